// Administration commands on the account database below a root directory.
//
// A command is a line of text (CommandText.h) that names a method and its arguments:
//
//   on accounts  CreateUser    Name [FullName UserID GroupId HomeDirectory ScriptPath
//                              UserPassword CreateHome]
//                ModifyUser    Name [the same, daysMustKeepPassword
//                              daysMustChangePasswordAfter daysWarnBeforePasswordExpire
//                              daysExpireAfter PasswordExpiration]
//                DeleteUser    Name [RemoveHome]
//                SetPassword   Name UserPassword
//                EnableUser    Name
//                DisableUser   Name
//   on groups    CreateGroup   Name [GroupId]
//                DeleteGroup   Name
//                AddMember     Name Member
//                RemoveMember  Name Member
//
// DisableUser locks the password, as usermod -L does; EnableUser unlocks it, but never leaves
// an account open that has no password. DeleteUser leaves the mail file.
//
// Numbers are CMPI_uint32, CreateHome and RemoveHome 0 or 1; PasswordExpiration, the day from
// which the account can no longer be used, is CMPI_dateTime; the rest is CMPI_string. What is
// absent stays unchanged; for CreateUser, it is as the root's own login.defs and
// default/useradd say.
#pragma once

#include <filesystem>
#include <string>

namespace qelo::store {

// How a command that was not carried out stands in the log, at level 6000: its component, and
// what comes before the reason.
constexpr char kCommandComponent[] = "Qelo.AdminCommand";
constexpr char kRefusalPrefix[] = "Command not carried out: ";

struct CommandOutcome {
    // Whether the command was carried out. When it was not, nothing has changed.
    bool accepted = false;
    // A short text for people, never empty: what was done, or why nothing was. It never holds
    // a password.
    std::string status;
};

// Carries out one command on <root>/etc. Commands on the same root wait for one another, in
// all threads and processes. A failure is also written to the log. `command` is not kept; every
// copy of a password that is made of it is wiped. Throws nothing but std::bad_alloc, and then has
// changed nothing.
CommandOutcome executeAdminCommand(const std::filesystem::path& root, const std::string& command);

// Writes the reason of a refused command to the log and the trace, as executeAdminCommand
// does; for stores that take no commands.
void logRefusedCommand(const std::string& reason);

} // namespace qelo::store
