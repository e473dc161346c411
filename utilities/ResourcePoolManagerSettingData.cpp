// Setting data of partitions: which records tell a resource, and how setting data are shown.

#include "ResourcePoolManagerSettingData.h"

#include <algorithm>
#include <limits>
#include <optional>
#include <string_view>

#include "Exception.h"
#include "ListedProperties.h"
#include "NumberText.h"
#include "VirtualSystemInstanceId.h"
#include "VirtualSystemRepSystem.h"
#include "VirtualSystemVisitorAttributes.h"
#include "VirtualSystemVisitorRules.h"
#include "VirtualSystemVisitorVSSD.h"

namespace {

/// Writes the instance ID of the resource @p id of @p owner.
/// @return false when @p id does not name one of this kind
bool formId(const zemRASDKind& kind, const zemInstanceIdOwner& owner, const zemString& id,
            zemString& instanceID) {
    switch (kind.resourceType) {
        case zemRASDKinds::processor.resourceType:
        case zemRASDKinds::memory.resourceType:
            instanceID = zemFormInstanceId(owner);
            return true;
        case zemRASDKinds::ioSlot.resourceType:
            instanceID = zemFormInstanceId(owner, id);
            return !id.isEmpty();
        default:
            instanceID = zemFormInstanceId(owner, zemNumberOf(id));
            return id.isDigit();
    }
}

// What tells a resource.

/// Which resource is asked for.
struct Asked {
    zemSettingSide side;
    const zemString& userName;
    zemLPAR& lpar;
    zemCEC& cec;
    const zemString& profileName;
    const zemString& info;

    zemVSSDVisitor visitor() const {
        zemVSSDVisitor made(&cec, "");
        made.setOperEnv(userName, "");
        return made;
    }
};

/// What was told of it: by an object of the model, or by records that were asked for.
struct Told {
    explicit Told(const zemRecordSetsType& answer) : records(answer) {
        if (records.size() > 0) {
            attributes.emplace(*records.getElementAt(0));
        }
    }
    template <class Object>
    explicit Told(const Object& object) : attributes(object) {}

