/// One provider object behind the five interfaces that a CIM server asks for.
///
/// The server calls one CMPI factory per kind of interface; the manager makes the provider object
/// at the first call for a name, hands out one interface record per kind, and destroys the object
/// when the last record is cleaned up. The factories of a provider library are one-liners:
///
///     static CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
///         return new DiskProvider(mb, ctx);
///     }
///     extern "C" CMPIInstanceMI* Disk_Create_InstanceMI(CMPIBroker* mb, CMPIContext* ctx,
///                                                       CMPIStatus* rc) {
///         return zemBaseProviderManager::getInstanceMI(mb, ctx, "Disk", rc, create);
///     }
///
/// The manager owns provider objects and records; the server owns nothing. All operations take
/// the manager's lock and may be called from any thread. A provider's cleanup and destructor run
/// under that lock, so they must not wait for another thread's factory or cleanup call.
#ifndef ZEM_BASE_PROVIDER_MANAGER_H
#define ZEM_BASE_PROVIDER_MANAGER_H

#include "CmpiBaseMI.h"
#include "CmpiBroker.h"
#include "CmpiContext.h"
#include "DynamicArray.h"
#include "StringUtils.h"
#include "Synchronizer.h"
#include "ZemExport.h"
#include "cmpidt.h"
#include "cmpift.h"

/// Makes the provider object of a name; null on failure.
typedef CmpiBaseMI* (*createMI)(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

class ZEM_EXPORT zemBaseProviderManager {
public:
    /// The record of provider @p name for one kind of interface: the one handed out before, or a
    /// new one, with a new provider object if none of that name lives.
    /// @return null, with @p status still OK, when @p create fails
    static CMPIInstanceMI* getInstanceMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                         CMPIStatus* status, createMI create);
    static CMPIAssociationMI* getAssociationMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                               CMPIStatus* status, createMI create);
    static CMPIMethodMI* getMethodMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                     CMPIStatus* status, createMI create);
    static CMPIIndicationMI* getIndicationMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                             CMPIStatus* status, createMI create);
    static CMPIPropertyMI* getPropertyMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                         CMPIStatus* status, createMI create);

    /// The cleanup entries of those records. The record is gone afterwards; with the last one of
    /// a name, the provider's cleanup runs and the object is destroyed, whatever its cleanup says.
    /// @param terminating  the server is going down: a provider is not asked whether it may go
    /// @return CMPI_RC_NEVER_UNLOAD, and nothing changed, for a provider that must stay; else the
    ///         code of the provider's cleanup, without its message
    static CMPIStatus cleanupInstanceMI(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        CMPIBoolean terminating);
    static CMPIStatus cleanupAssociationMI(CMPIAssociationMI* mi, const CMPIContext* ctx,
                                           CMPIBoolean terminating);
    static CMPIStatus cleanupMethodMI(CMPIMethodMI* mi, const CMPIContext* ctx,
                                      CMPIBoolean terminating);
    static CMPIStatus cleanupIndicationMI(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                          CMPIBoolean terminating);
    static CMPIStatus cleanupPropertyMI(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                        CMPIBoolean terminating);

private:
    /// One live provider object.
    struct _BaseMIItem {
        const char* m_miName;  // text of the name in m_miNameList
        unsigned int m_miCount;
        CmpiBaseMI* m_mi;
    };
    typedef _BaseMIItem BaseMIItem;

    zemBaseProviderManager();
    ~zemBaseProviderManager();
    zemBaseProviderManager(const zemBaseProviderManager&) = delete;
    zemBaseProviderManager& operator=(const zemBaseProviderManager&) = delete;

    static zemBaseProviderManager* getProviderManager();

    // What differs between the kinds stands in a traits class each, in the source.
    template <class Kind>
    static typename Kind::MI* getMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                    CMPIStatus* status, createMI create);
    template <class Kind>
    static CMPIStatus cleanupRecord(typename Kind::MI* mi, const CMPIContext* ctx,
                                    CMPIBoolean terminating);
    template <class Kind>
    typename Kind::MI* implGetMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                 createMI create);
    template <class Kind>
    CMPIStatus implCleanupMI(typename Kind::MI* mi, const CMPIContext* ctx,
                             CMPIBoolean terminating);
    template <class Kind>
    int findRecord(const char* name);
    template <class Kind>
    int indexOf(const typename Kind::MI* mi);
    template <class Kind>
    void dropRecord(int index);
    template <class Kind>
    void dropRecords();

    BaseMIItem* getBaseMIItem(const char* name);
    BaseMIItem* getBaseMIItem(CMPIBroker* mb, CMPIContext* ctx, const char* name, createMI create);
    void addBaseMI(const char* name, CmpiBaseMI* mi);
    CMPIStatus cleanupMI(const char* name, const CMPIContext* ctx, CMPIBoolean terminating);
    void forget(BaseMIItem* item, const zemString& name);

    struct InstanceKind;
    struct AssociationKind;
    struct MethodKind;
    struct IndicationKind;
    struct PropertyKind;

    zemSynchronizerContext m_synchContext;
    zemDynamicArray<zemString> m_miNameList;
    zemDynamicArray<_BaseMIItem> m_baseMIList;
    zemDynamicArray<CMPIInstanceMI> m_instanceMIList;
    zemDynamicArray<CMPIAssociationMI> m_associationMIList;
    zemDynamicArray<CMPIMethodMI> m_methodMIList;
    zemDynamicArray<CMPIIndicationMI> m_indicationMIList;
    zemDynamicArray<CMPIPropertyMI> m_propertyMIList;
};

#endif
