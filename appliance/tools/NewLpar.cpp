#include "NewLpar.h"

#include <algorithm>

#include "Activation.h"
#include "Change.h"
#include "ConfigureRules.h"
#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

/// What a partition runs, and what its host must be capable of for that.
struct Environment {
    const char* word;
    const char* capability;
};

constexpr Environment kEnvironments[] = {
    {"tmxlinux", nullptr},
    {"xbrgserver", "virtual_io_server_capable"},
    {"osq00", "osq00_capable"},
};

/// Attributes that are handled here, and those that are the partition's own; all others are its
/// profile's.
constexpr const char* kOwn = "lpar_id,name,profile_name,lpar_env,all_resources";
constexpr const char* kLparSettings = "allow_perf_collection,lpar_avail_priority";

constexpr const char* kEdges[] = {"min_", "desired_", "max_"};

std::string environment(const HostView& host, const Settings& settings) {
    std::string word = needed(settings, "lpar_env");
    for (const Environment& known : kEnvironments) {
        if (word != known.word) {
            continue;
        }
        refuseIf(known.capability != nullptr && host.host().get(known.capability) != "1",
                 Fault::NotCapable, {"lpar_env"});
        return word;
    }
    throw Failure(Fault::BadValue, {"lpar_env", word});
}

/// What must be given unless the partition is to have everything.
void requireQuantities(const Settings& settings) {
    const bool isDedicated = given(settings, "proc_mode") == "ded";
    for (const std::string quantity : {"mem", "procs", "proc_units"}) {
        if (quantity == "proc_units" && isDedicated) {
            continue;
        }
        for (const char* edge : kEdges) {
            needed(settings, edge + quantity);
        }
    }
}

Object newProfile(const HostView& host, const Settings& settings, const Place& place) {
    const std::string name = given(settings, "profile_name").value_or("normal");
    refuseIf(!isPrintable(name), Fault::BadValue, {"profile_name", name});
    const std::string all = given(settings, "all_resources").value_or("0");
    refuseIf(all != "0" && all != "1", Fault::BadValue, {"all_resources", all});
    if (all == "0") {
        requireQuantities(settings);
    }

    Object profile(Kind::Profile, place);
    profile.set("name", name);
    profile.set("all_resources", all);
    for (const std::string edge : kEdges) {
        profile.set(edge + "mem", "0");
        profile.set(edge + "procs", "0");
        profile.set(edge + "proc_units", "0.0");
    }
    for (const Setting& setting : settings) {
        if (isListed(kOwn, setting.name) || isListed(kLparSettings, setting.name)) {
            continue;
        }
        apply(host, profileRules(), setting, profile);
    }
    settle(host, settings, profile);
    return profile;
}

Object newLpar(const HostView& host, const Settings& settings, const Object& profile) {
    Object lpar(Kind::Lpar, {profile.place().host, profile.place().lpar, 0});
    const std::string name = needed(settings, "name");
    refuseIf(!isPrintable(name), Fault::BadValue, {"name", name});
    requireFreeName(host, name);
    lpar.set("name", name);
    lpar.set("lpar_env", environment(host, settings));
    lpar.set("state", "Not Activated");
    lpar.set("resource_config", "0");
    lpar.set("default_profile", profile.get("name"));
    lpar.set("curr_profile", "");
    for (const std::string amount : {"mem", "procs", "proc_units"}) {
        for (const char* edge : {"pend_min_", "pend_", "pend_max_"}) {
            lpar.set(edge + amount, amount == "proc_units" ? "0.0" : "0");
        }
    }
    takeSettings(profile, lpar);
    for (const Setting& setting : settings) {
        if (isListed(kLparSettings, setting.name)) {
            apply(host, lparRules(), setting, lpar);
        }
    }
    return lpar;
}

/// Takes those that @p isGone tells from the list that is the object's @p attribute.
/// @return whether there were such
template <typename IsGone>
bool takeFrom(Object& object, const char* attribute, const std::string& empty, IsGone isGone) {
    std::vector<std::string> elements = split(object.get(attribute));
    const auto gone = std::remove_if(elements.begin(), elements.end(), isGone);
    if (gone == elements.end()) {
        return false;
    }
    elements.erase(gone, elements.end());
    object.set(attribute, elements.empty() ? empty : joined(elements));
    return true;
}

/// The objects that name a partition as one that they can do without, without that name.
std::vector<Object> freed(const HostView& host, std::int64_t lpar) {
    const std::string id = std::to_string(lpar);
    const auto isId = [&](const std::string& element) { return element == id; };
    const auto isStart = [&](const std::string& element) {
        return element.rfind(id + '/', 0) == 0;
    };
    std::vector<Object> changed;
    for (Kind kind : {Kind::Lpar, Kind::Profile}) {
        for (Object user : host.all(kind)) {
            if (user.place().lpar != lpar && takeFrom(user, "power_ctrl_lpar_ids", "none", isId)) {
                changed.push_back(std::move(user));
            }
        }
    }
    for (Object system : host.all(Kind::SystemProfile)) {
        if (takeFrom(system, "lpar_profiles", "", isStart)) {
            changed.push_back(std::move(system));
        }
    }
    if (host.host().get("service_lpar_id") == id) {
        changed.push_back(host.host());
        changed.back().set("service_lpar_id", "none");
    }
    return changed;
}

}  // namespace

std::int64_t newId(const HostView& host, const Settings& settings) {
    const std::string limit = host.host().get("max_lpars");
    const std::int64_t most = number(limit);
    const auto& lpars = host.all(Kind::Lpar);
    refuseIf(static_cast<std::int64_t>(lpars.size()) >= most, Fault::TooManyLpars, {limit});
    std::int64_t id = 1;
    if (const auto wanted = given(settings, "lpar_id")) {
        refuseIf(!wholeNumber(*wanted, &id) || id < 1 || id > most, Fault::BadValue,
                 {"lpar_id", *wanted});
        refuseIf(host.lpar(id) != nullptr, Fault::IdTaken, {*wanted});
        return id;
    }
    for (const Object& lpar : lpars) {
        if (lpar.place().lpar != id) {
            break;
        }
        ++id;
    }
    return id;
}

void requireFreeName(const HostView& host, const std::string& name) {
    refuseIf(host.find(Kind::Lpar, "name", name) != nullptr, Fault::NameTaken, {name});
}

const char* newLparNames() {
    static const std::string names =
        namesOf(profileRules(), std::string(kOwn) + ',' + kLparSettings);
    return names.c_str();
}

void makeLpar(Change& change, const Operation& operation) {
    const HostView& host = change.host();
    const Settings settings = settingsOf(change.request(), "-i", operation.attributes);
    requireConnection(host);
    const Place place{host.host().place().host, newId(host, settings), 0};
    const Object profile = newProfile(host, settings, place);
    const Object lpar = newLpar(host, settings, profile);
    change.put(lpar);
    change.put(profile);
}

void eraseLpar(Change& change, const HostView& host, const Object& lpar) {
    const std::int64_t id = lpar.place().lpar;
    std::vector<Object> kept = freed(host, id), gone = {lpar};
    for (Kind kind : kOfLpar) {
        for (const Object& object : host.all(kind, id)) {
            gone.push_back(object);
            if (isPhysical(kind)) {
                kept.push_back(object.movedTo({object.place().host, 0}));
            }
        }
    }
    for (const Object& object : gone) {
        change.remove(object);
    }
    for (const Object& object : kept) {
        change.put(object);
    }
}

}  // namespace appliance
