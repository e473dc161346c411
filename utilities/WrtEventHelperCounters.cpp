#include "WrtEventHelperCounters.h"

int zemCountersForString::addCounter(const char* key) { return ++m_counter[key]; }

int zemCountersForString::getCounter(const char* key) const {
    const auto row = m_counter.find(key);
    return row == m_counter.end() ? 0 : row->second;
}

int zemCountersForString::subtractCounter(const char* key, int n) {
    const auto row = m_counter.find(key);
    if (row == m_counter.end()) {
        return -1;
    }
    row->second -= n;
    const int left = row->second;
    if (left <= 0) {
        m_counter.erase(row);
    }
    return left;
}

zemCountersForString ORXWRT_Counter::getCounter() {
    static const auto* const counter = new zemCountersForString;
    return *counter;
}
