#include "Jobs.h"

#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstring>
#include <exception>
#include <utility>

#include "BaseProvider.h"
#include "Exception.h"
#include "Guid.h"
#include "Thread.h"

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::size_t kMostJobs = 100;
constexpr std::size_t kMostWords = 4096;  ///< kept of what a tool says
constexpr int kLookMilliseconds = 200;    ///< between two looks at a tool that says nothing
constexpr std::chrono::seconds kTimeToEnd(5);
constexpr char kPrefix[] = "ORX:JOB*";

timeval now() {
    timeval time = {};
    gettimeofday(&time, nullptr);
    return time;
}

/// Takes what can be read, and keeps the front of it.
/// @return false at the end of the stream
bool drain(int fd, std::string& words) {
    char bytes[1024];
    for (;;) {
        const ssize_t size = read(fd, bytes, sizeof bytes);
        if (size <= 0 && (size == 0 || errno != EINTR)) {
            return size < 0 && errno == EAGAIN;
        }
        if (size > 0) {
            const std::size_t room = kMostWords - words.size();
            words.append(bytes, std::min(room, static_cast<std::size_t>(size)));
        }
    }
}

/// Reads @p output until @p child has ended, and closes it. The child is left for its status to be
/// fetched, so that until then its number is nobody else's.
///
/// The end of the output is not that of the tool, nor the other way round: what a tool leaves
/// behind may hold its output open.
std::string readToEnd(pid_t child, FILE* output) {
    std::string words;
    words.reserve(kMostWords);
    for (bool open = true, ended = false; !ended;) {
        if (open) {
            pollfd stream = {fileno(output), POLLIN, 0};
            if (poll(&stream, 1, kLookMilliseconds) > 0) {
                open = drain(stream.fd, words);
            }
        }
        siginfo_t end = {};
        const int failed =
            waitid(P_PID, static_cast<id_t>(child), &end, WEXITED | WNOWAIT | (open ? WNOHANG : 0));
        ended = failed != 0 ? errno != EINTR : end.si_pid == child;
        if (ended && open) {
            drain(fileno(output), words);
        }
    }
    std::fclose(output);
    words.erase(std::find(words.begin(), words.end(), '\0'), words.end());
    words.erase(words.find_last_not_of(" \r\n") + 1);
    words.erase(0, words.find_first_not_of(" \r\n"));
    return words;
}

std::string reasonOf(int waited, const std::string& words) {
    if (!words.empty()) {
        return words;
    }
    if (WIFSIGNALED(waited)) {
        return "Receive Signal:" + std::to_string(WTERMSIG(waited));
    }
    return "The tool ended with status " + std::to_string(WEXITSTATUS(waited)) + ".";
}

}  // namespace

struct JobTable::Job {
    Job(JobTable& owner, Work&& work) : table(owner), steps(std::move(work.steps)) {
        status.id = kPrefix + std::string(zemGuid::getNewGuid().toString());
        status.name = std::move(work.name);
        status.owner = std::move(work.owner);
        status.partition = std::move(work.partition);
        status.submitted = now();
    }

    JobTable& table;

    // Of whoever follows the job: first start(), then the thread.
    std::vector<Step> steps;
    std::size_t done = 0;
    FILE* output = nullptr;

    // Under the table's lock.
    Status status;
    State asked = Running;  ///< Terminated or Killed when a client wants that
    pid_t child = 0;        ///< 0 between two steps
    const Clock::time_point started = Clock::now();
    Clock::time_point ended;

    zemThread thread;
};

JobTable::Use::Use() {
    JobTable& table = instance();
    const zemSynchronizer hold(table.m_lock);
    ++table.m_uses;
}

JobTable::Use::~Use() {
    JobTable& table = instance();
    bool last = false;
    {
        const zemSynchronizer hold(table.m_lock);
        last = --table.m_uses == 0;
    }
    if (last) {
        table.endAll();
    }
}

JobTable::JobTable() = default;

JobTable::~JobTable() { endAll(); }

