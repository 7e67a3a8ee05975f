#include "logging/LoggerCore.h"

#include "logging/SyslogSink.h"

#include <utility>

#include <pthread.h>

namespace qelo::logging {
namespace {

constexpr const char* kOwnComponent = "CvLogger";

// Writing a line is no place for a thread to be cancelled at: callers do not expect it, and the
// unwinding could not pass through them.
class CancellationPause {
public:
    CancellationPause() { ::pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &before_); }
    ~CancellationPause() { ::pthread_setcancelstate(before_, nullptr); }
    CancellationPause(const CancellationPause&) = delete;
    CancellationPause& operator=(const CancellationPause&) = delete;

private:
    int before_ = PTHREAD_CANCEL_ENABLE;
};

// A failure of this library's own, as a line.
std::string ownLine(const char* function, std::string_view message) {
    return formatLine({function, "LoggerCore", 0, kOwnComponent, kFailureLevel, message});
}

void tellSyslog(std::string_view line) {
    Output(SinkTarget{SinkKind::Syslog, {}}).write(kFailureLevel, line);
}

void tellLog(Output& log, std::string_view line) {
    if (log.write(kFailureLevel, line)) {
        tellSyslog(line);
    }
}

std::string nameOf(const SinkTarget& target) {
    switch (target.kind) {
    case SinkKind::File:
        return target.path;
    case SinkKind::Stderr:
        return "standard error";
    case SinkKind::Syslog:
        return "syslog";
    case SinkKind::None:
        break;
    }
    return "nowhere";
}

} // namespace

LoggerCore::LoggerCore(std::string configPath, Clock::duration checkInterval)
    : configPath_(std::move(configPath)), checkInterval_(checkInterval) {
    const CancellationPause pause;
    nextCheck_ = (Clock::now() + checkInterval_).time_since_epoch().count();
    stamp_ = FileStamp(configPath_.c_str());
    settled_ = stamp_.isSettled();
    lastRead_ = readConfigFile(configPath_.c_str());
    publish(makeState(lastRead_));
    reportProblems(*state());
}

std::shared_ptr<const LoggerCore::State> LoggerCore::state() const {
    const std::lock_guard lock(stateMutex_);
    return state_;
}

void LoggerCore::publish(std::shared_ptr<const State> state) {
    const std::lock_guard lock(stateMutex_);
    state_.swap(state);
    for (const Channel channel : {Channel::Log, Channel::Trace}) {
        lowest_[static_cast<std::size_t>(channel)].store(
            state_->config.of(channel).lowestThreshold(), std::memory_order_relaxed);
    }
    std::uint32_t next = generation_.load(std::memory_order_relaxed) + 1;
    generation_.store(next == 0 ? 1 : next, std::memory_order_release);
}

LoggerCore::Admission LoggerCore::admissionOf(std::string_view component) const {
    const std::lock_guard lock(stateMutex_);
    return {generation_.load(std::memory_order_relaxed),
            {state_->config.of(Channel::Log).thresholdOf(component),
             state_->config.of(Channel::Trace).thresholdOf(component)}};
}

void LoggerCore::refreshIfDue() {
    const Clock::rep now = Clock::now().time_since_epoch().count();
    Clock::rep due = nextCheck_.load(std::memory_order_relaxed);
    if (now < due || !nextCheck_.compare_exchange_strong(due, now + checkInterval_.count(),
                                                         std::memory_order_relaxed)) {
        return;
    }
    reload();
}

void LoggerCore::reload() {
    const CancellationPause pause;
    const std::lock_guard lock(reloadMutex_);
    const FileStamp stamp(configPath_.c_str());
    if (settled_ && stamp == stamp_) {
        return;
    }
    // The stamp is older than the text, so a change in between shows the next time.
    const bool settled = stamp.isSettled();
    ConfigText file = readConfigFile(configPath_.c_str());
    if (file.text != lastRead_.text || file.refusal != lastRead_.refusal) {
        const auto next = makeState(file);
        publish(next);
        lastRead_ = std::move(file);
        reportProblems(*next);
    }
    stamp_ = stamp;
    settled_ = settled;
}

std::shared_ptr<const LoggerCore::State> LoggerCore::makeState(const ConfigText& file) const {
    auto next = std::make_shared<State>();
    next->config = parseConfig(file.text);
    if (!file.refusal.empty()) {
        next->config.problems.push_back({0, "not read: " + file.refusal});
    }
    auto& [log, trace] = next->outputs;
    const SinkTarget& traceTarget = next->config.of(Channel::Trace).target;
    log = outputFor(next->config.of(Channel::Log).target, Channel::Log);
    trace = log->target() == traceTarget ? log : outputFor(traceTarget, Channel::Trace);
    return next;
}

std::shared_ptr<Output> LoggerCore::outputFor(const SinkTarget& target, Channel channel) const {
    const auto current = state();
    if (current != nullptr) {
        const auto& output = current->outputs[static_cast<std::size_t>(channel)];
        if (output->target() == target) {
            return output;
        }
    }
    return std::make_shared<Output>(target);
}

void LoggerCore::reportProblems(const State& state) const {
    Output& log = *state.outputs[static_cast<std::size_t>(Channel::Log)];
    for (const Problem& problem : state.config.problems) {
        std::string text = configPath_;
        if (problem.line > 0) {
            text += ":" + std::to_string(problem.line);
        }
        tellLog(log, ownLine("readConfiguration", text + ": " + problem.text));
    }
}

void LoggerCore::write(Channel channel, const Line& line) {
    const CancellationPause pause;
    const auto current = state();
    Output& output = *current->outputs[static_cast<std::size_t>(channel)];
    const auto failure = output.write(line.level, formatLine(line));
    if (!failure) {
        return;
    }
    const std::string report =
        ownLine("write", "lines for " + nameOf(output.target()) + " are lost: " + *failure);
    if (channel == Channel::Log) {
        tellSyslog(report);
    } else {
        tellLog(*current->outputs[static_cast<std::size_t>(Channel::Log)], report);
    }
}

} // namespace qelo::logging
