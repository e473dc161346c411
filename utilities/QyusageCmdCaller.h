/// Asks the tool "qyusage" for samples of what hosts and partitions use.
///
/// An object is made for one operation and is not shared between threads. Operations throw what
/// the tool's failures raise (CommandCaller.h); "no results" is such a failure.
#ifndef QYUSAGE_CMD_CALLER_H
#define QYUSAGE_CMD_CALLER_H

#include <ctime>

#include "CommandCaller.h"

#define ZEM_QYUSAGE_SYS(X)                                        \
    X(TIME, "time")                                               \
    X(EVENT_TYPE, "event_type")                                   \
    X(RESOURCE_TYPE, "resource_type")                             \
    X(SYS_TIME, "sys_time")                                       \
    X(STATE, "state")                                             \
    X(CONFIGURABLE_SYS_PROC_UNITS, "configurable_sys_proc_units") \
    X(CONFIGURABLE_SYS_MEM, "configurable_sys_mem")               \
    X(CURR_AVAIL_SYS_PROC_UNITS, "curr_avail_sys_proc_units")     \
    X(CURR_AVAIL_7460_WKL_PERCENT, "curr_avail_7460_wkl_percent") \
    X(CURR_AVAIL_SYS_MEM, "curr_avail_sys_mem")                   \
    X(SYS_FIRMWARE_MEM, "sys_firmware_mem")                       \
    X(PROC_CYCLES_PER_SECOND, "proc_cycles_per_second")

#define ZEM_QYUSAGE_LPAR(X)                           \
    X(TIME, "time")                                   \
    X(EVENT_TYPE, "event_type")                       \
    X(RESOURCE_TYPE, "resource_type")                 \
    X(SYS_TIME, "sys_time")                           \
    X(TIME_CYCLES, "time_cycles")                     \
    X(LPAR_NAME, "lpar_name")                         \
    X(LPAR_ID, "lpar_id")                             \
    X(CURR_PROC_MODE, "curr_proc_mode")               \
    X(CURR_PROCS, "curr_procs")                       \
    X(CURR_SHARING_MODE, "curr_sharing_mode")         \
    X(CURR_7460_WKL_PERCENT, "curr_7460_wkl_percent") \
    X(CURR_MEM, "curr_mem")                           \
    X(ENTITLED_CYCLES, "entitled_cycles")             \
    X(CAPPED_CYCLES, "capped_cycles")                 \
    X(UNCAPPED_CYCLES, "uncapped_cycles")             \
    X(MEM_MODE, "mem_mode")

#define ZEM_QYUSAGE_CONFIG(X)                         \
    X(TYPE_MODEL_SERIAL_NUM, "type_model_serial_num") \
    X(NAME, "name")                                   \
    X(SAMPLE_RATE, "sample_rate")

class ZEM_EXPORT zemQyusageCmdCaller : public zemCommandCaller {
public:
    ZEM_ATTRIBUTE_TABLE(ManagedSystemAttribute, ZEM_QYUSAGE_SYS);
    ZEM_ATTRIBUTE_TABLE(PartitionAttribute, ZEM_QYUSAGE_LPAR);
    ZEM_ATTRIBUTE_TABLE(ConfigurationAttribute, ZEM_QYUSAGE_CONFIG);

    /// @param auth,locale  as for zemCommandCaller
    zemQyusageCmdCaller(const char* auth, const char* locale);

    /// How often each host is sampled. Arguments here and below:
    /// @param paramAttr  wanted attributes, ending in ATTR_END; null: all
    /// @param managedSystem  key or name of a host; null: all hosts. An empty text is passed on.
    /// @param additionalOption  further options of the tool as they are; null: none
    zemRecordSetsType getConfigurationSettings(int* paramAttr, const char* managedSystem,
                                               const char* additionalOption);

    /// The samples of partitions, or of hosts, within a range of time.
    /// @param filter  added to the filter for samples, with its own quoting; null or empty: none
    /// @param pStartDateTime,pEndDateTime  first and last hour; null: no limit
    zemRecordSetsType getPartitionsMetrics(int* paramAttr, const char* managedSystem,
                                           const char* filter, tm* pStartDateTime, tm* pEndDateTime,
                                           const char* additionalOption);
    zemRecordSetsType getManagedSystemMetrics(int* paramAttr, const char* managedSystem,
                                              tm* pStartDateTime, tm* pEndDateTime,
                                              const char* additionalOption);

    /// The same in seconds since the epoch, of which the tool reads the hour in UTC.
    /// @param startDateTime,endDateTime  -1: no limit
    zemRecordSetsType getPartitionsMetrics(int* paramAttr, const char* managedSystem,
                                           const char* filter, int startDateTime, int endDateTime,
                                           const char* additionalOption);
    zemRecordSetsType getManagedSystemMetrics(int* paramAttr, const char* managedSystem,
                                              int startDateTime, int endDateTime,
                                              const char* additionalOption);

private:
    static std::string formatDataTimeFilter(const tm* pStart, const tm* pEnd);
};

#undef ZEM_QYUSAGE_SYS
#undef ZEM_QYUSAGE_LPAR
#undef ZEM_QYUSAGE_CONFIG

#endif