/// Ends all jobs and forgets them. Their threads run code of this library, and must have ended
/// before it goes.
void JobTable::endAll() {
    const auto awaitEnds = [this](Clock::time_point limit) {
        while (running() > 0 && Clock::now() < limit) {
            usleep(10 * 1000);
        }
    };
    askAll(Terminated);
    awaitEnds(Clock::now() + kTimeToEnd);
    askAll(Killed);
    awaitEnds(Clock::time_point::max());
    const zemSynchronizer hold(m_lock);
    m_jobs.clear();
}

JobTable& JobTable::instance() {
    static JobTable table;
    return table;
}

std::string JobTable::start(Work work) {
    std::list<Job> place;
    place.emplace_back(*this, std::move(work));
    Job& job = place.front();
    std::string id = job.status.id;
    makeRoom();
    if (!startNext(job)) {
        return "";
    }
    {
        const zemSynchronizer hold(m_lock);
        m_jobs.splice(m_jobs.end(), place);
    }
    // The tool runs and must have somebody to follow it; for want of a thread, this one.
    bool followed = false;
    try {
        followed = job.thread.start(&JobTable::follow, &job) == 0;
    } catch (const std::bad_alloc&) {
    }
    if (!followed) {
        follow(&job);
    }
    return id;
}

/// Starts the next step that has anything to do.
/// @return false when there is none
bool JobTable::startNext(Job& job) {
    for (; job.done < job.steps.size(); ++job.done) {
        pid_t child = 0;
        if (job.steps[job.done](&child, &job.output) == 0) {
            const zemSynchronizer hold(m_lock);
            job.child = child;
            ask(job, job.asked);  // a client may have asked just now
            return true;
        }
    }
    return false;
}

void JobTable::follow(void* data) {
    Job& job = *static_cast<Job*>(data);
    JobTable& table = job.table;
    do {
        const std::string words = readToEnd(job.child, job.output);
        if (!table.reap(job, words)) {
            return;
        }
        try {
            if (!table.startNext(job)) {
                table.end(job, Completed, "");
                return;
            }
        } catch (const zemException& failure) {
            table.end(job, Exception, failure.getExceptionString());
            return;
        } catch (const std::exception& failure) {
            table.end(job, Exception, failure.what());
            return;
        }
    } while (true);
}

/// Fetches the status of the tool that has ended.
/// @return false when the job has ended with it
bool JobTable::reap(Job& job, const std::string& words) {
    const zemSynchronizer hold(m_lock);
    int waited = 0;
    const bool known = waitpid(job.child, &waited, 0) == job.child;
    const int error = errno;
    job.child = 0;
    const bool done = known && WIFEXITED(waited) && WEXITSTATUS(waited) == 0;
    if (done) {
        const std::size_t all = job.steps.size();
        ++job.done;
        if (all > 1) {
            job.status.percent = static_cast<unsigned short>(100 * job.done / all);
        }
        if (job.asked != Running && job.done < all) {
            end(job, job.asked, "It was ended on request.");
        }
        return !job.status.ended();
    }
    if (!known) {
        end(job, Exception, "How the tool ended is not known: " + std::string(strerror(error)));
        return false;
    }
    job.status.exitCode = WIFEXITED(waited) ? WEXITSTATUS(waited) : 0;
    // A tool that is killed has no say; one that exits has failed before it was.
    const bool asAsked = WIFSIGNALED(waited) || job.asked == Terminated;
    end(job, asAsked && job.asked != Running ? job.asked : Exception, reasonOf(waited, words));
    return false;
}

void JobTable::end(Job& job, State state, const std::string& error) {
    const zemSynchronizer hold(m_lock);
    Status& status = job.status;
    status.error = error;
    if (state == Completed) {
        status.percent = 100;
    } else if (job.steps.size() > 1) {
        status.error += " (" + std::to_string(job.done) + " of " +
                        std::to_string(job.steps.size()) + " changes had been made.)";
    }
    job.ended = Clock::now();
    status.changed = now();
    status.state = state;
}

