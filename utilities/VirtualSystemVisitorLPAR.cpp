#include "VirtualSystemVisitorLPAR.h"

#include <cctype>
#include <charconv>
#include <iterator>
#include <memory>
#include <string>
#include <string_view>

#include "CommandLine.h"
#include "Exception.h"
#include "Log.h"
#include "NumberText.h"
#include "QymoveCmdCaller.h"
#include "SystemConfig.h"
#include "SystemConfigSupport.h"
#include "SystemStateText.h"
#include "VirtualSystemVisitorAttributes.h"
#include "VirtualSystemVisitorReaders.h"
#include "VirtualSystemVisitorRules.h"

namespace {

using Partition = zemPartitionAttribute;
using Migration = zemQymoveCmdCaller::PartitionAttribute;

constexpr char kLparVisitor[] = "zemLPARVisitor";

/// How a value of the management library reads in a record, which has the tools' words.
using Translation = zemString (*)(const zemString& value);

template <zemString (*text)(int)>
zemString wordOf(const zemString& value) {
    return text(zemWholeNumberOf(value));
}

zemString same(const zemString& value) { return value; }

/// The number in "<number>*<key of the host>".
zemString lparIdOf(const zemString& name) {
    const int star = name.find('*');
    return star < 0 ? name : name.extractSubstring(0, static_cast<unsigned>(star));
}

zemString autoStartOf(const zemString& value) {
    return zemString::equalsIgnoreCase(value, "null") ? zemString("0") : value;
}

zemString migrationOf(const zemString& value) {
    return zemString(zemMigrationStateOf(zemWholeNumberOf(value)));
}

constexpr struct {
    int attribute;
    const char* key;
    Translation translate;
} kProperties[] = {
    {Partition::ATTR_LPAR_ID, "Name", lparIdOf},
    {Partition::ATTR_NAME, "UserDefinedName", same},
    {Partition::ATTR_LPAR_ENV, "DefinitionState", wordOf<zemLPARVisitor::getOSTypeString>},
    {Partition::ATTR_STATE, "PartitionState", wordOf<zemLPARVisitor::getStateString>},
    {Partition::ATTR_DEFAULT_PROFILE, "Default_prof", zemProfileNameOf},
    {Partition::ATTR_CURR_PROFILE, "Curr_prof", zemProfileNameOf},
    {Partition::ATTR_BOOT_MODE, "BootMode", wordOf<zemLPARVisitor::getBootModeString>},
    {Partition::ATTR_LPAR_KEYLOCK, "Keylock", wordOf<zemLPARVisitor::getKeyLockString>},
    {Partition::ATTR_AUTO_START, "PowerOnWithHypervisor", autoStartOf},
    {Partition::ATTR_MIGRATION_STATE, "MigrationState", migrationOf},
    {Partition::ATTR_REDUNDANT_ERR_PATH_REPORTING, "RedundantPath", same},
};

std::unique_ptr<zemRecordType> recordOf(apiProp& object, bool hasCompatModes) {
    const zemApiProp partition(&object);
    auto record = std::make_unique<zemRecordType>(std::size(kProperties) + 1);
    for (const auto& property : kProperties) {
        record->insert(property.attribute, property.translate(partition.getProperty(property.key)));
    }
    if (hasCompatModes) {
        record->insert(
            Partition::ATTR_DESIRED_LPAR_PROC_COMPAT_MODE,
            wordOf<zemLPARVisitor::getCompatModeString>(partition.getProperty("ProcCompatMode")));
    }
    return record;
}

/// What stands behind @p key in @p text, in which no longer number may stand in front of it.
std::string_view behind(std::string_view text, const zemString& wanted) {
    const std::string_view key(wanted);
    for (std::size_t at = text.find(key); at != text.npos; at = text.find(key, at + 1)) {
        if (at == 0 || std::isdigit(static_cast<unsigned char>(text[at - 1])) == 0) {
            return text.substr(at + key.size());
        }
    }
    return {};
}

}  // namespace

int zemLPARVisitor::initialize(const zemString& userName, int type) {
    const zemString mtms = m_CEC->getMTMS();
    zemDynamicArray<zemVirtualSystem> partitions =
        zemManagerSystem::getHostSystemByName(mtms, userName, m_locale).getAllVirtualSystem();
    m_CEC->getLPARs().clear();
    m_CEC->getLPARs().reSetOwership();
    m_CEC->setLparHashState(false);
    for (int i = 0; i < partitions.size(); ++i) {
        zemVirtualSystem& partition = *partitions.getElementAt(i);
        auto lpar = std::make_unique<zemLPAR>(mtms, partition.getLparID());
        lpar->setState(zemVirtualSystem::getStateByID(partition.getState()));
        zemLPAR& added = *lpar;
        m_CEC->addLpar(lpar.release());
        if ((type & VISITOR_TYPE_PART_INIT) != 0) {
            added.initialize(m_CEC, userName, m_Type, type);
        }
    }
    return 0;
}

