/// Asks the tool "qyfault" for the reference codes of hosts and partitions.
///
/// An object is made for one operation and is not shared between threads. Operations throw what
/// the tool's failures raise (CommandCaller.h); "no results" is such a failure.
#ifndef QYFAULT_CMD_CALLER_H
#define QYFAULT_CMD_CALLER_H

#include "CommandCaller.h"

#define ZEM_QYFAULT_LPAR(X)     \
    X(LPAR_NAME, "lpar_name")   \
    X(LPAR_ID, "lpar_id")       \
    X(TIME_STAMP, "time_stamp") \
    X(REFCODE, "refcode")       \
    X(WORD2, "word2")           \
    X(FRU_CALL_OUT_LOC_CODES, "fru_call_out_loc_codes")

#define ZEM_QYFAULT_SYS(X)        \
    X(REFCODE_NUM, "refcode_num") \
    X(REFCODE, "refcode")

class ZEM_EXPORT zemQyfaultCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_QYFAULT_LPAR);
    ZEM_ATTRIBUTE_TABLE(ManagedSystemAttribute, ZEM_QYFAULT_SYS);

    /// @param auth,locale  as for zemCommandCaller
    zemQyfaultCmdCaller(const char* auth, const char* locale);

    /// The latest codes of @p managedSystem, or of its partitions.
    /// @param paramAttr  wanted attributes, ending in ATTR_END; null: all
    /// @param managedSystem  key or name of a host; null or empty: all hosts
    /// @param filter  the tool's filter with its own quoting; null or empty: none
    zemRecordSetsType getManagedSystemInformation(int* paramAttr, const char* managedSystem);
    zemRecordSetsType getPartitionsInformation(int* paramAttr, const char* managedSystem,
                                               const char* filter);
};

#undef ZEM_QYFAULT_LPAR
#undef ZEM_QYFAULT_SYS

#endif
