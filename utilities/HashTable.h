/// zemHashTable: a chained hash table with unique keys; its hash functions; and the chains that
/// it shares with zemMultiHashTable.
///
/// The number of chains is fixed at construction; there is no rehashing. The array of chain heads
/// is made at the first insert, with room for about one entry a chain. Tables copy deeply; pointers
/// stored as values stay the caller's.
/// Operations report by return codes, except [] and getElement(), which throw the integer 3 for
/// an absent key.
///
/// Thread-safety: none; callers lock.
///
///     zemHashTable<int, zemString, hashFunc> record(4);
///     record.insert(7, "seven");
///     zemString value;
///     if (record.lookup(7, value) == 0) puts(value);
#ifndef HASH_TABLE_H
#define HASH_TABLE_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <functional>
#include <memory>
#include <new>
#include <type_traits>
#include <utility>
#include <vector>

#include "StringUtils.h"
#include "ZemExport.h"

/// Hash functions: each reduces a key to the index of its chain among @p count chains.
ZEM_EXPORT inline unsigned hashFunc(const int& key, unsigned count) {
    const auto value = static_cast<unsigned>(key);
    return value < count ? value : value % count;  // a record's keys seldom need the division
}

ZEM_EXPORT inline unsigned cecHashFunc(const zemString& key, unsigned count) {
    return static_cast<unsigned>(key.getHashKey()) % count;
}

ZEM_EXPORT inline unsigned lparHashFunc(const zemString& key, unsigned count) {
    return cecHashFunc(key, count);
}

ZEM_EXPORT inline unsigned assoHashFunc(const zemString& key, unsigned count) {
    return cecHashFunc(key, count);
}

/// Sums the text as 32-bit words in the machine's byte order; a partial last word does not count.
ZEM_EXPORT inline unsigned objectCacheHashFunc(const zemString& key, unsigned count) {
    const char* const text = key;
    const std::size_t words = key.isEmpty() ? 0 : key.length() / sizeof(std::uint32_t);
    std::uint32_t sum = 0;
    for (std::size_t i = 0; i < words; ++i) {
        std::uint32_t word = 0;
        std::memcpy(&word, text + i * sizeof word, sizeof word);
        sum += word;
    }
    return sum % count;
}

template <class K, class V>
struct ZEM_EXPORT DnxBucketElement {
    K m_key;
    V m_value;
};

template <class K, class V>
struct ZEM_EXPORT DnxBucket {
    DnxBucket* m_next;
    unsigned m_hash;
    DnxBucketElement<K, V> m_element;
};

/// The chains of a hash table and what does not depend on whether keys are unique. Newer entries
/// stand before older ones of the same chain.
template <class K, class V, unsigned (*HashFn)(const K&, unsigned)>
class ZEM_EXPORT zemBucketTable {
public:
    /// Return codes; absent is also the integer that [] and getElement() throw.
    static constexpr int done = 0;
    static constexpr int noHeads = 1;
    static constexpr int duplicate = 2;
    static constexpr int absent = 3;

    /// Copies the (newest) value of @p key. Returns 0, or 3 with @p value as it was.
    int lookup(const K& key, V& value) const {
        const Bucket* const bucket = find(key);
        if (bucket == nullptr) {
            return absent;
        }
        value = bucket->m_element.m_value;
        return done;
    }

    /// Removes every entry of @p key. Returns 0, or 3 if there is none.
    int remove(const K& key) {
        if (m_bucketArray == nullptr) {
            return absent;
        }
        int result = absent;
        const K wanted(key);  // the caller's may stand in an entry that goes
        const unsigned hash = HashFn(wanted, m_bucketLen);
        for (Bucket** link = &m_bucketArray[hash]; *link != nullptr;) {
            Bucket* const bucket = *link;
            if (holds(bucket, hash, wanted)) {
                *link = bucket->m_next;
                dispose(bucket);
                result = done;
            } else {
                link = &bucket->m_next;
            }
        }
        return result;
    }

    /// Removes all entries; the array of heads stays.
    void clear() {
        if (m_bucketArray == nullptr) {
            return;
        }
        for (unsigned i = 0; i < m_bucketLen; ++i) {
            while (Bucket* const bucket = m_bucketArray[i]) {
                m_bucketArray[i] = bucket->m_next;
                dispose(bucket);
            }
        }
        unused() = blockBegin();
    }

protected:
    using Bucket = DnxBucket<K, V>;

