// Indications of the built provider library, with a real Java VM, the stand-in's tools and its
// journal.

#include <csignal>
#include <map>

#include "JavaProcess.h"
#include "ServedProviders.h"

namespace {

using namespace std::chrono_literals;

/// A line of the values there are, by name.
std::string told(const cimom::NamedValues& values) {
    std::map<std::string, std::string> texts;
    for (const auto& [name, value] : values) {
        if (!value.isNull() && name != "CreationClassName" && name != "IndicationTime") {
            texts[name] = value.type() == CMPI_instance ? told(value.instance().properties)
                                                        : cimom::plainText(value);
        }
    }
    std::string line;
    for (const auto& [name, text] : texts) {
        line += (line.empty() ? "" : " ") + name + "=" + text;
    }
    return "[" + line + "]";
}

class EventProvidersTest : public testing_support::ServedProviders {
protected:
    using Handler = cimom::Server::IndicationHandler;
    using Id = cimom::Server::SubscriptionId;

    /// As "Class: [values]".
    static void write(const cimom::Indication& indication) {
        const cimom::Instance& instance = indication.instance;
        const cimom::Value* time = instance.properties.find("IndicationTime");
        EXPECT_LT(std::abs(static_cast<long>(time->dateTime().binary() / 1'000'000) -
                           static_cast<long>(std::time(nullptr))),
                  60);
        hear(instance.path.className + ": " + told(instance.properties));
    }
    Id subscribe(const std::string& query, const Handler& handler = &write) {
        Id id = 0;
        const cimom::Reply reply =
            m_server->subscribe(m_request, "SELECT * FROM " + query, "WQL", handler, id);
        EXPECT_TRUE(reply.ok()) << query << reply.message;
        return id;
    }
    void unsubscribe(Id id) { EXPECT_TRUE(m_server->unsubscribe(m_request, id).ok()); }

