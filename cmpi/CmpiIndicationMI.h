// Base of providers that send indications. Every operation answers CMPI_RC_ERR_NOT_SUPPORTED until
// a provider overrides it. The drive functions are as in CmpiInstanceMI.h.
#ifndef _CmpiIndicationMI_h_
#define _CmpiIndicationMI_h_

#include "CmpiBaseMI.h"
#include "CmpiContext.h"
#include "CmpiObjectPath.h"
#include "CmpiResult.h"
#include "CmpiSelectExp.h"
#include "CmpiStatus.h"

class CMPI_EXPORT CmpiIndicationMI : virtual public CmpiBaseMI {
public:
    CmpiIndicationMI(const CmpiBroker& mbp, const CmpiContext& ctx);

    static CMPIStatus driveAuthorizeFilter(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                           const CMPISelectExp* se, const char* ns,
                                           const CMPIObjectPath* op, const char* user);
    static CMPIStatus driveMustPoll(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                    const CMPISelectExp* se, const char* ns,
                                    const CMPIObjectPath* op);
    static CMPIStatus driveActivateFilter(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                          const CMPISelectExp* se, const char* clsName,
                                          const CMPIObjectPath* op, CMPIBoolean first);
    static CMPIStatus driveDeActivateFilter(CMPIIndicationMI* mi, const CMPIContext* eCtx,
                                            const CMPISelectExp* se, const char* clsName,
                                            const CMPIObjectPath* op, CMPIBoolean last);
    static CMPIStatus driveEnableIndications(CMPIIndicationMI* mi, const CMPIContext* eCtx);
    static CMPIStatus driveDisableIndications(CMPIIndicationMI* mi, const CMPIContext* eCtx);

    /// A filter is authorized for a user, then activated; @p first and @p last tell the first and
    /// the last filter of a class.
    virtual CmpiStatus authorizeFilter(const CmpiContext& ctx, const CmpiSelectExp& se,
                                       const char* ns, const CmpiObjectPath& op, const char* user);
    virtual CmpiStatus mustPoll(const CmpiContext& ctx, const CmpiSelectExp& se, const char* ns,
                                const CmpiObjectPath& op);
    virtual CmpiStatus activateFilter(const CmpiContext& ctx, const CmpiSelectExp& se,
                                      const char* ns, const CmpiObjectPath& op, CmpiBoolean first);
    virtual CmpiStatus deActivateFilter(const CmpiContext& ctx, const CmpiSelectExp& se,
                                        const char* ns, const CmpiObjectPath& op, CmpiBoolean last);
    /// The server is ready for indications, or no longer.
    virtual CmpiStatus enableIndications(const CmpiContext& ctx);
    virtual CmpiStatus disableIndications(const CmpiContext& ctx);
};

#endif
