#include "AssociationProvider.h"

#include <memory>
#include <string>

#include "AssociationSupport.h"
#include "BaseProviderText.h"
#include "Exception.h"
#include "Log.h"

namespace {

using Rows = zemDynamicArray<zemAssociationData>;

[[noreturn]] void throwInvalidName(const char* name) {
    const std::string text = std::string("Invalid association name ") + (name ? name : "");
    throw zemInvalidParameterException(text.c_str());
}

/// Refuses references that fit no row. A second object counts as derived when it derives from a
/// first class: subclasses on side 2 pass only where both sides share an ancestor, and clients
/// that name them are told so.
void checkReferences(const Rows& rows, const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                     const char* className, const char* providerName) {
    const zemString class2 = zemClassOf(cop2);
    bool fits1 = false;
    bool fits2 = false;
    for (int i = 0; i < rows.size(); ++i) {
        const zemAssociationData& row = *rows[i];
        fits1 = fits1 || zemIsOfClass(cop1, row.m_refClassName1);
        fits2 = fits2 || zemBaseProvider::compareClassNames(class2, row.m_refClassName2) ||
                zemPathIsA(cop2, row.m_refClassName1);
    }
    const zemString text1 = zemBaseProvider::objectPathToString(cop1);
    const zemString text2 = zemBaseProvider::objectPathToString(cop2);
    zemRefuseReferences(fits1 ? nullptr : static_cast<const char*>(text1), rows[0]->m_refPropName1,
                        fits2 ? nullptr : static_cast<const char*>(text2), rows[0]->m_refPropName2,
                        className, providerName);
}

/// Whether a path is of the class on one side of some row.
bool isOfAny(const Rows& rows, const CmpiObjectPath& cop, zemString zemAssociationData::*side) {
    for (int i = 0; i < rows.size(); ++i) {
        if (zemPathIsA(cop, rows[i]->*side)) {
            return true;
        }
    }
    return false;
}

/// Whether the class of a path is named in some row as first class.
bool isNamedFirst(const Rows& rows, const CmpiObjectPath& cop) {
    const zemString className = zemClassOf(cop);
    for (int i = 0; i < rows.size(); ++i) {
        if (zemBaseProvider::compareClassNames(className, rows[i]->m_refClassName1)) {
            return true;
        }
    }
    return false;
}

/// A line of progress on standard output, which the enumeration of names alone reports.
void report(const zemAssociationRequest& r, const char* text) {
    if (r.is(zemAssociationBits::OP_EnumInstNamesOp)) {
        zemLog::LogPlain((std::string("performEnumInstanceNames") + text).c_str());
    }
}

/// The same with two inserts: "label: first;second".
void report(const zemAssociationRequest& r, const char* label, const std::string& first,
            const std::string& second) {
    report(r, (label + first + ";" + second).c_str());
}

}  // namespace

zemSynchronizerContext zemAssociationProvider::m_synchContext;

// ---- zemAssociationData -------------------------------------------------------------------------

zemAssociationData::zemAssociationData(const char* assocClassName, const char* assoNameSpace,
                                       const char* refClassName1, const char* refPropName1,
                                       const char* nameSpace1, const char* refClassName2,
                                       const char* refPropName2, const char* nameSpace2)
    : m_assocClassName(assocClassName),
      m_assoNameSpace(assoNameSpace),
      m_refClassName1(refClassName1),
      m_refPropName1(refPropName1),
      m_nameSpace1(nameSpace1),
      m_refClassName2(refClassName2),
      m_refPropName2(refPropName2),
      m_nameSpace2(nameSpace2) {}

zemAssociationData::~zemAssociationData() = default;

zemString zemAssociationData::getNameSpace1(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_nameSpace1, cop);
}

zemString zemAssociationData::getNameSpace2(const CmpiObjectPath& cop) const {
    return zemNameSpaceOr(m_nameSpace2, cop);
}

struct zemAssociationData::Filters {
    const char* resultClass;
    const char* role;
    const char* resultRole;
};

const zemString* zemAssociationData::matchRole(const char* role) const {
    if (zemString::equalsIgnoreCase(m_refPropName1, role)) {
        return &m_refPropName1;
    }
    if (zemString::equalsIgnoreCase(m_refPropName2, role)) {
        return &m_refPropName2;
    }
    return nullptr;
}

