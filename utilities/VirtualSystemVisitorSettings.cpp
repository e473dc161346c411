#include "VirtualSystemVisitorSettings.h"

#include <algorithm>
#include <cstdint>
#include <initializer_list>
#include <iterator>
#include <memory>

#include "EdplatCmdCaller.h"
#include "Exception.h"
#include "VirtualSystemResourceSettings.h"

namespace {

using Partition = zemNwplatCmdCaller::PartitionAttribute;
using Profile = zemEdplatCmdCaller::PartitionProfileAttribute;
using Quantity = std::int64_t zemRASDCommData::*;

constexpr int kHundred = 100;

// The rules. Each makes the value of one setting, or none.

using Rule = zemString (*)(const zemWanted& wanted);

/// Whole units of what is set.
zemString inUnits(std::int64_t value, int unit) {
    return value < 0 ? zemString() : zemString(std::to_string(value / unit).c_str());
}

template <const zemString& (zemVSSD::*get)() const>
zemString text(const zemWanted& wanted) {
    return (wanted.vssd.*get)();
}

template <bool (zemVSSD::*get)() const>
zemString flag(const zemWanted& wanted) {
    return (wanted.vssd.*get)() ? "1" : "0";
}

/// A new partition has some slots even if nobody asks for them; a profile keeps those that it has.
zemString maxVirtualSlots(const zemWanted& wanted) {
    const int slots = wanted.vssd.getMaxVirtualSlots();
    if (slots != -1 && slots != 0) {
        return slots;
    }
    if (wanted.target == zemWanted::PROFILE) {
        return zemString();
    }
    return wanted.vssd.getVirtualSystemType() == "xbrgserver" ? "20" : "10";
}

zemString procMode(const zemRASDCommData& data, const zemWanted&) {
    return data.m_ConsumerVisibility == zemPassedThrough ? "ded" : "shared";
}

zemString sharingMode(const zemRASDCommData& data, const zemWanted&) { return data.m_SharingMode; }

/// For a profile, a weight that does not count is not mentioned.
zemString uncapWeight(const zemRASDCommData& data, const zemWanted& wanted) {
    const bool counts = wanted.target == zemWanted::PARTITION || data.m_SharingMode == "uncap";
    return counts ? inUnits(data.m_Weight, 1) : zemString();
}

/// What is not of a pool is of the primordial one.
zemString sharedProcPool(const zemRASDCommData& data, const zemWanted& wanted) {
    const bool isShared =
        wanted.target == zemWanted::PROFILE || data.m_ConsumerVisibility == zemVirtualized;
    const bool isPrimordial = zemString::equalsIgnoreCase(data.m_PoolID, zemPrimordial);
    return isShared && !isPrimordial ? data.m_PoolID : zemString();
}

template <Quantity quantity>
zemString wholeProcessors(const zemRASDCommData& data, const zemWanted&) {
    return inUnits(data.*quantity, kHundred);
}

template <Quantity quantity>
zemString processorUnits(const zemRASDCommData& data, const zemWanted&) {
    return data.*quantity < 0 ? zemString() : zemSettingText::hundredths(data.*quantity);
}

using ProcessorRule = zemString (*)(const zemRASDCommData& data, const zemWanted& wanted);

template <ProcessorRule rule>
zemString processor(const zemWanted& wanted) {
    return wanted.processor == nullptr ? zemString() : rule(wanted.processor->m_Data, wanted);
}

/// A new partition has the host's usual mode unless one is asked for.
zemString compatMode(const zemWanted& wanted) {
    if (wanted.processor == nullptr) {
        return zemString();
    }
    const zemString& mode = wanted.processor->m_Data.m_ProcCompatMode;
    if (wanted.target == zemWanted::PROFILE) {
        return mode;
    }
    if (!wanted.hasCompatModes) {
        return zemString();
    }
    return mode.isEmpty() ? zemString("default") : mode;
}

bool isShared(const zemMemoryRASD& memory) {
    return memory.m_Data.m_ConsumerVisibility == zemVirtualized;
}

zemString memMode(const zemMemoryRASD& memory, const zemWanted& wanted) {
    return !wanted.hasMemoryPools ? "" : isShared(memory) ? "shared" : "ded";
}

zemString memWeight(const zemMemoryRASD& memory, const zemWanted&) {
    return inUnits(memory.m_Data.m_Weight, 1);
}

zemString ioEntitledMem(const zemMemoryRASD& memory, const zemWanted&) {
    const std::int64_t entitled = memory.m_Data.m_Reservation;
    if (!isShared(memory)) {
        return zemString();
    }
    const zemString size = inUnits(entitled, zemKilobytes);
    return size == "0" ? zemString("auto") : size;
}

/// Shared memory reserves only what I/O may use: its sizes are the virtual ones.
template <Quantity own, Quantity ofShared>
zemString memorySize(const zemMemoryRASD& memory, const zemWanted&) {
    return inUnits(isShared(memory) ? memory.m_Data.*ofShared : memory.m_Data.*own, zemKilobytes);
}

using MemoryRule = zemString (*)(const zemMemoryRASD& memory, const zemWanted& wanted);

template <MemoryRule rule>
zemString memory(const zemWanted& wanted) {
    return wanted.memory == nullptr ? zemString() : rule(*wanted.memory, wanted);
}

template <const zemRASDKind& kind>
zemString list(const zemWanted& wanted) {
    return zemAdapterList(wanted.vssd, kind.resourceType).c_str();
}

/// Uses that slots are tagged for.
enum Tag { LOAD_SOURCE = 1, ALT_RESTART = 2, CONSOLE = 4, ALT_CONSOLE = 5, OP_CONSOLE = 6 };

/// The last slot that is tagged so, or else the tool's word for none.
template <Tag tag>
zemString taggedSlot(const zemWanted& wanted) {
    std::string slot = tag == LOAD_SOURCE ? "none" : tag == CONSOLE ? "dnx" : "";
    const auto slots = wanted.vssd.getRASD(zemRASDKinds::ioSlot.resourceType);
    for (int i = 0; i < slots.size(); ++i) {
        const auto* const rasd = dynamic_cast<const zemIOSlotRASD*>(slots.getElementAt(i));
        if (rasd != nullptr && rasd->m_Data.m_TaggedIOType.find(tag) >= 0) {
            slot = zemDrcIndexOf(*rasd);
        }
    }
    return slot.c_str();
}

constexpr int kNoAttribute = -1;  ///< what is not of a profile

constexpr struct SettingRow {
    zemSetting setting;
    int ofProfile;
    Rule rule;
} kSettings[] = {
#define BOTH(NAME) Partition::ATTR_##NAME, Profile::ATTR_##NAME
    {Partition::ATTR_NAME, kNoAttribute, text<&zemVSSD::getLparName>},
    {Partition::ATTR_PROFILE_NAME, Profile::ATTR_NEW_NAME, text<&zemVSSD::getProfileName>},
    {Partition::ATTR_LPAR_ENV, kNoAttribute, text<&zemVSSD::getVirtualSystemType>},
    {BOTH(AUTO_START), flag<&zemVSSD::getAutoActivate>},
    {BOTH(BOOT_MODE), text<&zemVSSD::getBootMode>},
    {BOTH(MAX_VIRTUAL_SLOTS), maxVirtualSlots},
    {BOTH(CONN_MONITORING), flag<&zemVSSD::getEnableConnectionMonitoring>},
    {BOTH(REDUNDANT_ERR_PATH_REPORTING), flag<&zemVSSD::getEnableRedundantErrorPathReporting>},
    {BOTH(PROC_MODE), processor<procMode>},
    {BOTH(SHARING_MODE), processor<sharingMode>},
    {BOTH(UNCAP_WEIGHT), processor<uncapWeight>},
    {BOTH(SHARED_PROC_POOL_ID), processor<sharedProcPool>},
    {BOTH(LPAR_PROC_COMPAT_MODE), compatMode},
    {BOTH(MIN_PROCS), processor<wholeProcessors<&zemRASDCommData::m_VirtualMinimum>>},
    {BOTH(DESIRED_PROCS), processor<wholeProcessors<&zemRASDCommData::m_VirtualQuantity>>},
    {BOTH(MAX_PROCS), processor<wholeProcessors<&zemRASDCommData::m_VirtualMaximum>>},
    {BOTH(MIN_PROC_UNITS), processor<processorUnits<&zemRASDCommData::m_Minimum>>},
    {BOTH(DESIRED_PROC_UNITS), processor<processorUnits<&zemRASDCommData::m_Reservation>>},
    {BOTH(MAX_PROC_UNITS), processor<processorUnits<&zemRASDCommData::m_Limit>>},
    {BOTH(MEM_MODE), memory<memMode>},
    {BOTH(MEM_WEIGHT), memory<memWeight>},
    {BOTH(DESIRED_IO_ENTITLED_MEM), memory<ioEntitledMem>},
    {BOTH(MIN_MEM),
     memory<memorySize<&zemRASDCommData::m_Minimum, &zemRASDCommData::m_VirtualMinimum>>},
    {BOTH(DESIRED_MEM),
     memory<memorySize<&zemRASDCommData::m_Reservation, &zemRASDCommData::m_VirtualQuantity>>},
    {BOTH(MAX_MEM),
     memory<memorySize<&zemRASDCommData::m_Limit, &zemRASDCommData::m_VirtualMaximum>>},
    {BOTH(VIRTUAL_SCSI_ADAPTERS), list<zemRASDKinds::scsi>},
    {BOTH(VIRTUAL_SERIAL_ADAPTERS), list<zemRASDKinds::serial>},
    {BOTH(VIRTUAL_ETH_ADAPTERS), list<zemRASDKinds::ethernet>},
    {BOTH(IO_SLOTS), list<zemRASDKinds::ioSlot>},
    {BOTH(LOAD_SOURCE_SLOT), taggedSlot<LOAD_SOURCE>},
    {BOTH(ALT_RESTART_DEVICE_SLOT), taggedSlot<ALT_RESTART>},
    {BOTH(CONSOLE_SLOT), taggedSlot<CONSOLE>},
    {BOTH(ALT_CONSOLE_SLOT), taggedSlot<ALT_CONSOLE>},
    {BOTH(OP_CONSOLE_SLOT), taggedSlot<OP_CONSOLE>},
#undef BOTH
};

// The elements of lists.

/// @p element of a list as it has to stand there.
std::string inList(const std::string& element, bool isQuoted) {
    if (!isQuoted && element.find_first_of(",\"") == std::string::npos) {
        return element;
    }
    std::string quoted = "\"";
    for (char c : element) {
        quoted.append(c == '"' ? 2 : 1, c);
    }
    return quoted + '"';
}

/// Fields with slashes between them.
std::string fields(std::initializer_list<std::string> values) {
    std::string all;
    for (const std::string& value : values) {
        all += value + '/';
    }
    return all.substr(0, all.size() - 1);
}

std::string number(int value) { return std::to_string(value); }
std::string textOf(const zemString& value) { return static_cast<const char*>(value); }

/// Serial adapters have a field of their own behind the type, which stays empty, as does the
/// partner's name.
std::string remoteElement(const zemRemoteAdapterRASDData& data, bool isSerial) {
    constexpr char kAny[] = "any";
    const bool isOpen = data.m_RemoteVirtualSystemID.isEmpty();
    return fields(
        {number(data.m_SlotID),
         std::string(data.m_VirtualAdapterType == 1 ? "client" : "server") + (isSerial ? "/" : ""),
         isOpen ? kAny : textOf(data.m_RemoteVirtualSystemID), "",
         isOpen || data.m_RemoteSlotID < 0 ? kAny : number(data.m_RemoteSlotID),
         number(data.m_IsRequired)});
}

std::string ethernetElement(const zemVETHRASD::zemVETHRASDData& data) {
    const std::string element = fields(
        {number(data.m_SlotID), number(data.m_IEEECompatible), number(data.m_PortVLANID),
         zemNumberList(data.m_AddVLANIDs),
         data.m_TrunkPriority > 0 ? number(data.m_TrunkPriority) : "", number(data.m_IsRequired)});
    return data.m_vswitch.isEmpty() ? element : element + '/' + textOf(data.m_vswitch);
}

struct ElementWriter {
    std::string operator()(const zemVSCSIRASD& scsi) const {
        return inList(remoteElement(scsi.m_Data, false), false);
    }
    std::string operator()(const zemVSERIALRASD& serial) const {
        return inList(remoteElement(serial.m_Data, true), false);
    }
    std::string operator()(const zemVETHRASD& ethernet) const {
        return inList(ethernetElement(ethernet.m_Data), ethernet.m_Data.m_AddVLANIDs.size() > 0);
    }
    std::string operator()(const zemIOSlotRASD& slot) const {
        return inList(fields({zemDrcIndexOf(slot), "", number(slot.m_Data.m_IsRequired)}), false);
    }
};

template <class Rasd>
Rasd* only(const zemVSSD& vssd, const zemRASDKind& kind, const char* what, const zemString& mtms,
           const char* cls, const char* method) {
    const auto rasds = vssd.getRASD(kind.resourceType);
    if (rasds.size() > 1) {
        zemString text;
        text.format("Duplicated %s is specified when creating lpar %s on %s", what,
                    static_cast<const char*>(vssd.getLparID()), static_cast<const char*>(mtms));
        throw zemInvalidParameterException(cls, method, text);
    }
    return dynamic_cast<Rasd*>(rasds.getElementAt(0));
}

}  // namespace

