#include "StringUtils.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <climits>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <memory>
#include <utility>

namespace {

constexpr char kEmptyText[] = "";

unsigned char byte(char c) { return static_cast<unsigned char>(c); }

char translate(const unsigned char (&table)[256], char c) {
    return static_cast<char>(table[byte(c)]);
}

void translate(const unsigned char (&table)[256], char* text, std::size_t n) {
    std::transform(text, text + n, text, [&table](char c) { return translate(table, c); });
}

unsigned lengthOf(const char* text) {
    return text == nullptr ? 0 : static_cast<unsigned>(std::strlen(text));
}

std::size_t boundedLength(const char* text, std::size_t n) {
    return text == nullptr ? 0 : ::strnlen(text, n);
}

// Byte by byte up to the first terminator, for texts of equal length only.
template <typename Same>
bool sameText(const char* a, const char* b, unsigned lengthA, unsigned lengthB, Same same) {
    if (lengthA != lengthB || lengthA == 0 || a == b) {
        return lengthA == lengthB;
    }
    if (a == nullptr || b == nullptr) {
        return false;
    }
    for (unsigned i = 0; i < lengthA && (a[i] != '\0' || b[i] != '\0'); ++i) {
        if (!same(a[i], b[i])) {
            return false;
        }
    }
    return true;
}

}  // namespace

zemString::zemString(int value) : zemString() {
    char digits[16];
    char* const end = std::to_chars(digits, digits + sizeof digits, value).ptr;
    assign(digits, static_cast<std::size_t>(end - digits));
}

zemString::zemString(const char* text) : zemString() {
    if (text != nullptr) {
        assign(text, std::strlen(text));
    }
}

zemString::zemString(const char* text, unsigned n) : zemString() { m_len = fill(text, n, '\0'); }

zemString::zemString(const char* text, unsigned n, char pad) : zemString() { fill(text, n, pad); }

zemString::zemString(const zemString& text, unsigned n, char pad) : zemString() {
    fill(text.isEmpty() ? nullptr : text.m_buffer, n, pad);
}

zemString::zemString(const zemString& source) : zemString() {
    if (!source.isEmpty()) {
        assign(source.m_buffer, source.m_len);
    }
}

void zemString::release() {
    delete[] m_buffer;
    m_buffer = nullptr;
    m_size = 0;
    m_len = 0;
}

void zemString::assign(const char* text, std::size_t n) {
    // clear() leaves m_size standing without a buffer.
    if (m_buffer == nullptr || n + 1 > m_size) {
        char* const buffer = new char[n + 1];
        delete[] m_buffer;
        m_buffer = buffer;
        m_size = n + 1;
    }
    std::memmove(m_buffer, text, n);
    m_buffer[n] = '\0';
    m_len = n;
}

void zemString::append(const char* text, std::size_t n, std::size_t newSize) {
    const std::size_t used = textLength();
    if (m_buffer == nullptr || used + n + 1 > m_size) {
        char* const buffer = new char[newSize];
        std::copy(m_buffer, m_buffer + used, buffer);
        std::copy(text, text + n, buffer + used);
        delete[] m_buffer;
        m_buffer = buffer;
        m_size = newSize;
    } else {
        std::memmove(m_buffer + used, text, n);
    }
    m_len = used + n;
    m_buffer[m_len] = '\0';
}

// Into a fresh string: n bytes, the beginning of the text and then pad. Returns how many are text.
std::size_t zemString::fill(const char* text, std::size_t n, char pad) {
    const std::size_t copied = boundedLength(text, n);
    m_buffer = new char[n + 1];
    m_size = n + 1;
    m_len = n;
    std::copy(text, text + copied, m_buffer);
    std::fill(m_buffer + copied, m_buffer + n, pad);
    m_buffer[n] = '\0';
    return copied;
}

zemString& zemString::operator=(const char* text) {
    if (text == nullptr) {
        release();
    } else if (text != m_buffer) {
        // A part of the own text is never longer than the buffer, so it is not freed under us.
        assign(text, std::strlen(text));
    }
    return *this;
}

zemString& zemString::operator=(const zemString& source) {
    if (this == &source) {
        return *this;
    }
    if (source.isEmpty()) {
        release();
    } else {
        assign(source.m_buffer, source.m_len);
    }
    return *this;
}

