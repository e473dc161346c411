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

constexpr char kClass[] = "zemHostSystem";

constexpr int kNoConnection = 254;

/// The bit of "RuntimeCapability" that tells whether the host runs osq00 partitions.
constexpr int kOsq00Bit = 30;

constexpr int kBase = 10;

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Migration = zemQymoveCmdCaller::ManagedSystemAttribute;

}  // namespace

int zemHostSystem::m_managedSystemInfoAttr[] = {Host::ATTR_NAME,          Host::ATTR_TYPE_MODEL,
                                                Host::ATTR_SERIAL_NUM,    Host::ATTR_STATE,
                                                Host::ATTR_OSQ00_CAPABLE, Host::ATTR_END};

zemHostSystem::zemHostSystem(apiProp& prop, const char* requestUserContext, const char* locale)
    : m_requestUserContext(requestUserContext), m_locale(locale) {
    parseApiProp(prop);
}

zemHostSystem::zemHostSystem(const zemString& mtms, const char* requestUserContext,
                             const char* locale)
    : m_requestUserContext(requestUserContext), m_locale(locale) {
    setMTMS(mtms);
}

zemHostSystem::~zemHostSystem() = default;

void zemHostSystem::setMTMS(const zemString& mtms) {
    const int star = mtms.find('*');
    m_typeModel = mtms.extractSubstring(0, static_cast<unsigned>(star));
    m_serialNum = mtms.extractSubstring(static_cast<unsigned>(star + 1));
}

void zemHostSystem::updateData(OP_LEVEL level) {
    const int depth = level == OP_LEVEL_ALL ? OP_LEVEL_2 : level;
    // Not getMTMS(), which comes here for a host without a key.
    const zemString mtms = m_typeModel + "*" + m_serialNum;
    const zemApiReader reader = {kClass, "updateData", "getCecObj"};
    const zemApiObjects hosts(reader, zemApiCaller().getCecObj(m_requestUserContext, mtms, depth));
    parseApiProp(hosts.only(mtms));
}

void zemHostSystem::parseApiProp(apiProp& prop) {
    const zemApiProp host(&prop);
    m_gotLevel1 = true;
    m_name = host.getProperty("UserDefinedName");
    m_state = zemNumberOf(host.getProperty("State"));
    m_primaryFspIP = host.getProperty("PrimaryFSP_IP");
    m_backupFspIP = host.getProperty("BackupFSP_IP");
    setMTMS(host.getProperty("Name"));
    const zemString runtime = host.getProperty("RuntimeCapability");
    m_osq00Capable = (std::strtoull(runtime, nullptr, kBase) >> kOsq00Bit & 1U) != 0;
    if (zemApiProp::getProperty(&prop, "ProcCompatModesSupported") != nullptr) {
        m_gotLevel2 = true;
        m_lparProcCompatModes = host.getProperty("ProcCompatModesSupported");
        m_ipmiPassThroughCapable = host.getProperty("Capability");
    }
}

void zemHostSystem::needLevel1() {
    if (!m_gotLevel1) {
        updateData(OP_LEVEL_1);
    }
}

zemString zemHostSystem::getMTMS() {
    if (!m_gotLevel1 && !m_gotLevel2 && m_typeModel.isEmpty()) {
        updateData(OP_LEVEL_1);
    }
    return m_typeModel + "*" + m_serialNum;
}

/// A getter of what identity and state tell.
#define ZEM_HOST_GETTER(TYPE, NAME, FIELD) \
    TYPE zemHostSystem::NAME() {           \
        needLevel1();                      \
        return FIELD;                      \
    }

ZEM_HOST_GETTER(zemString, getSystemName, m_name)
ZEM_HOST_GETTER(zemString, getTypeModel, m_typeModel)
ZEM_HOST_GETTER(zemString, getSerialNumber, m_serialNum)
ZEM_HOST_GETTER(zemString, getPrimaryFSPIP, m_primaryFspIP)
ZEM_HOST_GETTER(zemString, getBackupFSPIP, m_backupFspIP)
ZEM_HOST_GETTER(int, getState, m_state)
ZEM_HOST_GETTER(bool, getOsq00Capable, m_osq00Capable)
ZEM_HOST_GETTER(bool, isConnected, m_state != kNoConnection)

