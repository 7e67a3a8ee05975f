#include "SimAccountObjFactory.h"

#include "../store/RefreshHandshake.h"

#include <ClassNames.h>

#include <cstring>
#include <iterator>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountObjFactory("Corvane.SimAccountObjFactory");
const UnitTrace unit(loggerSimAccountObjFactory, "SimAccountObjFactory");

constexpr KeyRow<SimAccount> keys[] = {
    {"SystemCreationClassName", key::fixed<ComputerSystemClass>},
    {"SystemName", key::systemName},
    {"CreationClassName", key::fixed<AccountClass>},
    {"Name", key::text<&SimAccount::getName>},
};

// What of a text is converted between code pages.
constexpr unsigned int codepageLimit = 254;

// The ways to set the account's own kinds of property.
template <auto getter>
void dateTime(const InstanceWriter& writer, const char* name, SimAccount& account,
              SimAccountFactory& factory) {
    writer.dateTime(name, factory.adjustString((account.*getter)()));
}

template <auto getter>
void oneString(const InstanceWriter& writer, const char* name, SimAccount& account,
               SimAccountFactory&) {
    writer.strings(name, {(account.*getter)()});
}

template <auto getter>
void inCodepage(const InstanceWriter& writer, const char* name, SimAccount& account,
                SimAccountFactory& factory) {
    const std::string text = (account.*getter)();
    char source[codepageLimit + 1] = {};
    std::memcpy(source, text.c_str(), ::strnlen(text.c_str(), codepageLimit));
    char target[codepageLimit + 1] = {};
    factory.convertCodepage(target, codepageLimit, source, codepageLimit);
    writer.chars(name, target);
}

void passwordRules(const InstanceWriter& writer, const char* name, SimAccount& account,
                   SimAccountFactory&) {
    writer.uint16Array(name, account.getPasswordRules(), nullptr);
}

// The full name is published as the description; the property named for it stays empty.
void emptyText(const InstanceWriter& writer, const char* name, SimAccount&, SimAccountFactory&) {
    writer.chars(name, "");
}

using A = SimAccount;
using namespace property;

constexpr PropertyRow<SimAccount, SimAccountFactory> table[] = {
    {"Caption", caption},
    {"Description", chars<&A::getFullName>},
    {"FullName", emptyText},
    {"GroupId", uint32<&A::getGroupId>},
    {"daysMustChangePasswordAfter", uint32<&A::getdaysMustChangePasswordAfter>},
    {"daysExpireAfter", uint32<&A::getDaysExpireAfter>},
    {"UserID", chars<&A::getUserID>},
    {"UserPassword", oneString<&A::getUserPassword>},
    {"OrganizationName", oneString<&A::getOrganizationName>},
    {"ElementName", chars<&A::getElementName>},
    {"RequestedState", uint16<&A::getRequestedState>},
    {"EnabledState", uint16<&A::getEnabledState>},
    {"InactivityTimeout", dateTime<&A::getInactivityTimeout>},
    {"MaximumSuccessiveLoginFailures", uint16<&A::getMaxLoginFailures>},
    {"PasswordExpiration", dateTime<&A::getPasswordExpiration>},
    {"PasswordHistoryDepth", uint16<&A::getPasswordHistoryDepth>},
    {"ComplexPasswordRulesEnforced", passwordRules},
    {"HomeDirectory", inCodepage<&A::getHomeDirectory>},
    {"ScriptPath", inCodepage<&A::getScriptPath>},
    {"passwordLastChanged", dateTime<&A::getPasswordLastChanged>},
    {"daysMustKeepPassword", uint32<&A::getPasswordDaysMustKeep>},
    {"daysWarnBeforePasswordExpire", uint32<&A::getPasswordDaysWarnBeforeExpire>},
    {"passwordExpirationDate", dateTime<&A::getPasswordExpiration>},
    {"AccountDisable", boolean<&A::getAccountDisable>},
};
} // namespace

const SimAccountFactory::Shape& SimAccountFactory::shape() {
    static const Shape shape = {
        unit,
        AccountClass,
        "SimAccountProvider",
        getSimAccountInstances,
        &SimAccount::getName,
        SameKey::Replaces,
        keys,
        table,
        std::size(table),
        1,
        "Create CMPIObjectPath failed.",
        "Create CMPIObjectPath                     failed for RecordLogClass.",
        " simAccount=",
        " isObjPath=",
        true,
        true,
        1,
        {true, true, true}};
    return shape;
}

SimAccountFactory::SimAccountFactory() { unit.method(); }

SimAccountFactory::SimAccountFactory(bool isSen, bool isCap) {
    const CallTrace call(unit, parameters(" isSen=", isSen, " isCap=", isCap));
    load();
    call.leave();
}

SimAccountFactory::~SimAccountFactory() { unit.methodQuietly(); }

void refreshGroupUserInfo() {
    const TraceSite site = TraceSite::here();
    try {
        requestRefreshWhenStale(NodeLexicon::UserAccount,
                                [&](unsigned int user_sz, unsigned int nodeSize) {
                                    unit.variable("user_sz", user_sz, site);
                                    unit.variable("nodeSize", nodeSize, site);
                                });
    } catch (const std::exception& failure) {
        unit.message(failure.what());
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
