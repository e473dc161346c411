#include "Jvm.h"

#include <jni.h>
#include <unistd.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "JvmLibrary.h"
#include "LetUnwind.h"
#include "Log.h"

namespace {

constexpr useconds_t kStartPoll = 1000;
constexpr useconds_t kPause = 10000;
constexpr int kEndPolls = 100;

std::string environment(const char* name, const char* fallback) {
    const char* const value = std::getenv(name);
    return value == nullptr || *value == '\0' ? fallback : value;
}

constexpr struct {
    const char* option;
    const char* variable;
    const char* fallback;
} kOptions[] = {
    {"-Xmx", "PEGASUS_JMPI_MAX_HEAP", "128m"},
    {"-Xms", "PEGASUS_JMPI_INITIAL_HEAP", "8m"},
    {"-Xss", "PEGASUS_JMPI_JAVA_THREAD_STACK_SIZE", "4096k"},
    {"-Djava.class.path=", "CLASSPATH", ""},
};

JNIEnv* attach(JavaVM* vm) {
    void* env = nullptr;
    return vm != nullptr && vm->AttachCurrentThread(&env, nullptr) == JNI_OK
               ? static_cast<JNIEnv*>(env)
               : nullptr;
}

bool isAttachedTo(JavaVM* vm) {
    void* env = nullptr;
    return vm != nullptr && vm->GetEnv(&env, kZemJniVersion) == JNI_OK;
}

/// Whether the part can be used; one in which an exception waits from the start is given back.
bool isSound(zemVmPart& part) {
    if (part.env == nullptr || part.env->ExceptionCheck() == JNI_FALSE) {
        return part.result == JNI_OK;
    }
    part.env->ExceptionDescribe();
    part.env->ExceptionClear();
    zemLeaveVm();
    part.result = JNI_ERR;
    part.failure = "the Java VM started with an exception";
    return false;
}

}  // namespace

// -- zemJavaVM ----------------------------------------------------------------------------------

// Lives to the end of the process: its thread and Java's do not end before.
zemJavaVM& zemJavaVM::getJavaVM() {
    static auto* const javaVM = new zemJavaVM;
    return *javaVM;
}

int zemJavaVM::initJVM() {
    if (m_jvm != nullptr) {
        return 0;
    }
    std::vector<std::string> options;
    for (const auto& row : kOptions) {
        options.push_back(row.option + environment(row.variable, row.fallback));
        const std::string index = std::to_string(options.size() - 1);
        zemLog::LogPlain(("options[" + index + "].optionString =" + options.back()).c_str());
    }
    zemVmPart part = zemTakeVm(options);
    if (isSound(part)) {
        m_jvm = part.vm;
    }
    m_failure = part.failure.c_str();
    return part.result;
}

void* zemJavaVM::run(void* javaVM) {
    auto& self = *static_cast<zemJavaVM*>(javaVM);
    {
        const zemSynchronizer hold(self.m_initJvmMutex);
        zemQuietly([&] { self.initJVM(); });
        self.m_running = true;
    }
    while (!self.m_stop) {
        usleep(kPause);
    }
    zemLog::LogPlain("JVM will be destroyed ");
    self.destroyJVM();
    zemLog::LogPlain("exit thread");
    self.m_running = false;
    return nullptr;
}

void zemJavaVM::start() {
    if (!m_JvmInAThread) {
        const zemSynchronizer hold(m_initJvmMutex);
        initJVM();
        m_running = true;
        return;
    }
    // What the last reference ended may be on its way out yet, and stays while threads are
    // attached.
    for (int i = 0; m_running && i < kEndPolls; ++i) {
        usleep(kPause);
    }
    if (m_running) {
        const zemSynchronizer hold(m_initJvmMutex);
        m_failure = "it is about to end";
        return;
    }
    m_stop = false;
    if (pthread_create(&m_thread, nullptr, &run, this) != 0) {
        const zemSynchronizer hold(m_initJvmMutex);
        m_failure = "no thread for it";
        return;
    }
    pthread_detach(m_thread);
    while (!m_running) {
        usleep(kStartPoll);
    }
    { const zemSynchronizer hold(m_initJvmMutex); }
    usleep(kPause);
}