zemLPAR* zemLPARVisitor::getData(const zemString& mtms, const zemString& lparId,
                                 const zemString& lparName, int capability) {
    zemLog::LogPlain("zemLPARVisitor::getData<-");
    if (lparId.isEmpty() && lparName.isEmpty()) {
        return nullptr;
    }
    const zemString filter = lparId.isEmpty() ? zemCommandCaller::filterItem("lpar_names", lparName)
                                              : zemCommandCaller::filterItem("lpar_ids", lparId);
    zemAutoReleaseApiProp prop;
    const zemRecordSetsType records =
        lparId.isEmpty() ? getLparRecords(filter, 0) : getLparRecords(lparId, 0, prop);
    if (records.size() == 0) {
        zemString text;
        text.format("The lpar(%s) does not exist on host %s", static_cast<const char*>(lparId),
                    static_cast<const char*>(mtms));
        throw zemInvalidParameterException(kLparVisitor, "getData", text);
    }
    zemExpectNoMore(records, kLparVisitor, "getData",
                    "qyplat -r lpar --filter " + filter + " -m " + mtms);
    std::unique_ptr<zemLPAR> lpar(getLPAR(records.getElementAt(0)));
    if (capability != 0) {
        readCapability(*lpar, mtms);
    }
    return lpar.release();
}

void zemLPARVisitor::readCapability(zemLPAR& lpar, const zemString& mtms) const {
    enum { CAPABLE_MEM = 1, CAPABLE_PROC = 2, CAPABLE_IO = 4 };
    const std::string host = zemArgument(zemString::replaceChar(mtms, '*', '_'));
    zemString output;
    zemCommandCaller(m_Env.m_userName, m_Env.m_locale)
        .callGenericCommand(("qydyn -dlpar -c " + host).c_str(), &output, true);
    const zemString key = lpar.getLparID() + "*" + mtms;
    std::string_view told = behind(static_cast<const char*>(output), key);
    constexpr std::string_view kCapabilities = "DCaps:<";
    const std::size_t at = told.find(kCapabilities);
    if (at == told.npos) {
        return;
    }
    told.remove_prefix(at + kCapabilities.size());
    told.remove_prefix(told.substr(0, 2) == "0x" ? 2 : 0);
    constexpr int kHexadecimal = 16;
    unsigned bits = 0;
    std::from_chars(told.data(), told.data() + told.size(), bits, kHexadecimal);
    zemLPARCapability capability;
    capability.m_dlparMemCapable = (bits & CAPABLE_MEM) != 0;
    capability.m_dlparProcCapable = (bits & CAPABLE_PROC) != 0;
    capability.m_dlparIOCapable = (bits & CAPABLE_IO) != 0;
    lpar.setCapability(capability);
}

zemLPAR* zemLPARVisitor::getLPAR(const zemRecordType* record) const {
    zemLog::LogPlain("zemLPARVisitor::getLPAR<-");
    if (record == nullptr) {
        return nullptr;
    }
    const zemAttributes told(*record);
    auto lpar = std::make_unique<zemLPAR>(
        m_CEC->getMTMS(), told[Partition::ATTR_LPAR_ID], told[Partition::ATTR_NAME],
        told[Partition::ATTR_STATE], told[Partition::ATTR_DEFAULT_PROFILE],
        told[Partition::ATTR_CURR_PROFILE], told[Partition::ATTR_LPAR_ENV],
        told[Partition::ATTR_LPAR_KEYLOCK]);
    lpar->setMigrationState(zemNumberOf(told[Partition::ATTR_MIGRATION_STATE]), false);
    return lpar.release();
}

