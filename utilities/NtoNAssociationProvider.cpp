#include "NtoNAssociationProvider.h"

#include <string>

#include "AssociationSupport.h"
#include "BaseProviderText.h"
#include "Exception.h"

zemNtoNAssociationProvider::zemNtoNAssociationProvider(
    const CmpiBroker& mbp, const CmpiContext& ctx, const char* anAssocClassName,
    const char* aRefClassName1, const char* aRefClassName2, const char* aRefPropName1,
    const char* aRefPropName2, SupportedOpType aSupportedOperations, const char* aNameSpace1,
    const char* aNameSpace2, const char* aAssoNameSpace)
    : zemNtoNAssociationProvider(mbp, ctx, "zemNtoNAssociationProvider", anAssocClassName,
                                 aRefClassName1, aRefClassName2, aRefPropName1, aRefPropName2,
                                 aSupportedOperations, aNameSpace1, aNameSpace2, aAssoNameSpace) {}

zemNtoNAssociationProvider::zemNtoNAssociationProvider(
    const CmpiBroker& mbp, const CmpiContext& ctx, const char* providerName,
    const char* anAssocClassName, const char* aRefClassName1, const char* aRefClassName2,
    const char* aRefPropName1, const char* aRefPropName2, SupportedOpType aSupportedOperations,
    const char* aNameSpace1, const char* aNameSpace2, const char* aAssoNameSpace)
    : CmpiBaseMI(mbp, ctx),
      zemServerAssociation(mbp, ctx, providerName),
      m_assocClassName(anAssocClassName),
      m_refClassName1(aRefClassName1),
      m_refClassName2(aRefClassName2),
      m_refPropName1(aRefPropName1),
      m_refPropName2(aRefPropName2),
      m_assoNameSpace(aAssoNameSpace),
      m_nameSpace1(aNameSpace1),
      m_nameSpace2(aNameSpace2),
      m_supportedOperations(aSupportedOperations) {}

zemNtoNAssociationProvider::~zemNtoNAssociationProvider() = default;

CMPIBoolean zemNtoNAssociationProvider::isValidInstanceClass(const char* name) {
    return zemServesClass(name, m_assocClassName, m_supportedOperations, OP_AllInstOps);
}

CMPIBoolean zemNtoNAssociationProvider::isValidAssociationClass(const char* name) {
    return zemServesClass(name, m_assocClassName, m_supportedOperations,
                          OP_OnlyAssocOps | OP_OnlyRefOps);
}

void zemNtoNAssociationProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    zemListReferences(keys, m_refPropName1, m_refPropName2);
}

zemString zemNtoNAssociationProvider::getAssoNameSpace(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_assoNameSpace, cop);
}

zemString zemNtoNAssociationProvider::getNameSpace1(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_nameSpace1, cop);
}

zemString zemNtoNAssociationProvider::getNameSpace2(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_nameSpace2, cop);
}

// ---- Hooks --------------------------------------------------------------------------------------

void zemNtoNAssociationProvider::addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                                         const CmpiObjectPath& cop2, const char*) {
    zemSetReferences(ncop, m_refPropName1, cop1, m_refPropName2, cop2);
}

void zemNtoNAssociationProvider::addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                                               const CmpiObjectPath& cop2, const char**,
                                               const char*) {
    zemSetReferences(inst, m_refPropName1, cop1, m_refPropName2, cop2);
}

bool zemNtoNAssociationProvider::isFirstClass(const CmpiObjectPath& cop, const char* resultClass,
                                              const char* role, const char* resultRole) {
    if (zemIsGiven(role)) {
        if (zemString::equalsIgnoreCase(m_refPropName1, role)) {
            return true;
        }
        if (zemString::equalsIgnoreCase(m_refPropName2, role)) {
            return false;
        }
    }
    const zemString className = zemClassOf(cop);
    if (compareClassNames(className, m_refClassName1)) {
        return true;
    }
    if (compareClassNames(className, m_refClassName2)) {
        return false;
    }

    const bool is1 = zemPathIsA(cop, m_refClassName1);
    const bool is2 = zemPathIsA(cop, m_refClassName2);
    if (is1 != is2) {
        return is1;
    }
    const zemString nameSpace = zemTextOf(cop.getNameSpace());
    if (is1) {
        if (zemClassIsA(nameSpace, m_refClassName1, m_refClassName2)) {
            return true;
        }
        if (zemClassIsA(nameSpace, m_refClassName2, m_refClassName1)) {
            return false;
        }
    }
    if (zemIsGiven(resultRole)) {
        if (zemString::equalsIgnoreCase(m_refPropName1, resultRole)) {
            return false;
        }
        if (zemString::equalsIgnoreCase(m_refPropName2, resultRole)) {
            return true;
        }
    }
    return !zemIsGiven(resultClass) || !zemClassIsA(nameSpace, m_refClassName1, resultClass);
}

