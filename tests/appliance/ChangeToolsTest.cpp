// edalloc, edplat, nwplat and dlplat: tools and management library show what they change; what they
// refuse changes nothing.

#include <regex>

#include "ApiAnswer.h"

namespace {

using ChangeToolsTest = DemoTest;

// clang-format off
TEST_F(ChangeToolsTest, ResourcesMove) {
    expectRows({
        // Memory: what a partition has, what its host has left.
        {"qyalloc -r mem --level sys -m alpha -F curr_avail_sys_mem,pend_avail_sys_mem", "83968,83968\n"},
        {"edalloc -r mem -m '1111-AAA*0000001' -o a --id 4 -q 1024"},
        {"edalloc -r mem -m alpha -o r --id 2 -q 256"},
        {"qyalloc -r mem --level lpar -m alpha --filter lpar_ids=2,4 -F pend_mem,curr_mem,run_mem,pend_min_mem,curr_max_mem", "3840,3840,3840,2048,8192\n17408,17408,17408,8192,32768\n"},
        {"qyalloc -r mem --level sys -m alpha -F curr_avail_sys_mem,pend_avail_sys_mem", "83200,83200\n"},
        {"edalloc -r mem -m alpha -o a --id 3 --entitled 7 -q 512"},
        {"edalloc -r mem -m alpha -o s --id 3 -a mem_weight=9"},
        {"qyalloc -r mem --level lpar -m alpha --filter lpar_ids=3 -F curr_mem,run_io_entitled_mem,run_mem_weight", "8704,263,9\n"},
        {"qyalloc -r mempool -m alpha -F pend_avail_pool_mem", "7673\n"},
        // Processors: shared ones by units, dedicated ones whole. What does not run is at rest.
        {"edalloc -r proc -m alpha -o a --id 4 --procs 1 --procunits 0.50"},
        {"edalloc -r proc -m alpha -o r --id 6 --procs 1"},
        {"edalloc -r proc -m 'beta lab' -o a --id 3 --procunits 0.05"},
        {"qyalloc -r proc --level lpar -m alpha --filter lpar_ids=4,6 -F curr_procs,curr_proc_units,run_proc_units", "4,2.75,2.75\n2,2.00,2.00\n"},
        {"qyalloc -r proc --level lpar -m 'beta lab' --filter lpar_ids=3 -F curr_proc_units,run_proc_units", "0.80,0.0\n"},
        {"edalloc -r proc -m alpha -o s --id 4 -a sharing_mode=uncap,uncap_weight=200"},
        {"edalloc -r proc -m alpha -o s --id 2 -a uncap_weight=7"},
        {"edalloc -r proc -m alpha -o s --id 3 -a sharing_mode=cap"},
        {"qyalloc -r proc --level lpar -m alpha --filter lpar_ids=2,3,4 -F curr_sharing_mode,pend_uncap_weight,run_uncap_weight", "uncap,7,7\ncap,0,0\nuncap,200,200\n"},
        // Physical slots.
        {"edalloc -r io --rsubtype slot -o a -m alpha --id 4 -l 30000006 -a '\"slot_io_pool_id=1\"'"},
        {"edalloc -r io  --rsubtype slot -m alpha -o r --id 1 -l 30000002"},
        {"qyalloc -r io --rsubtype slot -m alpha --filter drc_indexes=30000002,30000006 -F lpar_id,slot_io_pool_id", "null,none\n4,1\n"},
        // Virtual adapters: in the first free slot, or in that which is named.
        {"edalloc -r virtualio --rsubtype eth -o a -m alpha --id 3  -a '\"ieee_virtual_eth=1\",\"port_vlan_id=3\",\"addl_vlan_ids=5,7\",\"vswitch=v\"'"},
        {"edalloc -r virtualio --rsubtype eth -o a -m alpha --id 3  -s 8 -a '\"port_vlan_id=3\",\"is_trunk=1\",\"trunk_priority=1\"'"},
        {"qyalloc -r virtualio --rsubtype eth -m alpha --level lpar --filter lpar_ids=3,slots=4,8 -F slot_num,state,ieee_virtual_eth,addl_vlan_ids,trunk_priority,mac_addr", "4,1,1,\"5,7\",0,A20001000304\n8,1,0,none,1,A20001000308\n"},
        {"edalloc -r virtualio --rsubtype scsi -o a -m alpha --id 1 -s 9 -a '\"adapter_type=server\"'"},
        {"edalloc -r virtualio --rsubtype scsi -o a -m alpha --id 4 -a '\"adapter_type=client\",\"remote_lpar_name=xbrg1\",\"remote_slot_num=any\"'"},
        {"edalloc -r virtualio --rsubtype serial -o a -m alpha --id 4 -s 7 -a '\"adapter_type=server\",\"supports_dnx=0\"'"},
        {"qyalloc -r virtualio --rsubtype scsi -m alpha --level lpar --filter slots=4,9 -F lpar_id,slot_num,adapter_type,remote_lpar_name,remote_slot_num", "1,9,server,,any\n4,4,client,xbrg1,9\n"},
        {"xbrgcli -m alpha --id 1 -c mappings -F slot_num,remote_lpar_id 2>/dev/null || xbrgcli -m alpha --id 1 -c mappings | head -1", "9,any,,any,none\n"},
        {"edalloc -r virtualio --rsubtype scsi -m alpha -o r --id 4 -s 4 "},
        {"edalloc -r virtualio --rsubtype scsi -m alpha -o r --id 1 -s 9 "},
        {"edalloc -r virtualio --rsubtype eth -m alpha -o r --id 3 -s 8"},
        {"edalloc -r virtualio --rsubtype serial -m alpha -o r --id 4 -s 7"},
        {"qyalloc -r virtualio --rsubtype slot -m alpha --level slot --filter slots=4,7,8,9 -F lpar_id,slot_num,config", "2,7,serial\n3,4,ethernet\n"},
        {"appliance check"},
        {"appliance journal --json | wc -l", "21\n"},
    });
    const Answer memory(getLparMemoryCfg("", "4*1111-AAA*0000001", 2)), adapters(getLparVirtualEthernet("", "3*1111-AAA*0000001", 2));
    EXPECT_EQ("17408", memory.value(0, "CurAllocMem"));
    EXPECT_EQ("5,7", adapters.value(1, "addl_vlan_ids"));
    EXPECT_EQ("v", adapters.value(1, "vswitch"));
}

#define TAGGED "edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=6\","
#define TAGS "qyplat -r prof -m alpha --filter lpar_ids=6 -F io_slots,load_source_slot,alt_restart_device_slot,console_slot,op_console_slot"

TEST_F(ChangeToolsTest, StoredSettingsChange) {
    expectRows({
        // Hosts.
        {"edplat -r sys -m gamma -i '\"new_name=gamma, 2\",\"power_off_policy=1\",\"service_lpar_name=xbrg\",\"power_on_side=perm\",\"sp_failover_enabled=0\"'"},
        {"qyplat -r sys -m 1111-AAC*0000003 -F name,power_off_policy,service_lpar_id,curr_power_on_side,pend_power_on_side,sp_failover_enabled", "\"gamma, 2\",1,1,temp,perm,0\n"},
        // Partitions.
        {"edplat -r lpar -m alpha -i '\"lpar_id=3\",\"new_name=a,b\"'"},
        {"edplat -r lpar -m alpha -i '\"name=db,main\",\"default_profile=small, \"\"safe\"\"\",\"work_group_id=3\",\"allow_perf_collection=1\"'"},
        {"qyplat -r lpar -m alpha --filter lpar_ids=3,4 -F name,default_profile,curr_profile,work_group_id,allow_perf_collection", "\"a,b\",normal,normal,none,0\n\"db,main\",\"small, \"\"safe\"\"\",normal,3,1\n"},
        // Profiles.
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=3\",\"desired_mem=4352\",\"boot_mode=sms\",\"new_name=day\"'"},
        {"edplat -r prof -m alpha -i '\"name=day\",\"lpar_name=a,b\",\"power_ctrl_lpar_names+=xbrg1,\"\"db,main\"\"\",\"mem_mode=ded\",\"proc_mode=ded\",\"desired_procs=2\"'"},
        {"qyplat -r prof -m alpha --filter lpar_ids=3 -F name,desired_mem,mem_mode,mem_weight,primary_psp_id,proc_mode,sharing_mode,uncap_weight,shared_proc_pool_id,desired_proc_units,max_proc_units,power_ctrl_lpar_ids", "day,4352,ded,0,none,ded,share_idle_procs,0,null,2.00,4.00,\"1,4\"\n"},
        {"edplat -r prof -m alpha -i '\"name=day\",\"lpar_id=3\",\"proc_mode=shared\",\"sharing_mode=uncap\",\"shared_proc_pool_name=web, db\",\"power_ctrl_lpar_ids-=1\",\"mem_mode=shared\"'"},
        {"qyplat -r prof -m alpha --filter lpar_ids=3 -F mem_weight,desired_io_entitled_mem,primary_psp_name,uncap_weight,shared_proc_pool_id,power_ctrl_lpar_ids", "128,auto,xbrg1,128,1,4\n"},
        {"qyplat -r lpar -m alpha --filter lpar_ids=3 -F default_profile,curr_profile", "day,day\n"},
        // Lists: elements as callers write them, and as the tools print them.
        {"edplat -r prof -m alpha -i '\"name=day\",\"lpar_id=3\",\"virtual_eth_adapters+=5/1/7/\"\"20,30\"\"//0,\"\"6/1/1/5,7/2/1/sw\"\"\",\"virtual_scsi_adapters+=7/client/1/xbrg1/20/1\",\"virtual_serial_adapters+=8/server//any//any/0\",\"io_slots+=30000006//1\"'"},
        {"qyplat -r prof -m alpha --filter lpar_ids=3 -F virtual_eth_adapters", "\"2/0/4//0/0/default,\"\"5/1/7/20,30/0/0/default\"\",\"\"6/1/1/5,7/2/1/sw\"\"\"\n"},
        {"qyplat -r prof -m alpha --filter lpar_ids=3 -F virtual_scsi_adapters,virtual_serial_adapters,io_slots", "\"3/client/1/xbrg1/13/1,7/client/1/xbrg1/20/1\",\"0/server/1/any//any/1,1/server/1/any//any/1,8/server/1/any//any/0\",30000006/none/1\n"},
        {"edplat -r prof -m alpha -i '\"name=day\",\"lpar_id=3\",\"virtual_eth_adapters-=\"\"6/1/1/5,7/2/1/sw\"\",2\",\"virtual_serial_adapters-=8/server//any//any/0\",\"io_slots-=30000006//1\",\"virtual_scsi_adapters=none\"'"},
        {"qyplat -r prof -m alpha --filter lpar_ids=3 -F virtual_eth_adapters,virtual_scsi_adapters,virtual_serial_adapters,io_slots", "\"\"\"5/1/7/20,30/0/0/default\"\"\",none,\"0/server/1/any//any/1,1/server/1/any//any/1\",none\n"},
        // Tags beside lists: none takes nothing away.
        {TAGGED "\"io_slots+=30000006//0\",\"load_source_slot+=none\",\"alt_restart_device_slot+=30000006\",\"console_slot+=dnx\",\"op_console_slot+=30000006\"'"},
        {TAGS, "\"30000005/none/1,30000006/none/0\",30000005,30000006,dnx,30000006\n"},
        {TAGGED "\"io_slots-=30000006//0\",\"load_source_slot-=none\",\"alt_restart_device_slot-=30000005\",\"console_slot-=dnx\",\"op_console_slot-=30000006\"'"},
        {TAGS, "30000005/none/1,30000005,30000006,dnx,none\n"},
        {"edplat -r lpar -m alpha -i '\"lpar_id=4\",\"default_profile=normal\"'"},
        {"dlplat -r prof -m alpha --id 4 -n 'small, \"safe\"'"},
        {"qyplat -r prof -m alpha --filter lpar_ids=4 -F name", "normal\n"},
        {"appliance check"},
    });
    const Answer profile(getLparProfile("", "3*1111-AAA*0000001", "day", 2)), host(getCecObj("", "1111-AAC*0000003", 1));
    EXPECT_EQ("3", profile.value(0, "BootMode"));
    EXPECT_EQ("\"5/1/7/20,30/0/0/default\"", profile.value(0, "virtual_eth_adapters"));
    EXPECT_EQ("gamma, 2", host.value(0, "UserDefinedName"));
}


