// What follows from the settings of a profile, and whether they go together.

#include <algorithm>

#include "Adapters.h"
#include "ConfigureRules.h"
#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr const char* kSerialAdapters = "virtual_serial_adapters";
constexpr const char* kUsualWeight = "128";

constexpr const char* kLeastToMost[] = {"min_", "desired_", "max_"};

void requireRise(const Object& profile, const std::string& quantity, std::int64_t least) {
    for (const char* edge : kLeastToMost) {
        const std::int64_t size = hundredths(profile.get(edge + quantity));
        refuseIf(size < least, Fault::OutsideLimits, {edge + quantity});
        least = size;
    }
}

void settleMemory(const HostView& host, const Settings& settings, Object& profile) {
    if (profile.get("mem_mode") == "ded") {
        for (const Setting& setting : settings) {
            const bool isOfPool = setting.name.find("_psp_") != std::string::npos ||
                                  setting.name == "desired_io_entitled_mem";
            refuseIf(isOfPool && !isListed(",none,null", setting.value), Fault::Disagree,
                     {setting.name, "mem_mode"});
        }
        profile.update("mem_weight", "0");
        profile.update("desired_io_entitled_mem", "null");
        profile.update("primary_psp_id", "none");
        profile.update("secondary_psp_id", "none");
        return;
    }
    const auto& pools = host.all(Kind::MemPool);
    refuseIf(pools.empty(), Fault::BadValue, {"mem_mode", "shared"});
    refuseIf(profile.get("proc_mode") == "ded", Fault::Disagree, {"mem_mode", "proc_mode"});
    if (!given(settings, "mem_mode")) {
        return;
    }
    if (profile.get("primary_psp_id") == "none") {
        profile.update("primary_psp_id", split(pools.front().get("psp_ids")).front());
    }
    if (!given(settings, "mem_weight") && profile.get("mem_weight") == "0") {
        profile.set("mem_weight", kUsualWeight);
    }
    if (profile.get("desired_io_entitled_mem") == "null") {
        profile.set("desired_io_entitled_mem", "auto");
    }
}

void settleSharing(const Settings& settings, Object& profile) {
    const bool isDedicated = profile.get("proc_mode") == "ded";
    if (sharesPool(profile.get("sharing_mode")) == isDedicated) {
        refuseIf(given(settings, "sharing_mode").has_value(), Fault::Disagree,
                 {"sharing_mode", "proc_mode"});
        profile.set("sharing_mode", isDedicated ? "share_idle_procs" : "cap");
    }
    if (isDedicated) {
        for (const char* pool : {"shared_proc_pool_id", "shared_proc_pool_name"}) {
            refuseIf(given(settings, pool).value_or("null") != "null", Fault::Disagree,
                     {pool, "proc_mode"});
        }
        profile.update("shared_proc_pool_id", "null");
    } else if (profile.get("shared_proc_pool_id") == "null") {
        profile.set("shared_proc_pool_id", "0");
    }
    // Callers name a weight whatever the mode is; it counts for an uncapped partition alone.
    if (profile.get("sharing_mode") != "uncap") {
        profile.update("uncap_weight", "0");
    } else if (given(settings, "sharing_mode") && !given(settings, "uncap_weight") &&
               profile.get("uncap_weight") == "0") {
        profile.set("uncap_weight", kUsualWeight);
    }
}

void settleProcessors(const HostView& host, const Settings& settings, Object& profile) {
    requireRise(profile, "procs", 100);
    const bool isDedicated = profile.get("proc_mode") == "ded";
    const std::int64_t least = hundredths(host.host().get("min_proc_units_per_virtual_proc"));
    for (const char* edge : kLeastToMost) {
        const std::string procs = std::string(edge) + "procs";
        const std::string unitsName = std::string(edge) + "proc_units";
        const std::int64_t count = number(profile.get(procs));
        if (isDedicated) {
            const std::optional<std::string> wanted = given(settings, unitsName);
            refuseIf(wanted && hundredths(*wanted) != count * 100, Fault::Disagree,
                     {unitsName, procs});
            profile.set(unitsName, units(count * 100));
        } else if (const std::int64_t size = hundredths(profile.get(unitsName));
                   size < count * least || size > count * 100) {
            throw Failure(Fault::OutsideLimits, {unitsName});
        }
    }
    requireRise(profile, "proc_units", 0);
}

void settleSlots(const HostView& host, Object& profile) {
    std::vector<std::string> serial = elementsOf(kSerialAdapters, profile.get(kSerialAdapters));
    for (std::int64_t console = 0; console < 2; ++console) {
        const std::string key = std::to_string(console) + '/';
        const auto isIt = [&](const std::string& e) { return e.rfind(key, 0) == 0; };
        if (std::any_of(serial.begin(), serial.end(), isIt)) {
            continue;
        }
        const auto size = static_cast<std::ptrdiff_t>(serial.size());
        serial.insert(serial.begin() + std::min<std::ptrdiff_t>(console, size),
                      adapterElement(*adapterForm(Kind::Serial), {Kind::Serial, {0, 0, console}}));
    }
    profile.update(kSerialAdapters, adapterList(serial));
    adaptersOf(profile);

    for (const IoSlot& slot : ioSlotsFromList(profile.get("io_slots"))) {
        refuseIf(host.find(Kind::Slot, "drc_index", slot.drcIndex) == nullptr, Fault::SlotNotFound,
                 {slot.drcIndex});
    }
}

}  // namespace

void settle(const HostView& host, const Settings& settings, Object& profile) {
    settleMemory(host, settings, profile);
    settleSharing(settings, profile);
    settleSlots(host, profile);
    if (profile.get("all_resources") == "1") {
        return;
    }
    requireRise(profile, "mem", 100);
    settleProcessors(host, settings, profile);
}

}  // namespace appliance
