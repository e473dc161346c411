#include "DataTypeConvertUtils.h"

#include <initializer_list>
#include <string>

#include "CmpiData.h"
#include "CmpiString.h"

namespace {

zemString keyOf(const CmpiObjectPath& cop, const char* name) {
    const CmpiData key = cop.getKey(name);
    return key.getType() == CMPI_chars ? zemString(key.getCString())
                                       : zemString(key.getString().charPtr());
}

zemString behind(const zemString& value, int position) {
    return position < 0 ? zemString() : value.extractSubstring(static_cast<unsigned>(position) + 1);
}

bool isOneOf(const zemString& className, std::initializer_list<const char*> parts) {
    for (const char* part : parts) {
        if (className.find(part) >= 0) {
            return true;
        }
    }
    return false;
}

constexpr const char* kHostClass = "ORXC_CEC_CS";
constexpr const char* kPartitionClass = "ORXC_LPAR_CS";
constexpr const char* kCapabilitiesPrefix = "ORXCORAL:ZEMCap:";
constexpr const char* kServicePrefix = "SystemVirtualization:";
constexpr const char* kMetricOfHosts = "ORX:ZEM:MDHS00";
constexpr unsigned kCapabilitiesLength = 16;
constexpr unsigned kServiceLength = 21;
static_assert(std::char_traits<char>::length(kCapabilitiesPrefix) == kCapabilitiesLength);
static_assert(std::char_traits<char>::length(kServicePrefix) == kServiceLength);

/// The path that a row is applied to, and what comes of it.
struct Reading {
    const CmpiObjectPath& cop;
    const zemString className;
    const char* key;
    zemString& mtms;
    zemString& lparid;

    zemString value() const { return keyOf(cop, key); }
};

/// The classes of a row, named in full (ignoring case) or by a part (with case), the key that
/// carries the identity, and the way to cut it out.
struct Row {
    bool byPart;
    const char* classes[7];
    const char* key;
    void (*cut)(const Reading& r);

    bool fits(const zemString& className) const {
        for (const char* const* name = classes; *name != nullptr; ++name) {
            if (byPart ? className.find(*name) >= 0
                       : zemString::equalsIgnoreCase(className, *name)) {
                return true;
            }
        }
        return false;
    }
};

}  // namespace

struct zemIdentityCuts {
    static void whole(const Reading& r) { r.mtms = r.value(); }
    static void dropped(const Reading& r) { r.value(); }
    static void separated(const Reading& r) {
        zemDataTypeConvertManager::seperateMTMSAndLparID(r.value(), r.mtms, r.lparid);
    }
    static void behindFirstStar(const Reading& r) {
        const zemString value = r.value();
        r.mtms = behind(value, value.find('*'));
    }
    static void behindFirstStarOrWhole(const Reading& r) {
        const zemString value = r.value();
        r.mtms = value.find('*') < 0 ? value : behind(value, value.find('*'));
    }
    static void behindSecondStarFromRight(const Reading& r) {
        const zemString value = r.value();
        const int last = value.reverseFind('*');
        const int second = last > 0 ? value.reverseFind('*', static_cast<unsigned>(last) - 1) : -1;
        if (second > 0) {
            r.mtms = behind(value, second);
        }
    }
    static void behindFirstDash(const Reading& r) {
        const zemString value = r.value();
        r.mtms = behind(value, value.find('-'));
    }
    static void capabilities(const Reading& r) {
        const zemString value = r.value();
        r.mtms =
            behind(value, isOneOf(r.className, {"Processor", "Memory"}) ? value.find('*')
                                                                        : value.reverseFind(':'));
    }
    /// A pool class ends with the word; classes about pools, with text behind it, have no host.
    static void pool(const Reading& r) {
        if (static_cast<std::size_t>(r.className.find("Pool")) + 4 == r.className.length()) {
            behindFirstStar(r);
        }
    }
    /// Devices of a host carry its MTMS, those of anything else are cut like a partition's.
    static void device(const Reading& r) {
        if (zemString::equalsIgnoreCase(keyOf(r.cop, "SystemCreationClassName"), kHostClass)) {
            whole(r);
        } else {
            behindFirstStar(r);
        }
    }
    /// The same, but only for hosts and partitions.
    static void knownDevice(const Reading& r) {
        const zemString creator = keyOf(r.cop, "SystemCreationClassName");
        const zemString value = r.value();
        if (zemString::equalsIgnoreCase(creator, kHostClass)) {
            r.mtms = value;
        } else if (zemString::equalsIgnoreCase(creator, kPartitionClass)) {
            zemDataTypeConvertManager::seperateMTMSAndLparID(value, r.mtms, r.lparid);
        }
    }
    static void behindCapabilitiesPrefix(const Reading& r) {
        r.mtms = r.value().extractSubstring(kCapabilitiesLength);
    }
    /// Starts one byte early, so that the partition's id keeps the colon that callers expect.
    static void enabledCapabilities(const Reading& r) {
        zemDataTypeConvertManager::seperateMTMSAndLparID(
            r.value().extractSubstring(kCapabilitiesLength - 1), r.mtms, r.lparid);
    }
    static void behindServicePrefix(const Reading& r) {
        r.mtms = r.value().extractSubstring(kServiceLength);
    }
    static void metric(const Reading& r) {
        const zemString value = r.value();
        const zemString text = value.extractSubstring(kCapabilitiesLength);
        if (value.find(kMetricOfHosts) >= 0) {
            r.mtms = text;
        } else {
            zemDataTypeConvertManager::seperateMTMSAndLparID(text, r.mtms, r.lparid);
        }
    }
};

