/// Creates partitions through the tool "nwplat".
///
/// An object is made for one operation and is not shared between threads.
#ifndef NWPLAT_CMD_CALLER_H
#define NWPLAT_CMD_CALLER_H

#include "CommandCaller.h"
#include "StoredAttributes.h"

// The name of the port capabilities ends in a blank; the tool takes it so.
#define ZEM_NWPLAT_LPAR(X)                                          \
    X(LPAR_ID, "lpar_id")                                           \
    X(NAME, "name")                                                 \
    X(PROFILE_NAME, "profile_name")                                 \
    X(LPAR_ENV, "lpar_env")                                         \
    ZEM_STORED_SIZES(X)                                             \
    ZEM_STORED_ADAPTERS(X)                                          \
    X(WORK_GROUP_ID, "work_group_id")                               \
    ZEM_STORED_DEVICES(X)                                           \
    ZEM_STORED_SHARED_POOL(X)                                       \
    ZEM_STORED_POOLS(X)                                             \
    X(LHEA_CAPABILITIES, "lhea_capabilities ")                      \
    X(SNI_DEVICE_IDS, "sni_device_ids")                             \
    X(REDUNDANT_ERR_PATH_REPORTING, "redundant_err_path_reporting") \
    X(ELECTRONIC_ERR_REPORTING, "electronic_err_reporting")         \
    X(ALL_RESOURCES, "all_resources")                               \
    X(ALLOW_PERF_COLLECTION, "allow_perf_collection")               \
    X(LPAR_AVAIL_PRIORITY, "lpar_avail_priority")

class ZEM_EXPORT zemNwplatCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_NWPLAT_LPAR);

    /// @param auth,locale  as for zemCommandCaller
    zemNwplatCmdCaller(const char* auth, const char* locale);

    /// Makes a partition and its first profile.
    /// @param attrPairs  positions in PartitionAttribute and their values
    /// @param managedSystem  key or name of the host; null: the line does not name it
    /// @return 0
    /// @throws zemInvalidParameterException id "INVALID_INDEX": a position outside the table; and
    ///         what the tool's failures raise (CommandCaller.h)
    int makePartitionsInformation(const zemDynamicArray<tagAttributePair>& attrPairs,
                                  const char* managedSystem);
};

#undef ZEM_NWPLAT_LPAR

#endif
