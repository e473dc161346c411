#include "BaseProviderManager.h"

#include <cstring>
#include <memory>
#include <string>

#include "CmpiAssociationMI.h"
#include "CmpiIndicationMIEx.h"
#include "CmpiInstanceMI.h"
#include "CmpiMethodMI.h"
#include "CmpiPropertyMI.h"
#include "CmpiStatus.h"
#include "LetUnwind.h"
#include "Log.h"

namespace {

constexpr int kVersion = 200;
constexpr CMPIStatus kOK = {CMPI_RC_OK, nullptr};

// Entries that newer levels of the CMPI headers add at the end of a table stay null, and so does
// what a server built on such headers finds behind the table of older ones.
template <class FT>
struct Table : FT {
    void (*spare[4])();
};

}  // namespace

#pragma GCC diagnostic ignored "-Wmissing-field-initializers"

// One kind of interface: record, table, list, and the table's entries, in the table's order.

struct zemBaseProviderManager::InstanceKind {
    using MI = CMPIInstanceMI;
    using FT = CMPIInstanceMIFT;
    static constexpr auto kList = &zemBaseProviderManager::m_instanceMIList;
    static constexpr FT kTable = {kVersion,
                                  kVersion,
                                  nullptr,
                                  cleanupInstanceMI,
                                  CmpiInstanceMI::driveEnumInstanceNames,
                                  CmpiInstanceMI::driveEnumInstances,
                                  CmpiInstanceMI::driveGetInstance,
                                  CmpiInstanceMI::driveCreateInstance,
                                  CmpiInstanceMI::driveSetInstance,
                                  CmpiInstanceMI::driveDeleteInstance,
                                  CmpiInstanceMI::driveExecQuery};
};

struct zemBaseProviderManager::AssociationKind {
    using MI = CMPIAssociationMI;
    using FT = CMPIAssociationMIFT;
    static constexpr auto kList = &zemBaseProviderManager::m_associationMIList;
    static constexpr FT kTable = {kVersion,
                                  kVersion,
                                  nullptr,
                                  cleanupAssociationMI,
                                  CmpiAssociationMI::driveAssociators,
                                  CmpiAssociationMI::driveAssociatorNames,
                                  CmpiAssociationMI::driveReferences,
                                  CmpiAssociationMI::driveReferenceNames};
};

struct zemBaseProviderManager::MethodKind {
    using MI = CMPIMethodMI;
    using FT = CMPIMethodMIFT;
    static constexpr auto kList = &zemBaseProviderManager::m_methodMIList;
    static constexpr FT kTable = {kVersion, kVersion, nullptr, cleanupMethodMI,
                                  CmpiMethodMI::driveInvokeMethod};
};

struct zemBaseProviderManager::IndicationKind {
    using MI = CMPIIndicationMI;
    using FT = CMPIIndicationMIFT;
    static constexpr auto kList = &zemBaseProviderManager::m_indicationMIList;
    static constexpr FT kTable = {kVersion,
                                  kVersion,
                                  nullptr,
                                  cleanupIndicationMI,
                                  zemCmpiIndicationMI::driveAuthorizeFilter,
                                  zemCmpiIndicationMI::driveMustPoll,
                                  zemCmpiIndicationMI::driveActivateFilter,
                                  zemCmpiIndicationMI::driveDeActivateFilter,
                                  zemCmpiIndicationMI::driveEnableIndications,
                                  zemCmpiIndicationMI::driveDisableIndications};
};

struct zemBaseProviderManager::PropertyKind {
    using MI = CMPIPropertyMI;
    using FT = CMPIPropertyMIFT;
    static constexpr auto kList = &zemBaseProviderManager::m_propertyMIList;
    static constexpr FT kTable = {kVersion,
                                  kVersion,
                                  nullptr,
                                  cleanupPropertyMI,
                                  CmpiPropertyMI::driveSetProperty,
                                  CmpiPropertyMI::driveGetProperty};
};

zemBaseProviderManager::zemBaseProviderManager()
    : m_miNameList(25),
      m_baseMIList(25),
      m_instanceMIList(25),
      m_associationMIList(25),
      m_methodMIList(25),
      m_indicationMIList(25),
      m_propertyMIList(25) {}

// The process is ending: providers are neither cleaned up nor destroyed, for what they would talk
// to may be gone already.
zemBaseProviderManager::~zemBaseProviderManager() {
    dropRecords<PropertyKind>();
    dropRecords<IndicationKind>();
    dropRecords<MethodKind>();
    dropRecords<AssociationKind>();
    dropRecords<InstanceKind>();
}

zemBaseProviderManager* zemBaseProviderManager::getProviderManager() {
    static zemBaseProviderManager manager;
    return &manager;
}

