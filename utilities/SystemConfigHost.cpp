#include <cstdlib>
#include <memory>
#include <string>

#include "CommandLine.h"
#include "DNXApiCaller.h"
#include "LetUnwind.h"
#include "NwplatCmdCaller.h"
#include "QymoveCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "SystemConfig.h"
#include "SystemConfigSupport.h"
#include "SystemStateText.h"

namespace {

constexpr char kHostSystem[] = "zemHostSystem";

constexpr int kNoConnection = 254;

/// The bit of "RuntimeCapability" that tells whether the host runs osq00 partitions.
constexpr int kOsq00Bit = 30;

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using HostMigration = zemQymoveCmdCaller::ManagedSystemAttribute;

}  // namespace

int zemHostSystem::m_managedSystemInfoAttr[] = {Host::ATTR_NAME,          Host::ATTR_TYPE_MODEL,
                                                Host::ATTR_SERIAL_NUM,    Host::ATTR_STATE,
                                                Host::ATTR_OSQ00_CAPABLE, Host::ATTR_END};

zemHostSystem::zemHostSystem(apiProp& prop, const char* requestUserContext, const char* locale)
    : zemConfigObject(requestUserContext, locale) {
    parseApiProp(prop);
}

zemHostSystem::zemHostSystem(const zemString& mtms, const char* requestUserContext,
                             const char* locale)
    : zemConfigObject(requestUserContext, locale) {
    setMTMS(mtms);
}

zemHostSystem::~zemHostSystem() = default;

void zemHostSystem::setMTMS(const zemString& mtms) {
    const int star = mtms.find('*');
    m_typeModel = mtms.extractSubstring(0, static_cast<unsigned>(star));
    m_serialNum = mtms.extractSubstring(static_cast<unsigned>(star + 1));
}

void zemHostSystem::updateData(OP_LEVEL level) {
    // Not getMTMS(), which comes here for a host without a key.
    const zemString mtms = m_typeModel + "*" + m_serialNum;
    const zemApiReader reader = {kHostSystem, "updateData", "getCecObj"};
    const zemApiObjects hosts(
        reader, zemApiCaller().getCecObj(m_requestUserContext, mtms, detailOf(level)));
    parseApiProp(hosts.only(mtms));
}

void zemHostSystem::parseApiProp(apiProp& prop) {
    using Self = zemHostSystem;
    static constexpr zemConfigField<Self> kLevel1[] = {
        {"UserDefinedName", zemSetText<&Self::m_name>},
        {"State", zemSetNumber<&Self::m_state>},
        {"PrimaryFSP_IP", zemSetText<&Self::m_primaryFspIP>},
        {"BackupFSP_IP", zemSetText<&Self::m_backupFspIP>},
        {"Name", [](Self& host, const zemString& value) { host.setMTMS(value); }},
        {"RuntimeCapability",
         [](Self& host, const zemString& value) {
             const auto bits = std::strtoull(value, nullptr, zemNumberBase);
             host.m_osq00Capable = (bits >> kOsq00Bit & 1U) != 0;
         }},
    };
    static constexpr zemConfigField<Self> kLevel2[] = {
        {"ProcCompatModesSupported", zemSetText<&Self::m_lparProcCompatModes>},
        {"Capability", zemSetText<&Self::m_ipmiPassThroughCapable>},
    };
    m_gotLevel1 = true;
    zemReadApiFields(&prop, *this, kLevel1);
    if (zemApiProp::getProperty(&prop, "ProcCompatModesSupported") != nullptr) {
        m_gotLevel2 = true;
        zemReadApiFields(&prop, *this, kLevel2);
    }
}

zemString zemHostSystem::getMTMS() {
    if (m_typeModel.isEmpty()) {
        need(OP_LEVEL_1);
    }
    return m_typeModel + "*" + m_serialNum;
}

ZEM_CONFIG_GETTER(zemHostSystem, zemString, getSystemName, 1, m_name)
ZEM_CONFIG_GETTER(zemHostSystem, zemString, getTypeModel, 1, m_typeModel)
ZEM_CONFIG_GETTER(zemHostSystem, zemString, getSerialNumber, 1, m_serialNum)
ZEM_CONFIG_GETTER(zemHostSystem, zemString, getPrimaryFSPIP, 1, m_primaryFspIP)
ZEM_CONFIG_GETTER(zemHostSystem, zemString, getBackupFSPIP, 1, m_backupFspIP)
ZEM_CONFIG_GETTER(zemHostSystem, int, getState, 1, m_state)
ZEM_CONFIG_GETTER(zemHostSystem, bool, getOsq00Capable, 1, m_osq00Capable)
ZEM_CONFIG_GETTER(zemHostSystem, bool, isConnected, 1, m_state != kNoConnection)

zemString zemHostSystem::getStateByID(int state) { return zemHostStateText(state); }

zemDynamicArray<zemVirtualSystem> zemHostSystem::readPartitions(const char* method,
                                                                const char* environment) {
    const zemApiReader reader = {kHostSystem, method, "getAllLparsFromCec", "UNKNOWN"};
    const zemApiObjects objects(
        reader, zemApiCaller().getAllLparsFromCec(m_requestUserContext, getMTMS(), 1));
    zemDynamicArray<zemVirtualSystem> partitions;
    for (apiProp& partition : objects) {
        if (environment == nullptr ||
            zemApiProp(&partition).getProperty("Lpar_env") == environment) {
            partitions.addElement(std::make_unique<zemVirtualSystem>(
                partition, *this, m_requestUserContext, m_locale));
        }
    }
    return partitions;
}