zemString& zemString::operator=(zemString&& source) noexcept {
    if (this == &source) {
        return *this;
    }
    release();
    if (!source.isEmpty()) {
        std::swap(m_buffer, source.m_buffer);
        std::swap(m_size, source.m_size);
        std::swap(m_len, source.m_len);
    }
    return *this;
}

zemString& zemString::operator+=(const char* text) {
    const std::size_t n = text == nullptr ? 0 : std::strlen(text);
    if (n > 0) {
        append(text, n, textLength() + n + 1);
    }
    return *this;
}

zemString& zemString::operator+=(char c) {
    append(&c, 1, textLength() + 8);
    return *this;
}

zemString& zemString::operator+=(const zemString& text) {
    return *this += static_cast<const char*>(text);
}

zemString operator+(const zemString& a, const zemString& b) {
    zemString sum(a);
    sum += b;
    return sum;
}

zemString operator+(const char* a, const zemString& b) {
    zemString sum(a);
    sum += b;
    return sum;
}

void zemString::clear() {
    delete[] m_buffer;
    m_buffer = nullptr;
}

int zemString::format(const char* fmt, ...) {
    va_list args;
    va_start(args, fmt);
    const int result = std::vsnprintf(nullptr, 0, fmt, args);
    va_end(args);
    const std::size_t length = result < 1 ? 0 : static_cast<std::size_t>(result);
    // A fresh buffer even if the old one would do: the arguments may point into that.
    std::unique_ptr<char[]> buffer(new char[length + 1]());
    if (length > 0) {
        va_start(args, fmt);
        std::vsnprintf(buffer.get(), length + 1, fmt, args);
        va_end(args);
    }
    delete[] m_buffer;
    m_buffer = buffer.release();
    m_size = length + 1;
    m_len = length;
    return result;
}

zemString::operator const char*() const { return isEmpty() ? kEmptyText : m_buffer; }

bool zemString::isDigit() const {
    return !isEmpty() &&
           std::all_of(m_buffer, m_buffer + m_len, [](char c) { return c >= '0' && c <= '9'; });
}

bool zemString::startsWith(const char* prefix) const {
    if (prefix == nullptr || *prefix == '\0') {
        return true;
    }
    return !isEmpty() && std::strncmp(m_buffer, prefix, std::strlen(prefix)) == 0;
}

int zemString::count(char c) const {
    return static_cast<int>(std::count(m_buffer, m_buffer + textLength(), c));
}

int zemString::getHashKey() const {
    unsigned sum = 0;
    for (std::size_t i = 0; i < textLength(); ++i) {
        sum += static_cast<unsigned>(static_cast<signed char>(m_buffer[i]));
    }
    return static_cast<int>(sum);
}

bool zemString::equals(const char* a, const char* b, unsigned lengthA, unsigned lengthB) {
    return sameText(a, b, lengthA, lengthB, [](char x, char y) { return x == y; });
}

bool zemString::equalsIgnoreCase(const char* a, const char* b, unsigned lengthA, unsigned lengthB) {
    return sameText(a, b, lengthA, lengthB, [](char x, char y) {
        return x == y || std::toupper(byte(x)) == std::toupper(byte(y));
    });
}

bool zemString::equals(const char* a, const char* b) {
    return (a == nullptr) == (b == nullptr) && equals(a, b, lengthOf(a), lengthOf(b));
}

bool zemString::equals(const zemString& a, const char* b) {
    return equals(a.m_buffer, b, a.textLength(), lengthOf(b));
}

bool zemString::equals(const zemString& a, const zemString& b) {
    return equals(a.m_buffer, b.m_buffer, a.textLength(), b.textLength());
}

bool zemString::equalsIgnoreCase(const char* a, const char* b) {
    return (a == nullptr) == (b == nullptr) && equalsIgnoreCase(a, b, lengthOf(a), lengthOf(b));
}

bool zemString::equalsIgnoreCase(const zemString& a, const char* b) {
    return equalsIgnoreCase(a.m_buffer, b, a.textLength(), lengthOf(b));
}

bool zemString::equalsIgnoreCase(const zemString& a, const zemString& b) {
    return equalsIgnoreCase(a.m_buffer, b.m_buffer, a.textLength(), b.textLength());
}

bool operator==(const zemString& a, const zemString& b) { return zemString::equals(a, b); }

