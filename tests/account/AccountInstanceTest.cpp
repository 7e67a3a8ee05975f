// What an account looks like as a CIM instance.
#include "AccountFixture.h"

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

class AccountInstance : public AccountFixture {
protected:
    // The only account of a store, with one property given another value.
    Instance instanceWith(Properties id, PropertyValue value) {
        StoreNode node = fullAccountNode("alice");
        node.properties[id] = std::move(value);
        serve({node});
        expectSuccess(enumInstances());
        return onlyInstance();
    }
};

std::vector<NamedValue> keyProperties() {
    std::vector<NamedValue> keys;
    for (const NamedValue& key : accountKeys("alice")) {
        keys.push_back({key.name, Value::chars(key.value.text)});
    }
    return keys;
}

Value oneString(const std::string& text) {
    return Value::array(CMPI_string, {Value::string(text)});
}

std::vector<NamedValue> furtherProperties() {
    return {
        {"Caption", Value::chars("Simple Identity")},
        {"Description", Value::chars("Full name of alice")},
        {"FullName", Value::chars("")},
        {"GroupId", Value::uint32(100)},
        {"daysMustChangePasswordAfter", Value::uint32(90)},
        {"daysExpireAfter", Value::uint32(30)},
        {"UserID", Value::chars("1001")},
        {"UserPassword", oneString("Secret-of-the-account")},
        {"OrganizationName", oneString("Organisation")},
        {"ElementName", Value::chars("alice")},
        {"RequestedState", Value::uint16(2)},
        {"EnabledState", Value::uint16(2)},
        {"InactivityTimeout", Value::dateTime("20140307123005.000000+000")},
        {"MaximumSuccessiveLoginFailures", Value::uint16(5)},
        {"PasswordExpiration", Value::dateTime("20150408133106.000000+000")},
        {"PasswordHistoryDepth", Value::uint16(4)},
        {"ComplexPasswordRulesEnforced",
         Value::array(CMPI_uint16, {Value::uint16(2), Value::uint16(8), Value::uint16(4)})},
        {"HomeDirectory", Value::chars("/home/alice")},
        {"ScriptPath", Value::chars("/bin/bash")},
        {"passwordLastChanged", Value::dateTime("20130206112904.000000+000")},
        {"daysMustKeepPassword", Value::uint32(2)},
        {"daysWarnBeforePasswordExpire", Value::uint32(7)},
        {"passwordExpirationDate", Value::dateTime("20150408133106.000000+000")},
        {"AccountDisable", Value::boolean(false)},
    };
}

constexpr unsigned long captionLibrary = 2;
constexpr const wchar_t* captionId = L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION";

TEST_F(AccountInstance, Has_four_keys_and_24_properties_in_their_order) {
    platform_.setResourceText(captionLibrary, "en", captionId, L"Simple Identity");
    serve({fullAccountNode("alice")});
    expectSuccess(enumInstances());
    std::vector<NamedValue> expected = keyProperties();
    const std::vector<NamedValue> further = furtherProperties();
    expected.insert(expected.end(), further.begin(), further.end());
    ASSERT_EQ(expected.size(), 28U);
    EXPECT_THAT(onlyInstance().properties, ElementsAreArray(expected));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_TRUE(exitMarked());
}

TEST_F(AccountInstance, Each_property_is_set_exactly_once) {
    serve({fullAccountNode("alice")});
    enumInstances();
    EXPECT_EQ(broker_.callCount("setProperty"), 28U);
}

TEST_F(AccountInstance, Is_made_on_a_path_with_host_and_namespace) {
    platform_.setSystemName("box7");
    classPath_ = broker_.makePath("root/other", "ZANTH_Account");
    serve({accountNode("alice")});
    enumInstances();
    const Path path = onlyInstance().path;
    EXPECT_EQ(path.className, "ZANTH_Account");
    EXPECT_EQ(path.nameSpace, "root/other");
    EXPECT_EQ(path.host, "box7");
    EXPECT_EQ(onlyInstance().propertyText("SystemName"), "box7");
}

TEST_F(AccountInstance, The_brokers_own_filter_is_given_the_list_and_the_keys) {
    serve({accountNode("alice")});
    enumInstances({{"Caption", "UserID"}});
    EXPECT_THAT(broker_.calls(),
                testing::Contains("setPropertyFilter({Caption,UserID},{SystemCreationClassName,"
                                  "SystemName,CreationClassName,Name})"));
    enumInstances();
    EXPECT_THAT(broker_.calls(),
                testing::Contains("setPropertyFilter(null,{SystemCreationClassName,SystemName,"
                                  "CreationClassName,Name})"));
}

