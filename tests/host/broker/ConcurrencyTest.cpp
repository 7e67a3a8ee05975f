// Several clients at once, and helper threads inside one call. Meant for the thread sanitizer
// as much as for the results.
#include "BrokerFixture.h"
#include "DispatcherFixture.h"

#include <atomic>
#include <thread>

namespace qelo::broker::testing {
namespace {

class ConcurrencyTest : public DispatcherTest {};

TEST_F(ConcurrencyTest, Requests_of_many_threads_do_not_disturb_each_other) {
    std::atomic<int> wrong{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < 6; ++t) {
        threads.emplace_back([&, t] {
            const OperationContext context = {"user" + std::to_string(t), "", "", "", 0};
            LocalConnection mine(dispatcher, context);
            for (int i = 0; i < 30; ++i) {
                int seen = 0;
                mine.enumerateInstances(classPath("TEST_Widget"), {},
                                        [&](const cim::Instance&) { ++seen; });
                wrong += seen == 2 ? 0 : 1;
                const auto who = mine.invokeMethod(widget("one"), "WhoAmIByUpCall", {});
                wrong += who.returnValue.asString() == context.principal + "//" ? 0 : 1;
                mine.associatorNames(widget("one"), {"", "", "First", ""}, [](const auto&) {});
                if (i % 10 == 0) {
                    mine.invokeMethod(widget("one"), "EnumerateInThread", {});
                }
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(wrong, 0);
    EXPECT_EQ(log().size(), 2U); // one call of each factory that tells
}

class SharedCallTest : public BrokerTest {};

TEST_F(SharedCallTest, Helper_threads_may_fill_different_objects_of_one_call) {
    std::vector<CMPIInstance*> made;
    for (int i = 0; i < 4; ++i) {
        made.push_back(instance());
    }
    std::vector<std::thread> threads;
    for (CMPIInstance* mine : made) {
        threads.emplace_back([mine] {
            for (int i = 0; i < 200; ++i) {
                const std::string name = "P" + std::to_string(i);
                mine->ft->setProperty(mine, name.c_str(), chars(name.c_str()), CMPI_chars);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (const CMPIInstance* filled : made) {
        EXPECT_EQ(filled->ft->getPropertyCount(filled, nullptr), 200U);
        EXPECT_EQ(text(filled->ft->getProperty(filled, "p199", nullptr).value.string), "P199");
    }
}

} // namespace
} // namespace qelo::broker::testing
