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

void processorPools(zemCECVisitor& hosts) {
    if (!isThere(hosts, [](zemCEC& host) { return host.getProcessorPool().size(); })) {
        hosts.initializeProcessorPool("", zemCECVisitor::Level_All);
    }
}

using V = zemCECVisitor;

/// What is read for names, and for quantities besides, in the order of
/// zemResourcePool::getIndexFromClassName().
constexpr struct {
    Step names[2];
    Step quantities[3];
} kSteps[zemPoolRowCount] = {
    {{ofHosts<&V::initializeProcessorLevelSys>, processorPools},
     {ofHosts<&V::initializeProcessorLevelPool>, partitions,
      ofPartitions<&V::initializeProcessorLevelLpar>}},
    {{ofHosts<&V::initializeMemoryLevelSys>, ofHosts<&V::initializeMemoryPool>},
     {partitions, ofPartitions<&V::initializeMemoryLevelLpar>}},
    {{},
     {partitions, ofPartitions<&V::initializeIOSlotLevelLpar>,
      ofHosts<&V::initializeIOSlotLevelSys>}},
    {{}, {partitions, ofPartitions<&V::initializeEthernetAdapterLevelLpar>}},
    {{}, {partitions, ofPartitions<&V::initializeSerialAdapterLevelLpar>}},
    {{}, {partitions, ofPartitions<&V::initializeSCSIAdapterLevelLpar>}},
};

template <std::size_t N>
void run(const Step (&steps)[N], zemCECVisitor& hosts) {
    for (const Step step : steps) {
        if (step != nullptr) {
            step(hosts);
        }
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

void zemRPVisitor::readHosts(zemCECVisitor& hosts, const zemString& className, int mode) {
    const int row = zemResourcePool::getIndexFromClassName(className, true);
    if (row == -1) {
        return;
    }
    run(kSteps[row].names, hosts);
    if (zemResourcePool::isQuantified(mode)) {
        run(kSteps[row].quantities, hosts);
    }
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
