// What is asked for when a partition is made is what tools and management library then tell of it.
#include <gtest/gtest.h>

#include <cmath>
#include <map>
#include <random>

#include "Exception.h"
#include "NwplatCmdCaller.h"
#include "QyplatCmdCaller.h"
#include "SystemConfig.h"
#include "TestAppliance.h"

namespace {

using New = zemNwplatCmdCaller::PartitionAttribute;
using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;
using testing_support::TestAppliance;

constexpr char kHost[] = "1111-AAA*0000001";
constexpr unsigned kFirstId = 20;  // of the partitions that are made

struct Asked {
    int creation;  ///< position in the creation tool's table
    int profile;   ///< in that of the profile's query
    std::string value;
};

using Configuration = std::vector<Asked>;

/// One of many configurations, the same for the same @p seed.
class Generator {
public:
    explicit Generator(unsigned seed) : m_seed(seed), m_random(seed) {}

    Configuration make() {
        const bool dedicated = below(2) == 1;
        const int memory = 1 + below(16), procs = 1 + below(4);
        add(New::ATTR_LPAR_ID, Profile::ATTR_LPAR_ID, std::to_string(kFirstId + m_seed));
        add(New::ATTR_NAME, Profile::ATTR_LPAR_NAME, name("p"));
        add(New::ATTR_PROFILE_NAME, Profile::ATTR_NAME, name("f"));
        add(New::ATTR_LPAR_ENV, Profile::ATTR_LPAR_ENV, one({"tmxlinux", "xbrgserver", "osq00"}));
        add(New::ATTR_BOOT_MODE, Profile::ATTR_BOOT_MODE, one({"norm", "dd", "ds", "of", "sms"}));
        add(New::ATTR_AUTO_START, Profile::ATTR_AUTO_START, flag());
        add(New::ATTR_CONN_MONITORING, Profile::ATTR_CONN_MONITORING, flag());
        add(New::ATTR_REDUNDANT_ERR_PATH_REPORTING, Profile::ATTR_REDUNDANT_ERR_PATH_REPORTING,
            flag());
        add(New::ATTR_MAX_VIRTUAL_SLOTS, Profile::ATTR_MAX_VIRTUAL_SLOTS, number(20 + below(80)));
        add(New::ATTR_MIN_MEM, Profile::ATTR_MIN_MEM, number(256 * memory));
        add(New::ATTR_DESIRED_MEM, Profile::ATTR_DESIRED_MEM, number(256 * memory * 2));
        add(New::ATTR_MAX_MEM, Profile::ATTR_MAX_MEM, number(256 * memory * 4));
        add(New::ATTR_PROC_MODE, Profile::ATTR_PROC_MODE, dedicated ? "ded" : "shared");
        const std::string sharing =
            one(dedicated ? Words{"keep_idle_procs", "share_idle_procs"} : Words{"cap", "uncap"});
        add(New::ATTR_SHARING_MODE, Profile::ATTR_SHARING_MODE, sharing);
        if (sharing == "uncap") {
            add(New::ATTR_UNCAP_WEIGHT, Profile::ATTR_UNCAP_WEIGHT, number(below(256)));
        }
        add(New::ATTR_MIN_PROCS, Profile::ATTR_MIN_PROCS, "1");
        add(New::ATTR_DESIRED_PROCS, Profile::ATTR_DESIRED_PROCS, number(procs));
        add(New::ATTR_MAX_PROCS, Profile::ATTR_MAX_PROCS, number(procs + below(4)));
        if (!dedicated) {
            addUnits(procs);
        }
        addAdapters();
        return std::move(m_asked);
    }

private:
    using Words = std::vector<const char*>;

    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    std::string one(const Words& words) { return words[m_random() % words.size()]; }
    std::string flag() { return number(below(2)); }
    static std::string number(int value) { return std::to_string(value); }
    std::string name(const std::string& start) {
        return start + std::to_string(m_seed) +
               one({"", " blank", ",comma", "\"quote", "\\slash", "$HOME", "'single", "-Bücher",
                    ", \"all\" \\of 'them' "});
    }

    void addUnits(int procs) {
        const auto units = [](int hundredths) {
            return std::to_string(hundredths / 100) + "." +
                   std::to_string(100 + hundredths % 100).substr(1);
        };
        const int least = 5 + below(20), wanted = least + procs * 5 + below(30);
        add(New::ATTR_MIN_PROC_UNITS, Profile::ATTR_MIN_PROC_UNITS, units(least));
        add(New::ATTR_DESIRED_PROC_UNITS, Profile::ATTR_DESIRED_PROC_UNITS,
            units(std::min(wanted, procs * 100)));
        add(New::ATTR_MAX_PROC_UNITS, Profile::ATTR_MAX_PROC_UNITS, units(procs * 100));
    }

