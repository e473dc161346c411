#include <limits>
#include <tuple>

#include "BaseProviderText.h"
#include "ProviderHarness.h"

namespace {

using cimom::Value;
using Z = zemBaseProvider;

class BaseProviderValues : public BothBrokers {
protected:
    BaseProviderValues() : h(GetParam()), provider(h.provider()) {}

    using Args = FromServer<CmpiArgs>;
    using Disk = FromServer<CmpiInstance>;

    // A value as a provider gets it from the server.
    CmpiData data(const Value& value) { return Args(h.args({{"v", value}})).getArg("v"); }

    // What a call refuses, or "".
    static std::string refused(const std::function<void()>& call) { return failureText(call, "t"); }

    Harness h;
    zemBaseProvider& provider;
};

TEST_P(BaseProviderValues, PrintsValues) {
    const cimom::ObjectPath path("root/cimv2", "Test_Disk", {{"Name", "d1"}});
    const std::pair<Value, const char*> rows[] = {
        {Value(std::int8_t{-8}), "-8"},
        {Value(std::numeric_limits<std::uint32_t>::max()), "4294967295"},
        {Value(std::numeric_limits<std::uint64_t>::max()), "18446744073709551615"},
        {Value(16777217.0), "16777216.000000"},  // a real64 has the precision of a real32
        {Value(-1e300), "-inf"},
        {Value("50%d"), "\"50%d\""},
        {Value(path), "root/cimv2:Test_Disk.Name=\"d1\""},
        {Value(cimom::DateTime::fromBinary(1500000, true)), "00000000000001.500000:000"},
        {Value::array(CMPI_string, {Value("a"), Value::null(CMPI_string)}), "{\"a\",}"},
        {Value::char16(65), ""},
    };
    for (const auto& [value, expected] : rows) {
        EXPECT_STREQ(expected, Z::cmpidata2String(data(value)));
    }
    // Further properties depend on the server.
    CmpiInstance disk = Disk(h.disk());
    const std::string mof(Z::instanceToString(disk));
    EXPECT_EQ(0U, mof.find("instance of Test_Disk {\n    string Name = \"d1\""));
}

TEST_P(BaseProviderValues, ParsesObjectPaths) {
    const std::pair<const char*, const char*> rows[] = {
        {"Foo", "root/cimv2:Foo"},
        {"root/x:Foo.a=\"1\",b=2", "root/x:Foo.a=\"1\",b=\"2\""},
        {"//h/test/x:Foo.k=\"\"v\"\"", "//h/test/x:Foo.k=\"v\""},
        {"Foo.a=x=y", "root/cimv2:Foo.a=\"x=y\""},
        {"//h/Foo", "refused"},
        {"//h", "refused"},
        {"Foo.", "refused"},
        {"Foo.a=\"1,2\"", "refused"},
    };
    for (const auto& [source, expected] : rows) {
        zemString made = "refused";
        const std::string refusal = refused(
            [&, s = source] { made = Z::objectPathToString(Z::createObjectPath(zemString(s))); });
        EXPECT_STREQ(expected, made);
        EXPECT_EQ(made == "refused" ? source : "", refusal);
    }
    const CmpiObjectPath from = Z::createObjectPath(zemString("//box/test/a:Test_Disk.Name=1"));
    EXPECT_STREQ("//box/test/a:Test_Disk", Z::objectPathToString(Z::createObjectPath(from)));
    EXPECT_STREQ("//box/test/b:Other",
                 Z::objectPathToString(Z::createObjectPath(from, "test/b", "Other")));
}

TEST_P(BaseProviderValues, ConvertsDateTimes) {
    const std::pair<CmpiDateTime, const char*> rows[] = {
        {Z::convertDateTime(0L), "00000000000000.000000:000"},
        {Z::convertDateTime(1000000000L), "20010909014640.000000+000"},
        {Z::convertDateTime(timeval{1000000000, 7}), "20010909014640.000007+000"},
        {Z::convertDateTime(std::numeric_limits<long>::max()), "00000000000000.000000:000"},
    };
    for (const auto& [time, text] : rows) {
        EXPECT_STREQ(text, Z::cmpidata2String(CmpiData(time)));
    }
    EXPECT_EQ(1000000000L, Z::convertDateTime(Z::convertDateTime(1000000000L)));
    // before and after a change to and from summer time, wherever the process thinks it is
    for (const char* zone : {"UTC", "Europe/Berlin", "America/St_Johns", "Asia/Kolkata"}) {
        setenv("TZ", zone, 1);
        tzset();
        for (const long when :
             {1L, 1364691599L, 1364691600L, 1382835599L, 1382835600L, 4102444800L}) {
            EXPECT_EQ(when, Z::convertDateTime(Z::convertDateTime(when))) << zone;
        }
        EXPECT_LE(std::abs(Z::convertDateTime(Z::getCurrentDateTime()) - time(nullptr)), 5) << zone;
    }
    unsetenv("TZ");
    tzset();
}

TEST_P(BaseProviderValues, ReadsWhatMustBeThere) {
    const cimom::NamedValues values{{"Name", "d1"}, {"Caption", Value::null(CMPI_string)}};
    const Args args(h.args(values));
    const Disk disk(h.disk(values));
    EXPECT_STREQ("\"d1\"", Z::cmpidata2String(provider.getParmVal(args, "Name")));
    EXPECT_STREQ("\"d1\"", Z::cmpidata2String(provider.getPropVal(disk, "Name")));
    for (const char* name : {"Caption", "None"}) {
        EXPECT_EQ("Parameter " + std::string(name) + " is not found in provided parameters.",
                  refused([&] { provider.getParmVal(args, name); }));
        EXPECT_EQ("Property " + std::string(name) +
                      " is not found on instance provided for class Test_Disk.",
                  refused([&] { provider.getPropVal(disk, name); }));
    }
    EXPECT_TRUE(Z::getKeyBinding(CmpiObjectPath(h.path()), "None").isNotFound());
}

TEST_P(BaseProviderValues, ComparesKeys) {
    const auto compare = [&](const cimom::NamedValues& given, bool namesOnly = false) {
        return refused([&] {
            const CmpiObjectPath path(h.scope.wrap(cimom::ObjectPath("", "Test_Disk", given)));
            provider.validateKeys(path, CmpiObjectPath(h.path()), "M", namesOnly);
        });
    };
    EXPECT_EQ("", compare({{"name", "D1"}}));
    EXPECT_NE("", compare({{"Name", "d2"}}));
    EXPECT_EQ("", compare({{"Name", "d2"}}, true));
}

TEST_P(BaseProviderValues, ComparesKeyValues) {
    const cimom::ObjectPath one("root/a", "K", {{"k", "x"}}), same("ROOT/A", "k", {{"K", "X"}}),
        other("root/a", "K", {{"k", "y"}});
    const std::tuple<Value, Value, bool> rows[] = {
        {Value("abc"), Value("ABC"), true},
        {Value(std::uint16_t{7}), Value(std::int64_t{7}), true},
        {Value(std::uint64_t{7}), Value(std::int8_t{-7}), false},
        {Value(std::int32_t{7}), Value(7.9), true},  // converted to the width of the first
        {Value(std::int32_t{7}), Value(1e30), false},
        {Value(true), Value(true), false},
        {Value(cimom::DateTime()), Value(cimom::DateTime()), true},
        {Value(one), Value(same), true},
        {Value(one), Value(other), false},
        {Value::null(CMPI_string), Value::null(CMPI_uint8), true},
        {Value::null(CMPI_string), Value(""), false},
    };
    CMPIBroker* const broker = h.server.broker();
    CMPIBrokerEncFT silent = *broker->eft;  // prints no paths
    silent.toString = nullptr;
    for (CMPIBrokerEncFT* table : {&silent, broker->eft}) {
        broker->eft = table;
        for (const auto& [a, b, equal] : rows) {
            zemString text1("old"), text2("old");
            EXPECT_EQ(equal, Z::compareKeyValues(data(a), data(b), text1, text2) != 0)
                << Z::cmpidata2String(data(a)) << " " << Z::cmpidata2String(data(b));
            EXPECT_TRUE(text1 != "old" && text2 != "old");
        }
    }
}

TEST_P(BaseProviderValues, ConvertsStringArrays) {
    zemDynamicArray<zemString> texts(25);
    texts.addElement(new zemString("a"));
    texts.addElement(nullptr);
    const zemDynamicArray<zemString> back = Z::convertStringArray(Z::convertStringArray(texts));
    ASSERT_EQ(2, back.size());
    EXPECT_STREQ("a", *back[0]);
    EXPECT_STREQ("", *back[1]);
}

TEST_P(BaseProviderValues, ComparesClassNames) {
    EXPECT_TRUE(Z::compareClassNames("ORX_Disk", "orx_disk"));
    EXPECT_TRUE(Z::compareClassNames("ORXDSG_Disk", "_disk"));
    EXPECT_FALSE(Z::compareClassNames("Disk", "_Disk"));
    EXPECT_FALSE(Z::compareClassNames("ORX_My_Disk", "_Disk"));
    EXPECT_STREQ("ORXDSG_OperatingSystem", Z::getOSClassName("orxdsg_X"));
}

ON_BOTH_BROKERS(BaseProviderValues);

TEST(BaseProviderValidation, FindsRepeatedNamesInLongLists) {
    Harness h(cimom::Character::Full);
    h.className = "Test_Unknown";  // of which the server cannot tell the properties
    std::vector<std::string> names;
    for (int i = 0; i < 20000; ++i) {
        names.push_back("Caption" + std::to_string(i));
    }
    names.insert(names.end(), {"CAPTION7", "caption3"});
    std::vector<const char*> list;
    for (const std::string& name : names) {
        list.push_back(name.c_str());
    }
    list.push_back(nullptr);
    EXPECT_EQ(
        "3/Duplicate property name Caption3 for class Test_Unknown is provided to "
        "method M on provider TestProvider.",
        failureText(
            [&] { h.provider().validateProerties(CmpiObjectPath(h.path()), list.data(), "M"); },
            "kt"));
    EXPECT_TRUE(Z::containsProperty(list.data(), "CAPTION3"));
    EXPECT_FALSE(Z::containsProperty(list.data(), "Name"));
    EXPECT_TRUE(Z::containsProperty(nullptr, "Name"));
}

}  // namespace