namespace {

using Cut = zemIdentityCuts;
constexpr bool kNamed = false;
constexpr bool kContains = true;

// The first row that fits decides. The tables look alike and are not: see the header.
// clang-format off
constexpr Row kHostRows[] = {
    {kNamed, {"ORXC_Processor", "ORXC_Memory", "ORXC_IOSlot", "ORXC_SerialController", "ORXC_SCSIPort",
              "ORXC_EthernetPort"},                                    "SystemName", Cut::device},
    {kNamed, {"ORXC_CEC_CS"},                                          "Name",       Cut::whole},
    {kNamed, {"ORXC_LPAR_CS"},                                         "Name",       Cut::behindFirstStar},
    {kContains, {"RASettingData"},                                     "InstanceID", Cut::behindSecondStarFromRight},
    {kContains, {"PoolConfigurationService"},                          "SystemName", Cut::whole},
    {kContains, {"poolconfigurationcapabilities"},                     "InstanceID", Cut::behindFirstDash},
    {kContains, {"Pool"},                                              "InstanceID", Cut::pool},
    {kContains, {"AllocationCapabilities"},                            "InstanceID", Cut::capabilities},
    {kNamed, {"ORXC_ConfigurationCapacity", "ORXC_MemoryCapacity"},    "Name",       Cut::whole},
    {kNamed, {"ORXC_PhysicalPackage"},                                 "Tag",        Cut::whole},
    {kNamed, {"ORXC_VLANEndpoint"},                                    "SystemName", Cut::behindFirstStarOrWhole},
    {kNamed, {"ORXC_NetworkVLAN"},                                     "InstanceID", Cut::whole},
};

constexpr Row kHostAndPartitionRows[] = {
    {kNamed, {"ORXC_CEC_CS", "ORXC_MemoryCapacity", "ORXC_ConfigurationCapacity"}, "Name", Cut::whole},
    {kNamed, {"ORXC_LPAR_CS"},                                         "Name",       Cut::separated},
    {kNamed, {"ORXC_Processor", "ORXC_Memory", "ORXC_IOSlot", "ORXC_SerialController", "ORXC_SCSIPort",
              "ORXC_EthernetPort"},                                    "SystemName", Cut::knownDevice},
    {kNamed, {"ORXC_ProcessorPool", "ORXC_MemoryPool", "ORXC_IOSlotPool", "ORXC_SerialAdapterPool",
              "ORXC_SCSIAdapterPool", "ORXC_NetworkVLAN"},             "InstanceID", Cut::behindFirstStar},
    {kNamed, {"ORXC_PhysicalPackage"},                                 "Tag",        Cut::whole},
    {kNamed, {"ORXC_AlarmDevice", "ORXC_PowerManagementService"},      "SystemName", Cut::knownDevice},
    {kContains, {"RASettingData"},                                     "InstanceID", Cut::behindSecondStarFromRight},
    {kContains, {"PoolConfigurationService"},                          "SystemName", Cut::dropped},
    {kContains, {"poolconfigurationcapabilities"},                     "InstanceID", Cut::behindFirstDash},
    {kContains, {"AllocationCapabilities"},                            "InstanceID", Cut::capabilities},
    {kNamed, {"ORXC_LANEndPoint", "ORXC_VLANEndPoint"},                "SystemName", Cut::separated},
    {kNamed, {"ORXC_VirtualSystemManagementCapabilities", "ORXC_VirtualSystemMigrationCapabilities"},
                                                                       "InstanceID", Cut::behindCapabilitiesPrefix},
    {kNamed, {"ORXC_EnabledVirtualSystemCapabilities"},                "InstanceID", Cut::enabledCapabilities},
    {kNamed, {"ORXC_VirtualSystemManagementService"},                  "Name",       Cut::behindServicePrefix},
    {kNamed, {"ORXC_ZEMMetricValue"},                                  "InstanceID", Cut::metric},
};
// clang-format on

template <std::size_t N>
void apply(const Row (&rows)[N], const CmpiObjectPath& cop, zemString& mtms, zemString& lparid) {
    const zemString className(cop.getClassName().charPtr());
    for (const Row& row : rows) {
        if (!row.fits(className)) {
            continue;
        }
        row.cut({cop, className, row.key, mtms, lparid});
        return;
    }
}

}  // namespace

zemString zemDataTypeConvertManager::getMTMSByOP(const CmpiObjectPath& cop) {
    zemString mtms, lparid;
    apply(kHostRows, cop, mtms, lparid);
    return mtms;
}

void zemDataTypeConvertManager::getMTMSAndLparIDByOp(const CmpiObjectPath& cop, zemString& mtms,
                                                     zemString& lparid) {
    mtms = "";
    lparid = "";
    apply(kHostAndPartitionRows, cop, mtms, lparid);
}

void zemDataTypeConvertManager::seperateMTMSAndLparID(const zemString& key, zemString& mtms,
                                                      zemString& lparid) {
    const int star = key.find('*');
    if (star < 0) {
        return;
    }
    lparid = key.extractSubstring(0, static_cast<unsigned>(star));
    mtms = behind(key, star);
}
