// All operations of all classes, in many threads at once, through the built provider libraries
// and the real object manager, while the store and the configuration of the log change. Meant
// for the sanitizers as much as for the results: every answer is what one state of the store
// gives to a single request without any other at work.
#include "ChangingLog.h"
#include "ChangingStore.h"
#include "CommandLives.h"
#include "ConcurrentRun.h"
#include "MixedOperations.h"

#include "platform/commands/CommandTest.h"

#include "ScratchRoot.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iostream>
#include <random>
#include <set>

namespace qelo::test {
namespace {

using testing::IsEmpty;

constexpr const char* kOfOneState = "of one state";
constexpr const char* kWhileItChanged = "while the store changed";
constexpr const char* kBetweenFiles = "from between two files";

std::string endOf(const std::string& pair, bool far) {
    const std::size_t between = pair.find(kBetweenEnds);
    return far ? pair.substr(0, between) : pair.substr(between + 1);
}

std::set<std::string> endsOf(const Answer& answer, bool far) {
    std::set<std::string> ends;
    for (const std::string& pair : answer.results) {
        ends.insert(endOf(pair, far));
    }
    return ends;
}

// What an operation answers in each state of a store that stands still.
class Expectation {
public:
    void add(Answer answer) { ofStates_.push_back(std::move(answer)); }

    const Answer& of(std::size_t state) const { return ofStates_.at(state); }

    // The state that gives this answer.
    std::optional<std::size_t> stateOf(const Answer& answer) const {
        const auto found = std::find(ofStates_.begin(), ofStates_.end(), answer);
        return found == ofStates_.end() ? std::nullopt
                                        : std::optional<std::size_t>(found - ofStates_.begin());
    }

    // Whether it ties all objects of one state at the one end to all of one state at the other.
    bool isOfTwoStates(const Answer& answer) const {
        const std::set<std::string> far = endsOf(answer, true);
        const std::set<std::string> near = endsOf(answer, false);
        const std::set<std::string> pairs(answer.results.begin(), answer.results.end());
        return answer.status == 0 && pairs.size() == answer.results.size() &&
               pairs.size() == far.size() * near.size() && isEndOfAState(far, true) &&
               isEndOfAState(near, false);
    }

private:
    bool isEndOfAState(const std::set<std::string>& ends, bool far) const {
        return std::any_of(ofStates_.begin(), ofStates_.end(),
                           [&](const Answer& answer) { return endsOf(answer, far) == ends; });
    }

    std::vector<Answer> ofStates_;
};

void chooseStore(const std::string& choice) {
    ASSERT_EQ(::setenv("QELO_NODE_STORE", choice.c_str(), 1), 0);
}

class Concurrency : public testing::Test {
protected:
    Concurrency() { ChangingLog::instance().silence(); }

    void learn(ChangingStore& store) {
        ObjectManager manager;
        operations_ = mixedOperations(manager.router(), store.subjects());
        expected_.resize(operations_.size());
        for (std::size_t state = 0; state < store.states(); ++state) {
            store.putState(state);
            for (std::size_t i = 0; i < operations_.size(); ++i) {
                expected_[i].add(operations_[i].run(manager.router()));
            }
        }
        store.putState(0);
        EXPECT_THAT(manager.complaints(), IsEmpty());
    }

    // That the expectations tell one population from the other, and nothing is served twice.
    void expectLearnt() {
        for (std::size_t i = 0; i < operations_.size(); ++i) {
            SCOPED_TRACE(operations_[i].name());
            const Answer& first = expected_[i].of(0);
            const std::set<std::string> distinct(first.results.begin(), first.results.end());
            EXPECT_EQ(distinct.size(), first.results.size());
            const bool tells = operations_[i].kind.rfind("EnumInstance", 0) == 0 &&
                               (operations_[i].className == "ZANTH_Account" ||
                                operations_[i].className == "ZANTH_Group");
            if (tells) {
                EXPECT_GT(first.results.size(), 10U);
                EXPECT_FALSE(first == expected_[i].of(1));
            }
        }
    }

    void judge(std::size_t number, const Answer& answer, std::optional<std::size_t> held,
               Tally& verdicts) {
        const Expectation& expectation = expected_[number];
        const std::optional<std::size_t> state = expectation.stateOf(answer);
        bool right = false;
        if (held) {
            right = answer == expectation.of(*held);
            verdicts.count(kOfOneState);
        } else {
            right = state || (operations_[number].pairs && expectation.isOfTwoStates(answer));
            verdicts.count(state && *state > 1 ? kBetweenFiles : kWhileItChanged);
        }
        if (!right) {
            run_.findings().add(operations_[number].name() + ": " + describe(answer) +
                                "\n in state " + (held ? std::to_string(*held) : "unknown"));
        }
    }

