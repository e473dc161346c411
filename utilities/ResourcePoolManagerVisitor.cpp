#include "ResourcePoolManagerVisitor.h"

#include <cstddef>
#include <utility>

#include "ResourcePoolManagerRows.h"

namespace {

using Step = void (*)(zemCECVisitor& hosts);

/// An operation of the visitor that hangs records on hosts, or on partitions.
template <int (zemCECVisitor::*operation)(const zemString&, int)>
void ofHosts(zemCECVisitor& hosts) {
    (hosts.*operation)("", zemCECVisitor::Level_All);
}
template <int (zemCECVisitor::*operation)(const zemString&, const zemString&, int)>
void ofPartitions(zemCECVisitor& hosts) {
    (hosts.*operation)("", "", zemCECVisitor::Level_All);
}

/// Whether any host has what @p count counts.
template <class Count>
bool isThere(zemCECVisitor& hosts, Count count) {
    for (int i = 0; i < hosts.size(); ++i) {
        if (count(*hosts.getData(i)) > 0) {
            return true;
        }
    }
    return false;
}

void partitions(zemCECVisitor& hosts) {
    if (!isThere(hosts, [](zemCEC& host) { return host.getLPARs().size(); })) {
        hosts.initializeLparResource("", "", zemCECVisitor::Level_All, VISITOR_TYPE_LPAR);
    }
}

void poolProcessors(zemCECVisitor& hosts) {
    if (!isThere(hosts, [](zemCEC& host) { return host.getPoolProcessor().getMTMS().length(); })) {
        hosts.initializeProcessorLevelPool("", zemCECVisitor::Level_All);
    }
}

void processorPools(zemCECVisitor& hosts) {
    if (!isThere(hosts, [](zemCEC& host) { return host.getProcessorPool().size(); })) {
        hosts.initializeProcessorPool("", zemCECVisitor::Level_All);
    }
}

using V = zemCECVisitor;

/// What is read in the order of zemResourcePool::getIndexFromClassName(): for names, of hosts and
/// of their pools, and for quantities besides, of pools and of partitions. The settings of
/// partitions are made of the first and the last of these, too.
constexpr struct {
    Step host, pools, poolQuantities, partition;
} kSteps[zemPoolRowCount] = {
    {ofHosts<&V::initializeProcessorLevelSys>, processorPools, poolProcessors,
     ofPartitions<&V::initializeProcessorLevelLpar>},
    {ofHosts<&V::initializeMemoryLevelSys>, ofHosts<&V::initializeMemoryPool>, nullptr,
     ofPartitions<&V::initializeMemoryLevelLpar>},
    {nullptr, nullptr, nullptr, ofPartitions<&V::initializeIOSlotLevelLpar>},
    {nullptr, nullptr, nullptr, ofPartitions<&V::initializeEthernetAdapterLevelLpar>},
    {nullptr, nullptr, nullptr, ofPartitions<&V::initializeSerialAdapterLevelLpar>},
    {nullptr, nullptr, nullptr, ofPartitions<&V::initializeSCSIAdapterLevelLpar>},
};

void run(bool isWanted, Step step, zemCECVisitor& hosts) {
    if (isWanted && step != nullptr) {
        step(hosts);
    }
}

template <class Pool>
std::unique_ptr<zemResourcePool> make() {
    return std::make_unique<Pool>();
}

}  // namespace

int zemHierarchyPoolVistor::size() const {
    int count = 0;
    const zemDynamicArray<zemResourcePool>& pools = m_CEC->getRPs();
    for (int i = 0; i < pools.size(); ++i) {
        count += 1 + pools.getElementAt(i)->getSubPoolSize();
    }
    return count;
}

zemResourcePool* zemHierarchyPoolVistor::getData(int index) const {
    const zemDynamicArray<zemResourcePool>& pools = m_CEC->getRPs();
    for (int i = 0; index >= 0 && i < pools.size(); ++i) {
        zemResourcePool* const pool = pools.getElementAt(i);
        if (index <= pool->getSubPoolSize()) {
            return index == 0 ? pool : pool->getSubPool(index - 1);
        }
        index -= 1 + pool->getSubPoolSize();
    }
    return nullptr;
}

void zemRPVisitor::readHosts(zemCECVisitor& hosts, const zemString& className, int mode,
                             bool haveSettings) {
    const int row = zemResourcePool::getIndexFromClassName(className, true);
    if (row == -1) {
        return;
    }
    const bool isQuantified = zemResourcePool::isQuantified(mode);
    run(!haveSettings, kSteps[row].host, hosts);
    run(true, kSteps[row].pools, hosts);
    run(isQuantified, kSteps[row].poolQuantities, hosts);
    run(isQuantified, partitions, hosts);
    run(isQuantified && !haveSettings, kSteps[row].partition, hosts);
}

int zemRPVisitor::initialize(const zemString& className, int level) {
    m_CEC->getRPs().clear();
    m_CEC->getRPs().reSetOwership();
    if (!className.isEmpty()) {
        m_Type = className;
    }
    std::unique_ptr<zemResourcePool> pool = getResourcePool();
    if (pool == nullptr || pool->initialize(m_CEC, m_Env.m_userName, level) == -1) {
        return -1;
    }
    m_CEC->getRPs().addElement(std::move(pool));
    return 0;
}

std::unique_ptr<zemResourcePool> zemRPVisitor::getResourcePool() const {
    static constexpr std::unique_ptr<zemResourcePool> (*kMakers[zemPoolRowCount])() = {
        make<zemProcessorPool>,       make<zemMemoryPool>,        make<zemIOSlotPool>,
        make<zemEthernetAdapterPool>, make<zemSerialAdapterPool>, make<zemSCSIAdapterPool>};
    const int row = zemResourcePool::getIndexFromClassName(m_Type, true);
    return row == -1 ? nullptr : kMakers[row]();
}
