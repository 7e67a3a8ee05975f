// The operating system's services, on POSIX threads. They take no broker, so they are
// neither recorded nor made to fail.

#include "support/broker/Objects.h"

#include <cerrno>
#include <cstring>
#include <ctime>
#include <mutex>
#include <new>
#include <pthread.h>
#include <set>

namespace qelo::test {

namespace {

// A provider must not free the name and a broker cannot know when it is done with it, so it
// is kept, once per name.
char* resolveFileName(const char* name) {
    static std::mutex mutex;
    static std::set<std::string> names;
    if (name == nullptr) {
        return nullptr;
    }
    const std::lock_guard lock(mutex);
    return const_cast<char*>(names.insert("lib" + std::string(name) + ".so").first->c_str());
}

struct Thread {
    pthread_t id;
};

void* newThread(void* (*start)(void*), void* parm, int detached) {
    auto* const thread = new (std::nothrow) Thread();
    if (thread == nullptr) {
        return nullptr;
    }
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setdetachstate(&attributes,
                                detached != 0 ? PTHREAD_CREATE_DETACHED : PTHREAD_CREATE_JOINABLE);
    const int error = pthread_create(&thread->id, &attributes, start, parm);
    pthread_attr_destroy(&attributes);
    if (error == 0) {
        return thread;
    }
    delete thread;
    return nullptr;
}

int joinThread(void* thread, void** code) {
    auto* const joined = static_cast<Thread*>(thread);
    const int error = pthread_join(joined->id, code);
    if (error == 0) {
        delete joined;
    }
    return error;
}

int exitThread(void* code) { pthread_exit(code); }
int cancelThread(void* thread) { return pthread_cancel(static_cast<Thread*>(thread)->id); }

int threadSleep(CMPIUint32 milliseconds) {
    const timespec length = {static_cast<time_t>(milliseconds / 1000),
                             static_cast<long>(milliseconds % 1000) * 1000000};
    return nanosleep(&length, nullptr) == 0 ? 0 : errno;
}

// pthread_once_t is an int that starts at 0, which is what a provider passes.
static_assert(sizeof(pthread_once_t) == sizeof(int) && PTHREAD_ONCE_INIT == 0);
int threadOnce(int* once, void (*init)(void)) { return pthread_once(once, init); }

static_assert(sizeof(pthread_key_t) == sizeof(CMPI_THREAD_KEY_TYPE));
int createThreadKey(CMPI_THREAD_KEY_TYPE* key, void (*cleanup)(void*)) {
    return pthread_key_create(key, cleanup);
}
int destroyThreadKey(CMPI_THREAD_KEY_TYPE key) { return pthread_key_delete(key); }
void* getThreadSpecific(CMPI_THREAD_KEY_TYPE key) { return pthread_getspecific(key); }
int setThreadSpecific(CMPI_THREAD_KEY_TYPE key, void* value) {
    return pthread_setspecific(key, value);
}

void* newMutex(int) {
    auto* const mutex = new (std::nothrow) pthread_mutex_t;
    if (mutex == nullptr) {
        return nullptr;
    }
    pthread_mutexattr_t attributes;
    pthread_mutexattr_init(&attributes);
    pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
    pthread_mutex_init(mutex, &attributes);
    pthread_mutexattr_destroy(&attributes);
    return mutex;
}
pthread_mutex_t* asMutex(void* mutex) { return static_cast<pthread_mutex_t*>(mutex); }
void destroyMutex(void* mutex) {
    pthread_mutex_destroy(asMutex(mutex));
    delete asMutex(mutex);
}
void lockMutex(void* mutex) { pthread_mutex_lock(asMutex(mutex)); }
void unlockMutex(void* mutex) { pthread_mutex_unlock(asMutex(mutex)); }

void* newCondition(int) {
    auto* const condition = new (std::nothrow) pthread_cond_t;
    if (condition != nullptr) {
        pthread_cond_init(condition, nullptr);
    }
    return condition;
}
pthread_cond_t* asCondition(void* condition) { return static_cast<pthread_cond_t*>(condition); }
void destroyCondition(void* condition) {
    pthread_cond_destroy(asCondition(condition));
    delete asCondition(condition);
}
int condWait(void* condition, void* mutex) {
    return pthread_cond_wait(asCondition(condition), asMutex(mutex));
}
int timedCondWait(void* condition, void* mutex, timespec* wait) {
    return pthread_cond_timedwait(asCondition(condition), asMutex(mutex), wait);
}
int signalCondition(void* condition) { return pthread_cond_signal(asCondition(condition)); }

} // namespace

const CMPIBrokerExtFT* tableBrokerExt() {
    static const CMPIBrokerExtFT table = {
        CMPIVersion200,    resolveFileName,   newThread,        joinThread,      exitThread,
        cancelThread,      threadSleep,       threadOnce,       createThreadKey, destroyThreadKey,
        getThreadSpecific, setThreadSpecific, newMutex,         destroyMutex,    lockMutex,
        unlockMutex,       newCondition,      destroyCondition, condWait,        timedCondWait,
        signalCondition};
    return &table;
}

} // namespace qelo::test