    zemRecordSetsType records;
    std::optional<zemAttributes> attributes;  ///< none: there is no such resource
};

Told profileOf(const Asked& asked) {
    zemDynamicArray<zemPartitionProfileConfiguration>& profiles = asked.lpar.getLparProfile();
    for (int i = 0; i < profiles.size(); ++i) {
        if (profiles[i]->getProfileName() == asked.profileName) {
            return Told(*profiles.getElementAt(i));
        }
    }
    return Told(profiles.size() > 0 ? zemRecordSetsType()
                                    : asked.visitor().getProfileRecords(
                                          nullptr, asked.lpar.getLparID(), asked.profileName, 0));
}

zemString filterOf(const Asked& asked) {
    return zemCommandCaller::filterItem("lpar_ids", asked.lpar.getLparID());
}

/// The mode that a partition's own record of the model does not tell stands in its profile.
zemString compatModeOf(const Asked& asked) {
    if (asked.lpar.isLparProcessorAvailable()) {
        return asked.lpar.getDesiredLparProcCompatMode();
    }
    const Told profile = profileOf(asked);
    const zemString mode =
        profile.attributes ? (*profile.attributes)[zemProfileAttribute::ATTR_LPAR_PROC_COMPAT_MODE]
                           : zemString();
    return mode.isEmpty() ? zemString("default") : mode;
}

std::unique_ptr<zemRASD> makeProcessor(const Asked& asked) {
    const bool isState = asked.side == SIDE_STATE;
    const Told told = !isState ? profileOf(asked)
                      : asked.lpar.isLparProcessorAvailable()
                          ? Told(asked.lpar.getLparProcessor())
                          : Told(asked.visitor().getProcRecords(filterOf(asked)));
    if (!told.attributes) {
        return nullptr;
    }
    auto rasd = std::make_unique<zemProcessorRASD>();
    const int pools = zemNumberOf(asked.cec.getProcessor().getMaxSharedProcPools());
    zemDecideProcessor(isState ? zemRunningProcessor(*told.attributes)
                               : zemProfileProcessor(*told.attributes, pools),
                       rasd->m_Data);
    if (isState) {
        rasd->m_Data.m_ProcCompatMode = compatModeOf(asked);
    } else if (!asked.cec.getCapability().m_lparProcCompatModes.isEmpty()) {
        rasd->m_Data.m_ProcCompatMode =
            (*told.attributes)[zemProfileAttribute::ATTR_LPAR_PROC_COMPAT_MODE];
    }
    return rasd;
}

std::unique_ptr<zemRASD> makeMemory(const Asked& asked) {
    const bool isState = asked.side == SIDE_STATE;
    const Told told = !isState ? profileOf(asked)
                      : asked.lpar.isLparMemoryAvailable()
                          ? Told(asked.lpar.getLparMemory())
                          : Told(asked.visitor().getMemoryRecords(filterOf(asked)));
    if (!told.attributes) {
        return nullptr;
    }
    auto rasd = std::make_unique<zemMemoryRASD>();
    const int pools = zemNumberOf(asked.cec.getMemoy().getMaxMemPools());
    zemDecideMemory(isState ? zemRunningMemory(*told.attributes, pools)
                            : zemProfileMemory(*told.attributes, pools),
                    rasd->m_Data);
    return rasd;
}

/// An element of a list of what runs, as a record. The name of the other partition may hold
/// slashes: fields behind it are counted from the end.
template <std::size_t count>
zemRecordType recordOf(std::string_view element, const int (&fields)[count], int name) {
    zemRecordType record(count);
    const auto insert = [&record](int field, std::string_view value) {
        record.insert(field, zemString(value.data(), static_cast<unsigned>(value.size())));
    };
    std::size_t first = 0, last = count - 1;  // behind the fields is their end
    for (; first < last && fields[first] != name; ++first) {
        const std::size_t slash = std::min(element.find('/'), element.size());
        insert(fields[first], element.substr(0, slash));
        element.remove_prefix(std::min(slash + 1, element.size()));
    }
    for (; last > first + 1; --last) {
        const std::size_t slash = element.rfind('/');
        insert(fields[last - 1], slash == element.npos ? "" : element.substr(slash + 1));
        element = element.substr(0, slash == element.npos ? element.size() : slash);
    }
    return record;
}

/// A running serial or SCSI adapter.
template <class Rasd, class Of, std::size_t count>
std::unique_ptr<zemRASD> makeRunning(const zemString& info, const int (&fields)[count],
                                     zemRemoteValues (*read)(const zemAttributes&)) {
    const zemRecordType record =
        recordOf(std::string_view(info), fields, Of::ATTR_REMOTE_LPAR_NAME);
    const zemAttributes adapter(record);
    auto rasd = std::make_unique<Rasd>();
    zemDecideRemote(read(adapter), rasd->m_Data);
    zemDecideAdapter(zemNumberOf(adapter[Of::ATTR_IS_REQUIRED]), rasd->m_Data);
    return rasd;
}

/// The MAC address of a running Ethernet adapter: it stands behind the switch, if that is known.
zemString addressOf(std::string_view element) {
    constexpr std::ptrdiff_t kSlashes = 7;
    if (std::count(element.begin(), element.end(), '/') < kSlashes) {
        return {};
    }
    const std::string_view address = element.substr(element.rfind('/') + 1);
    return zemString(address.data(), static_cast<unsigned>(address.size()));
}

std::unique_ptr<zemRASD> makeRASD(const zemRASDKind& kind, const Asked& asked) {
    if (kind.resourceType == zemRASDKinds::processor.resourceType) {
        return makeProcessor(asked);
    }
    if (kind.resourceType == zemRASDKinds::memory.resourceType) {
        return makeMemory(asked);
    }
    if (asked.info.isEmpty() || asked.info == "none") {
        return nullptr;
    }
    if (asked.side == SIDE_STATE && kind.resourceType == zemRASDKinds::serial.resourceType) {
        return makeRunning<zemVSERIALRASD, zemSerialAttribute>(asked.info, zemSerialFields,
                                                               zemRunningSerial);
    }
    if (asked.side == SIDE_STATE && kind.resourceType == zemRASDKinds::scsi.resourceType) {
        return makeRunning<zemVSCSIRASD, zemScsiAttribute>(asked.info, zemScsiFields,
                                                           zemRunningScsi);
    }
    std::unique_ptr<zemRASD> rasd(zemVSSDVisitor::createIORASD(asked.info, kind.resourceType));
    if (asked.side == SIDE_STATE && kind.resourceType == zemRASDKinds::ethernet.resourceType &&
        rasd != nullptr) {
        rasd->getData()->m_Address = addressOf(std::string_view(asked.info));
    }
    return rasd;
}

int fill(const zemRASDKind& kind, const Asked& asked, const zemString& id, int type,
         zemOnLPARRASettingDataCommData& data) {
    const zemInstanceIdOwner owner = {asked.side, asked.profileName, asked.lpar.getLparID(),
                                      asked.cec.getMTMS()};
    if (!formId(kind, owner, id, data.m_InstanceID)) {
        return -1;
    }
    try {
        data.m_RASD = type == VISITOR_TYPE_RASD_INIT_NI ? nullptr : makeRASD(kind, asked);
    } catch (const zemInvalidParameterException&) {
        return -1;  // the element has quotes that nothing closes
    }
    data.m_ResourceType = static_cast<CMPIUint16>(kind.resourceType);
    data.m_AllocationUnits = kind.units;
    return 0;
}

// How a datum becomes a value: false leaves the property null. A datum is a field of the data of
// all RASDs or of some kind.

/// Null: the data are of another kind.
template <class Owner, class Datum>
const Datum* datumOf(Datum Owner::*datum, const zemRASDCommData& data) {
    const auto* const owner = dynamic_cast<const Owner*>(&data);
    return owner == nullptr ? nullptr : &(owner->*datum);
}

template <class Number>
bool isOf(std::int64_t value) {
    return value >= 0 && (sizeof(Number) == sizeof value ||
                          value <= static_cast<std::int64_t>(std::numeric_limits<Number>::max()));
}

/// The value refers to the text, which the data keep.
template <auto datum>
bool text(const zemRASDCommData& data, CmpiData& value) {
    const zemString* const told = datumOf(datum, data);
    if (told == nullptr || told->isEmpty()) {
        return false;
    }
    value = CmpiData(static_cast<const char*>(*told));
    return true;
}

template <class Number, auto datum>
bool number(const zemRASDCommData& data, CmpiData& value) {
    const auto* const told = datumOf(datum, data);
    if (told == nullptr || !isOf<Number>(*told)) {
        return false;
    }
    value = CmpiData(static_cast<Number>(*told));
    return true;
}

template <auto datum>
bool numbers(const zemRASDCommData& data, CmpiData& value) {
    const zemArray<int>* const told = datumOf(datum, data);
    if (told == nullptr || told->size() == 0) {
        return false;
    }
    CmpiArray list(static_cast<CMPICount>(told->size()), CMPI_uint16);
    for (int i = 0; i < told->size(); ++i) {
        if (!isOf<CMPIUint16>((*told)[i])) {
            return false;
        }
        list[static_cast<CMPICount>(i)] = CmpiData(static_cast<CMPIUint16>((*told)[i]));
    }
    value = CmpiData(list);
    return true;
}

template <auto datum>
bool flag(const zemRASDCommData& data, CmpiData& value) {
    const int told = data.*datum;
    value.setBoolean(static_cast<CMPIBoolean>(told > 0));
    return told >= 0;
}

bool isVirtualized(const zemRASDCommData& data, CmpiData& value) {
    constexpr int kVirtualized = 3;
    value.setBoolean(static_cast<CMPIBoolean>(data.m_ConsumerVisibility == kVirtualized));
    return data.m_ResourceType != zemRASDKinds::processor.resourceType &&
           data.m_ResourceType != zemRASDKinds::memory.resourceType;
}

using All = zemRASDCommData;
using Processor = zemProcessorRASD::zemProcessorRASDData;
using Slot = zemIOSlotRASD::zemIOSlotRASDData;
using Ethernet = zemVETHRASD::zemVETHRASDData;
using Remote = zemRemoteAdapterRASDData;

constexpr struct {
    const char* property;
    bool (*read)(const zemRASDCommData& data, CmpiData& value);
} kProperties[] = {
    {"PoolID", text<&All::m_PoolID>},
    {"ProcCompatMode", text<&Processor::m_ProcCompatMode>},
    {"SharingMode", text<&All::m_SharingMode>},
    {"Limit", number<CMPIUint64, &All::m_Limit>},
    {"VirtualQuantity", number<CMPIUint64, &All::m_VirtualQuantity>},
    {"VirtualMinimum", number<CMPIUint64, &All::m_VirtualMinimum>},
    {"VirtualMaximum", number<CMPIUint64, &All::m_VirtualMaximum>},
    {"Minimum", number<CMPIUint64, &All::m_Minimum>},
    {"Reservation", number<CMPIUint64, &All::m_Reservation>},
    {"Weight", number<CMPIUint32, &All::m_Weight>},
    {"MappingBehavior", number<CMPIUint16, &All::m_MappingBehavior>},
    {"ConsumerVisibility", number<CMPIUint16, &All::m_ConsumerVisibility>},
    {"AutomaticAllocation", flag<&All::m_AutomaticAllocation>},
    {"AutomaticDeallocation", flag<&All::m_AutomaticDeallocation>},
    {"TrunkPriority", number<CMPIUint8, &Ethernet::m_TrunkPriority>},
    {"PortVLANID", number<CMPIUint16, &Ethernet::m_PortVLANID>},
    {"IsVirtualized", isVirtualized},
    {"IEEECompatible", number<CMPIUint8, &Ethernet::m_IEEECompatible>},
    {"AddVLANIDs", numbers<&Ethernet::m_AddVLANIDs>},
    {"RemoteVirtualSystemID", text<&Remote::m_RemoteVirtualSystemID>},
    {"VirtualAdapterType", number<CMPIUint8, &Remote::m_VirtualAdapterType>},
    {"RemoteClientFlag", number<CMPIUint8, &Remote::m_RemoteClientFlag>},
    {"RemoteClientSlotFlag", number<CMPIUint8, &Remote::m_RemoteClientSlotFlag>},
    {"RemoteSlotID", number<CMPIUint16, &Remote::m_RemoteSlotID>},
    {"IsRequired", number<CMPIUint8, &All::m_IsRequired>},
    // what only tells an adapter from its like
    {"DRCIndex", text<&Slot::m_DRCIndex>},
    {"TaggedIOType", numbers<&Slot::m_TaggedIOType>},
    {"SlotID", number<CMPIUint16, &Ethernet::m_SlotID>},
    {"SlotID", number<CMPIUint16, &Remote::m_SlotID>},
    {"VSwitch", text<&Ethernet::m_vswitch>},
    {"Address", text<&All::m_Address>},
};

}  // namespace

