// What the whole-library tests of a provider share: a broker, the recording platform, and each
// of the provider's operations as one call.
#pragma once

#include "support/broker/RecordingBroker.h"
#include "support/platform/ProviderLibrary.h"
#include "support/platform/RecordingPlatform.h"
#include "support/platform/SampleNodes.h"
#include "support/platform/TracePoints.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

namespace qelo::test {

inline constexpr const char* requestNameSpace = "root/cimv2";

// The names of the properties a client asks for; nothing stands for all of them.
using PropertyNames = std::optional<std::vector<const char*>>;

struct ProviderUnderTest {
    const char* provider; // as registered, for example "SimGroupProvider"
    const char* className;
    bool methods = false;
    bool associations = false;
};

// The filters of an association request; null is one that the client did not give.
struct AssociationFilters {
    const char* assocClass = nullptr;
    const char* resultClass = nullptr;
    const char* role = nullptr;
    const char* resultRole = nullptr;
};

class ProviderFixture : public testing::Test {
protected:
    explicit ProviderFixture(const ProviderUnderTest& provider);
    // Every test ends with all cursors closed and nothing misused at the broker.
    ~ProviderFixture() override;

    // Has the provider use another broker, or none.
    void registerBroker(const CMPIBroker* broker);

    Outcome enumNames();
    Outcome enumInstances(const PropertyNames& properties = std::nullopt);
    Outcome getInstance(const std::vector<NamedValue>& keys,
                        const PropertyNames& properties = std::nullopt);
    // Of the provider's own class, unless another is given.
    Outcome invoke(const char* method, const CMPIArgs* in, const std::string& className = {});

    Outcome associators(const CMPIObjectPath* source, const AssociationFilters& filters,
                        const PropertyNames& properties = std::nullopt);
    Outcome associatorNames(const CMPIObjectPath* source, const AssociationFilters& filters);
    Outcome references(const CMPIObjectPath* source, const char* resultClass = nullptr,
                       const PropertyNames& properties = std::nullopt);
    Outcome referenceNames(const CMPIObjectPath* source, const char* resultClass = nullptr);

    // That key, or property, of everything that was returned.
    std::vector<std::string> returned(const std::string& name) const;
    // The only instance or path returned; an empty one, and a failure, if there is not just one.
    Instance onlyInstance() const;
    Path onlyPath() const;

    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }
    // The points that one unit wrote, its markers included.
    std::vector<std::string> pointsOf(Unit unit) const;
    // The points that stand in one function.
    std::vector<std::string> pointsIn(const std::string& function) const;
    // The texts of the MESSAGE lines of a level.
    std::vector<std::string> messages(int level = 6000) const;
    bool exitMarked() const;

    void expectNothingReturned() const;

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    ProviderUnderTest provider_;
    CMPIInstanceMI* instances_ = nullptr;
    CMPIMethodMI* methods_ = nullptr;
    CMPIAssociationMI* associations_ = nullptr;
    const CMPIObjectPath* classPath_ = nullptr;
};

// A NULL-terminated list in the form of the interface; null for nothing. `list` keeps it.
const char** propertyList(const PropertyNames& properties, std::vector<const char*>& list);

void expectOk(const Outcome& outcome);
// CMPI_RC_ERR_FAILED with that message; without one for an empty text.
void expectFailed(const Outcome& outcome, const std::string& message);

} // namespace qelo::test
