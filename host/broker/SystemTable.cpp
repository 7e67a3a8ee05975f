// Threads and their helpers, with POSIX behind them. Mutexes are recursive.
#include "Broker.h"
#include "Slot.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <memory>
#include <pthread.h>
#include <type_traits>

namespace qelo::broker {
namespace {

// Handles to threads and once-objects are handed out as they are.
static_assert(sizeof(pthread_t) == sizeof(void*) && std::is_integral_v<pthread_t>);
static_assert(std::is_same_v<pthread_once_t, int>);
static_assert(std::is_same_v<pthread_key_t, CMPI_THREAD_KEY_TYPE>);

pthread_t threadOf(CMPI_THREAD_TYPE handle) {
    pthread_t thread = 0;
    std::memcpy(&thread, &handle, sizeof thread);
    return thread;
}

CMPI_THREAD_TYPE handleOf(pthread_t thread) {
    CMPI_THREAD_TYPE handle = nullptr;
    std::memcpy(&handle, &thread, sizeof handle);
    return handle;
}

struct ThreadStart {
    CMPI_THREAD_RETURN (*start)(void*);
    void* argument;
};

// Nothing thrown may end the whole process.
void* runThread(void* argument) {
    const std::unique_ptr<ThreadStart> given(static_cast<ThreadStart*>(argument));
    try {
        return given->start(given->argument);
    } catch (...) {
        passForcedUnwind();
        return nullptr;
    }
}

// Standard brokers differ in who frees the name; to leave it alone is right for all.
char* resolveFileName(const char* name) {
    return slot<char*>(nullptr, nullptr, [&]() -> char* {
        if (!name) {
            return nullptr;
        }
        return ::strdup(("lib" + std::string(name) + ".so").c_str());
    });
}

CMPI_THREAD_TYPE newThread(CMPI_THREAD_RETURN (*start)(void*), void* argument, int detached) {
    return slot<CMPI_THREAD_TYPE>(nullptr, nullptr, [&]() -> CMPI_THREAD_TYPE {
        if (!start) {
            return nullptr;
        }
        auto given = std::make_unique<ThreadStart>(ThreadStart{start, argument});
        pthread_attr_t attributes;
        if (pthread_attr_init(&attributes) != 0) {
            return nullptr;
        }
        if (detached) {
            pthread_attr_setdetachstate(&attributes, PTHREAD_CREATE_DETACHED);
        }
        pthread_t thread = 0;
        const int rc = pthread_create(&thread, &attributes, runThread, given.get());
        pthread_attr_destroy(&attributes);
        if (rc != 0) {
            return nullptr;
        }
        (void)given.release(); // the thread owns it now
        return handleOf(thread);
    });
}

int joinThread(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN* code) {
    return thread ? pthread_join(threadOf(thread), code) : ESRCH;
}

int exitThread(CMPI_THREAD_RETURN code) { pthread_exit(code); }

int cancelThread(CMPI_THREAD_TYPE thread) {
    return thread ? pthread_cancel(threadOf(thread)) : ESRCH;
}

int threadSleep(CMPIUint32 milliseconds) {
    timespec left = {};
    left.tv_sec = static_cast<time_t>(milliseconds / 1000);
    left.tv_nsec = static_cast<long>(milliseconds % 1000) * 1'000'000L;
    int rc = EINTR;
    while (rc == EINTR) {
        rc = clock_nanosleep(CLOCK_MONOTONIC, 0, &left, &left);
    }
    return rc;
}

int threadOnce(int* once, void (*init)(void)) {
    if (!once || !init) {
        return EINVAL;
    }
    int rc = EINVAL;
    slot<int>(nullptr, 0, [&] { return rc = pthread_once(once, init); });
    return rc;
}

int createThreadKey(CMPI_THREAD_KEY_TYPE* key, void (*cleanup)(void*)) {
    return key ? pthread_key_create(key, cleanup) : EINVAL;
}

int destroyThreadKey(CMPI_THREAD_KEY_TYPE key) { return pthread_key_delete(key); }

void* getThreadSpecific(CMPI_THREAD_KEY_TYPE key) { return pthread_getspecific(key); }

int setThreadSpecific(CMPI_THREAD_KEY_TYPE key, void* value) {
    return pthread_setspecific(key, value);
}

CMPI_MUTEX_TYPE newMutex(int) {
    return slot<CMPI_MUTEX_TYPE>(nullptr, nullptr, []() -> CMPI_MUTEX_TYPE {
        auto mutex = std::make_unique<pthread_mutex_t>();
        pthread_mutexattr_t attributes;
        if (pthread_mutexattr_init(&attributes) != 0) {
            return nullptr;
        }
        pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
        const int rc = pthread_mutex_init(mutex.get(), &attributes);
        pthread_mutexattr_destroy(&attributes);
        return rc == 0 ? mutex.release() : nullptr;
    });
}

pthread_mutex_t* mutexOf(CMPI_MUTEX_TYPE handle) { return static_cast<pthread_mutex_t*>(handle); }

void destroyMutex(CMPI_MUTEX_TYPE mutex) {
    if (!mutex) {
        return;
    }
    pthread_mutex_destroy(mutexOf(mutex));
    delete mutexOf(mutex);
}

void lockMutex(CMPI_MUTEX_TYPE mutex) {
    if (mutex) {
        pthread_mutex_lock(mutexOf(mutex));
    }
}

void unlockMutex(CMPI_MUTEX_TYPE mutex) {
    if (mutex) {
        pthread_mutex_unlock(mutexOf(mutex));
    }
}

CMPI_COND_TYPE newCondition(int) {
    return slot<CMPI_COND_TYPE>(nullptr, nullptr, []() -> CMPI_COND_TYPE {
        auto condition = std::make_unique<pthread_cond_t>();
        return pthread_cond_init(condition.get(), nullptr) == 0 ? condition.release() : nullptr;
    });
}

pthread_cond_t* conditionOf(CMPI_COND_TYPE handle) { return static_cast<pthread_cond_t*>(handle); }

void destroyCondition(CMPI_COND_TYPE condition) {
    if (!condition) {
        return;
    }
    pthread_cond_destroy(conditionOf(condition));
    delete conditionOf(condition);
}

int condWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex) {
    if (!condition || !mutex) {
        return EINVAL;
    }
    return pthread_cond_wait(conditionOf(condition), mutexOf(mutex));
}

int timedCondWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, struct timespec* wait) {
    if (!condition || !mutex || !wait) {
        return EINVAL;
    }
    return pthread_cond_timedwait(conditionOf(condition), mutexOf(mutex), wait);
}

int signalCondition(CMPI_COND_TYPE condition) {
    return condition ? pthread_cond_signal(conditionOf(condition)) : EINVAL;
}

} // namespace

const CMPIBrokerExtFT systemTable = {
    CMPIVersion200,    resolveFileName,   newThread,        joinThread,      exitThread,
    cancelThread,      threadSleep,       threadOnce,       createThreadKey, destroyThreadKey,
    getThreadSpecific, setThreadSpecific, newMutex,         destroyMutex,    lockMutex,
    unlockMutex,       newCondition,      destroyCondition, condWait,        timedCondWait,
    signalCondition,
};

} // namespace qelo::broker