TEST_F(AccountInstance, The_caption_comes_from_resource_library_2_in_the_language) {
    platform_.setLanguage("de");
    platform_.setResourceText(captionLibrary, "de", captionId, L"Identit\u00e4t \u20ac \U0001F600");
    serve({accountNode("alice")});
    enumInstances();
    EXPECT_EQ(onlyInstance().propertyText("Caption"),
              "Identit\xC3\xA4t \xE2\x82\xAC \xF0\x9F\x98\x80");
    ASSERT_EQ(platform_.libraryRequests().size(), 1U);
    EXPECT_EQ(platform_.libraryRequests()[0].number, captionLibrary);
    EXPECT_EQ(platform_.libraryRequests()[0].language, "de");
    ASSERT_EQ(platform_.textRequests().size(), 1U);
    EXPECT_EQ(platform_.textRequests()[0].library,
              RecordingPlatform::resourceLibraryName(captionLibrary, "de"));
    EXPECT_EQ(platform_.textRequests()[0].id, captionId);
}

TEST_F(AccountInstance, Description_carries_the_full_name_and_FullName_stays_empty) {
    const Instance instance = instanceWith(FullName, "Alice Arden");
    EXPECT_EQ(instance.propertyText("Description"), "Alice Arden");
    EXPECT_EQ(instance.propertyText("FullName"), "");
}

TEST_F(AccountInstance, Both_expiration_properties_carry_the_same_date) {
    const Instance instance = instanceWith(PasswordExpiration, "2020-01-02 03:04:05");
    EXPECT_EQ(instance.propertyText("PasswordExpiration"), "20200102030405.000000+000");
    EXPECT_EQ(instance.propertyText("passwordExpirationDate"), "20200102030405.000000+000");
}

TEST_F(AccountInstance, Numbers_wider_than_their_property_keep_their_low_16_bits) {
    StoreNode node = fullAccountNode("alice");
    node.properties[MaxLoginFailures] = 70000U;
    node.properties[PasswordHistoryDepth] = 65536U;
    serve({node});
    enumInstances();
    EXPECT_EQ(propertyOf(onlyInstance(), "MaximumSuccessiveLoginFailures"), Value::uint16(4464));
    EXPECT_EQ(propertyOf(onlyInstance(), "PasswordHistoryDepth"), Value::uint16(0));
}

TEST_F(AccountInstance, Numbers_of_32_bits_keep_their_full_range) {
    StoreNode node = fullAccountNode("alice");
    node.properties[GroupId] = "4294967295";
    node.properties[DaysExpireAfter] = 4294967295U;
    serve({node});
    enumInstances();
    EXPECT_EQ(propertyOf(onlyInstance(), "GroupId"), Value::uint32(4294967295U));
    EXPECT_EQ(propertyOf(onlyInstance(), "daysExpireAfter"), Value::uint32(4294967295U));
}

TEST_F(AccountInstance, A_locked_account_is_disabled_in_all_three_properties) {
    const Instance instance = instanceWith(AccountState, 16U);
    EXPECT_EQ(propertyOf(instance, "RequestedState"), Value::uint16(3));
    EXPECT_EQ(propertyOf(instance, "EnabledState"), Value::uint16(3));
    EXPECT_EQ(propertyOf(instance, "AccountDisable"), Value::boolean(true));
}

TEST_F(AccountInstance, An_expired_account_has_state_6_and_is_not_disabled) {
    const Instance instance = instanceWith(AccountState, 12U);
    EXPECT_EQ(propertyOf(instance, "RequestedState"), Value::uint16(6));
    EXPECT_EQ(propertyOf(instance, "EnabledState"), Value::uint16(6));
    EXPECT_EQ(propertyOf(instance, "AccountDisable"), Value::boolean(false));
}

TEST_F(AccountInstance, Without_rules_the_list_is_empty_and_not_NULL) {
    const Instance instance = instanceWith(PasswordRules, std::vector<unsigned int>{});
    EXPECT_EQ(propertyOf(instance, "ComplexPasswordRulesEnforced"), Value::array(CMPI_uint16, {}));
}

TEST_F(AccountInstance, A_bare_account_has_every_property_with_its_default) {
    serve({bareAccountNode()});
    expectSuccess(enumInstances());
    const Instance instance = onlyInstance();
    ASSERT_EQ(instance.properties.size(), 28U);
    EXPECT_EQ(instance.propertyText("Name"), "");
    EXPECT_EQ(propertyOf(instance, "UserPassword"), oneString(""));
    EXPECT_EQ(propertyOf(instance, "OrganizationName"), oneString(""));
    EXPECT_EQ(propertyOf(instance, "RequestedState"), Value::uint16(0));
    EXPECT_EQ(propertyOf(instance, "EnabledState"), Value::uint16(0));
    EXPECT_EQ(propertyOf(instance, "AccountDisable"), Value::boolean(false));
    for (const char* date : {"InactivityTimeout", "PasswordExpiration", "passwordLastChanged",
                             "passwordExpirationDate"}) {
        EXPECT_EQ(propertyOf(instance, date), Value::nullOf(CMPI_dateTime)) << date;
    }
}

