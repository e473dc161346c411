#include <gtest/gtest.h>

#include <cstring>

#include "Guid.h"

namespace {

constexpr char zero[] = "00000000-0000-0000-0000-000000000000";

TEST(GuidTest, ReadsAndPrints) {
    const std::pair<const char*, const char*> rows[] = {
        {"0123abcd-4567-89ab-cdef-0123456789ab", "0123ABCD-4567-89AB-CDEF-0123456789AB"},
        {"0123abcd-4567-89ab-cdef-0123456789a", zero},
        {"0123abcd-4567-89ab-cdef-0123456789abc", zero},
        {"0123abcd-4567-89ab-cdef00123456789ab", zero},
        {"0123abcd4-567-89ab-cdef-0123456789ab", zero},
        {"0123abcd-4567-xxxx-cdef-0123456789ab", "0123ABCD-4567-0000-0000-000000000000"},
        {"", zero},
        {nullptr, zero},
    };
    for (const auto& [text, printed] : rows) {
        EXPECT_STREQ(zemGuid(text).toString(), printed);
    }
    EXPECT_TRUE(zemGuid(rows[0].first) == zemGuid(rows[0].second));
    EXPECT_FALSE(zemGuid(rows[0].first) == zemGuid());
    EXPECT_FALSE(zemGuid::getNewGuid() == zemGuid::getNewGuid());
}

TEST(GuidTest, PartsStandInMemoryInTheOrderOfTheText) {
    // The fifth group is a 16-bit word and a 32-bit one.
    const zemGuid guid("03020100-0504-0706-0908-0B0A0F0E0D0C");
    EXPECT_EQ(std::memcmp(reinterpret_cast<const char*>(&guid) + sizeof(void*),
                          "\0\1\2\3\4\5\6\7\10\11\12\13\14\15\16\17", 16),
              0);
}

}  // namespace
