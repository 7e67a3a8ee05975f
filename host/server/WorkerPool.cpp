#include "WorkerPool.h"

#include <utility>

namespace qelo::server {

WorkerPool::WorkerPool(std::size_t threads, std::size_t backlog) : backlog_(backlog) {
    threads_.reserve(threads);
    try {
        for (std::size_t i = 0; i < threads; ++i) {
            threads_.emplace_back([this] { work(); });
        }
    } catch (...) {
        stop(); // a thread that is not joined would end the process
        throw;
    }
}

WorkerPool::~WorkerPool() { stop(); }

bool WorkerPool::submit(Job job) {
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        if (stopped_ || jobs_.size() >= backlog_) {
            return false;
        }
        jobs_.push_back(std::move(job));
    }
    changed_.notify_one();
    return true;
}

void WorkerPool::stop() {
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        stopped_ = true;
    }
    changed_.notify_all();
    for (std::thread& thread : threads_) {
        if (thread.joinable()) {
            thread.join();
        }
    }
}

void WorkerPool::work() {
    std::unique_lock<std::mutex> lock(mutex_);
    while (true) {
        changed_.wait(lock, [this] { return stopped_ || !jobs_.empty(); });
        if (jobs_.empty()) {
            return;
        }
        Job job = std::move(jobs_.front());
        jobs_.pop_front();
        lock.unlock();
        try {
            job();
        } catch (...) {
            // See Job.
        }
        job = nullptr; // what it holds goes before the lock is taken again
        lock.lock();
    }
}

} // namespace qelo::server
