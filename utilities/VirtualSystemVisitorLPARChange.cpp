// How partitions are changed: their names, their keylock, and the resources of one that runs.

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "CommandLine.h"
#include "EdallocCmdCaller.h"
#include "EdplatCmdCaller.h"
#include "Exception.h"
#include "SystemConfigSupport.h"
#include "VirtualSystemVisitorLPAR.h"
#include "VirtualSystemVisitorSettings.h"

namespace {

using Edalloc = zemEdallocCmdCaller;

constexpr char kLparVisitor[] = "zemLPARVisitor";

/// Whose resource changes, and how: what stands in every line of the tool, and who follows it.
struct Running {
    Edalloc& caller;
    const zemString& mtms;
    const zemString& lparid;
    pid_t* pid;
    FILE** fpOutput;
};

// Slots and adapters.

void addNumber(int index, int value, zemPairs& pairs) {
    if (value != -1) {
        addCommandAttribute(index, zemString(value), pairs);
    }
}

zemPairs ethernetPairs(const zemVETHRASD::zemVETHRASDData& data) {
    using Attribute = Edalloc::AddVETHAttribute;
    zemPairs pairs;
    addNumber(Attribute::ATTR_IEEE_VIRTUAL_ETH, data.m_IEEECompatible, pairs);
    addNumber(Attribute::ATTR_PORT_VLAN_ID, data.m_PortVLANID, pairs);
    const bool isTrunk = data.m_TrunkPriority > 0;
    addNumber(Attribute::ATTR_IS_TRUNK, data.m_TrunkPriority == -1 ? -1 : isTrunk, pairs);
    addNumber(Attribute::ATTR_TRUNK_PRIORITY, isTrunk ? data.m_TrunkPriority : -1, pairs);
    if (data.m_AddVLANIDs.size() > 0) {
        addCommandAttribute(Attribute::ATTR_ADDL_VLAN_IDS, zemNumberList(data.m_AddVLANIDs).c_str(),
                            pairs);
    }
    if (!data.m_vswitch.isInvalid()) {
        addCommandAttribute(Attribute::ATTR_VSWITCH, data.m_vswitch, pairs);
    }
    return pairs;
}

/// The attributes that serial and SCSI adapters have in common bear the same numbers.
zemPairs remotePairs(const zemRemoteAdapterRASDData& data) {
    using Attribute = Edalloc::AddVSCSIAttribute;
    constexpr int kAny = -2;
    zemPairs pairs;
    if (data.m_VirtualAdapterType != -1) {
        addCommandAttribute(Attribute::ATTR_ADAPTER_TYPE,
                            data.m_VirtualAdapterType != 0 ? "client" : "server", pairs);
    }
    if (data.m_RemoteSlotID == kAny) {
        addCommandAttribute(Attribute::ATTR_REMOTE_SLOT_NUM, "any", pairs);
    } else {
        addNumber(Attribute::ATTR_REMOTE_SLOT_NUM, data.m_RemoteSlotID, pairs);
    }
    if (!data.m_RemoteVirtualSystemID.isInvalid()) {
        addCommandAttribute(Attribute::ATTR_REMOTE_LPAR_ID, data.m_RemoteVirtualSystemID, pairs);
    }
    return pairs;
}

struct Adder {
    const Running& to;

    int operator()(const zemIOSlotRASD& slot) const {
        return to.caller.addIOSlot(to.mtms, to.lparid,
                                   zemArgument(zemDrcIndexOf(slot).c_str()).c_str(), zemPairs(),
                                   to.pid, to.fpOutput);
    }
    int operator()(const zemVETHRASD& ethernet) const {
        return add(&Edalloc::addVETH, ethernet, ethernetPairs(ethernet.m_Data));
    }
    int operator()(const zemVSCSIRASD& scsi) const {
        return add(&Edalloc::addVSCSI, scsi, remotePairs(scsi.m_Data));
    }
    int operator()(const zemVSERIALRASD& serial) const {
        return add(&Edalloc::addVSERIAL, serial, remotePairs(serial.m_Data));
    }

