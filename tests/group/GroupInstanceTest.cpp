// Enumerating the instances of groups.
#include "GroupFixture.h"

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::IsEmpty;

class GroupInstances : public GroupFixture {
protected:
    // The properties that are set for this list, whatever the broker's own filter does.
    std::vector<std::string> setFor(const PropertyNames& properties) {
        broker_.ignorePropertyFilter(true);
        enumInstances(properties);
        return onlyInstance().propertyNames();
    }
};

TEST_F(GroupInstances, An_instance_has_these_six_properties_in_this_order) {
    platform_.setResourceText(2, "en", L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION", L"Identities");
    serve({groupNode("wheel", {"a", "b"})});
    expectOk(enumInstances());
    EXPECT_THAT(onlyInstance().properties,
                ElementsAre(NamedValue{"CreationClassName", Value::chars("ZANTH_Group")},
                            NamedValue{"Name", Value::chars("wheel")},
                            NamedValue{"Caption", Value::chars("Identities")},
                            NamedValue{"Description", Value::chars("wheel")},
                            NamedValue{"ElementName", Value::chars("wheel")},
                            NamedValue{"GroupMembers", Value::chars("a,b")}));
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(GroupInstances, The_instances_path_has_class_namespace_and_host_and_no_keys_of_its_own) {
    platform_.setSystemName("box7");
    serve({groupNode("wheel")});
    enumInstances();
    EXPECT_EQ(onlyInstance().path.toString(), "//box7/root/cimv2:ZANTH_Group");
    EXPECT_EQ(broker_.callCount("addKey"), 0U);
}

TEST_F(GroupInstances, Instances_come_in_name_order_with_one_CMReturnDone) {
    serve({groupNode("wheel"), groupNode("adm"), groupNode("Staff")});
    expectOk(enumInstances());
    EXPECT_THAT(returned("Name"), ElementsAre("Staff", "adm", "wheel"));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(GroupInstances, The_first_of_two_records_with_one_name_wins) {
    serve({groupNode("wheel", {"first"}), groupNode("wheel", {"second"})});
    enumInstances();
    EXPECT_EQ(onlyInstance().propertyText("GroupMembers"), "first");
}

TEST_F(GroupInstances, The_caption_is_looked_up_in_library_2_of_the_current_language) {
    platform_.setLanguage("de");
    platform_.setResourceText(2, "de", L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION", L"Identit\u00e4ten");
    serve({groupNode("wheel")});
    enumInstances();
    EXPECT_EQ(onlyInstance().propertyText("Caption"), "Identit\xC3\xA4ten");
    ASSERT_EQ(platform_.libraryRequests().size(), 1U);
    EXPECT_EQ(platform_.libraryRequests()[0].number, 2U);
    EXPECT_EQ(platform_.libraryRequests()[0].language, "de");
    ASSERT_EQ(platform_.textRequests().size(), 1U);
    EXPECT_EQ(platform_.textRequests()[0].id, L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION");
}

TEST_F(GroupInstances, A_list_naming_only_GroupMembers_yields_the_two_keys_and_GroupMembers) {
    serve({groupNode("wheel", {"a", "b"})});
    EXPECT_THAT(setFor({{"GroupMembers"}}),
                ElementsAre("CreationClassName", "Name", "GroupMembers"));
}

TEST_F(GroupInstances, Each_property_can_be_asked_for_alone) {
    serve({groupNode("wheel")});
    for (const char* name : {"Caption", "Description", "ElementName", "GroupMembers"}) {
        EXPECT_THAT(setFor({{name}}), ElementsAre("CreationClassName", "Name", name));
    }
}

TEST_F(GroupInstances, A_list_keeps_the_order_of_the_class) {
    serve({groupNode("wheel")});
    EXPECT_THAT(setFor({{"GroupMembers", "Unknown", "Caption", "GroupMembers"}}),
                ElementsAre("CreationClassName", "Name", "Caption", "GroupMembers"));
}

TEST_F(GroupInstances, An_empty_list_yields_the_keys_alone) {
    serve({groupNode("wheel")});
    EXPECT_THAT(setFor(std::vector<const char*>{}), ElementsAre("CreationClassName", "Name"));
}

TEST_F(GroupInstances, Names_in_the_list_are_compared_exactly) {
    serve({groupNode("wheel")});
    EXPECT_THAT(setFor({{"groupmembers", "CAPTION", "ElementName ", "Descriptio"}}),
                ElementsAre("CreationClassName", "Name"));
}

TEST_F(GroupInstances, The_brokers_own_filter_gets_the_list_and_the_two_keys) {
    serve({groupNode("wheel")});
    enumInstances({{"Caption", "Other"}});
    EXPECT_THAT(broker_.calls(), testing::Contains("setPropertyFilter({Caption,Other},"
                                                   "{CreationClassName,Name})"));
    enumInstances();
    EXPECT_THAT(broker_.calls(),
                testing::Contains("setPropertyFilter(null,{CreationClassName,Name})"));
}

TEST_F(GroupInstances, Without_groups_success_and_CMReturnDone_and_nothing_else) {
    serve({});
    expectOk(enumInstances());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    expectSamePoints(pointsOf(source::groupProvider), plainLines("EnumInstances", true));
}

TEST_F(GroupInstances, A_null_instance_is_passed_over) {
    serve({groupNode("a"), groupNode("b"), groupNode("c")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        for (const char* slot : {"newInstance", "newObjectPath"}) {
            broker_.clearFaults();
            broker_.failSlot(slot, 2, fault);
            expectOk(enumInstances());
            EXPECT_THAT(returned("Name"), ElementsAre("a", "c"));
            EXPECT_EQ(broker_.doneCount(), 1);
        }
    }
}

TEST_F(GroupInstances, Without_a_broker_nothing_is_returned) {
    serve({groupNode("wheel")});
    registerBroker(nullptr);
    expectOk(enumInstances());
    expectNothingReturned();
}

} // namespace
} // namespace qelo::test
