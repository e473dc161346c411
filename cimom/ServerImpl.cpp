// How a server finds the providers of an operation.

#include "ServerImpl.h"

#include <algorithm>

#include "PathText.h"

namespace cimom {

namespace {

bool servesNameSpace(const std::vector<std::string>& nameSpaces, const std::string& wanted) {
    return nameSpaces.empty() ||
           std::any_of(nameSpaces.begin(), nameSpaces.end(),
                       [&](const std::string& each) { return sameName(each, wanted); });
}

[[noreturn]] void unserved(const std::string& nameSpace, const std::string& className) {
    throw Failure(CMPI_RC_ERR_NOT_SUPPORTED,
                  "no provider serves class " + className + " in " + nameSpace + " for this");
}

}  // namespace

void Server::Impl::add(const Registration& row, const std::string& folder) {
    const auto known = std::find_if(providers.begin(), providers.end(), [&](const Provider& each) {
        return each.name() == row.provider && each.file() == row.library;
    });
    Provider* provider = known == providers.end() ? nullptr : &*known;
    if (!provider) {
        std::vector<std::string> folders{folder};
        const auto& more = broker.options().libraryFolders;
        folders.insert(folders.end(), more.begin(), more.end());
        provider = &providers.emplace_back(row.provider, row.library, folders);
    }
    routes[row.className].push_back({row.nameSpaces, row.interfaces, provider});
}

void Server::Impl::add(const std::string& name, const std::vector<std::string>& classes,
                       const Factories& factories, const std::vector<std::string>& nameSpaces) {
    const unsigned interfaces =
        (factories.instance ? kInstance : 0U) | (factories.association ? kAssociation : 0U) |
        (factories.method ? kMethod : 0U) | (factories.indication ? kIndication : 0U) |
        (factories.property ? kProperty : 0U);
    Provider& provider = providers.emplace_back(name, factories);
    for (const std::string& className : classes)
        routes[className].push_back({nameSpaces, interfaces, &provider});
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

bool Server::Impl::serves(const ObjectPath& path, Interface bit) const {
    if (routeOf(path.className, path.nameSpace, bit)) return true;
    const CimClass* cls = broker.classOf(path);
    return cls && std::any_of(cls->lineage.begin(), cls->lineage.end(), [&](const CimClass* each) {
               return routeOf(each->name, path.nameSpace, bit) != nullptr;
           });
}

Target Server::Impl::targetOf(const ObjectPath& path, Interface bit) const {
    if (Provider* provider = routeOf(path.className, path.nameSpace, bit))
        return {provider, path.className};
    for (const CimClass* cls = broker.classOf(path); cls; cls = cls->superclass)
        if (Provider* provider = routeOf(cls->name, path.nameSpace, bit))
            return {provider, path.className};
    unserved(path.nameSpace, path.className);
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

std::vector<Target> Server::Impl::associationTargets(const ObjectPath& path) const {
    const ClassRepository* classes = broker.classes();
    const auto mayHold = [&](const std::string& association) {
        const CimClass* cls = classes ? classes->findClass(association) : nullptr;
        if (!cls) return true;
        return std::any_of(cls->properties.begin(), cls->properties.end(), [&](const auto& end) {
            return end->type == CimType::Reference &&
                   (classes->isA(path.className, end->referenceClass) ||
                    classes->isA(end->referenceClass, path.className));
        });
    };
    std::vector<Target> targets;
    for (const auto& [className, rows] : routes)
        for (const Route& row : rows) {
            const bool known = std::any_of(
                targets.begin(), targets.end(),
                [&row = row](const Target& target) { return target.provider == row.provider; });
            if (!known && (row.interfaces & kAssociation) &&
                servesNameSpace(row.nameSpaces, path.nameSpace) && mayHold(className))
                targets.push_back({row.provider, ""});
        }
    // In the order of registration, not of the table.
    const auto rank = [this](const Target& target) {
        return std::find_if(providers.begin(), providers.end(),
                            [&](const Provider& each) { return &each == target.provider; });
    };
    std::sort(targets.begin(), targets.end(), [&](const Target& a, const Target& b) {
        return std::distance(providers.begin(), rank(a)) <
               std::distance(providers.begin(), rank(b));
    });
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
            if (std::any_of(request.properties->begin(), request.properties->end(),
                            [&n = name](const std::string& each) { return sameName(each, n); }))
                wanted.set(name, value);
        instance.properties = std::move(wanted);
    }
}

}  // namespace cimom
