/// The only locking idiom of the system: a recursive mutex and the guard that holds it.
///
/// Thread-safety: both are made for use by many threads; a context outlives its guards.
///
///     zemSynchronizer hold(m_synchContext);  // until the end of the block
#ifndef SYNCHRONIZER_H
#define SYNCHRONIZER_H

#include <pthread.h>

#include "ZemExport.h"

/// A recursive mutex: its holder may lock it again.
class ZEM_EXPORT zemSynchronizerContext {
public:
    zemSynchronizerContext();
    ~zemSynchronizerContext();
    zemSynchronizerContext(const zemSynchronizerContext&) = delete;
    zemSynchronizerContext& operator=(const zemSynchronizerContext&) = delete;

    /// The POSIX results: 0, or an error number.
    int lockContext();
    int unlockContext();

private:
    pthread_mutex_t m_mutex;
};

/// Holds a context from construction to destruction.
class ZEM_EXPORT zemSynchronizer {
public:
    explicit zemSynchronizer(zemSynchronizerContext& context);
    ~zemSynchronizer();
    zemSynchronizer(const zemSynchronizer&) = delete;
    zemSynchronizer& operator=(const zemSynchronizer&) = delete;

private:
    zemSynchronizerContext* m_context;
};

#endif