#define NEW "nwplat -r lpar -m gamma -i '\"min_mem=256\",\"desired_mem=512\",\"max_mem=1024\",\"min_procs=1\",\"desired_procs=2\",\"max_procs=4\",\"lpar_env=tmxlinux\","
#define SHARED "\"min_proc_units=0.10\",\"desired_proc_units=1.00\",\"max_proc_units=2.00\","

TEST_F(ChangeToolsTest, PartitionsComeAndGo) {
    expectRows({
        {NEW SHARED "\"name=new, one\",\"profile_name=first\",\"auto_start=1\",\"boot_mode=sms\",\"max_virtual_slots=20\",\"conn_monitoring=1\",\"redundant_err_path_reporting=1\",\"proc_mode=shared\",\"sharing_mode=uncap\",\"uncap_weight=100\",\"lpar_proc_compat_mode=default\",\"virtual_scsi_adapters=3/client/1//12/1\",\"virtual_serial_adapters=4/server//any//any/0\",\"virtual_eth_adapters=2/0/1///0,\"\"5/1/7/20,30//0/vs\"\"\",\"io_slots=30000001//0\",\"lhea_capabilities =0\"'"},
        {NEW "\"name=ded\",\"proc_mode=ded\",\"sharing_mode=share_idle_procs\",\"uncap_weight=3\",\"desired_proc_units=2.00\",\"lpar_avail_priority=1\",\"min_num_huge_pages=0\"'"},
        {"nwplat -r lpar -m gamma -i '\"lpar_id=9\",\"name=all\",\"lpar_env=osq00\",\"all_resources=1\",\"load_source_slot=30000001\",\"console_slot=dnx\"'"},
        {"qyplat -r lpar -m gamma --filter lpar_ids=3,4,9 -F lpar_id,name,lpar_env,state,resource_config,default_profile,curr_profile", "3,\"new, one\",tmxlinux,Not Activated,0,first,\n4,ded,tmxlinux,Not Activated,0,normal,\n9,all,osq00,Not Activated,0,normal,\n"},
        {"qyalloc -r proc --level lpar -m gamma --filter lpar_ids=3,4 -F pend_proc_mode,pend_sharing_mode,pend_uncap_weight,pend_shared_proc_pool_id,pend_procs,curr_proc_units", "shared,uncap,100,0,0,0.0\nded,share_idle_procs,0,null,0,0.0\n"},
        {"qyalloc -r virtualio --rsubtype slot --level lpar -m gamma --filter lpar_ids=3,4 -F curr_max_virtual_slots", "20\n10\n"},
        {"qyplat -r prof -m gamma --filter lpar_ids=3 -F virtual_scsi_adapters,virtual_eth_adapters,io_slots,desired_proc_units,boot_mode,conn_monitoring,auto_start,redundant_err_path_reporting", "3/client/1/xbrg/12/1,\"2/0/1//0/0/default,\"\"5/1/7/20,30/0/0/vs\"\"\",30000001/none/0,1.00,sms,1,1,1\n"},
        {"qyplat -r prof -m gamma --filter lpar_ids=4,9 -F lpar_id,virtual_serial_adapters,min_proc_units,max_proc_units,all_resources,console_slot", "4,\"0/server/1/any//any/1,1/server/1/any//any/1\",1.00,4.00,0,none\n9,\"0/server/1/any//any/1,1/server/1/any//any/1\",0.0,0.0,1,dnx\n"},
        {"qyalloc -r virtualio --rsubtype slot --level slot -m gamma --filter lpar_ids=3", "No results were found.\n"},
        // Others forget the one that goes, and its ID is free again.
        {"edplat -r prof -m gamma -i '\"name=my-prof\",\"lpar_id=7\",\"power_ctrl_lpar_ids=1,3\"'"},
        {"edplat -r sys -m gamma -i '\"service_lpar_id=3\"'"},
        {"dlplat -r lpar -m 1111-AAC*0000003 --id 3"},
        {"qyplat -r prof -m gamma --filter lpar_ids=7 -F power_ctrl_lpar_ids", "1\n"},
        {"qyplat -r sys -m gamma -F service_lpar_id", "none\n"},
        {"dlplat -r lpar -m 'beta lab' --id 4"},
        {"qyalloc -r io --rsubtype slot -m 'beta lab' -F lpar_id | sort | uniq -c | tr -s ' '", " 2 1\n 3 null\n"},
        {NEW SHARED "\"name=next\"'"},
        {"qyplat -r lpar -m gamma -F lpar_id,name", "1,xbrg\n2,linux-a\n3,next\n4,ded\n7,my-test\n9,all\n"},
        {"appliance check"},
    });
    const Answer made(getLparObj("", "4*1111-AAC*0000003", 2)), gone(getLparObj("", "4*1111-AAB*0000002", 1));
    EXPECT_EQ("0,normal", made.value(0, "Default_prof"));
    EXPECT_EQ("null,", made.value(0, "Curr_prof"));
    EXPECT_EQ(API_NOT_FOUND, gone.code());
}

