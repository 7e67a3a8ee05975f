#include "Requests.h"

#include "FloorProvider.h"

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <malloc.h>
#include <memory>
#include <thread>

namespace qelo::bench {
namespace {

using broker::Dispatcher;
using broker::DispatcherOptions;
using broker::ProviderRegistration;
using broker::ProviderType;

ProviderRegistration registration(const char* className, const char* provider,
                                  const char* library) {
    ProviderRegistration made;
    made.className = className;
    made.nameSpaces = {nameSpace};
    made.provider = provider;
    made.library = library;
    made.types = {ProviderType::Instance, ProviderType::Method};
    return made;
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

} // namespace

broker::LocalConnection connect() {
    DispatcherOptions options;
    options.libraryDirectories = {QELO_PROVIDER_DIRECTORY};
    auto dispatcher = std::make_shared<Dispatcher>(std::move(options));
    dispatcher->add(registration(accountClass, "SimAccountProvider",
                                 "qelosimpleidentitymanagementprofileprovider"));
    dispatcher->add(registration(floorClass, "FloorProvider", "qelofloorprovider"));
    return broker::LocalConnection(dispatcher);
}

Store::Store(const benchmark::State& state, Form form)
    : population_(static_cast<int>(state.range(0))) {
    const bool file = form == Form::nodeFile;
    const std::string choice = file ? population_.fileChoice() : population_.accountsChoice();
    ::setenv("QELO_NODE_STORE", choice.c_str(), 1);
    // Files this fresh are read on every request, for their stamps cannot be trusted yet.
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
}

Store::~Store() { ::unsetenv("QELO_NODE_STORE"); }

double residentMemory() { return statusBytes("VmRSS"); }

double peakMemory() { return statusBytes("VmHWM"); }

// What was freed before goes back to the kernel first.
void forgetPeak() {
    malloc_trim(0);
    std::ofstream("/proc/self/clear_refs") << "5";
}

void populations(benchmark::internal::Benchmark* made) {
    made->Arg(100)->Arg(1000)->Arg(10000)->Arg(60000)->Unit(benchmark::kMillisecond);
}

} // namespace qelo::bench
