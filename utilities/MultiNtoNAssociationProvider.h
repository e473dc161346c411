/// zemMultiNtoNAssociationProvider: one association class among several classes on each side.
///
/// A final provider lists the allowed pairs of classes in its constructor, with one role per side
/// for all of them, and says in isValidateAssociation() which objects belong together; the base
/// serves the seven operations by asking the CIM server for the objects.
///
///     class SystemDevice : public zemMultiNtoNAssociationProvider {
///     public:
///         SystemDevice(const CmpiBroker& mb, const CmpiContext& ctx)
///             : CmpiBaseMI(mb, ctx),
///               zemMultiNtoNAssociationProvider(mb, ctx, "SystemDevice", "ORX_SystemDevice",
///                                               "ORX_Host\0ORX_Disk\0ORX_Host\0ORX_Port\0",
///                                               "GroupComponent", "PartComponent", OP_ALLOps, "",
///                                               "", "") {}
///         ...
///     };
///
/// Two things set it apart from zemNtoNAssociationProvider. The pairs are reduced once to the
/// classes that need enumerating: of a class and a base of it that stands later in the list, the
/// base alone, whose enumeration has the objects of both. And one enumeration of associations
/// asks for the objects of each class once. There are no Before and After hooks.
///
/// Failures are zemExceptions for the frame of zemBaseProvider, with the name of the server's code
/// as id; a navigation ends quietly for codes that become no exception.
///
/// Threads. A lock of the provider is held during one call to the server and the handling of what
/// it answers, in a navigation including isValidateAssociation(), never for a whole operation:
/// operations on one provider interleave between classes. A second lock makes the reduction of the
/// pairs happen once. Nothing is kept from one operation to the next.
#ifndef MULTI_NTON_ASSOCIATION_PROVIDER_H
#define MULTI_NTON_ASSOCIATION_PROVIDER_H

#include "Array.h"
#include "AssociationOperations.h"
#include "StringUtils.h"
#include "Synchronizer.h"
#include "ZemExport.h"

class zemAssociationCall;

class ZEM_EXPORT zemMultiNtoNAssociationProvider : public zemServerAssociation {
public:
    ZEM_ASSOCIATION_OPERATIONS();

    /// @param aRefClassNamePairs  names, each ended by a zero byte and all by an empty name: first
    ///        class, second class, first class, second class ...
    /// @param providerName  "zemMultiNtoNAssociationProvider" in the first form
    /// @throws zemInvalidParameterException  for a null or empty list, or an odd number of names
    zemMultiNtoNAssociationProvider(const CmpiBroker& mbp, const CmpiContext& ctx,
                                    const char* anAssocClassName, const char* aRefClassNamePairs,
                                    const char* aRefPropName1, const char* aRefPropName2,
                                    SupportedOpType aSupportedOperations, const char* aNameSpace1,
                                    const char* aNameSpace2, const char* aAssoNameSpace);
    zemMultiNtoNAssociationProvider(const CmpiBroker& mbp, const CmpiContext& ctx,
                                    const char* providerName, const char* anAssocClassName,
                                    const char* aRefClassNamePairs, const char* aRefPropName1,
                                    const char* aRefPropName2, SupportedOpType aSupportedOperations,
                                    const char* aNameSpace1, const char* aNameSpace2,
                                    const char* aAssoNameSpace);
    ~zemMultiNtoNAssociationProvider() override;

    CmpiInstance performGetInstance(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                    const char** properties) override;
    CMPIBoolean isValidInstanceClass(const char* name) override;
    CMPIBoolean isValidAssociationClass(const char* name) override;
    void populateEssentialKeys(const char* name, CmpiArray& keys) override;

    // ---- Hooks ----------------------------------------------------------------------------------

    /// Sets the two references on the path and on the instance of an association.
    virtual void addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                         const CmpiObjectPath& cop2, const char* className);
    virtual void addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2, const char** properties,
                               const char* className);

    /// Whether @p cop is of the first, resp. second, class of a pair or derives from it; the class
    /// of the first such pair goes to @p out, unless that is null.
    virtual bool isFirstClass(const CmpiObjectPath& cop, zemString* out);
    virtual bool isSecondClass(const CmpiObjectPath& cop, zemString* out);

    /// Whether the object of side 1 and that of side 2 belong together; by default all do.
    virtual bool isValidateAssociation(const CmpiContext& ctx, const CmpiObjectPath& cop1,
                                       const CmpiObjectPath& cop2);

    /// Classes of the first pair that fits two objects. @return 0, or -1 if none fits
    virtual int getReferenceClass(const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                                  zemString& strRefClassName1, zemString& strRefClassName2);

    /// Whether a pair joins two classes or bases of them.
    virtual bool hasAssociationBetweenClasses(const char* strRefClassName1,
                                              const char* strRefClassName2);

    /// The bodies of the navigations and of the enumerations.
    /// @param opType         the operation
    /// @param callingMethod  its word in messages
    virtual void implementAssociation(const CmpiContext& ctx, CmpiResult& rslt,
                                      const CmpiObjectPath& cop, const char* assocClass,
                                      const char* resultClass, const char* role,
                                      const char* resultRole, const char** properties,
                                      SupportedOpType opType, const char* callingMethod);
    /// One side of a navigation: returns what is associated with @p cop, which stands on side 1
    /// if @p isFirst, by way of its class @p sourceName, or its own class when that is empty.
    virtual void association(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                             const char* resultClass, const char** properties,
                             const char* sourceName, bool isFirst, SupportedOpType opType,
                             const char* callingMethod);
    virtual void implementEnumeration(const CmpiContext& ctx, CmpiResult& rslt,
                                      const CmpiObjectPath& cop, const char** properties,
                                      SupportedOpType opType, const char* callingMethod);

    /// Namespaces of the sides: "root/cimv2" where none is configured; for a request on @p cop,
    /// that of the request.
    zemString getNameSpace1() const;
    zemString getNameSpace2() const;
    zemString getNameSpace1(const CmpiObjectPath& cop) const;
    zemString getNameSpace2(const CmpiObjectPath& cop) const;
    zemString getAssoNameSpace(const CmpiObjectPath& cop) const;

protected:
    /// Asks the server for the source of a navigation.
    /// @return 0 if it exists, 1 for a status that becomes no exception
    int validateSourceObject(const CmpiContext& ctx, const CmpiObjectPath& cop,
                             const char* callingMethod);

    /// Fills the two lists of classes that need enumerating, once.
    void aggregateReferenceClasses();

    zemString m_assocClassName;
    zemStringPairs m_refClassNamePairs;
    zemString m_refPropName1;
    zemString m_refPropName2;
    zemString m_assoNameSpace;
    zemString m_nameSpace1;
    zemString m_nameSpace2;
    zemSynchronizerContext m_synchContext;
    SupportedOpType m_supportedOperations;
    zemArray<zemString> m_aFirstClassName;
    zemArray<zemString> m_aSecondClassName;
    zemSynchronizerContext m_refClassCacheMtx;
    bool m_isAggregated;

private:
    void enumerate(const zemAssociationRequest& r) override;
    void navigate(const zemAssociationRequest& r) override;
    void returnNeighbours(zemAssociationCall& call, const zemAssociationRequest& r,
                          const char* targetName, const char* nameSpace, bool isFirst);
    bool isWanted(const char* targetName, const char* nameSpace, const char* resultClass) const;
};

#endif
