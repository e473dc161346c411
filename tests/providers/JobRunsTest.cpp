// Changes of a running partition as jobs, by the real service and tools: what clients see and may
// do, and what is left when one of those who take part is killed or leaves.
#include <pty.h>

#include "ServedProviders.h"

namespace {

using namespace cimom;
using testing_support::Outcome;
using testing_support::ServedProviders;

constexpr char kService[] =
    "ORXC_VirtualSystemManagementService.CreationClassName=\"ORXC_VirtualSystemManagementService\","
    "Name=\"VirtualSystemManagement\",SystemCreationClassName=\"ORXC_CEC_CS\","
    "SystemName=\"1111-AAA*0000001\"";
constexpr char kPartition[] =
    "ORXC_VirtualSystemSettingData.InstanceID=\"ORX:4*2*1111-AAA*0000001\"";

/// A serial adapter, as cimom takes it.
std::string adapter(int slot) {
    return "instance of ORXC_SerialAdapterRASettingData { SlotID = " + std::to_string(slot) +
           "; VirtualAdapterType = 0; }";
}

class JobRunsTest : public ServedProviders {
protected:
    void SetUp() override {
        ServedProviders::SetUp();
        m_appliance.replaceTool(
            "edalloc", "echo $$ >$APPLIANCE_HOME/tool; exec " ZEM_PROGRAMS "/edalloc \"$@\"");
    }

    /// Runs lines in which "$(tool)" is the tool's process, once there is one.
    Outcome shell(const std::string& lines) {
        return m_appliance.run(
            "t=$APPLIANCE_HOME/tool\n"
            "tool() { for n in $(seq 999); do [ -s $t ] && cat $t && break || sleep 0.02; done "
            "2>&-; }\n" +
            lines);
    }
    static std::string cimomAdding(const std::string& adapters) {
        return "cimom --broker " + brokerName({GetParam(), 0}) +
               " --registration " ZEM_REGISTRATION " --schema " ZEM_SCHEMA " im '" + kService +
               "' AddResourceSettings 'AffectedConfiguration=" + kPartition +
               "' 'ResourceSettings={" + adapters + "}' ";
    }
    ObjectPath startJob() {
        const Value adapters = parseValue('{' + adapter(9) + '}', CMPI_instanceA, m_classes.get());
        const Reply reply = m_server->invokeMethod(
            m_request, parsePath(kService), "AddResourceSettings",
            {{"AffectedConfiguration", parsePath(kPartition)}, {"ResourceSettings", adapters}});
        EXPECT_EQ(reply.value(), Value(std::uint32_t{4096})) << reply.message;
        return reply.out.find("Job")->reference();
    }

    /// Whether the tool has ended within some time, and left all as it should be, with the new
    /// adapter or without it.
    void expectLeft(bool isChanged) {
        EXPECT_EQ(shell("for i in $(seq 500); do kill -0 $(tool) || exit 0; sleep 0.02; done; "
                        "exit 1")
                      .exit,
                  0)
            << "the tool is left";
        EXPECT_EQ(shell("qyalloc -r virtualio --rsubtype serial --level lpar -m alpha "
                        "-F lpar_id,slot_num | grep -qx 2,9")
                          .exit == 0,
                  isChanged);
        EXPECT_EQ(shell("appliance check").exit, 0);
    }
};

TEST_P(JobRunsTest, CommandLineTellsHowTheJobEnds) {
    const struct {
        const char* fault;
        const char* meanwhile;  ///< $p is cimom
        int exit;
        const char* said;
        bool isChanged;
    } rows[] = {
        {"--clear", ":", 0, "", true},
        {"edalloc --text 'WRTL8038 No room.' --code 1", ":", 1,
         "CIM_ERR_FAILED (1): WRTL8038 No room.\n", false},
        {"edalloc --delay 60000", "kill -9 $(tool)", 1, "Receive Signal:9\n", false},
        {"edalloc --delay 60000",
         "until grep Job $t.out; do sleep 0.02; done; sleep 1; kill -INT $p", 1,
         "Receive Signal:15\n", false},
        {"edalloc --delay 2500", "tool; kill -9 $p", 137, "", true},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fault + std::string("; ") + row.meanwhile);
        const Outcome run = shell("rm -f $t*; appliance init --force; appliance fault " +
                                  std::string(row.fault) + "; " + cimomAdding(adapter(9)) +
                                  ">$t.out & p=$!; " + row.meanwhile + "; wait $p");
        EXPECT_EQ(run.exit, row.exit) << run.err;
        EXPECT_NE(run.err.find(row.said), std::string::npos) << run.err;
        expectLeft(row.isChanged);
    }
}

