#include "ResponseStream.h"

#include <algorithm>
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
    if (!file_.empty() || inMemory_ >= limits_.memory) {
        spill(lock, bytes);
    } else {
        memory_.emplace_back(bytes);
        inMemory_ += bytes.size();
    }
    if (inMemory_ > limits_.head) {
        announceHead(lock);
    }
    wakeReader(std::move(lock));
}

bool ResponseStream::restart() {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (headAnnounced_ || cancelled_) {
        return false;
    }
    forgetMemory();
    return true;
}

void ResponseStream::end(State state) {
    std::unique_lock<std::mutex> lock(mutex_);
    state_ = state;
    announceHead(lock);
    wakeReader(std::move(lock));
}

// Waits for a reader that keeps up; a slow one makes the caller go on to the file.
void ResponseStream::makeRoom(std::unique_lock<std::mutex>& lock) {
    while (!cancelled_ && file_.empty() && inMemory_ >= limits_.memory) {
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

// The reader may ask at once, and would wait for the lock.
void ResponseStream::wakeReader(std::unique_lock<std::mutex> lock) {
    if (resume_) {
        const auto resume = std::exchange(resume_, nullptr);
        lock.unlock();
        resume();
    }
}

ssize_t ResponseStream::read(char* buffer, std::size_t size, const std::function<void()>& pause,
                             std::function<void()> resume) {
    const std::lock_guard<std::mutex> lock(mutex_);
    ssize_t got = inMemory_ > 0 ? takeFromMemory(buffer, size) : file_.take(buffer, size);
    if (got > 0) {
        delivered_ += static_cast<std::size_t>(got);
        // A writer that goes on for every piece would be woken for every piece.
        if (inMemory_ <= limits_.memory / 2) {
            taken_.notify_one();
        }
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
    std::size_t taken = 0;
    while (taken < size && !memory_.empty()) {
        const std::string& first = memory_.front();
        const std::size_t count = std::min(size - taken, first.size() - firstAt_);
        first.copy(buffer + taken, count, firstAt_);
        taken += count;
        firstAt_ += count;
        if (firstAt_ == first.size()) {
            memory_.pop_front();
            firstAt_ = 0;
        }
    }
    inMemory_ -= taken;
    return static_cast<ssize_t>(taken);
}

void ResponseStream::forgetMemory() {
    memory_.clear();
    firstAt_ = 0;
    inMemory_ = 0;
}

bool ResponseStream::isWhole() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return state_ == State::Finished && file_.empty();
}

std::string ResponseStream::takeAll() {
    const std::lock_guard<std::mutex> lock(mutex_);
    std::string all;
    all.reserve(inMemory_);
    for (const std::string& piece : memory_) {
        all.append(piece, std::exchange(firstAt_, 0), std::string::npos);
    }
    forgetMemory();
    return all;
}

void ResponseStream::cancel() {
    const std::lock_guard<std::mutex> lock(mutex_);
    cancelled_ = true;
    taken_.notify_one();
}

} // namespace qelo::server
