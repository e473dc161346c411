// edpower and edsusp: the states of hosts and partitions.

#include <algorithm>
#include <map>

#include "Activation.h"
#include "LparState.h"
#include "Operation.h"
#include "Text.h"

namespace appliance {

namespace {

/// The option's value, which must be one of @p words (with commas between them).
/// @throws Failure MissingOption, BadOptionValue
std::string oneOf(const Request& request, const char* option, const char* words) {
    refuseIf(!request.has(option), Fault::MissingOption, {option});
    std::string value = request.value(option);
    refuseIf(!isListed(words, value), Fault::BadOptionValue, {option, value});
    return value;
}

// Partitions.

/// An I/O server through which a partition moves must stay until it is there.
void requireNoMoveThrough(const HostView& host, const Object& server) {
    for (const Object& lpar : host.all(Kind::Lpar)) {
        const bool leaves = lpar.get("source_sys_name") == host.host().get("name");
        refuseIf(isMoving(lpar) &&
                     lpar.get(leaves ? "source_msp_id" : "dest_msp_id") == server.get("lpar_id"),
                 Fault::InUse, {lpar.get("lpar_id")});
    }
}

void startLpar(Change& change, const Operation&) {
    const Request& request = change.request();
    const std::string bootMode =
        request.has("-b") ? oneOf(request, "-b", "norm,dd,ds,of,sms") : std::string();
    const Object lpar = change.lpar();
    const std::string last = lpar.get("curr_profile");
    const std::string usual = last.empty() ? lpar.get("default_profile") : last;
    Activation activation(change.host());
    activation.start(lpar, request.has("-f") ? request.value("-f") : usual, bootMode);
    activation.apply(change);
}

void stopLpar(Change& change, const Operation& operation) {
    Object lpar = change.lpar();
    requireState(change.host(), "Operating");
    requireStill(lpar);
    // Otherwise it must run, so that the system can end itself, or write its dump.
    const bool isHard = std::string(operation.last) == "shutdown";
    requireState(lpar, isHard ? "Running,Open Firmware,Error" : "Running");
    requireNoMoveThrough(change.host(), lpar);
    const bool restarts =
        change.request().has("--restart") || std::string(operation.last) == "dumprestart";
    if (restarts) {
        clearRefcode(lpar);
    }
    enter(change, change.host(), {lpar}, restarts ? "Running" : "Not Activated");
}

void turnKey(Change& change, const Operation&) {
    const std::string position = oneOf(change.request(), "-k", "norm,manual");
    Object lpar = change.lpar();
    requireConnection(change.host());
    requireStill(lpar);
    lpar.set("lpar_keylock", position);
    change.put(lpar);
}

// System profiles.

struct LparProfile {
    std::int64_t lpar;
    std::string profile;
};

/// @throws Failure NoSuchSystemProfile
std::vector<LparProfile> systemProfile(const HostView& host, const std::string& name) {
    const Object* system = host.find(Kind::SystemProfile, "name", name);
    refuseIf(system == nullptr, Fault::NoSuchSystemProfile, {name});
    std::map<std::string, std::string> profiles;
    for (const Object& profile : host.all(Kind::Profile)) {
        const Place& place = profile.place();
        profiles[std::to_string(place.lpar) + '/' + std::to_string(place.number)] =
            profile.get("name");
    }
    std::vector<LparProfile> lpars;
    for (const std::string& element : split(system->get("lpar_profiles"))) {
        lpars.push_back({number(element), profiles[element]});
    }
    return lpars;
}

/// Starts those that do not run yet, in this order.
/// @param passOver  a partition that cannot start is left as it is
void start(Activation& activation, const HostView& host, const std::vector<LparProfile>& lpars,
           bool passOver) {
    for (const LparProfile& row : lpars) {
        const Object* lpar = host.lpar(row.lpar);
        if (lpar == nullptr || isActive(*lpar) || activation.hasStarted(*lpar)) {
            continue;
        }
        try {
            activation.start(*lpar, row.profile, "");
        } catch (const Failure&) {
            if (!passOver) {
                throw;
            }
        }
    }
}

void startSystemProfile(Change& change, const Operation& operation) {
    const Request& request = change.request();
    refuseIf(!request.has("-n"), Fault::MissingOption, {"-n"});
    refuseIf(!operation.isTest && request.has("--test"), Fault::BadOptionValue, {"-o", "on"});
    const HostView& host = change.host();
    requireState(host, "Operating,Standby");
    Activation activation(host);
    start(activation, host, systemProfile(host, request.value("-n")), request.has("--continue"));
    activation.apply(change);
}

// Hosts.

/// Which partitions start with the host.
std::vector<LparProfile> lparsToStart(const HostView& host, const Request& request) {
    if (request.value("-o") == "onsysprof") {
        return systemProfile(host, request.value("-f"));
    }
    std::vector<LparProfile> lpars;
    for (const Object& lpar : host.all(Kind::Lpar)) {
        if (lpar.get("auto_start") != "1") {
            continue;
        }
        lpars.push_back({lpar.place().lpar, lpar.get("default_profile")});
    }
    return lpars;
}

/// A host that is powered on takes up what was set for that moment.
void setState(Change& change, const std::string& state) {
    Object host = change.host().host();
    if (state != "Power Off" && host.get("state") != "Standby") {
        for (const std::string& what :
             split("sys_keylock,power_on_side,power_on_speed,power_on_speed_override,"
                   "mfg_default_ipl_source,mfg_default_boot_mode")) {
            host.set("curr_" + what, host.get("pend_" + what));
        }
        host.set("power_on_option", host.get("pend_power_on_option"));
    }
    host.set("state", state);
    change.put(host);
}

/// Makes a host without active partitions operate. What cannot start does not keep it from that.
void operate(Change& change) {
    const std::vector<LparProfile> lpars = lparsToStart(change.host(), change.request());
    setState(change, "Operating");
    Activation activation(change.host());
    start(activation, change.host(), lpars, true);
    activation.apply(change);
}

void startHost(Change& change, const Operation& operation) {
    const std::string name = operation.last;
    refuseIf(name == "onsysprof" && !change.request().has("-f"), Fault::MissingOption, {"-f"});
    const bool standsBy = name == "onstandby";
    requireState(change.host(), standsBy ? "Power Off" : "Power Off,Standby");
    if (standsBy) {
        return setState(change, "Standby");
    }
    operate(change);
}

void stopHost(Change& change, const Operation&) {
    const bool restarts = change.request().has("--restart");
    const bool isImmediate = change.request().has("--immed");
    refuseIf(restarts && !isImmediate, Fault::MissingOption, {"--immed"});
    const HostView& host = change.host();
    requireState(host, "Operating,Standby,Error");
    std::vector<Object> active;
    for (const Object& lpar : host.all(Kind::Lpar)) {
        requireStill(lpar);
        if (isActive(lpar)) {
            active.push_back(lpar);
        }
    }
    refuseIf(!active.empty() && !isImmediate, Fault::LparsActive);
    enter(change, host, active, "Not Activated");
    if (restarts) {
        return operate(change);
    }
    setState(change, "Power Off");
}

/// The appliance keeps nothing of a host that could differ from the host itself, so there is
/// nothing to build anew: only a host that it cannot reach refuses.
void rebuildHost(Change& change, const Operation&) { requireConnection(change.host()); }

// Suspension. It takes no time here, so it is never found under way, nor does it fail halfway.

void requireSuspendable(const HostView& host, const Object& lpar) {
    requireState(host, "Operating");
    requireStill(lpar);
    requireState(lpar, "Running");
    const std::string id = lpar.get("lpar_id");
    refuseIf(host.host().get("lpar_suspend_capable") != "1" || lpar.get("suspend_capable") != "1",
             Fault::NotSuspendable, {id});
    refuseIf(lpar.get("lpar_env") == "xbrgserver", Fault::LparStays, {id});
    refuseIf(!host.all(Kind::Slot, lpar.place().lpar).empty(), Fault::PhysicalAdapters, {id});
}

/// What each operation on a suspension needs, and to which state it leads.
struct Suspension {
    const char* name;
    bool hasSubject;   ///< -t suspend must be given
    const char* from;  ///< state; null when nothing can be done
    const char* to;    ///< state; null when the operation only asks
};

constexpr Suspension kSuspensions[] = {
    {"suspend", false, "Running", "Suspended"}, {"resume", false, "Suspended", "Running"},
    {"validate", true, "Running", nullptr},     {"cancel", true, nullptr, nullptr},
    {"recover", true, nullptr, nullptr},        {"shutdown", true, "Suspended", "Not Activated"},
};

void suspend(Change& change, const Operation& operation) {
    const Suspension& row =
        *std::find_if(std::begin(kSuspensions), std::end(kSuspensions),
                      [&](const Suspension& s) { return std::string(s.name) == operation.last; });
    const Request& request = change.request();
    if (row.hasSubject || request.has("-t")) {
        oneOf(request, "-t", "suspend");
    }
    const Object lpar = change.lpar();
    refuseIf(row.from == nullptr, Fault::NoSuspension, {request.value("--id")});
    if (std::string(row.from) == "Running") {
        requireSuspendable(change.host(), lpar);
    } else {
        requireState(change.host(), "Operating");
        requireState(lpar, row.from);
    }
    if (row.to != nullptr) {
        enter(change, change.host(), {lpar}, row.to);
    }
}

}  // namespace

const std::vector<Operation> kPowerOperations = {
    {{kEdpower, "lpar", nullptr, "on"}, startLpar},
    {{kEdpower, "lpar", nullptr, "shutdown"}, stopLpar},
    {{kEdpower, "lpar", nullptr, "osshutdown"}, stopLpar},
    {{kEdpower, "lpar", nullptr, "dumprestart"}, stopLpar},
    {{kEdpower, "lpar", nullptr, "chkey"}, turnKey},
    {{kEdpower, "sys", nullptr, "on"}, startHost},
    {{kEdpower, "sys", nullptr, "onstandby"}, startHost},
    {{kEdpower, "sys", nullptr, "onsysprof"}, startHost},
    {{kEdpower, "sys", nullptr, "off"}, stopHost},
    {{kEdpower, "sys", nullptr, "rebuild"}, rebuildHost},
    {{kEdpower, "sysprof", nullptr, "on"}, startSystemProfile},
    {{kEdpower, "sysprof", nullptr, nullptr}, startSystemProfile, true},
    {{kEdsusp, nullptr, nullptr, "suspend"}, suspend},
    {{kEdsusp, nullptr, nullptr, "resume"}, suspend},
    {{kEdsusp, nullptr, nullptr, "validate"}, suspend},
    {{kEdsusp, nullptr, nullptr, "cancel"}, suspend},
    {{kEdsusp, nullptr, nullptr, "recover"}, suspend},
    {{kEdsusp, nullptr, nullptr, "shutdown"}, suspend},
};

}  // namespace appliance