#define PROF "edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=3\","
#define MEM "edalloc -r mem -m alpha "
#define PROC "edalloc -r proc -m alpha "
#define VETH "edalloc -r virtualio --rsubtype eth -m alpha "
#define VSCSI "edalloc -r virtualio --rsubtype scsi -m alpha "
#define IO "edalloc -r io --rsubtype slot -m alpha "

TEST_F(ChangeToolsTest, WhatIsRefusedChangesNothing) {
    expectRefused({
        // The line.
        {"edalloc -r mem -m alpha -o a --id 4", "WRTL1003 The option -q is missing."},
        {"edalloc -r mem -o a --id 4 -q 256", "WRTL1003 The option -m is missing."},
        {"edalloc -r mem -m alpha -o a -q 256", "WRTL1003 The option --id is missing."},
        {"edalloc -r mem -m alpha -o x --id 4", "WRTL1004 The option -o cannot have the value \"x\"."},
        {MEM "-o a --id 4 -q 100", "WRTL1004 The option -q"},
        {PROC "-o a --id 4 --procunits 0.125", "WRTL1004 The option --procunits"},
        {PROC "-o s --id 4 -a ''", "WRTL1003 The option -a"},
        {PROC "-o s --id 4 -a weight=1", "WRTL1007 The attribute \"weight\" is not known."},
        {"edplat -r sys -m alpha", "WRTL1003 The option -i is missing."},
        {PROF "\"boot_mode\"'", "WRTL1012 "},
        {"edplat -r lpar -m alpha -i '\"lpar_id=3\"x'", "WRTL1007 The attribute \"\"lpar_id\" is not known."},
        {PROF "\"boot_mode=sms\",\"boot_mode=of\"'", "WRTL1013 "},
        {PROF "\"desired_mem+=256\"'", "WRTL1015 The attribute desired_mem is no list"},
        {"edplat -r lpar -m alpha -i '\"new_name=x\"'", "WRTL1014 The attribute lpar_id is missing."},
        {"nwplat -r lpar -m gamma -i ''", "WRTL1014 "},
        {NEW "\"name=x\"'", "WRTL1014 The attribute min_proc_units is missing."},
        // What is not there.
        {"edalloc -r mem -m omega -o a --id 4 -q 256", "WRTL8018 "},
        {MEM "-o a --id 8 -q 256", "WRTL8011 The partition with the ID 8 was not found."},
        {"dlplat -r lpar -m alpha --id 8", "WRTL8011 "},
        {"edplat -r lpar -m alpha -i '\"lpar_id=8\"'", "WRTL8011 "},
        {"edplat -r lpar -m alpha -i '\"name=x\"'", "WRTL8010 The partition with the name \"x\" was not found."},
        {"edplat -r prof -m alpha -i '\"name=x\",\"lpar_id=3\"'", "WRTL8031 The partition has no profile with the name \"x\"."},
        {"edplat -r lpar -m alpha -i '\"lpar_id=3\",\"default_profile=x\"'", "WRTL8031 "},
        {"LC_ALL=de edplat -r prof -m alpha -i '\"name=x\",\"lpar_id=3\"'", "WRTL8031 Die Partition hat kein Profil"},
        {IO "-o a --id 4 -l 210", "WRTL8041 "},
        // Names and numbers that are taken, or cannot be.
        {"edplat -r sys -m alpha -i '\"new_name=gamma\"'", "WRTL8032 The name \"gamma\" is taken."},
        {"edplat -r sys -m gamma -i '\"new_name=1111-AAA*0000001\"'", "WRTL8032 "},
        {"edplat -r sys -m alpha -i '\"new_name=x\"'", "WRTL8050 The partition with the ID 7 is moving"},
        {"edplat -r lpar -m alpha -i '\"lpar_id=3\",\"new_name=xbrg1\"'", "WRTL8032 "},
        {"edplat -r lpar -m alpha -i '\"lpar_id=3\",\"new_name=\"'", "WRTL1011 "},
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=4\",\"new_name=small, \"\"safe\"\"\"'", "WRTL8032 "},
        {NEW SHARED "\"name=xbrg\"'", "WRTL8032 "},
        {NEW SHARED "\"name=x\",\"lpar_id=7\"'", "WRTL8033 "},
        {NEW SHARED "\"name=x\",\"lpar_id=1001\"'", "WRTL1011 "},
        {"nwplat -r lpar -m gamma -i '\"name=a\tb\",\"lpar_env=tmxlinux\",\"all_resources=1\"'", "WRTL1011 The attribute name"},
        {"nwplat -r lpar -m gamma -i '\"name=a\",\"lpar_env=other\",\"all_resources=1\"'", "WRTL1011 The attribute lpar_env"},
        // Values that cannot be, or do not go together.
        {PROF "\"desired_mem=100\"'", "WRTL1011 The attribute desired_mem cannot have the value \"100\"."},
        {PROF "\"desired_mem=256\"'", "WRTL8036 The attribute desired_mem would be outside its limits."},
        {PROF "\"min_procs=9\"'", "WRTL8036 "},
        {PROF "\"desired_proc_units=2.50\"'", "WRTL8036 The attribute desired_proc_units"},
        {PROF "\"boot_mode=fast\"'", "WRTL1011 "},
        {PROF "\"lpar_proc_compat_mode=CORAL8\"'", "WRTL1011 "},
        {PROF "\"shared_proc_pool_id=2\"'", "WRTL1011 "},
        {PROF "\"primary_psp_id=4\"'", "WRTL1011 "},
        {PROF "\"sharing_mode=keep_idle_procs\"'", "WRTL8037 The attributes sharing_mode and proc_mode do not go together."},
        {PROF "\"proc_mode=ded\"'", "WRTL8037 The attributes mem_mode and proc_mode"},
        {PROF "\"mem_mode=ded\",\"proc_mode=ded\",\"desired_procs=2\",\"desired_proc_units=1.50\"'", "WRTL8037 "},
        {PROF "\"max_num_huge_pages=1\"'", "WRTL8035 "},
        {"edplat -r prof -m gamma -i '\"name=normal\",\"lpar_id=1\",\"mem_mode=shared\"'", "WRTL1011 "},
        // Lists.
        {PROF "\"virtual_eth_adapters+=2/0/1//0/0\"'", "WRTL8039 The list virtual_eth_adapters has \"2\" already."},
        {PROF "\"virtual_scsi_adapters+=2/server/any//any/0\"'", "WRTL1011 "},
        {PROF "\"virtual_eth_adapters+=10/0/1//0/0\"'", "WRTL1011 The attribute virtual_eth_adapters cannot have the value \"10/0/1//0/0/default\"."},
        {PROF "\"virtual_eth_adapters=4/0/1/\"\"5,6\"\"/0/0\"'", "WRTL1011 "},
        {PROF "\"virtual_eth_adapters=4/0/4095//0/0\"'", "WRTL1011 "},
        {PROF "\"console_slot+=x\"'", "WRTL1011 "},
        {PROF "\"virtual_serial_adapters-=0\"'", "WRTL8046 "},
        {PROF "\"virtual_eth_adapters-=6/0/1//0/0\"'", "WRTL8040 The list virtual_eth_adapters does not have \"6\"."},
        {PROF "\"io_slots=999//1\"'", "WRTL8041 The managed system has no physical slot 999."},
        {PROF "\"io_slots=30000001/1\"'", "WRTL1011 "},
        {PROF "\"power_ctrl_lpar_ids=1,8\"'", "WRTL1011 "},
        // Resources that are not there, or that cannot be given or taken.
        {MEM "-o a --id 4 -q 16640", "WRTL8036 The attribute pend_mem would be outside its limits."},
        {MEM "-o r --id 4 -q 8448", "WRTL8036 "},
        {MEM "-o a --id 4 --entitled 1", "WRTL8037 "},
        {MEM "-o a --id 3 --entitled 7900", "WRTL8038 "},
        {MEM "-o s --id 4 -a mem_weight=1", "WRTL8037 "},
        {PROC "-o a --id 6 --procunits 1.00", "WRTL8037 "},
        {PROC "-o a --id 4 --procunits 1.00", "WRTL8036 The attribute pend_proc_units"},
        {PROC "-o s --id 2 -a uncap_weight=256", "WRTL1011 "},
        {PROC "-o s --id 4 -a uncap_weight=1", "WRTL8037 "},
        {PROC "-o s --id 4 -a sharing_mode=share_idle_procs", "WRTL8037 "},
        {MEM "-o a --id 7 -q 256", "WRTL8050 "},
        {MEM "-o r --id 5 -q 256", "WRTL8049 The partition with the ID 5 cannot do this in the state \"Suspended\"."},
        {"edalloc -r mem -m gamma -o a --id 1 -q 256", "WRTL8048 The managed system \"gamma\" cannot do this in the state \"Power Off\"."},
        {"edplat -r sys -m 'delta, spare' -i '\"new_name=x\"'", "WRTL8048 "},
        {IO "-o a --id 4 -l 30000001", "WRTL8042 The physical slot 30000001 belongs to the partition with the ID 1."},
        {IO "-o r --id 4 -l 30000006", "WRTL8043 "},
        {IO "-o r --id 1 -l 30000001", "WRTL8046 "},
        {VETH "-o a --id 3 -s 2 -a '\"port_vlan_id=1\"'", "WRTL8044 "},
        {VETH "-o a --id 3 -s 10 -a '\"port_vlan_id=1\"'", "WRTL8044 "},
        {VETH "-o a --id 3 -a '\"port_vlan_id=1\",\"addl_vlan_ids=3\"'", "WRTL8037 "},
        {VETH "-o a --id 3", "WRTL1014 The attribute port_vlan_id is missing."},
        {VETH "-o r --id 3 -s 3", "WRTL8045 "},
        {VSCSI "-o a --id 4 -a '\"adapter_type=client\",\"remote_lpar_id=1\",\"remote_slot_num=9\"'", "WRTL8062 "},
        {VSCSI "-o a --id 4 -a '\"adapter_type=client\",\"remote_lpar_id=1\",\"remote_slot_num=13\"'", "WRTL8047 "},
        {VSCSI "-o a --id 4 -a '\"adapter_type=client\"'", "WRTL8062 "},
        {VSCSI "-o r --id 1 -s 13", "WRTL8047 This is in use by the partition with the ID 3."},
        {VSCSI "-o r --id 3 -s 3", "WRTL8046 "},
        // Partitions that are needed, or at work.
        {"dlplat -r lpar -m alpha --id 3", "WRTL8049 "},
        {"dlplat -r lpar -m 'beta lab' --id 1", "WRTL8047 "},
        {"dlplat -r lpar -m 'beta lab' --id 2", "WRTL8050 "},
        {"dlplat -r prof -m alpha --id 3 -n normal", "WRTL8030 "},
        {"dlplat -r prof -m alpha --id 3 -n x", "WRTL8031 "},
        {"dlplat -r prof -m alpha --id 3", "WRTL1003 The option -n is missing."},
    });
}
// clang-format on