const zemString* zemAssociationData::matchClass(const CmpiObjectPath& cop,
                                                const char* className) const {
    const zemString nameSpace = zemTextOf(cop.getNameSpace());
    for (const zemString* side : {&m_refClassName1, &m_refClassName2}) {
        if (zemBaseProvider::compareClassNames(className, *side) ||
            zemClassIsA(nameSpace, *side, className)) {
            return side;
        }
    }
    return nullptr;
}

bool zemAssociationData::checkSide(bool first, const CmpiObjectPath& cop, zemString& sourceClass,
                                   zemString& sourceRole, zemString* resultRole,
                                   const Filters& filters) const {
    if (resultRole != nullptr) {
        *resultRole = "";
    }
    if (!zemIsOfClass(cop, first ? m_refClassName1 : m_refClassName2)) {
        return false;
    }
    sourceClass = first ? m_refClassName1 : m_refClassName2;
    sourceRole = first ? m_refPropName1 : m_refPropName2;
    const zemString& resultClass = first ? m_refClassName2 : m_refClassName1;
    if (resultRole != nullptr) {
        *resultRole = first ? m_refPropName2 : m_refPropName1;
    }

    if (zemIsGiven(filters.role)) {
        const zemString* const role = matchRole(filters.role);
        if (role == nullptr || *role != sourceRole) {
            return false;
        }
    }
    const zemString* wantedRole = nullptr;
    if (zemIsGiven(filters.resultRole)) {
        wantedRole = matchRole(filters.resultRole);
        if (wantedRole == nullptr) {
            return false;
        }
        if (resultRole != nullptr && *wantedRole != *resultRole) {
            return false;
        }
    }
    const zemString* wantedClass = nullptr;
    if (zemIsGiven(filters.resultClass)) {
        wantedClass = matchClass(cop, filters.resultClass);
        if (wantedClass == nullptr || *wantedClass != resultClass) {
            return false;
        }
    }
    if (wantedRole == nullptr || wantedClass == nullptr) {
        return true;
    }
    // With one class on both sides, the role wanted would have to be that of both.
    const auto agrees = [&](const zemString& className, const zemString& role) {
        return !zemString::equalsIgnoreCase(resultClass, className) ||
               zemString::equalsIgnoreCase(*wantedRole, role);
    };
    return agrees(m_refClassName1, m_refPropName1) && agrees(m_refClassName2, m_refPropName2);
}

bool zemAssociationData::getAssoDataFromOperation1(const CmpiObjectPath& cop,
                                                   zemString& sourceClass, zemString& sourceRole,
                                                   zemString* resultRole, const char* pResultClass,
                                                   const char* pRole,
                                                   const char* pResultRole) const {
    return checkSide(true, cop, sourceClass, sourceRole, resultRole,
                     {pResultClass, pRole, pResultRole});
}

bool zemAssociationData::getAssoDataFromOperation2(const CmpiObjectPath& cop,
                                                   zemString& sourceClass, zemString& sourceRole,
                                                   zemString* resultRole, const char* pResultClass,
                                                   const char* pRole,
                                                   const char* pResultRole) const {
    return checkSide(false, cop, sourceClass, sourceRole, resultRole,
                     {pResultClass, pRole, pResultRole});
}

bool zemAssociationData::getAssoDataFromOperation(const CmpiObjectPath& cop, zemString& sourceClass,
                                                  zemString& sourceRole, zemString* resultRole,
                                                  const char* pResultClass, const char* pRole,
                                                  const char* pResultRole) const {
    return checkSide(zemIsOfClass(cop, m_refClassName1), cop, sourceClass, sourceRole, resultRole,
                     {pResultClass, pRole, pResultRole});
}

// ---- The table ----------------------------------------------------------------------------------

zemAssociationProvider::zemAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                               SupportedOpType supportedOperations)
    : zemAssociationProvider(mb, ctx, "zemAssociationProvider", supportedOperations) {}

zemAssociationProvider::zemAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                               const char* providerName,
                                               SupportedOpType supportedOperations)
    : CmpiBaseMI(mb, ctx),
      zemServerAssociation(mb, ctx, providerName),
      m_supportedOperations(supportedOperations),
      m_assoData(25),
      m_aFirstClassName(16),
      m_aSecondClassName(16) {}

