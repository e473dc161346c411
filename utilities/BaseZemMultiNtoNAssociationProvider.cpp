#include "BaseZemMultiNtoNAssociationProvider.h"

#include <memory>

#include "AssociationDataPrepareUtils.h"
#include "AssociationSupport.h"
#include "BaseProviderText.h"
#include "Exception.h"

namespace {

using IndexPairs = zemDynamicArray<objectPathIndexPair>;
using Paths = zemDynamicArray<CmpiObjectPath>;
using Pair = zemMultiNtoNAssociationPair;

[[noreturn]] void throwNoHandle(const char* text) {
    throw zemOperationFailedException("zemBaseZemMultiNtoNAssociationProvider", "getInstance",
                                      text);
}

bool sameName(const zemString& a, const char* b) { return zemString::equalsIgnoreCase(a, b); }

bool fitsFilter(const char* filter, const zemString& name) {
    return !zemIsGiven(filter) || sameName(name, filter);
}

CmpiObjectPath classPathOf(const CmpiObjectPath& cop, const zemMultiNtoNAssociationData& side) {
    return zemBaseProvider::createObjectPath(cop, zemNameSpaceOr(side.m_nameSpace, cop),
                                             side.m_className);
}

/// Makes paths like that of a request, for as many associations as there are, reading it once.
class PathsLike {
public:
    explicit PathsLike(const CmpiObjectPath& cop)
        : m_className(zemClassOf(cop)),
          m_nameSpace(zemTextOf(cop.getNameSpace())),
          m_host(zemTextOf(cop.getHostname())) {}

    CmpiObjectPath make() const {
        CmpiObjectPath path(static_cast<const char*>(m_nameSpace), m_className);
        if (!m_host.isEmpty()) path.setHostname(static_cast<const char*>(m_host));
        return path;
    }
    const zemString& className() const { return m_className; }

private:
    const zemString m_className;
    const zemString m_nameSpace;
    const zemString m_host;
};

}  // namespace

// ---- What both bases do -------------------------------------------------------------------------

template <class Provider>
zemProviderPairAssociation<Provider>::zemProviderPairAssociation(
    const CmpiBroker& mb, const CmpiContext& ctx, const char* name,
    SupportedOpType supportedOperations)
    : CmpiBaseMI(mb, ctx),
      zemBaseZemInstanceProvider(mb, ctx, name),
      m_supportedOperations(supportedOperations) {}

template <class Provider>
CMPIBoolean zemProviderPairAssociation<Provider>::isValidInstanceClass(const char* name) {
    return m_associationDataSet.isFoundClassName(name) &&
           (m_supportedOperations & OP_AllInstOps) != 0;
}

template <class Provider>
CMPIBoolean zemProviderPairAssociation<Provider>::isValidAssociationClass(const char* name) {
    return m_associationDataSet.isFoundClassName(name) &&
           (m_supportedOperations & (OP_OnlyAssocOps | OP_OnlyRefOps)) != 0;
}

template <class Provider>
void zemProviderPairAssociation<Provider>::populateEssentialKeys(const char*, CmpiArray& keys) {
    zemListReferences(keys, getLeftRefPropName(), getRightRefPropName());
}

template <class Provider>
const char* zemProviderPairAssociation<Provider>::getMessageBundlePath() {
    return "";
}

template <class Provider>
zemBaseZemInstanceProvider* zemProviderPairAssociation<Provider>::getProviderHandleByClassName(
    const char* name) const {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        for (const auto* side : {&pair.m_leftAssiData, &pair.m_rightAssiData})
            if (sameName(side->m_className, name)) return side->m_providerHandle;
    }
    return nullptr;
}

template <class Provider>
bool zemProviderPairAssociation<Provider>::findClassBySide(const char* name, bool isLeft) const {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        if (sameName((isLeft ? pair.m_leftAssiData : pair.m_rightAssiData).m_className, name))
            return true;
    }
    return false;
}

template <class Provider>
bool zemProviderPairAssociation<Provider>::hasRelationShipBetweenTwoClass(const char* left,
                                                                          const char* right) const {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        if (sameName(pair.m_leftAssiData.m_className, left) &&
            sameName(pair.m_rightAssiData.m_className, right))
            return true;
    }
    return false;
}

