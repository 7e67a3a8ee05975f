#include <cim/ObjectPath.h>

#include <gtest/gtest.h>

namespace qelo::cim {
namespace {

ObjectPath account(const char* name) {
    ObjectPath path("root/cimv2", "ZANTH_Account");
    path.setKey("SystemName", Value::string("host"));
    path.setKey("Name", Value::string(name));
    return path;
}

TEST(ObjectPath, Names_compare_ignoring_the_case_of_ASCII_letters) {
    EXPECT_TRUE(sameName("ZANTH_Account", "zanth_ACCOUNT"));
    EXPECT_FALSE(sameName("A", "AB"));
    EXPECT_FALSE(sameName("a@", "a`")); // neighbours of the letters
    EXPECT_FALSE(sameName("[", "{"));
    EXPECT_FALSE(sameName("é", "É"));
}

TEST(ObjectPath, Setting_a_key_again_replaces_its_value_in_place) {
    ObjectPath path = account("root");
    path.setKey("SYSTEMNAME", Value::string("other"));
    ASSERT_EQ(path.keys().size(), 2U);
    EXPECT_EQ(path.keys()[0].name, "SystemName");
    EXPECT_EQ(path.key("systemname")->asString(), "other");
}

TEST(ObjectPath, A_key_that_is_not_there_is_null) {
    EXPECT_EQ(account("root").key("Nam"), nullptr);
    ObjectPath path = account("root");
    path.clearKeys();
    EXPECT_EQ(path.key("Name"), nullptr);
}

TEST(ObjectPath, Text_names_the_namespace_and_on_demand_the_host) {
    ObjectPath path = account("root");
    path.setHost("server:5989");
    EXPECT_EQ(path.toText(), R"(root/cimv2:ZANTH_Account.SystemName="host",Name="root")");
    EXPECT_EQ(path.toText(true),
              R"(//server:5989/root/cimv2:ZANTH_Account.SystemName="host",Name="root")");
    EXPECT_EQ(path.toText(false, false), R"(ZANTH_Account.SystemName="host",Name="root")");
    EXPECT_EQ(ObjectPath("root/cimv2", "ZANTH_Group").toText(true), "root/cimv2:ZANTH_Group");
}

TEST(ObjectPath, Numbers_and_booleans_stand_bare_and_texts_in_quotes) {
    ObjectPath path("", "C");
    path.setKey("U", Value::unsignedInteger(Type::UInt8, 5));
    path.setKey("S", Value::signedInteger(Type::SInt8, -5));
    path.setKey("B", Value::boolean(true));
    path.setKey("T", Value::string("a\"\\\n"));
    path.setKey("D", Value::dateTime(DateTime::fromMicroseconds(0, false)));
    path.setKey("N", Value::null(Type::String));
    EXPECT_EQ(path.toText(),
              R"(C.U=5,S=-5,B=true,T="a\"\\\n",D="19700101000000.000000+000",N=NULL)");
}

TEST(ObjectPath, A_reference_is_the_quoted_text_of_its_path) {
    ObjectPath path("", "A");
    path.setKey("Antecedent", Value::reference(account("root")));
    EXPECT_EQ(path.toText(),
              R"(A.Antecedent="root/cimv2:ZANTH_Account.SystemName=\"host\",Name=\"root\"")");
}

TEST(ObjectPath, Equality_ignores_host_namespace_order_and_the_case_of_names) {
    ObjectPath other("root/interop", "zanth_account");
    other.setHost("elsewhere");
    other.setKey("NAME", Value::string("root"));
    other.setKey("SystemName", Value::string("host"));
    EXPECT_EQ(account("root"), other);
}

TEST(ObjectPath, Equality_compares_values_exactly_and_counts_keys) {
    EXPECT_NE(account("root"), account("Root"));
    ObjectPath fewer("root/cimv2", "ZANTH_Account");
    fewer.setKey("Name", Value::string("root"));
    EXPECT_NE(account("root"), fewer);
    EXPECT_NE(fewer, account("root"));
    EXPECT_NE(ObjectPath("", "A"), ObjectPath("", "B"));
    ObjectPath otherKeys("", "ZANTH_Account");
    otherKeys.setKey("Name", Value::string("root"));
    otherKeys.setKey("Host", Value::string("host"));
    EXPECT_NE(account("root"), otherKeys);
}

} // namespace
} // namespace qelo::cim
