// Who hears of moves through the VM of the process.

#include <stdexcept>

#include "JavaProcess.h"
#include "MigrationEventJniHelper.h"

namespace {

zemMigrationEventJniHelper* g_helper = nullptr;

void first(const zemMigrationEvent& event) {
    std::ostringstream line;
    line << event.migrationSide << '/' << event.destLparName << '/' << event.totalBytes << '/'
         << event.leftBytes << '/' << event.sentBytes << '/' << event.recvBytes << '/'
         << event.state << '/' << event.portNum;
    hear(line.str());
}
void failing(const zemMigrationEvent&) {
    hear("failing");
    throw std::runtime_error("on purpose");
}
void leaving(const zemMigrationEvent&) {
    hear("leaving");
    EXPECT_EQ(g_helper->unregisterSubscription("user", &leaving), 0);
}

TEST(MigrationEventJniHelperTest, ListenersHearInOrder) {
    using Lines = std::vector<std::string>;
    DemoAppliance appliance(ZEM_PROGRAMS);
    appliance.run("domove -o s -m alpha --id 7");
    appliance.run("edpower -r lpar --id 1 -o on -f normal -m 'beta lab'");
    inProcess([&] {
        zemMigrationEventJniHelper helper, another;
        g_helper = &another;
        for (const auto listener : {&failing, &leaving, &first}) {
            EXPECT_EQ(helper.registerSubscription("user", listener), 0);
        }
        Subscriber user;
        user.helper();
        const auto move = [](const char* object) {
            InJava java;
            const jobject table =
                *object == '\0' ? java.probe("table", "()Ljava/lang/Object;") : java.text(object);
            return java.probe(&JNIEnv::CallStaticIntMethod, "move", "(Ljava/lang/Object;)I", table);
        };
        const std::string event = "-1/B\xC3\xBCro/1099511627776/0/7/0/on/0";
        EXPECT_EQ(move(""), 0);
        EXPECT_EQ(heard(3), (Lines{"failing", "leaving", event}));
        EXPECT_EQ(move(""), 0);
        EXPECT_EQ(heard(2), (Lines{"failing", event}));
        EXPECT_EQ(move("no table"), -1);
        EXPECT_EQ(another.unregisterSubscription("user", &leaving), -1);
        EXPECT_EQ(helper.unregisterSubscription("user", &failing), 0);

        Listener steps([](const zemWRTEvent& status) {
            zemJvmHelper* const java = status.getJvmHelper();
            const jobject table = status.getHashObject("getNewObject");
            const jobject name = java->getValueOfHashtable(java->getEnv(), table, "Name");
            EXPECT_EQ(java->getStringObjValue(java->getEnv(), name), "7*1111-AAA*0000001");
        });
        user.add(610, "ORXWRT_Partition", steps);
        appliance.run("APPLIANCE_MOVE_SECONDS=0 domove -o m -m alpha -t 'beta lab' --id 7");
        const Lines lines = heard(12);
        ASSERT_EQ(lines.size(), 12U);
        EXPECT_EQ(lines[0], "0/traveller/2147483648/2147483648/0/0/Migration Starting/0");
        EXPECT_EQ(lines[11], "0/traveller/2147483648/0/2147483648/2147483648/Migration Complete/0");
        EXPECT_TRUE(within(std::chrono::seconds(1), [&] { return steps.calls == 12; }));
    });
}

}  // namespace
