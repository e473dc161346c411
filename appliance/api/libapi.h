/**
 * The appliance's management library: reads hosts, partitions, profiles and their resources as
 * blocks of name and value pairs. It changes nothing; changes are made with the tools.
 *
 * A call returns a result, an array of records: the first is the header with the return code, the
 * objects are the records 1 to objCount - 1. The caller owns the result and gives it back with one
 * freeApi(). Null is an internal failure, such as a state that cannot be read.
 *
 *     apiProp* hosts = getAllCecs(user, 1);
 *     if (hosts != NULL && getReturnCode(hosts) == API_SUCCESS)
 *         for (int i = 1; i < hosts->objCount; ++i) puts(getProperty(&hosts[i],
 * "UserDefinedName")); freeApi(hosts);
 *
 * Every call reads one picture of the state. Any number of threads may call at once; a result
 * belongs to the thread that uses it.
 *
 * Arguments: user is who asks; mtms is a host's key "<type_model>*<serial_num>"; lparKey is
 * "<lparId>*<mtms>"; level is 1 for identity and state, 2 for all.
 */
#ifndef LIBAPI_H
#define LIBAPI_H

#ifdef __cplusplus
extern "C" {
#endif

enum { API_MAX_PROPERTIES = 1000, API_TEXT_SIZE = 400 };

/**
 * One record. A value that is longer than its entry runs on through the entries behind it, which
 * have empty names and count in propertyCount; getProperty() gives all of it.
 *
 * Records look large and are not: of the tables only what is filled takes memory.
 */
typedef struct apiProp {
    int classType;     /**< kind of object */
    int propertyCount; /**< entries in use */
    int objCount;      /**< of the header: records in the result, the header among them */
    int rc;            /**< of the header: one of the codes below */
    char name[API_MAX_PROPERTIES][API_TEXT_SIZE];
    char value[API_MAX_PROPERTIES][API_TEXT_SIZE];
} apiProp;

/** Return codes. */
enum {
    API_FAILED = -1,       /**< cannot be done now, or an object is too large for a record */
    API_SUCCESS = 0,       /**< also when there is no object, unless one was asked for by name */
    API_INVALID_INPUT = 1, /**< a null or malformed argument, or an unknown level */
    API_INVALID_STATE = 2,
    API_UNKNOWN_SYSTEM = 3, /**< there is no host with this key */
    API_INVALID_BKN = 4,
    API_NOT_SUPPORTED = 5,
    API_ACCESS_DENIED = 6,
    API_NOT_FOUND = 7 /**< the host has no such partition, or the partition no such profile */
};

/* Hosts. */
apiProp* getCecObj(const char* user, const char* mtms, int level);
apiProp* getAllCecs(const char* user, int level);

/* Partitions: one, of all hosts, of one host. */
apiProp* getLparObj(const char* user, const char* lparKey, int level);
apiProp* getAllLpars(const char* user, int level);
apiProp* getAllLparsFromCec(const char* user, const char* mtms, int level);

/* Profiles: one by its name, of a partition, of a host, of all hosts. */
apiProp* getLparProfile(const char* user, const char* lparKey, const char* profile, int level);
apiProp* getAllLparProfilesFromLpar(const char* user, const char* lparKey, int level);
apiProp* getAllLparProfilesFromCec(const char* user, const char* mtms, int level);
apiProp* getAllLparProfiles(const char* user, int level);

/* Virtual adapters and I/O slots: of a partition, of a host, of all hosts. */
apiProp* getLparVirtualSerial(const char* user, const char* lparKey, int level);
apiProp* getLparVirtualScsi(const char* user, const char* lparKey, int level);
apiProp* getLparVirtualEthernet(const char* user, const char* lparKey, int level);
apiProp* getLparIoSlots(const char* user, const char* lparKey, int level);
apiProp* getVirtualSerial(const char* user, const char* mtms, int level);
apiProp* getVirtualScsi(const char* user, const char* mtms, int level);
apiProp* getVirtualEthernet(const char* user, const char* mtms, int level);
apiProp* getIoSlots(const char* user, const char* mtms, int level);
apiProp* getAllLparVirtualSerial(const char* user, int level);
apiProp* getAllLparVirtualScsi(const char* user, int level);
apiProp* getAllLparVirtualEthernet(const char* user, int level);
apiProp* getAllIoSlots(const char* user, int level);

/* Memory and processors that a host has, and its pools: of a host, of all hosts. */
apiProp* getCecMemoryCfg(const char* user, const char* mtms, int level);
apiProp* getCecProcessorCfg(const char* user, const char* mtms, int level);
apiProp* getCecMemoryPoolCfg(const char* user, const char* mtms, int level);
apiProp* getCecProcessorPoolCfg(const char* user, const char* mtms, int level);
apiProp* getAllCecMemoryCfg(const char* user, int level);
apiProp* getAllCecProcessorCfg(const char* user, int level);
apiProp* getAllCecMemoryPoolCfgs(const char* user, int level);
apiProp* getAllCecProcessorPoolCfg(const char* user, int level);

/* Memory and processors that partitions have: of a partition, of a host, of all hosts. */
apiProp* getLparMemoryCfg(const char* user, const char* lparKey, int level);
apiProp* getLparProcessorCfg(const char* user, const char* lparKey, int level);
apiProp* getAllLparMemoryCfg(const char* user, const char* mtms, int level);
apiProp* getAllLparProcessorCfg(const char* user, const char* mtms, int level);
apiProp* getAllLparMemoryCfgs(const char* user, int level);
apiProp* getAllLparProcessorCfgs(const char* user, int level);

/** The value under key, within the record; null when there is none. Keys are case-sensitive. */
char* getProperty(apiProp* record, const char* key);

/** The header's return code; API_FAILED for null. */
int getReturnCode(apiProp* result);

/** Gives back a whole result, by its header. Null is allowed. */
void freeApi(apiProp* result);

#ifdef __cplusplus
}
#endif

#endif
