#include "WrtEventHelper.h"

#include <jni.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <exception>
#include <vector>

#include "Exception.h"
#include "JniLocal.h"
#include "LetUnwind.h"
#include "Log.h"
#include "TraceTool.h"

namespace {

constexpr const char* kManager = "zemWrtEventManager";
constexpr const char* kJavaHelper = "com/orx/kel/mvr/event/jni/WRTEventHelper";
constexpr const char* kConsume = "WRTEventHelper_consumeWRTEvent";
constexpr const char* kNoObject = "null";
constexpr jint kMostReferences = 32;  ///< of one callback, before the VM makes more room

CTimeLoger& timing() { return *CTimeLogerManager::getInstance()->getLogger(kConsume); }

/// A line of the timing trace.
void note(const char* method, const zemString& text, const char* level = "INFO") {
    timing().log(level, method, text);
}

/// Addresses stand in the trace as numbers, which tell one from another.
int numberOf(const void* address) {
    return static_cast<int>(reinterpret_cast<std::intptr_t>(address));
}

/// What events are known under whose object type is Java's null, which is invalid here, or empty.
zemString typeOrNull(const zemString& objectType) {
    const char* what = objectType.isInvalid() ? "object type is invalid, set it to null"
                       : objectType.isEmpty() ? "object type is empty, set it to null"
                                              : nullptr;
    note("eventOccured", what == nullptr ? "Normal object type" : what);
    return what == nullptr ? objectType : zemString(kNoObject);
}

/// The references that a callback leaves behind, and a Java exception, end with this.
class CallFrame {
public:
    explicit CallFrame(const zemJvmHelper& helper)
        : m_helper(helper), m_isPushed(helper.getEnv()->PushLocalFrame(kMostReferences) == 0) {}
    // NOLINTNEXTLINE(bugprone-exception-escape): is asked to throw nothing
    ~CallFrame() {
        m_helper.checkException(m_helper.getEnv(), false);
        if (m_isPushed) {
            m_helper.getEnv()->PopLocalFrame(nullptr);
        }
    }
    CallFrame(const CallFrame&) = delete;
    CallFrame& operator=(const CallFrame&) = delete;

private:
    const zemJvmHelper& m_helper;
    bool m_isPushed;
};

}  // namespace

zemEventData::~zemEventData() = default;

zemWrtEventCallBack::~zemWrtEventCallBack() = default;

int zemWrtEventCallBack::operator()(const zemWRTEvent& event) {
    const std::unique_ptr<zemEventData> data(eventOccured(event));
    if (!data) {
        return -1;
    }
    if (m_deliverFunc != nullptr) {
        m_deliverFunc(data.get());
    }
    return 0;
}

// -- the callbacks of one key -------------------------------------------------------------------

zemWrtEventHandler::zemWrtEventHandler(int eventType, const zemString& objectType)
    : m_eventType(eventType), m_objectType(objectType) {
    createKey(m_key, sizeof m_key, eventType, objectType);
}

void zemWrtEventHandler::createKey(char* dst, std::size_t size, int eventType,
                                   const zemString& objectType) {
    snprintf(dst, size - 1, "%d-%s", eventType, static_cast<const char*>(objectType));
    dst[size - 1] = '\0';
}

zemString zemWrtEventHandler::getzemStringKey(int eventType, const zemString& objectType) {
    char key[kKeySize];
    createKey(key, sizeof key, eventType, objectType);
    return zemString(key);
}

int zemWrtEventHandler::registerCallBack(zemWrtEventCallBack* callBack) {
    return ++m_WrtEventCallBack[callBack];
}

int zemWrtEventHandler::unregisterCallBack(zemWrtEventCallBack* callBack) {
    const auto row = m_WrtEventCallBack.find(callBack);
    if (row == m_WrtEventCallBack.end() || row->second < 1) {
        return -1;
    }
    const int left = --row->second;
    if (left == 0) {
        m_WrtEventCallBack.erase(row);
    }
    return left;
}

// -- subscriptions ------------------------------------------------------------------------------

// Lives to the end of the process: Java's threads do not end before.
zemWrtEventManager& zemWrtEventManager::getWrtEventManager() {
    static auto* const manager = new zemWrtEventManager;
    return *manager;
}

zemString zemWrtEventManager::getKey(int eventType, const zemString& objType) {
    return zemWrtEventHandler::getzemStringKey(eventType, objType);
}

