// Jobs over tools that are scripts: how each end shows in the table, and what clients see and may
// do.
#include <gtest/gtest.h>

#include "Exception.h"
#include "InProcessFactories.h"
#include "JobProvider.h"
#include "OnThreads.h"
#include "PathText.h"
#include "PropertiesHelper.h"
#include "ServedProviders.h"

namespace {

using namespace cimom;
using testing_support::ScopedEnvironment;

/// A step that runs a line of the shell.
JobTable::Step tool(const std::string& script) {
    return [script](pid_t* pid, FILE** output) {
        return zemPropertiesHelper::asynExecuteCommand(("sh -c '" + script + "'").c_str(), pid,
                                                       output, nullptr, nullptr);
    };
}

std::string start(const std::vector<std::string>& scripts, const std::string& owner = "") {
    JobTable::Work work{"Work", owner, "2*1111-AAA*0000001", {}};
    for (const std::string& script : scripts) {
        work.steps.push_back(tool(script));
    }
    return JobTable::instance().start(std::move(work));
}

JobTable::Status endOf(const std::string& id) {
    for (int i = 0; i < 1000; ++i) {
        const auto job = JobTable::instance().find(id);
        if (!job || job->ended()) {
            return job.value_or(JobTable::Status{});
        }
        usleep(10 * 1000);
    }
    ADD_FAILURE() << "a job without an end";
    return {};
}

constexpr auto kStop = JobTable::Terminated;
constexpr auto kKill = JobTable::Killed;
constexpr auto kNobody = JobTable::Running;

TEST(JobTableTest, JobsEndAsTheirToolsDo) {
    const struct {
        std::vector<std::string> scripts;
        JobTable::State asked, state;
        int percent, exitCode;  ///< -1 for no percentage
        std::string error;
    } rows[] = {
        {{"exit 0"}, kNobody, JobTable::Completed, 100, 0, ""},
        {{"echo warning", "sleep 0.1", "exit 0"}, kNobody, JobTable::Completed, 100, 0, ""},
        {{"echo WRTL8038 No room. >&2; exit 1"},
         kNobody,
         JobTable::Exception,
         -1,
         1,
         "WRTL8038 No room."},
        {{"exit 0", "echo no; exit 3", "exit 0"},
         kNobody,
         JobTable::Exception,
         33,
         3,
         "no (1 of 3 changes had been made.)"},
        {{"exit 7"}, kNobody, JobTable::Exception, -1, 7, "The tool ended with status 7."},
        {{"kill -9 $$"}, kNobody, JobTable::Exception, -1, 0, "Receive Signal:9"},
        {{"sleep 2 & echo left; exit 2"}, kNobody, JobTable::Exception, -1, 2, "left"},
        {{"exec >&- 2>&-; sleep 0.3; exit 2"},
         kNobody,
         JobTable::Exception,
         -1,
         2,
         "The tool ended with status 2."},
        {{"head -c 300000 /dev/zero | tr \"\\\\0\" x; exit 1"},
         kNobody,
         JobTable::Exception,
         -1,
         1,
         std::string(4096, 'x')},
        {{"exec sleep 30"}, kStop, kStop, -1, 0, "Receive Signal:15"},
        {{"exec sleep 30"}, kKill, kKill, -1, 0, "Receive Signal:9"},
        {{"trap \"echo bye; exit 4\" TERM; echo; while :; do sleep 0.05; done"},
         kStop,
         kStop,
         -1,
         4,
         "bye"},
        {{"trap \"\" TERM; echo; sleep 0.3", "exit 0"},
         kStop,
         kStop,
         50,
         0,
         "It was ended on request. (1 of 2 changes had been made.)"},
        {{"trap \"\" TERM; echo; sleep 0.3"}, kStop, JobTable::Completed, 100, 0, ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.scripts.front());
        const std::string id = start(row.scripts);
        if (row.asked != kNobody) {
            usleep(100 * 1000);  // until the script has set its traps
            EXPECT_EQ(JobTable::instance().requestState(id, row.asked), JobTable::Started);
            EXPECT_EQ(JobTable::instance().find(id)->state, JobTable::ShuttingDown);
        }
        const JobTable::Status job = endOf(id);
        EXPECT_EQ(job.state, row.state);
        EXPECT_EQ(job.percent ? *job.percent : -1, row.percent);
        EXPECT_EQ(job.exitCode, row.exitCode);
        EXPECT_EQ(job.error, row.error);
        EXPECT_EQ(JobTable::instance().requestState(id, kKill), JobTable::InvalidTransition);
    }
    // A client whose thread the server cancels as soon as it can.
    std::thread([] {
        pthread_cancel(pthread_self());
        start({"exit 0"});
        pthread_testcancel();
    }).join();
    for (const JobTable::Status& job : JobTable::instance().all()) {
        EXPECT_GT(endOf(job.id).state, JobTable::ShuttingDown);
    }
    errno = 0;
    EXPECT_TRUE(waitpid(-1, nullptr, WNOHANG) < 0 && errno == ECHILD) << "a child is left";
}

TEST(JobTableTest, StepsThatStartNothing) {
    const JobTable::Step idle = [](pid_t*, FILE**) { return -1; };
    const JobTable::Step failing = [](pid_t*, FILE**) -> int {
        throw zemInvalidParameterException("no such slot");
    };
    JobTable& table = JobTable::instance();
    const std::size_t before = table.all().size();
    EXPECT_EQ(table.start({"Nothing", "", "", {idle, idle}}), "");
    EXPECT_THROW(table.start({"Wrong", "", "", {idle, failing}}), zemInvalidParameterException);
    EXPECT_EQ(table.all().size(), before);
    EXPECT_EQ(endOf(table.start({"Some", "", "", {idle, tool("exit 0"), idle}})).percent, 100);
    EXPECT_EQ(endOf(table.start({"Half", "", "", {tool("exit 0"), failing}})).error,
              "no such slot (1 of 2 changes had been made.)");
}

TEST(JobTableTest, TheTableIsBounded) {
    JobTable& table = JobTable::instance();
    const std::string kept = start({"exec sleep 60"});
    onThreads(4, [](int) {
        for (int i = 0; i < 30; ++i) {
            const std::string id = start({i % 2 == 0 ? "exit 0" : "exec sleep 60"});
            JobTable::instance().requestState(id, kKill);
            EXPECT_GT(endOf(id).state, JobTable::ShuttingDown);
        }
    });
    EXPECT_LE(table.all().size(), 103U);
    EXPECT_EQ(table.find(kept)->state, JobTable::Running);
    table.requestState(kept, kKill);
    endOf(kept);
}

class JobProviderTest : public testing::TestWithParam<Character> {
protected:
    JobProviderTest() {
        Options options;
        options.character = GetParam();
        options.classes = ClassRepository::load(ZEM_SCHEMA);
        m_server = std::make_unique<Server>(options);
        m_server->registerProvider("Jobs", {"ORXC_ConcreteJob"}, FactoriesOf<JobProvider>::all());
        makeKnown(m_server->broker());
        m_request.user = "ann";
    }

