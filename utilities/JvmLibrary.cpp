#include "JvmLibrary.h"

#include <dlfcn.h>
#include <glob.h>

#include <csignal>
#include <cstdlib>
#include <iterator>
#include <mutex>

namespace {

constexpr struct {
    int result;
    const char* text;
} kResults[] = {
    {JNI_OK, "success"},
    {JNI_ERR, "unknown error"},
    {JNI_EDETACHED, "the thread is not attached to the VM"},
    {JNI_EVERSION, "the VM does not know this version of JNI"},
    {JNI_ENOMEM, "not enough memory"},
    {JNI_EEXIST, "the process has a VM already"},
    {JNI_EINVAL, "invalid arguments"},
};

/// Where Java lies when JAVA_HOME does not tell, the first one that is there: what the dynamic
/// linker finds, the system's choice, any.
constexpr const char* kUsualPlaces[] = {
    "/usr/lib/jvm/default-java/lib/server/libjvm.so",
    "/usr/lib/jvm/jre/lib/server/libjvm.so",
    "/usr/lib/jvm/*/lib/server/libjvm.so",
    "/usr/lib/jvm/*/jre/lib/*/server/libjvm.so",
    "/opt/*/lib/server/libjvm.so",
};
constexpr const char* kInJavaHome = "/lib/server/libjvm.so";

/// Signals that a VM takes for itself though the server may live by them, and has no use for here.
constexpr struct {
    int number;
    bool isWithheld;  ///< ends the server, in its own way
} kSignals[] = {
    {SIGHUP, true}, {SIGINT, true}, {SIGTERM, true}, {SIGQUIT, false}, {SIGUSR2, false}};

/// Has the VM that starts in its scope leave the server's signals alone. What is ignored when it
/// starts, it neither handles nor lets through to its threads, so that is what the withheld signals
/// are meanwhile; the others go back to those who handled them.
class ServerSignals {
public:
    ServerSignals() {
        for (std::size_t i = 0; i < std::size(kSignals); ++i) {
            struct sigaction ignored = {};
            ignored.sa_handler = SIG_IGN;
            sigaction(kSignals[i].number, kSignals[i].isWithheld ? &ignored : nullptr,
                      &m_before[i]);
        }
    }
    ~ServerSignals() {
        for (std::size_t i = 0; i < std::size(kSignals); ++i) {
            if (kSignals[i].isWithheld || m_before[i].sa_handler != SIG_DFL) {
                sigaction(kSignals[i].number, &m_before[i], nullptr);
            }
        }
    }
    ServerSignals(const ServerSignals&) = delete;
    ServerSignals& operator=(const ServerSignals&) = delete;

private:
    struct sigaction m_before[std::size(kSignals)];
};

using CreateVm = jint (*)(JavaVM**, void**, void*);
using CreatedVms = jint (*)(JavaVM**, jsize, jsize*);

/// The VM's library, which stays loaded.
struct Library {
    CreateVm create = nullptr;
    CreatedVms created = nullptr;
    std::string failure;
};

void* openUsual() {
    for (const char* pattern : kUsualPlaces) {
        glob_t found = {};
        void* library = nullptr;
        if (glob(pattern, 0, nullptr, &found) == 0) {
            for (std::size_t i = 0; i < found.gl_pathc && library == nullptr; ++i) {
                library = dlopen(found.gl_pathv[i], RTLD_NOW);
            }
        }
        globfree(&found);
        if (library != nullptr) {
            return library;
        }
    }
    return nullptr;
}

Library open() {
    Library library;
    const char* const home = std::getenv("JAVA_HOME");
    const bool isTold = home != nullptr && *home != '\0';
    void* handle = dlopen("libjvm.so", RTLD_NOW | RTLD_NOLOAD);  // the server may have a VM itself
    if (handle == nullptr && isTold) {
        handle = dlopen((std::string(home) + kInJavaHome).c_str(), RTLD_NOW);
        if (handle == nullptr) {
            library.failure = "no Java where JAVA_HOME is: " + std::string(dlerror());
            return library;
        }
    }
    if (handle == nullptr) {
        handle = dlopen("libjvm.so", RTLD_NOW);
    }
    if (handle == nullptr) {
        handle = openUsual();
    }
    if (handle == nullptr) {
        library.failure = "no Java found: neither JAVA_HOME nor a usual place has libjvm.so";
        return library;
    }
    library.create = reinterpret_cast<CreateVm>(dlsym(handle, "JNI_CreateJavaVM"));
    library.created = reinterpret_cast<CreatedVms>(dlsym(handle, "JNI_GetCreatedJavaVMs"));
    if (library.create == nullptr || library.created == nullptr) {
        library.failure = "libjvm.so is not the library of a Java VM";
    }
    return library;
}

/// Keeps this library loaded: threads of the VM run in it, whatever the server unloads.
void pin() {
    Dl_info self;
    if (dladdr(reinterpret_cast<void*>(&pin), &self) != 0) {
        dlopen(self.dli_fname, RTLD_NOW | RTLD_NOLOAD | RTLD_NODELETE);
    }
}

std::mutex g_mutex;
JavaVM* g_vm = nullptr;  ///< while there are parts
int g_parts = 0;
bool g_isOurs = false;
bool g_isEnding = false;

/// The VM of the process, where there is one.
JavaVM* existing(const Library& library) {
    JavaVM* vm = nullptr;
    jsize count = 0;
    return library.created(&vm, 1, &count) == JNI_OK && count > 0 ? vm : nullptr;
}

void start(const Library& library, const std::vector<std::string>& options, zemVmPart& part) {
    std::vector<JavaVMOption> rows;
    rows.reserve(options.size());
    for (const std::string& option : options) {
        rows.push_back({const_cast<char*>(option.c_str()), nullptr});
    }
    JavaVMInitArgs arguments = {};
    arguments.version = kZemJniVersion;
    arguments.options = rows.data();
    arguments.nOptions = static_cast<jint>(rows.size());
    arguments.ignoreUnrecognized = JNI_FALSE;
    const ServerSignals signals;
    void* env = nullptr;
    part.result = library.create(&part.vm, &env, &arguments);
    part.env = static_cast<JNIEnv*>(env);
}

}  // namespace