    // One thread's requests: all operations again and again, each round in another order.
    void ask(broker::Router& router, std::size_t thread, Tally& tally, Tally& verdicts) {
        std::mt19937 random(static_cast<std::mt19937::result_type>(thread));
        std::vector<std::size_t> order(operations_.size());
        for (std::size_t i = 0; i < order.size(); ++i) {
            order[i] = i;
        }
        while (run_.goesOn()) {
            std::shuffle(order.begin(), order.end(), random);
            for (const std::size_t number : order) {
                if (!run_.goesOn()) {
                    return;
                }
                const std::uint64_t first = turns_.now();
                const Answer answer = operations_[number].run(router);
                judge(number, answer, Turns::heldBetween(first, turns_.now()), verdicts);
                tally.count(operations_[number].kind);
            }
        }
    }

    void disturb(ChangingStore& store) {
        // The long ones follow the slow changes of the account files.
        constexpr std::array<int, 8> pauses = {30, 1, 40, 5, 0, 12, 60, 300};
        for (std::uint64_t turn = 1; run_.goesOn(); ++turn) {
            turns_.begin();
            store.change(turn);
            turns_.end();
            run_.pause(std::chrono::milliseconds(pauses[turn % pauses.size()]));
        }
        changes_ = turns_.now() / 2;
    }

    void disturbLog() {
        while (run_.goesOn()) {
            ChangingLog::instance().turn();
            run_.pause(std::chrono::milliseconds(1200));
        }
    }

    void expectGoodLog() {
        ChangingLog& log = ChangingLog::instance();
        log.finish();
        EXPECT_GT(log.lines(), 0U);
        EXPECT_THAT(log.faulty(), IsEmpty());
        std::cout << "[  SWEEP   ]   lines logged and traced: " << log.lines() << "\n";
    }

    void serveWhileItChanges(ChangingStore& store, const std::string& title) {
        chooseStore(store.choice());
        learn(store);
        expectLearnt();
        // A new one, whose providers are loaded by many threads at once.
        ObjectManager manager;
        std::vector<Tally> verdicts(kConcurrentThreads);
        run_.restart();
        run_.run([&](std::size_t thread,
                     Tally& tally) { ask(manager.router(), thread, tally, verdicts[thread]); },
                 {[&] { disturb(store); }, [&] { disturbLog(); }});
        run_.tell(title);
        tellVerdicts(verdicts);
        expectGoodLog();
        EXPECT_THAT(run_.findings().texts(), IsEmpty());
        EXPECT_THAT(manager.complaints(), IsEmpty());
        for (const Operation& operation : operations_) {
            EXPECT_GT(run_.tally().of(operation.kind), 0U) << operation.kind;
        }
    }

    void tellVerdicts(const std::vector<Tally>& verdicts) {
        Tally all;
        for (const Tally& verdict : verdicts) {
            all.add(verdict);
        }
        for (const auto& [verdict, times] : all.counts()) {
            std::cout << "[  SWEEP   ]   answers " << verdict << ": " << times << "\n";
        }
        std::cout << "[  SWEEP   ]   changes of the store: " << changes_ << "\n";
        EXPECT_GT(all.of(kOfOneState), 0U);
        EXPECT_GT(all.of(kWhileItChanged), 0U);
        EXPECT_GT(changes_, 10U);
    }

    ScratchDirectory scratch_;
    ConcurrentRun run_;
    Turns turns_;
    std::uint64_t changes_ = 0;
    std::vector<Operation> operations_;
    std::vector<Expectation> expected_;
};

TEST_F(Concurrency, Every_answer_is_one_state_of_account_files_that_are_replaced) {
    ChangingAccounts store(scratch_.path() / "root");
    serveWhileItChanges(store, "account files replaced");
}

TEST_F(Concurrency, Every_answer_is_one_state_of_a_node_file_that_is_replaced) {
    ChangingNodeFile store(scratch_.path() / "nodes");
    serveWhileItChanges(store, "node file replaced");
}

TEST_F(Concurrency, Every_thread_finds_what_its_own_methods_did) {
    const std::filesystem::path root = scratch_.path() / "root";
    ASSERT_TRUE(store::initRoot(root).accepted);
    chooseStore("accounts:" + root.native());
    ObjectManager manager;
    const CommandLives lives(manager.router(), run_.findings());
    const auto before = stateOf(root);
    run_.restart();
    run_.run([&](std::size_t thread, Tally& tally) { lives.live(thread, run_, tally); },
             {[&] { disturbLog(); }});
    run_.tell("accounts created, changed and deleted");
    expectGoodLog();
    EXPECT_THAT(run_.findings().texts(), IsEmpty());
    EXPECT_THAT(manager.complaints(), IsEmpty());
    EXPECT_THAT(findFaults(root), IsEmpty());
    EXPECT_EQ(stateOf(root), before);
    lives.expectAllKinds(run_.tally());
}

} // namespace
} // namespace qelo::test
