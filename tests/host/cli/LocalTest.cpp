// What the command line does with this machine itself, beside the object manager.
#include "Program.h"

#include <cli/local/GroupIds.h>
#include <cli/local/Refusals.h>
#include <cli/local/RootCommand.h>

#include <commands/AdminCommand.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace qelo::cli {
namespace {

namespace fs = std::filesystem;

// A scratch directory, and the environment variables that the store and the log look at.
class Local : public Program {
protected:
    Local() {
        std::string pattern = (fs::temp_directory_path() / "qelo-cli-XXXXXX").string();
        if (mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error("no scratch directory");
        }
        directory = pattern;
        setenv("QELO_NODE_STORE", ("accounts:" + directory.string()).c_str(), 1);
    }
    ~Local() override {
        unsetenv("QELO_NODE_STORE");
        std::error_code ignored;
        fs::remove_all(directory, ignored);
    }

    void write(const std::string& name, const std::string& content) const {
        fs::create_directories((directory / name).parent_path());
        std::ofstream(directory / name) << content;
    }

    fs::path directory;
};

using RootCommand = Local;

TEST_F(RootCommand, A_scratch_root_is_made_without_an_object_manager) {
    furtherCommands = {addRootCommand};
    const std::string root = (directory / "new").string();
    EXPECT_EQ(run({"init-root", root}), 0) << errors.text();
    EXPECT_EQ(output.text(), "made " + root + "; use it with --root " + root + "\n");
    EXPECT_TRUE(fs::is_regular_file(root + "/etc/passwd"));
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(RootCommand, An_existing_root_is_refused_and_stays_as_it_is) {
    furtherCommands = {addRootCommand};
    write("etc/passwd", "root:x:0:0::/:/bin/sh\n");
    EXPECT_EQ(run({"init-root", directory.string()}), ExitUsage);
    EXPECT_EQ(errors.text().find("qelosim: "), 0U);
    EXPECT_EQ(errors.text().find('\n'), errors.text().size() - 1);
    EXPECT_EQ(fs::file_size(directory / "etc/passwd"), 22U);
    EXPECT_EQ(output.text(), "");
}

TEST_F(RootCommand, The_directory_must_be_named) {
    furtherCommands = {addRootCommand};
    EXPECT_EQ(run({"init-root"}), ExitUsage);
    EXPECT_EQ(run({"init-root", ""}), ExitUsage);
}

using LocalGroupIds = Local;

TEST_F(LocalGroupIds, Are_those_of_the_group_file) {
    write("etc/group", "root:x:0:\nadm:x:4:root\ncrew:x:4294967294:\n");
    EXPECT_EQ(localGroupIds(), (std::map<std::string, std::string>{
                                   {"root", "0"}, {"adm", "4"}, {"crew", "4294967294"}}));
}

TEST_F(LocalGroupIds, Damaged_groups_have_none_and_the_first_of_a_name_counts) {
    write("etc/group", "adm:x:4:\nadm:x:5:\nbad:x:none:\n:x:7:\nlast:x:8:\n");
    const auto ids = localGroupIds();
    EXPECT_EQ(ids.at("adm"), "4");
    EXPECT_EQ(ids.at("last"), "8");
    EXPECT_EQ(ids.count("bad"), 0U);
    EXPECT_EQ(ids.count(""), 0U);
}

TEST_F(LocalGroupIds, A_store_that_cannot_be_read_throws) {
    EXPECT_THROW(localGroupIds(), std::runtime_error);
}

TEST_F(LocalGroupIds, They_are_shown_in_the_table_of_groups) {
    write("etc/group", "crew:x:77:\n");
    groupIds = localGroupIds;
    cim::Instance group(cim::ObjectPath("root/cimv2", "ZANTH_Group"));
    group.setProperty("Name", cim::Value::string("crew"));
    group.setProperty("GroupMembers", cim::Value::string(""));
    manager.instances = {group};
    EXPECT_EQ(run({"groups"}), 0) << errors.text();
    EXPECT_NE(output.text().find("77"), std::string::npos) << output.text();
}

using Refusals = Local;

TEST_F(Refusals, The_reason_of_the_last_refused_command_is_overheard) {
    const RefusalReason reason = overhearRefusals();
    const auto refused = store::executeAdminCommand(directory, "Nonsense");
    ASSERT_FALSE(refused.accepted);
    EXPECT_NE(reason(), "");
    EXPECT_EQ(reason(), refused.status);
    const auto other = store::executeAdminCommand(directory, "DeleteUser,Name:CMPI_string:nobody");
    EXPECT_EQ(reason(), other.status);
    EXPECT_NE(other.status, refused.status);
}

} // namespace
} // namespace qelo::cli
