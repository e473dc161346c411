/// zemMultiHashTable: a chained hash table in which a key may have many values.
///
/// As zemHashTable (see there for chains, copying and return codes), except that insert() never
/// refuses a key and reading gives the set of all values of a key. remove() drops them all.
///
/// Thread-safety: none; callers lock.
#ifndef MULTI_HASH_TABLE_H
#define MULTI_HASH_TABLE_H

#include <set>

#include "HashTable.h"

template <class K, class V, unsigned (*HashFn)(const K&, unsigned)>
class ZEM_EXPORT zemMultiHashTable : public zemBucketTable<K, V, HashFn> {
    using Base = zemBucketTable<K, V, HashFn>;

public:
    /// A table of @p n chains, 8 if that is 0.
    explicit zemMultiHashTable(unsigned n = 0) : Base(n) {}

    /// Adds one more value for @p key. Returns 0, or 1 if the table has no chains.
    int insert(const K& key, const V& value) { return this->add(key, value, false); }

    /// All values of @p key; the empty set if it is absent.
    std::set<V> getElement(const K& key) const {
        std::set<V> values;
        for (const auto* b = this->find(key); b != nullptr; b = this->findNext(b)) {
            values.insert(b->m_element.m_value);
        }
        return values;
    }

    std::set<V> operator[](const K& key) { return getElement(key); }

    /// @throws int 3 if nothing has ever been inserted
    std::set<V> operator[](const K& key) const {
        if (!this->hasHeads()) {
            throw int{Base::absent};
        }
        return getElement(key);
    }
};

#endif
