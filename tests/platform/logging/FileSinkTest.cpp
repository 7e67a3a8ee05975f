#include "Scratch.h"

#include "logging/Output.h"

#include <gmock/gmock.h>

#include <csignal>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using namespace qelo::logging;
using namespace qelo::test;
using testing::AllOf;
using testing::Each;
using testing::ElementsAre;
using testing::EndsWith;
using testing::MatchesRegex;
using testing::SizeIs;

constexpr auto kLongerThanTheCheckInterval = std::chrono::milliseconds(1100);

// Levels of lines that wait to be written, and of those that do not.
constexpr int kProgress = 3000;
constexpr int kFailure = 6000;

SinkTarget fileAt(const std::string& path) { return {SinkKind::File, path}; }

SinkTarget unbufferedFileAt(const std::string& path) { return {SinkKind::File, path, false}; }

// The texts behind the times of a file's lines.
std::vector<std::string> textsOf(const std::string& path) {
    std::vector<std::string> texts;
    for (const std::string& line : linesOf(path)) {
        texts.push_back(line.substr(std::min(line.size(), line.find(' ') + 1)));
    }
    return texts;
}

// Waits for a file to have so many lines; false after ten seconds.
bool awaitLines(const std::string& path, std::size_t count) {
    for (int i = 0; i < 1000 && linesOf(path).size() < count; ++i) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return linesOf(path).size() == count;
}

