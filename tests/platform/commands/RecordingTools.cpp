#include "RecordingTools.h"

namespace qelo::test {

namespace {

using store::ToolResult;

ToolResult ended(ToolResult::End end, int code, const std::string& message) {
    ToolResult result;
    result.end = end;
    result.code = code;
    result.message = message;
    return result;
}

ToolResult faultyResult(RecordingTools::Fault fault) {
    switch (fault) {
    case RecordingTools::Fault::Lies:
        return ended(ToolResult::End::Exited, 0, "");
    case RecordingTools::Fault::TimesOut:
        return ended(ToolResult::End::TimedOut, 0, "");
    case RecordingTools::Fault::CannotStart:
        return ended(ToolResult::End::NotStarted, 2, "");
    default:
        return ended(ToolResult::End::Exited, 1, "made to fail\n");
    }
}

bool doesItsWork(RecordingTools::Fault fault) {
    return fault == RecordingTools::Fault::FailsAfterwards ||
           fault == RecordingTools::Fault::TimesOut;
}

} // namespace

std::string RecordedCall::tool() const { return program.substr(program.rfind('/') + 1); }

std::string RecordedCall::line() const {
    std::string text;
    for (const std::string& argument : arguments) {
        text += " " + argument;
    }
    return text;
}

ToolResult RecordingTools::run(const store::ToolCall& call) {
    Fault fault = Fault::None;
    {
        const std::lock_guard<std::mutex> held(mutex_);
        fault = calls_.size() == faultyCall_ ? fault_ : Fault::None;
        calls_.push_back({call.program, call.arguments, std::string(call.input.view())});
    }
    if (fault == Fault::None) {
        return store::systemTools().run(call);
    }
    if (doesItsWork(fault)) {
        store::systemTools().run(call);
    }
    return faultyResult(fault);
}

void RecordingTools::failAt(std::size_t number, Fault fault) {
    faultyCall_ = number;
    fault_ = fault;
}

std::vector<RecordedCall> RecordingTools::calls() const {
    const std::lock_guard<std::mutex> held(mutex_);
    return calls_;
}

} // namespace qelo::test
