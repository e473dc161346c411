#include <array>
#include <cstddef>
#include <cstdlib>
#include <string>
#include <string_view>

#include "Exception.h"
#include "QyallocCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "ResourcePoolManager.h"
#include "SystemConfigSupport.h"
#include "SystemStateText.h"
#include "VirtualSystemRep.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;
using Capability = zemCECCapability;

constexpr unsigned kChains = 8;

/// What the library's capability words tell.
constexpr struct {
    bool Capability::*field;
    std::size_t word;
    unsigned bit;
} kWordBits[] = {
    {&Capability::m_activeLparMobilityCapable, 1, 32},
    {&Capability::m_inactiveLparMobilityCapable, 1, 64},
    {&Capability::m_virtualIoServerCapable, 0, 8},
    {&Capability::m_virtualSwitchCapable, 1, 1},
    {&Capability::m_osq00Capable, 0, 64},
    {&Capability::m_redundantErrPathReportingCapable, 0, 32},
    {&Capability::m_lparSuspendCapable, 5, 16},
};

constexpr std::size_t kCompatModesWord = 2;
constexpr unsigned kCompatModesBit = 16;

/// The bit of "RuntimeCapability" that osq00 partitions need besides.
constexpr unsigned long long kOsq00Runtime = 1ULL << 30;

/// What the tool's attributes tell, besides the list of compatibility modes.
constexpr struct {
    bool Capability::*field;
    int attribute;
} kAttributes[] = {
    {&Capability::m_activeLparMobilityCapable, Host::ATTR_ACTIVE_LPAR_MOBILITY_CAPABLE},
    {&Capability::m_inactiveLparMobilityCapable, Host::ATTR_INACTIVE_LPAR_MOBILITY_CAPABLE},
    {&Capability::m_virtualIoServerCapable, Host::ATTR_VIRTUAL_IO_SERVER_CAPABLE},
    {&Capability::m_virtualSwitchCapable, Host::ATTR_VIRTUAL_SWITCH_CAPABLE},
    {&Capability::m_osq00Capable, Host::ATTR_OSQ00_CAPABLE},
};

using Words = std::array<unsigned long long, 32>;

unsigned long long wordOf(const char* text) {
    constexpr int kBase = 10;
    return std::strtoull(text, nullptr, kBase);
}

/// The words of a list that stands between two brackets.
Words wordsOf(const zemString& list) {
    Words words{};
    std::string_view rest(list);
    rest = rest.size() < 2 ? std::string_view() : rest.substr(1, rest.size() - 2);
    for (unsigned long long& word : words) {
        const std::size_t comma = rest.find(',');
        word = wordOf(std::string(rest.substr(0, comma)).c_str());
        if (comma == std::string_view::npos) {
            break;
        }
        rest.remove_prefix(comma + 1);
    }
    return words;
}

using SystemQuery = zemRecordSetsType (zemQyallocCmdCaller::*)(int*, const char*, int, const char*);

/// A limit of a host, asked of the tool unless @p kept is known.
int limitOf(int& kept, SystemQuery query, int attribute, const zemString& systemName) {
    if (kept == -1) {
        int wanted[] = {attribute, -1};
        zemQyallocCmdCaller caller("", "");
        const zemRecordSetsType records = (caller.*query)(wanted, systemName, 0, nullptr);
        kept = records.size() == 0 ? 0 : zemNumberOf((*records.getElementAt(0))[attribute]);
    }
    return kept;
}

}  // namespace

zemLogicalDevice::~zemLogicalDevice() = default;

zemComputerSystem::~zemComputerSystem() = default;

zemCEC::zemCEC() : m_lparHash(kChains) {}

zemCEC::zemCEC(const zemString& mtms, const zemString& systemName) : zemCEC() {
    m_MTMS = mtms;
    m_SystemName = systemName;
}

zemCEC::~zemCEC() = default;

void zemCEC::setStatePlus(const zemString& code) {
    m_state = zemHostStateText(zemWholeNumberOf(code));
}