JobTable::Answer JobTable::ask(Job& job, State state) {
    if (state == Running) {
        return Started;
    }
    if (job.child != 0 && kill(job.child, state == Killed ? SIGKILL : SIGTERM) != 0) {
        return Failed;
    }
    job.asked = job.asked == Killed ? Killed : state;
    if (job.status.state == Running) {
        job.status.state = ShuttingDown;
        job.status.changed = now();
    }
    return Started;
}

void JobTable::askAll(State state) {
    const zemSynchronizer hold(m_lock);
    for (Job& job : m_jobs) {
        if (!job.status.ended()) {
            ask(job, state);
        }
    }
}

std::ptrdiff_t JobTable::running() {
    const zemSynchronizer hold(m_lock);
    return std::count_if(m_jobs.begin(), m_jobs.end(),
                         [](const Job& job) { return !job.status.ended(); });
}

// A job that has ended does not take the lock any more, so its thread may be joined under it.
void JobTable::makeRoom() {
    const zemSynchronizer hold(m_lock);
    dropOld();
    while (m_jobs.size() >= kMostJobs) {
        const auto oldest = std::find_if(m_jobs.begin(), m_jobs.end(),
                                         [](const Job& job) { return job.status.ended(); });
        if (oldest == m_jobs.end()) {
            throw zemOperationFailedException("JobTable", "start", "Too many jobs are running.");
        }
        m_jobs.erase(oldest);
    }
}

void JobTable::dropOld() {
    const auto limit = Clock::now() - std::chrono::seconds(kSecondsBeforeRemoval);
    m_jobs.remove_if([&](const Job& job) {
        return job.status.ended() && job.status.deleteOnCompletion && job.ended < limit;
    });
}

JobTable::Job* JobTable::jobOf(const std::string& id) {
    dropOld();
    const auto job = std::find_if(m_jobs.begin(), m_jobs.end(),
                                  [&](const Job& each) { return each.status.id == id; });
    return job == m_jobs.end() ? nullptr : &*job;
}

JobTable::Status JobTable::statusOf(const Job& job) {
    Status status = job.status;
    status.elapsed = std::chrono::duration_cast<std::chrono::microseconds>(
        (status.ended() ? job.ended : Clock::now()) - job.started);
    return status;
}

std::vector<JobTable::Status> JobTable::all() {
    const zemSynchronizer hold(m_lock);
    dropOld();
    std::vector<Status> found;
    for (const Job& job : m_jobs) {
        found.push_back(statusOf(job));
    }
    return found;
}

std::optional<JobTable::Status> JobTable::find(const std::string& id) {
    const zemSynchronizer hold(m_lock);
    const Job* job = jobOf(id);
    return job == nullptr ? std::nullopt : std::optional(statusOf(*job));
}

JobTable::Answer JobTable::requestState(const std::string& id, State state) {
    if (state != Terminated && state != Killed) {
        return NotSupported;
    }
    const zemSynchronizer hold(m_lock);
    Job* job = jobOf(id);
    return job == nullptr || job->status.ended() ? InvalidTransition : ask(*job, state);
}

bool JobTable::setDeleteOnCompletion(const std::string& id, bool value) {
    const zemSynchronizer hold(m_lock);
    Job* job = jobOf(id);
    if (job != nullptr) {
        job->status.deleteOnCompletion = value;
    }
    return job != nullptr;
}

bool JobTable::remove(const std::string& id) {
    const zemSynchronizer hold(m_lock);
    const std::size_t before = m_jobs.size();
    m_jobs.remove_if([&](const Job& job) { return job.status.id == id && job.status.ended(); });
    return m_jobs.size() < before;
}

CmpiObjectPath jobPath(const CmpiObjectPath& near, const std::string& id) {
    CmpiObjectPath path = zemBaseProvider::createObjectPath(near, kJobClass);
    path.setKey("InstanceID", CmpiData(id.c_str()));
    return path;
}
