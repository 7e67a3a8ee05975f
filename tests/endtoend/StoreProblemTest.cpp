#include "Qelosim.h"

#include <unistd.h>

namespace qelo::endtoend {
namespace {

constexpr int kNoInput = 66;

// The error of a command that must fail, without the program's name.
std::string problemWith(const std::string& store) {
    const Finished finished = qelosim({"accounts", "--store", store});
    EXPECT_EQ(finished.status, kNoInput) << store;
    EXPECT_EQ(finished.out, "");
    EXPECT_EQ(finished.err.find("qelosim: "), 0U);
    EXPECT_EQ(finished.err.find('\n'), finished.err.size() - 1);
    return finished.err.substr(9);
}

TEST(StoreProblem, A_root_directory_without_accounts_is_reported) {
    const Scratch scratch;
    EXPECT_EQ(problemWith("accounts:" + scratch.path()),
              "cannot read " + scratch.path("etc/passwd") + ": No such file or directory\n");
}

TEST(StoreProblem, A_node_file_that_does_not_exist_is_reported) {
    const Scratch scratch;
    EXPECT_EQ(problemWith("file:" + scratch.path("x.json")),
              "cannot read " + scratch.path("x.json") + ": No such file or directory\n");
}

TEST(StoreProblem, A_node_file_that_is_not_JSON_is_reported) {
    const Scratch scratch;
    for (const char* content : {"", "{", "{\"nodes\": [}", "nodes", "{\"nodes\": []}{}"}) {
        const std::string problem = problemWith("file:" + scratch.write("x.json", content));
        EXPECT_EQ(problem.find("node file " + scratch.path("x.json") + " refused: "), 0U);
        EXPECT_NE(problem.find(": not JSON in UTF-8 at byte "), std::string::npos) << problem;
    }
}

TEST(StoreProblem, A_node_file_of_another_shape_is_reported_with_the_place) {
    const Scratch scratch;
    const std::pair<const char*, const char*> cases[] = {
        {"{}", "document: \"nodes\" is missing"},
        {"[]", "document: an object is needed, not a list"},
        {R"({"accounts": []})", "document: unknown member \"accounts\""},
        {R"({"nodes": {}})", "document: \"nodes\" has to be a list, not an object"},
        {R"({"nodes": [{"path": "/a"}]})", "node 0 \"/a\": \"type\" is missing"},
        {R"({"nodes": [{"type": 46, "path": "/a", "properties": {"Name": "x"}}]})",
         "node 0 \"/a\": a property is named by a decimal number, not \"Name\""},
    };
    for (const auto& [content, reason] : cases) {
        EXPECT_EQ(problemWith("file:" + scratch.write("x.json", content)),
                  "node file " + scratch.path("x.json") + " refused: " + reason + "\n");
    }
}

TEST(StoreProblem, A_store_of_an_unknown_kind_in_the_environment_is_reported) {
    const Finished finished = runProcess(qelosimCommand({}), {{"QELO_NODE_STORE", "accounts"}});
    EXPECT_EQ(finished.status, kNoInput);
    EXPECT_EQ(finished.err, "qelosim: QELO_NODE_STORE: \"accounts\" is neither accounts:DIR nor "
                            "file:PATH\n");
}

TEST(StoreProblem, A_directory_is_no_node_file) {
    const Scratch scratch;
    EXPECT_EQ(problemWith("file:" + scratch.path()), scratch.path() + " is not a file\n");
}

TEST(StoreProblem, A_database_that_may_not_be_read_is_reported) {
    if (geteuid() == 0) {
        GTEST_SKIP() << "root may read every file";
    }
    const Scratch scratch;
    const std::string passwd = scratch.write("etc/passwd", "root:x:0:0::/:/bin/sh\n");
    std::filesystem::permissions(passwd, std::filesystem::perms::none);
    EXPECT_EQ(problemWith("accounts:" + scratch.path()),
              "cannot read " + passwd + ": Permission denied\n");
}

TEST(StoreProblem, A_store_in_the_environment_is_tested_too) {
    const Finished finished =
        runProcess(qelosimCommand({}), {{"QELO_NODE_STORE", "file:/nonexistent/x.json"}});
    EXPECT_EQ(finished.status, kNoInput);
    EXPECT_EQ(finished.err,
              "qelosim: cannot read /nonexistent/x.json: No such file or directory\n");
}

TEST(StoreProblem, A_directory_without_providers_is_reported) {
    const Scratch scratch;
    scratch.write("etc/passwd", "root:x:0:0::/:/bin/sh\n");
    const Finished finished = qelosim(
        {"accounts", "--store", "accounts:" + scratch.path(), "--provider-dir", scratch.path()});
    EXPECT_EQ(finished.status, 1);
    EXPECT_EQ(finished.out, "");
    EXPECT_EQ(finished.err.find('\n'), finished.err.size() - 1);
    EXPECT_NE(finished.err.find(scratch.path()), std::string::npos) << finished.err;
}

} // namespace
} // namespace qelo::endtoend
