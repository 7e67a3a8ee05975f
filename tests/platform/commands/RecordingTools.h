// A tool runner that keeps what tools were run, and can make one of them fail.
#pragma once

#include "ToolRunner.h"

#include <mutex>
#include <string>
#include <vector>

namespace qelo::test {

struct RecordedCall {
    std::string program;
    std::vector<std::string> arguments;
    std::string input;

    // The program's name without its directory.
    std::string tool() const;
    // The arguments with a blank before each.
    std::string line() const;
};

// Runs the real tools, unless told to fail.
class RecordingTools : public store::ToolRunner {
public:
    enum class Fault {
        None,
        // The tool does nothing and says that it failed.
        Refuses,
        // The tool does its work and then says that it failed.
        FailsAfterwards,
        // The tool does nothing and says that it is done.
        Lies,
        // The tool does its work but is killed for taking too long.
        TimesOut,
        // The tool cannot be started.
        CannotStart,
    };

    store::ToolResult run(const store::ToolCall& call) override;

    // Lets the call of this number (from 0) fail.
    void failAt(std::size_t number, Fault fault);
    std::vector<RecordedCall> calls() const;

private:
    mutable std::mutex mutex_;
    std::vector<RecordedCall> calls_;
    std::size_t faultyCall_ = 0;
    Fault fault_ = Fault::None;
};

} // namespace qelo::test
