// domove: the way of a partition from one host to another.
//
// A move is a chain of changes. The first keeps a place on the other host: the partition as it
// will be, not active, with its profiles and adapters, so that nobody else takes what it needs.
// Further ones count the bytes. The last makes the place the partition, and clears where it was.
// Whatever happens between two of them, the state is sound, and what is under way can be undone:
// "domove -o s" gives the place up whether the process that moves is there or not, and that
// process, if it is, finds at its next step that its move is no more.

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <random>
#include <set>
#include <thread>

#include "Activation.h"
#include "Adapters.h"
#include "LparState.h"
#include "NewLpar.h"
#include "Operation.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr int kSteps = 10;

/// What tells of a move at both of its ends.
constexpr const char* kTelling =
    "migration_state,migration_type,source_sys_name,dest_sys_name,source_lpar_id,dest_lpar_id,"
    "source_msp_name,source_msp_id,dest_msp_name,dest_msp_id,bytes_transmitted,bytes_remaining,"
    "migration_token";

std::string typeOf(const Object& lpar) { return isActive(lpar) ? "active" : "inactive"; }

bool holds(const Object& lpar, const Object& object) {
    return object.place().lpar == lpar.place().lpar;
}

/// The adapter to which a client is joined; null for other adapters.
const Object* serverOf(const HostView& host, const Object& client) {
    const auto server = serverOf(client);
    if (!server) {
        return nullptr;
    }
    for (const Object& other : host.all(client.kind(), server->first)) {
        if (other.place().number == server->second) {
            return &other;
        }
    }
    return nullptr;
}

// What is refused.

void requireMovable(const HostView& source, const Object& lpar) {
    const std::string id = lpar.get("lpar_id");
    requireStill(lpar);
    requireState(lpar, "Running,Not Activated");
    refuseIf(lpar.get("resource_config") == "0", Fault::NoResources, {id});
    refuseIf(lpar.get("lpar_env") == kIoServer || source.host().get("service_lpar_id") == id,
             Fault::LparStays, {id});
    for (Kind kind : kPhysical) {
        refuseIf(!source.all(kind, lpar.place().lpar).empty(), Fault::PhysicalAdapters, {id});
    }
    // Only for disks is there another server where the partition goes.
    for (Kind kind : {Kind::VirtualScsi, Kind::Serial}) {
        for (const Object& adapter : source.all(kind)) {
            const auto server = serverOf(adapter);
            const bool isClient = server && kind == Kind::Serial && holds(lpar, adapter);
            if (!isClient && !(server && server->first == lpar.place().lpar)) {
                continue;
            }
            const std::int64_t slot = isClient ? adapter.place().number : server->second;
            throw Failure(Fault::JoinedAdapters, {std::to_string(slot)});
        }
    }
}

/// Of a host at either end.
void requireCapable(const HostView& host, const std::string& type) {
    const Row row{&host, &host.host()};
    const std::string name = host.host().get("name");
    requireState(host, "Operating");
    refuseIf(host.host().get(type + "_lpar_mobility_capable") != "1", Fault::NotMovable, {name});
    const std::int64_t moves = number(valueOf(row, "num_" + type + "_migrations_in_progress"));
    refuseIf(moves >= number(host.host().get("num_" + type + "_migrations_supported")),
             Fault::TooManyMoves, {name});
}

void requireRoom(const HostView& target, const Object& lpar) {
    const bool isShared = lpar.get("mem_mode") == "shared";
    refuseIf(isShared && target.all(Kind::MemPool).empty(), Fault::NoPool, {"mem_mode"});
    for (const std::string quantity : {"mem", "proc_units"}) {
        if (isShared && quantity == "mem") {
            continue;
        }
        for (const std::string when : {"curr_", "pend_"}) {
            const std::string attribute = std::string(when).append("avail_sys_").append(quantity);
            const std::string left = valueOf({&target, &target.host()}, attribute);
            refuseIf(hundredths(left) < hundredths(lpar.get(when + quantity)), Fault::NotEnough,
                     {attribute, left});
        }
    }
    const std::string modes = target.host().get("lpar_proc_compat_modes");
    for (const char* mode : {"desired_lpar_proc_compat_mode", "curr_lpar_proc_compat_mode"}) {
        refuseIf(!isListed(modes, lpar.get(mode)), Fault::NotCapable, {mode});
    }
}

/// Whether a partition can do what I/O servers do for a move.
bool isRunningServer(const Object& lpar) {
    return lpar.get("lpar_env") == kIoServer && lpar.get("state") == "Running";
}

