#include "MultiNtoNAssociationProvider.h"

#include <cstring>
#include <memory>
#include <vector>

#include "AssociationSupport.h"
#include "BaseProviderText.h"
#include "Exception.h"
#include "HashTable.h"
#include "ProviderTracer.h"

namespace {

constexpr const char* kDefaultNameSpace = "root/cimv2";

zemString givenOr(const zemString& nameSpace, const char* fallback) {
    return nameSpace.isEmpty() ? zemString(fallback) : nameSpace;
}

/// The pairs in a block of names, see the constructor.
zemStringPairs readPairs(const char* block) {
    zemStringPairs pairs;
    const char* name = block;
    while (zemIsGiven(name)) {
        const char* const second = name + std::strlen(name) + 1;
        if (*second == '\0') {
            throw zemInvalidParameterException("");
        }
        pairs.addPair(name, second);
        name = second + std::strlen(second) + 1;
    }
    if (pairs.size() == 0) {
        throw zemInvalidParameterException("");
    }
    return pairs;
}

/// Whether @p fits holds for some pair; later ones are not looked at.
template <class Fits>
bool anyPair(const zemStringPairs& pairs, Fits fits) {
    zemString first, second;
    for (int i = 0; i < pairs.size(); ++i) {
        pairs.getPair(i, first, second);
        if (fits(first, second)) {
            return true;
        }
    }
    return false;
}

/// The names of which no later one is the same or a base: the objects of the others come with it.
zemArray<zemString> aggregate(const zemDynamicArray<zemString>& names, const char* nameSpace) {
    zemArray<zemString> kept(16);
    for (int i = 0; i < names.size(); ++i) {
        bool covered = false;
        for (int j = i + 1; j < names.size() && !covered; ++j) {
            covered = zemClassIsA(nameSpace, *names[i], *names[j]);
        }
        if (!covered) {
            kept.append(*names[i]);
        }
    }
    return kept;
}

using ObjectPaths = std::vector<CmpiObjectPath>;

/// The objects that one enumeration of associations has asked for, by class and namespace.
class ObjectCache {
public:
    ObjectCache(zemAssociationCall& call, zemSynchronizerContext& lock, int classes)
        : m_call(call), m_lock(lock), m_objects(static_cast<unsigned>(classes)) {}

    std::shared_ptr<const ObjectPaths> paths(const zemString& className,
                                             const zemString& nameSpace) {
        const zemString key = className + nameSpace;
        std::shared_ptr<const ObjectPaths> objects;
        if (m_objects.lookup(key, objects) == 0) {
            return objects;
        }
        const zemSynchronizer hold(m_lock);
        objects = std::make_shared<const ObjectPaths>(m_call.paths(nameSpace, className));
        m_objects.insert(key, objects);
        return objects;
    }

private:
    zemAssociationCall& m_call;
    zemSynchronizerContext& m_lock;
    zemHashTable<zemString, std::shared_ptr<const ObjectPaths>, objectCacheHashFunc> m_objects;
};

}  // namespace

zemMultiNtoNAssociationProvider::zemMultiNtoNAssociationProvider(
    const CmpiBroker& mbp, const CmpiContext& ctx, const char* anAssocClassName,
    const char* aRefClassNamePairs, const char* aRefPropName1, const char* aRefPropName2,
    SupportedOpType aSupportedOperations, const char* aNameSpace1, const char* aNameSpace2,
    const char* aAssoNameSpace)
    : zemMultiNtoNAssociationProvider(mbp, ctx, "zemMultiNtoNAssociationProvider", anAssocClassName,
                                      aRefClassNamePairs, aRefPropName1, aRefPropName2,
                                      aSupportedOperations, aNameSpace1, aNameSpace2,
                                      aAssoNameSpace) {}

zemMultiNtoNAssociationProvider::zemMultiNtoNAssociationProvider(
    const CmpiBroker& mbp, const CmpiContext& ctx, const char* providerName,
    const char* anAssocClassName, const char* aRefClassNamePairs, const char* aRefPropName1,
    const char* aRefPropName2, SupportedOpType aSupportedOperations, const char* aNameSpace1,
    const char* aNameSpace2, const char* aAssoNameSpace)
    : CmpiBaseMI(mbp, ctx),
      zemServerAssociation(mbp, ctx, providerName),
      m_assocClassName(anAssocClassName),
      m_refClassNamePairs(readPairs(aRefClassNamePairs)),
      m_refPropName1(aRefPropName1),
      m_refPropName2(aRefPropName2),
      m_assoNameSpace(aAssoNameSpace),
      m_nameSpace1(aNameSpace1),
      m_nameSpace2(aNameSpace2),
      m_supportedOperations(aSupportedOperations),
      m_aFirstClassName(16),
      m_aSecondClassName(16),
      m_isAggregated(false) {}

