// How a server finds the providers of an operation.

#include "ServerImpl.h"

#include <algorithm>
#include <set>

#include "Json.h"
#include "PathText.h"

namespace cimom {

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
        if (known == providers.end()) {
            known = providers.emplace(known, row.provider, row.library, folders);
        }
        m_impl->addRoute({row.className, row.nameSpaces, row.interfaces, &*known});
    }
}

void Server::registerProvider(const std::string& name, const std::vector<std::string>& classes,
                              const Factories& factories,
                              const std::vector<std::string>& nameSpaces) {
    const unsigned interfaces =
        interfacesThat([&](const auto& kind) { return factories.*kind.factory != nullptr; });
    Provider& provider = m_impl->providers.emplace_back(name, factories);
    for (const std::string& className : classes) {
        m_impl->addRoute({className, nameSpaces, interfaces, &provider});
    }
}

void Server::Impl::addRoute(Route route) {
    const Route& added = routes.emplace_back(std::move(route));
    routesOf[added.className].push_back(&added);
}

namespace {

/// A path with those in its keys in a namespace.
ObjectPath placed(ObjectPath path, const std::string& nameSpace) {
    if (path.nameSpace.empty()) {
        path.nameSpace = nameSpace;
    }
    const NamedValues keys = path.keys;
    for (const auto& [name, value] : keys) {
        if (value.type() == CMPI_ref && !value.isNull()) {
            path.keys.set(name, placed(value.reference(), nameSpace));
        }
    }
    return path;
}

}  // namespace

ObjectPath Server::Impl::complete(const Request& request, const ObjectPath& path) const {
    const ClassRepository* classes = broker.classes();
    if (!classes) {
        return placed(path, request.nameSpace);
    }
    if (!broker.classOf(path) && !(broker.lean() && routesOf.count(path.className))) {
        throw Failure(CMPI_RC_ERR_INVALID_CLASS, "no class " + path.className);
    }
    return placed(typedKeys(path, *classes, broker.lean() ? Unfit::Kept : Unfit::Refused),
                  request.nameSpace);
}

Provider* Server::Impl::routeOf(const std::string& className, const std::string& nameSpace,
                                Interface bit) const {
    const auto at = routesOf.find(className);
    if (at == routesOf.end()) {
        return nullptr;
    }
    for (const Route* route : at->second) {
        if (route->serves(nameSpace, bit)) {
            return route->provider;
        }
    }
    return nullptr;
}

Provider* Server::Impl::providerOf(const ObjectPath& path, Interface bit) const {
    Provider* provider = routeOf(path.className, path.nameSpace, bit);
    for (const CimClass* cls = broker.classOf(path); cls && !provider; cls = cls->superclass) {
        provider = routeOf(cls->name, path.nameSpace, bit);
    }
    return provider;
}

Target Server::Impl::targetOf(const ObjectPath& path, Interface bit) const {
    if (Provider* provider = providerOf(path, bit)) {
        return {provider, path.className};
    }
    throw Failure(CMPI_RC_ERR_NOT_SUPPORTED,
                  "no provider serves class " + path.className + " in " + path.nameSpace +
                      ": no registration lists it, or a class above it, with the interface " +
                      interfaceNames(bit));
}

std::vector<Target> Server::Impl::targetsBelow(const ObjectPath& classPath, Interface bit) const {
    std::vector<Target> targets;
    const auto consider = [&](const std::string& className) {
        if (Provider* provider = routeOf(className, classPath.nameSpace, bit)) {
            targets.push_back({provider, className});
        }
    };
    consider(classPath.className);
    if (const CimClass* cls = broker.classOf(classPath)) {
        for (const CimClass* below : cls->allSubclasses()) {
            consider(below->name);
        }
    }
    if (targets.empty()) {
        targets.push_back(targetOf(classPath, bit));
    }
    return targets;
}

std::vector<Target> Server::Impl::associationTargets(const Request& request, const ObjectPath& path,
                                                     const std::string& association) {
    std::vector<Target> targets;
    if (!association.empty()) {
        targets = targetsBelow(complete(request, {path.nameSpace, association}), kAssociation);
    } else {
        for (const Route& route : routes) {
            if (route.serves(path.nameSpace, kAssociation) &&
                mayHold(route.className, path.className)) {
                targets.push_back({route.provider, route.className});
            }
        }
    }
    if (!broker.lean()) {
        return targets;
    }
    std::vector<Target> once;
    std::set<const Provider*> known;
    for (const Target& target : targets) {
        if (known.insert(target.provider).second) {
            once.push_back({target.provider, association});
        }
    }
    return once;
}

bool Server::Impl::mayHold(const std::string& association, const std::string& className) const {
    const ClassRepository* classes = broker.classes();
    const CimClass* cls = classes ? classes->findClass(association) : nullptr;
    if (!cls) {
        return true;
    }
    if (broker.lean()) {
        return cls->isAssociation;
    }
    return std::any_of(cls->properties.begin(), cls->properties.end(), [&](const auto& end) {
        return end->type == CMPI_ref && (classes->isA(className, end->referenceClass) ||
                                         classes->isA(end->referenceClass, className));
    });
}

Instance Server::Impl::filled(Instance instance) const {
    const CimClass* cls = broker.classOf(instance.path);
    if (!cls) {
        return instance;
    }
    NamedValues all = cls->blank();
    for (const auto& [name, value] : instance.path.keys) {
        all.set(name, value);
    }
    NameSet known;  // a name that stands twice stays for the provider to judge
    for (const auto& [name, value] : instance.properties) {
        known.insert(name).second ? all.set(name, value) : all.add(name, value);
    }
    instance.properties = std::move(all);
    return instance;
}

void Server::Impl::keepProperties(const std::optional<std::vector<std::string>>& names,
                                  Reply& reply) {
    if (!names) {
        return;
    }
    const NameSet wanted(names->begin(), names->end());
    for (Instance& instance : reply.instances) {
        NamedValues kept;
        for (const auto& [name, value] : instance.properties) {
            if (wanted.count(name) != 0) {
                kept.set(name, value);
            }
        }
        instance.properties = std::move(kept);
    }
}

namespace {

void refuseUnplaced(const ObjectPath& path);

void refuseUnplaced(const NamedValues& values) {
    if (values.nesting() == 0) {
        return;  // as most: there is no path among them
    }
    for (const auto& each : values) {
        if (each.value.type() == CMPI_ref && !each.value.isNull()) {
            refuseUnplaced(each.value.reference());
        }
    }
}
void refuseUnplaced(const ObjectPath& path) {
    if (path.nameSpace.empty()) {
        throw ProviderFault("the path " + printPath(path) + ", which has no namespace");
    }
    refuseUnplaced(path.keys);
}

}  // namespace

void refuseUnplaced(const Reply& reply) {
    for (const ObjectPath& path : reply.paths) {
        refuseUnplaced(path);
    }
    for (const Instance& instance : reply.instances) {
        refuseUnplaced(instance.path);
        refuseUnplaced(instance.properties);
    }
}

}  // namespace cimom
