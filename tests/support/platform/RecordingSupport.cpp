#include "RecordingState.h"

#include <stdexcept>

namespace qelo::test {

bool RecordingPlatform::State::refusesLibraryCall(const std::string& operation) {
    const std::optional<StoreFault> fault = libraryFaults.next(operation);
    if (fault == StoreFault::ThrowsForeign) {
        throw ForeignFailure{};
    }
    if (fault == StoreFault::ThrowsRuntimeError) {
        throw std::runtime_error(storeFailureText);
    }
    return fault.has_value();
}

void RecordingPort::buffer() {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    state.refusesLibraryCall("CvMessageBuffer");
}

std::string RecordingPort::narrow(std::string text) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    return state.refusesLibraryCall("make_string") ? std::string() : text;
}

void RecordingPort::line(LogLine line) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    if (state.refusesLibraryCall("line")) {
        return;
    }
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
    if (state.refusesLibraryCall("getSystemName")) {
        return "";
    }
    return state.support.systemName;
}

std::optional<bool> RecordingPort::scriptedComparison() {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    if (state.refusesLibraryCall("isObjPathsEqual")) {
        return false;
    }
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
    return state.refusesLibraryCall("getLanguageId") ? "" : state.support.language;
}

std::wstring RecordingPort::library(unsigned long number, const std::string& language) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    if (state.records.on) {
        state.records.libraryRequests.push_back({number, language});
    }
    return state.refusesLibraryCall("getResourceLibrary")
               ? std::wstring()
               : RecordingPlatform::resourceLibraryName(number, language);
}

std::wstring RecordingPort::text(const std::wstring& library, const std::wstring& id) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    if (state.records.on) {
        state.records.textRequests.push_back({library, id});
    }
    if (state.refusesLibraryCall("ResourceString")) {
        return {};
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
        if (state.refusesLibraryCall("ValidateInput")) {
            return false;
        }
        gate = state.support.inputGate;
    }
    return !gate || gate(value);
}

} // namespace qelo::test