TEST_P(JobRunsTest, ATerminalShowsHowFarTheJobIs) {
    ASSERT_EQ(shell("appliance fault edalloc --delay 1500 --calls 2").exit, 0);
    int terminal = -1;
    if (forkpty(&terminal, nullptr, nullptr, nullptr) == 0) {
        execlp("sh", "sh", "-c", cimomAdding(adapter(9) + ", " + adapter(10)).c_str(), nullptr);
        _exit(1);
    }
    std::string shown;
    char bytes[512];
    for (ssize_t size = 0; (size = read(terminal, bytes, sizeof bytes)) > 0;) {
        shown.append(bytes, static_cast<std::size_t>(size));
    }
    close(terminal);
    int status = -1;
    EXPECT_TRUE(wait(&status) > 0 && status == 0) << shown;
    EXPECT_NE(shown.find("Add resources: 50 %, "), std::string::npos) << shown;
}

TEST_P(JobRunsTest, ClientsFollowAndEndJobs) {
    ASSERT_EQ(shell("appliance fault edalloc --delay 60000").exit, 0);
    const ObjectPath job = startJob();
    const auto shown = [&] {
        std::string texts;
        const Reply reply = m_server->getInstance(m_request, job);
        for (const char* property : {"Name", "AffectedSystem", "JobState", "OperationalStatus",
                                     "PercentComplete", "ErrorCode", "ErrorDescription"}) {
            const Value* value = reply.instances.at(0).properties.find(property);
            texts += (value && !value->isNull() ? printValue(*value) : "-") + ' ';
        }
        return texts;
    };
    const auto ask = [&](const char* user, std::uint16_t state) {
        Request request = m_request;
        request.user = user;
        const Reply reply =
            m_server->invokeMethod(request, job, "RequestStateChange", {{"RequestedState", state}});
        return reply.ok() ? printValue(reply.value()) : statusName(reply.rc);
    };
    const std::string front = "\"Add resources\" \"2*1111-AAA*0000001\" ";
    EXPECT_EQ(shown(), front + "4 {2} - - - ");
    EXPECT_EQ(m_server->deleteInstance(m_request, job).rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(m_server->invokeMethod(m_request, job, "GetError").out.find("Error"));
    EXPECT_EQ(ask("eve", 5), "CIM_ERR_FAILED");
    EXPECT_EQ(ask("root", 9), "CIM_ERR_FAILED");
    EXPECT_EQ(ask("root", 3), "1");
    shell("tool");
    EXPECT_EQ(ask("root", 5), "4096");
    expectLeft(false);
    EXPECT_EQ(ask("root", 5), "4097");
    EXPECT_EQ(shown(), front + "9 {14, 17} - 0 \"Receive Signal:9\" ");
    const Reply error = m_server->invokeMethod(m_request, job, "GetError");
    EXPECT_EQ(*error.out.find("Error")->instance().properties.find("Message"),
              Value("Receive Signal:9"));

    EXPECT_EQ(m_server->setProperty(m_request, job, "DeleteOnCompletion", false).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server->getProperty(m_request, job, "DeleteOnCompletion").value(), Value(false));
    EXPECT_EQ(m_server->deleteInstance(m_request, job).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server->getInstance(m_request, job).rc, CMPI_RC_ERR_NOT_FOUND);
}

// An idle server keeps the service, and one that stops has the tool end, whose job is gone then.
TEST_P(JobRunsTest, TheServerStopsWhileAJobRuns) {
    ASSERT_EQ(shell("appliance fault edalloc --delay 60000").exit, 0);
    const ObjectPath job = startJob();
    EXPECT_EQ(m_server->unloadProviders(false).size(), 1U);
    EXPECT_EQ(m_server->getInstance(m_request, job).rc, CMPI_RC_OK);
    shell("tool");
    m_server->unloadProviders(true);
    expectLeft(false);
    EXPECT_EQ(m_server->getInstance(m_request, job).rc, CMPI_RC_ERR_NOT_FOUND);
}

ON_BOTH_BROKERS(JobRunsTest);

}  // namespace
