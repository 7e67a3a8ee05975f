#include "RecordingState.h"

namespace qelo::test {

void RecordingPort::line(LogLine line) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    ++state.records.lineCount;
    if (state.records.on) {
        if (line.sink == Sink::Log) {
            state.records.note(line.message);
        }
        state.records.lines.push_back(std::move(line));
    }
}

std::string RecordingPort::systemName() {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    state.records.note("platform: getSystemName()");
    return state.support.systemName;
}

std::optional<bool> RecordingPort::scriptedComparison() {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    const auto& answers = state.support.pathAnswers;
    const std::size_t next = state.records.pathComparisons.size();
    if (answers.empty()) {
        return std::nullopt;
    }
    return next < answers.size() && answers[next];
}

void RecordingPort::pathsCompared(PathComparison comparison) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    state.records.pathComparisons.push_back(comparison);
}

std::string RecordingPort::language() {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    return state.support.language;
}

std::wstring RecordingPort::library(unsigned long number, const std::string& language) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    if (state.records.on) {
        state.records.libraryRequests.push_back({number, language});
    }
    return RecordingPlatform::resourceLibraryName(number, language);
}

std::wstring RecordingPort::text(const std::wstring& library, const std::wstring& id) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    if (state.records.on) {
        state.records.textRequests.push_back({library, id});
    }
    const auto found = state.support.texts.find({library, id});
    return found != state.support.texts.end() ? found->second : id;
}

bool RecordingPort::inputAccepted(const std::string& value, const std::string& extra) {
    std::function<bool(const std::string&)> gate;
    {
        auto& state = *RecordingPlatform::instance().state_;
        std::lock_guard lock(state.mutex);
        state.records.inputChecks.push_back({value, extra});
        gate = state.support.inputGate;
    }
    return !gate || gate(value);
}

} // namespace qelo::test
