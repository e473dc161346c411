/// Base of the instance providers: a provider fills arrays, and this class hands them to the
/// server.
///
///     class DiskProvider : public zemBaseZemInstanceProvider {
///         using zemBaseZemInstanceProvider::enumInstances;  // those of the frame stay visible
///         using zemBaseZemInstanceProvider::getInstance;
///         int getInstance(const CmpiContext&, const CmpiObjectPath& cop, const char**,
///                         CmpiInstance& out) override;
///         void enumInstances(const CmpiContext&, const CmpiObjectPath& cop, const char**,
///                            zemDynamicArray<CmpiInstance>& out,
///                            const CmpiObjectPath& origCop) override;
///     };
///
/// Providers of the same process call these operations directly as well, past the server. See
/// BaseZemValidator.h for the tests of incoming instances.
#ifndef ZEM_BASE_ZEM_INSTANCE_PROVIDER_H
#define ZEM_BASE_ZEM_INSTANCE_PROVIDER_H

#include "BaseZemValidator.h"

class ZEM_EXPORT zemBaseZemInstanceProvider : public zemBaseZemValidator {
public:
    /// Namespace of the classes of this schema.
    static constexpr char kDefaultNameSpace[] = "root/orxsd";

    zemBaseZemInstanceProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    using zemBaseZemValidator::enumInstanceNames;
    using zemBaseZemValidator::enumInstances;
    using zemBaseZemValidator::getInstance;

    /// Fills @p out, which has been made for the path.
    /// @return 0 when the object exists; the default knows none and returns -1
    virtual int getInstance(const CmpiContext& ctx, const CmpiObjectPath& cop,
                            const char** properties, CmpiInstance& out);

    /// Add new objects to @p out, which owns them; the defaults add nothing.
    /// @param origCop  path of the client's request, where @p cop was made from it
    virtual void enumInstanceNames(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                   zemDynamicArray<CmpiObjectPath>& out,
                                   const CmpiObjectPath& origCop);
    virtual void enumInstances(const CmpiContext& ctx, const CmpiObjectPath& cop,
                               const char** properties, zemDynamicArray<CmpiInstance>& out,
                               const CmpiObjectPath& origCop);

    CmpiInstance performGetInstance(const CmpiContext& ctx, const CmpiObjectPath& path,
                                    const char** properties) override;
    void performEnumInstances(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override;
    void performEnumInstanceNames(const CmpiContext& ctx, CmpiResult& result,
                                  const CmpiObjectPath& path) override;

protected:
    /// The parts of a partition's key "<lparId>*<type_model>*<serial_num>". A host's key, which
    /// has no first part, gives "" and itself.
    zemString getLparID(zemString key);
    zemString getMtms(zemString key);

    CmpiBroker m_broker;
};

#endif
