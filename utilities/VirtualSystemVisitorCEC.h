/// zemCECVisitor: reads the managed hosts into a manager, and hangs on them their partitions,
/// profiles and records of resources.
///
/// One call of the management library covers all hosts, or all partitions of one: who enumerates
/// asks with empty keys and finds the records hung where they belong, in place of one call for each
/// partition. Tools are asked only for what the library does not tell: suspending and restarting.
///
///     visitor->initialize(userName, true, zemCECVisitor::Level_All);
///     visitor->initializeLparResource(userName, "", zemCECVisitor::Level_All, VISITOR_TYPE_LPAR);
///     visitor->initializeMemoryLevelLpar(userName, "", zemCECVisitor::Level_All);
///     puts(visitor->getData(0)->getLPARs().getElementAt(0)->getLparMemory().getCurrMem());
///
/// In all operations, userName is who asks, and where it is empty the user of setOperEnv(); mtms
/// is the key of a host, lparid the number of a partition. A level is one of initializeLevel.
///
/// Thread-safety: none; a visitor belongs to one operation.
#ifndef VIRTUAL_SYSTEM_VISITOR_CEC_H
#define VIRTUAL_SYSTEM_VISITOR_CEC_H

#include "DynamicArray.h"
#include "RecordSets.h"
#include "StringUtils.h"
#include "VirtualSystemRep.h"
#include "VirtualSystemVisitorManager.h"
#include "ZemExport.h"

class ZEM_EXPORT zemCECVisitor {
public:
    /// How much of each partition is filled: key and state, or everything. Of all else, everything
    /// is filled whatever the level.
    enum initializeLevel { Level_Basic = 1, Level_All = 2 };

    /// @param vm  whose hosts are visited; outlives the visitor
    /// @param type  CIM class whose instances are wanted
    zemCECVisitor(zemVirtualizationManager* vm, const zemString& type);

    void setOperEnv(const zemOperEnv& env) { m_Env = env; }
    void setOperEnv(const zemString& user, const zemString& locale) { m_Env = {user, locale}; }

    /// The manager's hosts: how many, and one by its position, null outside of them.
    int size() const;
    zemCEC* getData(int index);

    /// The host with this key. One that the manager lacks is asked for at the tool "qyplat", and
    /// added to the manager with its name and capabilities; null when the tool knows none.
    /// @throws what queries throw (CommandCaller.h)
    zemCEC* getData(const zemString& mtms);

    // --- Hosts

    /// Fills the manager, of which all hosts with all that hangs on them are deleted first.
    /// @param onlyOperating  leaves out hosts that are neither "Operating" nor "Standby"
    /// @param mtms  the one host to read; empty: all
    /// @return 1; -1 when one host was asked for, and it is left out or not the only answer
    /// @throws what getAllCECObjectsByKeys() throws
    int initialize(const zemString& userName, bool onlyOperating, int level);
    int initialize(const zemString& userName, bool onlyOperating, const zemString& mtms, int level);

    /// Adds what the tool "qyplat" tells of suspending and restarting to the hosts' capabilities,
    /// and prints it; numbers that are none count as 0. @p level has no effect.
    /// @return 1; 0 when there are no hosts
    /// @throws what queries throw (CommandCaller.h)
    int initilaizeCECSuspendRR(const zemString& userName, int level);

    /// Makes a partition of @p cec, with its first profile, by one line of the tool "nwplat"; the
    /// model stays as it is. The tool chooses the partition's number.
    /// @param vssd  the settings, and the RASDs of one processor and one memory, of slots and
    ///        adapters, which stay the caller's. What is empty or not set is left to the tool, but
    ///        virtual slots, of which a type has a usual number. Dedicated processors are set to
    ///        share what is idle, and to be as many as their units, in the RASD itself.
    /// @param isOSQ00  the slots that are tagged as load source, console and the like are told too
    /// @return 0
    /// @throws zemInvalidParameterException there are several RASDs of processors or memory, or
    ///         shared processors are from no pool although the host has several
    /// @throws zemObjectNotFoundException id "Processor" or "Memory": there is none
    /// @throws what the tool's failures raise (CommandCaller.h); it has made nothing then
    int createLPAR(zemCEC* cec, zemVSSD* vssd, bool isOSQ00);