TEST_F(AccountInstance, Dates_are_asked_of_the_broker_by_their_adjusted_text) {
    StoreNode node = accountNode("alice");
    node.properties[InactivityTimeout] = "2014/03/07 12:30:05 GMT+1";
    node.properties[PasswordLastChanged] = "20140307";
    serve({node});
    enumInstances();
    EXPECT_THAT(broker_.calls(),
                testing::Contains("newDateTimeFromChars(\"20140307123005.000000+000\")"));
    EXPECT_THAT(broker_.calls(), testing::Contains("newDateTimeFromChars(\"\")"));
}

TEST_F(AccountInstance, Fourteen_digits_that_are_no_date_give_a_NULL_date) {
    const Instance instance = instanceWith(InactivityTimeout, "99999999999999");
    EXPECT_EQ(propertyOf(instance, "InactivityTimeout"), Value::nullOf(CMPI_dateTime));
}

// ---- property lists ----

TEST_F(AccountInstance, Properties_Caption_gives_the_four_keys_and_Caption_only) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    expectSuccess(enumInstances({{"Caption"}}));
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "Name",
                            "Caption"));
}

TEST_F(AccountInstance, The_list_is_honoured_also_where_the_brokers_filter_is_not) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    enumInstances({{"UserID", "GroupId"}});
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "Name",
                            "GroupId", "UserID"));
}

TEST_F(AccountInstance, Names_in_a_list_are_compared_exactly) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    enumInstances({{"caption", "USERID", "passwordexpiration", "Unknown", ""}});
    EXPECT_EQ(onlyInstance().properties.size(), 4U);
}

TEST_F(AccountInstance, An_empty_list_leaves_the_keys) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    enumInstances(PropertyNames(std::in_place));
    EXPECT_EQ(onlyInstance().properties.size(), 4U);
}

TEST_F(AccountInstance, Keys_are_set_whatever_the_list_says) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    enumInstances({{"Name", "Name", "ElementName"}});
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "Name",
                            "ElementName"));
}

class EachProperty : public AccountInstance, public testing::WithParamInterface<std::size_t> {};

TEST_P(EachProperty, Can_be_asked_for_alone) {
    broker_.ignorePropertyFilter(true);
    platform_.setResourceText(captionLibrary, "en", captionId, L"Simple Identity");
    const NamedValue wanted = furtherProperties()[GetParam()];
    serve({fullAccountNode("alice")});
    enumInstances({{wanted.name.c_str()}});
    std::vector<NamedValue> expected = keyProperties();
    expected.push_back(wanted);
    EXPECT_THAT(onlyInstance().properties, ElementsAreArray(expected));
}

INSTANTIATE_TEST_SUITE_P(Of, EachProperty, testing::Range<std::size_t>(0, 24),
                         [](const auto& test) { return furtherProperties()[test.param].name; });

// ---- lists of accounts ----

TEST_F(AccountInstance, Every_account_is_returned_in_name_order) {
    serve({accountNode("zoe"), accountNode("Bob"), accountNode("alice")});
    expectSuccess(enumInstances());
    EXPECT_THAT(returnedNames(), ElementsAre("Bob", "alice", "zoe"));
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
}

TEST_F(AccountInstance, Of_two_records_with_one_name_the_later_is_served) {
    StoreNode later = accountNode("alice");
    later.properties[UserID] = "2002";
    serve({fullAccountNode("alice"), accountNode("bob"), later});
    enumInstances();
    EXPECT_THAT(returnedNames(), ElementsAre("alice", "bob"));
    EXPECT_EQ(broker_.returnedInstances()[0].propertyText("UserID"), "2002");
}

TEST_F(AccountInstance, No_accounts_succeed_with_CMReturnDone_and_no_trace_to_the_broker) {
    serve({});
    expectSuccess(enumInstances());
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    EXPECT_TRUE(exitMarked());
}

TEST_F(AccountInstance, A_store_without_administration_node_succeeds_with_nothing) {
    platform_.addNode(accountNode("alice"));
    expectSuccess(enumInstances());
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(AccountInstance, A_refused_AccountState_serves_nothing_of_the_whole_list) {
    StoreNode strange = accountNode("bob");
    strange.properties[AccountState] = 0U;
    serve({accountNode("alice"), strange});
    expectSuccess(enumInstances());
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(failureTexts(), ElementsAre("Failed while setting Requested State"));
}

} // namespace
} // namespace qelo::test
