#include "CmpiMethodMI.h"

#include "CmpiDriver.h"

CmpiMethodMI::CmpiMethodMI(const CmpiBroker& mbp, const CmpiContext& ctx) : CmpiBaseMI(mbp, ctx) {}

CMPIStatus CmpiMethodMI::driveInvokeMethod(CMPIMethodMI* mi, const CMPIContext* eCtx,
                                           const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                           const char* methodName, const CMPIArgs* eIn,
                                           CMPIArgs* eOut) {
    return CmpiDriver::drive(mi, &CmpiMethodMI::invokeMethod, eCtx, eRslt, eCop, methodName, eIn,
                             eOut);
}

CmpiStatus CmpiMethodMI::invokeMethod(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                      const char*, const CmpiArgs&, CmpiArgs&) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}
