/// What an association provider can be asked: its operations as bits, and the classes that bring
/// the operations of a client down to few. For the association families; final providers derive
/// from those.
///
/// Every family takes the bits in its constructor as its own SupportedOpType; a client that asks
/// for an operation whose bit is missing is answered "not supported".
///
///     using Base = zemNtoNAssociationProvider;
///     Base(mb, ctx, ..., Base::OP_AllInstOps | Base::OP_OnlyAssocOps, ...)
///
/// Thread-safety: no state; as thread-safe as what derives from them.
#ifndef ASSOCIATION_OPERATIONS_H
#define ASSOCIATION_OPERATIONS_H

#include "BaseProvider.h"
#include "BaseZemInstanceProvider.h"
#include "ZemExport.h"

/// Declares SupportedOpType and its enumerators inside a provider class.
#define ZEM_ASSOCIATION_OPERATIONS()                                                    \
    enum SupportedOpType {                                                              \
        OP_GetInstOp = 1,                                                               \
        OP_EnumInstsOp = 2,                                                             \
        OP_EnumInstNamesOp = 4,                                                         \
        OP_AssocsOp = 8,                                                                \
        OP_AssocNamesOp = 16,                                                           \
        OP_RefsOp = 32,                                                                 \
        OP_RefNamesOp = 64,                                                             \
        OP_AllInstOps = 7,                                                              \
        OP_OnlyAssocOps = 24,                                                           \
        OP_OnlyRefOps = 96,                                                             \
        OP_ALLOps = 127                                                                 \
    };                                                                                  \
    friend constexpr SupportedOpType operator|(SupportedOpType a, SupportedOpType b) {  \
        return static_cast<SupportedOpType>(static_cast<int>(a) | static_cast<int>(b)); \
    }

struct zemAssociationRequest;

/// Makes one operation of the four navigations of a client. Base is a provider without
/// associations of its own.
template <class Base>
class ZEM_EXPORT zemAssociationNavigation : public Base {
public:
    zemAssociationNavigation(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    void performAssociators(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                            const char* assocClass, const char* resultClass, const char* role,
                            const char* resultRole, const char** properties) override;
    void performAssociatorNames(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                                const char* assocClass, const char* resultClass, const char* role,
                                const char* resultRole) override;
    void performReferences(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                           const char* resultClass, const char* role,
                           const char** properties) override;
    void performReferenceNames(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                               const char* resultClass, const char* role) override;

private:
    virtual void navigate(const zemAssociationRequest& request) = 0;
};

extern template class zemAssociationNavigation<zemBaseProvider>;
extern template class zemAssociationNavigation<zemBaseZemInstanceProvider>;

/// What the families have in common that ask the CIM server for their objects: the two
/// enumerations made one operation as well, and the message bundle.
class ZEM_EXPORT zemServerAssociation : public zemAssociationNavigation<zemBaseProvider> {
public:
    zemServerAssociation(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    void performEnumInstances(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                              const char** properties) override;
    void performEnumInstanceNames(const CmpiContext& ctx, CmpiResult& rslt,
                                  const CmpiObjectPath& cop) override;
    const char* getMessageBundlePath() override;

private:
    virtual void enumerate(const zemAssociationRequest& request) = 0;
};

#endif
