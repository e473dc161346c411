/// Work that goes on after the operation that started it has answered: tools in the background,
/// which clients follow as instances of ORXC_ConcreteJob.
///
///     JobTable::Work work;
///     work.name = "Add resources";
///     work.owner = user;
///     work.partition = "2*1111-AAA*0000001";
///     for (const auto& rasd : rasds)  // what a step needs it owns: it may run later
///         work.steps.push_back([=](pid_t* pid, FILE** output) { return add(rasd, pid, output); });
///     const std::string id = JobTable::instance().start(std::move(work));
///     if (!id.empty())
///         out.setArg("Job", CmpiData(jobPath(path, id)));  // and answer 4096
///
/// The steps run one after the other, each a tool of its own. The first that fails ends the job:
/// what the ones before it changed stays changed, and the job's error says how many were done.
///
/// The table is one for the process, and so are its jobs: the provider that starts them and the one
/// that shows them must be loaded into the same process, and both must stay loaded while the server
/// runs (zemBaseZemProvider). Each has a JobTable::Use as a member: with the last of them, or at
/// the exit of the process, the tools that still run are asked to end, after five seconds made to,
/// and waited for. A process that is killed leaves its tools to themselves; no other process ever
/// knows of its jobs.
///
/// Thread-safety: all operations may be called from any thread.
#ifndef JOBS_H
#define JOBS_H

#include <sys/time.h>
#include <sys/types.h>

#include <chrono>
#include <cstddef>
#include <cstdio>
#include <functional>
#include <list>
#include <optional>
#include <string>
#include <vector>

#include "CmpiObjectPath.h"
#include "Synchronizer.h"

class JobTable {
public:
    /// Starts a tool in the background and hands over the child, which becomes the table's to reap,
    /// and the stream of its output, which becomes the table's to close. Returns 0; any other
    /// number, with nothing started, says that there is nothing to do. May throw a zemException.
    using Step = std::function<int(pid_t* pid, FILE** output)>;

    struct Work {
        std::string name;       ///< for users, as "Add resources"
        std::string owner;      ///< the client's user; may be empty
        std::string partition;  ///< Name of the partition that changes; empty for none
        std::vector<Step> steps;
    };

    /// Numbers of the schema.
    enum State : unsigned short {
        Running = 4,
        ShuttingDown = 6,
        Completed = 7,
        Terminated = 8,
        Killed = 9,
        Exception = 10
    };
    /// What RequestStateChange answers.
    enum Answer : unsigned {
        NotSupported = 1,
        Failed = 4,
        Started = 4096,
        InvalidTransition = 4097
    };

    /// How long a job that has ended is shown.
    static constexpr long kSecondsBeforeRemoval = 300;

    /// What is known of a job at one moment.
    struct Status {
        std::string id;
        std::string name;
        std::string owner;
        std::string partition;
        State state = Running;
        std::optional<unsigned short> percent;  ///< none while nothing tells how far the work is
        int exitCode = 0;                       ///< of the tool that failed; 0 without one
        std::string error;                      ///< what the tool said, or why there is none
        timeval submitted = {};
        timeval changed = {};                 ///< when the state last did; zero when it never did
        std::chrono::microseconds elapsed{};  ///< to now or to the end
        bool deleteOnCompletion = true;

        bool ended() const { return state >= Completed; }
    };

    /// Keeps the jobs running while it lives.
    class Use {
    public:
        Use();
        ~Use();
        Use(const Use&) = delete;
        Use& operator=(const Use&) = delete;
    };

    /// The table of this process.
    static JobTable& instance();

    /// Starts @p work: its first step that has anything to do on this thread, the others behind it.
    /// @return the InstanceID of the job; empty, without a job, when no step had anything to do
    /// @throws zemException what a step throws before anything was started
    /// @throws zemOperationFailedException too many jobs run
    std::string start(Work work);

    /// All jobs, oldest first, and one of them. Jobs that have ended are shown for five minutes
    /// more, and without deleteOnCompletion until they are removed; of more than the table holds
    /// the oldest go first.
    std::vector<Status> all();
    std::optional<Status> find(const std::string& id);

    /// Asks the tool that runs to end (Terminated), or ends it (Killed). The job has the new state
    /// as soon as the tool has ended, and Completed if that had done its work by then.
    /// @return Started; InvalidTransition for a job that has ended, NotSupported for any other
    ///         state, Failed when the tool cannot be reached
    Answer requestState(const std::string& id, State state);

    /// @return false for a job that there is not, remove() also for one that runs
    bool setDeleteOnCompletion(const std::string& id, bool value);
    bool remove(const std::string& id);

private:
    struct Job;

    JobTable();
    ~JobTable();
    JobTable(const JobTable&) = delete;
    JobTable& operator=(const JobTable&) = delete;

    static void follow(void* job);
    static Status statusOf(const Job& job);

    bool startNext(Job& job);
    bool reap(Job& job, const std::string& words);
    void end(Job& job, State state, const std::string& error);
    static Answer ask(Job& job, State state);
    void askAll(State state);
    std::ptrdiff_t running();
    void endAll();
    void makeRoom();
    void dropOld();
    Job* jobOf(const std::string& id);

    zemSynchronizerContext m_lock;
    std::list<Job> m_jobs;
    int m_uses = 0;
};

/// Class and path of a job, in the namespace of @p near.
constexpr char kJobClass[] = "ORXC_ConcreteJob";
CmpiObjectPath jobPath(const CmpiObjectPath& near, const std::string& id);

#endif