/// The I/O server that carries the memory of active partitions.
const Object& moverOf(const HostView& host) {
    for (const Object& lpar : host.all(Kind::Lpar)) {
        if (isRunningServer(lpar)) {
            return lpar;
        }
    }
    throw Failure(Fault::NoMover, {host.host().get("name")});
}

// The place.

/// Adapters that serve the clients of a partition that comes to a host.
class Servers {
public:
    /// @param mustRun  only I/O servers that run are of use
    Servers(const HostView& host, bool mustRun) : m_host(host), m_mustRun(mustRun) {
        for (Kind kind : kVirtual) {
            for (const Object& adapter : host.all(kind)) {
                m_used.insert(slotOf(adapter));
            }
        }
    }

    /// Joins @p client to a new adapter, which is given back; what is behind it is as behind
    /// @p before.
    /// @throws Failure NoServerSlot
    Object join(Object& client, const Object& before) {
        const VirtualSlot slot = take();
        Object server(client.kind(), {client.place().host, slot.first, slot.second},
                      before.stored());
        server.set("remote_lpar_id", std::to_string(client.place().lpar));
        server.set("remote_slot_num", std::to_string(client.place().number));
        client.set("remote_lpar_id", std::to_string(slot.first));
        client.set("remote_slot_num", std::to_string(slot.second));
        return server;
    }

private:
    VirtualSlot take() {
        constexpr std::int64_t kFirst = 2;  // behind the consoles
        for (const Object& lpar : m_host.all(Kind::Lpar)) {
            if (lpar.get("lpar_env") != kIoServer || (m_mustRun && !isRunningServer(lpar))) {
                continue;
            }
            const std::int64_t end = number(lpar.get("curr_max_virtual_slots"));
            for (std::int64_t slot = kFirst; slot < end; ++slot) {
                if (m_used.emplace(lpar.place().lpar, slot).second) {
                    return {lpar.place().lpar, slot};
                }
            }
        }
        throw Failure(Fault::NoServerSlot, {m_host.host().get("name")});
    }

    const HostView& m_host;
    bool m_mustRun;
    std::set<VirtualSlot> m_used;
};

/// The adapters of @p lpar for @p place, those of disks behind the servers that come with them.
std::vector<Object> adaptersFor(const HostView& source, const Object& lpar, const HostView& target,
                                const Place& place) {
    Servers servers(target, isActive(lpar));
    std::vector<Object> adapters;
    for (Kind kind : kVirtual) {
        for (const Object& adapter : source.all(kind, lpar.place().lpar)) {
            Object moved = adapter.movedTo(place);
            moved.set("state", "0");
            if (kind == Kind::Ethernet &&
                target.find(kind, "mac_addr", moved.get("mac_addr")) != nullptr) {
                moved.set("mac_addr", newMac(target, moved.place()));
            }
            if (const Object* server = serverOf(source, adapter)) {
                adapters.push_back(servers.join(moved, *server));
            }
            adapters.push_back(std::move(moved));
        }
    }
    return adapters;
}

/// Makes the list of disk adapters of a profile say of each what @p adapters say of it.
void rejoin(Object& profile, const std::vector<Object>& adapters) {
    const AdapterForm& form = *adapterForm(Kind::VirtualScsi);
    std::vector<std::string> elements;
    for (const std::string& element : elementsOf(form.list, profile.get(form.list))) {
        Object adapter = adapterFromElement(form, profile.place(), element);
        for (const Object& now : adapters) {
            if (now.kind() != form.kind || slotOf(now) != slotOf(adapter) || !serverOf(adapter)) {
                continue;
            }
            for (const char* name : {"remote_lpar_id", "remote_slot_num"}) {
                adapter.set(name, now.get(name));
            }
        }
        elements.push_back(adapterElement(form, adapter));
    }
    profile.update(form.list, adapterList(elements));
}

/// Takes from a partition or a profile what only its former host has.
void detach(Object& object, const HostView& target) {
    const bool isProfile = object.kind() == Kind::Profile;
    for (const char* name :
         {"power_ctrl_lpar_ids", "work_group_id", "hsl_pool_id", "virtual_opti_pool_id"}) {
        object.update(name, "none");
    }
    if (isProfile) {
        object.update("io_slots", "none");
    }
    for (const std::string when : {"pend_", "curr_"}) {
        const std::string name = (isProfile ? "" : when) + "shared_proc_pool_id";
        if (object.get(name) != "null") {
            object.update(name, "0");
        }
    }
    if (object.get("mem_mode") != "shared" || target.all(Kind::MemPool).empty()) {
        return;
    }
    const auto servers = split(target.all(Kind::MemPool).front().get("psp_ids"));
    object.update("primary_psp_id", servers.front());
    object.update("secondary_psp_id", servers.size() > 1 ? servers[1] : "none");
    if (!isProfile) {
        object.update("curr_psp_id", servers.front());
    }
}

