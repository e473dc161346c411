/// Associations by rows: zemAssociationProvider and its table of zemAssociationData.
///
/// The simplest of the association families. A final provider derives from it, adds a row for each
/// pair of classes that its association class joins, and says which two objects belong together;
/// the base serves the seven operations by asking the CIM server for the objects of each side.
/// Nothing of the association is stored or cached: its instances are made of the two paths.
///
///     class HostedDisk : public zemAssociationProvider {
///     public:
///         HostedDisk(const CmpiBroker& mb, const CmpiContext& ctx)
///             : CmpiBaseMI(mb, ctx), zemAssociationProvider(mb, ctx, "HostedDisk", OP_ALLOps) {
///             addAssoData(new zemAssociationData("ORX_HostedDisk", "", "ORX_Host", "Antecedent",
///                                                "", "ORX_Disk", "Dependent", ""));
///         }
///         bool isValidateAssociation(const CmpiContext&, const zemAssociationData&,
///                                    const CmpiObjectPath& host,
///                                    const CmpiObjectPath& disk) override;
///     };
///
/// Use it for 1-to-1 and 1-to-N associations with one class on each side of a row.
/// docs/writing-a-provider.md compares the families.
///
/// Failures are zemExceptions for the frame of zemBaseProvider. What the server refuses becomes
/// one by its code; a navigation ends quietly, with what it has returned so far, for codes that
/// have none. An association class that is in no row gives zemInvalidParameterException, and so
/// does a navigation that names none: which class a provider answers with then, or for a base
/// class, it says itself, by overriding isValidAssociationClass() and the navigations.
///
/// Threads. The rows are added in the constructor and do not change afterwards. One lock, common
/// to all providers of this family, is held while a row is worked on: while the server is asked
/// and while isValidateAssociation(), addKeys() and addProperties() run. A server that serves such
/// a request on another thread must not let it come back into this family.
#ifndef ASSOCIATION_PROVIDER_H
#define ASSOCIATION_PROVIDER_H

#include "Array.h"
#include "AssociationOperations.h"
#include "DynamicArray.h"
#include "StringUtils.h"
#include "Synchronizer.h"
#include "ZemExport.h"

class zemAssociationCall;

/// One row: two classes and the reference properties ("roles") by which an association class
/// points at them. A class name that begins with "_" stands for every class with that suffix.
class ZEM_EXPORT zemAssociationData {
public:
    /// The fields in their order. An empty namespace of a side means that of the request.
    zemAssociationData(const char* assocClassName, const char* assoNameSpace,
                       const char* refClassName1, const char* refPropName1, const char* nameSpace1,
                       const char* refClassName2, const char* refPropName2, const char* nameSpace2);
    virtual ~zemAssociationData();
    zemAssociationData(const zemAssociationData&) = default;
    zemAssociationData& operator=(const zemAssociationData&) = default;

    /// Namespace of a side for a request on @p cop.
    zemString getNameSpace1(const CmpiObjectPath& cop) const;
    zemString getNameSpace2(const CmpiObjectPath& cop) const;

    /// Whether @p cop can stand on side 1, resp. 2, under the filters of a request; null and empty
    /// filters do not restrict.
    ///
    /// When the class of @p cop fits, @p sourceClass and @p sourceRole are set to the names of its
    /// side and @p resultRole, unless null, to the role of the other, also when a filter then
    /// fails; otherwise only @p resultRole is touched: it is emptied. A result class that fits both
    /// sides counts as that of side 1. With both sides of one class, a request that gives result
    /// class and result role has no answer unless the two roles have the same name.
    bool getAssoDataFromOperation1(const CmpiObjectPath& cop, zemString& sourceClass,
                                   zemString& sourceRole, zemString* resultRole,
                                   const char* pResultClass, const char* pRole,
                                   const char* pResultRole) const;
    bool getAssoDataFromOperation2(const CmpiObjectPath& cop, zemString& sourceClass,
                                   zemString& sourceRole, zemString* resultRole,
                                   const char* pResultClass, const char* pRole,
                                   const char* pResultRole) const;

