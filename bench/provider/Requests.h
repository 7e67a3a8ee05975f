// What the benchmarks of the provider have in common: a store of accounts, a connection to the
// providers in this process, and the measuring loop.
#pragma once

#include "Allocations.h"

#include <broker/LocalConnection.h>
#include <store/Populations.h>

#include <benchmark/benchmark.h>

#include <cstdint>
#include <string>

namespace qelo::bench {

inline constexpr const char* nameSpace = "root/cimv2";
inline constexpr const char* accountClass = "ZANTH_Account";

// The form of the accounts: nodes of a file, or the files of an account database.
enum class Form { nodeFile, accountFiles };

// To the account provider and to the floor provider.
broker::LocalConnection connect();

// A store of as many accounts as the benchmark's argument says, chosen for its time.
class Store {
public:
    Store(const benchmark::State& state, Form form);
    ~Store();
    Store(const Store&) = delete;
    Store& operator=(const Store&) = delete;

private:
    Population population_;
};

// What the process holds now, in bytes; forgetPeak() makes the kernel count the peak anew.
double residentMemory();
double peakMemory();
void forgetPeak();

// Runs a benchmark's loop and fills its counters.
template <class Request> void measure(benchmark::State& state, Request request) {
    request(); // what is done once for all is not counted
    forgetPeak();
    const double before = residentMemory();
    const std::uint64_t allocations = allocationCount();
    for (auto _ : state) {
        request();
    }
    using ::benchmark::Counter;
    const auto accounts = static_cast<double>(state.range(0));
    const double made = static_cast<double>(allocationCount() - allocations);
    state.counters["per_account"] =
        Counter(accounts, Counter::kIsIterationInvariantRate | Counter::kInvert);
    state.counters["allocations"] = Counter(made / accounts, Counter::kAvgIterations);
    state.counters["peak"] =
        Counter((peakMemory() - before) / accounts, Counter::kDefaults, Counter::kIs1024);
}

// 100, 1,000, 10,000 and 60,000 accounts.
void populations(benchmark::internal::Benchmark* made);

} // namespace qelo::bench
