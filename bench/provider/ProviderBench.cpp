// What serving accounts costs, from the call of a client in this process to the last instance.
//
//   floor       the same calls of the broker for the same instances, from ready records: no
//               store, no trace
//   enumerate   EnumInstances of the provider, from a node file and from account files
//   enumerateTraced   the same with every line traced to a file
//   readStore   the provider's reading of all accounts into records, and nothing else
//   getOne      GetInstance of one account among all, which reads them all
//
// The counters are
//   per_account   CPU time
//   allocations   for each account
//   peak          memory for each account that the process needed at most beyond what it held
// The goals are: enumerate within 3 times the floor, enumerateTraced within 8 times enumerate,
// getOne within 1.2 times readStore, per_account of 60,000 within 1.15 times that of 1,000, and
// a peak of 12 KiB. tools/bench compares them.
#include "Allocations.h"
#include "FloorProvider.h"
#include "Logging.h"

#include <account/SimAccount.h>
#include <broker/LocalConnection.h>
#include <store/Populations.h>

#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <malloc.h>
#include <memory>
#include <optional>
#include <string>
#include <thread>
#include <vector>

namespace {

using qelo::broker::Dispatcher;
using qelo::broker::DispatcherOptions;
using qelo::broker::LocalConnection;
using qelo::broker::ProviderRegistration;
using qelo::broker::ProviderType;
using qelo::cim::Instance;
using qelo::cim::ObjectPath;

constexpr const char* nameSpace = "root/cimv2";
constexpr const char* accountClass = "ZANTH_Account";

enum class Form { nodeFile, accountFiles };

std::unique_ptr<qelo::bench::Logging> logging;

ProviderRegistration registration(const char* className, const char* provider,
                                  const char* library) {
    ProviderRegistration made;
    made.className = className;
    made.nameSpaces = {nameSpace};
    made.provider = provider;
    made.library = library;
    made.types.add(ProviderType::Instance);
    return made;
}

LocalConnection connect() {
    DispatcherOptions options;
    options.libraryDirectories = {QELO_PROVIDER_DIRECTORY};
    auto dispatcher = std::make_shared<Dispatcher>(std::move(options));
    dispatcher->add(registration(accountClass, "SimAccountProvider",
                                 "qelosimpleidentitymanagementprofileprovider"));
    dispatcher->add(registration(qelo::bench::floorClass, "FloorProvider", "qelofloorprovider"));
    return LocalConnection(dispatcher);
}

// A store of so many accounts, chosen for the time of a benchmark.
class Store {
public:
    Store(benchmark::State& state, Form form) : population_(static_cast<int>(state.range(0))) {
        const bool file = form == Form::nodeFile;
        const std::string choice = file ? population_.fileChoice() : population_.accountsChoice();
        ::setenv("QELO_NODE_STORE", choice.c_str(), 1);
        // Files this fresh are read on every request, for their stamps cannot be trusted yet.
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
    }
    ~Store() { ::unsetenv("QELO_NODE_STORE"); }
    Store(const Store&) = delete;
    Store& operator=(const Store&) = delete;

private:
    qelo::bench::Population population_;
};

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

// Runs a benchmark's loop and fills its counters.
template <class Request> void measure(benchmark::State& state, Request request) {
    request(); // what is done once for all is not counted
    forgetPeak();
    const double before = statusBytes("VmRSS");
    const std::uint64_t allocations = qelo::bench::allocationCount();
    for (auto _ : state) {
        request();
    }
    using benchmark::Counter;
    const auto accounts = static_cast<double>(state.range(0));
    const double made = static_cast<double>(qelo::bench::allocationCount() - allocations);
    state.counters["per_account"] =
        Counter(accounts, Counter::kIsIterationInvariantRate | Counter::kInvert);
    state.counters["allocations"] = Counter(made / accounts, Counter::kAvgIterations);
    state.counters["peak"] =
        Counter((statusBytes("VmHWM") - before) / accounts, Counter::kDefaults, Counter::kIs1024);
}

std::size_t enumerate(LocalConnection& connection, const char* className) {
    std::size_t found = 0;
    connection.enumerateInstances(ObjectPath(nameSpace, className), std::nullopt,
                                  [&](const Instance&) { ++found; });
    return found;
}

std::vector<Instance> instancesOf(LocalConnection& connection, const char* className) {
    std::vector<Instance> all;
    connection.enumerateInstances(ObjectPath(nameSpace, className), std::nullopt,
                                  [&](const Instance& instance) { all.push_back(instance); });
    return all;
}

void floorOf(benchmark::State& state) {
    LocalConnection connection = connect();
    {
        const Store store(state, Form::nodeFile);
        const std::vector<Instance> accounts = instancesOf(connection, accountClass);
        qelo::bench::setFloorInstances(accounts);
        if (instancesOf(connection, qelo::bench::floorClass) != accounts) {
            state.SkipWithError("the floor does not serve the same instances");
            return;
        }
    }
    measure(state,
            [&] { benchmark::DoNotOptimize(enumerate(connection, qelo::bench::floorClass)); });
    qelo::bench::setFloorInstances({});
}

void enumerateAccounts(benchmark::State& state, Form form) {
    const Store store(state, form);
    LocalConnection connection = connect();
    if (enumerate(connection, accountClass) != static_cast<std::size_t>(state.range(0))) {
        state.SkipWithError("not all accounts are served");
        return;
    }
    measure(state, [&] { benchmark::DoNotOptimize(enumerate(connection, accountClass)); });
}

void enumerateTraced(benchmark::State& state) {
    logging->traceEverything(true);
    enumerateAccounts(state, Form::nodeFile);
    logging->traceEverything(false);
}

void readStore(benchmark::State& state, Form form) {
    const Store store(state, form);
    measure(state, [&] {
        std::vector<Tesk::SimpleIdentityManagementProvider::SimAccount> accounts;
        if (Tesk::SimpleIdentityManagementProvider::getSimAccountInstances(accounts)) {
            state.SkipWithError("the accounts were not read");
        }
    });
}

void getOne(benchmark::State& state, Form form) {
    const Store store(state, form);
    LocalConnection connection = connect();
    std::optional<ObjectPath> path;
    connection.enumerateInstanceNames(ObjectPath(nameSpace, accountClass),
                                      [&](const ObjectPath& found) { path = found; });
    measure(state, [&] { benchmark::DoNotOptimize(connection.getInstance(*path, std::nullopt)); });
}

void populations(benchmark::internal::Benchmark* made) {
    made->Arg(100)->Arg(1000)->Arg(10000)->Arg(60000)->Unit(benchmark::kMillisecond);
}

BENCHMARK(floorOf)->Name("floor")->Apply(populations);
BENCHMARK_CAPTURE(enumerateAccounts, node_file, Form::nodeFile)
    ->Name("enumerate/node_file")
    ->Apply(populations);
BENCHMARK_CAPTURE(enumerateAccounts, account_files, Form::accountFiles)
    ->Name("enumerate/account_files")
    ->Apply(populations);
BENCHMARK_CAPTURE(readStore, node_file, Form::nodeFile)
    ->Name("readStore/node_file")
    ->Arg(60000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(readStore, account_files, Form::accountFiles)
    ->Name("readStore/account_files")
    ->Arg(60000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(getOne, node_file, Form::nodeFile)
    ->Name("getOne/node_file")
    ->Arg(60000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(getOne, account_files, Form::accountFiles)
    ->Name("getOne/account_files")
    ->Arg(60000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK(enumerateTraced)->Arg(1000)->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    logging = std::make_unique<qelo::bench::Logging>();
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) {
        return 1;
    }
    benchmark::RunSpecifiedBenchmarks();
    logging.reset();
    return 0;
}
