// What the tests of both associations share. An association ties a far object, which another
// provider serves, to a near one, which this library makes from the service nodes of the store.
// Every test runs for both associations unless it says otherwise.
#pragma once

#include "support/operations/ProviderFixture.h"

#include <functional>
#include <string>
#include <vector>

namespace qelo::test {

struct AssociationCase {
    const char* prefix; // of the operations
    const char* className;
    const char* farClass;
    const char* farRole;
    const char* nearClass;
    const char* nearRole;
    const char* nearKey;    // the key that tells near objects apart
    const char* nearPrefix; // of that key's value
    bool filtersResultClass;

    Unit provider;
    Unit factory;

    const char* farPathFailed; // the lines for a class path that cannot be made
    const char* ownPathFailed; // ... while instances are built
    const char* ownNameFailed; // ... while names are enumerated

    BrokerTrace nothingNear; // what the near factory tells the broker
    BrokerTrace nearPathFailed;
    const char* nearPathStatus;
};

inline void PrintTo(const AssociationCase* test, std::ostream* stream) {
    *stream << test->className;
}

const AssociationCase& hostedService();
const AssociationCase& elementCapabilities();

inline constexpr const char* enumerationFailed = "CBEnumInstanceNames Failed for the target Class";

class AssociationFixture : public ProviderFixture,
                           public testing::WithParamInterface<const AssociationCase*> {
protected:
    AssociationFixture();

    // A store with a service node for each of these paths.
    void serveNear(const std::vector<std::string>& paths);
    // A broker that knows a far object for each of these names, in this order.
    void serveFar(const std::vector<std::string>& names);
    // Two far objects, in no order by name, and three near ones.
    void serveTwoAndThree();

    const CMPIObjectPath* farPath(const std::string& name);
    const CMPIObjectPath* nearPath(const std::string& path);
    std::string nearId(const std::string& path) const { return case_.nearPrefix + path; }
    // The pairs of far name and near id, far ones outermost, as "far|near".
    std::vector<std::string> pairs(const std::vector<std::string>& far,
                                   const std::vector<std::string>& near) const;
    // The same of what was returned: from the keys of paths, the properties of instances.
    std::vector<std::string> returnedPairs() const;

    // The filters that name the association, and a result class.
    AssociationFilters along(const char* resultClass = nullptr) const {
        return {case_.className, resultClass, nullptr, nullptr};
    }

    // Has the k-th path of that class that the operation asks for fail, from 1. Runs the
    // operation once to find out which path that is.
    void failPathOf(const std::string& className, unsigned int k, const Fault& fault,
                    const std::function<void()>& operation);

    // That the provider's own lines are its markers, and within them these messages.
    void expectLines(const std::string& operation, bool ends,
                     const std::vector<std::string>& told = {}) const;
    // The end of the normal path: success, CMReturnDone, the exit marker, no message.
    void expectNormalEnd(const Outcome& outcome, const std::string& operation) const;
    // A failed step: its line, no CMReturnDone, no exit marker.
    void expectFailedStep(const std::string& operation, const std::string& text) const;

    const AssociationCase& case_ = *GetParam();
    const Fault broken_ = Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "no access");
};

void expectBroken(const Outcome& outcome);

// Instantiates a suite for both associations.
#define QELO_FOR_BOTH_ASSOCIATIONS(Suite)                                                          \
    INSTANTIATE_TEST_SUITE_P(Both, Suite,                                                          \
                             testing::Values(&hostedService(), &elementCapabilities()),            \
                             [](const auto& test) { return std::string(test.param->prefix); })

} // namespace qelo::test
