#include "Change.h"

#include <algorithm>
#include <ctime>
#include <set>

#include "Check.h"
#include "Failure.h"
#include "Json.h"
#include "LparState.h"
#include "Text.h"

namespace appliance {

const HostView& Change::host() {
    if (!m_session) {
        m_session = std::make_unique<Session>();
        m_host = numberOf(m_request.value("-m"));
    }
    return view(m_host);
}

std::int64_t Change::numberOf(const std::string& name) {
    refuseIf(name.empty(), Fault::MissingOption, {"-m"});
    return hostsNamed(m_session->store, name, '*').front()->host().place().host;
}

const HostView& Change::view(std::int64_t host) {
    std::unique_ptr<HostView>& view = m_session->views[host];
    if (!view) {
        Store& store = m_session->store;
        std::optional<Object> found = store.find(Kind::Host, {host, 0, 0});
        refuseIf(!found, Fault::StateUnusable,
                 {"appliance.db", "host " + std::to_string(host) + " is missing"});
        view = std::make_unique<HostView>(store, std::move(*found));
    }
    return *view;
}

const HostView& Change::host(const std::string& name) { return view(numberOf(name)); }

bool Change::isHost(const std::string& name) {
    const Hosts hosts = allHosts(m_session->store);
    return std::any_of(hosts.begin(), hosts.end(), [&](const auto& view) {
        return view->host().get("name") == name || view->mtms() == name;
    });
}

Object Change::lpar() {
    constexpr std::int64_t kMost = 65535;
    host();
    refuseIf(!m_request.has("--id"), Fault::MissingOption, {"--id"});
    const std::int64_t id = m_request.number("--id", 1, kMost, 0);
    std::optional<Object> found = m_session->store.find(Kind::Lpar, {m_host, id, 0});
    refuseIf(!found, Fault::LparIdNotFound, {m_request.value("--id")});
    return std::move(*found);
}

void Change::keep(const Object& object) {
    const std::pair key(object.kind(), object.place());
    if (m_before.count(key) != 0) {
        return;
    }
    m_before.emplace(key, m_session->store.find(key.first, key.second));
}

// The object may be one of a view, which goes when the object is no longer used.

void Change::put(const Object& object) {
    const std::int64_t host = object.place().host;
    keep(object);
    m_session->store.put(object);
    m_session->views.erase(host);
}

void Change::remove(const Object& object) {
    const std::int64_t host = object.place().host;
    keep(object);
    m_session->store.remove(object.kind(), object.place());
    m_session->views.erase(host);
}

std::string Change::journalLine() {
    std::vector<ChangedObject> objects;
    for (const auto& [key, before] : m_before) {
        const auto& [kind, place] = key;
        std::optional<Object> after = m_session->store.find(kind, place);
        if (before || after) {
            objects.push_back({view(place.host).mtms(), before, std::move(after)});
        }
    }
    return appliance::journalLine(m_request.tool().name, std::time(nullptr), m_notes, objects);
}

void Change::note(const char* name, std::vector<std::pair<const char*, std::string>> values) {
    m_notes[name] = std::move(values);
}

void Change::verify() {
    std::set<std::int64_t> hosts;
    for (const auto& [key, before] : m_before) {
        hosts.insert(key.second.host);
    }
    for (std::int64_t host : hosts) {
        const std::vector<std::string> findings = check(view(host));
        if (!findings.empty()) {
            throw Failure(Fault::Unsound, {findings.front()});
        }
    }
}

void Change::commit() {
    if (!m_session) {
        return;
    }
    verify();
    const std::string line = journalLine();
    if (!line.empty()) {
        m_session->store.append(line);
    }
    m_session->transaction.commit();
    m_session.reset();
}

void requireState(const HostView& host, const char* states) {
    const std::string state = host.host().get("state");
    refuseIf(!isListed(states, state), Fault::HostState, {host.host().get("name"), state});
}

void requireConnection(const HostView& host) {
    const std::string state = host.host().get("state");
    refuseIf(state == "No Connection", Fault::HostState, {host.host().get("name"), state});
}

void requireState(const Object& lpar, const char* states) {
    const std::string state = lpar.get("state");
    refuseIf(!isListed(states, state), Fault::LparState, {lpar.get("lpar_id"), state});
}

void requireStill(const Object& lpar) {
    refuseIf(isMoving(lpar), Fault::LparMoving, {lpar.get("lpar_id")});
}

}  // namespace appliance
