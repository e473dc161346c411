#include <gtest/gtest.h>

#include "Failure.h"
#include "Object.h"
#include "Text.h"

namespace {

using namespace appliance;
using Texts = std::vector<std::string>;

TEST(TextTest, RecordsComeBackAsTheyWere) {
    const struct {
        Texts values;
        const char* record;
    } rows[] = {
        {{"a", "b"}, "a,b"},
        {{""}, ""},
        {{"", "", "x"}, ",,x"},
        {{"x,y", "z"}, "\"x,y\",z"},
        {{"say \"hi\"", "z"}, "\"say \"\"hi\"\"\",z"},
        {{"\"", ","}, "\"\"\"\",\",\""},
        {{"1,\"2\"", "\"3,4\""}, "\"1,\"\"2\"\"\",\"\"\"3,4\"\"\""},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.record, joined(row.values));
        EXPECT_EQ(row.values, split(row.record)) << row.record;
    }
}

TEST(TextTest, AQuoteThatClosesNothingIsAnOrdinaryCharacter) {
    EXPECT_EQ((Texts{"\"x", "y"}), split("\"x,y"));
    EXPECT_EQ((Texts{"\"a\"b", "c"}), split("\"a\"b,c"));
    EXPECT_EQ((Texts{"a\"b", "\""}), split("a\"b,\""));
    EXPECT_EQ((Texts{"", ""}), split("\"\","));
}

TEST(TextTest, Numbers) {
    const struct {
        const char* text;
        std::int64_t hundredths;
        const char* again;
    } rows[] = {{"1.25", 125, "1.25"},  {"0.0", 0, "0.0"},   {"0.05", 5, "0.05"},
                {"3", 300, "3.00"},     {".5", 50, "0.50"},  {"-0.75", -75, "-0.75"},
                {"2.999", 299, "2.99"}, {"null", 0, "0.0"},  {"", 0, "0.0"},
                {"-", 0, "0.0"},        {"1.", 100, "1.00"}, {"10.1", 1010, "10.10"}};
    for (const auto& row : rows) {
        EXPECT_EQ(row.hundredths, hundredths(row.text)) << row.text;
        EXPECT_EQ(row.again, units(row.hundredths));
    }
    std::int64_t value = 7;
    for (const char* wrong : {"", "-1", "+1", "1x", " 1", "99999999999999999999"}) {
        EXPECT_FALSE(wholeNumber(wrong, &value)) << wrong;
        EXPECT_EQ(7, value);
    }
    EXPECT_TRUE(wholeNumber("0042", &value));
    EXPECT_EQ(42, value);
    for (const char* wrong : {"", "0.125", "-1", "1,5", "1x", ".5", "1000000001"}) {
        EXPECT_FALSE(wholeUnits(wrong, &value)) << wrong;
    }
    EXPECT_TRUE(wholeUnits("1.25", &value));
    EXPECT_EQ(125, value);
    EXPECT_EQ("000A", hex(10, 4));
    EXPECT_EQ("01/02/2013 03:04:05", timeText(1357095845));
}

TEST(TextTest, AttributesKeepAllThatALineCanHold) {
    Object object(Kind::Lpar, {1, 4});
    object.set("pend_mem", "2048");
    object.set("name", "name=pend_mem=\"1\"");
    EXPECT_EQ("name=pend_mem=\"1\"", object.get("name"));
    EXPECT_EQ("2048", Object(Kind::Lpar, {1, 4}, object.stored()).get("pend_mem"));
    EXPECT_THROW(object.set("name", "two\nlines"), Failure);
    EXPECT_THROW(object.set("nmae", "x"), std::logic_error);
    EXPECT_THROW(object.get("lpar_env"), std::logic_error);  // must be set first
}

}  // namespace
