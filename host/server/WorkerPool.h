// A fixed number of threads that carry out jobs in the order of their arrival.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <deque>
#include <functional>
#include <mutex>
#include <thread>
#include <vector>

namespace qelo::server {

class WorkerPool {
public:
    // What a job throws is dropped: a job has to report its own failure.
    using Job = std::function<void()>;

    // At most `backlog` jobs wait beside those that run.
    WorkerPool(std::size_t threads, std::size_t backlog);
    ~WorkerPool(); // as stop()
    WorkerPool(const WorkerPool&) = delete;
    WorkerPool& operator=(const WorkerPool&) = delete;

    // False when too many wait already or the pool has been stopped; the job will not run.
    bool submit(Job job);

    // Carries out what has been submitted and ends the threads.
    void stop();

private:
    void work();

    const std::size_t backlog_;
    std::mutex mutex_;
    std::condition_variable changed_;
    std::deque<Job> jobs_;
    bool stopped_ = false;
    std::vector<std::thread> threads_;
};

} // namespace qelo::server