    explicit zemBucketTable(unsigned n) : m_bucketLen(n == 0 ? 8 : n), m_bucketArray(nullptr) {}

    zemBucketTable(const zemBucketTable& source) : zemBucketTable(source.m_bucketLen) {
        copyChains(source);
    }

    /// Leaves @p source empty, with its number of chains.
    zemBucketTable(zemBucketTable&& source) noexcept
        : m_bucketLen(source.m_bucketLen), m_bucketArray(source.m_bucketArray) {
        source.m_bucketArray = nullptr;
    }

    zemBucketTable& operator=(const zemBucketTable& source) {
        if (this != &source) {
            clear();
            if (m_bucketLen != source.m_bucketLen) {
                releaseHeads();
                m_bucketLen = source.m_bucketLen;
            }
            copyChains(source);
        }
        return *this;
    }

    zemBucketTable& operator=(zemBucketTable&& source) noexcept {
        std::swap(m_bucketLen, source.m_bucketLen);
        std::swap(m_bucketArray, source.m_bucketArray);
        return *this;
    }

    ~zemBucketTable() {
        clear();
        releaseHeads();
    }

    bool hasHeads() const { return m_bucketArray != nullptr; }

    static bool holds(const Bucket* bucket, unsigned hash, const K& key) {
        return bucket->m_hash == hash && bucket->m_element.m_key == key;
    }

    /// The newest entry of @p key, or null.
    Bucket* find(const K& key) const {
        if (m_bucketArray == nullptr) {
            return nullptr;
        }
        const unsigned hash = HashFn(key, m_bucketLen);
        return findFrom(m_bucketArray[hash], hash, key);
    }

    /// The next older entry of the same key, or null.
    Bucket* findNext(const Bucket* bucket) const {
        return findFrom(bucket->m_next, bucket->m_hash, bucket->m_element.m_key);
    }

    /// Puts a new entry at the head of its chain. Returns 0; 1 if there can be no chains; 2 if
    /// the key has to be @p unique and is there already.
    template <class Value>
    int add(const K& key, Value&& value, bool unique) {
        if (m_bucketLen == 0) {
            return noHeads;
        }
        makeHeads();
        const unsigned hash = HashFn(key, m_bucketLen);
        Bucket*& head = m_bucketArray[hash];
        if (unique && findFrom(head, hash, key) != nullptr) {
            return duplicate;
        }
        head = make(head, hash, key, std::forward<Value>(value));
        return done;
    }

private:
    static Bucket* findFrom(Bucket* bucket, unsigned hash, const K& key) {
        while (bucket != nullptr && !holds(bucket, hash, key)) {
            bucket = bucket->m_next;
        }
        return bucket;
    }

    // The heads and the first entries share one piece of memory, because queries make records by
    // the hundred thousand, each with one entry a chain: heads, the next unused entry, the block
    // of entries. What the block has no room for is made singly; an entry removed from the block
    // leaves its place unused until clear().
    struct alignas(Bucket) Slot {
        unsigned char m_bytes[sizeof(Bucket)];
    };

    static constexpr unsigned blockLimit = 64;  // few tables with more chains fill them

    std::size_t headSlots() const {
        return ((std::size_t{m_bucketLen} + 1) * sizeof(Bucket*) + sizeof(Slot) - 1) / sizeof(Slot);
    }

    std::size_t blockSlots() const { return std::min(m_bucketLen, blockLimit); }

    Bucket*& unused() { return m_bucketArray[m_bucketLen]; }

    Bucket* blockBegin() const {
        return reinterpret_cast<Bucket*>(reinterpret_cast<Slot*>(m_bucketArray) + headSlots());
    }

    Bucket* blockEnd() const { return blockBegin() + blockSlots(); }

    bool isInBlock(const Bucket* bucket) const {
        const std::less<const Bucket*> before;
        return !before(bucket, blockBegin()) && before(bucket, blockEnd());
    }

    void makeHeads() {
        if (m_bucketArray == nullptr) {
            m_bucketArray = reinterpret_cast<Bucket**>(new Slot[headSlots() + blockSlots()]);
            std::uninitialized_fill_n(m_bucketArray, m_bucketLen, nullptr);
            new (&unused()) Bucket*(blockBegin());
        }
    }

