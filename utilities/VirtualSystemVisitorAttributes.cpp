#include "VirtualSystemVisitorAttributes.h"

#include <iterator>

#include "VirtualSystemRep.h"

namespace {

template <class Object>
struct Field {
    int attribute;
    const zemString& (Object::*get)() const;
};

/// What the objects of a class tell. The fields in which the tools' attributes are found, row by
/// row; a class without a row for an attribute does not tell it.
template <class Object>
struct Told;

// clang-format off
template <>
struct Told<zemLPAR> : zemPartitionAttribute {
    using Self = zemLPAR;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,                       &Self::getLparID},
        {ATTR_NAME,                          &Self::getLparName},
        {ATTR_LPAR_ENV,                      &Self::getVirtualSystemType},
        {ATTR_STATE,                         &Self::getState},
        {ATTR_DEFAULT_PROFILE,               &Self::getDefaultProfileName},
        {ATTR_CURR_PROFILE,                  &Self::getCurrentProfileName},
        {ATTR_BOOT_MODE,                     &Self::getBootMode},
        {ATTR_LPAR_KEYLOCK,                  &Self::getKeyLock},
        {ATTR_AUTO_START,                    &Self::getAutoStart},
        {ATTR_DESIRED_LPAR_PROC_COMPAT_MODE, &Self::getDesiredLparProcCompatMode},
        {ATTR_REDUNDANT_ERR_PATH_REPORTING,  &Self::getRedundantErrPathReporting},
    };
};

template <>
struct Told<zemPartitionProfileConfiguration> : zemProfileAttribute {
    using Self = zemPartitionProfileConfiguration;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,                      &Self::getLparID},
        {ATTR_LPAR_NAME,                    &Self::getLparName},
        {ATTR_NAME,                         &Self::getProfileName},
        {ATTR_LPAR_ENV,                     &Self::getLparEnv},
        {ATTR_MIN_MEM,                      &Self::getMinMem},
        {ATTR_DESIRED_MEM,                  &Self::getDesiredMem},
        {ATTR_MAX_MEM,                      &Self::getMaxMem},
        {ATTR_MEM_MODE,                     &Self::getMemMode},
        {ATTR_MEM_WEIGHT,                   &Self::getMemWeight},
        {ATTR_DESIRED_IO_ENTITLED_MEM,      &Self::getDesiredIoEntitledMem},
        {ATTR_PROC_MODE,                    &Self::getProcMode},
        {ATTR_MIN_PROC_UNITS,               &Self::getMinProcsUnits},
        {ATTR_DESIRED_PROC_UNITS,           &Self::getDesiredProcsUnits},
        {ATTR_MAX_PROC_UNITS,               &Self::getMaxProcsUnits},
        {ATTR_MIN_PROCS,                    &Self::getMinProcs},
        {ATTR_DESIRED_PROCS,                &Self::getDesiredProcs},
        {ATTR_MAX_PROCS,                    &Self::getMaxProcs},
        {ATTR_SHARING_MODE,                 &Self::getSharingMode},
        {ATTR_UNCAP_WEIGHT,                 &Self::getUncapWeight},
        {ATTR_IO_SLOTS,                     &Self::getIoSlots},
        {ATTR_LOAD_SOURCE_SLOT,             &Self::getLoadSourceSlot},
        {ATTR_ALT_RESTART_DEVICE_SLOT,      &Self::getAltRestartDeviceSlot},
        {ATTR_CONSOLE_SLOT,                 &Self::getConsoleSlot},
        {ATTR_ALT_CONSOLE_SLOT,             &Self::getAltConsoleSlot},
        {ATTR_OP_CONSOLE_SLOT,              &Self::getOpConsoleSlot},
        {ATTR_MAX_VIRTUAL_SLOTS,            &Self::getMaxVirtualSlots},
        {ATTR_VIRTUAL_SERIAL_ADAPTERS,      &Self::getVirtualSerialAdapters},
        {ATTR_VIRTUAL_SCSI_ADAPTERS,        &Self::getVirtualScsiAdapters},
        {ATTR_VIRTUAL_ETH_ADAPTERS,         &Self::getVirtualEthAdapters},
        {ATTR_BOOT_MODE,                    &Self::getBootMode},
        {ATTR_CONN_MONITORING,              &Self::getConnMonitoring},
        {ATTR_AUTO_START,                   &Self::getAutoStart},
        {ATTR_SHARED_PROC_POOL_ID,          &Self::getSharedProcPoolID},
        {ATTR_LPAR_PROC_COMPAT_MODE,        &Self::getLparProcCompatMode},
        {ATTR_REDUNDANT_ERR_PATH_REPORTING, &Self::getRedundantErrPathReporting},
    };
};

