#include "Provider.h"

#include <dlfcn.h>
#include <unistd.h>

namespace cimom {

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
    using Named = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    using Generic = MI* (*)(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);
    if (m_file.empty()) {
        const Factory<MI>& factory = m_factories.*kindOfInterface<MI>().factory;
        return factory ? factory(broker.face(), context, &status) : nullptr;
    }
    const std::string suffix = std::string("_Create_") + kindOfInterface<MI>().factoryName;
    if (void* symbol = dlsym(m_library, (m_name + suffix).c_str())) {
        return reinterpret_cast<Named>(symbol)(broker.face(), context, &status);
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