zemAssociationProvider::~zemAssociationProvider() = default;

void zemAssociationProvider::addAssoData(zemAssociationData* row) { m_assoData.addElement(row); }

zemAssociationData* zemAssociationProvider::getAssoData(const char* name) const {
    for (int i = 0; i < m_assoData.size(); ++i) {
        zemAssociationData* const row = m_assoData[i];
        if (row != nullptr && zemString::equalsIgnoreCase(row->m_assocClassName, name)) {
            return row;
        }
    }
    return nullptr;
}

zemDynamicArray<zemAssociationData>* zemAssociationProvider::getAssoDataSet(
    const char* name) const {
    auto set = std::make_unique<Rows>(25);
    for (int i = 0; i < m_assoData.size(); ++i) {
        const zemAssociationData* const row = m_assoData[i];
        if (row != nullptr && zemString::equalsIgnoreCase(row->m_assocClassName, name)) {
            set->addElement(std::make_unique<zemAssociationData>(*row));
        }
    }
    return set.release();
}

const zemAssociationData& zemAssociationProvider::requireAssoData(const char* name) const {
    const zemAssociationData* const row = getAssoData(name);
    if (row == nullptr) {
        throwInvalidName(name);
    }
    return *row;
}

CMPIBoolean zemAssociationProvider::isValidInstanceClass(const char* name) {
    return zemServesClass(name, requireAssoData(name).m_assocClassName, m_supportedOperations,
                          OP_AllInstOps);
}

CMPIBoolean zemAssociationProvider::isValidAssociationClass(const char* name) {
    return zemServesClass(name, requireAssoData(name).m_assocClassName, m_supportedOperations,
                          OP_OnlyAssocOps | OP_OnlyRefOps);
}

void zemAssociationProvider::populateEssentialKeys(const char* name, CmpiArray& keys) {
    const zemAssociationData& row = requireAssoData(name);
    zemListReferences(keys, row.m_refPropName1, row.m_refPropName2);
}

// ---- Hooks --------------------------------------------------------------------------------------

void zemAssociationProvider::addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                                     const CmpiObjectPath& cop2, const char* className) {
    const zemAssociationData& row = requireAssoData(className);
    zemSetReferences(ncop, row.m_refPropName1, cop1, row.m_refPropName2, cop2);
}

void zemAssociationProvider::addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                                           const CmpiObjectPath& cop2, const char**,
                                           const char* className) {
    const zemAssociationData& row = requireAssoData(className);
    zemSetReferences(inst, row.m_refPropName1, cop1, row.m_refPropName2, cop2);
}

bool zemAssociationProvider::isValidateAssociation(const CmpiContext&, const zemAssociationData&,
                                                   const CmpiObjectPath&, const CmpiObjectPath&) {
    return true;
}

bool zemAssociationProvider::BeforeGenerateAssociation(const CmpiContext&, const char*) {
    return true;
}

void zemAssociationProvider::AfterGenerateAssociation(const CmpiContext&, const char*) {}

int zemAssociationProvider::getReferenceClass(const CmpiObjectPath& cop1,
                                              const CmpiObjectPath& cop2,
                                              zemString& strRefClassName1,
                                              zemString& strRefClassName2, const char* className) {
    const std::unique_ptr<Rows> rows(getAssoDataSet(className));
    for (int i = 0; i < rows->size(); ++i) {
        const zemAssociationData& row = *(*rows)[i];
        strRefClassName1 = row.m_refClassName1;
        strRefClassName2 = row.m_refClassName2;
        if (zemIsOfClass(cop1, row.m_refClassName1) && zemIsOfClass(cop2, row.m_refClassName2)) {
            break;
        }
    }
    return 0;
}

bool zemAssociationProvider::isFirstClass(const CmpiObjectPath& cop, const char* className) {
    const std::unique_ptr<Rows> rows(getAssoDataSet(className));
    return isOfAny(*rows, cop, &zemAssociationData::m_refClassName1);
}

bool zemAssociationProvider::isSecondClass(const CmpiObjectPath& cop, const char* className) {
    const std::unique_ptr<Rows> rows(getAssoDataSet(className));
    return isOfAny(*rows, cop, &zemAssociationData::m_refClassName2);
}

