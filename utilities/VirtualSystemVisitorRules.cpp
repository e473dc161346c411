#include "VirtualSystemVisitorRules.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <string_view>

#include "Exception.h"
#include "NumberText.h"

namespace {

constexpr std::int64_t kHundredths = 100;
constexpr std::int64_t kKilobytes = 1024;

// Of a RASD.
enum { MAPPING_SHARED = 1, MAPPING_DEDICATED = 2 };
enum { PASSED_THROUGH = 2, VIRTUALIZED = 3 };
enum { ADAPTER_SERVER = 0, ADAPTER_CLIENT = 1 };
enum { PARTNER_FIXED = 0, PARTNER_ANY = 1, PARTNER_CONSOLE = 2 };
constexpr int kAnySlot = -2;
constexpr char kPrimordial[] = "Primordial";

bool is(const zemString& text, const char* word) { return zemString::equalsIgnoreCase(text, word); }

/// Whole processors as hundredths.
std::int64_t processors(const zemString& text) { return kHundredths * zemNumberOf(text); }

/// Megabytes as kilobytes.
std::int64_t kilobytes(const zemString& text) { return kKilobytes * zemNumberOf(text); }

template <class Unit>
zemQuantities quantities(const zemAttributes& object, Unit unit, int minimum, int quantity,
                         int maximum) {
    return {unit(object[minimum]), unit(object[quantity]), unit(object[maximum])};
}

/// What holds both now and after the pending change.
template <class Unit>
zemQuantities effective(const zemAttributes& object, Unit unit, const int (&minima)[2],
                        int quantity, const int (&maxima)[2]) {
    return {std::max(unit(object[minima[0]]), unit(object[minima[1]])), unit(object[quantity]),
            std::min(unit(object[maxima[0]]), unit(object[maxima[1]]))};
}

void setVirtuals(const zemQuantities& values, zemRASDCommData& data) {
    data.m_VirtualMinimum = values.minimum;
    data.m_VirtualQuantity = values.quantity;
    data.m_VirtualMaximum = values.maximum;
}

void setReservation(const zemQuantities& values, zemRASDCommData& data) {
    data.m_Minimum = values.minimum;
    data.m_Reservation = values.quantity;
    data.m_Limit = values.maximum;
}

void setMapping(bool isShared, const zemString& poolID, zemRASDCommData& data) {
    data.m_MappingBehavior = isShared ? MAPPING_SHARED : MAPPING_DEDICATED;
    data.m_ConsumerVisibility = isShared ? VIRTUALIZED : PASSED_THROUGH;
    data.m_PoolID = poolID;
}

/// The attributes of a running serial or SCSI adapter.
struct RemoteAttributes {
    int slot;
    int adapterType;
    int partition;
    int partnerSlot;
};

zemRemoteValues runningRemote(const zemAttributes& adapter, const RemoteAttributes& attributes) {
    zemRemoteValues values;
    values.slot = zemNumberOf(adapter[attributes.slot]);
    values.adapterType =
        is(adapter[attributes.adapterType], "server") ? ADAPTER_SERVER : ADAPTER_CLIENT;
    const zemString& partition = adapter[attributes.partition];
    // The partition decides for the slot, too, whatever stands there.
    if (is(partition, "any")) {
        values.anyPartition = PARTNER_ANY;
    } else {
        values.partition = partition;
        values.partnerSlot = zemNumberOf(adapter[attributes.partnerSlot]);
    }
    return values;
}

/// Further VLANs, "none", or a list that may stand in quotes.
void appendVlans(const zemString& text, zemArray<int>& vlans) {
    std::string_view list(text);
    if (is(text, "none")) {
        return;
    }
    if (!list.empty() && list.front() == '"') {
        list.remove_prefix(1);
        list.remove_suffix(list.empty() ? 0 : 1);
    }
    // The management library puts brackets around its lists.
    while (!list.empty()) {
        const std::size_t begin = std::min(list.find_first_not_of("[], "), list.size());
        list.remove_prefix(begin);
        const std::size_t length = std::min(list.find(','), list.size());
        if (length > 0) {
            vlans.append(zemNumberOf(list.substr(0, length)));
        }
        list.remove_prefix(length);
    }
}

}  // namespace

std::int64_t zemHundredths(const zemString& units) {
    constexpr double kHalf = 0.5;
    const double value = zemRealOf(std::string_view(units)) * kHundredths + kHalf;
    using Limits = std::numeric_limits<std::int64_t>;
    if (std::abs(value) < static_cast<double>(Limits::max())) {
        return static_cast<std::int64_t>(value);
    }
    return value < 0 ? Limits::min() : Limits::max();
}

