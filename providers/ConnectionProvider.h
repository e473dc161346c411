/// ORXC_HostConnection: the appliance's connections to service processors, read from qylink.
/// InstanceID is ORX:<Name of the host>:<service processor>.
///
/// The shortest way to serve a class for reading: three operations that fill what they are
/// given. Thread-safety: no state; any number of operations at once.
#ifndef CONNECTION_PROVIDER_H
#define CONNECTION_PROVIDER_H

#include <string>

#include "BaseZemInstanceProvider.h"

class ConnectionProvider : public zemBaseZemInstanceProvider {
public:
    ConnectionProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    /// The Name of the host in an InstanceID; empty when that has not the form of one.
    static std::string hostOf(const std::string& id);

protected:
    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;

    int getInstance(const CmpiContext& context, const CmpiObjectPath& path, const char** properties,
                    CmpiInstance& out) override;
    void enumInstanceNames(const CmpiContext& context, const CmpiObjectPath& path,
                           zemDynamicArray<CmpiObjectPath>& out,
                           const CmpiObjectPath& asked) override;
    void enumInstances(const CmpiContext& context, const CmpiObjectPath& path,
                       const char** properties, zemDynamicArray<CmpiInstance>& out,
                       const CmpiObjectPath& asked) override;
    CMPIBoolean isValidInstanceClass(const char* className) override;
    void populateEssentialKeys(const char* className, CmpiArray& keys) override;
};

#endif
