#include "JMPIProviderInterfaceStub.h"

#include <memory>
#include <utility>

#include "AssociationSupport.h"

zemJMPIInstanceProviderBrokerInterface::zemJMPIInstanceProviderBrokerInterface(
    const CmpiBroker& mb, const CmpiContext& ctx, const zemString& providerName)
    : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, providerName) {}

zemSynchronizerContext& zemJMPIInstanceProviderBrokerInterface::getSynchronizerContext() {
    static zemSynchronizerContext context;
    return context;
}

CMPIBoolean zemJMPIInstanceProviderBrokerInterface::isValidInstanceClass(const char*) {
    return false;
}

// The marks tell the three calls apart in the timing log.

int zemJMPIInstanceProviderBrokerInterface::getInstance(const CmpiContext& ctx,
                                                        const CmpiObjectPath& cop,
                                                        const char** properties,
                                                        CmpiInstance& out) {
    const zemString className = zemClassOf(cop);
    const zemSynchronizer hold(getSynchronizerContext());
    const zemBrokerTiming timing("<gi>", className);
    out = m_broker.getInstance(ctx, cop, properties);
    return 0;
}

void zemJMPIInstanceProviderBrokerInterface::enumInstanceNames(const CmpiContext& ctx,
                                                               const CmpiObjectPath& cop,
                                                               zemDynamicArray<CmpiObjectPath>& out,
                                                               const CmpiObjectPath&) {
    const zemString className = zemClassOf(cop);
    const zemSynchronizer hold(getSynchronizerContext());
    const zemBrokerTiming timing("<ni>", className);
    const zemString nameSpace = zemTextOf(cop.getNameSpace());
    const zemString host = zemTextOf(cop.getHostname());
    for (CmpiEnumeration names = m_broker.enumInstanceNames(ctx, cop); names.hasNext();) {
        auto path = std::make_unique<CmpiObjectPath>(zemNextPath(names));
        path->setNameSpace(static_cast<const char*>(nameSpace));
        path->setHostname(static_cast<const char*>(host));
        zemAppend(out, std::move(path));
    }
}

void zemJMPIInstanceProviderBrokerInterface::enumInstances(const CmpiContext& ctx,
                                                           const CmpiObjectPath& cop,
                                                           const char** properties,
                                                           zemDynamicArray<CmpiInstance>& out,
                                                           const CmpiObjectPath&) {
    const zemString className = zemClassOf(cop);
    const zemSynchronizer hold(getSynchronizerContext());
    const zemBrokerTiming timing("<ei>", className);
    CmpiEnumeration instances = m_broker.enumInstances(ctx, cop, properties);
    while (instances.hasNext()) {
        zemAppend(out, std::make_unique<CmpiInstance>(zemNextInstance(instances)));
    }
}
