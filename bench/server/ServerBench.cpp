// What the server costs: `qelosim serve` as its own process over loopback, against the same
// providers in this process. Prints one line for each figure, server,NAME,BEST,MEDIAN, which
// tools/bench makes a table of.
//
//   bench_server [--quick] [PART]
//
// The parts, and the names in their lines:
//
//   inprocess/..., connections/N/...   instances and requests a second, of wall time (wall) and
//                                      of processor time (cpu): the server's, not the client's
//   core/...                           the server alone on one core, a long answer
//   length/N/..., length/fresh/N/...   most memory (peak, bytes), time to the first instance and
//                                      to the end (first, whole, seconds) of N instances
//   accounts/...                       the same for 60,000 accounts of our own provider
//   get/...                            one GetInstance after the other on one connection
#include "Client.h"
#include "Clock.h"
#include "Figures.h"
#include "InProcess.h"
#include "Load.h"
#include "ServerProcess.h"
#include "TrivialClasses.h"

#include <store/Populations.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <future>
#include <optional>
#include <sched.h>
#include <stdexcept>
#include <string>
#include <sys/resource.h>
#include <thread>
#include <utility>
#include <vector>

namespace {

using namespace qelo::bench;
using qelo::broker::LocalConnection;
using qelo::cim::Instance;
using qelo::cim::ObjectPath;

constexpr unsigned int pageOfInstances = 1000; // in one answer, where many are asked for
constexpr unsigned int longAnswer = 60'000;
constexpr unsigned int manyAccounts = 60'000;
constexpr unsigned int fewAccounts = 10;
constexpr int firstSamples = 50;

struct Plan {
    int runs;
    double seconds; // of one run of load
    int getsPerRun; // requests
    bool largeOnes; // answers of 500,000 instances, populations of 60,000
};
constexpr Plan whole = {5, 1.0, 3000, true};
constexpr Plan quickly = {3, 0.3, 1000, false};

std::size_t occurrences(const std::string& text, const std::string& word) {
    std::size_t count = 0;
    for (std::size_t at = text.find(word); at != std::string::npos; at = text.find(word, at + 1)) {
        ++count;
    }
    return count;
}

std::vector<std::string> argumentsOf(const TrivialClasses& classes, const std::string& store) {
    return {"--schema-dir",   QELO_SCHEMA_DIRECTORY,   "--schema-dir", classes.folder().string(),
            "--provider-dir", QELO_PROVIDER_DIRECTORY, "--store",      store};
}

// The calling thread and the processes that it starts.
void runAhead() {
    const sched_param lowest = {sched_get_priority_min(SCHED_RR)};
    (void)sched_setscheduler(0, SCHED_RR, &lowest);
}

// The element of the first instance's name in an answer.
std::string firstName(const std::string& answer) {
    const std::string end = "</INSTANCENAME>";
    const std::size_t first = answer.find("<INSTANCENAME ");
    const std::size_t last = answer.find(end, first);
    if (last == std::string::npos) {
        throw std::runtime_error("the answer has no instance");
    }
    return answer.substr(first, last + end.size() - first);
}

// Asks once and counts what comes, so that all the other answers need only be as long.
std::size_t checkedLength(const ServerProcess& server, const std::string& className,
                          unsigned int instances) {
    const std::string answer =
        Client(server.port()).askForText(enumerateInstancesRequest(className));
    if (occurrences(answer, "<INSTANCE ") != instances ||
        occurrences(answer, "<PROPERTY") != std::size_t{28} * instances) {
        throw std::runtime_error(className + ": not all instances are served");
    }
    return answer.size();
}

class Bench {
public:
    explicit Bench(const Plan& plan) : plan_(plan), few_(fewAccounts) {}

    // All parts, or the one of that name.
    void run(const std::string& only) {
        const std::pair<const char*, void (Bench::*)()> parts[] = {
            {"inprocess", &Bench::inProcess}, {"connections", &Bench::overConnections},
            {"core", &Bench::onOneCore},      {"get", &Bench::oneByOne},
            {"length", &Bench::lengths},      {"accounts", &Bench::accounts},
        };
        for (const auto& [name, part] : parts) {
            const bool wanted =
                only.empty() ? plan_.largeOnes || part != &Bench::accounts : only == name;
            if (wanted) {
                (this->*part)();
            }
        }
        figures_.print();
    }

private:
    void higher(const std::string& name, double value) {
        figures_.add(name, value, Better::Higher);
    }
    void lower(const std::string& name, double value) { figures_.add(name, value, Better::Lower); }
    void rate(const std::string& name, double items, double wall, double cpu) {
        higher(name + "/wall", items / wall);
        higher(name + "/cpu", items / cpu);
    }

