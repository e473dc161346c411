#include "ConfigureRules.h"

#include <algorithm>
#include <set>

#include "Adapters.h"
#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

using Value = std::optional<std::string>;

constexpr const char* kNone = "none";

bool isNone(const std::string& value) { return value.empty() || value == kNone; }

// Rules for single values.

/// One of the words of @p argument.
Value words(const HostView&, const std::string& value, const char* argument) {
    const std::vector<std::string> all = split(argument);
    return std::find(all.begin(), all.end(), value) == all.end() ? Value() : value;
}

/// A number within the first two of @p argument, or the word behind them.
Value numberIn(const HostView&, const std::string& value, const char* argument) {
    const std::vector<std::string> limits = split(argument);
    if (limits.size() > 2 && value == limits[2]) return value;
    std::int64_t found = 0;
    if (!wholeNumber(value, &found) || found < number(limits[0]) || found > number(limits[1])) {
        return std::nullopt;
    }
    return std::to_string(found);
}

Value memory(const HostView& host, const std::string& value, const char*) {
    constexpr std::int64_t kMost = 1LL << 40;
    std::int64_t found = 0;
    const std::int64_t region = number(host.host().get("mem_region_size"));
    if (!wholeNumber(value, &found) || found > kMost || found % region != 0) return std::nullopt;
    return std::to_string(found);
}

Value procUnits(const HostView&, const std::string& value, const char*) {
    std::int64_t size = 0;
    return wholeUnits(value, &size) ? units(size) : Value();
}

Value printable(const HostView&, const std::string& value, const char*) {
    return isPrintable(value) ? value : Value();
}

Value compatMode(const HostView& host, const std::string& value, const char*) {
    return words(host, value, host.host().get("lpar_proc_compat_modes").c_str());
}

/// For what no host has: nothing of it is all that can be asked for.
Value nothing(const HostView& host, const std::string& value, const char*) {
    return value.empty() ? value : words(host, value, "0,0.0,0.00,none,null");
}

template <Kind kind>
Value poolId(const HostView& host, const std::string& value, const char* argument) {
    if (value == argument) return value;
    for (const Object& pool : host.all(kind)) {
        if (value == std::to_string(pool.place().number)) return value;
    }
    return std::nullopt;
}

Value procPoolNamed(const HostView& host, const std::string& value, const char*) {
    for (const Object& pool : host.all(Kind::ProcPool)) {
        if (pool.get("name") == value) return std::to_string(pool.place().number);
    }
    return std::nullopt;
}

/// The ID of a partition, of the environment @p argument unless that is empty.
Value lparId(const HostView& host, const std::string& value, const char* argument) {
    if (isNone(value)) return kNone;
    std::int64_t id = 0;
    const Object* lpar = wholeNumber(value, &id) ? host.lpar(id) : nullptr;
    if (lpar == nullptr || (*argument != '\0' && lpar->get("lpar_env") != argument)) {
        return std::nullopt;
    }
    return std::to_string(id);
}

Value lparNamed(const HostView& host, const std::string& value, const char* argument) {
    if (isNone(value)) return kNone;
    const Object* lpar = host.lparNamed(value);
    return lpar == nullptr ? Value() : lparId(host, lpar->get("lpar_id"), argument);
}

/// A physical slot by its DRC index, a virtual slot by its number, or the word @p argument.
Value taggedSlot(const HostView& host, const std::string& value, const char* argument) {
    if (isNone(value)) return kNone;
    if (value == argument) return value;
    for (const Object& slot : host.all(Kind::Slot)) {
        if (slot.get("drc_index") == value) return value;
    }
    return adapterValue("slot_num", value);
}

// Rules for lists.

template <Rule rule>
Value eachOf(const HostView& host, const std::string& list, const char* argument) {
    if (isNone(list)) return kNone;
    std::vector<std::string> elements;
    for (const std::string& element : split(list)) {
        const Value value = rule(host, element, argument);
        if (!value || *value == kNone) return std::nullopt;
        elements.push_back(*value);
    }
    return joined(elements);
}

Value hca(const HostView& host, const std::string& value, const char*) {
    const std::string id = value.substr(0, value.find('/'));
    for (const Object& adapter : host.all(Kind::Hca)) {
        if (adapter.get("adapter_id") == id) return value;
    }
    return std::nullopt;
}

Value adapters(const HostView&, const std::string& list, const char* argument) {
    std::vector<std::string> elements;
    for (const AdapterForm& form : kAdapterForms) {
        if (std::string(argument) != form.list) continue;
        for (const std::string& element : elementsOf(argument, list)) {
            elements.push_back(adapterElement(form, adapterFromElement(form, {}, element)));
        }
    }
    return adapterList(elements);
}

Value ioSlots(const HostView&, const std::string& list, const char*) {
    std::vector<std::string> elements;
    for (const IoSlot& slot : ioSlotsFromList(list)) elements.push_back(ioSlotElement(slot));
    return adapterList(elements);
}

constexpr const char* kConsoles = "virtual_serial_adapters";  ///< in its slots 0 and 1

