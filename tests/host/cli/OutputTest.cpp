#include <cli/Output.h>

#include <gtest/gtest.h>

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <thread>
#include <unistd.h>

namespace qelo::cli {
namespace {

struct Pipe {
    Pipe() { EXPECT_EQ(pipe(ends), 0); }
    ~Pipe() {
        closeReader();
        closeWriter();
    }
    void closeReader() { closeEnd(ends[0]); }
    void closeWriter() { closeEnd(ends[1]); }
    std::string readAll() {
        std::string text;
        char buffer[4096];
        for (ssize_t got = 0; (got = read(ends[0], buffer, sizeof buffer)) > 0;) {
            text.append(buffer, static_cast<std::size_t>(got));
        }
        return text;
    }
    static void closeEnd(int& end) {
        if (end >= 0) {
            close(end);
            end = -1;
        }
    }
    int ends[2] = {-1, -1};
};

// Without this, writing to a closed pipe would end the test program.
class FileOutputTest : public ::testing::Test {
protected:
    void SetUp() override { previous_ = std::signal(SIGPIPE, SIG_IGN); }
    void TearDown() override { (void)std::signal(SIGPIPE, previous_); }

private:
    void (*previous_)(int) = SIG_DFL;
};

TEST_F(FileOutputTest, What_is_flushed_arrives_whole_and_in_order) {
    Pipe pipe;
    std::string expected;
    std::thread writer([&] {
        FileOutput output(pipe.ends[1]);
        for (int i = 0; i < 50000; ++i) {
            output.write(std::to_string(i) + "\n");
        }
        output.flush();
        pipe.closeWriter();
    });
    for (int i = 0; i < 50000; ++i) {
        expected += std::to_string(i) + "\n";
    }
    EXPECT_EQ(pipe.readAll(), expected);
    writer.join();
}

TEST_F(FileOutputTest, A_non_blocking_descriptor_is_waited_for) {
    Pipe pipe;
    ASSERT_EQ(fcntl(pipe.ends[1], F_SETFL, O_NONBLOCK), 0);
    const std::string expected(1 << 20, 'x');
    std::thread writer([&] {
        FileOutput output(pipe.ends[1]);
        output.write(expected);
        output.flush();
        pipe.closeWriter();
    });
    EXPECT_EQ(pipe.readAll().size(), expected.size());
    writer.join();
}

TEST_F(FileOutputTest, A_closed_pipe_is_a_reader_that_has_gone) {
    Pipe pipe;
    pipe.closeReader();
    FileOutput output(pipe.ends[1]);
    output.write("x");
    try {
        output.flush();
        FAIL() << "nothing was thrown";
    } catch (const OutputError& error) {
        EXPECT_TRUE(error.readerHasGone());
    }
}

TEST_F(FileOutputTest, A_full_disk_is_an_error_with_its_reason) {
    const int full = open("/dev/full", O_WRONLY);
    ASSERT_GE(full, 0);
    FileOutput output(full);
    output.write("x");
    try {
        output.flush();
        FAIL() << "nothing was thrown";
    } catch (const OutputError& error) {
        EXPECT_FALSE(error.readerHasGone());
        EXPECT_STREQ(error.what(), "No space left on device");
    }
    close(full);
}

TEST_F(FileOutputTest, What_could_not_be_written_is_not_tried_again) {
    const int full = open("/dev/full", O_WRONLY);
    FileOutput output(full);
    output.write("x");
    EXPECT_THROW(output.flush(), OutputError);
    EXPECT_NO_THROW(output.flush());
    close(full);
}

TEST_F(FileOutputTest, A_large_output_fails_while_it_is_written) {
    const int full = open("/dev/full", O_WRONLY);
    FileOutput output(full);
    EXPECT_THROW(
        {
            for (int i = 0; i < 100000; ++i) {
                output.write("0123456789");
            }
        },
        OutputError);
    close(full);
}

TEST_F(FileOutputTest, A_descriptor_that_is_not_writable_is_an_error) {
    const int readOnly = open("/dev/null", O_RDONLY);
    FileOutput output(readOnly);
    output.write("x");
    EXPECT_THROW(output.flush(), OutputError);
    close(readOnly);
}

TEST_F(FileOutputTest, A_pipe_has_no_width_and_no_colours) {
    Pipe pipe;
    const FileOutput output(pipe.ends[1]);
    EXPECT_EQ(output.columns(), 0U);
    EXPECT_FALSE(output.hasColours());
}

} // namespace
} // namespace qelo::cli
