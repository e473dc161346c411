#include <fcntl.h>
#include <poll.h>
#include <pwd.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <climits>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

#include "CommandLine.h"
#include "Exception.h"
#include "Pipe.h"
#include "PollPlan.h"
#include "PropertiesHelper.h"

namespace {

constexpr char kClass[] = "zemPropertiesHelper";
constexpr char kMethod[] = "executeCommand";  // also of what the asynchronous form throws

constexpr int kNoSuchUser = -1;
constexpr int kEarlyEnd = 255;  // exit status of a child that did not reach its program

/// Output counts in pieces of this size: a zero byte hides the rest of its piece.
constexpr size_t kPiece = 1023;

/// Who is woken at the child's end looks at times only, for a child that a debugger has stopped.
constexpr std::chrono::microseconds kPauseUntilWoken = std::chrono::milliseconds(100);

[[noreturn]] void throwFailed(const char* accessMethod, int error, const char* text) {
    throw zemOperationFailedException(kClass, kMethod, accessMethod, zemString(error), text);
}

[[noreturn]] void throwSystemError(const char* accessMethod, int error) {
    throwFailed(accessMethod, error, std::strerror(error));
}

bool isGiven(const char* text) { return text != nullptr && *text != '\0'; }

// --- user switch --------------------------------------------------------------------------------

/// A user to become, looked up beforehand: the look-up takes locks, the switch itself none.
struct UserSwitch {
    int failure = 0;  // of the look-up: an error number or kNoSuchUser
    bool needed = false;
    uid_t uid = 0;
    gid_t gid = 0;
};

int errnoOr(int fallback) { return errno != 0 ? errno : fallback; }

UserSwitch findUser(const char* userName) {
    UserSwitch found;
    char pwdBuffer[1024];
    passwd pwd = {};
    passwd* result = nullptr;
    errno = 0;
    if (getpwuid_r(geteuid(), &pwd, pwdBuffer, sizeof pwdBuffer, &result) != 0) {
        found.failure = errnoOr(kNoSuchUser);
        return found;
    }
    if (result != nullptr && std::strcmp(result->pw_name, userName) == 0) {
        return found;
    }
    errno = 0;
    if (getpwnam_r(userName, &pwd, pwdBuffer, sizeof pwdBuffer, &result) != 0) {
        found.failure = errno;
    } else if (result == nullptr) {
        found.failure = errnoOr(kNoSuchUser);
    } else {
        found.needed = true;
        found.uid = result->pw_uid;
        found.gid = result->pw_gid;
    }
    return found;
}

/// The group goes first: the user may have lost the right to change it.
int becomeUser(const UserSwitch& user) {
    if (!user.needed) {
        return user.failure;
    }
    errno = 0;
    if (setgid(user.gid) != 0) {
        return errnoOr(kNoSuchUser);
    }
    errno = 0;
    return setuid(user.uid) == 0 ? 0 : errnoOr(kNoSuchUser);
}

// --- before the fork ----------------------------------------------------------------------------

/// "<number>:<text>" of every error number. strerror takes locks that another thread may hold at
/// the fork, so the child only looks up.
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

/// All that a child needs, made while threads, locks and memory are still in order: up to its exec
/// the child then calls nothing that takes a lock or memory.
class PreparedCommand {
public:
    PreparedCommand(const char* command, const char* userName, const char* locale)
        : m_line(zemSplitCommandLine(command)), m_texts(errorTexts()) {
        for (std::string& argument : m_line.arguments) {
            m_argv.push_back(argument.data());
        }
        m_argv.push_back(nullptr);
        if (!m_line.valid()) {
            m_complaint = "-1:Invalid command parameter:" + m_line.parameters;
        }
        if (isGiven(userName)) {
            m_user = findUser(userName);
            m_noSuchUser = std::string("0:The given user name \"") + userName + "\" was not found.";
        }
        if (isGiven(locale)) {
            setLocale(locale);
        }
    }
    PreparedCommand(const PreparedCommand&) = delete;
    PreparedCommand& operator=(const PreparedCommand&) = delete;

    const zemCommandLine& line() const { return m_line; }

    /// Whether the child does nothing but wire itself and become the program: it changes no user,
    /// and what it may report fits an empty pipe.
    bool isPlain() const {
        return m_line.valid() && m_line.program.size() < PIPE_BUF && !m_user.needed &&
               m_user.failure == 0;
    }

    const UserSwitch& user() const { return m_user; }

    /// What is wrong with the command line, empty if nothing is.
    const std::string& complaint() const { return m_complaint; }

    /// "<number>:<text>" of an error number or kNoSuchUser.
    const std::string& failureText(int error) const {
        return error == kNoSuchUser
                   ? m_noSuchUser
                   : m_texts[std::min<size_t>(static_cast<size_t>(error), m_texts.size() - 1)];
    }

