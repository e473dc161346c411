/// What a VSSD with its RASDs asks for, as attributes of the tools that make partitions and change
/// profiles. Private to the library.
///
/// Each setting stands once, with its attribute in both tools and the rule that makes its value of
/// the VSSD; whoever runs a tool says which settings go, in their order:
///
///     zemWanted wanted{zemWanted::PROFILE, vssd};
///     wanted.memory = zemOnlyMemory(vssd, kClass, kMethod);
///     constexpr zemSetting kSettings[] = {Partition::ATTR_BOOT_MODE, Partition::ATTR_DESIRED_MEM};
///     zemAddSettings(wanted, kSettings, pairs);
///
/// A setting without a value is left out. Values are texts of clients: those of pairs are escaped,
/// all others stand as they are.
///
/// Functions of their arguments; any thread may call them.
#ifndef VIRTUAL_SYSTEM_VISITOR_SETTINGS_H
#define VIRTUAL_SYSTEM_VISITOR_SETTINGS_H

#include <cstddef>
#include <string>

#include "CommandCaller.h"
#include "NwplatCmdCaller.h"
#include "VirtualSystemRepVSSD.h"

/// A setting, by the attribute of the tool that makes partitions.
using zemSetting = zemNwplatCmdCaller::PartitionAttribute::Attribute;
using zemPairs = zemDynamicArray<tagAttributePair>;

/// The visibility of a RASD: dedicated to the partition, or shared with others.
constexpr int zemPassedThrough = 2;
constexpr int zemVirtualized = 3;

/// The pool that is none.
constexpr char zemPrimordial[] = "Primordial";

/// Kilobytes, in which RASDs hold memory, in one of the tools' megabytes.
constexpr int zemKilobytes = 1024;

/// A VSSD, and what is known of whom it is for.
struct zemWanted {
    enum Target { PARTITION, PROFILE };

    Target target;  ///< a new partition, or a profile that is there
    zemVSSD& vssd;
    const zemProcessorRASD* processor = nullptr;  ///< null: nothing is asked of processors
    const zemMemoryRASD* memory = nullptr;        ///< nor of memory
    bool hasMemoryPools = false;                  ///< the host: memory has a mode there
    bool hasCompatModes = false;                  ///< the host, for a new partition
};

/// The settings of all slots and adapters, and of slots that are tagged for a use.
constexpr zemSetting kListSettings[] = {
    zemNwplatCmdCaller::PartitionAttribute::ATTR_VIRTUAL_SCSI_ADAPTERS,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_VIRTUAL_SERIAL_ADAPTERS,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_VIRTUAL_ETH_ADAPTERS,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_IO_SLOTS};
constexpr zemSetting kTagSettings[] = {
    zemNwplatCmdCaller::PartitionAttribute::ATTR_LOAD_SOURCE_SLOT,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_ALT_RESTART_DEVICE_SLOT,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_CONSOLE_SLOT,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_ALT_CONSOLE_SLOT,
    zemNwplatCmdCaller::PartitionAttribute::ATTR_OP_CONSOLE_SLOT};

/// Appends the value of a setting to @p pairs, under the number that it has in the target's tool.
void zemAddSetting(const zemWanted& wanted, zemSetting setting, zemPairs& pairs);

/// The same for several, in their order.
template <std::size_t N>
void zemAddSettings(const zemWanted& wanted, const zemSetting (&settings)[N], zemPairs& pairs) {
    for (zemSetting setting : settings) {
        zemAddSetting(wanted, setting, pairs);
    }
}

/// Appends one pair, with @p value as the tool is to take it.
void addCommandAttribute(int index, const zemString& value, zemPairs& pairs);

/// A list of the VSSD's slots or adapters, as a tool takes it: an element that needs it in quotes.
/// In the RASDs themselves, what is no flag of what is required becomes 0.
std::string zemAdapterList(const zemVSSD& vssd, int resourceType);

/// The numbers with commas between them; and a slot's DRC index, without the partition that stands
/// behind it once it was read from an instance ID.
std::string zemNumberList(const zemArray<int>& numbers);
std::string zemDrcIndexOf(const zemIOSlotRASD& slot);

/// What @p todo gives for @p rasd, whose kind is a slot or an adapter; @p otherwise for others.
template <class Todo, class Result>
Result zemOnAdapter(const zemRASD& rasd, const Todo& todo, Result otherwise) {
    if (const auto* slot = dynamic_cast<const zemIOSlotRASD*>(&rasd)) {
        return todo(*slot);
    }
    if (const auto* ethernet = dynamic_cast<const zemVETHRASD*>(&rasd)) {
        return todo(*ethernet);
    }
    if (const auto* scsi = dynamic_cast<const zemVSCSIRASD*>(&rasd)) {
        return todo(*scsi);
    }
    if (const auto* serial = dynamic_cast<const zemVSERIALRASD*>(&rasd)) {
        return todo(*serial);
    }
    return otherwise;
}

/// Takes processors and memory, which a system has once, from the VSSD; null if it has none.
/// @param mtms  the host, for the words of the failure
/// @param cls,method  who takes them
/// @throws zemInvalidParameterException there are several
zemProcessorRASD* zemOnlyProcessor(const zemVSSD& vssd, const zemString& mtms, const char* cls,
                                   const char* method);
zemMemoryRASD* zemOnlyMemory(const zemVSSD& vssd, const zemString& mtms, const char* cls,
                             const char* method);

#endif
