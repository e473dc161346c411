/// The types of the Java Native Interface, named and no more, as <jni.h> declares them: whoever
/// builds on the library needs no Java for that, and may include <jni.h> beside this.
#ifndef JNI_TYPES_H
#define JNI_TYPES_H

struct JNIEnv_;
struct JavaVM_;
class _jobject;
class _jclass;
class _jstring;
class _jobjectArray;

using JNIEnv = JNIEnv_;
using JavaVM = JavaVM_;
using jobject = _jobject*;
using jclass = _jclass*;
using jstring = _jstring*;
using jobjectArray = _jobjectArray*;

#endif
