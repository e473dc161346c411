#include <functional>
#include <string_view>
#include <type_traits>
#include <unordered_map>
#include <utility>

#include "Log.h"
#include "NumberText.h"
#include "QyplatCmdCaller.h"
#include "VirtualSystemVisitorCEC.h"

namespace {

using Partition = zemQyplatCmdCaller::PartitionAttribute;

/// The visitor's hosts by key and their partitions by number, for one operation: the tables that
/// hosts give out have few chains, and are copied each time. Of two with one key the first counts.
/// To a single host belongs whatever was read for it.
class Owners {
public:
    explicit Owners(zemCECVisitor& visitor) {
        for (int i = 0; i < visitor.size(); ++i) {
            zemCEC* const host = visitor.getData(i);
            m_hosts.emplace(host->getMTMS(), Host{host, {}, false});
        }
        m_isSingle = visitor.size() == 1;
    }

    /// Null: there is none.
    template <class Owner, class Record>
    Owner* of(const Record& record) {
        if constexpr (std::is_same_v<Owner, zemCEC>) {
            Host* const host = find(record.getMTMS());
            return host == nullptr ? nullptr : host->cec;
        } else {
            return partition(record.getMTMS(), record.getLparID());
        }
    }

    zemLPAR* partition(const zemString& mtms, const zemString& lparid) {
        Host* const host = find(mtms);
        if (host == nullptr) {
            return nullptr;
        }
        if (!host->isFilled) {
            host->isFilled = true;
            for (int i = 0; i < host->cec->getLPARs().size(); ++i) {
                zemLPAR* const lpar = host->cec->getLPARs().getElementAt(i);
                host->lpars.emplace(lpar->getLparID(), lpar);
            }
        }
        const auto found = host->lpars.find(std::string_view(lparid));
        return found == host->lpars.end() ? nullptr : found->second;
    }

private:
    /// Texts are the objects' own.
    template <class Value>
    using Table = std::unordered_map<std::string_view, Value>;

    struct Host {
        zemCEC* cec;
        Table<zemLPAR*> lpars;
        bool isFilled;
    };

    Host* find(const zemString& mtms) {
        const auto found = m_isSingle ? m_hosts.begin() : m_hosts.find(std::string_view(mtms));
        return found == m_hosts.end() ? nullptr : &found->second;
    }

