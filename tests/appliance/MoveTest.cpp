// domove: a partition's way to another host, whatever happens on it.

#include <sys/wait.h>

#include "ApiAnswer.h"
#include "Store.h"
#include "SystemConfig.h"

namespace {

using appliance::Kind;

constexpr const char* kAlpha = "1111-AAA*0000001";
constexpr const char* kMove = "domove -o m -m alpha -t 'beta lab' --id 7";
// Starts that move, and waits until bytes flow, or until it has ended.
constexpr const char* kUnderWay =
    "domove -o m -m alpha -t 'beta lab' --id 7 & p=$!; "
    "until qymove -r lpar -m alpha --filter lpar_ids=7 -F migration_state | grep -q Progress || "
    "! kill -0 $p; do :; done; ";

/// A text in a line of the journal.
std::string noted(const std::string& line, const std::string& name) {
    const std::string start = '"' + name + "\":\"";
    const std::size_t at = line.find(start) + start.size();
    return line.substr(at, line.find('"', at) - at);
}

class MoveTest : public ApiTest {
protected:
    MoveTest() {
        out("domove -o s -m alpha --id 7");  // the move of the demo, which nobody carries out
        out("edpower -r lpar --id 1 -o on -f normal -m 'beta lab'");
    }

    testing_support::ScopedEnvironment m_seconds{"APPLIANCE_MOVE_SECONDS", "1"};
};

TEST_F(MoveTest, RunsInTheBackground) {
    zemVirtualSystem partition("7", zemManagerSystem::getHostSystemByName(kAlpha, ""), "", "");
    EXPECT_TRUE(partition.validateMigratebility("beta lab", false, "", nullptr));
    pid_t pid = 0;
    FILE* stream = nullptr;
    const std::size_t before = testing_support::lines(out("appliance journal --json")).size();
    ASSERT_EQ(0, partition.migrateTo("beta lab", false, "", nullptr, &pid, &stream));
    int status = -1, seen = 0;
    testing::internal::CaptureStdout();  // the log of the queries
    for (int percent = 0; waitpid(pid, &status, WNOHANG) == 0;) {
        EXPECT_EQ("", out("appliance check"));
        const int now = partition.getMigrationPercentComplete("");
        const Answer lpar(getLparObj("", (std::string("7*") + kAlpha).c_str(), 1));
        if (now <= 0 || lpar.size() == 0) {
            continue;
        }
        EXPECT_EQ("13", lpar.value(0, "MigrationState"));
        EXPECT_LE(percent, now);
        percent = now;
        ++seen;
    }
    testing::internal::GetCapturedStdout();
    EXPECT_EQ(0, fclose(stream));
    EXPECT_EQ(0, status);
    EXPECT_LT(0, seen);

    // clang-format off
    expectRows({
        {"appliance check"},
        {"qyplat -r lpar -m alpha --filter lpar_names=traveller", "WRTL8010 The partition with the name \"traveller\" was not found.\n"},
        {"qyplat -r lpar -m 'beta lab' --filter lpar_ids=2 -F name,state,migration_state", "traveller,Running,Not Migrating\n"},
        {"qyplat -r prof -m 'beta lab' --filter lpar_ids=2 -F name,virtual_scsi_adapters", "\"day, night\",3/client/1/xbrg/3/1\n"},
        {"qyalloc -r virtualio --rsubtype scsi --level lpar -m 'beta lab' --filter lpar_ids=1,2,slots=3 -F lpar_id,state,remote_lpar_id,remote_slot_num,backing_devices", "1,1,2,3,disk7\n2,1,1,3,none\n"},
        {"qyalloc -r virtualio --rsubtype scsi --level lpar -m alpha --filter lpar_ids=2 -F slot_num", "14\n"},
        {"qyalloc -r mem --level lpar -m 'beta lab' --filter lpar_ids=2 -F curr_mem,run_mem", "2048,2048\n"},
        {"qymove -r sys -m alpha -F num_active_migrations_in_progress", "0\n"},
    });
    // clang-format on
    const Answer there(getLparObj("", "2*1111-AAB*0000002", 2));
    EXPECT_EQ("2", there.value(0, "PartitionState"));
    EXPECT_EQ("0,day, night", there.value(0, "Curr_prof"));

    // One line for the start, for each step, and for the end; whoever follows them needs no more.
    const auto journal = testing_support::lines(out("appliance journal --json"));
    ASSERT_EQ(before + 12, journal.size());
    std::int64_t sent = -1;
    for (std::size_t i = before; i < journal.size(); ++i) {
        const auto bytes = [&](const char* which) { return std::stoll(noted(journal[i], which)); };
        EXPECT_LT(sent, i + 1 == journal.size() ? sent + 1 : bytes("bytes_transmitted"));
        sent = bytes("bytes_transmitted");
        EXPECT_EQ(2048LL << 20, bytes("bytes_total"));
        EXPECT_EQ(bytes("bytes_total"), sent + bytes("bytes_remaining"));
        EXPECT_EQ(i == before               ? "Migration Starting"
                  : i + 1 == journal.size() ? "Migration Complete"
                                            : "Migration In Progress",
                  noted(journal[i], "state"));
        EXPECT_EQ(kAlpha, noted(journal[i], "source"));
        EXPECT_EQ("1111-AAB*0000002", noted(journal[i], "dest"));
        EXPECT_EQ("traveller", noted(journal[i], "lpar_name"));
        EXPECT_EQ("7", noted(journal[i], "source_lpar_id"));
        EXPECT_EQ("2", noted(journal[i], "dest_lpar_id"));
    }
}

TEST_F(MoveTest, ThatIsStoppedOrKilledLeavesNothing) {
    setenv("APPLIANCE_MOVE_SECONDS", "4", 1);
    const std::string before = shown();
    const auto stopped =
        m_appliance.run(std::string(kUnderWay) + "domove -o s -m alpha --id 7 && wait $p; echo $?");
    EXPECT_EQ("1\n", stopped.out);
    EXPECT_EQ("WRTL8074 The move of the partition with the ID 7 was stopped.\n", stopped.err);
    EXPECT_EQ(before, shown());
    EXPECT_EQ("", out("appliance check"));
    EXPECT_EQ("Migration Stopped", noted(out("appliance journal --json | tail -1"), "state"));

    m_appliance.run(std::string(kUnderWay) + "kill -9 $p; wait $p");
    EXPECT_NE(before, shown());
    EXPECT_EQ("", out("appliance check"));
    EXPECT_EQ("WRTL8050", m_appliance.run(kMove).err.substr(0, 8));
    // What of the place is to be changed is refused until someone decides.
    EXPECT_EQ("WRTL8050", m_appliance.run("dlplat -r lpar -m 'beta lab' --id 2").err.substr(0, 8));
    EXPECT_EQ("", out("domove -o s -m alpha --id 7"));
    EXPECT_EQ(before, shown());
    EXPECT_EQ("", out("appliance check"));
    setenv("APPLIANCE_MOVE_SECONDS", "0", 1);
    EXPECT_EQ("", out(kMove));
}

TEST_F(MoveTest, TwoAtOnce) {
    out("edsusp -o shutdown -t suspend -m alpha --id 5");
    const auto both = m_appliance.run(std::string(kUnderWay) +
                                      "domove -o m -m alpha -t 'beta lab' --id 5; wait $p");
    EXPECT_EQ("", both.err);
    EXPECT_EQ("", out("appliance check"));
    // The way back is a move like any other; a profile of before starts what came.
    // clang-format off
    expectRows({
        {"qyplat -r lpar -m 'beta lab' --filter lpar_ids=2,5 -F name,state", "traveller,Running\n\"say \"\"hi\"\"\",Not Activated\n"},
        {"domove -o m -m 'beta lab' -t alpha --id 5"},
        {"edpower -r lpar --id 5 -o on -f normal -m alpha"},
        {"domove -o m -m 'beta lab' -t alpha --id 2"},
        {"qyplat -r lpar -m alpha --filter lpar_ids=5,7 -F name,state", "\"say \"\"hi\"\"\",Running\ntraveller,Running\n"},
        {"appliance check"},
    });
    // clang-format on
}

TEST_F(MoveTest, WhatIsRefusedChangesNothing) {
    // clang-format off
    const struct {
        const char* options;
        const char* code;
        Kind kind = Kind::Host;  // what is different before, if anything
        appliance::Place place{};
        const char* attribute = nullptr;
        const char* value = nullptr;
    } rows[] = {
        {"--id 7", "WRTL1003"},
        {"-t nowhere --id 7", "WRTL8018"},
        {"-t alpha --id 7", "WRTL8069"},
        {"-t gamma --id 7", "WRTL8048"},
        {"-t 'beta lab' --ip 10.0.0.1-u user --id 7", "WRTL1006"},
        {"-t 'beta lab' --ip 10.0.0.1 --id 7", "WRTL8075"},
        {"-t 'beta lab' --id 99", "WRTL8011"},
        {"-t 'beta lab' --id 1", "WRTL8066"},
        {"-t 'beta lab' --id 3", "WRTL8061"},
        {"-t 'beta lab' --id 4", "WRTL8067"},
        {"-t 'beta lab' --id 5", "WRTL8049"},
        {"-t 'beta lab' --id 6", "WRTL8067"},
        {"-t 'beta lab' --id 7", "WRTL8051", Kind::Lpar, {1, 7}, "resource_config", "0"},
        {"-t 'beta lab' --id 7", "WRTL8066", Kind::Host, {1}, "service_lpar_id", "7"},
        {"-t 'beta lab' --id 7", "WRTL8068", Kind::Serial, {1, 4, 6}, "remote_lpar_id", "7"},
        {"-t 'beta lab' --id 7", "WRTL8069", Kind::Host, {2}, "active_lpar_mobility_capable", "0"},
        {"-t 'beta lab' --id 7", "WRTL8070", Kind::Host, {1}, "num_active_migrations_supported", "0"},
        {"-t 'beta lab' --id 7", "WRTL8071", Kind::Lpar, {2, 1}, "state", "Open Firmware"},
        {"-t 'beta lab' --id 7", "WRTL8072", Kind::Lpar, {2, 1}, "curr_max_virtual_slots", "3"},
        {"-t 'beta lab' --id 7", "WRTL8032", Kind::Lpar, {2, 3}, "name", "traveller"},
        {"-t 'beta lab' --id 7", "WRTL8034", Kind::Host, {2}, "max_lpars", "3"},
        {"-t 'beta lab' --id 7", "WRTL8035", Kind::Host, {2}, "lpar_proc_compat_modes", "default,CORAL6"},
        {"-t 'beta lab' --id 7", "WRTL8038", Kind::Host, {2}, "installed_sys_mem", "15360"},
        {"-t 'beta lab' --id 7", "WRTL8038", Kind::Host, {2}, "installed_sys_proc_units", "2.80"},
        {"-t 'beta lab' --id 7", "WRTL8030", Kind::Host, {2}, "mem_region_size", "4096"},
    };
    // clang-format on
    const std::string before = shown() + out("appliance journal --json");
    for (const auto& row : rows) {
        auto store = appliance::Store::open(appliance::Database::Access::Write);
        const auto usual = store.find(row.kind, row.place);
        const auto put = [&](appliance::Object object, const char* value) {
            auto change = store.write();
            if (value != nullptr) {
                object.set(row.attribute, value);
            }
            store.put(object);
            change.commit();
        };
        if (usual) {
            put(*usual, row.value);
        }
        for (const std::string operation : {"v", "m"}) {
            const auto outcome =
                m_appliance.run("domove -o " + operation + " -m alpha " + row.options);
            EXPECT_EQ(row.code, outcome.err.substr(0, 8)) << row.options << '\n' << outcome.err;
            EXPECT_EQ("", outcome.out);
            EXPECT_NE(0, outcome.exit);
        }
        if (usual) {
            put(*usual, nullptr);
        }
    }
    EXPECT_EQ(before, shown() + out("appliance journal --json"));
    EXPECT_EQ("WRTL8073", m_appliance.run("domove -o s -m alpha --id 7").err.substr(0, 8));
}

}  // namespace
