#include <cim/Instance.h>

#include <gtest/gtest.h>

namespace qelo::cim {
namespace {

Instance group() {
    ObjectPath path("root/cimv2", "ZANTH_Group");
    path.setKey("Name", Value::string("wheel"));
    Instance instance(path);
    instance.setProperty("Name", Value::string("wheel"), "CIM_Group");
    instance.setProperty("GroupMembers", Value::string("root,adm"));
    return instance;
}

TEST(Instance, Properties_keep_the_order_in_which_they_were_set) {
    Instance instance = group();
    instance.setProperty("A", Value());
    ASSERT_EQ(instance.properties().size(), 3U);
    EXPECT_EQ(instance.properties()[0].name, "Name");
    EXPECT_EQ(instance.properties()[1].name, "GroupMembers");
    EXPECT_EQ(instance.properties()[2].name, "A");
}

TEST(Instance, Setting_a_property_again_replaces_value_and_origin_in_place) {
    Instance instance = group();
    instance.setProperty("NAME", Value::string("staff"), "ZANTH_Group");
    ASSERT_EQ(instance.properties().size(), 2U);
    EXPECT_EQ(instance.properties()[0].name, "Name");
    EXPECT_EQ(instance.properties()[0].value, Value::string("staff"));
    EXPECT_EQ(instance.properties()[0].origin, "ZANTH_Group");
}

TEST(Instance, Properties_are_found_ignoring_case) {
    const Instance instance = group();
    ASSERT_NE(instance.property("groupmembers"), nullptr);
    EXPECT_EQ(instance.property("groupmembers")->asString(), "root,adm");
    EXPECT_EQ(instance.property("Members"), nullptr);
}

TEST(Instance, The_class_is_that_of_the_path) {
    EXPECT_EQ(group().className(), "ZANTH_Group");
    Instance instance;
    EXPECT_EQ(instance.className(), "");
    instance.setPath(ObjectPath("", "X"));
    EXPECT_EQ(instance.className(), "X");
    instance.mutablePath().setClassName("Y");
    EXPECT_EQ(instance.className(), "Y");
}

TEST(Instance, Equality_ignores_order_and_origin) {
    Instance other(group().path());
    other.setProperty("GroupMembers", Value::string("root,adm"));
    other.setProperty("Name", Value::string("wheel"));
    EXPECT_EQ(group(), other);
}

TEST(Instance, Instances_with_another_path_or_value_differ) {
    Instance value = group();
    value.setProperty("GroupMembers", Value::string("root"));
    EXPECT_NE(group(), value);
    Instance more = group();
    more.setProperty("A", Value());
    EXPECT_NE(group(), more);
    EXPECT_NE(more, group());
    Instance path = group();
    path.mutablePath().setKey("Name", Value::string("x"));
    EXPECT_NE(group(), path);
    Instance renamed(group().path());
    renamed.setProperty("Name", Value::string("wheel"));
    renamed.setProperty("Other", Value::string("root,adm"));
    EXPECT_NE(group(), renamed);
}

} // namespace
} // namespace qelo::cim