    /// Replaces the process by the program; returns only on failure.
    void exec() const {
        if (m_environment.empty()) {
            execvp(m_argv[0], m_argv.data());
        } else {
            execvpe(m_argv[0], m_argv.data(), m_environment.data());
        }
    }

private:
    void setLocale(const char* locale) {
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

    zemCommandLine m_line;
    std::vector<char*> m_argv;
    std::string m_complaint;
    UserSwitch m_user;
    std::string m_noSuchUser;
    std::string m_localeEntry;
    std::vector<char*> m_environment;  // empty: the process's own
    const std::vector<std::string>& m_texts;
};

/// Opens @p pipe so that it is neither one of the standard descriptors, which the child fills, nor
/// left open in the children of other runs, where it would hide the end of this one's output.
void openPipe(zemPipe& pipe) {
    int fds[2];
    if (pipe2(fds, O_CLOEXEC) != 0) {
        throwSystemError("pipe", errno);
    }
    int error = 0;
    for (int& fd : fds) {
        if (fd > STDERR_FILENO) {
            continue;
        }
        const int low = fd;
        fd = fcntl(low, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
        if (fd < 0) {
            error = errno;
            fd = 0;  // none
        }
        close(low);
    }
    pipe.attach(fds);
    if (error != 0) {
        throwSystemError("pipe", error);
    }
}

void setNonBlocking(zemPipe& pipe) { fcntl(pipe.getReadingPipe(), F_SETFL, O_NONBLOCK); }

// --- in the child -------------------------------------------------------------------------------

/// What sets the children of the two runners apart.
struct ChildWiring {
    int out;             // becomes descriptor 1
    int err;             // becomes descriptor 2
    int report;          // where the child says why it did not reach its program
    bool numbered;       // reports begin with their number and the exit status is kEarlyEnd
    int parentsEnds[3];  // reading ends, closed in the child; 0 for none
};

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

/// Writes @p text and its zero byte. The reader may have given up meanwhile, which must not keep a
/// program from being started: hence no SIGPIPE.
void report(int fd, const char* text, const char* separator = "", const char* subject = "") {
    struct sigaction ignore = {};
    struct sigaction before = {};
    ignore.sa_handler = SIG_IGN;
    sigaction(SIGPIPE, &ignore, &before);
    writeAll(fd, text, std::strlen(text));
    writeAll(fd, separator, std::strlen(separator));
    writeAll(fd, subject, std::strlen(subject) + 1);
    sigaction(SIGPIPE, &before, nullptr);
}

[[noreturn]] void endEarly(const PreparedCommand& command, const ChildWiring& wiring, int error,
                           const char* subject) {
    const char* text = command.failureText(error).c_str();
    if (wiring.numbered) {
        report(wiring.report, text);
        _exit(kEarlyEnd);
    }
    report(wiring.report, std::strchr(text, ':') + 1, subject != nullptr ? " : " : "",
           subject != nullptr ? subject : "");
    _exit(error > 0 ? error : kEarlyEnd);
}

/// The child from the fork to the program. The ends that it writes close at exec or exit.
[[noreturn]] void runChild(const PreparedCommand& command, const ChildWiring& wiring) {
    for (const int end : wiring.parentsEnds) {
        if (end != 0) close(end);
    }
    if (dup2(wiring.out, STDOUT_FILENO) < 0 || dup2(wiring.err, STDERR_FILENO) < 0) {
        endEarly(command, wiring, errno, nullptr);
    }
    const int switched = becomeUser(command.user());
    if (switched != 0) {
        endEarly(command, wiring, switched, nullptr);
    }
    if (!command.line().valid()) {
        report(wiring.report, command.complaint().c_str());
        if (command.line().unbalancedQuote) {
            _exit(kEarlyEnd);
        }
    }
    command.exec();
    endEarly(command, wiring, errno, command.line().program.c_str());
}

// --- in the parent ------------------------------------------------------------------------------

/// Holds every signal back from the calling thread.
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

    /// In the child: what exec makes of the signals, before the first can come. A handler of the
    /// parent's would run on the memory that both use.
    void releaseInChild() const {
        struct sigaction action = {};
        for (int signal = 1; signal < NSIG; ++signal) {
            const bool caught = sigaction(signal, nullptr, &action) == 0 &&
                                action.sa_handler != SIG_DFL && action.sa_handler != SIG_IGN;
            if (caught) {
                std::signal(signal, SIG_DFL);
            }
        }
        sigprocmask(SIG_SETMASK, &m_before, nullptr);
    }

private:
    sigset_t m_before;
};

/// Starts a child. A plain one borrows the memory of this process and halts this thread up to its
/// exec: to fork a large server takes longer than many a tool runs, and every page written next
/// has to be copied.
/// @return its id, or -1 with errno set
pid_t startChild(const PreparedCommand& command, const ChildWiring& wiring) {
    const SignalsHeld signals;
    const pid_t pid = command.isPlain() ? vfork() : fork();
    if (pid == 0) {
        signals.releaseInChild();
        runChild(command, wiring);
    }
    return pid;
}

/// Appends @p size bytes of output, each piece up to its first zero byte.
void appendPieces(std::string& text, const char* bytes, size_t size) {
    for (size_t begin = 0; begin < size; begin += kPiece) {
        const size_t piece = std::min(kPiece, size - begin);
        text.append(bytes + begin, strnlen(bytes + begin, piece));
    }
}

/// A descriptor that can be read when the child has ended; none where the system has no such thing.
class ChildEnd {
public:
    explicit ChildEnd(pid_t pid)
        : m_descriptor(static_cast<int>(syscall(SYS_pidfd_open, pid, 0))) {}
    ~ChildEnd() {
        if (isKnown()) close(m_descriptor);
    }
    ChildEnd(const ChildEnd&) = delete;
    ChildEnd& operator=(const ChildEnd&) = delete;

