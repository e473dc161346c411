// A stock client's tour through `cimom serve`, over HTTP and over HTTPS with a password.
#include <gtest/gtest.h>
#include <signal.h>

#include <csignal>
#include <mutex>

#include "../utilities/OnThreads.h"
#include "HttpServer.h"
#include "TestAppliance.h"

namespace {

using namespace std::chrono_literals;

using testing_support::contents;
using testing_support::DemoAppliance;
using testing_support::Outcome;
using testing_support::ScopedEnvironment;

struct Row {
    std::string arguments;  ///< of wbemcli; $U is where the classes are
    std::vector<std::string> parts;
    std::string absent = "(nothing)";
};

class ServeTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_EQ(m_appliance.run("command -v wbemcli").exit, 0) << "needs sblim-wbemcli";
    }
    ~ServeTest() override { stop(); }

    std::string file(const char* name) const { return (m_appliance.folder() / name).string(); }
    /// Starts to serve; the base of its addresses is in $U of what is run from now on.
    void serve(const std::string& options, const std::string& credentials = "") {
        m_appliance.run("cd " + m_appliance.folder().string() +
                        "; rm -f log status; (cimom serve --log --port 0 " + options +
                        " >log 2>fault & echo $! >pid; wait $!; echo $? >status) &");
        within(10s, [&] { return contents(file("log")).find('\n') != std::string::npos; });
        const std::string log = contents(file("log"));
        const std::size_t scheme = log.find("http"), host = log.find("127.0.0.1");
        ASSERT_NE(host, std::string::npos) << contents(file("fault"));
        m_url = log.substr(scheme, host - scheme) + credentials +
                log.substr(host, log.find('\n') - host) + "/root/cimv2";
    }
    /// @return the exit status of what was started
    std::string stop() {
        const std::string pid = contents(file("pid"));
        if (pid.empty() || !contents(file("status")).empty()) {
            return contents(file("status"));
        }
        kill(std::stoi(pid), SIGTERM);
        within(10s, [&] { return !contents(file("status")).empty(); });
        return contents(file("status"));
    }
    std::string client(const std::string& arguments) {
        const Outcome got =
            m_appliance.run("U='" + m_url + "'; wbemcli -noverify " + arguments + " 2>&1");
        return got.out;
    }
    void expectRows(const std::vector<Row>& rows) {
        for (const Row& row : rows) {
            const std::string answer = client(row.arguments);
            for (const std::string& part : row.parts) {
                EXPECT_NE(answer.find(part), std::string::npos) << row.arguments << ":\n" << answer;
            }
            EXPECT_EQ(answer.find(row.absent), std::string::npos) << row.arguments;
        }
    }

    DemoAppliance m_appliance{ZEM_PROGRAMS};
    ScopedEnvironment m_registration{"CIMOM_REGISTRATION", ZEM_REGISTRATION};
    ScopedEnvironment m_schema{"CIMOM_SCHEMA", ZEM_SCHEMA};
    std::string m_url;
};

