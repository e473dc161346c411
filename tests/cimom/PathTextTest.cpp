// Paths, values and instances as text, both ways.
#include "Failure.h"
#include "Fixture.h"
#include "PathText.h"

namespace {

using namespace cimom;

TEST(PathText, PathsRoundTrip) {
    ObjectPath onHost("test/a", "C", {{"k", 1}});
    onHost.host = "host.example";
    const std::pair<ObjectPath, const char*> rows[] = {
        {{"", "Foo"}, "Foo"},
        {{"root/cimv2", "Foo"}, "root/cimv2:Foo"},
        {onHost, "//host.example/test/a:C.k=1"},
        {{"", "C", {{"a", ""}, {"b", true}}}, R"(C.a="",b=true)"},
        {{"", "C", {{"a", "x,y=\"z\"\\ . : // \n\t\x01"}}},
         R"(C.a="x,y=\"z\"\\ . : // \n\t\x0001")"},
        {{"n", "C", {{"a", std::int64_t{-5}}, {"b", std::uint64_t{18446744073709551615U}}}},
         "n:C.a=-5,b=18446744073709551615"},
        {{"", "C", {{"r", 2.5}, {"s", 1e100}, {"n", Value()}}}, "C.r=2.5,s=1e+100,n=NULL"},
        {{"", "C", {{"c", Value::char16('\'')}, {"d", Value::char16(0x20AC)}}},
         R"(C.c='\'',d='\x20AC')"},
    };
    for (const auto& [path, text] : rows) {
        EXPECT_EQ(printPath(path), text);
        EXPECT_EQ(printPath(parsePath(text)), text);
    }
    EXPECT_EQ(parsePath(rows[4].second), rows[4].first);
    EXPECT_EQ(parsePath("C. a = \"1\" , b = 2"),
              ObjectPath("", "C", {{"a", "1"}, {"b", std::int64_t{2}}}));
}

TEST(PathText, MistakesAreFound) {
    for (const char* text : {"", ":C", "//host", "///C", "n:", "C.", "C.a", "C.a=", "C.a=\"x",
                             "C.=1", "C.a=1,", "C.a=x", "C.a=1,A=2", "C.a=\"x\"b", "C.a=\"\\q\"",
                             "C.a=\"\\x12\"", "C\"", "C.a=99999999999999999999x", "C.a='ab'"}) {
        EXPECT_THROW(parsePath(text), Failure) << text;
    }
}

TEST(PathText, KeysAreTypedByTheClass) {
    const ObjectPath one = fixture::thing("one");
    const ObjectPath link("root/cimv2", "Fix_Link", {{"Antecedent", one}, {"Dependent", one}});
    const ObjectPath read = parsePath(printPath(link));
    EXPECT_EQ(read.keys.find("Dependent")->type(), CMPI_string);
    EXPECT_EQ(typedKeys(read, *fixture::classes()), link);
    EXPECT_THROW(typedKeys(parsePath("Fix_Thing.Name=5"), *fixture::classes()), Failure);
}

TEST(PathText, ValuesAreReadByType) {
    // No value: refused.
    const std::tuple<const char*, CMPIType, Value> rows[] = {
        {"5", CMPI_uint8, std::uint8_t{5}},
        {"256", CMPI_uint8, {}},
        {"-1", CMPI_uint32, {}},
        {"-128", CMPI_sint8, std::int8_t{-128}},
        {"", CMPI_sint32, {}},
        {" 5", CMPI_sint32, {}},
        {"1e2", CMPI_real32, 100.0F},
        {"TRUE", CMPI_boolean, true},
        {"yes", CMPI_boolean, {}},
        {"\"5\"", CMPI_string, "\"5\""},
        {"x", CMPI_char16, Value::char16('x')},
        {"00000001000000.000000:000", CMPI_dateTime, DateTime::fromBinary(86400000000, true)},
        {"soon", CMPI_dateTime, {}},
        {"Foo.a=1", CMPI_ref, ObjectPath("", "Foo", {{"a", std::int64_t{1}}})},
        {"{a, \"b,c\" ,}", CMPI_stringA, Value::array(CMPI_string, {"a", "b,c"})},
        {"{\"A.k=1\"}", CMPI_refA,
         Value::array(CMPI_ref, {ObjectPath("", "A", {{"k", std::int64_t{1}}})})},
        {"1,2", CMPI_uint16A, Value::array(CMPI_uint16, {std::uint16_t{1}, std::uint16_t{2}})},
        {"{}", CMPI_uint16A, Value::array(CMPI_uint16, {})},
        {"{1", CMPI_uint16A, {}},
        {"{1}2", CMPI_uint16A, {}},
    };
    for (const auto& [text, type, expected] : rows) {
        if (expected.isNull()) {
            EXPECT_THROW(parseValue(text, type), Failure) << text;
        } else {
            EXPECT_EQ(parseValue(text, type), expected) << text;
        }
    }
    EXPECT_EQ(guessValue("-7"), Value(std::int64_t{-7}));
    EXPECT_EQ(guessValue("\"7\""), Value("7"));
    EXPECT_EQ(guessValue("seven \"7\""), Value("seven \"7\""));
    EXPECT_EQ(guessValue("{\"a\", NULL}"), Value::array(CMPI_string, {"a", Value()}));
}

TEST(PathText, InstancesReadBackAsTheirClassSays) {
    Instance thing(fixture::thing("one"),
                   {{"Name", "one"},
                    {"Size", std::uint32_t{5}},
                    {"Since", DateTime()},
                    {"Tags", Value::array(CMPI_string, {"a \"quoted\" one", "b"})},
                    {"Part", Value::null(CMPI_instance)}});
    thing.path.nameSpace.clear();
    Instance outer = thing;
    outer.properties.set("Part", thing);
    const std::string text = printInstance(outer);
    EXPECT_EQ(text.substr(0, 48), "// Fix_Thing.Name=\"one\"\ninstance of Fix_Thing {\n");
    const auto& classes = *fixture::classes();
    const Value read = parseValue(text.substr(text.find('\n') + 1), CMPI_instance, &classes);
    EXPECT_EQ(read.instance(), outer);
    const char* const two = "{Fix_Thing{Size=1;}, instance of Fix_Base { Name = \"x\"; }}";
    EXPECT_EQ(parseValue(two, CMPI_instanceA, &classes).elements().size(), 2U);
    for (const char* bad : {"Fix_Thing{Size=-1;}", "Fix_Thing{Sise=1;}", "Fix_Thing{Size=1;", "{}",
                            "Fix_Thing{Size=1;}x", "Fix_Thing{Size 1;}"}) {
        EXPECT_THROW(parseValue(bad, CMPI_instance, &classes), Failure) << bad;
    }
    std::string deep, wide = "A{";
    for (int i = 0; i < 100; ++i) {
        deep += "A{p=instance of ";
        wide += "a" + std::to_string(i) + "={1}; b" + std::to_string(i) + "=instance of B {}; ";
    }
    EXPECT_EQ(parseValue(wide + "}", CMPI_instance).instance().properties.size(), 200U);
    EXPECT_THROW(parseValue(deep, CMPI_instance, &classes), Failure);
}

TEST(PathText, RealsKeepTheirValue) {
    for (const double value : {0.0, 1e-310, 0.1, 1.0 / 3, 1e-300, 123456789.0, -2.5e10}) {
        EXPECT_EQ(parseValue(printValue(value), CMPI_real64), Value(value));
    }
    EXPECT_EQ(printValue(0.1F), "0.1");
}

}  // namespace
