/// How a provider reaches into Java: it holds a zemJvmHelperRef for as long as it wants events, and
/// each operation takes its environment anew.
///
///     zemJvmHelperRef m_java;                                  // member of the provider
///     ...
///     zemJvmHelper* helper = m_java.getJvmHelper();            // starts the VM the first time
///     zemAutoDetachThread env = helper->getEnvWithThread();    // until the end of the block
///     if (env.get() == nullptr) { ... zemJavaVM::getJavaVM().getFailure() ... }
///
/// Thread-safety: a helper may be used by many threads; a zemAutoDetachThread and the environment
/// in it belong to one. getJvmHelper() takes a lock of the reference's own.
#ifndef JVM_HELPER_H
#define JVM_HELPER_H

#include "Jvm.h"
#include "JvmServices.h"
#include "Synchronizer.h"
#include "ZemExport.h"

class zemJvmHelper;

/// Has the calling thread attached to the VM until the end of the scope. A thread that was attached
/// before, as those are that Java calls on, stays so: scopes may stand in each other.
class ZEM_EXPORT zemAutoDetachThread {
public:
    explicit zemAutoDetachThread(zemJvmHelper& helper);
    ~zemAutoDetachThread();
    zemAutoDetachThread(const zemAutoDetachThread&) = delete;
    zemAutoDetachThread& operator=(const zemAutoDetachThread&) = delete;

    /// Null when there is no VM.
    JNIEnv* get() const { return m_env; }
    zemJvmHelper& helper() const { return m_helper; }

private:
    zemJvmHelper& m_helper;
    bool m_isOurs;
    JNIEnv* m_env;
};

class ZEM_EXPORT zemJvmHelper : public zemJvmServices {
public:
    /// @param env  of the thread that Java called on; null for a helper of all threads
    explicit zemJvmHelper(JNIEnv* env = nullptr) : zemJvmServices("zemJvmHelper"), m_env(env) {}
    virtual ~zemJvmHelper();

    zemAutoDetachThread getEnvWithThread() { return zemAutoDetachThread(*this); }

    /// What the helper was made with.
    JNIEnv* getEnv() const { return m_env; }

private:
    JNIEnv* m_env;
};

/// A reference on the VM, taken when the helper is first asked for.
class ZEM_EXPORT zemJvmHelperRef {
public:
    zemJvmHelperRef() = default;
    /// Gives the reference back, if one was taken; helpers that were got from here are gone.
    ~zemJvmHelperRef();
    zemJvmHelperRef(const zemJvmHelperRef&) = delete;
    zemJvmHelperRef& operator=(const zemJvmHelperRef&) = delete;

    /// The same helper at each call, never null, owned by the reference.
    zemJvmHelper* getJvmHelper();

private:
    zemSynchronizerContext m_synchContext;
    zemJvmHelper* m_JvmHelper = nullptr;
};

#endif