TEST_F(ServeTest, AStockClientReachesTheWholeModel) {
    serve("");
    const std::string host =
        R"("$U:ORXC_CEC_CS.CreationClassName=\"ORXC_CEC_CS\",Name=\"1111-AAA*0000001\"")";
    const std::string web =
        R"("$U:ORXC_LPAR_CS.CreationClassName=\"ORXC_LPAR_CS\",Name=\"3*1111-AAA*0000001\"")";
    const std::string made =
        R"("$U:ORXC_LPAR_CS.CreationClassName=\"ORXC_LPAR_CS\",Name=\"8*1111-AAA*0000001\"")";
    const std::string service =
        R"("$U:ORXC_VirtualSystemManagementService.SystemCreationClassName=\"ORXC_CEC_CS\",)"
        R"(SystemName=\"1111-AAA*0000001\",Name=\"VirtualSystemManagement\",)"
        R"(CreationClassName=\"ORXC_VirtualSystemManagementService\"" )";
    // wbemcli sends what it is given as it stands.
    const std::string settings =
        R"('ModifySystemSettings.SystemSettings=<![CDATA[<INSTANCE CLASSNAME=)"
        R"("ORXC_VirtualSystemSettingData"><PROPERTY NAME="InstanceID" TYPE="string"><VALUE>)"
        R"(ORX:4*3*1111-AAA*0000001</VALUE></PROPERTY><PROPERTY NAME="ElementName" TYPE="string">)"
        R"(<VALUE>by settings</VALUE></PROPERTY></INSTANCE>]]>')";
    const std::string partition = "ORXC_LPAR_CS.CreationClassName=\"ORXC_LPAR_CS\",Name=\"3*1111-";
    const std::string connection = "ORXC_HostConnection.InstanceID";
    const std::vector<Row> rows = {
        {"ecn \"$U:\"", {"CIM_ManagedElement\n", "ORXC_LPAR_CS\n"}},
        {"gc \"$U:ORXC_LPAR_CS\"", {"LparID=", "EnabledState="}},
        {"ein \"$U:ORXC_LPAR_CS\"", {partition}},
        {"ei \"$U:CIM_System\"", {"ElementName=\"web server\"", "ORXC_CEC_CS", "B\xC3\xBCro-Pr"}},
        {"gi " + web + " ElementName,OperationalStatus", {"\"web server\"", "OperationalStatus=2"}},
        {"ain " + host, {partition, connection}},
        {"ain -ac ORXC_HostedPartition " + host, {partition}, connection},
        {"ai -arc ORXC_HostConnection " + host, {connection}},
        {"ain -ar Antecedent -arr Dependent " + host, {partition, connection}},
        {"ain -ar Dependent -arr Antecedent " + host, {connection}, partition},
        {"ri -arc ORXC_HostedPartition " + host,
         {"ORXC_HostedPartition.Ante"},
         "ORXC_HostComponent"},
        {"rin -ar GroupComponent " + host, {"ORXC_HostComponent.Group"}, "ORXC_HostedPartition"},
        {"mi " + web + " ElementName='a > b'", {}, "wbemcli:"},
        {"gp " + web + " ElementName", {"a > b"}},
        {"sp " + web + " ElementName=www", {}, "wbemcli:"},
        {"cm " + service + settings, {"ModifySystemSettings: 0"}},
        {"gp " + web + " ElementName", {"by settings"}},
        {"cm " + web + " RequestStateChange.RequestedState=4", {"RequestStateChange: 0"}},
        {"ci " + made + " CreationClassName=ORXC_LPAR_CS,Name=8*1111-AAA*0000001",
         {"(7) CIM_ERR_NOT_SUPPORTED: Method createInstance on provider ORXC_LPAR_CSProvider"}},
        {"di " + web, {}, "wbemcli:"},
        {"gi " + web, {"(6) CIM_ERR_NOT_FOUND: The requested object root/cimv2:ORXC_LPAR_CS."}},
        {"ei \"$U:ORXC_Nix\"", {"(5) CIM_ERR_INVALID_CLASS: no class ORXC_Nix"}},
    };
    expectRows(rows);
    EXPECT_EQ(stop(), "0\n");
    const std::string log = contents(file("log"));
    EXPECT_NE(log.find(" ms root/cimv2 DeleteInstance\n"), std::string::npos) << log;
    EXPECT_NE(log.find(" GetInstance CIM_ERR_NOT_FOUND The requested"), std::string::npos) << log;
    EXPECT_EQ(contents(file("fault")), "");
}

