#include "WrtEventHelperEvent.h"

#include <jni.h>

#include "JniLocal.h"

namespace {

constexpr const char* kPegasusApi = "com/orx/wrt/api/DnxPegasusApi";

}  // namespace

zemWRTEvent::zemWRTEvent(zemJvmHelper* helper, jobject& event)
    : m_jvm(helper), m_WRTEventObject(event), m_WRTEventClass(env()->GetObjectClass(event)) {
    m_jvm->checkException(env(), true);
}

zemWRTEvent::~zemWRTEvent() { env()->DeleteLocalRef(m_WRTEventClass); }

int zemWRTEvent::getEventType() const {
    const zemJniCalls java(*m_jvm, env());
    return java.checked(env()->CallIntMethod(m_WRTEventObject,
                                             java.method(m_WRTEventClass, "getEventType", "()I")));
}

zemString zemWRTEvent::getObjectType() const {
    const zemLocalRef<jobject> text(env(), object("getObjectType", "()Ljava/lang/String;"));
    return m_jvm->getStringObjValue(env(), text.get());
}

jobject zemWRTEvent::object(const char* getter, const char* signature) const {
    const zemJniCalls java(*m_jvm, env());
    return java.checked(
        env()->CallObjectMethod(m_WRTEventObject, java.method(m_WRTEventClass, getter, signature)));
}

jobject zemWRTEvent::object(const char* getter) const {
    return object(getter, "()Ljava/lang/Object;");
}

jobject zemWRTEvent::getOldObject() const { return object("getOldObject"); }
jobject zemWRTEvent::getNewObject() const { return object("getNewObject"); }

jobject zemWRTEvent::objectOf(const char* getter, const char* className) const {
    zemLocalRef<jobject> found(env(), object(getter));
    return m_jvm->isInstanceOf(env(), found.get(), className) ? found.release() : nullptr;
}

jobject zemWRTEvent::getHashObject(const char* name) const {
    return objectOf(name, "java/util/Hashtable");
}

jobject zemWRTEvent::getRClientObject(const char* name) const {
    return objectOf(name, "com/orx/wrt/rep/client/RClientObject");
}

zemString zemWRTEvent::getRClientObjectProperty(jobject object, const char* name) const {
    if (object == nullptr) {
        return {};
    }
    const zemJniCalls java(*m_jvm, env());
    const zemLocalRef<jclass> type(env(), env()->GetObjectClass(object));
    const jmethodID get =
        java.method(type.get(), "getProperty", "(Ljava/lang/String;)Ljava/lang/Object;");
    const zemLocalRef<jstring> key(env(), java.text(name));
    const zemLocalRef<jobject> value(env(),
                                     java.checked(env()->CallObjectMethod(object, get, key.get())));
    return m_jvm->getStringObjValue(env(), value.get(), true);
}

zemString zemDnxPegasusApi::getLparRefCode(const char* mtms, const char* lparId) const {
    const zemAutoDetachThread attached = m_jvm->getEnvWithThread();
    JNIEnv* const env = zemRequireVm(attached.get(), "zemDnxPegasusApi", "getLparRefCode",
                                     zemJavaVM::getJavaVM().getFailure());
    const zemJniCalls java(*m_jvm, env);
    const zemLocalRef<jclass> type(env, java.classOf(kPegasusApi));
    const jmethodID get = java.staticMethod(
        type.get(), "getLparRefCode", "(Ljava/lang/String;Ljava/lang/String;)Ljava/lang/String;");
    const zemLocalRef<jstring> host(env, java.text(mtms)), lpar(env, java.text(lparId));
    const zemLocalRef<jobject> code(
        env, java.checked(env->CallStaticObjectMethod(type.get(), get, host.get(), lpar.get())));
    return m_jvm->getStringObjValue(env, code.get());
}