TEST_F(ChangeToolsTest, TheJournalTellsWhatChanged) {
    const auto since = std::time(nullptr);
    out("edplat -r lpar -m alpha -i '\"lpar_id=3\",\"new_name=\xff\"'");
    out("edalloc -r io --rsubtype slot -m alpha -o a --id 4 -l 30000006");
    const std::string journal = out("appliance journal --json");
    const std::regex time(R"("time":(\d+),)"), slot(R"(\{"unit_phys_loc":[^}]*"30000006"\})");
    EXPECT_LE(since, std::stoll((*std::sregex_iterator(journal.begin(), journal.end(), time))[1]));
    EXPECT_EQ(
        R"({"number":1,"tool":"edplat","objects":[{"event":"modify","kind":"lpar","host":"1111-AAA*0000001","lpar":3,"number":0,"old":{"name":"web server"},"new":{"name":"�"}}]}
{"number":2,"tool":"edalloc","objects":[{"event":"delete","kind":"slot","host":"1111-AAA*0000001","lpar":0,"number":6,"old":SLOT},{"event":"add","kind":"slot","host":"1111-AAA*0000001","lpar":4,"number":6,"new":SLOT}]}
)",
        std::regex_replace(std::regex_replace(journal, time, ""), slot, "SLOT"));
}

}  // namespace
