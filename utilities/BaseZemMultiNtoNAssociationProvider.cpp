#include "BaseZemMultiNtoNAssociationProvider.h"

#include <memory>
#include <optional>
#include <utility>

#include "AssociationDataPrepareUtils.h"
#include "AssociationSupport.h"
#include "BaseProviderText.h"
#include "Exception.h"

namespace {

using IndexPairs = zemDynamicArray<objectPathIndexPair>;
using Paths = zemDynamicArray<CmpiObjectPath>;
using Pair = zemMultiNtoNAssociationPair;

constexpr const char* kNoHandle = "error occured while retrive the handle of the associated class.";
constexpr const char* kNoTargetHandle =
    "Error occured while retrive the handle of the associated class.";

zemBaseZemInstanceProvider& given(zemBaseZemInstanceProvider* handle, const char* complaint) {
    if (handle != nullptr) {
        return *handle;
    }
    throw zemOperationFailedException("zemBaseZemMultiNtoNAssociationProvider", "getInstance",
                                      complaint);
}

bool sameName(const zemString& a, const char* b) { return zemString::equalsIgnoreCase(a, b); }

bool fitsFilter(const char* filter, const zemString& name) {
    return !zemIsGiven(filter) || sameName(name, filter);
}

/// The objects of a side, from its handle; what it leaves empty in the array is no object.
std::unique_ptr<Paths> fetch(const CmpiContext& ctx, const CmpiObjectPath& cop,
                             const zemMultiNtoNAssociationData& side, const char* complaint) {
    zemBaseZemInstanceProvider& handle = given(side.m_providerHandle, complaint);
    Paths all(25);
    handle.enumInstanceNames(ctx,
                             zemBaseProvider::createObjectPath(
                                 cop, zemNameSpaceOr(side.m_nameSpace, cop), side.m_className),
                             all, cop);
    auto objects = std::make_unique<Paths>(all.size(), 25, 1);  // so that adding cannot fail
    for (int i = 0; i < all.size(); ++i) {
        if (all[i] != nullptr) {
            objects->addElement(all[i]);
        }
    }
    all.relinquishOwnership();
    return objects;
}

}  // namespace

// ---- What both bases do -------------------------------------------------------------------------

/// Makes paths like that of a request, for as many associations as there are, reading it once.
class zemProviderPairAssociation::PathsLike {
public:
    explicit PathsLike(const CmpiObjectPath& cop)
        : m_className(zemClassOf(cop)),
          m_nameSpace(zemTextOf(cop.getNameSpace())),
          m_host(zemTextOf(cop.getHostname())) {}

    CmpiObjectPath make() const {
        CmpiObjectPath path(static_cast<const char*>(m_nameSpace), m_className);
        if (!m_host.isEmpty()) {
            path.setHostname(static_cast<const char*>(m_host));
        }
        return path;
    }
    const zemString& className() const { return m_className; }

private:
    const zemString m_className;
    const zemString m_nameSpace;
    const zemString m_host;
};

zemProviderPairAssociation::zemProviderPairAssociation(const CmpiBroker& mb, const CmpiContext& ctx,
                                                       const char* name,
                                                       SupportedOpType supportedOperations)
    : CmpiBaseMI(mb, ctx),
      zemAssociationNavigation(mb, ctx, name),
      m_supportedOperations(supportedOperations) {}

CMPIBoolean zemProviderPairAssociation::isValidInstanceClass(const char* name) {
    return m_associationDataSet.isFoundClassName(name) &&
           (m_supportedOperations & OP_AllInstOps) != 0;
}

CMPIBoolean zemProviderPairAssociation::isValidAssociationClass(const char* name) {
    return m_associationDataSet.isFoundClassName(name) &&
           (m_supportedOperations & (OP_OnlyAssocOps | OP_OnlyRefOps)) != 0;
}

void zemProviderPairAssociation::populateEssentialKeys(const char*, CmpiArray& keys) {
    zemListReferences(keys, getLeftRefPropName(), getRightRefPropName());
}

const char* zemProviderPairAssociation::getMessageBundlePath() { return ""; }