int zemJavaVM::refJavaVM() {
    const zemSynchronizer hold(m_refJvmMutex);
    if (m_refs == 0) {
        start();
    }
    return ++m_refs;
}

int zemJavaVM::releaseJavaVM() {
    const zemSynchronizer hold(m_refJvmMutex);
    if (m_refs > 0 && --m_refs == 0 && m_JvmInAThread) {
        m_stop = true;
        const zemSynchronizer holdEnd(m_destroyJvmMutex);
        usleep(kPause);
    }
    return 0;
}

int zemJavaVM::destroyJVM() {
    JavaVM* const vm = m_jvm;
    if (vm == nullptr) {
        return 0;
    }
    attach(vm);
    if (!zemLeaveVm()) {
        vm->DetachCurrentThread();
    }
    usleep(kPause);
    m_jvm = nullptr;
    return 0;
}

JNIEnv* zemJavaVM::attachThread() {
    // A VM that ends waits for those who are attached, and takes nobody more.
    JNIEnv* const env = m_stop ? nullptr : attach(m_jvm);
    if (env == nullptr) {
        zemLog::LogPlain("attachThread, error");
    }
    return env;
}

void zemJavaVM::detachThread() {
    JavaVM* const vm = m_jvm;
    if (vm != nullptr) {
        vm->DetachCurrentThread();
    }
}

bool zemJavaVM::isAttached() { return isAttachedTo(m_jvm); }

const char* zemJavaVM::getJvmErrorString(int code) { return zemVmResultText(code); }

zemString zemJavaVM::getFailure() {
    const zemSynchronizer hold(m_initJvmMutex);
    return m_jvm == nullptr && m_failure.isEmpty() ? zemString("it does not run") : m_failure;
}

// -- zemJvm -------------------------------------------------------------------------------------

zemJvm& zemJvm::getJvm() {
    static auto* const jvm = new zemJvm;
    return *jvm;
}

// Made once the VM's library is loaded, it goes before that takes its own things down at the end of
// the process.
class zemJvm::AtEnd {
public:
    ~AtEnd() { getJvm().destroyJVM(); }
};

int zemJvm::initJVM() {
    const zemSynchronizer hold(m_initMutex);
    if (m_jvm != nullptr) {
        return 0;
    }
    std::string path = "-Djava.library.path=.:/usr/lib64/:/usr/lib/:";
    path += environment("LIBPATH", "") + ':' + environment("LD_LIBRARY_PATH", "") + ':' +
            environment("PATH", "");
    zemVmPart part = zemTakeVm({"-Djava.class.path=" + environment("CLASSPATH", ""), path,
                                "-verbose:jni", "-Djava.compiler=NONE", "-Xcheck:jni"});
    if (!isSound(part)) {
        m_failure = part.failure.c_str();
        return -1;
    }
    m_jvm = part.vm;
    m_env = part.env;
    static const AtEnd atEnd;
    return 0;
}

int zemJvm::destroyJVM() {
    const zemSynchronizer hold(m_initMutex);
    if (m_jvm != nullptr) {
        m_jvm = nullptr;
        m_env = nullptr;
        zemLeaveVm();
    }
    return 0;
}

JNIEnv* zemJvm::attachThread() {
    initJVM();
    return attach(getJavaVm());
}

void zemJvm::detachThread() {
    const zemSynchronizer hold(m_initMutex);
    void* env = nullptr;
    if (m_jvm != nullptr && m_jvm->GetEnv(&env, kZemJniVersion) == JNI_OK) {
        m_env = m_env == env ? nullptr : m_env;
        m_jvm->DetachCurrentThread();
    }
}

bool zemJvm::isAttached() { return isAttachedTo(getJavaVm()); }

JavaVM* zemJvm::getJavaVm() {
    const zemSynchronizer hold(m_initMutex);
    return m_jvm;
}

JNIEnv* zemJvm::getEnv() {
    const zemSynchronizer hold(m_initMutex);
    return m_env;
}

zemString zemJvm::getFailure() {
    const zemSynchronizer hold(m_initMutex);
    return m_failure;
}
