#include "logging/ProcessIds.h"

#include <atomic>

#include <pthread.h>
#include <unistd.h>

namespace qelo::logging {
namespace {

// Counts the forks that this process descends from; never 0 once it is watched.
std::atomic<unsigned> forks{0};

struct Known {
    unsigned forks;
    ProcessIds ids;
};

thread_local Known known{};

void countFork() { forks.fetch_add(1, std::memory_order_relaxed); }

bool watchForks() noexcept {
    countFork();
    return ::pthread_atfork(nullptr, nullptr, &countFork) == 0;
}

} // namespace

ProcessIds processIds() noexcept {
    static const bool watched = watchForks();
    const unsigned now = forks.load(std::memory_order_relaxed);
    if (known.forks != now || !watched) {
        known = {now, {::getpid(), ::gettid()}};
    }
    return known.ids;
}

} // namespace qelo::logging
