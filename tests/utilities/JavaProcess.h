/// Tests with a real Java VM and listeners to events: each case has a process of its own, for none
/// starts a second VM.
#pragma once

#include <gtest/gtest.h>
#include <jni.h>
#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <vector>

#include "../support/TestAppliance.h"
#include "OnThreads.h"
#include "Store.h"
#include "WrtEventHelper.h"

using testing_support::DemoAppliance;
using Environment = std::map<std::string, std::string>;

inline std::string jar(const std::string& name) { return ZEM_LIBRARIES "/" + name + ".jar"; }

/// The stand-in's classes and those of tests, whom JNI is checked for.
inline Environment usual() {
    return {{"CLASSPATH", jar("appliance-events") + ":" + jar("test-probe")},
            {"JAVA_TOOL_OPTIONS", "-Xcheck:jni"}};
}

/// Runs @p body in a process whose environment has @p changes over the usual one, and holds what it
/// does against the rules of JNI.
/// @param printed  among what it must have printed
inline void inProcess(const std::function<void()>& body, Environment changes = {},
                      const std::string& printed = "") {
    changes.merge(usual());
    const auto run = [&] {
        for (const auto& [name, value] : changes) {
            setenv(name.c_str(), value.c_str(), 1);
        }
        testing::internal::CaptureStdout();
        body();
        const std::string out = testing::internal::GetCapturedStdout();
        EXPECT_NE(out.find(printed), std::string::npos) << out;
        for (const char* complaint : {"in native method", "JNI local refs", "FATAL"}) {
            EXPECT_EQ(out.find(complaint), std::string::npos) << out;
        }
        // The other process shows what comes on standard error alone.
        const testing::TestResult& result =
            *testing::UnitTest::GetInstance()->current_test_info()->result();
        for (int i = 0; i < result.total_part_count(); ++i) {
            const testing::TestPartResult& part = result.GetTestPartResult(i);
            fprintf(stderr, "%s:%d: %s\n", part.file_name(), part.line_number(), part.message());
        }
        _exit(testing::Test::HasFailure() ? 1 : 0);
    };
    EXPECT_EXIT(run(), testing::ExitedWithCode(0), "");
}

/// The thread of a test in Java, with what it calls there.
class InJava {
public:
    InJava() : m_env(m_helper.getEnvWithThread()) {}

    JNIEnv* env() const { return m_env.get(); }
    zemJvmHelper& helper() { return m_helper; }
    jstring text(const char* text) { return m_helper.NewJString(env(), text); }

    /// Calls a static method of the class Probe.
    template <class Value, class... Arguments>
    Value probe(Value (JNIEnv::*function)(jclass, jmethodID, ...), const char* name,
                const char* signature, Arguments... arguments) {
        const jclass type = env()->FindClass("com/orx/kel/mvr/event/jni/Probe");
        m_helper.checkException(env(), true);
        const jmethodID method = env()->GetStaticMethodID(type, name, signature);
        m_helper.checkException(env(), true);
        const Value value = (env()->*function)(type, method, arguments...);
        m_helper.checkException(env(), true);
        env()->DeleteLocalRef(type);
        return value;
    }
    jobject probe(const char* name, const char* signature) {
        return probe(&JNIEnv::CallStaticObjectMethod, name, signature);
    }

private:
    zemJvmHelper m_helper;
    zemAutoDetachThread m_env;
};

/// A line of the journal: a name or a state was changed.
inline std::string changed(const std::string& kind, const std::string& place,
                           const std::string& attribute, const std::string& before,
                           const std::string& after) {
    return R"({"tool":"x","time":1,"objects":[{"event":"modify","kind":")" + kind + R"(",)" +
           place + R"(,"number":0,"old":{")" + attribute + R"(":")" + before + R"("},"new":{")" +
           attribute + R"(":")" + after + R"("}}]})";
}

inline void appendToJournal(const std::vector<std::string>& lines) {
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    appliance::Transaction change = store.write();
    for (const std::string& line : lines) {
        store.append(line);
    }
    change.commit();
}

inline std::mutex g_linesLock;
inline std::vector<std::string> g_lines;  ///< what listeners wrote down

inline void hear(const std::string& line) {
    const std::lock_guard<std::mutex> hold(g_linesLock);
    g_lines.push_back(line);
}

/// What was heard since the last call, once there are so many lines or ten seconds are over.
inline std::vector<std::string> heard(std::size_t count) {
    within(std::chrono::seconds(10), [count] {
        const std::lock_guard<std::mutex> hold(g_linesLock);
        return g_lines.size() >= count;
    });
    const std::lock_guard<std::mutex> hold(g_linesLock);
    return std::exchange(g_lines, {});
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