int zemWrtEventManager::registerSubscription(zemJvmHelper* helper, const zemString& user,
                                             int eventType, const zemString& objType,
                                             zemWrtEventCallBack* callBack) {
    const zemSynchronizer hold(m_regMutex);
    noteSubscription("registerSubscription", user, eventType, objType, callBack);
    callJava(helper, "register", user, eventType, objType);
    return registerEvent(eventType, objType, callBack);
}

int zemWrtEventManager::unregisterSubscription(zemJvmHelper* helper, const zemString& user,
                                               int eventType, const zemString& objType,
                                               zemWrtEventCallBack* callBack, bool all) {
    int left = 0;
    {
        const zemSynchronizer hold(m_regMutex);
        noteSubscription("unregisterSubscription", user, eventType, objType, callBack);
        callJava(helper, all ? "deregisterALL" : "deregister", user, eventType, objType);
        left = unregisterEvent(eventType, objType, callBack);
    }
    if (left == 0) {
        awaitCalls(callBack);
    }
    return left;
}

void zemWrtEventManager::noteSubscription(const char* method, const zemString& user, int eventType,
                                          const zemString& objType,
                                          const zemWrtEventCallBack* callBack) {
    zemString text;
    text.format("user:%s,eventtype:%d,obj type:%s, callback:%d,", static_cast<const char*>(user),
                eventType, static_cast<const char*>(objType), numberOf(callBack));
    note(method, text);
}

void zemWrtEventManager::callJava(zemJvmHelper* helper, const char* method, const zemString& user,
                                  int eventType, const zemString& objType) {
    const zemAutoDetachThread attached = helper->getEnvWithThread();
    JNIEnv* const env =
        zemRequireVm(attached.get(), kManager, method, zemJavaVM::getJavaVM().getFailure());
    const zemJniCalls java(*helper, env);
    const zemLocalRef<jclass> type(env, java.classOf(kJavaHelper));
    const jmethodID make = java.staticMethod(type.get(), "getWRTEventHelper",
                                             "()Lcom/orx/kel/mvr/event/jni/WRTEventHelper;");
    note(method, zemString("Construct ") + kJavaHelper);
    const zemLocalRef<jobject> made(env,
                                    java.checked(env->CallStaticObjectMethod(type.get(), make)));
    if (made.get() == nullptr) {
        throw zemOperationFailedException(kManager, method, "CIM_ERR",
                                          "Java has no helper for events");
    }
    const jmethodID call =
        java.method(type.get(), method, "(Ljava/lang/String;ILjava/lang/String;)I");
    note(method, zemString("call ") + kJavaHelper + "." + method);
    const zemLocalRef<jstring> userText(env, java.text(user)), typeText(env, java.text(objType));
    java.checked(env->CallIntMethod(made.get(), call, userText.get(), eventType, typeText.get()));
}

int zemWrtEventManager::registerEvent(int eventType, const zemString& objType,
                                      zemWrtEventCallBack* callBack) {
    const zemString key = getKey(eventType, objType);
    int count = 0;
    {
        const std::lock_guard<std::mutex> hold(m_tableMutex);
        auto& handler = m_WrtEventContainer[static_cast<const char*>(key)];
        if (!handler) {
            handler = std::make_unique<zemWrtEventHandler>(eventType, objType);
        }
        count = handler->registerCallBack(callBack);
    }
    zemLog::LogPlain("registerEvent key is :[" + key + "]");
    return count;
}

int zemWrtEventManager::unregisterEvent(int eventType, const zemString& objType,
                                        zemWrtEventCallBack* callBack) {
    const std::lock_guard<std::mutex> hold(m_tableMutex);
    const auto row = m_WrtEventContainer.find(static_cast<const char*>(getKey(eventType, objType)));
    if (row == m_WrtEventContainer.end()) {
        return -1;
    }
    const int left = row->second->unregisterCallBack(callBack);
    if (row->second->getCallBacks().empty()) {
        m_WrtEventContainer.erase(row);
    }
    return left;
}

// -- events -------------------------------------------------------------------------------------

