#include "Filter.h"
#include "Resource.h"
#include "Text.h"

namespace appliance {

namespace {

// In no other language and word: the callers of the tools compare the answer with this sentence
// to tell an empty answer from records.
constexpr const char* kNothing = "No results were found.\n";

std::vector<std::string> wantedAttributes(const Resource& resource, const std::string& names) {
    std::vector<std::string> wanted = split(names.empty() ? resource.attributes : names);
    for (const std::string& name : wanted) {
        refuseIf(!isListed(resource.attributes, name), Fault::UnknownAttribute, {name});
    }
    return wanted;
}

std::string records(const std::vector<Row>& rows, const std::vector<std::string>& attributes,
                    bool withNames) {
    std::string text;
    for (const Row& row : rows) {
        const char* comma = "";
        for (const std::string& attribute : attributes) {
            std::string value = valueOf(row, attribute);
            if (withNames) {
                value.insert(0, attribute + '=');
            }
            text.append(comma).append(quoted(value));
            comma = ",";
        }
        text += '\n';
    }
    return text;
}

}  // namespace

std::string answer(const Request& request) {
    const Resource& resource = commandFor(resources(), request);
    const auto attributes = wantedAttributes(resource, request.value("-F"));

    Store store = Store::open(Database::Access::Read);
    const Transaction picture = store.read();
    const Hosts hosts = resource.tool == kQydyn ? hostsNamed(store, request.value("-c"), '_')
                                                : hostsNamed(store, request.value("-m"), '*');
    std::vector<Row> rows = resource.rows(hosts, request);
    applyFilter(request.value("--filter"), resource.filters, hosts, rows);
    if (rows.empty()) {
        return kNothing;
    }
    const bool withNames = !request.has("-F") && request.has("-r");
    return records(rows, attributes, withNames);
}

}  // namespace appliance
