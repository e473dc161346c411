/// The indication interface of a provider, in the form this system uses.
///
/// The class of the CMPI binding wraps the filter; this one hands the raw CMPISelectExp through,
/// so that a provider can give it back to the broker as it came. zemBaseProvider derives from it,
/// and the function table that zemBaseProviderManager hands to the CIM server points to the drive
/// functions below. The class has no state; operations run on whatever thread the server uses.
#ifndef ZEM_CMPI_INDICATION_MI_EX_H
#define ZEM_CMPI_INDICATION_MI_EX_H

#include "CmpiBaseMI.h"
#include "CmpiBroker.h"
#include "CmpiContext.h"
#include "CmpiObjectPath.h"
#include "CmpiStatus.h"
#include "ZemExport.h"
#include "cmpidt.h"
#include "cmpift.h"

class ZEM_EXPORT zemCmpiIndicationMI : public virtual CmpiBaseMI {
public:
    zemCmpiIndicationMI(const CmpiBroker& mb, const CmpiContext& ctx);

    /// The operations of the interface; every default answers CMPI_RC_ERR_NOT_SUPPORTED.
    /// @param eventType  class name in the filter's FROM clause
    /// @param path       class to be watched
    virtual CmpiStatus authorizeFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                       const char* eventType, const CmpiObjectPath& path,
                                       const char* owner);
    virtual CmpiStatus mustPoll(const CmpiContext& ctx, const CMPISelectExp* filter,
                                const char* eventType, const CmpiObjectPath& path);
    virtual CmpiStatus activateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                      const char* eventType, const CmpiObjectPath& path,
                                      CMPIBoolean firstActivation);
    virtual CmpiStatus deActivateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                        const char* eventType, const CmpiObjectPath& path,
                                        CMPIBoolean lastActivation);
    virtual CmpiStatus enableIndications(const CmpiContext& ctx);
    virtual CmpiStatus disableIndications(const CmpiContext& ctx);

    /// Entries of a CMPIIndicationMIFT. The record's hdl must be the CmpiBaseMI of a provider of
    /// this class. The answer carries the provider's code, returned or thrown as CmpiStatus, and
    /// never its message. Other exceptions pass through.
    static CMPIStatus driveAuthorizeFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                           const CMPISelectExp* filter, const char* eventType,
                                           const CMPIObjectPath* path, const char* owner);
    static CMPIStatus driveMustPoll(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                    const CMPISelectExp* filter, const char* eventType,
                                    const CMPIObjectPath* path);
    /// The entry of CMPI 2.1, whose result is not used.
    static CMPIStatus driveMustPoll(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                    const CMPIResult* result, const CMPISelectExp* filter,
                                    const char* eventType, const CMPIObjectPath* path);
    static CMPIStatus driveActivateFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                          const CMPISelectExp* filter, const char* eventType,
                                          const CMPIObjectPath* path, CMPIBoolean firstActivation);
    static CMPIStatus driveDeActivateFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                            const CMPISelectExp* filter, const char* eventType,
                                            const CMPIObjectPath* path, CMPIBoolean lastActivation);
    static CMPIStatus driveEnableIndications(CMPIIndicationMI* mi, const CMPIContext* ctx);
    static CMPIStatus driveDisableIndications(CMPIIndicationMI* mi, const CMPIContext* ctx);
};

#endif
