#include "Appliances.h"
#include "Builder.h"

namespace appliance {

namespace {

struct DemoHost {
    HostPlan plan;
    std::vector<LparPlan> lpars;
};

/// What makes one object of the demo different from its like.
struct Particular {
    Kind kind;
    Place place;
    const char* settings;  ///< as for set()
};

std::vector<DemoHost> hosts() {
    return {
        {{"alpha", "1111-AAA", "0000001", "Operating", 131072, 3200, 8192},
         {{1, "xbrg1", "xbrgserver", "Running", 4096, 200, "keep_idle_procs"},
          {2, "xbrg2", "xbrgserver", "Running", 4096, 100, "uncap"},
          {3, "web server", "tmxlinux", "Running", 8192, 150, "uncap", 1, "normal", 1},
          {4, "db,main", "tmxlinux", "Running", 16384, 225, "cap", 2, "normal", 1},
          {5, "say \"hi\"", "tmxlinux", "Suspended", 2048, 50, "uncap", 1},
          {6, "Büro-Prüfstand", "osq00", "Running", 8192, 300, "share_idle_procs"},
          {7, "traveller", "tmxlinux", "Running", 2048, 25, "uncap", 2, "day, night"}}},
        {{"beta lab", "1111-AAB", "0000002", "Standby", 65536, 1600},
         {{1, "xbrg", "xbrgserver", "Not Activated", 4096, 100, "uncap"},
          {2, "traveller", "tmxlinux", "Not Activated", 2048, 25, "uncap", 1, "day, night"},
          {3, "東京, \"本番\"", "tmxlinux", "Not Activated", 4096, 75, "cap", 1},
          {4, "osq dev", "osq00", "Not Activated", 4096, 100, "share_idle_procs_always"}}},
        {{"gamma", "1111-AAC", "0000003", "Power Off", 32768, 800},
         {{1, "xbrg", "xbrgserver", "Not Activated", 2048, 100, "uncap"},
          {2, "linux-a", "tmxlinux", "Not Activated", 1024, 10, "cap", 1},
          {7, "my-test", "tmxlinux", "Not Activated", 1024, 10, "cap", 1, "my-prof"}}},
        {{"delta, spare", "1111-AAD", "0000004", "No Connection", 32768, 800}, {}},
    };
}

constexpr const char* kTravel =
    "migration_state=Migration In Progress;migration_type=active;source_sys_name=alpha;"
    "dest_sys_name=beta lab;source_lpar_id=7;dest_lpar_id=2;source_msp_name=xbrg1;source_msp_id=1;"
    "dest_msp_name=xbrg;dest_msp_id=1;bytes_transmitted=1073741824;bytes_remaining=1073741824";

/// Of partitions, their first profiles and the memory pool.
constexpr Particular kParticulars[] = {
    {Kind::MemPool, {1}, "psp_ids=1,2"},
    {Kind::Lpar, {1, 2}, "auto_start=1"},
    {Kind::Profile, {1, 2}, "auto_start=1"},
    {Kind::Lpar,
     {1, 3},
     "mem_mode=shared;pend_mem_weight=128;pend_io_entitled_mem=256;primary_psp_id=1;"
     "secondary_psp_id=2;refcode=A1000042;refcode_time=11/02/2024 07:30:05;"
     "fru_call_out_loc_codes=U2222.001.0000001-P1-C1;hsl_pool_id=0"},
    {Kind::Profile,
     {1, 3},
     "mem_mode=shared;mem_weight=128;desired_io_entitled_mem=auto;primary_psp_id=1;"
     "secondary_psp_id=2;conn_monitoring=1;hsl_pool_id=0"},
    {Kind::Lpar,
     {1, 4},
     "hsl_pool_id=0;boot_mode=sms;lpar_keylock=manual;desired_lpar_proc_compat_mode=CORAL6+;"
     "curr_lpar_proc_compat_mode=CORAL6+"},
    {Kind::Profile, {1, 4}, "hsl_pool_id=0;boot_mode=sms;lpar_proc_compat_mode=CORAL6+"},
    {Kind::Lpar, {1, 5}, "suspend_capable=1;remote_restart_capable=1;remote_restart_status=Ready"},
    {Kind::Lpar, {1, 6}, "virtual_opti_pool_id=0;power_ctrl_lpar_ids=1,2;work_group_id=1"},
    {Kind::Profile, {1, 6}, "virtual_opti_pool_id=0"},
    // The place that is kept for the traveller holds nothing before it arrives.
    {Kind::Lpar, {1, 7}, kTravel},
    {Kind::Lpar, {2, 2}, kTravel},
    // Never activated: it has no current profile and holds nothing yet.
    {Kind::Lpar,
     {3, 2},
     "resource_config=0;curr_profile=;curr_mem=0;curr_procs=0;curr_proc_units=0.0"},
};

/// One of everything that is rare, on the first host.
constexpr Particular kRarities[] = {
    {Kind::ProcPool, {1, 0, 1}, "name=web, db;max_pool_proc_units=8.00"},
    {Kind::HslPool, {1, 0, 0}, ""},
    {Kind::OptiPool, {1, 0, 0}, ""},
    {Kind::Hca, {1, 4, 1}, "adapter_id=30010001;phys_loc=U2222.001.0000001-P1-C9"},
    {Kind::Hca, {1, 0, 2}, "adapter_id=30010002;phys_loc=U2222.001.0000001-P1-C10"},
    {Kind::Sni, {1, 4, 0}, "adapter_id=30020001;phys_loc=U2222.001.0000001-P1-C11"},
    {Kind::Ethernet,
     {1, 4, 5},
     "port_vlan_id=7;ieee_virtual_eth=1;addl_vlan_ids=20,30;mac_addr=A20001000405;vswitch=storage"},
    {Kind::Serial,
     {1, 4, 6},
     "adapter_type=client;supports_dnx=0;remote_lpar_id=2;remote_slot_num=7;is_required=0"},
    {Kind::Serial,
     {1, 2, 7},
     "supports_dnx=0;remote_lpar_id=4;remote_slot_num=6;connect_status=active;is_required=0"},
};

}  // namespace

void fillDemo(Store& store) {
    std::int64_t number = 0;
    for (const DemoHost& demo : hosts()) {
        HostBuilder host(store, ++number, demo.plan);
        for (const LparPlan& lpar : demo.lpars) {
            host.add(lpar);
        }
        if (number == 1) {
            host.addProfile(4, "small, \"safe\"");
        }
        for (const Particular& rarity : kRarities) {
            if (rarity.place.host == number) {
                set(host.add(rarity.kind, rarity.place), rarity.settings);
            }
        }
        for (const Particular& particular : kParticulars) {
            const Place& place = particular.place;
            if (place.host == number) {
                set(host.first(particular.kind, place.lpar), particular.settings);
            }
        }
        host.finish();
    }
}

}  // namespace appliance
