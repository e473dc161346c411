/// The one Java VM that a process can have, in parts that its users hold; private to the library.
///
/// The first part starts the VM, the last one ends it. A VM that the server started itself is used
/// as it is and never ended. Any thread may call.
#ifndef ZEM_JVM_LIBRARY_H
#define ZEM_JVM_LIBRARY_H

#include <jni.h>

#include <string>
#include <vector>

constexpr jint kZemJniVersion = JNI_VERSION_1_2;

struct zemVmPart {
    JavaVM* vm = nullptr;
    JNIEnv* env = nullptr;  ///< of the calling thread, where it started the VM
    int result = JNI_ERR;   ///< of the invocation interface; what is not JNI_OK is no part
    std::string failure;    ///< why there is none
};

/// Takes a part in the VM; @p options are for the one that starts it.
zemVmPart zemTakeVm(const std::vector<std::string>& options);

/// Gives a part back.
/// @return whether it was the last one and the VM has ended; that takes until no other thread is
///         attached
bool zemLeaveVm();

/// The words for a result of the invocation interface.
const char* zemVmResultText(int result);

#endif