    template <class Request>
    void rateInProcess(const std::string& name, double itemsEach, Request request) {
        request(); // loads the provider
        for (int run = 0; run < plan_.runs; ++run) {
            const double cpu = cpuSeconds();
            const double began = wallSeconds();
            double items = 0;
            do {
                request();
                items += itemsEach;
            } while (wallSeconds() - began < plan_.seconds);
            rate(name, items, wallSeconds() - began, cpuSeconds() - cpu);
        }
    }

    void inProcess() {
        ::setenv("QELO_NODE_STORE", few_.fileChoice().c_str(), 1);
        LocalConnection connection = connectInProcess(classes_.folder());
        std::optional<ObjectPath> path;
        std::size_t found = 0;
        const auto enumerate = [&](const std::string& className) {
            connection.enumerateInstances(ObjectPath("root/cimv2", className), std::nullopt,
                                          [&](const Instance& instance) {
                                              ++found;
                                              path = instance.path();
                                          });
        };
        rateInProcess("inprocess/ready", pageOfInstances,
                      [&] { enumerate(readyClass(pageOfInstances)); });
        rateInProcess("inprocess/fresh", pageOfInstances,
                      [&] { enumerate(freshClass(pageOfInstances)); });
        if (found % pageOfInstances != 0) {
            throw std::runtime_error("not all instances are served in process");
        }
        rateInProcess("inprocess/get", 1, [&] { connection.getInstance(*path, std::nullopt); });
    }

    void overConnections() {
        const ServerProcess server(argumentsOf(classes_, few_.fileChoice()));
        const std::string className = readyClass(pageOfInstances);
        const std::size_t length = checkedLength(server, className, pageOfInstances);
        const std::string enumerate = enumerateInstancesRequest(className);
        Client client(server.port());
        const std::string get = getInstanceRequest(
            firstName(client.askForText(enumerateInstancesRequest(readyClass(1)))));
        const std::size_t getLength = client.ask(get).bytes;
        for (int run = 0; run < plan_.runs; ++run) {
            for (const unsigned int connections : {1U, 4U, 16U}) {
                const std::string name = "connections/" + std::to_string(connections);
                const Load many = load(server, enumerate, length, connections, plan_.seconds);
                rate(name + "/ready", many.requests * pageOfInstances, many.wall, many.serverCpu);
                const Load gets = load(server, get, getLength, connections, plan_.seconds);
                rate(name + "/get", gets.requests, gets.wall, gets.serverCpu);
            }
        }
    }

    // The server on the first core, the client on the last: they are not in each other's way
    // when there are two.
    void onOneCore() {
        const std::vector<int> cores = usableCores();
        const ServerProcess server(argumentsOf(classes_, few_.fileChoice()), cores.front());
        for (const std::string& kind : {std::string("ready"), std::string("fresh")}) {
            const std::string className =
                kind == "ready" ? readyClass(longAnswer) : freshClass(longAnswer);
            const std::size_t length = checkedLength(server, className, longAnswer);
            std::async(std::launch::async, [&] {
                pinTo(cores.back());
                for (int run = 0; run < plan_.runs; ++run) {
                    const Load many = load(server, enumerateInstancesRequest(className), length, 1,
                                           plan_.seconds);
                    const double instances = many.requests * longAnswer;
                    rate("core/" + kind, instances, many.wall, many.serverCpu);
                    lower("core/" + kind + "/client", many.clientCpu / instances);
                }
            }).get();
        }
    }

    // Ahead of all other programs where that is allowed: the slowest of a hundred would else
    // tell how busy the machine is. On one core, for client and server take turns.
    void oneByOne() {
        std::async(std::launch::async, [this] {
            pinTo(usableCores().back());
            runAhead();
            getOneByOne();
        }).get();
    }

