// The service factory by itself.
#include "ServiceFixture.h"

#include <service/SimAccountManagementServiceObjFactory.h>

namespace qelo::test {
namespace {

using Factory = Tesk::SimpleIdentityManagementProvider::SimAccountManagementServiceFactory;
using Tesk::SimpleIdentityManagementProvider::SimAccountManagementService;
using testing::IsEmpty;

class ServiceFactory : public testing::Test {
protected:
    ServiceFactory() {
        platform_.reset();
        broker_.ignorePropertyFilter(true);
    }
    ~ServiceFactory() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    int one(Factory& factory, const std::string& name) {
        return factory.getOneSimAccountManagementServiceCMPIInstance(
            broker_.get(), ref_, broker_.makeString(name), nullptr, instances_, &status_);
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    const CMPIObjectPath* ref_ = broker_.makePath(requestNameSpace, serviceClass);
    std::vector<CMPIObjectPath*> paths_;
    std::vector<CMPIInstance*> instances_;
    CMPIStatus status_{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
};

TEST_F(ServiceFactory, Made_without_flags_it_is_empty_and_reads_nothing) {
    platform_.addNode(serviceNode("/a"));
    Factory factory;
    EXPECT_EQ(factory.getNumberOfInstances(), 0U);
    EXPECT_EQ(platform_.storeCallCount(), 0U);
}

TEST_F(ServiceFactory, The_flags_are_traced_and_change_nothing) {
    platform_.addNode(serviceNode("/a"));
    for (const bool isCap : {false, true}) {
        for (const bool isSen : {false, true}) {
            platform_.forget();
            EXPECT_EQ(Factory(isCap, isSen).getNumberOfInstances(), 1U);
            const std::string params =
                std::string(" isCap=") + (isCap ? "1" : "0") + " isSen=" + (isSen ? "1" : "0");
            const std::string function = "SimAccountManagementServiceFactory";
            const auto expected = ExpectedTrace()
                                      .entering(source::serviceFactory, function, params)
                                      .exiting(source::serviceFactory, function, params)
                                      .points();
            const std::vector<std::string> points = tracePoints(platform_.lines());
            EXPECT_EQ(points.at(0), expected[0]);
            EXPECT_THAT(points, testing::Contains(expected[1]));
        }
    }
}

TEST_F(ServiceFactory, The_number_of_instances_is_traced_as_a_variable) {
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    Factory factory(true, false);
    platform_.forget();
    factory.getNumberOfInstances();
    EXPECT_THAT(tracePoints(platform_.lines()),
                testing::Contains(ExpectedTrace()
                                      .variable(source::serviceFactory, "getNumberOfInstances",
                                                "noOfInstances", "2")
                                      .points()[0]));
}

TEST_F(ServiceFactory, Paths_answer_0_1_or_2) {
    Factory empty;
    EXPECT_EQ(
        empty.getAllSimAccountManagementServiceCMPIObjPaths(broker_.get(), ref_, paths_, &status_),
        1);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED) << "untouched";
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    Factory factory(true, false);
    EXPECT_EQ(
        factory.getAllSimAccountManagementServiceCMPIObjPaths(broker_.get(), ref_, paths_, nullptr),
        0);
    EXPECT_EQ(paths_.size(), 2U);
    broker_.failSlot("newObjectPath", 4, Fault::null());
    EXPECT_EQ(
        factory.getAllSimAccountManagementServiceCMPIObjPaths(broker_.get(), ref_, paths_, nullptr),
        2);
    EXPECT_EQ(paths_.size(), 3U) << "those before the failure stay";
}

TEST_F(ServiceFactory, IsObjPath_is_only_traced) {
    for (const bool isObjPath : {false, true}) {
        platform_.forget();
        Factory factory;
        const CMPIInstance* instance = factory.makeSimAccountManagementServiceInstance(
            broker_.get(), ref_, SimAccountManagementService(), nullptr, isObjPath, &status_);
        ASSERT_NE(instance, nullptr);
        EXPECT_EQ(broker_.inspect(instance).properties.size(), 9U);
        EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED) << "rc is not changed";
    }
}

TEST_F(ServiceFactory, An_instance_that_cannot_be_made_is_null) {
    Factory factory;
    for (const char* slot : {"newObjectPath", "newInstance"}) {
        for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
            broker_.clearFaults();
            broker_.failSlot(slot, 0, fault);
            EXPECT_EQ(factory.makeSimAccountManagementServiceInstance(broker_.get(), ref_,
                                                                      SimAccountManagementService(),
                                                                      nullptr, false, &status_),
                      nullptr);
            EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
        }
    }
}

TEST_F(ServiceFactory, All_instances_answer_0_null_ones_included) {
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    Factory factory(true, false);
    broker_.failSlot("newInstance", 1, Fault::null());
    EXPECT_EQ(factory.getAllSimAccountManagementServiceCMPIInstances(broker_.get(), ref_, nullptr,
                                                                     false, instances_, &status_),
              0);
    ASSERT_EQ(instances_.size(), 2U);
    EXPECT_EQ(instances_[0], nullptr);
}

TEST_F(ServiceFactory, One_instance_answers_0_also_when_no_record_has_the_key) {
    platform_.addNode(serviceNode("/a"));
    Factory factory(true, false);
    EXPECT_EQ(one(factory, serviceName("/x")), 0);
    EXPECT_THAT(instances_, IsEmpty());
    EXPECT_EQ(one(factory, serviceName("/a")), 0);
    EXPECT_EQ(instances_.size(), 1U);
}

} // namespace
} // namespace qelo::test
