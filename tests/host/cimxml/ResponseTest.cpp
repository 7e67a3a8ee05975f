// Answers: what the writer writes, the reader reads.
#include "Documents.h"
#include "Samples.h"

#include <cimxml/ElementWriter.h>
#include <cimxml/ResponseWriter.h>

#include <gmock/gmock.h>

namespace qelo::cimxml {
namespace {

using cim::Type;
using cim::Value;
using ::testing::HasSubstr;
using ::testing::Not;

ResponseWriter writerFor(bool extrinsic = false) {
    Request request;
    request.messageId = "4<2";
    request.method = "M";
    request.extrinsic = extrinsic;
    return ResponseWriter(request, "host", "root/cimv2");
}

// A whole answer, of what `write` appends.
template <class Write> std::string answerWith(Write write) {
    const ResponseWriter writer = writerFor();
    std::string out;
    writer.begin(out);
    write(writer, out);
    writer.end(out);
    return out;
}

std::string answerWith(const cim::Instance& instance, InstanceForm form,
                       const InstanceOptions& options = {}) {
    return answerWith([&](const ResponseWriter& writer, std::string& out) {
        writer.instance(out, instance, form, options);
    });
}

std::string textOf(const cim::Class& declaration) {
    std::string out;
    ClassOptions options;
    options.localOnly = false;
    options.includeClassOrigin = true;
    appendClass(out, declaration, options);
    return out;
}

std::string answerWith(const cim::Class& declaration, const ClassOptions& options) {
    return answerWith([&](const ResponseWriter& writer, std::string& out) {
        writer.declaration(out, declaration, options);
    });
}

TEST(Response, The_envelope_names_message_and_method) {
    const std::string text = answerWith([](const ResponseWriter&, std::string&) {});
    EXPECT_EQ(text, "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
                    "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"4&lt;2\" "
                    "PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE NAME=\"M\"><IRETURNVALUE>"
                    "</IRETURNVALUE></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n");
    EXPECT_TRUE(readAnswer(text).instances.empty());
}

TEST(Response, An_operation_without_results_has_an_empty_answer) {
    std::string out;
    writerFor().begin(out, false);
    writerFor().end(out, false);
    EXPECT_THAT(out, HasSubstr("<IMETHODRESPONSE NAME=\"M\"></IMETHODRESPONSE>"));
    EXPECT_NO_THROW(readAnswer(out));
}

TEST(Response, Instances_come_back_as_they_were) {
    const cim::Instance sample = sampleInstance();
    const auto plain = readAnswer(answerWith(sample, InstanceForm::Plain)).instances.at(0);
    EXPECT_EQ(plain.path().toText(), "C") << "an instance alone has no path";
    for (const InstanceForm form : {InstanceForm::Named, InstanceForm::WithObjectPath}) {
        const auto results = readAnswer(answerWith(sample, form));
        ASSERT_EQ(results.instances.size(), 1U);
        EXPECT_EQ(results.instances[0], sample);
        for (std::size_t i = 0; i < sample.properties().size(); ++i) {
            EXPECT_EQ(results.instances[0].properties()[i].name, sample.properties()[i].name);
            EXPECT_EQ(results.instances[0].properties()[i].value, sample.properties()[i].value)
                << sample.properties()[i].name;
        }
    }
    for (const auto& property : sample.properties()) {
        EXPECT_EQ(*plain.property(property.name), property.value) << property.name;
    }
}

TEST(Response, References_keep_host_and_namespace) {
    const auto instance =
        readAnswer(answerWith(sampleInstance(), InstanceForm::Plain)).instances.at(0);
    EXPECT_EQ(instance.property("Far")->asReference().host(), "h");
    EXPECT_EQ(instance.property("Far")->asReference().nameSpace(), "root/cimv2");
    EXPECT_EQ(instance.property("Reference")->asReference().nameSpace(), "");
    EXPECT_EQ(instance.property("Class")->asReference().nameSpace(), "root/cimv2");
}

TEST(Response, Not_a_number_stays_one) {
    cim::Instance sample(cim::ObjectPath("", "C"));
    sample.setProperty("R", Value::real(Type::Real32, NAN));
    const auto read = readAnswer(answerWith(sample, InstanceForm::Plain)).instances.at(0);
    EXPECT_TRUE(std::isnan(read.property("R")->asReal()));
}

TEST(Response, Text_that_xml_cannot_hold_is_replaced_and_the_answer_readable) {
    cim::Instance sample(cim::ObjectPath("", "C"));
    sample.setProperty("A", Value::string(std::string("\0\xFF\x1B[", 4)));
    const auto read = readAnswer(answerWith(sample, InstanceForm::Plain)).instances.at(0);
    EXPECT_EQ(read.property("A")->asString(), "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD[");
}

TEST(Response, Class_origins_are_written_on_request) {
    cim::Instance sample(cim::ObjectPath("", "C"));
    sample.setProperty("A", Value::boolean(true), "Base");
    InstanceOptions options;
    EXPECT_THAT(answerWith(sample, InstanceForm::Plain, options), Not(HasSubstr("CLASSORIGIN")));
    options.includeClassOrigin = true;
    const auto read = readAnswer(answerWith(sample, InstanceForm::Plain, options)).instances.at(0);
    EXPECT_EQ(read.properties()[0].origin, "Base");
}

TEST(Response, Qualifiers_of_instances_are_those_of_the_class) {
    const cim::Class declaration = sampleClass();
    cim::Instance sample(cim::ObjectPath("", "C"));
    sample.setProperty("name", Value::string("x"));
    sample.setProperty("Unknown", Value::string("x"));
    InstanceOptions options;
    options.declaration = &declaration;
    EXPECT_THAT(answerWith(sample, InstanceForm::Plain, options), Not(HasSubstr("QUALIFIER")));
    options.includeQualifiers = true;
    const std::string text = answerWith(sample, InstanceForm::Plain, options);
    EXPECT_THAT(text, HasSubstr("<INSTANCE CLASSNAME=\"C\"><QUALIFIER NAME=\"Description\""));
    EXPECT_THAT(text, HasSubstr("NAME=\"name\" TYPE=\"string\"><QUALIFIER NAME=\"Key\""));
    EXPECT_EQ(readAnswer(text).instances.at(0), sample);
    options.declaration = nullptr;
    EXPECT_THAT(answerWith(sample, InstanceForm::Plain, options), Not(HasSubstr("QUALIFIER")));
}

TEST(Response, Paths_come_back_as_they_were) {
    const auto read = [](PathForm form, const cim::ObjectPath& path) {
        return readAnswer(answerWith([&](const ResponseWriter& writer, std::string& out) {
                   writer.path(out, path, form);
               }))
            .paths.at(0);
    };
    const auto name = read(PathForm::InstanceName, samplePath());
    EXPECT_EQ(name, samplePath());
    EXPECT_EQ(name.nameSpace(), "");
    EXPECT_EQ(name.key("End")->asReference().nameSpace(), "root/other");
    const auto object = read(PathForm::ObjectPath, samplePath("root/third"));
    EXPECT_EQ(object, samplePath());
    EXPECT_EQ(object.nameSpace(), "root/third");
    EXPECT_EQ(object.host(), "host");
    EXPECT_EQ(read(PathForm::ObjectPath, samplePath("")).nameSpace(), "root/cimv2");
    EXPECT_EQ(read(PathForm::ObjectPath, cim::ObjectPath("", "K")).toText(true),
              "//host/root/cimv2:K");
}

TEST(Response, Class_names_and_values_come_back) {
    const auto results = readAnswer(answerWith([](const ResponseWriter& writer, std::string& out) {
        writer.className(out, "A");
        writer.className(out, "B");
        writer.value(out, Value::unsignedInteger(Type::UInt8, 5));
        writer.value(out, Value::array(Type::UInt8, {Value::unsignedInteger(Type::UInt8, 6)}));
        writer.value(out, Value::reference(samplePath()));
        writer.value(out, Value::null(Type::UInt8));
    }));
    EXPECT_EQ(results.classNames, (std::vector<std::string>{"A", "B"}));
    ASSERT_EQ(results.values.size(), 3U);
    EXPECT_EQ(results.values[0], Value::string("5")) << "the answer does not tell the type";
    EXPECT_EQ(results.values[1], Value::array(Type::String, {Value::string("6")}));
    EXPECT_EQ(results.values[2], Value::reference(samplePath()));
}

TEST(Response, A_class_comes_back_whole) {
    ClassOptions options;
    options.localOnly = false;
    options.includeClassOrigin = true;
    const auto results = readAnswer(answerWith(sampleClass(), options));
    ASSERT_EQ(results.classes.size(), 1U);
    const cim::Class& read = results.classes[0];
    EXPECT_EQ(textOf(read), textOf(sampleClass()));
    EXPECT_EQ(read.superclass, "B");
    EXPECT_TRUE(read.property("Name")->propagated);
    EXPECT_TRUE(hasFlag(read.property("Name")->qualifiers, "Key"));
    EXPECT_FALSE(read.property("Name")->qualifiers[0].flavor.overridable);
    EXPECT_EQ(read.property("Numbers")->arraySize, 4U);
    EXPECT_EQ(read.property("Numbers")->defaultValue, sampleClass().properties[1].defaultValue);
    EXPECT_EQ(read.property("End")->referenceClass, "D");
    ASSERT_EQ(read.method("Do")->parameters.size(), 4U);
    EXPECT_TRUE(read.method("Do")->parameters[2].array);
    EXPECT_EQ(read.method("Do")->parameters[2].type, Type::Reference);
    EXPECT_EQ(read.method("Do")->returnType, Type::SInt32);
}

TEST(Response, A_class_is_written_as_far_as_it_is_wanted) {
    const std::string local = answerWith(sampleClass(), {});
    EXPECT_THAT(local, Not(HasSubstr("NAME=\"Name\"")));
    EXPECT_THAT(local, Not(HasSubstr("Inherited")));
    EXPECT_THAT(local, Not(HasSubstr("CLASSORIGIN")));
    EXPECT_THAT(local, HasSubstr("NAME=\"Numbers\""));
    ClassOptions options;
    options.localOnly = false;
    options.includeQualifiers = false;
    const std::string bare = answerWith(sampleClass(), options);
    EXPECT_THAT(bare, Not(HasSubstr("QUALIFIER")));
    EXPECT_THAT(bare, HasSubstr("NAME=\"Inherited\""));
    options.properties = {"END"};
    const auto read = readAnswer(answerWith(sampleClass(), options)).classes.at(0);
    ASSERT_EQ(read.properties.size(), 1U);
    EXPECT_EQ(read.properties[0].name, "End");
    options.properties = std::vector<std::string>();
    EXPECT_TRUE(readAnswer(answerWith(sampleClass(), options)).classes.at(0).properties.empty());
}

TEST(Response, A_type_of_qualifiers_comes_back) {
    const auto read = readAnswer(answerWith([](const ResponseWriter& writer, std::string& out) {
                          writer.qualifierType(out, sampleQualifierType());
                      })).qualifierTypes.at(0);
    const cim::QualifierType sample = sampleQualifierType();
    EXPECT_EQ(read.name, sample.name);
    EXPECT_EQ(read.type, sample.type);
    EXPECT_TRUE(read.array);
    EXPECT_EQ(read.arraySize, sample.arraySize);
    EXPECT_EQ(read.defaultValue, sample.defaultValue);
    EXPECT_EQ(read.scopes, sample.scopes);
    EXPECT_FALSE(read.flavor.overridable);
    EXPECT_FALSE(read.flavor.toSubclass);
    EXPECT_TRUE(read.flavor.translatable);
}

TEST(Response, The_result_of_a_method_comes_back) {
    client::MethodResult result;
    result.returnValue = Value::unsignedInteger(Type::UInt32, 5);
    const cim::Instance sample = sampleInstance();
    for (const auto& property : sample.properties()) {
        if (!property.value.isNull()) {
            result.out.emplace_back(property.name, property.value);
        }
    }
    std::string out;
    writerFor(true).methodResult(out, result);
    const auto read = readAnswer(out).method;
    EXPECT_EQ(read.returnValue, result.returnValue);
    EXPECT_EQ(read.out, result.out);
}

TEST(Response, A_method_may_return_nothing) {
    client::MethodResult result;
    result.out.emplace_back("N", Value::null(Type::UInt8));
    std::string out;
    writerFor(true).methodResult(out, result);
    const auto read = readAnswer(out).method;
    EXPECT_TRUE(read.returnValue.isNull());
    EXPECT_EQ(read.out, result.out);
}

TEST(Response, Errors_are_thrown_as_they_were) {
    for (const bool extrinsic : {false, true}) {
        std::string out;
        writerFor(extrinsic).error(out, 6, "no <such> \"thing\"");
        try {
            readAnswer(out);
            FAIL() << "no error";
        } catch (const client::CimError& error) {
            EXPECT_EQ(error.code(), 6U);
            EXPECT_STREQ(error.what(), "no <such> \"thing\"");
        }
    }
}

TEST(Response, Pieces_of_any_size_give_the_same) {
    std::string text = answerWith([](const ResponseWriter& writer, std::string& out) {
        writer.instance(out, sampleInstance(), InstanceForm::Named, {});
        writer.instance(out, sampleInstance(), InstanceForm::WithObjectPath, {});
    });
    for (const std::size_t size : {1U, 2U, 7U, 100U, 4096U}) {
        const auto results = readAnswer(text, size);
        ASSERT_EQ(results.instances.size(), 2U) << size;
        EXPECT_EQ(results.instances[0], sampleInstance());
        EXPECT_EQ(results.instances[1], sampleInstance());
    }
}

} // namespace
} // namespace qelo::cimxml
