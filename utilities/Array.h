/// zemArray: a small array of values, such as slot numbers, class names or callbacks.
///
/// The array owns its values; copies are deep. Element types need a default constructor and
/// assignment; remove() and find() need ==. Return codes are those of zemDynamicArray: 0 done,
/// 1 no such element.
///
/// Thread-safety: none; callers lock.
#ifndef ARRAY_H
#define ARRAY_H

#include <algorithm>
#include <climits>
#include <cstddef>
#include <memory>
#include <new>
#include <utility>

#include "ZemExport.h"

template <class T>
class ZEM_EXPORT zemArray {
public:
    /// An empty array whose capacity grows by @p grow entries at a time (8 if < 1).
    explicit zemArray(int grow = 16) : zemArray(0, grow) {}

    /// An empty array with room for @p max values.
    zemArray(int max, int grow)
        : m_array(max > 0 ? newEntries(max).release() : nullptr),
          m_count(0),
          m_countOverride(0),
          m_max(std::max(max, 0)),
          m_grow(grow) {}

    zemArray(const zemArray& source) : zemArray(0, 0) { *this = source; }

    zemArray& operator=(const zemArray& source) {
        if (this != &source) {
            std::unique_ptr<T[]> entries;
            if (source.m_max > 0) {
                entries = newEntries(source.m_max);
                std::copy(source.m_array, source.m_array + source.m_count, entries.get());
            }
            delete[] m_array;
            m_array = entries.release();
            m_count = source.m_count;
            m_countOverride = source.m_countOverride;
            m_max = source.m_max;
            m_grow = source.m_grow;
        }
        return *this;
    }

    ~zemArray() { delete[] m_array; }

    /// Appends a copy of @p value, which may be an element of this array. Returns 0.
    int append(const T& value) {
        if (m_count < m_max) {
            m_array[m_count] = value;
        } else {
            T copy(value);
            reserve(m_max);
            m_array[m_count] = std::move(copy);
        }
        ++m_count;
        return 0;
    }

    /// Removes the first element equal to @p value. Returns 0, or 1 if there is none.
    int remove(T& value) { return removeAt(find(value)); }

    /// Removes the element at @p index; later ones move down. Returns 0, or 1 out of range.
    int removeAt(int index) {
        if (!contains(index)) {
            return 1;
        }
        std::move(m_array + index + 1, m_array + m_count, m_array + index);
        m_array[--m_count] = T();
        return 0;
    }

    /// Index of the first element equal to @p value; -1 if there is none.
    int find(T value) const {
        const T* const end = m_array + m_count;
        const T* const hit = std::find(static_cast<const T*>(m_array), end, value);
        return hit == end ? -1 : static_cast<int>(hit - m_array);
    }

    /// Drops all elements and gives their room back. Returns 0.
    int clear() {
        delete[] m_array;
        m_array = nullptr;
        m_count = 0;
        m_countOverride = 0;
        m_max = 0;
        return 0;
    }

    int size() const { return m_count; }

    /// Makes the array @p count elements long; new ones are default values. Returns 0, or 1 for
    /// a negative count.
    int setSize(int count) {
        if (count < 0) {
            return 1;
        }
        if (count > 0) {
            extendTo(count - 1);
        }
        while (m_count > count) {
            m_array[--m_count] = T();
        }
        m_countOverride = count;
        return 0;
    }

    /// The element at @p index, or a default value out of range.
    const T& operator[](int index) const {
        static const T none{};
        return contains(index) ? m_array[index] : none;
    }

    /// The element at @p index; the array is extended with default values to hold it. A negative
    /// index yields an element of no array, a default value at each call.
    T& operator[](int index) {
        if (index < 0) {
            static thread_local T nowhere;
            nowhere = T();
            return nowhere;
        }
        extendTo(index);
        return m_array[index];
    }

private:
    static std::unique_ptr<T[]> newEntries(int max) {
        return std::make_unique<T[]>(static_cast<std::size_t>(max));
    }

    bool contains(int index) const { return index >= 0 && index < m_count; }

    // Makes room for base + growth step values.
    void reserve(int base) {
        if (m_grow < 1) {
            m_grow = 8;
        }
        if (base > INT_MAX - m_grow) {
            throw std::bad_alloc();
        }
        std::unique_ptr<T[]> entries = newEntries(base + m_grow);
        std::move(m_array, m_array + m_count, entries.get());
        delete[] m_array;
        m_array = entries.release();
        m_max = base + m_grow;
    }

    void extendTo(int index) {
        if (index >= m_max) {
            reserve(index);
        }
        m_count = std::max(m_count, index + 1);
    }

    T* m_array;
    int m_count;
    int m_countOverride;  // length last asked for by setSize(), 0 if never
    int m_max;
    int m_grow;
};

#endif