    template <class Operation, class Rasd>
    int add(Operation operation, const Rasd& rasd, const zemPairs& pairs) const {
        return (to.caller.*operation)(to.mtms, to.lparid, rasd.m_Data.m_SlotID, pairs, to.pid,
                                      to.fpOutput);
    }
};

struct Remover {
    const Running& from;

    int operator()(const zemIOSlotRASD& slot) const {
        return from.caller.removeIOSlot(from.mtms, from.lparid,
                                        zemArgument(zemDrcIndexOf(slot).c_str()).c_str(), from.pid,
                                        from.fpOutput);
    }
    int operator()(const zemVETHRASD& rasd) const { return remove(&Edalloc::removeVETH, rasd); }
    int operator()(const zemVSCSIRASD& rasd) const { return remove(&Edalloc::removeVSCSI, rasd); }
    int operator()(const zemVSERIALRASD& rasd) const {
        return remove(&Edalloc::removeVSERIAL, rasd);
    }

    template <class Operation, class Rasd>
    int remove(Operation operation, const Rasd& rasd) const {
        return (from.caller.*operation)(from.mtms, from.lparid, rasd.m_Data.m_SlotID, from.pid,
                                        from.fpOutput);
    }
};

// Processors and memory.

enum Change { NOTHING, ADD, REMOVE, MODIFY };

/// How far a resource moves, in the unit of RASDs: what stands behind it, and how much of it the
/// partition sees.
struct Difference {
    std::int64_t reservation = 0;
    std::int64_t quantity = 0;

    /// Both go the way of the reservation, or if that stays of the quantity.
    Change change() const {
        const std::int64_t leading = reservation != 0 ? reservation : quantity;
        return leading == 0 ? NOTHING : leading > 0 ? ADD : REMOVE;
    }
};

/// What is not set does not change, nor is there less than nothing.
std::int64_t difference(std::int64_t before, std::int64_t now) {
    return now < 0 ? 0 : now - std::max<std::int64_t>(before, 0);
}

/// @throws zemOperationFailedException the old data are neither shared nor dedicated
Difference differenceOf(const zemRASDCommData& before, const zemRASDCommData& now) {
    const std::int64_t reservation = difference(before.m_Reservation, now.m_Reservation);
    switch (before.m_ConsumerVisibility) {
        case zemPassedThrough:
            return {0, reservation};
        case zemVirtualized:
            return {reservation, difference(before.m_VirtualQuantity, now.m_VirtualQuantity)};
        default:
            throw zemOperationFailedException(
                kLparVisitor, "ChangeRunningMemProcResource",
                "ConsumerVisibility is not correct, ConsumerVisibility should be 3 when shared "
                "mode, ConsumerVisibility should be 2 dedicated mode ");
    }
}

bool hasOtherSharing(const zemRASDCommData& before, const zemRASDCommData& now) {
    return (now.m_Weight != -1 && now.m_Weight != before.m_Weight) ||
           (!now.m_SharingMode.isEmpty() && now.m_SharingMode != before.m_SharingMode);
}

int changeMemory(const Running& running, Change change, const Difference& sizes, zemRASD* rasd) {
    const auto& [caller, mtms, lparid, pid, fpOutput] = running;
    // The tool takes megabytes.
    const std::int64_t entitled = std::abs(sizes.reservation) / zemKilobytes;
    const std::int64_t size = std::abs(sizes.quantity) / zemKilobytes;
    switch (change) {
        case ADD:
            return caller.addMemory(mtms, lparid, entitled, size, pid, fpOutput);
        case REMOVE:
            return caller.removeMemory(mtms, lparid, entitled, size, pid, fpOutput);
        default:
            return caller.modifyMemory(mtms, lparid, rasd, pid, fpOutput);
    }
}

int changeProcessors(const Running& running, Change change, const Difference& sizes,
                     zemRASD* rasd) {
    const auto& [caller, mtms, lparid, pid, fpOutput] = running;
    const std::int64_t procs = std::abs(sizes.quantity);
    const std::int64_t units = std::abs(sizes.reservation);
    switch (change) {
        case ADD:
            return caller.addProcessing(mtms, lparid, procs, units, pid, fpOutput);
        case REMOVE:
            return caller.removeProcessing(mtms, lparid, procs, units, pid, fpOutput);
        default:
            return caller.modifyProcessing(mtms, lparid, rasd, pid, fpOutput);
    }
}

}  // namespace

