// The program that makes, shows and checks an appliance.

#include <gtest/gtest.h>
#include <unistd.h>

#include <map>

#include "Store.h"
#include "ToolRecords.h"

namespace {

using namespace appliance;

class ApplianceTest : public ToolTest {};

TEST_F(ApplianceTest, EndsWithTheStatusThatTheHelpNames) {
    const struct {
        const char* command;
        int exit;
        const char* out;  ///< is somewhere in standard output
        const char* err;  ///< likewise in standard error
    } rows[] = {
        {"appliance show", 3, "", "WRTL2002 There is no appliance in "},
        {"APPLIANCE_HOME= appliance init", 3, "", "WRTL2001 "},
        {"APPLIANCE_HOME=/dev/null/x appliance init", 3, "", "WRTL2005 "},
        {"appliance init", 0, "", ""},
        {"appliance init", 1, "", "WRTL2004 "},
        {"LC_ALL=de_DE.UTF-8 appliance generate", 1, "", "WRTL2004 In "},
        {"appliance show", 0, "beta lab (1111-AAB*0000002)  Standby", ""},
        {"appliance show --format json", 0, "\"name\": \"say \\\"hi\\\"\"", ""},
        {"appliance show --format xml", 2, "", "xml"},
        {"appliance show >/dev/full", 4, "", "WRTL2007 "},
        {"appliance check", 0, "", ""},
        {"appliance generate --hosts -1", 2, "", "--hosts"},
        {"appliance generate --force --hosts 2 --lpars 9", 0, "", ""},
        {"appliance show", 0, "host-002-lpar-0009", ""},
        {"appliance check", 0, "", ""},
        {"appliance generate --force --hosts 0", 0, "", ""},
        {"qyplat -r sys", 0, "No results were found.", ""},
        {"appliance", 2, "", "subcommand"},
        {"appliance shwo --after 2", 2, "", "shwo"},
        {"appliance --version", 0, "appliance ", ""},
        {"APPLIANCE_HOME=$APPLIANCE_HOME/two; export APPLIANCE_HOME; appliance init; "
         "edplat -r lpar -m alpha -i lpar_id=3,new_name=w; appliance journal",
         0, "  edplat\n    modify lpar 3 of 1111-AAA*0000001: name \"web server\" -> \"w\"\n", ""},
        {"appliance --help", 0, "Exit status: 0 done", ""},
        {"appliance generate --help", 0, "--seed", ""},
    };
    for (const auto& row : rows) {
        const auto outcome = run(row.command);
        EXPECT_EQ(row.exit, outcome.exit) << row.command << '\n' << outcome.err;
        EXPECT_NE(std::string::npos, outcome.out.find(row.out)) << row.command << outcome.out;
        EXPECT_NE(std::string::npos, outcome.err.find(row.err)) << row.command << outcome.err;
        EXPECT_EQ(*row.err == '\0', outcome.err.empty()) << row.command << outcome.err;
    }
}

TEST_F(ApplianceTest, WhatOthersLeaveInItsFolderNeitherStopsNorMisleadsIt) {
    make("init");
    const std::string before = shown();
    const auto damage = [&](const char* sql) {
        const auto file = m_appliance.folder() / "appliance/appliance.db";
        Database(file.string(), Database::Access::Write).execute(sql);
    };
    damage("UPDATE object SET attributes = 'stray' || rtrim(attributes, char(10))");
    EXPECT_EQ(before, shown());
    for (const auto& [version, answer] : std::map<std::string, const char*>{
             {"99", "WRTL2003 The appliance's state has version 99; this program reads version 2."},
             {"0", "WRTL2002 "}}) {
        damage(("PRAGMA user_version = " + version).c_str());
        EXPECT_EQ(0U, run("appliance show").err.find(answer)) << version;
    }
    damage("PRAGMA user_version = 2");
    damage("UPDATE object SET lpar = 1 WHERE kind = 'host'");
    const struct {
        const char* command;  ///< in the appliance's folder
        int exit;
        const char* answer;  ///< its beginning
    } rows[] = {
        {"edplat -r sys -m alpha -i power_off_policy=1", 3, "WRTL2005 "},
        {"umask 022; appliance fault qyplat --code 1; stat -c %a faults", 0, "600\n"},
        {"chmod 666 faults; appliance fault; stat -c %a faults", 0,
         "qyplat: 1 calls, code 1\n666\n"},
        {"flock faults sleep 20 & sleep .1; timeout 10 qylink -r all -F state; kill $!", 0, "Conn"},
        {"rm faults; ln -s linked faults; appliance fault qyplat --code 1", 3, "WRTL2005 "},
        {"! ls linked", 0, ""},
        {"rm faults; mkfifo faults; timeout 10 appliance fault", 3, "WRTL2005 "},
        {"timeout 10 qylink -r all -F state", 0, "Connected"},
        {"rm appliance.db*; mkfifo appliance.db; timeout 10 qyplat -r sys", 3, "WRTL2005 "},
        {"timeout 10 appliance init --force", 3, "WRTL2005 "},
    };
    for (const auto& row : rows) {
        const auto outcome = run("cd $APPLIANCE_HOME; " + std::string(row.command));
        EXPECT_EQ(row.exit, outcome.exit) << row.command << outcome.err;
        EXPECT_EQ(0U, (outcome.out + outcome.err).find(row.answer)) << row.command << outcome.err;
    }
}

TEST_F(ApplianceTest, TheSameSeedMakesTheSameAppliance) {
    const auto made = [&](const std::string& options) {
        const std::string generate = "appliance generate --force --hosts 3 --lpars 40 ";
        EXPECT_EQ(0, run(generate + options).exit);
        EXPECT_EQ("", run("appliance check").out);
        return shown();
    };
    const std::string first = made("--seed 7");
    EXPECT_EQ(first, made("--seed 7"));
    EXPECT_NE(first, made("--seed 8"));
    EXPECT_EQ("120\n", run("qyplat -r lpar | wc -l").out);
}

TEST_F(ApplianceTest, CheckFindsWhatAHostWouldRefuse) {
    const struct {
        Kind kind;
        Place place;
        const char* attribute;
        const char* value;
        const char* finding;
    } rows[] = {
        {Kind::Host, {1}, "installed_sys_mem", "4096", "alpha: the partitions have more memory"},
        {Kind::Host, {1}, "installed_sys_proc_units", "1.00", "have more processors than there"},
        {Kind::Host, {1}, "max_lpars", "6", "more partitions than the host can have"},
        {Kind::Host, {2}, "name", "alpha", "another host has the same name"},
        {Kind::ProcPool, {1, 0, 1}, "max_pool_proc_units", "3.00", "than it may use"},
        {Kind::Lpar, {1, 3}, "name", "xbrg1", "partition 3 has the name of another: xbrg1"},
        {Kind::Lpar, {1, 3}, "default_profile", "x", "has a default_profile that does not exist"},
        {Kind::Lpar, {1, 3}, "pend_mem", "8191", "no multiple of the region size"},
        {Kind::Lpar, {1, 3}, "pend_mem", "16640", "has a quantity outside its limits: pend_mem"},
        {Kind::Lpar, {1, 3}, "pend_shared_proc_pool_id", "5", "processor pool that does not exist"},
        {Kind::Lpar, {1, 3}, "curr_max_virtual_slots", "3", "behind the partition's last virtual"},
        {Kind::Profile, {1, 4, 1}, "name", "normal", "profile 1 of partition 4 has the name"},
        {Kind::Profile, {1, 4, 1}, "min_procs", "9", "outside its limits: desired_procs"},
        {Kind::Profile, {1, 9, 0}, "name", "x", "belongs to a partition that does not exist"},
        {Kind::VirtualScsi, {1, 3, 3}, "remote_slot_num", "15", "that is not joined to it"},
        {Kind::VirtualScsi, {1, 3, 3}, "remote_lpar_id", "any", "that is not joined to it"},
        {Kind::Ethernet, {1, 4, 2}, "mac_addr", "A20001000302", "has the MAC address of another"},
        {Kind::Ethernet, {1, 3, 3}, "mac_addr", "0", "shares its virtual slot"},
        {Kind::Slot, {1, 1, 1}, "drc_index", "30000002", "has the DRC index of another"},
    };
    for (const auto& row : rows) {
        make("init --force");
        Store store = Store::open(Database::Access::Write);
        Transaction change = store.write();
        Object changed(row.kind, row.place);
        for (const Object& object : store.all(row.kind, row.place.host)) {
            const Place& place = object.place();
            if (place.lpar == row.place.lpar && place.number == row.place.number) {
                changed = object;
            }
        }
        changed.set(row.attribute, row.value);
        if (changed.stored().find("mem") == std::string::npos && row.kind == Kind::Profile) {
            for (const char* quantity : {"mem", "procs", "proc_units"}) {
                for (const char* prefix : {"min_", "desired_", "max_"}) {
                    changed.set(std::string(prefix) + quantity, "1");
                }
            }
        }
        store.put(changed);
        change.commit();
        const auto outcome = run("appliance check");
        EXPECT_EQ(1, outcome.exit) << row.attribute << outcome.err;
        EXPECT_NE(std::string::npos, outcome.out.find(row.finding))
            << row.attribute << ' ' << outcome.out << outcome.err;
    }
    make("init --force");
    Database((m_appliance.folder() / "appliance/appliance.db").string(), Database::Access::Write)
        .execute(
            "UPDATE object SET attributes = replace(replace(attributes, "
            "'remote_lpar_id=3', 'remote_lpar_id=any'), 'slot_num=15', 'slot_num=13') "
            "WHERE kind = 'scsi' AND host = 1");
    EXPECT_NE(std::string::npos, run("appliance check").out.find("that serves another client"));
}

TEST_F(ApplianceTest, AToolSeesTheOldApplianceOrTheNewOne) {
    make("generate --hosts 2 --lpars 50");
    const auto outcome =
        run("appliance generate --force --hosts 2 --lpars 3000 & "
            "while kill -0 $! 2>/dev/null; do qyplat -r lpar -F lpar_id | wc -l; done; "
            "qyplat -r lpar -F lpar_id | wc -l");
    EXPECT_EQ("", outcome.err);
    const auto counts = testing_support::lines(outcome.out);
    for (const std::string& count : counts) {
        EXPECT_TRUE(count == "100" || count == "6000") << count;
    }
    EXPECT_EQ("6000", counts.back());
}

TEST_F(ApplianceTest, UsersWhoMayOnlyReadTheFolderCanAsk) {
    if (geteuid() != 0) {
        GTEST_SKIP() << "needs another user";
    }
    ASSERT_EQ(0, run("umask 022 && appliance init").exit);
    const auto asOther = [&](const std::string& command) {
        return run("setpriv --reuid=65534 --regid=65534 --clear-groups " + command);
    };
    EXPECT_EQ("14\n", asOther("qyplat -r lpar -F name | wc -l").out);
    EXPECT_EQ(3, asOther("appliance init --force").exit);
    EXPECT_EQ("14\n", run("qyplat -r lpar -F name | wc -l").out);
}

}  // namespace