template <>
struct Told<zemPartitionProcessorResource> : zemProcessorAttribute {
    using Self = zemPartitionProcessorResource;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,                  &Self::getLparID},
        {ATTR_CURR_PROC_MODE,           &Self::getCurrProcMode},
        {ATTR_CURR_MIN_PROC_UNITS,      &Self::getCurrMinProcUnits},
        {ATTR_CURR_MAX_PROC_UNITS,      &Self::getCurrMaxProcUnits},
        {ATTR_CURR_MIN_PROCS,           &Self::getCurrMinProcs},
        {ATTR_CURR_MAX_PROCS,           &Self::getCurrMaxProcs},
        {ATTR_CURR_SHARING_MODE,        &Self::getCurrSharingMode},
        {ATTR_PEND_SHARED_PROC_POOL_ID, &Self::getPendSharedProcPoolId},
        {ATTR_PEND_MIN_PROC_UNITS,      &Self::getPendMinProcUnits},
        {ATTR_PEND_MAX_PROC_UNITS,      &Self::getPendMaxProcUnits},
        {ATTR_PEND_MIN_PROCS,           &Self::getPendMinProcs},
        {ATTR_PEND_MAX_PROCS,           &Self::getPendMaxProcs},
        {ATTR_RUN_PROC_UNITS,           &Self::getRunProcUnits},
        {ATTR_RUN_PROCS,                &Self::getRunProcs},
        {ATTR_RUN_UNCAP_WEIGHT,         &Self::getRunUncapWeight},
    };
};

template <>
struct Told<zemPartitionMemoryResource> : zemMemoryAttribute {
    using Self = zemPartitionMemoryResource;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,             &Self::getLparID},
        {ATTR_CURR_MIN_MEM,        &Self::getCurrMinMem},
        {ATTR_CURR_MAX_MEM,        &Self::getCurrMaxMem},
        {ATTR_PEND_MIN_MEM,        &Self::getPendMinMem},
        {ATTR_PEND_MAX_MEM,        &Self::getPendMaxMem},
        {ATTR_RUN_MEM,             &Self::getRunMem},
        {ATTR_MEM_MODE,            &Self::getMemMode},
        {ATTR_RUN_MEM_WEIGHT,      &Self::getRunMemWeight},
        {ATTR_RUN_IO_ENTITLED_MEM, &Self::getRunIoEntitledMem},
    };
};

template <>
struct Told<zemPartitionIOSlotResource> : zemSlotAttribute {
    using Self = zemPartitionIOSlotResource;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,   &Self::getLparID},
        {ATTR_DRC_INDEX, &Self::getDrcIndex},
    };
};

template <>
struct Told<zemPartitionSerialAdapterResource> : zemSerialAttribute {
    using Self = zemPartitionSerialAdapterResource;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,         &Self::getLparID},
        {ATTR_SLOT_NUM,        &Self::getSlotNum},
        {ATTR_IS_REQUIRED,     &Self::getIsRequired},
        {ATTR_ADAPTER_TYPE,    &Self::getAdapterType},
        {ATTR_SUPPORTS_DNX,    &Self::getSupportsDnx},
        {ATTR_REMOTE_LPAR_ID,  &Self::getRemoteLparId},
        {ATTR_REMOTE_SLOT_NUM, &Self::getRemoteSlotNum},
    };
};

