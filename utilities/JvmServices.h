/// What C++ asks of Java objects again and again: texts, numbers, values of hash tables.
///
/// Each takes the environment of the calling thread. Objects that are returned are local
/// references: they hold until the native method that was called from Java returns, or until the
/// thread is detached, and belong to the caller. Texts are UTF-8 on this side; bytes that are none,
/// and halves of surrogate pairs, are replaced.
///
/// What has no answer reads as 0, false, an empty text or null: a null object, one of another
/// class, a key that is not there. A Java exception on the way leaves as checkException() says.
///
/// Thread-safety: nothing is held between calls.
#ifndef JVM_SERVICES_H
#define JVM_SERVICES_H

#include <cstdint>

#include "JniTypes.h"
#include "StringUtils.h"
#include "ZemExport.h"

class ZEM_EXPORT zemJvmServices {
public:
    /// A Java string; null for a null text.
    jstring NewJString(JNIEnv* env, const char* text) const;
    /// An array of @p count Java strings.
    jobjectArray NewJStringArray(JNIEnv* env, const char* const* texts, int count) const;

    /// What the java.util.Hashtable @p table has under the text @p key.
    jobject getValueOfHashtable(JNIEnv* env, jobject table, const char* key) const;

    /// The values of a java.lang.Number, cut to size as Java does, and of a java.lang.Boolean.
    int getIntObjValue(JNIEnv* env, jobject object) const;
    std::int64_t getLongObjValue(JNIEnv* env, jobject object) const;
    bool getBooleanObjValue(JNIEnv* env, jobject object) const;

    /// The text of a java.lang.String; with @p anyObject that of any object, as its toString()
    /// tells it.
    zemString getStringObjValue(JNIEnv* env, jobject object, bool anyObject = false) const;

    /// Whether @p object, which is not null, is of the class @p className, such as
    /// "java/util/Hashtable", or of one derived from it.
    bool isInstanceOf(JNIEnv* env, jobject object, const char* className) const;

    /// Describes a pending Java exception on standard error and clears it.
    /// @return whether there was one
    /// @throws zemOperationFailedException when there was one and @p throwException asks for it; id
    ///         "CIM_ERR", text "Java caused an exception: " and what the exception says
    bool checkException(JNIEnv* env, bool throwException = true) const;

protected:
    /// @param name  what failures name as the class that throws
    explicit zemJvmServices(const char* name) : m_className(name) {}
    ~zemJvmServices() = default;

private:
    const char* m_className;
};

#endif