    void releaseHeads() {
        delete[] reinterpret_cast<Slot*>(m_bucketArray);
        m_bucketArray = nullptr;
    }

    template <class Value>
    Bucket* make(Bucket* next, unsigned hash, const K& key, Value&& value) {
        if (unused() == blockEnd()) {
            return new Bucket{next, hash, {key, std::forward<Value>(value)}};
        }
        Bucket* const bucket = new (unused()) Bucket{next, hash, {key, std::forward<Value>(value)}};
        ++unused();
        return bucket;
    }

    void dispose(Bucket* bucket) {
        if (isInBlock(bucket)) {
            bucket->~Bucket();
        } else {
            delete bucket;
        }
    }

    void copyChains(const zemBucketTable& source) {
        if (source.m_bucketArray == nullptr) {
            return;
        }
        makeHeads();
        for (unsigned i = 0; i < m_bucketLen; ++i) {
            Bucket** link = &m_bucketArray[i];
            for (const Bucket* from = source.m_bucketArray[i]; from != nullptr;
                 from = from->m_next) {
                *link = make(nullptr, from->m_hash, from->m_element.m_key, from->m_element.m_value);
                link = &(*link)->m_next;
            }
        }
    }

    unsigned m_bucketLen;
    Bucket** m_bucketArray;
};

template <class K, class V, unsigned (*HashFn)(const K&, unsigned)>
class ZEM_EXPORT zemHashTable : public zemBucketTable<K, V, HashFn> {
    using Base = zemBucketTable<K, V, HashFn>;

public:
    /// A table of @p n chains, 8 if that is 0.
    explicit zemHashTable(unsigned n = 0) : Base(n) {}

    /// Adds an entry. Returns 0; 2 if the key is there already, which changes nothing; 1 if the
    /// table has no chains.
    int insert(const K& key, const V& value) { return insertNew(key, value); }
    int insert(const K& key, V&& value) { return insertNew(key, std::move(value)); }

    /// Gives each of @p keys that the table lacks an entry with a default value. It takes no room
    /// until it is written to, because many tables share the keys and most entries stay as they
    /// are. A second call replaces the first one's keys.
    void insertBlanks(std::shared_ptr<const std::vector<K>> keys) { m_blanks = std::move(keys); }

    int lookup(const K& key, V& value) const {
        const V* const found = valueOf(key);
        if (found == nullptr) {
            return Base::absent;
        }
        value = *found;
        return Base::done;
    }

    int remove(const K& key) {
        const bool wasBlank = isBlank(key);
        if (wasBlank) {
            auto others = std::make_shared<std::vector<K>>(*m_blanks);
            others->erase(std::remove(others->begin(), others->end(), key), others->end());
            m_blanks = std::move(others);
        }
        const int result = Base::remove(key);
        return wasBlank ? Base::done : result;
    }

    void clear() {
        m_blanks.reset();
        Base::clear();
    }

    /// The value of @p key, owned by the table.
    /// @throws int 3 if the key is absent
    V& operator[](const K& key) {
        auto* bucket = this->find(key);
        if (bucket == nullptr) {
            static_cast<void>(std::as_const(*this)[key]);  // throws unless there is a blank
            if constexpr (std::is_default_constructible_v<V>) {
                this->add(key, V(), true);
            }
            bucket = this->find(key);
        }
        return bucket->m_element.m_value;
    }
    const V& operator[](const K& key) const {
        const V* const found = valueOf(key);
        if (found == nullptr) {
            throw int{Base::absent};
        }
        return *found;
    }

    /// The same, copied.
    V getElement(const K& key) const { return (*this)[key]; }

private:
    template <class Value>
    int insertNew(const K& key, Value&& value) {
        return isBlank(key) ? Base::duplicate : this->add(key, std::forward<Value>(value), true);
    }

    bool isBlank(const K& key) const {
        return m_blanks != nullptr &&
               std::find(m_blanks->begin(), m_blanks->end(), key) != m_blanks->end();
    }

    /// The value of @p key, or null.
    const V* valueOf(const K& key) const {
        if (const auto* const bucket = this->find(key)) {
            return &bucket->m_element.m_value;
        }
        if constexpr (std::is_default_constructible_v<V>) {
            static const V blank{};
            return isBlank(key) ? &blank : nullptr;
        }
        return nullptr;
    }

    std::shared_ptr<const std::vector<K>> m_blanks;
};

#endif
