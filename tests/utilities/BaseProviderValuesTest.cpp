#include <limits>

#include "BaseProviderText.h"
#include "ProviderHarness.h"

namespace {

class BaseProviderValues : public BothBrokers {
protected:
    BaseProviderValues() : h(GetParam()), provider(h.provider()) {}

    // A value as a provider reads it from a path or instance of the server.
    CmpiData data(const cimom::Value& value) {
        cimom::NamedValues args;
        args.set("v", value);
        return CmpiArgsOf(h.scope.wrap(args)).getArg("v");
    }
    std::string text(const cimom::Value& value) {
        return static_cast<const char*>(zemBaseProvider::cmpidata2String(data(value)));
    }
    std::string parsed(const std::string& source) {
        try {
            return static_cast<const char*>(zemBaseProvider::objectPathToString(
                zemBaseProvider::createObjectPath(zemString(source.c_str()))));
        } catch (const zemInvalidParameterException& e) {
            return std::string("refused: ") + e.getExceptionString();
        }
    }
    std::string keysRefused(const cimom::NamedValues& given, const cimom::NamedValues& found,
                            bool namesOnly = false) {
        try {
            provider.validateKeys(
                CmpiObjectPath(h.scope.wrap(cimom::ObjectPath("root/cimv2", "Test_Disk", given))),
                CmpiObjectPath(h.scope.wrap(cimom::ObjectPath("root/cimv2", "Test_Disk", found))),
                "M", namesOnly);
            return "";
        } catch (const zemInvalidParameterException& e) {
            return e.getExceptionString();
        }
    }

    struct CmpiArgsOf : CmpiArgs {
        explicit CmpiArgsOf(CMPIArgs* args) : CmpiArgs(args) {}
    };
    struct CmpiInstanceOf : CmpiInstance {
        explicit CmpiInstanceOf(CMPIInstance* instance) : CmpiInstance(instance) {}
    };

