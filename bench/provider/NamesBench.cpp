// EnumInstanceNames of the accounts, against the floor: the same paths from ready records.
#include "FloorProvider.h"
#include "Requests.h"

#include <optional>
#include <vector>

namespace {

using namespace qelo::bench;
using qelo::broker::LocalConnection;
using qelo::cim::Instance;
using qelo::cim::ObjectPath;

std::size_t enumerateNames(LocalConnection& connection, const char* className) {
    std::size_t found = 0;
    connection.enumerateInstanceNames(ObjectPath(nameSpace, className),
                                      [&](const ObjectPath&) { ++found; });
    return found;
}

std::vector<ObjectPath> namesOf(LocalConnection& connection, const char* className) {
    std::vector<ObjectPath> all;
    connection.enumerateInstanceNames(ObjectPath(nameSpace, className),
                                      [&](const ObjectPath& path) { all.push_back(path); });
    return all;
}

// The accounts as the floor's ready records; whether it then serves the same paths.
bool makeReady(benchmark::State& state, LocalConnection& connection) {
    const Store store(state, Form::nodeFile);
    std::vector<Instance> accounts;
    connection.enumerateInstances(ObjectPath(nameSpace, accountClass), std::nullopt,
                                  [&](const Instance& found) { accounts.push_back(found); });
    setFloorInstances(accounts);
    return namesOf(connection, floorClass) == namesOf(connection, accountClass);
}

void namesFloor(benchmark::State& state) {
    LocalConnection connection = connect();
    if (!makeReady(state, connection)) {
        state.SkipWithError("the floor does not serve the same paths");
        return;
    }
    measure(state, [&] { benchmark::DoNotOptimize(enumerateNames(connection, floorClass)); });
    setFloorInstances({});
}

void names(benchmark::State& state, Form form) {
    const Store store(state, form);
    LocalConnection connection = connect();
    if (enumerateNames(connection, accountClass) != static_cast<std::size_t>(state.range(0))) {
        state.SkipWithError("not all accounts are served");
        return;
    }
    measure(state, [&] { benchmark::DoNotOptimize(enumerateNames(connection, accountClass)); });
}

BENCHMARK(namesFloor)->Apply(populations);
BENCHMARK_CAPTURE(names, node_file, Form::nodeFile)->Name("names/node_file")->Apply(populations);
BENCHMARK_CAPTURE(names, account_files, Form::accountFiles)
    ->Name("names/account_files")
    ->Apply(populations);

} // namespace
