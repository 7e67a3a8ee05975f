// InvokeMethod as far as the store's command: the provider looks at its store and hands over a
// command which the store refuses, for what a command does is the system's cost. The floor is a
// provider that refuses at once.
#include "FloorProvider.h"
#include "Requests.h"

namespace {

using namespace qelo::bench;
using qelo::broker::LocalConnection;
using qelo::cim::ObjectPath;
using qelo::cim::Value;

// Whether the method was refused, as it has to be.
bool callRefused(LocalConnection& connection, const char* className) {
    const ObjectPath path(nameSpace, className);
    try {
        connection.invokeMethod(path, "NoSuchCommand", {{"Name", Value::string("user100000")}});
        return false;
    } catch (const qelo::client::CimError&) {
        return true;
    }
}

void invoke(benchmark::State& state, const char* className) {
    LocalConnection connection = connect();
    measure(state, [&] {
        if (!callRefused(connection, className)) {
            state.SkipWithError("the method was not refused");
        }
    });
}

void methodFloor(benchmark::State& state) { invoke(state, floorClass); }

void method(benchmark::State& state, Form form) {
    const Store store(state, form);
    invoke(state, accountClass);
}

void inMicroseconds(benchmark::internal::Benchmark* made) {
    populations(made);
    made->Unit(benchmark::kMicrosecond);
}

BENCHMARK(methodFloor)->Arg(1)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(method, node_file, Form::nodeFile)
    ->Name("method/node_file")
    ->Apply(inMicroseconds);
BENCHMARK_CAPTURE(method, account_files, Form::accountFiles)
    ->Name("method/account_files")
    ->Apply(inMicroseconds);

} // namespace
