// edplat and dlplat: what is stored of hosts, partitions and profiles.

#include "Change.h"
#include "ConfigureRules.h"
#include "Failure.h"
#include "NewLpar.h"
#include "Operation.h"
#include "Text.h"

namespace appliance {

namespace {

Settings settingsOf(const Request& request, const Operation& operation) {
    refuseIf(!request.has("-i"), Fault::MissingOption, {"-i"});
    return appliance::settingsOf(request, "-i", operation.attributes);
}

/// The partition that the settings name, by @p id or else by @p name.
Object lparOf(const HostView& host, const Settings& settings, const char* id, const char* name) {
    if (const auto wanted = given(settings, id)) {
        std::int64_t number = 0;
        const Object* lpar = wholeNumber(*wanted, &number) ? host.lpar(number) : nullptr;
        refuseIf(lpar == nullptr, Fault::LparIdNotFound, {*wanted});
        return *lpar;
    }
    const auto called = given(settings, name);
    refuseIf(!called, Fault::MissingSetting, {id});
    const Object* lpar = host.find(Kind::Lpar, "name", *called);
    refuseIf(lpar == nullptr, Fault::LparNameNotFound, {*called});
    return *lpar;
}

/// Applies all settings but @p selectors, which say what object is meant.
void applyAll(const HostView& host, const AttributeRules& rules, const Settings& settings,
              const char* selectors, Object& object) {
    for (const Setting& setting : settings) {
        if (!isListed(selectors, setting.name)) {
            apply(host, rules, setting, object);
        }
    }
}

void editHost(Change& change, const Operation& operation) {
    const HostView& view = change.host();
    const Settings settings = settingsOf(change.request(), operation);
    requireConnection(view);
    Object host = view.host();
    applyAll(view, hostRules(), settings, "", host);
    const std::string name = host.get("name");
    if (name != view.host().get("name")) {
        refuseIf(change.isHost(name), Fault::NameTaken, {name});
        // Both ends of a move know each other by name.
        for (const Object& lpar : view.all(Kind::Lpar)) {
            requireStill(lpar);
        }
    }
    change.put(host);
}

void editLpar(Change& change, const Operation& operation) {
    const HostView& host = change.host();
    const Settings settings = settingsOf(change.request(), operation);
    requireConnection(host);
    Object lpar = lparOf(host, settings, "lpar_id", "name");
    requireStill(lpar);
    const std::string before = lpar.get("name"), current = lpar.get("curr_profile");
    applyAll(host, lparRules(), settings, "lpar_id,name", lpar);
    if (lpar.get("name") != before) {
        requireFreeName(host, lpar.get("name"));
    }
    lpar.set("curr_profile", current);  // until it is set, it is taken to be the default one
    const std::string profile = lpar.get("default_profile");
    refuseIf(host.profile(lpar.place().lpar, profile) == nullptr, Fault::ProfileNotFound,
             {profile});
    change.put(lpar);
}

/// Gives a profile the name that "new_name" asks for, wherever its partition names it.
void renameProfile(Change& change, Object lpar, const std::string& name, Object& profile) {
    const std::string before = profile.get("name");
    if (name == before) {
        return;
    }
    refuseIf(!isPrintable(name), Fault::BadValue, {"new_name", name});
    refuseIf(change.host().profile(lpar.place().lpar, name) != nullptr, Fault::NameTaken, {name});
    profile.set("name", name);
    const std::string current = lpar.get("curr_profile"), usual = lpar.get("default_profile");
    if (usual == before) {
        lpar.set("default_profile", name);
    }
    lpar.set("curr_profile", current == before ? name : current);
    change.put(lpar);
}

void editProfile(Change& change, const Operation& operation) {
    const HostView& host = change.host();
    const Settings settings = settingsOf(change.request(), operation);
    requireConnection(host);
    const Object lpar = lparOf(host, settings, "lpar_id", "lpar_name");
    requireStill(lpar);
    const std::string name = needed(settings, "name");
    const Object* found = host.profile(lpar.place().lpar, name);
    refuseIf(found == nullptr, Fault::ProfileNotFound, {name});
    Object profile = *found;
    applyAll(host, profileRules(), settings, "lpar_id,lpar_name,name,new_name", profile);
    settle(host, settings, profile);
    renameProfile(change, lpar, given(settings, "new_name").value_or(name), profile);
    change.put(profile);
}

/// What others cannot do without stays: the adapters that clients are joined to, and the service
/// of paging to partitions with shared memory.
void requireUnused(const HostView& host, const Object& lpar) {
    const std::string id = lpar.get("lpar_id");
    const auto requireOther = [&](const Object& user, bool uses) {
        if (!uses || user.place().lpar == lpar.place().lpar) {
            return;
        }
        throw Failure(Fault::InUse, {std::to_string(user.place().lpar)});
    };
    for (Kind kind : {Kind::VirtualScsi, Kind::Serial}) {
        for (const Object& adapter : host.all(kind)) {
            requireOther(adapter, adapter.get("adapter_type") == "client" &&
                                      adapter.get("remote_lpar_id") == id);
        }
    }
    for (const Object& pool : host.all(Kind::MemPool)) {
        refuseIf(isListed(pool.get("psp_ids"), id), Fault::InUse, {id});
    }
    for (Kind kind : {Kind::Lpar, Kind::Profile}) {
        for (const Object& user : host.all(kind)) {
            requireOther(user,
                         user.get("primary_psp_id") == id || user.get("secondary_psp_id") == id);
        }
    }
}

void removeLpar(Change& change, const Operation&) {
    requireConnection(change.host());
    const Object lpar = change.lpar();
    requireStill(lpar);
    requireState(lpar, "Not Activated");
    requireUnused(change.host(), lpar);
    eraseLpar(change, change.host(), lpar);
}

/// The partition's default profile and the one that it runs with stay: it would name none.
void removeProfile(Change& change, const Operation&) {
    requireConnection(change.host());
    const Object lpar = change.lpar();
    requireStill(lpar);
    refuseIf(!change.request().has("-n"), Fault::MissingOption, {"-n"});
    const std::string name = change.request().value("-n");
    const Object* profile = change.host().profile(lpar.place().lpar, name);
    refuseIf(profile == nullptr, Fault::ProfileNotFound, {name});
    change.remove(*profile);
}

const std::string kHostNames = namesOf(hostRules(), "");
const std::string kLparNames = namesOf(lparRules(), "name,lpar_id");
const std::string kProfileNames = namesOf(profileRules(), "name,lpar_id,lpar_name,new_name");

}  // namespace

const std::vector<Operation> kConfigureOperations = {
    {{kEdplat, "sys", nullptr, nullptr, kHostNames.c_str()}, editHost},
    {{kEdplat, "lpar", nullptr, nullptr, kLparNames.c_str()}, editLpar},
    {{kEdplat, "prof", nullptr, nullptr, kProfileNames.c_str()}, editProfile},
    {{kNwplat, "lpar", nullptr, nullptr, newLparNames()}, makeLpar},
    {{kDlplat, "lpar", nullptr, nullptr}, removeLpar},
    {{kDlplat, "prof", nullptr, nullptr}, removeProfile},
};

}  // namespace appliance
