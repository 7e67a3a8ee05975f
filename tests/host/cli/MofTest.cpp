#include "RecordingOutput.h"

#include <cli/render/Display.h>
#include <cli/render/Mof.h>
#include <cli/render/Writer.h>

#include <cim/QuotedText.h>

#include <gtest/gtest.h>

#include <cmath>

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;

TEST(MofFormat, An_instance_is_a_declaration_with_one_property_a_line) {
    cim::Instance instance(cim::ObjectPath("root/cimv2", "ZANTH_Group"));
    instance.setProperty("Name", Value::string("a\"b\\c\n"));
    instance.setProperty("Size", Value::unsignedInteger(Type::UInt32, 3));
    instance.setProperty("None", Value::null(Type::String));
    EXPECT_EQ(mofInstance(instance), "instance of ZANTH_Group {\n"
                                     "    Name = \"a\\\"b\\\\c\\n\";\n"
                                     "    Size = 3;\n"
                                     "    None = NULL;\n"
                                     "};\n");
}

TEST(MofFormat, Scalars_are_literals) {
    EXPECT_EQ(mofValue(Value::boolean(true)), "TRUE");
    EXPECT_EQ(mofValue(Value::boolean(false)), "FALSE");
    EXPECT_EQ(mofValue(Value::signedInteger(Type::SInt8, -5)), "-5");
    EXPECT_EQ(mofValue(Value::dateTime(cim::DateTime::fromMicroseconds(0, true))),
              "\"00000000000000.000000:000\"");
}

TEST(MofFormat, Reals_always_have_a_point) {
    EXPECT_EQ(mofValue(Value::real(Type::Real64, 1)), "1.0");
    EXPECT_EQ(mofValue(Value::real(Type::Real64, 1e300)), "1.0e+300");
    EXPECT_EQ(mofValue(Value::real(Type::Real64, 0.25)), "0.25");
    EXPECT_EQ(mofValue(Value::real(Type::Real64, INFINITY)), "NULL");
    EXPECT_EQ(mofValue(Value::real(Type::Real32, NAN)), "NULL");
}

TEST(MofFormat, Characters_stand_in_single_quotes) {
    const auto c = [](unsigned int code) {
        return mofValue(Value::unsignedInteger(Type::Char16, code));
    };
    EXPECT_EQ(c('x'), "'x'");
    EXPECT_EQ(c('\''), "'\\''");
    EXPECT_EQ(c('"'), "'\\\"'");
    EXPECT_EQ(c('\\'), "'\\\\'");
    EXPECT_EQ(c('\n'), "'\\n'");
}

TEST(MofFormat, Arrays_stand_in_braces) {
    EXPECT_EQ(mofValue(Value::array(Type::String, {Value::string("a"), Value::null(Type::String),
                                                   Value::string("b,")})),
              R"({"a", NULL, "b,"})");
    EXPECT_EQ(mofValue(Value::array(Type::String, {})), "{}");
    EXPECT_EQ(mofValue(Value::null(Type::String, true)), "NULL");
}

TEST(MofFormat, References_and_embedded_instances_are_quoted_texts) {
    cim::ObjectPath path("root/cimv2", "C");
    path.setKey("K", Value::string("v"));
    EXPECT_EQ(mofValue(Value::reference(path)), R"("root/cimv2:C.K=\"v\"")");
    cim::Instance inner(cim::ObjectPath("", "I"));
    inner.setProperty("X", Value::boolean(true));
    EXPECT_EQ(mofValue(Value::instance(inner)), R"("instance of I {\n    X = TRUE;\n};\n")");
}

TEST(MofFormat, Any_bytes_become_a_literal_that_a_terminal_can_show) {
    std::string bytes = "\u202e\u009b\x1b]0;x\x07";
    for (int byte = 1; byte < 256; ++byte) {
        bytes += static_cast<char>(byte);
    }
    const std::string literal = mofString(bytes);
    EXPECT_TRUE(isDisplayable(std::string_view(literal)));
    std::size_t position = 0;
    std::string error;
    const auto read = cim::readQuoted(literal, position, error);
    ASSERT_TRUE(read) << error;
    EXPECT_EQ(position, literal.size());
    EXPECT_EQ(read->find("\u202e\u009b\x1b]0;x\x07"), 0U);
    EXPECT_NE(read->find("\uFFFD"), std::string::npos);
}

TEST(MofFormat, Instances_are_separated_by_an_empty_line) {
    RecordingOutput output;
    const auto writer = makeWriter(Format::Mof, output);
    writer->instance(cim::Instance(cim::ObjectPath("root/cimv2", "A")));
    writer->instance(cim::Instance(cim::ObjectPath("root/cimv2", "B")));
    writer->finish();
    EXPECT_EQ(output.text(), "instance of A {\n};\n\ninstance of B {\n};\n");
}

} // namespace
} // namespace qelo::cli
