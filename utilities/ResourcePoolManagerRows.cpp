#include "ResourcePoolManagerRows.h"

#include <iterator>

namespace {

// clang-format off
constexpr zemPoolRow kRows[] = {
    {zemRASDKinds::processor, "Processor", "ORXCORAL:ProcessorPoolService:",
     {"ORXC_Processor", "ORXC_ProcessorPool", "ORXC_ProcessorAllocationCapabilities",
      "ORXC_ProcessorPoolConfigurationCapabilities", "ORXC_ProcessorPoolConfigurationService",
      "ORXC_ProcessorRASettingData"}},
    {zemRASDKinds::memory, "Memory", "ORX:MemoryPoolService:",
     {"ORXC_Memory", "ORXC_MemoryPool", "ORXC_MemoryAllocationCapabilities",
      "ORXC_MemoryPoolConfigurationCapabilities", "ORXC_MemoryPoolConfigurationService",
      "ORXC_MemoryRASettingData"}},
    {zemRASDKinds::ioSlot, "I/O Slot", "ORX:IOSlotPoolService:",
     {"ORXC_IOSlot", "ORXC_IOSlotPool", "ORXC_IOSlotAllocationCapabilities",
      "ORXC_IOSlotPoolConfigurationCapabilities", "ORXC_IOSlotPoolConfigurationService",
      "ORXC_IOSlotAdapterRASettingData"}},
    {zemRASDKinds::ethernet, "Virtual Ethernet Adapter", "ORX:EthernetAdapterPoolService:",
     {"ORXC_EthernetPort", "ORXC_EthernetAdapterPool", "ORXC_EthernetAdapterAllocationCapabilities",
      "ORXC_EthernetAdapterPoolConfigurationCapabilities",
      "ORXC_EthernetAdapterPoolConfigurationService", "ORXC_EthernetAdapterRASettingData"}},
    {zemRASDKinds::serial, "Virtual Serial Adapter", "ORX:SerialAdapterPoolService:",
     {"ORXC_SerialController", "ORXC_SerialAdapterPool", "ORXC_SerialAdapterAllocationCapabilities",
      "ORXC_SerialAdapterPoolConfigurationCapabilities",
      "ORXC_SerialAdapterPoolConfigurationService", "ORXC_SerialAdapterRASettingData"}},
    {zemRASDKinds::scsi, "Virtual SCSI Adapter", "ORX:SCSIAdapterPoolService:",
     {"ORXC_SPIPort", "ORXC_SCSIAdapterPool", "ORXC_SCSIAdapterAllocationCapabilities",
      "ORXC_SCSIAdapterPoolConfigurationCapabilities",
      "ORXC_SCSIAdapterPoolConfigurationService", "ORXC_SCSIAdapterRASettingData"}},
};
// clang-format on
static_assert(std::size(kRows) == zemPoolRowCount);

}  // namespace

const zemPoolRow& zemPoolRowOf(int resourceType) {
    int index = 0;
    while (index < zemPoolRowCount - 1 && kRows[index].kind.resourceType != resourceType) {
        ++index;
    }
    return kRows[index];
}

int zemFindPoolRow(const zemString& className, zemPoolClass first, zemPoolClass last) {
    for (int index = 0; index < zemPoolRowCount; ++index) {
        for (int column = first; column <= last; ++column) {
            if (zemString::equalsIgnoreCase(className, kRows[index].classes[column])) {
                return index;
            }
        }
    }
    return -1;
}