zemProcessorValues zemRunningProcessor(const zemAttributes& processor) {
    using Of = zemProcessorAttribute;
    zemProcessorValues values;
    values.isShared = is(processor[Of::ATTR_CURR_PROC_MODE], "shared");
    values.sharingMode = processor[Of::ATTR_CURR_SHARING_MODE];
    values.weight = zemNumberOf(processor[Of::ATTR_RUN_UNCAP_WEIGHT]);
    values.poolID = processor[Of::ATTR_PEND_SHARED_PROC_POOL_ID];
    values.virtuals =
        effective(processor, processors, {Of::ATTR_PEND_MIN_PROCS, Of::ATTR_CURR_MIN_PROCS},
                  Of::ATTR_RUN_PROCS, {Of::ATTR_PEND_MAX_PROCS, Of::ATTR_CURR_MAX_PROCS});
    values.units = effective(
        processor, zemHundredths, {Of::ATTR_PEND_MIN_PROC_UNITS, Of::ATTR_CURR_MIN_PROC_UNITS},
        Of::ATTR_RUN_PROC_UNITS, {Of::ATTR_PEND_MAX_PROC_UNITS, Of::ATTR_CURR_MAX_PROC_UNITS});
    return values;
}

zemProcessorValues zemProfileProcessor(const zemAttributes& profile, int pools) {
    using Of = zemProfileAttribute;
    const zemString& poolID = profile[Of::ATTR_SHARED_PROC_POOL_ID];
    zemProcessorValues values;
    values.isShared = is(profile[Of::ATTR_PROC_MODE], "shared");
    values.sharingMode = profile[Of::ATTR_SHARING_MODE];
    values.weight = zemNumberOf(profile[Of::ATTR_UNCAP_WEIGHT]);
    const bool isTold = pools > 0 && !poolID.isEmpty() && !is(poolID, "null");
    values.poolID = isTold ? poolID : zemString("0");
    values.virtuals = quantities(profile, processors, Of::ATTR_MIN_PROCS, Of::ATTR_DESIRED_PROCS,
                                 Of::ATTR_MAX_PROCS);
    values.units = quantities(profile, zemHundredths, Of::ATTR_MIN_PROC_UNITS,
                              Of::ATTR_DESIRED_PROC_UNITS, Of::ATTR_MAX_PROC_UNITS);
    return values;
}

void zemDecideProcessor(const zemProcessorValues& values,
                        zemProcessorRASD::zemProcessorRASDData& data) {
    data.m_ResourceType = zemRASDKinds::processor.resourceType;
    data.m_SharingMode = values.sharingMode;
    if (values.isShared && is(values.sharingMode, "uncap")) {
        data.m_Weight = values.weight;
    }
    setMapping(values.isShared, values.isShared ? values.poolID : zemString(kPrimordial), data);
    setVirtuals(values.virtuals, data);
    setReservation(values.isShared ? values.units : values.virtuals, data);
}

zemMemoryValues zemRunningMemory(const zemAttributes& memory, int pools) {
    using Of = zemMemoryAttribute;
    zemMemoryValues values;
    values.isShared = pools > 0 && is(memory[Of::ATTR_MEM_MODE], "shared");
    if (!values.isShared) {
        values.memory = effective(memory, kilobytes, {Of::ATTR_PEND_MIN_MEM, Of::ATTR_CURR_MIN_MEM},
                                  Of::ATTR_RUN_MEM, {Of::ATTR_PEND_MAX_MEM, Of::ATTR_CURR_MAX_MEM});
        return values;
    }
    values.memory =
        quantities(memory, kilobytes, Of::ATTR_RUN_MEM, Of::ATTR_RUN_MEM, Of::ATTR_RUN_MEM);
    values.entitled = kilobytes(memory[Of::ATTR_RUN_IO_ENTITLED_MEM]);
    values.weight = zemNumberOf(memory[Of::ATTR_RUN_MEM_WEIGHT]);
    return values;
}

zemMemoryValues zemProfileMemory(const zemAttributes& profile, int pools) {
    using Of = zemProfileAttribute;
    zemMemoryValues values;
    values.isShared = pools > 0 && is(profile[Of::ATTR_MEM_MODE], "shared");
    values.memory =
        quantities(profile, kilobytes, Of::ATTR_MIN_MEM, Of::ATTR_DESIRED_MEM, Of::ATTR_MAX_MEM);
    const zemString& entitled = profile[Of::ATTR_DESIRED_IO_ENTITLED_MEM];
    if (!entitled.isEmpty() && !is(entitled, "null") && !is(entitled, "auto")) {
        values.entitled = kilobytes(entitled);
    }
    values.weight = zemNumberOf(profile[Of::ATTR_MEM_WEIGHT]);
    return values;
}

