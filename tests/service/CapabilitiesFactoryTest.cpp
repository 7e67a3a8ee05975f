// The capabilities factory by itself.
#include "ServiceFixture.h"

#include <service/SimAccountManagementCapabilitiesObjFactory.h>

namespace qelo::test {
namespace {

using Factory = Tesk::SimpleIdentityManagementProvider::SimAccountManagementCapabilitiesFactory;
using Tesk::SimpleIdentityManagementProvider::SimAccountManagementCapabilities;
using testing::IsEmpty;

class CapabilitiesFactory : public testing::Test {
protected:
    CapabilitiesFactory() {
        platform_.reset();
        broker_.ignorePropertyFilter(true);
    }
    ~CapabilitiesFactory() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    const CMPIObjectPath* ref_ = broker_.makePath(requestNameSpace, capabilitiesClass);
    std::vector<CMPIObjectPath*> paths_;
    std::vector<CMPIInstance*> instances_;
    CMPIStatus status_{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
};

TEST_F(CapabilitiesFactory, Made_without_flags_it_is_empty_reads_nothing_and_traces_nothing) {
    platform_.addNode(serviceNode("/a"));
    Factory factory;
    EXPECT_EQ(platform_.lineCount(), 0U);
    EXPECT_EQ(factory.getNumberOfInstances(), 0U);
    EXPECT_EQ(platform_.storeCallCount(), 0U);
}

TEST_F(CapabilitiesFactory, The_flags_are_ignored_and_not_traced) {
    platform_.addNode(serviceNode("/a"));
    for (const bool first : {false, true}) {
        for (const bool second : {false, true}) {
            EXPECT_EQ(Factory(first, second).getNumberOfInstances(), 1U);
        }
    }
    for (const LogLine& line : platform_.lines()) {
        EXPECT_EQ(line.message.find("isCap"), std::string::npos);
        EXPECT_EQ(line.message.find("isSen"), std::string::npos);
    }
}

TEST_F(CapabilitiesFactory, Paths_answer_0_1_or_2) {
    Factory empty;
    EXPECT_EQ(empty.getAllSimAccountManagementCapabilitiesCMPIObjPaths(broker_.get(), ref_, paths_,
                                                                       &status_),
              1);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    platform_.addNode(serviceNode("/a"));
    Factory factory(true, false);
    EXPECT_EQ(factory.getAllSimAccountManagementCapabilitiesCMPIObjPaths(broker_.get(), ref_,
                                                                         paths_, nullptr),
              0);
    broker_.failSlot("newObjectPath", 0, Fault::null());
    EXPECT_EQ(factory.getAllSimAccountManagementCapabilitiesCMPIObjPaths(broker_.get(), ref_,
                                                                         paths_, nullptr),
              2);
    EXPECT_EQ(paths_.size(), 1U);
}

TEST_F(CapabilitiesFactory, IsObjPath_is_only_traced) {
    for (const bool isObjPath : {false, true}) {
        Factory factory;
        const CMPIInstance* instance = factory.makeSimAccountManagementCapabilitiesInstance(
            broker_.get(), ref_, SimAccountManagementCapabilities(), nullptr, isObjPath, nullptr);
        ASSERT_NE(instance, nullptr);
        EXPECT_EQ(broker_.inspect(instance).properties.size(), 5U);
    }
}

TEST_F(CapabilitiesFactory, One_instance_answers_0_also_when_no_record_has_the_key) {
    platform_.addNode(serviceNode("/a"));
    Factory factory(true, false);
    const auto one = [&](const std::string& id) {
        return factory.getOneSimAccountManagementCapabilitiesCMPIInstance(
            broker_.get(), ref_, broker_.makeString(id), nullptr, instances_, &status_);
    };
    EXPECT_EQ(one(capabilitiesId("/x")), 0);
    EXPECT_THAT(instances_, IsEmpty());
    EXPECT_EQ(one(capabilitiesId("/a")), 0);
    EXPECT_EQ(instances_.size(), 1U);
}

} // namespace
} // namespace qelo::test
