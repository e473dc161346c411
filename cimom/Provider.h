/// Providers: where they come from, their CMPI interfaces, and their life from load to unload.
#ifndef CIMOM_PROVIDER_H
#define CIMOM_PROVIDER_H

#include <memory>
#include <mutex>
#include <string>
#include <tuple>
#include <vector>

#include "Broker.h"

namespace cimom {

/// "lib<name>.so" for a bare name, any other name as it stands.
std::string libraryFileName(const std::string& name);

/// What distinguishes the five kinds of interfaces.
template <class MI>
struct InterfaceKind {
    Interface bit;
    const char* name;         ///< in registrations
    const char* factoryName;  ///< behind the "_Create_" of a library's factories
    Factory<MI> Factories::*factory;
};
constexpr std::tuple kInterfaceKinds{
    InterfaceKind<CMPIInstanceMI>{kInstance, "instance", "InstanceMI", &Factories::instance},
    InterfaceKind<CMPIAssociationMI>{kAssociation, "association", "AssociationMI",
                                     &Factories::association},
    InterfaceKind<CMPIMethodMI>{kMethod, "method", "MethodMI", &Factories::method},
    InterfaceKind<CMPIIndicationMI>{kIndication, "indication", "IndicationMI",
                                    &Factories::indication},
    InterfaceKind<CMPIPropertyMI>{kProperty, "property", "PropertyMI", &Factories::property}};
template <class MI>
constexpr const InterfaceKind<MI>& kindOfInterface() {
    return std::get<InterfaceKind<MI>>(kInterfaceKinds);
}
/// The bits of the interfaces for which @p has holds.
template <class Predicate>
unsigned interfacesThat(Predicate has) {
    return std::apply(
        [&](const auto&... kind) { return ((has(kind) ? unsigned{kind.bit} : 0U) | ...); },
        kInterfaceKinds);
}

/// The names of the interfaces that bits stand for, separated by commas.
std::string interfaceNames(unsigned bits);

/// One provider with the interfaces that have been asked for so far. Thread-safe.
class Provider {
public:
    /// A provider of a library, looked for in @p folders.
    Provider(std::string name, std::string library, std::vector<std::string> folders)
        : m_name(std::move(name)), m_file(std::move(library)), m_folders(std::move(folders)) {}
    /// A provider of this process.
    Provider(std::string name, const Factories& factories)
        : m_name(std::move(name)), m_factories(factories) {}
    ~Provider();
    Provider(const Provider&) = delete;
    Provider& operator=(const Provider&) = delete;

    const std::string& name() const { return m_name; }
    const std::string& file() const { return m_file; }

    /// Keeps a provider loaded while it lives.
    class Use {
    public:
        explicit Use(Provider& provider);
        ~Use();
        Use(const Use&) = delete;
        Use& operator=(const Use&) = delete;

    private:
        Provider& m_provider;
    };
    /// The interface, made when asked for the first time; valid as long as a Use.
    /// @throws Failure CMPI_RC_ERR_FAILED when the library or the factory fails
    template <class MI>
    MI& interface(Broker& broker, const CMPIContext* context);

    /// Calls the cleanup of all interfaces and unloads the library.
    /// @return false when the provider is in use or, unless @p terminating, asks to stay
    bool unload(const CMPIContext* context, bool terminating);

private:
    using Interfaces = std::tuple<CMPIInstanceMI*, CMPIAssociationMI*, CMPIMethodMI*,
                                  CMPIIndicationMI*, CMPIPropertyMI*>;

    void open();
    template <class MI>
    MI* create(Broker& broker, const CMPIContext* context, CMPIStatus& status);

    const std::string m_name;
    const std::string m_file;
    const std::vector<std::string> m_folders;
    const Factories m_factories;

    std::recursive_mutex m_mutex;  // recursive: a factory may reach its own provider by an upcall
    void* m_library = nullptr;
    Interfaces m_interfaces{};
    int m_uses = 0;
};

}  // namespace cimom

#endif
