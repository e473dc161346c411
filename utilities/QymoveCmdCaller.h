/// Asks the tool "qymove" for what can migrate between hosts, and how far a migration is.
///
/// An object is made for one operation and is not shared between threads. Operations throw what
/// the tool's failures raise (CommandCaller.h); "no results" is such a failure.
#ifndef QYMOVE_CMD_CALLER_H
#define QYMOVE_CMD_CALLER_H

#include "CommandCaller.h"

#define ZEM_QYMOVE_LPAR(X)                    \
    X(NAME, "name")                           \
    X(LPAR_ID, "lpar_id")                     \
    X(MIGRATION_STATE, "migration_state")     \
    X(MIGRATION_TYPE, "migration_type")       \
    X(SOURCE_SYS_NAME, "source_sys_name")     \
    X(DEST_SYS_NAME, "dest_sys_name")         \
    X(SOURCE_LPAR_ID, "source_lpar_id")       \
    X(DEST_LPAR_ID, "dest_lpar_id")           \
    X(SOURCE_MSP_NAME, "source_msp_name")     \
    X(SOURCE_MSP_ID, "source_msp_id")         \
    X(DEST_MSP_NAME, "dest_msp_name")         \
    X(DEST_MSP_ID, "dest_msp_id")             \
    X(BYTES_TRANSMITTED, "bytes_transmitted") \
    X(BYTES_REMAINING, "bytes_remaining")

#define ZEM_QYMOVE_SYS(X)                                                         \
    X(INACTIVE_LPAR_MOBILITY_CAPABLE, "inactive_lpar_mobility_capable")           \
    X(NUM_INACTIVE_MIGRATIONS_SUPPORTED, "num_inactive_migrations_supported")     \
    X(NUM_INACTIVE_MIGRATIONS_IN_PROGRESS, "num_inactive_migrations_in_progress") \
    X(ACTIVE_LPAR_MOBILITY_CAPABLE, "active_lpar_mobility_capable")               \
    X(NUM_ACTIVE_MIGRATIONS_SUPPORTED, "num_active_migrations_supported")         \
    X(NUM_ACTIVE_MIGRATIONS_IN_PROGRESS, "num_active_migrations_in_progress")

#define ZEM_QYMOVE_MANAGER(X) X(REMOTE_LPAR_MOBILITY_CAPABLE, "remote_lpar_mobility_capable")

class ZEM_EXPORT zemQymoveCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_QYMOVE_LPAR);
    ZEM_ATTRIBUTE_TABLE(ManagedSystemAttribute, ZEM_QYMOVE_SYS);
    ZEM_ATTRIBUTE_TABLE(ManagerSystemAttribute, ZEM_QYMOVE_MANAGER);

    /// @param auth,locale  as for zemCommandCaller
    zemQymoveCmdCaller(const char* auth, const char* locale);

    /// Capabilities of the appliance itself, and of @p managedSystem.
    /// @param paramAttr  wanted attributes, ending in ATTR_END; null: all
    /// @param managedSystem  key or name of a host; null: all hosts. An empty text is passed on.
    zemRecordSetsType getManagerSystemCapabilities(int* paramAttr);
    zemRecordSetsType getManagedSystemCapabilities(int* paramAttr, const char* managedSystem);

    /// One record for each partition of @p managedSystem.
    /// @param filter  the tool's filter with its own quoting; null or empty: none
    zemRecordSetsType getPartitionsMigrationState(int* paramAttr, const char* managedSystem,
                                                  const char* filter);
};

#undef ZEM_QYMOVE_LPAR
#undef ZEM_QYMOVE_SYS
#undef ZEM_QYMOVE_MANAGER

#endif
