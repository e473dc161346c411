/// Counts by name: how many subscriptions each class has.
///
/// Thread-safety: none; callers lock.
#ifndef WRT_EVENT_HELPER_COUNTERS_H
#define WRT_EVENT_HELPER_COUNTERS_H

#include <map>
#include <string>

#include "ZemExport.h"

class ZEM_EXPORT zemCountersForString {
public:
    /// Counts @p key once more, from 1; returns its count.
    int addCounter(const char* key);
    /// 0 for an unknown key.
    int getCounter(const char* key) const;
    /// Takes @p n from the count of @p key, which goes at 0 or below. Returns what is left, or -1
    /// for an unknown key.
    int subtractCounter(const char* key, int n);

    void clear() { m_counter.clear(); }
    int size() const { return static_cast<int>(m_counter.size()); }

private:
    std::map<std::string, int> m_counter;
};

/// The counts of subscriptions by class name that the process began with.
class ZEM_EXPORT ORXWRT_Counter {
public:
    /// A copy of the one object of the process, which counts nothing itself.
    static zemCountersForString getCounter();
};

#endif
