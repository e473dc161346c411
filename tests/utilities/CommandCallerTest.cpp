#include <gtest/gtest.h>

#include <tuple>

#include "FailingAllocation.h"
#include "RecordParser.h"
#include "TimingTrace.h"
#include "ToolFolder.h"

namespace {

class Caller : public zemCommandCaller {
public:
    explicit Caller(const char* auth = "", const char* locale = "")
        : zemCommandCaller(auth, locale) {}
    using zemCommandCaller::callChCommand;
    using zemCommandCaller::callLsCommand;
    using zemCommandCaller::callMkCommand;
};

const TimingTrace timing("zemcommandtrace");

constexpr const char* kNames[] = {"lpar_id", "name", "state", "mode"};

/// The records as text: values of the keys with "|" between them, ";" after each record.
std::string text(const zemRecordSetsType& records, const std::vector<int>& keys) {
    std::string all;
    for (int i = 0; i < records.size(); ++i) {
        for (size_t k = 0; k < keys.size(); ++k) {
            all += (k > 0 ? "|" : "") + std::string((*records.getElementAt(i))[keys[k]]);
        }
        all += ';';
    }
    return all;
}

TEST(RecordParserTest, RecordsAndQuotes) {
    // output, its records of two fields, whether they are all of it
    const std::tuple<std::string, const char*, bool> rows[] = {
        {"", "", true},
        {"a,b\n", "a|b;", true},
        {"a,b", "a|b;", true},
        {"a\n", "a|;", true},
        {"a,b,c\n", "a|b;", true},
        {"\"x,y\",z\n", "x,y|z;", true},
        {"\"he said \"\"hi\"\"\",z\n", "he said \"hi\"|z;", true},
        {"ab\"c,d\"e,\"f\"\"\"\n", "abc,de|f\";", true},
        {"\"\",\"\"\n", "|;", true},
        {"\"\"\"\",x\n", "\"|x;", true},
        {"a,b\n\nc,d\n", "a|b;|;c|d;", true},
        {"\n", "|;", true},
        {"\"x", "", false},
        {"a,b\nc,\"x\nd,e\n", "a|b;", false},
        {"a,b,\"open\nc,d\n", "a|b;c|d;", true},  // behind the wanted fields nothing is read
        {std::string("a\0b,c\n", 6), "a|b;", true},
        {std::string("\"a\0\",c\n", 7), "", false},
    };
    for (const auto& [output, expected, valid] : rows) {
        zemRecordSetsType records(0, 0, 1);
        EXPECT_EQ(valid, zemParseRecords(output, nullptr, 2, records)) << output;
        EXPECT_EQ(expected, text(records, {0, 1})) << output;
    }
}

TEST(RecordParserTest, AsksTwiceForOneField) {
    const int keys[] = {7, 7, 5};
    zemRecordSetsType records(0, 25, 1);
    EXPECT_TRUE(zemParseRecords(",b,c\n", keys, 3, records));
    zemRecordType& record = *records[0];
    EXPECT_EQ("|c;", text(records, {7, 5}));
    EXPECT_EQ(2, record.insert(7, "late"));
}

// Short records are cheap however many fields were asked for, and a failure at any allocation
// leaves nothing behind.
TEST(RecordParserTest, RecordsTakeWhatTheirFieldsTake) {
    constexpr unsigned kFields = 62;
    std::string full = "\"a\"\"\"";
    for (unsigned i = 1; i < kFields; ++i) {
        full += ",ab";
    }
    const std::pair<std::string, long> rows[] = {
        {"", 0}, {std::string(kFields, ','), 0}, {"x", 1}, {full, kFields}};
    for (const auto& [line, texts] : rows) {
        const std::string output = line + '\n' + line + '\n' + line + '\n';
        bool parsed = false;
        for (long allocations = 0; !parsed; ++allocations) {
            const long before = FailingAllocation::bytes();
            try {
                zemRecordSetsType records(0, 25, 1);
                {
                    const FailingAllocation failing(allocations);
                    parsed = zemParseRecords(output, nullptr, kFields, records);
                }
                EXPECT_GE(3 * (300 + texts * 96), FailingAllocation::bytes() - before) << line;
                zemString last;
                EXPECT_EQ(0, records.getElementAt(2)->lookup(kFields - 1, last));
            } catch (const std::bad_alloc&) {
            }
            ASSERT_EQ(before, FailingAllocation::bytes())
                << "without the allocation " << allocations;
        }
    }
}

TEST(CommandCallerTest, JudgesTheToolsResult) {
    ToolFolder tools;
    const std::pair<const char*, const char*> rows[] = {
        {"echo fine", ""},
        {"echo 'No results were found'", ""},
        {"echo 'No results were found. At all.'; echo",
         "5//\"tool\"/No results were found. At all."},
        {"echo 'No results were found.' >&2; exit 3", "5//\"tool\"/No results were found.\n"},
        {"echo 'No results were found.'; exit 3", "5//\"tool\"/No results were found.\n"},
        {"echo 'No results were found.' >&2", ""},
        {"echo 'WRTL1234 something'; exit 1", "6/WRTL1234/\"tool\"/WRTL1234 something"},
        {"echo 'WRT WRTL9\nx y\n' >&2; echo out; exit 1", "6/WRTL9/\"tool\"/WRT WRTL9\nx y"},
        {"printf 'WRTL8\\tx' >&2; exit 1", "6/WRTL8/\"tool\"/WRTL8\tx"},
        {"printf 'see WRTL7' >&2; exit 1", "6/WRTL7/\"tool\"/see WRTL7"},
        {"echo other >&2; exit 255", "6/UNKNOWN/\"tool\"/other"},
        {"exit 1", "6/UNKNOWN/\"tool\"/"},
    };
    for (const auto& [body, failure] : rows) {
        tools.script("tool", body);
        const auto run = [] { Caller().callGenericCommand("tool", nullptr, false); };
        EXPECT_EQ(failure, failureText(run, "kiat")) << body;
    }
    zemString output;
    tools.recorder("xbrgcli", "bridged\n");
    EXPECT_EQ(0, Caller().callXBRGCommand("list -a", &output));
    EXPECT_STREQ("bridged\n", output);
    EXPECT_EQ("list|-a", tools.arguments());
    const std::string name = " callGenericCommand-xbrgcli list -a ";
    const std::string trace =
        timing.waitFor(name + "end", [&output] { Caller().callXBRGCommand("list -a", &output); });
    const size_t end = trace.find(name + "end at ");
    EXPECT_TRUE(trace.find(name + "begin at ") < end && end != std::string::npos);
}

TEST(CommandCallerTest, RunsUnderUserAndLocale) {
    ToolFolder tools;
    tools.script("tool", "id -un; echo $LC_ALL");
    const bool isRoot = geteuid() == 0;
    zemString output;
    Caller(isRoot ? "nobody" : "", "xx").callGenericCommand("tool", &output, true);
    EXPECT_EQ((isRoot ? "nobody\n" : tools.run("id -un").out) + "xx\n", std::string(output));
}

TEST(CommandCallerTest, QueriesNamedFields) {
    ToolFolder tools;
    tools.recorder("tool", "run,7,one\nidle,8\n");
    zemRecordSetsType records(0, 25, 1);
    int wanted[] = {2, 0, 1, -1};
    Caller().callLsCommand("tool -r lpar", wanted, -1, kNames, 4, records);
    EXPECT_EQ("-r|lpar|-F|state,lpar_id,name", tools.arguments());
    EXPECT_EQ("run|7|one;idle|8|;", text(records, {2, 0, 1}));

    zemRecordSetsType all(0, 25, 1);
    Caller().callLsCommand("tool", nullptr, -1, kNames, 4, all);
    EXPECT_EQ("-F|lpar_id,name,state,mode", tools.arguments());
    EXPECT_EQ("run|7|one|;idle|8||;", text(all, {0, 1, 2, 3}));

    zemRecordSetsType none(0, 25, 1);  // a resource without fields: records are only counted
    Caller().callLsCommand("tool", nullptr, -1, nullptr, 0, none);
    EXPECT_EQ("-F", tools.arguments());
    EXPECT_EQ(2, none.size());

    tools.recorder("tool", "a\n\"b\n");
    zemRecordSetsType first(0, 25, 1);
    const auto query = [&first](int index) {
        int list[] = {index, -1};
        return failureText([&] { Caller().callLsCommand("tool", list, -1, kNames, 4, first); },
                           "kmiat");
    };
    EXPECT_EQ("6/callLsCommand/INVALID_RECORD/tool -F name/a\n\"b\n", query(1));
    EXPECT_EQ("a;", text(first, {1}));
    EXPECT_EQ("3/callLsCommand/INVALID_INDEX/tool -F /4", query(4));
    tools.recorder("tool", "");
    EXPECT_EQ("", query(1));
    EXPECT_EQ(1, first.size());
}

TEST(CommandCallerTest, BuildsChangesAndCreations) {
    ToolFolder tools;
    tools.recorder("tool");
    using List = std::vector<tagAttributePair>;
    const List none, single = {{1, "P"}, {0, "3"}}, multi = {{3, "a,b c"}};
    const List low = {{-1, "x"}}, high = {{4, "x"}};
    const struct {
        List single;
        List multi;
        int op;              // -1: a creation
        const char* result;  // what the tool receives, or the failure
    } rows[] = {
        {single, multi, 2, R"(-r|x|-i|"name=P","lpar_id=3","mode-=a,b c")"},
        {single, multi, 0, R"(-r|x|-i|"name=P","lpar_id=3","mode+=a,b c")"},
        {none, multi, 1, R"(-r|x|-i|"mode=a,b c")"},
        {none, none, 0, "-r|x"},
        {single, high, 0,
         R"(3/BuildChCmdString/INVALID_INDEX/tool -r x -i "\"name=P\",\"lpar_id=3\",/4)"},
        {low, none, 0, R"(3/BuildChCmdString/INVALID_INDEX/tool -r x -i "/-1)"},
        {none, multi, 3, R"(3/BuildChCmdString/INVALID_INDEX/tool -r x -i "/3)"},
        {single, none, -1, R"(-r|x|-i|"name=P","lpar_id=3")"},
        {none, none, -1, "-r|x|-i|"},
        {high, none, -1, R"(3/callMkCommand/INVALID_INDEX/tool -r x -i "/4)"},
    };
    for (const auto& row : rows) {
        std::filesystem::remove(tools.file("argv"));
        const auto run = [&row] {
            if (row.op < 0) {
                Caller().callMkCommand("tool -r x", pairs(row.single), kNames, 4);
            } else {
                Caller().callChCommand("tool -r x", pairs(row.single), pairs(row.multi), kNames, 4,
                                       static_cast<Caller::CH_OP_TYPE>(row.op), "-i");
            }
        };
        const std::string failure = failureText(run, "kmiat");
        EXPECT_EQ(row.result, failure + tools.arguments());
    }
}

TEST(CommandCallerTest, CutsTheFrontOfALine) {
    ToolFolder tools;
    tools.recorder("tool");
    const std::string front = "tool " + std::string(3000, 'x');
    Caller().callMkCommand(front.c_str(), pairs({}), kNames, 4);
    EXPECT_EQ(std::string(507, 'x') + "|-i|", tools.arguments());
    zemRecordSetsType records(0, 25, 1);
    Caller().callLsCommand(front.c_str(), nullptr, -1, kNames, 1, records);
    EXPECT_EQ(std::string(2043, 'x') + "|-F|lpar_id", tools.arguments());
    const std::string open = "tool \"" + std::string(3000, 'x') + '"';
    EXPECT_EQ("3/INVALID_LENGTH/512",
              failureText([&open] { Caller().callMkCommand(open.c_str(), pairs({}), kNames, 4); },
                          "kit"));
}

}  // namespace
