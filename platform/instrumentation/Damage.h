// What is wrong with one file, gathered while it is read and told in one log line.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::nodes {

class Damage {
public:
    // `reason` is a literal. The content of a line is never kept: it may hold a hash. Of
    // several reasons for one line, given one after the other, the last is told.
    void add(std::size_t line, std::string_view reason);

    bool empty() const { return count_ == 0; }

    // "3 damaged lines: 4 (too few fields), 9 (name used before), ..." Only the first few
    // lines are told one by one.
    std::string text() const;

private:
    struct Line {
        std::size_t number;
        std::string_view reason;
    };
    std::vector<Line> first_;
    std::size_t count_ = 0;
    std::size_t last_ = 0;
};

} // namespace qelo::nodes
