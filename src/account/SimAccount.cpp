#include "SimAccount.h"

#include <UnitTrace.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccount("Corvane.SimAccountObj");
const UnitTrace unit(loggerSimAccount, "SimAccount");

// States of an account in the node store, and in CIM.
enum StoreState : unsigned int { usable = 1, expired = 12, locked = 16 };
enum CimState : std::uint16_t {
    stateUnknown = 0,
    stateEnabled = 2,
    stateDisabled = 3,
    stateNotApplicable = 5,
    stateOffline = 6,
};

std::uint16_t cimState(unsigned int storeState, CimState otherwise) {
    switch (storeState) {
    case usable:
        return stateEnabled;
    case expired:
        return stateOffline;
    case locked:
        return stateDisabled;
    default:
        return otherwise;
    }
}

constexpr unsigned int lastPasswordRule = 7;

} // namespace

SimAccount::SimAccount() { unit.method(); }

SimAccount::~SimAccount() { unit.methodQuietly(); }

std::string SimAccount::getName() { return unit.read("_name", _name); }
std::string SimAccount::getUserID() { return unit.read("_userID", _userID); }
unsigned int SimAccount::getGroupId() { return _groupId; }
unsigned int SimAccount::getdaysMustChangePasswordAfter() { return _daysMustChangePasswordAfter; }
std::string SimAccount::getFullName() { return _fullName; }

std::string SimAccount::getUserPassword() {
    unit.method();
    return _userPassword;
}

std::string SimAccount::getOrganizationName() {
    return unit.read("_organizationName", _organizationName);
}
std::string SimAccount::getElementName() { return unit.read("_elementName", _elementName); }
std::uint16_t SimAccount::getRequestedState() {
    return unit.read("_requestedState", _requestedState);
}
std::uint16_t SimAccount::getEnabledState() { return unit.read("_enabledState", _enabledState); }
std::string SimAccount::getInactivityTimeout() {
    return unit.read("_inactivityTimeout", _inactivityTimeout);
}
unsigned int SimAccount::getMaxLoginFailures() {
    return unit.read("_maxLoginFailures", _maxLoginFailures);
}
std::string SimAccount::getPasswordExpiration() {
    return unit.read("_passwordExpiration", _passwordExpiration);
}
unsigned int SimAccount::getPasswordHistoryDepth() {
    return unit.read("_passwordHistoryDepth", _passwordHistoryDepth);
}

std::vector<std::uint16_t> SimAccount::getPasswordRules() {
    unit.method();
    return _passwordRules;
}

std::string SimAccount::getHomeDirectory() { return unit.read("_homeDirectory", _homeDirectory); }
std::string SimAccount::getScriptPath() { return unit.read("_scriptPath", _scriptPath); }
std::string SimAccount::getPasswordLastChanged() {
    return unit.read("_passwordLastChanged", _passwordLastChanged);
}
unsigned int SimAccount::getPasswordDaysMustKeep() {
    return unit.read("_passwordDaysMustKeep", _passwordDaysMustKeep);
}
unsigned int SimAccount::getDaysExpireAfter() {
    return unit.read("_daysExpireAfter", _daysExpireAfter);
}
unsigned int SimAccount::getPasswordDaysWarnBeforeExpire() {
    return unit.read("_passwordDaysWarnBeforeExpire", _passwordDaysWarnBeforeExpire);
}
bool SimAccount::getAccountDisable() { return unit.read("_accountDisable", _accountDisable); }

bool SimAccount::setName(std::string name) {
    return unit.assign(" name=", "_name", _name, std::move(name));
}
bool SimAccount::setUserID(std::string userID) {
    return unit.assign(" userID=", "_userID", _userID, std::move(userID));
}
bool SimAccount::setGroupId(unsigned int groupId) {
    _groupId = groupId;
    return false;
}
bool SimAccount::setdaysMustChangePasswordAfter(unsigned int days) {
    _daysMustChangePasswordAfter = days;
    return false;
}
bool SimAccount::setFullName(std::string fullName) {
    _fullName = std::move(fullName);
    return false;
}

bool SimAccount::setUserPassword(std::string userPassword) {
    unit.withParameters(" Entered function setUserPassword", ENTERING, TraceSite::here());
    _userPassword = std::move(userPassword);
    unit.withParameters(" Exiting function setUserPassword=", EXITING, TraceSite::here());
    return false;
}

