/// Asks the tool "qylink" for the appliance's connections to hosts.
///
/// An object is made for one operation and is not shared between threads. Operations throw what
/// the tool's failures raise (CommandCaller.h); "no results" is such a failure.
#ifndef QYLINK_CMD_CALLER_H
#define QYLINK_CMD_CALLER_H

#include "CommandCaller.h"

#define ZEM_QYLINK_ALL(X)                             \
    X(RESOURCE_TYPE, "resource_type")                 \
    X(TYPE_MODEL_SERIAL_NUM, "type_model_serial_num") \
    X(SP, "sp")                                       \
    X(SP_PHYS_LOC, "sp_phys_loc")                     \
    X(IPADDR, "ipaddr")                               \
    X(ALT_IPADDR, "alt_ipaddr")                       \
    X(STATE, "state")                                 \
    X(CONNECTION_ERROR_CODE, "connection_error_code")

class ZEM_EXPORT zemQylinkCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(ALL, ZEM_QYLINK_ALL);

    /// @param auth,locale  as for zemCommandCaller
    zemQylinkCmdCaller(const char* auth, const char* locale);

    /// One record for each connection to @p managedSystem.
    /// @param paramAttr  wanted attributes, ending in ATTR_END; null: all
    /// @param managedSystem  key or name of a host; null or empty: all hosts
    zemRecordSetsType getQylinkInformation(int* paramAttr, const char* managedSystem);
};

#undef ZEM_QYLINK_ALL

#endif