template <>
struct Told<zemPartitionSCSIAdapterResource> : zemScsiAttribute {
    using Self = zemPartitionSCSIAdapterResource;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,         &Self::getLparID},
        {ATTR_SLOT_NUM,        &Self::getSlotNum},
        {ATTR_ADAPTER_TYPE,    &Self::getAdapterType},
        {ATTR_REMOTE_LPAR_ID,  &Self::getRemoteLparId},
        {ATTR_REMOTE_SLOT_NUM, &Self::getRemoteSlotNum},
        {ATTR_IS_REQUIRED,     &Self::getIsRequired},
    };
};

template <>
struct Told<zemPartitionEthernetAdapterResource> : zemEthernetAttribute {
    using Self = zemPartitionEthernetAdapterResource;
    static constexpr Field<Self> kFields[] = {
        {ATTR_LPAR_ID,          &Self::getLparID},
        {ATTR_SLOT_NUM,         &Self::getSlotNum},
        {ATTR_IEEE_VIRTUAL_ETH, &Self::getIeeeVirtualEth},
        {ATTR_PORT_VLAN_ID,     &Self::getPortVlanID},
        {ATTR_ADDL_VLAN_IDS,    &Self::getAddlVlanIds},
        {ATTR_IS_TRUNK,         &Self::getIsTrunk},
        {ATTR_IS_REQUIRED,      &Self::getIsRequired},
        {ATTR_MAC_ADDR,         &Self::getMacAddr},
        {ATTR_TRUNK_PRIORITY,   &Self::getTruukPriority},
        {zemEthernetSwitch,     &Self::getVSwitch},
    };
};
// clang-format on

const zemString kNotTold;

const zemString& fromRecord(const void* object, int attribute) {
    const auto& record = *static_cast<const zemRecordType*>(object);
    zemString value;
    return record.lookup(attribute, value) == 0 ? record[attribute] : kNotTold;
}

template <class Object>
const zemString& fromModel(const void* object, int attribute) {
    for (const Field<Object>& field : Told<Object>::kFields) {
        if (field.attribute == attribute) {
            return (static_cast<const Object*>(object)->*field.get)();
        }
    }
    return kNotTold;
}

}  // namespace

zemAttributes::zemAttributes(const zemRecordType& record) : m_object(&record), m_read(fromRecord) {}

template <class Object>
zemAttributes::zemAttributes(const Object& object) : m_object(&object), m_read(fromModel<Object>) {}

template <class Object>
zemRecordType zemRecordOf(const Object& object) {
    zemRecordType record(std::size(Told<Object>::kFields));
    for (const Field<Object>& field : Told<Object>::kFields) {
        record.insert(field.attribute, (object.*field.get)());
    }
    return record;
}

template <class Object>
std::vector<int> zemAttributesOf() {
    std::vector<int> attributes;
    for (const Field<Object>& field : Told<Object>::kFields) {
        attributes.push_back(field.attribute);
    }
    attributes.push_back(Told<Object>::ATTR_END);
    return attributes;
}

template zemAttributes::zemAttributes(const zemLPAR&);
template zemAttributes::zemAttributes(const zemPartitionProfileConfiguration&);
template zemAttributes::zemAttributes(const zemPartitionProcessorResource&);
template zemAttributes::zemAttributes(const zemPartitionMemoryResource&);
template zemAttributes::zemAttributes(const zemPartitionIOSlotResource&);
template zemAttributes::zemAttributes(const zemPartitionSerialAdapterResource&);
template zemAttributes::zemAttributes(const zemPartitionSCSIAdapterResource&);
template zemAttributes::zemAttributes(const zemPartitionEthernetAdapterResource&);

template zemRecordType zemRecordOf(const zemPartitionProfileConfiguration&);
template zemRecordType zemRecordOf(const zemPartitionEthernetAdapterResource&);

template std::vector<int> zemAttributesOf<zemPartitionProcessorResource>();
template std::vector<int> zemAttributesOf<zemPartitionMemoryResource>();
template std::vector<int> zemAttributesOf<zemPartitionIOSlotResource>();
template std::vector<int> zemAttributesOf<zemPartitionSerialAdapterResource>();
template std::vector<int> zemAttributesOf<zemPartitionSCSIAdapterResource>();