    /// Adds @p cec, which becomes the manager's, after its partitions have been read. Returns 0.
    /// @throws what zemLPARVisitor::initialize() throws; @p cec has been deleted then
    int addCEC(zemCEC* cec, const zemString& userName);

    /// Adds the host with this key, of which only what getData() asks for is known. Returns 0; -1
    /// when there is no such host.
    int addCEC(const zemString& mtms);

    /// Deletes the host with this key. Returns 0; -1 when there is none.
    int removeCEC(const zemString& mtms);

    /// Gives the host that has the key of @p cec its name and state, where they differ. Returns 0;
    /// -1 when there is no such host. @p cec remains the caller's.
    int modifyCEC(const zemCEC* cec);

    // --- What hangs on hosts and partitions
    //
    // Each reads one collection with one call and hangs its records on the manager's hosts, or on
    // the partitions that they have by now; records of others are dropped. With several hosts it
    // reads all of them, whatever lparid says; with one, what that host, or its partition lparid,
    // has. Each prints that it begins, and returns 0.
    //
    // throws: what the operation of the same collection throws (getAll...ByKeys); nothing has been
    // hung then.

    /// Partitions. Those that are there stay: who reads them anew reads the hosts first.
    /// @param mask  a list of Common.h, which has no effect: everything is filled
    /// @param type  a VMVisitorType, which has no effect: what is filled follows the level
    int initializeLparResource(const zemString& userName, const zemString& lparid, int level,
                               int type);
    int initializeLparResource(const zemString& userName, const zemString& lparid, int* mask,
                               int type);

    /// Of partitions, in addition to what hangs there: profiles, slots, adapters; in place of it:
    /// processors, memory. Where the slots of whole hosts are read, these tell how many they have,
    /// free ones too.
    int initializeLparProfile(const zemString& userName, const zemString& lparid, int level);
    int initializeLparProfile(const zemString& userName, const zemString& lparid, int* mask);
    int initializeProcessorLevelLpar(const zemString& userName, const zemString& lparid, int level);
    int initializeMemoryLevelLpar(const zemString& userName, const zemString& lparid, int level);
    int initializeIOSlotLevelLpar(const zemString& userName, const zemString& lparid, int level);
    int initializeSerialAdapterLevelLpar(const zemString& userName, const zemString& lparid,
                                         int level);
    int initializeSCSIAdapterLevelLpar(const zemString& userName, const zemString& lparid,
                                       int level);
    int initializeEthernetAdapterLevelLpar(const zemString& userName, const zemString& lparid,
                                           int level);

    /// Of hosts, in place of what hangs there, but for the pools of processors, which add up.
    int initializeProcessorLevelSys(const zemString& userName, int level);
    int initializeProcessorLevelPool(const zemString& userName, int level);
    int initializeProcessorPool(const zemString& userName, int level);
    int initializeMemoryLevelSys(const zemString& userName, int level);
    int initializeMemoryPool(const zemString& userName, int level);

    /// Whether partitions can be suspended and restarted elsewhere. The tool's answers do not name
    /// hosts: it is asked twice for each host that has partitions.
    /// @param mask  has no effect
    /// @throws what queries throw (CommandCaller.h)
    int initializeLparSuspendRR(const zemString& userName, const zemString& lparid, int* mask);

    // --- Collections
    //
    // Each gives the records of one collection, which the caller owns, with one call of the
    // library: those of all hosts for an empty mtms; of one host; or, with lparid, of one of its
    // partitions. Absent values are empty texts. The library's "not found" gives no records.
    //
    // throws: zemAccessDeniedException the user may not read; zemOperationFailedException any other
    // answer of the library, and none, which counts as its code -1.

    zemDynamicArray<zemCEC> getAllCECObjectsByKeys(const zemString& userName, int level,
                                                   const zemString& mtms) const;

    /// One whose key has no "*" has no number and no host.
    /// @param level  below Level_All, only number, host and state are filled
    /// @param mask  a list of Common.h, which has no effect: everything is filled
    zemDynamicArray<zemLPAR> getAllPartitionObjectsByKeys(const zemString& userName, int level,
                                                          const zemString& mtms,
                                                          const zemString& lparid) const;
    zemDynamicArray<zemLPAR> getAllPartitionObjectsByKeys(const zemString& userName, int* mask,
                                                          const zemString& mtms,
                                                          const zemString& lparid) const;

    // Records of partitions, but for slots: zemInvalidParameterException when the library gives a
    // partition's key without "*".

