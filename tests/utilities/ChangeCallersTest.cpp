#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <tuple>

#include "EdallocCmdCaller.h"
#include "EdplatCmdCaller.h"
#include "EdpowerCaller.h"
#include "EdsuspCaller.h"
#include "NwplatCmdCaller.h"
#include "ToolFolder.h"
#include "VirtualSystemRepRASD.h"

namespace {

using Partition = zemEdplatCmdCaller::PartitionAttribute;
using Profile = zemEdplatCmdCaller::PartitionProfileAttribute;

constexpr char kPrefix[] = "<zem350Log-prefix>";

zemProcessorRASD rasd(const char* sharingMode, int weight) {
    zemProcessorRASD::zemProcessorRASDData data;
    data.m_SharingMode = sharingMode;
    data.m_Weight = weight;
    return zemProcessorRASD(&data);
}

void check(const std::string& log, const std::string& line, const std::string& behind,
           const std::function<void()>& change) {
    const LoggedCall call = logged(line.substr(0, line.find(' ')), "done\n", change);
    // The first command of a process is followed by a word of the timing trace.
    EXPECT_EQ(0U, call.log.find(log + line + '\n' + behind)) << call.log;
}

/// What is logged, how the line goes on, and what makes it.
using Row = std::tuple<const char*, const char*, std::function<void()>>;

TEST(ChangeCallersTest, Edalloc) {
    zemEdallocCmdCaller c("", "");
    zemProcessorRASD both = rasd("uncap", 128), weight = rasd("", 0);
    zemProcessorRASD odd = rasd("a\" -o \"r", 0), none = rasd("", -1);
    pid_t pid = 0;
    pid_t* const p = nullptr;
    FILE* stream = nullptr;
    FILE** const f = nullptr;
    // clang-format off
    const Row rows[] = {
        {"addProcessing:procs:250;procUnits:0;", "proc -m h*1 -o a --id 3 --procs 2 ", [&] { c.addProcessing("h*1", "3", 250, 0, &pid, f); }},
        {"addProcessing:procs:0;procUnits:150;", "proc -m h*1 -o a --id 3 --procunits 1.50", [&] { c.addProcessing("h*1", "3", 0, 150, p, f); }},
        {"removeProcessing:procs:200;procUnits:5;", "proc -m h*1 -o r --id 3 --procs 2 --procunits 0.05", [&] { c.removeProcessing("h*1", "3", 200, 5, p, &stream); }},
        {"modifyProcessing: ", R"(proc -m h*1 -o s --id 3 -a "sharing_mode=uncap,uncap_weight=128")", [&] { c.modifyProcessing("h*1", "3", &both, p, f); }},
        {"modifyProcessing: ", R"(proc -m h*1 -o s --id 3 -a "uncap_weight=0")", [&] { c.modifyProcessing("h*1", "3", &weight, p, f); }},
        {"modifyProcessing: ", R"(proc -m h*1 -o s --id 3 -a "sharing_mode=a\" -o \"r,uncap_weight=0")", [&] { c.modifyProcessing("h*1", "3", &odd, p, f); }},
        {"modifyProcessing: ", R"(proc -m h*1 -o s --id 3 -a "")", [&] { c.modifyProcessing("h*1", "3", &none, p, f); }},
        {"addMemory:", "mem -m h*1 -o a --id 3", [&] { c.addMemory("h*1", "3", 0, 0, p, f); }},
        {"removeMemory:", "mem -m h*1 -o r --id 3 --entitled 7 -q 8589934592", [&] { c.removeMemory("h*1", "3", 7, 8589934592, p, f); }},
        {"modifyMemory:", R"(mem -m h*1 -o s --id 3 -a "mem_weight=128")", [&] { c.modifyMemory("h*1", "3", &both, p, f); }},
        {"addIOSlot:", R"(io --rsubtype slot -o a -m h*1 --id 3 -l 210  -a  "\"slot_io_pool_id=1\"")", [&] { c.addIOSlot("h*1", "3", "210", pairs({{0, "1"}}), p, f); }},
        {"removeIOSlot:", "io  --rsubtype slot -m h*1 -o r --id 3 -l 210", [&] { c.removeIOSlot("h*1", "3", "210", p, f); }},
        {"addVETH:", R"(virtualio --rsubtype eth -o a -m h*1 --id 3  -s 5  -a  "\"addl_vlan_ids=5,7\",\"vswitch=v\"")", [&] { c.addVETH("h*1", "3", 5, pairs({{2, "5,7"}, {5, "v"}}), p, f); }},
        {"addVSCSI:", "virtualio --rsubtype scsi -o a -m h*1 --id 3 ", [&] { c.addVSCSI("h*1", "3", 0, pairs({}), p, f); }},
        {"addVSERIAL:", R"(virtualio --rsubtype serial -o a -m h*1 --id 3   -a  "\"supports_dnx=1\"")", [&] { c.addVSERIAL("h*1", "3", -1, pairs({{4, "1"}}), p, f); }},
        {"removeVETH:", "virtualio --rsubtype eth -m h*1 -o r --id 3 -s 5 ", [&] { c.removeVETH("h*1", "3", 5, p, f); }},
        {"removeVSCSI:", "virtualio --rsubtype scsi -m h*1 -o r --id 3 -s 0 ", [&] { c.removeVSCSI("h*1", "3", 0, p, f); }},
        {"removeVSERIAL:", "virtualio --rsubtype serial -m h*1 -o r --id 3 -s 2 ", [&] { c.removeVSERIAL("h*1", "3", 2, p, f); }},
    };
    // clang-format on
    for (const auto& [log, line, change] : rows) {
        check(std::string(kPrefix) + log, std::string("edalloc -r ") + line, "", change);
    }
}

TEST(ChangeCallersTest, EdplatAndNwplat) {
    zemEdplatCmdCaller c("", "");
    zemNwplatCmdCaller create("", "");
    const auto adapter = pairs({{Profile::ATTR_VIRTUAL_ETH_ADAPTERS, "5/1/2,3"}});
    const auto name = pairs({{Partition::ATTR_NEW_NAME, "web"}});
    // clang-format off
    const Row rows[] = {
        {R"(edplat -r sys -m "h")", "", [&] { c.modifyManagedSystemInformation(pairs({}), "h"); }},
        {"edplat -r sys", R"(  -i  "\"sp_failover_enabled-=1\"")", [&] { c.changeManagedSystemInformation(pairs({{8, "1"}}), nullptr, c.CH_OP_REMOVE); }},
        {R"(edplat -r lpar -m "")", R"(  -i  "\"lpar_id=3\"")", [&] { c.addPartitionsInformation("3", pairs({}), ""); }},
        {R"(edplat -r lpar -m "h")", R"(  -i  "\"lpar_id=3\",\"new_name=web\"")", [&] { c.modifyPartitionsInformation("3", name, "h"); }},
        {"edplat -r lpar", R"(  -i  "\"lpar_id=3\",\"new_name-=web\"")", [&] { c.removePartitionsInformation("3", name, nullptr); }},
        {R"(edplat -r prof -m "M")", R"(  -i  "\"name=P\",\"lpar_id=3\",\"virtual_eth_adapters+=5/1/2,3\"")", [&] { c.addPartitionsProfileInformation("P", adapter, "3", "M"); }},
        {"edplat -r prof", R"(  -i  "\"name=P\",\"lpar_id=3\",\"electronic_err_reporting=1\"")", [&] { c.modifyPartitionsProfileInformation("P", pairs({{57, "1"}}), "3", nullptr); }},
        {"edplat -r prof", R"(  -i  "\"name=P\",\"lpar_id=3\",\"virtual_eth_adapters-=5/1/2,3\"")", [&] { c.removePartitionsProfileInformation("P", adapter, "3", nullptr); }},
        {R"(nwplat -r lpar -m "M")", R"( -i "\"lhea_capabilities =1\",\"lpar_avail_priority=7\"")", [&] { create.makePartitionsInformation(pairs({{54, "1"}, {60, "7"}}), "M"); }},
        {"nwplat -r lpar", R"( -i "")", [&] { create.makePartitionsInformation(pairs({}), nullptr); }},
    };
    // clang-format on
    for (const auto& [begin, end, change] : rows) {
        check(kPrefix, std::string(begin) + end, "", change);
    }
}

TEST(ChangeCallersTest, ValuesReachTheToolAsTheyAre) {
    const std::string open = "6/zemPropertiesHelper/executeCommand/-1/Invalid command parameter:";
    // What the tool receives of a value; null: the line is refused.
    const std::pair<const char*, const char*> rows[] = {
        {"a b  c", "a b  c"},
        {"x,y;$HOME `id` $(id) *", "x,y;$HOME `id` $(id) *"},
        {"M\xc3\xbcller \xe6\x9d\xb1 \xfc", "M\xc3\xbcller \xe6\x9d\xb1 \xfc"},
        {"it's C:\\temp", "it's C:\\temp"},
        // A value that holds double quotes brings their escapes with it.
        {"say \\\"hi\\\" \\\\", "say \"hi\" \\"},
        {"a\"b", nullptr},
        {"end\\", nullptr},
    };
    for (const auto& [value, received] : rows) {
        ToolFolder tools;
        tools.recorder("edplat");
        const auto name = pairs({{Partition::ATTR_NEW_NAME, value}});
        const std::string thrown = failureText([&name] {
            zemEdplatCmdCaller("", "").modifyPartitionsInformation("3", name, "host, 1");
        });
        EXPECT_EQ(received == nullptr ? open : "", thrown.substr(0, open.size()));
        const std::string line = "-r|lpar|-m|host, 1|-i|\"lpar_id=3\",\"new_name=";
        EXPECT_EQ(received == nullptr ? "" : line + received + '"', tools.arguments());
    }
}

struct Power {
    int resource;
    int operation;
    std::string flags = "";  // i: at once, r: restart, s: stop on error, v: validate
    const char* sysProfile = "";
    int bootMode = 0;
    const char* profile = "P";
    int lparId = 3;
};

void run(const Power& settings, int times = 1) {
    const auto has = [&settings](char flag) {
        return settings.flags.find(flag) != std::string::npos;
    };
    EdpowerCaller c("", "");
    c.setManagedSystem("M");
    c.setResource(settings.resource);
    c.setOperation(settings.operation);
    c.setImmed(has('i'));
    c.setRestart(has('r'));
    c.setStopOnError(has('s'));
    c.setValidateSysProfile(has('v'));
    c.setSysProfName(settings.sysProfile);
    c.setBootMode(settings.bootMode);
    c.setLparProfileName(settings.profile);
    c.setLparId(settings.lparId);
    for (; times > 0; --times) {
        c.run();
    }
}

void suspend(int operation) {
    EdsuspCaller c("", "");
    c.setManagedSystem("M");
    c.setLparId(3);
    c.setOperation(operation);
    c.run();
}

TEST(ChangeCallersTest, EdpowerAndEdsusp) {
    const std::string rule = kPrefix + std::string(28, '+') + '\n';
    // clang-format off
    const std::pair<Power, const char*> rows[] = {
        {{1, 1, "", "", 1}, "lpar --id 3 -o on -b norm -f P"}, {{1, 1, "", "", 2}, "lpar --id 3 -o on -b dd -f P"},
        {{1, 1, "", "", 3}, "lpar --id 3 -o on -b ds -f P"}, {{1, 1, "", "", 4}, "lpar --id 3 -o on -b of -f P"},
        {{1, 1, "", "", 5}, "lpar --id 3 -o on -b sms -f P"}, {{1, 1, "", "", 0, "P Q"}, "lpar --id 3 -o on -f P Q"},
        {{1, 2, "ir"}, "lpar --id 3 -o shutdown --immed  --restart "}, {{1, 3, "r"}, "lpar --id 3 -o osshutdown --restart "},
        {{1, 4, "", "", 0, ""}, "lpar --id 3 -o dumprestart"},
        {{2, 1}, "sys -o on"}, {{2, 6}, "sys -o onstandby"}, {{2, 7, "", "N"}, "sys -o onsysprof -f N"},
        {{2, 8}, "sys -o rebuild"}, {{2, 9}, "sys -o off"}, {{2, 9, "ir"}, "sys -o off --immed --restart"},
        {{3, 1, "", "N"}, "sysprof -n N -o on  --continue "}, {{3, 1, "s", "N"}, "sysprof -n N -o on "},
        {{3, 0, "v", "N"}, "sysprof -n N --test "}, {{3, -1, "", "N"}, "sysprof -n N"},
    };
    const char* const changes[] = {"suspend", "resume", "validate -t suspend ", "cancel -t suspend ", "recover -t suspend ", "shutdown -t suspend "};
    // clang-format on
    for (const auto& row : rows) {
        const std::string line = std::string("edpower -r ") + row.second + " -m \"M\"";
        check(rule + kPrefix + "Change system state:", line, rule, [&row] { run(row.first); });
    }
    for (int i = 0; i < 6; ++i) {
        const std::string line = std::string("edsusp  -o ") + changes[i] + " -m \"M\" --id 3";
        check(rule + kPrefix + "Change lpar state:", line, rule, [i] { suspend(i + 1); });
    }
}

TEST(ChangeCallersTest, RefusalsRunNoTool) {
    ToolFolder tools;
    for (const char* tool : {"edalloc", "edplat", "nwplat", "edpower", "edsusp"}) {
        tools.recorder(tool);
    }
    zemEdallocCmdCaller edalloc("", "");
    const std::string parms = "4/EdpowerCaller/validateParms//edpower ";
    const std::string atRun = "4/EdpowerCaller/run//";
    const std::string mismatch = atRun + "parameter for the invoke method does not match CLI";
    const std::string index = "3/zemCommandCaller/BuildChCmdString/INVALID_INDEX/";
    // clang-format off
    const std::vector<std::pair<std::string, std::function<void()>>> rows = {
        {parms + "-r lpar operation unsupported: \x05", [] { run({1, 5}); }},
        {parms + "-r lpar requires --id", [] { run({1, 1, "", "", 0, "", 0}); }},
        {parms + "-r lpar requires -f <lpar_profile_name>", [] { run({1, 1, "", "", 0, ""}); }},
        {parms + "-r lpar -o shutdown --restart must have --immed", [] { run({2, 9, "r"}); }},
        {parms + "-r sysprof requires -n <system_profile_name>", [] { run({3, 0}); }},
        {parms + "-r sysprof cannot have -o and --test", [] { run({3, 2, "v", "N"}); }},
        {parms + "-r sysprof must have -o on", [] { run({3, 2, "", "N"}); }},
        {parms + "resource type unsupported: \x04", [] { run({4, 1}); }},
        {mismatch, [] { run({1, 1, "", "", 6}); }},
        {mismatch, [] { run({2, 5}); }},
        {atRun + "The command entered is either missing a required parameter or a parameter value " "is invalid. The parameters that are missing or have an invalid value are -f.", [] { run({2, 7}); }},
        {"4/EdsuspCaller/validateParms//edsusp resource type unsupported: \x07", [] { suspend(7); }},
        {"4/EdsuspCaller/validateParms//edsusp resource type unsupported: ", [] { suspend(0); }},
        {"3/zemEdallocCmdCaller/removeProcessing//\"VirtualQuantity/100\" for shared mode or " "\"Reservation/100\" for dedicated mode should be an integer for the command \"edalloc -r " "proc -m %s -o r --id lpar_id --procs\"", [&] { edalloc.removeProcessing("M", "3", 250, 1, nullptr, nullptr); }},
        {index + "6", [&] { edalloc.addVETH("M", "3", 1, pairs({{6, "x"}}), nullptr, nullptr); }},
        {index + "-1", [] { zemEdplatCmdCaller("", "").modifyPartitionsInformation("3", pairs({{-1, ""}}), ""); }},
        {"3/zemCommandCaller/callMkCommand/INVALID_INDEX/61", [] { zemNwplatCmdCaller("", "").makePartitionsInformation(pairs({{61, ""}}), "M"); }},
    };
    // clang-format on
    for (const auto& [words, operation] : rows) {
        EXPECT_EQ(words, failureText(operation));
        EXPECT_EQ("", tools.arguments()) << words;
    }
    // The first run uses settings up: the operation, and the validation.
    const auto twice = [] { run({1, 1}, 2); };
    EXPECT_EQ(parms + "-r lpar operation unsupported: ", failureText(twice));
    run({3, 0, "v", "N"}, 2);
    EXPECT_EQ("-r|sysprof|-n|N|-m|M", tools.arguments());
    tools.script("edsusp", "echo 'WRTL8018 no such partition' >&2; exit 1");
    tools.script("edpower", "echo 'No results were found.'");
    EXPECT_EQ("6/zemCommandCaller/callGenericCommand/WRTL8018/WRTL8018 no such partition",
              failureText([] { suspend(1); }));
    const auto switchOn = [] { run({2, 1}); };
    EXPECT_EQ("5/zemCommandCaller/callGenericCommand//No results were found.",
              failureText(switchOn));
}

TEST(ChangeCallersTest, BackgroundRunsBelongToTheCaller) {
    ToolFolder tools;
    ASSERT_EQ(0, mkfifo(tools.file("gate").c_str(), 0644));
    tools.script("edalloc",
                 "read x <$here/gate; printf '%70000s\\n' $8; id -u >&2; echo $LC_ALL; exit $8");
    const bool isRoot = geteuid() == 0;
    const std::string user = isRoot ? "65534" : std::to_string(geteuid());
    std::filesystem::permissions(tools.folder(), std::filesystem::perms::all);
    const long before = openDescriptors();
    std::pair<pid_t, FILE*> children[2];
    for (auto& [pid, stream] : children) {
        zemEdallocCmdCaller c(isRoot ? "nobody" : "", "xx");
        EXPECT_EQ(0, c.addMemory("M", "7", 0, 1, &pid, &stream));
    }
    for (auto& [pid, stream] : children) {  // each when it may, while the other may run
        EXPECT_EQ(0, waitpid(pid, nullptr, WNOHANG));
    }
    const int gate = open(tools.file("gate").c_str(), O_RDWR | O_CLOEXEC);
    EXPECT_EQ(2, write(gate, "\n\n", 2));
    for (auto& [pid, stream] : children) {
        EXPECT_EQ(std::string(69999, ' ') + "7\n" + user + "\nxx\n", readAll(stream));
        int status = 0;
        EXPECT_EQ(pid, waitpid(pid, &status, 0));
        EXPECT_EQ(7, WEXITSTATUS(status));
    }
    close(gate);
    EXPECT_FALSE(hasChildren());
    EXPECT_EQ(before, openDescriptors());
}

}  // namespace
