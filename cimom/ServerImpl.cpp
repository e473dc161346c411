// How a server finds the providers of an operation.

#include "ServerImpl.h"

#include <algorithm>
#include <set>

#include "PathText.h"

namespace cimom {

namespace {

bool servesNameSpace(const std::vector<std::string>& nameSpaces, const std::string& wanted) {
    return nameSpaces.empty() || containsName(nameSpaces, wanted);
}

}  // namespace

void Server::loadRegistration(const std::string& file) {
    const std::size_t slash = file.rfind('/');
    std::vector<std::string> folders{slash == std::string::npos ? "." : file.substr(0, slash)};
    const auto& more = m_impl->broker.options().libraryFolders;
    folders.insert(folders.end(), more.begin(), more.end());
    std::list<Provider>& providers = m_impl->providers;
    for (const Registration& row : readRegistration(file)) {
        auto known = std::find_if(providers.begin(), providers.end(), [&](const Provider& each) {
            return each.name() == row.provider && each.file() == row.library;
        });
        if (known == providers.end())
            known = providers.emplace(known, row.provider, row.library, folders);
        m_impl->routes[row.className].push_back({row.nameSpaces, row.interfaces, &*known});
    }
}

void Server::registerProvider(const std::string& name, const std::vector<std::string>& classes,
                              const Factories& factories,
                              const std::vector<std::string>& nameSpaces) {
    const unsigned interfaces =
        interfacesThat([&](const auto& kind) { return factories.*kind.factory != nullptr; });
    Provider& provider = m_impl->providers.emplace_back(name, factories);
    for (const std::string& className : classes)
        m_impl->routes[className].push_back({nameSpaces, interfaces, &provider});
}

ObjectPath Server::Impl::complete(const Request& request, const ObjectPath& path) const {
    ObjectPath full = path;
    if (full.nameSpace.empty()) full.nameSpace = request.nameSpace;
    const ClassRepository* classes = broker.classes();
    if (!classes) return full;
    if (!broker.classOf(full) && !(broker.lean() && routes.count(full.className)))
        throw Failure(CMPI_RC_ERR_INVALID_CLASS, "no class " + full.className);
    return typedKeys(full, *classes, broker.lean() ? Unfit::Kept : Unfit::Refused);
}

Provider* Server::Impl::routeOf(const std::string& className, const std::string& nameSpace,
                                Interface bit) const {
    const auto at = routes.find(className);
    if (at == routes.end()) return nullptr;
    for (const Route& route : at->second)
        if ((route.interfaces & bit) && servesNameSpace(route.nameSpaces, nameSpace))
            return route.provider;
    return nullptr;
}

Provider* Server::Impl::providerOf(const ObjectPath& path, Interface bit) const {
    Provider* provider = routeOf(path.className, path.nameSpace, bit);
    for (const CimClass* cls = broker.classOf(path); cls && !provider; cls = cls->superclass)
        provider = routeOf(cls->name, path.nameSpace, bit);
    return provider;
}

Target Server::Impl::targetOf(const ObjectPath& path, Interface bit) const {
    if (Provider* provider = providerOf(path, bit)) return {provider, path.className};
    throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "no provider serves class " + path.className + " in " +
                                                 path.nameSpace + " for this");
}

std::vector<Target> Server::Impl::targetsBelow(const ObjectPath& classPath, Interface bit) const {
    std::vector<Target> targets;
    const auto consider = [&](const std::string& className) {
        if (Provider* provider = routeOf(className, classPath.nameSpace, bit))
            targets.push_back({provider, className});
    };
    consider(classPath.className);
    if (const CimClass* cls = broker.classOf(classPath))
        for (const CimClass* below : cls->allSubclasses()) consider(below->name);
    if (targets.empty()) targets.push_back(targetOf(classPath, bit));
    return targets;
}

std::vector<Target> Server::Impl::associationTargets(const ObjectPath& path) {
    const ClassRepository* classes = broker.classes();
    const auto mayHold = [&](const std::string& association) {
        const CimClass* cls = classes ? classes->findClass(association) : nullptr;
        if (!cls) return true;
        return std::any_of(cls->properties.begin(), cls->properties.end(), [&](const auto& end) {
            return end->type == CMPI_ref && (classes->isA(path.className, end->referenceClass) ||
                                             classes->isA(end->referenceClass, path.className));
        });
    };
    std::set<const Provider*> asked;
    for (const auto& [className, rows] : routes)
        for (const Route& row : rows)
            if ((row.interfaces & kAssociation) != 0 &&
                servesNameSpace(row.nameSpaces, path.nameSpace) && mayHold(className))
                asked.insert(row.provider);
    std::vector<Target> targets;  // in the order of registration
    for (Provider& each : providers)
        if (asked.count(&each) != 0) targets.push_back({&each, ""});
    return targets;
}

void Server::Impl::finish(const Request& request, const ObjectPath& path, Reply& reply) {
    for (ObjectPath& each : reply.paths)
        if (each.nameSpace.empty()) each.nameSpace = path.nameSpace;
    for (Instance& instance : reply.instances) {
        if (instance.path.nameSpace.empty()) instance.path.nameSpace = path.nameSpace;
        if (!request.properties) continue;
        NamedValues wanted;
        for (const auto& [name, value] : instance.properties)
            if (containsName(*request.properties, name)) wanted.set(name, value);
        instance.properties = std::move(wanted);
    }
}

}  // namespace cimom
