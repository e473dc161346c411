/// Threads that end in the middle of an operation; private to the library.
///
/// A server may cancel the thread that an operation runs on. The C library then unwinds its stack
/// in the way of an exception that has no object and must not be swallowed: a handler of all
/// exceptions that keeps it ends the whole process. So all go through zemQuietly(), or begin with
/// zemLetUnwind():
///
///     } catch (...) {
///         zemLetUnwind();
///         return false;
///     }
///
/// Where the unwinding cannot pass, zemUncancelled keeps a thread from being cancelled.
#ifndef ZEM_LET_UNWIND_H
#define ZEM_LET_UNWIND_H

#include <pthread.h>

#include <exception>

/// Passes on the unwinding of a thread, which alone is no current exception. A handler of its type
/// would do the same, but binds a reference to no object, which is undefined.
inline void zemLetUnwind() {
    if (std::current_exception() == nullptr) {
        throw;
    }
}

/// Keeps this thread from being cancelled while the object lives; a request that comes meanwhile is
/// served behind it. Destructors need it, for they must not throw.
class zemUncancelled {
public:
    explicit zemUncancelled(bool wanted = true) : m_wanted(wanted) {
        if (m_wanted) {
            pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &m_before);
        }
    }
    ~zemUncancelled() {
        if (m_wanted) {
            pthread_setcancelstate(m_before, nullptr);
        }
    }
    zemUncancelled(const zemUncancelled&) = delete;
    zemUncancelled& operator=(const zemUncancelled&) = delete;

private:
    const bool m_wanted;
    int m_before = PTHREAD_CANCEL_ENABLE;
};

/// Runs @p work, whose failure must not become that of its caller.
/// @return false when it threw
template <class Work>
bool zemQuietly(Work work) {
    // While one exception is being handled, the unwinding of a thread cannot be caught at all.
    const zemUncancelled uncancelled(std::current_exception() != nullptr);
    try {
        work();
        return true;
    } catch (...) {
        zemLetUnwind();
        return false;
    }
}

#endif
