#include "logging/HeldLines.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>

#include <pthread.h>
#include <time.h>

namespace qelo::logging {
namespace {

// Long enough for a busy thread to fill its buffer, too short for a reader to notice.
constexpr timespec kDelay{0, 10L * 1000 * 1000};

constexpr std::size_t kStackSize = std::size_t{64} * 1024;

// The process's signals are its own threads' business.
class SignalsBlocked {
public:
    SignalsBlocked() {
        sigset_t all;
        ::sigfillset(&all);
        ::pthread_sigmask(SIG_SETMASK, &all, &before_);
    }
    ~SignalsBlocked() { ::pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
    SignalsBlocked(const SignalsBlocked&) = delete;
    SignalsBlocked& operator=(const SignalsBlocked&) = delete;

private:
    sigset_t before_{};
};

class ThreadAttributes {
public:
    ThreadAttributes() {
        ::pthread_attr_init(&attributes_);
        ::pthread_attr_setdetachstate(&attributes_, PTHREAD_CREATE_DETACHED);
        ::pthread_attr_setstacksize(&attributes_, kStackSize);
    }
    ~ThreadAttributes() { ::pthread_attr_destroy(&attributes_); }
    ThreadAttributes(const ThreadAttributes&) = delete;
    ThreadAttributes& operator=(const ThreadAttributes&) = delete;

    const pthread_attr_t* get() const { return &attributes_; }

private:
    pthread_attr_t attributes_{};
};

} // namespace

HeldLines& HeldLines::instance() {
    static auto* const lines = new HeldLines;
    return *lines;
}

HeldLines::HeldLines() {
    ::sem_init(&wake_, 0, 0);
    ::pthread_atfork(&beforeFork, &afterForkInParent, &afterForkInChild);
    // Refused, the lines of the last moment are lost.
    (void)std::atexit(&atExit);
}

void HeldLines::add(LineHolder& holder) {
    const std::lock_guard lock(holdersMutex_);
    holders_.push_back(&holder);
}

void HeldLines::remove(LineHolder& holder) noexcept {
    const std::lock_guard lock(holdersMutex_);
    holders_.erase(std::remove(holders_.begin(), holders_.end(), &holder), holders_.end());
}

bool HeldLines::request() noexcept {
    if (ending_ || !startThread()) {
        return false;
    }
    if (!requested_.exchange(true)) {
        ::sem_post(&wake_);
    }
    return true;
}

bool HeldLines::startThread() noexcept {
    if (started_) {
        return true;
    }
    const std::lock_guard lock(startMutex_);
    if (!started_) {
        const SignalsBlocked blocked;
        const ThreadAttributes attributes;
        pthread_t thread{};
        started_ = ::pthread_create(&thread, attributes.get(), &threadMain, this) == 0;
        if (started_) {
            ::pthread_setname_np(thread, "qelo-log");
        }
    }
    return started_;
}

void* HeldLines::threadMain(void* self) {
    static_cast<HeldLines*>(self)->serve();
    return nullptr;
}

void HeldLines::serve() {
    for (;;) {
        while (::sem_wait(&wake_) != 0 && errno == EINTR) {
        }
        ::nanosleep(&kDelay, nullptr);
        requested_ = false;
        writeAll();
    }
}

void HeldLines::writeAll() {
    const std::lock_guard lock(holdersMutex_);
    for (LineHolder* holder : holders_) {
        holder->lockLines();
        holder->writeHeld();
        holder->unlockLines();
    }
}

void HeldLines::beforeFork() {
    HeldLines& lines = instance();
    lines.holdersMutex_.lock();
    for (LineHolder* holder : lines.holders_) {
        holder->lockLines();
        holder->writeHeld();
    }
    lines.startMutex_.lock();
}

void HeldLines::afterForkInParent() {
    HeldLines& lines = instance();
    lines.startMutex_.unlock();
    for (LineHolder* holder : lines.holders_) {
        holder->unlockLines();
    }
    lines.holdersMutex_.unlock();
}

void HeldLines::afterForkInChild() {
    HeldLines& lines = instance();
    // The thread stayed behind, and what it was woken with.
    ::sem_init(&lines.wake_, 0, 0);
    lines.started_ = false;
    lines.requested_ = false;
    afterForkInParent();
}

// Lines of later exit handlers and destructors find nobody to write them, and write themselves.
void HeldLines::atExit() {
    HeldLines& lines = instance();
    lines.ending_ = true;
    lines.writeAll();
}

} // namespace qelo::logging
