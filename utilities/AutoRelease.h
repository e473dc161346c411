/// zemAutoRelease: owns one pointer and hands it to a Deleter object at the end of its scope.
///
/// For results of the management library, attachments to the Java VM and the like, which plain
/// delete does not release. The deleter is never called on null.
///
/// Thread-safety: none.
#ifndef AUTO_RELEASE_H
#define AUTO_RELEASE_H

#include "ZemExport.h"

template <class T, class Deleter>
class ZEM_EXPORT zemAutoRelease {
public:
    /// Owns @p pointer from here on.
    explicit zemAutoRelease(T* pointer = nullptr) : _Ptr(pointer) {}
    ~zemAutoRelease() { reset(nullptr); }
    zemAutoRelease(const zemAutoRelease&) = delete;
    zemAutoRelease& operator=(const zemAutoRelease&) = delete;

    /// Owns @p pointer from here on; the pointer held before is released if it is another one.
    void reset(T* pointer) {
        T* const old = _Ptr;
        _Ptr = pointer;
        if (old != nullptr && old != pointer) {
            Deleter()(old);
        }
    }

    /// Gives the pointer up to the caller, unreleased.
    T* release() {
        T* const pointer = _Ptr;
        _Ptr = nullptr;
        return pointer;
    }

    /// The pointer, still owned here; null when none is held.
    T* get() const { return _Ptr; }

private:
    T* _Ptr;
};

#endif