int zemAssociationProvider::validateSourceObject(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                                 const char* callingMethod) {
    zemAssociationCall call(*this, m_providerName, *broker, zemAssociationCall::kValidateSource,
                            ctx, cop);
    call.setWord(callingMethod);
    return call.validateSource(m_synchContext);
}

// ---- Instances ----------------------------------------------------------------------------------

CmpiInstance zemAssociationProvider::performGetInstance(const CmpiContext& ctx,
                                                        const CmpiObjectPath& cop,
                                                        const char** properties) {
    zemAssociationCall call(*this, m_providerName, *broker, OP_GetInstOp, ctx, cop);
    call.require(m_supportedOperations);
    const std::unique_ptr<Rows> rows(getAssoDataSet(call.className()));
    if (rows->size() == 0) {
        throwInvalidName(call.className());
    }

    const CmpiObjectPath cop1 = call.reference((*rows)[0]->m_refPropName1);
    const CmpiObjectPath cop2 = call.reference((*rows)[0]->m_refPropName2);
    if (!isNamedFirst(*rows, cop1)) {
        checkReferences(*rows, cop1, cop2, call.className(), m_providerName);
        return CmpiInstance(cop);
    }
    std::optional<CmpiInstance> result;
    call.guard([&] {
        const zemAssociationData& last = *(*rows)[rows->size() - 1];
        result = makeInstance(call, ctx, cop, properties, last, cop1, cop2);
    });
    return *result;
}

CmpiInstance zemAssociationProvider::makeInstance(zemAssociationCall& call, const CmpiContext& ctx,
                                                  const CmpiObjectPath& cop,
                                                  const char** properties,
                                                  const zemAssociationData& row,
                                                  const CmpiObjectPath& cop1,
                                                  const CmpiObjectPath& cop2) {
    const zemSynchronizer hold(m_synchContext);
    const char* const timed = row.m_refClassName1;
    const CmpiObjectPath path1 = call.getInstance(cop1, timed).getObjectPath();
    const CmpiObjectPath path2 = call.getInstance(cop2, timed).getObjectPath();
    const char* const className = call.className();
    if (!BeforeGenerateAssociation(ctx, className)) {
        throw zemOperationFailedException(className, "getInstance", "getInstance", "CIM_ERR",
                                          "Error to initialize data for association.");
    }
    isValidateAssociation(ctx, row, path1, path2);
    CmpiObjectPath ncop = createObjectPath(cop);
    CmpiInstance instance = zemReferenceInstance(*this, ncop, path1, path2, properties, className);
    AfterGenerateAssociation(ctx, className);
    return instance;
}

void zemAssociationProvider::enumerate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    report(r, " <-");
    call.require(m_supportedOperations);
    const char* const className = call.className();
    const std::unique_ptr<Rows> rows(getAssoDataSet(className));
    if (rows->size() == 0) {
        throwInvalidName(className);
    }
    call.guard([&] {
        report(r, " before BeforeGenerateAssociation");
        if (!BeforeGenerateAssociation(r.ctx, className)) {
            return;
        }
        report(r, " after BeforeGenerateAssociation");
        for (int i = 0; i < rows->size(); ++i) {
            const zemAssociationData* const row = (*rows)[i];
            if (row == nullptr) {
                report(r, ": the association data error.");
            } else {
                enumerateRow(call, r, *row);
            }
        }
        AfterGenerateAssociation(r.ctx, className);
    });
    report(r, " ->");
}

void zemAssociationProvider::enumerateRow(zemAssociationCall& call, const zemAssociationRequest& r,
                                          const zemAssociationData& row) {
    const zemSynchronizer hold(m_synchContext);
    const std::string class1 = static_cast<const char*>(row.m_refClassName1);
    const std::string class2 = static_cast<const char*>(row.m_refClassName2);
    report(r, ": ", class1, class2);
    const zemString nameSpace2 = row.getNameSpace2(r.cop);
    const std::vector<CmpiObjectPath> cops1 = call.paths(row.getNameSpace1(r.cop), class1.c_str());
    std::vector<CmpiObjectPath> cops2;
    if (zemString::equalsIgnoreCase(row.m_refClassName1, row.m_refClassName2)) {
        // one set of objects for both sides; in the end all are in the namespace of side 2
        cops2 = cops1;
        for (CmpiObjectPath& path : cops2) {
            call.place(path, nameSpace2);
        }
    } else {
        cops2 = call.paths(nameSpace2, class2.c_str());
    }
    report(r, ": objs size: ", std::to_string(cops1.size()), std::to_string(cops2.size()));
    for (const CmpiObjectPath& cop1 : cops1) {
        report(r, ": obj1: ");
        for (const CmpiObjectPath& cop2 : cops2) {
            report(r, ": obj2: ");
            if (!isValidateAssociation(r.ctx, row, cop1, cop2)) {
                continue;
            }
            report(r, ": an association found: ");
            zemReturnReference(*this, r.rslt, createObjectPath(r.cop), cop1, cop2, r.properties,
                               call.className(), r.is(OP_EnumInstsOp));
        }
    }
}

