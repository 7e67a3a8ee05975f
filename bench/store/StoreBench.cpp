// What a request costs the node store, with 1,000 and with 50,000 accounts in one run:
//   Read     taking a snapshot, as after a change of the database
//   List     a listing of all accounts from a snapshot, property by property as the provider
//            reads them
//   Select   opening a cursor and selecting the accounts when nothing changed
#include "Populations.h"

#include <Instrumentation.h>

#include <benchmark/benchmark.h>

#include <array>
#include <cstdlib>
#include <string>
#include <thread>

namespace {

using namespace Tesk::NodeLexicon;
using Tesk::Instrumentation;

enum class Form { accounts, file };

class ChosenPopulation {
public:
    ChosenPopulation(benchmark::State& state, Form form)
        : population_(static_cast<int>(state.range(0))) {
        const std::string choice =
            form == Form::file ? population_.fileChoice() : population_.accountsChoice();
        ::setenv("QELO_NODE_STORE", choice.c_str(), 1);
        // Files this fresh are read on every request, for their stamps cannot be trusted yet.
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        Instrumentation().selectNode(UserAccount);
    }
    ~ChosenPopulation() { ::unsetenv("QELO_NODE_STORE"); }
    ChosenPopulation(const ChosenPopulation&) = delete;
    ChosenPopulation& operator=(const ChosenPopulation&) = delete;

private:
    qelo::bench::Population population_;
};

void refresh() {
    Instrumentation administration;
    administration.selectNode(UserAdministration);
    unsigned int zero = 0;
    administration.setProperty(RefreshRequest, zero);
}

// The properties of one account in the provider's way.
std::size_t readAccount(Instrumentation& cursor) {
    constexpr std::array texts = {Name,
                                  Name,
                                  UserID,
                                  GroupId,
                                  UserPassword,
                                  FullName,
                                  HomeDirectory,
                                  ScriptPath,
                                  OrganizationName,
                                  InactivityTimeout,
                                  PasswordExpiration,
                                  PasswordLastChanged};
    constexpr std::array numbers = {AccountState,
                                    AccountState,
                                    AccountState,
                                    MaxLoginFailures,
                                    PasswordHistoryDepth,
                                    PasswordDaysMustKeep,
                                    PasswordDaysWarnBeforeExpire,
                                    DaysMustChangePasswordAfter,
                                    DaysExpireAfter};
    std::size_t found = 0;
    for (const auto id : texts) {
        std::string text;
        found += cursor.getProperty(id, text) ? 1U : 0U;
    }
    for (const auto id : numbers) {
        unsigned int number = 0;
        found += cursor.getProperty(id, number) ? 1U : 0U;
    }
    std::vector<unsigned int> rules;
    return found + (cursor.getProperty(PasswordRules, rules) ? 1U : 0U);
}

void setPerAccount(benchmark::State& state) {
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void Read(benchmark::State& state, Form form) {
    const ChosenPopulation population(state, form);
    for (auto step : state) {
        refresh();
    }
    setPerAccount(state);
}

void List(benchmark::State& state, Form form) {
    const ChosenPopulation population(state, form);
    for (auto step : state) {
        std::size_t found = 0;
        Instrumentation cursor;
        for (cursor.selectNode(UserAccount); cursor; ++cursor) {
            found += readAccount(cursor);
        }
        benchmark::DoNotOptimize(found);
    }
    setPerAccount(state);
}

void Select(benchmark::State& state, Form form) {
    const ChosenPopulation population(state, form);
    for (auto step : state) {
        Instrumentation cursor;
        benchmark::DoNotOptimize(cursor.selectNode(UserAccount));
    }
}

constexpr int few = 1'000;
constexpr int many = 50'000;

BENCHMARK_CAPTURE(Read, accounts, Form::accounts)
    ->Arg(few)
    ->Arg(many)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(Read, file, Form::file)->Arg(few)->Arg(many)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(List, accounts, Form::accounts)
    ->Arg(few)
    ->Arg(many)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(List, file, Form::file)->Arg(few)->Arg(many)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(Select, accounts, Form::accounts)
    ->Arg(few)
    ->Arg(many)
    ->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(Select, file, Form::file)->Arg(few)->Arg(many)->Unit(benchmark::kMicrosecond);

} // namespace

BENCHMARK_MAIN();