template <class Provider>
zemString zemProviderPairAssociation<Provider>::getLeftRefPropName() const {
    const Pair* const first = m_associationDataSet.getAssoPairByID(0);
    return first != nullptr ? first->m_leftAssiData.m_assoPropname : zemString();
}

template <class Provider>
zemString zemProviderPairAssociation<Provider>::getRightRefPropName() const {
    const Pair* const first = m_associationDataSet.getAssoPairByID(0);
    return first != nullptr ? first->m_rightAssiData.m_assoPropname : zemString();
}

template <class Provider>
void zemProviderPairAssociation<Provider>::getCopsByClassName(const CmpiContext& ctx,
                                                              const CmpiObjectPath& cop,
                                                              const Pair& pair, Paths& cops,
                                                              CachedNames& cache1,
                                                              CachedPaths& cache2, bool isLeft) {
    const zemMultiNtoNAssociationData& side = isLeft ? pair.m_leftAssiData : pair.m_rightAssiData;
    int at = 0;
    while (at < cache1.size() && !sameName(*cache1[at], side.m_className)) ++at;
    if (at == cache1.size()) {
        if (side.m_providerHandle == nullptr)
            throwNoHandle("error occured while retrive the handle of the associated class.");
        auto fetched = std::make_unique<Paths>(25);
        side.m_providerHandle->enumInstanceNames(ctx, classPathOf(cop, side), *fetched, cop);
        cache2.addElement(fetched.release());
        cache1.addElement(new zemString(side.m_className));
    }
    // assigning takes the ownership along: give it back to the cache
    Paths& cached = *cache2[at];
    cops = cached;
    cops.relinquishOwnership();
    cached.reSetOwership();
}

template <class Provider>
void zemProviderPairAssociation<Provider>::setValidAssociationKeys(const CmpiObjectPath& cop,
                                                                   const Paths& lefts,
                                                                   const Paths& rights,
                                                                   const IndexPairs& pairs,
                                                                   Paths& out) {
    const PathsLike request(cop);
    for (int i = 0; i < pairs.size(); ++i) {
        auto ncop = std::make_unique<CmpiObjectPath>(request.make());
        self().addKeys(*ncop, *lefts[pairs[i]->m_copsIndex1], *rights[pairs[i]->m_copsIndex2],
                       request.className());
        out.addElement(ncop.release());
    }
}

template <class Provider>
void zemProviderPairAssociation<Provider>::setValidAssociationProperties(
    const CmpiObjectPath& cop, const Paths& lefts, const Paths& rights, const IndexPairs& pairs,
    const char** properties, void* addInfo, zemDynamicArray<CmpiInstance>& out) {
    const PathsLike request(cop);
    for (int i = 0; i < pairs.size(); ++i) {
        const CmpiObjectPath& left = *lefts[pairs[i]->m_copsIndex1];
        const CmpiObjectPath& right = *rights[pairs[i]->m_copsIndex2];
        CmpiObjectPath ncop = request.make();
        self().addKeys(ncop, left, right, request.className());
        auto instance = std::make_unique<CmpiInstance>(ncop);
        self().complete(*instance, left, right, properties, request.className(), addInfo);
        out.addElement(instance.release());
    }
}

template <class Provider>
void zemProviderPairAssociation<Provider>::enumerate(zemAssociationCall& call,
                                                     const CmpiContext& ctx,
                                                     const CmpiObjectPath& cop,
                                                     const Visit& visit) {
    call.require(m_supportedOperations);
    call.guard([&] {
        self().prepared(ctx, call.className(), cop, [&](void* addInfo) {
            CachedNames names(25);
            CachedPaths paths(25);
            for (int i = 0; i < m_associationDataSet.size(); ++i) {
                const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
                if (!pair.isOf(call.className())) continue;
                Paths lefts(25), rights(25);
                getCopsByClassName(ctx, cop, pair, lefts, names, paths, true);
                getCopsByClassName(ctx, cop, pair, rights, names, paths, false);
                IndexPairs found(25);
                self().join(ctx, lefts, rights, pair, addInfo, found);
                visit(lefts, rights, found, addInfo);
            }
        });
    });
}

