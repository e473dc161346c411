#include "CmpiPropertyMI.h"

#include "CmpiDriver.h"

CmpiPropertyMI::CmpiPropertyMI(const CmpiBroker& mbp, const CmpiContext& ctx)
    : CmpiBaseMI(mbp, ctx) {}

CMPIStatus CmpiPropertyMI::driveSetProperty(CMPIPropertyMI* mi, const CMPIContext* eCtx,
                                            const CMPIResult* eRslt, const CMPIObjectPath* eOp,
                                            const char* name, CMPIData data) {
    return CmpiDriver::drive(mi, &CmpiPropertyMI::setProperty, eCtx, eRslt, eOp, name, data);
}

CMPIStatus CmpiPropertyMI::driveGetProperty(CMPIPropertyMI* mi, const CMPIContext* eCtx,
                                            const CMPIResult* eRslt, const CMPIObjectPath* eOp,
                                            const char* name) {
    return CmpiDriver::drive(mi, &CmpiPropertyMI::getProperty, eCtx, eRslt, eOp, name);
}

CmpiStatus CmpiPropertyMI::setProperty(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                       const char*, const CmpiData&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiPropertyMI::getProperty(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                       const char*) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}
