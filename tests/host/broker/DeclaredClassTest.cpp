// Instances of classes that the schema knows: what may be set, and what becomes a key.
#include "BrokerFixture.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cctype>
#include <set>

namespace qelo::broker::testing {
namespace {

cim::PropertyDeclaration declared(const char* name, cim::Type type, bool array = false,
                                  const char* qualifier = nullptr) {
    cim::PropertyDeclaration property;
    property.name = name;
    property.type = type;
    property.array = array;
    if (qualifier) {
        cim::Qualifier flag;
        flag.name = qualifier;
        flag.value = cim::Value::boolean(true);
        property.qualifiers.push_back(flag);
    }
    return property;
}

class DeclaredClassTest : public BrokerTest {
protected:
    DeclaredClassTest() {
        thing_.name = "TEST_Thing";
        thing_.properties = {declared("Name", cim::Type::String, false, "Key"),
                             declared("Size", cim::Type::UInt16),
                             declared("Sizes", cim::Type::UInt16, true),
                             declared("Since", cim::Type::DateTime),
                             declared("Part", cim::Type::String, false, "EmbeddedObject"),
                             declared("Link", cim::Type::Reference)};
        hooks.schema.findClass = [this](const std::string& nameSpace,
                                        const std::string& className) -> const cim::Class* {
            ++lookups_;
            return nameSpace == "root/test" && className == "TEST_Thing" ? &thing_ : nullptr;
        };
    }

    CMPIInstance* instance(const char* className = "TEST_Thing") {
        return mb()->eft->newInstance(mb(), path(className), nullptr);
    }
    static CMPIrc set(CMPIInstance* inst, const char* name, const void* value, CMPIType type) {
        return inst->ft->setProperty(inst, name, static_cast<const CMPIValue*>(value), type).rc;
    }
    static bool has(CMPIInstance* inst, const char* name) {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        inst->ft->getProperty(inst, name, &status);
        return status.rc == CMPI_RC_OK;
    }

    cim::Class thing_;
    int lookups_ = 0;
};

TEST_F(DeclaredClassTest, A_property_that_is_not_declared_is_refused_and_not_kept) {
    CMPIInstance* inst = instance();
    EXPECT_EQ(set(inst, "Color", "red", CMPI_chars), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_FALSE(has(inst, "Color"));
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 0U);
}

TEST_F(DeclaredClassTest, A_value_of_another_type_is_refused_and_not_kept) {
    CMPIInstance* inst = instance();
    CMPIValue value = {};
    for (const int type : {CMPI_uint32, CMPI_sint16, CMPI_uint8, CMPI_boolean}) {
        EXPECT_EQ(set(inst, "Size", &value, static_cast<CMPIType>(type)), CMPI_RC_ERR_TYPE_MISMATCH)
            << type;
    }
    EXPECT_EQ(set(inst, "Sizes", &value, CMPI_uint16), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(inst, "Size", "5", CMPI_chars), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(inst, "Size", nullptr, CMPI_uint32), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(inst, "Name", &value, CMPI_uint16), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 0U);
}

TEST_F(DeclaredClassTest, A_refused_value_leaves_the_one_before) {
    CMPIInstance* inst = instance();
    CMPIValue value = {};
    value.uint16 = 7;
    EXPECT_EQ(set(inst, "SIZE", &value, CMPI_uint16), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Size", &value, CMPI_uint64), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(inst->ft->getProperty(inst, "Size", nullptr).value.uint16, 7);
}

TEST_F(DeclaredClassTest, Values_of_the_declared_type_are_kept) {
    CMPIInstance* inst = instance();
    CMPIValue value = {};
    EXPECT_EQ(set(inst, "Name", "one", CMPI_chars), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Size", nullptr, CMPI_uint16), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Since", nullptr, CMPI_null), CMPI_RC_OK);
    EXPECT_EQ(inst->ft->getProperty(inst, "Since", nullptr).type, CMPI_dateTime);
    value.array = mb()->eft->newArray(mb(), 1, CMPI_uint16, nullptr);
    EXPECT_EQ(set(inst, "Sizes", &value, static_cast<CMPIType>(CMPI_uint16 | CMPI_ARRAY)),
              CMPI_RC_OK);
    value.inst = instance("TEST_Other");
    EXPECT_EQ(set(inst, "Part", &value, CMPI_instance), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Part", "as text", CMPI_chars), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Name", &value, CMPI_instance), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 5U);
}

TEST_F(DeclaredClassTest, Only_declared_keys_become_keys_of_the_path) {
    CMPIInstance* inst = instance();
    const char* keys[] = {"Size", nullptr};
    inst->ft->setPropertyFilter(inst, nullptr, keys);
    CMPIValue value = {};
    EXPECT_EQ(set(inst, "Size", &value, CMPI_uint16), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "name", "one", CMPI_chars), CMPI_RC_OK);
    value.ref = path("TEST_Target");
    EXPECT_EQ(set(inst, "Link", &value, CMPI_ref), CMPI_RC_OK);
    const CMPIObjectPath* op = inst->ft->getObjectPath(inst, nullptr);
    EXPECT_EQ(op->ft->getKeyCount(op, nullptr), 1U);
    EXPECT_STREQ(text(op->ft->getKey(op, "Name", nullptr).value.string).c_str(), "one");
}