const char* zemVmResultText(int result) {
    for (const auto& row : kResults) {
        if (row.result == result) {
            return row.text;
        }
    }
    return "undefined result";
}

zemVmPart zemTakeVm(const std::vector<std::string>& options) {
    const std::lock_guard<std::mutex> hold(g_mutex);
    zemVmPart part;
    if (g_isEnding) {
        part.failure = "the Java VM of this process is about to end";
        return part;
    }
    if (g_parts == 0) {
        const Library library = open();
        if (!library.failure.empty()) {
            part.failure = library.failure;
            return part;
        }
        g_vm = existing(library);
        g_isOurs = g_vm == nullptr;
        if (g_isOurs) {
            start(library, options, part);
            if (part.result != JNI_OK) {
                part.vm = nullptr;
                part.env = nullptr;
                part.failure =
                    std::string("the Java VM did not start: ") + zemVmResultText(part.result);
                return part;
            }
            g_vm = part.vm;
        }
        pin();
    }
    ++g_parts;
    part.vm = g_vm;
    part.result = JNI_OK;
    return part;
}

bool zemLeaveVm() {
    std::unique_lock<std::mutex> hold(g_mutex);
    if (g_parts == 0 || --g_parts > 0) {
        return false;
    }
    JavaVM* const vm = g_vm;
    g_vm = nullptr;
    if (!g_isOurs) {
        return false;
    }
    // Not under the mutex: it waits for attached threads, which may come here.
    g_isEnding = true;
    hold.unlock();
    vm->DestroyJavaVM();
    hold.lock();
    g_isEnding = false;
    return true;
}