// ---- Navigation ---------------------------------------------------------------------------------

void zemAssociationProvider::navigate(const zemAssociationRequest& r) {
    zemAssociationCall call(*this, m_providerName, *broker, r.operation, r.ctx, r.cop);
    call.require(m_supportedOperations);
    const std::unique_ptr<Rows> rows(getAssoDataSet(r.assocClass));
    if (rows->size() == 0) {
        throwInvalidName(r.assocClass);
    }
    call.guard([&] {
        if (!BeforeGenerateAssociation(r.ctx, r.assocClass)) {
            return;
        }
        for (int i = 0; i < rows->size(); ++i) {
            if (!navigateRow(call, r, *(*rows)[i])) {
                return;
            }
        }
        AfterGenerateAssociation(r.ctx, r.assocClass);
    });
}

/// @return false when there is no source object, so that the other rows have no answer either
bool zemAssociationProvider::navigateRow(zemAssociationCall& call, const zemAssociationRequest& r,
                                         const zemAssociationData& row) {
    const bool references = r.is(OP_OnlyRefOps);
    zemString sourceClass, role1, role2, resultRole;
    zemString* const roleOut = references ? nullptr : &resultRole;
    const bool isFirst = row.getAssoDataFromOperation1(r.cop, sourceClass, role1, roleOut,
                                                       r.resultClass, r.role, r.resultRole);
    const bool isSecond = row.getAssoDataFromOperation2(r.cop, sourceClass, role2, roleOut,
                                                        r.resultClass, r.role, r.resultRole);
    if (!isFirst && !isSecond) {
        return true;
    }
    // the orientation of each side: whether the source comes first in a pair
    const bool first = role1 == row.m_refPropName1;
    const bool second = role2 == row.m_refPropName1;
    const bool targetIsSecond = isFirst ? first : second;
    const zemString nameSpace =
        targetIsSecond ? row.getNameSpace2(r.cop) : row.getNameSpace1(r.cop);
    const zemString& target = targetIsSecond ? row.m_refClassName2 : row.m_refClassName1;
    if (validateSourceObject(r.ctx, r.cop, call.word()) != 0) {
        return false;
    }

    const zemSynchronizer hold(m_synchContext);
    if (r.is(OP_RefsOp)) {
        validateProerties(createObjectPath(r.cop, row.m_assocClassName), r.properties, call.word());
    }
    std::vector<zemAssociationCandidate> candidates;
    CmpiEnumeration objects =
        call.targets(r, call.classPath(nameSpace, target), row.m_refClassName1);
    while (objects.hasNext()) {
        candidates.push_back(zemNextCandidate(objects, r.is(OP_AssocsOp)));
        if (references) {
            call.place(candidates.back().path, nameSpace);
        }
    }
    const auto makePath = [&] { return call.classPath(row.m_assoNameSpace, row.m_assocClassName); };
    const auto pass = [&](bool sourceFirst) {
        for (const zemAssociationCandidate& candidate : candidates) {
            const CmpiObjectPath& cop1 = sourceFirst ? r.cop : candidate.path;
            const CmpiObjectPath& cop2 = sourceFirst ? candidate.path : r.cop;
            if (isValidateAssociation(r.ctx, row, cop1, cop2)) {
                zemReturnNeighbour(*this, r, candidate, cop1, cop2, row.m_assocClassName, makePath);
            }
        }
    };
    if (isFirst) {
        pass(first);
    }
    if (isSecond) {
        pass(second);
    }
    return true;
}