#ifdef ZEM_EVENTS
TEST_F(ServeTest, ASubscriptionOfAStockClientOutlastsARestart) {
    // A Java VM lives by SIGSEGV, and its memory is no matter of a leak checker's.
    const ScopedEnvironment sanitizer("ASAN_OPTIONS", "handle_segv=0:detect_leaks=0");
    const ScopedEnvironment classes("CLASSPATH", ZEM_EVENTS);
    std::signal(SIGPIPE, [](int) {});
    std::mutex mutex;
    std::string taken;
    cimom::HttpServer listener({}, [&](const cimom::HttpRequest& request) {
        const std::lock_guard<std::mutex> lock(mutex);
        taken += request.header("CIMExportMethod") + request.body;
        return cimom::HttpAnswer();
    });
    const auto arrives = [&](const std::string& change, const std::string& part) {
        EXPECT_EQ(m_appliance.run(change + " -m '1111-AAA*0000001'").exit, 0);
        return within(10s, [&] {
            const std::lock_guard<std::mutex> lock(mutex);
            return taken.find(part) != std::string::npos;
        });
    };
    const auto named = [](const std::string& className, const std::string& quote) {
        std::string keys;
        for (const char* key : {"SystemCreationClassName", "SystemName", "CreationClassName"}) {
            keys += key + ("=" + quote) + (*key == 'C' ? className : "here") + quote + ",";
        }
        return keys + "Name=" + quote + "a" + quote;
    };
    const auto path = [&](const std::string& className) {
        return className + "." + named(className, "\\\"");
    };
    const std::string filter = path("CIM_IndicationFilter");
    const std::string destination = path("CIM_ListenerDestinationCIMXML");
    const std::string ends = "Filter=" + filter + ",Handler=" + destination;
    const std::string subscription = "\"$U:CIM_IndicationSubscription." + ends + "\"";
    serve("--state .");
    m_url.replace(m_url.find("cimv2"), 5, "interop");
    expectRows({
        {"ci \"$U:" + filter + "\" " + named("CIM_IndicationFilter", "") +
             ",'Query=\"SELECT * FROM ORXC_PartitionStateChange\"',QueryLanguage=WQL,"
             "SourceNamespace=root/cimv2",
         {"CIM_IndicationFilter.System"}},
        {"ci \"$U:" + destination + "\" " + named("CIM_ListenerDestinationCIMXML", "") +
             ",Destination=http://127.0.0.1:" + std::to_string(listener.port()),
         {"CIMXML.System"}},
        {"ci " + subscription + " \"" + ends + "\"", {"CIM_IndicationSubscription.Filter"}},
        {"mi " + subscription + " SubscriptionInfo=mine", {}, "wbemcli:"},
        {"gi " + subscription, {"SubscriptionState=2", "SubscriptionInfo=\"mine\""}},
        {"rin \"$U:" + filter + "\"", {"CIM_IndicationSubscription.Filter"}},
        {"ain \"$U:" + destination + "\"", {"CIM_IndicationFilter.System"}},
        {"di \"$U:" + filter + "\"", {"(1) CIM_ERR_FAILED: it is in use by"}},
    });
    EXPECT_TRUE(arrives("edpower -r lpar --id 3 -o shutdown --immed",
                        "ExportIndication<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM"));
    EXPECT_NE(taken.find("<INSTANCE CLASSNAME=\"ORXC_PartitionStateChange\">"), std::string::npos);
    EXPECT_EQ(stop(), "0\n");
    serve("--state .");
    m_url.replace(m_url.find("cimv2"), 5, "interop");
    EXPECT_TRUE(arrives("edpower -r lpar --id 4 -o shutdown --immed", "Name=&quot;4*1111"));
    expectRows({{"di " + subscription, {}, "wbemcli:"},
                {"di \"$U:" + filter + "\"", {}, "wbemcli:"},
                {"di \"$U:" + destination + "\"", {}, "wbemcli:"},
                {"ein \"$U:CIM_IndicationSubscription\"", {}, "CIM_"}});
    EXPECT_EQ(stop(), "0\n");
    EXPECT_EQ(contents(file("fault")), "");
}
#endif

TEST_F(ServeTest, WhoSignsInIsWhoToolsRunAs) {
    ASSERT_EQ(m_appliance
                  .run("cd " + m_appliance.folder().string() +
                       "; umask 077; openssl req -x509 -newkey rsa:2048 -nodes -keyout key "
                       "-out certificate -days 2 -subj /CN=localhost; printf '%s:%s\\n' "
                       "'no user' \"$(openssl passwd -6 secret)\" >passwords")
                  .exit,
              0);
    serve("--certificate certificate --key key --passwords passwords", "no user:secret@");
    const std::string all = "ein \"$U:ORXC_LPAR_CS\"";
    expectRows({{all, {"The given user name \"no user\" was not found."}}});
    m_url.replace(m_url.find("secret"), 6, "sekret");
    expectRows({{all, {"Invalid username/password"}}});
    EXPECT_EQ(stop(), "0\n");
}

TEST_F(ServeTest, StrangersAreNotServedByMistake) {
    const struct {
        const char* options;
        const char* error;
    } rows[] = {
        {"--address 0.0.0.0", "only addresses of the loopback interface"},
        {"--address :: --passwords x", "only addresses of the loopback interface"},
        {"--address example.invalid", "only addresses of the loopback interface"},
        {"--certificate x", "--certificate and --key go together"},
        {"--passwords /etc/passwd", "others may read or change it"},
        {"--certificate none --key none", "none: cannot be read"},
        {"--certificate /etc/hosts --key /etc/hosts", "cannot be served"},
    };
    for (const auto& row : rows) {
        const Outcome got = m_appliance.run(std::string("cimom serve --port 0 ") + row.options);
        EXPECT_NE(got.exit, 0) << row.options;
        EXPECT_NE(got.err.find(row.error), std::string::npos) << got.err;
    }
}

}  // namespace
