// Reading accounts from the node store. Part of the source unit SimAccount.

#include "SimAccount.h"

#include "../store/RecordLoader.h"

#include <ProviderException.h>
#include <UnitTrace.h>

#include <cstdlib>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccount("Corvane.SimAccountObj");
const UnitTrace unit(loggerSimAccount, "SimAccount");

using TextSetter = bool (SimAccount::*)(std::string);
using NumberSetter = bool (SimAccount::*)(unsigned int);
using ListSetter = bool (SimAccount::*)(std::vector<unsigned int>);

// Each offers one property of the node under the cursor to the record. True when the record
// refuses the value; a property that the node lacks is passed over.
bool refuses(Instrumentation& node, NodeLexicon::Properties id, SimAccount& record,
             TextSetter set) {
    std::string value;
    return node.getProperty(id, value) && (record.*set)(std::move(value));
}

bool refuses(Instrumentation& node, NodeLexicon::Properties id, SimAccount& record,
             NumberSetter set) {
    unsigned int value = 0;
    return node.getProperty(id, value) && (record.*set)(value);
}

bool refuses(Instrumentation& node, NodeLexicon::Properties id, SimAccount& record,
             ListSetter set) {
    std::vector<unsigned int> value;
    return node.getProperty(id, value) && (record.*set)(std::move(value));
}

// The store keeps the group id as decimal text; leading digits count, none gives 0.
bool refusesGroupId(Instrumentation& node, SimAccount& record) {
    std::string value;
    if (!node.getProperty(NodeLexicon::GroupId, value)) {
        return false;
    }
    constexpr int decimal = 10;
    const long number = std::strtol(value.c_str(), nullptr, decimal);
    return record.setGroupId(static_cast<unsigned int>(number));
}

// One property as it is read: how, and what is said when the record refuses it.
struct Row {
    bool (*refused)(Instrumentation& node, SimAccount& record);
    const char* message;
};

template <NodeLexicon::Properties id, auto set>
bool offer(Instrumentation& node, SimAccount& record) {
    return refuses(node, id, record, set);
}

using Account = SimAccount;
namespace N = NodeLexicon;

// In the order of reading. The messages stand as clients of the log know them.
constexpr Row rows[] = {
    {offer<N::Name, &Account::setName>, "Failed while setting Name"},
    {offer<N::FullName, &Account::setFullName>, "Failed while setting FullName"},
    {offer<N::UserID, &Account::setUserID>, "Failed while setting UserID"},
    {refusesGroupId, "Failed while setting Group Id"},
    {offer<N::UserPassword, &Account::setUserPassword>, "Failed while setting UserPassword"},
    {offer<N::OrganizationName, &Account::setOrganizationName>,
     "Failed while setting OrganizationName"},
    {offer<N::Name, &Account::setElementName>, "Failed while setting Element Name"},
    {offer<N::AccountState, &Account::setRequestedState>, "Failed while setting Requested State"},
    {offer<N::DaysMustChangePasswordAfter, &Account::setdaysMustChangePasswordAfter>,
     "Failed while setting Password Days Before Expire"},
    {offer<N::AccountState, &Account::setEnabledState>, "Failed while setting Enabled State"},
    {offer<N::InactivityTimeout, &Account::setInactivityTimeout>,
     "Failed while setting InactivityTimeout"},
    {offer<N::MaxLoginFailures, &Account::setMaxLoginFailures>,
     "Failed while setting MaxLoginFailures"},
    {offer<N::DaysExpireAfter, &Account::setDaysExpireAfter>,
     "Failed while setting daysExpireAfter"},
    {offer<N::PasswordExpiration, &Account::setPasswordExpiration>,
     "Failed while setting PasswordExpiration"},
    {offer<N::PasswordHistoryDepth, &Account::setPasswordHistoryDepth>,
     "Failed while setting PasswordHistoryDepth"},
    {offer<N::PasswordRules, &Account::setPasswordRules>, "Failed while setting PasswordRules"},
    {offer<N::HomeDirectory, &Account::setHomeDirectory>, "Failed while setting HomeDirectory"},
    {offer<N::ScriptPath, &Account::setScriptPath>, "Failed while setting ScriptPath"},
    {offer<N::PasswordLastChanged, &Account::setPasswordLastChanged>,
     "Failed while setting PasswordLastChanged"},
    {offer<N::PasswordDaysMustKeep, &Account::setPasswordDaysMustKeep>,
     "Failed while setting PasswordDaysMustKeep"},
    {offer<N::PasswordDaysWarnBeforeExpire, &Account::setPasswordDaysWarnBeforeExpire>,
     "Failed while setting PasswordDaysWarnBeforeExpire"},
    {offer<N::AccountState, &Account::setAccountDisable>, "Failed while setting AccountDisable"},
};

// Selects the accounts under the administration node; false when there is no such node or
// no account at all.
bool selectAccounts(Instrumentation& cursor) {
    cursor.selectNode(NodeLexicon::UserAdministration);
    if (!cursor) {
        return false;
    }
    const std::string path = cursor.getPathToNode();
    cursor.selectNode(NodeLexicon::UserAccount);
    if (!cursor) {
        return false;
    }
    cursor.setFilter(NodeLexicon::ParentPath, path);
    return true;
}

void fillAccount(Instrumentation& node, SimAccount& account) {
    for (const Row& row : rows) {
        if (row.refused(node, account)) {
            throw ProviderException(row.message);
        }
    }
}

} // namespace

void setVector(std::vector<SimAccount>& vectSimAccount, Tesk::Instrumentation& instrumentation) {
    CallTrace call(unit, parameters(" vectSimAccount=", &vectSimAccount,
                                    " instrumentation=", &instrumentation));
    appendRecords(instrumentation, vectSimAccount, fillAccount);
    call.leave();
}

bool getSimAccountInstances(std::vector<SimAccount>& vectSimAccount) {
    CallTrace call(unit, parameters(" vectSimAccount=", &vectSimAccount));
    bool failed = true;
    try {
        Instrumentation cursor;
        if (selectAccounts(cursor)) {
            setVector(vectSimAccount, cursor);
            failed = false;
        }
    } catch (const std::exception& failure) {
        unit.message(failure.what());
    }
    return call.leave(failed);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
