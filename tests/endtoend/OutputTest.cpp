#include "Qelosim.h"

#include <fcntl.h>
#include <unistd.h>

namespace qelo::endtoend {
namespace {

constexpr int kOutputError = 74;
constexpr int kClosedPipe = 141;

using Output = AccountDatabase;

TEST_F(Output, A_reader_that_has_gone_ends_the_program_quietly) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    close(ends[0]);
    const Finished finished =
        runProcessInto(ends[1], qelosimCommand({"accounts", "--store", store()}));
    close(ends[1]);
    EXPECT_EQ(finished.status, kClosedPipe);
    EXPECT_EQ(finished.err, "");
}

TEST_F(Output, A_full_disk_is_reported) {
    const int full = open("/dev/full", O_WRONLY | O_CLOEXEC);
    ASSERT_GE(full, 0);
    for (const char* format : {"text", "json", "mof"}) {
        const Finished finished = runProcessInto(
            full, qelosimCommand({"accounts", "--store", store(), "--format", format}));
        EXPECT_EQ(finished.status, kOutputError);
        EXPECT_EQ(finished.err, "qelosim: cannot write the output: No space left on device\n");
    }
    close(full);
}

TEST_F(Output, A_closed_output_is_reported_and_hits_no_other_file) {
    const Finished finished = runProcessInto(-1, qelosimCommand({"accounts", "--store", store()}));
    EXPECT_EQ(finished.status, kOutputError);
    EXPECT_EQ(finished.err, "qelosim: cannot write the output: Bad file descriptor\n");
}

TEST_F(Output, Nothing_is_coloured_where_no_terminal_is) {
    EXPECT_EQ(run({"accounts"}).out.find('\x1b'), std::string::npos);
}

} // namespace
} // namespace qelo::endtoend
