// qyplat, and with it what all query tools have in common: options, filters, quoting, failures,
// language. Every row runs the program.

#include <gtest/gtest.h>

#include "ToolRecords.h"

namespace {

using testing_support::Outcome;

using QyplatTest = DemoTest;

TEST_F(QyplatTest, AnswersAndFailures) {
    // clang-format off
    expectRows({
        // Which hosts.
        {"qyplat -r sys -F name,type_model,serial_num", "alpha,1111-AAA,0000001\nbeta lab,1111-AAB,0000002\ngamma,1111-AAC,0000003\n\"delta, spare\",1111-AAD,0000004\n"},
        {"qyplat -r sys -m '1111-AAC*0000003' -F state", "Power Off\n"},
        {"qyplat -r sys -m 'delta, spare' -F state,sys_time", "No Connection,unavailable\n"},
        {"qyplat -r lpar -m '' -F name | wc -l", "14\n"},
        {"qyplat -r lpar -m 'delta, spare'", "No results were found.\n"},
        {"LC_ALL=de_DE.UTF-8 qyplat -r lpar -m 'delta, spare'", "No results were found.\n"},
        // Order of fields and records, quoting.
        {"qyplat -m gamma -F state,lpar_id,lpar_id -r lpar", "Not Activated,1,1\nNot Activated,2,2\nNot Activated,7,7\n"},
        {"qyplat -r lpar -m alpha -F name,lpar_env",
         "xbrg1,xbrgserver\nxbrg2,xbrgserver\nweb server,tmxlinux\n\"db,main\",tmxlinux\n"
         "\"say \"\"hi\"\"\",tmxlinux\nBüro-Prüfstand,osq00\ntraveller,tmxlinux\n"},
        {"qyplat -r prof -m alpha --filter lpar_ids=4 -F virtual_eth_adapters,lpar_name,name",
         "\"2/0/1//0/0/default,\"\"5/1/7/20,30/0/0/storage\"\"\",\"db,main\",normal\n"
         "\"2/0/1//0/0/default,\"\"5/1/7/20,30/0/0/storage\"\"\",\"db,main\","
         "\"small, \"\"safe\"\"\"\n"},
        {"qyplat -r prof -m alpha --filter lpar_ids=2 -F virtual_scsi_adapters,io_slots", "\"\"\"14/server/4/db,main/3/0\"\",17/server/7/traveller/3/0\",\"30000003/none/1,30000004/none/0\"\n"},
        {"qyplat -r prof -m gamma --filter lpar_ids=7 -F virtual_serial_adapters,io_slots", "\"0/server/1/any//any/1,1/server/1/any//any/1\",none\n"},
        {"qyplat -r lpar -m gamma --filter lpar_ids=7 | cut -d, -f1-3", "lpar_id=7,name=my-test,lpar_env=tmxlinux\n"},
        {"qyplat -r lpar -m alpha --filter lpar_ids=4 | cut -d, -f2,3", "\"name=db,main\"\n"},
        // Filters.
        {"qyplat -r lpar -m alpha --filter lpar_ids=7,2 -F lpar_id", "2\n7\n"},
        {"qyplat -r lpar -m alpha --filter '\"lpar_ids=7,2\"' -F lpar_id", "2\n7\n"},
        {"qyplat -r lpar --filter '\"lpar_names=xbrg,traveller\",lpar_ids=2' -F name", "traveller\n"},
        {"qyplat -r lpar --filter 'lpar_names=db,main' -F lpar_id", "4\n"},
        {"qyplat -r lpar --filter 'lpar_names=xbrg1,db,main,web server' -F lpar_id", "1\n3\n4\n"},
        {"qyplat -r lpar --filter 'lpar_names=\"db,main\",xbrg2' -F lpar_id", "2\n4\n"},
        {"qyplat -r lpar --filter '\"lpar_names=\"\"db,main\"\",xbrg2\"' -F lpar_id", "2\n4\n"},
        {"qyplat -r lpar --filter 'lpar_names=say \"hi\"' -F lpar_id", "5\n"},
        {"qyplat -r lpar --filter 'lpar_names=東京, \"本番\"' -F lpar_id", "3\n"},
        {"qyplat -r lpar --filter lpar_envs=osq00 -F name", "Büro-Prüfstand\nosq dev\n"},
        {"qyplat -r lpar --filter '' -F name | wc -l", "14\n"},
        {"qyplat -r prof --filter 'lpar_ids=4,profile_names=small, \"safe\"' -F desired_mem", "8192\n"},
        {"qyplat -r prof -m gamma --filter lpar_ids=7,profile_names=my-prof -F name", "my-prof\n"},
        {"qyplat -r prof -m gamma --filter lpar_ids=7,profile_names=other -F name", "No results were found.\n"},
        // What is not there.
        {"qyplat -r lpar -m omega", "WRTL8018 The managed system \"omega\" was not found.\n"},
        {"qyplat -r sys -m 1111-AAA", "WRTL8018 The managed system \"1111-AAA\" was not found.\n"},
        {"qyplat -r lpar -m gamma --filter lpar_ids=1,3", "WRTL8011 The partition with the ID 3 was not found.\n"},
        {"qyplat -r prof -m gamma --filter '\"lpar_ids=,1\"'", "WRTL8011 The partition with the ID  was not found.\n"},
        {"qyplat -r lpar --filter 'lpar_names=db,ma in'", "WRTL8010 The partition with the name \"db\" was not found.\n"},
        {"LC_ALL=de_DE.UTF-8 qyplat -r lpar -m omega", "WRTL8018 Das verwaltete System \"omega\" wurde nicht gefunden.\n"},
        {"LC_ALL= LC_MESSAGES= LANG=de qyplat -r lpar -m omega", "WRTL8018 Das verwaltete System \"omega\" wurde nicht gefunden.\n"},
        {"LC_ALL=C LANG=de_DE qyplat -r lpar -m omega", "WRTL8018 The managed system \"omega\" was not found.\n"},
        // What is wrong with the line.
        {"qyplat", "WRTL1003 The option -r is missing.\n"},
        {"qyplat -r frame", "WRTL1004 The option -r cannot have the value \"frame\".\n"},
        {"qyplat -r sys -x", "WRTL1001 The option -x is not known.\n"},
        {"qyplat -r sys --level sys", "WRTL1001 The option --level is not known.\n"},
        {"qyplat -r sys -m", "WRTL1002 The option -m needs a value.\n"},
        {"qyplat -r sys -r lpar", "WRTL1005 The option -r is given more than once.\n"},
        {"qyplat -r sys name", "WRTL1006 The argument \"name\" belongs to no option.\n"},
        {"qyplat -r lpar -F name,nmae", "WRTL1007 The attribute \"nmae\" is not known.\n"},
        {"qyplat -r sys -F lpar_id", "WRTL1007 The attribute \"lpar_id\" is not known.\n"},
        {"qyplat -r sys -F name,", "WRTL1007 The attribute \"\" is not known.\n"},
        {"qyplat -r lpar --filter ids=1", "WRTL1008 The filter \"ids\" is not known.\n"},
        {"qyplat -r lpar --filter lpar_ids=1,ids=1", "WRTL1008 The filter \"ids\" is not known.\n"},
        {"qyplat -r lpar --filter 4", "WRTL1009 The filter \"4\" is not of the form name=value.\n"},
        {"qyplat -r lpar --filter =4", "WRTL1009 The filter \"=4\" is not of the form name=value.\n"},
        {"LC_ALL=de_AT qyplat -r lpar --filter ids=1", "WRTL1008 Der Filter \"ids\" ist nicht bekannt.\n"},
        {"APPLIANCE_HOME= qyplat -r sys", "WRTL2001 The environment variable APPLIANCE_HOME does not name the appliance's folder.\n"},
        {"qyplat -r sys >/dev/full", "WRTL2007 The output cannot be written: No space left on device.\n"},
        {"qyplat -r sys >&-", "WRTL2007 The output cannot be written: Bad file descriptor.\n"},
    });
    // clang-format on
}

TEST_F(QyplatTest, HelpNamesAllThatCanBeAsked) {
    const std::string help = run("APPLIANCE_HOME= qyplat --help").out;
    for (const char* word : {"Usage: qyplat", "-r prof", "--filter", "profile_names",
                             "redundant_err_path_reporting"}) {
        EXPECT_NE(std::string::npos, help.find(word)) << word;
    }
    EXPECT_EQ("qyplat ", run("APPLIANCE_HOME= qyplat --version").out.substr(0, 7));
}

TEST_F(QyplatTest, AReaderThatLeavesIsAFailureAndNoSignal) {
    ASSERT_EQ(0, run("appliance generate --force --hosts 1 --lpars 1500").exit);
    const Outcome outcome =
        run("{ qyplat -r prof -F; echo $? >\"$APPLIANCE_HOME/status\"; } | head -c 1");
    EXPECT_EQ("WRTL2007 The output cannot be written: Broken pipe.\n", outcome.err);
    EXPECT_EQ("4\n", run("cat \"$APPLIANCE_HOME/status\"").out);
}

}  // namespace
