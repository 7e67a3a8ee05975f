// docs/classes.md against the schema and the providers.
#include <reference/ServedClasses.h>
#include <schema/Mof.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <sstream>

namespace qelo::reference {
namespace {

namespace fs = std::filesystem;
using ::testing::HasSubstr;
using ::testing::Not;

// Lines, for failures that show what differs.
std::vector<std::string> linesOf(std::istream&& stream) {
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

class ClassReferenceTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string name = (fs::temp_directory_path() / "qelo_reference_XXXXXX").string();
        ASSERT_NE(::mkdtemp(name.data()), nullptr);
        scratch = name;
    }
    void TearDown() override {
        ::unsetenv("QELO_NODE_STORE");
        std::error_code ignored;
        fs::remove_all(scratch, ignored);
    }

    fs::path scratch;
};

TEST_F(ClassReferenceTest, The_document_says_what_schema_and_providers_say) {
    const auto classes = askProviders(QELO_SCHEMA_DIRECTORY, QELO_PROVIDER_DIRECTORY, scratch);
    const auto expected =
        linesOf(std::istringstream(classReference(readSchema(QELO_SCHEMA_DIRECTORY), classes)));
    const auto written = linesOf(std::ifstream(QELO_CLASS_REFERENCE));
    ASSERT_FALSE(written.empty()) << "cannot read " << QELO_CLASS_REFERENCE;
    for (std::size_t i = 0; i < std::min(expected.size(), written.size()); ++i) {
        ASSERT_EQ(written[i], expected[i])
            << QELO_CLASS_REFERENCE << ":" << i + 1 << " is old; tools/class-reference renews it";
    }
    EXPECT_EQ(written.size(), expected.size());
}

TEST_F(ClassReferenceTest, Each_served_class_is_told_with_what_its_instances_have) {
    schema::ClassRepository repository;
    schema::readMof({"test.mof",
                     "class Base { [Key] string Id; string Unused; uint16 State; };"
                     "[Description(\"A | B\")] class Sub : Base {"
                     " [ValueMap{\"0\", \"1\"}, Values{\"Off\", \"On\"}, Units(\"Days\"),"
                     "  Description(\"x|y\")] uint32 Own[];"
                     " [Static] uint32 Go([In(false), Out] Base ref Made); };"},
                    "root/test", {}, repository);
    ServedClass served;
    served.registration.className = "Sub";
    served.registration.nameSpaces = {"root/test"};
    served.registration.provider = "SubProvider";
    served.registration.library = "sub";
    served.registration.types = {broker::ProviderType::Instance, broker::ProviderType::Method};
    served.properties = {"id", "State"};
    const std::string text = classReference(repository, {served});
    EXPECT_THAT(text, HasSubstr("\n## Sub\n\nA | B\n\n`Sub` < `Base`  \n"
                                "Served by `SubProvider` of `libsub.so.1` (instance, method).\n"));
    EXPECT_THAT(text, HasSubstr("\n| `Id` * | `string` | `Base` |  |\n"));
    EXPECT_THAT(text, HasSubstr("\n| `State` | `uint16` | `Base` |  |\n"));
    EXPECT_THAT(text, HasSubstr("\n| `Own` | `uint32[]` | `Sub` | x\\|y Unit: Days. "
                                "Values: `0` Off, `1` On. Never set. |\n"));
    EXPECT_THAT(text, HasSubstr("\nInherited and never set: `Unused`.\n"));
    EXPECT_THAT(text, Not(HasSubstr("| `Unused`")));
    EXPECT_THAT(text, HasSubstr("\n### Go\n\n Returns `uint32`. Asked of the class.\n"));
    EXPECT_THAT(text, HasSubstr("\n| `Made` | `Base ref` | out | no |  |\n"));
}

TEST_F(ClassReferenceTest, A_class_that_the_schema_does_not_have_is_an_error) {
    ServedClass served;
    served.registration.className = "None";
    served.registration.nameSpaces = {"root/test"};
    EXPECT_THROW(classReference(schema::ClassRepository(), {served}), std::runtime_error);
}

} // namespace
} // namespace qelo::reference
