#include "RecordingOutput.h"

#include <cli/render/Display.h>
#include <cli/render/Table.h>

#include <gtest/gtest.h>

#include <sstream>

namespace qelo::cli {
namespace {

Table sample() {
    Table table({{"NAME", Align::Left, false},
                 {"NUMBER", Align::Right, false},
                 {"TEXT", Align::Left, true},
                 {"MORE", Align::Left, true}});
    table.addRow({{"alice"}, {"7"}, {"a rather long text without any meaning"}, {"x"}});
    table.addRow({{"bob"}, {"123456789"}, {"日本語のとても長い名前です、本当に"}, {"/usr/bin/y"}});
    return table;
}

std::vector<std::string> linesOf(const Table& table, std::size_t columns) {
    RecordingOutput output;
    output.becomeTerminal(columns);
    table.write(output);
    std::vector<std::string> lines;
    std::istringstream stream(output.text());
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

TEST(Table, Columns_are_as_wide_as_their_widest_text) {
    RecordingOutput output;
    Table table({{"A", Align::Left, false}, {"B", Align::Right, false}, {"C", Align::Left, false}});
    table.addRow({{"long"}, {"1"}, {"x"}});
    table.addRow({{""}, {"100"}, {""}});
    table.write(output);
    EXPECT_EQ(output.text(), "A       B  C\n"
                             "long    1  x\n"
                             "      100\n");
}

TEST(Table, Texts_are_made_displayable) {
    RecordingOutput output;
    Table table({{"A", Align::Left, false}});
    table.addRow({{"a\nb"}});
    table.write(output);
    EXPECT_EQ(output.text(), "A\na\\nb\n");
}

TEST(Table, No_line_exceeds_a_terminal_of_any_width) {
    const Table table = sample();
    for (std::size_t columns = 1; columns < 120; ++columns) {
        for (const std::string& line : linesOf(table, columns)) {
            EXPECT_LE(displayWidth(line), columns) << line;
        }
    }
}

TEST(Table, Flexible_columns_give_way_first_and_the_widest_before_the_others) {
    const auto lines = linesOf(sample(), 50);
    EXPECT_EQ(lines.at(1), "alice          7  a rather long text …  x");
    EXPECT_EQ(lines.at(2), "bob    123456789  日本語のとても長い…   /usr/bin/y");
}

TEST(Table, Where_everything_fits_nothing_is_clipped) {
    for (const std::size_t columns : {std::size_t{0}, std::size_t{200}}) {
        for (const std::string& line : linesOf(sample(), columns)) {
            EXPECT_EQ(line.find("…"), std::string::npos);
        }
    }
}

TEST(Table, A_line_ends_with_its_last_text) {
    for (const std::string& line : linesOf(sample(), 60)) {
        EXPECT_NE(line.back(), ' ');
    }
}

TEST(Table, Emphasis_is_written_where_colours_are_welcome_only) {
    Table table({{"A", Align::Left, false}, {"B", Align::Left, false}});
    table.addRow({{"x", Emphasis::Alert}, {"y", Emphasis::Faint}});
    RecordingOutput plain;
    plain.becomeTerminal(80);
    table.write(plain);
    EXPECT_EQ(plain.text(), "A  B\nx  y\n");
    RecordingOutput coloured;
    coloured.becomeTerminal(80, true);
    table.write(coloured);
    EXPECT_EQ(coloured.text(), "\x1b[1mA  B\x1b[0m\n\x1b[33mx\x1b[0m  \x1b[2my\x1b[0m\n");
}

TEST(Table, On_a_terminal_too_narrow_for_its_columns_no_escape_sequence_is_cut) {
    Table table({{"A", Align::Left, false}, {"B", Align::Left, false}});
    table.addRow({{"xx", Emphasis::Alert}, {"yy", Emphasis::Faint}});
    RecordingOutput output;
    output.becomeTerminal(3, true);
    table.write(output);
    EXPECT_EQ(output.text(), "\x1b[1mA …\x1b[0m\n… …\n");
}

TEST(Table, A_row_of_another_length_is_refused) {
    Table table({{"A", Align::Left, false}});
    EXPECT_THROW(table.addRow({{"x"}, {"y"}}), std::invalid_argument);
    EXPECT_TRUE(table.empty());
}

} // namespace
} // namespace qelo::cli
