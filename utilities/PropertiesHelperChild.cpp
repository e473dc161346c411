#include "PropertiesHelperChild.h"

#include <fcntl.h>
#include <linux/capability.h>
#include <pwd.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <csignal>
#include <cstring>
#include <string_view>

#include "LetUnwind.h"
#include "Synchronizer.h"

namespace {

const std::string& textOf(const std::vector<std::string>& texts, int error) {
    return texts[std::min<size_t>(static_cast<size_t>(error), texts.size() - 1)];
}

/// What follows the number of "<number>:<text>".
const char* wordsOf(const std::string& text) { return text.c_str() + text.find(':') + 1; }

int errnoOr(int fallback) { return errno != 0 ? errno : fallback; }

/// The body of a switch, with the calls that make it. The group goes first: the user may have lost
/// the right to change it.
int becomeUser(const zemUserSwitch& user, int (*setGroup)(gid_t), int (*setUser)(uid_t)) {
    if (!user.needed) {
        return user.failure;
    }
    errno = 0;
    if (setGroup(user.gid) != 0 || setUser(user.uid) != 0) {
        return errnoOr(zemUserSwitch::kNoSuchUser);
    }
    return 0;
}

// --- in the child, by the rule at the top of the header ------------------------------------------

void writeAll(int fd, const char* bytes, size_t size) {
    while (size > 0) {
        const ssize_t written = write(fd, bytes, size);
        if (written < 0 && errno != EINTR) {
            return;
        }
        if (written > 0) {
            bytes += written;
            size -= static_cast<size_t>(written);
        }
    }
}

/// Writes the three texts and a zero byte. The reader may have given up meanwhile, which must not
/// keep a program from being started: hence no SIGPIPE.
void report(int fd, const char* text, const char* separator = "", const char* subject = "") {
    std::signal(SIGPIPE, SIG_IGN);
    writeAll(fd, text, std::strlen(text));
    writeAll(fd, separator, std::strlen(separator));
    writeAll(fd, subject, std::strlen(subject) + 1);
    std::signal(SIGPIPE, SIG_DFL);
}

/// Gives the signals, all held back so far, their defaults before the first can come: a handler of
/// the server's would run on its memory, and a tool that ignores SIGTERM cannot be ended.
void resetSignals() {
    for (int signal = 1; signal < NSIG; ++signal) {
        std::signal(signal, SIG_DFL);
    }
    sigset_t none;
    sigemptyset(&none);
    sigprocmask(SIG_SETMASK, &none, nullptr);
}

/// Marks all but the standard descriptors to be closed when the program begins: a server's sockets
/// and files are no tool's business. Open until then, the channel can still tell of a failure.
void closeOthersAtExec() {
    constexpr unsigned int first = STDERR_FILENO + 1;
#ifdef SYS_close_range
    constexpr unsigned int atExec = 1U << 2;  // CLOSE_RANGE_CLOEXEC, which older headers lack
    if (syscall(SYS_close_range, first, ~0U, atExec) == 0) {
        return;
    }
#endif
    rlimit limit = {};
    getrlimit(RLIMIT_NOFILE, &limit);
    for (rlim_t fd = first; fd < std::min<rlim_t>(limit.rlim_cur, INT_MAX); ++fd) {
        fcntl(static_cast<int>(fd), F_SETFD, FD_CLOEXEC);
    }
}

// The C library's own calls switch every thread of a process, and the server's are what the child
// would find. The kernel knows threads only.
#ifdef SYS_setgid32
constexpr long kSetGroup = SYS_setgid32;
constexpr long kSetUser = SYS_setuid32;
#else
constexpr long kSetGroup = SYS_setgid;
constexpr long kSetUser = SYS_setuid;
#endif
int setOwnGroup(gid_t group) { return static_cast<int>(syscall(kSetGroup, group)); }
int setOwnUser(uid_t user) { return static_cast<int>(syscall(kSetUser, user)); }

/// Drops every capability that is left after the switch to a user. Without permitted and
/// inheritable ones there are no ambient ones, and exec gives what belongs to the user alone.
int dropCapabilities() {
    __user_cap_header_struct self = {_LINUX_CAPABILITY_VERSION_3, 0};
    constexpr __user_cap_data_struct none[_LINUX_CAPABILITY_U32S_3] = {};
    return static_cast<int>(syscall(SYS_capset, &self, none));
}

}  // namespace

