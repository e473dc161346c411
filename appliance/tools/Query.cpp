#include "Query.h"

#include <algorithm>

#include "Filter.h"
#include "Help.h"
#include "Resource.h"
#include "Text.h"

namespace appliance {

namespace {

// In no other language and word: the callers of the tools compare the answer with this sentence
// to tell an empty answer from records.
constexpr const char* kNothing = "No results were found.\n";

bool same(const char* word, const std::string& value) {
    return word == nullptr ? value.empty() : value == word;
}

/// Resources that know no levels are asked with any of those that others have, and with none.
bool anyLevel(const std::string& level) {
    return level.empty() || level == "lpar" || level == "sys" || level == "pool" || level == "slot";
}

/// Walks the table from the option that decides most: the first value that leaves no row is the
/// one that is wrong.
const Resource& resourceFor(Tool tool, const Request& request) {
    const char* const option = typeOption(tool);
    const std::string type = request.value(option), subtype = request.value("--rsubtype"),
                      level = request.value("--level");
    bool typeKnown = false, subtypeKnown = false;
    for (const Resource& resource : resources()) {
        if (resource.tool != tool || !same(resource.type, type)) continue;
        typeKnown = true;
        if (!same(resource.subtype, subtype)) continue;
        subtypeKnown = true;
        if (resource.level == nullptr ? anyLevel(level) : level == resource.level) return resource;
    }
    const char* wrong = !typeKnown ? option : !subtypeKnown ? "--rsubtype" : "--level";
    if (!request.has(wrong)) throw Failure(Fault::MissingOption, {wrong});
    throw Failure(Fault::BadOptionValue, {wrong, request.value(wrong)});
}

std::vector<std::string> wantedAttributes(const Resource& resource, const std::string& names) {
    std::vector<std::string> known = split(resource.attributes);
    if (names.empty()) return known;
    std::vector<std::string> wanted = split(names);
    for (const std::string& name : wanted) {
        if (std::find(known.begin(), known.end(), name) == known.end()) {
            throw Failure(Fault::UnknownAttribute, {name});
        }
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
            if (withNames) value.insert(0, attribute + '=');
            text.append(comma).append(quoted(value));
            comma = ",";
        }
        text += '\n';
    }
    return text;
}

}  // namespace

Tool toolNamed(const std::string& name) {
    for (const ToolName& tool : toolNames()) {
        if (name == tool.name) return tool.tool;
    }
    throw Failure(Fault::UnknownTool, {name});
}

std::string answer(Tool tool, const char* const* arguments, Language language) {
    const Request request(tool, arguments);
    if (request.has("--help")) return help(tool, language);

    const Resource& resource = resourceFor(tool, request);
    const auto attributes = wantedAttributes(resource, request.value("-F"));

    Store store = Store::open(Database::Access::Read);
    const Transaction picture = store.read();
    const Hosts hosts = tool == kQydyn ? hostsNamed(store, request.value("-c"), '_')
                                       : hostsNamed(store, request.value("-m"), '*');
    std::vector<Row> rows = resource.rows(hosts, request);
    applyFilter(request.value("--filter"), resource.filters, hosts, rows);
    if (rows.empty()) return kNothing;
    const bool withNames = !request.has("-F") && request.has("-r");
    return records(rows, attributes, withNames);
}

}  // namespace appliance
