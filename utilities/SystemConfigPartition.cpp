#include <cmath>
#include <cstdlib>
#include <memory>
#include <string>

#include "CommandLine.h"
#include "DNXApiCaller.h"
#include "EdplatCmdCaller.h"
#include "LetUnwind.h"
#include "PropertiesHelper.h"
#include "QymoveCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "SystemConfig.h"
#include "SystemConfigSupport.h"
#include "SystemStateText.h"

namespace {

constexpr char kVirtualSystem[] = "zemVirtualSystem";

constexpr int kNotActivated = 0;

using Partition = zemQyplatCmdCaller::PartitionAttribute;
using PartitionChange = zemEdplatCmdCaller::PartitionAttribute;

/// What a tool of moves says of its failure: an id up to the first blank, and the words behind it.
[[noreturn]] void throwMoveFailure(const std::string& line, const zemString& errors,
                                   const zemString& output, const char* method) {
    zemString text = errors.isEmpty() ? output : errors;
    zemString id = "UNKNOWN";
    const int blank = text.find(' ');
    if (blank > 0) {
        id = text.extractSubstring(0, static_cast<unsigned>(blank));
        text = text.extractSubstring(static_cast<unsigned>(blank) + 1);
    }
    // The class is another one's; clients know these failures so.
    throw zemOperationFailedException("zemHostSystem", method, line.c_str(), id, text);
}

}  // namespace

int zemVirtualSystem::m_virtualSystemInfoAttr[] = {Partition::ATTR_LPAR_ID,
                                                   Partition::ATTR_STATE,
                                                   Partition::ATTR_NAME,
                                                   Partition::ATTR_CURR_PROFILE,
                                                   Partition::ATTR_DEFAULT_PROFILE,
                                                   Partition::ATTR_LPAR_ENV,
                                                   Partition::ATTR_BOOT_MODE,
                                                   Partition::ATTR_END};

zemVirtualSystem::zemVirtualSystem(apiProp& prop, const zemHostSystem& host,
                                   const char* requestUserContext, const char* locale)
    : zemConfigObject(requestUserContext, locale), m_hostSystem(host) {
    parseApiProp(prop);
}

zemVirtualSystem::zemVirtualSystem(apiProp& prop, const char* requestUserContext,
                                   const char* locale)
    : zemConfigObject(requestUserContext, locale) {
    const zemString key = zemApiProp(&prop).getProperty("Name");
    m_hostSystem = zemHostSystem(key.extractSubstring(static_cast<unsigned>(key.find('*') + 1)),
                                 requestUserContext, locale);
    parseApiProp(prop);
}

zemVirtualSystem::zemVirtualSystem(const zemString& lparId, const zemHostSystem& host,
                                   const char* requestUserContext, const char* locale)
    : zemConfigObject(requestUserContext, locale), m_lparId(lparId), m_hostSystem(host) {}

zemVirtualSystem::~zemVirtualSystem() = default;

void zemVirtualSystem::updateData(OP_LEVEL level) {
    const zemString key = getLparIDAndMTMS();
    const zemApiReader reader = {kVirtualSystem, "updateData", "getLparObj"};
    const zemApiObjects partitions(
        reader, zemApiCaller().getLparObj(m_requestUserContext, key, detailOf(level)));
    parseApiProp(partitions.only(key));
}

void zemVirtualSystem::parseApiProp(apiProp& prop) {
    using Self = zemVirtualSystem;
    static constexpr zemConfigField<Self> kFields[] = {
        {"Name",
         [](Self& partition, const zemString& key) {
             partition.m_lparId = key.extractSubstring(0, static_cast<unsigned>(key.find('*')));
         }},
        {"UserDefinedName", zemSetText<&Self::m_lparName>},
        {"DefinitionState",
         [](Self& partition, const zemString& state) {
             const zemString environment(zemEnvironmentText(zemNumberOf(state)));
             partition.m_lparEnv = environment.isEmpty() ? state : environment;
         }},
        {"PartitionState", zemSetNumber<&Self::m_lparState>},
        {"BootMode", zemSetNumber<&Self::m_bootMode>},
        {"MigrationState", zemSetNumber<&Self::m_migrationState>},
        {"RedundantPath",
         [](Self& partition, const zemString& state) {
             partition.m_redundantPath = zemNumberOf(state) == 0;  // 0 is on
         }},
        {"Keylock", zemSetNumber<&Self::m_lparKeylock>},
        {"ProcCompatMode", zemSetText<&Self::m_procCompatMode>},
    };
    static constexpr zemConfigField<Self> kLevel2[] = {
        {"Default_prof",
         [](Self& partition, const zemString& profile) {
             partition.m_defaultProfile = zemProfileNameOf(profile);
         }},
        {"Curr_prof",
         [](Self& partition, const zemString& profile) {
             partition.m_currProfile = zemProfileNameOf(profile);
         }},
    };
    m_gotLevel1 = true;
    zemReadApiFields(&prop, *this, kFields);
    if (zemApiProp::getProperty(&prop, "Default_prof") != nullptr) {
        m_gotLevel2 = true;
        zemReadApiFields(&prop, *this, kLevel2);
    }
}

