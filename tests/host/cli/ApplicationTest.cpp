#include "Program.h"

#include <nlohmann/json.hpp>

#include <cerrno>
#include <new>

namespace qelo::cli {
namespace {

using Application = Program;

TEST_F(Application, An_error_of_the_object_manager_is_one_line_and_its_status_code) {
    manager.failWith(client::CimError(5, "no provider for class ZANTH_X"));
    EXPECT_EQ(run({"ei", "ZANTH_X"}), 5);
    EXPECT_EQ(errors.text(),
              "qelosim: ei: no provider for class ZANTH_X (CIM_ERR_INVALID_CLASS, 5)\n");
    EXPECT_EQ(output.text(), "");
}

TEST_F(Application, An_error_without_text_is_named_by_its_code) {
    manager.failWith(client::CimError(6, ""));
    EXPECT_EQ(run({"gi", "C.K=1"}), 6);
    EXPECT_EQ(errors.text(), "qelosim: gi: CIM_ERR_NOT_FOUND, 6\n");
}

TEST_F(Application, Every_code_of_CIM_is_the_exit_status) {
    for (unsigned int code = 1; code < 64; ++code) {
        manager.failWith(client::CimError(code, "x"));
        EXPECT_EQ(run({"accounts"}), static_cast<int>(code));
    }
}

TEST_F(Application, Other_codes_cannot_be_mistaken_for_success_or_usage) {
    for (const unsigned int code : {0U, 64U, 100U, 200U, 256U, 512U, 4294967295U}) {
        manager.failWith(client::CimError(code, "x"));
        EXPECT_EQ(run({"accounts"}), 1) << code;
    }
}

TEST_F(Application, A_message_of_several_lines_or_with_escapes_stays_one_harmless_line) {
    manager.failWith(client::CimError(1, "first\nsecond\x1b[31m\xff"));
    run({"accounts"});
    EXPECT_EQ(errors.text(),
              "qelosim: accounts: first\\nsecond\\x001B[31m\\xFF (CIM_ERR_FAILED, 1)\n");
}

TEST_F(Application, What_arrived_before_an_error_is_shown_and_json_stays_open) {
    manager.instances = {accountInstance("root", "", 0, 2)};
    manager.failWith(client::CimError(1, "lost"));
    EXPECT_EQ(run({"ei", "ZANTH_Account", "--json"}), 1);
    EXPECT_NE(output.text().find("\"root\""), std::string::npos);
    EXPECT_FALSE(nlohmann::json::accept(output.text()));
    EXPECT_GE(output.flushes(), 1);
}

TEST_F(Application, Unexpected_exceptions_are_internal_errors) {
    manager.failWith(std::runtime_error("surprise"));
    EXPECT_EQ(run({"accounts"}), ExitSoftware);
    EXPECT_EQ(errors.text(), "qelosim: accounts: surprise\n");
    manager.failWith(std::bad_alloc());
    EXPECT_EQ(run({"accounts"}), ExitSoftware);
    manager.failWith(42);
    EXPECT_EQ(run({"accounts"}), ExitSoftware);
    EXPECT_EQ(errors.text(), "qelosim: accounts: surprise\n"
                             "qelosim: out of memory\n"
                             "qelosim: accounts: unknown error\n");
}

TEST_F(Application, A_store_that_cannot_be_read_has_its_own_status) {
    manager.failWith(StoreError("cannot read /x: No such file or directory"));
    EXPECT_EQ(run({"accounts"}), ExitNoInput);
    EXPECT_EQ(errors.text(), "qelosim: cannot read /x: No such file or directory\n");
}

TEST_F(Application, A_reader_that_has_gone_ends_the_program_quietly) {
    output.failBehind(0, EPIPE);
    EXPECT_EQ(run({"accounts"}), ExitClosedPipe);
    EXPECT_EQ(errors.text(), "");
}

TEST_F(Application, A_full_disk_is_reported) {
    output.failBehind(0, ENOSPC);
    for (const char* format : {"text", "json", "mof"}) {
        manager.instances = {accountInstance("root", "", 0, 2)};
        EXPECT_EQ(run({"ei", "ZANTH_Account", "--format", format}), ExitOutput);
    }
    EXPECT_EQ(run({"--help"}), ExitOutput);
    EXPECT_NE(errors.text().find("qelosim: cannot write the output: No space left on device\n"),
              std::string::npos);
}

TEST_F(Application, Errors_that_cannot_be_written_change_nothing) {
    errors.failBehind(0, EPIPE);
    manager.failWith(client::CimError(6, "x"));
    EXPECT_EQ(run({"accounts"}), 6);
}

TEST_F(Application, What_is_no_command_line_is_a_usage_error_in_one_line) {
    const std::vector<std::vector<std::string>> wrong = {
        {"nonsense"},
        {"accounts", "extra"},
        {"--nonsense"},
        {"ei"},
        {"ei", "A", "B"},
        {"gi"},
        {"ein", ""},
        {"accounts", "--format"},
        {"accounts", "--format", "xml"},
        {"accounts", "--format", ""},
        {"accounts", "--json", "--format", "text"},
        {"accounts", "--store", "/etc"},
        {"accounts", "--store", "accounts:"},
        {"accounts", "--store", "file:"},
        {"accounts", "--namespace", ""},
        {"accounts", "--namespace", "a b"},
        {"accounts", "--namespace", "//h/a"},
        {"accounts", "groups"},
        {"ei", "ZANTH_Account", "--provider-dir"},
        {"ei", "ZANTH_Account", "--provider-dir", ""},
        {"\x1b[2J"},
        {"ei", "\n\x1b"},
        {""},
    };
    for (const auto& arguments : wrong) {
        errors = RecordingOutput();
        EXPECT_EQ(run(arguments), ExitUsage) << ::testing::PrintToString(arguments);
        EXPECT_EQ(errors.text().find("qelosim: "), 0U) << errors.text();
        EXPECT_EQ(errors.text().find('\n'), errors.text().size() - 1) << errors.text();
        EXPECT_EQ(errors.text().find('\x1b'), std::string::npos);
    }
    EXPECT_EQ(manager.connections, 0);
    EXPECT_EQ(output.text(), "");
}

TEST_F(Application, A_usage_error_points_to_the_help_that_tells_more) {
    run({"nonsense"});
    EXPECT_EQ(errors.text(), "qelosim: no such command: \"nonsense\" (see qelosim --help)\n");
    errors = RecordingOutput();
    run({"ei"});
    EXPECT_EQ(errors.text(), "qelosim: CLASS is required (see qelosim ei --help)\n");
}

TEST_F(Application, Common_options_may_stand_before_or_behind_the_command) {
    for (const auto& arguments : std::vector<std::vector<std::string>>{
             {"--store", "file:/tmp/x.json", "--provider-dir", "/a", "--provider-dir", "/b", "ei",
              "C"},
             {"ei", "--store", "file:/tmp/x.json", "--provider-dir", "/a", "--provider-dir", "/b",
              "C"},
             {"ei", "C", "--provider-dir=/a", "--provider-dir=/b", "--store=file:/tmp/x.json"}}) {
        EXPECT_EQ(run(arguments), 0) << errors.text();
        EXPECT_EQ(options().store, "file:/tmp/x.json");
        EXPECT_EQ(options().providerDirectories, std::vector<std::string>({"/a", "/b"}));
    }
}

TEST_F(Application, Help_names_every_command_and_the_exit_statuses) {
    EXPECT_EQ(run({"--help"}), 0);
    for (const char* word :
         {"accounts", "groups", "identity",    "ein", "ei",      "gi",          "ain",
          "ai",       "rin",    "ri",          "cm",  "--store", "--namespace", "--provider-dir",
          "--format", "--json", "Exit status", "64",  "66",      "70",          "74",
          "141"}) {
        EXPECT_NE(output.text().find(word), std::string::npos) << word;
    }
    EXPECT_EQ(manager.connections, 0);
    EXPECT_EQ(errors.text(), "");
}

TEST_F(Application, Each_command_has_its_own_help) {
    EXPECT_EQ(run({"ain", "--help"}), 0);
    EXPECT_NE(output.text().find("-ac"), std::string::npos);
    EXPECT_NE(output.text().find("--store"), std::string::npos);
    EXPECT_EQ(run({"cm", "--help"}), 0);
    EXPECT_NE(output.text().find("uint32"), std::string::npos);
}

TEST_F(Application, The_version_is_printed) {
    EXPECT_EQ(run({"--version"}), 0);
    EXPECT_EQ(output.text().find("qelosim "), 0U);
    EXPECT_EQ(output.text().back(), '\n');
}

} // namespace
} // namespace qelo::cli