zemBaseZemInstanceProvider* zemProviderPairAssociation::getProviderHandleByClassName(
    const char* name) const {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        for (const auto* side : {&pair.m_leftAssiData, &pair.m_rightAssiData}) {
            if (sameName(side->m_className, name)) {
                return side->m_providerHandle;
            }
        }
    }
    return nullptr;
}

bool zemProviderPairAssociation::findClassBySide(const char* name, bool isLeft) const {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        if (sameName((isLeft ? pair.m_leftAssiData : pair.m_rightAssiData).m_className, name)) {
            return true;
        }
    }
    return false;
}

bool zemProviderPairAssociation::hasRelationShipBetweenTwoClass(const char* left,
                                                                const char* right) const {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        if (sameName(pair.m_leftAssiData.m_className, left) &&
            sameName(pair.m_rightAssiData.m_className, right)) {
            return true;
        }
    }
    return false;
}

zemString zemProviderPairAssociation::getLeftRefPropName() const {
    const Pair* const first = m_associationDataSet.getAssoPairByID(0);
    return first != nullptr ? first->m_leftAssiData.m_assoPropname : zemString();
}

zemString zemProviderPairAssociation::getRightRefPropName() const {
    const Pair* const first = m_associationDataSet.getAssoPairByID(0);
    return first != nullptr ? first->m_rightAssiData.m_assoPropname : zemString();
}

void zemProviderPairAssociation::getCopsByClassName(const CmpiContext& ctx,
                                                    const CmpiObjectPath& cop, const Pair& pair,
                                                    Paths& cops, CachedNames& cache1,
                                                    CachedPaths& cache2, bool isLeft) {
    const zemMultiNtoNAssociationData& side = isLeft ? pair.m_leftAssiData : pair.m_rightAssiData;
    int at = 0;
    while (at < cache1.size() && !sameName(*cache1[at], side.m_className)) {
        ++at;
    }
    if (at == cache1.size()) {
        zemAppend(cache2, fetch(ctx, cop, side, kNoHandle));
        zemAppend(cache1, std::make_unique<zemString>(side.m_className));
    }
    // assigning takes the ownership along: give it back to the cache
    Paths& cached = *cache2[at];
    cops = cached;
    cops.relinquishOwnership();
    cached.reSetOwership();
}

std::unique_ptr<CmpiObjectPath> zemProviderPairAssociation::associate(const PathsLike& request,
                                                                      const CmpiObjectPath& left,
                                                                      const CmpiObjectPath& right) {
    auto ncop = std::make_unique<CmpiObjectPath>(request.make());
    nameKeys(*ncop, left, right, request.className());
    return ncop;
}

std::unique_ptr<CmpiInstance> zemProviderPairAssociation::associate(const PathsLike& request,
                                                                    const CmpiObjectPath& left,
                                                                    const CmpiObjectPath& right,
                                                                    const char** properties,
                                                                    void* addInfo) {
    auto instance = std::make_unique<CmpiInstance>(*associate(request, left, right));
    complete(*instance, left, right, properties, request.className(), addInfo);
    return instance;
}

void zemProviderPairAssociation::enumerate(zemAssociationCall& call, const Enumeration& e) {
    call.require(m_supportedOperations);
    call.guard([&] {
        prepare(e.ctx, call.className(), e.cop, [&](void* addInfo) {
            CachedNames names(25);
            CachedPaths paths(25);
            for (int i = 0; i < m_associationDataSet.size(); ++i) {
                const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
                if (!pair.isOf(call.className())) {
                    continue;
                }
                Paths lefts(25), rights(25);
                getCopsByClassName(e.ctx, e.cop, pair, lefts, names, paths, true);
                getCopsByClassName(e.ctx, e.cop, pair, rights, names, paths, false);
                join(e, lefts, rights, pair, addInfo);
            }
        });
    });
}

void zemProviderPairAssociation::enumInstanceNames(const CmpiContext& ctx,
                                                   const CmpiObjectPath& cop, Paths& out,
                                                   const CmpiObjectPath&) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_EnumInstNamesOp, ctx, cop);
    enumerate(call, {ctx, cop, nullptr, &out, nullptr});
}

