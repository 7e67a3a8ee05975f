// Threads, mutexes, conditions, keys and the rest of the operating system's table.
#include "BrokerFixture.h"

#include <atomic>
#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <ctime>
#include <stdexcept>

namespace qelo::broker::testing {
namespace {

class SystemTest : public BrokerTest {
protected:
    const CMPIBrokerExtFT& xft() { return *mb()->xft; }
};

std::atomic<int> counter{0};

TEST_F(SystemTest, A_library_name_is_completed) {
    char* name = xft().resolveFileName("thing");
    EXPECT_STREQ(name, "libthing.so");
    std::free(name);
    EXPECT_EQ(xft().resolveFileName(nullptr), nullptr);
}

TEST_F(SystemTest, A_thread_runs_and_is_joined_for_its_result) {
    static int result = 0;
    CMPI_THREAD_TYPE thread = xft().newThread(
        [](void* parm) -> void* {
            *static_cast<int*>(parm) = 5;
            return parm;
        },
        &result, 0);
    ASSERT_NE(thread, nullptr);
    void* code = nullptr;
    EXPECT_EQ(xft().joinThread(thread, &code), 0);
    EXPECT_EQ(code, &result);
    EXPECT_EQ(result, 5);
}

TEST_F(SystemTest, A_detached_thread_runs_on_its_own) {
    counter = 0;
    ASSERT_NE(xft().newThread(
                  [](void*) -> void* {
                      ++counter;
                      return nullptr;
                  },
                  nullptr, 1),
              nullptr);
    for (int i = 0; i < 500 && counter == 0; ++i) {
        xft().threadSleep(10);
    }
    EXPECT_EQ(counter, 1);
}

TEST_F(SystemTest, A_thread_can_end_itself_early) {
    static const CMPIBrokerExtFT* table = nullptr;
    table = mb()->xft;
    static int mark = 0;
    CMPI_THREAD_TYPE thread = xft().newThread(
        [](void*) -> void* {
            table->exitThread(&mark);
            return nullptr;
        },
        nullptr, 0);
    void* code = nullptr;
    EXPECT_EQ(xft().joinThread(thread, &code), 0);
    EXPECT_EQ(code, &mark);
}

TEST_F(SystemTest, A_thread_can_be_cancelled_from_outside) {
    static const CMPIBrokerExtFT* table = nullptr;
    table = mb()->xft;
    CMPI_THREAD_TYPE thread = xft().newThread(
        [](void*) -> void* {
            for (;;) {
                table->threadSleep(10);
            }
        },
        nullptr, 0);
    EXPECT_EQ(xft().cancelThread(thread), 0);
    EXPECT_EQ(xft().joinThread(thread, nullptr), 0);
}

TEST_F(SystemTest, An_exception_ends_the_thread_but_not_the_process) {
    CMPI_THREAD_TYPE thread =
        xft().newThread([](void*) -> void* { throw std::runtime_error("escaped"); }, nullptr, 0);
    EXPECT_EQ(xft().joinThread(thread, nullptr), 0);
}

TEST_F(SystemTest, Missing_threads_are_errors) {
    EXPECT_EQ(xft().newThread(nullptr, nullptr, 0), nullptr);
    EXPECT_EQ(xft().joinThread(nullptr, nullptr), ESRCH);
    EXPECT_EQ(xft().cancelThread(nullptr), ESRCH);
}

TEST_F(SystemTest, Sleep_lasts_at_least_as_long_as_asked) {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(xft().threadSleep(20), 0);
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(20));
    EXPECT_EQ(xft().threadSleep(0), 0);
}

TEST_F(SystemTest, Once_runs_once) {
    int once = 0;
    counter = 0;
    const auto count = [] { ++counter; };
    EXPECT_EQ(xft().threadOnce(&once, count), 0);
    EXPECT_EQ(xft().threadOnce(&once, count), 0);
    EXPECT_EQ(counter, 1);
    EXPECT_EQ(xft().threadOnce(nullptr, count), EINVAL);
    EXPECT_EQ(xft().threadOnce(&once, nullptr), EINVAL);
}

TEST_F(SystemTest, Keys_hold_a_value_per_thread_and_clean_it_up) {
    static CMPI_THREAD_KEY_TYPE key = 0;
    static const CMPIBrokerExtFT* table = nullptr;
    table = mb()->xft;
    counter = 0;
    ASSERT_EQ(xft().createThreadKey(&key, [](void*) { ++counter; }), 0);
    int mine = 0;
    EXPECT_EQ(xft().setThreadSpecific(key, &mine), 0);
    CMPI_THREAD_TYPE thread = xft().newThread(
        [](void* parm) -> void* {
            void* before = table->getThreadSpecific(key);
            table->setThreadSpecific(key, parm);
            return before;
        },
        &mine, 0);
    void* before = &mine;
    EXPECT_EQ(xft().joinThread(thread, &before), 0);
    EXPECT_EQ(before, nullptr);
    EXPECT_EQ(counter, 1);
    EXPECT_EQ(xft().getThreadSpecific(key), &mine);
    EXPECT_EQ(xft().setThreadSpecific(key, nullptr), 0);
    EXPECT_EQ(xft().destroyThreadKey(key), 0);
    EXPECT_NE(xft().destroyThreadKey(key), 0);
    EXPECT_EQ(xft().createThreadKey(nullptr, nullptr), EINVAL);
}

TEST_F(SystemTest, A_mutex_can_be_locked_again_by_its_owner_and_excludes_others) {
    struct Shared {
        const CMPIBrokerExtFT* table;
        CMPI_MUTEX_TYPE mutex;
        int value = 0;
    };
    Shared shared = {mb()->xft, xft().newMutex(0)};
    ASSERT_NE(shared.mutex, nullptr);
    xft().lockMutex(shared.mutex);
    xft().lockMutex(shared.mutex);
    CMPI_THREAD_TYPE thread = xft().newThread(
        [](void* parm) -> void* {
            auto* given = static_cast<Shared*>(parm);
            given->table->lockMutex(given->mutex);
            given->value *= 2;
            given->table->unlockMutex(given->mutex);
            return nullptr;
        },
        &shared, 0);
    xft().unlockMutex(shared.mutex);
    xft().threadSleep(20); // still held once
    shared.value = 21;
    xft().unlockMutex(shared.mutex);
    xft().joinThread(thread, nullptr);
    EXPECT_EQ(shared.value, 42);
    xft().destroyMutex(shared.mutex);
}

TEST_F(SystemTest, A_condition_wakes_who_waits) {
    struct Shared {
        const CMPIBrokerExtFT* table;
        CMPI_MUTEX_TYPE mutex;
        CMPI_COND_TYPE condition;
        bool ready = false;
    };
    Shared shared = {mb()->xft, xft().newMutex(0), xft().newCondition(0)};
    ASSERT_NE(shared.condition, nullptr);
    xft().lockMutex(shared.mutex);
    CMPI_THREAD_TYPE thread = xft().newThread(
        [](void* parm) -> void* {
            auto* given = static_cast<Shared*>(parm);
            given->table->lockMutex(given->mutex);
            given->ready = true;
            given->table->signalCondition(given->condition);
            given->table->unlockMutex(given->mutex);
            return nullptr;
        },
        &shared, 0);
    while (!shared.ready) {
        EXPECT_EQ(xft().condWait(shared.condition, shared.mutex), 0);
    }
    timespec past = {};
    past.tv_sec = std::time(nullptr) - 1;
    EXPECT_EQ(xft().timedCondWait(shared.condition, shared.mutex, &past), ETIMEDOUT);
    xft().unlockMutex(shared.mutex);
    xft().joinThread(thread, nullptr);
    xft().destroyCondition(shared.condition);
    xft().destroyMutex(shared.mutex);
}

TEST_F(SystemTest, Missing_mutexes_and_conditions_do_no_harm) {
    xft().lockMutex(nullptr);
    xft().unlockMutex(nullptr);
    xft().destroyMutex(nullptr);
    xft().destroyCondition(nullptr);
    timespec now = {};
    EXPECT_EQ(xft().condWait(nullptr, nullptr), EINVAL);
    EXPECT_EQ(xft().timedCondWait(nullptr, nullptr, &now), EINVAL);
    EXPECT_EQ(xft().signalCondition(nullptr), EINVAL);
}

} // namespace
} // namespace qelo::broker::testing
