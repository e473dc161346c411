// How the settings of a profile are built, and RASDs of lists of slots and adapters.

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

#include "Exception.h"
#include "Log.h"
#include "LogLines.h"
#include "NumberText.h"
#include "VirtualSystemVisitorAttributes.h"
#include "VirtualSystemVisitorRules.h"
#include "VirtualSystemVisitorVSSD.h"

namespace {

using Partition = zemPartitionAttribute;
using Profile = zemProfileAttribute;

bool isWord(const zemString& text, const char* word) {
    return zemString::equalsIgnoreCase(text, word);
}

constexpr char kLine[] = "=======getProfileVSSD:";

std::unique_ptr<zemVSSD> makeVSSD(const zemCEC& host, const zemAttributes& lpar,
                                  const zemAttributes& profile) {
    zemLogLines lines;
    const auto told = [&lines](const char* name, const zemAttributes& attributes,
                               int attribute) -> const zemString& {
        const zemString& value = attributes[attribute];
        lines.add({kLine, name, ":"}, value);
        return value;
    };
    const zemString& lparID = told("lparId", profile, Profile::ATTR_LPAR_ID);
    const zemString& autoStart = told("autoStart", profile, Profile::ATTR_AUTO_START);
    const zemString& lparName = told("lparName", profile, Profile::ATTR_LPAR_NAME);
    const zemString& name = told("profileName", profile, Profile::ATTR_NAME);
    const zemString& bootMode = told("bootMode", profile, Profile::ATTR_BOOT_MODE);
    const zemString& monitoring = told("connMonitoring", profile, Profile::ATTR_CONN_MONITORING);
    const zemString& slots = told("maxVirtualSlots", profile, Profile::ATTR_MAX_VIRTUAL_SLOTS);
    const zemString& lparEnv = told("lparEnv", profile, Profile::ATTR_LPAR_ENV);
    const zemString& redundant =
        told("redundantErrPathReporting", profile, Profile::ATTR_REDUNDANT_ERR_PATH_REPORTING);
    const zemString& defaultName = told("defaultProfile", lpar, Partition::ATTR_DEFAULT_PROFILE);
    const zemString& keylock = told("keylock", lpar, Partition::ATTR_LPAR_KEYLOCK);
    auto vssd = std::make_unique<zemVSSD>(
        lparID, host.getMTMS(), lparEnv, zemNumberOf(autoStart), lparName, name, bootMode,
        zemNumberOf(monitoring), zemString::equalsIgnoreCase(defaultName, name) ? 1 : 0,
        zemNumberOf(slots), zemNumberOf(redundant), keylock, defaultName);
    vssd->GenerateInstanceID(false);
    return vssd;
}

void addProcessor(zemCEC& host, const zemAttributes& profile, zemVSSD& vssd) {
    auto rasd = std::make_unique<zemProcessorRASD>();
    const int pools = zemNumberOf(host.getProcessor().getMaxSharedProcPools());
    zemDecideProcessor(zemProfileProcessor(profile, pools), rasd->m_Data);
    if (!host.getCapability().m_lparProcCompatModes.isEmpty()) {
        rasd->m_Data.m_ProcCompatMode = profile[Profile::ATTR_LPAR_PROC_COMPAT_MODE];
    }
    vssd.addRASD(rasd.release());
}

void addMemory(zemCEC& host, const zemAttributes& profile, zemVSSD& vssd) {
    auto rasd = std::make_unique<zemMemoryRASD>();
    const int pools = zemNumberOf(host.getMemoy().getMaxMemPools());
    zemDecideMemory(zemProfileMemory(profile, pools), rasd->m_Data);
    vssd.addRASD(rasd.release());
}

/// The lists of a profile, in the order in which their RASDs stand.
constexpr struct {
    int bit;
    int attribute;
    const zemRASDKind& kind;
} kLists[] = {
    {VISITOR_TYPE_RASD_VSERIAL, Profile::ATTR_VIRTUAL_SERIAL_ADAPTERS, zemRASDKinds::serial},
    {VISITOR_TYPE_RASD_VSCSI, Profile::ATTR_VIRTUAL_SCSI_ADAPTERS, zemRASDKinds::scsi},
    {VISITOR_TYPE_RASD_VETH, Profile::ATTR_VIRTUAL_ETH_ADAPTERS, zemRASDKinds::ethernet},
    {VISITOR_TYPE_RASD_IOSLOT, Profile::ATTR_IO_SLOTS, zemRASDKinds::ioSlot},
};

/// Whose slots a tag goes to: those of all, or of the one that the profile names.
enum Tagging { TAG_ALL, TAG_NAMED };

/// Gives slots the tags of those that the profile names as load source, console and the like.
void tagSlots(const zemAttributes& profile, Tagging tagging, zemVSSD& vssd) {
    static constexpr struct {
        int attribute;
        int tag;
    } kTags[] = {
        {Profile::ATTR_LOAD_SOURCE_SLOT, 1}, {Profile::ATTR_ALT_RESTART_DEVICE_SLOT, 2},
        {Profile::ATTR_CONSOLE_SLOT, 4},     {Profile::ATTR_ALT_CONSOLE_SLOT, 5},
        {Profile::ATTR_OP_CONSOLE_SLOT, 6},
    };
    const int type = zemRASDKinds::ioSlot.resourceType;
    for (const auto& row : kTags) {
        const zemString& slot = profile[row.attribute];
        if (slot.isEmpty() || isWord(slot, "null") || isWord(slot, "none") || slot == "0") {
            continue;
        }
        const zemString key = zemString(type) + "-" + slot;
        int tagged = 0;
        for (int i = 0; i < vssd.getRASDs().size(); ++i) {
            auto* const rasd = dynamic_cast<zemIOSlotRASD*>(vssd.getRASDs().getElementAt(i));
            if (rasd != nullptr && (tagging == TAG_ALL || isWord(rasd->getKey(), key))) {
                rasd->m_Data.m_TaggedIOType.append(row.tag);
                ++tagged;
            }
        }
        if (tagging == TAG_NAMED && tagged == 0) {
            zemLog::LogPlain(kLine + ("no slot RASD:" + key));
        }
    }
}

std::unique_ptr<zemVSSD> buildProfile(zemCEC& host, const zemAttributes& lpar,
                                      const zemAttributes& profile, int type, Tagging tagging) {
    std::unique_ptr<zemVSSD> vssd = makeVSSD(host, lpar, profile);
    if ((type & VISITOR_TYPE_RASD_PROC) != 0) {
        addProcessor(host, profile, *vssd);
    }
    if ((type & VISITOR_TYPE_RASD_MEM) != 0) {
        addMemory(host, profile, *vssd);
    }
    for (const auto& list : kLists) {
        if ((type & list.bit) != 0) {
            zemVSSDVisitor::createIORASDs(profile[list.attribute], list.kind.resourceType,
                                          vssd.get());
        }
    }
    if ((type & VISITOR_TYPE_RASD_IOSLOT) != 0) {
        tagSlots(profile, tagging, *vssd);
    }
    zemNameRASDs(*vssd);
    return vssd;
}

/// Where the element ends with which @p list begins: at a comma outside of quotes; npos if quotes
/// are not closed.
std::size_t elementEnd(std::string_view list) {
    bool isQuoted = false;
    for (std::size_t i = 0; i < list.size(); ++i) {
        if (list[i] == '"') {
            isQuoted = !isQuoted;
        } else if (list[i] == ',' && !isQuoted) {
            return i;
        }
    }
    return std::string_view::npos;
}

template <class Rasd, class Adapter>
zemRASD* makeRemote(const zemString& element) {
    const Adapter adapter(element);
    zemRemoteValues values;
    values.slot = adapter.getSlotId();
    values.adapterType = adapter.getIsServer() < 0 ? -1 : 1 - adapter.getIsServer();
    values.anyPartition = adapter.getRemoteLparId() < 0 ? 1 : 0;
    values.partition = zemString(adapter.getRemoteLparId());
    if (adapter.getRemoteSlotNumber() >= 0) {
        values.partnerSlot = adapter.getRemoteSlotNumber();
    }
    auto rasd = std::make_unique<Rasd>();
    zemDecideRemote(values, rasd->m_Data);
    zemDecideAdapter(adapter.getIsRequired(), rasd->m_Data);
    return rasd.release();
}

zemRASD* makeEthernet(const zemString& element) {
    const zemVirtualEthernetAdapter adapter(element);
    auto rasd = std::make_unique<zemVETHRASD>();
    zemVETHRASD::zemVETHRASDData& data = rasd->m_Data;
    zemDecideAdapter(adapter.getIsRequired(), data);
    data.m_SlotID = adapter.getSlotId();
    data.m_IEEECompatible = adapter.getIsIEEE();
    data.m_PortVLANID = adapter.getPortVlanId();
    data.m_AddVLANIDs = adapter.getAdditionalVlanIds();
    data.m_TrunkPriority = adapter.getTrunkPriority();
    data.m_vswitch = adapter.getVSwitch();
    return rasd.release();
}

zemRASD* makeSlot(const zemString& element) {
    const zemIOSlotAdapter slot(element);
    auto rasd = std::make_unique<zemIOSlotRASD>();
    zemDecideAdapter(slot.getIsRequired(), rasd->m_Data);
    rasd->m_Data.m_DRCIndex = slot.getDrcIndex();
    return rasd.release();
}

constexpr struct {
    const zemRASDKind& kind;
    zemRASD* (*make)(const zemString& element);
} kMakers[] = {
    {zemRASDKinds::serial, makeRemote<zemVSERIALRASD, zemVirtualSerialAdapter>},
    {zemRASDKinds::scsi, makeRemote<zemVSCSIRASD, zemVirtualSCSIAdapter>},
    {zemRASDKinds::ethernet, makeEthernet},
    {zemRASDKinds::ioSlot, makeSlot},
};

}  // namespace