bool operator==(const zemString& a, const char* b) { return zemString::equals(a, b); }

bool operator!=(const zemString& a, const zemString& b) { return !(a == b); }

bool operator!=(const zemString& a, const char* b) { return !(a == b); }

int zemString::find(char c, unsigned start) const {
    if (start >= textLength()) {
        return -1;
    }
    const void* const hit = std::memchr(m_buffer + start, c, m_len - start);
    return hit == nullptr ? -1 : static_cast<int>(static_cast<const char*>(hit) - m_buffer);
}

int zemString::find(const char* s, unsigned /*start*/) const {
    if (m_buffer == nullptr || s == nullptr || *s == '\0') {
        return -1;
    }
    const char* const hit = std::strstr(m_buffer, s);
    return hit == nullptr ? -1 : static_cast<int>(hit - m_buffer);
}

int zemString::find(const zemString& s, unsigned start) const {
    return find(static_cast<const char*>(s), start);
}

int zemString::reverseFind(char c, unsigned start) const {
    if (isEmpty()) {
        return -1;
    }
    std::size_t i = std::min<std::size_t>(start, m_len - 1) + 1;
    while (i > 0 && m_buffer[i - 1] != c) {
        --i;
    }
    return static_cast<int>(i) - 1;
}

zemString zemString::extractSubstring(unsigned start) const {
    return extractSubstring(start, UINT_MAX);
}

zemString zemString::extractSubstring(unsigned start, unsigned end) const {
    zemString part;
    const std::size_t stop = std::min<std::size_t>(end, textLength());
    if (start < stop) {
        part.assign(m_buffer + start, stop - start);
    }
    return part;
}

void zemString::mapCase(int (*mapping)(int), int ascii) {
    std::transform(m_buffer, m_buffer + textLength(), m_buffer, [=](char c) {
        if (ascii != 0) {
            return static_cast<char>(mapping(byte(c)));
        }
        return translate(AtoEchars, static_cast<char>(mapping(byte(translate(EtoAchars, c)))));
    });
}

zemString& zemString::upperCase(int ascii) {
    mapCase(std::toupper, ascii);
    return *this;
}

zemString& zemString::lowerCase(int ascii) {
    mapCase(std::tolower, ascii);
    return *this;
}

zemString& zemString::stripLeading(char c) {
    std::size_t n = 0;
    while (n < textLength() && m_buffer[n] == c) {
        ++n;
    }
    if (n > 0) {
        std::memmove(m_buffer, m_buffer + n, m_len - n + 1);
        m_len -= n;
    }
    return *this;
}

zemString& zemString::stripTrailing(char c) {
    if (m_buffer != nullptr) {
        while (m_len > 0 && (m_buffer[m_len - 1] == c || m_buffer[m_len - 1] == '\0')) {
            --m_len;
        }
        m_buffer[m_len] = '\0';
    }
    return *this;
}

zemString& zemString::padString(unsigned n, char pad) {
    const std::size_t used = textLength();
    if (n > used) {
        const std::size_t size = std::size_t{n} + 1;
        if (m_buffer == nullptr || m_size < size) {
            char* const buffer = new char[size];
            std::copy(m_buffer, m_buffer + used, buffer);
            delete[] m_buffer;
            m_buffer = buffer;
        }
        std::fill(m_buffer + used, m_buffer + n, pad);
        m_buffer[n] = '\0';
        m_len = n;
        m_size = size;
    }
    return *this;
}

zemString& zemString::replaceChar(char a, char b) {
    const std::size_t n = boundedLength(m_buffer, textLength());
    std::replace(m_buffer, m_buffer + n, a, b);
    return *this;
}

zemString& zemString::EtoA() {
    translate(EtoAchars, m_buffer, textLength());
    return *this;
}

zemString& zemString::AtoE() {
    translate(AtoEchars, m_buffer, textLength());
    return *this;
}

void zemString::EtoA(char* buf, unsigned n) { translate(EtoAchars, buf, n); }

void zemString::AtoE(char* buf, unsigned n) { translate(AtoEchars, buf, n); }

zemString zemString::upperCase(const zemString& text, int ascii) {
    return zemString(text).upperCase(ascii);
}

zemString zemString::lowerCase(const zemString& text, int ascii) {
    return zemString(text).lowerCase(ascii);
}

