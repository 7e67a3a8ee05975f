// What a line costs: turned away, and written to a file; and what collecting its text costs.
//
// Makes its own configuration and log file in a scratch directory. The log admits 6000 and
// above, as it does by default; the trace has ten components of its own and admits nothing.
#include "UnitTrace.h"
#include "platform/CvLogger.h"

#include <benchmark/benchmark.h>

#include <array>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <ostream>
#include <string>

namespace {

constexpr int kProgress = 3000;
constexpr int kFailure = 6000;

const std::string component = "Corvane.SimAccountProvider";
const std::string message = "ENTERING: SimAccountProvider_EnumInstances() in SimAccountProvider";

void logLine(int level) {
    CvLog::CvLogger::logLevelMessage("bench", "LoggingBenchmark", 1, component, level, nullptr, 0,
                                     0, message);
}

void lineNotAdmitted(benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) {
        logLine(kProgress);
    }
}
BENCHMARK(lineNotAdmitted)->Threads(1)->Threads(2);

// Every component has its own logger name; a request passes through several.
void lineNotAdmittedFromTenComponents(benchmark::State& state) {
    std::array<std::string, 10> components;
    for (std::size_t index = 0; index < components.size(); ++index) {
        components[index] = "Corvane.SimpleIdentityComponent" + std::to_string(index);
    }
    std::size_t next = 0;
    for ([[maybe_unused]] auto _ : state) {
        CvLog::CvLogger::traceLevelMessage("bench", "LoggingBenchmark", 1, components[next],
                                           kFailure, nullptr, 0, 0, message);
        next = (next + 1) % components.size();
    }
}
BENCHMARK(lineNotAdmittedFromTenComponents);

void lineAdmittedToFile(benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) {
        logLine(kFailure);
    }
}
BENCHMARK(lineAdmittedToFile)->Threads(1)->Threads(2);

void bufferOfSixtyCharacters(benchmark::State& state) {
    const std::string text(60, 'x');
    for ([[maybe_unused]] auto _ : state) {
        CvLog::CvMessageBuffer buffer;
        benchmark::DoNotOptimize(buffer.str(buffer << text.c_str()));
    }
}
BENCHMARK(bufferOfSixtyCharacters);

void bufferWithAPointerThroughItsStream(benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) {
        CvLog::CvMessageBuffer buffer;
        std::ostream& stream = buffer << " broker=";
        stream << static_cast<const void*>(&state);
        benchmark::DoNotOptimize(buffer.str(stream));
    }
}
BENCHMARK(bufferWithAPointerThroughItsStream);

// The whole of a trace point as the provider has it: the text, to the log and to the trace.
const Tesk::UnitTrace unit(component, "LoggingBenchmark");

void tracePointNotAdmitted(benchmark::State& state) {
    for ([[maybe_unused]] auto _ : state) {
        unit.method();
    }
}
BENCHMARK(tracePointNotAdmitted);

void tracePointOfAVariableNotAdmitted(benchmark::State& state) {
    const std::string value = "/home/user100000";
    for ([[maybe_unused]] auto _ : state) {
        unit.variable("_homeDirectory", value);
    }
}
BENCHMARK(tracePointOfAVariableNotAdmitted);

class Scratch {
public:
    Scratch() {
        std::string name =
            (std::filesystem::temp_directory_path() / "bench_logging.XXXXXX").string();
        if (::mkdtemp(name.data()) == nullptr) {
            std::abort();
        }
        path_ = name;
        std::ofstream config(path_ / "logging.conf");
        config << "log = file:" << (path_ / "log").string() << "\n"
               << "trace = file:" << (path_ / "trace").string() << "\n";
        for (int index = 0; index < 10; ++index) {
            config << "trace.level.Corvane.SimpleIdentityComponent" << index << " = off\n";
        }
    }
    ~Scratch() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    Scratch(const Scratch&) = delete;
    Scratch& operator=(const Scratch&) = delete;

    std::string config() const { return (path_ / "logging.conf").string(); }

private:
    std::filesystem::path path_;
};

} // namespace

int main(int argc, char** argv) {
    const Scratch scratch;
    ::setenv("QELO_LOG_CONFIG", scratch.config().c_str(), 1);
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) {
        return 1;
    }
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
