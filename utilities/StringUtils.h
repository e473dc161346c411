/// zemString, the string of the whole system, and zemStringPairs, an ordered list of string pairs.
///
/// A zemString owns a NUL-terminated byte buffer. Text is single bytes: no locale, no Unicode, no
/// sharing between objects. A string without a buffer ("invalid") and one with an empty text
/// behave the same to callers. No operation throws anything but std::bad_alloc.
///
/// Thread-safety: none; an object belongs to one thread at a time.
///
///     zemString line;
///     line.format("%s*%s", typeModel, serialNumber);
///     int star = line.find('*');
///     puts(line.extractSubstring(static_cast<unsigned>(star) + 1));
#ifndef STRING_UTILS_H
#define STRING_UTILS_H

#include <cstddef>

#include "DynamicArray.h"
#include "ZemExport.h"

class ZEM_EXPORT zemString {
public:
    /// The invalid string: empty, without a buffer.
    zemString() : m_buffer(nullptr), m_size(0), m_len(0) {}

    /// The decimal text of @p value.
    zemString(int value);

    /// A copy of @p text. Null gives the invalid string; "" gives an empty one with a buffer.
    zemString(const char* text);

    /// At most @p n bytes of @p text (none if null), in a buffer with room for n.
    zemString(const char* text, unsigned n);

    /// Exactly @p n bytes: the beginning of @p text (none if null), filled up with @p pad.
    zemString(const char* text, unsigned n, char pad);
    zemString(const zemString& text, unsigned n, char pad);

    /// A copy of an empty source is invalid.
    zemString(const zemString& source);

    /// Leaves @p source invalid.
    zemString(zemString&& source) noexcept
        : m_buffer(source.m_buffer), m_size(source.m_size), m_len(source.m_len) {
        source.m_buffer = nullptr;
        source.m_size = source.m_len = 0;
    }

    ~zemString() { delete[] m_buffer; }

    /// Replaces the text; the buffer is reused if it suffices. Null makes the string invalid;
    /// the text may be part of this string.
    zemString& operator=(const char* text);

    /// Replaces the text; an empty source makes this string invalid.
    zemString& operator=(const zemString& source);
    zemString& operator=(zemString&& source) noexcept;

    /// Appends; null and empty texts change nothing. The buffer grows to the exact length, so
    /// build long texts of many pieces elsewhere.
    zemString& operator+=(const char* text);
    zemString& operator+=(const zemString& text);

    /// Appends one byte, with some room for more.
    zemString& operator+=(char c);

    /// Releases the buffer. length() keeps its value, although isEmpty() is now true: meant for
    /// strings about to be assigned or destroyed.
    void clear();

    /// Replaces the contents with the printf expansion and returns its length. The arguments may
    /// include this string. A result below 1 (empty text, or a failed conversion) empties it.
    int format(const char* fmt, ...) __attribute__((format(printf, 2, 3)));

    /// The text, never null: every empty string gives the address of one empty literal.
    operator const char*() const;

    std::size_t length() const { return m_len; }
    bool isEmpty() const { return m_len == 0 || m_buffer == nullptr; }
    bool isInvalid() const { return m_buffer == nullptr; }

    /// Whether there is at least one byte and all are "0" to "9".
    bool isDigit() const;

    /// Whether the text begins with @p prefix; a null or empty prefix always fits.
    bool startsWith(const char* prefix) const;

    /// Number of occurrences of @p c.
    int count(char c) const;
    int statChar(char c) const { return count(c); }

    /// Sum of the bytes as signed values. Callers reduce it to a bucket index themselves.
    int getHashKey() const;

    /// Equality byte by byte; a null text equals null, or an empty string.
    static bool equals(const char* a, const char* b);
    static bool equals(const zemString& a, const char* b);
    static bool equals(const zemString& a, const zemString& b);

    /// The same with upper and lower case alike.
    static bool equalsIgnoreCase(const char* a, const char* b);
    static bool equalsIgnoreCase(const zemString& a, const char* b);
    static bool equalsIgnoreCase(const zemString& a, const zemString& b);

    /// First index of @p c at or after @p start; -1 if none.
    int find(char c, unsigned start = 0) const;

    /// First index of the text @p s in the whole string: @p start is accepted and not looked at,
    /// and callers rely on hits before it. -1 if none, or if @p s is null or empty.
    int find(const char* s, unsigned start = 0) const;
    int find(const zemString& s, unsigned start = 0) const;

    /// Last index of @p c at or before @p start; -1 if none.
    int reverseFind(char c, unsigned start = ~0U) const;

