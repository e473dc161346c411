// edpower and edsusp: tools and management library show what they change; what they refuse changes
// nothing.

#include "ApiAnswer.h"

namespace {

using PowerToolsTest = DemoTest;

#define BETA " -m 1111-AAB*0000002"
#define LPAR "edpower -r lpar -m gamma "
#define PROF "edplat -r prof -m gamma -i '\"name=normal\",\"lpar_id=2\","
#define STATES "qyplat -r lpar -m gamma -F lpar_id,state"

// clang-format off
TEST_F(PowerToolsTest, PartitionsStartAndStop) {
    expectRows({
        // A host that stands by operates as soon as a partition does.
        {"edpower -r lpar --id 1 -o on -f normal" BETA},
        {"edpower -r lpar --id 3 -o on -b sms -f normal" BETA},
        {"qyplat -r sys -F state" BETA, "Operating\n"},
        {"qyplat -r lpar --filter lpar_ids=1,3 -F state,os_version,curr_profile,boot_mode,curr_lpar_proc_compat_mode" BETA, "Running,XBRG 2.1,normal,norm,CORAL7\nRunning,Linux 5.14,normal,sms,CORAL7\n"},
        {"qyalloc -r mem --level lpar --filter lpar_ids=3 -F pend_mem,curr_mem,run_mem,run_min_mem" BETA, "4096,4096,4096,2048\n"},
        {"qyalloc -r virtualio --rsubtype eth --level lpar --filter lpar_ids=1,3 -F state,mac_addr" BETA, "1,A20002000102\n1,A20002000302\n"},
        {"appliance journal --json | wc -l", "2\n"},
        {"edpower -r lpar --id 3 -o shutdown --immed  --restart " BETA},
        {"edpower -r lpar --id 3 -o dumprestart" BETA},
        {"qyplat -r lpar --filter lpar_ids=3 -F state,boot_mode" BETA, "Running,sms\n"},
        {"edpower -r lpar --id 3 -o osshutdown" BETA},
        {"edpower -r lpar -o chkey -k manual --id 3" BETA},
        {"qyplat -r lpar --filter lpar_ids=3 -F state,lpar_keylock" BETA, "Not Activated,manual\n"},
        {"qyalloc -r mem --level lpar --filter lpar_ids=3 -F pend_mem,curr_mem,run_mem,run_min_mem" BETA, "4096,4096,0,0\n"},
        {"qyalloc -r proc --level lpar --filter lpar_ids=3 -F curr_procs,run_procs,run_proc_units" BETA, "1,0,0.0\n"},
        {"appliance check"},
    });
    const Answer runs(getLparObj("", "1*1111-AAB*0000002", 2)), rests(getLparObj("", "3*1111-AAB*0000002", 2)), host(getCecObj("", "1111-AAB*0000002", 1));
    EXPECT_EQ("2", runs.value(0, "PartitionState"));
    EXPECT_EQ("0", rests.value(0, "PartitionState"));
    EXPECT_EQ("2", rests.value(0, "Keylock"));
    EXPECT_EQ("1", host.value(0, "State"));
}

TEST_F(PowerToolsTest, AProfileGetsWhatIsLeft) {
    expectRows({
        {"edpower -r sys -o on -m gamma"},
        {PROF "\"max_mem=65536\",\"desired_mem=32768\",\"desired_procs=80\",\"max_procs=80\",\"desired_proc_units=60.00\",\"max_proc_units=64.00\"'"},
        {LPAR "--id 2 -o on -f normal"},
        {"qyalloc -r mem --level lpar -m gamma --filter lpar_ids=2 -F pend_min_mem,pend_mem,curr_mem,run_mem,curr_max_mem", "512,27648,27648,27648,65536\n"},
        {"qyalloc -r proc --level lpar -m gamma --filter lpar_ids=2 -F pend_procs,curr_proc_units,run_proc_units", "80,6.90,6.90\n"},
        {"qyalloc -r proc --level sys -m gamma -F curr_avail_sys_proc_units,pend_avail_sys_proc_units", "0.0,0.0\n"},
        // Now that nothing is left, others start with no more than they hold.
        {LPAR "--id 7 -o on -f my-prof"},
        {LPAR "--id 7 -o shutdown"},
        {"edplat -r prof -m gamma -i '\"name=my-prof\",\"lpar_id=7\",\"min_mem=1280\",\"desired_mem=1280\"'"},
        {LPAR "--id 7 -o on -f my-prof", "WRTL8038 The managed system has not enough left: pend_avail_sys_mem is 1024.\n"},
        {LPAR "--id 2 -o shutdown"},
        {PROF "\"desired_mem=1024\",\"proc_mode=ded\",\"sharing_mode=share_idle_procs\",\"min_procs=2\",\"desired_procs=4\",\"boot_mode=of\",\"io_slots=30000003//1\"'"},
        {LPAR "--id 2 -o on"},
        {LPAR "--id 7 -o on"},
        {"qyalloc -r proc --level lpar -m gamma --filter lpar_ids=2 -F curr_proc_mode,curr_shared_proc_pool_id,curr_procs,curr_min_proc_units,curr_proc_units,curr_max_proc_units", "ded,null,4,2.00,4.00,80.00\n"},
        {"qyalloc -r io --rsubtype slot -m gamma --filter drc_indexes=30000003 -F lpar_id", "2\n"},
        {STATES ",curr_profile", "1,Not Activated,normal\n2,Open Firmware,normal\n7,Running,my-prof\n"},
        // Nothing runs that could end itself or write a dump.
        {LPAR "--id 2 -o osshutdown", "WRTL8049 The partition with the ID 2 cannot do this in the state \"Open Firmware\".\n"},
        {LPAR "--id 2 -o dumprestart", "WRTL8049 The partition with the ID 2 cannot do this in the state \"Open Firmware\".\n"},
        {LPAR "--id 2 -o shutdown --immed --restart"},
        {STATES " --filter lpar_ids=2", "2,Running\n"},
        {LPAR "--id 2 -o shutdown --immed"},
        {PROF "\"io_slots=none\"'"},
        {LPAR "--id 2 -o on -f normal"},
        {"qyalloc -r io --rsubtype slot -m gamma --filter drc_indexes=30000003 -F lpar_id", "null\n"},
        // A partition that is to have everything.
        {"nwplat -r lpar -m gamma -i '\"name=all\",\"lpar_env=tmxlinux\",\"all_resources=1\"'"},
        {LPAR "--id 3 -o on -f normal"},
        {"qyalloc -r mem --level lpar -m gamma --filter lpar_ids=3 -F curr_mem,curr_max_mem", "26368,26368\n"},
        {"qyalloc -r proc --level lpar -m gamma --filter lpar_ids=3 -F curr_procs,curr_proc_units", "3,2.90\n"},
        {"appliance check"},
    });
}

TEST_F(PowerToolsTest, WhatStartsTogetherSharesWhatIsLeft) {
    expectRows({
        {"edpower -r sys -o on -m gamma"},
        {PROF "\"max_mem=65536\",\"desired_mem=20480\",\"max_proc_units=8.00\",\"desired_proc_units=5.00\",\"max_procs=8\",\"desired_procs=5\"'"},
        {"edplat -r prof -m gamma -i '\"name=my-prof\",\"lpar_id=7\",\"max_mem=65536\",\"desired_mem=20480\",\"max_proc_units=8.00\",\"desired_proc_units=5.00\",\"max_procs=8\",\"desired_procs=5\"'"},
        {"edpower -r sysprof -n all -o on -m gamma"},
        {"qyalloc -r mem --level lpar -m gamma -F lpar_id,curr_mem", "1,2048\n2,20480\n7,8192\n"},
        {"qyalloc -r proc --level lpar -m gamma -F lpar_id,curr_proc_units", "1,1.00\n2,5.00\n7,2.00\n"},
    });
}

TEST_F(PowerToolsTest, AdaptersAreThoseOfTheProfile) {
    expectRows({
        {"edpower -r lpar --id 2 -o shutdown -m alpha"},
        {"edpower -r lpar --id 4 -o shutdown -m alpha"},
        // The server for partition 4 stays though the profile has it no more; that of slot 7 goes with its client.
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=2\",\"virtual_scsi_adapters=9/server/any//any/0\",\"virtual_serial_adapters-=7\",\"virtual_eth_adapters+=6/0/5//0/0/vs\"'"},
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=4\",\"virtual_serial_adapters-=6\",\"virtual_scsi_adapters+=8/client/2//9/0\"'"},
        {"edpower -r lpar --id 4 -o on -f normal -m alpha", "WRTL8062 No server adapter is free for the client adapter in the virtual slot 8.\n"},
        {"edpower -r lpar --id 2 -o on -f normal -m alpha"},
        {"edpower -r lpar --id 4 -o on -f normal -m alpha"},
        // A server for anyone serves one.
        {"edpower -r lpar --id 3 -o shutdown -m alpha"},
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=3\",\"virtual_scsi_adapters+=8/client/2//9/0\"'"},
        {"edpower -r lpar --id 3 -o on -f normal -m alpha", "WRTL8062 No server adapter is free for the client adapter in the virtual slot 8.\n"},
        // A client for any server finds the one that is free, and the same again.
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=3\",\"virtual_scsi_adapters-=8\"'"},
        {"edplat -r prof -m alpha -i '\"name=normal\",\"lpar_id=3\",\"virtual_scsi_adapters+=8/client/any//any/0,9/client/1//any/0\"'"},
        {"edpower -r lpar --id 3 -o on -f normal -m alpha", "WRTL8062 No server adapter is free for the client adapter in the virtual slot 8.\n"},
        {"edalloc -r virtualio --rsubtype scsi -o a -m alpha --id 1 -s 8 -a '\"adapter_type=server\"'"},
        {"edalloc -r virtualio --rsubtype scsi -o a -m alpha --id 1 -s 9 -a '\"adapter_type=server\"'"},
        {"edpower -r lpar --id 3 -o on -f normal -m alpha"},
        {"edalloc -r virtualio --rsubtype scsi -o a -m alpha --id 1 -s 7 -a '\"adapter_type=server\"'"},
        {"edpower -r lpar --id 3 -o shutdown -m alpha"},
        {"edpower -r lpar --id 3 -o on -f normal -m alpha"},
        {"qyalloc -r virtualio --rsubtype scsi --level lpar -m alpha --filter lpar_ids=3,slots=8,9 -F slot_num,remote_lpar_id,remote_slot_num", "8,1,8\n9,1,9\n"},
        {"qyplat -r prof -m alpha --filter lpar_ids=3 -F virtual_scsi_adapters", "\"3/client/1/xbrg1/13/1,8/client/any//any/0,9/client/1/xbrg1/any/0\"\n"},
        {"qyalloc -r virtualio --rsubtype scsi --level lpar -m alpha --filter lpar_ids=2,4 -F lpar_id,slot_num,adapter_type,remote_lpar_id,remote_slot_num,backing_devices", "2,9,server,any,any,none\n2,14,server,4,3,disk4\n2,17,server,7,3,disk7\n4,3,client,2,14,none\n4,8,client,2,9,none\n"},
        {"qyalloc -r virtualio --rsubtype slot --level slot -m alpha --filter lpar_ids=4,slots=5,6 -F lpar_id,slot_num,config", "4,5,ethernet\n"},
        {"qyalloc -r virtualio --rsubtype eth --level lpar -m alpha --filter lpar_ids=2,slots=2,6 -F mac_addr,addl_vlan_ids", "A20001000202,\"10,20,30\"\nA20001000206,none\n"},
        {"appliance check"},
    });
}

