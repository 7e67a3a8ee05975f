#include <cim/Instance.h>
#include <cim/ObjectPath.h>
#include <cim/Value.h>

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <stdexcept>

namespace qelo::cim {
namespace {

Value u8(std::uint64_t value) { return Value::unsignedInteger(Type::UInt8, value); }

ObjectPath group(const char* name) {
    ObjectPath path("root/cimv2", "ZANTH_Group");
    path.setKey("Name", Value::string(name));
    return path;
}

TEST(Value, A_new_value_is_a_null_string) {
    const Value value;
    EXPECT_TRUE(value.isNull());
    EXPECT_FALSE(value.isArray());
    EXPECT_EQ(value.type(), Type::String);
    EXPECT_EQ(value.toText(), "");
}

TEST(Value, Null_knows_its_type_and_whether_it_stands_for_an_array) {
    const Value value = Value::null(Type::UInt16, true);
    EXPECT_TRUE(value.isNull());
    EXPECT_TRUE(value.isArray());
    EXPECT_EQ(value.type(), Type::UInt16);
    EXPECT_NE(value, Value::null(Type::UInt16, false));
    EXPECT_NE(value, Value::null(Type::UInt8, true));
    EXPECT_EQ(value, Value::null(Type::UInt16, true));
}

TEST(Value, Reading_another_alternative_throws) {
    EXPECT_THROW(Value::boolean(true).asString(), std::bad_variant_access);
    EXPECT_THROW(Value().asString(), std::bad_variant_access);
    EXPECT_THROW(u8(1).asSigned(), std::bad_variant_access);
}

TEST(Value, Integers_are_limited_by_their_type) {
    EXPECT_EQ(u8(255).asUnsigned(), 255U);
    EXPECT_THROW(u8(256), std::invalid_argument);
    EXPECT_THROW(Value::unsignedInteger(Type::UInt16, 65536), std::invalid_argument);
    EXPECT_THROW(Value::unsignedInteger(Type::Char16, 65536), std::invalid_argument);
    EXPECT_THROW(Value::unsignedInteger(Type::UInt32, 1ULL << 32), std::invalid_argument);
    EXPECT_EQ(Value::unsignedInteger(Type::UInt64, UINT64_MAX).asUnsigned(), UINT64_MAX);
    EXPECT_EQ(Value::signedInteger(Type::SInt8, -128).asSigned(), -128);
    EXPECT_THROW(Value::signedInteger(Type::SInt8, -129), std::invalid_argument);
    EXPECT_THROW(Value::signedInteger(Type::SInt8, 128), std::invalid_argument);
    EXPECT_THROW(Value::signedInteger(Type::SInt16, 32768), std::invalid_argument);
    EXPECT_THROW(Value::signedInteger(Type::SInt32, INT64_C(-2147483649)), std::invalid_argument);
    EXPECT_EQ(Value::signedInteger(Type::SInt64, INT64_MIN).asSigned(), INT64_MIN);
}

TEST(Value, A_type_of_another_family_is_refused) {
    EXPECT_THROW(Value::unsignedInteger(Type::SInt8, 1), std::invalid_argument);
    EXPECT_THROW(Value::signedInteger(Type::UInt8, 1), std::invalid_argument);
    EXPECT_THROW(Value::real(Type::UInt8, 1), std::invalid_argument);
    EXPECT_THROW(Value::unsignedInteger(Type::String, 1), std::invalid_argument);
}

TEST(Value, A_real32_is_rounded_and_limited) {
    EXPECT_EQ(Value::real(Type::Real32, 0.1).asReal(), static_cast<double>(0.1F));
    EXPECT_EQ(Value::real(Type::Real64, 0.1).asReal(), 0.1);
    EXPECT_THROW(Value::real(Type::Real32, 1e39), std::invalid_argument);
    EXPECT_TRUE(std::isinf(Value::real(Type::Real32, INFINITY).asReal()));
}

TEST(Value, Array_elements_are_scalars_of_its_type_or_null) {
    const Value value = Value::array(Type::UInt8, {u8(1), Value::null(Type::UInt8), u8(3)});
    EXPECT_TRUE(value.isArray());
    EXPECT_EQ(value.asArray().size(), 3U);
    EXPECT_THROW(Value::array(Type::UInt16, {u8(1)}), std::invalid_argument);
    EXPECT_THROW(Value::array(Type::UInt8, {value}), std::invalid_argument);
}

TEST(Value, Scalars_have_a_plain_text) {
    EXPECT_EQ(Value::boolean(true).toText(), "true");
    EXPECT_EQ(Value::boolean(false).toText(), "false");
    EXPECT_EQ(Value::unsignedInteger(Type::UInt64, UINT64_MAX).toText(), "18446744073709551615");
    EXPECT_EQ(Value::signedInteger(Type::SInt64, INT64_MIN).toText(), "-9223372036854775808");
    EXPECT_EQ(Value::string("a \"b\"\n").toText(), "a \"b\"\n");
    EXPECT_EQ(Value::unsignedInteger(Type::Char16, 0x65E5).toText(), "日");
    EXPECT_EQ(Value::dateTime(DateTime::fromMicroseconds(0, false)).toText(),
              "19700101000000.000000+000");
    EXPECT_EQ(Value::reference(group("wheel")).toText(), R"(root/cimv2:ZANTH_Group.Name="wheel")");
}

TEST(Value, Reals_print_with_as_many_digits_as_reading_them_back_takes) {
    EXPECT_EQ(Value::real(Type::Real64, 0.1).toText(), "0.1");
    EXPECT_EQ(Value::real(Type::Real32, 0.1).toText(), "0.1");
    EXPECT_EQ(Value::real(Type::Real64, 1.0 / 3).toText(), "0.3333333333333333");
    EXPECT_EQ(Value::real(Type::Real64, INFINITY).toText(), "INF");
    EXPECT_EQ(Value::real(Type::Real64, -INFINITY).toText(), "-INF");
    EXPECT_EQ(Value::real(Type::Real32, NAN).toText(), "NaN");
    EXPECT_EQ(std::stod(Value::real(Type::Real64, -std::numeric_limits<double>::max()).toText()),
              -std::numeric_limits<double>::max());
}

TEST(Value, Arrays_print_their_elements_with_commas) {
    EXPECT_EQ(Value::array(Type::UInt8, {u8(1), Value::null(Type::UInt8), u8(3)}).toText(), "1,,3");
    EXPECT_EQ(Value::array(Type::String, {}).toText(), "");
}

TEST(Value, An_embedded_instance_prints_its_class_and_properties) {
    Instance instance{ObjectPath("", "ZANTH_Group")};
    instance.setProperty("Name", Value::string("wheel"));
    instance.setProperty("Size", u8(3));
    EXPECT_EQ(Value::instance(instance).toText(), "ZANTH_Group{Name=wheel,Size=3}");
}

TEST(Value, Equality_looks_at_type_nullness_and_contents) {
    EXPECT_EQ(u8(1), u8(1));
    EXPECT_NE(u8(1), u8(2));
    EXPECT_NE(u8(1), Value::unsignedInteger(Type::UInt16, 1));
    EXPECT_NE(u8(1), Value::null(Type::UInt8));
    EXPECT_NE(Value::string(""), Value());
    EXPECT_NE(Value::string("a"), Value::string("A"));
    EXPECT_EQ(Value::array(Type::UInt8, {u8(1)}), Value::array(Type::UInt8, {u8(1)}));
    EXPECT_NE(Value::array(Type::UInt8, {u8(1)}), Value::array(Type::UInt8, {}));
    EXPECT_NE(Value::array(Type::UInt8, {}), Value::null(Type::UInt8, true));
}

TEST(Value, References_and_instances_are_equal_by_contents) {
    EXPECT_EQ(Value::reference(group("a")), Value::reference(group("a")));
    EXPECT_NE(Value::reference(group("a")), Value::reference(group("b")));
    EXPECT_EQ(Value::instance(Instance(group("a"))), Value::instance(Instance(group("a"))));
    EXPECT_NE(Value::instance(Instance(group("a"))), Value::instance(Instance(group("b"))));
}

TEST(Value, A_copy_outlives_its_original) {
    Value copy;
    {
        const Value original = Value::reference(group("a"));
        copy = original;
    }
    EXPECT_EQ(copy.asReference().className(), "ZANTH_Group");
}

TEST(Value, Type_names_are_those_of_MOF) {
    EXPECT_STREQ(typeName(Type::UInt16), "uint16");
    EXPECT_STREQ(typeName(Type::SInt64), "sint64");
    EXPECT_STREQ(typeName(Type::Real32), "real32");
    EXPECT_STREQ(typeName(Type::DateTime), "datetime");
    EXPECT_STREQ(typeName(Type::Boolean), "boolean");
}

} // namespace
} // namespace qelo::cim
