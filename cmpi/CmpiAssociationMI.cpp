#include "CmpiAssociationMI.h"

#include "CmpiDriver.h"

CmpiAssociationMI::CmpiAssociationMI(const CmpiBroker& mbp, const CmpiContext& ctx)
    : CmpiBaseMI(mbp, ctx) {}

CMPIStatus CmpiAssociationMI::driveAssociators(CMPIAssociationMI* mi, const CMPIContext* eCtx,
                                               const CMPIResult* eRslt, const CMPIObjectPath* eOp,
                                               const char* asscClass, const char* resultClass,
                                               const char* role, const char* resultRole,
                                               const char** properties) {
    return CmpiDriver::drive(mi, &CmpiAssociationMI::associators, eCtx, eRslt, eOp, asscClass,
                             resultClass, role, resultRole, properties);
}

CMPIStatus CmpiAssociationMI::driveAssociatorNames(CMPIAssociationMI* mi, const CMPIContext* eCtx,
                                                   const CMPIResult* eRslt,
                                                   const CMPIObjectPath* eOp,
                                                   const char* assocClass, const char* resultClass,
                                                   const char* role, const char* resultRole) {
    return CmpiDriver::drive(mi, &CmpiAssociationMI::associatorNames, eCtx, eRslt, eOp, assocClass,
                             resultClass, role, resultRole);
}

CMPIStatus CmpiAssociationMI::driveReferences(CMPIAssociationMI* mi, const CMPIContext* eCtx,
                                              const CMPIResult* eRslt, const CMPIObjectPath* eOp,
                                              const char* resultClass, const char* role,
                                              const char** properties) {
    return CmpiDriver::drive(mi, &CmpiAssociationMI::references, eCtx, eRslt, eOp, resultClass,
                             role, properties);
}

CMPIStatus CmpiAssociationMI::driveReferenceNames(CMPIAssociationMI* mi, const CMPIContext* eCtx,
                                                  const CMPIResult* eRslt,
                                                  const CMPIObjectPath* eOp,
                                                  const char* resultClass, const char* role) {
    return CmpiDriver::drive(mi, &CmpiAssociationMI::referenceNames, eCtx, eRslt, eOp, resultClass,
                             role);
}

CmpiStatus CmpiAssociationMI::associators(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                          const char*, const char*, const char*, const char*,
                                          const char**) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiAssociationMI::associatorNames(const CmpiContext&, CmpiResult&,
                                              const CmpiObjectPath&, const char*, const char*,
                                              const char*, const char*) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiAssociationMI::references(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                         const char*, const char*, const char**) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}

CmpiStatus CmpiAssociationMI::referenceNames(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                                             const char*, const char*) {
    return CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
}
