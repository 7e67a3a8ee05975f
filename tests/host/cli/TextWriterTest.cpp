#include "RecordingOutput.h"

#include <cli/render/Writer.h>

#include <gtest/gtest.h>

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;

TEST(TextFormat, An_instance_is_its_path_and_a_block_of_properties) {
    RecordingOutput output;
    cim::ObjectPath path("root/cimv2", "C");
    path.setKey("K", Value::string("v"));
    cim::Instance instance(path);
    instance.setProperty("K", Value::string("v"));
    instance.setProperty("Longer", Value::unsignedInteger(Type::UInt8, 2));
    instance.setProperty("When", Value::dateTime(cim::DateTime::fromMicroseconds(0, false)));
    instance.setProperty("None", Value::null(Type::DateTime));
    instance.setProperty("List", Value::array(Type::String, {Value::string("a")}));
    const auto writer = makeWriter(Format::Text, output);
    writer->instance(instance);
    writer->instance(cim::Instance(path));
    writer->finish();
    EXPECT_EQ(output.text(), "root/cimv2:C.K=\"v\"\n"
                             "  K      = \"v\"\n"
                             "  Longer = 2\n"
                             "  When   = 19700101000000.000000+000\n"
                             "  None   = NULL\n"
                             "  List   = {\"a\"}\n"
                             "\n"
                             "root/cimv2:C.K=\"v\"\n");
}

TEST(TextFormat, Hostile_values_stay_on_their_line) {
    RecordingOutput output;
    cim::ObjectPath path("root/cimv2", "C\x1b[1m");
    path.setKey("K\n", Value::string("\x1b[2J\n\u202e\xff"));
    cim::Instance instance(path);
    instance.setProperty("P\x07", Value::string("\r\nroot\x9b"));
    const auto writer = makeWriter(Format::Text, output);
    writer->path(path);
    writer->instance(instance);
    writer->finish();
    const std::string printed = R"(root/cimv2:C\x001B[1m.K\n="\x001B[2J\n\x202E\xFF")"
                                "\n";
    EXPECT_EQ(output.text(), printed + printed + R"(  P\x0007 = "\r\nroot\xFFFD")" + "\n");
}

} // namespace
} // namespace qelo::cli