zemString zemVirtualSystem::ownFilter() const {
    return zemCommandCaller::quoted(zemCommandCaller::filterItem("lpar_ids", m_lparId));
}

zemString zemVirtualSystem::getLparIDAndMTMS() { return m_lparId + "*" + getMTMS(); }

ZEM_CONFIG_GETTER(zemVirtualSystem, zemString, getName, 1, m_lparName)
ZEM_CONFIG_GETTER(zemVirtualSystem, zemString, getEnv, 1, m_lparEnv)
ZEM_CONFIG_GETTER(zemVirtualSystem, bool, isXBRG, 1, m_lparEnv == "xbrgserver")
ZEM_CONFIG_GETTER(zemVirtualSystem, bool, isOSQ00, 1, m_lparEnv == "osq00")
ZEM_CONFIG_GETTER(zemVirtualSystem, int, getState, 1, m_lparState)
ZEM_CONFIG_GETTER(zemVirtualSystem, bool, isLive, 1, m_lparState != kNotActivated)
ZEM_CONFIG_GETTER(zemVirtualSystem, int, getBootMode, 1, m_bootMode)
ZEM_CONFIG_GETTER(zemVirtualSystem, int, getMigrationState, 1,
                  zemMigrationStateOf(m_migrationState))
ZEM_CONFIG_GETTER(zemVirtualSystem, zemString, getMigrationStateString, 1,
                  zemMigrationStateText(zemMigrationStateOf(m_migrationState)))
ZEM_CONFIG_GETTER(zemVirtualSystem, zemString, getDefaultProfileName, 2, m_defaultProfile)
ZEM_CONFIG_GETTER(zemVirtualSystem, zemString, getCurrentProfileName, 2, m_currProfile)
ZEM_CONFIG_GETTER(zemVirtualSystem, zemString, getProcCompatMode, 2, m_procCompatMode)
ZEM_CONFIG_GETTER(zemVirtualSystem, int, getKeyLock, 2, zemKeylockOf(m_lparKeylock))
ZEM_CONFIG_GETTER(zemVirtualSystem, bool, getRedundantPath, 2, m_redundantPath)

zemString zemVirtualSystem::getStateByID(int state) { return zemPartitionStateText(state); }

zemString zemVirtualSystem::getKeyLockByID(int position) { return zemKeylockText(position); }

zemString zemVirtualSystem::getBootModeByID(int bootMode) { return zemBootModeText(bootMode); }

int zemVirtualSystem::getMigrationState(int number) { return zemMigrationStateOf(number); }

int zemVirtualSystem::getMigrationStateFromString(const zemString& text) {
    return zemMigrationStateOf(static_cast<const char*>(text));
}

std::string zemVirtualSystem::moveLine(char operation, const zemString& targetHost,
                                       bool isCrossManager, const zemString& targetManager,
                                       const char* userName) {
    std::string manager;
    if (isCrossManager) {
        manager = std::string("--ip ") + static_cast<const char*>(targetManager);
        if (userName != nullptr) {
            manager += std::string("-u ") + userName;  // no blank before it: the tool gets it so
        }
    }
    return std::string("domove -o ") + operation + " -m " + zemQuoted(getMTMS()) + " -t " +
           zemQuoted(targetHost) + ' ' + manager + " --id " + zemQuoted(m_lparId);
}

bool zemVirtualSystem::validateMigratebility(const zemString& targetHost, bool isCrossManager,
                                             const zemString& targetManager, const char* userName) {
    const std::string line = moveLine('v', targetHost, isCrossManager, targetManager, userName);
    zemString output;
    zemString errors;
    int exitCode = -1;
    zemPropertiesHelper::executeCommand(line.c_str(), output, errors, &exitCode,
                                        m_requestUserContext, 0, m_locale, false);
    if (exitCode != 0) {
        throwMoveFailure(line, errors, output, "getVirtualSystemByName");
    }
    return true;
}

int zemVirtualSystem::migrateTo(const zemString& targetHost, bool isCrossManager,
                                const zemString& targetManager, const char* userName, pid_t* pid,
                                FILE** fpOutput) {
    const std::string line = moveLine('m', targetHost, isCrossManager, targetManager, userName);
    const int rc = zemPropertiesHelper::asynExecuteCommand(line.c_str(), pid, fpOutput,
                                                           m_requestUserContext, m_locale);
    if (rc != 0) {
        const std::string text = "Command:\"" + line + "\" ReturnCode:" + std::to_string(rc);
        throw zemNotSupportedException(kVirtualSystem, "validateMigratebility", text.c_str());
    }
    return 0;
}

int zemVirtualSystem::stopMigration(const zemString& /*targetHost*/, bool /*isCrossManager*/,
                                    const zemString& /*targetManager*/, const char* /*userName*/,
                                    int timeOut) {
    const std::string line =
        "domove -o s -m " + zemQuoted(getMTMS()) + " --id " + zemQuoted(m_lparId);
    zemString output;
    zemString errors;
    int exitCode = -1;
    const int rc = zemPropertiesHelper::executeCommand(
        line.c_str(), output, errors, &exitCode, m_requestUserContext, timeOut, m_locale, false);
    if (rc == 0 && exitCode != 0) {
        throwMoveFailure(line, errors, output, "stopMigration");
    }
    return rc;
}

