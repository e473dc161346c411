/// Numbers and names of the console's events, as providers ask for them by getters: the types of
/// events, the classes of objects that they tell of, the properties of those.
///
/// Each class is its table; zemDnxApiConstants, the keys of reference codes, stands with the
/// management library. Everything is static and safe from any thread.
///
///     manager.registerSubscription(helper, user, zemEventSubscription::getEVENT_MODIFY_OBJECT(),
///                                  zemWrtConstants::getLPAR_CIM_CLASS(), &callBack);
#ifndef WRT_EVENT_HELPER_CONSTANTS_H
#define WRT_EVENT_HELPER_CONSTANTS_H

#include "DNXApiCallerConstants.h"

// Types of events. The negative ones tell of the console itself, whose object type is "null".
#define ZEM_EVENT_TYPES(X)       \
    X(EVENT_LOST_CONNECTION, -1) \
    X(EVENT_RECONNECT, -2)       \
    X(EVENT_ADD_OBJECT, 1)       \
    X(EVENT_DELETE_OBJECT, 2)    \
    X(EVENT_MODIFY_OBJECT, 4)    \
    X(EVENT_LED_VALUE_CHANGE, 8) \
    X(EVENT_BKN_MIG_STATUS, 610) \
    X(EVENT_SE_MSG, 660)         \
    X(EVENT_MODIFY_IP, 661)      \
    X(EVENT_NOT_LWH, 1001)

#define ZEM_WRT_CONSTANTS(X)                                      \
    /* classes of objects */                                      \
    X(CEC_CIM_CLASS, "ORXWRT_ComputerSystem")                     \
    X(LPAR_CIM_CLASS, "ORXWRT_Partition")                         \
    X(PROF_CIM_CLASS, "ORXWRT_LparProfile")                       \
    X(CONSOLE_CIM_CLASS, "ORXWRT_Console")                        \
    X(LostConn_Event, "null")                                     \
    X(ReConnect_Event, "null")                                    \
    /* properties of objects */                                   \
    X(NAME, "Name")                                               \
    X(PARTITION_NAME, "PartitionName")                            \
    X(USER_DEFINED_NAME, "UserDefinedName")                       \
    X(OP_PANEL_VALUE, "OpPanelValue")                             \
    X(PARTITION_STATE, "PartitionState")                          \
    X(HIBERNATION_STATE, "HibernationState")                      \
    X(REMOTERESTART_STATE, "RemoteRestartState")                  \
    X(STATE, "State")                                             \
    X(MIGRATION_STATE, "MigrationState")                          \
    X(OS_TYPE, "OsType")                                          \
    X(ComputerSystemName, "ComputerSystemName")                   \
    X(IPAddress, "IPAddress")                                     \
    X(OldIPAddress, "OldIPAddress")                               \
    /* keys of a migration's hash table */                        \
    X(MIGRATION_SIDE, "MIGRATION_SIDE")                           \
    X(DESP_LPAR_NAME, "DESP_LPAR_NAME")                           \
    X(TOTAL_BYTES, "TOTAL_BYTES")                                 \
    X(BYTES_LEFT, "BYTES_LEFT")                                   \
    X(BYTES_SENT, "BYTES_SENT")                                   \
    X(BYTES_RECEIVED, "BYTES_RECEIVED")                           \
    X(CURRENT_MIGRATION_STATE, "CURRENT_MIGRATION_STATE")         \
    X(MIGRATION_PORT_NUM, "MIGRATION_PORT_NUM")                   \
    /* resources of a partition: at run time, current, pending */ \
    X(RuntimeMem, "RuntimeMem")                                   \
    X(CurAllocMem, "CurAllocMem")                                 \
    X(PendAllocMem, "PendAllocMem")                               \
    X(PendUncappedWeight, "PendUncappedWeight")                   \
    X(CurUncappedWeight, "CurUncappedWeight")                     \
    X(PendSharingMode, "PendSharingMode")                         \
    X(CurSharingMode, "CurSharingMode")                           \
    X(PendAllocProcs, "PendAllocProcs")                           \
    X(CurAllocProcs, "CurAllocProcs")                             \
    X(PendAllocProcUnits, "PendAllocProcUnits")                   \
    X(CurAllocProcUnits, "CurAllocProcUnits")                     \
    X(PendVRMWeight, "PendVRMWeight")                             \
    X(CurrVRMWeight, "CurrVRMWeight")                             \
    X(RuntimeVRMWeight, "RuntimeVRMWeight")                       \
    X(EntUsage, "EntUsage")                                       \
    X(PendEntMem, "PendEntMem")                                   \
    X(CurrEntMem, "CurrEntMem")                                   \
    X(RuntimeEntMem, "RuntimeEntMem")

// Properties of a service event; a problem is known by its event.
#define ZEM_SERVICE_EVENT(X)                          \
    X(EVTYPE_CEC, "CEC")                              \
    X(EVTYPE_LPAR, "LPAR")                            \
    X(INDICATIONTYPE, "IndicationType")               \
    X(EVENTTYPE, "EventType")                         \
    X(SYSTEMNAME, "SystemName")                       \
    X(SEVERITY, "PerceivedSeverity")                  \
    X(EVENTID, "EventID")                             \
    X(DESCRIPTION, "Description")                     \
    X(PMHNUM, "PMHNum")                               \
    X(EVENTTIME, "EventTime")                         \
    X(REFCODE, "RefCode")                             \
    X(FRU, "FRU")                                     \
    X(SUBSYSTEMID, "SubsystemID")                     \
    X(EVENTSEVERITY, "EventSeverity")                 \
    X(PLATFORMLOGID, "PlatformLogID")                 \
    X(REFCODEEXTENSION, "RefcodeExtension")           \
    X(NOTIFICATIONTYPE, "NotificationType")           \
    X(NOTIFICATIONSTATUS, "NotificationStatus")       \
    X(ERR_RESOURCE_NAME, "ErrResourceName")           \
    X(MTYPE, "MachineType")                           \
    X(MMODEL, "MachineModel")                         \
    X(MSERIAL, "MachineSerial")                       \
    X(PARTITION_ID, "PartitionID")                    \
    X(PROBLEM_NUMBER, "EventID")                      \
    X(PRIME_ANALYZE_CONSOLE, "PrimaryAnalyzeConsole") \
    X(IS_NOTIFY_CUSTOMER, "IsNotifyCustomer")         \
    X(IS_CALL_HOME, "isCalledHome")                   \
    X(IS_CHOME_ENABLED, "IsCallHomeEnabled")          \
    X(PROBLEM_DATA_LIST, "ProblemDataSet")            \
    X(FRU_LIST, "FruParts")

#define ZEM_NUMBER_GETTER(name, value) \
    static int get##name() { return value; }
#define ZEM_TEXT_GETTER(name, value) \
    static zemString get##name() { return value; }

class ZEM_EXPORT zemEventSubscription : public zemConstants {
public:
    ZEM_EVENT_TYPES(ZEM_NUMBER_GETTER)
};

class ZEM_EXPORT zemWrtConstants : public zemConstants {
public:
    ZEM_WRT_CONSTANTS(ZEM_TEXT_GETTER)
};

class ZEM_EXPORT zemDnxServiceEvent : public zemConstants {
public:
    ZEM_SERVICE_EVENT(ZEM_TEXT_GETTER)
};

#undef ZEM_EVENT_TYPES
#undef ZEM_WRT_CONSTANTS
#undef ZEM_SERVICE_EVENT
#undef ZEM_NUMBER_GETTER
#undef ZEM_TEXT_GETTER

#endif
