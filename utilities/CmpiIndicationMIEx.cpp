#include "CmpiIndicationMIEx.h"

namespace {

// Common body of the drive functions: from the server's record to the provider's virtual call,
// and from its status to a bare code.
template <class Call>
CMPIStatus drive(CMPIIndicationMI* mi, const CMPIContext* rawContext, Call call) {
    try {
        const CmpiContext ctx(const_cast<CMPIContext*>(rawContext));
        auto* base = static_cast<CmpiBaseMI*>(const_cast<void*>(mi->hdl));
        auto* provider = dynamic_cast<zemCmpiIndicationMI*>(base);
        return {call(provider, ctx).rc(), nullptr};
    } catch (const CmpiStatus& status) {
        return {status.rc(), nullptr};
    }
}

CmpiObjectPath wrap(const CMPIObjectPath* path) {
    return CmpiObjectPath(const_cast<CMPIObjectPath*>(path));
}

CmpiStatus notSupported() { return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED); }

}  // namespace

zemCmpiIndicationMI::zemCmpiIndicationMI(const CmpiBroker& mb, const CmpiContext& ctx)
    : CmpiBaseMI(mb, ctx) {}

CmpiStatus zemCmpiIndicationMI::authorizeFilter(const CmpiContext&, const CMPISelectExp*,
                                                const char*, const CmpiObjectPath&, const char*) {
    return notSupported();
}

CmpiStatus zemCmpiIndicationMI::mustPoll(const CmpiContext&, const CMPISelectExp*, const char*,
                                         const CmpiObjectPath&) {
    return notSupported();
}

CmpiStatus zemCmpiIndicationMI::activateFilter(const CmpiContext&, const CMPISelectExp*,
                                               const char*, const CmpiObjectPath&, CMPIBoolean) {
    return notSupported();
}

CmpiStatus zemCmpiIndicationMI::deActivateFilter(const CmpiContext&, const CMPISelectExp*,
                                                 const char*, const CmpiObjectPath&, CMPIBoolean) {
    return notSupported();
}

CmpiStatus zemCmpiIndicationMI::enableIndications(const CmpiContext&) { return notSupported(); }

CmpiStatus zemCmpiIndicationMI::disableIndications(const CmpiContext&) { return notSupported(); }

CMPIStatus zemCmpiIndicationMI::driveAuthorizeFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                                     const CMPISelectExp* filter,
                                                     const char* eventType,
                                                     const CMPIObjectPath* path,
                                                     const char* owner) {
    return drive(mi, ctx, [&](zemCmpiIndicationMI* provider, const CmpiContext& context) {
        return provider->authorizeFilter(context, filter, eventType, wrap(path), owner);
    });
}

CMPIStatus zemCmpiIndicationMI::driveMustPoll(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                              const CMPISelectExp* filter, const char* eventType,
                                              const CMPIObjectPath* path) {
    return drive(mi, ctx, [&](zemCmpiIndicationMI* provider, const CmpiContext& context) {
        return provider->mustPoll(context, filter, eventType, wrap(path));
    });
}

CMPIStatus zemCmpiIndicationMI::driveMustPoll(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                              const CMPIResult*, const CMPISelectExp* filter,
                                              const char* eventType, const CMPIObjectPath* path) {
    return driveMustPoll(mi, ctx, filter, eventType, path);
}

CMPIStatus zemCmpiIndicationMI::driveActivateFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                                    const CMPISelectExp* filter,
                                                    const char* eventType,
                                                    const CMPIObjectPath* path,
                                                    CMPIBoolean firstActivation) {
    return drive(mi, ctx, [&](zemCmpiIndicationMI* provider, const CmpiContext& context) {
        return provider->activateFilter(context, filter, eventType, wrap(path), firstActivation);
    });
}

CMPIStatus zemCmpiIndicationMI::driveDeActivateFilter(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                                      const CMPISelectExp* filter,
                                                      const char* eventType,
                                                      const CMPIObjectPath* path,
                                                      CMPIBoolean lastActivation) {
    return drive(mi, ctx, [&](zemCmpiIndicationMI* provider, const CmpiContext& context) {
        return provider->deActivateFilter(context, filter, eventType, wrap(path), lastActivation);
    });
}

CMPIStatus zemCmpiIndicationMI::driveEnableIndications(CMPIIndicationMI* mi,
                                                       const CMPIContext* ctx) {
    return drive(mi, ctx, [](zemCmpiIndicationMI* provider, const CmpiContext& context) {
        return provider->enableIndications(context);
    });
}

CMPIStatus zemCmpiIndicationMI::driveDisableIndications(CMPIIndicationMI* mi,
                                                        const CMPIContext* ctx) {
    return drive(mi, ctx, [](zemCmpiIndicationMI* provider, const CmpiContext& context) {
        return provider->disableIndications(context);
    });
}
