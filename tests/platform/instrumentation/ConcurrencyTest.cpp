#include "StoreListing.h"
#include "TestLog.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;

constexpr int readers = 4;
constexpr int rounds = 60;

std::string accountsUpTo(int count) {
    std::string content;
    for (int i = 0; i < count; ++i) {
        content += "u" + std::to_string(i) + ":x:" + std::to_string(count) + ":1:::\n";
    }
    return content;
}

// True when the listing is one state of the file and no mixture: each account carries the
// number of accounts as its user id.
bool isWhole(const std::shared_ptr<NodeStore>& store) {
    NodeCursor cursor(store);
    unsigned int count = 0;
    std::string user;
    bool same = true;
    for (cursor.select(UserAccount); cursor.valid(); cursor.advance(), ++count) {
        same = same && cursor.read(UserID, user) && user == std::to_string(cursor.size());
    }
    return same && count == cursor.size() && count > 0;
}

} // namespace

TEST(Concurrency, Each_cursor_sees_one_whole_state_while_files_are_replaced) {
    const ScratchRoot root;
    root.write("etc/group", "");
    root.write("etc/passwd", accountsUpTo(10));
    const auto store = storeOf(root);
    std::atomic<bool> stop = false;
    std::atomic<int> broken = 0;
    std::vector<std::thread> threads;
    for (int i = 0; i < readers; ++i) {
        threads.emplace_back([&] {
            while (!stop) {
                broken += isWhole(store) ? 0 : 1;
            }
        });
    }
    threads.emplace_back([&] {
        while (!stop) {
            store->refresh();
        }
    });
    for (int round = 0; round < rounds; ++round) {
        root.replace("etc/passwd", accountsUpTo(10 + round * 7));
    }
    stop = true;
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(broken, 0);
    EXPECT_EQ(namesOf(store, UserAccount).size(), 10U + (rounds - 1) * 7U);
    clearLog();
}

TEST(Concurrency, Stores_can_be_chosen_by_many_threads) {
    const ScratchRoot root;
    root.write("etc/passwd", accountsUpTo(3));
    root.write("etc/group", "");
    const ScopedVariable variable("QELO_NODE_STORE", root.choice());
    std::atomic<int> wrong = 0;
    std::vector<std::thread> threads;
    for (int i = 0; i < readers; ++i) {
        threads.emplace_back([&] {
            for (int round = 0; round < rounds; ++round) {
                wrong += isWhole(chosenStore()) ? 0 : 1;
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(wrong, 0);
    clearLog();
}

} // namespace qelo::nodes::tests
