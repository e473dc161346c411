/// zemNtoNAssociationProvider: one association class between two known classes.
///
/// A final provider names the classes and roles in its constructor and says in
/// isValidateAssociation() which objects belong together; the base serves the seven operations by
/// asking the CIM server for the objects of each side.
///
///     class HostedDisk : public zemNtoNAssociationProvider {
///     public:
///         HostedDisk(const CmpiBroker& mb, const CmpiContext& ctx)
///             : CmpiBaseMI(mb, ctx),
///               zemNtoNAssociationProvider(mb, ctx, "HostedDisk", "ORX_HostedDisk", "ORX_Host",
///                                          "ORX_Disk", "Antecedent", "Dependent", OP_ALLOps, "",
///                                          "", "") {}
///         bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& host,
///                                    const CmpiObjectPath& disk) override;
///     };
///
/// Compared with zemAssociationProvider: no rows; a source stands on one side only, which
/// isFirstClass() decides; the associator operations hold no array of objects; and getInstance
/// refuses a pair that isValidateAssociation() refuses. docs/writing-a-provider.md compares all.
///
/// Failures are zemExceptions for the frame of zemBaseProvider. What the server refuses becomes
/// one by its code; a navigation ends quietly for codes that have none, and for filters that
/// cannot be met.
///
/// Threads. Each provider object has a lock that is held from the first call to the server to the
/// end of an operation, hooks included: operations of one provider come one after another, those
/// of two providers run side by side. A provider whose objects are served by another provider of
/// this family must not serve objects of that one.
#ifndef NTON_ASSOCIATION_PROVIDER_H
#define NTON_ASSOCIATION_PROVIDER_H

#include "AssociationOperations.h"
#include "StringUtils.h"
#include "Synchronizer.h"
#include "ZemExport.h"

class zemAssociationCall;

class ZEM_EXPORT zemNtoNAssociationProvider : public zemServerAssociation {
public:
    ZEM_ASSOCIATION_OPERATIONS();

    /// Both classes come first, then both roles. An empty namespace means that of the request.
    /// @param providerName  "zemNtoNAssociationProvider" in the first form
    zemNtoNAssociationProvider(const CmpiBroker& mbp, const CmpiContext& ctx,
                               const char* anAssocClassName, const char* aRefClassName1,
                               const char* aRefClassName2, const char* aRefPropName1,
                               const char* aRefPropName2, SupportedOpType aSupportedOperations,
                               const char* aNameSpace1, const char* aNameSpace2,
                               const char* aAssoNameSpace);
    zemNtoNAssociationProvider(const CmpiBroker& mbp, const CmpiContext& ctx,
                               const char* providerName, const char* anAssocClassName,
                               const char* aRefClassName1, const char* aRefClassName2,
                               const char* aRefPropName1, const char* aRefPropName2,
                               SupportedOpType aSupportedOperations, const char* aNameSpace1,
                               const char* aNameSpace2, const char* aAssoNameSpace);
    ~zemNtoNAssociationProvider() override;

    CmpiInstance performGetInstance(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                    const char** properties) override;
    CMPIBoolean isValidInstanceClass(const char* name) override;
    CMPIBoolean isValidAssociationClass(const char* name) override;
    void populateEssentialKeys(const char* name, CmpiArray& keys) override;

    /// The namespaces of the association and of its sides for a request on @p cop.
    zemString getAssoNameSpace(const CmpiObjectPath& cop) const;
    zemString getNameSpace1(const CmpiObjectPath& cop) const;
    zemString getNameSpace2(const CmpiObjectPath& cop) const;

    // ---- Hooks ----------------------------------------------------------------------------------

    /// Sets the two references on the path and on the instance of an association.
    virtual void addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                         const CmpiObjectPath& cop2, const char* className);
    virtual void addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2, const char** properties,
                               const char* className);

    /// Whether the source of a navigation stands on side 1. The first rule that applies decides:
    /// its role, its class by name, its ancestors, which of two related classes is the more
    /// derived, the result role, the result class; in doubt side 1.
    virtual bool isFirstClass(const CmpiObjectPath& cop, const char* resultClass, const char* role,
                              const char* resultRole);

    /// Whether the object of side 1 and that of side 2 belong together; by default all do.
    virtual bool isValidateAssociation(const CmpiContext& ctx, const CmpiObjectPath& cop1,
                                       const CmpiObjectPath& cop2);

    /// Called when the server has answered, before the first pair is looked at, and after the last
    /// one. False ends the operation without results. The second is called on normal completion
    /// only; performGetInstance() calls neither.
    virtual bool BeforeGenerateAssociation(const CmpiContext& ctx);
    virtual void AfterGenerateAssociation(const CmpiContext& ctx);

protected:
    /// Asks the server for the source of a navigation.
    /// @return 0 if it exists, 1 for a status that becomes no exception
    int validateSourceObject(const CmpiContext& ctx, const CmpiObjectPath& cop,
                             const char* callingMethod);

    zemString m_assocClassName;
    zemString m_refClassName1;
    zemString m_refClassName2;
    zemString m_refPropName1;
    zemString m_refPropName2;
    zemString m_assoNameSpace;
    zemString m_nameSpace1;
    zemString m_nameSpace2;
    zemSynchronizerContext m_synchContext;
    SupportedOpType m_supportedOperations;

private:
    zemString refuseReferences(const CmpiContext& ctx, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2);
    void enumerate(const zemAssociationRequest& r) override;
    void navigate(const zemAssociationRequest& r) override;
    bool passesFilters(const zemAssociationRequest& r, bool first) const;
    bool narrowTarget(const zemAssociationRequest& r, const char* nameSpace,
                      zemString& target) const;
    void returnNeighbours(zemAssociationCall& call, const zemAssociationRequest& r,
                          const CmpiObjectPath& target, bool first);
};

#endif
