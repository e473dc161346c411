/// Changes the resources of a running partition through the tool "edalloc".
///
/// Every operation runs to its end when the last two arguments are null: it then returns 0, or
/// throws what the tool's failure raises (CommandCaller.h). With both given it returns 0 as soon
/// as the tool is started, and the child and its stream belong to the caller, who reads the
/// stream, closes it and reaps the child (zemPropertiesHelper::asynExecuteCommand()).
///
///     zemEdallocCmdCaller caller(userName, locale);
///     caller.addProcessing(mtms, "3", 200, 0, nullptr, nullptr);  // two processors more
///
/// The host, the partition and the slot stand in the line as they are: callers quote what may hold
/// a blank, a quote or a backslash (zemCommandCaller::quoted()).
///
/// An object is made for one operation and is not shared between threads.
#ifndef EDALLOC_CMD_CALLER_H
#define EDALLOC_CMD_CALLER_H

#include <sys/types.h>

#include <cstdint>
#include <cstdio>
#include <string>

#include "CommandCaller.h"

class zemRASD;

#define ZEM_EDALLOC_VSCSI(X)                \
    X(ADAPTER_TYPE, "adapter_type")         \
    X(REMOTE_LPAR_ID, "remote_lpar_id")     \
    X(REMOTE_LPAR_NAME, "remote_lpar_name") \
    X(REMOTE_SLOT_NUM, "remote_slot_num")

#define ZEM_EDALLOC_VSERIAL(X) ZEM_EDALLOC_VSCSI(X) X(SUPPORTS_DNX, "supports_dnx")

#define ZEM_EDALLOC_VETH(X)                 \
    X(IEEE_VIRTUAL_ETH, "ieee_virtual_eth") \
    X(PORT_VLAN_ID, "port_vlan_id")         \
    X(ADDL_VLAN_IDS, "addl_vlan_ids")       \
    X(IS_TRUNK, "is_trunk")                 \
    X(TRUNK_PRIORITY, "trunk_priority")     \
    X(VSWITCH, "vswitch")

#define ZEM_EDALLOC_IOSLOT(X) X(SLOT_IO_POOL_ID, "slot_io_pool_id")

class ZEM_EXPORT zemEdallocCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(AddVSERIALAttribute, ZEM_EDALLOC_VSERIAL);
    ZEM_ATTRIBUTE_TABLE(AddVSCSIAttribute, ZEM_EDALLOC_VSCSI);
    ZEM_ATTRIBUTE_TABLE(AddVETHAttribute, ZEM_EDALLOC_VETH);
    ZEM_ATTRIBUTE_TABLE(AddIOSlotAttribute, ZEM_EDALLOC_IOSLOT);

    /// @param auth,locale  as for zemCommandCaller
    zemEdallocCmdCaller(const char* auth, const char* locale);

    /// Gives processors to the partition @p lparID of the host @p managedSystem or takes them.
    /// @param procs  hundredths of a processor, of which whole processors go to the tool
    /// @param procUnits  hundredths of a processing unit; what is not positive is left out
    /// @throws zemInvalidParameterException a removal of @p procs that is no multiple of 100
    int addProcessing(const char* managedSystem, const zemString& lparID, std::int64_t procs,
                      std::int64_t procUnits, pid_t* pid, FILE** fpOutput);
    int removeProcessing(const char* managedSystem, const zemString& lparID, std::int64_t procs,
                         std::int64_t procUnits, pid_t* pid, FILE** fpOutput);

    /// Sets the sharing mode and the weight of @p rasd, which must not be null; what is not set
    /// there is left out.
    int modifyProcessing(const char* managedSystem, const zemString& lparID, zemRASD* rasd,
                         pid_t* pid, FILE** fpOutput);

    /// Gives memory to the partition or takes it.
    /// @param size  memory entitled for I/O
    /// @param vsize  memory of the partition; what is not positive is left out. Both are in the
    ///        unit of the tool.
    int addMemory(const char* managedSystem, const zemString& lparID, std::int64_t size,
                  std::int64_t vsize, pid_t* pid, FILE** fpOutput);
    int removeMemory(const char* managedSystem, const zemString& lparID, std::int64_t size,
                     std::int64_t vsize, pid_t* pid, FILE** fpOutput);

    /// Sets the memory weight of @p rasd, which must not be null.
    int modifyMemory(const char* managedSystem, const zemString& lparID, zemRASD* rasd, pid_t* pid,
                     FILE** fpOutput);

    /// Gives the I/O slot @p drc_index to the partition or takes it.
    /// @param attrPairs  positions in AddIOSlotAttribute and their values
    int addIOSlot(const char* managedSystem, const zemString& lparID, const zemString& drc_index,
                  const zemDynamicArray<tagAttributePair>& attrPairs, pid_t* pid, FILE** fpOutput);
    int removeIOSlot(const char* managedSystem, const zemString& lparID, const zemString& drc_index,
                     pid_t* pid, FILE** fpOutput);

    /// Adds a virtual Ethernet, SCSI or serial adapter.
    /// @param slotID  virtual slot; if not positive, the tool chooses one
    /// @param attrPairs  positions in the table of the adapter, and their values
    int addVETH(const char* managedSystem, const zemString& lparID, std::int32_t slotID,
                const zemDynamicArray<tagAttributePair>& attrPairs, pid_t* pid, FILE** fpOutput);
    int addVSCSI(const char* managedSystem, const zemString& lparID, std::int32_t slotID,
                 const zemDynamicArray<tagAttributePair>& attrPairs, pid_t* pid, FILE** fpOutput);
    int addVSERIAL(const char* managedSystem, const zemString& lparID, std::int32_t slotID,
                   const zemDynamicArray<tagAttributePair>& attrPairs, pid_t* pid, FILE** fpOutput);

    /// Removes the adapter in the virtual slot @p slotID.
    int removeVETH(const char* managedSystem, const zemString& lparID, std::int32_t slotID,
                   pid_t* pid, FILE** fpOutput);
    int removeVSCSI(const char* managedSystem, const zemString& lparID, std::int32_t slotID,
                    pid_t* pid, FILE** fpOutput);
    int removeVSERIAL(const char* managedSystem, const zemString& lparID, std::int32_t slotID,
                      pid_t* pid, FILE** fpOutput);

private:
    /// The line with @p attrPairs behind it.
    static std::string withPairs(std::string line, zemAttributeNames table,
                                 const zemDynamicArray<tagAttributePair>& attrPairs);

    /// Logs the line behind @p logFront and runs it, to its end or in the background.
    int run(const char* throwMethod, const std::string& logFront, const std::string& line,
            pid_t* pid, FILE** fpOutput);
};

#undef ZEM_EDALLOC_VSERIAL
#undef ZEM_EDALLOC_VSCSI
#undef ZEM_EDALLOC_VETH
#undef ZEM_EDALLOC_IOSLOT

#endif
