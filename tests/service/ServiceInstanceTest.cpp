// Enumerating the instances of services.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* function = "SimAccountManagementService_EnumInstances";

class ServiceInstances : public ServiceFixture {
protected:
    std::vector<std::string> optionalFor(const PropertyNames& properties) {
        broker_.ignorePropertyFilter(true);
        expectOk(enumInstances(properties));
        std::vector<std::string> names = onlyInstance().propertyNames();
        EXPECT_GE(names.size(), 4U);
        names.erase(names.begin(), names.begin() + 4);
        return names;
    }
};

TEST_F(ServiceInstances, An_instance_has_these_nine_properties_in_this_order) {
    platform_.setResourceText(2, "en", L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION", L"Identities");
    serve({"/a"});
    expectOk(enumInstances());
    const std::string name = serviceName("/a");
    EXPECT_THAT(
        onlyInstance().properties,
        ElementsAre(NamedValue{"SystemCreationClassName", Value::chars("ZANTH_ComputerSystem")},
                    NamedValue{"SystemName", Value::chars("host.example")},
                    NamedValue{"CreationClassName", Value::chars(serviceClass)},
                    NamedValue{"Name", Value::chars(name)},
                    NamedValue{"Caption", Value::chars("Identities")},
                    NamedValue{"Description", Value::chars(name)},
                    NamedValue{"ElementName", Value::chars(name)},
                    NamedValue{"RequestedState", Value::uint16(12)},
                    NamedValue{"EnabledState", Value::uint16(2)}));
    EXPECT_EQ(onlyInstance().path.toString(),
              "//host.example/root/cimv2:" + std::string(serviceClass));
    EXPECT_EQ(broker_.doneCount(), 1);
    expectSamePoints(pointsOf(source::serviceProvider),
                     markers(source::serviceProvider, function, true));
}

TEST_F(ServiceInstances, The_caption_is_looked_up_in_library_2_of_the_current_language) {
    platform_.setLanguage("ja");
    platform_.setResourceText(2, "ja", L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION", L"\u7ba1\u7406");
    serve({"/a"});
    enumInstances();
    EXPECT_EQ(onlyInstance().propertyText("Caption"), "\xE7\xAE\xA1\xE7\x90\x86");
    ASSERT_EQ(platform_.libraryRequests().size(), 1U);
    EXPECT_EQ(platform_.libraryRequests()[0].number, 2U);
    EXPECT_EQ(platform_.libraryRequests()[0].language, "ja");
}

TEST_F(ServiceInstances, A_list_naming_only_Caption_yields_the_four_keys_and_Caption) {
    serve({"/a"});
    EXPECT_THAT(optionalFor({{"Caption"}}), ElementsAre("Caption"));
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "Name",
                            "Caption"));
}

TEST_F(ServiceInstances, Each_property_can_be_asked_for_alone) {
    serve({"/a"});
    for (const char* name :
         {"Caption", "Description", "ElementName", "RequestedState", "EnabledState"}) {
        EXPECT_THAT(optionalFor({{name}}), ElementsAre(name));
    }
}

TEST_F(ServiceInstances, An_empty_or_foreign_list_yields_the_keys_alone) {
    serve({"/a"});
    EXPECT_THAT(optionalFor(std::vector<const char*>{}), IsEmpty());
    EXPECT_THAT(optionalFor({{"Other", "Status"}}), IsEmpty());
}

TEST_F(ServiceInstances, The_brokers_own_filter_gets_the_list_and_the_four_keys) {
    serve({"/a"});
    enumInstances({{"Caption"}});
    EXPECT_THAT(broker_.calls(),
                Contains("setPropertyFilter({Caption},{SystemCreationClassName,SystemName,"
                         "CreationClassName,Name})"));
    enumInstances();
    EXPECT_THAT(broker_.calls(), Contains("setPropertyFilter(null,{SystemCreationClassName,"
                                          "SystemName,CreationClassName,Name})"));
}

TEST_F(ServiceInstances, Without_a_node_success_no_instances_and_CMReturnDone) {
    expectOk(enumInstances());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    expectSamePoints(pointsOf(source::serviceProvider),
                     markers(source::serviceProvider, function, true));
}

TEST_F(ServiceInstances, A_null_instance_is_passed_over) {
    serve({"/a", "/b", "/c"});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        for (const char* slot : {"newInstance", "newObjectPath"}) {
            broker_.clearFaults();
            broker_.failSlot(slot, 2, fault);
            expectOk(enumInstances());
            EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/a"), serviceName("/c")));
            EXPECT_EQ(broker_.doneCount(), 1);
        }
    }
}

TEST_F(ServiceInstances, The_later_of_two_nodes_with_the_same_path_text_gives_the_one_service) {
    serve({"/a", "/a"});
    expectOk(enumInstances());
    EXPECT_EQ(onlyInstance().propertyText("Name"), serviceName("/a"));
}

} // namespace
} // namespace qelo::test