template <class Kind>
typename Kind::MI* zemBaseProviderManager::getMI(CMPIBroker* mb, CMPIContext* ctx, const char* name,
                                                 CMPIStatus* status, createMI create) {
    if (status != nullptr) {
        *status = kOK;
    }
    // The server, which may be written in C, cannot take an exception.
    typename Kind::MI* record = nullptr;
    zemQuietly([&] { record = getProviderManager()->implGetMI<Kind>(mb, ctx, name, create); });
    return record;
}

template <class Kind>
CMPIStatus zemBaseProviderManager::cleanupRecord(typename Kind::MI* mi, const CMPIContext* ctx,
                                                 CMPIBoolean terminating) {
    CMPIStatus status = {CMPI_RC_ERR_FAILED, nullptr};
    zemQuietly([&] { status = getProviderManager()->implCleanupMI<Kind>(mi, ctx, terminating); });
    return status;
}

template <class Kind>
typename Kind::MI* zemBaseProviderManager::implGetMI(CMPIBroker* mb, CMPIContext* ctx,
                                                     const char* name, createMI create) {
    zemSynchronizer hold(m_synchContext);
    const int index = findRecord<Kind>(name);
    if (index >= 0) {
        return (this->*Kind::kList)[index];
    }

    BaseMIItem* item = getBaseMIItem(mb, ctx, name, create);
    if (item == nullptr) {
        return nullptr;
    }
    std::unique_ptr<Table<typename Kind::FT>> table(new Table<typename Kind::FT>{Kind::kTable, {}});
    table->miName = item->m_miName;
    auto record = std::make_unique<typename Kind::MI>();
    record->hdl = item->m_mi;
    record->ft = table.get();
    (this->*Kind::kList).addElement(record.get());
    static_cast<void>(table.release());
    ++item->m_miCount;
    return record.release();
}

template <class Kind>
CMPIStatus zemBaseProviderManager::implCleanupMI(typename Kind::MI* mi, const CMPIContext* ctx,
                                                 CMPIBoolean terminating) {
    zemSynchronizer hold(m_synchContext);
    // Sought by address: a record that was cleaned up before must not be looked into.
    const int index = indexOf<Kind>(mi);
    if (index < 0) {
        return kOK;
    }
    const zemString name(mi->ft->miName);  // a copy: the record's text goes with the last record
    if (!terminating) {
        const BaseMIItem* item = getBaseMIItem(name);
        if (item != nullptr && item->m_mi->isUnloadable() == 0) {
            return {CMPI_RC_NEVER_UNLOAD, nullptr};
        }
    }
    dropRecord<Kind>(index);
    return cleanupMI(name, ctx, terminating);
}

template <class Kind>
int zemBaseProviderManager::findRecord(const char* name) {
    const auto& records = this->*Kind::kList;
    for (int i = 0; i < records.size(); ++i) {
        if (strcmp(records[i]->ft->miName, name) == 0) {
            return i;
        }
    }
    return -1;
}

template <class Kind>
int zemBaseProviderManager::indexOf(const typename Kind::MI* mi) {
    const auto& records = this->*Kind::kList;
    for (int i = 0; i < records.size(); ++i) {
        if (records[i] == mi) {
            return i;
        }
    }
    return -1;
}

template <class Kind>
void zemBaseProviderManager::dropRecord(int index) {
    delete static_cast<const Table<typename Kind::FT>*>((this->*Kind::kList)[index]->ft);
    (this->*Kind::kList).removeElementAt(index);
}

template <class Kind>
void zemBaseProviderManager::dropRecords() {
    while ((this->*Kind::kList).size() > 0) {
        dropRecord<Kind>((this->*Kind::kList).size() - 1);
    }
}

zemBaseProviderManager::BaseMIItem* zemBaseProviderManager::getBaseMIItem(const char* name) {
    for (int i = 0; i < m_baseMIList.size(); ++i) {
        if (strcmp(m_baseMIList[i]->m_miName, name) == 0) {
            return m_baseMIList[i];
        }
    }
    return nullptr;
}

zemBaseProviderManager::BaseMIItem* zemBaseProviderManager::getBaseMIItem(CMPIBroker* mb,
                                                                          CMPIContext* ctx,
                                                                          const char* name,
                                                                          createMI create) {
    BaseMIItem* item = getBaseMIItem(name);
    if (item != nullptr) {
        return item;
    }
    std::unique_ptr<CmpiBaseMI> mi(create(CmpiBroker(mb), CmpiContext(ctx), name));
    if (mi == nullptr) {
        return nullptr;
    }
    addBaseMI(name, mi.get());
    item = getBaseMIItem(name);
    // A creation function that asks for its own name meanwhile has made another, which stays.
    if (item->m_mi == mi.get()) {
        static_cast<void>(mi.release());
    }
    return item;
}

