// edplat and dlplat: what is stored of hosts, partitions and profiles.

#include <algorithm>

#include "Change.h"
#include "ConfigureRules.h"
#include "Failure.h"
#include "NewLpar.h"
#include "Operation.h"
#include "Text.h"

namespace appliance {

namespace {

using Settings = std::vector<Setting>;

Settings settingsOf(const Request& request, const Operation& operation) {
    if (!request.has("-i")) throw Failure(Fault::MissingOption, {"-i"});
    return appliance::settingsOf(request, "-i", operation.attributes);
}

/// The partition that the settings name, by @p id or else by @p name.
Object lparOf(const HostView& host, const Settings& settings, const char* id, const char* name) {
    const auto wanted = given(settings, id);
    if (!wanted && !given(settings, name)) throw Failure(Fault::MissingSetting, {id});
    if (wanted) {
        std::int64_t number = 0;
        const Object* lpar = wholeNumber(*wanted, &number) ? host.lpar(number) : nullptr;
        if (lpar == nullptr) throw Failure(Fault::LparIdNotFound, {*wanted});
        return *lpar;
    }
    const std::string called = *given(settings, name);
    const Object* lpar = host.lparNamed(called);
    if (lpar == nullptr) throw Failure(Fault::LparNameNotFound, {called});
    return *lpar;
}

/// Applies all settings but those that say which object is meant.
void applyAll(const HostView& host, const AttributeRules& rules, const Settings& settings,
              const std::vector<std::string>& selectors, Object& object) {
    for (const Setting& setting : settings) {
        const auto isIt = [&](const std::string& selector) { return setting.name == selector; };
        if (std::any_of(selectors.begin(), selectors.end(), isIt)) continue;
        apply(host, rules, setting, object);
    }
}

void editHost(const Request& request, const Operation& operation) {
    Change change(request);
    const Settings settings = settingsOf(request, operation);
    requireConnection(change.host());
    Object host = change.host().host();
    const std::string before = host.get("name");
    applyAll(change.host(), hostRules(), settings, {}, host);
    if (host.get("name") != before) {
        if (change.isHost(host.get("name"))) throw Failure(Fault::NameTaken, {host.get("name")});
        // Both ends of a move know each other by name.
        for (const Object& lpar : change.host().all(Kind::Lpar)) requireStill(lpar);
    }
    change.put(host);
    change.commit();
}

void editLpar(const Request& request, const Operation& operation) {
    Change change(request);
    const Settings settings = settingsOf(request, operation);
    const HostView& host = change.host();
    requireConnection(host);
    Object lpar = lparOf(host, settings, "lpar_id", "name");
    requireStill(lpar);
    const std::string before = lpar.get("name"), current = lpar.get("curr_profile");
    applyAll(host, lparRules(), settings, {"lpar_id", "name"}, lpar);
    if (lpar.get("name") != before) requireFreeName(host, lpar.get("name"));
    lpar.set("curr_profile", current);  // until it is set, it is taken to be the default one
    const std::string profile = lpar.get("default_profile");
    if (profileNamed(host, lpar.place().lpar, profile) == nullptr) {
        throw Failure(Fault::ProfileNotFound, {profile});
    }
    change.put(lpar);
    change.commit();
}

/// Gives a profile the name that "new_name" asks for, wherever its partition names it.
void renameProfile(Change& change, Object lpar, const std::string& name, Object& profile) {
    const std::string before = profile.get("name");
    if (name == before) return;
    if (!isPrintable(name)) throw Failure(Fault::BadValue, {"new_name", name});
    if (profileNamed(change.host(), lpar.place().lpar, name) != nullptr) {
        throw Failure(Fault::NameTaken, {name});
    }
    profile.set("name", name);
    const std::string current = lpar.get("curr_profile"), usual = lpar.get("default_profile");
    if (usual == before) lpar.set("default_profile", name);
    lpar.set("curr_profile", current == before ? name : current);
    change.put(lpar);
}

void editProfile(const Request& request, const Operation& operation) {
    Change change(request);
    const Settings settings = settingsOf(request, operation);
    const HostView& host = change.host();
    requireConnection(host);
    const Object lpar = lparOf(host, settings, "lpar_id", "lpar_name");
    requireStill(lpar);
    const std::string name = needed(settings, "name");
    const Object* found = profileNamed(host, lpar.place().lpar, name);
    if (found == nullptr) throw Failure(Fault::ProfileNotFound, {name});
    Object profile = *found;
    applyAll(host, profileRules(), settings, {"lpar_id", "lpar_name", "name", "new_name"}, profile);
    settle(host, settings, profile);
    renameProfile(change, lpar, given(settings, "new_name").value_or(name), profile);
    change.put(profile);
    change.commit();
}

// Deleting a partition.

bool names(const std::string& list, const std::string& id) {
    const std::vector<std::string> ids = split(list);
    return std::find(ids.begin(), ids.end(), id) != ids.end();
}

/// What others cannot do without stays: the adapters that clients are joined to, and the service
/// of paging to partitions with shared memory.
void requireUnused(const HostView& host, const Object& lpar) {
    const std::string id = lpar.get("lpar_id");
    for (Kind kind : {Kind::VirtualScsi, Kind::Serial}) {
        for (const Object& adapter : host.all(kind)) {
            if (adapter.get("adapter_type") == "client" && adapter.get("remote_lpar_id") == id &&
                adapter.place().lpar != lpar.place().lpar) {
                throw Failure(Fault::InUse, {std::to_string(adapter.place().lpar)});
            }
        }
    }
    for (const Object& pool : host.all(Kind::MemPool)) {
        if (names(pool.get("psp_ids"), id)) throw Failure(Fault::InUse, {id});
    }
    for (Kind kind : {Kind::Lpar, Kind::Profile}) {
        for (const Object& user : host.all(kind)) {
            if (user.place().lpar != lpar.place().lpar &&
                (user.get("primary_psp_id") == id || user.get("secondary_psp_id") == id)) {
                throw Failure(Fault::InUse, {std::to_string(user.place().lpar)});
            }
        }
    }
}

void removeLpar(const Request& request, const Operation&) {
    Change change(request);
    requireConnection(change.host());
    const Object lpar = change.lpar();
    requireStill(lpar);
    requireState(lpar, {"Not Activated"});
    requireUnused(change.host(), lpar);
    eraseLpar(change, change.host(), lpar);
    change.commit();
}

const std::string kHostNames = namesOf(hostRules(), "").substr(1);
const std::string kLparNames = namesOf(lparRules(), "name,lpar_id");
const std::string kProfileNames = namesOf(profileRules(), "name,lpar_id,lpar_name,new_name");

}  // namespace

const std::vector<Operation> kConfigureOperations = {
    {kEdplat, "sys", nullptr, nullptr, editHost, kHostNames.c_str()},
    {kEdplat, "lpar", nullptr, nullptr, editLpar, kLparNames.c_str()},
    {kEdplat, "prof", nullptr, nullptr, editProfile, kProfileNames.c_str()},
    {kNwplat, "lpar", nullptr, nullptr, makeLpar, newLparNames()},
    {kDlplat, "lpar", nullptr, nullptr, removeLpar},
};

}  // namespace appliance
