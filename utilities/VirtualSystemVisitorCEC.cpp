#include "VirtualSystemVisitorCEC.h"

#include <algorithm>
#include <iterator>
#include <memory>
#include <utility>

#include "Log.h"
#include "NumberText.h"
#include "QyplatCmdCaller.h"
#include "VirtualSystemVisitorLPAR.h"
#include "VirtualSystemVisitorReaders.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;

constexpr unsigned kChains = 8;

/// What is told of suspending and restarting, under the names by which it is printed.
constexpr struct {
    const char* name;
    int attribute;
} kSuspendRR[] = {
    {"typeModel: ", Host::ATTR_TYPE_MODEL},
    {"serialNum: ", Host::ATTR_SERIAL_NUM},
    {"maxSusLpars: ", Host::ATTR_MAX_SUSPEND_CAPABLE_LPARS},
    {"maxRRLpars: ", Host::ATTR_MAX_REMOTE_RESTART_CAPABLE_LPARS},
    {"SuspendCapable: ", Host::ATTR_LPAR_SUSPEND_CAPABLE},
    {"RRCapable: ", Host::ATTR_CORALHV_LPAR_REMOTE_RESTART_CAPABLE},
    {"activeMemSharingCapable: ", Host::ATTR_ACTIVE_MEMORY_SHARING_CAPABLE},
};

bool isOperating(const zemCEC& host) {
    return zemString::equalsIgnoreCase(host.getState(), "Operating") ||
           zemString::equalsIgnoreCase(host.getState(), "Standby");
}

int indexOf(const zemDynamicArray<zemCEC>& hosts, const zemString& mtms) {
    for (int i = 0; i < hosts.size(); ++i) {
        if (hosts.getElementAt(i)->getMTMS() == mtms) {
            return i;
        }
    }
    return -1;
}

}  // namespace

zemCECVisitor::zemCECVisitor(zemVirtualizationManager* vm, const zemString& type)
    : m_VM(vm), m_Type(type), m_CECHash(kChains) {}

int zemCECVisitor::size() const { return m_VM->m_CECs.size(); }

zemCEC* zemCECVisitor::getData(int index) { return m_VM->m_CECs.getElementAt(index); }

zemCEC* zemCECVisitor::getData(const zemString& mtms) {
    const int index = indexOf(m_VM->m_CECs, mtms);
    if (index >= 0 || mtms.isEmpty()) {  // without a key the tool would tell of all hosts
        return getData(index);
    }
    int wanted[] = {Host::ATTR_NAME,
                    Host::ATTR_ACTIVE_LPAR_MOBILITY_CAPABLE,
                    Host::ATTR_INACTIVE_LPAR_MOBILITY_CAPABLE,
                    Host::ATTR_VIRTUAL_IO_SERVER_CAPABLE,
                    Host::ATTR_VIRTUAL_SWITCH_CAPABLE,
                    Host::ATTR_LPAR_PROC_COMPAT_MODES,
                    Host::ATTR_OSQ00_CAPABLE,
                    Host::ATTR_END};
    const zemRecordSetsType records = zemRecordsOf([&] {
        return zemQyplatCmdCaller(m_Env.m_userName, m_Env.m_locale)
            .getManagedSystemInformation(wanted, mtms);
    });
    if (records.size() == 0) {
        return nullptr;
    }
    const zemRecordType& record = *records.getElementAt(0);
    auto host = std::make_unique<zemCEC>(mtms, record[Host::ATTR_NAME]);
    host->setCapability(record);
    m_VM->m_CECs.addElement(std::move(host));
    setCECHashState(false);
    return getData(size() - 1);
}

int zemCECVisitor::initialize(const zemString& userName, bool onlyOperating, int level) {
    return initialize(userName, onlyOperating, "", level);
}

int zemCECVisitor::initialize(const zemString& userName, bool onlyOperating, const zemString& mtms,
                              int level) {
    m_VM->m_CECs.clear();
    setCECHashState(false);
    zemDynamicArray<zemCEC> hosts = getAllCECObjectsByKeys(userName, level, mtms);
    const bool isSingle = !mtms.isEmpty();
    if (isSingle && hosts.size() != 1) {
        return -1;
    }
    for (int i = 0; i < hosts.size(); ++i) {
        if (!onlyOperating || isOperating(*hosts.getElementAt(i))) {
            m_VM->m_CECs.addElement(std::unique_ptr<zemCEC>(std::exchange(hosts[i], nullptr)));
        }
    }
    return isSingle && size() == 0 ? -1 : 1;
}

zemRecordSetsType zemCECVisitor::getSuspendRRCapableAttributes(const zemString& userName,
                                                               int /*level*/,
                                                               const zemString& mtms) const {
    int wanted[std::size(kSuspendRR) + 1] = {};
    *std::transform(std::begin(kSuspendRR), std::end(kSuspendRR), wanted,
                    [](const auto& row) { return row.attribute; }) = Host::ATTR_END;
    return zemQyplatCmdCaller(actor(userName), m_Env.m_locale)
        .getManagedSystemInformation(wanted, mtms);
}

