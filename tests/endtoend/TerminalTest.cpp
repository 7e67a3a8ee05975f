#include "Terminal.h"
#include "Qelosim.h"

#include <sstream>

namespace qelo::endtoend {
namespace {

using Terminal = AccountDatabase;

// Characters of a line of this test's own data: Japanese ones take two columns.
std::size_t columnsOf(const std::string& line) {
    std::size_t columns = 0;
    for (std::size_t i = 0; i < line.size(); ++i) {
        const auto byte = static_cast<unsigned char>(line[i]);
        const bool isEllipsis = line.compare(i, 3, "…") == 0;
        if (byte < 0x80 || isEllipsis) {
            columns += 1;
        } else if (byte >= 0xE0) {
            columns += 2;
        }
    }
    return columns;
}

TEST_F(Terminal, A_table_fits_into_the_terminal_at_any_width) {
    const Variables plain = {{"NO_COLOR", "1"}, {"LC_ALL", "C.UTF-8"}};
    for (const std::size_t columns : {10U, 30U, 40U, 60U, 66U, 80U}) {
        const Finished finished =
            runOnTerminal(columns, qelosimCommand({"accounts", "--store", store()}), plain);
        EXPECT_EQ(finished.status, 0) << finished.err;
        std::istringstream lines(finished.out.substr(0, finished.out.find("\n\n")));
        int count = 0;
        for (std::string line; std::getline(lines, line); ++count) {
            EXPECT_LE(columnsOf(line), columns) << line;
        }
        EXPECT_EQ(count, 5);
        EXPECT_EQ(finished.out.find('\x1b'), std::string::npos);
    }
}

TEST_F(Terminal, Colours_are_shown_where_the_terminal_has_them) {
    const auto command = qelosimCommand({"accounts", "--store", store()});
    const Finished coloured = runOnTerminal(80, command, {{"TERM", "xterm"}, {"NO_COLOR", ""}});
    EXPECT_NE(coloured.out.find("\x1b[1mNAME"), std::string::npos);
    const Finished dumb = runOnTerminal(80, command, {{"TERM", "dumb"}, {"NO_COLOR", ""}});
    EXPECT_EQ(dumb.out.find('\x1b'), std::string::npos);
}

TEST_F(Terminal, Hostile_fields_send_nothing_to_it) {
    scratch.write("etc/passwd", "eve:x:0:0:\x1b]0;owned\x07\x1b[2J:/home/e:/bin/sh\n");
    for (const char* format : {"text", "json", "mof"}) {
        const Finished finished =
            runOnTerminal(200, qelosimCommand({"accounts", "--store", store(), "--format", format}),
                          {{"NO_COLOR", "1"}});
        EXPECT_NE(finished.out.find("owned"), std::string::npos);
        EXPECT_EQ(finished.out.find_first_of("\x1b\x07"), std::string::npos);
    }
}

} // namespace
} // namespace qelo::endtoend