template <class Provider>
void zemProviderPairAssociation<Provider>::enumInstanceNames(const CmpiContext& ctx,
                                                             const CmpiObjectPath& cop, Paths& out,
                                                             const CmpiObjectPath&) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_EnumInstNamesOp, ctx, cop);
    enumerate(call, ctx, cop,
              [&](const Paths& lefts, const Paths& rights, const IndexPairs& pairs, void*) {
                  setValidAssociationKeys(cop, lefts, rights, pairs, out);
              });
}

template <class Provider>
void zemProviderPairAssociation<Provider>::enumInstances(const CmpiContext& ctx,
                                                         const CmpiObjectPath& cop,
                                                         const char** properties,
                                                         zemDynamicArray<CmpiInstance>& out,
                                                         const CmpiObjectPath&) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_EnumInstsOp, ctx, cop);
    enumerate(call, ctx, cop,
              [&](const Paths& lefts, const Paths& rights, const IndexPairs& pairs, void* addInfo) {
                  setValidAssociationProperties(cop, lefts, rights, pairs, properties, addInfo,
                                                out);
              });
}

template <class Provider>
bool zemProviderPairAssociation<Provider>::exists(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                                  const char** properties) {
    zemBaseZemInstanceProvider* const handle = getProviderHandleByClassName(zemClassOf(cop));
    if (handle == nullptr)
        throwNoHandle("error occured while retrive the handle of the associated class.");
    CmpiInstance instance(cop);
    return handle->getInstance(ctx, cop, properties, instance) == 0;
}

template <class Provider>
int zemProviderPairAssociation<Provider>::getInstance(const CmpiContext& ctx,
                                                      const CmpiObjectPath& cop,
                                                      const char** properties, CmpiInstance& out) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_GetInstOp, ctx, cop);
    call.require(m_supportedOperations);
    const CmpiObjectPath cop1 = call.reference(getLeftRefPropName());
    const CmpiObjectPath cop2 = call.reference(getRightRefPropName());
    const zemString class1 = zemClassOf(cop1);
    const zemString class2 = zemClassOf(cop2);
    const zemString text1 = objectPathToString(cop1);
    const zemString text2 = objectPathToString(cop2);
    const char* const none = nullptr;
    zemRefuseReferences(isFirstClass(class1) ? none : static_cast<const char*>(text1),
                        getLeftRefPropName(),
                        isSecondClass(class2) ? none : static_cast<const char*>(text2),
                        getRightRefPropName(), call.className(), m_providerName);
    int result = -1;
    call.guard([&] {
        if (!exists(ctx, cop1, nullptr) || !exists(ctx, cop2, nullptr)) return;
        self().prepared(ctx, call.className(), cop, [&](void* addInfo) {
            for (int i = 0; i < m_associationDataSet.size() && result != 0; ++i) {
                const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
                if (!pair.isOf(call.className()) ||
                    !sameName(pair.m_leftAssiData.m_className, class1) ||
                    !sameName(pair.m_rightAssiData.m_className, class2) ||
                    !self().belongTogether(ctx, cop1, cop2, pair, addInfo))
                    continue;
                CmpiObjectPath ncop = createObjectPath(cop);
                self().addKeys(ncop, cop1, cop2, call.className());
                out = CmpiInstance(ncop);
                self().complete(out, cop1, cop2, properties, call.className(), addInfo);
                result = 0;
            }
        });
    });
    return result;
}

template <class Provider>
void zemProviderPairAssociation<Provider>::performAssociators(
    const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole, const char** properties) {
    navigate({OP_AssocsOp, ctx, rslt, cop, properties, assocClass, resultClass, role, resultRole});
}

template <class Provider>
void zemProviderPairAssociation<Provider>::performAssociatorNames(
    const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole) {
    navigate({OP_AssocNamesOp, ctx, rslt, cop, nullptr, assocClass, resultClass, role, resultRole});
}

template <class Provider>
void zemProviderPairAssociation<Provider>::performReferences(
    const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop, const char* resultClass,
    const char* role, const char** properties) {
    navigate({OP_RefsOp, ctx, rslt, cop, properties, resultClass, nullptr, role});
}

template <class Provider>
void zemProviderPairAssociation<Provider>::performReferenceNames(const CmpiContext& ctx,
                                                                 CmpiResult& rslt,
                                                                 const CmpiObjectPath& cop,
                                                                 const char* resultClass,
                                                                 const char* role) {
    navigate({OP_RefNamesOp, ctx, rslt, cop, nullptr, resultClass, nullptr, role});
}

