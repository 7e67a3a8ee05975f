#include "CommandExecutor.h"

#include "CommandRequest.h"
#include "GroupCommands.h"
#include "PasswordHash.h"
#include "StoreLock.h"
#include "ToolRests.h"
#include "UserCommands.h"

#include <new>

namespace qelo::store {

namespace {

// Long enough for many commands that each wait for somebody else's tool.
constexpr std::chrono::minutes kLockLimit{5};

// So short that a string of it needs no memory.
constexpr const char* kShortStatus = "Done.";

Attempt<std::string> dispatch(const Workplace& workplace, const CommandRequest& request,
                              const Secret* hash) {
    switch (request.method) {
    case Method::CreateUser:
        return createUser(workplace, request, hash);
    case Method::ModifyUser:
        return modifyUser(workplace, request, hash);
    case Method::DeleteUser:
        return deleteUser(workplace, request);
    case Method::SetPassword:
        return setPassword(workplace, request, *hash);
    case Method::EnableUser:
        return enableUser(workplace, request);
    case Method::DisableUser:
        return disableUser(workplace, request);
    case Method::CreateGroup:
        return createGroup(workplace, request);
    case Method::DeleteGroup:
        return deleteGroup(workplace, request);
    case Method::AddMember:
        return addMember(workplace, request);
    case Method::RemoveMember:
        return removeMember(workplace, request);
    }
    return Refusal{"the method is unknown"};
}

// Replaces the password by its hash. The clear text is gone before anything else happens, and
// other commands do not wait for the hashing, which is slow by design.
Attempt<Secret> takeHash(CommandRequest& request) {
    if (!request.password) {
        return Secret();
    }
    Attempt<Secret> hash = hashPassword(*request.password);
    request.password.reset();
    return hash;
}

// When the memory is too short to tell what was done, it is done all the same.
Attempt<std::string> carryOutLocked(const RootDirectory& root, const CommandRequest& request,
                                    const Secret* hash, FileSystem& files, ToolRunner& tools) {
    bool done = false;
    try {
        Attempt<std::string> status = dispatch({root, files, tools, &done}, request, hash);
        removeToolRests(root, files);
        return status;
    } catch (const std::bad_alloc&) {
        if (!done) {
            throw;
        }
    }
    return std::string(kShortStatus);
}

Attempt<std::string> carryOut(const std::filesystem::path& rootPath, CommandRequest& request,
                              FileSystem& files, ToolRunner& tools) {
    const Attempt<Secret> hash = takeHash(request);
    if (!hash) {
        return hash.refusal();
    }
    const Attempt<RootDirectory> root = RootDirectory::open(rootPath, files);
    if (!root) {
        return root.refusal();
    }
    const Attempt<StoreLock> lock = StoreLock::take(*root, files, kLockLimit);
    if (!lock) {
        return lock.refusal();
    }
    return carryOutLocked(*root, request, hash->empty() ? nullptr : &*hash, files, tools);
}

} // namespace

Attempt<std::string> executeCommand(const std::filesystem::path& root, std::string_view command,
                                    FileSystem& files, ToolRunner& tools) {
    const Attempt<CommandText> text = parseCommandText(command);
    if (!text) {
        return text.refusal();
    }
    Attempt<CommandRequest> request = parseCommandRequest(*text);
    if (!request) {
        return request.refusal();
    }
    Attempt<std::string> status = carryOut(root, *request, files, tools);
    if (!status) {
        return Refusal{std::string(nameOf(request->method)) + ": " + status.reason()};
    }
    return status;
}

} // namespace qelo::store
