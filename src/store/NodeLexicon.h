// The numbers under which the node store knows its node types, properties and path kinds.
// They are the store's own and fixed.
#pragma once

namespace Tesk {
namespace NodeLexicon {

enum NodeType : int {
    UserAdministration = 17, // root of user administration; carries commands
    AccountServiceRoot = 40, // one per account management service
    UserAccount = 46,        // one per local account
    UserGroup = 51,          // one per local group
};

// The value type of each property stands beside it; "text" is a string.
enum Properties : int {
    DaysExpireAfter = 44,               // uint32
    EntryCount = 51,                    // uint32, entries that the database holds
    AdminCommand = 74,                  // text; written: a command, read: its status
    RefreshRequest = 75,                // uint32; writing 0 asks the store to re-read
    UserID = 89,                        // text
    InactivityTimeout = 91,             // text
    MaxLoginFailures = 106,             // uint32
    Name = 108,                         // text, of an account or a group
    OrganizationName = 113,             // text
    UserPassword = 117,                 // text
    PasswordExpiration = 118,           // text, a point in time
    PasswordHistoryDepth = 119,         // uint32
    AccountState = 123,                 // uint32: 1 usable, 12 expired, 16 locked
    PasswordRules = 137,                // uint32 list
    HomeDirectory = 158,                // text
    ScriptPath = 159,                   // text, the login shell
    PasswordLastChanged = 160,          // text, a point in time
    PasswordDaysMustKeep = 161,         // uint32
    PasswordDaysWarnBeforeExpire = 162, // uint32
    DaysMustChangePasswordAfter = 163,  // uint32
    GroupMembers = 165,                 // text list
    GroupId = 311,                      // text holding a decimal number
    FullName = 312,                     // text
};

enum PathType : int {
    ParentPath = 1, // nodes that lie under a given node
};

} // namespace NodeLexicon
} // namespace Tesk
