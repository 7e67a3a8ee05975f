// The threads behind the server, and the watch over its connections.
#include <server/ConnectionWatch.h>
#include <server/Timers.h>
#include <server/WorkerPool.h>

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <future>
#include <poll.h>
#include <stdexcept>
#include <sys/socket.h>
#include <unistd.h>
#include <vector>

namespace {

using namespace std::chrono_literals;
using qelo::server::ConnectionWatch;
using qelo::server::Timers;
using qelo::server::WorkerPool;

TEST(WorkerPool, Everything_submitted_is_done_before_it_stops) {
    std::atomic<int> done{0};
    WorkerPool pool(3, 1000);
    for (int i = 0; i < 500; ++i) {
        ASSERT_TRUE(pool.submit([&] { ++done; }));
    }
    pool.stop();
    EXPECT_EQ(done, 500);
    EXPECT_FALSE(pool.submit([] {}));
}

TEST(WorkerPool, A_job_that_waits_does_not_hold_up_the_others) {
    WorkerPool pool(2, 10);
    std::promise<void> go;
    std::promise<void> second;
    pool.submit([gate = go.get_future().share()] { gate.wait(); });
    pool.submit([&] { second.set_value(); });
    EXPECT_EQ(second.get_future().wait_for(10s), std::future_status::ready);
    go.set_value();
    pool.stop();
}

TEST(WorkerPool, Jobs_beyond_the_backlog_are_refused) {
    WorkerPool pool(1, 2);
    std::promise<void> started;
    std::promise<void> go;
    pool.submit([&, gate = go.get_future().share()] {
        started.set_value();
        gate.wait();
    });
    started.get_future().wait();
    EXPECT_TRUE(pool.submit([] {}));
    EXPECT_TRUE(pool.submit([] {}));
    EXPECT_FALSE(pool.submit([] {}));
    go.set_value();
    pool.stop();
}

TEST(WorkerPool, A_job_that_throws_leaves_the_thread_at_work) {
    WorkerPool pool(1, 10);
    std::promise<void> second;
    pool.submit([] { throw std::runtime_error("lost"); });
    pool.submit([&] { second.set_value(); });
    EXPECT_EQ(second.get_future().wait_for(10s), std::future_status::ready);
}

TEST(Timers, Actions_come_in_the_order_of_their_times) {
    Timers timers;
    std::vector<int> order;
    std::promise<void> last;
    timers.after(30ms, [&] {
        order.push_back(2);
        last.set_value();
    });
    timers.after(1ms, [&] { order.push_back(1); });
    last.get_future().wait();
    EXPECT_EQ(order, (std::vector<int>{1, 2}));
}

TEST(Timers, What_is_due_later_is_done_at_the_end) {
    std::atomic<int> done{0};
    Timers timers;
    timers.after(1h, [&] { ++done; });
    timers.stop();
    EXPECT_EQ(done, 1);
    timers.after(1h, [&] { ++done; });
    EXPECT_EQ(done, 2);
}

class ConnectionWatchTest : public testing::Test {
protected:
    void SetUp() override { ASSERT_EQ(socketpair(AF_UNIX, SOCK_STREAM, 0, ends_), 0); }
    void TearDown() override {
        close(ends_[0]);
        close(ends_[1]);
    }
    bool isEnded() const {
        pollfd item = {ends_[1], POLLIN, 0};
        return poll(&item, 1, 0) == 1;
    }
    int ends_[2] = {-1, -1};
    ConnectionWatch watch_;
};

TEST_F(ConnectionWatchTest, A_connection_that_lasts_too_long_is_ended) {
    watch_.add(ends_[0], -1s);
    watch_.endLate();
    EXPECT_TRUE(isEnded());
}

TEST_F(ConnectionWatchTest, One_that_has_time_left_is_not) {
    watch_.add(ends_[0], 1h);
    watch_.endLate();
    EXPECT_FALSE(isEnded());
}

TEST_F(ConnectionWatchTest, One_that_is_allowed_more_is_not) {
    watch_.add(ends_[0], -1s);
    watch_.allowForEver(ends_[0]);
    watch_.endLate();
    EXPECT_FALSE(isEnded());
}

TEST_F(ConnectionWatchTest, One_that_was_removed_is_left_alone) {
    watch_.add(ends_[0], -1s);
    watch_.remove(ends_[0]);
    watch_.allow(ends_[0], -1s);
    watch_.endLate();
    EXPECT_FALSE(isEnded());
}

} // namespace