    Harness h;
    ScriptedProvider& provider;
};

TEST_P(BaseProviderValues, NamesCodesAndTypes) {
    const std::pair<int, const char*> codes[] = {{0, "CIM_OK"},
                                                 {6, "CIM_ERR_NOT_FOUND"},
                                                 {17, "CIM_ERR_METHOD_NOT_FOUND"},
                                                 {18, "CIM_ERR_UNKNOWN"},
                                                 {50, "CIM_RDO_NOT_UNLOAD"},
                                                 {61, "CIM_ERR_INVALID_DATA_TYPE"},
                                                 {100, "CIM_ERROR_SYSTEM"},
                                                 {200, "CIM_ERROR"}};
    for (const auto& [rc, name] : codes) {
        EXPECT_STREQ(name, zemBaseProvider::cmpiRcToString(static_cast<CMPIrc>(rc)));
    }
    const std::pair<CMPIType, const char*> types[] = {
        {CMPI_uint32, "uint32"},     {CMPI_uint32 | CMPI_ARRAY, "uint32[]"},
        {CMPI_chars, "string"},      {CMPI_instance, "[embedded instance] string"},
        {CMPI_dateTime, "datetime"}, {CMPI_char16, "Unknown Type"},
        {CMPI_refA, "reference[]"},  {CMPI_null, "Unknown Type"},
    };
    for (const auto& [type, name] : types) {
        EXPECT_STREQ(name, zemBaseProvider::cmpiDataTypeToString(type));
    }
}

TEST_P(BaseProviderValues, PrintsValues) {
    using cimom::Value;
    const cimom::ObjectPath path = Harness::diskPath();
    const std::pair<Value, std::string> rows[] = {
        {Value(true), "TRUE"},
        {Value(static_cast<std::int8_t>(-8)), "-8"},
        {Value(static_cast<std::uint8_t>(200)), "200"},
        {Value(std::numeric_limits<std::uint32_t>::max()), "4294967295"},
        {Value(std::numeric_limits<std::uint64_t>::max()), "18446744073709551615"},
        {Value(std::numeric_limits<std::int64_t>::min()), "-9223372036854775808"},
        {Value(1.5F), "1.500000"},
        {Value(0.1), "0.100000"},
        {Value(16777217.0), "16777216.000000"},  // a real64 has the precision of a real32
        {Value(-1e300), "-inf"},
        {Value("50%d"), "\"50%d\""},
        {Value(path), "root/cimv2:Test_Disk.Name=\"d1\""},
        {Value(cimom::Instance(path, {{"Name", "d1"}})),
         "instance of Test_Disk {\n    string Name = \"d1\"};"},
        {Value(cimom::DateTime::fromBinary(1500000, true)), "00000000000001.500000:000"},
        {Value::array(CMPI_uint16, {}), "{}"},
        {Value::array(CMPI_uint16, {Value(std::uint16_t{1}), Value(std::uint16_t{2})}), "{1,2}"},
        {Value::array(CMPI_string, {Value("a"), Value::null(CMPI_string)}), "{\"a\",}"},
        {Value::null(CMPI_uint32), ""},
        {Value::char16(65), ""},
    };
    for (const auto& [value, expected] : rows) {
        // Embedded instances come back with all properties from one server and those set from
        // another.
        const std::string printed = text(value);
        if (value.type() == CMPI_instance) {
            EXPECT_EQ(0U, printed.find("instance of Test_Disk {\n    string Name = \"d1\""));
            EXPECT_EQ(printed.size() - 2, printed.rfind("};"));
        } else {
            EXPECT_EQ(expected, printed);
        }
    }
    EXPECT_STREQ("", zemBaseProvider::cmpidata2String(CmpiData()));
}

TEST_P(BaseProviderValues, ParsesObjectPaths) {
    const std::pair<const char*, const char*> rows[] = {
        {"Foo", "root/cimv2:Foo"},
        {"root/x:Foo.a=\"1\",b=2", "root/x:Foo.a=\"1\",b=\"2\""},
        {"//h/root/x:Foo.k=\"\"v\"\"", "//h/root/x:Foo.k=\"v\""},
        {"///root/x:Foo", "root/x:Foo"},
        {"Foo.a=x=y", "root/cimv2:Foo.a=\"x=y\""},
        {"Foo.a=\"\"", "root/cimv2:Foo.a=\"\""},
        {"//h/Foo", "refused: //h/Foo"},
        {"//h", "refused: //h"},
        {"Foo.", "refused: Foo."},
        {"Foo.a=1,b", "refused: Foo.a=1,b"},
        {"Foo.a=\"1,2\"", "refused: Foo.a=\"1,2\""},
    };
    for (const auto& [source, expected] : rows) EXPECT_EQ(expected, parsed(source)) << source;
}

TEST_P(BaseProviderValues, MakesPathsFromPaths) {
    cimom::ObjectPath source("root/a", "Test_Disk", {{"Name", "d1"}});
    source.host = "box";
    const CmpiObjectPath path(h.scope.wrap(source));
    const auto text = [](const CmpiObjectPath& made) {
        return std::string(static_cast<const char*>(zemBaseProvider::objectPathToString(made)));
    };
    EXPECT_EQ("//box/root/a:Test_Disk", text(zemBaseProvider::createObjectPath(path)));
    EXPECT_EQ("//box/root/a:Other", text(zemBaseProvider::createObjectPath(path, "Other")));
    EXPECT_EQ("//box/root/b:Other",
              text(zemBaseProvider::createObjectPath(path, "root/b", "Other")));
}

TEST_P(BaseProviderValues, ConvertsDateTimes) {
    const auto text = [this](const CmpiDateTime& time) {
        CMPIStatus rc = {CMPI_RC_OK, nullptr};
        CMPIString* string = time.getEnc()->ft->getStringFormat(time.getEnc(), &rc);
        return std::string(string->ft->getCharPtr(string, nullptr));
    };
    EXPECT_EQ("00000000000000.000000:000", text(zemBaseProvider::convertDateTime(0L)));
    EXPECT_EQ("20010909014640.000000+000", text(zemBaseProvider::convertDateTime(1000000000L)));
    EXPECT_EQ("20010909014640.000007+000",
              text(zemBaseProvider::convertDateTime(timeval{1000000000, 7})));
    EXPECT_EQ(1000000000L,
              zemBaseProvider::convertDateTime(zemBaseProvider::convertDateTime(1000000000L)));
    EXPECT_EQ("00000000000000.000000:000",
              text(zemBaseProvider::convertDateTime(std::numeric_limits<long>::max())));
    EXPECT_NEAR(static_cast<double>(time(nullptr)),
                static_cast<double>(
                    zemBaseProvider::convertDateTime(zemBaseProvider::getCurrentDateTime())),
                5);
}

TEST_P(BaseProviderValues, ReadsWhatMustBeThere) {
    const CmpiObjectPath path(h.path());
    EXPECT_TRUE(zemIsMissing(zemBaseProvider::getKeyBinding(path, "None")));
    const cimom::NamedValues values{{"Name", "d1"}, {"Caption", cimom::Value::null(CMPI_string)}};
    const CmpiArgsOf args(h.scope.wrap(values));
    const CmpiInstanceOf disk(h.scope.wrap(cimom::Instance(Harness::diskPath(), values)));
    EXPECT_STREQ("\"d1\"", zemBaseProvider::cmpidata2String(provider.getParmVal(args, "Name")));
    EXPECT_STREQ("\"d1\"", zemBaseProvider::cmpidata2String(provider.getPropVal(disk, "Name")));
    for (const char* name : {"Caption", "None"}) {
        EXPECT_THROW(provider.getParmVal(args, name), zemInvalidParameterException);
        try {
            provider.getPropVal(disk, name);
            ADD_FAILURE();
        } catch (const zemInvalidParameterException& e) {
            EXPECT_EQ("Property " + std::string(name) +
                          " is not found on instance provided for class Test_Disk.",
                      e.getExceptionString());
        }
    }
}

TEST_P(BaseProviderValues, ComparesKeys) {
    const std::string key =
        " for class Test_Disk is provided to method M on provider TestProvider.";
    EXPECT_EQ("", keysRefused({{"name", "D1"}}, {{"Name", "d1"}}));
    EXPECT_EQ("Key Name for class Test_Disk is not provided to method M on provider TestProvider.",
              keysRefused({}, {{"Name", "d1"}}));
    EXPECT_EQ("Invalid key name Serial" + key,
              keysRefused({{"Name", "d1"}, {"Serial", "7"}}, {{"Name", "d1"}}));
    EXPECT_EQ(
        "A key provided for class Test_Disk to method M on provider TestProvider had an unexpected "
        "value. A value of d2 was provided for key Name instead of the expected value of d1.",
        keysRefused({{"Name", "d2"}}, {{"Name", "d1"}}));
    EXPECT_EQ("", keysRefused({{"Name", "d2"}}, {{"Name", "d1"}}, true));
}

TEST_P(BaseProviderValues, ComparesKeyValues) {
    using cimom::Value;
    const cimom::ObjectPath one("root/a", "K", {{"k", "x"}});
    const cimom::ObjectPath same("ROOT/A", "k", {{"K", "X"}});
    const cimom::ObjectPath other("root/a", "K", {{"k", "y"}});
    const struct {
        Value a, b;
        bool equal;
    } rows[] = {
        {Value("abc"), Value("ABC"), true},
        {Value("1"), Value(std::uint32_t{1}), false},
        {Value(std::uint16_t{7}), Value(std::int64_t{7}), true},
        {Value(std::uint64_t{7}), Value(std::int8_t{-7}), false},
        {Value(std::int32_t{7}), Value(7.9), true},  // converted to the width of the first
        {Value(std::int32_t{7}), Value(1e30), false},
        {Value(1.5), Value(1.5F), true},
        {Value(true), Value(true), false},
        {Value(cimom::DateTime()), Value(cimom::DateTime()), true},
        {Value(one), Value(same), true},
        {Value(one), Value(other), false},
        {Value(one), Value("x"), false},
        {Value::null(CMPI_string), Value::null(CMPI_uint8), true},
        {Value::null(CMPI_string), Value(""), false},
    };
    for (const auto& [a, b, equal] : rows) {
        zemString text1("old"), text2("old");
        EXPECT_EQ(equal, zemBaseProvider::compareKeyValues(data(a), data(b), text1, text2) != 0)
            << text(a) << " " << text(b);
        EXPECT_EQ(a.type() == CMPI_string && !a.isNull() && !b.isNull(),
                  text1 != "" && a.type() != CMPI_ref);
    }
}

TEST(BaseProviderValidation, FindsRepeatedNamesInLongLists) {
    Harness h(cimom::Character::Full);
    std::vector<std::string> names;
    for (int i = 0; i < 20000; ++i) names.push_back("Caption" + std::to_string(i));
    names.push_back("CAPTION7");
    names.push_back("caption3");
    std::vector<const char*> list;
    for (const std::string& name : names) list.push_back(name.c_str());
    list.push_back(nullptr);
    // Of a class that the server does not know, so that any name may be a property.
    const CmpiObjectPath path(h.scope.wrap(cimom::ObjectPath("root/cimv2", "Test_Unknown")));
    try {
        h.provider().validateProerties(path, list.data(), "M");
        ADD_FAILURE();
    } catch (const zemInvalidParameterException& e) {
        EXPECT_STREQ(
            "Duplicate property name Caption3 for class Test_Unknown is provided to method M on "
            "provider TestProvider.",
            e.getExceptionString());
    }
    EXPECT_TRUE(zemBaseProvider::containsProperty(list.data(), "CAPTION3"));
    EXPECT_FALSE(zemBaseProvider::containsProperty(list.data(), "Name"));
    list = {nullptr};
    EXPECT_TRUE(zemBaseProvider::containsProperty(list.data(), "Name"));
}

TEST_P(BaseProviderValues, ConvertsStringArrays) {
    zemDynamicArray<zemString> texts(25);
    texts.addElement(new zemString("a"));
    texts.addElement(nullptr);
    texts.addElement(new zemString(""));
    zemDynamicArray<zemString> back =
        zemBaseProvider::convertStringArray(zemBaseProvider::convertStringArray(texts));
    ASSERT_EQ(3, back.size());
    EXPECT_STREQ("a", *back[0]);
    EXPECT_STREQ("", *back[1]);
    zemArray<const char*> pointers(2, 2);
    pointers.append("b");
    back = zemBaseProvider::convertStringArray(zemBaseProvider::convertStringArray(pointers));
    ASSERT_EQ(1, back.size());
    EXPECT_STREQ("b", *back[0]);
}

TEST_P(BaseProviderValues, ComparesClassNames) {
    EXPECT_TRUE(zemBaseProvider::compareClassNames("ORX_Disk", "orx_disk"));
    EXPECT_TRUE(zemBaseProvider::compareClassNames("ORXDSG_Disk", "_disk"));
    EXPECT_FALSE(zemBaseProvider::compareClassNames("Disk", "_Disk"));
    EXPECT_FALSE(zemBaseProvider::compareClassNames("ORX_My_Disk", "_Disk"));
    EXPECT_STREQ("ORXDSG_OperatingSystem", zemBaseProvider::getOSClassName("orxdsg_X"));
    EXPECT_STREQ("ORX_OperatingSystem", zemBaseProvider::getOSClassName("ORX_X"));
    EXPECT_FALSE(zemBaseProvider::getSystemName().isEmpty());
}

ON_BOTH_BROKERS(BaseProviderValues);

}  // namespace
