// What enumerating all accounts costs, from the call of a client in this process to the last
// instance, with 1,000 and with 50,000 accounts in one run. The counters are
//   per_account       time
//   peak_per_account  memory that the process needed at most beyond what it held before
// Both should be about the same in every row: the cost grows with the number of accounts and
// not faster.
#include <store/Populations.h>

#include <broker/LocalConnection.h>

#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <malloc.h>
#include <sstream>
#include <string>
#include <thread>

namespace {

using qelo::broker::Dispatcher;
using qelo::broker::DispatcherOptions;
using qelo::broker::LocalConnection;
using qelo::broker::ProviderRegistration;
using qelo::broker::ProviderType;

std::shared_ptr<Dispatcher> accountsDispatcher() {
    DispatcherOptions options;
    options.libraryDirectories = {QELO_PROVIDER_DIRECTORY};
    auto dispatcher = std::make_shared<Dispatcher>(std::move(options));
    ProviderRegistration accounts;
    accounts.className = "ZANTH_Account";
    accounts.nameSpaces = {"root/cimv2"};
    accounts.provider = "SimAccountProvider";
    accounts.library = "qelosimpleidentitymanagementprofileprovider";
    accounts.types.add(ProviderType::Instance);
    dispatcher->add(accounts);
    return dispatcher;
}

// A line of /proc/self/status in bytes.
double statusBytes(const std::string& name) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.compare(0, name.size() + 1, name + ":") == 0) {
            constexpr double kibibyte = 1024;
            return std::stod(line.substr(name.size() + 1)) * kibibyte;
        }
    }
    return 0;
}

// From here on the kernel counts the peak anew. What was freed before goes back to it first.
void forgetPeak() {
    malloc_trim(0);
    std::ofstream("/proc/self/clear_refs") << "5";
}

std::size_t enumerate(LocalConnection& connection) {
    std::size_t found = 0;
    connection.enumerateInstances(qelo::cim::ObjectPath("root/cimv2", "ZANTH_Account"),
                                  std::nullopt, [&](const qelo::cim::Instance&) { ++found; });
    return found;
}

void enumInstances(benchmark::State& state, bool fromFile) {
    const auto accounts = state.range(0);
    const qelo::bench::Population population(static_cast<int>(accounts));
    const std::string choice = fromFile ? population.fileChoice() : population.accountsChoice();
    ::setenv("QELO_NODE_STORE", choice.c_str(), 1);
    // Files this fresh are read on every request, for their stamps cannot be trusted yet.
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
    LocalConnection connection(accountsDispatcher());
    if (enumerate(connection) < static_cast<std::size_t>(accounts)) {
        state.SkipWithError("not all accounts are served");
        return;
    }
    forgetPeak();
    const double before = statusBytes("VmRSS");
    for (auto _ : state) {
        benchmark::DoNotOptimize(enumerate(connection));
    }
    const auto total = static_cast<double>(accounts);
    state.counters["per_account"] = benchmark::Counter(
        total, benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
    state.counters["peak_per_account"] =
        benchmark::Counter((statusBytes("VmHWM") - before) / total, benchmark::Counter::kDefaults,
                           benchmark::Counter::kIs1024);
}

BENCHMARK_CAPTURE(enumInstances, node_file, true)
    ->Arg(1000)
    ->Arg(50000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(enumInstances, account_files, false)
    ->Arg(1000)
    ->Arg(50000)
    ->Unit(benchmark::kMillisecond);

} // namespace

BENCHMARK_MAIN();