    Table<Host> m_hosts;
    bool m_isSingle = false;
};

/// An operation that hangs records: its name, and what it was called with.
struct Hanging {
    const char* operation;
    zemCECVisitor* visitor;
    const zemString& userName;
    const zemString& lparid;
    int level;
};

template <class Record>
using OfPartitions = zemDynamicArray<Record> (zemCECVisitor::*)(const zemString&, int,
                                                                const zemString&,
                                                                const zemString&) const;
template <class Record>
using OfHosts = zemDynamicArray<Record> (zemCECVisitor::*)(const zemString&, int,
                                                           const zemString&) const;

template <class Record>
zemDynamicArray<Record> recordsOf(const Hanging& hanging, OfPartitions<Record> read,
                                  const zemString& mtms, const zemString& lparid) {
    return (hanging.visitor->*read)(hanging.userName, hanging.level, mtms, lparid);
}

template <class Record>
zemDynamicArray<Record> recordsOf(const Hanging& hanging, OfHosts<Record> read,
                                  const zemString& mtms, const zemString& /*lparid*/) {
    return (hanging.visitor->*read)(hanging.userName, hanging.level, mtms);
}

void tellBegin(const char* operation) {
    zemLog::LogPlain(zemString("+++++ ") + operation + " start");
    zemLog::LogPlain("++++cec number");
}

/// Hands each record of @p records to @p store of its owner: the object, or what it holds.
template <class Owner, class Record, class Store>
void hangAll(zemDynamicArray<Record> records, zemCECVisitor& visitor, Store store) {
    Owners owners(visitor);
    for (int i = 0; i < records.size(); ++i) {
        Owner* const owner = owners.of<Owner>(*records.getElementAt(i));
        if (owner == nullptr) {
            continue;
        }
        if constexpr (std::is_invocable_v<Store, Owner&, Record*>) {
            std::invoke(store, *owner, std::exchange(records[i], nullptr));
        } else {
            std::invoke(store, *owner, std::move(*records.getElementAt(i)));
        }
    }
}

/// The records of what is visited; none without hosts, and then nothing is asked for.
template <class Read>
auto recordsOf(const Hanging& hanging, Read read) {
    tellBegin(hanging.operation);
    const int hosts = hanging.visitor->size();
    const bool isSingle = hosts == 1;
    const zemString mtms = isSingle ? hanging.visitor->getData(0)->getMTMS() : zemString();
    const zemString lparid = isSingle ? hanging.lparid : zemString();
    using Records = decltype(recordsOf(hanging, read, mtms, lparid));
    return hosts == 0 ? Records() : recordsOf(hanging, read, mtms, lparid);
}

template <class Owner, class Read, class Store>
int hang(const Hanging& hanging, Read read, Store store) {
    hangAll<Owner>(recordsOf(hanging, read), *hanging.visitor, store);
    return 0;
}

/// Tells hosts how many slots they have.
void countSlots(zemCECVisitor& visitor, const zemDynamicArray<zemPartitionIOSlotResource>& slots) {
    for (int i = 0; i < visitor.size(); ++i) {
        visitor.getData(i)->setIOSlotCount(0);
    }
    Owners owners(visitor);
    for (int i = 0; i < slots.size(); ++i) {
        if (zemCEC* const host = owners.of<zemCEC>(*slots.getElementAt(i))) {
            host->setIOSlotCount(host->getIOSlotCount() + 1);
        }
    }
}

void addPartition(zemCEC& host, zemLPAR* lpar) {
    host.addLpar(lpar);
    host.setLparHashState(false);
}

zemString valueOf(const zemRecordType& record, int attribute) {
    zemString value;
    record.lookup(attribute, value);
    return value;
}

/// Hands each record of a host's partitions to @p take with its partition.
template <class Take>
void onPartitions(const zemRecordSetsType& records, Owners& owners, const zemString& mtms,
                  Take take) {
    for (int i = 0; i < records.size(); ++i) {
        const zemRecordType& record = *records.getElementAt(i);
        if (zemLPAR* const lpar =
                owners.partition(mtms, valueOf(record, Partition::ATTR_LPAR_ID))) {
            take(*lpar, record);
        }
    }
}

}  // namespace

int zemCECVisitor::initializeLparResource(const zemString& userName, const zemString& lparid,
                                          int level, int /*type*/) {
    const OfPartitions<zemLPAR> read = &zemCECVisitor::getAllPartitionObjectsByKeys;
    return hang<zemCEC>({"initializeLparResource", this, userName, lparid, level}, read,
                        addPartition);
}

int zemCECVisitor::initializeLparResource(const zemString& userName, const zemString& lparid,
                                          int* /*mask*/, int type) {
    return initializeLparResource(userName, lparid, Level_All, type);
}

int zemCECVisitor::initializeLparProfile(const zemString& userName, const zemString& lparid,
                                         int level) {
    const OfPartitions<zemPartitionProfileConfiguration> read =
        &zemCECVisitor::getAllProfileLevelLparByKeys;
    return hang<zemLPAR>({"initializeLparProfile", this, userName, lparid, level}, read,
                         &zemLPAR::addLparProfile);
}

int zemCECVisitor::initializeLparProfile(const zemString& userName, const zemString& lparid,
                                         int* /*mask*/) {
    return initializeLparProfile(userName, lparid, Level_All);
}

