// The logging configuration of a benchmark, in a scratch directory of its own.
#pragma once

#include <filesystem>
#include <string>

namespace qelo::bench {

class Logging {
public:
    // As delivered: the log admits failures, the trace nothing.
    Logging();
    ~Logging();
    Logging(const Logging&) = delete;
    Logging& operator=(const Logging&) = delete;

    // Traces every line to a file from now on, each at once or several together, or nothing
    // again. Waits until the logger has seen the change.
    void traceEverything(bool on, bool atOnce);

private:
    void write(const std::string& text) const;

    std::filesystem::path path_;
};

} // namespace qelo::bench