bool zemNtoNAssociationProvider::isValidateAssociation(const CmpiContext&, const CmpiObjectPath&,
                                                       const CmpiObjectPath&) {
    return true;
}

bool zemNtoNAssociationProvider::BeforeGenerateAssociation(const CmpiContext&) { return true; }

void zemNtoNAssociationProvider::AfterGenerateAssociation(const CmpiContext&) {}

int zemNtoNAssociationProvider::validateSourceObject(const CmpiContext& ctx,
                                                     const CmpiObjectPath& cop,
                                                     const char* callingMethod) {
    zemAssociationCall call(*this, m_providerName, *broker, zemAssociationCall::kValidateSource,
                            ctx, cop);
    call.setWord(callingMethod);
    return call.validateSource(m_synchContext);
}

// ---- Instances ----------------------------------------------------------------------------------

CmpiInstance zemNtoNAssociationProvider::performGetInstance(const CmpiContext& ctx,
                                                            const CmpiObjectPath& cop,
                                                            const char** properties) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_GetInstOp, ctx, cop);
    call.require(m_supportedOperations);
    const CmpiObjectPath cop1 = call.reference(m_refPropName1);
    const CmpiObjectPath cop2 = call.reference(m_refPropName2);
    std::optional<CmpiInstance> result;
    call.guard([&] {
        const zemSynchronizer hold(m_synchContext);
        const CmpiObjectPath path1 = call.getInstance(cop1).getObjectPath();
        const CmpiObjectPath path2 = call.getInstance(cop2).getObjectPath();
        const zemString refusal = refuseReferences(ctx, cop1, cop2);
        if (!refusal.isEmpty()) {
            throw zemInvalidParameterException(refusal);
        }
        CmpiObjectPath ncop = createObjectPath(cop);
        result = zemReferenceInstance(*this, ncop, path1, path2, properties, call.className());
    });
    return *result;
}

/// What is wrong with a pair of references to existing objects; empty when they are associated.
zemString zemNtoNAssociationProvider::refuseReferences(const CmpiContext& ctx,
                                                       const CmpiObjectPath& cop1,
                                                       const CmpiObjectPath& cop2) {
    const zemString text1 = objectPathToString(cop1);
    const zemString text2 = objectPathToString(cop2);
    const auto invalid = [this](const zemString& text, const zemString& property) {
        return "Invalid value " + text + " for the property " + property + " of the class " +
               m_assocClassName + " is provided to method getInstance on provider " +
               m_providerName;
    };
    if (!zemIsOfClass(cop1, m_refClassName1)) {
        return invalid(text1, m_refPropName1);
    }
    if (!zemIsOfClass(cop2, m_refClassName2)) {
        return invalid(text2, m_refPropName2);
    }
    if (isValidateAssociation(ctx, cop1, cop2)) {
        return zemString();
    }
    return "There doesn't exist an association " + m_assocClassName + " between the property " +
           m_refPropName1 + " with value " + text1 + " and the property " + m_refPropName2 +
           " with value " + text2;
}

void zemNtoNAssociationProvider::enumerate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    call.guard([&] {
        const zemSynchronizer hold(m_synchContext);
        const auto cops1 = call.paths(getNameSpace1(r.cop), m_refClassName1);
        const auto cops2 = call.paths(getNameSpace2(r.cop), m_refClassName2);
        if (!BeforeGenerateAssociation(r.ctx)) {
            return;
        }
        for (const CmpiObjectPath& cop1 : cops1) {
            for (const CmpiObjectPath& cop2 : cops2) {
                if (isValidateAssociation(r.ctx, cop1, cop2)) {
                    zemReturnReference(*this, r.rslt, createObjectPath(r.cop), cop1, cop2,
                                       r.properties, call.className(), r.is(OP_EnumInstsOp));
                }
            }
        }
        AfterGenerateAssociation(r.ctx);
    });
}