    /// The bytes from @p start up to, not including, @p end, which is limited to the length. An
    /// empty range gives an invalid string.
    zemString extractSubstring(unsigned start) const;
    zemString extractSubstring(unsigned start, unsigned end) const;

    /// Case mapping in place; with @p ascii zero the bytes are EBCDIC.
    zemString& upperCase(int ascii);
    zemString& lowerCase(int ascii);

    /// Removes all leading or trailing bytes @p c in place; trailing NUL bytes go as well.
    zemString& stripLeading(char c);
    zemString& stripTrailing(char c);

    /// Extends the text with @p pad to @p n bytes; longer texts stay as they are.
    zemString& padString(unsigned n, char pad);

    /// Turns every @p a into @p b in place, up to the first NUL.
    zemString& replaceChar(char a, char b);

    /// EBCDIC to ASCII and back in place, byte by byte through the tables below.
    zemString& EtoA();
    zemString& AtoE();
    static void EtoA(char* buf, unsigned n);
    static void AtoE(char* buf, unsigned n);

    /// The operations above on a copy of @p text.
    static zemString upperCase(const zemString& text, int ascii);
    static zemString lowerCase(const zemString& text, int ascii);
    static zemString stripLeading(const zemString& text, char c);
    static zemString stripTrailing(const zemString& text, char c);
    static zemString replaceChar(const zemString& text, char a, char b);
    static zemString EtoA(const zemString& text);
    static zemString AtoE(const zemString& text);

    /// EBCDIC byte to console byte, and ASCII byte to EBCDIC byte. They are not each other's
    /// inverse at every entry.
    static const unsigned char EtoAchars[256];
    static const unsigned char AtoEchars[256];

protected:
    static bool equals(const char* a, const char* b, unsigned lengthA, unsigned lengthB);
    static bool equalsIgnoreCase(const char* a, const char* b, unsigned lengthA, unsigned lengthB);

private:
    unsigned textLength() const { return isEmpty() ? 0 : static_cast<unsigned>(m_len); }
    void release();
    void assign(const char* text, std::size_t n);
    void append(const char* text, std::size_t n, std::size_t newSize);
    std::size_t fill(const char* text, std::size_t n, char pad);
    void mapCase(int (*mapping)(int), int ascii);

    char* m_buffer;
    std::size_t m_size;
    std::size_t m_len;
};

/// Strings are equal if length and bytes are; a null text equals an empty string only.
ZEM_EXPORT bool operator==(const zemString& a, const zemString& b);
ZEM_EXPORT bool operator==(const zemString& a, const char* b);
ZEM_EXPORT bool operator!=(const zemString& a, const zemString& b);
ZEM_EXPORT bool operator!=(const zemString& a, const char* b);

ZEM_EXPORT zemString operator+(const zemString& a, const zemString& b);
ZEM_EXPORT zemString operator+(const char* a, const zemString& b);

/// An ordered list of (key, value) pairs. Keys may repeat; look-ups give the first pair that
/// fits, comparing exact case. The object owns copies of all texts.
class ZEM_EXPORT zemStringPairs {
public:
    zemStringPairs();
    zemStringPairs(const zemString& key, const zemString& value);
    zemStringPairs(const zemStringPairs& source);
    ~zemStringPairs();

    /// Adds the pairs of @p source to those already here. Callers assign to fresh objects.
    zemStringPairs& operator=(const zemStringPairs& source);

    int size() const { return m_count; }

    /// Appends a pair, whether or not the key is there already.
    void addPair(const zemString& key, const zemString& value);

    /// Removes the pair and returns its value; "" if there is no such pair.
    zemString removePair(int index);
    zemString removePair(const zemString& key);

    void removeAll();

    /// Copies of all keys or values, in order, owned by the array.
    zemDynamicArray<zemString> getFirstElements() const;
    zemDynamicArray<zemString> getSecondElements() const;

    /// Copies the pair at @p index and returns the index; for a bad one both outputs are "" and
    /// the result is -1.
    int getPair(int index, zemString& key, zemString& value) const;

    /// The value of the first pair with @p key, the key of the first with @p value, or "".
    zemString getValue(const zemString& key) const;
    zemString getKey(const zemString& value) const;

    /// Index of the first pair with @p key; -1 if none.
    int getIndex(const zemString& key) const;

private:
    void addAll(const zemStringPairs& source);
    int indexIn(const zemString* texts, const zemString& text) const;
    zemDynamicArray<zemString> copyOf(const zemString* texts) const;

    int m_count;
    int m_max;
    zemString* m_firstArray;
    zemString* m_secondArray;
};

#endif
