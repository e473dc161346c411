/// Thin wrappers over POSIX threads: a condition with its own mutex, a thread, a blocking queue.
///
/// Time-outs are in milliseconds. A signal wakes all waiters, and one given while nobody waits is
/// lost: waiters keep their state elsewhere, re-check it, and use timedWait() where a lost signal
/// would matter.
///
/// Thread-safety: zemCondition and zemControlledDataCommunication are made for many threads. A
/// zemThread may be asked and signalled by many, but is started and waited for by one at a time.
#ifndef THREAD_H
#define THREAD_H

#include <pthread.h>

#include "Synchronizer.h"
#include "ZemExport.h"

class ZEM_EXPORT zemCondition {
public:
    zemCondition();
    ~zemCondition();
    zemCondition(const zemCondition&) = delete;
    zemCondition& operator=(const zemCondition&) = delete;

    /// Blocks until a signal.
    void wait();

    /// Blocks until a signal or until the time is over; there is no telling which.
    void timedWait(int milliseconds);

    /// Wakes all threads that wait now.
    void signal();

private:
    pthread_cond_t m_condition;
    pthread_mutex_t m_mutex;
};

/// A thread that runs one function. Its destructor waits until that has ended.
class ZEM_EXPORT zemThread {
public:
    using StartInfo = void*;
    using StartMethod = void (*)(void*);

    zemThread();
    ~zemThread();
    zemThread(const zemThread&) = delete;
    zemThread& operator=(const zemThread&) = delete;

    /// Runs @p method with @p parm on a new thread; an exception that leaves the method ends the
    /// thread quietly. Returns 0, the POSIX error, or EBUSY while the thread runs already.
    int start(StartMethod method, StartInfo parm);

    /// Asks a running thread to end at its next cancellation point. Returns the POSIX result, 0
    /// if it does not run.
    int cancel();

    /// Send SIGSTOP and SIGCONT, which act on the whole process. Return the POSIX result.
    int suspend();
    int resume();

    /// Ends the calling thread.
    [[noreturn]] static void Exit();

    /// The identifier of a thread, cut to int.
    static int getCurrentThreadId();
    int getThreadId() const;

    /// Whether the method runs: true from start() until it ends or is cancelled.
    bool isStarted() const;

    /// Operations of the thread's own condition.
    void wait() { m_condition.wait(); }
    void timedWait(int milliseconds) { m_condition.timedWait(milliseconds); }
    void signal() { m_condition.signal(); }

    /// Blocks until the thread has ended; returns at once if none was started.
    void waitThreadExit();

private:
    struct _StartData {
        StartMethod m_method;
        StartInfo m_parm;
        zemThread* m_pthread;
    };

    class Started;

    static void* internalStart(void* data);
    int kill(int signalNumber);
    pthread_t handle() const;

    pthread_t m_thread;
    zemCondition m_condition;
    int m_started;
    mutable zemSynchronizerContext m_synchContext;  // guards m_thread and m_started
};

struct ZEM_EXPORT _CntrlDataEntry {
    void* m_data;
    int m_dataSize;
    _CntrlDataEntry* m_next;
};

/// A blocking first-in, first-out queue of opaque data, meant for one consumer. The data stay the
/// caller's: entries left at destruction are dropped, what they point to is not released.
class ZEM_EXPORT zemControlledDataCommunication {
public:
    zemControlledDataCommunication();
    ~zemControlledDataCommunication();
    zemControlledDataCommunication(const zemControlledDataCommunication&) = delete;
    zemControlledDataCommunication& operator=(const zemControlledDataCommunication&) = delete;

    /// Appends an entry, which wakes the consumer if the queue was empty.
    void putControlledData(void* data, int size);

    /// Blocks until there is an entry; returns its data, and its size in @p size.
    void* getControlledData(int& size);

private:
    zemCondition m_condition;
    zemSynchronizerContext m_synchContext;
    _CntrlDataEntry* m_queue;
    _CntrlDataEntry** m_queueEnd;
};

#endif
