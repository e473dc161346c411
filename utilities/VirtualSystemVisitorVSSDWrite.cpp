// How settings are changed: those of the model, and those of a profile by one line of a tool.

#include <memory>

#include "CommandLine.h"
#include "EdplatCmdCaller.h"
#include "Exception.h"
#include "Log.h"
#include "VirtualSystemInstanceId.h"
#include "VirtualSystemVisitorLPAR.h"
#include "VirtualSystemVisitorSettings.h"
#include "VirtualSystemVisitorVSSD.h"

namespace {

using Partition = zemNwplatCmdCaller::PartitionAttribute;

constexpr char kClass[] = "zemVSSDVisitor";

constexpr zemSetting kResources[] = {
    Partition::ATTR_PROC_MODE,
    Partition::ATTR_SHARED_PROC_POOL_ID,
    Partition::ATTR_SHARING_MODE,
    Partition::ATTR_UNCAP_WEIGHT,
    Partition::ATTR_LPAR_PROC_COMPAT_MODE,
    Partition::ATTR_MIN_PROCS,
    Partition::ATTR_DESIRED_PROCS,
    Partition::ATTR_MAX_PROCS,
    Partition::ATTR_MIN_PROC_UNITS,
    Partition::ATTR_DESIRED_PROC_UNITS,
    Partition::ATTR_MAX_PROC_UNITS,
    Partition::ATTR_MEM_MODE,
    Partition::ATTR_DESIRED_IO_ENTITLED_MEM,
    Partition::ATTR_MEM_WEIGHT,
    Partition::ATTR_MIN_MEM,
    Partition::ATTR_DESIRED_MEM,
    Partition::ATTR_MAX_MEM,
};

constexpr zemSetting kSystem[] = {
    Partition::ATTR_MAX_VIRTUAL_SLOTS, Partition::ATTR_AUTO_START,
    Partition::ATTR_BOOT_MODE,         Partition::ATTR_PROFILE_NAME,
    Partition::ATTR_CONN_MONITORING,   Partition::ATTR_REDUNDANT_ERR_PATH_REPORTING,
};

constexpr zemRASDKind kKinds[] = {zemRASDKinds::processor, zemRASDKinds::memory,
                                  zemRASDKinds::ethernet,  zemRASDKinds::ioSlot,
                                  zemRASDKinds::scsi,      zemRASDKinds::serial};

/// Whether @p data is to take the place of @p stored: it is the same one's, and says otherwise.
bool replaces(const zemVSSD& data, const zemVSSD& stored) {
    return zemString::equalsIgnoreCase(data.getInstanceID(), stored.getInstanceID()) &&
           !data.hasSettingsOf(stored);
}

}  // namespace

int zemVSSDVisitor::addData(zemVSSD* vssd) {
    const zemString key = vssd->getLparID() + "*" + vssd->getMTMS();
    zemLPARVisitor partitions(m_CEC, "");
    m_lparIndex = m_firstIndex = 0;
    for (int i = 0; i < partitions.size(); ++i) {
        if (partitions.getData(i)->getLparIDAndMTMS() == key) {
            partitions.getData(i)->addDefinedVSSD(vssd);
            break;
        }
    }
    return 0;
}

int zemVSSDVisitor::removeData(const zemString& id) {
    zemLPARVisitor partitions(m_CEC, "");
    m_lparIndex = m_firstIndex = 0;
    for (int i = 0; i < partitions.size(); ++i) {
        auto& defined = partitions.getData(i)->getDefinedVSSDs();
        for (int j = 0; j < defined.size(); ++j) {
            if (defined.getElementAt(j)->getInstanceID() == id) {
                return defined.removeElementAt(j);
            }
        }
    }
    return 0;
}

