// What a command asks for, with every argument checked.
#pragma once

#include "Attempt.h"
#include "CommandText.h"
#include "Secret.h"

#include <cstdint>
#include <optional>
#include <string>

namespace qelo::store {

enum class Method {
    CreateUser,
    ModifyUser,
    DeleteUser,
    SetPassword,
    EnableUser,
    DisableUser,
    CreateGroup,
    DeleteGroup,
    AddMember,
    RemoveMember
};

// Days of password ageing and of the account's end, as the shadow file counts them.
struct Ageing {
    std::optional<std::uint32_t> minimum;
    std::optional<std::uint32_t> maximum;
    std::optional<std::uint32_t> warning;
    std::optional<std::uint32_t> inactive;
    std::optional<long> expiry;

    bool any() const { return minimum || maximum || warning || inactive || expiry; }
};

// What is absent stays unchanged, or as the tools set it for a new account.
struct CommandRequest {
    Method method = Method::ModifyUser;
    std::string name;
    std::optional<std::string> fullName;
    std::optional<std::string> home;
    std::optional<std::string> shell;
    std::optional<std::string> member;
    std::optional<std::uint32_t> uid;
    std::optional<std::uint32_t> gid;
    std::optional<bool> createHome;
    std::optional<bool> removeHome;
    std::optional<Secret> password;
    Ageing ageing;
};

// The method's name as clients write it.
const char* nameOf(Method method);

// Checks a command against the table of methods: its method is known, every argument is one
// of the method's, of the right type, given once and with an acceptable value, and none that
// the method needs is missing. Reads nothing but `command`. Pure; for any thread.
Attempt<CommandRequest> parseCommandRequest(const CommandText& command);

} // namespace qelo::store
