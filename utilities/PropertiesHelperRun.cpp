#include <fcntl.h>
#include <poll.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <cstring>
#include <list>
#include <new>
#include <string>
#include <thread>
#include <vector>

#include "Exception.h"
#include "LetUnwind.h"
#include "Pipe.h"
#include "PollPlan.h"
#include "PropertiesHelper.h"
#include "PropertiesHelperChild.h"
#include "Synchronizer.h"

namespace {

constexpr char kClass[] = "zemPropertiesHelper";
constexpr char kMethod[] = "executeCommand";  // also of what the asynchronous form throws

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

/// Opens @p pipe so that it is neither one of the standard descriptors, which the child fills, nor
/// left open in the children of other runs, where it would hide the end of this one's output.
void openPipe(zemPipe& pipe) {
    const zemUncancelled uncancelled;
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
        const zemUncancelled uncancelled;
        if (isKnown()) {
            close(m_descriptor);
        }
    }
    ChildEnd(const ChildEnd&) = delete;
    ChildEnd& operator=(const ChildEnd&) = delete;

    bool isKnown() const { return m_descriptor >= 0; }
    int descriptor() const { return m_descriptor; }

private:
    int m_descriptor;
};

/// Children of runs whose thread was cancelled. They go on, as they do at a limit, but nobody else
/// knows of them: so the runs that come later reap those that have ended.
class AbandonedChildren {
public:
    using Place = std::list<pid_t>;  // for one child; made beforehand, as memory may be wanting

    static AbandonedChildren& instance() {
        // Never destroyed: threads may still be cancelled while the process ends.
        static AbandonedChildren& all = *new AbandonedChildren;
        return all;
    }

    void add(pid_t child, Place& place) {
        place.front() = child;
        const zemSynchronizer guard(m_lock);
        m_children.splice(m_children.end(), place);
    }

    void reapEnded() {
        const zemUncancelled uncancelled;
        const zemSynchronizer guard(m_lock);
        m_children.remove_if([](pid_t pid) { return waitpid(pid, nullptr, WNOHANG) != 0; });
    }

private:
    zemSynchronizerContext m_lock;
    Place m_children;
};

/// One run from its pipes on: empties them until the child has ended.
///
/// A cancelled thread leaves between two looks at the child and nowhere else.
class Supervision {
public:
    std::string m_stdout;
    std::string m_stderr;
    int m_status = 0;

    Supervision() {
        AbandonedChildren::instance().reapEnded();
        for (zemPipe* pipe : {&m_pfdStdout, &m_pfdStderr, &m_pfdExp}) {
            openPipe(*pipe);
        }
    }
    ~Supervision() {
        if (m_pid > 0) {
            AbandonedChildren::instance().add(m_pid, m_place);
        }
    }
    Supervision(const Supervision&) = delete;
    Supervision& operator=(const Supervision&) = delete;

    void start(const zemChildProcess& child) {
        m_pid = child.start({m_pfdStdout.getWritingPipe(), m_pfdStderr.getWritingPipe(),
                             m_pfdExp.getWritingPipe(), 0});
        if (m_pid < 0) {
            throwSystemError("fork", errno);
        }
        for (zemPipe* pipe : {&m_pfdStdout, &m_pfdStderr, &m_pfdExp}) {
            pipe->closeWritingPipe();
            setNonBlocking(*pipe);
        }
    }