TEST_F(DeclaredClassTest, An_unknown_class_takes_everything) {
    CMPIInstance* inst = instance("TEST_Other");
    CMPIValue value = {};
    EXPECT_EQ(set(inst, "Color", "red", CMPI_chars), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Size", &value, CMPI_uint64), CMPI_RC_OK);
}

// The broker expects each instance to be filled like those before.
TEST_F(DeclaredClassTest, Properties_may_come_in_another_order_each_time) {
    const std::vector<std::vector<const char*>> orders = {
        {"Name", "Part", "Name"}, {"Name", "Part"}, {"Part", "Name"}, {"NAME", "part", "Name"},
        {"Part", "Part", "Part"}, {"Name", "Name"}, {"Name", "Part"}};
    for (const auto& names : orders) {
        CMPIInstance* inst = instance();
        for (const char* name : names) {
            EXPECT_EQ(set(inst, name, "early", CMPI_chars), CMPI_RC_OK);
            EXPECT_EQ(set(inst, "Color", "red", CMPI_chars), CMPI_RC_ERR_NO_SUCH_PROPERTY);
            EXPECT_EQ(set(inst, name, name, CMPI_chars), CMPI_RC_OK);
        }
        std::set<std::string> lower;
        for (const char* name : names) {
            EXPECT_TRUE(has(inst, name)) << name;
            std::string folded = name;
            std::transform(folded.begin(), folded.end(), folded.begin(), ::tolower);
            lower.insert(folded);
        }
        EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), lower.size());
        EXPECT_EQ(has(inst, "Name"), lower.count("name") == 1);
        CMPIString* first = nullptr;
        inst->ft->getPropertyAt(inst, 0, &first, nullptr);
        EXPECT_EQ(text(first), names.front()) << "in the spelling that came first";
    }
}

TEST_F(DeclaredClassTest, An_instance_that_moves_to_another_class_keeps_to_that_one) {
    CMPIInstance* inst = instance("TEST_Other");
    EXPECT_EQ(set(inst, "Color", "red", CMPI_chars), CMPI_RC_OK);
    inst->ft->setObjectPath(inst, path("TEST_Thing"));
    EXPECT_EQ(set(inst, "Name", "one", CMPI_chars), CMPI_RC_OK);
    inst->ft->setObjectPath(inst, path("TEST_Thing"));
    EXPECT_EQ(set(inst, "Name", "two", CMPI_chars), CMPI_RC_OK);
    EXPECT_EQ(set(inst, "Size", nullptr, CMPI_uint16), CMPI_RC_OK);
    EXPECT_EQ(inst->ft->getPropertyCount(inst, nullptr), 3U);
}

TEST_F(DeclaredClassTest, A_clone_keeps_to_the_class_too) {
    CMPIInstance* inst = instance();
    CMPIInstance* copy = inst->ft->clone(inst, nullptr);
    EXPECT_EQ(set(copy, "Color", "red", CMPI_chars), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    copy->ft->release(copy);
}

TEST_F(DeclaredClassTest, The_class_is_looked_up_once_for_an_instance) {
    CMPIInstance* inst = instance();
    lookups_ = 0;
    set(inst, "Name", "one", CMPI_chars);
    set(inst, "Size", nullptr, CMPI_uint16);
    EXPECT_EQ(lookups_, 0);
    inst->ft->setObjectPath(inst, path("TEST_Other"));
    EXPECT_EQ(lookups_, 1);
    EXPECT_EQ(set(inst, "Color", "red", CMPI_chars), CMPI_RC_OK);
}

} // namespace
} // namespace qelo::broker::testing
