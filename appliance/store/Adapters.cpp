#include "Adapters.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <set>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

/// The values of a field that is a number, and what stands for one that is left empty; null when
/// it must be given.
struct NumberRule {
    const char* field;
    std::int64_t least;
    std::int64_t most;
    const char* absent;
};

constexpr std::int64_t kMostVlan = 4094;
constexpr std::size_t kMostVlans = 20;  ///< max_vlans_per_port of every host

constexpr NumberRule kNumberRules[] = {
    {"slot_num", 0, 65534, nullptr},
    {"ieee_virtual_eth", 0, 1, "0"},
    {"port_vlan_id", 1, kMostVlan, nullptr},
    {"is_trunk", 0, 1, "0"},
    {"trunk_priority", 0, 15, "0"},
    {"is_required", 0, 1, "0"},
    {"supports_dnx", 0, 1, "1"},
    {"remote_lpar_id", 1, 65534, "any"},
    {"remote_slot_num", 0, 65534, "any"},
};

std::optional<std::string> vlanIds(const std::string& list) {
    if (list.empty() || list == "none") {
        return std::string();
    }
    std::set<std::int64_t> ids;
    std::vector<std::string> texts;
    for (const std::string& text : split(list)) {
        std::int64_t id = 0;
        if (!wholeNumber(text, &id) || id < 1 || id > kMostVlan || !ids.insert(id).second) {
            return std::nullopt;
        }
        texts.push_back(std::to_string(id));
    }
    if (texts.size() > kMostVlans) {
        return std::nullopt;
    }
    return joined(texts);
}

/// Cuts at @p separator where it stands outside quotes, and drops quotes around a whole part.
std::optional<std::vector<std::string>> cut(const std::string& text, char separator) {
    std::vector<std::string> parts;
    bool inside = false;
    for (std::size_t begin = 0, i = 0; i <= text.size(); ++i) {
        if (i < text.size() && text[i] == '"') {
            inside = !inside;
        }
        if (i < text.size() && (text[i] != separator || inside)) {
            continue;
        }
        const std::string part = text.substr(begin, i - begin);
        const bool isQuoted = part.size() > 1 && part.front() == '"' && part.back() == '"';
        parts.push_back(isQuoted ? unquoted(part) : part);
        begin = i + 1;
    }
    if (inside) {
        return std::nullopt;
    }
    return parts;
}

/// Fills the field without name in, if @p element has the form's fields up to there.
std::string withRemoteName(const AdapterForm& form, const HostView& view, std::string element) {
    std::size_t begin = 0, before = 0;
    for (std::string_view field : namesIn(form.fields)) {
        if (field.empty()) {
            return element.insert(begin, view.lparName(element.substr(before, begin - 1 - before)));
        }
        before = begin;
        begin = element.find('/', begin) + 1;
        if (begin == 0) {
            break;
        }
    }
    return element;
}

}  // namespace

const AdapterForm* adapterForm(Kind kind) {
    const auto* found = std::find_if(std::begin(kAdapterForms), std::end(kAdapterForms),
                                     [&](const AdapterForm& form) { return form.kind == kind; });
    return found == std::end(kAdapterForms) ? nullptr : found;
}

std::string adapterElement(const AdapterForm& form, const Object& adapter) {
    std::string element;
    for (std::string_view field : namesIn(form.fields)) {
        if (!element.empty()) {
            element += '/';
        }
        if (!field.empty()) {
            element += adapter.get(field);
        }
    }
    return element;
}

std::string adapterList(const std::vector<std::string>& elements) {
    return elements.empty() ? "none" : joined(elements);
}

std::vector<std::string> elementsOf(const std::string& key, const std::string& list) {
    if (list.empty() || list == "none") {
        return {};
    }
    auto elements = cut(list, ',');
    if (!elements) {
        throw Failure(Fault::BadValue, {key, list});
    }
    return std::move(*elements);
}

std::optional<std::string> adapterValue(const std::string& name, const std::string& value) {
    for (const NumberRule& rule : kNumberRules) {
        if (name != rule.field) {
            continue;
        }
        if (rule.absent != nullptr && (value.empty() || value == rule.absent)) {
            return rule.absent;
        }
        std::int64_t number = 0;
        if (!wholeNumber(value, &number) || number < rule.least || number > rule.most) {
            return std::nullopt;
        }
        return std::to_string(number);
    }
    if (name == "addl_vlan_ids") {
        return vlanIds(value);
    }
    if (name == "vswitch") {
        if (value.find_first_of("/\"") != std::string::npos) {
            return std::nullopt;
        }
        return value.empty() ? "default" : value;
    }
    if (name == "adapter_type" && (value == "client" || value == "server")) {
        return value;
    }
    return std::nullopt;
}

bool isWhole(const Object& ethernet) {
    return ethernet.get("addl_vlan_ids").empty() || ethernet.get("ieee_virtual_eth") == "1";
}

