#include "Thread.h"

#include <sched.h>
#include <sys/time.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <memory>

#include "LetUnwind.h"

namespace {

// A consumer can miss the signal of a put that falls between its look at the queue and its wait,
// and a put on a queue that is not empty gives none: so it looks again after this long.
constexpr int recheckMilliseconds = 100;

// Gives the mutex back also when the waiting thread is cancelled.
class MutexHold {
public:
    explicit MutexHold(pthread_mutex_t& mutex) : m_mutex(mutex) { pthread_mutex_lock(&m_mutex); }
    ~MutexHold() { pthread_mutex_unlock(&m_mutex); }
    MutexHold(const MutexHold&) = delete;
    MutexHold& operator=(const MutexHold&) = delete;

private:
    pthread_mutex_t& m_mutex;
};

timespec fromNow(int milliseconds) {
    timeval now{};
    gettimeofday(&now, nullptr);
    const int interval = std::max(milliseconds, 0);
    timespec time{};
    time.tv_sec = now.tv_sec + interval / 1000;
    time.tv_nsec = now.tv_usec * 1000L + (interval % 1000) * 1000000L;
    if (time.tv_nsec >= 1000000000L) {
        time.tv_nsec -= 1000000000L;
        ++time.tv_sec;
    }
    return time;
}

}  // namespace

zemCondition::zemCondition() {
    pthread_cond_init(&m_condition, nullptr);
    pthread_mutex_init(&m_mutex, nullptr);
}

zemCondition::~zemCondition() {
    pthread_cond_destroy(&m_condition);
    pthread_mutex_destroy(&m_mutex);
}

void zemCondition::wait() {
    MutexHold hold(m_mutex);
    pthread_cond_wait(&m_condition, &m_mutex);
}

void zemCondition::timedWait(int milliseconds) {
    MutexHold hold(m_mutex);
    const timespec until = fromNow(milliseconds);
    pthread_cond_timedwait(&m_condition, &m_mutex, &until);
}

void zemCondition::signal() {
    MutexHold hold(m_mutex);
    pthread_cond_broadcast(&m_condition);
}

zemThread::zemThread() : m_thread(0), m_started(0) {}

zemThread::~zemThread() {
    const zemUncancelled uncancelled;
    waitThreadExit();
}

int zemThread::start(StartMethod method, StartInfo parm) {
    if (isStarted()) {
        return EBUSY;
    }
    waitThreadExit();
    auto data = std::make_unique<_StartData>(_StartData{method, parm, this});
    int result = 0;
    {
        // The new thread waits for the lock: nobody sees it started before its handle is known, and
        // a short method does not clear the flag before it is set.
        zemSynchronizer hold(m_synchContext);
        result = pthread_create(&m_thread, nullptr, internalStart, data.get());
        if (result == 0) {
            static_cast<void>(data.release());
            m_started = 1;
        } else {
            m_thread = 0;
        }
    }
    sched_yield();
    return result;
}

/// The flag of the thread that runs, from the moment when start() is done with it to the end,
/// whichever way the thread ends.
class zemThread::Started {
public:
    explicit Started(zemThread& thread) : m_owner(thread) { m_owner.handle(); }
    ~Started() {
        zemSynchronizer hold(m_owner.m_synchContext);
        m_owner.m_started = 0;
    }
    Started(const Started&) = delete;
    Started& operator=(const Started&) = delete;

private:
    zemThread& m_owner;
};

void* zemThread::internalStart(void* data) {
    const _StartData start = *std::unique_ptr<_StartData>(static_cast<_StartData*>(data));
    const Started started(*start.m_pthread);
    try {
        start.m_method(start.m_parm);
    } catch (...) {
        zemLetUnwind();
    }
    Exit();
}

int zemThread::cancel() {
    zemSynchronizer hold(m_synchContext);
    if (m_started == 0) {
        return 0;
    }
    m_started = 0;
    return pthread_cancel(m_thread);
}

int zemThread::suspend() { return kill(SIGSTOP); }

int zemThread::resume() { return kill(SIGCONT); }

int zemThread::kill(int signalNumber) {
    zemSynchronizer hold(m_synchContext);
    return m_thread == 0 ? ESRCH : pthread_kill(m_thread, signalNumber);
}

void zemThread::Exit() {
    static int zero = 0;
    pthread_exit(&zero);
}

int zemThread::getCurrentThreadId() { return static_cast<int>(pthread_self()); }

int zemThread::getThreadId() const { return static_cast<int>(handle()); }

bool zemThread::isStarted() const {
    zemSynchronizer hold(m_synchContext);
    return m_started != 0;
}

pthread_t zemThread::handle() const {
    zemSynchronizer hold(m_synchContext);
    return m_thread;
}

void zemThread::waitThreadExit() {
    // Joined by its handle, not by the flag: a thread that ended by itself or was cancelled has
    // cleared the flag, but still holds its stack, and may still be on its way out.
    const pthread_t thread = handle();
    if (thread != 0) {
        pthread_join(thread, nullptr);
        zemSynchronizer hold(m_synchContext);
        m_thread = 0;
        m_started = 0;
    }
}

zemControlledDataCommunication::zemControlledDataCommunication()
    : m_queue(nullptr), m_queueEnd(&m_queue) {}

zemControlledDataCommunication::~zemControlledDataCommunication() {
    while (m_queue != nullptr) {
        const std::unique_ptr<_CntrlDataEntry> entry(m_queue);
        m_queue = entry->m_next;
    }
}

void zemControlledDataCommunication::putControlledData(void* data, int size) {
    auto entry = std::make_unique<_CntrlDataEntry>(_CntrlDataEntry{data, size, nullptr});
    bool wasEmpty = false;
    {
        zemSynchronizer hold(m_synchContext);
        wasEmpty = m_queue == nullptr;
        *m_queueEnd = entry.release();
        m_queueEnd = &(*m_queueEnd)->m_next;
    }
    if (wasEmpty) {
        m_condition.signal();
    }
}

void* zemControlledDataCommunication::getControlledData(int& size) {
    for (;;) {
        {
            zemSynchronizer hold(m_synchContext);
            if (m_queue != nullptr) {
                const std::unique_ptr<_CntrlDataEntry> entry(m_queue);
                m_queue = entry->m_next;
                if (m_queue == nullptr) {
                    m_queueEnd = &m_queue;
                }
                size = entry->m_dataSize;
                return entry->m_data;
            }
        }
        m_condition.timedWait(recheckMilliseconds);
    }
}
