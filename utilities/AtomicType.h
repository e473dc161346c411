/// zemAtomicType: a number under its own lock, for counters of references and identifiers.
///
/// Thread-safety: every operation holds the object's lock; two operations in a row do not.
#ifndef ATOMIC_TYPE_H
#define ATOMIC_TYPE_H

#include "Synchronizer.h"
#include "ZemExport.h"

template <class T>
class ZEM_EXPORT zemAtomicType {
public:
    zemAtomicType() : m_value() {}
    zemAtomicType(T value) : m_value(value) {}
    zemAtomicType(const zemAtomicType& source) : m_value(source) {}

    /// Locks the two objects one after the other, never both.
    zemAtomicType& operator=(const zemAtomicType& source) {
        const T value = source;
        zemSynchronizer hold(m_mtx);
        m_value = value;
        return *this;
    }

    operator T() const {
        zemSynchronizer hold(m_mtx);
        return m_value;
    }

    /// All return the new value, the postfix forms the old one.
    T operator++() {
        zemSynchronizer hold(m_mtx);
        return ++m_value;
    }
    T operator++(int) {
        zemSynchronizer hold(m_mtx);
        return m_value++;
    }
    T operator--() {
        zemSynchronizer hold(m_mtx);
        return --m_value;
    }
    T operator--(int) {
        zemSynchronizer hold(m_mtx);
        return m_value--;
    }
    T operator+=(T amount) {
        zemSynchronizer hold(m_mtx);
        return m_value += amount;
    }
    T operator-=(T amount) {
        zemSynchronizer hold(m_mtx);
        return m_value -= amount;
    }

private:
    mutable zemSynchronizerContext m_mtx;
    T m_value;
};

#endif