int zemVSSDVisitor::modifyData(zemVSSD* data) {
    const bool isDefined = zemIsInstanceIdOf(SIDE_DEFINED, data->getInstanceID());
    const auto result = [](bool found) {
        zemLog::LogPlain(found ? "zemVSSDVisitor::modifyData-> return 0"
                               : "zemVSSDVisitor::modifyData-> return -1");
        return found ? 0 : -1;
    };
    zemLPARVisitor partitions(m_CEC, m_Type);
    for (int i = 0; i < partitions.size(); ++i) {
        zemLPAR& lpar = *partitions.getData(i);
        if (!isDefined && replaces(*data, lpar.getStateVSSD())) {
            lpar.setStateVSSD(*data);
            return result(true);
        }
        for (int j = 0; isDefined && j < lpar.getDefinedVSSDs().size(); ++j) {
            if (replaces(*data, *lpar.getDefinedVSSDs().getElementAt(j))) {
                lpar.getDefinedVSSDs().addElement(data);
                lpar.getDefinedVSSDs().removeElementAt(j);
                return result(true);
            }
        }
    }
    return result(false);
}

int zemVSSDVisitor::AddIOResources(zemVSSD* vssd) {
    return ModifyResourcesOfProfile(vssd, zemCommandCaller::CH_OP_ADD);
}

int zemVSSDVisitor::RemoveIOResources(zemVSSD* vssd) {
    return ModifyResourcesOfProfile(vssd, zemCommandCaller::CH_OP_REMOVE);
}

int zemVSSDVisitor::ModifyResourcesOfProfile(zemVSSD* vssd, zemCommandCaller::CH_OP_TYPE opType) {
    constexpr char kMethod[] = "ModifyResourcesOfProfile";
    const zemString& mtms = vssd->getMTMS();
    zemWanted wanted{zemWanted::PROFILE, *vssd};
    wanted.processor = zemOnlyProcessor(*vssd, mtms, kClass, kMethod);
    wanted.memory = zemOnlyMemory(*vssd, mtms, kClass, kMethod);
    wanted.hasMemoryPools = vssd->getMemoryPoolNum() > 0;
    zemPairs pairs;
    zemAddSettings(wanted, kResources, pairs);
    zemAddSettings(wanted, kListSettings, pairs);
    zemAddSettings(wanted, kTagSettings, pairs);
    return zemEdplatCmdCaller(m_Env.m_userName, m_Env.m_locale)
        .changePartitionsProfileInformation(vssd->getProfileName(), pairs, vssd->getLparID(), mtms,
                                            opType);
}

int zemVSSDVisitor::ModifySystemSetting(zemVSSD* vssd, const zemString& name) {
    zemPairs pairs;
    zemAddSettings({zemWanted::PROFILE, *vssd}, kSystem, pairs);
    return zemEdplatCmdCaller(m_Env.m_userName, m_Env.m_locale)
        .modifyPartitionsProfileInformation(name, pairs, vssd->getLparID(), vssd->getMTMS());
}

int zemVSSDVisitor::deleteLparProfile(const zemString& mtms, const zemString& lparId,
                                      const zemString& profile) {
    const std::string line = "dlplat -r prof -m " + zemQuoted(mtms) + " --id " + zemQuoted(lparId) +
                             " -n " + zemQuoted(profile);
    return zemCommandCaller(m_Env.m_userName, m_Env.m_locale)
        .callGenericCommand(line.c_str(), nullptr, false);
}

zemString zemVSSDVisitor::getIOSettingString(zemVSSD* vssd, int resourcetype) {
    return zemCommandCaller::itemValue(zemAdapterList(*vssd, resourcetype).c_str());
}

zemString zemVSSDVisitor::ConstructVSSDInstanceIDFromRASDInstanceID(zemCEC* cec,
                                                                    const zemString& id,
                                                                    int resourceType) {
    const bool isOfSystem = resourceType == zemRASDKinds::processor.resourceType ||
                            resourceType == zemRASDKinds::memory.resourceType;
    return zemSystemInstanceIdOf(id, cec->getMTMS(), !isOfSystem);
}

int zemVSSDVisitor::getResourceType(const zemString& className) {
    for (const zemRASDKind& kind : kKinds) {
        if (zemString::equalsIgnoreCase(className, kind.settingClass)) {
            return kind.resourceType;
        }
    }
    zemString text;
    text.format("Not support to such resource class \"%s\" ", static_cast<const char*>(className));
    throw zemInvalidParameterException(kClass, "getResourceType", text);
}