Object adapterFromElement(const AdapterForm& form, const Place& lpar, const std::string& element) {
    const Failure malformed(Fault::BadValue, {form.list, element});
    const auto names = namesIn(form.fields);
    auto fields = cut(element, '/');
    // Of Ethernet adapters, the switch may be missing, and a MAC address may follow.
    const std::size_t slack = form.kind == Kind::Ethernet ? 1 : 0;
    if (!fields || fields->size() + slack < names.size() || fields->size() > names.size() + slack) {
        throw malformed;
    }
    fields->resize(names.size());
    const auto slot = adapterValue("slot_num", fields->front());
    if (!slot) {
        throw malformed;
    }
    Object adapter(form.kind, {lpar.host, lpar.lpar, number(*slot)});
    for (std::size_t i = 1; i < names.size(); ++i) {
        if (names[i].empty()) {
            continue;
        }
        const auto value = adapterValue(std::string(names[i]), (*fields)[i]);
        if (!value) {
            throw malformed;
        }
        adapter.set(names[i], *value);
    }
    if (form.kind == Kind::Ethernet) {
        adapter.set("is_trunk", adapter.get("trunk_priority") == "0" ? "0" : "1");
    } else if (form.kind == Kind::Serial && adapter.get("adapter_type") == "client") {
        adapter.set("supports_dnx", "0");
    }
    // A client finds its server when the partition starts.
    if (form.kind == Kind::Ethernet && !isWhole(adapter)) {
        throw malformed;
    }
    return adapter;
}

std::map<std::int64_t, Object> adaptersOf(const Object& profile) {
    const std::int64_t slots = number(profile.get("max_virtual_slots"));
    std::map<std::int64_t, Object> adapters;
    for (const AdapterForm& form : kAdapterForms) {
        for (const std::string& element : elementsOf(form.list, profile.get(form.list))) {
            Object adapter = adapterFromElement(form, profile.place(), element);
            const std::int64_t slot = adapter.place().number;
            if (slot >= slots || !adapters.emplace(slot, std::move(adapter)).second) {
                throw Failure(Fault::BadValue, {form.list, element});
            }
        }
    }
    return adapters;
}

VirtualSlot slotOf(const Object& adapter) { return {adapter.place().lpar, adapter.place().number}; }

std::optional<VirtualSlot> serverOf(const Object& adapter) {
    VirtualSlot server;
    if (adapter.kind() == Kind::Ethernet || adapter.get("adapter_type") != "client" ||
        !wholeNumber(adapter.get("remote_lpar_id"), &server.first) ||
        !wholeNumber(adapter.get("remote_slot_num"), &server.second)) {
        return std::nullopt;
    }
    return server;
}

bool admits(const Object& adapter, const VirtualSlot& slot) {
    const auto fits = [&](const char* attribute, std::int64_t value) {
        const std::string wanted = adapter.get(attribute);
        return wanted == "any" || wanted == std::to_string(value);
    };
    return fits("remote_lpar_id", slot.first) && fits("remote_slot_num", slot.second);
}

bool serves(const Object& other, const Object& client) {
    return other.kind() == client.kind() && other.get("adapter_type") == "server" &&
           admits(other, slotOf(client));
}

std::string newMac(const HostView& view, const Place& place) {
    std::set<std::string> used;
    for (const Object& adapter : view.all(Kind::Ethernet)) {
        used.insert(adapter.get("mac_addr"));
    }
    const std::string prefix = view.host().get("mac_prefix");
    std::int64_t suffix = (place.lpar * 256 + place.number % 256) % (1 << 24);
    while (used.count(prefix + hex(suffix, 6)) != 0) {
        suffix = (suffix + 1) % (1 << 24);
    }
    return prefix + hex(suffix, 6);
}

std::vector<IoSlot> ioSlotsFromList(const std::string& list) {
    constexpr std::size_t kMostDigits = 8;
    constexpr std::int64_t kMostPool = 65534;
    std::vector<IoSlot> slots;
    std::set<std::string> drcs;
    for (const std::string& element : elementsOf("io_slots", list)) {
        const Failure malformed(Fault::BadValue, {"io_slots", element});
        const auto fields = cut(element, '/');
        if (!fields || fields->size() != 3) {
            throw malformed;
        }
        const auto required = adapterValue("is_required", (*fields)[2]);
        IoSlot slot{upperHex((*fields)[0]), (*fields)[1], required == "1"};
        if (slot.pool.empty()) {
            slot.pool = "none";
        }
        std::int64_t pool = 0;
        const bool fits =
            !slot.drcIndex.empty() && slot.drcIndex.size() <= kMostDigits &&
            slot.drcIndex.find_first_not_of("0123456789ABCDEF") == std::string::npos &&
            (slot.pool == "none" || (wholeNumber(slot.pool, &pool) && pool <= kMostPool)) &&
            required;
        if (!fits || !drcs.insert(slot.drcIndex).second) {
            throw malformed;
        }
        slots.push_back(std::move(slot));
    }
    return slots;
}

std::string ioSlotElement(const IoSlot& slot) {
    return slot.drcIndex + '/' + slot.pool + (slot.isRequired ? "/1" : "/0");
}

std::string namedAdapters(const Row& row, const char* key) {
    std::string list = row.self->get(key);
    if (list == "none") {
        return list;
    }
    std::vector<std::string> elements = split(list);
    for (const AdapterForm& form : kAdapterForms) {
        if (std::string_view(form.list) != key) {
            continue;
        }
        for (std::string& element : elements) {
            element = withRemoteName(form, *row.view, std::move(element));
        }
    }
    return joined(elements);
}

}  // namespace appliance
