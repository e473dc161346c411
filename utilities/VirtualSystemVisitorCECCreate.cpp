// How a partition is made: all that a VSSD asks for goes to the tool in one list.

#include "Exception.h"
#include "VirtualSystemVisitorCEC.h"
#include "VirtualSystemVisitorSettings.h"

namespace {

using Partition = zemNwplatCmdCaller::PartitionAttribute;

constexpr char kCecVisitor[] = "zemCECVisitor";
constexpr char kCreateLpar[] = "createLPAR";

constexpr zemSetting kOrder[] = {
    Partition::ATTR_NAME,
    Partition::ATTR_PROFILE_NAME,
    Partition::ATTR_LPAR_ENV,
    Partition::ATTR_AUTO_START,
    Partition::ATTR_BOOT_MODE,
    Partition::ATTR_MAX_VIRTUAL_SLOTS,
    Partition::ATTR_CONN_MONITORING,
    Partition::ATTR_REDUNDANT_ERR_PATH_REPORTING,
    Partition::ATTR_PROC_MODE,
    Partition::ATTR_SHARING_MODE,
    Partition::ATTR_UNCAP_WEIGHT,
    Partition::ATTR_SHARED_PROC_POOL_ID,
    Partition::ATTR_LPAR_PROC_COMPAT_MODE,
    Partition::ATTR_MIN_PROCS,
    Partition::ATTR_MAX_PROCS,
    Partition::ATTR_DESIRED_PROCS,
    Partition::ATTR_MIN_PROC_UNITS,
    Partition::ATTR_MAX_PROC_UNITS,
    Partition::ATTR_DESIRED_PROC_UNITS,
    Partition::ATTR_MEM_MODE,
    Partition::ATTR_MEM_WEIGHT,
    Partition::ATTR_DESIRED_IO_ENTITLED_MEM,
    Partition::ATTR_MIN_MEM,
    Partition::ATTR_DESIRED_MEM,
    Partition::ATTR_MAX_MEM,
};

[[noreturn]] void throwMissing(const char* what, const zemVSSD& vssd, const zemString& mtms) {
    zemString text;
    text.format("No %s is specified when creating lpar %s on %s", what,
                static_cast<const char*>(vssd.getLparID()), static_cast<const char*>(mtms));
    throw zemObjectNotFoundException(kCecVisitor, kCreateLpar, what, text);
}

/// Dedicated processors are as many as their units, and lend what is idle.
void settleDedicated(zemProcessorRASD::zemProcessorRASDData& data) {
    data.m_SharingMode = "share_idle_procs";
    data.m_VirtualMinimum = data.m_Minimum;
    data.m_VirtualQuantity = data.m_Reservation;
    data.m_VirtualMaximum = data.m_Limit;
}

/// A host with several pools must be told which one shared processors are taken from.
void requirePool(const zemProcessorRASD::zemProcessorRASDData& data, zemCEC& cec) {
    if (data.m_ConsumerVisibility == zemVirtualized &&
        zemString::equalsIgnoreCase(data.m_PoolID, zemPrimordial) && cec.getMaxProcPools() > 1) {
        zemString text;
        text.format(
            "Shared processing units can only be allocated from a shared pool but not "
            "\"Primordial\" pool on \"%s\".",
            static_cast<const char*>(cec.getMTMS()));
        throw zemInvalidParameterException(kCecVisitor, kCreateLpar, text);
    }
}

}  // namespace

int zemCECVisitor::createLPAR(zemCEC* cec, zemVSSD* vssd, bool isOSQ00) {
    zemWanted wanted{zemWanted::PARTITION, *vssd};
    const zemString mtms = cec->getMTMS();
    zemProcessorRASD* const processor = zemOnlyProcessor(*vssd, mtms, kCecVisitor, kCreateLpar);
    if (processor == nullptr) {
        throwMissing("Processor", *vssd, mtms);
    }
    if (processor->m_Data.m_ConsumerVisibility == zemPassedThrough) {
        settleDedicated(processor->m_Data);
    }
    requirePool(processor->m_Data, *cec);
    wanted.processor = processor;
    wanted.hasCompatModes = !cec->getCapability().m_lparProcCompatModes.isEmpty();
    wanted.memory = zemOnlyMemory(*vssd, mtms, kCecVisitor, kCreateLpar);
    if (wanted.memory == nullptr) {
        throwMissing("Memory", *vssd, mtms);
    }
    wanted.hasMemoryPools = cec->getMaxMemPools() > 0;

    zemPairs pairs;
    zemAddSettings(wanted, kOrder, pairs);
    zemAddSettings(wanted, kListSettings, pairs);
    if (isOSQ00) {
        zemAddSettings(wanted, kTagSettings, pairs);
    }
    return zemNwplatCmdCaller(m_Env.m_userName, m_Env.m_locale)
        .makePartitionsInformation(pairs, mtms);
}
