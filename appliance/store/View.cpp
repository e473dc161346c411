#include "View.h"

#include <algorithm>

#include "Failure.h"
#include "Text.h"

namespace appliance {

std::string HostView::mtms() const {
    return m_host.get("type_model") + '*' + m_host.get("serial_num");
}

std::int64_t HostView::memRegion() const {
    return std::max<std::int64_t>(1, number(m_host.get("mem_region_size")));
}

const std::vector<Object>& HostView::all(Kind kind) const {
    const auto found = m_objects.find(kind);
    if (found != m_objects.end()) {
        return found->second;
    }
    return m_objects.emplace(kind, m_store.all(kind, m_host.place().host)).first->second;
}

Objects HostView::all(Kind kind, std::int64_t lpar) const {
    const std::vector<Object>& objects = all(kind);
    const auto first = std::lower_bound(
        objects.begin(), objects.end(), lpar,
        [](const Object& object, std::int64_t wanted) { return object.place().lpar < wanted; });
    const auto last = std::find_if(
        first, objects.end(), [&](const Object& object) { return object.place().lpar != lpar; });
    const Object* data = objects.data();
    return {data + (first - objects.begin()), data + (last - objects.begin())};
}

const Object* HostView::find(Kind kind, const char* attribute, const std::string& value) const {
    for (const Object& object : all(kind)) {
        if (object.get(attribute) == value) {
            return &object;
        }
    }
    return nullptr;
}

const Object* HostView::lpar(std::int64_t id) const {
    const Objects found = all(Kind::Lpar, id);
    return found.empty() ? nullptr : found.first;
}

const Object* HostView::profile(std::int64_t lpar, const std::string& name) const {
    for (const Object& profile : all(Kind::Profile, lpar)) {
        if (profile.get("name") == name) {
            return &profile;
        }
    }
    return nullptr;
}

std::string HostView::lparName(const std::string& id) const {
    std::int64_t wanted = 0;
    const Object* found = wholeNumber(id, &wanted) ? lpar(wanted) : nullptr;
    return found == nullptr ? std::string() : found->get("name");
}

std::optional<Object> HostView::lparElsewhere(const std::string& host, std::int64_t id) const {
    for (const Object& other : m_store.all(Kind::Host)) {
        if (other.get("name") == host) {
            return m_store.find(Kind::Lpar, {other.place().host, id, 0});
        }
    }
    return std::nullopt;
}

Hosts allHosts(Store& store) {
    Hosts hosts;
    for (Object& host : store.all(Kind::Host)) {
        hosts.push_back(std::make_unique<HostView>(store, std::move(host)));
    }
    return hosts;
}

Hosts hostsNamed(Store& store, const std::string& name, char joint) {
    Hosts all = allHosts(store);
    if (name.empty()) {
        return all;
    }
    Hosts found;
    for (auto& host : all) {
        const Object& self = host->host();
        if (self.get("name") == name ||
            self.get("type_model") + joint + self.get("serial_num") == name) {
            found.push_back(std::move(host));
        }
    }
    if (found.empty()) {
        throw Failure(Fault::HostNotFound, {name});
    }
    return found;
}

Row rowOf(const HostView& view, const Object& object) {
    return {&view, &object, view.lpar(object.place().lpar)};
}

}  // namespace appliance