/// A call of a callback that is under way, unless it is registered no more.
class zemWrtEventManager::CallUnderWay {
public:
    CallUnderWay(zemWrtEventManager& manager, const zemString& key, zemWrtEventCallBack* callBack)
        : m_manager(manager) {
        const std::lock_guard<std::mutex> hold(manager.m_tableMutex);
        const auto row = manager.m_WrtEventContainer.find(static_cast<const char*>(key));
        m_isRegistered = row != manager.m_WrtEventContainer.end() &&
                         row->second->getCallBacks().count(callBack) != 0;
        if (m_isRegistered) {
            m_call = manager.m_calls.emplace(std::this_thread::get_id(), callBack);
        }
    }
    ~CallUnderWay() {
        if (m_isRegistered) {
            const std::lock_guard<std::mutex> hold(m_manager.m_tableMutex);
            m_manager.m_calls.erase(m_call);
            m_manager.m_callEnded.notify_all();
        }
    }
    CallUnderWay(const CallUnderWay&) = delete;
    CallUnderWay& operator=(const CallUnderWay&) = delete;

    explicit operator bool() const { return m_isRegistered; }

private:
    zemWrtEventManager& m_manager;
    bool m_isRegistered;
    Calls::iterator m_call;
};

void zemWrtEventManager::awaitCalls(const zemWrtEventCallBack* callBack) {
    std::unique_lock<std::mutex> hold(m_tableMutex);
    if (m_calls.count(std::this_thread::get_id()) != 0) {
        return;
    }
    m_callEnded.wait(hold, [&] {
        return std::none_of(m_calls.begin(), m_calls.end(),
                            [&](const auto& call) { return call.second == callBack; });
    });
}

int zemWrtEventManager::eventOccured(const zemWRTEvent& event) {
    const char* const method = "eventOccured";
    const zemString objectType = typeOrNull(event.getObjectType());
    const int eventType = event.getEventType();
    const zemString key = getKey(eventType, objectType);
    zemLog::LogPlain("FINAL key is :[" + key + "]");
    zemString text;
    text.format("zemWrtEventManager:: event type=%d, object type=%s, key=%s\n", eventType,
                static_cast<const char*>(objectType), static_cast<const char*>(key));
    note(method, text);

    std::vector<zemWrtEventCallBack*> callBacks;
    {
        const std::lock_guard<std::mutex> hold(m_tableMutex);
        const auto row = m_WrtEventContainer.find(static_cast<const char*>(key));
        if (row == m_WrtEventContainer.end()) {
            note(method, "zemWrtEventManager:: handler is not found for key: " + key + " \n");
            return 0;
        }
        if (!row->second) {
            note(method, "zemWrtEventManager:: handler for " + key + " is NULL \n");
            return -1;
        }
        for (const auto& entry : row->second->getCallBacks()) {
            callBacks.push_back(entry.first);
        }
    }
    std::exception_ptr failure;
    for (zemWrtEventCallBack* callBack : callBacks) {
        text.format("zemWrtEventManager:: callback:%d \n", numberOf(callBack));
        note(method, text);
        const CallUnderWay call(*this, key, callBack);
        if (callBack == nullptr || !call) {
            continue;
        }
        const CallFrame frame(*event.getJvmHelper());
        try {
            (*callBack)(event);
        } catch (...) {
            zemLetUnwind();
            failure = failure ? failure : std::current_exception();
        }
    }
    if (failure) {
        std::rethrow_exception(failure);
    }
    return 0;
}

/// Called by Java for each event, on the thread that delivers it. Nothing is thrown into Java.
extern "C" JNIEXPORT jint JNICALL
Java_com_orx_kel_mvr_event_jni_WRTEventHelper_consumeWRTEvent(JNIEnv* env, jobject, jobject event) {
    const char* const method = "consumeWRTEvent";
    int result = -1;
    timing().begin(method);
    try {
        if (event != nullptr) {
            zemJvmHelper helper(env);
            const zemWRTEvent view(&helper, event);
            zemString text;
            text.format("Event occured, type:%d, object:%s", view.getEventType(),
                        static_cast<const char*>(view.getObjectType()));
            note(method, text);
            result = zemWrtEventManager::getWrtEventManager().eventOccured(view);
        }
    } catch (const zemException& failure) {
        note(method, failure.toString(), "ERROR");
    } catch (const std::exception& failure) {
        note(method, failure.what(), "ERROR");
    } catch (...) {
        zemLetUnwind();
        note(method, "Unknow error", "ERROR");
    }
    timing().end(method);
    return result;
}
