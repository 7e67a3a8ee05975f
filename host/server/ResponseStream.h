// The body of one answer on its way from the thread that runs the provider to the thread that
// serves the connection. It holds little in memory: a writer waits for a reader that keeps
// up, and what a slow reader leaves goes to a file, so that a slow client holds neither
// memory nor a provider.
#pragma once

#include "SpillFile.h"

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <deque>
#include <functional>
#include <mutex>
#include <stdexcept>
#include <string>
#include <string_view>
#include <sys/types.h>

namespace qelo::server {

// Nobody wants the answer any more, or there is no room for it.
class ResponseAbandoned : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

class ResponseStream {
public:
    struct Limits {
        std::size_t head = 64UL * 1024;    // an answer up to this is sent as a whole
        std::size_t memory = 256UL * 1024; // kept in memory before the writer waits
        // A reader that takes less than `progress` bytes in this time is slow.
        std::chrono::milliseconds patience{50};
        std::size_t progress = 32UL * 1024;
        // How long to wait for a slow reader when there is no room in the file either.
        std::chrono::milliseconds stall{10'000};
    };

    // `headReady` is called once, by the writer, when the answer is complete, has failed or
    // has grown beyond `head`. It may not call back into the stream.
    ResponseStream(SpaceBudget& space, const Limits& limits, std::function<void()> headReady);

    // For the writer. write() throws ResponseAbandoned after cancel() or when no room can be
    // found in time. finish() and fail() end the answer, once.
    void write(std::string_view bytes);
    void finish() { end(State::Finished); }
    void fail() { end(State::Failed); }

    // Forgets what was written, when none of it can have been read yet; false otherwise.
    bool restart();

    // For the reader.
    static constexpr ssize_t endOfStream = -1;
    static constexpr ssize_t broken = -2;
    // Takes up to `size` bytes. With none there yet it calls `pause` and returns 0; `resume`
    // is then called, by the writer, when it makes sense to ask again, which it may do itself.
    ssize_t read(char* buffer, std::size_t size, const std::function<void()>& pause,
                 std::function<void()> resume);
    // Whether the whole answer is in memory; then takeAll() gives it.
    bool isWhole() const;
    std::string takeAll();
    // From any thread: the reader has gone.
    void cancel();

private:
    enum class State { Open, Finished, Failed };

    void end(State state);
    void makeRoom(std::unique_lock<std::mutex>& lock);
    bool waitForReader(std::unique_lock<std::mutex>& lock);
    void spill(std::unique_lock<std::mutex>& lock, std::string_view bytes);
    void announceHead(std::unique_lock<std::mutex>& lock);
    void wakeReader(std::unique_lock<std::mutex> lock);
    void forgetMemory();
    ssize_t takeFromMemory(char* buffer, std::size_t size);

    const Limits limits_;
    std::function<void()> headReady_;
    mutable std::mutex mutex_;
    std::condition_variable taken_; // the reader took something, or has gone
    State state_ = State::Open;
    bool cancelled_ = false;
    bool headAnnounced_ = false;
    std::function<void()> resume_;   // of a reader that waits
    std::deque<std::string> memory_; // as it was written
    std::size_t firstAt_ = 0;        // what stands before it in the first has been read
    std::size_t inMemory_ = 0;       // bytes that have not
    std::size_t delivered_ = 0;
    SpillFile file_; // behind the memory, in the order of the answer
};

} // namespace qelo::server