zemResourceRASettingDataCommData::~zemResourceRASettingDataCommData() = default;

zemResourceRASettingData::~zemResourceRASettingData() = default;

zemOnLPARRASettingDataCommData::~zemOnLPARRASettingDataCommData() = default;

template <const zemRASDKind& kind>
int zemRASettingDataOf<kind>::initialize(zemResourcePool*, zemCEC*, const zemString&, int) {
    return -1;
}

template <const zemRASDKind& kind>
int zemRASettingDataOf<kind>::initialize(const zemString&, zemLPAR*, zemCEC*, const zemString&,
                                         const zemString&, const zemString&, int) {
    return -1;
}

template <const zemRASDKind& kind, zemSettingSide side>
int zemRASettingDataOnSide<kind, side>::initialize(const zemString& userName, zemLPAR* lpar,
                                                   zemCEC* cec, const zemString& profileName,
                                                   const zemString& id, const zemString& info,
                                                   int type) {
    return fill(kind, {side, userName, *lpar, *cec, profileName, info}, id, type,
                this->m_RASettingData);
}

template <const zemRASDKind& kind>
void zemRASettingDataOnLPAR<kind>::addSpecificProperties(CmpiInstance& instance,
                                                         const char** properties, const char*) {
    zemAddIdentity(instance, properties, m_RASettingData);
    if (m_RASettingData.m_RASD != nullptr) {
        zemAddRASDProperties(instance, properties, *m_RASettingData.m_RASD->getData());
    }
}

