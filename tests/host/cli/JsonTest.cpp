#include "RecordingOutput.h"

#include <cli/render/Display.h>
#include <cli/render/Writer.h>

#include <nlohmann/json.hpp>

#include <gtest/gtest.h>

#include <cmath>

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;
using Json = nlohmann::ordered_json;

std::string written(const std::vector<cim::Instance>& instances) {
    RecordingOutput output;
    const auto writer = makeWriter(Format::Json, output);
    for (const auto& instance : instances) {
        writer->instance(instance);
    }
    writer->finish();
    return output.text();
}

// What a property of that value becomes.
Json property(const Value& value) {
    cim::Instance instance(cim::ObjectPath("root/cimv2", "C"));
    instance.setProperty("P", value);
    return Json::parse(written({instance}))[0]["properties"]["P"];
}

std::string textOf(const Value& value) { return property(value).dump(); }

TEST(JsonFormat, No_instances_are_an_empty_array) { EXPECT_EQ(written({}), "[]\n"); }

TEST(JsonFormat, Instances_are_objects_of_class_path_and_properties_in_order) {
    cim::ObjectPath path("root/cimv2", "C");
    path.setKey("K", Value::string("v"));
    cim::Instance instance(path);
    instance.setProperty("Z", Value::string("1"));
    instance.setProperty("A", Value::unsignedInteger(Type::UInt8, 2));
    EXPECT_EQ(written({instance}), "[\n"
                                   "  {\n"
                                   "    \"class\": \"C\",\n"
                                   "    \"path\": \"root/cimv2:C.K=\\\"v\\\"\",\n"
                                   "    \"properties\": {\n"
                                   "      \"Z\": \"1\",\n"
                                   "      \"A\": 2\n"
                                   "    }\n"
                                   "  }\n"
                                   "]\n");
    EXPECT_EQ(Json::parse(written({instance, instance, instance})).size(), 3U);
}

TEST(JsonFormat, Integers_are_exact_numbers) {
    EXPECT_EQ(textOf(Value::unsignedInteger(Type::UInt64, UINT64_MAX)), "18446744073709551615");
    EXPECT_EQ(textOf(Value::signedInteger(Type::SInt64, INT64_MIN)), "-9223372036854775808");
    EXPECT_EQ(textOf(Value::unsignedInteger(Type::UInt64, (1ULL << 53) + 1)), "9007199254740993");
}

TEST(JsonFormat, Reals_are_numbers_and_the_special_ones_texts) {
    EXPECT_EQ(textOf(Value::real(Type::Real32, 0.1)), "0.1");
    EXPECT_EQ(textOf(Value::real(Type::Real64, -2.5)), "-2.5");
    EXPECT_EQ(textOf(Value::real(Type::Real64, NAN)), "\"NaN\"");
    EXPECT_EQ(textOf(Value::real(Type::Real64, -INFINITY)), "\"-INF\"");
}

TEST(JsonFormat, Other_scalars_have_their_own_forms) {
    EXPECT_EQ(textOf(Value::boolean(true)), "true");
    EXPECT_EQ(textOf(Value::null(Type::String)), "null");
    EXPECT_EQ(textOf(Value::null(Type::UInt8, true)), "null");
    EXPECT_EQ(textOf(Value::dateTime(cim::DateTime::fromMicroseconds(0, false))),
              "\"19700101000000.000000+000\"");
    EXPECT_EQ(textOf(Value::unsignedInteger(Type::Char16, 'x')), "\"x\"");
    EXPECT_EQ(textOf(Value::reference(cim::ObjectPath("ns", "C"))), "\"ns:C\"");
}

TEST(JsonFormat, Arrays_keep_their_order_and_nulls) {
    const auto u8 = [](unsigned int value) { return Value::unsignedInteger(Type::UInt8, value); };
    EXPECT_EQ(textOf(Value::array(Type::UInt8, {u8(2), Value::null(Type::UInt8), u8(1)})),
              "[2,null,1]");
    EXPECT_EQ(textOf(Value::array(Type::String, {})), "[]");
}

TEST(JsonFormat, An_embedded_instance_is_an_object_of_the_same_form) {
    cim::Instance inner(cim::ObjectPath("", "Inner"));
    inner.setProperty("X", Value::boolean(false));
    EXPECT_EQ(textOf(Value::instance(inner)),
              R"({"class":"Inner","path":"Inner","properties":{"X":false}})");
}

TEST(JsonFormat, Any_bytes_become_valid_json_that_a_terminal_can_show) {
    std::string bytes = "\u202e\u009b\x1b[2J \"\\\n日本";
    for (int byte = 0; byte < 256; ++byte) {
        bytes += static_cast<char>(byte);
    }
    cim::Instance instance(cim::ObjectPath("root/cimv2", "C"));
    instance.setProperty("P", Value::string(bytes));
    const std::string text = written({instance});
    EXPECT_TRUE(nlohmann::json::accept(text));
    std::string lines = text;
    lines.erase(std::remove(lines.begin(), lines.end(), '\n'), lines.end());
    EXPECT_TRUE(isDisplayable(std::string_view(lines)));
    const std::string read = Json::parse(text)[0]["properties"]["P"];
    EXPECT_EQ(read.find("\u202e\u009b\x1b[2J \"\\\n日本"), 0U);
    EXPECT_NE(read.find("\uFFFD"), std::string::npos);
}

TEST(JsonFormat, Readable_text_stays_readable) {
    cim::Instance instance(cim::ObjectPath("root/cimv2", "C"));
    instance.setProperty("P", Value::string("山田 花子"));
    EXPECT_NE(written({instance}).find("山田 花子"), std::string::npos);
}

TEST(JsonFormat, Every_instance_is_written_when_it_arrives) {
    RecordingOutput output;
    const auto writer = makeWriter(Format::Json, output);
    writer->instance(cim::Instance(cim::ObjectPath("root/cimv2", "First")));
    EXPECT_NE(output.text().find("First"), std::string::npos);
    writer->instance(cim::Instance(cim::ObjectPath("root/cimv2", "Second")));
    EXPECT_NE(output.text().find("Second"), std::string::npos);
    EXPECT_FALSE(nlohmann::json::accept(output.text()));
    writer->finish();
    EXPECT_TRUE(nlohmann::json::accept(output.text()));
}

} // namespace
} // namespace qelo::cli