// ---- Navigation ---------------------------------------------------------------------------------

void zemNtoNAssociationProvider::navigate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    call.guard([&] {
        const bool first = isFirstClass(r.cop, r.resultClass, r.role, r.resultRole);
        if (!passesFilters(r, first)) {
            return;
        }
        const zemString nameSpace = first ? getNameSpace2(r.cop) : getNameSpace1(r.cop);
        zemString target = first ? m_refClassName2 : m_refClassName1;
        if (!narrowTarget(r, nameSpace, target)) {
            return;
        }
        if (validateSourceObject(r.ctx, r.cop, call.word()) != 0) {
            return;
        }
        if (r.is(OP_RefsOp)) {
            validateProerties(call.classPath(getAssoNameSpace(r.cop), m_assocClassName),
                              r.properties, call.word());
        }
        const zemSynchronizer hold(m_synchContext);
        returnNeighbours(call, r, call.classPath(nameSpace, target), first);
    });
}

/// Whether the source can be on its side, and the other side be what the client wants.
bool zemNtoNAssociationProvider::passesFilters(const zemAssociationRequest& r, bool first) const {
    const zemString& sourceRole = first ? m_refPropName1 : m_refPropName2;
    const zemString& targetRole = first ? m_refPropName2 : m_refPropName1;
    const auto fits = [](const char* role, const zemString& property) {
        return !zemIsGiven(role) || zemString::equalsIgnoreCase(property, role);
    };
    return fits(r.role, sourceRole) && fits(r.resultRole, targetRole) &&
           zemPathIsA(r.cop, first ? m_refClassName1 : m_refClassName2) &&
           (!zemIsGiven(r.resultClass) ||
            zemClassIsA(zemTextOf(r.cop.getNameSpace()), first ? m_refClassName2 : m_refClassName1,
                        r.resultClass));
}

/// Replaces the target class by the result class where that is the more derived.
/// @return false when neither is derived from the other, so that there is nothing to return
bool zemNtoNAssociationProvider::narrowTarget(const zemAssociationRequest& r, const char* nameSpace,
                                              zemString& target) const {
    if (!zemIsGiven(r.resultClass) || zemClassIsA(nameSpace, target, r.resultClass)) {
        return true;
    }
    if (!zemClassIsA(nameSpace, r.resultClass, target)) {
        return false;
    }
    target = r.resultClass;
    return true;
}

/// The associators are read one by one as the server hands them over; only the references, whose
/// paths are put in place first, are read as a whole.
void zemNtoNAssociationProvider::returnNeighbours(zemAssociationCall& call,
                                                  const zemAssociationRequest& r,
                                                  const CmpiObjectPath& target, bool first) {
    if (r.is(OP_AssocsOp)) {
        validateProerties(target, r.properties, call.word());
    }
    CmpiEnumeration objects = call.targets(r, target, zemClassOf(target));
    std::vector<zemAssociationCandidate> all;
    while (r.is(OP_OnlyRefOps) && objects.hasNext()) {
        all.push_back(zemNextCandidate(objects, false));
        call.place(all.back().path, zemTextOf(target.getNameSpace()));
    }
    if (!BeforeGenerateAssociation(r.ctx)) {
        return;
    }
    const auto makePath = [&] { return call.classPath(getAssoNameSpace(r.cop), m_assocClassName); };
    const auto tryPair = [&](const zemAssociationCandidate& candidate) {
        const CmpiObjectPath& cop1 = first ? r.cop : candidate.path;
        const CmpiObjectPath& cop2 = first ? candidate.path : r.cop;
        if (isValidateAssociation(r.ctx, cop1, cop2)) {
            zemReturnNeighbour(*this, r, candidate, cop1, cop2, m_assocClassName, makePath);
        }
    };
    for (const zemAssociationCandidate& candidate : all) {
        tryPair(candidate);
    }
    while (objects.hasNext()) {
        tryPair(zemNextCandidate(objects, r.is(OP_AssocsOp)));
    }
    AfterGenerateAssociation(r.ctx);
}
