#include "Show.h"

#include <algorithm>
#include <nlohmann/json.hpp>

#include "Text.h"
#include "View.h"

namespace appliance {

namespace {

using Json = nlohmann::ordered_json;
using Line = std::vector<std::string>;

constexpr const char* kColumns[] = {"name",           "lpar_env", "state",
                                    "run_proc_units", "run_mem",  "curr_profile"};

std::string table(const std::vector<Line>& lines) {
    std::vector<std::size_t> widths(lines.front().size(), 0);
    for (const Line& line : lines) {
        for (std::size_t i = 0; i < line.size(); ++i) {
            widths[i] = std::max(widths[i], characters(line[i]));
        }
    }
    std::string text;
    for (const Line& line : lines) {
        text += "   ";
        for (std::size_t i = 0; i < line.size(); ++i) {
            text += ' ' + line[i];
            if (i + 1 < line.size()) {
                text.append(widths[i] - characters(line[i]) + 1, ' ');
            }
        }
        text += '\n';
    }
    return text;
}

std::string overview(const HostView& view) {
    const Row row{&view, &view.host()};
    const auto& lpars = view.all(Kind::Lpar);
    std::string text = view.host().get("name") + " (" + view.mtms() + ")  " +
                       view.host().get("state") + "\n    " + std::to_string(lpars.size()) +
                       " partitions, free: " + valueOf(row, "pend_avail_sys_proc_units") + " of " +
                       valueOf(row, "configurable_sys_proc_units") + " processing units, " +
                       valueOf(row, "pend_avail_sys_mem") + " of " +
                       valueOf(row, "configurable_sys_mem") + " MB\n";
    if (lpars.empty()) {
        return text;
    }
    std::vector<Line> lines = {
        {"id", "name", "environment", "state", "processors", "memory", "profile"}};
    for (const Object& lpar : lpars) {
        lines.push_back({lpar.get("lpar_id")});
        for (const char* column : kColumns) {
            lines.back().push_back(lpar.get(column));
        }
    }
    return text + table(lines);
}

Json attributes(const Object& object) {
    const Place& place = object.place();
    Json json = {{"host", place.host}, {"lpar", place.lpar}, {"number", place.number}};
    for (const auto& [name, value] : object.settings()) {
        json[std::string(name)] = value;
    }
    return json;
}

std::string dumped(const Json& json) {
    return json.dump(-1, ' ', false, Json::error_handler_t::replace);
}

/// Of what was changed all that differs, of what was added or deleted its name.
std::string changes(const Json& object) {
    const Json none = Json::object(), old = object.value("old", none),
               now = object.value("new", none);
    const bool isBoth = object.at("event") == "modify";
    std::string text;
    for (const auto& [name, value] : (old.empty() ? now : old).items()) {
        if (!isBoth && name != "name") {
            continue;
        }
        text += (text.empty() ? ": " : ", ") + name + ' ' + dumped(value);
        if (isBoth) {
            text += " -> " + dumped(now.at(name));
        }
    }
    return text;
}

std::string entry(const Json& change) {
    std::string text = timeText(change.at("time")) + "  " + change.at("tool").get<std::string>();
    if (change.contains("move")) {
        text += ": " + change["move"].at("state").get<std::string>();
    }
    for (const Json& object : change.at("objects")) {
        const std::string kind = object.at("kind"), event = object.at("event");
        const std::int64_t lpar = object.at("lpar"), number = object.at("number");
        text.append("\n    ").append(event).append(1, ' ').append(kind);
        if (lpar != 0) {
            text += ' ' + std::to_string(lpar);
        }
        if (kind != "lpar" && kind != "host") {
            text += (lpar != 0 ? '/' : ' ') + std::to_string(number);
        }
        text += " of " + object.at("host").get<std::string>() + changes(object);
    }
    return text;
}

}  // namespace

std::string journalJson(std::int64_t number, const std::string& line) {
    return "{\"number\":" + std::to_string(number) + ',' + line.substr(1) + '\n';
}

std::string journalText(std::int64_t number, const std::string& line) {
    std::string text = line;
    try {
        text = entry(Json::parse(line));
    } catch (const Json::exception&) {
        // Not written by a tool.
    }
    return std::to_string(number) + "  " + text + '\n';
}

std::string showText(Store& store) {
    std::string text;
    for (const auto& view : allHosts(store)) {
        text += overview(*view);
    }
    return text;
}

std::string showJson(Store& store) {
    Json json;
    for (int i = 0; i < kKinds; ++i) {
        const Kind kind = static_cast<Kind>(i);
        Json& list = json[kindName(kind)] = Json::array();
        for (const Object& object : store.all(kind)) {
            list.push_back(attributes(object));
        }
    }
    return json.dump(2, ' ', false, Json::error_handler_t::replace) + '\n';
}

}  // namespace appliance