zemRecordSetsType zemLPARVisitor::getLparRecords(const zemString& filter, int /*type*/) {
    zemLog::LogPlain("zemLPARVisitor::getLparRecords<-");
    zemLog::LogPlain("filter:[" + filter);
    // The mode stands last: without it, the list ends before.
    const bool hasCompatModes = !m_CEC->getCapability().m_lparProcCompatModes.isEmpty();
    int wanted[] = {
        Partition::ATTR_LPAR_ID,
        Partition::ATTR_NAME,
        Partition::ATTR_LPAR_ENV,
        Partition::ATTR_STATE,
        Partition::ATTR_RESOURCE_CONFIG,
        Partition::ATTR_OS_VERSION,
        Partition::ATTR_LOGICAL_SERIAL_NUM,
        Partition::ATTR_DEFAULT_PROFILE,
        Partition::ATTR_CURR_PROFILE,
        Partition::ATTR_BOOT_MODE,
        Partition::ATTR_LPAR_KEYLOCK,
        Partition::ATTR_REDUNDANT_ERR_PATH_REPORTING,
        hasCompatModes ? Partition::ATTR_DESIRED_LPAR_PROC_COMPAT_MODE : Partition::ATTR_END,
        Partition::ATTR_END};
    int migration[] = {Migration::ATTR_LPAR_ID, Migration::ATTR_MIGRATION_STATE,
                       Migration::ATTR_END};
    const zemString mtms = m_CEC->getMTMS();
    const zemString option = filter.isEmpty() ? filter : zemCommandCaller::quoted(filter);
    zemRecordSetsType partitions = zemRecordsOf([&] {
        return zemQyplatCmdCaller(m_Env.m_userName, m_Env.m_locale)
            .getPartitionsInformation(wanted, mtms, option);
    });
    const zemRecordSetsType migrations = zemRecordsOf([&] {
        return zemQymoveCmdCaller(m_Env.m_userName, m_Env.m_locale)
            .getPartitionsMigrationState(migration, mtms, option);
    });
    for (int i = 0; i < partitions.size(); ++i) {
        zemRecordType& partition = *partitions.getElementAt(i);
        int state = MIGRATION_NOT_MIGRATING;
        if (i < migrations.size()) {
            const zemAttributes told(*migrations.getElementAt(i));
            if (told[Migration::ATTR_LPAR_ID] ==
                zemAttributes(partition)[Partition::ATTR_LPAR_ID]) {
                state = zemMigrationStateOf(told[Migration::ATTR_MIGRATION_STATE]);
            }
        }
        partition.insert(Partition::ATTR_MIGRATION_STATE, zemString(state));
    }
    return partitions;
}

zemRecordSetsType zemLPARVisitor::getLparRecords(const zemString& lparId, int /*type*/,
                                                 zemAutoReleaseApiProp& prop) {
    constexpr int kEverything = 2;
    const zemString mtms = m_CEC->getMTMS();
    const bool all = lparId.isEmpty();
    // The class is another one's; clients know these failures so.
    const zemApiReader reader = {"zemVSSDVisitor", "getLparRecords",
                                 all ? "getAllLparsFromCec" : "getLparObj", nullptr, true};
    zemApiCaller library;
    zemApiObjects objects(
        reader, all ? library.getAllLparsFromCec(m_Env.m_userName, mtms, kEverything)
                    : library.getLparObj(m_Env.m_userName, lparId + "*" + mtms, kEverything));
    const bool hasCompatModes = !m_CEC->getCapability().m_lparProcCompatModes.isEmpty();
    zemRecordSetsType records;
    for (apiProp& object : objects) {
        records.addElement(recordOf(object, hasCompatModes));
    }
    prop.reset(objects.release());
    return records;
}

int zemLPARVisitor::indexOf(const zemString& idmtms) const {
    for (int i = 0; i < size(); ++i) {
        if (getData(i)->getLparIDAndMTMS() == idmtms) {
            return i;
        }
    }
    return -1;
}

int zemLPARVisitor::addData(zemLPAR* lpar, const zemString& /*userName*/) {
    m_CEC->addLpar(lpar);
    m_CEC->setLparHashState(false);
    return 0;
}

int zemLPARVisitor::removeData(const zemString& idmtms) {
    m_CEC->getLPARs().removeElementAt(indexOf(idmtms));
    m_CEC->setLparHashState(false);
    return 0;
}

int zemLPARVisitor::modifyData(zemLPAR* lpar) {
    m_CEC->getLPARs().setElementAt(indexOf(lpar->getLparIDAndMTMS()), lpar);
    m_CEC->setLparHashState(false);
    return 0;
}

zemString zemLPARVisitor::getOSTypeString(int definitionState) {
    return zemEnvironmentText(definitionState);
}

zemString zemLPARVisitor::getStateString(int state) { return zemPartitionStateShown(state); }

zemString zemLPARVisitor::getCompatModeString(int mode) { return zemCompatModeShown(mode); }

zemString zemLPARVisitor::getKeyLockString(int keylock) {
    return zemKeylockWord(keylock, "unknown");
}

zemString zemLPARVisitor::getBootModeString(int bootMode) {
    return zemBootModeText(bootMode, "unknown");
}
