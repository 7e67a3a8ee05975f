#include "ChangingLog.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <thread>
#include <unistd.h>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

constexpr std::size_t kFaultyKept = 5;
constexpr std::size_t kRotatedKept = 2; // the logger looks for a moved file once in a second
constexpr const char* kNothing = "log = none\nlog.level = off\n";
constexpr std::array<const char*, 2> kFiles = {"log", "trace"};

std::vector<std::string> configurations(const fs::path& directory) {
    const std::string log = "log = file:" + (directory / "log").native() + "\n";
    const std::string trace = "trace = file:" + (directory / "trace").native() + "\n";
    return {"log = none\n" + trace + "trace.level = 0\n",
            log + "log.level = 6000\n" + trace + "trace.level = off\n" +
                "trace.level.Corvane.SimAccountObj = 3000\n",
            kNothing, log + "log.level = 3000\nthis = is not a setting\n" + trace};
}

// Time, process and thread, level, component and so on, without any character that would end
// the line or hide a part of it.
bool isWholeLine(const std::string& line) {
    static const std::string process = " [" + std::to_string(::getpid()) + ":";
    constexpr std::size_t lengthOfTime = sizeof "2026-01-02T03:04:05.678+01:00" - 1;
    const bool printable = std::none_of(line.begin(), line.end(), [](char character) {
        const auto byte = static_cast<unsigned char>(character);
        return byte < 0x20 || byte == 0x7F;
    });
    const bool fromUs =
        line.find("] 3000 ") < 60 || line.find("] 4000 ") < 60 || line.find("] 6000 ") < 60;
    const bool once = line.find(process) == lengthOfTime &&
                      line.find(process, lengthOfTime + 1) == std::string::npos;
    return printable && fromUs && once && line.front() == '2';
}

} // namespace

ChangingLog& ChangingLog::instance() {
    static ChangingLog log;
    return log;
}

ChangingLog::ChangingLog() {
    std::string pattern = (fs::temp_directory_path() / "qelo-log-XXXXXX").native();
    if (::mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("no scratch directory");
    }
    directory_ = pattern;
    silence();
    ::setenv("QELO_LOG_CONFIG", (directory_ / "logging.conf").c_str(), 1);
}

ChangingLog::~ChangingLog() {
    std::error_code ignored;
    fs::remove_all(directory_, ignored);
}

void ChangingLog::silence() { configure(kNothing, false); }

void ChangingLog::configure(const std::string& text, bool inPlace) {
    const fs::path config = directory_ / "logging.conf";
    const fs::path draft = directory_ / "logging.conf+";
    std::ofstream(inPlace ? config : draft, std::ios::trunc) << text;
    if (!inPlace) {
        fs::rename(draft, config);
    }
}

void ChangingLog::turn() {
    const auto texts = configurations(directory_);
    configure(texts[turns_ % texts.size()], turns_ / texts.size() % 2 == 1);
    rotate();
    ++turns_;
}

void ChangingLog::rotate() {
    for (const char* name : kFiles) {
        const fs::path file = directory_ / name;
        if (fs::exists(file)) {
            fs::rename(file, file.native() + "." + std::to_string(turns_));
        }
        if (turns_ >= kRotatedKept) {
            lookThrough(file.native() + "." + std::to_string(turns_ - kRotatedKept));
        }
    }
}

void ChangingLog::finish() {
    silence();
    // The logger gathers lines for some milliseconds before it writes them.
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
    for (const char* name : kFiles) {
        const std::string file = (directory_ / name).native();
        for (std::size_t turn = turns_ - std::min(turns_, kRotatedKept); turn < turns_; ++turn) {
            lookThrough(file + "." + std::to_string(turn));
        }
        lookThrough(file);
    }
}

void ChangingLog::lookThrough(const fs::path& file) {
    std::ifstream stream(file, std::ios::binary);
    for (std::string line; std::getline(stream, line);) {
        ++lines_;
        const bool whole = !stream.eof() && !line.empty() && isWholeLine(line);
        if (!whole && faulty_.size() < kFaultyKept) {
            faulty_.push_back(line);
        }
    }
    fs::remove(file);
}

} // namespace qelo::test
