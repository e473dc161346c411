#include "StringUtils.h"

#include <algorithm>
#include <cctype>
#include <climits>
#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <utility>

namespace {

constexpr char emptyText[] = "";

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

// Walks over a printf format and its arguments, and counts how many bytes a buffer for the
// expansion should have, terminator not included. An estimate: mostly generous, sometimes short.
class FormatSizer {
public:
    FormatSizer(const char* fmt, va_list args) : m_next(fmt) { va_copy(m_args, args); }
    ~FormatSizer() { va_end(m_args); }
    FormatSizer(const FormatSizer&) = delete;
    FormatSizer& operator=(const FormatSizer&) = delete;

    std::size_t count() {
        std::size_t total = 0;
        while (*m_next != '\0') {
            if (*m_next++ != '%') {
                ++total;
            } else if (*m_next == '%') {
                ++m_next;
                ++total;
            } else {
                total += conversion();
            }
        }
        return total;
    }

private:
    // How wide an argument is passed, as the length modifiers before the conversion say.
    enum class Width { plain, word, longWord, longDouble };

    std::size_t conversion() {
        std::size_t extra = 0;
        for (; *m_next != '\0' && std::strchr("-+0 #", *m_next) != nullptr; ++m_next) {
            extra += *m_next == '#' ? 2 : 0;
        }
        const std::size_t width = number();
        std::size_t precision = 0;
        std::size_t textLimit = SIZE_MAX;
        if (*m_next == '.') {
            ++m_next;
            textLimit = precision = number();
        }
        extra += modifiers(std::max<std::size_t>(width + precision, 40));
        return extra + argument(width, precision, textLimit);
    }

    // A width or precision: from the arguments for "*", else the digits; 0 if there is neither.
    std::size_t number() {
        long value = 0;
        if (*m_next == '*') {
            ++m_next;
            value = va_arg(m_args, int);
        } else if (std::isdigit(byte(*m_next)) != 0) {
            char* end = nullptr;
            value = std::strtol(m_next, &end, 10);
            m_next = end;
        }
        return static_cast<std::size_t>(std::min(std::labs(value), static_cast<long>(INT_MAX)));
    }

    // Returns what a second "l" adds.
    std::size_t modifiers(std::size_t forLongLong) {
        std::size_t extra = 0;
        m_width = Width::plain;
        for (; *m_next != '\0' && std::strchr("hlLqjzt", *m_next) != nullptr; ++m_next) {
            if (*m_next == 'l' && m_width == Width::word) {
                m_width = Width::longWord;
                extra = forLongLong;
            } else if (*m_next == 'l' || *m_next == 'j' || *m_next == 'z' || *m_next == 't') {
                m_width = Width::word;
            } else if (*m_next == 'L' || *m_next == 'q') {
                m_width = Width::longDouble;
            }
        }
        return extra;
    }

    std::size_t argument(std::size_t width, std::size_t precision, std::size_t textLimit) {
        const std::size_t field = width + precision;
        const char kind = *m_next;
        if (kind == '\0') {
            return 0;
        }
        ++m_next;
        const auto isOneOf = [kind](const char* kinds) {
            return std::strchr(kinds, kind) != nullptr;
        };
        if (isOneOf("cC")) {
            va_arg(m_args, int);
            return 1;
        }
        if (isOneOf("sS")) {
            // A precision bounds the text, which then need not be terminated.
            const char* const text = va_arg(m_args, const char*);
            const std::size_t length = text == nullptr ? 6 : boundedLength(text, textLimit);
            return std::max({field, length, std::size_t{1}});
        }
        if (isOneOf("diouxX")) {
            skipInteger();
            return m_width == Width::longWord ? 1 : std::max<std::size_t>(field, 32);
        }
        if (isOneOf("eEfFgGaA")) {
            skipReal();
            return std::max(precision + 318, field);
        }
        if (isOneOf("pn")) {
            va_arg(m_args, void*);
            return kind == 'n' ? 0 : std::max<std::size_t>(field, 32);
        }
        return 0;
    }

    void skipInteger() {
        static_assert(sizeof(long) == sizeof(long long), "one width serves all wide integers");
        if (m_width != Width::plain) {
            va_arg(m_args, long long);
            return;
        }
        va_arg(m_args, int);
    }

    void skipReal() {
        if (m_width == Width::longDouble || m_width == Width::longWord) {
            va_arg(m_args, long double);
            return;
        }
        va_arg(m_args, double);
    }

    const char* m_next;
    va_list m_args;
    Width m_width = Width::plain;
};

}  // namespace

zemString::zemString(int value) : zemString() {
    char digits[16];
    const int n = std::snprintf(digits, sizeof digits, "%d", value);
    assign(digits, static_cast<std::size_t>(n));
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
    const std::size_t estimate = FormatSizer(fmt, args).count();
    std::size_t size = std::max(estimate + 1, m_buffer == nullptr ? 0 : m_size);
    // A fresh buffer even if the old one would do: the arguments may point into that.
    std::unique_ptr<char[]> buffer(new char[size]);
    va_list again;
    va_copy(again, args);
    const int result = std::vsnprintf(buffer.get(), size, fmt, args);
    if (result > 0 && static_cast<std::size_t>(result) >= size) {
        size = static_cast<std::size_t>(result) + 1;
        buffer.reset(new char[size]);
        std::vsnprintf(buffer.get(), size, fmt, again);
    }
    va_end(again);
    va_end(args);
    delete[] m_buffer;
    m_buffer = buffer.release();
    m_size = size;
    m_len = result < 1 ? 0 : static_cast<std::size_t>(result);
    m_buffer[m_len] = '\0';
    return result;
}

zemString::operator const char*() const { return isEmpty() ? emptyText : m_buffer; }

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
