#include <gtest/gtest.h>

#include "StringUtils.h"

namespace {

const char* const none = nullptr;

std::string bytes(const zemString& s) {
    return std::string(static_cast<const char*>(s), s.isEmpty() ? 0 : s.length());
}

void expectRows(const std::vector<std::pair<zemString, std::string>>& rows) {
    for (const auto& [got, want] : rows) {
        EXPECT_EQ(bytes(got), want);
    }
}

TEST(StringTest, TextsOfConstructorsAndTransformations) {
    const zemString hello("hello");
    const zemString empty("");
    expectRows({
        {zemString(-120), "-120"},
        {zemString("abcdef", 3U), "abc"},
        {zemString(none, 5U), ""},
        {zemString(hello, 7U, '.'), "hello.."},
        {zemString(empty, 2U, 'x'), "xx"},
        {hello.extractSubstring(1, 3), "el"},
        {hello.extractSubstring(3, 99), "lo"},
        {hello.extractSubstring(5, 3), ""},
        {hello.extractSubstring(10), ""},
        {hello.extractSubstring(~0U - 1U, ~0U), ""},
        {zemString::stripLeading("  a b ", ' '), "a b "},
        {zemString::stripTrailing("  a b  ", ' '), "  a b"},
        {zemString("ab", 5U, '\0').stripTrailing('x'), "ab"},  // drops the NULs
        {zemString::replaceChar("a.b.c", '.', '/'), "a/b/c"},
        {zemString::upperCase("aZ9", 1), "AZ9"},
        {zemString::upperCase("\x81\x89\xf1", 0), "\xc1\xc9\xf1"},  // a, i, 1 in EBCDIC
        {zemString::AtoE("A[]^\xc1"), "\xc1\xad\xbd\x5f\xc1"},      // the top bit is ignored
        {zemString::EtoA("\xc8\x85\x93\x93\x96"), "Hello"},
        {zemString("ab").padString(300, '-').padString(3, '+'), "ab" + std::string(298, '-')},
        {"<" + zemString("b") + ">", "<b>"},
    });
}

TEST(StringTest, EmptyWithAndWithoutABuffer) {
    EXPECT_TRUE(zemString(none).isInvalid());
    zemString text("hello");
    text = "";
    EXPECT_FALSE(text.isInvalid());
    text = zemString(text);
    EXPECT_TRUE(text.isInvalid()) << "copies of empty strings have no buffer";
    EXPECT_EQ(static_cast<const char*>(text), static_cast<const char*>(zemString("")));
    text = "abcdef";
    text = static_cast<const char*>(text) + 2;
    text += text;
    EXPECT_STREQ(text, "cdefcdef");
    text = none;
    text += "";
    EXPECT_TRUE(text.isInvalid());
}

TEST(StringTest, ClearedStringKeepsItsLengthAndTakesNewText) {
    zemString text("hello");
    text.clear();
    EXPECT_TRUE(text.isEmpty() && zemString(text).isInvalid());
    EXPECT_EQ(text.length(), 5U);
    EXPECT_STREQ(text, "");
    text = "hi";  // shorter than before: the old size must not be trusted
    EXPECT_STREQ(text, "hi");
    text.clear();
    for (int i = 0; i < 100; ++i) {
        text += 'x';
    }
    EXPECT_EQ(bytes(text), std::string(100, 'x'));
}

TEST(StringTest, Equality) {
    // two texts, whether they are the same and whether they differ by case only
    const std::tuple<const char*, const char*, bool, bool> rows[] = {
        {"abc", "abc", true, true}, {"abc", "aBc", false, true}, {"abc", "ab", false, false},
        {"", "", true, true},       {none, none, true, true},    {none, "x", false, false}};
    for (const auto& [a, b, same, alike] : rows) {
        const zemString first(a), second(b);
        EXPECT_EQ(zemString::equals(a, b), same);
        EXPECT_EQ(zemString::equals(first, b), same);
        EXPECT_EQ(first == second, same);
        EXPECT_EQ(zemString::equalsIgnoreCase(a, b), alike);
        EXPECT_EQ(zemString::equalsIgnoreCase(first, b), alike);
        EXPECT_EQ(zemString::equalsIgnoreCase(first, second), alike);
    }
    EXPECT_TRUE(zemString("") == none && zemString() == "" && !zemString::equals(none, ""));
}

TEST(StringTest, Search) {
    const zemString text("axbxc");
    const zemString empty;
    using Ints = std::vector<int>;
    EXPECT_EQ((Ints{text.find('x', 0), text.find('x', 2), text.find('c', 5)}), (Ints{1, 3, -1}));
    EXPECT_EQ((Ints{text.reverseFind('x', 99), text.reverseFind('x', 2), text.reverseFind('x', 0)}),
              (Ints{3, 1, -1}));
    EXPECT_EQ(zemString("abxab").find("x", 5), 2) << "the start does not matter";
    EXPECT_EQ((Ints{text.find("", 0), empty.find("a", 0), empty.reverseFind('x', 3)}),
              (Ints{-1, -1, -1}));
    EXPECT_EQ((Ints{text.count('x'), zemString("a\xff").getHashKey(), empty.getHashKey()}),
              (Ints{2, 'a' - 1, 0}));
    EXPECT_TRUE(text.startsWith("ax") && text.startsWith(none) && empty.startsWith(""));
    EXPECT_FALSE(empty.startsWith("a") || text.startsWith("axbxcd"));
    EXPECT_TRUE(zemString("0123456789").isDigit());
    EXPECT_FALSE(empty.isDigit() || zemString("-1").isDigit());
}

TEST(StringTest, Format) {
    zemString text;
    const char* volatile null = nullptr;  // so that the compiler does not see the null
    const auto check = [&text](int result, const std::string& expected) {
        EXPECT_EQ(bytes(text), expected);
        EXPECT_EQ(result, static_cast<int>(expected.size()));
    };
    check(text.format("%d%% of %s, %c", 42, static_cast<const char*>(null), 'x'),
          "42% of (null), x");
    check(text.format("%08.3f|%-6s|%+d|%#x", 3.14159, "ab", 7, 255), "0003.142|ab    |+7|0xff");
    const char unterminated[] = {'a', 'b', 'c'};
    check(text.format("%.3s", unterminated), "abc");
    check(text.format("%F %ls", 1e300, L"wide"), std::to_string(1e300) + " wide");
    text = std::string(5000, 'q').c_str();
    check(text.format("<%s>", static_cast<const char*>(text)), "<" + std::string(5000, 'q') + ">");
    int written = 0;
    check(text.format("abc%n%d", &written, 1), "abc1");
    EXPECT_EQ(written, 3);
    check(text.format("%s", ""), "");
    EXPECT_FALSE(text.isInvalid());
}

TEST(StringPairsTest, KeepsOrderAndDuplicates) {
    zemStringPairs pairs;
    for (int i = 0; i < 25; ++i) {
        pairs.addPair(zemString(i % 20), zemString(100 + i));
    }
    zemString key("k");
    zemString value("v");
    EXPECT_EQ(pairs.getPair(24, key, value), 24);
    expectRows({{key, "4"},
                {value, "124"},
                {pairs.getValue("3"), "103"},  // the first of two
                {pairs.getValue("0") + pairs.getKey("100"), "1000"},
                {pairs.getKey("123"), "3"},
                {pairs.removePair("3"), "103"},
                {pairs.getValue("3"), "123"},
                {pairs.removePair("nil"), ""}});
    EXPECT_EQ(pairs.getIndex("4"), 3);
    EXPECT_EQ(pairs.getPair(24, key, value), -1);
    EXPECT_TRUE(key.isEmpty() && value.isEmpty());
}

TEST(StringPairsTest, AssignmentAppendsAndRemovingTheLastStartsAgain) {
    zemStringPairs pairs("a", "1");
    pairs = zemStringPairs("b", "2");
    pairs = *&pairs;
    const zemDynamicArray<zemString> keys = zemStringPairs(pairs).getFirstElements();
    ASSERT_EQ(keys.size(), 2);
    expectRows({{*keys[0], "a"}, {*keys[1], "b"}, {pairs.removePair(0), "1"}});
    EXPECT_STREQ(pairs.removePair(0), "2");
    EXPECT_EQ(pairs.size(), 0);
    pairs.addPair("c", "3");
    EXPECT_STREQ(*pairs.getSecondElements()[0], "3");
}

}  // namespace
