// Base of providers that serve single properties. Both operations answer CMPI_RC_ERR_NOT_SUPPORTED
// until a provider overrides them. The drive functions are as in CmpiInstanceMI.h.
#ifndef _CmpiPropertyMI_h_
#define _CmpiPropertyMI_h_

#include "CmpiArgs.h"
#include "CmpiBaseMI.h"
#include "CmpiContext.h"
#include "CmpiObjectPath.h"
#include "CmpiResult.h"
#include "CmpiStatus.h"

class CMPI_EXPORT CmpiPropertyMI : virtual public CmpiBaseMI {
public:
    CmpiPropertyMI(const CmpiBroker& mbp, const CmpiContext& ctx);

    static CMPIStatus driveSetProperty(CMPIPropertyMI* mi, const CMPIContext* eCtx,
                                       const CMPIResult* eRslt, const CMPIObjectPath* eOp,
                                       const char* name, CMPIData data);
    static CMPIStatus driveGetProperty(CMPIPropertyMI* mi, const CMPIContext* eCtx,
                                       const CMPIResult* eRslt, const CMPIObjectPath* eOp,
                                       const char* name);

    virtual CmpiStatus setProperty(const CmpiContext& ctx, CmpiResult& rslt,
                                   const CmpiObjectPath& op, const char* name,
                                   const CmpiData& data);
    virtual CmpiStatus getProperty(const CmpiContext& ctx, CmpiResult& rslt,
                                   const CmpiObjectPath& op, const char* name);
};

#endif
