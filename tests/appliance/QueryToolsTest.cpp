// The query tools beside qyplat, and that they agree. Every row runs a program.

#include <gtest/gtest.h>

#include "Text.h"
#include "ToolRecords.h"

namespace {

using appliance::number;

class QueryToolsTest : public DemoTest {
protected:
    /// The values of one field.
    std::vector<std::string> column(const std::string& command) {
        std::vector<std::string> values;
        for (const Record& record : recordsOf(run(command).out)) {
            values.push_back(record[0]);
        }
        return values;
    }
};

TEST_F(QueryToolsTest, AnswersAndFailures) {
    // clang-format off
    expectRows({
        {"qyalloc -r virtualio --rsubtype eth -m alpha --filter lpar_ids=4,slots=5 --level lpar -F port_vlan_id,addl_vlan_ids", "7,\"20,30\"\n"},
        {"qyalloc -r virtualio --rsubtype slot --level slot -m alpha --filter lpar_ids=4 -F slot_num,config", "0,serial\n1,serial\n2,ethernet\n3,scsi\n5,ethernet\n6,serial\n"},
        {"qyalloc -r virtualio --rsubtype scsi --level lpar -m alpha --filter 'lpar_names=db,main' -F remote_lpar_name,remote_slot_num", "xbrg2,14\n"},
        {"qyalloc -r procpool -m alpha -F name,lpar_names,lpar_ids", "DefaultPool,\"xbrg2,\"\"say \"\"\"\"hi\"\"\"\"\"\",traveller\",\"2,5,7\"\n\"web, db\",\"web server,\"\"db,main\"\"\",\"3,4\"\n"},
        {"qyalloc -r mempool -m gamma", "No results were found.\n"},
        {"qyalloc -r io --rsubtype slot -m gamma --filter lpar_names=xbrg -F drc_index", "30000001\n30000002\n"},
        {"qyalloc -r io --rsubtype taggedio -F lpar_name,console_slot", "Büro-Prüfstand,dnx\nosq dev,dnx\n"},
        // Asked with a bare -F by callers that only count.
        {"qyalloc -r hca --level lpar -F | wc -l", "1\n"},
        {"qyalloc -r hca --level sys -F | wc -l", "2\n"},
        {"qyalloc -r sni -m alpha -F | wc -l", "1\n"},
        {"qyalloc -r mem --level sys --maxmem 65536 -m alpha -F required_min_mem_tmx_linux", "1280\n"},
        // What is there is what the firmware, the pool and the partitions have, and what is left.
        {"qyalloc -r mem --level sys -F configurable_sys_mem,curr_avail_sys_mem,pend_avail_sys_mem", "131072,83968,83968\n65536,49152,49152\n32768,27648,26624\n32768,30720,30720\n"},
        {"qyalloc -r proc --level sys -F configurable_sys_proc_units,curr_avail_sys_proc_units,pend_avail_sys_proc_units", "32.00,21.50,21.50\n16.00,13.00,13.00\n8.00,6.90,6.80\n8.00,8.00,8.00\n"},
        {"qyalloc -r mem -F", "WRTL1003 The option --level is missing.\n"},
        {"qyalloc -r virtualio -F", "WRTL1003 The option --rsubtype is missing.\n"},
        {"qyalloc -r virtualio --rsubtype scsi --level sys -F", "WRTL1004 The option --level cannot have the value \"sys\".\n"},
        {"qyalloc -r io --rsubtype unit --level frame -F", "WRTL1004 The option --level cannot have the value \"frame\".\n"},
        {"qyalloc -r mem --level sys --maxmem 0", "WRTL1004 The option --maxmem cannot have the value \"0\".\n"},
        {"qymove -r sys -m alpha -F num_active_migrations_in_progress", "1\n"},
        // Callers pair the lines with those of qyplat.
        {"qymove -r lpar -m alpha -F lpar_id | tr '\\n' ,", "1,2,3,4,5,6,7,"},
        {"qymove -r lpar -m '' --filter lpar_names=traveller -F bytes_transmitted", "1073741824\n1073741824\n"},
        {"qyfault -r lpar -m alpha --filter lpar_ids=3 -F refcode", "A1000042\n"},
        {"qylink -r all -m 'delta, spare' -F sp,state", "primary,No Connection\nsecondary,No Connection\n"},
        {"qylwh", "WRTL3001 This appliance is not the manager of a single host.\n"},
        // Running, suspended, moving away.
        {"qydyn -dlpar -c 1111-AAA_0000001 | grep '^[357][*]'", "3*1111-AAA*0000001,DCaps:<7>\n5*1111-AAA*0000001,DCaps:<0>\n7*1111-AAA*0000001,DCaps:<0>\n"},
        {"qydyn -dlpar -c 9999-ZZZ_0000001", "WRTL8018 The managed system \"9999-ZZZ_0000001\" was not found.\n"},
        {"qydyn -c alpha", "WRTL1003 The option -dlpar is missing.\n"},
        {"qydyn -dlpar -c 'delta, spare'", "No results were found.\n"},
        {"xbrgcli -m alpha --id 1 -c version", "XBRG 2.1\n"},
        {"xbrgcli -m alpha --id 2 -c mappings", "14,4,\"db,main\",3,disk4\n17,7,traveller,3,disk7\n"},
        {"xbrgcli -m alpha --id 3 -c version", "WRTL8019 The partition with the ID 3 is no I/O server.\n"},
        {"xbrgcli -m 'beta lab' --id 1 -c version", "WRTL8020 The partition with the ID 1 is not running.\n"},
        {"xbrgcli -m alpha --id 99 -c version", "WRTL8011 The partition with the ID 99 was not found.\n"},
        {"xbrgcli --id 1 -c version", "WRTL1003 The option -m is missing.\n"},
        {"xbrgcli -m alpha --id 1 -c 'version now'", "WRTL1004 The option -c cannot have the value \"version now\".\n"},
        {"appliance generate --force --hosts 1 --lpars 2 && qylwh | cut -d, -f2,3", "0000001,1\n"},
    });
    // clang-format on
}

TEST_F(QueryToolsTest, SamplesCoverTheTimeAskedFor) {
    const auto samples = [&](const std::string& range) {
        return column("qyusage -r sys -m alpha  --filter event_types=sample" + range + " -F time");
    };
    EXPECT_NEAR(12, static_cast<double>(samples("").size()), 1);  // the last hour
    EXPECT_EQ(3U, samples(" -n 3").size());
    EXPECT_EQ("No results were found.", samples(" --startyear 1999 --endyear 2001").front());
    EXPECT_EQ(2, run("qyusage -r sys --startyear 24x").exit);

    const std::time_t time = std::time(nullptr) - 2 * 24 * 60 * 60;
    const auto thatDay = [&](const char* format) {
        char text[160];
        return std::string(text, std::strftime(text, sizeof text, format, std::gmtime(&time)));
    };
    const std::string hours = thatDay(
        " --startyear %Y --startmonth %m --startday %d --starthour 3 "
        " --endyear %Y --endmonth %m --endday %d --endhour 5 ");
    const auto two = samples(hours);
    ASSERT_EQ(25U, two.size());
    EXPECT_EQ(thatDay("%m/%d/%Y 05:00:00"), two.front());
    EXPECT_EQ(thatDay("%m/%d/%Y 03:00:00"), two.back());
    EXPECT_EQ(two, samples(hours));

    const auto cycles =
        column("qyusage -r lpar -m alpha  --filter \"event_types=sample\",lpar_ids=4" + hours +
               " -F entitled_cycles");
    ASSERT_EQ(25U, cycles.size());
    EXPECT_EQ(number(cycles.front()) * 3, number(cycles.back()) * 5);  // counted from midnight
}

}  // namespace
