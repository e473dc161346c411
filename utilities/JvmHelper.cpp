#include "JvmHelper.h"

zemAutoDetachThread::zemAutoDetachThread(zemJvmHelper& helper)
    : m_helper(helper),
      m_isOurs(!zemJavaVM::getJavaVM().isAttached()),
      m_env(zemJavaVM::getJavaVM().attachThread()) {}

zemAutoDetachThread::~zemAutoDetachThread() {
    if (m_isOurs && m_env != nullptr) {
        zemJavaVM::getJavaVM().detachThread();
    }
}

zemJvmHelper::~zemJvmHelper() = default;

zemJvmHelperRef::~zemJvmHelperRef() {
    if (m_JvmHelper != nullptr) {
        zemJavaVM::getJavaVM().releaseJavaVM();
        delete m_JvmHelper;
    }
}

zemJvmHelper* zemJvmHelperRef::getJvmHelper() {
    const zemSynchronizer hold(m_synchContext);
    if (m_JvmHelper == nullptr) {
        m_JvmHelper = new zemJvmHelper;
        zemJavaVM::getJavaVM().refJavaVM();
    }
    return m_JvmHelper;
}