    bool isKnown() const { return m_descriptor >= 0; }
    int descriptor() const { return m_descriptor; }

private:
    int m_descriptor;
};

/// One run from the fork on: empties the child's pipes until the child has ended.
class Supervision {
public:
    zemPipe m_pfdStdout;
    zemPipe m_pfdStderr;
    zemPipe m_pfdExp;

    std::string m_stdout;
    std::string m_stderr;
    int m_status = 0;

    void open() {
        openPipe(m_pfdStdout);
        openPipe(m_pfdStderr);
        openPipe(m_pfdExp);
    }

    ChildWiring wiring() const {
        return {m_pfdStdout.getWritingPipe(),
                m_pfdStderr.getWritingPipe(),
                m_pfdExp.getWritingPipe(),
                true,
                {m_pfdStdout.getReadingPipe(), m_pfdStderr.getReadingPipe(),
                 m_pfdExp.getReadingPipe()}};
    }

    void closeChildEnds() {
        for (zemPipe* pipe : {&m_pfdStdout, &m_pfdStderr, &m_pfdExp}) {
            pipe->closeWritingPipe();
            setNonBlocking(*pipe);
        }
    }

    /// Polls until the child has ended (true) or the limit is reached (false).
    /// @param error  receives the error number when waiting itself fails, else 0
    bool awaitEnd(pid_t pid, int waitTime, int& error) {
        zemPollPlan plan(waitTime);
        const ChildEnd end(pid);
        error = 0;
        for (;;) {
            if (plan.expired()) {
                return error != 0;
            }
            const pid_t ended = waitpid(pid, &m_status, WNOHANG);
            error = ended < 0 ? errno : 0;
            if (ended >= 0) {
                drainAll();
            }
            if (ended > 0 || (ended < 0 && error != EINTR)) {
                return true;
            }
            rest(end.isKnown() && !plan.limited() ? kPauseUntilWoken : plan.pause(), end);
        }
    }

    /// Why the child did not reach its program, "<number>:<text>"; empty when it did.
    std::string exceptionText() const {
        std::string text;
        appendPieces(text, m_exp.data(), m_exp.size());
        return text;
    }

private:
    /// Spends a pause between two passes. A pipe that fills meanwhile is emptied, so that the child
    /// need not wait for the next pass, and the end of the child ends the pause.
    void rest(std::chrono::microseconds pause, const ChildEnd& end) {
        using Clock = std::chrono::steady_clock;
        pollfd watched[] = {{end.descriptor(), POLLIN, 0},
                            {m_pfdStdout.getReadingPipe(), POLLIN, 0},
                            {m_pfdStderr.getReadingPipe(), POLLIN, 0},
                            {m_pfdExp.getReadingPipe(), POLLIN, 0}};
        const auto until = Clock::now() + pause;
        for (auto left = until - Clock::now(); left > left.zero(); left = until - Clock::now()) {
            const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(left);
            const timespec limit = {seconds.count(), (left - seconds).count()};
            const int ready = ppoll(watched, std::size(watched), &limit, nullptr);
            if (ready < 0 && errno != EINTR) {
                std::this_thread::sleep_for(left);
            }
            if (watched[0].revents != 0) {
                return;
            }
            if (ready > 0) {
                drainAll();
            }
            for (pollfd& pipe : watched) {
                // The child may close its output and go on.
                if ((pipe.revents & (POLLHUP | POLLIN)) == POLLHUP) pipe.fd = -1;
            }
        }
    }