/// What tells the elements of a list apart: the slot, the DRC index, the whole ID.
std::string keyOf(const std::string& element) { return element.substr(0, element.find('/')); }

/// @p list with the elements of @p changes added or removed.
std::string merged(const char* key, Setting::Operator op, const std::string& list,
                   const std::string& changes) {
    std::vector<std::string> elements = elementsOf(key, list);
    std::set<std::string> keys;
    for (const std::string& element : elements) keys.insert(keyOf(element));
    for (const std::string& element : elementsOf(key, changes)) {
        const std::string changed = keyOf(element);
        if (op != Setting::Operator::Remove) {
            if (!keys.insert(changed).second) throw Failure(Fault::ElementThere, {key, changed});
            elements.push_back(element);
        } else if (keys.erase(changed) == 0) {
            throw Failure(Fault::ElementMissing, {key, changed});
        } else if (std::string(key) == kConsoles && (changed == "0" || changed == "1")) {
            throw Failure(Fault::Required, {changed});
        }
    }
    const auto isGone = [&](const std::string& e) { return keys.count(keyOf(e)) == 0; };
    elements.erase(std::remove_if(elements.begin(), elements.end(), isGone), elements.end());
    return adapterList(elements);
}

const AttributeRule& ruleFor(const AttributeRules& rules, const std::string& name) {
    return *std::find_if(rules.begin(), rules.end(),
                         [&](const AttributeRule& rule) { return name == rule.name; });
}

constexpr const char* kFlag = "0,1";
constexpr const char* kIoServer = "xbrgserver";

}  // namespace

const AttributeRules& hostRules() {
    // What the next start takes up is pending until then.
    static const AttributeRules rules = {
        {"new_name", "name", printable},
        {"power_off_policy", "power_off_policy", words, kFlag},
        {"service_lpar_id", "service_lpar_id", lparId},
        {"service_lpar_name", "service_lpar_id", lparNamed},
        {"power_on_option", "pend_power_on_option", words, "standby,autostart"},
        {"power_on_side", "pend_power_on_side", words, "temp,perm"},
        {"power_on_speed", "pend_power_on_speed", words, "fast,slow"},
        {"power_on_speed_override", "pend_power_on_speed_override", words, "none,fast,slow"},
        {"sp_failover_enabled", "sp_failover_enabled", words, kFlag},
    };
    return rules;
}

const AttributeRules& lparRules() {
    static const AttributeRules rules = {
        {"new_name", "name", printable},
        {"work_group_id", "work_group_id", numberIn, "1,32,none"},
        {"default_profile", "default_profile", printable},
        {"ipl_source", "ipl_source", words, "a,b,c,d"},
        {"allow_perf_collection", "allow_perf_collection", words, kFlag},
        {"lpar_avail_priority", "lpar_avail_priority", numberIn, "0,255"},
        {"electronic_err_reporting", "electronic_err_reporting", words, kFlag},
    };
    return rules;
}

