#include "Provider.h"

#include <dlfcn.h>
#include <unistd.h>

#include <algorithm>
#include <nlohmann/json.hpp>
#include <stdexcept>

namespace cimom {

// -- registration files -------------------------------------------------------------------------

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

std::string interfaceNames(unsigned bits) {
    std::string names;
    interfacesThat([&](const auto& kind) {
        if (bits & kind.bit) {
            names += (names.empty() ? "" : ", ") + std::string(kind.name);
        }
        return false;
    });
    return names;
}

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

// -- libraries ------------------------------------------------------------------------------------

std::string libraryFileName(const std::string& name) {
    const bool bare = name.find('/') == std::string::npos && name.find(".so") == std::string::npos;
    return bare ? "lib" + name + ".so" : name;
}

void Provider::open() {
    if (m_library || m_file.empty()) {
        return;
    }
    const std::string name = libraryFileName(m_file);
    std::string path = name;  // for the system's loader, unless a folder has it
    if (name[0] != '/') {
        for (auto folder = m_folders.rbegin(); folder != m_folders.rend(); ++folder) {
            const std::string candidate = *folder + "/" + name;
            if (access(candidate.c_str(), R_OK) == 0) {
                path = candidate;
            }
        }
    }
    m_library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (!m_library) {
        const char* why = dlerror();
        throw Failure(CMPI_RC_ERR_FAILED,
                      "provider " + m_name + ": cannot load " + path + ": " + textOf(why));
    }
}

// -- interfaces -----------------------------------------------------------------------------------

namespace {

template <class MI>
CMPIrc cleanUp(MI* mi, const CMPIContext* context, bool terminating) {
    try {
        return mi->ft->cleanup(mi, context, terminating ? 1 : 0).rc;
    } catch (const std::exception&) {  // nobody is left to hear of it
        return CMPI_RC_ERR_FAILED;
    }
}

}  // namespace

// The factory of the provider's name goes before the generic one of its library.
template <class MI>
MI* Provider::create(Broker& broker, const CMPIContext* context, CMPIStatus& status) {
    using Generic = MI* (*)(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);
    if (m_file.empty()) {
        const Factory<MI> factory = m_factories.*kindOfInterface<MI>().factory;
        return factory ? factory(broker.face(), context, &status) : nullptr;
    }
    const std::string suffix = std::string("_Create_") + kindOfInterface<MI>().factoryName;
    if (void* symbol = dlsym(m_library, (m_name + suffix).c_str())) {
        return reinterpret_cast<Factory<MI>>(symbol)(broker.face(), context, &status);
    }
    if (void* symbol = dlsym(m_library, ("_Generic" + suffix).c_str())) {
        return reinterpret_cast<Generic>(symbol)(broker.face(), context, m_name.c_str(), &status);
    }
    throw Failure(CMPI_RC_ERR_FAILED,
                  "provider " + m_name + ": " + m_file + " has no factory " + m_name + suffix);
}

template <class MI>
MI& Provider::interface(Broker& broker, const CMPIContext* context) {
    std::lock_guard<std::recursive_mutex> lock(m_mutex);
    MI*& made = std::get<MI*>(m_interfaces);
    if (made) {
        return *made;
    }
    open();
    CMPIStatus status{CMPI_RC_OK, nullptr};
    MI* fresh = create<MI>(broker, context, status);
    if (!fresh || status.rc != CMPI_RC_OK || !fresh->ft) {
        std::string text =
            "provider " + m_name + ": its factory made no " + kindOfInterface<MI>().factoryName;
        if (status.rc != CMPI_RC_OK) {
            text += std::string(", ") + statusName(status.rc);
        }
        if (status.msg) {
            text += ": " + bodyOf(status.msg).text;
        }
        throw Failure(CMPI_RC_ERR_FAILED, text);
    }
    made = fresh;
    return *made;
}
template CMPIInstanceMI& Provider::interface(Broker&, const CMPIContext*);
template CMPIAssociationMI& Provider::interface(Broker&, const CMPIContext*);
template CMPIMethodMI& Provider::interface(Broker&, const CMPIContext*);
template CMPIIndicationMI& Provider::interface(Broker&, const CMPIContext*);
template CMPIPropertyMI& Provider::interface(Broker&, const CMPIContext*);

Provider::Use::Use(Provider& provider) : m_provider(provider) {
    std::lock_guard<std::recursive_mutex> lock(m_provider.m_mutex);
    ++m_provider.m_uses;
}

Provider::Use::~Use() {
    std::lock_guard<std::recursive_mutex> lock(m_provider.m_mutex);
    --m_provider.m_uses;
}

bool Provider::unload(const CMPIContext* context, bool terminating) {
    std::lock_guard<std::recursive_mutex> lock(m_mutex);
    if (m_uses != 0) {
        return false;
    }
    bool stays = false;
    std::apply(
        [&](auto*&... mi) {
            const auto end = [&](auto*& each) {
                if (!each) {
                    return;
                }
                const CMPIrc rc = cleanUp(each, context, terminating);
                const bool wants = rc == CMPI_RC_DO_NOT_UNLOAD || rc == CMPI_RC_NEVER_UNLOAD;
                stays = stays || wants;
                // An interface that stays has not been cleaned up.
                if (!wants || terminating) {
                    each = nullptr;
                }
            };
            (end(mi), ...);
        },
        m_interfaces);
    if (stays) {
        return terminating;  // what asks to stay keeps its code, to the end of the process
    }
    if (m_library) {
        dlclose(m_library);
    }
    m_library = nullptr;
    return true;
}

// Only a library that asked to stay is still open here; it stays.
Provider::~Provider() = default;

}  // namespace cimom