    /// The exception channel is emptied along with the others, for its text can be larger than a
    /// pipe; its pieces are counted at the end, when it is whole.
    void drainAll() {
        drain(m_pfdStdout,
              [this](const char* bytes, size_t size) { appendPieces(m_stdout, bytes, size); });
        drain(m_pfdStderr,
              [this](const char* bytes, size_t size) { appendPieces(m_stderr, bytes, size); });
        drain(m_pfdExp, [this](const char* bytes, size_t size) { m_exp.append(bytes, size); });
    }

    template <typename Sink>
    void drain(zemPipe& pipe, Sink sink) {
        for (;;) {
            const int size = pipe.read(m_buffer.data(), m_buffer.size());
            if (size > 0) {
                sink(m_buffer.data(), static_cast<size_t>(size));
            } else if (size == 0 || errno != EINTR) {
                return;
            }
        }
    }

    std::string m_exp;
    std::vector<char> m_buffer = std::vector<char>(kPiece * 64);
};

/// Throws what an ended child tells by its wait status, if it did not exit.
void checkStatus(int status) {
    if (WIFSIGNALED(status)) {
        const std::string text = "Receive Signal:" + std::to_string(WTERMSIG(status));
        throw zemOperationFailedException(kClass, kMethod, text.c_str());
    }
    if (WIFSTOPPED(status)) {
        const std::string text = "Receive Stop Signal:" + std::to_string(WSTOPSIG(status));
        throw zemOperationFailedException(kClass, kMethod, text.c_str());
    }
}

/// Throws what the exception channel holds, if it holds anything.
void checkExceptionText(const std::string& text, const std::string& program) {
    if (text.empty()) {
        return;
    }
    const int error = static_cast<int>(std::strtol(text.c_str(), nullptr, 10));
    const std::string words = text.substr(text.find(':') + 1);
    if (error == EACCES) {
        throw zemAccessDeniedException(kClass, kMethod, program.c_str(), zemString(error),
                                       words.c_str());
    }
    throwFailed(program.c_str(), error, words.c_str());
}

}  // namespace

int zemPropertiesHelper::executeCommand(const char* command, zemString& strStdout,
                                        zemString& strStderr, int* exitCode,
                                        const char* requestUserContext, int waitTime,
                                        const char* locale, bool /*forceTimeOut*/) {
    const PreparedCommand prepared(command, requestUserContext, locale);
    strStdout = "";
    strStderr = "";
    if (exitCode != nullptr) {
        *exitCode = -1;
    }
    Supervision run;
    run.open();
    const pid_t pid = startChild(prepared, run.wiring());
    if (pid < 0) {
        throwSystemError("fork", errno);
    }
    run.closeChildEnds();
    int error = 0;
    const bool ended = run.awaitEnd(pid, waitTime, error);
    strStdout += run.m_stdout.c_str();
    strStderr += run.m_stderr.c_str();
    if (!ended) {
        throw zemOperationFailedException(kClass, kMethod, "CLI_TIME_OUT",
                                          "CLI do not return in 10 miniutes.");
    }
    if (error != 0) {
        throwSystemError("waitpid", error);
    }
    checkStatus(run.m_status);
    if (exitCode != nullptr) {
        *exitCode = WEXITSTATUS(run.m_status);
    }
    checkExceptionText(run.exceptionText(), prepared.line().program);
    return 0;
}

int zemPropertiesHelper::asynExecuteCommand(const char* command, pid_t* pid, FILE** fpOutput,
                                            const char* requestUserContext, const char* locale) {
    const PreparedCommand prepared(command, requestUserContext, locale);
    zemPipe pfdStdout;
    openPipe(pfdStdout);
    setNonBlocking(pfdStdout);
    // The stream is made first, so that no tool runs on behalf of a call that fails for want of it.
    FILE* stream = fdopen(pfdStdout.getReadingPipe(), "r");
    if (stream == nullptr) {
        throwFailed("fopen", errno, command);
    }
    const int writing = pfdStdout.getWritingPipe();
    const pid_t child = startChild(
        prepared, {writing, writing, STDOUT_FILENO, false, {pfdStdout.getReadingPipe(), 0, 0}});
    const int error = errno;
    pfdStdout.closeWritingPipe();
    pfdStdout.detach();  // the reading end is the stream's
    if (child < 0) {
        std::fclose(stream);
        throwSystemError("fork", error);
    }
    if (pid != nullptr) {
        *pid = child;
    }
    if (fpOutput != nullptr) {
        *fpOutput = stream;
    }
    // Without an owner the stream stays open: closed, its end would kill the tool as it writes.
    return 0;
}

int zemPropertiesHelper::changeProcessUserContext(const char* userName) {
    return becomeUser(findUser(userName != nullptr ? userName : ""));
}