zemMultiNtoNAssociationProvider::~zemMultiNtoNAssociationProvider() = default;

CMPIBoolean zemMultiNtoNAssociationProvider::isValidInstanceClass(const char* name) {
    return zemServesClass(name, m_assocClassName, m_supportedOperations, OP_AllInstOps);
}

CMPIBoolean zemMultiNtoNAssociationProvider::isValidAssociationClass(const char* name) {
    return zemServesClass(name, m_assocClassName, m_supportedOperations,
                          OP_OnlyAssocOps | OP_OnlyRefOps);
}

void zemMultiNtoNAssociationProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    zemListReferences(keys, m_refPropName1, m_refPropName2);
}

zemString zemMultiNtoNAssociationProvider::getNameSpace1() const {
    return givenOr(m_nameSpace1, kDefaultNameSpace);
}

zemString zemMultiNtoNAssociationProvider::getNameSpace2() const {
    return givenOr(m_nameSpace2, kDefaultNameSpace);
}

zemString zemMultiNtoNAssociationProvider::getNameSpace1(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_nameSpace1, cop);
}

zemString zemMultiNtoNAssociationProvider::getNameSpace2(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_nameSpace2, cop);
}

zemString zemMultiNtoNAssociationProvider::getAssoNameSpace(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_assoNameSpace, cop);
}

// ---- Classes ------------------------------------------------------------------------------------

void zemMultiNtoNAssociationProvider::aggregateReferenceClasses() {
    const zemSynchronizer hold(m_refClassCacheMtx);
    if (m_isAggregated) {
        return;
    }
    const auto first = aggregate(m_refClassNamePairs.getFirstElements(), getNameSpace1());
    const auto second = aggregate(m_refClassNamePairs.getSecondElements(), getNameSpace2());
    // both lists or none: the server may fail meanwhile, and the next operation tries again
    m_aFirstClassName = first;
    m_aSecondClassName = second;
    m_isAggregated = true;
}

bool zemMultiNtoNAssociationProvider::isFirstClass(const CmpiObjectPath& cop, zemString* out) {
    return anyPair(m_refClassNamePairs, [&](const zemString& first, const zemString&) {
        if (!zemPathIsA(cop, first)) {
            return false;
        }
        if (out != nullptr) {
            *out = first;
        }
        return true;
    });
}

bool zemMultiNtoNAssociationProvider::isSecondClass(const CmpiObjectPath& cop, zemString* out) {
    return anyPair(m_refClassNamePairs, [&](const zemString&, const zemString& second) {
        if (!zemPathIsA(cop, second)) {
            return false;
        }
        if (out != nullptr) {
            *out = second;
        }
        return true;
    });
}

int zemMultiNtoNAssociationProvider::getReferenceClass(const CmpiObjectPath& cop1,
                                                       const CmpiObjectPath& cop2,
                                                       zemString& strRefClassName1,
                                                       zemString& strRefClassName2) {
    const bool found =
        anyPair(m_refClassNamePairs, [&](const zemString& first, const zemString& second) {
            if (!zemIsOfClass(cop1, first) || !zemIsOfClass(cop2, second)) {
                return false;
            }
            strRefClassName1 = first;
            strRefClassName2 = second;
            return true;
        });
    return found ? 0 : -1;
}

bool zemMultiNtoNAssociationProvider::hasAssociationBetweenClasses(const char* strRefClassName1,
                                                                   const char* strRefClassName2) {
    PROV_TRACE_LOCALS();
    PROV_TRACE_STRING(4, "Validate relationship between %s and %s", strRefClassName1,
                      strRefClassName2);
    const CmpiObjectPath path1(static_cast<const char*>(getNameSpace1()), strRefClassName1);
    const CmpiObjectPath path2(static_cast<const char*>(getNameSpace2()), strRefClassName2);
    return anyPair(m_refClassNamePairs, [&](const zemString& first, const zemString& second) {
        return zemIsOfClass(path1, first) && zemIsOfClass(path2, second);
    });
}

// ---- Hooks --------------------------------------------------------------------------------------

void zemMultiNtoNAssociationProvider::addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                                              const CmpiObjectPath& cop2, const char*) {
    zemSetReferences(ncop, m_refPropName1, cop1, m_refPropName2, cop2);
}