void zemAddIdentity(CmpiInstance& instance, const char** properties,
                    const zemResourceRASettingDataCommData& data) {
    if (data.m_ResourceType == 0) {
        return;
    }
    const zemListedProperties listed(instance, properties);
    listed.add("InstanceID", data.m_InstanceID);
    listed.add("ResourceType", CmpiData(data.m_ResourceType));
    if (!data.m_AllocationUnits.isEmpty()) {
        listed.add("AllocationUnits", data.m_AllocationUnits);
    }
}

void zemAddRASDProperties(CmpiInstance& instance, const char** properties,
                          const zemRASDCommData& data) {
    const zemListedProperties listed(instance, properties);
    for (const auto& row : kProperties) {
        CmpiData value;
        if (listed.has(row.property) && row.read(data, value)) {
            instance.setProperty(row.property, value);
        }
    }
}

#define ZEM_LEAVES(KIND)                                                     \
    template class zemRASettingDataOf<zemRASDKinds::KIND>;                   \
    template class zemRASettingDataOnLPAR<zemRASDKinds::KIND>;               \
    template class zemRASettingDataOnSide<zemRASDKinds::KIND, SIDE_DEFINED>; \
    template class zemRASettingDataOnSide<zemRASDKinds::KIND, SIDE_STATE>;
ZEM_LEAVES(processor)
ZEM_LEAVES(memory)
ZEM_LEAVES(ioSlot)
ZEM_LEAVES(ethernet)
ZEM_LEAVES(scsi)
ZEM_LEAVES(serial)
#undef ZEM_LEAVES