void zemBaseProviderManager::addBaseMI(const char* name, CmpiBaseMI* mi) {
    zemSynchronizer hold(m_synchContext);
    // The manager counts the uses, no anchor of the binding does. Objects are made without one, so
    // that saying it once in the life of the library is enough.
    static bool first = true;
    if (first) {
        mi->setProviderBase(nullptr);
    }
    first = false;

    if (getBaseMIItem(name) != nullptr) {
        return;
    }
    auto ownName = std::make_unique<zemString>(name);
    auto item = std::make_unique<BaseMIItem>(BaseMIItem{*ownName, 0, mi});
    m_miNameList.addElement(ownName.get());
    static_cast<void>(ownName.release());
    m_baseMIList.addElement(item.get());
    static_cast<void>(item.release());
}

CMPIStatus zemBaseProviderManager::cleanupMI(const char* name, const CMPIContext* ctx,
                                             CMPIBoolean terminating) {
    zemSynchronizer hold(m_synchContext);
    BaseMIItem* item = getBaseMIItem(name);
    if (item == nullptr) {
        return kOK;
    }
    if (item->m_miCount > 1) {
        --item->m_miCount;
        return kOK;
    }
    item->m_miCount = 0;
    if (!terminating && item->m_mi->isUnloadable() == 0) {
        return kOK;
    }

    const zemString ownName(name);  // the one in the list is about to go
    CmpiContext context(const_cast<CMPIContext*>(ctx));
    CMPIrc rc = CMPI_RC_ERR_FAILED;
    zemQuietly([&] {
        try {
            rc = item->m_mi->cleanup(context).rc();
        } catch (const CmpiStatus& status) {
            rc = status.rc();
        }
    });
    delete item->m_mi;
    forget(item, ownName);
    return {rc, nullptr};
}

void zemBaseProviderManager::forget(BaseMIItem* item, const zemString& name) {
    m_miNameList.removeElementAt(m_miNameList.findElement(&name));
    for (int i = 0; i < m_baseMIList.size(); ++i) {
        if (m_baseMIList[i] == item) {
            m_baseMIList.removeElementAt(i);
            break;
        }
    }

    zemQuietly([this] {
        const std::string prefix = "zemBaseProviderManager::cleanupMI:";
        zemLog::LogPlain((prefix + std::to_string(m_baseMIList.size())).c_str());
        for (int i = 0; i < m_baseMIList.size(); ++i) {
            const BaseMIItem* left = m_baseMIList[i];
            const std::string line =
                prefix + left->m_miName + ";count=" + std::to_string(left->m_miCount);
            zemLog::LogPlain(line.c_str());
        }
    });
}

CMPIInstanceMI* zemBaseProviderManager::getInstanceMI(CMPIBroker* mb, CMPIContext* ctx,
                                                      const char* name, CMPIStatus* status,
                                                      createMI create) {
    return getMI<InstanceKind>(mb, ctx, name, status, create);
}

CMPIAssociationMI* zemBaseProviderManager::getAssociationMI(CMPIBroker* mb, CMPIContext* ctx,
                                                            const char* name, CMPIStatus* status,
                                                            createMI create) {
    return getMI<AssociationKind>(mb, ctx, name, status, create);
}

CMPIMethodMI* zemBaseProviderManager::getMethodMI(CMPIBroker* mb, CMPIContext* ctx,
                                                  const char* name, CMPIStatus* status,
                                                  createMI create) {
    return getMI<MethodKind>(mb, ctx, name, status, create);
}

CMPIIndicationMI* zemBaseProviderManager::getIndicationMI(CMPIBroker* mb, CMPIContext* ctx,
                                                          const char* name, CMPIStatus* status,
                                                          createMI create) {
    return getMI<IndicationKind>(mb, ctx, name, status, create);
}

CMPIPropertyMI* zemBaseProviderManager::getPropertyMI(CMPIBroker* mb, CMPIContext* ctx,
                                                      const char* name, CMPIStatus* status,
                                                      createMI create) {
    return getMI<PropertyKind>(mb, ctx, name, status, create);
}

CMPIStatus zemBaseProviderManager::cleanupInstanceMI(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                                     CMPIBoolean terminating) {
    return cleanupRecord<InstanceKind>(mi, ctx, terminating);
}

CMPIStatus zemBaseProviderManager::cleanupAssociationMI(CMPIAssociationMI* mi,
                                                        const CMPIContext* ctx,
                                                        CMPIBoolean terminating) {
    return cleanupRecord<AssociationKind>(mi, ctx, terminating);
}

CMPIStatus zemBaseProviderManager::cleanupMethodMI(CMPIMethodMI* mi, const CMPIContext* ctx,
                                                   CMPIBoolean terminating) {
    return cleanupRecord<MethodKind>(mi, ctx, terminating);
}

CMPIStatus zemBaseProviderManager::cleanupIndicationMI(CMPIIndicationMI* mi, const CMPIContext* ctx,
                                                       CMPIBoolean terminating) {
    return cleanupRecord<IndicationKind>(mi, ctx, terminating);
}

CMPIStatus zemBaseProviderManager::cleanupPropertyMI(CMPIPropertyMI* mi, const CMPIContext* ctx,
                                                     CMPIBoolean terminating) {
    return cleanupRecord<PropertyKind>(mi, ctx, terminating);
}