void zemMultiNtoNAssociationProvider::addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                                                    const CmpiObjectPath& cop2, const char**,
                                                    const char*) {
    zemSetReferences(inst, m_refPropName1, cop1, m_refPropName2, cop2);
}

bool zemMultiNtoNAssociationProvider::isValidateAssociation(const CmpiContext&,
                                                            const CmpiObjectPath&,
                                                            const CmpiObjectPath&) {
    return true;
}

int zemMultiNtoNAssociationProvider::validateSourceObject(const CmpiContext& ctx,
                                                          const CmpiObjectPath& cop,
                                                          const char* callingMethod) {
    zemAssociationCall call(*this, m_providerName, *broker, zemAssociationCall::kValidateSource,
                            ctx, cop, zemAssociationCall::kCodeAsId);
    call.setWord(callingMethod);
    return call.validateSource(m_synchContext);
}

// ---- Instances ----------------------------------------------------------------------------------

CmpiInstance zemMultiNtoNAssociationProvider::performGetInstance(const CmpiContext& ctx,
                                                                 const CmpiObjectPath& cop,
                                                                 const char** properties) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_GetInstOp, ctx, cop);
    call.require(m_supportedOperations);
    const CmpiObjectPath cop1 = call.reference(m_refPropName1);
    const CmpiObjectPath cop2 = call.reference(m_refPropName2);
    zemString class1, class2;
    const bool joined = getReferenceClass(cop1, cop2, class1, class2) == 0;
    const bool fits1 = isFirstClass(cop1, &class1);
    const bool fits2 = isSecondClass(cop2, &class2);
    const zemString text1 = objectPathToString(cop1);
    const zemString text2 = objectPathToString(cop2);
    zemRefuseReferences(fits1 ? nullptr : static_cast<const char*>(text1), m_refPropName1,
                        fits2 ? nullptr : static_cast<const char*>(text2), m_refPropName2,
                        m_assocClassName, m_providerName);
    if (!joined || !isValidateAssociation(ctx, cop1, cop2)) {
        throwObjectNotFoundExc(call.word(), call.className(), objectPathToString(cop));
    }

    const zemSynchronizer hold(m_synchContext);
    const CmpiObjectPath path1 = call.getInstance(cop1).getObjectPath();
    const CmpiObjectPath path2 = call.getInstance(cop2).getObjectPath();
    CmpiObjectPath ncop = createObjectPath(cop);
    return zemReferenceInstance(*this, ncop, path1, path2, properties, call.className());
}

void zemMultiNtoNAssociationProvider::enumerate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    implementEnumeration(r.ctx, r.rslt, r.cop, r.properties,
                         static_cast<SupportedOpType>(r.operation), call.word());
}

void zemMultiNtoNAssociationProvider::implementEnumeration(const CmpiContext& ctx, CmpiResult& rslt,
                                                           const CmpiObjectPath& cop,
                                                           const char** properties,
                                                           SupportedOpType opType,
                                                           const char* callingMethod) {
    zemAssociationCall call(*this, m_providerName, *broker, opType, ctx, cop,
                            zemAssociationCall::kCodeAsId, __func__);
    call.setWord(callingMethod);
    call.guard([&] {
        aggregateReferenceClasses();
        const zemArray<zemString>& firsts = m_aFirstClassName;
        const zemArray<zemString>& seconds = m_aSecondClassName;
        ObjectCache cache(call, m_synchContext, firsts.size() + seconds.size());
        for (int i = 0; i < firsts.size(); ++i) {
            for (int j = 0; j < seconds.size(); ++j) {
                if (!hasAssociationBetweenClasses(firsts[i], seconds[j])) {
                    continue;
                }
                const auto cops1 = cache.paths(firsts[i], getNameSpace1(cop));
                const auto cops2 = cache.paths(seconds[j], getNameSpace2(cop));
                for (const CmpiObjectPath& cop1 : *cops1) {
                    for (const CmpiObjectPath& cop2 : *cops2) {
                        if (isValidateAssociation(ctx, cop1, cop2)) {
                            zemReturnReference(*this, rslt, createObjectPath(cop), cop1, cop2,
                                               properties, call.className(),
                                               opType == OP_EnumInstsOp);
                        }
                    }
                }
            }
        }
    });
}

// ---- Navigation ---------------------------------------------------------------------------------

void zemMultiNtoNAssociationProvider::navigate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    implementAssociation(r.ctx, r.rslt, r.cop, r.assocClass, r.resultClass, r.role, r.resultRole,
                         r.properties, static_cast<SupportedOpType>(r.operation), call.word());
}

