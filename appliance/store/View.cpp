#include "View.h"

#include <algorithm>

#include "Text.h"

namespace appliance {

std::string HostView::mtms() const {
    return m_host.get("type_model") + '*' + m_host.get("serial_num");
}

const std::vector<Object>& HostView::all(Kind kind) const {
    const auto found = m_objects.find(kind);
    if (found != m_objects.end()) return found->second;
    return m_objects.emplace(kind, m_store.all(kind, m_host.place().host)).first->second;
}

const Object* HostView::lpar(std::int64_t id) const {
    const auto& lpars = all(Kind::Lpar);
    const auto found = std::lower_bound(
        lpars.begin(), lpars.end(), id,
        [](const Object& lpar, std::int64_t wanted) { return lpar.place().lpar < wanted; });
    return found != lpars.end() && found->place().lpar == id ? &*found : nullptr;
}

std::string HostView::lparName(const std::string& id) const {
    std::int64_t wanted = 0;
    const Object* found = wholeNumber(id, &wanted) ? lpar(wanted) : nullptr;
    return found == nullptr ? std::string() : found->get("name");
}

std::vector<std::unique_ptr<HostView>> allHosts(Store& store) {
    std::vector<std::unique_ptr<HostView>> hosts;
    for (Object& host : store.all(Kind::Host)) {
        hosts.push_back(std::make_unique<HostView>(store, std::move(host)));
    }
    return hosts;
}

Row rowOf(const HostView& view, const Object& object) {
    return {&view, &object, view.lpar(object.place().lpar)};
}

}  // namespace appliance
