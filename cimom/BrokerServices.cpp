// The broker's operating system services and memory functions.

#include <pthread.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <ctime>

#include "Broker.h"
#include "Provider.h"

namespace cimom {

namespace {

// -- threads ----------------------------------------------------------------------------------

static_assert(sizeof(pthread_t) <= sizeof(void*), "a thread's name fits a pointer");
static_assert(std::is_same_v<pthread_key_t, CMPI_THREAD_KEY_TYPE>, "keys are the system's");

pthread_t threadOf(CMPI_THREAD_TYPE thread) { return reinterpret_cast<pthread_t>(thread); }
pthread_mutex_t* mutexOf(CMPI_MUTEX_TYPE mutex) { return static_cast<pthread_mutex_t*>(mutex); }
pthread_cond_t* conditionOf(CMPI_COND_TYPE cond) { return static_cast<pthread_cond_t*>(cond); }

char* resolveFileName(const char* name) { return strdup(libraryFileName(textOf(name)).c_str()); }
CMPI_THREAD_TYPE newThread(CMPI_THREAD_RETURN (*start)(void*), void* parm, int detached) {
    pthread_t thread{};
    if (pthread_create(&thread, nullptr, start, parm) != 0) {
        return nullptr;
    }
    if (detached) {
        pthread_detach(thread);
    }
    return reinterpret_cast<CMPI_THREAD_TYPE>(thread);  // NOLINT(performance-no-int-to-ptr)
}
int joinThread(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN* answer) {
    return pthread_join(threadOf(thread), answer);
}
int exitThread(CMPI_THREAD_RETURN code) { pthread_exit(code); }
int cancelThread(CMPI_THREAD_TYPE thread) { return pthread_cancel(threadOf(thread)); }
int threadSleep(CMPIUint32 milliseconds) {
    timespec left{static_cast<time_t>(milliseconds / 1000),
                  static_cast<long>(milliseconds % 1000) * 1000000};
    return nanosleep(&left, nullptr);
}
int threadOnce(int* once, void (*init)()) {
    // One lock for all, recursive since an init may need another one done first.
    static std::recursive_mutex mutex;
    std::lock_guard<std::recursive_mutex> lock(mutex);
    if (*once == 0) {
        *once = 1;
        init();
    }
    return 0;
}
int setThreadSpecific(CMPI_THREAD_KEY_TYPE key, void* value) {
    return pthread_setspecific(key, value);
}

// -- mutexes and conditions -------------------------------------------------------------------

template <class T, auto Init>
void* newPrimitive(int) {
    auto* made = new T;
    Init(made, nullptr);
    return made;
}
template <class T, auto Destroy>
void destroyPrimitive(void* primitive) {
    Destroy(static_cast<T*>(primitive));
    delete static_cast<T*>(primitive);
}
void lockMutex(CMPI_MUTEX_TYPE mutex) { pthread_mutex_lock(mutexOf(mutex)); }
void unlockMutex(CMPI_MUTEX_TYPE mutex) { pthread_mutex_unlock(mutexOf(mutex)); }
int condWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex) {
    return pthread_cond_wait(conditionOf(condition), mutexOf(mutex));
}
int timedCondWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, timespec* until) {
    return pthread_cond_timedwait(conditionOf(condition), mutexOf(mutex), until);
}
int signalCondition(CMPI_COND_TYPE condition) {
    return pthread_cond_signal(conditionOf(condition));
}

// -- memory -----------------------------------------------------------------------------------

CMPIGcStat* mark(Broker& broker) {
    Activation* activation = Activation::current(broker);
    if (!activation) {
        throw Failure(CMPI_RC_ERR_FAILED, "no request on this thread");
    }
    return const_cast<void*>(activation->pool().mark());
}
void release(Broker& broker, const CMPIGcStat* level) {
    Activation* activation = Activation::current(broker);
    if (!activation || !activation->pool().release(level)) {
        throw Failure(CMPI_RC_ERR_FAILED, "no such mark in the request of this thread");
    }
}

void* allocate(const CMPIBroker* mb, void* old, std::size_t size, bool zeroed) {
    return brokerEntry(mb, nullptr,
                       [=](Broker& broker) { return broker.allocate(old, size, zeroed); });
}
void* cmpiMalloc(const CMPIBroker* mb, std::size_t size) {
    return allocate(mb, nullptr, size, false);
}
void* cmpiCalloc(const CMPIBroker* mb, std::size_t count, std::size_t size) {
    const bool overflows = size != 0 && count > SIZE_MAX / size;
    return overflows ? nullptr : allocate(mb, nullptr, count * size, true);
}
void* cmpiRealloc(const CMPIBroker* mb, void* block, std::size_t size) {
    return allocate(mb, block, size, false);
}
char* cmpiStrDup(const CMPIBroker* mb, const char* text) {
    const std::size_t size = text ? std::strlen(text) + 1 : 0;
    void* block = text ? cmpiMalloc(mb, size) : nullptr;
    return static_cast<char*>(block ? std::memcpy(block, text, size) : nullptr);
}
void cmpiFree(const CMPIBroker* mb, void* block) {
    brokerEntry(mb, nullptr, [block](Broker& broker) { broker.freeBlock(block); });
}

template <class C>
void freeObject(const CMPIBroker*, C* object) {
    releaseObject(object);
}

}  // namespace

CMPIBrokerExtFT extensionTable(bool lean) {
    return brokerTable(lean, 1, &CMPIBrokerExtFT::signalCondition, resolveFileName, newThread,
                       joinThread, exitThread, cancelThread, threadSleep, threadOnce,
                       pthread_key_create, pthread_key_delete, pthread_getspecific,
                       setThreadSpecific, newPrimitive<pthread_mutex_t, pthread_mutex_init>,
                       destroyPrimitive<pthread_mutex_t, pthread_mutex_destroy>, lockMutex,
                       unlockMutex, newPrimitive<pthread_cond_t, pthread_cond_init>,
                       destroyPrimitive<pthread_cond_t, pthread_cond_destroy>, condWait,
                       timedCondWait, signalCondition);
}

CMPIBrokerMemFT memoryTable(bool lean) {
    return brokerTable(lean, 0, &CMPIBrokerMemFT::release, entryOf<mark>, entryOf<release>,
                       cmpiMalloc, cmpiCalloc, cmpiRealloc, cmpiStrDup, cmpiFree,
                       freeObject<CMPIInstance>, freeObject<CMPIObjectPath>, freeObject<CMPIArgs>,
                       freeObject<CMPIString>, freeObject<CMPIArray>, freeObject<CMPIDateTime>,
                       freeObject<CMPISelectExp>);
}

}  // namespace cimom
