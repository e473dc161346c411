// The attributes that are not stored, and how each is worked out.

#include <algorithm>
#include <ctime>

#include "Adapters.h"
#include "AttributeIndex.h"
#include "LparState.h"
#include "Text.h"
#include "View.h"

namespace appliance {

namespace {

/// Works out a value; what @p key means is the function's own, mostly the name of an attribute.
using Make = std::string (*)(const Row& row, const char* key);

struct Derived {
    Kinds kinds;
    const char* names;
    Make make;
    const char* key = nullptr;  ///< null: the attribute's own name
};

std::string noneWhenEmpty(const std::string& value) { return value.empty() ? "none" : value; }

std::string constant(const Row&, const char* key) { return key; }

std::string own(const Row& row, const char* key) { return row.self->get(key); }

std::string ownOrNone(const Row& row, const char* key) { return noneWhenEmpty(own(row, key)); }

std::string ofHost(const Row& row, const char* key) { return row.view->host().get(key); }

std::string ofLpar(const Row& row, const char* key) {
    return row.lpar == nullptr ? "null" : row.lpar->get(key);
}

/// The name of the partition whose ID stands in attribute @p key; empty when that is a word.
std::string nameOfId(const Row& row, const char* key) { return row.view->lparName(own(row, key)); }

std::string namesOfIds(const Row& row, const char* key) {
    std::vector<std::string> names;
    for (const std::string& id : split(own(row, key))) {
        std::string name = row.view->lparName(id);
        if (!name.empty()) {
            names.push_back(std::move(name));
        }
    }
    return noneWhenEmpty(joined(names));
}

// Members of a pool: the partitions in whose attribute @p key the pool's number stands.

bool isMember(const Row& row, const Object& lpar, const std::string& key) {
    return lpar.get(key) == std::to_string(row.self->place().number);
}

std::string members(const Row& row, const char* key, const char* attribute) {
    std::vector<std::string> texts;
    for (const Object& lpar : row.view->all(Kind::Lpar)) {
        if (isMember(row, lpar, key)) {
            texts.push_back(lpar.get(attribute));
        }
    }
    return noneWhenEmpty(joined(texts));
}

std::string memberIds(const Row& row, const char* key) { return members(row, key, "lpar_id"); }

std::string memberNames(const Row& row, const char* key) { return members(row, key, "name"); }

// Names, locations, clocks.

std::string hostMtms(const Row& row, const char*) { return row.view->mtms(); }

std::string lparKey(const Row& row, const char*) {
    return std::to_string(row.self->place().lpar) + '*' + row.view->mtms();
}

/// What a partition can change while it runs, as bits: 1 memory, 2 processors, 4 I/O. One that
/// does not run, or is on its way to another host, can change nothing.
std::string dynamicCapabilities(const Row& row, const char*) {
    constexpr std::int64_t kAllOfThem = 1 | 2 | 4;
    const bool changes = own(row, "state") == "Running" && !isMoving(*row.self);
    return "DCaps:<" + hex(changes ? kAllOfThem : 0, 1) + '>';
}

std::string sampleTime(const Row& row, const char*) { return timeText(row.time); }

std::string hostTime(const Row& row, const char* key) {
    if (row.time != 0) {
        return sampleTime(row, key);
    }
    if (ofHost(row, "state") == "No Connection") {
        return "unavailable";
    }
    return timeText(std::time(nullptr));
}

std::string logicalSerial(const Row& row, const char*) {
    return ofHost(row, "serial_num") + hex(row.self->place().lpar, 1);
}

std::string backplane(const Row& row, const char*) { return own(row, "unit_phys_loc") + "-P1"; }

std::string busDrcIndex(const Row& row, const char*) {
    return hex(0x20000000 + row.self->place().number, 8);
}

std::string virtualDrcName(const Row& row, const char*) {
    const Place& place = row.self->place();
    return 'U' + ofHost(row, "type_model") + '.' + ofHost(row, "serial_num") + "-V" +
           std::to_string(place.lpar) + "-C" + std::to_string(place.number);
}

std::string slotConfig(const Row& row, const char*) { return kindName(row.self->kind()); }

// What a host has, and what of it is free. @p key is the attribute of its partitions that counts,
// and begins with "curr" or "pend". A value below zero says that they hold more than there is.

/// "curr_" or "pend_".
std::string when(const char* key) { return {key, 5}; }

template <typename Amount>
std::int64_t sumOfLpars(const Row& row, Amount amount) {
    std::int64_t sum = 0;
    for (const Object& lpar : row.view->all(Kind::Lpar)) {
        sum += amount(lpar);
    }
    return sum;
}

std::int64_t hostNumber(const Row& row, const char* key) { return number(ofHost(row, key)); }

std::int64_t hostUnits(const Row& row, const char* key) { return hundredths(ofHost(row, key)); }

std::int64_t systemMem(const Row& row) {
    return hostNumber(row, "installed_sys_mem") - hostNumber(row, "deconfig_sys_mem");
}

std::int64_t systemUnits(const Row& row) {
    return hostUnits(row, "installed_sys_proc_units") - hostUnits(row, "deconfig_sys_proc_units");
}

std::string configurableMem(const Row& row, const char*) { return std::to_string(systemMem(row)); }

/// Attribute @p key of the host's memory pool, "0" when it has none.
std::string ofMemPool(const Row& row, const char* key) {
    const auto& pools = row.view->all(Kind::MemPool);
    return pools.empty() ? "0" : pools.front().get(key);
}

std::string availableMem(const Row& row, const char* key) {
    // Partitions with shared memory live in the pool, which counts as a whole.
    const std::int64_t dedicated = sumOfLpars(row, [&](const Object& lpar) {
        return lpar.get("mem_mode") == "shared" ? 0 : number(lpar.get(key));
    });
    return std::to_string(systemMem(row) - hostNumber(row, "sys_firmware_mem") - dedicated -
                          number(ofMemPool(row, (when(key) + "pool_mem").c_str())));
}

std::string availablePoolMem(const Row& row, const char* key) {
    const std::int64_t entitled = sumOfLpars(row, [&](const Object& lpar) {
        return lpar.get("mem_mode") == "shared" ? number(lpar.get(key)) : 0;
    });
    return std::to_string(number(own(row, "pend_pool_mem")) -
                          number(own(row, "sys_firmware_pool_mem")) - entitled);
}

/// Least memory of a partition that may grow to row.maxMem; @p key is the least of its environment.
std::string requiredMem(const Row& row, const char* key) {
    // The table by which a partition's memory is found takes 1/64 of the most it may have.
    const std::int64_t region = row.view->memRegion();
    const std::int64_t regions = (row.maxMem / 64 + region - 1) / region;
    return std::to_string(number(key) + regions * region);
}

std::string configurableUnits(const Row& row, const char*) { return units(systemUnits(row)); }

std::string availableUnits(const Row& row, const char* key) {
    std::int64_t free = systemUnits(row);
    free -= sumOfLpars(row, [&](const Object& lpar) { return hundredths(lpar.get(key)); });
    for (const Object& pool : row.view->all(Kind::ProcPool)) {
        free -= hundredths(pool.get(when(key) + "reserved_pool_proc_units"));
    }
    return units(free);
}

/// All that is not dedicated: what pool 0 has.
std::string sharedUnits(const Row& row, const char* key) {
    const std::int64_t dedicated = sumOfLpars(row, [&](const Object& lpar) {
        return lpar.get("curr_proc_mode") == "ded" ? hundredths(lpar.get(key)) : 0;
    });
    return units(systemUnits(row) - dedicated);
}

std::string poolUnits(const Row& row, const char* key) {
    return row.self->place().number == 0 ? sharedUnits(row, key) : own(row, "max_pool_proc_units");
}

std::string availablePoolUnits(const Row& row, const char* key) {
    if (row.self->place().number == 0) {
        return availableUnits(row, key);
    }
    const std::string pool = when(key) + "shared_proc_pool_id";
    const std::int64_t held = sumOfLpars(row, [&](const Object& lpar) {
        return isMember(row, lpar, pool) ? hundredths(lpar.get(key)) : 0;
    });
    return units(hundredths(own(row, "max_pool_proc_units")) - held);
}

/// How many partitions are moving in the way @p key.
std::string migrations(const Row& row, const char* key) {
    return std::to_string(sumOfLpars(row, [&](const Object& lpar) {
        return lpar.get("migration_type") == key && isMoving(lpar);
    }));
}

// Counters of a partition at the time of a sample. They count from midnight, which keeps the
// numbers of a large host within 64 bits.

std::int64_t cycles(const Row& row, std::int64_t units) {
    constexpr std::int64_t kDay = 86'400;
    return row.time % kDay * (hostNumber(row, "proc_cycles_per_second") / 100) * units;
}

std::string elapsedCycles(const Row& row, const char*) { return std::to_string(cycles(row, 100)); }

std::int64_t runningCycles(const Row& row) {
    return cycles(row, hundredths(row.lpar->get("run_proc_units")));
}

std::string entitledCycles(const Row& row, const char*) {
    return std::to_string(runningCycles(row));
}

std::string cappedCycles(const Row& row, const char*) {
    // Between a fifth and four fifths of what the partition may use, the same at every sample.
    return std::to_string(runningCycles(row) / 100 * (20 + row.lpar->place().lpar * 37 % 60));
}

std::string uncappedCycles(const Row& row, const char*) {
    const bool uncapped = row.lpar->get("curr_sharing_mode") == "uncap";
    return std::to_string(uncapped ? runningCycles(row) / 10 : 0);
}

constexpr Kinds kAnyKind = Kinds::all();

constexpr Derived kDerived[] = {
    {kAnyKind, "lpar_id,lpar_env", ofLpar},
    {kAnyKind, "lpar_name", ofLpar, "name"},
    {kAnyKind, "sys_name", ofHost, "name"},
    {kAnyKind, "type_model,serial_num", ofHost},
    {kAnyKind, "type_model_serial_num", hostMtms},
    {kAnyKind, "lpar_key", lparKey},
    {kAnyKind, "sys_time", hostTime},
    {kAnyKind, "time", sampleTime},
    {kAnyKind, "event_type", constant, "sample"},
    {kAnyKind, "curr_7460_wkl_percent", constant, "0.00"},

    {{Kind::Host, Kind::Link}, "resource_type", constant, "sys"},
    {Kind::Host, "configurable_sys_mem", configurableMem},
    {Kind::Host, "curr_avail_sys_mem", availableMem, "curr_mem"},
    {Kind::Host, "pend_avail_sys_mem", availableMem, "pend_mem"},
    {Kind::Host, "required_min_mem_tmx_linux", requiredMem, "256"},
    {Kind::Host, "required_min_mem_osq00", requiredMem, "512"},
    {Kind::Host, "configurable_sys_proc_units", configurableUnits},
    {Kind::Host, "curr_avail_sys_proc_units", availableUnits, "curr_proc_units"},
    {Kind::Host, "pend_avail_sys_proc_units", availableUnits, "pend_proc_units"},
    // The protocol's spelling.
    {Kind::Host, "configurable_pool_proc_uints", sharedUnits, "curr_proc_units"},
    {Kind::Host, "pend_pool_mem", ofMemPool},
    {Kind::Host, "num_active_migrations_in_progress", migrations, "active"},
    {Kind::Host, "num_inactive_migrations_in_progress", migrations, "inactive"},
    {Kind::Host, "remote_lpar_mobility_capable", constant, "1"},
    {Kind::Host, "curr_avail_7460_wkl_percent", constant, "0.00"},
    {Kind::Host, "refcode_num", constant, "0"},

    {Kind::Bus, "backplane_phys_loc,bus_drc_name", backplane},
    {Kind::Bus, "bus_drc_index", busDrcIndex},
    {Kind::Slot, "drc_name", own, "phys_loc"},

    {Kind::ProcPool, "configurable_pool_proc_units", poolUnits, "curr_proc_units"},
    {Kind::ProcPool, "curr_avail_pool_proc_units", availablePoolUnits, "curr_proc_units"},
    {Kind::ProcPool, "pend_avail_pool_proc_units", availablePoolUnits, "pend_proc_units"},
    {Kind::ProcPool, "lpar_names", memberNames, "curr_shared_proc_pool_id"},
    {Kind::ProcPool, "lpar_ids", memberIds, "curr_shared_proc_pool_id"},
    {Kind::MemPool, "pend_avail_pool_mem", availablePoolMem, "pend_io_entitled_mem"},
    {Kind::MemPool, "psp_names", namesOfIds, "psp_ids"},
    {Kind::HslPool, "lpar_names", memberNames, "hsl_pool_id"},
    {Kind::HslPool, "lpar_ids", memberIds, "hsl_pool_id"},
    {Kind::OptiPool, "lpar_names", memberNames, "virtual_opti_pool_id"},
    {Kind::OptiPool, "lpar_ids", memberIds, "virtual_opti_pool_id"},

    {{Kind::Lpar, Kind::Profile}, "primary_psp_name", namesOfIds, "primary_psp_id"},
    {{Kind::Lpar, Kind::Profile}, "secondary_psp_name", namesOfIds, "secondary_psp_id"},
    {Kind::Lpar, "curr_psp_name", namesOfIds, "curr_psp_id"},
    {Kind::Lpar, "resource_type", constant, "lpar"},
    {Kind::Lpar, "logical_serial_num", logicalSerial},
    {Kind::Lpar, "dlpar_capabilities", dynamicCapabilities},
    {Kind::Lpar, "time_cycles", elapsedCycles},
    {Kind::Lpar, "entitled_cycles", entitledCycles},
    {Kind::Lpar, "capped_cycles", cappedCycles},
    {Kind::Lpar, "uncapped_cycles", uncappedCycles},
    {Kind::Lpar, "time_stamp", own, "refcode_time"},
    {Kind::Profile, "virtual_serial_adapters,virtual_scsi_adapters", namedAdapters},

    {{Kind::Ethernet, Kind::VirtualScsi, Kind::Serial}, "config", slotConfig},
    {{Kind::Ethernet, Kind::VirtualScsi, Kind::Serial}, "drc_name", virtualDrcName},
    {Kind::Ethernet, "addl_vlan_ids", ownOrNone},
    {{Kind::VirtualScsi, Kind::Serial}, "remote_lpar_name", nameOfId, "remote_lpar_id"},
};

}  // namespace

std::string valueOf(const Row& row, const std::string& name) {
    static const AttributeIndex<Derived> index(kDerived);
    const Derived* derived = index.find(row.self->kind(), name);
    if (derived == nullptr) {
        return row.self->get(name);
    }
    return derived->make(row, derived->key == nullptr ? name.c_str() : derived->key);
}

}  // namespace appliance
