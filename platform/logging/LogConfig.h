// The configuration of the log and the trace, and its text form.
//
// The text has one setting a line; a line whose first character is '#' is a comment:
//
//   log = syslog                          where the log goes: syslog, stderr, none
//   trace = file:/var/log/qelosim.trace   or a file, given by its absolute path
//   trace.buffer = off                    lines of a file are not gathered, but written at once
//   log.level = 6000                      lowest level admitted, of every component
//   log.level.Corvane.SimAccountObj = 3000    ... of this one and of those below it
//   trace.level = off                     admits nothing
//
// A setting given twice has the later value. What is not given keeps its default: the log
// goes to syslog and admits 6000 and above, the trace goes nowhere and admits nothing.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::logging {

// A level that is compared with a message's. Wider than a message's level, so that one value
// lies above all of those.
using Threshold = std::int64_t;

constexpr Threshold kAdmitsNothing = INT64_MAX;

// Levels of failures, by which the log is limited unless told otherwise.
constexpr int kFailureLevel = 6000;

enum class SinkKind { None, Syslog, Stderr, File };

struct SinkTarget {
    SinkKind kind = SinkKind::None;
    std::string path;     // of a file
    bool buffered = true; // whether lines of a file are gathered for a moment
};

inline bool operator==(const SinkTarget& left, const SinkTarget& right) {
    return left.kind == right.kind && left.path == right.path && left.buffered == right.buffered;
}

// Thresholds per component. A component without one of its own has that of the component
// named by its text up to the last dot, and so on up to the root's.
class Thresholds {
public:
    explicit Thresholds(Threshold root) : root_(root) {}

    // Sets the threshold of `component`; the empty name is the root. False, and nothing is
    // set, where there are too many already.
    bool set(std::string_view component, Threshold threshold);

    Threshold of(std::string_view component) const;

    // The lowest that any component has.
    Threshold lowest() const;

private:
    Threshold root_;
    std::map<std::string, Threshold, std::less<>> components_;
};

// One of the two kinds of lines.
enum class Channel { Log, Trace };

constexpr std::size_t kChannels = 2;

struct ChannelConfig {
    SinkTarget target;
    Thresholds thresholds;

    // The threshold that counts: nothing is admitted to a channel that goes nowhere.
    Threshold thresholdOf(std::string_view component) const;
    Threshold lowestThreshold() const;
};

struct Problem {
    std::size_t line; // counted from 1; 0 for the file as a whole
    std::string text;
};

struct LogConfig {
    std::array<ChannelConfig, kChannels> channels{
        ChannelConfig{{SinkKind::Syslog, {}}, Thresholds(kFailureLevel)},
        ChannelConfig{{SinkKind::None, {}}, Thresholds(kAdmitsNothing)}};

    // What could not be understood, and was ignored. Holds a bounded number of entries.
    std::vector<Problem> problems;

    ChannelConfig& of(Channel channel) { return channels[static_cast<std::size_t>(channel)]; }
    const ChannelConfig& of(Channel channel) const {
        return channels[static_cast<std::size_t>(channel)];
    }
};

// Reads a configuration; takes any bytes. Pure, for any thread. Throws std::bad_alloc only.
LogConfig parseConfig(std::string_view text);

} // namespace qelo::logging
