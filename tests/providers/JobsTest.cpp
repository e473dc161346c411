// The table of jobs over tools that are scripts: how each end shows.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <sstream>
#include <thread>

#include "Exception.h"
#include "Jobs.h"
#include "OnThreads.h"
#include "PropertiesHelper.h"

namespace {

JobTable& table = JobTable::instance();

/// A step that runs lines of the shell.
JobTable::Step tool(const std::string& script) {
    return [script](pid_t* pid, FILE** output) {
        return zemPropertiesHelper::asynExecuteCommand(("sh -c '" + script + "'").c_str(), pid,
                                                       output, nullptr, nullptr);
    };
}

/// A job of scripts with "|" between them.
std::string start(const std::string& scripts) {
    JobTable::Work work{"Work", "", "", {}};
    std::istringstream all(scripts);
    for (std::string script; std::getline(all, script, '|');) {
        work.steps.push_back(tool(script));
    }
    return table.start(std::move(work));
}

/// State, percentage, exit status and words of a job that has ended.
std::string endOf(const std::string& id) {
    auto job = table.find(id);
    for (; job && !job->ended(); job = table.find(id)) {
        usleep(10 * 1000);
    }
    return !job ? "none"
                : std::to_string(job->state) + ' ' +
                      (job->percent ? std::to_string(*job->percent) : "-") + ' ' +
                      std::to_string(job->exitCode) + ' ' + job->error;
}

constexpr auto kNobody = JobTable::Running;
constexpr auto kStop = JobTable::Terminated;
constexpr auto kKill = JobTable::Killed;

TEST(JobTableTest, JobsEndAsTheirToolsDo) {
    const std::string ready = testing::TempDir() + "ready" + std::to_string(getpid());
    setenv("READY", ready.c_str(), 1);
    const struct {
        const char* scripts;
        JobTable::State asked;  ///< once the script says that it is ready
        std::string end;
    } rows[] = {
        {"exit 0", kNobody, "7 100 0 "},
        {"echo warning|sleep 0.1|exit 0", kNobody, "7 100 0 "},
        {"echo WRTL8038 No room. >&2; exit 1", kNobody, "10 - 1 WRTL8038 No room."},
        {"exit 0|echo no; exit 3|exit 0", kNobody, "10 33 3 no (1 of 3 changes had been made.)"},
        {"exit 7", kNobody, "10 - 7 The tool ended with status 7."},
        {"kill -9 $$", kNobody, "10 - 0 Receive Signal:9"},
        {"sleep 2 & echo left; exit 2", kNobody, "10 - 2 left"},
        {"exec >&- 2>&-; sleep 0.3; exit 2", kNobody, "10 - 2 The tool ended with status 2."},
        {"printf %0100000d 0; exit 1", kNobody, "10 - 1 " + std::string(4096, '0')},
        {": >$READY; exec sleep 60", kStop, "8 - 0 Receive Signal:15"},
        {"trap \"echo bye; exit 4\" TERM; : >$READY; while :; do sleep 0.05; done", kStop,
         "8 - 4 bye"},
        {"trap \"\" TERM; : >$READY; sleep 0.3|exit 0", kStop,
         "8 50 0 It was ended on request. (1 of 2 changes had been made.)"},
        {"trap \"\" TERM; : >$READY; sleep 0.3", kStop, "7 100 0 "},
    };
    for (const auto& row : rows) {
        const std::string id = start(row.scripts);
        if (row.asked != kNobody) {
            while (unlink(ready.c_str()) != 0) {
                usleep(10 * 1000);
            }
            EXPECT_EQ(table.requestState(id, row.asked), JobTable::Started);
            EXPECT_EQ(table.find(id)->state, JobTable::ShuttingDown);
        }
        EXPECT_EQ(endOf(id), row.end) << row.scripts;
        EXPECT_EQ(table.requestState(id, kKill), JobTable::InvalidTransition);
    }
    std::thread([] {  // of a client, which the server cancels as soon as it can
        pthread_cancel(pthread_self());
        start("exit 0");
        pthread_testcancel();
    })
        .join();
    for (const JobTable::Status& job : table.all()) {
        endOf(job.id);
    }
    EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1) << "a child is left";
}

TEST(JobTableTest, StepsThatStartNothing) {
    const JobTable::Step idle = [](pid_t*, FILE**) { return -1; };
    const JobTable::Step failing = [](pid_t*, FILE**) -> int {
        throw zemInvalidParameterException("no such slot");
    };
    const std::size_t before = table.all().size();
    EXPECT_EQ(table.start({"Nothing", "", "", {idle, idle}}), "");
    EXPECT_THROW(table.start({"Wrong", "", "", {idle, failing}}), zemInvalidParameterException);
    EXPECT_EQ(table.all().size(), before);
    EXPECT_EQ(endOf(table.start({"Some", "", "", {idle, tool("exit 0"), idle}})), "7 100 0 ");
    EXPECT_EQ(endOf(table.start({"Half", "", "", {tool("exit 0"), failing}})),
              "10 50 0 no such slot (1 of 2 changes had been made.)");
}

TEST(JobTableTest, TheTableIsBounded) {
    const std::string kept = start("exec sleep 60");
    onThreads(4, [](int) {
        for (int i = 0; i < 30; ++i) {
            const std::string id = start(i % 2 == 0 ? "exit 0" : "exec sleep 60");
            table.requestState(id, kKill);
            endOf(id);
        }
    });
    EXPECT_LE(table.all().size(), 103U);
    EXPECT_EQ(table.find(kept)->state, JobTable::Running);
    table.requestState(kept, kKill);
    EXPECT_EQ(endOf(kept), "9 - 0 Receive Signal:9");
}

}  // namespace
