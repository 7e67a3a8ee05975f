#include "ExpectationText.h"

#include <algorithm>
#include <iterator>
#include <sstream>
#include <stdexcept>

namespace qelo::test {

namespace {

constexpr std::size_t kWidth = 110;
constexpr const char* kIndent = "    ";
constexpr const char* kFurtherIndent = "        ";
constexpr const char* kArrow = " -> ";
constexpr const char* kGood = "good";
constexpr const char* kAny = "any";
constexpr const char* kSomewhere = "somewhere";

std::string joined(const std::vector<std::string>& texts) {
    std::string all;
    for (const std::string& text : texts) {
        all += (all.empty() ? "" : ", ") + text;
    }
    return all;
}

std::vector<std::string> split(const std::string& text) {
    std::vector<std::string> pieces;
    std::size_t from = 0;
    for (std::size_t to = text.find(", "); to != std::string::npos; to = text.find(", ", from)) {
        pieces.push_back(text.substr(from, to - from));
        from = to + 2;
    }
    pieces.push_back(text.substr(from));
    return pieces;
}

std::string rangeText(std::size_t first, std::size_t last) {
    const std::string begin = std::to_string(first);
    return first == last ? begin : begin + "-" + std::to_string(last);
}

// Breaks a line at blanks after commas, so that what follows is indented further.
std::string wrapped(const std::string& line) {
    std::string text;
    std::string rest = line;
    while (rest.size() > kWidth) {
        const std::size_t end = std::min(rest.find(kArrow), kWidth);
        const std::size_t comma = rest.rfind(", ", end);
        if (comma == std::string::npos || comma <= sizeof "        ") {
            break;
        }
        text += rest.substr(0, comma + 1) + "\n";
        rest = kFurtherIndent + rest.substr(comma + 2);
    }
    return text + rest + "\n";
}

// One line of an entry: the ways that lead to the same outcome, and the calls.
using Line = std::pair<std::string, std::string>;

// What one call leads to, by way.
using OfCall = std::map<std::string, std::set<std::string>>;

// A text that tells it for all ways, if there is one.
std::string commonText(const OfCall& byWay) {
    std::set<std::string> common = byWay.begin()->second;
    for (const auto& entry : byWay) {
        std::set<std::string> both;
        std::set_intersection(common.begin(), common.end(), entry.second.begin(),
                              entry.second.end(), std::inserter(both, both.end()));
        common = std::move(both);
    }
    return common.empty() ? std::string() : *common.begin();
}

std::map<NthCall, OfCall> byCall(const OperationOutcomes& outcomes,
                                 const std::vector<std::string>& ways) {
    std::map<NthCall, OfCall> calls;
    for (const std::string& way : ways) {
        const auto found = outcomes.faulty.find(way);
        if (found != outcomes.faulty.end()) {
            for (const auto& [call, texts] : found->second) {
                calls[call][way] = texts;
            }
        }
    }
    return calls;
}

std::string waysText(const std::vector<std::string>& some, const std::vector<std::string>& all) {
    return some == all ? kAny : joined(some);
}

std::map<Line, std::set<NthCall>> linesOf(const OperationOutcomes& outcomes,
                                          const std::vector<std::string>& ways) {
    std::map<Line, std::set<NthCall>> lines;
    for (const auto& [call, byWay] : byCall(outcomes, ways)) {
        const std::string common = commonText(byWay);
        std::map<std::string, std::vector<std::string>> byText;
        for (const std::string& way : ways) {
            const auto found = byWay.find(way);
            if (found != byWay.end()) {
                const std::set<std::string>& texts = found->second;
                const std::string own = texts.empty() ? "?" : *texts.begin();
                byText[common.empty() ? own : common].push_back(way);
            }
        }
        for (const auto& [text, some] : byText) {
            lines[{waysText(some, ways), text}].insert(call);
        }
    }
    return lines;
}

std::string somewhereText(const OperationOutcomes& outcomes, const std::vector<std::string>& ways) {
    std::map<std::string, std::vector<std::string>> byText;
    for (const std::string& way : ways) {
        const auto found = outcomes.somewhere.find(way);
        if (found != outcomes.somewhere.end()) {
            for (const std::string& text : found->second) {
                byText[text].push_back(way);
            }
        }
    }
    std::set<std::string> lines;
    for (const auto& [text, some] : byText) {
        lines.insert(kIndent + waysText(some, ways) + ": " + kSomewhere + kArrow + text + "\n");
    }
    std::string all;
    for (const std::string& line : lines) {
        all += line;
    }
    return all;
}

// The entries of a file, line by line.
class Reader {
public:
    explicit Reader(const std::vector<std::string>& ways) : ways_(ways) {}

