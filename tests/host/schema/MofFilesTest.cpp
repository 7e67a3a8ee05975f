#include "SchemaFixture.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace qelo::schema::testing {
namespace {

namespace fs = std::filesystem;
using ::testing::HasSubstr;

class MofFilesTest : public SchemaTest {
protected:
    MofFilesTest() {
        std::string name = (fs::temp_directory_path() / "qelo_mof_XXXXXX").string();
        folder_ = mkdtemp(name.data()) == nullptr ? fs::path() : fs::path(name);
        fs::create_directories(folder_ / "schema/sub");
    }
    ~MofFilesTest() override {
        std::error_code ignored;
        fs::remove_all(folder_, ignored);
    }

    void write(const std::string& name, const std::string& text) const {
        std::ofstream(folder_ / "schema" / name) << text;
    }
    std::string loadError() {
        try {
            loadMofFolder(folder_ / "schema", nameSpace, repository);
        } catch (const SchemaError& error) {
            return error.what();
        }
        return {};
    }

    fs::path folder_;
};

TEST_F(MofFilesTest, A_folder_is_loaded_with_included_files_in_their_place) {
    write("a_sub.mof", "// includes what sorts behind it\n#pragma include (\"z_base.mof\")\n"
                       "#pragma include (\"sub/other.mof\")\nclass Sub : Base {};");
    write("z_base.mof", "class Base {};");
    write("sub/other.mof", "#pragma include (\"../z_base.mof\")\nclass Other : Base {};");
    write("notes.txt", "not MOF");
    EXPECT_EQ(loadError(), "");
    EXPECT_TRUE(repository.isA(nameSpace, "Sub", "Base"));
    EXPECT_TRUE(repository.isA(nameSpace, "Other", "Base"));
}

TEST_F(MofFilesTest, Includes_do_not_leave_the_folder) {
    std::ofstream(folder_ / "outside.mof") << "class Outside {};";
    write("a.mof", "#pragma include (\"../outside.mof\")");
    EXPECT_THAT(loadError(), HasSubstr("outside of the folder"));
    write("a.mof", "#pragma include (\"/etc/passwd\")");
    EXPECT_THAT(loadError(), HasSubstr("outside of the folder"));
    fs::create_symlink(folder_ / "outside.mof", folder_ / "schema/link.inc");
    write("a.mof", "#pragma include (\"link.inc\")");
    EXPECT_THAT(loadError(), HasSubstr("outside of the folder"));
    EXPECT_EQ(repository.find(nameSpace, "Outside"), nullptr);
}

TEST_F(MofFilesTest, Errors_name_the_file) {
    write("bad.mof", "class X {}\n");
    EXPECT_THAT(loadError(), HasSubstr("bad.mof:2:1: \";\" is expected"));
    write("bad.mof", "#pragma include (\"sub\")");
    EXPECT_THAT(loadError(), HasSubstr("bad.mof:1:1: cannot include \"sub\""));
    EXPECT_THROW(loadMofFolder(folder_ / "none", nameSpace, repository), SchemaError);
    EXPECT_THROW(loadMofFile(folder_ / "none.mof", nameSpace, repository), SchemaError);
}

TEST_F(MofFilesTest, The_schema_that_comes_with_the_host_is_sound) {
    loadMofFolder(QELO_SCHEMA_DIRECTORY, nameSpace, repository);
    EXPECT_EQ(names("", true).size(), 28U);
    EXPECT_TRUE(repository.isA(nameSpace, "ZANTH_Account", "CIM_EnabledLogicalElement"));
    EXPECT_TRUE(known("CIM_HostedService").isAssociation());
    EXPECT_TRUE(known("CIM_Service").isAbstract());
    EXPECT_FALSE(known("ZANTH_AccountManagementService").isAbstract());
    EXPECT_EQ(property("ZANTH_Account", "EnabledState").defaultValue.asUnsigned(), 5U);
    const cim::MethodDeclaration* create = known("ZANTH_Account").method("CreateUser");
    ASSERT_NE(create, nullptr);
    EXPECT_TRUE(cim::hasFlag(create->qualifiers, "Static"));
    EXPECT_EQ(create->parameters.size(), 8U);
}

} // namespace
} // namespace qelo::schema::testing