void zemDecideMemory(const zemMemoryValues& values, zemMemoryRASD::zemMemoryRASDData& data) {
    data.m_ResourceType = zemRASDKinds::memory.resourceType;
    data.m_AutomaticAllocation = zemRASDKinds::memory.automaticAllocation;
    data.m_AutomaticDeallocation = zemRASDKinds::memory.automaticDeallocation;
    setMapping(values.isShared, values.isShared ? "0" : kPrimordial, data);
    setVirtuals(values.memory, data);
    if (values.isShared) {
        data.m_Reservation = values.entitled;
        data.m_Weight = values.weight;
    } else {
        setReservation(values.memory, data);
    }
}

void zemDecideAdapter(int isRequired, zemRASDCommData& data) {
    setMapping(data.m_ResourceType != zemRASDKinds::ioSlot.resourceType, "0", data);
    setVirtuals({1, 1, 1}, data);
    data.m_AutomaticAllocation = 1;
    data.m_AutomaticDeallocation = 0;
    data.m_IsRequired = isRequired;
}

zemRemoteValues zemRunningSerial(const zemAttributes& adapter) {
    using Of = zemSerialAttribute;
    zemRemoteValues values =
        runningRemote(adapter, {Of::ATTR_SLOT_NUM, Of::ATTR_ADAPTER_TYPE, Of::ATTR_REMOTE_LPAR_ID,
                                Of::ATTR_REMOTE_SLOT_NUM});
    if (values.anyPartition == PARTNER_ANY && adapter[Of::ATTR_SUPPORTS_DNX] != "0") {
        values.anyPartition = PARTNER_CONSOLE;
    }
    return values;
}

zemRemoteValues zemRunningScsi(const zemAttributes& adapter) {
    using Of = zemScsiAttribute;
    return runningRemote(adapter, {Of::ATTR_SLOT_NUM, Of::ATTR_ADAPTER_TYPE,
                                   Of::ATTR_REMOTE_LPAR_ID, Of::ATTR_REMOTE_SLOT_NUM});
}

void zemDecideRemote(const zemRemoteValues& values, zemRemoteAdapterRASDData& data) {
    data.m_SlotID = values.slot;
    data.m_VirtualAdapterType = values.adapterType;
    const bool isServer = values.adapterType == ADAPTER_SERVER;
    if (values.anyPartition != PARTNER_FIXED) {
        data.m_RemoteClientFlag = values.anyPartition;
    } else {
        data.m_RemoteVirtualSystemID = values.partition;
        data.m_RemoteClientFlag = isServer ? PARTNER_FIXED : data.m_RemoteClientFlag;
    }
    if (!values.partnerSlot) {
        data.m_RemoteSlotID = kAnySlot;
        data.m_RemoteClientSlotFlag = PARTNER_ANY;
    } else {
        data.m_RemoteSlotID = *values.partnerSlot;
        data.m_RemoteClientSlotFlag = isServer ? PARTNER_FIXED : data.m_RemoteClientSlotFlag;
    }
}

void zemDecideEthernet(const zemAttributes& adapter, zemVETHRASD::zemVETHRASDData& data) {
    using Of = zemEthernetAttribute;
    zemDecideAdapter(zemNumberOf(adapter[Of::ATTR_IS_REQUIRED]), data);
    data.m_SlotID = zemNumberOf(adapter[Of::ATTR_SLOT_NUM]);
    data.m_IEEECompatible = zemNumberOf(adapter[Of::ATTR_IEEE_VIRTUAL_ETH]);
    data.m_PortVLANID = zemNumberOf(adapter[Of::ATTR_PORT_VLAN_ID]);
    appendVlans(adapter[Of::ATTR_ADDL_VLAN_IDS], data.m_AddVLANIDs);
    const bool isTrunk = zemNumberOf(adapter[Of::ATTR_IS_TRUNK]) != 0;
    data.m_TrunkPriority = isTrunk ? zemNumberOf(adapter[Of::ATTR_TRUNK_PRIORITY]) : 0;
    data.m_Address = adapter[Of::ATTR_MAC_ADDR];
    data.m_vswitch = adapter[zemEthernetSwitch];
}

void zemNameRASDs(zemVSSD& vssd) {
    for (int i = 0; i < vssd.getRASDs().size(); ++i) {
        vssd.getRASDs().getElementAt(i)->getInstanceID(true, &vssd);
    }
}

void zemExpectRecord(const zemRecordSetsType& records, const char* cls, const char* method,
                     const zemString& query) {
    if (records.size() == 0) {
        throw zemObjectNotFoundException(cls, method,
                                         "There is no output result when executing " + query);
    }
    zemExpectNoMore(records, cls, method, query);
}

void zemExpectNoMore(const zemRecordSetsType& records, const char* cls, const char* method,
                     const zemString& query) {
    if (records.size() > 1) {
        throw zemInvalidParameterException(
            cls, method, "The output result should only have one record when executing " + query);
    }
}