TEST_F(PowerToolsTest, HostsAndSystemProfiles) {
    expectRows({
        {"edpower -r sys -o onstandby -m gamma"},
        {"edpower -r sys -o rebuild -m gamma"},
        {"edpower -r sysprof -n all --test  -m gamma"},
        {"qyplat -r sys -m gamma -F state", "Standby\n"},
        {"edpower -r sysprof -n all -o on  --continue  -m gamma"},
        {"qyplat -r sys -m gamma -F state", "Operating\n"},
        {STATES, "1,Running\n2,Running\n7,Running\n"},
        {"edpower -r sys -o off --immed -m gamma"},
        {STATES, "1,Not Activated\n2,Not Activated\n7,Not Activated\n"},
        {"appliance journal --json | wc -l", "3\n"},
        // Partitions that start by themselves, as far as they can; what was pending takes effect.
        {PROF "\"auto_start=1\"'"},
        {"edplat -r prof -m gamma -i '\"name=my-prof\",\"lpar_id=7\",\"auto_start=1\"'"},
        {"edpower -r sys -o onsysprof -f all -m gamma"},
        {PROF "\"io_slots=30000001//1\"'"},
        {"edplat -r sys -m gamma -i '\"power_on_side=perm\"'"},
        {"edpower -r sys -o off --immed --restart -m gamma"},
        {"qyplat -r sys -m gamma -F state,curr_power_on_side", "Operating,perm\n"},
        {STATES, "1,Not Activated\n2,Not Activated\n7,Running\n"},
        {LPAR "--id 7 -o shutdown"},
        {"edpower -r sys -o off -m gamma"},
        {"edpower -r sys -o on -m gamma"},
        {STATES, "1,Not Activated\n2,Not Activated\n7,Running\n"},
        // One that cannot start is passed over, or keeps all from it.
        {"edpower -r sysprof -n all -o on -m gamma", "WRTL8042 The physical slot 30000001 belongs to the partition with the ID 1.\n"},
        {STATES, "1,Not Activated\n2,Not Activated\n7,Running\n"},
        {"edpower -r sysprof -n all -o on --continue -m gamma"},
        {STATES, "1,Running\n2,Not Activated\n7,Running\n"},
        {"appliance check"},
    });
}

