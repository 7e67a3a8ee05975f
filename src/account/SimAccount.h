// One local user account as read from the node store, and how accounts are read.
#pragma once

#include <Instrumentation.h>

#include <cmpidt.h>

#include <cstdint>
#include <string>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// A value: filled once while accounts are loaded, copied and read afterwards. Nothing here
// touches the node store. Getters return a copy of the field. Setters change the field only
// and return true when they refuse the value, false when they took it. Getters, setters,
// the constructor and the destructor are traced; the password never is.
class SimAccount {
public:
    // Every text empty, every number 0, every flag false.
    SimAccount();
    ~SimAccount();
    SimAccount(const SimAccount&) = default;
    SimAccount(SimAccount&&) noexcept = default;
    SimAccount& operator=(const SimAccount&) = default;
    SimAccount& operator=(SimAccount&&) noexcept = default;

    std::string getName();
    std::string getUserID();
    unsigned int getGroupId();
    unsigned int getdaysMustChangePasswordAfter();
    std::string getFullName();
    std::string getUserPassword();
    std::string getOrganizationName();
    std::string getElementName();
    std::uint16_t getRequestedState(); // a value of CIM RequestedState, 0 when not known
    std::uint16_t getEnabledState();   // a value of CIM EnabledState, 0 when not known
    std::string getInactivityTimeout();
    unsigned int getMaxLoginFailures();
    std::string getPasswordExpiration();
    unsigned int getPasswordHistoryDepth();
    std::vector<std::uint16_t> getPasswordRules(); // values of CIM ComplexPasswordRulesEnforced
    std::string getHomeDirectory();
    std::string getScriptPath();
    std::string getPasswordLastChanged();
    unsigned int getPasswordDaysMustKeep();
    unsigned int getDaysExpireAfter();
    unsigned int getPasswordDaysWarnBeforeExpire();
    bool getAccountDisable();

    bool setName(std::string name);
    bool setUserID(std::string userID);
    bool setGroupId(unsigned int groupId);
    bool setdaysMustChangePasswordAfter(unsigned int days);
    bool setFullName(std::string fullName);
    bool setUserPassword(std::string userPassword);
    bool setOrganizationName(std::string organizationName);
    bool setElementName(std::string elementName);
    // The states are those of the node store: 1 usable, 12 expired, 16 locked. The
    // requested state refuses any other; the enabled state takes it as "not applicable".
    bool setRequestedState(unsigned int status);
    bool setEnabledState(unsigned int enabledState);
    bool setInactivityTimeout(std::string inactivityTimeout);
    bool setMaxLoginFailures(unsigned int maxLoginFailures);
    bool setPasswordExpiration(std::string passwordExpiration);
    bool setPasswordHistoryDepth(unsigned int passwordHistoryDepth);
    // Rules of the node store, 1 to 7; others are passed over.
    bool setPasswordRules(std::vector<unsigned int> passwordRules);
    bool setHomeDirectory(std::string homeDirectory);
    bool setScriptPath(std::string scriptPath);
    bool setPasswordLastChanged(std::string passwordLastChanged);
    bool setPasswordDaysMustKeep(unsigned int passwordDaysMustKeep);
    bool setDaysExpireAfter(unsigned int daysExpireAfter);
    bool setPasswordDaysWarnBeforeExpire(unsigned int passwordDaysWarnBeforeExpire);
    bool setAccountDisable(unsigned int status); // disabled exactly when locked

private:
    std::string _name;
    std::string _userID;
    std::uint32_t _groupId = 0;
    std::uint32_t _daysMustChangePasswordAfter = 0;
    std::string _fullName;
    std::string _userPassword;
    std::string _organizationName;
    std::string _elementName;
    std::uint16_t _requestedState = 0;
    std::uint16_t _enabledState = 0;
    std::string _inactivityTimeout;
    std::uint32_t _maxLoginFailures = 0;
    std::string _passwordExpiration;
    std::uint32_t _passwordHistoryDepth = 0;
    std::vector<std::uint16_t> _passwordRules;
    std::string _homeDirectory;
    std::string _scriptPath;
    std::string _passwordLastChanged;
    std::uint32_t _passwordDaysMustKeep = 0;
    std::uint32_t _daysExpireAfter = 0;
    std::uint32_t _passwordDaysWarnBeforeExpire = 0;
    bool _accountDisable = false;
};

// Appends one record for each account under the administration node, in store order.
// Returns false when the accounts were read (there may be none), true when they could not
// be: there is no administration node or no account node, or the store or a value failed,
// which is traced. Records read before a failure stay in the vector.
bool getSimAccountInstances(std::vector<SimAccount>& vectSimAccount);

// Appends one record for each node from the cursor's position on, and moves the cursor past
// them. Throws ProviderException when a record refuses a value, and what the store throws;
// the records before that stay in the vector.
void setVector(std::vector<SimAccount>& vectSimAccount, Tesk::Instrumentation& instrumentation);

// Has the node store carry out a method of class ZANTH_Account: packs the call into a
// command, writes it to the administration node and reads the status text back. Returns true
// when the method failed: the gate refused an argument, the store did not take the command,
// or its status text is empty. Returns false when it is reported as done, which includes a
// store without an administration node and a status that cannot be read. `out` is never
// written. Whatever the store throws goes to the caller.
bool executeMethod(const char* methodName, const CMPIArgs* in, CMPIArgs* out);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
