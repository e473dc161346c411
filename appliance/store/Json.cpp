#include "Json.h"

#include <nlohmann/json.hpp>

#include "Text.h"

namespace appliance {

namespace {

using Json = nlohmann::ordered_json;

std::string dumped(const Json& json, int indent = -1) {
    return json.dump(indent, ' ', false, Json::error_handler_t::replace);
}

// -- what a change writes -----------------------------------------------------------------------

/// The attributes that @p object has set; where there is an @p other, those that differ between
/// them, whichever set them.
Json differing(const Object& object, const std::optional<Object>& other) {
    Json json = Json::object();
    for (const Object* setter : {&object, other ? &*other : &object}) {
        for (const auto& setting : setter->settings()) {
            const std::string name(setting.first), value = object.get(name);
            if (!other || value != other->get(name)) {
                json[name] = value;
            }
        }
    }
    return json;
}

/// What became of an object; nothing for one that is as it was.
Json changed(const ChangedObject& change) {
    const auto& [host, before, after] = change;
    const Object& either = before ? *before : *after;
    const Place& place = either.place();
    Json json = {{"event", !before  ? "add"
                           : !after ? "delete"
                                    : "modify"},
                 {"kind", kindName(either.kind())},
                 {"host", host},
                 {"lpar", place.lpar},
                 {"number", place.number}};
    if (before) {
        json["old"] = differing(*before, after);
    }
    if (after) {
        json["new"] = differing(*after, before);
    }
    const bool same = before && after && json["new"].empty();
    return same ? Json() : json;
}

// -- what of that is shown ----------------------------------------------------------------------

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

Json attributes(const Object& object) {
    const Place& place = object.place();
    Json json = {{"host", place.host}, {"lpar", place.lpar}, {"number", place.number}};
    for (const auto& [name, value] : object.settings()) {
        json[std::string(name)] = value;
    }
    return json;
}

}  // namespace

std::string journalLine(const char* tool, std::time_t time, const JournalNotes& notes,
                        const std::vector<ChangedObject>& objects) {
    Json differ = Json::array();
    for (const ChangedObject& object : objects) {
        if (Json json = changed(object); !json.is_null()) {
            differ.push_back(std::move(json));
        }
    }
    if (differ.empty()) {
        return {};
    }
    Json line = {{"tool", tool}, {"time", time}};
    for (const auto& [name, values] : notes) {
        for (const auto& [key, value] : values) {
            line[name][key] = value;
        }
    }
    line["objects"] = std::move(differ);
    return dumped(line);
}

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

std::string showJson(Store& store) {
    Json json;
    for (int i = 0; i < kKinds; ++i) {
        const Kind kind = static_cast<Kind>(i);
        Json& list = json[kindName(kind)] = Json::array();
        for (const Object& object : store.all(kind)) {
            list.push_back(attributes(object));
        }
    }
    return dumped(json, 2) + '\n';
}

}  // namespace appliance