zemString zemHostSystem::getStateByID(int state) { return zemHostStateText(state); }

zemDynamicArray<zemVirtualSystem> zemHostSystem::readPartitions(const char* method,
                                                                const char* environment) {
    const zemApiReader reader = {kClass, method, "getAllLparsFromCec", "UNKNOWN"};
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
    const zemRecordSetsType records = zemWithNotFound(kUnknownToChanges, kClass, method, [&] {
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
        throw zemObjectNotFoundException(kClass, method, text);
    }
    // State and boot mode stand in the record as words; the object reads their numbers.
    return zemVirtualSystem((*records.getElementAt(found))[Partition::ATTR_LPAR_ID], *this,
                            m_requestUserContext, m_locale);
}

zemVirtualSystem zemHostSystem::getVirtualSystemById(const zemString& lparId) {
    const zemString key = lparId + "*" + getMTMS();
    const zemApiReader reader = {kClass, "getVirtualSystemById", "getLparObj"};
    const zemApiObjects partitions(reader, zemApiCaller().getLparObj(m_requestUserContext, key, 1));
    return zemVirtualSystem(partitions.only(key), *this, m_requestUserContext, m_locale);
}

zemString zemHostSystem::migrationCapability(int row, const char* method) {
    int wanted[] = {row, Migration::ATTR_END};
    const zemRecordSetsType records = zemQymoveCmdCaller(m_requestUserContext, m_locale)
                                          .getManagedSystemCapabilities(wanted, getMTMS());
    if (records.size() == 0) {
        throw zemOperationFailedException(kClass, method, zemString(records.size()));
    }
    return (*records.getElementAt(0))[row];
}

#define ZEM_MIGRATION_FLAG(NAME, ROW) \
    bool zemHostSystem::NAME() { return migrationCapability(Migration::ATTR_##ROW, #NAME) == "1"; }
#define ZEM_MIGRATION_NUMBER(NAME, ROW)                                        \
    int zemHostSystem::NAME() {                                                \
        return zemNumberOf(migrationCapability(Migration::ATTR_##ROW, #NAME)); \
    }

ZEM_MIGRATION_FLAG(isEnableInactiveMigration, INACTIVE_LPAR_MOBILITY_CAPABLE)
ZEM_MIGRATION_NUMBER(getMaxInactiveMigrationNum, NUM_INACTIVE_MIGRATIONS_SUPPORTED)
ZEM_MIGRATION_NUMBER(getCurrentInactiveMigrationNum, NUM_INACTIVE_MIGRATIONS_IN_PROGRESS)
ZEM_MIGRATION_FLAG(isEnableActiveMigration, ACTIVE_LPAR_MOBILITY_CAPABLE)
ZEM_MIGRATION_NUMBER(getMaxActiveMigrationNum, NUM_ACTIVE_MIGRATIONS_SUPPORTED)
ZEM_MIGRATION_NUMBER(getCurrentActiveMigrationNum, NUM_ACTIVE_MIGRATIONS_IN_PROGRESS)

int zemHostSystem::destoryVirtualSystem(const char* lparId) {
    const std::string line =
        "dlplat -r lpar -m " + zemQuoted(getMTMS()) + " --id " + zemQuoted(lparId);
    return zemCommandCaller(m_requestUserContext, nullptr)
        .callGenericCommand(line.c_str(), nullptr, false);
}

int zemHostSystem::createVirtualSystem(const zemDynamicArray<tagAttributePair>& attrPairs) {
    return zemNwplatCmdCaller(m_requestUserContext, m_locale)
        .makePartitionsInformation(attrPairs, getMTMS());
}

bool zemHostSystem::IsUnusedLparId(const zemString& lparId) try {
    const zemString mtms = getMTMS();
    const zemString key = lparId + "*" + mtms;
    const zemApiReader reader = {kClass, "IsUnusedLparId", "getAllLparsFromCec"};
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