zemVSSD* zemVSSDVisitor::getProfileVSSD(zemLPAR* lpar, zemPartitionProfileConfiguration* profile,
                                        int type) {
    if (lpar == nullptr || profile == nullptr) {
        return nullptr;
    }
    return buildProfile(*m_CEC, zemAttributes(*lpar), zemAttributes(*profile), type, TAG_ALL)
        .release();
}

zemVSSD* zemVSSDVisitor::getProfileVSSD(const zemRecordType& lparRecord,
                                        const zemRecordType& profileRecord, int type) {
    return buildProfile(*m_CEC, zemAttributes(lparRecord), zemAttributes(profileRecord), type,
                        TAG_NAMED)
        .release();
}

void zemVSSDVisitor::createIORASDs(const zemString& setting, int resourcetype, zemVSSD* vssd) {
    if (setting.isEmpty() || isWord(setting, "none") || isWord(setting, "null")) {
        return;
    }
    const zemString list = setting + ",";
    for (std::string_view rest(list); !rest.empty();) {
        const std::size_t end = elementEnd(rest);
        if (end == rest.npos) {
            throw zemOperationFailedException("zemCommandCaller", "callLsCommand", "qyplat -r prof",
                                              "INVALID_RECORD", std::string(rest).c_str());
        }
        const zemString element(rest.data(), static_cast<unsigned>(end));
        if (zemRASD* const rasd = createIORASD(element, resourcetype)) {
            vssd->addRASD(rasd);
        }
        rest.remove_prefix(end + 1);
    }
}

zemRASD* zemVSSDVisitor::createIORASD(const zemString& element, int resourcetype) {
    zemString text = element;
    if (text.startsWith("\"")) {
        text = text.extractSubstring(1, static_cast<unsigned>(text.length()) - 1);
    }
    if (text.isEmpty()) {
        return nullptr;
    }
    for (const auto& maker : kMakers) {
        if (maker.kind.resourceType == resourcetype) {
            return maker.make(text);
        }
    }
    return nullptr;
}

zemString zemVSSDVisitor::getSharingModeString(int sharingMode) {
    constexpr const char* kModes[] = {"cap", "uncap"};
    return sharingMode == 0 || sharingMode == 1 ? kModes[sharingMode] : "unknown";
}