    /// The same on the side whose class @p cop has, side 1 first.
    bool getAssoDataFromOperation(const CmpiObjectPath& cop, zemString& sourceClass,
                                  zemString& sourceRole, zemString* resultRole,
                                  const char* pResultClass, const char* pRole,
                                  const char* pResultRole) const;

    zemString m_assocClassName;
    zemString m_assoNameSpace;
    zemString m_refClassName1;
    zemString m_refPropName1;
    zemString m_nameSpace1;
    zemString m_refClassName2;
    zemString m_refPropName2;
    zemString m_nameSpace2;

private:
    struct Filters;
    bool checkSide(bool first, const CmpiObjectPath& cop, zemString& sourceClass,
                   zemString& sourceRole, zemString* resultRole, const Filters& filters) const;
    const zemString* matchRole(const char* role) const;
    const zemString* matchClass(const CmpiObjectPath& cop, const char* className) const;
};

class ZEM_EXPORT zemAssociationProvider : public zemServerAssociation {
public:
    ZEM_ASSOCIATION_OPERATIONS();

    /// @param providerName  "zemAssociationProvider" in the first form
    zemAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                           SupportedOpType supportedOperations);
    zemAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* providerName,
                           SupportedOpType supportedOperations);
    ~zemAssociationProvider() override;

    /// Appends a row, which belongs to the provider from here on; for constructors.
    void addAssoData(zemAssociationData* row);

    /// The first row of an association class, owned by the provider; null if there is none.
    zemAssociationData* getAssoData(const char* name) const;

    /// Copies of all rows of an association class, in order, for the caller to delete.
    zemDynamicArray<zemAssociationData>* getAssoDataSet(const char* name) const;

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

    /// Whether the object of side 1 and that of side 2 belong together; by default all do. Its
    /// answer does not matter to performGetInstance().
    virtual bool isValidateAssociation(const CmpiContext& ctx, const zemAssociationData& row,
                                       const CmpiObjectPath& cop1, const CmpiObjectPath& cop2);

    /// Called before a pass of pairing, to get the data that isValidateAssociation() needs, and
    /// after it, to release them. False ends an enumeration or a navigation without results. The
    /// second is called on normal completion only: data must survive until the next pass or the
    /// destructor. Both run without the lock, except in performGetInstance().
    virtual bool BeforeGenerateAssociation(const CmpiContext& ctx, const char* className);
    virtual void AfterGenerateAssociation(const CmpiContext& ctx, const char* className);

    /// Classes of the first row that fits two objects, of the last row if none fits; 0.
    virtual int getReferenceClass(const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                                  zemString& strRefClassName1, zemString& strRefClassName2,
                                  const char* className);

    /// Whether @p cop is of the first, resp. second, class of any row of an association class.
    virtual bool isFirstClass(const CmpiObjectPath& cop, const char* className);
    virtual bool isSecondClass(const CmpiObjectPath& cop, const char* className);

protected:
    /// Asks the server for the source of a navigation.
    /// @return 0 if it exists, 1 for a status that becomes no exception
    int validateSourceObject(const CmpiContext& ctx, const CmpiObjectPath& cop,
                             const char* callingMethod);

    static zemSynchronizerContext m_synchContext;
    SupportedOpType m_supportedOperations;
    zemDynamicArray<zemAssociationData> m_assoData;

    /// For subclasses; not used here.
    zemArray<zemString> m_aFirstClassName;
    zemArray<zemString> m_aSecondClassName;

private:
    const zemAssociationData& requireAssoData(const char* name) const;
    CmpiInstance makeInstance(zemAssociationCall& call, const CmpiContext& ctx,
                              const CmpiObjectPath& cop, const char** properties,
                              const zemAssociationData& row, const CmpiObjectPath& cop1,
                              const CmpiObjectPath& cop2);
    void enumerate(const zemAssociationRequest& r) override;
    void enumerateRow(zemAssociationCall& call, const zemAssociationRequest& r,
                      const zemAssociationData& row);
    void navigate(const zemAssociationRequest& r) override;
    bool navigateRow(zemAssociationCall& call, const zemAssociationRequest& r,
                     const zemAssociationData& row);
};

#endif