void zemMultiNtoNAssociationProvider::implementAssociation(
    const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop, const char*,
    const char* resultClass, const char* role, const char* resultRole, const char** properties,
    SupportedOpType opType, const char* callingMethod) {
    aggregateReferenceClasses();
    if (validateSourceObject(ctx, cop, callingMethod) != 0) {
        return;
    }
    if (opType == OP_RefsOp) {
        validateProerties(createObjectPath(cop, getAssoNameSpace(cop), m_assocClassName),
                          properties, callingMethod);
    }
    const auto fits = [](const char* wanted, const zemString& property) {
        return !zemIsGiven(wanted) || zemString::equalsIgnoreCase(property, wanted);
    };
    zemString sourceName1, sourceName2;
    const bool first = fits(role, m_refPropName1) && isFirstClass(cop, &sourceName1) &&
                       fits(resultRole, m_refPropName2);
    const bool second = fits(role, m_refPropName2) && isSecondClass(cop, &sourceName2) &&
                        fits(resultRole, m_refPropName1);
    if (first) {
        association(ctx, rslt, cop, resultClass, properties, sourceName1, true, opType,
                    callingMethod);
    }
    if (second) {
        association(ctx, rslt, cop, resultClass, properties, sourceName2, false, opType,
                    callingMethod);
    }
}

void zemMultiNtoNAssociationProvider::association(const CmpiContext& ctx, CmpiResult& rslt,
                                                  const CmpiObjectPath& cop,
                                                  const char* resultClass, const char** properties,
                                                  const char* sourceName, bool isFirst,
                                                  SupportedOpType opType,
                                                  const char* callingMethod) {
    zemAssociationCall call(*this, m_providerName, *broker, opType, ctx, cop,
                            zemAssociationCall::kCodeAsId, __func__);
    call.setWord(callingMethod);
    const zemAssociationRequest request{opType,           ctx,        rslt, cop, properties,
                                        m_assocClassName, resultClass};
    const zemString nameSpace = isFirst ? getNameSpace2(cop) : getNameSpace1(cop);
    const char* const source = zemIsGiven(sourceName) ? sourceName : call.className();
    const zemArray<zemString>& targets = isFirst ? m_aSecondClassName : m_aFirstClassName;
    call.guard([&] {
        for (int i = 0; i < targets.size(); ++i) {
            const char* const target = targets[i];
            const bool joined = isFirst ? hasAssociationBetweenClasses(source, target)
                                        : hasAssociationBetweenClasses(target, source);
            if (joined && isWanted(target, nameSpace, resultClass)) {
                returnNeighbours(call, request, target, nameSpace, isFirst);
            }
        }
    });
}

/// Whether objects of a class can be of the result class, either being the more derived.
bool zemMultiNtoNAssociationProvider::isWanted(const char* targetName, const char* nameSpace,
                                               const char* resultClass) const {
    return !zemIsGiven(resultClass) || zemClassIsA(nameSpace, targetName, resultClass) ||
           zemClassIsA(nameSpace, resultClass, targetName);
}

void zemMultiNtoNAssociationProvider::returnNeighbours(zemAssociationCall& call,
                                                       const zemAssociationRequest& r,
                                                       const char* targetName,
                                                       const char* nameSpace, bool isFirst) {
    PROV_TRACE_LOCALS();
    const CmpiObjectPath target = call.classPath(nameSpace, targetName);
    const bool instances = r.is(OP_AssocsOp);
    if (instances) {
        validateProerties(target, r.properties, call.word());
    }
    const auto makePath = [&] { return call.classPath(getAssoNameSpace(r.cop), m_assocClassName); };

    const zemSynchronizer hold(m_synchContext);
    PROV_TRACE_STRING(4, instances ? "EnumInstances %s:%s" : "EnumInstanceNames %s:%s", nameSpace,
                      targetName);
    CmpiEnumeration objects = call.targets(r, target, targetName);
    while (objects.hasNext()) {
        zemAssociationCandidate candidate = zemNextCandidate(objects, instances);
        const CmpiObjectPath& cop1 = isFirst ? r.cop : candidate.path;
        const CmpiObjectPath& cop2 = isFirst ? candidate.path : r.cop;
        if (!isValidateAssociation(r.ctx, cop1, cop2)) {
            continue;
        }
        if (!instances) {
            candidate.path.setNameSpace(nameSpace);
        }
        zemReturnNeighbour(*this, r, candidate, cop1, cop2, m_assocClassName, makePath);
    }
}
