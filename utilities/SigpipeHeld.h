/// Writing to a reader that may be gone; private to the library.
///
/// A server need not know that a library in it writes to pipes, and is ended by SIGPIPE if it has
/// not made provision. While the object lives, a write of this thread to a pipe or socket without a
/// reader fails with EPIPE and no more; the server's own handling of the signal stays as it is.
#ifndef ZEM_SIGPIPE_HELD_H
#define ZEM_SIGPIPE_HELD_H

#include <cerrno>
#include <csignal>
#include <ctime>

#include "LetUnwind.h"

class zemSigpipeHeld {
public:
    zemSigpipeHeld() {
        sigemptyset(&m_sigpipe);
        sigaddset(&m_sigpipe, SIGPIPE);
        pthread_sigmask(SIG_BLOCK, &m_sigpipe, &m_before);
        // Only where the thread held the signal back itself can one have been waiting before.
        sigset_t pending;
        m_wasPending = sigismember(&m_before, SIGPIPE) == 1 && sigpending(&pending) == 0 &&
                       sigismember(&pending, SIGPIPE) == 1;
        errno = 0;
    }
    ~zemSigpipeHeld() {
        const int error = errno;  // of the write
        if (error == EPIPE && !m_wasPending) {
            take();
        }
        pthread_sigmask(SIG_SETMASK, &m_before, nullptr);
        errno = error;
    }
    zemSigpipeHeld(const zemSigpipeHeld&) = delete;
    zemSigpipeHeld& operator=(const zemSigpipeHeld&) = delete;

private:
    void take() const {
        const zemUncancelled uncancelled;
        constexpr timespec now = {0, 0};
        while (sigtimedwait(&m_sigpipe, nullptr, &now) < 0 && errno == EINTR) {
        }
    }

    sigset_t m_sigpipe;
    sigset_t m_before;
    bool m_wasPending = false;
};

#endif