    /// The process numbers of those who read the journal for Java, first to last.
    std::vector<std::string> followers() const {
        return testing_support::lines(testing_support::contents(m_appliance.folder() / "pids"));
    }
};

TEST_P(EventProvidersTest, EachClassTellsWhatIsItsOwn) {
    const std::string web = "Name=3*1111-AAA*0000001", state = "ORXC_PartitionStateChange";
    const std::string path =
        "Path=root/cimv2:ORXC_LPAR_CS.CreationClassName=\"ORXC_LPAR_CS\",Name=";
    const std::string source = "SourceInstance", model = " SourceInstanceModel" + path;
    const std::string webPath = model + "\"3*1111-AAA*0000001\" Values=[";
    const std::string made = "LparEnvironment=tmxlinux " + web + " State=Not Activated]" + webPath;
    const struct {
        std::string query, change;
        std::string first;  ///< of the indications, the beginning
        std::size_t count;
    } cases[] = {
        {state,
         "edalloc -r mem -m alpha --id 3 -o a -q 256 && "
         "edplat -r lpar -m alpha -i 'lpar_id=3,new_name=B\xC3\xBCro \"1\"'",
         state + ": [PreviousInstance=[ElementName=web server " + web + "] PreviousValues=[] " +
             source + "=[ElementName=B\xC3\xBCro \"1\" " + web + "]" + webPath + "]]",
         1},
        {"CIM_InstModification", "edalloc -r mem -m alpha --id 3 -o r -q 256",
         "ORXC_PartitionResourceChange: [PreviousInstance=[" + web +
             "] PreviousValues=[CurrentMemory=8448 PendingMemory=8448 RuntimeMemory=8448] " +
             source + "=[" + web + "]" + webPath + "CurrentMemory=8192 PendingMemory=8192 ",
         1},
        {"CIM_InstDeletion",
         "edpower -r lpar -m alpha --id 3 -o shutdown --immed && dlplat -r lpar -m alpha --id 3",
         "ORXC_PartitionDeletion: [" + source + "=[ElementName=B\xC3\xBCro \"1\" EnabledState=3 " +
             made +
             "CurrentEntitledMemory=256 CurrentMemory=8192 PendingEntitledMemory=256 "
             "PendingMemory=8192 PendingMemoryWeight=128 PendingProcessingUnits=150 ",
         1},
        {"ORXC_PartitionCreation",
         "nwplat -r lpar -m alpha -i name=new,profile_name=n,lpar_env=tmxlinux,all_resources=1",
         "ORXC_PartitionCreation: [" + source + "=[ElementName=new EnabledState=3 " + made, 1},
        {"CIM_ProcessIndication",
         "edpower -r lpar --id 1 -o on -f normal -m 'beta lab' && domove -o s -m alpha --id 7 && "
         "APPLIANCE_MOVE_SECONDS=0 domove -o m -m alpha -t 'beta lab' --id 7",
         "ORXC_PartitionMove: [DestinationHostName=1111-AAB*0000002 LeftBytes=1073741824 "
         "PartitionName=traveller Partition" +
             path +
             "\"7*1111-AAA*0000001\" PercentComplete=50 SentBytes=1073741824 "
             "State=Migration Stopped TotalBytes=2147483648]",
         13},
    };
    m_appliance.replaceTool("appliance", "echo $$ >>" + m_appliance.folder().string() +
                                             "/pids; exec " ZEM_PROGRAMS "/appliance \"$@\"");
    inProcess([&] {
        std::size_t all = 0;
        for (const auto& row : cases) {
            const Id first = subscribe(row.query), second = subscribe(row.query);
            unsubscribe(first);
            EXPECT_EQ(m_appliance.run(row.change).err, "");
            const std::vector<std::string> lines = heard(row.count);
            ASSERT_EQ(lines.size(), row.count) << row.query;
            EXPECT_EQ(lines[0].substr(0, row.first.size()), row.first);
            unsubscribe(second);
            // The last one has ended it: nobody reads the journal any more.
            ASSERT_EQ(followers().size(), ++all);
            const int reader = std::stoi(followers().back());
            EXPECT_TRUE(within(2min, [&] { return kill(reader, 0) != 0; }));
        }
    });
}

TEST_P(EventProvidersTest, WhoIsSlowOrGoneHoldsUpHisOwnClassAlone) {
    constexpr int kAll = 2'000, kPartitions = 50;
    inProcess([&] {
        std::atomic<bool> isHeldUp{true};
        std::map<std::string, int> next;
        std::atomic<int> count{0};
        subscribe("ORXC_PartitionStateChange", [&](const cimom::Indication& indication) {
            while (isHeldUp) {
                usleep(1000);
            }
            const cimom::Instance& source =
                indication.instance.properties.find("SourceInstance")->instance();
            EXPECT_EQ(source.properties.find("ElementName")->text(),
                      std::to_string(next[source.properties.find("Name")->text()]++));
            ++count;
        });
        std::atomic<int> gone{0};
        Id leaving = 0;
        const Id failing = subscribe("ORXC_PartitionResourceChange", [&](const auto&) {
            ++gone;
            throw std::runtime_error("gone");
        });
        std::vector<std::string> lines;
        for (int i = 0; i < kAll; ++i) {
            lines.push_back(changed("lpar",
                                    R"("host":"H","lpar":)" + std::to_string(i % kPartitions + 1),
                                    "name", "x", std::to_string(i / kPartitions)));
        }
        appendToJournal(lines);
        const std::string resources =
            changed("lpar", R"("host":"H","lpar":1)", "curr_mem", "1", "2");
        appendToJournal({resources, resources});
        EXPECT_TRUE(within(2min, [&] { return gone == 2; }));
        unsubscribe(failing);
        leaving = subscribe("ORXC_PartitionResourceChange", [&](const auto&) {
            unsubscribe(leaving);
            hear("left");
        });
        appendToJournal({resources});
        EXPECT_EQ(heard(1).size(), 1U);
        EXPECT_EQ(count, 0);
        isHeldUp = false;
        EXPECT_TRUE(within(2min, [&] { return count == kAll; }));
    });
}

// Indication operations hand no message on: who watches reads the reason in the provider's log.
TEST_P(EventProvidersTest, WithoutJavaOnlyIndicationsFail) {
    inProcess(
        [&] {
            Id id = 0;
            const char* const all = "SELECT * FROM CIM_Indication";
            EXPECT_EQ(m_server->subscribe(m_request, all, "WQL", &write, id).rc,
                      CMPI_RC_ERR_FAILED);
            EXPECT_EQ(m_server->enumInstanceNames(m_request, {"", "ORXC_CEC_CS"}).paths.size(), 4U);
            const auto outcome =
                m_appliance.run("cimom --registration " ZEM_REGISTRATION " --schema " ZEM_SCHEMA
                                " watch ORXC_PartitionMove");
            EXPECT_NE(outcome.err.find("ORXC_PartitionMove: No Java VM: no Java where"),
                      std::string::npos)
                << outcome.err;
        },
        {{"JAVA_HOME", "/no"}});
}

ON_BOTH_BROKERS(EventProvidersTest);

}  // namespace
