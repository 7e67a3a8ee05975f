// What serving accounts costs, from the call of a client in this process to the last instance.
//
//   floor       the same calls of the broker for the same instances, from ready records: no
//               store, no trace
//   enumerate   EnumInstances of the provider, from a node file and from account files
//   enumerateTraced   the same with every line traced to a file
//   enumerateTracedAtOnce   the same with each line written by itself
//   readStore   the provider's reading of all accounts into records, and nothing else
//   getOne      GetInstance of one account among all, which reads them all
//   names, namesFloor    EnumInstanceNames, and its floor (NamesBench.cpp)
//   method, methodFloor  InvokeMethod, and its floor (MethodBench.cpp)
//
// The counters are
//   per_account   CPU time
//   allocations   for each account
//   peak          memory for each account that the process needed at most beyond what it held
// The goals are: enumerate within 3 times the floor, enumerateTraced within 8 times enumerate,
// getOne within 1.2 times readStore, names within 1.5 times readStore and namesFloor, per_account
// of 60,000 within 1.15 times that of 1,000, and a peak of 12 KiB. tools/bench compares them.
#include "FloorProvider.h"
#include "Logging.h"
#include "Requests.h"

#include <account/SimAccount.h>

#include <memory>
#include <optional>
#include <vector>

namespace {

using qelo::bench::accountClass;
using qelo::bench::connect;
using qelo::bench::Form;
using qelo::bench::measure;
using qelo::bench::nameSpace;
using qelo::bench::populations;
using qelo::bench::Store;
using qelo::broker::LocalConnection;
using qelo::cim::Instance;
using qelo::cim::ObjectPath;

std::unique_ptr<qelo::bench::Logging> logging;

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

void enumerateTraced(benchmark::State& state, bool atOnce) {
    logging->traceEverything(true, atOnce);
    enumerateAccounts(state, Form::nodeFile);
    logging->traceEverything(false, false);
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

BENCHMARK(floorOf)->Name("floor")->Apply(populations);
BENCHMARK_CAPTURE(enumerateAccounts, node_file, Form::nodeFile)
    ->Name("enumerate/node_file")
    ->Apply(populations);
BENCHMARK_CAPTURE(enumerateAccounts, account_files, Form::accountFiles)
    ->Name("enumerate/account_files")
    ->Apply(populations);
BENCHMARK_CAPTURE(readStore, node_file, Form::nodeFile)
    ->Name("readStore/node_file")
    ->Apply(populations);
BENCHMARK_CAPTURE(readStore, account_files, Form::accountFiles)
    ->Name("readStore/account_files")
    ->Apply(populations);
BENCHMARK_CAPTURE(getOne, node_file, Form::nodeFile)
    ->Name("getOne/node_file")
    ->Arg(60000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(getOne, account_files, Form::accountFiles)
    ->Name("getOne/account_files")
    ->Arg(60000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(enumerateTraced, gathered, false)
    ->Name("enumerateTraced")
    ->Arg(1000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(enumerateTraced, atOnce, true)
    ->Name("enumerateTracedAtOnce")
    ->Arg(1000)
    ->Unit(benchmark::kMillisecond);

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
