#include "Damage.h"

namespace qelo::nodes {

namespace {

constexpr std::size_t linesTold = 10;

} // namespace

void Damage::add(std::size_t line, std::string_view reason) {
    const bool sameLine = count_ > 0 && line == last_;
    last_ = line;
    if (sameLine) {
        if (first_.back().number == line) {
            first_.back().reason = reason;
        }
        return;
    }
    if (first_.size() < linesTold) {
        first_.push_back({line, reason});
    }
    ++count_;
}

std::string Damage::text() const {
    std::string text =
        std::to_string(count_) + (count_ == 1 ? " damaged line:" : " damaged lines:");
    const char* separator = " ";
    for (const Line& line : first_) {
        text.append(separator).append(std::to_string(line.number));
        text.append(" (").append(line.reason).append(")");
        separator = ", ";
    }
    if (count_ > first_.size()) {
        text.append(" and ").append(std::to_string(count_ - first_.size())).append(" more");
    }
    return text;
}

} // namespace qelo::nodes
