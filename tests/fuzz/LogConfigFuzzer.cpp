// Logging configurations: whatever the file holds, there is a configuration, and the problems
// told have bounds and a line.
#include "FuzzInput.h"

#include <logging/LogConfig.h>

#include <algorithm>

namespace {

using namespace qelo::logging;
using qelo::fuzz::require;

void checkTarget(const SinkTarget& target, std::string_view text) {
    if (target.kind != SinkKind::File) {
        require(target.path.empty());
        return;
    }
    require(target.path.size() > 1 && target.path.front() == '/' && target.path.back() != '/');
    require(std::none_of(target.path.begin(), target.path.end(),
                         [](char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7f; }));
    require(qelo::fuzz::contains(text, "file:" + target.path));
}

void checkProblems(const std::vector<Problem>& problems, std::string_view text) {
    const auto lines = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n')) + 1;
    require(problems.size() <= 21);
    std::size_t last = 0;
    for (const Problem& problem : problems) {
        require(!problem.text.empty() && problem.text.size() < 200);
        if (&problem == &problems.back() && problem.line == 0) {
            require(problems.size() == 21);
            continue;
        }
        require(problem.line > last && problem.line <= lines);
        last = problem.line;
    }
}

void checkThresholds(const ChannelConfig& channel, std::string_view component) {
    const Threshold threshold = channel.thresholdOf(component);
    require(threshold >= 0 && threshold >= channel.lowestThreshold());
    require(channel.target.kind != SinkKind::None || threshold == kAdmitsNothing);
    require(channel.thresholdOf({}) >= channel.lowestThreshold());
}

// Settings behind damage count all the same, and the later of two does.
void checkLastLine(std::string_view text) {
    const LogConfig config = parseConfig(std::string(text) + "\nlog = stderr\nlog.level = 5\n"
                                                             "trace=file:/t\ntrace.level=off");
    require(config.of(Channel::Log).target.kind == SinkKind::Stderr);
    require(config.of(Channel::Log).thresholds.of({}) == 5);
    require(config.of(Channel::Trace).target.kind == SinkKind::File);
    require(config.of(Channel::Trace).target.path == "/t");
    require(config.of(Channel::Trace).thresholdOf({}) == kAdmitsNothing);
}

// Two channels in one file have one buffer.
void checkSharedFile(const LogConfig& config) {
    const SinkTarget& log = config.of(Channel::Log).target;
    const SinkTarget& trace = config.of(Channel::Trace).target;
    require(log.kind != SinkKind::File || trace.kind != SinkKind::File || log.path != trace.path ||
            log.buffered == trace.buffered);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    const LogConfig config = parseConfig(text);
    for (const ChannelConfig& channel : config.channels) {
        checkTarget(channel.target, text);
        checkThresholds(channel, "Corvane.SimAccountObj");
        checkThresholds(channel, text.substr(0, 100));
    }
    checkProblems(config.problems, text);
    checkSharedFile(config);
    checkLastLine(text);
    return 0;
}