    void getOneByOne() {
        const ServerProcess server(argumentsOf(classes_, few_.fileChoice()));
        // Files this fresh are read on every request, for their stamps cannot be trusted yet.
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        for (const auto& [name, className] :
             {std::pair<std::string, std::string>{"trivial", readyClass(1)},
              {"accounts", "ZANTH_Account"}}) {
            Client client(server.port());
            const std::string request = getInstanceRequest(
                firstName(client.askForText(enumerateInstancesRequest(className))));
            if (occurrences(client.askForText(request), "<INSTANCE ") != 1) {
                throw std::runtime_error(className + ": no instance");
            }
            for (int run = 0; run < plan_.runs; ++run) {
                std::vector<double> times;
                times.reserve(static_cast<std::size_t>(plan_.getsPerRun));
                for (int i = 0; i < plan_.getsPerRun; ++i) {
                    times.push_back(client.ask(request).whole);
                }
                lower("get/" + name + "/median", quantile(times, 0.5));
                lower("get/" + name + "/p99", quantile(times, 0.99));
            }
        }
    }

    void measureAnswer(const ServerProcess& server, const std::string& name,
                       const std::string& className) {
        Client client(server.port());
        const std::string request = enumerateInstancesRequest(className);
        client.ask(request); // what is done once for all is not counted
        for (int run = 0; run < plan_.runs; ++run) {
            server.forgetPeak();
            const Client::Answer answer = client.ask(request);
            lower(name + "/peak", server.peakMemory());
            lower(name + "/whole", answer.whole);
        }
    }

    // Whoever has the first instance goes, so that many can be asked for.
    void measureFirst(const ServerProcess& server, const std::string& name,
                      const std::string& className, int samples) {
        for (int i = 0; i < samples; ++i) {
            lower(name + "/first",
                  Client(server.port()).askForFirst(enumerateInstancesRequest(className)));
        }
    }

    void lengths() {
        const ServerProcess server(argumentsOf(classes_, few_.fileChoice()));
        for (const unsigned int count : trivialCounts) {
            if (count > 1 && (plan_.largeOnes || count <= longAnswer)) {
                const std::string name = std::to_string(count);
                measureAnswer(server, "length/" + name, readyClass(count));
                measureAnswer(server, "length/fresh/" + name, freshClass(count));
                measureFirst(server, "length/" + name, readyClass(count), firstSamples);
                measureFirst(server, "length/fresh/" + name, freshClass(count), firstSamples);
            }
        }
    }

    void accounts() {
        const Population many(static_cast<int>(manyAccounts));
        const ServerProcess server(argumentsOf(classes_, many.fileChoice()));
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        checkedLength(server, "ZANTH_Account", manyAccounts);
        lower("accounts/before", server.peakMemory());
        measureAnswer(server, "accounts", "ZANTH_Account");
        measureFirst(server, "accounts", "ZANTH_Account", plan_.runs);
        firstInProcess(many.fileChoice());
    }

    void firstInProcess(const std::string& store) {
        ::setenv("QELO_NODE_STORE", store.c_str(), 1);
        LocalConnection connection = connectInProcess(classes_.folder());
        for (int run = -1; run < plan_.runs; ++run) {
            const double began = wallSeconds();
            double first = 0;
            connection.enumerateInstances(
                ObjectPath("root/cimv2", "ZANTH_Account"), std::nullopt,
                [&](const Instance&) { first = first == 0 ? wallSeconds() - began : first; });
            if (run >= 0) {
                lower("accounts/inprocess/first", first);
                lower("accounts/inprocess/whole", wallSeconds() - began);
            }
        }
    }

    const Plan& plan_;
    const TrivialClasses classes_;
    const Population few_;
    Figures figures_;
};

} // namespace

int main(int argc, char** argv) {
    std::vector<std::string> arguments(argv + 1, argv + argc);
    const bool quick = !arguments.empty() && arguments.front() == "--quick";
    arguments.erase(arguments.begin(), arguments.begin() + (quick ? 1 : 0));
    // Keeps others from the processors as far as that is allowed; the server inherits it.
    constexpr int beforeOthers = -10;
    (void)setpriority(PRIO_PROCESS, 0, beforeOthers);
    try {
        Bench(quick ? quickly : whole).run(arguments.empty() ? "" : arguments.front());
    } catch (const std::exception& error) {
        (void)std::fprintf(stderr, "bench_server: %s\n", error.what());
        return 1;
    }
    return 0;
}