int zemLPARVisitor::deleteLpar(const zemString& mtms, const zemString& lparId) {
    zemCommandCaller(m_Env.m_userName, m_Env.m_locale)
        .callGenericCommand(zemRemovalLine(mtms, lparId).c_str(), nullptr, false);
    return 0;
}

int zemLPARVisitor::ChangeKeyLock(zemVSSD* vssd, const zemString& keylock) {
    const std::string line = zemKeylockLine(vssd->getMTMS(), vssd->getLparID(), keylock);
    return zemCommandCaller(m_Env.m_userName, m_Env.m_locale)
        .callGenericCommand(line.c_str(), nullptr, false);
}

int zemLPARVisitor::ModifyLparProperties(zemVSSD* vssd) {
    using Attribute = zemEdplatCmdCaller::PartitionAttribute;
    zemPairs pairs;
    if (!vssd->getDefaultProfileName().isInvalid()) {
        addCommandAttribute(Attribute::ATTR_DEFAULT_PROFILE, vssd->getDefaultProfileName(), pairs);
    }
    if (!vssd->getLparName().isInvalid()) {
        addCommandAttribute(Attribute::ATTR_NEW_NAME, vssd->getLparName(), pairs);
    }
    if (pairs.size() > 0) {
        // Clients know these failures by the class that sets a default profile alone.
        zemWithNotFound(kUnknownToChanges, "zemVirtualSystem", "setDefaultProfile", [&] {
            return zemEdplatCmdCaller(m_Env.m_userName, m_Env.m_locale)
                .modifyPartitionsInformation(vssd->getLparID(), pairs, vssd->getMTMS());
        });
    }
    return vssd->getKeylock().isInvalid() ? 0 : ChangeKeyLock(vssd, vssd->getKeylock());
}

int zemLPARVisitor::ChangeRunningIOResource(const zemString& mtms, const zemString& lparid,
                                            zemRASD* rasd, pid_t* pid, FILE** fpOutput,
                                            zemCommandCaller::CH_OP_TYPE op) {
    Edalloc caller(m_Env.m_userName, m_Env.m_locale);
    const zemString host = zemArgument(mtms).c_str(), lpar = zemArgument(lparid).c_str();
    const Running running{caller, host, lpar, pid, fpOutput};
    switch (op) {
        case zemCommandCaller::CH_OP_ADD:
            return zemOnAdapter(*rasd, Adder{running}, -1);
        case zemCommandCaller::CH_OP_REMOVE:
            return zemOnAdapter(*rasd, Remover{running}, -1);
        default:
            return -1;
    }
}

int zemLPARVisitor::ChangeRunningMemProcResource(const zemString& mtms, const zemString& lparid,
                                                 zemRASD* rasdold, zemRASD* rasd, pid_t* pid,
                                                 FILE** fpOutput) {
    const zemRASDCommData& before = *rasdold->getData();
    const zemRASDCommData& now = *rasd->getData();
    const Difference sizes = differenceOf(before, now);
    Change change = sizes.change();
    if (change == NOTHING) {
        if (!hasOtherSharing(before, now)) {
            return -1;
        }
        change = MODIFY;
    }
    Edalloc caller(m_Env.m_userName, m_Env.m_locale);
    const zemString host = zemArgument(mtms).c_str(), lpar = zemArgument(lparid).c_str();
    const Running running{caller, host, lpar, pid, fpOutput};
    switch (now.m_ResourceType) {
        case zemRASDKinds::memory.resourceType:
            return changeMemory(running, change, sizes, rasd);
        case zemRASDKinds::processor.resourceType:
            return changeProcessors(running, change, sizes, rasd);
        default:
            return -1;
    }
}
