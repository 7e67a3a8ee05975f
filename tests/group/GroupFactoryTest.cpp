// The group factory by itself: what its members answer, and how its flag limits an instance.
#include "GroupFixture.h"

#include <group/SimGroupObjFactory.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimGroup;
using Tesk::SimpleIdentityManagementProvider::SimGroupFactory;
using testing::ElementsAre;
using testing::IsEmpty;

class GroupFactory : public testing::Test {
protected:
    GroupFactory() {
        platform_.reset();
        // The list alone decides what is set, so the broker's own filter is out of the way.
        broker_.ignorePropertyFilter(true);
    }
    ~GroupFactory() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    void serve(const std::vector<StoreNode>& groups) {
        for (const StoreNode& group : groups) {
            platform_.addNode(group);
        }
    }

    // The properties of the instance of one group.
    std::vector<std::string> madeWith(const PropertyNames& properties, bool isObjPath) {
        SimGroup record;
        record.setName("wheel");
        std::vector<const char*> list;
        CMPIInstance* instance = factory_.makeSimGroupInstance(
            broker_.get(), ref_, record, propertyList(properties, list), isObjPath, nullptr);
        return instance == nullptr ? std::vector<std::string>{"no instance"}
                                   : broker_.inspect(instance).propertyNames();
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    const CMPIObjectPath* ref_ = broker_.makePath(requestNameSpace, "ZANTH_Group");
    SimGroupFactory factory_;
    std::vector<CMPIObjectPath*> paths_;
    std::vector<CMPIInstance*> instances_;
    CMPIStatus status_{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
};

TEST_F(GroupFactory, Made_without_flags_it_is_empty_and_reads_nothing) {
    serve({groupNode("wheel")});
    EXPECT_EQ(factory_.getNumberOfInstances(), 0U);
    EXPECT_EQ(platform_.storeCallCount(), 0U);
}

TEST_F(GroupFactory, The_flags_change_nothing) {
    serve({groupNode("wheel"), groupNode("adm")});
    for (const bool first : {false, true}) {
        for (const bool second : {false, true}) {
            SimGroupFactory factory(first, second);
            EXPECT_EQ(factory.getNumberOfInstances(), 2U);
        }
    }
}

TEST_F(GroupFactory, The_number_of_instances_counts_names) {
    serve({groupNode("wheel"), groupNode("adm"), groupNode("wheel")});
    EXPECT_EQ(SimGroupFactory(true, false).getNumberOfInstances(), 2U);
}

TEST_F(GroupFactory, Paths_of_no_group_answer_1_and_leave_the_status) {
    EXPECT_EQ(factory_.getAllSimGroupCMPIObjPaths(broker_.get(), ref_, paths_, &status_), 1);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_THAT(paths_, IsEmpty());
}

TEST_F(GroupFactory, Paths_answer_0_and_are_appended) {
    serve({groupNode("wheel"), groupNode("adm")});
    SimGroupFactory factory(true, false);
    EXPECT_EQ(factory.getAllSimGroupCMPIObjPaths(broker_.get(), ref_, paths_, &status_), 0);
    EXPECT_EQ(factory.getAllSimGroupCMPIObjPaths(broker_.get(), ref_, paths_, &status_), 0);
    ASSERT_EQ(paths_.size(), 4U);
    EXPECT_EQ(broker_.inspect(paths_[3]).keyText("Name"), "wheel");
}

TEST_F(GroupFactory, A_path_that_cannot_be_made_answers_2_and_keeps_those_before) {
    serve({groupNode("wheel"), groupNode("adm")});
    SimGroupFactory factory(true, false);
    broker_.failSlot("newObjectPath", 2, Fault::null());
    EXPECT_EQ(factory.getAllSimGroupCMPIObjPaths(broker_.get(), ref_, paths_, &status_), 2);
    EXPECT_EQ(paths_.size(), 1U);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(broker_.inspect(status_.msg), "Create CMPIObjectPath failed.");
}

TEST_F(GroupFactory, The_status_may_be_left_out) {
    serve({groupNode("wheel")});
    SimGroupFactory factory(true, false);
    EXPECT_EQ(factory.getAllSimGroupCMPIObjPaths(broker_.get(), ref_, paths_, nullptr), 0);
    broker_.failSlot("newObjectPath", 0, Fault::null());
    EXPECT_EQ(factory.getAllSimGroupCMPIObjPaths(broker_.get(), ref_, paths_, nullptr), 2);
    EXPECT_THAT(broker_.traces(), ElementsAre(BrokerTrace{2, "SimGroupProvider", pathFailedTrace}));
    EXPECT_EQ(broker_.callCount("newString"), 0U) << "no text is made for nobody";
}

TEST_F(GroupFactory, A_null_list_yields_everything) {
    EXPECT_THAT(madeWith(std::nullopt, false),
                ElementsAre("CreationClassName", "Name", "Caption", "Description", "ElementName",
                            "GroupMembers"));
}

TEST_F(GroupFactory, A_null_list_with_isObjPath_yields_the_keys_alone) {
    EXPECT_THAT(madeWith(std::nullopt, true), ElementsAre("CreationClassName", "Name"));
}

TEST_F(GroupFactory, A_given_list_is_honoured_whatever_isObjPath_says) {
    for (const bool isObjPath : {false, true}) {
        EXPECT_THAT(madeWith({{"Caption"}}, isObjPath),
                    ElementsAre("CreationClassName", "Name", "Caption"));
        EXPECT_THAT(madeWith(std::vector<const char*>{}, isObjPath),
                    ElementsAre("CreationClassName", "Name"));
    }
}

TEST_F(GroupFactory, An_instance_that_cannot_be_made_is_null_and_leaves_the_status) {
    for (const char* slot : {"newObjectPath", "newInstance"}) {
        for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
            broker_.clearFaults();
            broker_.failSlot(slot, 0, fault);
            EXPECT_EQ(factory_.makeSimGroupInstance(broker_.get(), ref_, SimGroup(), nullptr, false,
                                                    &status_),
                      nullptr);
            EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
        }
    }
}

TEST_F(GroupFactory, An_instance_leaves_the_status_alone) {
    factory_.makeSimGroupInstance(broker_.get(), ref_, SimGroup(), nullptr, false, &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
}

TEST_F(GroupFactory, All_instances_answer_0_also_without_groups) {
    EXPECT_EQ(factory_.getAllSimGroupCMPIInstances(broker_.get(), ref_, nullptr, false, instances_,
                                                   &status_),
              0);
    EXPECT_THAT(instances_, IsEmpty());
    serve({groupNode("wheel"), groupNode("adm")});
    SimGroupFactory factory(true, false);
    broker_.failSlot("newInstance", 1, Fault::null());
    EXPECT_EQ(factory.getAllSimGroupCMPIInstances(broker_.get(), ref_, nullptr, true, instances_,
                                                  &status_),
              0);
    ASSERT_EQ(instances_.size(), 2U) << "null ones included";
    EXPECT_EQ(instances_[0], nullptr);
    EXPECT_THAT(broker_.inspect(instances_[1]).propertyNames(),
                ElementsAre("CreationClassName", "Name"));
}

TEST_F(GroupFactory, One_instance_answers_0_when_found_and_1_when_not) {
    serve({groupNode("wheel")});
    SimGroupFactory factory(true, false);
    const auto one = [&](const char* name) {
        return factory.getOneSimGroupCMPIInstance(broker_.get(), ref_, broker_.makeString(name),
                                                  nullptr, instances_, &status_);
    };
    EXPECT_EQ(one("Wheel"), 1);
    EXPECT_THAT(instances_, IsEmpty());
    EXPECT_EQ(one("wheel"), 0);
    EXPECT_EQ(instances_.size(), 1U);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    broker_.failSlot("newInstance", 0, Fault::null());
    EXPECT_EQ(one("wheel"), 0) << "also when the instance cannot be made";
    EXPECT_EQ(instances_.at(1), nullptr);
}

} // namespace
} // namespace qelo::test