    zemDynamicArray<zemPartitionProfileConfiguration> getAllProfileLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;
    zemDynamicArray<zemPartitionProfileConfiguration> getAllProfileLevelLparByKeys(
        const zemString& userName, int* mask, const zemString& mtms, const zemString& lparid) const;
    zemDynamicArray<zemPartitionProcessorResource> getAllProcessorLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;
    zemDynamicArray<zemPartitionMemoryResource> getAllMemoryLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;
    zemDynamicArray<zemPartitionSerialAdapterResource> getAllSerialAdapterLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;
    zemDynamicArray<zemPartitionSCSIAdapterResource> getAllSCSIAdapterLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;
    zemDynamicArray<zemPartitionEthernetAdapterResource> getAllEthernetAdapterLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;

    /// Only slots that belong to a partition.
    zemDynamicArray<zemPartitionIOSlotResource> getAllIOSlotLevelLparByKeys(
        const zemString& userName, int level, const zemString& mtms, const zemString& lparid) const;

    zemDynamicArray<zemSystemProcessorResource> getAllProcessorLevelSysByKeys(
        const zemString& userName, int level, const zemString& mtms) const;
    zemDynamicArray<zemPoolProcessorResource> getAllProcessorLevelPoolByKeys(
        const zemString& userName, int level, const zemString& mtms) const;
    zemDynamicArray<zemProcessorPoolResource> getAllProcessorPoolByKeys(
        const zemString& userName, int level, const zemString& mtms) const;
    zemDynamicArray<zemSystemMemoryResource> getAllMemoryLevelSysByKeys(
        const zemString& userName, int level, const zemString& mtms) const;
    zemDynamicArray<zemMemoryPoolResource> getAllMemoryPoolByKeys(const zemString& userName,
                                                                  int level,
                                                                  const zemString& mtms) const;

    // --- Suspending and restarting, by the tool "qyplat"
    //
    // throws: what queries throw (CommandCaller.h)

    /// A record for a host, all for an empty @p mtms, keyed by
    /// zemQyplatCmdCaller::ManagedSystemAttribute: the two halves of its key, and what it is
    /// capable of. @p level has no effect.
    zemRecordSetsType getSuspendRRCapableAttributes(const zemString& userName, int level,
                                                    const zemString& mtms) const;

    /// A record for a partition, all of the host for an empty @p lparid, keyed by
    /// zemQyplatCmdCaller::PartitionAttribute: its number with its state and whether it can be
    /// suspended, or whether it can be restarted elsewhere and how far that is.
    zemRecordSetsType getSuspendCapable(const zemString& userName, const zemString& mtms,
                                        const zemString& lparid) const;
    zemRecordSetsType getRRCapable(const zemString& userName, const zemString& mtms,
                                   const zemString& lparid) const;

    // --- Hosts by key

    /// A copy of the table of @p visitor's hosts by key, which is made first unless its state is
    /// true. It holds the manager's pointers. The operations here that add or delete hosts reset
    /// the state of their own visitor; another one of the same manager is told by
    /// setCECHashState().
    zemcecHashType getCECHashMapping(zemCECVisitor* visitor);
    bool isCECAlreadyHashed() const { return m_isCECHashed; }
    void setCECHashState(bool isHashed) { m_isCECHashed = isHashed; }

    /// The host with this key, or null.
    static zemCEC* getCECObjectByMTMS(const zemcecHashType& hash, const zemString& mtms);

    /// Does nothing: users call it in front of a split of their own.
    static void seperateAPIPrepName(const zemString& name, zemString& first, zemString& second);

private:
    const zemString& actor(const zemString& userName) const {
        return userName.isEmpty() ? m_Env.m_userName : userName;
    }
    /// Slots of partitions and, with an empty number and nothing else told, free ones.
    zemDynamicArray<zemPartitionIOSlotResource> slots(const zemString& userName, int level,
                                                      const zemString& mtms,
                                                      const zemString& lparid) const;
    zemRecordSetsType partitionsInformation(int* wanted, const zemString& userName,
                                            const zemString& mtms, const zemString& lparid) const;

    zemVirtualizationManager* m_VM;
    zemString m_Type;
    zemOperEnv m_Env;
    zemcecHashType m_CECHash;  ///< hosts by key; good while m_isCECHashed is true
    bool m_isCECHashed = false;
};

#endif
