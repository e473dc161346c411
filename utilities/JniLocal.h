/// What every call into Java needs: references that end with their scope, threads that are
/// detached, methods by name; private to the library.
///
/// All throw what zemJvmServices::checkException() throws, with no exception pending behind them.
#ifndef ZEM_JNI_LOCAL_H
#define ZEM_JNI_LOCAL_H

#include <jni.h>

#include "Exception.h"
#include "JvmServices.h"

/// A local reference, deleted at the end of the scope.
template <class Ref = jobject>
class zemLocalRef {
public:
    zemLocalRef(JNIEnv* env, Ref ref) : m_env(env), m_ref(ref) {}
    ~zemLocalRef() {
        if (m_ref != nullptr) {
            m_env->DeleteLocalRef(m_ref);
        }
    }
    zemLocalRef(const zemLocalRef&) = delete;
    zemLocalRef& operator=(const zemLocalRef&) = delete;

    Ref get() const { return m_ref; }
    Ref release() {
        Ref ref = m_ref;
        m_ref = nullptr;
        return ref;
    }

private:
    JNIEnv* m_env;
    Ref m_ref;
};

/// The services with the environment of one thread.
class zemJniCalls {
public:
    zemJniCalls(const zemJvmServices& services, JNIEnv* env) : m_services(services), m_env(env) {}

    JNIEnv* env() const { return m_env; }

    /// Passes @p value on, if no exception came with it.
    template <class Value>
    Value checked(Value value) const {
        m_services.checkException(m_env, true);
        return value;
    }

    // What these return belongs to the caller.

    jclass classOf(const char* name) const { return checked(m_env->FindClass(name)); }
    jstring text(const char* text) const { return m_services.NewJString(m_env, text); }

    jmethodID method(jclass type, const char* name, const char* signature) const {
        return checked(m_env->GetMethodID(type, name, signature));
    }
    jmethodID staticMethod(jclass type, const char* name, const char* signature) const {
        return checked(m_env->GetStaticMethodID(type, name, signature));
    }

    /// Calls a method without arguments of an object that is not null.
    template <class Value>
    Value call(jobject object, const char* name, const char* signature,
               Value (JNIEnv::*function)(jobject, jmethodID, ...)) const {
        const zemLocalRef<jclass> type(m_env, m_env->GetObjectClass(object));
        return checked((m_env->*function)(object, method(type.get(), name, signature)));
    }

private:
    const zemJvmServices& m_services;
    JNIEnv* m_env;
};

/// Passes @p env on.
/// @throws zemOperationFailedException there is none, for the reason @p failure
inline JNIEnv* zemRequireVm(JNIEnv* env, const char* className, const char* method,
                            const zemString& failure) {
    if (env == nullptr) {
        throw zemOperationFailedException(className, method, "CIM_ERR",
                                          zemString("No Java VM: ") + failure);
    }
    return env;
}

#endif
