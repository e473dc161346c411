#include "Json.h"

#include <algorithm>
#include <fstream>
#include <nlohmann/json.hpp>
#include <stdexcept>

#include "PathText.h"
#include "Provider.h"

namespace cimom {

// -- registrations ----------------------------------------------------------------------------

namespace {

using Json = nlohmann::json;

/// What is read of a registration, and where in it, for what is said of its faults.
class Part {
public:
    Part(const Json& json, std::string place) : m_json(json), m_place(std::move(place)) {}

    [[noreturn]] void refuse(const std::string& why) const {
        throw std::runtime_error(m_place + ": " + why);
    }
    bool has(const char* name) const { return m_json.is_object() && m_json.contains(name); }
    Part member(const char* name) const {
        if (!has(name)) {
            refuse('"' + std::string(name) + "\" is missing");
        }
        return {m_json.at(name), m_place + ": \"" + name + '"'};
    }
    /// Its elements; of what is no list, it alone.
    std::vector<Part> oneOrMore() const {
        if (!m_json.is_array()) {
            return {*this};
        }
        std::vector<Part> parts;
        for (const Json& each : m_json) {
            parts.emplace_back(each, m_place);
        }
        return parts;
    }
    std::vector<std::pair<std::string, Part>> members() const {
        if (!m_json.is_object()) {
            refuse("not an object of classes");
        }
        std::vector<std::pair<std::string, Part>> all;
        for (const auto& [name, json] : m_json.items()) {
            all.emplace_back(name, Part(json, m_place + ": class " + name));
        }
        return all;
    }
    std::string text() const {
        if (!m_json.is_string() || m_json.get_ref<const std::string&>().empty()) {
            refuse("not a name");
        }
        return m_json.get<std::string>();
    }

private:
    const Json& m_json;
    const std::string m_place;
};

unsigned interfaceBit(const Part& part) {
    const std::string name = part.text();
    const unsigned bit = interfacesThat([&](const auto& kind) { return name == kind.name; });
    if (bit != 0) {
        return bit;
    }
    part.refuse("there is no interface '" + name + "', but " + interfaceNames(~0U));
}

Registration readRow(const std::string& className, const Part& row, const Part& whole) {
    const auto either = [&](const char* name) {
        return row.has(name) || !whole.has(name) ? row.member(name) : whole.member(name);
    };
    Registration registration;
    registration.className = className;
    registration.provider = row.member("provider").text();
    registration.library = either("library").text();
    for (const Part& name : either("namespace").oneOrMore()) {
        registration.nameSpaces.push_back(name.text());
    }
    for (const Part& name : row.member("interfaces").oneOrMore()) {
        registration.interfaces |= interfaceBit(name);
    }
    return registration;
}

Json parseJson(const std::string& file, const std::string& text) {
    try {
        return Json::parse(text);
    } catch (const Json::parse_error& error) {
        if (error.byte > text.size()) {
            throw std::runtime_error(file + ": ends before its JSON does");
        }
        const std::string before = text.substr(0, error.byte > 0 ? error.byte - 1 : 0);
        const auto line = std::count(before.begin(), before.end(), '\n') + 1;
        const std::size_t column = before.size() - (before.rfind('\n') + 1) + 1;
        throw std::runtime_error(file + ":" + std::to_string(line) + ":" + std::to_string(column) +
                                 ": not JSON from here on");
    }
}

}  // namespace

std::vector<Registration> readRegistration(const std::string& file) {
    std::string text;
    try {
        text = readRegularFile(file);
    } catch (const std::exception& e) {
        throw std::runtime_error(file + ": cannot be read: " + e.what());
    }
    const Json json = parseJson(file, text);
    const Part whole(json, file);
    std::vector<Registration> rows;
    for (const auto& [className, entry] : whole.member("classes").members()) {
        for (const Part& row : entry.oneOrMore()) {
            rows.push_back(readRow(className, row, whole));
        }
    }
    return rows;
}

// -- messages -----------------------------------------------------------------------------------

std::optional<MessageTexts> readTexts(const std::string& file) {
    std::ifstream in(file);
    const auto json = in ? Json::parse(in, nullptr, false) : Json();
    if (!json.is_object()) {
        return std::nullopt;
    }
    MessageTexts texts;
    for (const auto& [id, text] : json.items()) {
        if (text.is_string()) {
            texts.emplace(id, text.get<std::string>());
        }
    }
    return texts;
}

// -- results ------------------------------------------------------------------------------------

namespace {

using Ordered = nlohmann::ordered_json;

Ordered toJson(const Instance& instance);

Ordered toJson(const Value& value) {
    if (value.isNull()) {
        return nullptr;
    }
    if (value.isArray()) {
        Ordered array = Ordered::array();
        for (const Value& element : value.elements()) {
            array.push_back(toJson(element));
        }
        return array;
    }
    if (value.type() == CMPI_boolean) {
        return value.boolean();
    }
    if (isReal(value.type())) {
        return value.real();
    }
    if (isInteger(value.type())) {
        return value.isSigned() ? Ordered(value.sint()) : Ordered(value.uint());
    }
    return value.type() == CMPI_instance ? toJson(value.instance()) : Ordered(plainText(value));
}

// The names are known to differ, and so are put behind one another, not looked for.
Ordered toJson(const NamedValues& values) {
    Ordered::object_t object;
    for (const auto& [name, value] : values) {
        object.Ordered::object_t::Container::emplace_back(name, toJson(value));
    }
    return object;
}

Ordered toJson(const Instance& instance) {
    return {{"path", printPath(instance.path)},
            {"class", instance.path.className},
            {"properties", toJson(instance.properties)}};
}

std::string dump(const Ordered& json, int indent = 2) {
    return json.dump(indent, ' ', false, Ordered::error_handler_t::replace) + "\n";
}

template <class List>
std::string dumpAll(const List& items) {
    Ordered array = Ordered::array();
    for (const auto& item : items) {
        array.push_back(toJson(item));
    }
    return dump(array);
}

}  // namespace

std::string jsonOf(const std::deque<Instance>& instances) { return dumpAll(instances); }
std::string jsonOf(const std::deque<ObjectPath>& paths) { return dumpAll(paths); }
std::string jsonOf(const std::vector<std::string>& names) { return dumpAll(names); }
std::string jsonOf(const Value& value) { return dump(toJson(value)); }

std::string jsonOfMethod(const Reply& reply) {
    return dump({{"returnValue", toJson(reply.value())}, {"out", toJson(reply.out)}});
}

std::string jsonLineOf(const Instance& instance) { return dump(toJson(instance), -1); }

}  // namespace cimom