bool SimAccount::setOrganizationName(std::string organizationName) {
    return unit.assign(" organizationName=", "_organizationName", _organizationName,
                       std::move(organizationName));
}
bool SimAccount::setElementName(std::string elementName) {
    return unit.assign(" elementName=", "_elementName", _elementName, std::move(elementName));
}

bool SimAccount::setRequestedState(unsigned int status) {
    CallTrace call(unit, parameters(" status=", status));
    _requestedState = cimState(status, stateUnknown);
    unit.variable("_requestedState", _requestedState);
    return call.leave(_requestedState == stateUnknown);
}

bool SimAccount::setEnabledState(unsigned int enabledState) {
    CallTrace call(unit, parameters(" enabledState=", enabledState));
    _enabledState = cimState(enabledState, stateNotApplicable);
    unit.variable("_enabledState", _enabledState);
    return call.leave(false);
}

bool SimAccount::setInactivityTimeout(std::string inactivityTimeout) {
    return unit.assign(" inactivityTimeout=", "_inactivityTimeout", _inactivityTimeout,
                       std::move(inactivityTimeout));
}
bool SimAccount::setMaxLoginFailures(unsigned int maxLoginFailures) {
    return unit.assign(" maxLoginFailures=", "_maxLoginFailures", _maxLoginFailures,
                       maxLoginFailures);
}
bool SimAccount::setPasswordExpiration(std::string passwordExpiration) {
    return unit.assign(" passwordExpiration=", "_passwordExpiration", _passwordExpiration,
                       std::move(passwordExpiration));
}
bool SimAccount::setPasswordHistoryDepth(unsigned int passwordHistoryDepth) {
    return unit.assign(" passwordHistoryDepth=", "_passwordHistoryDepth", _passwordHistoryDepth,
                       passwordHistoryDepth);
}

// NOLINTNEXTLINE(performance-unnecessary-value-param): setters take their value by value
bool SimAccount::setPasswordRules(std::vector<unsigned int> passwordRules) {
    CallTrace call(unit, parameters(" passwordRules=", &passwordRules));
    _passwordRules.clear();
    for (const unsigned int rule : passwordRules) {
        if (rule >= 1 && rule <= lastPasswordRule) {
            // CIM counts from "Other" (1), the store from its first rule.
            _passwordRules.push_back(static_cast<std::uint16_t>(rule + 1));
        }
    }
    return call.leave(false);
}

bool SimAccount::setHomeDirectory(std::string homeDirectory) {
    return unit.assign(" homeDirectory=", "_homeDirectory", _homeDirectory,
                       std::move(homeDirectory));
}
bool SimAccount::setScriptPath(std::string scriptPath) {
    return unit.assign(" scriptPath=", "_scriptPath", _scriptPath, std::move(scriptPath));
}
bool SimAccount::setPasswordLastChanged(std::string passwordLastChanged) {
    return unit.assign(" passwordLastChanged=", "_passwordLastChanged", _passwordLastChanged,
                       std::move(passwordLastChanged));
}
bool SimAccount::setPasswordDaysMustKeep(unsigned int passwordDaysMustKeep) {
    return unit.assign(" passwordDaysMustKeep=", "_passwordDaysMustKeep", _passwordDaysMustKeep,
                       passwordDaysMustKeep);
}
bool SimAccount::setDaysExpireAfter(unsigned int daysExpireAfter) {
    return unit.assign(" daysExpireAfter=", "_daysExpireAfter", _daysExpireAfter, daysExpireAfter);
}
bool SimAccount::setPasswordDaysWarnBeforeExpire(unsigned int passwordDaysWarnBeforeExpire) {
    return unit.assign(" passwordDaysWarnBeforeExpire=", "_passwordDaysWarnBeforeExpire",
                       _passwordDaysWarnBeforeExpire, passwordDaysWarnBeforeExpire);
}

bool SimAccount::setAccountDisable(unsigned int status) {
    CallTrace call(unit, parameters(" accountDisable=", status));
    _accountDisable = status == locked;
    unit.variable("_accountDisable", _accountDisable);
    return call.leave(false);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
