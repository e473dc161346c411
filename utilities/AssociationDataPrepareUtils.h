/// Scopes that call the Before and After hooks of the bases in
/// BaseZemMultiNtoNAssociationProvider.h in pairs, also when an exception passes through.
///
/// What an After hook throws out of a destructor is dropped: the operation's own outcome counts.
/// The objects belong to one operation on one thread; the provider outlives them.
#ifndef ASSOCIATION_DATA_PREPARE_UTILS_H
#define ASSOCIATION_DATA_PREPARE_UTILS_H

#include "CmpiContext.h"
#include "CmpiObjectPath.h"
#include "StringUtils.h"
#include "ZemExport.h"

class zemBaseZemMultiNtoNAssociationProvider;
class zemEnhanceBaseZemMultiNtoNAssociationProvider;

class ZEM_EXPORT zemAssociationDataPrepareUtility {
public:
    /// Calls the provider's BeforeGenerateAssociation(); a null provider has no hooks.
    /// @throws zemException  the hook's, under this class's name and with the text
    ///         "BeforeGenerateAssociation failed"; AfterGenerateAssociation() is then not called
    zemAssociationDataPrepareUtility(zemBaseZemMultiNtoNAssociationProvider* provider,
                                     const CmpiContext& ctx, const char* className);
    /// Calls AfterGenerateAssociation().
    ~zemAssociationDataPrepareUtility();
    zemAssociationDataPrepareUtility(const zemAssociationDataPrepareUtility&) = delete;
    zemAssociationDataPrepareUtility& operator=(const zemAssociationDataPrepareUtility&) = delete;

    /// What the hook answered; false without a provider.
    bool isInitialized() const { return m_Initialized; }

private:
    zemBaseZemMultiNtoNAssociationProvider* m_provider;
    CmpiContext m_ctx;
    zemString m_className;
    bool m_Initialized;
};

class ZEM_EXPORT zemAssociationDataPrepareUtilityPlus {
public:
    /// Calls nothing yet.
    zemAssociationDataPrepareUtilityPlus(zemEnhanceBaseZemMultiNtoNAssociationProvider* provider,
                                         const CmpiContext& ctx, const char* className,
                                         const CmpiObjectPath& cop);
    /// Calls AfterGenerateAssociation() with what run() got, null if it was never called.
    ~zemAssociationDataPrepareUtilityPlus();
    zemAssociationDataPrepareUtilityPlus(const zemAssociationDataPrepareUtilityPlus&) = delete;
    zemAssociationDataPrepareUtilityPlus& operator=(const zemAssociationDataPrepareUtilityPlus&) =
        delete;

    /// Calls BeforeGenerateAssociation() and returns its context, which belongs to the provider.
    void* run();

private:
    zemEnhanceBaseZemMultiNtoNAssociationProvider* m_providerPlus;
    void* m_addInfo;
    CmpiContext m_ctx;
    zemString m_className;
    CmpiObjectPath m_cop;
};

#endif