std::string zemNumberList(const zemArray<int>& numbers) {
    std::string all;
    for (int i = 0; i < numbers.size(); ++i) {
        all += (i == 0 ? "" : ",") + std::to_string(numbers[i]);
    }
    return all;
}

std::string zemDrcIndexOf(const zemIOSlotRASD& slot) {
    const std::string index = textOf(slot.m_Data.m_DRCIndex);
    return index.substr(0, index.find('*'));
}

std::string zemAdapterList(const zemVSSD& vssd, int resourceType) {
    std::string all;
    const auto rasds = vssd.getRASD(resourceType);
    for (int i = 0; i < rasds.size(); ++i) {
        zemRASD& rasd = *rasds.getElementAt(i);
        int& isRequired = rasd.getData()->m_IsRequired;
        isRequired = isRequired == 1 ? 1 : 0;
        const std::string element = zemOnAdapter(rasd, ElementWriter(), std::string());
        if (!element.empty()) {
            all += (all.empty() ? "" : ",") + element;
        }
    }
    return all;
}

void addCommandAttribute(int index, const zemString& value, zemPairs& pairs) {
    pairs.addElement(std::make_unique<tagAttributePair>(index, zemCommandCaller::itemValue(value)));
}

void zemAddSetting(const zemWanted& wanted, zemSetting setting, zemPairs& pairs) {
    const auto* const row =
        std::find_if(std::begin(kSettings), std::end(kSettings),
                     [setting](const SettingRow& each) { return each.setting == setting; });
    const zemString value = row->rule(wanted);
    if (!value.isEmpty()) {
        addCommandAttribute(wanted.target == zemWanted::PARTITION ? row->setting : row->ofProfile,
                            value, pairs);
    }
}

zemProcessorRASD* zemOnlyProcessor(const zemVSSD& vssd, const zemString& mtms, const char* cls,
                                   const char* method) {
    return only<zemProcessorRASD>(vssd, zemRASDKinds::processor, "Processor", mtms, cls, method);
}

zemMemoryRASD* zemOnlyMemory(const zemVSSD& vssd, const zemString& mtms, const char* cls,
                             const char* method) {
    return only<zemMemoryRASD>(vssd, zemRASDKinds::memory, "Memory", mtms, cls, method);
}