/// The partition as it will be, not active yet, and all that it will have; itself first.
std::vector<Object> placeFor(const HostView& source, const Object& lpar, const HostView& target) {
    const Place place{target.host().place().host, newId(target, {}), 0};
    std::vector<Object> objects = {lpar.movedTo(place)};
    setInactive(objects.front(), "Not Activated");
    const std::vector<Object> adapters = adaptersFor(source, lpar, target, place);
    for (const Object& profile : source.all(Kind::Profile, lpar.place().lpar)) {
        objects.push_back(profile.movedTo(place));
        rejoin(objects.back(), adapters);
    }
    for (Object& object : objects) {
        detach(object, target);
    }
    objects.insert(objects.end(), adapters.begin(), adapters.end());
    return objects;
}

/// Removes a partition with all that it has, and the adapters that serve it.
void vacate(Change& change, const HostView& host, const Object& lpar) {
    std::vector<Object> servers;
    for (const Object& client : host.all(Kind::VirtualScsi, lpar.place().lpar)) {
        if (const Object* server = serverOf(host, client)) {
            servers.push_back(*server);
        }
    }
    eraseLpar(change, host, lpar);
    for (const Object& server : servers) {
        change.remove(server);
    }
}

// The move.

/// Both ends of a move. The source's tells of it, and the place's says the same.
struct Ends {
    Object lpar;
    Object place;

    void tell(const std::string& name, const std::string& value) {
        lpar.set(name, value);
        place.set(name, value);
    }
    void beStill() {
        for (std::string_view name : namesIn(kTelling)) {
            lpar.unset(name);
            place.unset(name);
        }
    }
};

/// For those who follow the journal, which shows of the objects only what has changed.
void note(Change& change, const Object& lpar, const char* state) {
    const std::int64_t sent = number(lpar.get("bytes_transmitted"));
    const std::int64_t left = number(lpar.get("bytes_remaining"));
    change.note("move", {{"state", state},
                         {"type", lpar.get("migration_type")},
                         {"lpar_name", lpar.get("name")},
                         {"source", change.host().mtms()},
                         {"source_sys_name", lpar.get("source_sys_name")},
                         {"source_lpar_id", lpar.get("source_lpar_id")},
                         {"dest", change.host(lpar.get("dest_sys_name")).mtms()},
                         {"dest_sys_name", lpar.get("dest_sys_name")},
                         {"dest_lpar_id", lpar.get("dest_lpar_id")},
                         {"bytes_total", std::to_string(sent + left)},
                         {"bytes_transmitted", std::to_string(sent)},
                         {"bytes_remaining", std::to_string(left)}});
}

std::string newToken() {
    std::random_device device;
    return hex(device(), 8) + hex(device(), 8);
}

/// Keeps the place for the partition that --id names on the host that -t names.
/// @return the partition, which now tells of its move
Object reserve(Change& change) {
    const Request& request = change.request();
    const HostView& from = change.host();
    const std::string target = request.value("-t");
    refuseIf(target.empty(), Fault::MissingOption, {"-t"});
    refuseIf(request.has("--ip"), Fault::OtherManager, {request.value("--ip")});
    const Object lpar = change.lpar();
    const HostView& to = change.host(target);
    const std::string type = typeOf(lpar);
    refuseIf(&from == &to, Fault::NotMovable, {to.host().get("name")});
    requireMovable(from, lpar);
    requireCapable(from, type);
    requireCapable(to, type);
    requireFreeName(to, lpar.get("name"));
    requireRoom(to, lpar);
    const Object* movers[] = {isActive(lpar) ? &moverOf(from) : nullptr,
                              isActive(lpar) ? &moverOf(to) : nullptr};

    std::vector<Object> objects = placeFor(from, lpar, to);
    Ends ends{lpar, objects.front()};
    // What an inactive partition sends is its configuration.
    const std::int64_t bytes = isActive(lpar) ? number(lpar.get("run_mem")) << 20 : 1 << 20;
    ends.tell("migration_state", "Migration Starting");
    ends.tell("migration_type", type);
    ends.tell("source_sys_name", from.host().get("name"));
    ends.tell("dest_sys_name", to.host().get("name"));
    ends.tell("source_lpar_id", lpar.get("lpar_id"));
    ends.tell("dest_lpar_id", std::to_string(ends.place.place().lpar));
    ends.tell("bytes_transmitted", "0");
    ends.tell("bytes_remaining", std::to_string(bytes));
    ends.tell("migration_token", newToken());
    for (int end = 0; end < 2 && movers[end] != nullptr; ++end) {
        const std::string msp = end == 0 ? "source_msp_" : "dest_msp_";
        ends.tell(msp + "name", movers[end]->get("name"));
        ends.tell(msp + "id", movers[end]->get("lpar_id"));
    }
    objects.front() = ends.place;
    change.put(ends.lpar);
    for (const Object& object : objects) {
        change.put(object);
    }
    note(change, ends.lpar, "Migration Starting");
    return ends.lpar;
}

