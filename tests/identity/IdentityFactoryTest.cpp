// The identity's record and factory by themselves.
#include "IdentityFixture.h"

#include <identity/SimIdentityObjFactory.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::getSimIdentityInstances;
using Tesk::SimpleIdentityManagementProvider::SimIdentity;
using Tesk::SimpleIdentityManagementProvider::SimIdentityFactory;
using testing::ElementsAre;
using testing::IsEmpty;

TEST(IdentityRecord, Both_getters_answer_the_constant) {
    RecordingPlatform::instance().reset();
    SimIdentity identity;
    EXPECT_EQ(identity.getInstanceID(), identifier);
    EXPECT_EQ(identity.getElementName(), identifier);
    EXPECT_EQ(RecordingPlatform::instance().lineCount(), 0U) << "nothing is traced";
}

TEST(IdentityRecord, Loading_appends_one_and_answers_0) {
    RecordingPlatform::instance().reset();
    std::vector<SimIdentity> records;
    EXPECT_EQ(getSimIdentityInstances(records), 0U);
    EXPECT_EQ(records.size(), 1U);
    EXPECT_EQ(getSimIdentityInstances(records), 0U);
    EXPECT_EQ(records.size(), 2U);
    EXPECT_EQ(RecordingPlatform::instance().storeCallCount(), 0U);
}

class IdentityFactory : public testing::Test {
protected:
    IdentityFactory() {
        RecordingPlatform::instance().reset();
        broker_.ignorePropertyFilter(true);
    }
    ~IdentityFactory() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    std::vector<std::string> madeWith(const PropertyNames& properties, bool isObjPath) {
        std::vector<const char*> list;
        CMPIInstance* instance =
            factory_.makeSimIdentityInstance(broker_.get(), ref_, SimIdentity(),
                                             propertyList(properties, list), isObjPath, &status_);
        return instance == nullptr ? std::vector<std::string>{"no instance"}
                                   : broker_.inspect(instance).propertyNames();
    }

    RecordingBroker broker_;
    const CMPIObjectPath* ref_ = broker_.makePath(requestNameSpace, "ZANTH_SimIdentity");
    SimIdentityFactory factory_{true, false};
    std::vector<CMPIObjectPath*> paths_;
    std::vector<CMPIInstance*> instances_;
    CMPIStatus status_{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
};

TEST_F(IdentityFactory, The_flags_change_nothing) {
    for (const bool first : {false, true}) {
        for (const bool second : {false, true}) {
            EXPECT_EQ(SimIdentityFactory(first, second).getNumberOfInstances(), 1U);
        }
    }
}

TEST_F(IdentityFactory, Made_without_flags_it_finds_nothing_and_says_so_at_level_2) {
    SimIdentityFactory empty;
    EXPECT_EQ(empty.getAllSimIdentityCMPIObjPaths(broker_.get(), ref_, paths_, &status_), 1);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_THAT(paths_, IsEmpty());
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{2, "SimIdentityProvider", "***No instance found***"}));
    EXPECT_EQ(empty.getAllSimIdentityCMPIInstances(broker_.get(), ref_, nullptr, false, instances_,
                                                   &status_),
              0);
    EXPECT_THAT(instances_, IsEmpty());
}

TEST_F(IdentityFactory, Paths_answer_0_or_2) {
    EXPECT_EQ(factory_.getAllSimIdentityCMPIObjPaths(broker_.get(), ref_, paths_, nullptr), 0);
    EXPECT_EQ(paths_.size(), 1U);
    broker_.failSlot("newObjectPath", 0, Fault::nullHandle());
    EXPECT_EQ(factory_.getAllSimIdentityCMPIObjPaths(broker_.get(), ref_, paths_, nullptr), 2);
    EXPECT_EQ(paths_.size(), 1U);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{2, "SimIdentityProvider", identityPathFailedTrace}));
}

TEST_F(IdentityFactory, A_null_list_yields_everything) {
    EXPECT_THAT(madeWith(std::nullopt, false), ElementsAre("InstanceID", "ElementName"));
}

TEST_F(IdentityFactory, A_null_list_with_IsObjPath_yields_no_ElementName) {
    EXPECT_THAT(madeWith(std::nullopt, true), ElementsAre("InstanceID"));
}

TEST_F(IdentityFactory, A_given_list_is_honoured_whatever_IsObjPath_says) {
    for (const bool isObjPath : {false, true}) {
        EXPECT_THAT(madeWith({{"ElementName"}}, isObjPath),
                    ElementsAre("InstanceID", "ElementName"));
        EXPECT_THAT(madeWith({{"InstanceID"}}, isObjPath), ElementsAre("InstanceID"));
    }
}

TEST_F(IdentityFactory, Making_an_instance_leaves_the_status_alone) {
    madeWith(std::nullopt, false);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    broker_.failSlot("newInstance", 0, Fault::error());
    EXPECT_THAT(madeWith(std::nullopt, false), ElementsAre("no instance"));
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
}

TEST_F(IdentityFactory, One_instance_answers_0_when_found_and_1_when_not) {
    const auto one = [&](const char* id) {
        return factory_.getOneSimIdentityCMPIInstance(broker_.get(), ref_, broker_.makeString(id),
                                                      nullptr, instances_, &status_);
    };
    EXPECT_EQ(one("zanth:simidentity1"), 1);
    EXPECT_THAT(instances_, IsEmpty());
    EXPECT_EQ(one(identifier), 0);
    EXPECT_EQ(instances_.size(), 1U);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
}

} // namespace
} // namespace qelo::test
