#include "Logging.h"

#include <platform/CvLogger.h>

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <thread>

namespace qelo::bench {
namespace {

// The logger looks at its file once a second, and only when there are lines.
void letTheLoggerLook() {
    std::this_thread::sleep_for(std::chrono::milliseconds(1200));
    constexpr int lines = 200;
    for (int i = 0; i < lines; ++i) {
        CvLog::CvLogger::traceLevelMessage("letTheLoggerLook", "Logging", 1, "Bench", 1, nullptr, 0,
                                           0, "line");
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(100)); // gathered lines get written
}

} // namespace

Logging::Logging() {
    std::string name = (std::filesystem::temp_directory_path() / "bench_logging.XXXXXX").string();
    if (::mkdtemp(name.data()) == nullptr) {
        throw std::runtime_error("no scratch directory");
    }
    path_ = name;
    write("");
    ::setenv("QELO_LOG_CONFIG", (path_ / "logging.conf").c_str(), 1);
}

Logging::~Logging() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

void Logging::traceEverything(bool on, bool atOnce) {
    const std::string place = "trace = file:" + (path_ / "trace").string() + "\ntrace.level = 0\n";
    write(on ? place + (atOnce ? "trace.buffer = off\n" : "") : "");
    letTheLoggerLook();
    std::error_code ignored;
    if (!on) {
        std::filesystem::remove(path_ / "trace", ignored);
    } else if (std::filesystem::file_size(path_ / "trace", ignored) == 0 || ignored) {
        throw std::runtime_error("the trace is not written");
    }
}

void Logging::write(const std::string& text) const {
    std::ofstream(path_ / "logging.conf") << text;
}

} // namespace qelo::bench