void zemChildProcess::run(const zemChildWiring& wiring) const {
    resetSignals();
    closeOthersAtExec();
    if (wiring.readingEnd != 0) {
        close(wiring.readingEnd);
    }
    if (dup2(wiring.out, STDOUT_FILENO) < 0 || dup2(wiring.err, STDERR_FILENO) < 0) {
        endEarly(wiring, errno);
    }
    if (m_user.needed) {
        const bool switched = becomeUser(m_user, setOwnGroup, setOwnUser) == 0;
        if (!switched || dropCapabilities() != 0) {
            endEarly(wiring, errno);
        }
    }
    const bool complains = !m_complaint.empty();
    if (complains && wiring.channel == 0) {
        report(STDOUT_FILENO, m_streamed);
    }
    if (m_user.failure != 0 || m_line.unbalancedQuote) {
        _exit(wiring.channel == 0 && m_user.failure > 0 ? m_user.failure : kEarlyEnd);
    }
    exec();
    if (complains && wiring.channel != 0) {
        _exit(kEarlyEnd);
    }
    endEarly(wiring, errno, " : ", m_line.program.c_str());
}

/// Says why and ends; without a channel @p separator and @p subject follow the words.
void zemChildProcess::endEarly(const zemChildWiring& wiring, int error, const char* separator,
                               const char* subject) const {
    const std::string& text = textOf(m_texts, error);
    if (wiring.channel != 0) {
        report(wiring.channel, text.c_str());
        _exit(kEarlyEnd);
    }
    report(STDOUT_FILENO, wordsOf(text), separator, subject);
    _exit(error > 0 ? error : kEarlyEnd);
}

/// Replaces the process by the program; returns only on failure.
void zemChildProcess::exec() const {
    if (m_environment.empty()) {
        execvp(m_argv[0], m_argv.data());
    } else {
        execvpe(m_argv[0], m_argv.data(), m_environment.data());
    }
}

// --- in the parent ------------------------------------------------------------------------------

namespace {

/// strerror takes locks that another thread may hold at the start, so the child only looks up.
const std::vector<std::string>& errorTexts() {
    static const std::vector<std::string> texts = [] {
        constexpr int kNumbers = 256;
        std::vector<std::string> all;
        all.reserve(kNumbers);
        for (int error = 0; error < kNumbers; ++error) {
            all.push_back(std::to_string(error) + ':' + std::strerror(error));
        }
        return all;
    }();
    return texts;
}

bool isGiven(const char* text) { return text != nullptr && *text != '\0'; }

/// Holds every signal back from the calling thread, and so from its child.
class SignalsHeld {
public:
    SignalsHeld() {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &m_before);
    }
    ~SignalsHeld() { pthread_sigmask(SIG_SETMASK, &m_before, nullptr); }
    SignalsHeld(const SignalsHeld&) = delete;
    SignalsHeld& operator=(const SignalsHeld&) = delete;

private:
    sigset_t m_before;
};

/// Keeps a child that is another user already from being traced by that user while it has the
/// memory of the server. The kernel sees to it at the switch, by a mark on the memory; but the mark
/// would stay with the server, which could leave no core from then on. So the server gets its own
/// setting back, but only when the last such child has a memory of its own.
class UntraceableChild {
public:
    explicit UntraceableChild(bool switches) : m_switches(switches) {
        if (!m_switches) {
            return;
        }
        const zemSynchronizer guard(starting().lock);
        if (starting().count++ == 0) {
            starting().dumpable = prctl(PR_GET_DUMPABLE);
        }
    }
    ~UntraceableChild() {
        if (!m_switches) {
            return;
        }
        const zemSynchronizer guard(starting().lock);
        if (--starting().count == 0 && starting().dumpable == 1) {
            prctl(PR_SET_DUMPABLE, 1);
        }
    }
    UntraceableChild(const UntraceableChild&) = delete;
    UntraceableChild& operator=(const UntraceableChild&) = delete;

private:
    struct Starting {
        zemSynchronizerContext lock;
        int count = 0;
        int dumpable = 0;
    };
    /// Never destroyed: tools may still be started while the process ends.
    static Starting& starting() {
        static Starting& all = *new Starting;
        return all;
    }