void zemProviderPairAssociation::enumInstances(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                               const char** properties,
                                               zemDynamicArray<CmpiInstance>& out,
                                               const CmpiObjectPath&) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_EnumInstsOp, ctx, cop);
    enumerate(call, {ctx, cop, properties, nullptr, &out});
}

bool zemProviderPairAssociation::exists(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                        const char** properties) {
    zemBaseZemInstanceProvider& handle =
        given(getProviderHandleByClassName(zemClassOf(cop)), kNoHandle);
    CmpiInstance instance(cop);
    return handle.getInstance(ctx, cop, properties, instance) == 0;
}

int zemProviderPairAssociation::getInstance(const CmpiContext& ctx, const CmpiObjectPath& cop,
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
    bool found = false;
    call.guard([&] {
        if (!exists(ctx, cop1, nullptr) || !exists(ctx, cop2, nullptr)) {
            return;
        }
        prepare(ctx, call.className(), cop, [&](void* addInfo) {
            const Make make = [&](const CmpiObjectPath& left, const CmpiObjectPath& right) {
                out = *associate(PathsLike(cop), left, right, properties, addInfo);
            };
            for (int i = 0; i < m_associationDataSet.size() && !found; ++i) {
                const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
                found = pair.isOf(call.className()) &&
                        sameName(pair.m_leftAssiData.m_className, class1) &&
                        sameName(pair.m_rightAssiData.m_className, class2) &&
                        belongs(ctx, cop1, cop2, pair, addInfo, make);
            }
        });
    });
    return found ? 0 : -1;
}

bool zemProviderPairAssociation::ValidateInputObjectPath(const CmpiContext& ctx,
                                                         const CmpiObjectPath& cop, const char*,
                                                         const char** properties) {
    const zemString className = zemClassOf(cop);
    return (isFirstClass(className) || isSecondClass(className)) && exists(ctx, cop, properties);
}

bool zemProviderPairAssociation::CheckClassNameInAssociationPair(const CmpiContext& ctx,
                                                                 const CmpiObjectPath& cop,
                                                                 const Pair& pair, bool& isFirst) {
    const zemString className = zemClassOf(cop);
    const bool left = sameName(pair.m_leftAssiData.m_className, className);
    const bool right = sameName(pair.m_rightAssiData.m_className, className);
    isFirst = left && right ? standsLeft(ctx, cop) : left;
    return left || right;
}

bool zemProviderPairAssociation::CheckRolesAndResultClass(
    const char* resultRole, const char* role, const char* resultClass,
    const zemMultiTargetAssociationData& target) const {
    const zemMultiNtoNAssociationData& side = target.m_AssoData;
    return fitsFilter(role, side.m_assoPropname) &&
           fitsFilter(resultRole, target.m_OtherSidePropName) &&
           (!zemIsGiven(resultClass) ||
            zemClassIsA(side.m_nameSpace, side.m_className, resultClass));
}

void zemProviderPairAssociation::collectTargets(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                                const char* assocClass, const char* resultClass,
                                                const char* role, const char* resultRole,
                                                Targets& targets) {
    for (int i = 0; i < m_associationDataSet.size(); ++i) {
        const Pair& pair = *m_associationDataSet.getAssoPairByID(i);
        bool isFirst = false;
        if (!pair.isOf(assocClass) || !CheckClassNameInAssociationPair(ctx, cop, pair, isFirst)) {
            continue;
        }
        auto target = std::make_unique<zemMultiTargetAssociationData>(pair, isFirst);
        target->m_AssoData.m_nameSpace = zemNameSpaceOr(target->m_AssoData.m_nameSpace, cop);
        if (CheckRolesAndResultClass(resultRole, role, resultClass, *target)) {
            zemAppend(targets, std::move(target));
        }
    }
}

