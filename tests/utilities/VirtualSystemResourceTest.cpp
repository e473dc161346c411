#include <gtest/gtest.h>

#include <memory>
#include <sstream>

#include "FailureText.h"
#include "SystemStateText.h"
#include "VirtualSystemResource.h"

namespace {

using Processor = zemPartitionProcessorResource;
using Slot = zemPartitionIOSlotResource;
using Serial = zemPartitionSerialAdapterResource;
using Scsi = zemPartitionSCSIAdapterResource;
using Profile = zemPartitionProfileConfiguration;

/// What a field holds after it was set.
#define STORED(CLASS, FIELD)                     \
    [](const std::string& value) {               \
        CLASS record;                            \
        record.set##FIELD(value.c_str());        \
        return std::string(record.get##FIELD()); \
    }

// One setter for each translation; those of its kind differ by their names alone.
TEST(VirtualSystemResourceTest, SettersTranslate) {
    const char* const hex = "0>0;512>200;65535>FFFF;4294967295>FFFFFFFF;-1>FFFFFFFF;text>0";
    const char* const remote = "65535>any;0>0;65534>65534;null>null;>";
    const struct {
        std::string (*stored)(const std::string&);
        const char* values;
    } rows[] = {
        {STORED(Processor, CurrMinProcUnits),
         ">0.0;0>0.0;5>0.05;25>0.25;100>1.00;125>1.25;00>0.00;12345>123.45"},
        {STORED(Processor, CurrProcMode), "255>ded;0>shared;>shared;2550>shared"},
        {STORED(Processor, CurrSharedProcPoolId), "255>null;0>0;3>3;>"},
        {STORED(Processor, PendSharedProcPoolId), "255>255;3>3"},
        {STORED(Slot, PciClass), hex},
        {STORED(Slot, PciDeviceId), hex},
        {STORED(Slot, PciRevisionId), hex},
        {STORED(Slot, ParentSlotDrcIndex), "null>none;21010003>21010003;NULL>NULL"},
        {STORED(Slot, Iop), "false>0;FALSE>0;true>1;0>1;>1"},
        {STORED(Slot, SlotIoPoolId), "65535>none;null>none;0>0;3>3"},
        {STORED(Slot, FeatureCodes), "[2201,2202]>2201,2202;a[1]b]>1;[]>;2201>2201;]1[2]>2"},
        {STORED(Serial, IsRequired), "true>1;false>0;True>0;1>0;>0"},
        {STORED(Serial, AdapterType), "0>client;1>server;65535>server"},
        {STORED(Serial, RemoteLparId), remote},
        {STORED(Serial, RemoteSlotNum), remote},
        {STORED(Scsi, RemoteLparId), remote},
        {STORED(Scsi, RemoteSlotNum), "65535>65535"},
        {STORED(Serial, ConnectStatus), "null>unavailable;0>none;1>active;2>unknown;>unknown"},
        {STORED(Serial, SupportsDnx), "0>0;1>1;null>1;>1"},
        {STORED(Profile, DesiredIoEntitledMem), "0>auto;null>null;64>64"},
        {STORED(Profile, BootMode), "1>norm;2>ds;3>sms;4>of;5>dd;0>unknown;6>unknown"},
        {STORED(Profile, LparProcCompatMode),
         "0>CORAL5;63>default;11>unknown;null>unknown;>unknown"},
    };
    for (const auto& row : rows) {
        std::istringstream values(row.values);
        for (std::string pair; std::getline(values, pair, ';');) {
            const size_t arrow = pair.find('>');
            EXPECT_EQ(pair.substr(arrow + 1), row.stored(pair.substr(0, arrow)))
                << pair << " of row " << &row - rows;
        }
    }
}

TEST(VirtualSystemResourceTest, SharingModes) {
    const struct {
        const char* processors;
        const char* donor;
        const char* sharing;
        const char* stored;
    } rows[] = {
        {"0", "0", "0", "cap"},
        {"0", "255", "1", "uncap"},
        {"0", "0", "2", "unknown"},
        {"0", "0", "null", "unknown"},
        {"255", "0", "0", "share_idle_procs"},
        {"255", "1", "0", "share_idle_procs_always"},
        {"255", "0", "1", "keep_idle_procs"},
        {"255", "1", "1", "share_idle_procs_active"},
        {"255", "255", "0", "share_idle_procs"},
        {"255", "255", "1", "keep_idle_procs"},
        {"255", "0", "2", "unknown"},
        {"255", "9223372036854775807", "9223372036854775807", "unknown"},
        {"255", "-9223372036854775808", "922337203685477580", "unknown"},
    };
    for (const auto& row : rows) {
        Processor processor;
        processor.setCurrSharingMode(row.processors, row.donor, row.sharing);
        EXPECT_STREQ(row.stored, processor.getCurrSharingMode());
    }
}

TEST(VirtualSystemResourceTest, RecordsTellWhoseTheyAre) {
    EXPECT_STREQ("3*T*S", Slot("3*T*S").getLparIDAndMTMS());
    EXPECT_EQ("|T|", joined(Slot("*T").getLparID(), Slot("*T").getMTMS()));
    EXPECT_STREQ("4*T*S", Profile("T*S", "4").getLparIDAndMTMS());
    EXPECT_STREQ("T*S", zemMemoryPoolResource("T*S").getMTMS());
    Profile unread("T*S", "4");
    unread.setDefaultValue();
    EXPECT_EQ("4*T*S|zemNULL|zemNULL|",
              joined(unread.getLparIDAndMTMS(), unread.getProfileName(), unread.getIoSlots()));
    for (void (*make)() : {+[] { Profile("3"); }, +[] { Serial(""); }}) {
        EXPECT_EQ(
            "3////DNX API property \"Name\" with wrong format, it should be the format : "
            "LPARID*MTMS.",
            failureText(make));
    }
}

TEST(VirtualSystemResourceTest, NumbersHaveWords) {
    // clang-format off
    EXPECT_EQ("0 CORAL5;1 CORAL6_enhanced;2 CORAL6;3 CORAL6+;4 CORAL7;5 CORAL6+_enhanced;6 CORAL7_enhanced;7 CORAL7+;8 CORAL7+_enhanced;9 CORAL8;10 CORAL8_enhanced;63 default;", wordsOf(zemCompatModeText, "unknown"));
    EXPECT_EQ("0 C5;1 C6 enhanced;2 C6;3 C6+;4 C7;5 C6+ enhanced;6 C7 enhanced;7 C7+;8 C7+ enhanced;9 C8;10 C8 enhanced;63 Default;", wordsOf(zemCompatModeShown, "unknown"));
    EXPECT_EQ("0 Not Activated;1 Starting;2 Running;3 Shutting Down;4 Error;8 Open Firmware;9 Suspended;", wordsOf(zemPartitionStateShown, "unknown"));
    EXPECT_EQ("1 tmxlinux;2 tmxlinux;3 xbrgserver;4 xbrgserver;129 osq00;130 osq00;", wordsOf(zemEnvironmentText, ""));
    EXPECT_EQ("2 manual;4 norm;", wordsOf([](int number) { return zemKeylockWord(number, "raw"); }, "raw"));
    // clang-format on
    EXPECT_STREQ("unknow", zemBootModeText(0, "unknow"));
    const auto bootMode = [](int mode) {
        return std::string(zemSystemSetting::getBootModeString(mode));
    };
    EXPECT_EQ("0 unknown;1 norm;2 ds;3 sms;4 of;5 dd;", wordsOf(bootMode, ""));
    for (int mode = 0; mode <= 5; ++mode) {
        EXPECT_EQ(mode, zemSystemSetting::convertBootModeToInt(bootMode(mode).c_str()));
    }
    EXPECT_EQ(-1, zemSystemSetting::convertBootModeToInt("Norm"));
    EXPECT_EQ(-1, zemSystemSetting::convertBootModeToInt(""));
}

/// The text of a setting; its clone, which outlives it, must have the same.
template <class Setting>
std::string valueOf(Setting setting) {
    std::string value(setting.getValue());
    const std::unique_ptr<zemSystemSetting> copy(Setting(setting).clone());
    EXPECT_NE(nullptr, dynamic_cast<Setting*>(copy.get()));
    EXPECT_EQ(value, std::string(copy->getValue()));
    return value;
}

TEST(VirtualSystemResourceTest, SettingsGiveTheirText) {
    const std::pair<const char*, std::string> rows[] = {
        {"5000000000", valueOf(zemMinProcsResource(5000000000))},
        {"18446744073709551615", valueOf(zemDesiredMemResource())},
        {"0.05", valueOf(zemMinProcUnitsResource(5))},
        {"12.50", valueOf(zemMaxProcUnitsResource(1250))},
        {"-0.01", valueOf(zemDesiredProcUnitsResource())},
        {"128", valueOf(zemUncapWeightSetting(128))},
        {"4294967295", valueOf(zemUncapWeightSetting())},
        {"ded", valueOf(zemProcModeSetting("255"))},
        {"shared", valueOf(zemProcModeSetting("ded"))},
        {"sms", valueOf(zemBootModeSetting(3))},
        {"", valueOf(zemBootModeSetting())},
        {"-1", valueOf(zemKeyLockSetting())},
        {"20", valueOf(zemMaxVirtualSlotsSetting(20))},
        {"web", valueOf(zemPartintionNameSetting("web"))},
    };
    for (const auto& [text, value] : rows) {
        EXPECT_EQ(text, value);
    }
}

TEST(VirtualSystemResourceTest, GroupsGiveTheirSettings) {
    // clang-format off
    const zemProcsSettings procs(1, 2, 3, "255", "CORAL7");
    EXPECT_EQ("1|2|3|255|CORAL7|", joined(procs.getMinProcs(), procs.getDesiredProcs(), procs.getMaxProcs(), procs.getProcMode(), procs.getProcCompatMode()));
    EXPECT_EQ("1|2|3|ded|CORAL7|", joined(procs.getMinProcsResource().getValue(), procs.getDesiredProcsResource().getValue(), procs.getMaxProcsResource().getValue(), procs.getProcModeSetting().getValue(), procs.getProcCompatModeSetting().getValue()));
    const zemProcUnitsSettings units(10, 20, 30, "uncap", 4);
    EXPECT_EQ("0.10|0.20|0.30|uncap|4|", joined(units.getMinProcUnitsResource().getValue(), units.getDesiredProcUnitsResource().getValue(), units.getMaxProcUnitsResource().getValue(), units.getSharingModeSetting().getValue(), units.getUncapWeightSetting().getValue()));
    const zemMemorySettings memory(1, 2, 3, "ded");
    EXPECT_EQ("1|2|3|ded|", joined(memory.getMinMemResource().getValue(), memory.getDesiredMemResource().getValue(), memory.getMaxMemResource().getValue(), memory.getMemModeSetting().getValue()));
    const zemVirtualSystemSettings system(1, "n", "2", "h", "p", "os", 3, 4, 5, 6, 7, 8);
    EXPECT_EQ("1|h|", joined(system.getSettingType(), system.getHostName()));
    EXPECT_EQ("n|2|p|os|sms|4|5|6|7|8|", joined(system.getPartintionNameSetting().getValue(), system.getPartintionIdSetting().getValue(), system.getProfileNameSetting().getValue(), system.getOSTypeSetting().getValue(), system.getBootModeSetting().getValue(), system.getEnableConnectionMonitoringSetting().getValue(), system.getAutoActivateSetting().getValue(), system.getEnableRedundantErrorPathReportingSetting().getValue(), system.getKeyLockSetting().getValue(), system.getMaxVirtualSlotsSetting().getValue()));
    // clang-format on
    EXPECT_EQ("-1||", joined(zemVirtualSystemSettings().getKeyLock(),
                             zemVirtualSystemSettings().getLparName()));
}

TEST(VirtualSystemResourceTest, PropertiesOfStrings) {
    const struct {
        const char* text;
        int index;
        const char* property;
        int next;
    } rows[] = {
        {"a/b", 0, "a", 1},         {"a/b", 1, "", 1},       {"a/b", 2, "b", -1},
        {"a/b", -1, "", -1},        {"a/", 2, "", -1},       {"", 0, "", -1},
        {"\"a/b\"/c", 0, "a/b", 5}, {"\"a\"x/c", 0, "a", 4}, {"\"\"/c", 0, "", 2},
        {"a\"b/c", 0, "a\"b", 3},   {"x/\"a\"", 2, "a", -1}, {"a/b", 9, "", -1},
    };
    for (const auto& row : rows) {
        int index = row.index;
        EXPECT_STREQ(row.property,
                     zemVirtualSystemIOResource::getNextResourceProperty(row.text, index, '/'));
        EXPECT_EQ(row.next, index) << row.text;
    }
}

std::string fields(const zemIOSlotAdapter& a) {
    return joined(a.getDrcIndex(), a.getPoolId(), a.getIsRequired());
}
std::string fields(const zemVirtualSerialAdapter& a) {
    return joined(a.getSlotId(), a.getIsServer(), a.getSupportsDNX(), a.getRemoteLparId(),
                  a.getRemoteLparName(), a.getRemoteSlotNumber(), a.getIsRequired());
}
std::string fields(const zemVirtualSCSIAdapter& a) {
    return joined(a.getSlotId(), a.getIsServer(), a.getRemoteLparId(), a.getRemoteLparName(),
                  a.getRemoteSlotNumber(), a.getIsRequired());
}
std::string fields(const zemVirtualEthernetAdapter& a) {
    std::string vlans;
    for (int i = 0; i < a.getAdditionalVlanIds().size(); ++i) {
        vlans += (i == 0 ? "" : "+") + std::to_string(a.getAdditionalVlanIds()[i]);
    }
    return joined(a.getSlotId(), a.getIsIEEE(), a.getPortVlanId(), vlans, a.getTrunkPriority(),
                  a.getIsRequired(), a.getVSwitch());
}

/// The fields that an element is read into, " > " and what they are written as.
template <class Adapter>
std::string readAndWritten(const char* element) {
    Adapter adapter((zemString(element)));
    return fields(adapter) + " > " + valueOf(adapter);
}

/// The same after a merge with another element, of an adapter that has its string form already.
template <class Adapter>
std::string merged(const char* element, const char* other) {
    Adapter adapter((zemString(element)));
    adapter.getValue();
    adapter.mergeWith(Adapter(zemString(other)));
    return fields(adapter) + " > " + valueOf(adapter);
}

TEST(VirtualSystemResourceTest, AdaptersAreReadAndWritten) {
    constexpr auto slot = readAndWritten<zemIOSlotAdapter>;
    constexpr auto serial = readAndWritten<zemVirtualSerialAdapter>;
    constexpr auto scsi = readAndWritten<zemVirtualSCSIAdapter>;
    constexpr auto ethernet = readAndWritten<zemVirtualEthernetAdapter>;
    const struct {
        std::string (*shown)(const char*);
        const char* element;
        const char* expected;
    } rows[] = {
        {slot, "21010003/3/1", "21010003|3|1| > 21010003/3/1"},
        // Without a pool the writer loses the DRC index.
        {slot, "21010003/none/1", "21010003|-1|1| > none/1"},
        {slot, "21010003", "21010003|-1|-1| > none/"},
        {slot, "none", "none|-1|-1| > none/"},
        {slot, "/2/x/4/\"", "|2|0| > /2/0"},
        {slot, "\"2,1\"/99999999999/-99999999999",
         "2,1|2147483647|-2147483648| > 2,1/2147483647/1"},
        {serial, "4/server/1/any//any/0", "4|1|1|-1||-1|0| > 4/server/1/any//any/0"},
        // The name is read past: it is not written either.
        {serial, "4/server/0/2/web/5/1", "4|1|0|2||5|1| > 4/server/0/2//5/1"},
        {serial, "4/client/1/2/\"a/b\"/5/1", "4|0|-1|2||5|1| > 4/client//2//5/1"},
        {serial, "4/client//any/web/x5/", "4|0|-1|-1||-1|-1| > 4/client/////"},
        {serial, "4/Server/1/2", "4|-1|-1|2||-1|-1| > 4///2///"},
        {serial, "", "-1|-1|-1|-1||-1|-1| > //////"},
        {scsi, "3/server/any//any/1", "3|1|-1||-1|1| > 3/server/any//any/1"},
        {scsi, "3/client/10/io server/11/0", "3|0|10||11|0| > 3/client/10//11/0"},
        {scsi, " +3x/client", "3|0|-1||-1|-1| > 3/client////"},
        {ethernet, "2/0/1//0/1", "2|0|1||0|1|| > 2/0/1//0/1"},
        // Further VLANs are run together.
        {ethernet, "2/1/1/\"3,4\"/0/1/ETHERNET0/0A1B",
         "2|1|1|3+4|0|1|ETHERNET0| > 2/1/1/\"34\"/0/1/ETHERNET0"},
        {ethernet, "2/1/1/3/0/1/", "2|1|1|3|0|1|| > 2/1/1/3/0/1"},
        {ethernet, "2/1/1/,3,,x,/1", "2|1|1|3+0|1|-1|| > 2/1/1/\"30\"/1/"},
        {ethernet, "", "-1|-1|-1||-1|-1|| > /////"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.expected, row.shown(row.element)) << row.element;
    }
    // What is asked for, as no element tells it: names, and -2 for any.
    zemArray<int> vlans;
    vlans.append(7);
    EXPECT_EQ("a/0/1", valueOf(zemIOSlotAdapter("a", 0, 1)));
    EXPECT_EQ("4/server/0/any/web/5/", valueOf(zemVirtualSerialAdapter(4, 1, 0, -2, "web", 5, -1)));
    EXPECT_EQ("4/client/2/web//1", valueOf(zemVirtualSCSIAdapter(4, 0, 2, "web", -2, 1)));
    EXPECT_EQ("4/1/2/7//1/v", valueOf(zemVirtualEthernetAdapter(4, 1, 2, vlans, -1, 1, "v")));
}

TEST(VirtualSystemResourceTest, OpenQuotesAreRefused) {
    const struct {
        void (*read)(const char*);
        const char* element;
        const char* told;
    } rows[] = {
        {[](const char* e) { zemIOSlotAdapter{zemString(e)}; }, "1/\"2", "1/\"2"},
        {[](const char* e) { zemVirtualSerialAdapter{zemString(e)}; }, "1////\"/", "1////\"/"},
        {[](const char* e) { zemVirtualSCSIAdapter{zemString(e)}; }, "\"1/client", "\"1/client"},
        {[](const char* e) { zemVirtualEthernetAdapter{zemString(e)}; }, "1/0/1/2,\"3/0", "2,\"3"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(std::string("3/zemVirtualSystemIOResource/getNextResourceProperty//") + row.told,
                  failureText([&row] { row.read(row.element); }));
    }
}

TEST(VirtualSystemResourceTest, MergeFillsUpAndAppends) {
    const struct {
        std::string (*shown)(const char*, const char*);
        const char* element;
        const char* other;
        const char* expected;
    } rows[] = {
        {merged<zemIOSlotAdapter>, "a/1/", "b/2/1", "a|1|1| > a/1/a/1/1"},
        {merged<zemIOSlotAdapter>, "a//0", "b/none/1", "a|-1|0| > none/0"},
        {merged<zemVirtualSerialAdapter>, "4/client", "5/server/1/2//3/1",
         "4|0|1|2||3|1| > 4/client/////4/client//2//3/1"},
        {merged<zemVirtualSCSIAdapter>, "//7", "5/server/2//3/1",
         "5|1|7||3|1| > //7///5/server/7//3/1"},
        {merged<zemVirtualEthernetAdapter>, "/1/9/\"1,2\"", "5/0/8/3/6/1/v",
         "5|1|9|1+2|6|1|v| > /1/9/\"12\"//"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.expected, row.shown(row.element, row.other)) << row.element;
    }
    zemVirtualSerialAdapter named;
    named.mergeWith(zemVirtualSerialAdapter(4, 1, 0, -1, "web", 5, 1));
    EXPECT_EQ("4/server/0/any/web/5/1", valueOf(named));
}

}  // namespace
