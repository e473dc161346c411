/// Stubs that make a class served elsewhere look like an instance provider of this process.
///
/// The bases of BaseZemMultiNtoNAssociationProvider.h take handles of instance providers. Where
/// one of their classes is served by another provider of the CIM server, often a Java one, a stub
/// takes its place: it answers by asking the broker.
///
///     zemComputerSystemProviderStub hosts(mb, ctx);
///     hosts.enumInstanceNames(ctx, cop, paths, cop);
///
/// What the broker refuses passes through as CmpiStatus.
///
/// Threads. One lock is common to all stubs and held during a call to the broker: at most one
/// forwarded call runs at a time. The families of AssociationProvider.h, NtoNAssociationProvider.h
/// and MultiNtoNAssociationProvider.h, too, hold a lock while they ask the server. Two threads that
/// take the two locks in either order wait for each other for ever; so a class that a stub
/// forwards must not be an association of such a family, unless no class that this association
/// joins comes, in the end, out of a stub. Associations of the families that take stubs are no such
/// danger: they hold no lock while they ask a handle.
#ifndef JMPI_PROVIDER_INTERFACE_STUB_H
#define JMPI_PROVIDER_INTERFACE_STUB_H

#include "BaseZemInstanceProvider.h"
#include "Synchronizer.h"

class ZEM_EXPORT zemJMPIInstanceProviderBrokerInterface : public zemBaseZemInstanceProvider {
public:
    zemJMPIInstanceProviderBrokerInterface(const CmpiBroker& mb, const CmpiContext& ctx,
                                           const zemString& providerName);

    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;

    /// Whether the stub forwards a class; the default forwards none.
    CMPIBoolean isValidInstanceClass(const char* name) override;

    /// Returns 0, with the broker's instance in @p out.
    int getInstance(const CmpiContext& ctx, const CmpiObjectPath& cop, const char** properties,
                    CmpiInstance& out) override;

    /// Every path gets namespace and host of @p cop.
    void enumInstanceNames(const CmpiContext& ctx, const CmpiObjectPath& cop,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& origCop) override;
    void enumInstances(const CmpiContext& ctx, const CmpiObjectPath& cop, const char** properties,
                       zemDynamicArray<CmpiInstance>& out, const CmpiObjectPath& origCop) override;

    /// The lock of all stubs.
    virtual zemSynchronizerContext& getSynchronizerContext();
};

// One stub: its class and the name of its provider.
#define ZEM_PROVIDER_STUB(NAME, PROVIDER, CLASS)                                                \
    class ZEM_EXPORT NAME : public zemJMPIInstanceProviderBrokerInterface {                     \
    public:                                                                                     \
        NAME(const CmpiBroker& mb, const CmpiContext& ctx)                                      \
            : CmpiBaseMI(mb, ctx), zemJMPIInstanceProviderBrokerInterface(mb, ctx, PROVIDER) {} \
        CMPIBoolean isValidInstanceClass(const char* name) override {                           \
            return compareClassNames(name, CLASS);                                              \
        }                                                                                       \
    }

// clang-format off
ZEM_PROVIDER_STUB(zemComputerSystemProviderStub, "ORXC_CEC_CSProvider", "ORXC_CEC_CS");
ZEM_PROVIDER_STUB(zemVirtualSystemProviderStub, "ORXC_LPAR_CSProvider", "ORXC_LPAR_CS");
ZEM_PROVIDER_STUB(zemDNXProviderStub, "ORXC_DNXProvider", "ORXC_DNX");
ZEM_PROVIDER_STUB(zemLWHProviderStub, "ORXC_LWHProvider", "ORXC_LWH");
ZEM_PROVIDER_STUB(zemLANEndPointProviderStub, "ORXC_LANEndPointProvider", "ORXC_LANEndpoint");
ZEM_PROVIDER_STUB(zemMemoryProviderStub, "ORX_MemoryProvider", "ORX_Memory");
ZEM_PROVIDER_STUB(zemSerialControllerProviderStub, "ORXC_SerialControllerProvider", "ORXC_SerialController");
ZEM_PROVIDER_STUB(zemAlarmDeviceProviderStub, "ORX_AlarmDeviceProvider", "ORX_AlarmDevice");
ZEM_PROVIDER_STUB(zemPassThruServiceProviderStub, "ORXCC_PassThruServiceProvider", "ORXCC_PassThruService");
ZEM_PROVIDER_STUB(zemMAPAdminDomainProviderStub, "ORX_MAPAdminDomainProvider", "ORX_MAPAdminDomain");
ZEM_PROVIDER_STUB(zemPhysicalPackageProviderStub, "ORX_PhysicalPackageProvider", "ORX_PhysicalPackage");
ZEM_PROVIDER_STUB(zemPowerManagementCapabilitiesProviderStub, "ORX_PowerManagementCapabilitiesProvider", "ORX_PowerManagementCapabilities");
ZEM_PROVIDER_STUB(zemPowerManagementServiceProviderStub, "ORXC_PowerManagementServiceProvider", "ORXC_PowerManagementService");
// clang-format on

#undef ZEM_PROVIDER_STUB

#endif
