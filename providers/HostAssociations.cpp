// Associations of hosts, partitions and connections: one on each family that the library has.
//
// All of them ask the same question, whether two objects belong to one host, and none of them
// needs the tools for it: the host's Name is part of every key.
#include <cstring>
#include <string>

#include "AssociationProvider.h"
#include "BaseZemMultiNtoNAssociationProvider.h"
#include "ConnectionProvider.h"
#include "DataTypeConvertUtils.h"
#include "JMPIProviderInterfaceStub.h"
#include "MultiNtoNAssociationProvider.h"
#include "NtoNAssociationProvider.h"
#include "OneAssociation.h"
#include "ProviderFactories.h"

namespace {

constexpr const char kHost[] = "ORXC_CEC_CS";
constexpr const char kPartition[] = "ORXC_LPAR_CS";
constexpr const char kConnection[] = "ORXC_HostConnection";
constexpr const char kService[] = "CIM_Service";
constexpr const char kManagementService[] = "ORXC_VirtualSystemManagementService";

constexpr const char kHostedPartition[] = "ORXC_HostedPartition";
constexpr const char kHostedService[] = "ORXC_HostedService";
constexpr const char kConnectedHost[] = "ORXC_ConnectedHost";
constexpr const char kHostComponent[] = "ORXC_HostComponent";
constexpr const char kReachedHost[] = "ORXC_ReachedHost";
constexpr const char kPartitionConnection[] = "ORXC_PartitionConnection";

bool isOfClass(const CmpiObjectPath& path, const char* className) {
    return path.getClassName().equals(className) != 0;
}

zemString hostOf(const CmpiObjectPath& path) {
    if (isOfClass(path, kConnection)) {
        return ConnectionProvider::hostOf(path.getKey("InstanceID").getString().charPtr()).c_str();
    }
    if (isOfClass(path, kManagementService)) {
        return path.getKey("SystemName").getString().charPtr();
    }
    return zemDataTypeConvertManager::getMTMSByOP(path);
}

bool onOneHost(const CmpiObjectPath& a, const CmpiObjectPath& b) {
    const zemString host = hostOf(a);
    return !host.isEmpty() && host == hostOf(b);
}

/// Which host a partition runs on: one class on each side, both asked of the server.
class HostedPartition : public OneAssociation<zemNtoNAssociationProvider> {
public:
    HostedPartition(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(kHostedPartition, mb, ctx, name, kHostedPartition, kHost, kPartition,
                         "Antecedent", "Dependent", OP_ALLOps, "", "", "") {}

protected:
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& host,
                               const CmpiObjectPath& partition) override {
        return onOneHost(host, partition);
    }
};

/// Which connections lead to a host: a row, to which further pairs of classes can be added. Paths
/// of references are made in the row's namespace as it stands there, so it has to name one.
class ConnectedHost : public OneAssociation<zemAssociationProvider> {
public:
    ConnectedHost(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), OneAssociation(kConnectedHost, mb, ctx, name, OP_ALLOps) {
        addAssoData(new zemAssociationData(kConnectedHost, kNameSpace, kHost, "Antecedent", "",
                                           kConnection, "Dependent", ""));
    }

protected:
    bool isValidateAssociation(const CmpiContext&, const zemAssociationData&,
                               const CmpiObjectPath& host,
                               const CmpiObjectPath& connection) override {
        return onOneHost(host, connection);
    }
};

/// All that a host is made of: a list of pairs, the base class standing for its subclasses.
class HostComponent : public OneAssociation<zemMultiNtoNAssociationProvider> {
public:
    HostComponent(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(kHostComponent, mb, ctx, name, kHostComponent,
                         "ORXC_CEC_CS\0ORXC_LPAR_CS\0"
                         "ORXC_CEC_CS\0ORXC_HostConnection\0"
                         "ORXC_CEC_CS\0CIM_EnabledLogicalElement\0",
                         "GroupComponent", "PartComponent", OP_ALLOps, "", "", "") {}

protected:
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& host,
                               const CmpiObjectPath& part) override {
        return !isOfClass(part, kHost) && onOneHost(host, part) && !part.classPathIsA(kService);
    }
};

/// Which services a host has: of whatever class, by their base.
class HostedService : public OneAssociation<zemMultiNtoNAssociationProvider> {
public:
    HostedService(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(kHostedService, mb, ctx, name, kHostedService,
                         "ORXC_CEC_CS\0CIM_Service\0", "Antecedent", "Dependent", OP_ALLOps, "", "",
                         "") {}

protected:
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& host,
                               const CmpiObjectPath& service) override {
        return onOneHost(host, service);
    }
};

/// Hosts are served by another provider, which the stub asks through the server; connections by
/// an object of this library.
class ReachedHost : public OneAssociation<zemBaseZemMultiNtoNAssociationProvider> {
public:
    ReachedHost(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(kReachedHost, mb, ctx, name, OP_ALLOps),
          m_hosts(mb, ctx),
          m_connections(mb, ctx, "ORXC_HostConnectionProvider") {
        m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
            {&m_hosts, kHost, "Antecedent", ""}, {&m_connections, kConnection, "Dependent", ""},
            kReachedHost, ""));
    }

protected:
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& host,
                               const CmpiObjectPath& connection,
                               const zemMultiNtoNAssociationPair&) override {
        return onOneHost(host, connection);
    }

private:
    zemComputerSystemProviderStub m_hosts;
    ConnectionProvider m_connections;
};

/// Both sides can be long, so only objects with one key, their host, are compared.
class PartitionConnection : public OneAssociation<zemEnhanceBaseZemMultiNtoNAssociationProvider> {
public:
    PartitionConnection(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          OneAssociation(kPartitionConnection, mb, ctx, name, OP_ALLOps),
          m_partitions(mb, ctx),
          m_connections(mb, ctx, "ORXC_HostConnectionProvider") {
        m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
            {&m_connections, kConnection, "Antecedent", ""},
            {&m_partitions, kPartition, "Dependent", ""}, kPartitionConnection, ""));
    }

protected:
    zemString getObjectPathHashKeyString(const CmpiObjectPath& path, bool) override {
        return hostOf(path);
    }
    bool isValidateAssociationPlus(const CmpiContext&, const CmpiObjectPath& connection,
                                   const CmpiObjectPath& partition, void*) override {
        return onOneHost(connection, partition);
    }

private:
    zemVirtualSystemProviderStub m_partitions;
    ConnectionProvider m_connections;
};

}  // namespace

ZEM_PROVIDER(ORXC_HostedPartitionProvider, HostedPartition)
ZEM_PROVIDER(ORXC_ConnectedHostProvider, ConnectedHost)
ZEM_PROVIDER(ORXC_HostComponentProvider, HostComponent)
ZEM_PROVIDER(ORXC_HostedServiceProvider, HostedService)
ZEM_PROVIDER(ORXC_ReachedHostProvider, ReachedHost)
ZEM_PROVIDER(ORXC_PartitionConnectionProvider, PartitionConnection)
