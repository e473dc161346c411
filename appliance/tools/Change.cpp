#include "Change.h"

#include <algorithm>
#include <ctime>
#include <nlohmann/json.hpp>

#include "Check.h"
#include "Failure.h"
#include "Help.h"
#include "LparState.h"

namespace appliance {

namespace {

using Json = nlohmann::ordered_json;

/// The attributes that @p object has set; where there is an @p other, those that differ between
/// them, whichever set them.
Json attributes(const Object& object, const std::optional<Object>& other) {
    Json json = Json::object();
    for (const Object* setter : {&object, other ? &*other : &object}) {
        for (const auto& setting : setter->settings()) {
            const std::string name(setting.first), value = object.get(name);
            if (!other || value != other->get(name)) json[name] = value;
        }
    }
    return json;
}

std::int64_t needed(const Request& request, const char* option, std::int64_t most) {
    if (!request.has(option)) throw Failure(Fault::MissingOption, {option});
    return request.number(option, 1, most, 0);
}

/// Whether @p state is one of @p states.
bool isOne(const std::string& state, std::initializer_list<const char*> states) {
    return std::any_of(states.begin(), states.end(), [&](const char* s) { return state == s; });
}

}  // namespace

Change::Change(const Request& request)
    : m_request(request),
      m_store(Store::open(Database::Access::Write)),
      m_transaction(m_store.write()),
      m_host(numberOf(request.value("-m"))) {}

std::int64_t Change::numberOf(const std::string& name) {
    if (name.empty()) throw Failure(Fault::MissingOption, {"-m"});
    return hostsNamed(m_store, name, '*').front()->host().place().host;
}

const HostView& Change::view(std::int64_t host) {
    std::unique_ptr<HostView>& view = m_views[host];
    if (!view) {
        view = std::make_unique<HostView>(m_store, *m_store.find(Kind::Host, {host, 0, 0}));
    }
    return *view;
}

const HostView& Change::host(const std::string& name) { return view(numberOf(name)); }

bool Change::isHost(const std::string& name) {
    const Hosts hosts = allHosts(m_store);
    return std::any_of(hosts.begin(), hosts.end(), [&](const auto& view) {
        return view->host().get("name") == name || view->mtms() == name;
    });
}

Object Change::lpar() {
    constexpr std::int64_t kMost = 65535;
    const std::int64_t id = needed(m_request, "--id", kMost);
    std::optional<Object> found = m_store.find(Kind::Lpar, {m_host, id, 0});
    if (!found) throw Failure(Fault::LparIdNotFound, {m_request.value("--id")});
    return std::move(*found);
}

void Change::keep(const Object& object) {
    const Place& place = object.place();
    const Key key{object.kind(), place.host, place.lpar, place.number};
    if (m_before.count(key) == 0) m_before.emplace(key, m_store.find(object.kind(), place));
}

// The object may be one of a view, which goes when the object is no longer used.

void Change::put(const Object& object) {
    const std::int64_t host = object.place().host;
    keep(object);
    m_store.put(object);
    m_views.erase(host);
}

void Change::remove(const Object& object) {
    const std::int64_t host = object.place().host;
    keep(object);
    m_store.remove(object.kind(), object.place());
    m_views.erase(host);
}

std::string Change::journalLine() {
    Json objects = Json::array();
    for (const auto& [key, before] : m_before) {
        const auto& [kind, host, lpar, number] = key;
        const std::optional<Object> after = m_store.find(kind, {host, lpar, number});
        if (!before && !after) continue;
        const char* event = !before ? "add" : !after ? "delete" : "modify";
        Json object = {{"event", event},
                       {"kind", kindName(kind)},
                       {"host", view(host).mtms()},
                       {"lpar", lpar},
                       {"number", number}};
        if (before) object["old"] = attributes(*before, after);
        if (after) object["new"] = attributes(*after, before);
        const bool same = before && after && object["new"].empty();
        if (!same) objects.push_back(std::move(object));
    }
    if (objects.empty()) return {};
    Json line = {{"tool", toolName(m_request.tool())}, {"time", std::time(nullptr)}};
    for (const auto& [name, values] : m_notes) {
        for (const auto& [key, value] : values) line[name][key] = value;
    }
    line["objects"] = std::move(objects);
    // Names may hold bytes that are no text in UTF-8, which the stored state keeps as they are.
    return line.dump(-1, ' ', false, Json::error_handler_t::replace);
}

void Change::note(const char* name, std::vector<std::pair<const char*, std::string>> values) {
    m_notes[name] = std::move(values);
}

void Change::verify() {
    std::set<std::int64_t> hosts;
    for (const auto& [key, before] : m_before) hosts.insert(std::get<1>(key));
    for (std::int64_t host : hosts) {
        const std::vector<std::string> findings = check(view(host));
        if (!findings.empty()) throw Failure(Fault::Unsound, {findings.front()});
    }
}

void Change::commit() {
    verify();
    const std::string line = journalLine();
    if (!line.empty()) m_store.append(line);
    m_transaction.commit();
}

void requireState(const HostView& host, std::initializer_list<const char*> states) {
    const std::string state = host.host().get("state");
    if (!isOne(state, states)) throw Failure(Fault::HostState, {host.host().get("name"), state});
}

void requireConnection(const HostView& host) {
    const std::string state = host.host().get("state");
    if (state == "No Connection") {
        throw Failure(Fault::HostState, {host.host().get("name"), state});
    }
}

void requireState(const Object& lpar, std::initializer_list<const char*> states) {
    const std::string state = lpar.get("state");
    if (!isOne(state, states)) throw Failure(Fault::LparState, {lpar.get("lpar_id"), state});
}

void requireStill(const Object& lpar) {
    if (isMoving(lpar)) throw Failure(Fault::LparMoving, {lpar.get("lpar_id")});
}

}  // namespace appliance
