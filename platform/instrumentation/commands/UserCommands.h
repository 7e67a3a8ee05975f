// The commands on accounts.
//
// Each reads the database first and refuses what it can see will fail, so that tools fail only
// for reasons that nobody could foresee. Then come the steps, in the order that leaves, at
// every moment, a database that is whole, and afterwards a look at what has become of it.
// After a failure everything is put back.
//
//   CreateUser   account (locked, so nobody can use it yet), home directory, password.
//   ModifyUser   comment, home, shell and numbers; owner of the home directory; a new home
//                directory; ageing and password.
//   DeleteUser   home directory renamed (can be taken back), account with its private group and
//                memberships (can be taken back), home directory removed. When removing fails
//                before anything is gone, all is put back; later the command is finished and
//                its status names what is left.
//   SetPassword, EnableUser, DisableUser  one change each, of one field.
//
// A process that is killed between two steps leaves an account that is whole but locked, has
// no home directory yet, or whose home directory stays behind under its other name.
#pragma once

#include "CommandRequest.h"
#include "Workplace.h"

#include <string>

namespace qelo::store {

// Each carries out one request of its method, under the store's lock, and returns the status
// text. `hash` is the hash of the request's password, null when it has none.
Attempt<std::string> createUser(const Workplace& workplace, const CommandRequest& request,
                                const Secret* hash);
Attempt<std::string> modifyUser(const Workplace& workplace, const CommandRequest& request,
                                const Secret* hash);
Attempt<std::string> deleteUser(const Workplace& workplace, const CommandRequest& request);
Attempt<std::string> setPassword(const Workplace& workplace, const CommandRequest& request,
                                 const Secret& hash);
Attempt<std::string> enableUser(const Workplace& workplace, const CommandRequest& request);
Attempt<std::string> disableUser(const Workplace& workplace, const CommandRequest& request);

} // namespace qelo::store
