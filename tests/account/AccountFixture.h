// What the whole-library tests of the account provider share: a broker, the recording
// platform, and the provider's operations as one call each.
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

inline constexpr const char* accountNameSpace = "root/cimv2";

// The names of the properties a client asks for; nothing stands for all of them.
using PropertyNames = std::optional<std::vector<const char*>>;

class AccountFixture : public testing::Test {
protected:
    AccountFixture();
    // Every test ends with all cursors closed and nothing misused at the broker.
    ~AccountFixture() override;

    // A store with an administration node and these accounts below it.
    void serve(const std::vector<StoreNode>& accounts);

    Outcome enumNames();
    Outcome enumInstances(const PropertyNames& properties = std::nullopt);
    Outcome getInstance(const std::vector<NamedValue>& keys,
                        const PropertyNames& properties = std::nullopt);
    Outcome invoke(const char* method, const CMPIArgs* in,
                   const std::string& className = "ZANTH_Account");

    // The names of the accounts returned, as paths or as instances.
    std::vector<std::string> returnedNames() const;
    // The only instance returned; an empty one, and a failure, when there is not just one.
    Instance onlyInstance() const;

    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }
    // The provider's MESSAGE lines, by their text alone.
    std::vector<std::string> failureTexts() const;
    bool exitMarked() const;

    static const char** listOf(const PropertyNames& properties, std::vector<const char*>& list);

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    CMPIInstanceMI* instances_;
    CMPIMethodMI* methods_;
    const CMPIObjectPath* classPath_;
};

// The four keys of an account's path, in their order.
std::vector<NamedValue> accountKeys(const std::string& name);

// The property of that name; a NULL of no type, and a failure, when there is none.
Value propertyOf(const Instance& instance, const std::string& name);

void expectSuccess(const Outcome& outcome);
void expectFailure(const Outcome& outcome, const std::string& message);

} // namespace qelo::test
