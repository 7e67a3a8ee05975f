// Enumerating the instance of the identity.
#include "IdentityFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

class IdentityInstances : public IdentityFixture {
protected:
    std::vector<std::string> setFor(const PropertyNames& properties) {
        broker_.ignorePropertyFilter(true);
        expectOk(enumInstances(properties));
        return onlyInstance().propertyNames();
    }
};

TEST_F(IdentityInstances, The_instance_has_the_same_text_as_key_and_as_element_name) {
    expectOk(enumInstances());
    EXPECT_THAT(onlyInstance().properties,
                ElementsAre(NamedValue{"InstanceID", Value::chars(identifier)},
                            NamedValue{"ElementName", Value::chars(identifier)}));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(IdentityInstances, The_instances_path_has_class_namespace_and_host_and_no_keys_of_its_own) {
    enumInstances();
    EXPECT_EQ(onlyInstance().path.toString(), "//host.example/root/cimv2:ZANTH_SimIdentity");
    EXPECT_EQ(broker_.callCount("addKey"), 0U);
}

TEST_F(IdentityInstances, A_list_naming_only_InstanceID_yields_no_ElementName) {
    EXPECT_THAT(setFor({{"InstanceID"}}), ElementsAre("InstanceID"));
}

TEST_F(IdentityInstances, ElementName_is_set_where_the_list_names_it_exactly) {
    EXPECT_THAT(setFor({{"ElementName"}}), ElementsAre("InstanceID", "ElementName"));
    EXPECT_THAT(setFor({{"elementname"}}), ElementsAre("InstanceID"));
    EXPECT_THAT(setFor(std::vector<const char*>{}), ElementsAre("InstanceID"));
}

TEST_F(IdentityInstances, The_brokers_own_filter_gets_the_list_and_the_key) {
    enumInstances({{"ElementName"}});
    EXPECT_THAT(broker_.calls(), Contains("setPropertyFilter({ElementName},{InstanceID})"));
    enumInstances();
    EXPECT_THAT(broker_.calls(), Contains("setPropertyFilter(null,{InstanceID})"));
}

TEST_F(IdentityInstances, An_instance_that_cannot_be_made_is_passed_over) {
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        for (const char* slot : {"newObjectPath", "newInstance"}) {
            broker_.clearFaults();
            broker_.failSlot(slot, 1, fault);
            expectOk(enumInstances());
            expectNothingReturned();
            EXPECT_EQ(broker_.doneCount(), 1);
        }
    }
}

TEST_F(IdentityInstances, No_caption_is_looked_up) {
    enumInstances();
    EXPECT_THAT(platform_.libraryRequests(), IsEmpty());
}

} // namespace
} // namespace qelo::test