template <class Provider>
bool zemProviderPairAssociation<Provider>::ValidateInputObjectPath(const CmpiContext& ctx,
                                                                   const CmpiObjectPath& cop,
                                                                   const char*,
                                                                   const char** properties) {
    const zemString className = zemClassOf(cop);
    return (isFirstClass(className) || isSecondClass(className)) && exists(ctx, cop, properties);
}

template <class Provider>
bool zemProviderPairAssociation<Provider>::CheckClassNameInAssociationPair(
    const CmpiContext& ctx, const CmpiObjectPath& cop, const Pair& pair, bool& isFirst) {
    const zemString className = zemClassOf(cop);
    const bool left = sameName(pair.m_leftAssiData.m_className, className);
    const bool right = sameName(pair.m_rightAssiData.m_className, className);
    isFirst = left && right ? self().isFirstClassWhen2ClassTheSame(ctx, cop) : left;
    return left || right;
}

template <class Provider>
bool zemProviderPairAssociation<Provider>::CheckRolesAndResultClass(
    const char* resultRole, const char* role, const char* resultClass,
    const zemMultiTargetAssociationData& target) const {
    const zemMultiNtoNAssociationData& side = target.m_AssoData;
    return fitsFilter(role, side.m_assoPropname) &&
           fitsFilter(resultRole, target.m_OtherSidePropName) &&
           (!zemIsGiven(resultClass) ||
            zemClassIsA(side.m_nameSpace, side.m_className, resultClass));
}

template <class Provider>
void zemProviderPairAssociation<Provider>::collectTargets(
    const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole, Targets& targets) {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        bool isFirst = false;
        if (!pair.isOf(assocClass) || !CheckClassNameInAssociationPair(ctx, cop, pair, isFirst))
            continue;
        auto target = std::make_unique<zemMultiTargetAssociationData>(pair, isFirst);
        target->m_AssoData.m_nameSpace = zemNameSpaceOr(target->m_AssoData.m_nameSpace, cop);
        if (CheckRolesAndResultClass(resultRole, role, resultClass, *target))
            targets.addElement(target.release());
    }
}

template <class Provider>
void zemProviderPairAssociation<Provider>::navigate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    call.guard([&] {
        if (!ValidateInputObjectPath(r.ctx, r.cop, call.word())) return;
        Targets targets(25);
        self().CheckAssociationOperationParameters(r.ctx, r.cop, r.assocClass, r.resultClass,
                                                   r.role, r.resultRole, targets);
        if (r.is(OP_RefsOp) && zemIsGiven(r.assocClass))
            validateProerties(createObjectPath(r.cop, r.assocClass), r.properties, call.word());
        self().prepared(r.ctx, r.assocClass, r.cop, [&](void* addInfo) {
            for (int i = 0; i < targets.size(); ++i) visitTarget(call, r, *targets[i], addInfo);
        });
    });
}

template <class Provider>
void zemProviderPairAssociation<Provider>::visitTarget(zemAssociationCall& call,
                                                       const zemAssociationRequest& r,
                                                       const zemMultiTargetAssociationData& target,
                                                       void* addInfo) {
    const zemMultiNtoNAssociationData& far = target.m_AssoData;
    if (far.m_providerHandle == nullptr)
        throwNoHandle("Error occured while retrive the handle of the associated class.");
    Paths objects(25);
    far.m_providerHandle->enumInstanceNames(r.ctx, classPathOf(r.cop, far), objects, r.cop);

    const zemMultiNtoNAssociationData near(getProviderHandleByClassName(call.className()),
                                           call.className(), target.m_OtherSidePropName,
                                           zemTextOf(r.cop.getNameSpace()));
    const Pair pair(target.isFirst() ? near : far, target.isFirst() ? far : near,
                    target.m_AssoClassName, target.m_AssoNameSpace);
    for (const int i : self().neighbours(r.ctx, r.cop, target.isFirst(), objects, pair, addInfo))
        returnNeighbour(call, r, target, *objects[i], addInfo);
}