// What hangs on partitions, and what on hosts: the operation, the collection that it reads, and
// the owner's operation that takes a record.
#define ON_PARTITIONS(NAME, READ, STORE)                                                     \
    int zemCECVisitor::NAME(const zemString& userName, const zemString& lparid, int level) { \
        return hang<zemLPAR>({#NAME, this, userName, lparid, level}, &zemCECVisitor::READ,   \
                             &zemLPAR::STORE);                                               \
    }
#define ON_HOSTS(NAME, READ, STORE)                                                            \
    int zemCECVisitor::NAME(const zemString& userName, int level) {                            \
        return hang<zemCEC>({#NAME, this, userName, zemString(), level}, &zemCECVisitor::READ, \
                            &zemCEC::STORE);                                                   \
    }

// clang-format off
ON_PARTITIONS(initializeProcessorLevelLpar, getAllProcessorLevelLparByKeys, setLparProcessor)
ON_PARTITIONS(initializeMemoryLevelLpar, getAllMemoryLevelLparByKeys, setLparMemory)
ON_PARTITIONS(initializeSerialAdapterLevelLpar, getAllSerialAdapterLevelLparByKeys, addLparSerialAdapter)
ON_PARTITIONS(initializeSCSIAdapterLevelLpar, getAllSCSIAdapterLevelLparByKeys, addLparSCSIAdapter)
ON_PARTITIONS(initializeEthernetAdapterLevelLpar, getAllEthernetAdapterLevelLparByKeys, addLparEthernetAdapter)

ON_HOSTS(initializeProcessorLevelSys, getAllProcessorLevelSysByKeys, setProcessor)
ON_HOSTS(initializeProcessorLevelPool, getAllProcessorLevelPoolByKeys, setPoolProcessor)
ON_HOSTS(initializeProcessorPool, getAllProcessorPoolByKeys, addProcessorPool)
ON_HOSTS(initializeMemoryLevelSys, getAllMemoryLevelSysByKeys, setMemory)
ON_HOSTS(initializeMemoryPool, getAllMemoryPoolByKeys, setMemoryPool)
// clang-format on

#undef ON_PARTITIONS
#undef ON_HOSTS

int zemCECVisitor::initializeIOSlotLevelLpar(const zemString& userName, const zemString& lparid,
                                             int level) {
    zemDynamicArray<zemPartitionIOSlotResource> all = recordsOf(
        Hanging{"initializeIOSlotLevelLpar", this, userName, lparid, level}, &zemCECVisitor::slots);
    if (lparid.isEmpty() || size() > 1) {
        countSlots(*this, all);
    }
    hangAll<zemLPAR>(all, *this, &zemLPAR::addLparIOSlot);
    return 0;
}

int zemCECVisitor::initializeLparSuspendRR(const zemString& userName, const zemString& lparid,
                                           int* /*mask*/) {
    tellBegin("initializeLparSuspendRR");
    const zemString wanted = size() == 1 ? lparid : zemString();
    Owners owners(*this);
    for (int i = 0; i < size(); ++i) {
        if (getData(i)->getLPARs().size() == 0) {
            continue;  // the tool would call it a failure to find none
        }
        const zemString mtms = getData(i)->getMTMS();
        onPartitions(getSuspendCapable(userName, mtms, wanted), owners, mtms,
                     [](zemLPAR& lpar, const zemRecordType& record) {
                         const zemString value = valueOf(record, Partition::ATTR_SUSPEND_CAPABLE);
                         if (value.isDigit()) {
                             lpar.setSuspendCapable(zemNumberOf(value));
                         }
                     });
        onPartitions(getRRCapable(userName, mtms, wanted), owners, mtms,
                     [](zemLPAR& lpar, const zemRecordType& record) {
                         lpar.setRRCapable(
                             zemNumberOf(valueOf(record, Partition::ATTR_REMOTE_RESTART_CAPABLE)));
                         lpar.setRRState(valueOf(record, Partition::ATTR_REMOTE_RESTART_STATUS));
                     });
    }
    return 0;
}
