/// ORXC_ApiHost and ORXC_ApiPartition: the hosts and partitions of ORXC_CEC_CS and ORXC_LPAR_CS,
/// read through the management library instead of the tools.
///
/// Both are one provider with a table: which operations read one system and all, and which
/// property comes from which key of the library, by way of which words. Thread-safety: constant
/// tables and no state; any number of operations at once.
#include <strings.h>

#include <cstdlib>
#include <memory>
#include <string>

#include "BaseZemInstanceProvider.h"
#include "DNXApiCaller.h"
#include "PropertyRows.h"
#include "ProviderFactories.h"
#include "SystemConfig.h"

namespace {

/// One property: its value is words(value under the key).
struct Field {
    const char* property;
    ValueKind kind;
    const char* key;
    std::string (*words)(const std::string& value);
};

struct SystemClass {
    const char* name;
    zemApiReader oneReader, allReader;
    apiProp* (zemApiCaller::*one)(const char* user, const char* key, int level);
    apiProp* (zemApiCaller::*all)(const char* user, int level);
    bool (*isKey)(const std::string& text);
    std::vector<Field> fields;
};

constexpr int kLevel = 1;  // identity and state

// Words for values.

std::string same(const std::string& value) { return value; }

/// The library tells states by number; what is no number has no words.
template <class System>
std::string stateOf(const std::string& value) {
    char* end = nullptr;
    const long state = std::strtol(value.c_str(), &end, 10);
    if (value.empty() || *end != '\0' || state < 0 || state > 0xFFFF) {
        return "";
    }
    return static_cast<const char*>(System::getStateByID(static_cast<int>(state)));
}

std::string beforeStar(const std::string& key) { return key.substr(0, key.find('*')); }

std::string behindStar(const std::string& key) {
    const std::size_t star = key.find('*');
    return star == std::string::npos ? "" : key.substr(star + 1);
}

bool isPartitionName(const std::string& text) {
    return zemString(beforeStar(text).c_str()).isDigit() && isHostName(behindStar(text));
}

const SystemClass& hostClass() {
    static const SystemClass host = {
        "ORXC_ApiHost",
        {"ORXC_ApiHost", "getInstance", "getCecObj"},
        {"ORXC_ApiHost", "enumInstances", "getAllCecs"},
        &zemApiCaller::getCecObj,
        &zemApiCaller::getAllCecs,
        isHostName,
        {
            {"ElementName", ValueKind::Text, "UserDefinedName", same},
            {"EnabledState", ValueKind::EnabledState, "State", stateOf<zemHostSystem>},
            {"State", ValueKind::Text, "State", stateOf<zemHostSystem>},
            {"TypeModel", ValueKind::Text, "Name", beforeStar},
            {"SerialNumber", ValueKind::Text, "Name", behindStar},
            {"IPAddress", ValueKind::Text, "PrimaryFSP_IP", same},
        }};
    return host;
}

const SystemClass& partitionClass() {
    static const SystemClass partition = {
        "ORXC_ApiPartition",
        {"ORXC_ApiPartition", "getInstance", "getLparObj"},
        {"ORXC_ApiPartition", "enumInstances", "getAllLpars"},
        &zemApiCaller::getLparObj,
        &zemApiCaller::getAllLpars,
        isPartitionName,
        {
            {"ElementName", ValueKind::Text, "UserDefinedName", same},
            {"EnabledState", ValueKind::EnabledState, "PartitionState", stateOf<zemVirtualSystem>},
            {"State", ValueKind::Text, "PartitionState", stateOf<zemVirtualSystem>},
            {"LparID", ValueKind::Uint16, "Name", beforeStar},
            {"HostName", ValueKind::Text, "Name", behindStar},
            {"LparEnvironment", ValueKind::Text, "Lpar_env", same},
        }};
    return partition;
}

class ApiSystemProvider : public zemBaseZemInstanceProvider {
protected:
    ApiSystemProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name,
                      const SystemClass& system)
        : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, name), m_system(system) {
        for (const Field& field : system.fields) {
            m_rows.push_back({field.property, field.kind, static_cast<int>(m_rows.size())});
        }
    }

    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;

    int getInstance(const CmpiContext& context, const CmpiObjectPath& path, const char** properties,
                    CmpiInstance& out) override {
        const CmpiString creationClass = getKeyBinding(path, "CreationClassName").getString();
        const std::string name = getKeyBinding(path, "Name").getString().charPtr();
        if (strcasecmp(creationClass.charPtr(), m_system.name) != 0 || !m_system.isKey(name)) {
            return -1;
        }
        try {
            const zemApiObjects systems(
                m_system.oneReader,
                (zemApiCaller().*m_system.one)(getUserContext(context), name.c_str(), kLevel));
            out = makeInstance(path, properties, systems.only(name.c_str()));
        } catch (const zemException& e) {
            if (!isUnknownObject(e)) {
                throw;
            }
            return -1;
        }
        return 0;
    }

    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out, const CmpiObjectPath&) override {
        for (apiProp& system : all(context)) {
            out.addElement(
                std::make_unique<CmpiObjectPath>(systemPath(path, m_system.name, nameOf(system))));
        }
    }

    void enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                       const char** properties, zemDynamicArray<CmpiInstance>& out,
                       const CmpiObjectPath&) override {
        for (apiProp& system : all(context)) {
            out.addElement(std::make_unique<CmpiInstance>(makeInstance(path, properties, system)));
        }
    }

    CMPIBoolean isValidInstanceClass(const char* className) override {
        return compareClassNames(className, m_system.name);
    }

    void populateEssentialKeys(const char*, CmpiArray& keys) override { listSystemKeys(keys); }

private:
    zemApiObjects all(const CmpiContext& context) {
        return {m_system.allReader,
                (zemApiCaller().*m_system.all)(getUserContext(context), kLevel)};
    }

    static std::string nameOf(apiProp& system) {
        return std::string(zemApiProp(&system).getProperty("Name"));
    }

    CmpiInstance makeInstance(const CmpiObjectPath& near, const char** properties,
                              apiProp& system) {
        const zemApiProp object(&system);
        zemRecordType record(static_cast<unsigned>(m_rows.size()));
        for (const PropertyRow& row : m_rows) {
            const Field& field = m_system.fields[static_cast<std::size_t>(row.attribute)];
            const zemString value = object.getProperty(field.key);
            record.insert(row.attribute, field.words(static_cast<const char*>(value)).c_str());
        }
        CmpiInstance instance =
            newInstance(systemPath(near, m_system.name, nameOf(system)), properties);
        setProperties(instance, m_rows, properties, record);
        return instance;
    }

    const SystemClass& m_system;
    std::vector<PropertyRow> m_rows;  ///< the fields, each with its own index as attribute
};

template <const SystemClass& (*system)()>
class ApiProviderOf : public ApiSystemProvider {
public:
    ApiProviderOf(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), ApiSystemProvider(mb, ctx, name, system()) {}
};

}  // namespace

ZEM_PROVIDER(ORXC_ApiHostProvider, ApiProviderOf<hostClass>)
ZEM_PROVIDER(ORXC_ApiPartitionProvider, ApiProviderOf<partitionClass>)
