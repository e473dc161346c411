/// A result of the management library for a test, and an appliance to read it from.
#ifndef API_ANSWER_H
#define API_ANSWER_H

#include <gtest/gtest.h>

#include <string>

#include "ToolRecords.h"
#include "libapi.h"

using OfAll = apiProp* (*)(const char*, int);
using OfKey = apiProp* (*)(const char*, const char*, int);

/// Owns a result.
class Answer {
public:
    explicit Answer(apiProp* result) : m_result(result) {}
    ~Answer() { freeApi(m_result); }
    Answer(const Answer&) = delete;
    Answer& operator=(const Answer&) = delete;

    int code() const { return getReturnCode(m_result); }
    bool isNull() const { return m_result == nullptr; }
    int size() const { return m_result == nullptr ? 0 : m_result->objCount - 1; }
    /// The first object has the index 0.
    apiProp* record(int index) const { return m_result + 1 + index; }
    std::string value(int index, const std::string& key) const {
        const char* text = getProperty(record(index), key.c_str());
        return text == nullptr ? "absent: " + key : text;
    }

private:
    apiProp* m_result;
};

using ApiTest = DemoTest;

#endif
