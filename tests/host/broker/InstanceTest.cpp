// Instances, slot by slot: properties, keys, filters.
#include "BrokerFixture.h"

namespace qelo::broker::testing {
namespace {

class InstanceTest : public BrokerTest {
protected:
    static std::string keyOf(const CMPIInstance* inst, const char* name) {
        const CMPIObjectPath* op = inst->ft->getObjectPath(inst, nullptr);
        CMPIStatus status = {};
        const CMPIData data = op->ft->getKey(op, name, &status);
        return status.rc == CMPI_RC_OK ? text(data.value.string) : "(none)";
    }
    static bool has(const CMPIInstance* inst, const char* name) {
        CMPIStatus status = {};
        inst->ft->getProperty(inst, name, &status);
        return status.rc == CMPI_RC_OK;
    }
    static void set(const CMPIInstance* inst, const char* name, const char* value) {
        EXPECT_EQ(inst->ft->setProperty(inst, name, chars(value), CMPI_chars).rc, CMPI_RC_OK);
    }
};

TEST_F(InstanceTest, Properties_are_found_by_name_in_any_case_and_by_position) {
    CMPIInstance* inst = instance();
    const CMPIValue number = uint32Value(5);
    EXPECT_EQ(inst->ft->setProperty(inst, "Number", &number, CMPI_uint32).rc, CMPI_RC_OK);
    set(inst, "Color", "red");
    set(inst, "COLOR", "blue");
    EXPECT_EQ(inst->ft->getPropertyCount(inst, &st), 2U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(inst->ft->getProperty(inst, "color", &st).value.string), "blue");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    CMPIString* name = nullptr;
    EXPECT_EQ(inst->ft->getPropertyAt(inst, 0, &name, &st).value.uint32, 5U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(name), "Number");
    inst->ft->getPropertyAt(inst, 2, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(name, nullptr);
    inst->ft->getProperty(inst, "None", &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(InstanceTest, A_property_needs_a_name) {
    CMPIInstance* inst = instance();
    EXPECT_EQ(inst->ft->setProperty(inst, nullptr, nullptr, CMPI_uint8).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(inst->ft->setProperty(inst, "", nullptr, CMPI_uint8).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(InstanceTest, A_dead_instance_refuses_everything) {
    CMPIInstance* inst = instance();
    const CMPIInstanceFT* ft = inst->ft;
    ft->release(inst);
    EXPECT_TRUE(isNull(ft->getProperty(inst, "P", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    CMPIString* name = string("stale");
    ft->getPropertyAt(inst, 0, &name, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(name, nullptr);
    EXPECT_EQ(ft->getPropertyCount(inst, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setProperty(inst, "P", nullptr, CMPI_uint8).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->getObjectPath(inst, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setPropertyFilter(inst, nullptr, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setObjectPath(inst, path()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->setPropertyWithOrigin(inst, "P", nullptr, CMPI_uint8, nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(InstanceTest, Key_properties_named_with_the_filter_become_keys_of_the_path) {
    CMPIInstance* inst = instance();
    const char* wanted[] = {"Color", nullptr};
    const char* keys[] = {"Name", "SystemName", nullptr};
    EXPECT_EQ(inst->ft->setPropertyFilter(inst, wanted, keys).rc, CMPI_RC_OK);
    set(inst, "NAME", "one");
    set(inst, "SystemName", "sys");
    set(inst, "Color", "red");
    set(inst, "Size", "big");
    EXPECT_EQ(keyOf(inst, "Name"), "one");
    EXPECT_EQ(keyOf(inst, "SystemName"), "sys");
    EXPECT_EQ(keyOf(inst, "Color"), "(none)");
    EXPECT_TRUE(has(inst, "Color"));
    EXPECT_FALSE(has(inst, "Name")); // a key of the path, but not asked for
    EXPECT_FALSE(has(inst, "Size"));
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 1U);
}

TEST_F(InstanceTest, Keys_of_the_class_come_from_the_schema) {
    hooks.schema.keyNames =
        [](const std::string& nameSpace,
           const std::string& className) -> std::optional<std::vector<std::string>> {
        if (nameSpace == "root/test" && className == "TEST_Thing") {
            return std::vector<std::string>{"Name"};
        }
        return std::nullopt;
    };
    CMPIInstance* inst = instance();
    set(inst, "name", "one");
    set(inst, "Color", "red");
    EXPECT_EQ(keyOf(inst, "Name"), "one");
    EXPECT_EQ(keyOf(inst, "Color"), "(none)");
    EXPECT_TRUE(has(inst, "Name"));
}

TEST_F(InstanceTest, A_null_key_property_leaves_the_path_alone) {
    CMPIInstance* inst = instance();
    const char* keys[] = {"Name", nullptr};
    inst->ft->setPropertyFilter(inst, nullptr, keys);
    inst->ft->setProperty(inst, "Name", nullptr, CMPI_string);
    EXPECT_EQ(keyOf(inst, "Name"), "(none)");
    set(inst, "Name", "one");
    inst->ft->setProperty(inst, "Name", nullptr, CMPI_string);
    EXPECT_EQ(keyOf(inst, "Name"), "one");
}

TEST_F(InstanceTest, A_key_that_the_path_has_follows_its_property) {
    CMPIObjectPath* op = path();
    op->ft->addKey(op, "Name", chars("one"), CMPI_chars);
    CMPIInstance* inst = mb()->eft->newInstance(mb(), op, nullptr);
    set(inst, "Name", "two");
    EXPECT_EQ(keyOf(inst, "Name"), "two");
    EXPECT_EQ(text(op->ft->getKey(op, "Name", nullptr).value.string), "one");
}

TEST_F(InstanceTest, References_are_keys_where_nobody_knows_better) {
    CMPIInstance* inst = instance();
    CMPIValue value = {};
    value.ref = path("TEST_Target");
    inst->ft->setProperty(inst, "Antecedent", &value, CMPI_ref);
    const CMPIObjectPath* op = inst->ft->getObjectPath(inst, nullptr);
    EXPECT_EQ(op->ft->getKey(op, "Antecedent", &st).type, CMPI_ref);
    EXPECT_EQ(rc(), CMPI_RC_OK);
}

TEST_F(InstanceTest, References_are_no_keys_where_the_schema_says_so) {
    hooks.schema.keyNames = [](const std::string&, const std::string&) {
        return std::vector<std::string>{"InstanceID"};
    };
    CMPIInstance* inst = instance();
    CMPIValue value = {};
    value.ref = path("TEST_Target");
    inst->ft->setProperty(inst, "Antecedent", &value, CMPI_ref);
    const CMPIObjectPath* op = inst->ft->getObjectPath(inst, nullptr);
    EXPECT_EQ(op->ft->getKeyCount(op, nullptr), 0U);
}

TEST_F(InstanceTest, A_filter_hides_what_was_set_before_and_a_later_one_shows_it_again) {
    CMPIInstance* inst = instance();
    set(inst, "Color", "red");
    set(inst, "Size", "big");
    const char* onlySize[] = {"size", nullptr};
    const char* nothing[] = {nullptr};
    inst->ft->setPropertyFilter(inst, onlySize, nullptr);
    EXPECT_FALSE(has(inst, "Color"));
    EXPECT_TRUE(has(inst, "Size"));
    inst->ft->setPropertyFilter(inst, nothing, nullptr);
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 0U);
    inst->ft->setPropertyFilter(inst, nullptr, nullptr);
    EXPECT_TRUE(has(inst, "Color"));
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 2U);
}

TEST_F(InstanceTest, Keys_named_after_their_properties_were_set_still_reach_the_path) {
    CMPIInstance* inst = instance();
    set(inst, "Name", "one");
    const char* keys[] = {"Name", nullptr};
    const char* nothing[] = {nullptr};
    inst->ft->setPropertyFilter(inst, nothing, keys);
    EXPECT_EQ(keyOf(inst, "Name"), "one");
}

TEST_F(InstanceTest, Its_path_can_be_replaced) {
    CMPIInstance* inst = instance();
    CMPIObjectPath* op = mb()->eft->newObjectPath(mb(), "root/new", "TEST_New", nullptr);
    op->ft->addKey(op, "Name", chars("one"), CMPI_chars);
    EXPECT_EQ(inst->ft->setObjectPath(inst, op).rc, CMPI_RC_OK);
    op->ft->setClassName(op, "TEST_Changed");
    const CMPIObjectPath* now = inst->ft->getObjectPath(inst, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(now->ft->toString(now, nullptr)), "root/new:TEST_New.Name=\"one\"");
    EXPECT_EQ(inst->ft->setObjectPath(inst, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(InstanceTest, The_class_of_origin_reaches_the_host) {
    CMPIInstance* inst = instance();
    EXPECT_EQ(inst->ft->setPropertyWithOrigin(inst, "P", chars("x"), CMPI_chars, "CIM_Base").rc,
              CMPI_RC_OK);
    EXPECT_EQ(inst->ft->setPropertyWithOrigin(inst, "Q", chars("y"), CMPI_chars, nullptr).rc,
              CMPI_RC_OK);
    const cim::Instance host = toCim(*liveObject<InstanceObject>(inst));
    EXPECT_EQ(host.properties().at(0).origin, "CIM_Base");
    EXPECT_EQ(host.properties().at(1).origin, "");
}

} // namespace
} // namespace qelo::broker::testing
