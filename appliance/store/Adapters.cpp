#include "Adapters.h"

#include <algorithm>
#include <cstring>
#include <iterator>

#include "Text.h"

namespace appliance {

namespace {

std::string withRemoteName(const AdapterForm& form, const HostView& view, std::string element) {
    std::vector<std::size_t> slashes;
    for (std::size_t i = 0; i < element.size(); ++i) {
        if (element[i] == '/') slashes.push_back(i);
    }
    if (slashes.size() < form.remoteName) return element;
    const std::size_t id = slashes[form.remoteId - 1] + 1;
    const std::string name = view.lparName(element.substr(id, slashes[form.remoteId] - id));
    return element.insert(slashes[form.remoteName - 1] + 1, name);
}

}  // namespace

const AdapterForm* adapterForm(Kind kind) {
    const auto* found = std::find_if(std::begin(kAdapterForms), std::end(kAdapterForms),
                                     [&](const AdapterForm& form) { return form.kind == kind; });
    return found == std::end(kAdapterForms) ? nullptr : found;
}

std::string adapterElement(const AdapterForm& form, const Object& adapter) {
    std::string element;
    for (const char* const* field = form.fields; *field != nullptr; ++field) {
        if (field != form.fields) element += '/';
        if (**field != '\0') element += adapter.get(*field);
    }
    return element;
}

std::string adapterList(const std::vector<std::string>& elements) {
    return elements.empty() ? "none" : joined(elements);
}

std::string namedAdapters(const Row& row, const char* key) {
    std::string list = row.self->get(key);
    const auto* form =
        std::find_if(std::begin(kAdapterForms), std::end(kAdapterForms),
                     [&](const AdapterForm& f) { return !std::strcmp(f.list, key); });
    if (list == "none" || form == std::end(kAdapterForms) || form->remoteId == 0) return list;
    std::vector<std::string> elements = split(list);
    for (std::string& element : elements) {
        element = withRemoteName(*form, *row.view, std::move(element));
    }
    return joined(elements);
}

}  // namespace appliance
