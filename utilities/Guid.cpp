#include "Guid.h"

#include <pthread.h>
#include <sys/time.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

constexpr std::size_t kTextLength = 36;

// The parts of each half, lowest bits first, as they lie in memory on the little-endian target.
std::uint64_t highHalf(std::uint32_t word, std::uint16_t a, std::uint16_t b) {
    return word | std::uint64_t{a} << 32 | std::uint64_t{b} << 48;
}

std::uint64_t lowHalf(std::uint16_t a, std::uint16_t b, std::uint32_t word) {
    return a | std::uint64_t{b} << 16 | std::uint64_t{word} << 32;
}

}  // namespace

zemGuid::zemGuid() : m_u64High(0), m_u64Low(0) {}

zemGuid::zemGuid(const char* text) : zemGuid() {
    if (text == nullptr || ::strnlen(text, kTextLength + 1) != kTextLength) {
        return;
    }
    for (const int dash : {8, 13, 18, 23}) {
        if (text[dash] != '-') {
            return;
        }
    }
    // A group that does not read leaves itself and the later ones zero.
    unsigned first = 0;
    unsigned last = 0;
    unsigned short middle[4] = {};
    static_cast<void>(std::sscanf(text, "%08X-%04hX-%04hX-%04hX-%04hX%08X", &first, &middle[0],
                                  &middle[1], &middle[2], &middle[3], &last));
    m_u64High = highHalf(first, middle[0], middle[1]);
    m_u64Low = lowHalf(middle[2], middle[3], last);
}

zemGuid::~zemGuid() = default;

zemString zemGuid::toString() const {
    const auto part = [](std::uint64_t half, int shift, unsigned mask) {
        return static_cast<unsigned>(half >> shift) & mask;
    };
    zemString text;
    text.format("%08X-%04X-%04X-%04X-%04X%08X", part(m_u64High, 0, 0xFFFFFFFF),
                part(m_u64High, 32, 0xFFFF), part(m_u64High, 48, 0xFFFF), part(m_u64Low, 0, 0xFFFF),
                part(m_u64Low, 16, 0xFFFF), part(m_u64Low, 32, 0xFFFFFFFF));
    return text;
}

bool zemGuid::operator==(const zemGuid& other) const {
    return m_u64High == other.m_u64High && m_u64Low == other.m_u64Low;
}

zemGuid zemGuid::getNewGuid() {
    timeval now{};
    gettimeofday(&now, nullptr);
    zemGuid guid;
    guid.m_u64High = static_cast<std::uint64_t>(now.tv_sec);
    guid.m_u64Low =
        static_cast<std::uint32_t>(pthread_self()) | static_cast<std::uint64_t>(std::rand()) << 32;
    return guid;
}
