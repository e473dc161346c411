// Indication operations of zemBaseProvider.
#include "BaseProvider.h"
#include "BaseProviderFrame.h"

CmpiStatus zemBaseProvider::enableIndications(const CmpiContext& ctx) {
    return zemOperationFrame(*this, zemOperation::EnableIndications, ctx).run([&] {
        performEnableIndications();
    });
}

CmpiStatus zemBaseProvider::disableIndications(const CmpiContext& ctx) {
    return zemOperationFrame(*this, zemOperation::DisableIndications, ctx).run([&] {
        performDisableIndications();
    });
}

CmpiStatus zemBaseProvider::mustPoll(const CmpiContext& ctx, const CMPISelectExp* filter,
                                     const char* eventType, const CmpiObjectPath& path) {
    zemOperationFrame frame(*this, zemOperation::MustPoll, ctx, &path);
    frame.setEventType(eventType);
    return frame.run([&] { performMustPoll(ctx, filter, frame.className(), path); });
}

CmpiStatus zemBaseProvider::activateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                           const char* eventType, const CmpiObjectPath& path,
                                           CMPIBoolean firstActivation) {
    zemOperationFrame frame(*this, zemOperation::ActivateFilter, ctx, &path);
    frame.setEventType(eventType);
    frame.setFilterLabel("Filter___activate");
    return frame.run(
        [&] { performActivateFilter(ctx, filter, frame.className(), path, firstActivation); });
}

CmpiStatus zemBaseProvider::authorizeFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                            const char* eventType, const CmpiObjectPath& path,
                                            const char* owner) {
    zemOperationFrame frame(*this, zemOperation::AuthorizeFilter, ctx, &path);
    frame.setEventType(eventType);
    return frame.run([&] { performAuthorizeFilter(ctx, filter, frame.className(), path, owner); });
}

CmpiStatus zemBaseProvider::deActivateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                             const char* eventType, const CmpiObjectPath& path,
                                             CMPIBoolean lastActivation) {
    zemOperationFrame frame(*this, zemOperation::DeActivateFilter, ctx, &path);
    frame.setEventType(eventType);
    frame.setFilterLabel("deActivateFilter");
    return frame.run(
        [&] { performDeActivateFilter(ctx, filter, frame.className(), path, lastActivation); });
}

void zemBaseProvider::performEnableIndications() { traceDefault(__func__); }

void zemBaseProvider::performDisableIndications() { traceDefault(__func__); }

// The default names activateFilter, not mustPoll: the text is the same to a client that only
// wants to know that the provider takes no filters.
CmpiStatus zemBaseProvider::performMustPoll(const CmpiContext&, const CMPISelectExp*,
                                            const char* className, const CmpiObjectPath&) {
    refuse(__func__, "activateFilter", className);
}

void zemBaseProvider::performActivateFilter(const CmpiContext&, const CMPISelectExp*,
                                            const char* className, const CmpiObjectPath&,
                                            CMPIBoolean) {
    refuse(__func__, "activateFilter", className);
}

void zemBaseProvider::performAuthorizeFilter(const CmpiContext&, const CMPISelectExp*, const char*,
                                             const CmpiObjectPath&, const char*) {
    traceDefault(__func__);
}

void zemBaseProvider::performDeActivateFilter(const CmpiContext&, const CMPISelectExp*,
                                              const char* className, const CmpiObjectPath&,
                                              CMPIBoolean) {
    refuse(__func__, "deActivateFilter", className);
}
