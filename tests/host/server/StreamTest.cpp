// Answers on their way from a provider to a client.
#include <server/ResponseStream.h>
#include <server/SpillFile.h>

#include <gtest/gtest.h>

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>

namespace {

using namespace std::chrono_literals;
using qelo::server::ResponseAbandoned;
using qelo::server::ResponseStream;
using qelo::server::SpaceBudget;
using qelo::server::SpillFile;

constexpr std::size_t kPlenty = 64UL * 1024 * 1024;

// Bytes whose place can be told, so that a swap or a loss shows.
std::string pattern(std::size_t from, std::size_t size) {
    std::string text;
    text.reserve(size);
    for (std::size_t i = from; i < from + size; ++i) {
        text += static_cast<char>('a' + i * 7 % 26);
    }
    return text;
}

// A reader that waits in its own thread as long as it is told to.
class Reader {
public:
    explicit Reader(ResponseStream& stream) : stream_(stream) {}

    // Reads until the stream ends, at most `most` bytes.
    std::string read(std::size_t most = SIZE_MAX) {
        std::string all;
        char buffer[1000];
        while (all.size() < most) {
            const ssize_t got = stream_.read(
                buffer, sizeof buffer, [this] { pause(); }, [this] { wake(); });
            if (got < 0) {
                ended_ = got;
                break;
            }
            all.append(buffer, static_cast<std::size_t>(got));
            if (got == 0) {
                waitForWake();
            }
        }
        return all;
    }

    ssize_t ended() const { return ended_; }

private:
    void pause() {
        const std::lock_guard<std::mutex> lock(mutex_);
        awake_ = false;
    }
    void wake() {
        const std::lock_guard<std::mutex> lock(mutex_);
        awake_ = true;
        changed_.notify_all();
    }
    void waitForWake() {
        std::unique_lock<std::mutex> lock(mutex_);
        changed_.wait(lock, [this] { return awake_; });
    }

