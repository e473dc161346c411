#include "JvmServices.h"

#include <string>
#include <vector>

#include "JniLocal.h"

namespace {

constexpr char32_t kReplacement = 0xFFFD;
constexpr char32_t kFirstAbove = 0x10000;  ///< the first character that takes two units of UTF-16

bool isSurrogate(char32_t c) { return c >= 0xD800 && c < 0xE000; }

/// The character of UTF-8 at @p text, which goes behind it.
char32_t nextOf(const char*& text) {
    constexpr char32_t kLeast[] = {0, 0x80, 0x800, kFirstAbove};
    const auto lead = static_cast<unsigned char>(*text++);
    if (lead < 0x80) {
        return lead;
    }
    const int more = lead >= 0xF8 || lead < 0xC0 ? 0 : lead >= 0xF0 ? 3 : lead >= 0xE0 ? 2 : 1;
    if (more == 0) {
        return kReplacement;
    }
    char32_t c = lead & (0x3FU >> more);
    for (int i = 0; i < more; ++i) {
        if ((static_cast<unsigned char>(*text) & 0xC0U) != 0x80) {
            return kReplacement;
        }
        c = c << 6U | (static_cast<unsigned char>(*text++) & 0x3FU);
    }
    return c < kLeast[more] || c > 0x10FFFF || isSurrogate(c) ? kReplacement : c;
}

std::vector<jchar> utf16Of(const char* text) {
    std::vector<jchar> units;
    while (*text != '\0') {
        const char32_t c = nextOf(text);
        if (c >= kFirstAbove) {
            units.push_back(static_cast<jchar>(0xD7C0 + (c >> 10U)));
        }
        units.push_back(static_cast<jchar>(c >= kFirstAbove ? 0xDC00 + (c & 0x3FFU) : c));
    }
    return units;
}

void append(std::string& text, char32_t c) {
    const int more = c < 0x80 ? 0 : c < 0x800 ? 1 : c < kFirstAbove ? 2 : 3;
    constexpr unsigned kLead[] = {0, 0xC0, 0xE0, 0xF0};
    text += static_cast<char>(kLead[more] | c >> (6U * static_cast<unsigned>(more)));
    for (int i = more - 1; i >= 0; --i) {
        text += static_cast<char>(0x80U | (c >> (6U * static_cast<unsigned>(i)) & 0x3FU));
    }
}

std::string utf8Of(const std::vector<jchar>& units) {
    std::string text;
    for (std::size_t i = 0; i < units.size(); ++i) {
        char32_t c = units[i];
        if (isSurrogate(c)) {
            const bool isPair = c < 0xDC00 && i + 1 < units.size() && units[i + 1] >= 0xDC00 &&
                                isSurrogate(units[i + 1]);
            c = isPair ? kFirstAbove + ((c & 0x3FFU) << 10U) + (units[++i] & 0x3FFU) : kReplacement;
        }
        append(text, c);
    }
    return text;
}

zemString textOf(JNIEnv* env, jstring string) {
    std::vector<jchar> units(static_cast<std::size_t>(env->GetStringLength(string)));
    env->GetStringRegion(string, 0, static_cast<jsize>(units.size()), units.data());
    return zemString(utf8Of(units).c_str());
}

/// What toString() of an exception says, whatever that itself may throw.
zemString wordsOf(JNIEnv* env, jobject thrown) {
    const zemLocalRef<jclass> type(env, env->GetObjectClass(thrown));
    const jmethodID method = env->GetMethodID(type.get(), "toString", "()Ljava/lang/String;");
    zemLocalRef<jobject> words(
        env, env->ExceptionCheck() != JNI_FALSE ? nullptr : env->CallObjectMethod(thrown, method));
    if (env->ExceptionCheck() != JNI_FALSE) {
        env->ExceptionClear();
        return {};
    }
    return words.get() == nullptr ? zemString() : textOf(env, static_cast<jstring>(words.get()));
}

}  // namespace