void zemProviderPairAssociation::navigate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    call.guard([&] {
        if (!ValidateInputObjectPath(r.ctx, r.cop, call.word())) {
            return;
        }
        Targets targets(25);
        findTargets(r.ctx, r.cop, r.assocClass, r.resultClass, r.role, r.resultRole, targets);
        if (r.is(OP_RefsOp) && zemIsGiven(r.assocClass)) {
            validateProerties(createObjectPath(r.cop, r.assocClass), r.properties, call.word());
        }
        prepare(r.ctx, r.assocClass, r.cop, [&](void* addInfo) {
            for (int i = 0; i < targets.size(); ++i) {
                visitTarget(call, r, *targets[i], addInfo);
            }
        });
    });
}

void zemProviderPairAssociation::visitTarget(zemAssociationCall& call,
                                             const zemAssociationRequest& r,
                                             const zemMultiTargetAssociationData& target,
                                             void* addInfo) {
    const zemMultiNtoNAssociationData& far = target.m_AssoData;
    const std::unique_ptr<Paths> objects = fetch(r.ctx, r.cop, far, kNoTargetHandle);
    const zemMultiNtoNAssociationData near(getProviderHandleByClassName(call.className()),
                                           call.className(), target.m_OtherSidePropName,
                                           zemTextOf(r.cop.getNameSpace()));
    const Pair pair(target.isFirst() ? near : far, target.isFirst() ? far : near,
                    target.m_AssoClassName, target.m_AssoNameSpace);
    const zemString className =
        target.m_AssoClassName.isEmpty() ? zemString(r.assocClass) : target.m_AssoClassName;

    // What the hooks make of the pair at hand, where the client wants the association.
    std::optional<CmpiObjectPath> path;
    std::optional<CmpiInstance> instance;
    const Make make = [&](const CmpiObjectPath& left, const CmpiObjectPath& right) {
        if (!r.is(OP_OnlyRefOps)) {
            return;
        }
        path = call.classPath(zemNameSpaceOr(target.m_AssoNameSpace, r.cop), className);
        nameKeys(*path, left, right, className);
        if (!r.is(OP_RefsOp)) {
            return;
        }
        instance = CmpiInstance(*path);
        complete(*instance, left, right, r.properties, className, addInfo);
    };
    const auto returnMade = [&](const CmpiObjectPath& found) {
        if (r.is(OP_AssocsOp)) {
            instance = CmpiInstance(found);
            if (far.m_providerHandle->getInstance(r.ctx, found, r.properties, *instance) != 0) {
                return;
            }
        }
        if (instance) {
            r.rslt.returnData(*instance);
        } else {
            r.rslt.returnData(path ? *path : found);
        }
    };
    neighbours({r.ctx, r.cop, target.isFirst(), pair, addInfo}, *objects, make, returnMade);
}

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

/// Runs the two hooks of an operation under the lock, which is free in between.
class zemBaseZemMultiNtoNAssociationProvider::Preparation {
public:
    Preparation(zemBaseZemMultiNtoNAssociationProvider& provider, const CmpiContext& ctx,
                const char* className)
        : m_lock(provider.m_operationLock) {
        const zemSynchronizer hold(m_lock);
        m_hooks.emplace(&provider, ctx, className);
    }
    ~Preparation() {
        const zemSynchronizer hold(m_lock);
        m_hooks.reset();
    }
    Preparation(const Preparation&) = delete;
    Preparation& operator=(const Preparation&) = delete;

    bool succeeded() const { return m_hooks->isInitialized(); }

private:
    zemSynchronizerContext& m_lock;
    std::optional<zemAssociationDataPrepareUtility> m_hooks;
};

void zemBaseZemMultiNtoNAssociationProvider::prepare(const CmpiContext& ctx, const char* className,
                                                     const CmpiObjectPath&, const Work& work) {
    const Preparation preparation(*this, ctx, className);
    if (preparation.succeeded()) {
        work(nullptr);
    }
}

