#include "CmpiIndicationMI.h"

#include "CmpiDriver.h"

CmpiIndicationMI::CmpiIndicationMI(const CmpiBroker& mbp, const CmpiContext& ctx)
    : CmpiBaseMI(mbp, ctx) {}

CMPIStatus CmpiIndicationMI::driveAuthorizeFilter(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                                  const CMPISelectExp* se, const char* ns,
                                                  const CMPIObjectPath* op, const char* user) {
    return CmpiDriver::drive(mi, &CmpiIndicationMI::authorizeFilter, eCtx, se, ns, op, user);
}

CMPIStatus CmpiIndicationMI::driveMustPoll(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                           const CMPISelectExp* se, const char* ns,
                                           const CMPIObjectPath* op) {
    return CmpiDriver::drive(mi, &CmpiIndicationMI::mustPoll, eCtx, se, ns, op);
}

CMPIStatus CmpiIndicationMI::driveActivateFilter(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                                 const CMPISelectExp* se, const char* clsName,
                                                 const CMPIObjectPath* op, CMPIBoolean first) {
    return CmpiDriver::drive(mi, &CmpiIndicationMI::activateFilter, eCtx, se, clsName, op, first);
}

CMPIStatus CmpiIndicationMI::driveDeActivateFilter(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                                   const CMPISelectExp* se, const char* clsName,
                                                   const CMPIObjectPath* op, CMPIBoolean last) {
    return CmpiDriver::drive(mi, &CmpiIndicationMI::deActivateFilter, eCtx, se, clsName, op, last);
}

CMPIStatus CmpiIndicationMI::driveEnableIndications(CMPIIndicationMI* mi, const CMPIContext* eCtx) {
    return CmpiDriver::drive(mi, &CmpiIndicationMI::enableIndications, eCtx);
}

CMPIStatus CmpiIndicationMI::driveDisableIndications(CMPIIndicationMI* mi,
                                                     const CMPIContext* eCtx) {
    return CmpiDriver::drive(mi, &CmpiIndicationMI::disableIndications, eCtx);
}

CmpiStatus CmpiIndicationMI::authorizeFilter(const CmpiContext&, const CmpiSelectExp&, const char*,
                                             const CmpiObjectPath&, const char*) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiIndicationMI::mustPoll(const CmpiContext&, const CmpiSelectExp&, const char*,
                                      const CmpiObjectPath&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiIndicationMI::activateFilter(const CmpiContext&, const CmpiSelectExp&, const char*,
                                            const CmpiObjectPath&, CmpiBoolean) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiIndicationMI::deActivateFilter(const CmpiContext&, const CmpiSelectExp&, const char*,
                                              const CmpiObjectPath&, CmpiBoolean) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiIndicationMI::enableIndications(const CmpiContext&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiIndicationMI::disableIndications(const CmpiContext&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}
