/// zemDynamicArray: an array of pointers that owns what they point to, unless told otherwise.
///
/// Lists of providers, hosts, records and texts are kept and handed over in it. Ownership is a
/// flag of the object: copying or assigning an owning array makes the copy the owner, and the
/// source, although const, keeps readable pointers that it no longer deletes. So an array can be
/// returned by value without copying its elements.
///
/// Thread-safety: none; callers lock.
///
///     zemDynamicArray<zemString> names;
///     names.addElement(std::make_unique<zemString>("a"));
///     for (int i = 0; i < names.size(); ++i) puts(*names.getElementAt(i));
#ifndef DYNAMIC_ARRAY_H
#define DYNAMIC_ARRAY_H

#include <algorithm>
#include <climits>
#include <cstddef>
#include <memory>
#include <new>

#include "ZemExport.h"

template <class T>
class ZEM_EXPORT zemDynamicArray {
public:
    /// An empty, owning array whose capacity will grow by @p grow entries at a time (8 if < 1).
    explicit zemDynamicArray(int grow = 25) : zemDynamicArray(0, grow, 1) {}

    /// An empty array with room for @p max entries; @p ownData non-zero: it deletes its elements.
    zemDynamicArray(int max, int grow, int ownData)
        : m_array(max > 0 ? newEntries(max) : nullptr),
          m_max(std::max(max, 0)),
          m_grow(grow),
          m_count(0),
          m_ownData(ownData) {}

    /// Takes the elements over: the copy owns them if @p source did, and @p source no longer does.
    zemDynamicArray(const zemDynamicArray& source) : zemDynamicArray(0, 0, 0) { take(source); }

    /// Clears this array, then takes over as the copy constructor does.
    zemDynamicArray& operator=(const zemDynamicArray& source) {
        if (this != &source) {
            clear();
            take(source);
        }
        return *this;
    }

    ~zemDynamicArray() { clear(); }

    /// Appends @p element, which belongs to the array from here on if that owns. Returns 0.
    /// @throws std::bad_alloc no room; the element is still the caller's
    int addElement(T* element) {
        if (m_count >= m_max) {
            reserve(m_max, growStep());
        }
        m_array[m_count++] = element;
        return 0;
    }

    /// The same for an array that owns; without room for it, the element is deleted.
    int addElement(std::unique_ptr<T> element) {
        const int result = addElement(element.get());
        static_cast<void>(element.release());
        return result;
    }

    /// Stores @p element at @p index; an element already there is deleted if owned. An index
    /// past the end extends the array with nulls. Returns 0, or 1 for a negative index.
    int setElementAt(int index, T* element) {
        if (index < 0) {
            return 1;
        }
        extendTo(index);
        if (m_array[index] != element) {
            drop(index);
        }
        m_array[index] = element;
        return 0;
    }

    /// The element at @p index, still owned by the array; null outside the array.
    T* getElementAt(int index) const { return contains(index) ? m_array[index] : nullptr; }

    T* operator[](int index) const { return getElementAt(index); }

    /// The entry at @p index for reading or storing; the array is extended with nulls to hold
    /// it. A negative index yields an entry of no array, null at each call.
    T*& operator[](int index) {
        if (index < 0) {
            static thread_local T* nowhere;
            nowhere = nullptr;
            return nowhere;
        }
        extendTo(index);
        return m_array[index];
    }

    /// Removes the entry, deleting its element if owned; later ones move down, and a capacity
    /// far above the count is given back. Returns 0, or 1 for an index outside the array.
    int removeElementAt(int index) {
        if (!contains(index)) {
            return 1;
        }
        drop(index);
        std::copy(m_array + index + 1, m_array + m_count, m_array + index);
        m_array[m_count - 1] = nullptr;
        const int grow = growStep();
        const int count = m_count--;
        if (m_max - count > 2LL * grow) {
            resize(count + grow);
        }
        return 0;
    }

    /// Index of the first entry that is @p element or equals what it points to; -1 if none.
    int findElement(const T* element) const {
        for (int i = 0; i < m_count; ++i) {
            if (m_array[i] == element ||
                (m_array[i] != nullptr && element != nullptr && *m_array[i] == *element)) {
                return i;
            }
        }
        return -1;
    }

    /// Deletes the elements if owned and gives all room back. Returns 0.
    int clear() {
        // The youngest first: memory given back in the order in which it was taken would go back
        // to the system, and would have to be fetched again page by page for the next big result.
        for (int i = m_count; i-- > 0;) {
            drop(i);
        }
        delete[] m_array;
        m_array = nullptr;
        m_max = 0;
        m_count = 0;
        return 0;
    }

    int size() const { return m_count; }

    /// Makes the array @p count entries long: surplus elements are deleted if owned, new entries
    /// are null. Returns 0, or 1 for a negative count.
    int setSize(int count) {
        if (count < 0) {
            return 1;
        }
        if (count > m_count) {
            extendTo(count - 1);
        }
        while (m_count > count) {
            --m_count;
            drop(m_count);
            m_array[m_count] = nullptr;
        }
        return 0;
    }

    /// From here on the array does not delete its elements.
    void relinquishOwnership() { m_ownData = 0; }

    /// From here on the array deletes its elements.
    void reSetOwership() { m_ownData = 1; }

private:
    // The allocation behind m_max entries is rounded up to a power of two, so that an array that
    // grows far in small steps is not copied at every step.
    static std::size_t entriesFor(int max) {
        std::size_t entries = 8;
        while (entries < static_cast<std::size_t>(max)) {
            entries *= 2;
        }
        return entries;
    }

    static T** newEntries(int max) { return new T*[entriesFor(max)](); }

    bool contains(int index) const { return index >= 0 && index < m_count; }

    int growStep() {
        if (m_grow < 1) {
            m_grow = 8;
        }
        return m_grow;
    }

    void drop(int index) {
        if (m_ownData != 0) {
            delete m_array[index];
        }
    }

    void reserve(int base, int grow) {
        if (base > INT_MAX - grow) {
            throw std::bad_alloc();
        }
        resize(base + grow);
    }

    // Entries at and past m_count are null at all times.
    void resize(int max) {
        if (m_array == nullptr || entriesFor(max) != entriesFor(m_max)) {
            T** entries = newEntries(max);
            std::copy(m_array, m_array + m_count, entries);
            delete[] m_array;
            m_array = entries;
        }
        m_max = max;
    }

    void extendTo(int index) {
        if (index >= m_max) {
            reserve(index, growStep());
        }
        m_count = std::max(m_count, index + 1);
    }

    void take(const zemDynamicArray& source) {
        if (source.m_array != nullptr) {
            m_array = newEntries(source.m_max);
            std::copy(source.m_array, source.m_array + source.m_count, m_array);
        }
        m_max = source.m_max;
        m_grow = source.m_grow;
        m_count = source.m_count;
        m_ownData = source.m_ownData;
        if (m_ownData != 0) {
            source.m_ownData = 0;
        }
    }

    T** m_array;
    int m_max;
    int m_grow;
    int m_count;
    mutable int m_ownData;
};

#endif
