// Values of every type through containers, arrays, and the conversion to and from the host's
// own values.
#include "BrokerFixture.h"

#include <broker/Data.h>
#include <broker/Slot.h>

#include <array>
#include <limits>

namespace qelo::broker::testing {
namespace {

class ValuesTest : public BrokerTest {
protected:
    // Through an argument list and back.
    CMPIData stored(const CMPIValue* value, CMPIType type) {
        CMPIArgs* list = args();
        EXPECT_EQ(list->ft->addArg(list, "V", value, type).rc, CMPI_RC_OK);
        return list->ft->getArg(list, "V", nullptr);
    }
    CMPIrc refusal(const CMPIValue* value, CMPIType type) {
        CMPIArgs* list = args();
        const CMPIrc code = list->ft->addArg(list, "V", value, type).rc;
        EXPECT_EQ(list->ft->getArgCount(list, nullptr), 0U);
        return code;
    }
};

template <class T> CMPIValue valueWith(T CMPIValue::*member, T number) {
    CMPIValue value = {};
    value.*member = number;
    return value;
}

template <class T>
void expectKept(ValuesTest&, const CMPIData& data, T CMPIValue::*member, CMPIType type, T number) {
    EXPECT_EQ(data.type, type);
    EXPECT_EQ(data.state, CMPI_goodValue);
    EXPECT_EQ(data.value.*member, number);
}

TEST_F(ValuesTest, Every_simple_type_keeps_its_value) {
    const auto check = [&](auto member, CMPIType type, auto number) {
        const CMPIValue value = valueWith(member, number);
        expectKept(*this, stored(&value, type), member, type, number);
        // And through the host's values.
        CMPIData data = {type, CMPI_goodValue, value};
        expectKept(*this, fromCim(currentArena(), toCim(data)), member, type, number);
    };
    check(&CMPIValue::boolean, CMPI_boolean, CMPIBoolean{1});
    check(&CMPIValue::char16, CMPI_char16, CMPIChar16{0x20AC});
    check(&CMPIValue::uint8, CMPI_uint8, CMPIUint8{255});
    check(&CMPIValue::uint16, CMPI_uint16, CMPIUint16{65535});
    check(&CMPIValue::uint32, CMPI_uint32, CMPIUint32{4294967295U});
    check(&CMPIValue::uint64, CMPI_uint64, std::numeric_limits<CMPIUint64>::max());
    check(&CMPIValue::sint8, CMPI_sint8, CMPISint8{-128});
    check(&CMPIValue::sint16, CMPI_sint16, CMPISint16{-32768});
    check(&CMPIValue::sint32, CMPI_sint32, std::numeric_limits<CMPISint32>::min());
    check(&CMPIValue::sint64, CMPI_sint64, std::numeric_limits<CMPISint64>::min());
    check(&CMPIValue::real32, CMPI_real32, CMPIReal32{1.5F});
    check(&CMPIValue::real64, CMPI_real64, CMPIReal64{-2.25});
}

TEST_F(ValuesTest, No_more_is_read_than_a_variable_of_the_type_has) {
    // Bare variables in memory of their own: the address sanitizer sees a byte too many.
    const auto checked = [&](auto number, CMPIType type) {
        const auto own = std::make_unique<decltype(number)>(number);
        const CMPIData data = stored(reinterpret_cast<const CMPIValue*>(own.get()), type);
        EXPECT_EQ(data.state, CMPI_goodValue);
        return data;
    };
    EXPECT_EQ(checked(CMPIBoolean{1}, CMPI_boolean).value.boolean, 1);
    EXPECT_EQ(checked(CMPISint8{-3}, CMPI_sint8).value.sint8, -3);
    EXPECT_EQ(checked(CMPIUint16{3}, CMPI_uint16).value.uint16, 3);
    EXPECT_EQ(checked(CMPIReal32{1.5F}, CMPI_real32).value.real32, 1.5F);
    EXPECT_EQ(checked(CMPIUint64{3}, CMPI_uint64).value.uint64, 3U);
    EXPECT_EQ(text(checked(string("text"), CMPI_string).value.string), "text");
    EXPECT_NE(checked(path(), CMPI_ref).value.ref, nullptr);
    EXPECT_NE(checked(array(1, CMPI_uint8), CMPI_uint8A).value.array, nullptr);
    EXPECT_EQ(text(checked(static_cast<const char*>("text"), CMPI_charsptr).value.string), "text");

    const std::array<CMPIUint8, 9> bytes = {0, 1, 0, 0, 0, 0, 0, 0, 0};
    EXPECT_EQ(stored(reinterpret_cast<const CMPIValue*>(&bytes[1]), CMPI_uint64).value.uint64, 1U);
}

TEST_F(ValuesTest, Any_nonzero_boolean_is_one) {
    const CMPIValue value = valueWith(&CMPIValue::boolean, CMPIBoolean{200});
    EXPECT_EQ(stored(&value, CMPI_boolean).value.boolean, 1);
}

TEST_F(ValuesTest, Text_passed_as_chars_becomes_a_string) {
    char source[] = "text";
    const CMPIData data = stored(chars(source), CMPI_chars);
    source[0] = 'X';
    EXPECT_EQ(data.type, CMPI_string);
    EXPECT_EQ(text(data.value.string), "text");
    char* pointer = source;
    const CMPIValue value = valueWith(&CMPIValue::chars, pointer);
    EXPECT_EQ(text(stored(&value, CMPI_charsptr).value.string), "Xext");
    const CMPIValue none = valueWith(&CMPIValue::chars, static_cast<char*>(nullptr));
    EXPECT_TRUE(isNull(stored(&none, CMPI_charsptr)));
}

TEST_F(ValuesTest, A_null_value_is_null_of_its_type) {
    const CMPIData data = stored(nullptr, CMPI_uint16);
    EXPECT_EQ(data.type, CMPI_uint16);
    EXPECT_EQ(data.state, CMPI_nullValue);
    EXPECT_EQ(stored(nullptr, CMPI_chars).type, CMPI_string);
    EXPECT_EQ(stored(nullptr, CMPI_uint16A).type, CMPI_uint16A);
    EXPECT_EQ(stored(nullptr, CMPI_charsA).type, CMPI_stringA);
    EXPECT_TRUE(isNull(stored(nullptr, CMPI_null)));
    EXPECT_TRUE(isNull(stored(nullptr, CMPI_dateTime)));
}

TEST_F(ValuesTest, A_null_object_is_a_null_value) {
    const CMPIValue none = {};
    for (const int given : {CMPI_string, CMPI_dateTime, CMPI_ref, CMPI_instance, CMPI_stringA}) {
        const auto type = static_cast<CMPIType>(given);
        const CMPIData data = stored(&none, type);
        EXPECT_TRUE(isNull(data));
        EXPECT_EQ(data.type, type);
    }
}

TEST_F(ValuesTest, Objects_are_copied_deeply) {
    CMPIObjectPath* ref = path();
    ref->ft->addKey(ref, "Name", chars("one"), CMPI_chars);
    const CMPIValue value = valueWith(&CMPIValue::ref, ref);
    const CMPIData data = stored(&value, CMPI_ref);
    EXPECT_NE(data.value.ref, ref);
    ref->ft->addKey(ref, "Name", chars("two"), CMPI_chars);
    ref->ft->release(ref);
    EXPECT_EQ(text(data.value.ref->ft->getKey(data.value.ref, "name", nullptr).value.string),
              "one");
}

TEST_F(ValuesTest, Dead_objects_are_refused) {
    CMPIString* dead = string("x");
    dead->ft->release(dead);
    const CMPIValue value = valueWith(&CMPIValue::string, dead);
    EXPECT_EQ(refusal(&value, CMPI_string), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ValuesTest, An_object_of_another_kind_than_its_type_is_refused) {
    CMPIValue value = {};
    value.inst = instance();
    EXPECT_EQ(refusal(&value, CMPI_string), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(refusal(&value, CMPI_stringA), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ValuesTest, Types_that_are_none_and_types_for_elsewhere_are_refused) {
    const CMPIValue value = {};
    for (const int type : {1, 0x00AA, CMPI_args, CMPI_class, CMPI_filter, CMPI_enumeration,
                           CMPI_ptr, CMPI_ARRAY, 0x3900, 0xFFFF}) {
        EXPECT_EQ(refusal(&value, static_cast<CMPIType>(type)), CMPI_RC_ERR_INVALID_DATA_TYPE)
            << type;
    }
    EXPECT_EQ(refusal(nullptr, CMPI_args), CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_F(ValuesTest, An_array_must_have_elements_of_the_given_type) {
    CMPIValue value = {};
    value.array = array(1, CMPI_uint16);
    EXPECT_EQ(refusal(&value, CMPI_uint32A), CMPI_RC_ERR_TYPE_MISMATCH);
    const CMPIData data = stored(&value, CMPI_uint16A);
    EXPECT_EQ(data.type, CMPI_uint16A);
    EXPECT_EQ(data.value.array->ft->getSimpleType(data.value.array, nullptr), CMPI_uint16);
    value.array = array(1, CMPI_chars);
    EXPECT_EQ(stored(&value, CMPI_stringA).type, CMPI_stringA);
    EXPECT_EQ(stored(&value, CMPI_charsA).type, CMPI_stringA);
}

TEST_F(ValuesTest, A_new_array_has_null_elements_of_its_type) {
    const CMPIArray* made = mb()->eft->newArray(mb(), 2, CMPI_uint16, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(made->ft->getSize(made, &st), 2U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(made->ft->getSimpleType(made, &st), CMPI_uint16);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    const CMPIData data = made->ft->getElementAt(made, 1, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(data.type, CMPI_uint16);
    EXPECT_EQ(data.state, CMPI_nullValue);
    EXPECT_EQ(array(0, CMPI_string)->ft->getSize(array(0, CMPI_string), nullptr), 0U);
}

TEST_F(ValuesTest, Array_elements_are_set_only_in_range_and_in_type) {
    CMPIArray* made = array(1, CMPI_uint16);
    const CMPIValue value = valueWith(&CMPIValue::uint16, CMPIUint16{7});
    EXPECT_EQ(made->ft->setElementAt(made, 0, &value, CMPI_uint16).rc, CMPI_RC_OK);
    EXPECT_EQ(made->ft->getElementAt(made, 0, nullptr).value.uint16, 7);
    EXPECT_EQ(made->ft->setElementAt(made, 0, &value, CMPI_uint32).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(made->ft->setElementAt(made, 1, &value, CMPI_uint16).rc,
              CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(made->ft->setElementAt(nullptr, 0, &value, CMPI_uint16).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(made->ft->getElementAt(made, 0, nullptr).value.uint16, 7);
    EXPECT_EQ(made->ft->setElementAt(made, 0, nullptr, CMPI_uint16).rc, CMPI_RC_OK);
    EXPECT_TRUE(isNull(made->ft->getElementAt(made, 0, nullptr)));
    made->ft->setElementAt(made, 0, &value, CMPI_uint16);
    EXPECT_EQ(made->ft->setElementAt(made, 0, nullptr, CMPI_null).rc, CMPI_RC_OK);
    EXPECT_TRUE(isNull(made->ft->getElementAt(made, 0, nullptr)));
    const CMPIData outside = made->ft->getElementAt(made, 1, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(outside.state, CMPI_nullValue | CMPI_notFound);
    EXPECT_EQ(made->ft->getSimpleType(nullptr, &st), CMPI_null);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(made->ft->getSize(nullptr, &st), 0U);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ValuesTest, Text_fits_into_a_string_array_in_every_form) {
    CMPIArray* made = array(2, CMPI_string);
    EXPECT_EQ(made->ft->setElementAt(made, 0, chars("one"), CMPI_chars).rc, CMPI_RC_OK);
    const CMPIValue value = valueWith(&CMPIValue::string, string("two"));
    EXPECT_EQ(made->ft->setElementAt(made, 1, &value, CMPI_string).rc, CMPI_RC_OK);
    EXPECT_EQ(text(made->ft->getElementAt(made, 0, nullptr).value.string), "one");
    EXPECT_EQ(text(made->ft->getElementAt(made, 1, nullptr).value.string), "two");
}

TEST_F(ValuesTest, Arrays_of_arrays_and_of_unknown_types_are_refused) {
    for (const int type : {CMPI_stringA, CMPI_null, CMPI_args, CMPI_ptr, 5}) {
        EXPECT_EQ(mb()->eft->newArray(mb(), 1, static_cast<CMPIType>(type), &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_DATA_TYPE) << type;
    }
    EXPECT_EQ(mb()->eft->newArray(mb(), std::numeric_limits<CMPICount>::max(), CMPI_uint8, &st),
              nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_FAILED);
}

TEST_F(ValuesTest, Objects_survive_the_way_to_the_host_and_back) {
    CMPIInstance* inner = instance();
    inner->ft->setProperty(inner, "Color", chars("red"), CMPI_chars);
    CMPIArray* list = array(2, CMPI_instance);
    CMPIValue value = {};
    value.inst = inner;
    list->ft->setElementAt(list, 1, &value, CMPI_instance);
    value = {};
    value.array = list;
    const cim::Value host = toCim(stored(&value, CMPI_instanceA));
    ASSERT_TRUE(host.isArray());
    EXPECT_TRUE(host.asArray().at(0).isNull());
    EXPECT_EQ(host.asArray().at(1).asInstance().property("color")->asString(), "red");
    const CMPIData back = fromCim(currentArena(), host);
    EXPECT_EQ(back.type, CMPI_instanceA);
    EXPECT_EQ(toCim(back), host);

    value = {};
    value.dateTime = mb()->eft->newDateTimeFromChars(mb(), "20240101000000.000000+000", nullptr);
    const cim::Value time = toCim(stored(&value, CMPI_dateTime));
    EXPECT_EQ(time.asDateTime().text(), "20240101000000.000000+000");
    EXPECT_EQ(toCim(fromCim(currentArena(), time)), time);
}

TEST_F(ValuesTest, Text_with_a_zero_byte_does_not_reach_a_provider) {
    const cim::Value value = cim::Value::string(std::string("admin\0x", 7));
    EXPECT_THROW(fromCim(currentArena(), value), Refusal);
}

TEST_F(ValuesTest, Values_cannot_be_nested_without_end) {
    CMPIInstance* inst = instance();
    CMPIValue value = {};
    value.inst = inst;
    CMPIrc code = CMPI_RC_OK;
    int depth = 0;
    while (code == CMPI_RC_OK && depth < 1000) {
        code = inst->ft->setProperty(inst, "Inner", &value, CMPI_instance).rc;
        ++depth;
    }
    EXPECT_EQ(code, CMPI_RC_ERR_FAILED);
    EXPECT_LT(depth, 100);
    CMPIInstance* copy = inst->ft->clone(inst, &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(toCim(*liveObject<InstanceObject>(copy)), toCim(*liveObject<InstanceObject>(inst)));
    copy->ft->release(copy);
}

TEST_F(ValuesTest, A_value_nested_too_deeply_from_outside_is_refused) {
    cim::Value value = cim::Value::string("core");
    for (int i = 0; i < 200; ++i) {
        cim::Instance shell(cim::ObjectPath("root/test", "TEST_Thing"));
        shell.setProperty("Inner", std::move(value));
        value = cim::Value::instance(std::move(shell));
    }
    EXPECT_THROW(fromCim(currentArena(), value), Refusal);
}

} // namespace
} // namespace qelo::broker::testing