    /// Polls until the child has ended (true) or the limit is reached (false).
    /// @param error  receives the error number when waiting itself fails, else 0
    /// @throws std::bad_alloc at the end of a child whose output found no room
    bool awaitEnd(int waitTime, int& error) {
        zemPollPlan plan(waitTime);
        const ChildEnd end(m_pid);
        error = 0;
        for (;;) {
            pthread_testcancel();
            if (plan.expired()) {
                m_pid = 0;
                return error != 0;
            }
            if (hasEnded(error)) {
                m_pid = 0;
                if (m_outOfMemory) {
                    throw std::bad_alloc();
                }
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
    /// Looks at the child, and takes what it has written.
    bool hasEnded(int& error) {
        const zemUncancelled uncancelled;
        const pid_t ended = waitpid(m_pid, &m_status, WNOHANG);
        error = ended < 0 ? errno : 0;
        if (ended >= 0) {
            drainAll();
        }
        return ended > 0 || (ended < 0 && error != EINTR);
    }

    /// Spends a pause between two passes. A pipe that fills meanwhile is emptied, so that the child
    /// need not wait for the next pass, and the end of the child ends the pause.
    void rest(std::chrono::microseconds pause, const ChildEnd& end) {
        const zemUncancelled uncancelled;
        using Clock = std::chrono::steady_clock;
        pollfd watched[] = {
            {end.descriptor(), POLLIN, 0}, watch(m_pfdStdout), watch(m_pfdStderr), watch(m_pfdExp)};
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
            if (m_outOfMemory) {
                return;
            }
            for (pollfd& pipe : watched) {
                // The child may close its output and go on.
                if ((pipe.revents & (POLLHUP | POLLIN)) == POLLHUP) {
                    pipe.fd = -1;
                }
            }
        }
    }

    /// A closed pipe is not watched.
    static pollfd watch(const zemPipe& pipe) {
        const int reading = pipe.getReadingPipe();
        return {reading != 0 ? reading : -1, POLLIN, 0};
    }

    /// The exception channel is emptied along with the others, for nothing else reads it; its
    /// pieces are counted at the end, when it is whole.
    void drainAll() {
        try {
            drain(m_pfdStdout,
                  [this](const char* bytes, size_t size) { appendPieces(m_stdout, bytes, size); });
            drain(m_pfdStderr,
                  [this](const char* bytes, size_t size) { appendPieces(m_stderr, bytes, size); });
            drain(m_pfdExp, [this](const char* bytes, size_t size) { m_exp.append(bytes, size); });
        } catch (const std::bad_alloc&) {
            // The child is still to be waited for, but not to write for ever to a reader that
            // cannot take it.
            m_outOfMemory = true;
            for (zemPipe* pipe : {&m_pfdStdout, &m_pfdStderr, &m_pfdExp}) {
                pipe->closeReadingPipe();
            }
        }
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

    zemPipe m_pfdStdout;
    zemPipe m_pfdStderr;
    zemPipe m_pfdExp;
    std::string m_exp;
    bool m_outOfMemory = false;
    pid_t m_pid = 0;  // 0: not started, ended, or the caller's to reap
    AbandonedChildren::Place m_place{0};
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

/// Throws what the exception channel holds, or the child's complaint, if there is anything.
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
    const zemChildProcess child(command, requestUserContext, locale);
    strStdout = "";
    strStderr = "";
    if (exitCode != nullptr) {
        *exitCode = -1;
    }
    Supervision run;
    run.start(child);
    int error = 0;
    const bool ended = run.awaitEnd(waitTime, error);
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
    const std::string said = run.exceptionText();
    checkExceptionText(said.empty() ? child.complaint() : said, child.program());
    return 0;
}

int zemPropertiesHelper::asynExecuteCommand(const char* command, pid_t* pid, FILE** fpOutput,
                                            const char* requestUserContext, const char* locale) {
    // Cancelled in between, the thread would leave a child and a stream without an owner.
    const zemUncancelled uncancelled;
    const zemChildProcess child(command, requestUserContext, locale);
    AbandonedChildren::instance().reapEnded();
    zemPipe pfdStdout;
    openPipe(pfdStdout);
    setNonBlocking(pfdStdout);
    // The stream is made first, so that no tool runs on behalf of a call that fails for want of it.
    FILE* stream = fdopen(pfdStdout.getReadingPipe(), "r");
    if (stream == nullptr) {
        throwFailed("fopen", errno, command);
    }
    const int writing = pfdStdout.getWritingPipe();
    const pid_t started = child.start({writing, writing, 0, pfdStdout.getReadingPipe()});
    const int error = errno;
    pfdStdout.closeWritingPipe();
    pfdStdout.detach();  // the reading end is the stream's
    if (started < 0) {
        std::fclose(stream);
        throwSystemError("fork", error);
    }
    if (pid != nullptr) {
        *pid = started;
    }
    if (fpOutput != nullptr) {
        *fpOutput = stream;
    }
    // Without an owner the stream stays open: closed, its end would kill the tool as it writes.
    return 0;
}

int zemPropertiesHelper::changeProcessUserContext(const char* userName) {
    return zemBecomeUser(zemFindUser(userName != nullptr ? userName : ""));
}