    ResponseStream& stream_;
    std::mutex mutex_;
    std::condition_variable changed_;
    bool awake_ = true;
    ssize_t ended_ = 0;
};

ResponseStream::Limits smallLimits() {
    ResponseStream::Limits limits;
    limits.head = 1000;
    limits.memory = 4000;
    limits.patience = 5ms;
    limits.progress = 500;
    limits.stall = 100ms;
    return limits;
}

TEST(SpillFile, Bytes_come_out_in_the_order_in_which_they_went_in) {
    SpaceBudget space(kPlenty);
    SpillFile file(space);
    ASSERT_TRUE(file.append(pattern(0, 5000)));
    ASSERT_TRUE(file.append(pattern(5000, 5000)));
    std::string all;
    char buffer[777];
    for (ssize_t got = file.take(buffer, sizeof buffer); got > 0;
         got = file.take(buffer, sizeof buffer)) {
        all.append(buffer, static_cast<std::size_t>(got));
    }
    EXPECT_EQ(all, pattern(0, 10000));
    EXPECT_TRUE(file.empty());
    EXPECT_EQ(space.taken(), 0U);
}

TEST(SpillFile, Takes_no_more_than_there_is_room_for_and_gives_its_room_back) {
    SpaceBudget space(1000);
    {
        SpillFile first(space);
        SpillFile second(space);
        EXPECT_TRUE(first.append(pattern(0, 900)));
        EXPECT_FALSE(second.append(pattern(0, 200)));
        EXPECT_TRUE(second.empty());
        EXPECT_TRUE(second.append(pattern(0, 100)));
        EXPECT_EQ(space.taken(), 1000U);
    }
    EXPECT_EQ(space.taken(), 0U);
}

TEST(ResponseStream, A_small_answer_is_whole_and_announced_at_its_end) {
    SpaceBudget space(kPlenty);
    int announced = 0;
    ResponseStream stream(space, smallLimits(), [&] { ++announced; });
    stream.write("one ");
    stream.write("two");
    EXPECT_EQ(announced, 0);
    EXPECT_FALSE(stream.isWhole());
    stream.finish();
    EXPECT_EQ(announced, 1);
    ASSERT_TRUE(stream.isWhole());
    EXPECT_EQ(stream.takeAll(), "one two");
}

TEST(ResponseStream, A_larger_answer_is_announced_before_its_end_and_only_once) {
    SpaceBudget space(kPlenty);
    int announced = 0;
    ResponseStream stream(space, smallLimits(), [&] { ++announced; });
    stream.write(pattern(0, 1500));
    EXPECT_EQ(announced, 1);
    stream.write(pattern(1500, 1500));
    stream.finish();
    EXPECT_EQ(announced, 1);
    Reader reader(stream);
    EXPECT_EQ(reader.read(), pattern(0, 3000));
    EXPECT_EQ(reader.ended(), ResponseStream::endOfStream);
}

TEST(ResponseStream, What_has_not_been_announced_can_be_taken_back) {
    SpaceBudget space(kPlenty);
    ResponseStream stream(space, smallLimits(), [] {});
    stream.write("half an answer");
    ASSERT_TRUE(stream.restart());
    stream.write("an error");
    stream.finish();
    EXPECT_EQ(stream.takeAll(), "an error");
}

TEST(ResponseStream, What_has_been_announced_cannot_be_taken_back) {
    SpaceBudget space(kPlenty);
    ResponseStream stream(space, smallLimits(), [] {});
    stream.write(pattern(0, 1500));
    EXPECT_FALSE(stream.restart());
}

TEST(ResponseStream, A_reader_that_keeps_up_gets_everything_without_a_file) {
    SpaceBudget space(1); // any use of a file fails
    ResponseStream::Limits limits = smallLimits();
    limits.patience = 5s;
    ResponseStream stream(space, limits, [] {});
    std::thread writer([&] {
        for (std::size_t at = 0; at < 200'000; at += 1000) {
            stream.write(pattern(at, 1000));
        }
        stream.finish();
    });
    Reader reader(stream);
    EXPECT_EQ(reader.read(), pattern(0, 200'000));
    writer.join();
}

TEST(ResponseStream, A_reader_that_does_not_read_keeps_the_writer_only_for_a_moment) {
    SpaceBudget space(kPlenty);
    ResponseStream stream(space, smallLimits(), [] {});
    const auto start = std::chrono::steady_clock::now();
    for (std::size_t at = 0; at < 1'000'000; at += 1000) {
        stream.write(pattern(at, 1000));
    }
    stream.finish();
    EXPECT_LT(std::chrono::steady_clock::now() - start, 20s);
    EXPECT_GT(space.taken(), 900'000U);
    Reader reader(stream);
    EXPECT_EQ(reader.read(), pattern(0, 1'000'000));
    EXPECT_EQ(space.taken(), 0U);
}

TEST(ResponseStream, A_reader_may_be_slow_then_quick_then_slow_again) {
    SpaceBudget space(kPlenty);
    ResponseStream stream(space, smallLimits(), [] {});
    Reader reader(stream);
    std::string all;
    std::size_t written = 0;
    for (int round = 0; round < 5; ++round) {
        for (int i = 0; i < 20; ++i, written += 1000) {
            stream.write(pattern(written, 1000));
        }
        all += reader.read(written - all.size());
    }
    stream.finish();
    all += reader.read();
    EXPECT_EQ(all, pattern(0, written));
}

TEST(ResponseStream, Without_any_room_the_answer_is_given_up) {
    SpaceBudget space(1);
    ResponseStream stream(space, smallLimits(), [] {});
    EXPECT_THROW(
        {
            for (int i = 0; i < 100; ++i) {
                stream.write(pattern(0, 1000));
            }
        },
        ResponseAbandoned);
}

TEST(ResponseStream, A_writer_that_waits_learns_that_the_reader_has_gone) {
    SpaceBudget space(1);
    ResponseStream::Limits limits = smallLimits();
    limits.patience = 60s;
    ResponseStream stream(space, limits, [] {});
    std::thread canceller([&] {
        std::this_thread::sleep_for(20ms);
        stream.cancel();
    });
    EXPECT_THROW(
        {
            for (int i = 0; i < 100; ++i) {
                stream.write(pattern(0, 1000));
            }
        },
        ResponseAbandoned);
    canceller.join();
}

TEST(ResponseStream, A_failed_answer_ends_as_broken_after_what_was_written) {
    SpaceBudget space(kPlenty);
    ResponseStream stream(space, smallLimits(), [] {});
    stream.write(pattern(0, 1500));
    stream.fail();
    EXPECT_FALSE(stream.isWhole());
    Reader reader(stream);
    EXPECT_EQ(reader.read(), pattern(0, 1500));
    EXPECT_EQ(reader.ended(), ResponseStream::broken);
}

TEST(ResponseStream, A_reader_may_read_as_soon_as_it_is_woken) {
    SpaceBudget space(kPlenty);
    ResponseStream stream(space, smallLimits(), [] {});
    char buffer[100];
    ssize_t got = 0;
    const auto readAgain = [&] {
        got = stream.read(
            buffer, sizeof buffer, [] {}, [] {});
    };
    ASSERT_EQ(stream.read(
                  buffer, sizeof buffer, [] {}, readAgain),
              0);
    stream.write("text");
    EXPECT_EQ(got, 4);
}

TEST(ResponseStream, A_writer_that_waits_goes_on_once_half_has_been_read) {
    SpaceBudget space(kPlenty);
    ResponseStream::Limits limits = smallLimits();
    limits.patience = 600s;
    ResponseStream stream(space, limits, [] {});
    stream.write(pattern(0, 4000));
    std::thread writer([&] {
        stream.write(pattern(4000, 1000));
        stream.finish();
    });
    Reader reader(stream);
    std::string all = reader.read(2000);
    writer.join(); // hangs if nothing wakes it
    all += reader.read();
    EXPECT_EQ(all, pattern(0, 5000));
}

} // namespace