TEST_F(PowerToolsTest, SuspensionKeepsWhatAPartitionHolds) {
    const char* const mine = "qyalloc -r mem --level lpar -m alpha --filter lpar_ids=5 -F curr_mem,run_mem; qyplat -r lpar -m alpha --filter lpar_ids=5 -F state";
    expectRows({
        {mine, "2048,0\nSuspended\n"},
        {"edsusp  -o resume -m alpha --id 5"},
        {mine, "2048,2048\nRunning\n"},
        {"edsusp  -o validate -t suspend  -m alpha --id 5"},
        {"edsusp  -o suspend -m alpha --id 5"},
        {mine, "2048,0\nSuspended\n"},
        {"edsusp  -o shutdown -t suspend  -m alpha --id 5"},
        {mine, "2048,0\nNot Activated\n"},
        {"appliance check; appliance journal --json | wc -l", "3\n"},
    });
}

TEST_F(PowerToolsTest, WhatIsRefusedChangesNothing) {
    expectRefused({
        {"edpower -r lpar --id 1 -o on -f normal -m gamma", "WRTL8048"},
        {"edpower -r lpar --id 1 -o on -f normal -m alpha", "WRTL8049"},
        {"edpower -r lpar --id 5 -o on -f normal -m alpha", "WRTL8049"},
        {"edpower -r lpar --id 1 -o on -f none" BETA, "WRTL8031"},
        {"edpower -r lpar --id 99 -o on -f normal" BETA, "WRTL8011"},
        {"edpower -r lpar --id 2 -o on -f 'day, night'" BETA, "WRTL8050"},
        {"edpower -r lpar --id 1 -o on -f normal -m nowhere", "WRTL8018"},
        {"edpower -r lpar --id 1 -o on -f P Q" BETA, "WRTL1006"},
        {"edpower -r lpar --id 1 -o on -b fast -f normal" BETA, "WRTL1004"},
        {"edpower -r lpar -o on -f normal" BETA, "WRTL1003"},
        {"edpower -r lpar --id 1 -o start" BETA, "WRTL1004"},
        {"edpower -r lpar --id 1 -o shutdown" BETA, "WRTL8048"},
        {"edpower -r lpar --id 5 -o shutdown -m alpha", "WRTL8049"},
        {"edpower -r lpar --id 5 -o osshutdown -m alpha", "WRTL8049"},
        {"edpower -r lpar --id 7 -o shutdown --immed -m alpha", "WRTL8050"},
        {"edpower -r lpar --id 1 -o shutdown -m alpha", "WRTL8047"},  // partition 7 moves through it
        {"edpower -r lpar -o chkey -k auto --id 3 -m alpha", "WRTL1004"},
        {"edpower -r lpar -o chkey --id 3 -m alpha", "WRTL1003"},
        {"edpower -r sys -o on -m alpha", "WRTL8048"},
        {"edpower -r sys -o onstandby" BETA, "WRTL8048"},
        {"edpower -r sys -o onsysprof -m gamma", "WRTL1003"},
        {"edpower -r sys -o onsysprof -f none -m gamma", "WRTL8060"},
        {"edpower -r sys -o off -m gamma", "WRTL8048"},
        {"edpower -r sys -o off --immed -m alpha", "WRTL8050"},
        {"edpower -r sys -o off --restart -m alpha", "WRTL1003"},
        {"edpower -r sys -o rebuild -m 'delta, spare'", "WRTL8048"},
        {"edpower -r sysprof -n all -o on -m gamma", "WRTL8048"},
        {"edpower -r sysprof -n none --test  -m alpha", "WRTL8060"},
        {"edpower -r sysprof -n all --test  -o on -m alpha", "WRTL1004"},
        {"edpower -r sysprof -n all --test" BETA, "WRTL8050"},
        {"edsusp -o suspend -m alpha --id 3", "WRTL8064"},
        {"edsusp -o suspend -m alpha --id 5", "WRTL8049"},
        {"edsusp -o suspend -m alpha --id 7", "WRTL8050"},
        {"edsusp -o resume -m alpha --id 3", "WRTL8049"},
        {"edsusp -o validate -m alpha --id 3", "WRTL1003"},
        {"edsusp -o validate -t resume -m alpha --id 3", "WRTL1004"},
        {"edsusp -o cancel -t suspend -m alpha --id 5", "WRTL8065"},
        {"edsusp -o recover -t suspend -m alpha --id 5", "WRTL8065"},
        {"edsusp -o shutdown -t suspend -m alpha --id 3", "WRTL8049"},
    });
    // clang-format on
    const auto active = m_appliance.run(
        "domove -o s -m alpha --id 7; "
        "edpower -r sys -o off -m alpha");
    EXPECT_EQ("WRTL8063 Partitions are active on the managed system; --immed ends them.\n",
              active.err);
}

}  // namespace
