// What the tests of the identity share: the provider under test and the constant it serves.
#pragma once

#include "support/operations/ProviderFixture.h"

namespace qelo::test {

namespace source {
inline constexpr Unit identityFactory{"Corvane.SimIdentityObjFactory", "SimIdentityObjFactory"};
inline constexpr Unit identityProvider{"Corvane.SimIdentityProvider", "SimIdentityProvider"};
} // namespace source

inline constexpr const char* identifier = "ZANTH:SimIdentity1";
inline constexpr const char* identityPathFailedTrace =
    "Create CMPIObjectPath failed for                     SimIdentity class";

class IdentityFixture : public ProviderFixture {
protected:
    IdentityFixture() : ProviderFixture({"SimIdentityProvider", "ZANTH_SimIdentity"}) {}
    ~IdentityFixture() override {
        EXPECT_EQ(platform_.storeCallCount(), 0U) << "the identity never touches the store";
    }
};

} // namespace qelo::test
