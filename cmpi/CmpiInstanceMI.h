// Base of providers that serve instances. Every operation answers CMPI_RC_ERR_NOT_SUPPORTED until a
// provider overrides it.
//
// The drive functions are the entries of the function table: each wraps the arguments, calls the
// operation, and turns every exception into a status, CmpiStatus into itself and any other into
// CMPI_RC_ERR_FAILED.
#ifndef _CmpiInstanceMI_h_
#define _CmpiInstanceMI_h_

#include "CmpiBaseMI.h"
#include "CmpiContext.h"
#include "CmpiData.h"
#include "CmpiInstance.h"
#include "CmpiObjectPath.h"
#include "CmpiResult.h"
#include "CmpiStatus.h"
#include "CmpiString.h"

class CMPI_EXPORT CmpiInstanceMI : virtual public CmpiBaseMI {
public:
    CmpiInstanceMI(const CmpiBroker& mbp, const CmpiContext& ctx);

    static CMPIStatus driveEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                             const CMPIResult* eRslt, const CMPIObjectPath* eCop);
    static CMPIStatus driveEnumInstances(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                         const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                         const char** properties);
    static CMPIStatus driveGetInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                       const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                       const char** properties);
    static CMPIStatus driveCreateInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                          const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                          const CMPIInstance* eInst);
    static CMPIStatus driveSetInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                       const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                       const CMPIInstance* eInst, const char** properties);
    static CMPIStatus driveDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                          const CMPIResult* eRslt, const CMPIObjectPath* eCop);
    static CMPIStatus driveExecQuery(CMPIInstanceMI* mi, const CMPIContext* eCtx,
                                     const CMPIResult* eRslt, const CMPIObjectPath* eCop,
                                     const char* language, const char* query);

    /// A null list of properties asks for all of them; a list ends with a null.
    virtual CmpiStatus enumInstanceNames(const CmpiContext& ctx, CmpiResult& rslt,
                                         const CmpiObjectPath& cop);
    virtual CmpiStatus enumInstances(const CmpiContext& ctx, CmpiResult& rslt,
                                     const CmpiObjectPath& cop, const char** properties);
    virtual CmpiStatus getInstance(const CmpiContext& ctx, CmpiResult& rslt,
                                   const CmpiObjectPath& cop, const char** properties);
    virtual CmpiStatus createInstance(const CmpiContext& ctx, CmpiResult& rslt,
                                      const CmpiObjectPath& cop, const CmpiInstance& inst);
    virtual CmpiStatus setInstance(const CmpiContext& ctx, CmpiResult& rslt,
                                   const CmpiObjectPath& cop, const CmpiInstance& inst,
                                   const char** properties);
    virtual CmpiStatus deleteInstance(const CmpiContext& ctx, CmpiResult& rslt,
                                      const CmpiObjectPath& cop);
    /// The two texts come in the order in which the server passes them.
    virtual CmpiStatus execQuery(const CmpiContext& ctx, CmpiResult& rslt,
                                 const CmpiObjectPath& cop, const char* language,
                                 const char* query);
};

#endif
