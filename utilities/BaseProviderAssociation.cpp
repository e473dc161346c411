// Association operations of zemBaseProvider.
#include "BaseProvider.h"
#include "BaseProviderFrame.h"
#include "BaseProviderText.h"

CmpiStatus zemBaseProvider::associators(const CmpiContext& ctx, CmpiResult& result,
                                        const CmpiObjectPath& path, const char* assocClass,
                                        const char* resultClass, const char* role,
                                        const char* resultRole, const char** properties) {
    zemOperationFrame frame(*this, zemOperation::Associators, ctx, &path, &result);
    frame.setFilterClass(assocClass);
    return frame.run([&] {
        performAssociators(ctx, result, path, assocClass, resultClass, role, resultRole,
                           properties);
    });
}

CmpiStatus zemBaseProvider::associatorNames(const CmpiContext& ctx, CmpiResult& result,
                                            const CmpiObjectPath& path, const char* assocClass,
                                            const char* resultClass, const char* role,
                                            const char* resultRole) {
    zemOperationFrame frame(*this, zemOperation::AssociatorNames, ctx, &path, &result);
    frame.setFilterClass(assocClass);
    return frame.run([&] {
        performAssociatorNames(ctx, result, path, assocClass, resultClass, role, resultRole);
    });
}

CmpiStatus zemBaseProvider::references(const CmpiContext& ctx, CmpiResult& result,
                                       const CmpiObjectPath& path, const char* resultClass,
                                       const char* role, const char** properties) {
    zemOperationFrame frame(*this, zemOperation::References, ctx, &path, &result);
    frame.setFilterClass(resultClass);
    return frame.run([&] { performReferences(ctx, result, path, resultClass, role, properties); });
}

CmpiStatus zemBaseProvider::referenceNames(const CmpiContext& ctx, CmpiResult& result,
                                           const CmpiObjectPath& path, const char* resultClass,
                                           const char* role) {
    zemOperationFrame frame(*this, zemOperation::ReferenceNames, ctx, &path, &result);
    frame.setFilterClass(resultClass);
    return frame.run([&] { performReferenceNames(ctx, result, path, resultClass, role); });
}

void zemBaseProvider::performAssociators(const CmpiContext&, CmpiResult&,
                                         const CmpiObjectPath& path, const char*, const char*,
                                         const char*, const char*, const char**) {
    refuse(__func__, "associators", zemClassOf(path));
}

void zemBaseProvider::performAssociatorNames(const CmpiContext&, CmpiResult&,
                                             const CmpiObjectPath& path, const char*, const char*,
                                             const char*, const char*) {
    refuse(__func__, "associatorNames", zemClassOf(path));
}

void zemBaseProvider::performReferences(const CmpiContext&, CmpiResult&, const CmpiObjectPath& path,
                                        const char*, const char*, const char**) {
    refuse(__func__, "references", zemClassOf(path));
}

void zemBaseProvider::performReferenceNames(const CmpiContext&, CmpiResult&,
                                            const CmpiObjectPath& path, const char*, const char*) {
    refuse(__func__, "referenceNames", zemClassOf(path));
}
