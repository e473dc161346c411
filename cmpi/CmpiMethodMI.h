// Base of providers that serve methods. The operation answers CMPI_RC_ERR_NOT_SUPPORTED until a
// provider overrides it. The drive function is as in CmpiInstanceMI.h.
#ifndef _CmpiMethodMI_h_
#define _CmpiMethodMI_h_

#include "CmpiArgs.h"
#include "CmpiBaseMI.h"
#include "CmpiBroker.h"
#include "CmpiContext.h"
#include "CmpiObjectPath.h"
#include "CmpiResult.h"
#include "CmpiStatus.h"

class CMPI_EXPORT CmpiMethodMI : virtual public CmpiBaseMI {
public:
    CmpiMethodMI(const CmpiBroker& mbp, const CmpiContext& ctx);

    static CMPIStatus driveInvokeMethod(CMPIMethodMI* mi, const CMPIContext* eCtx,
                                        const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                        const char* methodName, const CMPIArgs* eIn,
                                        CMPIArgs* eOut);

    /// The return value goes to @p rslt, output arguments to @p out.
    virtual CmpiStatus invokeMethod(const CmpiContext& ctx, CmpiResult& rslt,
                                    const CmpiObjectPath& ref, const char* methodName,
                                    const CmpiArgs& in, CmpiArgs& out);
};

#endif
