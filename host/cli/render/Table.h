// A table of texts in aligned columns under a line of titles.
#pragma once

#include "../Output.h"

#include <cstddef>
#include <string>
#include <vector>

namespace qelo::cli {

enum class Align { Left, Right };
enum class Emphasis { None, Faint, Alert };

struct Column {
    std::string title;
    Align align = Align::Left;
    // Whether this column gives way first where the terminal is too narrow.
    bool flexible = false;
};

struct Cell {
    Cell(const std::string& content = {},
         Emphasis how = Emphasis::None); // NOLINT: a text is a cell
    std::string text;                    // displayable
    Emphasis emphasis;
};

class Table {
public:
    explicit Table(std::vector<Column> columns);

    // One cell for each column. The texts may be anything; they are made displayable here.
    void addRow(std::vector<Cell> cells);

    bool empty() const { return rows_.empty(); }
    std::size_t rows() const { return rows_.size(); }

    // On a terminal no line is wider than it: cells are clipped, flexible columns first,
    // the widest one at a time. Elsewhere every text is written whole.
    void write(Output& output) const;

private:
    using Widths = std::vector<std::size_t>;

    Widths fittedWidths(std::size_t available) const;
    std::string line(const std::vector<Cell>& cells, const Widths& widths, bool colours) const;

    std::vector<Column> columns_;
    Widths widths_;
    std::vector<std::vector<Cell>> rows_;
};

} // namespace qelo::cli
