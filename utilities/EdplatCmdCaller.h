/// Changes attributes of hosts, partitions and profiles through the tool "edplat".
///
///     zemEdplatCmdCaller caller(userName, locale);
///     zemDynamicArray<tagAttributePair> pairs;
///     pairs.addElement(new tagAttributePair{
///         zemEdplatCmdCaller::PartitionAttribute::ATTR_NEW_NAME, "web2"});
///     caller.modifyPartitionsInformation("3", pairs, mtms);
///
/// The operations return 0, or throw what the tool's failures raise (CommandCaller.h). An object is
/// made for one operation and is not shared between threads.
#ifndef EDPLAT_CMD_CALLER_H
#define EDPLAT_CMD_CALLER_H

#include "CommandCaller.h"
#include "StoredAttributes.h"

#define ZEM_EDPLAT_PROF(X)                                          \
    X(NAME, "name")                                                 \
    X(LPAR_ID, "lpar_id")                                           \
    X(LPAR_NAME, "lpar_name")                                       \
    X(NEW_NAME, "new_name")                                         \
    ZEM_STORED_SIZES(X)                                             \
    ZEM_STORED_SHARED_POOL(X)                                       \
    ZEM_STORED_ADAPTERS(X)                                          \
    ZEM_STORED_DEVICES(X)                                           \
    ZEM_STORED_POOLS(X)                                             \
    X(LHEA_CAPABILITIES, "lhea_capabilities")                       \
    X(SNI_DEVICE_IDS, "sni_device_ids")                             \
    X(WORK_GROUP_ID, "work_group_id")                               \
    X(REDUNDANT_ERR_PATH_REPORTING, "redundant_err_path_reporting") \
    X(ELECTRONIC_ERR_REPORTING, "electronic_err_reporting")

#define ZEM_EDPLAT_LPAR(X)                            \
    X(NAME, "name")                                   \
    X(LPAR_ID, "lpar_id")                             \
    X(NEW_NAME, "new_name")                           \
    X(WORK_GROUP_ID, "work_group_id")                 \
    X(DEFAULT_PROFILE, "default_profile")             \
    X(IPL_SOURCE, "ipl_source")                       \
    X(ALLOW_PERF_COLLECTION, "allow_perf_collection") \
    X(LPAR_AVAIL_PRIORITY, "lpar_avail_priority")     \
    X(ELECTRONIC_ERR_REPORTING, "electronic_err_reporting")

#define ZEM_EDPLAT_SYS(X)                                 \
    X(NEW_NAME, "new_name")                               \
    X(POWER_OFF_POLICY, "power_off_policy")               \
    X(SERVICE_LPAR_ID, "service_lpar_id")                 \
    X(SERVICE_LPAR_NAME, "service_lpar_name")             \
    X(POWER_ON_OPTION, "power_on_option")                 \
    X(POWER_ON_SIDE, "power_on_side")                     \
    X(POWER_ON_SPEED, "power_on_speed")                   \
    X(POWER_ON_SPEED_OVERRIDE, "power_on_speed_override") \
    X(SP_FAILOVER_ENABLED, "sp_failover_enabled")

class ZEM_EXPORT zemEdplatCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(PartitionProfileAttribute, ZEM_EDPLAT_PROF);
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_EDPLAT_LPAR);
    ZEM_ATTRIBUTE_TABLE(ManagedSystemAttribute, ZEM_EDPLAT_SYS);

    /// @param auth,locale  as for zemCommandCaller
    zemEdplatCmdCaller(const char* auth, const char* locale);

    /// Adds to, sets or takes from attributes of a host, a partition or a profile.
    /// @param profName,lparId  name of the profile, number of the partition
    /// @param attrPairs  positions in the table of the resource, and their values
    /// @param managedSystem  key or name of the host; null: the line does not name it
    /// @throws zemInvalidParameterException id "INVALID_INDEX": a position outside the table
    int changeManagedSystemInformation(const zemDynamicArray<tagAttributePair>& attrPairs,
                                       const char* managedSystem, CH_OP_TYPE op);
    int changePartitionsInformation(const zemString& lparId,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* managedSystem, CH_OP_TYPE op);
    int changePartitionsProfileInformation(const zemString& profName,
                                           const zemDynamicArray<tagAttributePair>& attrPairs,
                                           const char* lparId, const char* managedSystem,
                                           CH_OP_TYPE op);

    /// The same with the change that the name says.
    int modifyManagedSystemInformation(const zemDynamicArray<tagAttributePair>& attrPairs,
                                       const char* managedSystem);
    int addPartitionsInformation(const zemString& lparId,
                                 const zemDynamicArray<tagAttributePair>& attrPairs,
                                 const char* managedSystem);
    int modifyPartitionsInformation(const zemString& lparId,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* managedSystem);
    int removePartitionsInformation(const zemString& lparId,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* managedSystem);
    int addPartitionsProfileInformation(const zemString& profName,
                                        const zemDynamicArray<tagAttributePair>& attrPairs,
                                        const char* lparId, const char* managedSystem);
    int modifyPartitionsProfileInformation(const zemString& profName,
                                           const zemDynamicArray<tagAttributePair>& attrPairs,
                                           const char* lparId, const char* managedSystem);
    int removePartitionsProfileInformation(const zemString& profName,
                                           const zemDynamicArray<tagAttributePair>& attrPairs,
                                           const char* lparId, const char* managedSystem);

private:
    int change(const char* resource, const zemDynamicArray<tagAttributePair>& identity,
               const zemDynamicArray<tagAttributePair>& attrPairs, const char* managedSystem,
               zemAttributeNames table, CH_OP_TYPE op);
};

#undef ZEM_EDPLAT_PROF
#undef ZEM_EDPLAT_LPAR
#undef ZEM_EDPLAT_SYS

#endif