    const bool m_switches;
};

}  // namespace

zemUserSwitch zemFindUser(const char* userName) {
    const zemUncancelled uncancelled;
    zemUserSwitch found;
    // The C library takes a name of any length to pieces on the stack.
    if (strnlen(userName, LOGIN_NAME_MAX) == LOGIN_NAME_MAX) {
        found.failure = zemUserSwitch::kNoSuchUser;
        return found;
    }
    char pwdBuffer[1024];
    passwd pwd = {};
    passwd* result = nullptr;
    errno = 0;
    if (getpwuid_r(geteuid(), &pwd, pwdBuffer, sizeof pwdBuffer, &result) != 0) {
        found.failure = errnoOr(zemUserSwitch::kNoSuchUser);
        return found;
    }
    if (result != nullptr && std::strcmp(result->pw_name, userName) == 0) {
        return found;
    }
    errno = 0;
    if (getpwnam_r(userName, &pwd, pwdBuffer, sizeof pwdBuffer, &result) != 0) {
        found.failure = errno;
    } else if (result == nullptr) {
        found.failure = errnoOr(zemUserSwitch::kNoSuchUser);
    } else {
        found.needed = true;
        found.uid = result->pw_uid;
        found.gid = result->pw_gid;
    }
    return found;
}

int zemBecomeUser(const zemUserSwitch& user) { return becomeUser(user, setgid, setuid); }

zemChildProcess::zemChildProcess(const char* command, const char* userName, const char* locale)
    : m_texts(errorTexts()), m_line(zemSplitCommandLine(command)) {
    for (std::string& argument : m_line.arguments) {
        m_argv.push_back(argument.data());
    }
    m_argv.push_back(nullptr);
    if (isGiven(locale)) {
        setLocale(locale);
    }
    if (isGiven(userName)) {
        m_user = zemFindUser(userName);
    }
    if (m_user.failure != 0) {
        m_complaint = m_user.failure == zemUserSwitch::kNoSuchUser
                          ? std::string("0:The given user name \"") + userName + "\" was not found."
                          : textOf(m_texts, m_user.failure);
        m_streamed = wordsOf(m_complaint);
    } else if (!m_line.valid()) {
        m_complaint = "-1:Invalid command parameter:" + m_line.parameters;
        m_streamed = m_complaint.c_str();
    }
}

void zemChildProcess::setLocale(const char* locale) {
    constexpr std::string_view key = "LC_ALL=";
    m_localeEntry = std::string(key) + locale;
    bool replaced = false;
    for (char** entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
        const bool same = std::strncmp(*entry, key.data(), key.size()) == 0;
        m_environment.push_back(same ? m_localeEntry.data() : *entry);
        replaced = replaced || same;
    }
    if (!replaced) {
        m_environment.push_back(m_localeEntry.data());
    }
    m_environment.push_back(nullptr);
}

/// Whether all that a child without a channel may say fits an empty pipe, so that it need not wait
/// for the reader, which stands still until the child is done.
bool zemChildProcess::fitsPipe() const {
    constexpr size_t kLongestErrorText = 256;
    return m_complaint.size() + m_line.program.size() + kLongestErrorText < PIPE_BUF;
}

pid_t zemChildProcess::start(const zemChildWiring& wiring) const {
    const zemUncancelled uncancelled;
    const SignalsHeld signals;
    const UntraceableChild untraceable(m_user.needed);
    const bool borrows = wiring.channel != 0 || fitsPipe();
    const pid_t pid = borrows ? vfork() : fork();
    if (pid == 0) {
        run(wiring);
    }
    return pid;
}
