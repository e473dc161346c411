#include "CmpiInstanceMI.h"

#include "CmpiDriver.h"

CmpiInstanceMI::CmpiInstanceMI(const CmpiBroker& mbp, const CmpiContext& ctx)
    : CmpiBaseMI(mbp, ctx) {}

CMPIStatus CmpiInstanceMI::driveEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                                  const CMPIResult* eRslt,
                                                  const CMPIObjectPath* eCop) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::enumInstanceNames, eCtx, eRslt, eCop);
}

CMPIStatus CmpiInstanceMI::driveEnumInstances(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                              const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                              const char** properties) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::enumInstances, eCtx, eRslt, eCop, properties);
}

CMPIStatus CmpiInstanceMI::driveGetInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                            const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                            const char** properties) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::getInstance, eCtx, eRslt, eCop, properties);
}

CMPIStatus CmpiInstanceMI::driveCreateInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                               const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                               const CMPIInstance* eInst) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::createInstance, eCtx, eRslt, eCop, eInst);
}

CMPIStatus CmpiInstanceMI::driveSetInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                            const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                            const CMPIInstance* eInst, const char** properties) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::setInstance, eCtx, eRslt, eCop, eInst,
                             properties);
}

CMPIStatus CmpiInstanceMI::driveDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                               const CMPIResult* eRslt,
                                               const CMPIObjectPath* eCop) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::deleteInstance, eCtx, eRslt, eCop);
}

CMPIStatus CmpiInstanceMI::driveExecQuery(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                          const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                          const char* language, const char* query) {
    return CmpiDriver::drive(mi, &CmpiInstanceMI::execQuery, eCtx, eRslt, eCop, language, query);
}

CmpiStatus CmpiInstanceMI::enumInstanceNames(const CmpiContext&, CmpiResult&,
                                             const CmpiObjectPath&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiInstanceMI::enumInstances(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                         const char**) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiInstanceMI::getInstance(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                       const char**) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiInstanceMI::createInstance(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                          const CmpiInstance&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiInstanceMI::setInstance(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                       const CmpiInstance&, const char**) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiInstanceMI::deleteInstance(const CmpiContext&, CmpiResult&, const CmpiObjectPath&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiInstanceMI::execQuery(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                     const char*, const char*) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}