    void addAdapters() {
        std::string ethernet, scsi;
        for (int slot = 2; slot < 2 + below(4); ++slot) {
            const std::string start = number(slot) + "/1/" + number(1 + below(4000));
            const std::string element = below(2) == 1
                                            ? '"' + start + "/20,30/0/" + flag() + "/default\""
                                            : start + "//0/" + flag() + "/default";
            ethernet += (ethernet.empty() ? "" : ",") + element;
        }
        for (int slot = 10; slot < 10 + below(3); ++slot) {
            scsi += (scsi.empty() ? "" : ",") + number(slot) + "/server/any//any/" + flag();
        }
        add(New::ATTR_VIRTUAL_ETH_ADAPTERS, Profile::ATTR_VIRTUAL_ETH_ADAPTERS,
            ethernet.empty() ? "none" : ethernet);
        add(New::ATTR_VIRTUAL_SCSI_ADAPTERS, Profile::ATTR_VIRTUAL_SCSI_ADAPTERS,
            scsi.empty() ? "none" : scsi);
    }

    void add(int creation, int profile, const std::string& value) {
        m_asked.push_back({creation, profile, value});
    }

    const unsigned m_seed;
    std::mt19937 m_random;
    Configuration m_asked;
};

void expectLibraryTells(const Configuration& all, zemHostSystem& host, const zemString& id) {
    std::map<int, std::string> asked;
    for (const Asked& item : all) {
        asked[item.creation] = item.value;
    }
    zemVirtualSystem partition = host.getVirtualSystemById(id);
    EXPECT_FALSE(partition.isLive());
    zemVirtualSystemProfile profile =
        partition.getVirtualSystemProfileByName(asked[New::ATTR_PROFILE_NAME].c_str());
    const auto text = [](const zemString& value) { return std::string(value); };
    const auto number = [](int value) { return std::to_string(value); };
    const auto list = [](const zemString& value) {
        return value.length() == 0 ? std::string("none") : std::string(value);
    };
    const std::pair<int, std::string> told[] = {
        {New::ATTR_NAME, text(partition.getName())},
        {New::ATTR_LPAR_ENV, text(partition.getEnv())},
        {New::ATTR_PROFILE_NAME, text(partition.getDefaultProfileName())},
        {New::ATTR_MIN_MEM, number(profile.getMinMem())},
        {New::ATTR_DESIRED_MEM, number(profile.getDesiredMem())},
        {New::ATTR_MAX_MEM, number(profile.getMaxMem())},
        {New::ATTR_MIN_PROCS, number(profile.getMinProcs())},
        {New::ATTR_DESIRED_PROCS, number(profile.getDesiredProcs())},
        {New::ATTR_MAX_PROCS, number(profile.getMaxProcs())},
        {New::ATTR_AUTO_START, number(profile.getAutoStart())},
        {New::ATTR_CONN_MONITORING, number(profile.getConnMonitoring())},
        {New::ATTR_VIRTUAL_ETH_ADAPTERS, list(profile.getVirtualEthernetAdapterString())},
        {New::ATTR_VIRTUAL_SCSI_ADAPTERS, list(profile.getVirtualSCSIAdapterString())},
    };
    for (const auto& [attribute, value] : told) {
        EXPECT_EQ(asked[attribute], value) << attribute;
    }
    const std::string units = asked[New::ATTR_DESIRED_PROC_UNITS];
    EXPECT_EQ(
        units.empty() ? profile.getDesiredProcs() * 100L : std::lround(std::stod(units) * 100),
        profile.getDesiredProcUnits());
}

TEST(ConfigurationTest, ToolsAndLibraryTellWhatWasAskedFor) {
    TestAppliance appliance{ZEM_PROGRAMS};
    ASSERT_EQ(0, appliance.run("appliance init").exit);
    zemHostSystem host(kHost, "", "");
    zemQyplatCmdCaller tool("", "");
    for (unsigned i = 0; i < 50; ++i) {
        const Configuration configuration = Generator(i).make();
        zemDynamicArray<tagAttributePair> pairs;
        for (const Asked& item : configuration) {
            pairs.addElement(new tagAttributePair{item.creation,
                                                  zemCommandCaller::itemValue(item.value.c_str())});
        }
        try {
            ASSERT_EQ(0, host.createVirtualSystem(pairs));
            const zemString id(std::to_string(kFirstId + i).c_str());
            const zemString filter = "\"lpar_ids=" + id + "\"";
            const zemRecordSetsType profiles =
                tool.getPartitionsProfileInformation(nullptr, kHost, filter);
            ASSERT_EQ(1, profiles.size());
            for (const Asked& item : configuration) {
                EXPECT_EQ(item.value, std::string((*profiles[0])[item.profile])) << item.profile;
            }
            expectLibraryTells(configuration, host, id);
        } catch (const zemException& e) {
            FAIL() << "configuration " << i << ": " << e.toString();
        }
    }
    EXPECT_EQ(0, appliance.run("appliance check").exit);
}

}  // namespace