template <class Provider>
void zemProviderPairAssociation<Provider>::returnNeighbour(
    zemAssociationCall& call, const zemAssociationRequest& r,
    const zemMultiTargetAssociationData& target, const CmpiObjectPath& found, void* addInfo) {
    if (r.is(OP_AssocNamesOp)) {
        r.rslt.returnData(found);
        return;
    }
    if (r.is(OP_AssocsOp)) {
        CmpiInstance instance(found);
        if (target.m_AssoData.m_providerHandle->getInstance(r.ctx, found, r.properties, instance) ==
            0)
            r.rslt.returnData(instance);
        return;
    }
    const CmpiObjectPath& cop1 = target.isFirst() ? r.cop : found;
    const CmpiObjectPath& cop2 = target.isFirst() ? found : r.cop;
    const zemString className =
        target.m_AssoClassName.isEmpty() ? zemString(r.assocClass) : target.m_AssoClassName;
    CmpiObjectPath ncop = call.classPath(zemNameSpaceOr(target.m_AssoNameSpace, r.cop), className);
    self().addKeys(ncop, cop1, cop2, className);
    if (r.is(OP_RefNamesOp)) {
        r.rslt.returnData(ncop);
        return;
    }
    CmpiInstance instance(ncop);
    self().complete(instance, cop1, cop2, r.properties, className, addInfo);
    r.rslt.returnData(instance);
}

template class zemProviderPairAssociation<zemBaseZemMultiNtoNAssociationProvider>;
template class zemProviderPairAssociation<zemEnhanceBaseZemMultiNtoNAssociationProvider>;

// ---- zemBaseZemMultiNtoNAssociationProvider -----------------------------------------------------

zemBaseZemMultiNtoNAssociationProvider::zemBaseZemMultiNtoNAssociationProvider(
    const CmpiBroker& mb, const CmpiContext& ctx, SupportedOpType supportedOperations)
    : zemBaseZemMultiNtoNAssociationProvider(mb, ctx, "zemBaseZemMultiNtoNAssociationProvider",
                                             supportedOperations) {}

zemBaseZemMultiNtoNAssociationProvider::zemBaseZemMultiNtoNAssociationProvider(
    const CmpiBroker& mb, const CmpiContext& ctx, const char* providerName,
    SupportedOpType supportedOperations)
    : CmpiBaseMI(mb, ctx), zemProviderPairAssociation(mb, ctx, providerName, supportedOperations) {}

void zemBaseZemMultiNtoNAssociationProvider::addKeys(CmpiObjectPath& ncop,
                                                     const CmpiObjectPath& cop1,
                                                     const CmpiObjectPath& cop2, const char*) {
    zemSetReferences(ncop, getLeftRefPropName(), cop1, getRightRefPropName(), cop2);
}

void zemBaseZemMultiNtoNAssociationProvider::addProperties(CmpiInstance& inst,
                                                           const CmpiObjectPath& cop1,
                                                           const CmpiObjectPath& cop2, const char**,
                                                           const char*) {
    zemSetReferences(inst, getLeftRefPropName(), cop1, getRightRefPropName(), cop2);
}

void zemBaseZemMultiNtoNAssociationProvider::CheckAssociationOperationParameters(
    const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole, Targets& targets) {
    collectTargets(ctx, cop, assocClass, resultClass, role, resultRole, targets);
}

bool zemBaseZemMultiNtoNAssociationProvider::isFirstClassWhen2ClassTheSame(const CmpiContext&,
                                                                           const CmpiObjectPath&) {
    return false;
}

bool zemBaseZemMultiNtoNAssociationProvider::isValidateAssociation(const CmpiContext&,
                                                                   const CmpiObjectPath&,
                                                                   const CmpiObjectPath&,
                                                                   const Pair&) {
    return true;
}

bool zemBaseZemMultiNtoNAssociationProvider::BeforeGenerateAssociation(const CmpiContext&,
                                                                       const char*) {
    return true;
}

void zemBaseZemMultiNtoNAssociationProvider::AfterGenerateAssociation(const CmpiContext&,
                                                                      const char*) {}

void zemBaseZemMultiNtoNAssociationProvider::prepared(const CmpiContext& ctx, const char* className,
                                                      const CmpiObjectPath&,
                                                      const std::function<void(void*)>& work) {
    const zemSynchronizer hold(m_operationLock);
    const zemAssociationDataPrepareUtility preparation(this, ctx, className);
    if (preparation.isInitialized()) work(nullptr);
}

