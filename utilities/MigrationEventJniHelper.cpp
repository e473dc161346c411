#include "MigrationEventJniHelper.h"

#include <jni.h>

#include "Array.h"
#include "JniLocal.h"
#include "LetUnwind.h"

namespace {

constexpr const char* kHelper = "zemMigrationEventJniHelper";
constexpr const char* kMigrationHelper = "com/orx/kel/mvr/event/jni/MigrationEventJniHelper";

/// Those who hear of moves. Lives to the end of the process, as Java's threads do.
struct Listeners {
    zemSynchronizerContext lock;
    zemArray<pfnMigrationEventOcurrCallBack> functions;
};

Listeners& listeners() {
    static auto* const all = new Listeners;
    return *all;
}

/// Has the calling thread attached until the end of the scope, if there is a VM.
class Attached {
public:
    explicit Attached(zemJvm& jvm)
        : m_jvm(jvm), m_isOurs(!jvm.isAttached()), m_env(jvm.attachThread()) {}
    ~Attached() {
        if (m_isOurs && m_env != nullptr) {
            m_jvm.detachThread();
        }
    }
    Attached(const Attached&) = delete;
    Attached& operator=(const Attached&) = delete;

    JNIEnv* get() const { return m_env; }

private:
    zemJvm& m_jvm;
    bool m_isOurs;
    JNIEnv* m_env;
};

/// What the table has under each key, as a member of the event.
constexpr struct {
    const char* key;
    void (*read)(zemMigrationEvent&, const zemJvm&, JNIEnv*, jobject value);
} kFields[] = {
#define ZEM_FIELD_ROW(key, member, getter)                                                 \
    {                                                                                      \
        key, [](zemMigrationEvent& event, const zemJvm& jvm, JNIEnv* env, jobject value) { \
            event.member = static_cast<decltype(event.member)>(jvm.getter(env, value));    \
        }                                                                                  \
    }
    ZEM_FIELD_ROW("MIGRATION_SIDE", migrationSide, getIntObjValue),
    ZEM_FIELD_ROW("DESP_LPAR_NAME", destLparName, getStringObjValue),
    ZEM_FIELD_ROW("TOTAL_BYTES", totalBytes, getLongObjValue),
    ZEM_FIELD_ROW("BYTES_LEFT", leftBytes, getLongObjValue),
    ZEM_FIELD_ROW("BYTES_SENT", sentBytes, getLongObjValue),
    ZEM_FIELD_ROW("BYTES_RECEIVED", recvBytes, getLongObjValue),
    ZEM_FIELD_ROW("CURRENT_MIGRATION_STATE", state, getStringObjValue),
    ZEM_FIELD_ROW("MIGRATION_PORT_NUM", portNum, getIntObjValue),
#undef ZEM_FIELD_ROW
};

/// Hands the event that @p table tells of to all listeners.
/// @return whether it is one
bool consume(JNIEnv* env, jobject table) {
    const zemJvm& jvm = zemJvm::getJvm();
    if (!jvm.isInstanceOf(env, table, "java/util/Hashtable")) {
        return false;
    }
    zemMigrationEvent event;
    for (const auto& field : kFields) {
        const zemLocalRef<jobject> value(env, jvm.getValueOfHashtable(env, table, field.key));
        field.read(event, jvm, env, value.get());
    }
    const zemSynchronizer hold(listeners().lock);
    // Listeners may come and go while they are called.
    const zemArray<pfnMigrationEventOcurrCallBack> called = listeners().functions;
    for (int i = 0; i < called.size(); ++i) {
        if (listeners().functions.find(called[i]) >= 0) {
            zemQuietly([&] { called[i](event); });
        }
    }
    return true;
}

}  // namespace

zemMigrationEventJniHelper::~zemMigrationEventJniHelper() {
    if (m_migrationJniHelper != nullptr && m_jvm.getJavaVm() != nullptr) {
        const Attached attached(m_jvm);
        if (attached.get() != nullptr) {
            attached.get()->DeleteGlobalRef(m_migrationJniHelper);
        }
    }
}

int zemMigrationEventJniHelper::callJava(const char* method, const zemString& user) {
    const Attached attached(m_jvm);
    JNIEnv* const env = zemRequireVm(attached.get(), kHelper, method, m_jvm.getFailure());
    const zemJniCalls java(m_jvm, env);
    const zemLocalRef<jclass> type(env, java.classOf(kMigrationHelper));
    if (m_migrationJniHelper == nullptr) {
        const jmethodID make = java.method(type.get(), "<init>", "()V");
        const zemLocalRef<jobject> made(env, java.checked(env->NewObject(type.get(), make)));
        m_migrationJniHelper = env->NewGlobalRef(made.get());
    }
    const jmethodID call = java.method(type.get(), method, "(Ljava/lang/String;)I");
    const zemLocalRef<jstring> name(env, java.text(user));
    return java.checked(env->CallIntMethod(m_migrationJniHelper, call, name.get()));
}

int zemMigrationEventJniHelper::registerSubscription(const zemString& user,
                                                     pfnMigrationEventOcurrCallBack callback) {
    const zemSynchronizer hold(listeners().lock);
    const int result = callJava("register", user);
    listeners().functions.append(callback);
    return result;
}

int zemMigrationEventJniHelper::unregisterSubscription(const zemString& user,
                                                       pfnMigrationEventOcurrCallBack callback) {
    const zemSynchronizer hold(listeners().lock);
    if (listeners().functions.remove(callback) != 0) {
        return -1;
    }
    return callJava("deregister", user);
}

/// Called by Java for each step of a move, on the thread that delivers it. Nothing is thrown into
/// Java.
extern "C" JNIEXPORT jint JNICALL
Java_com_orx_kel_mvr_event_jni_MigrationEventJniHelper_consumeMigrationEvent(JNIEnv* env, jobject,
                                                                             jobject table) {
    bool isEvent = false;
    zemQuietly([&] { isEvent = consume(env, table); });
    return isEvent ? 0 : -1;
}
