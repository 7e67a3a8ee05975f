// What the operations without logic answer, for each of the seven providers.
#include "ProviderList.h"

#include "support/platform/ProviderLibrary.h"
#include "support/platform/RecordingPlatform.h"
#include "support/platform/TracePoints.h"

#include <gtest/gtest.h>

#include <string>

namespace qelo::test {
namespace {

void expectStatus(const CMPIStatus& status, CMPIrc rc) {
    EXPECT_EQ(status.rc, rc);
    EXPECT_EQ(status.msg, nullptr);
}

// Broker, context, result and paths are null throughout: touching one would end the test.
class UnsupportedOperations : public testing::TestWithParam<ProviderKind> {
protected:
    void SetUp() override { platform_.reset(); }

    bool isGroup() const { return name_ == "SimGroupProvider"; }

    // Groups trace two plain lines, all others nothing.
    void expectTraceOf(const std::string& operation) const {
        ExpectedTrace expected;
        if (isGroup()) {
            const std::string function = "SimGroup_" + operation;
            expected.plain(unit::groupProvider, function, function + ": entry");
            expected.plain(unit::groupProvider, function, function + ": exit");
        }
        expectSamePoints(tracePoints(platform_.lines()), expected);
        EXPECT_EQ(platform_.storeCallCount(), 0U);
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    std::string name_ = GetParam().provider;
    CMPIInstanceMI* mi_ = ProviderLibrary::instance().instanceMI(name_, nullptr);
};

class MethodCleanup : public UnsupportedOperations {};
class AssociationCleanup : public UnsupportedOperations {};

TEST_P(UnsupportedOperations, Cleanup_succeeds) {
    expectStatus(mi_->ft->cleanup(mi_, nullptr, 0), CMPI_RC_OK);
    expectTraceOf("Cleanup");
}

TEST_P(UnsupportedOperations, Cleanup_at_termination_succeeds) {
    expectStatus(mi_->ft->cleanup(mi_, nullptr, 1), CMPI_RC_OK);
    expectTraceOf("Cleanup");
}

TEST_P(UnsupportedOperations, CreateInstance_is_not_supported) {
    expectStatus(mi_->ft->createInstance(mi_, nullptr, nullptr, nullptr, nullptr),
                 CMPI_RC_ERR_NOT_SUPPORTED);
    expectTraceOf("CreateInstance");
}

TEST_P(UnsupportedOperations, ModifyInstance_is_not_supported) {
    expectStatus(mi_->ft->modifyInstance(mi_, nullptr, nullptr, nullptr, nullptr, nullptr),
                 CMPI_RC_ERR_NOT_SUPPORTED);
    expectTraceOf("ModifyInstance");
}

TEST_P(UnsupportedOperations, DeleteInstance_is_not_supported) {
    expectStatus(mi_->ft->deleteInstance(mi_, nullptr, nullptr, nullptr),
                 CMPI_RC_ERR_NOT_SUPPORTED);
    expectTraceOf("DeleteInstance");
}

TEST_P(UnsupportedOperations, ExecQuery_is_not_supported) {
    expectStatus(mi_->ft->execQuery(mi_, nullptr, nullptr, nullptr, "SELECT * FROM X", "WQL"),
                 CMPI_RC_ERR_NOT_SUPPORTED);
    expectTraceOf("ExecQuery");
}

TEST_P(MethodCleanup, Is_not_supported_unlike_Cleanup) {
    CMPIMethodMI* methods = ProviderLibrary::instance().methodMI(name_, nullptr);
    expectStatus(methods->ft->cleanup(methods, nullptr, 1), CMPI_RC_ERR_NOT_SUPPORTED);
    expectStatus(methods->ft->cleanup(methods, nullptr, 0), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(platform_.lineCount(), 0U);
    EXPECT_EQ(platform_.storeCallCount(), 0U);
}

TEST_P(AssociationCleanup, Succeeds) {
    CMPIAssociationMI* associations = ProviderLibrary::instance().associationMI(name_, nullptr);
    expectStatus(associations->ft->cleanup(associations, nullptr, 1), CMPI_RC_OK);
    expectStatus(associations->ft->cleanup(associations, nullptr, 0), CMPI_RC_OK);
    EXPECT_EQ(platform_.lineCount(), 0U);
    EXPECT_EQ(platform_.storeCallCount(), 0U);
}

INSTANTIATE_TEST_SUITE_P(Each, UnsupportedOperations, testing::ValuesIn(providerKinds()),
                         providerName<testing::TestParamInfo<ProviderKind>>);
INSTANTIATE_TEST_SUITE_P(Each, MethodCleanup, testing::ValuesIn(methodProviders()),
                         providerName<testing::TestParamInfo<ProviderKind>>);
INSTANTIATE_TEST_SUITE_P(Each, AssociationCleanup, testing::ValuesIn(associationProviders()),
                         providerName<testing::TestParamInfo<ProviderKind>>);

} // namespace
} // namespace qelo::test