zemDynamicArray<zemVirtualSystem> zemHostSystem::getAllVirtualSystem() {
    return readPartitions("getAllVirtualSystem", nullptr);
}

zemDynamicArray<zemVirtualSystem> zemHostSystem::getAllXBRG() {
    return readPartitions("getAllXBRG", "xbrgserver");
}

zemVirtualSystem zemHostSystem::getVirtualSystemByName(const zemString& lparName) {
    using Partition = zemQyplatCmdCaller::PartitionAttribute;
    const char* const method = "getVirtualSystemByName";
    const zemString mtms = getMTMS();
    const zemRecordSetsType records = zemWithNotFound(kUnknownToChanges, kHostSystem, method, [&] {
        const zemString filter =
            zemCommandCaller::quoted(zemCommandCaller::filterItem("lpar_names", lparName));
        return zemQyplatCmdCaller(m_requestUserContext, m_locale)
            .getPartitionsInformation(zemVirtualSystem::m_virtualSystemInfoAttr, mtms, filter);
    });
    // Several answer a name with commas when that is not one partition's, but the names of several.
    int found = records.size() == 1 ? 0 : -1;
    for (int i = 0; i < records.size(); ++i) {
        if ((*records.getElementAt(i))[Partition::ATTR_NAME] == lparName) {
            found = i;
        }
    }
    if (found < 0) {
        zemString text;
        text.format("The requested patition(name:%s) was not found on managed system %s",
                    static_cast<const char*>(lparName), static_cast<const char*>(mtms));
        throw zemObjectNotFoundException(kHostSystem, method, text);
    }
    // State and boot mode stand in the record as words; the object reads their numbers.
    return zemVirtualSystem((*records.getElementAt(found))[Partition::ATTR_LPAR_ID], *this,
                            m_requestUserContext, m_locale);
}

zemVirtualSystem zemHostSystem::getVirtualSystemById(const zemString& lparId) {
    const zemString key = lparId + "*" + getMTMS();
    const zemApiReader reader = {kHostSystem, "getVirtualSystemById", "getLparObj"};
    const zemApiObjects partitions(reader, zemApiCaller().getLparObj(m_requestUserContext, key, 1));
    return zemVirtualSystem(partitions.only(key), *this, m_requestUserContext, m_locale);
}

zemString zemHostSystem::migrationCapability(int row, const char* method) {
    int wanted[] = {row, HostMigration::ATTR_END};
    const zemRecordSetsType records = zemQymoveCmdCaller(m_requestUserContext, m_locale)
                                          .getManagedSystemCapabilities(wanted, getMTMS());
    if (records.size() == 0) {
        throw zemOperationFailedException(kHostSystem, method, zemString(records.size()));
    }
    return (*records.getElementAt(0))[row];
}

#define ZEM_MIGRATION_FLAG(NAME, ROW)                                        \
    bool zemHostSystem::NAME() {                                             \
        return migrationCapability(HostMigration::ATTR_##ROW, #NAME) == "1"; \
    }
#define ZEM_MIGRATION_NUMBER(NAME, ROW)                                            \
    int zemHostSystem::NAME() {                                                    \
        return zemNumberOf(migrationCapability(HostMigration::ATTR_##ROW, #NAME)); \
    }

ZEM_MIGRATION_FLAG(isEnableInactiveMigration, INACTIVE_LPAR_MOBILITY_CAPABLE)
ZEM_MIGRATION_NUMBER(getMaxInactiveMigrationNum, NUM_INACTIVE_MIGRATIONS_SUPPORTED)
ZEM_MIGRATION_NUMBER(getCurrentInactiveMigrationNum, NUM_INACTIVE_MIGRATIONS_IN_PROGRESS)
ZEM_MIGRATION_FLAG(isEnableActiveMigration, ACTIVE_LPAR_MOBILITY_CAPABLE)
ZEM_MIGRATION_NUMBER(getMaxActiveMigrationNum, NUM_ACTIVE_MIGRATIONS_SUPPORTED)
ZEM_MIGRATION_NUMBER(getCurrentActiveMigrationNum, NUM_ACTIVE_MIGRATIONS_IN_PROGRESS)

int zemHostSystem::destoryVirtualSystem(const char* lparId) {
    return zemCommandCaller(m_requestUserContext, nullptr)
        .callGenericCommand(zemRemovalLine(getMTMS(), lparId).c_str(), nullptr, false);
}

int zemHostSystem::createVirtualSystem(const zemDynamicArray<tagAttributePair>& attrPairs) {
    return zemNwplatCmdCaller(m_requestUserContext, m_locale)
        .makePartitionsInformation(attrPairs, getMTMS());
}

bool zemHostSystem::IsUnusedLparId(const zemString& lparId) try {
    const zemString mtms = getMTMS();
    const zemString key = lparId + "*" + mtms;
    const zemApiReader reader = {kHostSystem, "IsUnusedLparId", "getAllLparsFromCec"};
    for (apiProp& partition :
         zemApiObjects(reader, zemApiCaller().getAllLparsFromCec(m_requestUserContext, mtms, 1))) {
        if (zemApiProp(&partition).getProperty("Name") == key) {
            return false;
        }
    }
    return true;
} catch (const zemException&) {
    return false;  // the library cannot tell
} catch (...) {
    zemLetUnwind();
    return true;  // up to here no partition had the number
}
