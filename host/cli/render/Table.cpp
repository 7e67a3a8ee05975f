#include "Table.h"

#include "Display.h"

#include <algorithm>
#include <numeric>
#include <stdexcept>
#include <utility>

namespace qelo::cli {
namespace {

constexpr std::size_t kGap = 2;         // blanks between columns
constexpr std::size_t kComfortable = 8; // flexible columns shrink to this before others do
constexpr std::string_view kBold = "\x1b[1m";
constexpr std::string_view kFaint = "\x1b[2m";
constexpr std::string_view kAlert = "\x1b[33m";
constexpr std::string_view kReset = "\x1b[0m";

std::string emphasised(std::string text, Emphasis emphasis, bool colours) {
    if (!colours || emphasis == Emphasis::None || text.empty()) {
        return text;
    }
    return std::string(emphasis == Emphasis::Faint ? kFaint : kAlert) + text + std::string(kReset);
}

std::size_t totalOf(const std::vector<std::size_t>& widths) {
    return std::accumulate(widths.begin(), widths.end(), std::size_t{0}) +
           kGap * (widths.size() - 1);
}

// Clips the candidates to the largest common width with which the table fits, or to `floor`.
template <typename IsCandidate>
void shrink(std::vector<std::size_t>& widths, std::size_t available, std::size_t floor,
            IsCandidate isCandidate) {
    std::size_t limit = *std::max_element(widths.begin(), widths.end());
    while (totalOf(widths) > available && limit > floor) {
        --limit;
        for (std::size_t i = 0; i < widths.size(); ++i) {
            widths[i] = isCandidate(i) ? std::min(widths[i], limit) : widths[i];
        }
    }
}

} // namespace

Cell::Cell(const std::string& content, Emphasis how) : text(displayText(content)), emphasis(how) {}

Table::Table(std::vector<Column> columns) : columns_(std::move(columns)) {
    for (const Column& column : columns_) {
        widths_.push_back(displayWidth(column.title));
    }
}

void Table::addRow(std::vector<Cell> cells) {
    if (cells.size() != columns_.size()) {
        throw std::invalid_argument("a table row with another number of cells than columns");
    }
    for (std::size_t i = 0; i < cells.size(); ++i) {
        widths_[i] = std::max(widths_[i], displayWidth(cells[i].text));
    }
    rows_.push_back(std::move(cells));
}

Table::Widths Table::fittedWidths(std::size_t available) const {
    Widths widths = widths_;
    if (available == 0) {
        return widths;
    }
    const auto isFlexible = [&](std::size_t i) { return columns_[i].flexible; };
    const auto isAny = [](std::size_t) { return true; };
    shrink(widths, available, kComfortable, isFlexible);
    shrink(widths, available, kComfortable, isAny);
    shrink(widths, available, 1, isAny);
    return widths;
}

std::string Table::line(const std::vector<Cell>& cells, const Widths& widths, bool colours) const {
    std::string result;
    std::size_t pending = 0; // blanks that are written only if something follows
    for (std::size_t i = 0; i < cells.size(); ++i) {
        std::string text = clippedTo(cells[i].text, widths[i]);
        const std::size_t used = std::min(displayWidth(text), widths[i]);
        const std::size_t padding = widths[i] - used;
        const bool right = columns_[i].align == Align::Right;
        if (!text.empty()) {
            result.append(pending + (right ? padding : 0), ' ');
            pending = right ? 0 : padding;
            result += emphasised(std::move(text), cells[i].emphasis, colours);
        } else {
            pending += padding;
        }
        pending += kGap;
    }
    return result;
}

void Table::write(Output& output) const {
    const Widths widths = fittedWidths(output.columns());
    const bool colours = output.hasColours();
    std::vector<Cell> titles;
    for (const Column& column : columns_) {
        titles.emplace_back(column.title);
    }
    // Narrower than one character for each column: nothing is left but to cut the lines.
    const bool cut = output.columns() != 0 && totalOf(widths) > output.columns();
    const auto write = [&](const std::vector<Cell>& cells, bool bold) {
        const std::string text = line(cells, widths, colours && !bold && !cut);
        const std::string shown = cut ? clippedTo(text, output.columns()) : text;
        output.write(bold && colours ? std::string(kBold) + shown + std::string(kReset) : shown);
        output.write("\n");
    };
    write(titles, true);
    for (const auto& row : rows_) {
        write(row, false);
    }
}

} // namespace qelo::cli