int zemCECVisitor::initilaizeCECSuspendRR(const zemString& userName, int level) {
    if (size() == 0) {
        return 0;
    }
    const zemString mtms = size() == 1 ? getData(0)->getMTMS() : zemString();
    const zemcecHashType hosts = getCECHashMapping(this);
    const zemRecordSetsType records = getSuspendRRCapableAttributes(userName, level, mtms);
    for (int i = 0; i < records.size(); ++i) {
        const zemRecordType& record = *records.getElementAt(i);
        for (const auto& row : kSuspendRR) {
            zemLog::LogPlain(row.name + record[row.attribute]);
        }
        zemCEC* const host = getCECObjectByMTMS(
            hosts, record[Host::ATTR_TYPE_MODEL] + "*" + record[Host::ATTR_SERIAL_NUM]);
        if (host != nullptr) {
            const auto number = [&record](int attribute) {
                return std::max(0, zemWholeNumberOf(record[attribute]));
            };
            host->setSuspendRRCapableAttributes(
                number(Host::ATTR_MAX_SUSPEND_CAPABLE_LPARS),
                number(Host::ATTR_MAX_REMOTE_RESTART_CAPABLE_LPARS),
                number(Host::ATTR_LPAR_SUSPEND_CAPABLE),
                number(Host::ATTR_CORALHV_LPAR_REMOTE_RESTART_CAPABLE),
                number(Host::ATTR_ACTIVE_MEMORY_SHARING_CAPABLE));
        }
    }
    return 1;
}

zemRecordSetsType zemCECVisitor::partitionsInformation(int* wanted, const zemString& userName,
                                                       const zemString& mtms,
                                                       const zemString& lparid) const {
    zemString filter;
    if (!lparid.isEmpty()) {
        filter = zemCommandCaller::quoted(zemCommandCaller::filterItem("lpar_ids", lparid));
    }
    return zemQyplatCmdCaller(actor(userName), m_Env.m_locale)
        .getPartitionsInformation(wanted, mtms, filter);
}

zemRecordSetsType zemCECVisitor::getSuspendCapable(const zemString& userName, const zemString& mtms,
                                                   const zemString& lparid) const {
    int wanted[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_STATE, Partition::ATTR_SUSPEND_CAPABLE,
                    Partition::ATTR_END};
    return partitionsInformation(wanted, userName, mtms, lparid);
}

zemRecordSetsType zemCECVisitor::getRRCapable(const zemString& userName, const zemString& mtms,
                                              const zemString& lparid) const {
    int wanted[] = {Partition::ATTR_LPAR_ID, Partition::ATTR_REMOTE_RESTART_CAPABLE,
                    Partition::ATTR_REMOTE_RESTART_STATUS, Partition::ATTR_END};
    return partitionsInformation(wanted, userName, mtms, lparid);
}

int zemCECVisitor::addCEC(zemCEC* cec, const zemString& userName) {
    std::unique_ptr<zemCEC> added(cec);
    zemLPARVisitor partitions(cec, m_Type);
    partitions.setOperEnv(m_Env);
    partitions.initialize(actor(userName), VISITOR_TYPE_ALL_INIT);
    m_VM->m_CECs.addElement(std::move(added));
    setCECHashState(false);
    return 0;
}

int zemCECVisitor::addCEC(const zemString& mtms) { return getData(mtms) == nullptr ? -1 : 0; }

int zemCECVisitor::removeCEC(const zemString& mtms) {
    const int index = indexOf(m_VM->m_CECs, mtms);
    setCECHashState(false);
    return m_VM->m_CECs.removeElementAt(index) == 0 ? 0 : -1;
}

int zemCECVisitor::modifyCEC(const zemCEC* cec) {
    zemCEC* const known = getData(indexOf(m_VM->m_CECs, cec->getMTMS()));
    if (known == nullptr) {
        return -1;
    }
    known->setSystemName(cec->getSystemName());
    known->setState(cec->getState());
    return 0;
}

zemcecHashType zemCECVisitor::getCECHashMapping(zemCECVisitor* visitor) {
    if (!m_isCECHashed) {
        m_isCECHashed = true;
        m_CECHash.clear();
        for (int i = 0; i < visitor->size(); ++i) {
            zemCEC* const host = visitor->getData(i);
            m_CECHash.insert(host->getMTMS(), host);
        }
    }
    return m_CECHash;
}

zemCEC* zemCECVisitor::getCECObjectByMTMS(const zemcecHashType& hash, const zemString& mtms) {
    zemCEC* host = nullptr;
    hash.lookup(mtms, host);
    return host;
}

void zemCECVisitor::seperateAPIPrepName(const zemString& /*name*/, zemString& /*first*/,
                                        zemString& /*second*/) {}