bool zemJvmServices::checkException(JNIEnv* env, bool throwException) const {
    if (env->ExceptionCheck() == JNI_FALSE) {
        return false;
    }
    const zemLocalRef<jthrowable> thrown(env, env->ExceptionOccurred());
    env->ExceptionDescribe();
    env->ExceptionClear();
    if (throwException) {
        throw zemOperationFailedException(
            m_className, "checkException", "CIM_ERR",
            zemString("Java caused an exception: ") + wordsOf(env, thrown.get()));
    }
    return true;
}

jstring zemJvmServices::NewJString(JNIEnv* env, const char* text) const {
    if (text == nullptr) {
        return nullptr;
    }
    const std::vector<jchar> units = utf16Of(text);
    static constexpr jchar kNone = 0;
    return zemJniCalls(*this, env)
        .checked(env->NewString(units.empty() ? &kNone : units.data(),
                                static_cast<jsize>(units.size())));
}

jobjectArray zemJvmServices::NewJStringArray(JNIEnv* env, const char* const* texts,
                                             int count) const {
    const zemJniCalls java(*this, env);
    const zemLocalRef<jclass> type(env, java.classOf("java/lang/String"));
    zemLocalRef<jobjectArray> array(env,
                                    java.checked(env->NewObjectArray(count, type.get(), nullptr)));
    for (int i = 0; i < count; ++i) {
        const zemLocalRef<jstring> text(env, java.text(texts[i]));
        env->SetObjectArrayElement(array.get(), i, text.get());
        checkException(env, true);
    }
    return array.release();
}

bool zemJvmServices::isInstanceOf(JNIEnv* env, jobject object, const char* className) const {
    if (object == nullptr) {
        return false;
    }
    const zemLocalRef<jclass> type(env, zemJniCalls(*this, env).classOf(className));
    return env->IsInstanceOf(object, type.get()) != JNI_FALSE;
}

jobject zemJvmServices::getValueOfHashtable(JNIEnv* env, jobject table, const char* key) const {
    constexpr const char* kTable = "java/util/Hashtable";
    if (!isInstanceOf(env, table, kTable)) {
        return nullptr;
    }
    const zemJniCalls java(*this, env);
    const zemLocalRef<jclass> type(env, java.classOf(kTable));
    const jmethodID get = java.method(type.get(), "get", "(Ljava/lang/Object;)Ljava/lang/Object;");
    const zemLocalRef<jstring> text(env, java.text(key));
    return text.get() == nullptr ? nullptr
                                 : java.checked(env->CallObjectMethod(table, get, text.get()));
}

int zemJvmServices::getIntObjValue(JNIEnv* env, jobject object) const {
    return !isInstanceOf(env, object, "java/lang/Number")
               ? 0
               : zemJniCalls(*this, env).call(object, "intValue", "()I", &JNIEnv::CallIntMethod);
}

std::int64_t zemJvmServices::getLongObjValue(JNIEnv* env, jobject object) const {
    return !isInstanceOf(env, object, "java/lang/Number")
               ? 0
               : zemJniCalls(*this, env).call(object, "longValue", "()J", &JNIEnv::CallLongMethod);
}

bool zemJvmServices::getBooleanObjValue(JNIEnv* env, jobject object) const {
    return isInstanceOf(env, object, "java/lang/Boolean") &&
           zemJniCalls(*this, env)
                   .call(object, "booleanValue", "()Z", &JNIEnv::CallBooleanMethod) != JNI_FALSE;
}

zemString zemJvmServices::getStringObjValue(JNIEnv* env, jobject object, bool anyObject) const {
    if (isInstanceOf(env, object, "java/lang/String")) {
        return textOf(env, static_cast<jstring>(object));
    }
    if (!anyObject || object == nullptr) {
        return {};
    }
    const zemLocalRef<jobject> text(
        env, zemJniCalls(*this, env)
                 .call(object, "toString", "()Ljava/lang/String;", &JNIEnv::CallObjectMethod));
    return text.get() == nullptr ? zemString() : textOf(env, static_cast<jstring>(text.get()));
}