void zemBaseZemMultiNtoNAssociationProvider::join(const CmpiContext& ctx, const Paths& lefts,
                                                  const Paths& rights, const Pair& pair, void*,
                                                  IndexPairs& pairs) {
    for (int i = 0; i < lefts.size(); ++i)
        for (int j = 0; j < rights.size(); ++j)
            if (isValidateAssociation(ctx, *lefts[i], *rights[j], pair))
                pairs.addElement(new objectPathIndexPair{i, j});
}

std::set<int> zemBaseZemMultiNtoNAssociationProvider::neighbours(const CmpiContext& ctx,
                                                                 const CmpiObjectPath& source,
                                                                 bool isFirst, const Paths& targets,
                                                                 const Pair& pair, void*) {
    std::set<int> found;
    for (int i = 0; i < targets.size(); ++i)
        if (isValidateAssociation(ctx, isFirst ? source : *targets[i],
                                  isFirst ? *targets[i] : source, pair))
            found.insert(found.end(), i);
    return found;
}

bool zemBaseZemMultiNtoNAssociationProvider::belongTogether(const CmpiContext& ctx,
                                                            const CmpiObjectPath& cop1,
                                                            const CmpiObjectPath& cop2,
                                                            const Pair& pair, void*) {
    return isValidateAssociation(ctx, cop1, cop2, pair);
}

void zemBaseZemMultiNtoNAssociationProvider::complete(CmpiInstance& inst,
                                                      const CmpiObjectPath& cop1,
                                                      const CmpiObjectPath& cop2,
                                                      const char** properties,
                                                      const char* className, void*) {
    addProperties(inst, cop1, cop2, properties, className);
}

// ---- zemEnhanceBaseZemMultiNtoNAssociationProvider ----------------------------------------------

zemEnhanceBaseZemMultiNtoNAssociationProvider::zemEnhanceBaseZemMultiNtoNAssociationProvider(
    const CmpiBroker& mb, const CmpiContext& ctx, SupportedOpType supportedOperations)
    : zemEnhanceBaseZemMultiNtoNAssociationProvider(
          mb, ctx, "zemEnhanceBaseZemMultiNtoNAssociationProvider", supportedOperations) {}

