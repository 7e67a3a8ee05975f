#include "SampleNodes.h"

namespace qelo::test {

using namespace Tesk::NodeLexicon;

StoreNode administrationNode() { return {UserAdministration, administrationPath, {}}; }

StoreNode bareAccountNode() {
    return {UserAccount, std::string(administrationPath) + "/account", {}};
}

StoreNode accountNode(const std::string& name) {
    StoreNode node = bareAccountNode();
    node.properties[Name] = name;
    node.properties[AccountState] = 1U;
    return node;
}

StoreNode fullAccountNode(const std::string& name) {
    StoreNode node = accountNode(name);
    node.properties[FullName] = "Full name of " + name;
    node.properties[UserID] = "1001";
    node.properties[GroupId] = "100";
    node.properties[UserPassword] = "Secret-of-the-account";
    node.properties[OrganizationName] = "Organisation";
    node.properties[DaysMustChangePasswordAfter] = 90U;
    node.properties[InactivityTimeout] = "2014-03-07 12:30:05";
    node.properties[MaxLoginFailures] = 5U;
    node.properties[DaysExpireAfter] = 30U;
    node.properties[PasswordExpiration] = "2015-04-08 13:31:06";
    node.properties[PasswordHistoryDepth] = 4U;
    node.properties[PasswordRules] = std::vector<unsigned int>{1, 7, 3};
    node.properties[HomeDirectory] = "/home/" + name;
    node.properties[ScriptPath] = "/bin/bash";
    node.properties[PasswordLastChanged] = "2013-02-06 11:29:04";
    node.properties[PasswordDaysMustKeep] = 2U;
    node.properties[PasswordDaysWarnBeforeExpire] = 7U;
    return node;
}

} // namespace qelo::test
