/// The Java VM in the process of the CIM server: who wants events of the appliance holds a part in
/// it.
///
/// A process has one VM, whoever asks first and on however many threads: zemJavaVM, zemJvm, or the
/// server itself, whose VM both use as it is and never end. The VM's library is opened when the
/// first of them asks: the libjvm.so of the Java that JAVA_HOME names, or else of the first one
/// that is found in the usual places. Without Java everything but events works.
///
/// The classes that the VM loads come from CLASSPATH.
///
/// What the VM does to the signals of the process:
/// - SIGSEGV, SIGBUS, SIGILL, SIGFPE: it needs them, and hands what is not its own to the handlers
///   that were there before it.
/// - SIGPIPE, SIGXFSZ: no longer end the process; handlers that were there before are called on.
/// - SIGHUP, SIGINT, SIGTERM: stay the server's. Left to itself the VM would take them and end the
///   process in a way of its own, so they are ignored for the moment in which it starts.
/// - SIGQUIT, SIGUSR2: stay the server's where it handles or ignores them; else the first prints
/// what
///   the VM's threads do, and the second is the VM's own.
///
/// Thread-safety: any thread may call anything; a JNIEnv* belongs to the thread that got it.
#ifndef JVM_H
#define JVM_H

#include <pthread.h>

#include <atomic>

#include "AtomicType.h"
#include "JniTypes.h"
#include "JvmServices.h"
#include "StringUtils.h"
#include "Synchronizer.h"
#include "ZemExport.h"

/// The VM by count: the first reference starts it on a thread of its own, the last one ends it
/// there. Providers hold theirs by zemJvmHelperRef (JvmHelper.h).
///
/// Its options come from PEGASUS_JMPI_MAX_HEAP, PEGASUS_JMPI_INITIAL_HEAP,
/// PEGASUS_JMPI_JAVA_THREAD_STACK_SIZE and CLASSPATH. OpenJDK starts no second VM in a process that
/// has ended one: what comes behind the last release has no events until the process starts anew.
class ZEM_EXPORT zemJavaVM {
public:
    static zemJavaVM& getJavaVM();

    /// Takes a reference, and waits until the VM runs or has failed to.
    /// @return how many there are now. A VM that failed to start is counted as well: attachThread()
    ///         then gives null.
    int refJavaVM();

    /// Gives a reference back; without one, nothing happens. The last one asks the VM's thread to
    /// end it and does not wait for that: the VM goes when the last thread is detached. Returns 0.
    int releaseJavaVM();

    /// Ends the VM, unless others use it. Returns 0. For the VM's own thread; others release.
    int destroyJVM();

    /// Attaches the calling thread, if it is not; null without a VM. A thread that is attached
    /// keeps the VM from ending.
    JNIEnv* attachThread();
    /// Detaches the calling thread; one that Java called stays attached.
    void detachThread();
    /// Whether the calling thread is attached.
    bool isAttached();

    /// The words for a result of the invocation interface.
    static const char* getJvmErrorString(int code);

    /// Why there is no VM; empty while there is one.
    zemString getFailure();

private:
    zemJavaVM() = default;
    ~zemJavaVM() = delete;

    static void* run(void* javaVM);
    int initJVM();
    void start();

    std::atomic<bool> m_stop{false};
    std::atomic<bool> m_running{false};
    bool m_JvmInAThread = true;
    pthread_t m_thread = {};
    zemSynchronizerContext m_refJvmMutex;
    zemSynchronizerContext m_initJvmMutex;
    zemSynchronizerContext m_destroyJvmMutex;
    std::atomic<JavaVM*> m_jvm{nullptr};
    zemAtomicType<int> m_refs;
    zemString m_failure;  ///< under m_initJvmMutex
};

/// The VM as the helpers of EventJniHelper.h use it: started by the first that needs it, ended with
/// the process. Where it starts the VM, that tells on standard output what it does and checks every
/// call from outside (-verbose:jni, -Xcheck:jni), without its compiler.
class ZEM_EXPORT zemJvm : public zemJvmServices {
public:
    static zemJvm& getJvm();

    /// Starts the VM if there is none.
    /// @return 0, or -1
    int initJVM();
    /// Ends the VM, unless others use it. Returns 0.
    int destroyJVM();

    /// Attaches the calling thread, and starts the VM for that; null when there is none.
    JNIEnv* attachThread();
    void detachThread();
    bool isAttached();

    JavaVM* getJavaVm();
    /// The environment of the thread that started the VM, until that is detached; null where the VM
    /// was there before. That thread keeps the VM from ending, as every one does that is attached.
    JNIEnv* getEnv();
    static const char* getJvmErrorString(int code) { return zemJavaVM::getJvmErrorString(code); }

    /// Why initJVM() failed last.
    zemString getFailure();

private:
    class AtEnd;

    zemJvm() : zemJvmServices("zemJvm") {}
    ~zemJvm() = delete;

    zemSynchronizerContext m_initMutex;
    JavaVM* m_jvm = nullptr;
    JNIEnv* m_env = nullptr;
    zemString m_failure;
};

#endif
