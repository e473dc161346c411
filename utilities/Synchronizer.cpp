#include "Synchronizer.h"

zemSynchronizerContext::zemSynchronizerContext() {
    pthread_mutexattr_t attributes;
    pthread_mutexattr_init(&attributes);
    pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
    pthread_mutex_init(&m_mutex, &attributes);
    pthread_mutexattr_destroy(&attributes);
}

zemSynchronizerContext::~zemSynchronizerContext() { pthread_mutex_destroy(&m_mutex); }

int zemSynchronizerContext::lockContext() { return pthread_mutex_lock(&m_mutex); }

int zemSynchronizerContext::unlockContext() { return pthread_mutex_unlock(&m_mutex); }

zemSynchronizer::zemSynchronizer(zemSynchronizerContext& context) : m_context(&context) {
    m_context->lockContext();
}

zemSynchronizer::~zemSynchronizer() { m_context->unlockContext(); }