void zemCEC::setCapability(const zemCECCapability* capability) {
    if (capability != nullptr) {
        m_capability = *capability;
    }
}

void zemCEC::setCapability(const zemString& exCaps, const zemString& runtimeCap) {
    const Words words = wordsOf(exCaps);
    for (const auto& row : kWordBits) {
        m_capability.*row.field = (words[row.word] & row.bit) != 0;
    }
    m_capability.m_osq00Capable &= (wordOf(runtimeCap) & kOsq00Runtime) != 0;
    m_capability.m_lparProcCompatModes =
        (words[kCompatModesWord] & kCompatModesBit) != 0 ? "1" : "0";
}

void zemCEC::setCapability(const zemRecordType& record) {
    zemString value;
    for (const auto& row : kAttributes) {
        if (record.lookup(row.attribute, value) == 0) {
            m_capability.*row.field = value == "1";
        }
    }
    record.lookup(Host::ATTR_LPAR_PROC_COMPAT_MODES, m_capability.m_lparProcCompatModes);
}

zemString zemCEC::getType(int attribute) const {
    for (const auto& row : kAttributes) {
        if (row.attribute == attribute) {
            return m_capability.*row.field ? "1" : "0";
        }
    }
    return attribute == Host::ATTR_LPAR_PROC_COMPAT_MODES ? m_capability.m_lparProcCompatModes
                                                          : zemString();
}

void zemCEC::setSuspendRRCapableAttributes(int maxSuspendLpars, int maxRemoteRestartLpars,
                                           int suspendCapable, int remoteRestartCapable,
                                           int activeMemorySharingCapable) {
    m_capability.m_maxNumberOfSuspendCapableLpars = maxSuspendLpars;
    m_capability.m_maxNumberOfRemoteRestartCapableLpars = maxRemoteRestartLpars;
    m_capability.m_lparSuspendCapable = suspendCapable != 0;
    m_capability.m_lparRemoteRestartCapable = remoteRestartCapable != 0;
    m_capability.m_activeMemorySharingCapable = activeMemorySharingCapable != 0;
}

int zemCEC::getMaxMemPools() {
    return limitOf(
        m_capability.m_maxMemPools, &zemQyallocCmdCaller::getSystemMemoryResources,
        zemQyallocCmdCaller::MemoryResourceAttribute::SysLevelAttribute::ATTR_MAX_MEM_POOLS,
        m_SystemName);
}

int zemCEC::getMaxProcPools() {
    return limitOf(m_capability.m_maxProcPools, &zemQyallocCmdCaller::getSystemProcessorResources,
                   zemQyallocCmdCaller::ProcessorResourceAttribute::SysLevelAttribute::
                       ATTR_MAX_SHARED_PROC_POOLS,
                   m_SystemName);
}

void zemCEC::addLpar(zemLPAR* lpar) { own(m_LPARs, lpar); }

zemLparHashType zemCEC::getLparHashMapping() {
    if (!m_isLparHashed) {
        m_isLparHashed = true;
        m_lparHash.clear();
        for (int i = 0; i < m_LPARs.size(); ++i) {
            zemLPAR* const lpar = m_LPARs.getElementAt(i);
            m_lparHash.insert(lpar->getLparID(), lpar);
        }
    }
    return m_lparHash;
}

void zemCEC::buildupVirtualLpar() {
    if (m_VirtualLpar == nullptr) {
        m_VirtualLpar = new zemLPAR("virtual_lpar_id");
    }
}

void zemCEC::releaseVirtualLpar() {
    delete m_VirtualLpar;
    m_VirtualLpar = nullptr;
}

zemProcessorPoolResource& zemCEC::getProcessorPool(const zemString& poolId) const {
    for (int i = 0; i < m_ProcessorPool.size(); ++i) {
        zemProcessorPoolResource* const pool = m_ProcessorPool.getElementAt(i);
        if (pool->getSharedProcPoolId() == poolId) {
            return *pool;
        }
    }
    throw zemInvalidParameterException("zemCEC", "getProcessorPool", "Pool ID : " + poolId);
}