template <class Body> int exitStatusOfChild(Body body) {
    const pid_t child = ::fork();
    if (child == 0) {
        body();
    }
    int status = -1;
    ::waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

class FileSinkTest : public testing::Test {
protected:
    // Gives the reason the line could not be written; an empty text where it was.
    static std::string tryWrite(const std::string& path) {
        return Output(fileAt(path)).write(6000, "line").value_or("");
    }

    Scratch scratch;
    const std::string path = scratch.at("log");
};

TEST_F(FileSinkTest, A_line_begins_with_its_time_in_ISO_form_with_milliseconds_and_zone) {
    ASSERT_EQ(tryWrite(path), "");
    EXPECT_THAT(readFile(path),
                MatchesRegex("[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9]{2}:[0-9]{2}:[0-9]{2}[.][0-9]{3}"
                             "[+-][0-9]{2}:[0-9]{2} line\n"));
}

TEST_F(FileSinkTest, A_new_file_is_for_its_owner_only_whatever_the_umask) {
    const mode_t before = ::umask(0);
    const std::string failure = tryWrite(path);
    ::umask(before);
    ASSERT_EQ(failure, "");
    struct stat status {};
    ASSERT_EQ(::stat(path.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777U, 0600U);
}

TEST_F(FileSinkTest, Lines_are_added_to_what_the_file_holds) {
    std::ofstream(path) << "earlier\n";
    ASSERT_EQ(tryWrite(path), "");
    ASSERT_THAT(linesOf(path), SizeIs(2));
    EXPECT_EQ(linesOf(path)[0], "earlier");
}

TEST_F(FileSinkTest, A_symbolic_link_is_not_followed) {
    std::ofstream(scratch.at("target")) << "";
    ASSERT_EQ(::symlink(scratch.at("target").c_str(), path.c_str()), 0);
    EXPECT_NE(tryWrite(path), "");
    EXPECT_EQ(readFile(scratch.at("target")), "");
}

TEST_F(FileSinkTest, A_file_with_a_second_name_is_refused) {
    std::ofstream(scratch.at("target")) << "";
    ASSERT_EQ(::link(scratch.at("target").c_str(), path.c_str()), 0);
    EXPECT_NE(tryWrite(path), "");
    EXPECT_EQ(readFile(scratch.at("target")), "");
}

TEST_F(FileSinkTest, A_FIFO_neither_blocks_nor_is_written_to) {
    ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
    EXPECT_NE(tryWrite(path), "");
    const int reader = ::open(path.c_str(), O_RDONLY | O_NONBLOCK);
    ASSERT_GE(reader, 0);
    EXPECT_NE(tryWrite(path), "");
    char byte = 0;
    EXPECT_EQ(::read(reader, &byte, 1), 0);
    ::close(reader);
}

TEST_F(FileSinkTest, A_directory_in_the_place_of_the_file_is_a_failure) {
    std::filesystem::create_directory(path);
    EXPECT_NE(tryWrite(path), "");
}

TEST_F(FileSinkTest, A_full_disk_is_told_once_and_nothing_is_thrown) {
    Output output(fileAt("/dev/full"));
    EXPECT_EQ(output.write(6000, "line"), "No space left on device");
    EXPECT_EQ(output.write(6000, "line"), std::nullopt);
}

TEST_F(FileSinkTest, A_failure_ends_when_its_cause_does_and_a_later_one_is_told_again) {
    const std::string below = scratch.at("later/log");
    Output output(fileAt(below));
    EXPECT_EQ(output.write(6000, "lost"), "No such file or directory");
    std::filesystem::create_directory(scratch.at("later"));
    std::this_thread::sleep_for(kLongerThanTheCheckInterval);
    EXPECT_EQ(output.write(6000, "kept"), std::nullopt);
    EXPECT_THAT(readFile(below), EndsWith(" kept\n"));
    std::filesystem::remove_all(scratch.at("later"));
    std::this_thread::sleep_for(kLongerThanTheCheckInterval);
    EXPECT_EQ(output.write(6000, "lost"), "No such file or directory");
}

TEST_F(FileSinkTest, A_file_that_was_moved_away_is_created_anew_within_a_second) {
    Output output(fileAt(path));
    ASSERT_EQ(output.write(6000, "first"), std::nullopt);
    std::filesystem::rename(path, scratch.at("log.1"));
    std::this_thread::sleep_for(kLongerThanTheCheckInterval);
    ASSERT_EQ(output.write(6000, "second"), std::nullopt);
    EXPECT_THAT(readFile(scratch.at("log.1")), EndsWith(" first\n"));
    EXPECT_THAT(readFile(path), EndsWith(" second\n"));
}

void setFileSizeLimit(rlim_t bytes) {
    rlimit limit{};
    ::getrlimit(RLIMIT_FSIZE, &limit);
    limit.rlim_cur = bytes;
    ::setrlimit(RLIMIT_FSIZE, &limit);
}

TEST_F(FileSinkTest, A_line_cut_by_a_full_disk_does_not_run_into_the_next_one) {
    (void)std::signal(SIGXFSZ, SIG_IGN);
    Output output(fileAt(path));
    setFileSizeLimit(20);
    const auto failure = output.write(6000, "cut");
    setFileSizeLimit(RLIM_INFINITY);
    (void)std::signal(SIGXFSZ, SIG_DFL);
    EXPECT_NE(failure, std::nullopt);
    EXPECT_EQ(output.write(6000, "whole"), std::nullopt);
    const auto lines = linesOf(path);
    ASSERT_THAT(lines, SizeIs(2));
    EXPECT_THAT(lines[0], SizeIs(20));
    EXPECT_THAT(lines[1], EndsWith(" whole"));
}

TEST_F(FileSinkTest, Lines_of_several_processes_stay_whole) {
    constexpr int processes = 4;
    constexpr int lines = 300;
    for (int process = 0; process < processes; ++process) {
        if (::fork() == 0) {
            Output output(fileAt(path));
            const std::string text(5000, static_cast<char>('a' + process));
            for (int line = 0; line < lines; ++line) {
                output.write(6000, text);
            }
            ::_exit(0);
        }
    }
    for (int process = 0; process < processes; ++process) {
        ::wait(nullptr);
    }
    const auto found = linesOf(path);
    ASSERT_THAT(found, SizeIs(processes * lines));
    for (const std::string& line : found) {
        const std::string text = line.substr(std::min(line.size(), line.find(' ') + 1));
        ASSERT_EQ(text, std::string(5000, text.empty() ? '?' : text.front()));
    }
}

TEST_F(FileSinkTest, Gathered_lines_appear_though_no_other_follows) {
    Output output(fileAt(path));
    ASSERT_EQ(output.write(kProgress, "first"), std::nullopt);
    EXPECT_TRUE(awaitLines(path, 1));
    ASSERT_EQ(output.write(kProgress, "second"), std::nullopt);
    ASSERT_EQ(output.write(kProgress, "third"), std::nullopt);
    EXPECT_TRUE(awaitLines(path, 3));
    EXPECT_THAT(textsOf(path), ElementsAre("first", "second", "third"));
}

TEST_F(FileSinkTest, A_failure_is_written_at_once_behind_what_was_gathered) {
    Output output(fileAt(path));
    ASSERT_EQ(output.write(kProgress, "before"), std::nullopt);
    ASSERT_EQ(output.write(kFailure, "failure"), std::nullopt);
    EXPECT_THAT(textsOf(path), ElementsAre("before", "failure"));
}

TEST_F(FileSinkTest, More_lines_than_the_buffer_holds_lose_nothing) {
    constexpr int lines = 2000;
    {
        Output output(fileAt(path));
        for (int line = 0; line < lines; ++line) {
            ASSERT_EQ(output.write(kProgress, std::to_string(line) + std::string(100, '.')),
                      std::nullopt);
        }
    }
    const auto texts = textsOf(path);
    ASSERT_THAT(texts, SizeIs(lines));
    for (int line = 0; line < lines; ++line) {
        ASSERT_EQ(texts[static_cast<std::size_t>(line)],
                  std::to_string(line) + std::string(100, '.'));
    }
}

TEST_F(FileSinkTest, Without_a_buffer_a_process_that_ends_abruptly_loses_no_line) {
    const int status = exitStatusOfChild([&] {
        Output output(unbufferedFileAt(path));
        output.write(kProgress, "first");
        output.write(kProgress, "second");
        ::_exit(7);
    });
    EXPECT_EQ(status, 7);
    EXPECT_THAT(textsOf(path), ElementsAre("first", "second"));
}

TEST_F(FileSinkTest, A_child_process_does_not_repeat_what_its_parent_gathered) {
    Output output(fileAt(path));
    ASSERT_EQ(output.write(kProgress, "parent"), std::nullopt);
    const int status = exitStatusOfChild([&] {
        output.write(kProgress, "child");
        ::_exit(awaitLines(path, 2) ? 0 : 1);
    });
    EXPECT_EQ(status, 0);
    ASSERT_EQ(output.write(kFailure, "parent again"), std::nullopt);
    EXPECT_THAT(textsOf(path), ElementsAre("parent", "child", "parent again"));
}

TEST_F(FileSinkTest, Gathered_lines_that_could_not_be_written_are_told_with_the_next_one) {
    Output output(fileAt("/dev/full"));
    std::optional<std::string> told;
    for (int i = 0; i < 1000 && !told; ++i) {
        told = output.write(kProgress, "line");
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    EXPECT_EQ(told, "No space left on device");
}

TEST_F(FileSinkTest, Lines_gathered_before_their_file_was_moved_away_go_with_it) {
    Output output(fileAt(path));
    ASSERT_EQ(output.write(kFailure, "first"), std::nullopt);
    std::this_thread::sleep_for(kLongerThanTheCheckInterval);
    ASSERT_EQ(output.write(kProgress, "second"), std::nullopt);
    std::filesystem::rename(path, scratch.at("log.1"));
    std::this_thread::sleep_for(kLongerThanTheCheckInterval);
    ASSERT_EQ(output.write(kFailure, "third"), std::nullopt);
    EXPECT_THAT(textsOf(scratch.at("log.1")), ElementsAre("first", "second"));
    EXPECT_THAT(textsOf(path), ElementsAre("third"));
}

TEST_F(FileSinkTest, Threads_that_share_a_buffer_lose_nothing) {
    constexpr std::size_t threads = 4;
    constexpr std::size_t lines = 3000;
    {
        Output output(fileAt(path));
        std::vector<std::thread> writers;
        for (std::size_t writer = 0; writer < threads; ++writer) {
            writers.emplace_back([&] {
                for (std::size_t line = 0; line < lines; ++line) {
                    output.write(line % 100 == 0 ? kFailure : kProgress, "line");
                }
            });
        }
        for (std::thread& writer : writers) {
            writer.join();
        }
    }
    EXPECT_THAT(textsOf(path), AllOf(SizeIs(threads * lines), Each("line")));
}

TEST_F(FileSinkTest, An_output_that_goes_nowhere_takes_every_line) {
    EXPECT_EQ(Output({SinkKind::None, {}}).write(6000, "line"), std::nullopt);
}

TEST_F(FileSinkTest, Lines_for_standard_error_appear_there_and_not_on_standard_output) {
    testing::internal::CaptureStderr();
    testing::internal::CaptureStdout();
    Output({SinkKind::Stderr, {}}).write(6000, "to the terminal");
    EXPECT_THAT(testing::internal::GetCapturedStderr(), EndsWith(" to the terminal\n"));
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
}

TEST_F(FileSinkTest, A_system_without_a_system_log_loses_lines_quietly) {
    EXPECT_EQ(Output({SinkKind::Syslog, {}}).write(3000, "test line of the logging library"),
              std::nullopt);
}

} // namespace