void zemBaseZemMultiNtoNAssociationProvider::join(const Enumeration& e, const Paths& lefts,
                                                  const Paths& rights, const Pair& pair, void*) {
    const zemSynchronizer hold(m_operationLock);
    const PathsLike request(e.cop);
    for (int i = 0; i < lefts.size(); ++i) {
        for (int j = 0; j < rights.size(); ++j) {
            const CmpiObjectPath& left = *lefts[i];
            const CmpiObjectPath& right = *rights[j];
            if (!isValidateAssociation(e.ctx, left, right, pair)) {
                continue;
            }
            if (e.paths != nullptr) {
                zemAppend(*e.paths, associate(request, left, right));
            } else {
                zemAppend(*e.instances, associate(request, left, right, e.properties, nullptr));
            }
        }
    }
}

void zemBaseZemMultiNtoNAssociationProvider::neighbours(const Source& source, const Paths& targets,
                                                        const Make& make, const Found& found) {
    for (int i = 0; i < targets.size(); ++i) {
        const CmpiObjectPath& target = *targets[i];
        if (belongs(source.ctx, source.left(target), source.right(target), source.pair, nullptr,
                    make)) {
            found(target);
        }
    }
}

bool zemBaseZemMultiNtoNAssociationProvider::belongs(const CmpiContext& ctx,
                                                     const CmpiObjectPath& left,
                                                     const CmpiObjectPath& right, const Pair& pair,
                                                     void*, const Make& make) {
    const zemSynchronizer hold(m_operationLock);
    if (!isValidateAssociation(ctx, left, right, pair)) {
        return false;
    }
    make(left, right);
    return true;
}

void zemBaseZemMultiNtoNAssociationProvider::nameKeys(CmpiObjectPath& ncop,
                                                      const CmpiObjectPath& left,
                                                      const CmpiObjectPath& right,
                                                      const char* className) {
    addKeys(ncop, left, right, className);
}

void zemBaseZemMultiNtoNAssociationProvider::complete(CmpiInstance& inst,
                                                      const CmpiObjectPath& left,
                                                      const CmpiObjectPath& right,
                                                      const char** properties,
                                                      const char* className, void*) {
    addProperties(inst, left, right, properties, className);
}

void zemBaseZemMultiNtoNAssociationProvider::findTargets(const CmpiContext& ctx,
                                                         const CmpiObjectPath& cop,
                                                         const char* assocClass,
                                                         const char* resultClass, const char* role,
                                                         const char* resultRole, Targets& targets) {
    CheckAssociationOperationParameters(ctx, cop, assocClass, resultClass, role, resultRole,
                                        targets);
}

bool zemBaseZemMultiNtoNAssociationProvider::standsLeft(const CmpiContext& ctx,
                                                        const CmpiObjectPath& cop) {
    return isFirstClassWhen2ClassTheSame(ctx, cop);
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
    for (int i = 0; i < leftCops.size(); ++i) {
        setValidAssociationIndexPairSet(ctx, *leftCops[i], i, rightCops, hash, pairs, addInfo);
    }
    return pairs;
}