// NOLINTNEXTLINE(readability-function-size): one table
const AttributeRules& profileRules() {
    static const AttributeRules rules = {
        {"min_mem", "min_mem", memory},
        {"desired_mem", "desired_mem", memory},
        {"max_mem", "max_mem", memory},
        {"mem_mode", "mem_mode", words, "ded,shared"},
        {"mem_weight", "mem_weight", numberIn, "0,255"},
        {"desired_io_entitled_mem", "desired_io_entitled_mem", numberIn, "0,1073741824,auto"},
        {"primary_psp_id", "primary_psp_id", lparId, kIoServer},
        {"primary_psp_name", "primary_psp_id", lparNamed, kIoServer},
        {"secondary_psp_id", "secondary_psp_id", lparId, kIoServer},
        {"secondary_psp_name", "secondary_psp_id", lparNamed, kIoServer},
        {"min_procs", "min_procs", numberIn, "1,1000000"},
        {"desired_procs", "desired_procs", numberIn, "1,1000000"},
        {"max_procs", "max_procs", numberIn, "1,1000000"},
        {"min_proc_units", "min_proc_units", procUnits},
        {"desired_proc_units", "desired_proc_units", procUnits},
        {"max_proc_units", "max_proc_units", procUnits},
        {"proc_mode", "proc_mode", words, "ded,shared"},
        {"sharing_mode", "sharing_mode", words,
         "cap,uncap,keep_idle_procs,share_idle_procs,share_idle_procs_active,"
         "share_idle_procs_always"},
        {"uncap_weight", "uncap_weight", numberIn, "0,255"},
        {"lpar_proc_compat_mode", "lpar_proc_compat_mode", compatMode},
        {"shared_proc_pool_id", "shared_proc_pool_id", poolId<Kind::ProcPool>, "null"},
        {"shared_proc_pool_name", "shared_proc_pool_id", procPoolNamed},
        {"boot_mode", "boot_mode", words, "norm,dd,ds,of,sms"},
        {"auto_start", "auto_start", words, kFlag},
        {"max_virtual_slots", "max_virtual_slots", numberIn, "2,65534"},
        {"virtual_eth_adapters", "virtual_eth_adapters", adapters, "virtual_eth_adapters", true},
        {"virtual_scsi_adapters", "virtual_scsi_adapters", adapters, "virtual_scsi_adapters", true},
        {"virtual_serial_adapters", kConsoles, adapters, kConsoles, true},
        {"io_slots", "io_slots", ioSlots, "", true},
        {"load_source_slot", "load_source_slot", taggedSlot},
        {"alt_restart_device_slot", "alt_restart_device_slot", taggedSlot},
        {"console_slot", "console_slot", taggedSlot, "dnx"},
        {"alt_console_slot", "alt_console_slot", taggedSlot},
        {"op_console_slot", "op_console_slot", taggedSlot},
        {"lpar_io_pool_ids", "lpar_io_pool_ids", eachOf<numberIn>, "0,254", true},
        {"conn_monitoring", "conn_monitoring", words, kFlag},
        {"virtual_opti_pool_id", "virtual_opti_pool_id", poolId<Kind::OptiPool>, kNone},
        {"hsl_pool_id", "hsl_pool_id", poolId<Kind::HslPool>, kNone},
        {"power_ctrl_lpar_ids", "power_ctrl_lpar_ids", eachOf<lparId>, "", true},
        {"power_ctrl_lpar_names", "power_ctrl_lpar_ids", eachOf<lparNamed>, "", true},
        {"hca_adapters", "hca_adapters", eachOf<hca>, "", true},
        {"work_group_id", "work_group_id", numberIn, "1,32,none"},
        {"redundant_err_path_reporting", "redundant_err_path_reporting", words, kFlag},
        {"electronic_err_reporting", "electronic_err_reporting", words, kFlag},
        {"min_num_huge_pages", nullptr, nothing},
        {"desired_num_huge_pages", nullptr, nothing},
        {"max_num_huge_pages", nullptr, nothing},
        {"bsr_arrays", nullptr, nothing},
        {"min_7460_wkl_percent", nullptr, nothing},
        {"desired_7460_wkl_percent", nullptr, nothing},
        {"max_7460_wkl_percent", nullptr, nothing},
        {"lhea_logical_ports", nullptr, nothing},
        {"lhea_capabilities", nullptr, nothing},
        {"lhea_capabilities ", nullptr, nothing},  // nwplat's callers write the blank
        {"sni_device_ids", nullptr, nothing},
    };
    return rules;
}

std::string namesOf(const AttributeRules& rules, const std::string& others) {
    std::string names = others;
    for (const AttributeRule& rule : rules) names += std::string(",") + rule.name;
    return names;
}

std::string checkedValue(const HostView& host, const AttributeRules& rules,
                         const Setting& setting) {
    const AttributeRule& rule = ruleFor(rules, setting.name);
    const bool replaces = setting.op == Setting::Operator::Set;
    if (!replaces && !rule.isList) throw Failure(Fault::NotAList, {setting.name});
    // What is removed from a list need not be written in full.
    if (setting.op == Setting::Operator::Remove && setting.name == rule.stored) {
        return setting.value;
    }
    Value value = rule.rule(host, setting.value, rule.argument);
    if (value) return std::move(*value);
    const Fault fault = rule.stored == nullptr ? Fault::NotCapable : Fault::BadValue;
    throw Failure(fault, {setting.name, setting.value});
}

void apply(const HostView& host, const AttributeRules& rules, const Setting& setting,
           Object& object) {
    const AttributeRule& rule = ruleFor(rules, setting.name);
    const std::string value = checkedValue(host, rules, setting);
    if (rule.stored == nullptr) return;
    if (!rule.isList) return object.set(rule.stored, value);
    const bool replaces = setting.op == Setting::Operator::Set;
    const std::string before = replaces ? kNone : object.get(rule.stored);
    object.set(rule.stored, merged(rule.stored, setting.op, before, value));
}

std::optional<std::string> given(const std::vector<Setting>& settings, const std::string& name) {
    for (const Setting& setting : settings) {
        if (setting.name != name) continue;
        if (setting.op != Setting::Operator::Set) throw Failure(Fault::NotAList, {name});
        return setting.value;
    }
    return std::nullopt;
}

std::string needed(const std::vector<Setting>& settings, const std::string& name) {
    Value value = given(settings, name);
    if (!value) throw Failure(Fault::MissingSetting, {name});
    return std::move(*value);
}

bool sharesPool(const std::string& sharingMode) {
    return sharingMode == "cap" || sharingMode == "uncap";
}

bool isPrintable(const std::string& name) {
    constexpr std::ptrdiff_t kMost = 47;  // characters, not bytes
    const auto isControl = [](char c) { return static_cast<unsigned char>(c) < ' ' || c == 127; };
    const auto begins = [](char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; };
    return !name.empty() && std::none_of(name.begin(), name.end(), isControl) &&
           std::count_if(name.begin(), name.end(), begins) <= kMost;
}

const Object* profileNamed(const HostView& host, std::int64_t lpar, const std::string& name) {
    for (const Object& profile : host.all(Kind::Profile)) {
        if (profile.place().lpar == lpar && profile.get("name") == name) return &profile;
    }
    return nullptr;
}

}  // namespace appliance