zemEnhanceBaseZemMultiNtoNAssociationProvider::zemEnhanceBaseZemMultiNtoNAssociationProvider(
    const CmpiBroker& mb, const CmpiContext& ctx, const char* providerName,
    SupportedOpType supportedOperations)
    : CmpiBaseMI(mb, ctx), zemProviderPairAssociation(mb, ctx, providerName, supportedOperations) {}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::addKeys(CmpiObjectPath& ncop,
                                                            const CmpiObjectPath& cop1,
                                                            const CmpiObjectPath& cop2,
                                                            const char*) {
    zemSetReferences(ncop, getLeftRefPropName(), cop1, getRightRefPropName(), cop2);
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::addProperties(CmpiInstance& inst,
                                                                  const CmpiObjectPath& cop1,
                                                                  const CmpiObjectPath& cop2,
                                                                  const char**, const char*,
                                                                  void*) {
    zemSetReferences(inst, getLeftRefPropName(), cop1, getRightRefPropName(), cop2);
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::CheckAssociationOperationParameters(
    const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole, Targets& targets) {
    collectTargets(ctx, cop, assocClass, resultClass, role, resultRole, targets);
}

bool zemEnhanceBaseZemMultiNtoNAssociationProvider::isFirstClassWhen2ClassTheSame(
    const CmpiContext&, const CmpiObjectPath&) {
    return false;
}

bool zemEnhanceBaseZemMultiNtoNAssociationProvider::isValidateAssociation(const CmpiContext&,
                                                                          const CmpiObjectPath&,
                                                                          const CmpiObjectPath&,
                                                                          void*) {
    return true;
}

void* zemEnhanceBaseZemMultiNtoNAssociationProvider::BeforeGenerateAssociation(
    const CmpiContext&, const char*, const CmpiObjectPath&) {
    return nullptr;
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::AfterGenerateAssociation(const CmpiContext&,
                                                                             const char*, void*) {}

bool zemEnhanceBaseZemMultiNtoNAssociationProvider::isValidateAssociationPlus(const CmpiContext&,
                                                                              const CmpiObjectPath&,
                                                                              const CmpiObjectPath&,
                                                                              void*) {
    return true;
}

zemString zemEnhanceBaseZemMultiNtoNAssociationProvider::getObjectPathHashKeyString(
    const CmpiObjectPath&, bool) {
    return zemString();
}

zemDynamicArray<objectPathIndexPair>
zemEnhanceBaseZemMultiNtoNAssociationProvider::findValidAssociationCopMappingPair(
    const CmpiContext& ctx, const Paths& leftCops, const Paths& rightCops, void* addInfo) {
    IndexPairs pairs(25);
    const PathsByKey hash = getObjectPathHashRes(rightCops);
    for (int i = 0; i < leftCops.size(); ++i)
        setValidAssociationIndexPairSet(ctx, *leftCops[i], i, rightCops, hash, pairs, addInfo);
    return pairs;
}

zemEnhanceBaseZemMultiNtoNAssociationProvider::PathsByKey
zemEnhanceBaseZemMultiNtoNAssociationProvider::getObjectPathHashRes(const Paths& rightCops) {
    PathsByKey hash(rightCops.size());
    for (int j = 0; j < rightCops.size(); ++j)
        hash.insert(getObjectPathHashKeyString(*rightCops[j], false), j);
    return hash;
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::setValidAssociationIndexPairSet(
    const CmpiContext& ctx, const CmpiObjectPath& leftCop, int leftIndex, const Paths& rightCops,
    const PathsByKey& hash, IndexPairs& pairs, void* addInfo) {
    for (const int j : hash.getElement(getObjectPathHashKeyString(leftCop, true)))
        if (isValidateAssociationPlus(ctx, leftCop, *rightCops[j], addInfo))
            pairs.addElement(new objectPathIndexPair{leftIndex, j});
}

std::set<int> zemEnhanceBaseZemMultiNtoNAssociationProvider::getValidIndexSet(
    const CmpiContext& ctx, const CmpiObjectPath& source, bool isFirst, const Paths& targets,
    void* addInfo) {
    const zemString key = getObjectPathHashKeyString(source, isFirst);
    std::set<int> found;
    for (int i = 0; i < targets.size(); ++i)
        if (getObjectPathHashKeyString(*targets[i], !isFirst) == key &&
            isValidateAssociationPlus(ctx, isFirst ? source : *targets[i],
                                      isFirst ? *targets[i] : source, addInfo))
            found.insert(found.end(), i);
    return found;
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::prepared(
    const CmpiContext& ctx, const char* className, const CmpiObjectPath& cop,
    const std::function<void(void*)>& work) {
    zemAssociationDataPrepareUtilityPlus preparation(this, ctx, className, cop);
    work(preparation.run());
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::join(const CmpiContext& ctx, const Paths& lefts,
                                                         const Paths& rights, const Pair&,
                                                         void* addInfo, IndexPairs& pairs) {
    pairs = findValidAssociationCopMappingPair(ctx, lefts, rights, addInfo);
}

std::set<int> zemEnhanceBaseZemMultiNtoNAssociationProvider::neighbours(
    const CmpiContext& ctx, const CmpiObjectPath& source, bool isFirst, const Paths& targets,
    const Pair&, void* addInfo) {
    return getValidIndexSet(ctx, source, isFirst, targets, addInfo);
}

bool zemEnhanceBaseZemMultiNtoNAssociationProvider::belongTogether(const CmpiContext& ctx,
                                                                   const CmpiObjectPath& cop1,
                                                                   const CmpiObjectPath& cop2,
                                                                   const Pair&, void* addInfo) {
    return getObjectPathHashKeyString(cop1, true) == getObjectPathHashKeyString(cop2, false) &&
           isValidateAssociationPlus(ctx, cop1, cop2, addInfo) &&
           isValidateAssociation(ctx, cop1, cop2, addInfo);
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::complete(CmpiInstance& inst,
                                                             const CmpiObjectPath& cop1,
                                                             const CmpiObjectPath& cop2,
                                                             const char** properties,
                                                             const char* className, void* addInfo) {
    addProperties(inst, cop1, cop2, properties, className, addInfo);
}
