#include "ResponseStream.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace qelo::server {

ResponseStream::ResponseStream(SpaceBudget& space, const Limits& limits,
                               std::function<void()> headReady)
    : limits_(limits), headReady_(std::move(headReady)), file_(space) {}

void ResponseStream::write(std::string_view bytes) {
    std::unique_lock<std::mutex> lock(mutex_);
    makeRoom(lock);
    if (cancelled_) {
        throw ResponseAbandoned("the client has gone");
    }
    // What goes to the file stays behind what is there already.
    if (!file_.empty() || inMemory() >= limits_.memory) {
        spill(lock, bytes);
    } else {
        memory_.append(bytes);
    }
    if (inMemory() > limits_.head) {
        announceHead(lock);
    }
    wakeReader();
}

bool ResponseStream::restart() {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (headAnnounced_ || cancelled_) {
        return false;
    }
    memory_.clear();
    return true;
}

void ResponseStream::end(State state) {
    std::unique_lock<std::mutex> lock(mutex_);
    state_ = state;
    announceHead(lock);
    wakeReader();
}

// Waits for a reader that keeps up; a slow one makes the caller go on to the file.
void ResponseStream::makeRoom(std::unique_lock<std::mutex>& lock) {
    while (!cancelled_ && file_.empty() && inMemory() >= limits_.memory) {
        if (!waitForReader(lock)) {
            return;
        }
    }
}

// Whether the reader made progress.
bool ResponseStream::waitForReader(std::unique_lock<std::mutex>& lock) {
    const std::size_t before = delivered_;
    const auto goesOn = [&] { return cancelled_ || delivered_ - before >= limits_.progress; };
    return taken_.wait_for(lock, limits_.patience, goesOn);
}

void ResponseStream::spill(std::unique_lock<std::mutex>& lock, std::string_view bytes) {
    const auto stored = [&] { return cancelled_ || file_.append(bytes); };
    if (!taken_.wait_for(lock, limits_.stall, stored)) {
        throw ResponseAbandoned("the client does not take the answer, and there is no more room");
    }
    if (cancelled_) {
        throw ResponseAbandoned("the client has gone");
    }
}

void ResponseStream::announceHead(std::unique_lock<std::mutex>& lock) {
    if (headAnnounced_) {
        return;
    }
    headAnnounced_ = true;
    // The reader may ask at once.
    lock.unlock();
    headReady_();
    lock.lock();
}

void ResponseStream::wakeReader() {
    if (resume_) {
        std::exchange(resume_, nullptr)();
    }
}

ssize_t ResponseStream::read(char* buffer, std::size_t size, const std::function<void()>& pause,
                             std::function<void()> resume) {
    const std::lock_guard<std::mutex> lock(mutex_);
    ssize_t got = inMemory() > 0 ? takeFromMemory(buffer, size) : file_.take(buffer, size);
    if (got > 0) {
        delivered_ += static_cast<std::size_t>(got);
        taken_.notify_one();
        return got;
    }
    if (got < 0 || state_ == State::Failed) {
        return broken;
    }
    if (state_ == State::Finished) {
        return endOfStream;
    }
    pause();
    resume_ = std::move(resume);
    return 0;
}

ssize_t ResponseStream::takeFromMemory(char* buffer, std::size_t size) {
    const std::size_t count = std::min(size, inMemory());
    std::memcpy(buffer, memory_.data() + memoryAt_, count);
    memoryAt_ += count;
    // Moving what is left to the front pays once enough has been read.
    if (memoryAt_ == memory_.size() || memoryAt_ >= limits_.head) {
        memory_.erase(0, memoryAt_);
        memoryAt_ = 0;
    }
    return static_cast<ssize_t>(count);
}

bool ResponseStream::isWhole() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return state_ == State::Finished && file_.empty();
}

std::string ResponseStream::takeAll() {
    const std::lock_guard<std::mutex> lock(mutex_);
    memory_.erase(0, memoryAt_);
    memoryAt_ = 0;
    return std::exchange(memory_, std::string());
}

void ResponseStream::cancel() {
    const std::lock_guard<std::mutex> lock(mutex_);
    cancelled_ = true;
    taken_.notify_one();
}

} // namespace qelo::server
