// What makes lines that are held back for a moment appear soon, whatever becomes of the process.
#pragma once

#include <atomic>
#include <mutex>
#include <vector>

#include <semaphore.h>

namespace qelo::logging {

// A sink that gathers lines before it writes them.
class LineHolder {
public:
    // Keep other threads from adding lines, and let them again.
    virtual void lockLines() = 0;
    virtual void unlockLines() = 0;

    // Writes what is held. Called between the two above; keeps failures for the next line.
    virtual void writeHeld() noexcept = 0;

protected:
    ~LineHolder() = default;
};

// Writes the lines of all holders some milliseconds after one asked for it, before the process
// forks, so that no child writes them once more, and when the process ends. One for the
// process, never destroyed. Any thread may call any member.
class HeldLines {
public:
    static HeldLines& instance();

    HeldLines(const HeldLines&) = delete;
    HeldLines& operator=(const HeldLines&) = delete;

    // From add to remove a holder may hold lines. Not to be called with its lines locked.
    // add throws std::bad_alloc.
    void add(LineHolder& holder);
    void remove(LineHolder& holder) noexcept;

    // Asks for the lines to be written soon. False where nobody will do so, because the process
    // is about to end or can have no further thread: the holder then writes at once. To be
    // called with the holder's lines locked.
    bool request() noexcept;

private:
    HeldLines();

    static void* threadMain(void* self);
    static void beforeFork();
    static void afterForkInParent();
    static void afterForkInChild();
    static void atExit();

    bool startThread() noexcept;
    void serve();
    void writeAll();

    std::mutex holdersMutex_; // taken before the locks of holders
    std::vector<LineHolder*> holders_;

    std::mutex startMutex_; // taken after the locks of holders
    std::atomic<bool> started_{false};
    std::atomic<bool> requested_{false};
    std::atomic<bool> ending_{false};
    sem_t wake_{};
};

} // namespace qelo::logging
