// One local group as read from the node store, and how groups are read.
#pragma once

#include <Instrumentation.h>

#include <cmpidt.h>

#include <string>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// A value: filled once while groups are loaded, copied and read afterwards. Getters return a
// copy. Setters return true when they refuse the value, which none does today.
class SimGroup {
public:
    SimGroup();
    ~SimGroup();
    SimGroup(const SimGroup&) = default;
    SimGroup(SimGroup&&) noexcept = default;
    SimGroup& operator=(const SimGroup&) = default;
    SimGroup& operator=(SimGroup&&) noexcept = default;

    std::string getName();
    std::string getElementName();
    std::string getMembers(); // user names joined by ","

    bool setName(std::string name);
    bool setElementName(std::string elementName);
    bool setMembers(std::string member);

private:
    std::string _name;
    std::string _elementName;
    std::string _members;
};

// Appends one record for each group, in store order. Returns false when the groups were
// read, true when there is no group node or the store or a value failed, which is traced.
// Records read before a failure stay in the vector.
bool getSimGroupInstances(std::vector<SimGroup>& vectSimGroup);

// Appends one record for each node from the cursor's position on, and moves the cursor past
// them. Returns false. Throws ProviderException when a record refuses a value, and what the
// store throws.
bool setVector(std::vector<SimGroup>& vectSimGroup, Tesk::Instrumentation& instrumentation);

// Has the node store carry out a method of class ZANTH_Group. Returns 1 when the gate refused
// an argument or the store did not take the command; 0 when it is reported as done, which
// includes a store without an administration node. No status text is read back, and `out` is
// never written. Whatever the store throws goes to the caller.
int executeGroupMethod(const char* methodName, const CMPIArgs* in, CMPIArgs* out);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
