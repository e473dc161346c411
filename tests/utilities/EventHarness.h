/// Listeners to events of an appliance, for tests in a process of their own.
#pragma once

#include <unistd.h>

#include <atomic>
#include <functional>
#include <mutex>
#include <vector>

#include "../support/TestAppliance.h"
#include "JavaProcess.h"
#include "WrtEventHelper.h"

inline std::mutex g_linesLock;
inline std::vector<std::string> g_lines;  ///< what listeners wrote down

inline void hear(const std::string& line) {
    const std::lock_guard<std::mutex> hold(g_linesLock);
    g_lines.push_back(line);
}

/// What was heard since the last call, once there are so many lines or ten seconds are over.
inline std::vector<std::string> heard(std::size_t count) {
    for (int i = 0;; ++i) {
        {
            const std::lock_guard<std::mutex> hold(g_linesLock);
            if (g_lines.size() >= count || i == 1000) {
                return std::exchange(g_lines, {});
            }
        }
        usleep(10000);
    }
}

/// Counts its calls, and does with each event what it was made for.
class Listener : public zemWrtEventCallBack {
public:
    explicit Listener(std::function<void(const zemWRTEvent&)> body = [](const zemWRTEvent&) {})
        : m_body(std::move(body)) {}
    zemEventData* eventOccured(const zemWRTEvent& event) override {
        ++calls;
        m_body(event);
        return isDull ? nullptr : new zemEventData;
    }
    std::atomic<int> calls{0};
    bool isDull = false;  ///< makes no data

private:
    const std::function<void(const zemWRTEvent&)> m_body;
};

/// Subscribes, and holds the VM.
class Subscriber {
public:
    int add(int type, const char* object, zemWrtEventCallBack& callBack) {
        return m_manager.registerSubscription(helper(), "user", type, object, &callBack);
    }
    int remove(int type, const char* object, zemWrtEventCallBack& callBack, bool all = false) {
        return m_manager.unregisterSubscription(helper(), "user", type, object, &callBack, all);
    }
    zemJvmHelper* helper() { return m_java.getJvmHelper(); }

private:
    zemWrtEventManager& m_manager = zemWrtEventManager::getWrtEventManager();
    zemJvmHelperRef m_java;
};

class DemoAppliance : public testing_support::TestAppliance {
public:
    DemoAppliance() : TestAppliance(ZEM_PROGRAMS) { EXPECT_EQ(run("appliance init").exit, 0); }
};