zemEnhanceBaseZemMultiNtoNAssociationProvider::PathsByKey
zemEnhanceBaseZemMultiNtoNAssociationProvider::getObjectPathHashRes(const Paths& rightCops) {
    PathsByKey hash;
    for (int j = 0; j < rightCops.size(); ++j) {
        hash.insert(getObjectPathHashKeyString(*rightCops[j], false), j);
    }
    return hash;
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::setValidAssociationIndexPairSet(
    const CmpiContext& ctx, const CmpiObjectPath& leftCop, int leftIndex, const Paths& rightCops,
    const PathsByKey& hash, IndexPairs& pairs, void* addInfo) {
    for (const int j : hash.getElement(getObjectPathHashKeyString(leftCop, true))) {
        if (isValidateAssociationPlus(ctx, leftCop, *rightCops[j], addInfo)) {
            pairs.addElement(
                std::make_unique<objectPathIndexPair>(objectPathIndexPair{leftIndex, j}));
        }
    }
}

std::set<int> zemEnhanceBaseZemMultiNtoNAssociationProvider::getValidIndexSet(
    const CmpiContext& ctx, const CmpiObjectPath& source, bool isFirst, const Paths& targets,
    void* addInfo) {
    const zemString key = getObjectPathHashKeyString(source, isFirst);
    std::set<int> found;
    for (int i = 0; i < targets.size(); ++i) {
        if (getObjectPathHashKeyString(*targets[i], !isFirst) == key &&
            isValidateAssociationPlus(ctx, isFirst ? source : *targets[i],
                                      isFirst ? *targets[i] : source, addInfo)) {
            found.insert(found.end(), i);
        }
    }
    return found;
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::setValidAssociationKeys(
    const CmpiObjectPath& cop, const Paths& lefts, const Paths& rights, const IndexPairs& pairs,
    Paths& out) {
    const PathsLike request(cop);
    for (int i = 0; i < pairs.size(); ++i) {
        zemAppend(out, associate(request, *lefts[pairs[i]->m_copsIndex1],
                                 *rights[pairs[i]->m_copsIndex2]));
    }
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::setValidAssociationProperties(
    const CmpiObjectPath& cop, const Paths& lefts, const Paths& rights, const IndexPairs& pairs,
    const char** properties, void* addInfo, zemDynamicArray<CmpiInstance>& out) {
    const PathsLike request(cop);
    for (int i = 0; i < pairs.size(); ++i) {
        zemAppend(out, associate(request, *lefts[pairs[i]->m_copsIndex1],
                                 *rights[pairs[i]->m_copsIndex2], properties, addInfo));
    }
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::prepare(const CmpiContext& ctx,
                                                            const char* className,
                                                            const CmpiObjectPath& cop,
                                                            const Work& work) {
    zemAssociationDataPrepareUtilityPlus preparation(this, ctx, className, cop);
    work(preparation.run());
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::join(const Enumeration& e, const Paths& lefts,
                                                         const Paths& rights, const Pair&,
                                                         void* addInfo) {
    const IndexPairs pairs = findValidAssociationCopMappingPair(e.ctx, lefts, rights, addInfo);
    if (e.paths != nullptr) {
        setValidAssociationKeys(e.cop, lefts, rights, pairs, *e.paths);
    } else {
        setValidAssociationProperties(e.cop, lefts, rights, pairs, e.properties, addInfo,
                                      *e.instances);
    }
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::neighbours(const Source& source,
                                                               const Paths& targets,
                                                               const Make& make,
                                                               const Found& found) {
    for (const int i :
         getValidIndexSet(source.ctx, source.cop, source.isFirst, targets, source.addInfo)) {
        const CmpiObjectPath& target = *targets[i];
        make(source.left(target), source.right(target));
        found(target);
    }
}

bool zemEnhanceBaseZemMultiNtoNAssociationProvider::belongs(const CmpiContext& ctx,
                                                            const CmpiObjectPath& left,
                                                            const CmpiObjectPath& right,
                                                            const Pair&, void* addInfo,
                                                            const Make& make) {
    if (getObjectPathHashKeyString(left, true) != getObjectPathHashKeyString(right, false) ||
        !isValidateAssociationPlus(ctx, left, right, addInfo) ||
        !isValidateAssociation(ctx, left, right, addInfo)) {
        return false;
    }
    make(left, right);
    return true;
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::nameKeys(CmpiObjectPath& ncop,
                                                             const CmpiObjectPath& left,
                                                             const CmpiObjectPath& right,
                                                             const char* className) {
    addKeys(ncop, left, right, className);
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::complete(CmpiInstance& inst,
                                                             const CmpiObjectPath& left,
                                                             const CmpiObjectPath& right,
                                                             const char** properties,
                                                             const char* className, void* addInfo) {
    addProperties(inst, left, right, properties, className, addInfo);
}

void zemEnhanceBaseZemMultiNtoNAssociationProvider::findTargets(
    const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
    const char* resultClass, const char* role, const char* resultRole, Targets& targets) {
    CheckAssociationOperationParameters(ctx, cop, assocClass, resultClass, role, resultRole,
                                        targets);
}

bool zemEnhanceBaseZemMultiNtoNAssociationProvider::standsLeft(const CmpiContext& ctx,
                                                               const CmpiObjectPath& cop) {
    return isFirstClassWhen2ClassTheSame(ctx, cop);
}