/// @throws Failure NotMoving
Ends endsOf(Change& change) {
    Object lpar = change.lpar();
    const HostView& from = change.host();
    auto place = from.lparElsewhere(lpar.get("dest_sys_name"), number(lpar.get("dest_lpar_id")));
    refuseIf(!isMoving(lpar) || lpar.get("source_sys_name") != from.host().get("name") || !place,
             Fault::NotMoving, {lpar.get("lpar_id")});
    return {std::move(lpar), std::move(*place)};
}

/// The ends of the move with this token.
/// @throws Failure MoveStopped there is no such move any more
Ends endsOf(Change& change, const std::string& token) {
    change.host();  // what keeps it from starting has not stopped the move
    try {
        Ends ends = endsOf(change);
        if (ends.lpar.get("migration_token") == token) {
            return ends;
        }
    } catch (const Failure&) {
        // Of whatever kind: the partition itself may be gone.
    }
    throw Failure(Fault::MoveStopped, {change.request().value("--id")});
}

void advance(Change& change, Ends ends, int step) {
    const std::int64_t before = number(ends.lpar.get("bytes_transmitted"));
    const std::int64_t total = before + number(ends.lpar.get("bytes_remaining"));
    const std::int64_t sent = step == kSteps ? total : total / kSteps * step;
    ends.tell("migration_state", "Migration In Progress");
    ends.tell("bytes_transmitted", std::to_string(sent));
    ends.tell("bytes_remaining", std::to_string(total - sent));
    change.put(ends.lpar);
    change.put(ends.place);
    note(change, ends.lpar, "Migration In Progress");
    change.commit();
}

void arrive(Change& change, Ends ends) {
    note(change, ends.lpar, "Migration Complete");
    const std::string state = ends.lpar.get("state"), target = ends.lpar.get("dest_sys_name");
    vacate(change, change.host(), ends.lpar);
    ends.beStill();
    enter(change, change.host(target), {ends.place}, state.c_str());
    change.commit();
}

void giveUp(Change& change, Ends ends) {
    note(change, ends.lpar, "Migration Stopped");
    vacate(change, change.host(ends.lpar.get("dest_sys_name")), ends.place);
    ends.beStill();
    change.put(ends.lpar);
    change.commit();
}

/// How long a move takes, in seconds.
double duration() {
    constexpr double kUsual = 3, kMost = 86'400;
    const char* text = std::getenv("APPLIANCE_MOVE_SECONDS");
    if (text == nullptr) {
        return kUsual;
    }
    char* end = nullptr;
    const double seconds = std::strtod(text, &end);
    return end == text || !(seconds >= 0) ? kUsual : std::min(seconds, kMost);
}

// The operations.

void validateMove(Change& change, const Operation&) { reserve(change); }

void move(Change& first, const Operation&) {
    const auto start = std::chrono::steady_clock::now();
    const std::chrono::duration<double> pause(duration() / kSteps);
    const std::string token = reserve(first).get("migration_token");
    first.commit();
    const Request& request = first.request();
    try {
        for (int step = 1; step <= kSteps; ++step) {
            std::this_thread::sleep_until(start + step * pause);
            Change change(request);
            advance(change, endsOf(change, token), step);
        }
        Change change(request);
        arrive(change, endsOf(change, token));
    } catch (const Failure& failure) {
        if (failure.fault() == Fault::MoveStopped) {
            throw;
        }
        Change change(request);
        giveUp(change, endsOf(change, token));
        throw;
    }
}

void stopMove(Change& change, const Operation&) { giveUp(change, endsOf(change)); }

}  // namespace

const std::vector<Operation> kMoveOperations = {
    {{kDomove, nullptr, nullptr, "v"}, validateMove, true},
    {{kDomove, nullptr, nullptr, "m"}, move},
    {{kDomove, nullptr, nullptr, "s"}, stopMove},
};

}  // namespace appliance