    void read(const std::string& text) {
        std::istringstream stream(text);
        for (std::string line; std::getline(stream, line);) {
            if (line.rfind(kFurtherIndent, 0) == 0) {
                pending_ += " " + line.substr(std::string(kFurtherIndent).size());
                continue;
            }
            take();
            if (line.rfind(kIndent, 0) == 0) {
                pending_ = line.substr(std::string(kIndent).size());
                named_ = false;
            } else if (!line.empty() && line.front() != '#') {
                name(line);
            }
        }
        take();
    }

    std::map<std::string, OperationOutcomes> operations;

private:
    void name(const std::string& operation) {
        if (!named_) {
            current_.clear();
        }
        named_ = true;
        current_.push_back(operation);
        operations[operation];
    }

    void take() {
        if (pending_.empty()) {
            return;
        }
        const std::string line = std::move(pending_);
        pending_.clear();
        const std::size_t colon = line.find(": ");
        if (colon == std::string::npos || current_.empty()) {
            throw std::runtime_error("cannot be read: " + line);
        }
        const std::string head = line.substr(0, colon);
        for (const std::string& operation : current_) {
            if (head == kGood) {
                operations[operation].good = line.substr(colon + 2);
            } else {
                state(operations[operation], head, line.substr(colon + 2));
            }
        }
    }

    void state(OperationOutcomes& outcomes, const std::string& head, const std::string& rest) {
        const std::size_t arrow = rest.find(kArrow);
        if (arrow == std::string::npos) {
            throw std::runtime_error("has no outcome: " + rest);
        }
        const std::string text = rest.substr(arrow + std::string(kArrow).size());
        const std::string calls = rest.substr(0, arrow);
        for (const std::string& way : head == kAny ? ways_ : split(head)) {
            if (calls == kSomewhere) {
                outcomes.somewhere[way].insert(text);
                continue;
            }
            for (const NthCall& call : callsOf(calls)) {
                if (!outcomes.faulty[way][call].insert(text).second ||
                    outcomes.faulty[way][call].size() > 1) {
                    throw std::runtime_error("is stated twice: " + rest);
                }
            }
        }
    }

    const std::vector<std::string>& ways_;
    std::string pending_;
    std::vector<std::string> current_;
    bool named_ = false;
};

} // namespace

std::string callsText(const std::set<NthCall>& calls) {
    std::vector<std::string> pieces;
    for (auto call = calls.begin(); call != calls.end();) {
        const std::string kind = call->first;
        std::string ranges;
        while (call != calls.end() && call->first == kind) {
            const std::size_t first = call->second;
            std::size_t last = first;
            for (++call; call != calls.end() && *call == NthCall(kind, last + 1); ++call) {
                ++last;
            }
            ranges += (ranges.empty() ? "" : "/") + rangeText(first, last);
        }
        pieces.push_back(kind + " " + ranges);
    }
    return joined(pieces);
}

std::set<NthCall> callsOf(const std::string& text) {
    std::set<NthCall> calls;
    for (const std::string& piece : split(text)) {
        const std::size_t blank = piece.rfind(' ');
        if (blank == std::string::npos) {
            throw std::runtime_error("names no call: " + piece);
        }
        std::istringstream ranges(piece.substr(blank + 1));
        for (std::string range; std::getline(ranges, range, '/');) {
            const std::size_t dash = range.find('-');
            const std::size_t first = std::stoul(range);
            const std::size_t last =
                dash == std::string::npos ? first : std::stoul(range.substr(dash + 1));
            for (std::size_t n = first; n <= last; ++n) {
                calls.insert({piece.substr(0, blank), n});
            }
        }
    }
    return calls;
}

std::string bodyText(const OperationOutcomes& outcomes, const std::vector<std::string>& ways) {
    std::string text = kIndent + std::string(kGood) + ": " + outcomes.good + "\n";
    for (const auto& [line, calls] : linesOf(outcomes, ways)) {
        text += wrapped(kIndent + line.first + ": " + callsText(calls) + kArrow + line.second);
    }
    return text + somewhereText(outcomes, ways);
}

std::map<std::string, OperationOutcomes> parsed(const std::string& text,
                                                const std::vector<std::string>& ways) {
    Reader reader(ways);
    reader.read(text);
    return std::move(reader.operations);
}

} // namespace qelo::test
