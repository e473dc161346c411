#include "ConnectionProvider.h"

#include <memory>

#include "PropertyRows.h"
#include "ProviderFactories.h"
#include "QylinkCmdCaller.h"

namespace {

using Link = zemQylinkCmdCaller::ALL;

constexpr const char kClass[] = "ORXC_HostConnection";
constexpr const char kPrefix[] = "ORX:";

const Attributes kIdentity = {Link::ATTR_TYPE_MODEL_SERIAL_NUM, Link::ATTR_SP};

const std::vector<PropertyRow> kRows = {
    {"HostName", ValueKind::Text, Link::ATTR_TYPE_MODEL_SERIAL_NUM},
    {"ServiceProcessor", ValueKind::Text, Link::ATTR_SP},
    {"PhysicalLocation", ValueKind::Text, Link::ATTR_SP_PHYS_LOC},
    {"IPAddress", ValueKind::Text, Link::ATTR_IPADDR},
    {"EnabledState", ValueKind::EnabledState, Link::ATTR_STATE},
    {"State", ValueKind::Text, Link::ATTR_STATE},
    {"ErrorCode", ValueKind::Text, Link::ATTR_CONNECTION_ERROR_CODE},
};

std::string idOf(const zemRecordType& link) {
    return std::string(kPrefix) + static_cast<const char*>(link[Link::ATTR_TYPE_MODEL_SERIAL_NUM]) +
           ":" + static_cast<const char*>(link[Link::ATTR_SP]);
}

/// The connections of a host; null: of all.
zemRecordSetsType readLinks(const CmpiContext& context, const char** properties, const char* host) {
    zemQylinkCmdCaller tool(zemBaseProvider::getUserContext(context),
                            zemBaseProvider::getExternalLanguageName(context));
    return tool.getQylinkInformation(attributesFor(kRows, kIdentity, properties).data(), host);
}

CmpiObjectPath connectionPath(const CmpiObjectPath& near, const std::string& id) {
    CmpiObjectPath path = zemBaseProvider::createObjectPath(near, kClass);
    path.setKey("InstanceID", CmpiData(id.c_str()));
    return path;
}

CmpiInstance makeInstance(const CmpiObjectPath& near, const char** properties,
                          const zemRecordType& link) {
    CmpiInstance instance = newInstance(connectionPath(near, idOf(link)), properties);
    setProperties(instance, kRows, properties, link);
    return instance;
}

}  // namespace

ConnectionProvider::ConnectionProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                       const char* name)
    : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, name) {}

std::string ConnectionProvider::hostOf(const std::string& id) {
    const std::size_t prefix = sizeof kPrefix - 1;
    const std::size_t colon = id.rfind(':');
    if (id.compare(0, prefix, kPrefix) != 0 || colon < prefix) {
        return "";
    }
    const std::string host = id.substr(prefix, colon - prefix);
    return isHostName(host) ? host : "";
}

int ConnectionProvider::getInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties, CmpiInstance& out) {
    const std::string id = getKeyBinding(path, "InstanceID").getString().charPtr();
    const std::string host = hostOf(id);
    if (host.empty()) {
        return -1;
    }
    try {
        const zemRecordSetsType links = readLinks(context, properties, host.c_str());
        for (int i = 0; i < links.size(); ++i) {
            if (idOf(*links[i]) != id) {
                continue;
            }
            out = makeInstance(path, properties, *links[i]);
            return 0;
        }
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) {
            throw;
        }
    }
    return -1;
}

void ConnectionProvider::enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                                           zemDynamicArray<CmpiObjectPath>& out,
                                           const CmpiObjectPath&) {
    static const char* justTheKey[] = {"InstanceID", nullptr};
    const zemRecordSetsType links = readLinks(context, justTheKey, nullptr);
    for (int i = 0; i < links.size(); ++i) {
        out.addElement(std::make_unique<CmpiObjectPath>(connectionPath(path, idOf(*links[i]))));
    }
}

void ConnectionProvider::enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                                       const char** properties, zemDynamicArray<CmpiInstance>& out,
                                       const CmpiObjectPath&) {
    const zemRecordSetsType links = readLinks(context, properties, nullptr);
    for (int i = 0; i < links.size(); ++i) {
        out.addElement(std::make_unique<CmpiInstance>(makeInstance(path, properties, *links[i])));
    }
}

CMPIBoolean ConnectionProvider::isValidInstanceClass(const char* className) {
    return compareClassNames(className, kClass);
}

void ConnectionProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    setText(keys, 0, "InstanceID");
}

ZEM_PROVIDER(ORXC_HostConnectionProvider, ConnectionProvider)
