// From records of the account database to nodes of the store.
#pragma once

#include "AccountFiles.h"
#include "Node.h"
#include "PasswordPolicy.h"

#include <memory>
#include <optional>
#include <string>

namespace qelo::nodes {

// The one node of its type that accounts and groups lie under, and the one service root.
Node administrationNode();
Node serviceRootNode();

// The properties that all accounts share.
std::shared_ptr<const Properties> policyProperties(const PasswordPolicy& policy);

// `shadow` is the account's shadow record, or null when there is none or none can be read.
// `today` is in days since 1970 in UTC.
Node accountNode(const AccountRecord& account, const ShadowRecord* shadow, long today,
                 std::shared_ptr<const Properties> policy);

Node groupNode(const GroupRecord& group);

// 16 when locked, else 12 when the account's date of expiry has come, else 1; nothing when
// the database does not tell.
std::optional<unsigned int> accountState(PasswordUse password, const ShadowRecord* shadow,
                                         long today);

// "YYYY-MM-DD HH:MM:SS" of the start of a day in UTC; nothing for a day that is not told
// (negative) or has a year of more than four digits.
std::optional<std::string> dayText(long day);

} // namespace qelo::nodes
