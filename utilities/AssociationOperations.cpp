#include "AssociationOperations.h"

#include "AssociationSupport.h"

namespace {

using Bits = zemAssociationBits;

}  // namespace

template <class Base>
zemAssociationNavigation<Base>::zemAssociationNavigation(const CmpiBroker& mb,
                                                         const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx), Base(mb, ctx, name) {}

template <class Base>
void zemAssociationNavigation<Base>::performAssociators(
    const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole, const char** properties) {
    navigate(
        {Bits::OP_AssocsOp, ctx, rslt, cop, properties, assocClass, resultClass, role, resultRole});
}

template <class Base>
void zemAssociationNavigation<Base>::performAssociatorNames(
    const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole) {
    navigate({Bits::OP_AssocNamesOp, ctx, rslt, cop, nullptr, assocClass, resultClass, role,
              resultRole});
}

template <class Base>
void zemAssociationNavigation<Base>::performReferences(const CmpiContext& ctx, CmpiResult& rslt,
                                                       const CmpiObjectPath& cop,
                                                       const char* resultClass, const char* role,
                                                       const char** properties) {
    navigate({Bits::OP_RefsOp, ctx, rslt, cop, properties, resultClass, nullptr, role});
}

template <class Base>
void zemAssociationNavigation<Base>::performReferenceNames(const CmpiContext& ctx, CmpiResult& rslt,
                                                           const CmpiObjectPath& cop,
                                                           const char* resultClass,
                                                           const char* role) {
    navigate({Bits::OP_RefNamesOp, ctx, rslt, cop, nullptr, resultClass, nullptr, role});
}

template class zemAssociationNavigation<zemBaseProvider>;
template class zemAssociationNavigation<zemBaseZemInstanceProvider>;

zemServerAssociation::zemServerAssociation(const CmpiBroker& mb, const CmpiContext& ctx,
                                           const char* name)
    : CmpiBaseMI(mb, ctx), zemAssociationNavigation(mb, ctx, name) {}

void zemServerAssociation::performEnumInstances(const CmpiContext& ctx, CmpiResult& rslt,
                                                const CmpiObjectPath& cop,
                                                const char** properties) {
    enumerate({Bits::OP_EnumInstsOp, ctx, rslt, cop, properties});
}

void zemServerAssociation::performEnumInstanceNames(const CmpiContext& ctx, CmpiResult& rslt,
                                                    const CmpiObjectPath& cop) {
    enumerate({Bits::OP_EnumInstNamesOp, ctx, rslt, cop, nullptr});
}

const char* zemServerAssociation::getMessageBundlePath() {
    return "/KOpenFs/KORX/ProdData/QZE/Pegasus/msg/provider/osbase";
}
