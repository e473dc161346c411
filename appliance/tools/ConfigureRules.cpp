#include "ConfigureRules.h"

#include <algorithm>
#include <set>

#include "Adapters.h"
#include "Failure.h"
#include "LparState.h"
#include "Text.h"

namespace appliance {

namespace {

using Value = std::optional<std::string>;

constexpr const char* kNone = "none";

bool isNone(const std::string& value) { return value.empty() || value == kNone; }

// Rules for single values.

/// One of the words of @p argument.
Value words(const HostView&, const std::string& value, const char* argument) {
    return isListed(argument, value) ? value : Value();
}

/// A number within the first two of @p argument, or the word behind them.
Value numberIn(const HostView&, const std::string& value, const char* argument) {
    const std::vector<std::string> limits = split(argument);
    if (limits.size() > 2 && value == limits[2]) {
        return value;
    }
    std::int64_t found = 0;
    if (!wholeNumber(value, &found) || found < number(limits[0]) || found > number(limits[1])) {
        return std::nullopt;
    }
    return std::to_string(found);
}

Value memory(const HostView& host, const std::string& value, const char*) {
    constexpr std::int64_t kMost = 1LL << 40;
    std::int64_t found = 0;
    if (!wholeNumber(value, &found) || found > kMost || found % host.memRegion() != 0) {
        return std::nullopt;
    }
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
    if (value == argument) {
        return value;
    }
    for (const Object& pool : host.all(kind)) {
        if (value == std::to_string(pool.place().number)) {
            return value;
        }
    }
    return std::nullopt;
}

Value procPoolNamed(const HostView& host, const std::string& value, const char*) {
    const Object* pool = host.find(Kind::ProcPool, "name", value);
    return pool == nullptr ? Value() : std::to_string(pool->place().number);
}

/// The ID of a partition, of the environment @p argument unless that is empty.
Value lparId(const HostView& host, const std::string& value, const char* argument) {
    if (isNone(value)) {
        return kNone;
    }
    std::int64_t id = 0;
    const Object* lpar = wholeNumber(value, &id) ? host.lpar(id) : nullptr;
    const bool fits = lpar != nullptr && (*argument == '\0' || lpar->get("lpar_env") == argument);
    return fits ? std::to_string(id) : Value();
}

Value lparNamed(const HostView& host, const std::string& value, const char* argument) {
    if (isNone(value)) {
        return kNone;
    }
    const Object* lpar = host.find(Kind::Lpar, "name", value);
    return lpar == nullptr ? Value() : lparId(host, lpar->get("lpar_id"), argument);
}

/// A physical slot by its DRC index, a virtual slot by its number, or the word @p argument.
Value taggedSlot(const HostView& host, const std::string& value, const char* argument) {
    if (isNone(value)) {
        return kNone;
    }
    if (value == argument || host.find(Kind::Slot, "drc_index", value) != nullptr) {
        return value;
    }
    return adapterValue("slot_num", value);
}

// Rules for lists.

template <Rule rule>
Value eachOf(const HostView& host, const std::string& list, const char* argument) {
    if (isNone(list)) {
        return kNone;
    }
    std::vector<std::string> elements;
    for (const std::string& element : split(list)) {
        const Value value = rule(host, element, argument);
        if (!value || *value == kNone) {
            return std::nullopt;
        }
        elements.push_back(*value);
    }
    return joined(elements);
}

Value hca(const HostView& host, const std::string& value, const char*) {
    const std::string id = value.substr(0, value.find('/'));
    return host.find(Kind::Hca, "adapter_id", id) == nullptr ? Value() : value;
}

Value adapters(const HostView&, const std::string& list, const char* argument) {
    std::vector<std::string> elements;
    for (const AdapterForm& form : kAdapterForms) {
        if (std::string(argument) != form.list) {
            continue;
        }
        for (const std::string& element : elementsOf(argument, list)) {
            elements.push_back(adapterElement(form, adapterFromElement(form, {}, element)));
        }
    }
    return adapterList(elements);
}

Value ioSlots(const HostView&, const std::string& list, const char*) {
    std::vector<std::string> elements;
    for (const IoSlot& slot : ioSlotsFromList(list)) {
        elements.push_back(ioSlotElement(slot));
    }
    return adapterList(elements);
}

constexpr const char* kConsoles = "virtual_serial_adapters";  ///< in its slots 0 and 1

/// What tells the elements of a list apart: the slot, the DRC index, the whole ID.
std::string keyOf(const std::string& element) { return element.substr(0, element.find('/')); }

/// @p list with the elements of @p changes added or removed.
std::string merged(const std::string& key, Setting::Operator op, const std::string& list,
                   const std::string& changes) {
    std::vector<std::string> elements = elementsOf(key, list);
    std::set<std::string> keys;
    for (const std::string& element : elements) {
        keys.insert(keyOf(element));
    }
    for (const std::string& element : elementsOf(key, changes)) {
        const std::string changed = keyOf(element);
        if (op != Setting::Operator::Remove) {
            refuseIf(!keys.insert(changed).second, Fault::ElementThere, {key, changed});
            elements.push_back(element);
        } else if (keys.erase(changed) == 0) {
            throw Failure(Fault::ElementMissing, {key, changed});
        } else if (key == kConsoles && (changed == "0" || changed == "1")) {
            throw Failure(Fault::Required, {changed});
        }
    }
    const auto isGone = [&](const std::string& e) { return keys.count(keyOf(e)) == 0; };
    elements.erase(std::remove_if(elements.begin(), elements.end(), isGone), elements.end());
    return adapterList(elements);
}

/// A tag names one slot: one that is added takes the place, and the one that is removed leaves it.
/// None, or @p word in place of a slot, is nothing to add or remove.
std::string retagged(Setting::Operator op, const std::string& held, const std::string& slot,
                     const std::string& word) {
    if (isNone(slot) || slot == word) {
        return held;
    }
    if (op == Setting::Operator::Remove) {
        return held == slot ? kNone : held;
    }
    return slot;
}

const AttributeRule& ruleFor(const AttributeRules& rules, const std::string& name) {
    return *std::find_if(rules.begin(), rules.end(),
                         [&](const AttributeRule& rule) { return isListed(rule.names, name); });
}

constexpr const char* kFlag = "0,1";

}  // namespace

const AttributeRules& hostRules() {
    // What the next start takes up is pending until then.
    static const AttributeRules rules = {
        {"new_name", printable, "", "name"},
        {"power_off_policy", words, kFlag},
        {"service_lpar_id", lparId},
        {"service_lpar_name", lparNamed, "", "service_lpar_id"},
        {"power_on_option", words, "standby,autostart", "pend_power_on_option"},
        {"power_on_side", words, "temp,perm", "pend_power_on_side"},
        {"power_on_speed", words, "fast,slow", "pend_power_on_speed"},
        {"power_on_speed_override", words, "none,fast,slow", "pend_power_on_speed_override"},
        {"sp_failover_enabled", words, kFlag},
    };
    return rules;
}

const AttributeRules& lparRules() {
    static const AttributeRules rules = {
        {"new_name", printable, "", "name"},
        {"work_group_id", numberIn, "1,32,none"},
        {"default_profile", printable},
        {"ipl_source", words, "a,b,c,d"},
        {"allow_perf_collection", words, kFlag},
        {"lpar_avail_priority", numberIn, "0,255"},
        {"electronic_err_reporting", words, kFlag},
    };
    return rules;
}

const AttributeRules& profileRules() {
    static const AttributeRules rules = {
        {"min_mem,desired_mem,max_mem", memory},
        {"mem_mode", words, "ded,shared"},
        {"mem_weight", numberIn, "0,255"},
        {"desired_io_entitled_mem", numberIn, "0,1073741824,auto"},
        {"primary_psp_id", lparId, kIoServer},
        {"primary_psp_name", lparNamed, kIoServer, "primary_psp_id"},
        {"secondary_psp_id", lparId, kIoServer},
        {"secondary_psp_name", lparNamed, kIoServer, "secondary_psp_id"},
        {"min_procs,desired_procs,max_procs", numberIn, "1,1000000"},
        {"min_proc_units,desired_proc_units,max_proc_units", procUnits},
        {"proc_mode", words, "ded,shared"},
        {"sharing_mode", words,
         "cap,uncap,keep_idle_procs,share_idle_procs,share_idle_procs_active,"
         "share_idle_procs_always"},
        {"uncap_weight", numberIn, "0,255"},
        {"lpar_proc_compat_mode", compatMode},
        {"shared_proc_pool_id", poolId<Kind::ProcPool>, "null"},
        {"shared_proc_pool_name", procPoolNamed, "", "shared_proc_pool_id"},
        {"boot_mode", words, "norm,dd,ds,of,sms"},
        {"auto_start", words, kFlag},
        {"max_virtual_slots", numberIn, "2,65534"},
        {"virtual_eth_adapters", adapters, "virtual_eth_adapters", nullptr, true},
        {"virtual_scsi_adapters", adapters, "virtual_scsi_adapters", nullptr, true},
        {"virtual_serial_adapters", adapters, "virtual_serial_adapters", nullptr, true},
        {"io_slots", ioSlots, "", nullptr, true},
        {"load_source_slot,alt_restart_device_slot", taggedSlot},
        {"console_slot", taggedSlot, "dnx"},
        {"alt_console_slot,op_console_slot", taggedSlot},
        {"lpar_io_pool_ids", eachOf<numberIn>, "0,254", nullptr, true},
        {"conn_monitoring", words, kFlag},
        {"virtual_opti_pool_id", poolId<Kind::OptiPool>, kNone},
        {"hsl_pool_id", poolId<Kind::HslPool>, kNone},
        {"power_ctrl_lpar_ids", eachOf<lparId>, "", nullptr, true},
        {"power_ctrl_lpar_names", eachOf<lparNamed>, "", "power_ctrl_lpar_ids", true},
        {"hca_adapters", eachOf<hca>, "", nullptr, true},
        {"work_group_id", numberIn, "1,32,none"},
        {"redundant_err_path_reporting,electronic_err_reporting", words, kFlag},
        // nwplat's callers write the blank behind one of these.
        {"min_num_huge_pages,desired_num_huge_pages,max_num_huge_pages,bsr_arrays,"
         "min_7460_wkl_percent,desired_7460_wkl_percent,max_7460_wkl_percent,lhea_logical_ports,"
         "lhea_capabilities,lhea_capabilities ,sni_device_ids",
         nothing},
    };
    return rules;
}

std::string namesOf(const AttributeRules& rules, std::string others) {
    for (const AttributeRule& rule : rules) {
        others.append(",").append(rule.names);
    }
    return others.substr(others[0] == ',');
}

std::string checkedValue(const HostView& host, const AttributeRules& rules,
                         const Setting& setting) {
    const AttributeRule& rule = ruleFor(rules, setting.name);
    const bool replaces = setting.op == Setting::Operator::Set;
    refuseIf(!replaces && !rule.isList && rule.rule != taggedSlot, Fault::NotAList, {setting.name});
    // What is removed from a list need not be written in full.
    if (setting.op == Setting::Operator::Remove && rule.isList && rule.stored == nullptr) {
        return setting.value;
    }
    Value value = rule.rule(host, setting.value, rule.argument);
    if (value) {
        return std::move(*value);
    }
    const Fault fault = rule.rule == nothing ? Fault::NotCapable : Fault::BadValue;
    throw Failure(fault, {setting.name, setting.value});
}

void apply(const HostView& host, const AttributeRules& rules, const Setting& setting,
           Object& object) {
    const AttributeRule& rule = ruleFor(rules, setting.name);
    const std::string value = checkedValue(host, rules, setting);
    if (rule.rule == nothing) {
        return;
    }
    const std::string name = rule.stored == nullptr ? setting.name : rule.stored;
    const bool replaces = setting.op == Setting::Operator::Set;
    if (!rule.isList) {
        return object.set(
            name, replaces ? value : retagged(setting.op, object.get(name), value, rule.argument));
    }
    object.set(name, merged(name, setting.op, replaces ? kNone : object.get(name), value));
}

bool sharesPool(const std::string& sharingMode) {
    return sharingMode == "cap" || sharingMode == "uncap";
}

bool isPrintable(const std::string& name) {
    constexpr std::size_t kMost = 47;
    const auto isControl = [](char c) { return static_cast<unsigned char>(c) < ' ' || c == 127; };
    return !name.empty() && std::none_of(name.begin(), name.end(), isControl) &&
           characters(name) <= kMost;
}

}  // namespace appliance
