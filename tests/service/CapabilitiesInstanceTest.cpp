// Enumerating the instances of capabilities.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

const Unit& provider = source::capabilitiesProvider;
constexpr const char* function = "SimAccountManagementCapabilities_EnumInstances";

Value numbers(const std::vector<CMPIUint16>& values) {
    std::vector<Value> elements;
    for (const CMPIUint16 value : values) {
        elements.push_back(Value::uint16(value));
    }
    return Value::array(CMPI_uint16, elements);
}

class CapabilitiesInstances : public CapabilitiesFixture {
protected:
    std::vector<std::string> setFor(const PropertyNames& properties) {
        broker_.ignorePropertyFilter(true);
        expectOk(enumInstances(properties));
        return onlyInstance().propertyNames();
    }
};

TEST_F(CapabilitiesInstances, An_instance_has_these_five_properties_in_this_order) {
    serve({"/a"});
    expectOk(enumInstances());
    const std::string id = capabilitiesId("/a");
    EXPECT_THAT(onlyInstance().properties,
                ElementsAre(NamedValue{"InstanceID", Value::chars(id)},
                            NamedValue{"RequestedStatesSupported", numbers({2, 3, 6})},
                            NamedValue{"ElementNameEditSupported", Value::boolean(false)},
                            NamedValue{"ElementName", Value::chars(id)},
                            NamedValue{"OperationsSupported", numbers({2, 3, 4})}));
    EXPECT_EQ(onlyInstance().path.toString(),
              "//host.example/root/cimv2:" + std::string(capabilitiesClass));
    EXPECT_EQ(broker_.doneCount(), 1);
    expectSamePoints(pointsOf(provider), markers(provider, function, true));
}

TEST_F(CapabilitiesInstances, Every_instance_has_exactly_three_values_in_each_list) {
    serve({"/a", "/b", "/c", "/d"});
    for (int request = 0; request < 2; ++request) {
        enumInstances();
        ASSERT_EQ(broker_.returnedInstances().size(), 4U);
        for (const Instance& instance : broker_.returnedInstances()) {
            EXPECT_EQ(*instance.property("OperationsSupported"), numbers({2, 3, 4}));
            EXPECT_EQ(*instance.property("RequestedStatesSupported"), numbers({2, 3, 6}));
        }
    }
}

TEST_F(CapabilitiesInstances, A_list_naming_only_ElementName_yields_InstanceID_and_ElementName) {
    serve({"/a"});
    EXPECT_THAT(setFor({{"ElementName"}}), ElementsAre("InstanceID", "ElementName"));
}

TEST_F(CapabilitiesInstances, Each_property_can_be_asked_for_alone) {
    serve({"/a"});
    for (const char* name :
         {"RequestedStatesSupported", "ElementNameEditSupported", "OperationsSupported"}) {
        EXPECT_THAT(setFor({{name}}), ElementsAre("InstanceID", name));
    }
    EXPECT_THAT(setFor(std::vector<const char*>{}), ElementsAre("InstanceID"));
}

TEST_F(CapabilitiesInstances, There_is_neither_a_caption_nor_a_description) {
    serve({"/a"});
    EXPECT_THAT(setFor({{"Caption", "Description"}}), ElementsAre("InstanceID"));
    enumInstances();
    EXPECT_THAT(platform_.libraryRequests(), IsEmpty());
}

TEST_F(CapabilitiesInstances, The_brokers_own_filter_gets_the_list_and_the_key) {
    serve({"/a"});
    enumInstances({{"ElementName"}});
    EXPECT_THAT(broker_.calls(), Contains("setPropertyFilter({ElementName},{InstanceID})"));
    enumInstances();
    EXPECT_THAT(broker_.calls(), Contains("setPropertyFilter(null,{InstanceID})"));
}

TEST_F(CapabilitiesInstances, Without_a_node_success_no_instances_and_CMReturnDone) {
    expectOk(enumInstances());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    expectSamePoints(pointsOf(provider), markers(provider, function, true));
}

TEST_F(CapabilitiesInstances, A_null_instance_is_passed_over) {
    serve({"/a", "/b", "/c"});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        for (const char* slot : {"newInstance", "newObjectPath"}) {
            broker_.clearFaults();
            broker_.failSlot(slot, 2, fault);
            expectOk(enumInstances());
            EXPECT_THAT(returned("InstanceID"),
                        ElementsAre(capabilitiesId("/a"), capabilitiesId("/c")));
        }
    }
}

} // namespace
} // namespace qelo::test