zemString zemString::stripLeading(const zemString& text, char c) {
    return zemString(text).stripLeading(c);
}

zemString zemString::stripTrailing(const zemString& text, char c) {
    return zemString(text).stripTrailing(c);
}

zemString zemString::replaceChar(const zemString& text, char a, char b) {
    return zemString(text).replaceChar(a, b);
}

zemString zemString::EtoA(const zemString& text) { return zemString(text).EtoA(); }

zemString zemString::AtoE(const zemString& text) { return zemString(text).AtoE(); }

zemStringPairs::zemStringPairs()
    : m_count(0), m_max(0), m_firstArray(nullptr), m_secondArray(nullptr) {}

zemStringPairs::zemStringPairs(const zemString& key, const zemString& value) : zemStringPairs() {
    addPair(key, value);
}

zemStringPairs::zemStringPairs(const zemStringPairs& source) : zemStringPairs() { addAll(source); }

zemStringPairs::~zemStringPairs() { removeAll(); }

zemStringPairs& zemStringPairs::operator=(const zemStringPairs& source) {
    if (this != &source) {
        addAll(source);
    }
    return *this;
}

void zemStringPairs::addAll(const zemStringPairs& source) {
    for (int i = 0; i < source.m_count; ++i) {
        addPair(source.m_firstArray[i], source.m_secondArray[i]);
    }
}

void zemStringPairs::addPair(const zemString& key, const zemString& value) {
    if (m_count == m_max) {
        const int max = m_max + 10;
        std::unique_ptr<zemString[]> keys(new zemString[static_cast<std::size_t>(max)]);
        std::unique_ptr<zemString[]> values(new zemString[static_cast<std::size_t>(max)]);
        std::move(m_firstArray, m_firstArray + m_count, keys.get());
        std::move(m_secondArray, m_secondArray + m_count, values.get());
        delete[] m_firstArray;
        delete[] m_secondArray;
        m_firstArray = keys.release();
        m_secondArray = values.release();
        m_max = max;
    }
    m_firstArray[m_count] = key;
    m_secondArray[m_count] = value;
    ++m_count;
}

zemString zemStringPairs::removePair(int index) {
    if (index < 0 || index >= m_count) {
        return "";
    }
    zemString removed(m_secondArray[index]);
    for (zemString* texts : {m_firstArray, m_secondArray}) {
        std::move(texts + index + 1, texts + m_count, texts + index);
    }
    if (--m_count == 0) {
        removeAll();
    }
    return removed;
}

zemString zemStringPairs::removePair(const zemString& key) { return removePair(getIndex(key)); }

void zemStringPairs::removeAll() {
    delete[] m_firstArray;
    delete[] m_secondArray;
    m_firstArray = nullptr;
    m_secondArray = nullptr;
    m_count = 0;
    m_max = 0;
}

zemDynamicArray<zemString> zemStringPairs::copyOf(const zemString* texts) const {
    zemDynamicArray<zemString> copies(25);
    for (int i = 0; i < m_count; ++i) {
        auto copy = std::make_unique<zemString>(texts[i]);
        copies.addElement(copy.get());
        static_cast<void>(copy.release());
    }
    return copies;
}

zemDynamicArray<zemString> zemStringPairs::getFirstElements() const { return copyOf(m_firstArray); }

zemDynamicArray<zemString> zemStringPairs::getSecondElements() const {
    return copyOf(m_secondArray);
}

int zemStringPairs::getPair(int index, zemString& key, zemString& value) const {
    key = "";
    value = "";
    if (index < 0 || index >= m_count) {
        return -1;
    }
    key = m_firstArray[index];
    value = m_secondArray[index];
    return index;
}

int zemStringPairs::indexIn(const zemString* texts, const zemString& text) const {
    const zemString* const end = texts + m_count;
    const zemString* const hit = std::find(texts, end, text);
    return hit == end ? -1 : static_cast<int>(hit - texts);
}

zemString zemStringPairs::getValue(const zemString& key) const {
    const int index = getIndex(key);
    return index < 0 ? zemString("") : m_secondArray[index];
}

zemString zemStringPairs::getKey(const zemString& value) const {
    const int index = indexIn(m_secondArray, value);
    return index < 0 ? zemString("") : m_firstArray[index];
}

int zemStringPairs::getIndex(const zemString& key) const { return indexIn(m_firstArray, key); }