    static ObjectPath path(const std::string& id) {
        return {"root/cimv2", "ORXC_ConcreteJob", {{"InstanceID", id}}};
    }
    /// The properties as MOF prints them, with blanks between.
    std::string shown(const std::string& id, const std::vector<std::string>& properties) {
        const Reply reply = m_server->getInstance(m_request, path(id));
        std::string texts;
        for (const std::string& property : properties) {
            const Value* value =
                reply.ok() ? reply.instances[0].properties.find(property) : nullptr;
            texts +=
                (texts.empty() ? "" : " ") + (value && !value->isNull() ? printValue(*value) : "-");
        }
        return texts;
    }
    Reply request(const char* user, const std::string& id, std::uint16_t state) {
        Request by = m_request;
        by.user = user;
        return m_server->invokeMethod(by, path(id), "RequestStateChange",
                                      {{"RequestedState", Value(state)}});
    }

    std::unique_ptr<Server> m_server;
    Request m_request;
};

TEST_P(JobProviderTest, ClientsFollowAndEndJobs) {
    const std::vector<std::string> properties = {"Name",
                                                 "Owner",
                                                 "AffectedSystem",
                                                 "JobState",
                                                 "JobStatus",
                                                 "OperationalStatus",
                                                 "PercentComplete",
                                                 "ErrorCode",
                                                 "ErrorDescription"};
    const std::string id = start({"echo WRTL8038 busy; exec sleep 60"}, "ann");
    EXPECT_EQ(shown(id, properties),
              "\"Work\" \"ann\" \"2*1111-AAA*0000001\" 4 \"Running\" {2} - - -");
    EXPECT_EQ(m_server->deleteInstance(m_request, path(id)).rc, CMPI_RC_ERR_FAILED);
    EXPECT_NE(request("eve", id, 5).message.find("eve"), std::string::npos);
    EXPECT_EQ(request("ann", id, 3).value(), Value(std::uint32_t{1}));
    EXPECT_EQ(request("ann", id, 9).rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(m_server->invokeMethod(m_request, path(id), "GetError").out.find("Error") ==
                nullptr);
    usleep(100 * 1000);
    EXPECT_EQ(request("root", id, 4).value(), Value(std::uint32_t{4096}));
    endOf(id);
    EXPECT_EQ(shown(id, properties),
              "\"Work\" \"ann\" \"2*1111-AAA*0000001\" 8 \"Terminated\" {10, 17} - 0 "
              "\"WRTL8038 busy\"");
    const Reply error = m_server->invokeMethod(m_request, path(id), "GetError");
    ASSERT_TRUE(error.ok() && error.out.find("Error") != nullptr) << error.message;
    EXPECT_EQ(*error.out.find("Error")->instance().properties.find("MessageID"), Value("WRTL8038"));

    Instance change(path(id), {{"DeleteOnCompletion", Value(false)}});
    m_request.properties = {"DeleteOnCompletion"};
    EXPECT_EQ(m_server->modifyInstance(m_request, change).rc, CMPI_RC_OK);
    EXPECT_EQ(shown(id, {"DeleteOnCompletion"}), "false");
    change.properties.set("Owner", Value("eve"));
    m_request.properties = {"Owner"};
    EXPECT_NE(m_server->modifyInstance(m_request, change).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server->deleteInstance(m_request, path(id)).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server->getInstance(m_request, path(id)).rc, CMPI_RC_ERR_NOT_FOUND);
}

// What is followed here would else be lost with the provider.
TEST_P(JobProviderTest, TheProviderStaysWhileTheServerRuns) {
    const std::string id = start({"exit 0"}, "ann");
    EXPECT_NE(shown(id, {"Name"}), "-");
    EXPECT_EQ(m_server->unloadProviders(false), std::vector<std::string>{"Jobs"});
}

INSTANTIATE_TEST_SUITE_P(Brokers, JobProviderTest, testing_support::ServedProviders::brokers(),
                         testing_support::ServedProviders::nameOf);

}  // namespace