int zemVirtualSystem::getMigrationPercentComplete(const char* userName) try {
    using Migration = zemQymoveCmdCaller::PartitionAttribute;
    int wanted[] = {Migration::ATTR_BYTES_TRANSMITTED, Migration::ATTR_BYTES_REMAINING,
                    Migration::ATTR_END};
    const zemRecordSetsType records =
        zemQymoveCmdCaller(userName, nullptr)
            .getPartitionsMigrationState(wanted, getMTMS(), ownFilter());
    if (records.size() == 0) {
        return -1;
    }
    zemRecordType& record = *records.getElementAt(0);
    const auto sent = static_cast<double>(std::strtoull(record[wanted[0]], nullptr, zemNumberBase));
    const auto left = static_cast<double>(std::strtoull(record[wanted[1]], nullptr, zemNumberBase));
    constexpr double kSentAll = 90.0;
    return sent + left > 0 ? static_cast<int>(std::lround(sent / (sent + left) * kSentAll)) : 0;
} catch (...) {
    zemLetUnwind();
    return -1;
}

int zemVirtualSystem::change(int attributeIndex, const zemString& value, const char* method) {
    return zemWithNotFound(kUnknownToChanges, kVirtualSystem, method, [&] {
        zemDynamicArray<tagAttributePair> pairs;
        pairs.addElement(
            std::make_unique<tagAttributePair>(attributeIndex, zemCommandCaller::itemValue(value)));
        return zemEdplatCmdCaller(m_requestUserContext, m_locale)
            .modifyPartitionsInformation(m_lparId, pairs, getMTMS());
    });
}

int zemVirtualSystem::setDefaultProfile(const zemString& profileName) {
    return change(PartitionChange::ATTR_DEFAULT_PROFILE, profileName, "setDefaultProfile");
}

int zemVirtualSystem::setName(const zemString& systemName) {
    return change(PartitionChange::ATTR_NEW_NAME, systemName, "setVirtualSystemName");
}

int zemVirtualSystem::setKeylock(const zemString& keylockPos) {
    return zemWithNotFound(kUnknownToChanges, kVirtualSystem, "setKeylock", [&] {
        const std::string line = zemKeylockLine(getMTMS(), m_lparId, keylockPos);
        return zemCommandCaller(m_requestUserContext, m_locale)
            .callGenericCommand(line.c_str(), nullptr, false);
    });
}

zemVirtualSystemProfile zemVirtualSystem::getCurrentProfile() {
    return getVirtualSystemProfileByName(getCurrentProfileName());
}

zemVirtualSystemProfile zemVirtualSystem::getDefaultProfile() {
    return getVirtualSystemProfileByName(getDefaultProfileName());
}

zemDynamicArray<zemVirtualSystemProfile> zemVirtualSystem::getAllVirtualSystemProfiles() {
    const zemApiReader reader = {kVirtualSystem, "getAllVirtualSystemProfiles",
                                 "getAllLparProfilesFromLpar", "UNKNOWN"};
    const zemApiObjects objects(reader, zemApiCaller().getAllLparProfilesFromLpar(
                                            m_requestUserContext, getLparIDAndMTMS(), 1));
    zemDynamicArray<zemVirtualSystemProfile> profiles;
    for (apiProp& profile : objects) {
        profiles.addElement(std::make_unique<zemVirtualSystemProfile>(
            profile, *this, m_requestUserContext, m_locale));
    }
    return profiles;
}

zemVirtualSystemProfile zemVirtualSystem::getVirtualSystemProfileByName(
    const zemString& profileName) {
    const zemApiReader reader = {kVirtualSystem, "getVirtualSystemProfileByName", "getLparProfile"};
    const zemApiObjects profiles(
        reader,
        zemApiCaller().getLparProfile(m_requestUserContext, getLparIDAndMTMS(), profileName, 1));
    return zemVirtualSystemProfile(profiles.only(profileName), *this, m_requestUserContext,
                                   m_locale);
}

zemString zemVirtualSystem::getAttributeValue(int attributeIndex) {
    const char* const method = "getAttributeValue";
    zemExpectAttribute(attributeIndex, kVirtualSystem, method);
    int wanted[] = {attributeIndex, Partition::ATTR_END};
    const zemString key = getLparIDAndMTMS();
    const zemRecordSetsType records =
        zemWithNotFound(kUnknownToQueries, kVirtualSystem, method, [&] {
            return zemQyplatCmdCaller(m_requestUserContext, m_locale)
                .getPartitionsInformation(wanted, getMTMS(), ownFilter());
        });
    if (records.size() == 0) {
        throw zemObjectNotFoundException(kVirtualSystem, method, key);
    }
    return (*records.getElementAt(0))[attributeIndex];
}
