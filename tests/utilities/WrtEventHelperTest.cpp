// Who hears of which event, and what becomes of failures on Java's side.

#include <csignal>
#include <map>
#include <memory>

#include "FailureText.h"
#include "JavaProcess.h"
#include "MigrationEventJniHelper.h"
#include "WrtEventHelper.h"

namespace {

TEST(WrtEventHelperTest, FailuresInJavaAreThoseOfTheSubscriptionAlone) {
    const std::string threw = "CIM_ERR/Java caused an exception: java.";
    const std::string at = threw + "lang.IllegalStateException: at ";
    const std::string none = "CIM_ERR/No Java VM: ";
    const std::string faulty = jar("test-faulty");
    const struct {
        Environment environment;
        std::string events;  ///< how subscriptions to events and to moves fail, as far as this
        std::string moves;
        std::string endOfEvents;
        std::string endOfMoves;
    } cases[] = {
        {{{"JAVA_HOME", "/no"}}, none + "no Java where", none + "no Java where", "", ""},
        {{{"PEGASUS_JMPI_MAX_HEAP", "x"}}, none + "the Java VM did not start: ", threw, "", ""},
        {{{"CLASSPATH", ""}}, threw + "lang.NoClassDef", threw + "lang.NoClassDef", "", ""},
        {{{"CLASSPATH", jar("test-bare")}}, threw + "lang.NoSuchM", threw + "lang.NoSuchM", "", ""},
        {{{"CLASSPATH", faulty}, {"FAULT", "class"}}, threw + "lang.ExceptionInInit", "", "", ""},
        {{{"CLASSPATH", faulty}, {"FAULT", "get"}}, at + "get", "", "", ""},
        {{{"CLASSPATH", faulty}, {"FAULT", "null"}}, "CIM_ERR/Java has no helper", "", "", ""},
        {{{"CLASSPATH", faulty}, {"FAULT", "new"}}, "", at + "new", "", ""},
        {{{"CLASSPATH", faulty}, {"FAULT", "register"}}, at + "register", at + "register", "", ""},
        {{{"CLASSPATH", faulty}, {"FAULT", "deregister"}}, "", "", at, at},
        {{{"CLASSPATH", faulty}, {"FAULT", "deregisterALL"}}, "", "", at, ""},
        {{{"APPLIANCE_HOME", "/no"}}, threw + "io.IOException: WRTL2002", threw, "", ""},
    };
    testing_support::TestAppliance tools(ZEM_PROGRAMS);
    for (const auto& row : cases) {
        inProcess(
            [&] {
                Subscriber user;
                Listener listener;
                zemMigrationEventJniHelper moves;
                const auto function = [](const zemMigrationEvent&) {};
                const bool all = row.endOfMoves.empty();
                const auto fails = [](const std::function<void()>& step,
                                      const std::string& expected) {
                    const std::string text = failureText(step, "it");
                    EXPECT_EQ(text.substr(0, expected.size()), expected) << text;
                    EXPECT_EQ(text.empty(), expected.empty()) << text;
                    EXPECT_FALSE(zemJavaVM::getJavaVM().isAttached());
                    InJava java;
                    EXPECT_TRUE(java.env() == nullptr || !java.env()->ExceptionCheck());
                };
                fails([&] { user.add(4, "x", listener); }, row.events);
                fails([&] { moves.registerSubscription("user", function); }, row.moves);
                if (!row.endOfEvents.empty()) {
                    fails([&] { user.remove(4, "x", listener, all); }, row.endOfEvents);
                    fails([&] { moves.unregisterSubscription("user", function); }, row.endOfMoves);
                    EXPECT_EQ(user.add(4, "x", listener), 2);  // it stood
                }
            },
            row.environment);
    }
}

TEST(WrtEventHelperTest, EventsFindTheirCallBacksByKey) {
    const struct {
        int type;
        const char* registered;
        const char* key;
        const char* sent;
        bool isHeard;
    } cases[] = {
        {1, "ORXWRT_Partition", "1-ORXWRT_Partition", "ORXWRT_Partition", true},
        {4, "ORXWRT_Partition", "4-ORXWRT_Partition", "ORXWRT_LparProfile", false},
        {4, "ORXWRT_ComputerSystem", "4-ORXWRT_ComputerS", "ORXWRT_Computer", false},
        {4, "ORXWRT_ComputerSystem", "4-ORXWRT_ComputerS", "ORXWRT_ComputerSomething", true},
        {-1, "null", "-1-null", nullptr, true},
        {-2, "null", "-2-null", "", true},
        {7, "\x01 line", "7-\x01 line", "\x01 line", true},
    };
    DemoAppliance appliance(ZEM_PROGRAMS);
    inProcess([&] {
        Subscriber user;
        for (const auto& row : cases) {
            Listener listener;
            EXPECT_EQ(zemWrtEventHandler::getzemStringKey(row.type, row.registered), row.key);
            user.add(row.type, row.registered, listener);
            InJava java;
            for (const int type : {row.type, row.type + 1000}) {
                EXPECT_EQ(java.probe(&JNIEnv::CallStaticIntMethod, "send", "(ILjava/lang/String;)I",
                                     type, java.text(row.sent)),
                          0);
            }
            EXPECT_EQ(listener.calls, row.isHeard ? 1 : 0) << row.key;
            EXPECT_EQ(user.remove(row.type, row.registered, listener), 0);
            EXPECT_EQ(user.remove(row.type, row.registered, listener), -1);
        }
    });
}

TEST(WrtEventHelperTest, EachCallBackIsCalledWhateverOthersDo) {
    static int delivered = 0;
    DemoAppliance appliance(ZEM_PROGRAMS);
    inProcess([] {
        Subscriber user;
        Listener plain, dull;
        dull.isDull = true;
        Listener thrower([](const zemWRTEvent&) { throw std::runtime_error("on purpose"); });
        Listener leaver([](const zemWRTEvent& event) {
            JNIEnv* const env = event.getJvmHelper()->getEnv();
            event.getJvmHelper()->NewJString(env, "a reference");
            env->FindClass("no/such/Class");  // whose exception stays pending
        });
        Listener last([](const zemWRTEvent& event) {
            EXPECT_EQ(event.getOldRClientObject(), nullptr);
            EXPECT_EQ(event.getRClientObjectProperty(nullptr, "Name"), "");
        });
        for (Listener* listener : {&plain, &leaver, &dull, &last}) {
            listener->setDeliverFunction([](const zemEventData*) { ++delivered; });
            EXPECT_EQ(user.add(1, "x", *listener), 1);
            EXPECT_EQ(user.add(1, "x", *listener), 2);
            EXPECT_EQ(user.remove(1, "x", *listener), 1);
        }
        InJava java;
        const auto send = [&](const char* name, const char* signature, auto... arguments) {
            return java.probe(&JNIEnv::CallStaticIntMethod, name, signature, arguments...);
        };
        EXPECT_EQ(send("send", "(ILjava/lang/String;)I", 1, java.text("x")), 0);
        user.add(1, "x", thrower);
        EXPECT_EQ(send("send", "(ILjava/lang/String;)I", 1, java.text("x")), -1);
        EXPECT_EQ(send("sendObject", "(Ljava/lang/Object;)I", nullptr), -1);
        EXPECT_EQ(send("sendObject", "(Ljava/lang/Object;)I", java.text("no event")), -1);
        EXPECT_EQ(plain.calls + leaver.calls + dull.calls + last.calls, 8);
        EXPECT_EQ(delivered, 6);
    });
}

TEST(WrtEventHelperTest, CallBacksMayGoWhileEventsArrive) {
    DemoAppliance appliance(ZEM_PROGRAMS);
    inProcess([] {
        Subscriber user;
        Listener stays;
        user.add(1, "x", stays);
        std::atomic<bool> isOver{false};
        const auto storm = [&](int) {
            InJava java;
            const jstring type = java.text("x");
            while (!isOver) {
                java.probe(&JNIEnv::CallStaticIntMethod, "send", "(ILjava/lang/String;)I", 1, type);
            }
        };
        onThreads(2, storm, [&] {
            for (int i = 0; i < 200; ++i) {
                auto goes = std::make_unique<Listener>();
                user.add(1, "x", *goes);
                EXPECT_EQ(user.remove(1, "x", *goes), 0);
            }
            isOver = true;
        });
        EXPECT_GT(stays.calls, 200);
        EXPECT_EQ(user.remove(1, "x", stays), 0);
    });
}

// -- from the appliance ---------------------------------------------------------------------------

/// Writes an event down, with some of the properties.
void tell(const zemWRTEvent& event) {
    std::string line = std::to_string(event.getEventType());
    for (const char* name : {"Name", "State"}) {
        const zemString old = event.getRClientObjectProperty(event.getOldRClientObject(), name);
        const zemString now = event.getRClientObjectProperty(event.getNewRClientObject(), name);
        if (!old.isEmpty() || !now.isEmpty()) {
            line += static_cast<const char*>(zemString(" ") + name + "=" + old + ">" + now);
        }
    }
    hear(line);
}

TEST(WrtEventHelperTest, ChangesOfTheApplianceAreHeard) {
    const std::string gamma = " Name=1111-AAC*0000003>1111-AAC*0000003 State=";
    const std::string host = R"("host":"1111-AAC*0000003","lpar":0)", lost = "No Connection";
    const struct {
        std::string change;  ///< a command, or a line of the journal
        std::vector<std::string> expected;
    } cases[] = {
        {"edpower -r sys -m gamma -o on", {"4" + gamma + "3>1"}},
        {changed("host", host, "state", "Operating", lost),
         {"4" + gamma + "1>254", "-1" + gamma + "1>254"}},
        {"{no JSON", {}},
        {changed("host", host, "state", lost, "?"),
         {"4" + gamma + "254>255", "-2" + gamma + "254>255"}},
    };
    DemoAppliance appliance(ZEM_PROGRAMS);
    inProcess([&] {
        Subscriber user;
        Listener teller(&tell);
        for (const int type : {1, 2, 4}) {
            user.add(type, "ORXWRT_ComputerSystem", teller);
            user.add(-type, "null", teller);
        }
        for (const auto& row : cases) {
            if (row.change.front() != '{') {
                EXPECT_EQ(appliance.run(row.change).err, "");
            } else {
                appendToJournal({row.change});
            }
            EXPECT_EQ(heard(row.expected.size()), row.expected);
        }
        const zemDnxPegasusApi api(user.helper());
        EXPECT_EQ(api.getLparRefCode("1111-AAA*0000001", "1"), "00000000");
        EXPECT_NE(failureText([&] { api.getLparRefCode("no host", "1"); }, "t").find("WRTL8018"),
                  std::string::npos);
    });
}

TEST(WrtEventHelperTest, AStormArrivesWholeAndInOrderWhoeverIsSlow) {
    constexpr int kPartitions = 50, kAll = 10'000;
    static std::atomic<bool> isHeldUp{true};
    DemoAppliance appliance(ZEM_PROGRAMS);
    appliance.replaceTool("appliance", "echo $$ >>" + appliance.folder().string() +
                                           "/pids; exec " ZEM_PROGRAMS "/appliance \"$@\"");
    inProcess([&] {
        Subscriber user;
        Listener slow([](const zemWRTEvent& event) {
            const jobject object = event.getNewRClientObject();
            const zemString name = event.getRClientObjectProperty(object, "Name");
            while (name == "1*H" && isHeldUp) {
                usleep(1000);
            }
            hear(std::string(name + " ") + static_cast<const char*>(event.getRClientObjectProperty(
                                               object, "UserDefinedName")));
        });
        user.add(4, "ORXWRT_Partition", slow);
        std::vector<std::string> lines;
        for (int i = 0; i < kAll; ++i) {
            const std::string lpar = std::to_string(i % kPartitions + 1);
            lines.push_back(changed("lpar", R"("host":"H","lpar":)" + lpar, "name", "x",
                                    std::to_string(i / kPartitions)));
        }
        appendToJournal(lines);
        std::vector<std::string> all = heard(kAll / 2);
        EXPECT_GE(all.size(), std::size_t{kAll / 2});
        isHeldUp = false;
        for (const std::string& line : heard(kAll - all.size())) {
            all.push_back(line);
        }
        EXPECT_EQ(all.size(), std::size_t{kAll});
        std::map<std::string, int> next;
        for (const std::string& line : all) {
            const std::string lpar = line.substr(0, line.find(' '));
            EXPECT_EQ(line, lpar + " " + std::to_string(next[lpar]++));
        }
        // Who reads the journal may end; nothing is missed.
        kill(std::stoi(testing_support::contents(appliance.folder() / "pids")), SIGKILL);
        appendToJournal({lines.front()});
        EXPECT_EQ(heard(1).size(), 1U);
    });
}

}  // namespace
