#include "Pipe.h"

#include <unistd.h>

#include <cerrno>

#include "LetUnwind.h"
#include "SigpipeHeld.h"

namespace {

/// Also for the destructor, which a cancelled thread must not leave.
int closeEnd(int& descriptor) {
    const zemUncancelled uncancelled;
    if (descriptor != 0) {
        ::close(descriptor);
        descriptor = 0;
    }
    return 0;
}

/// Whether there is such an end. Without the test 0 would be the standard input of the host.
bool isOpen(int descriptor) {
    if (descriptor == 0) {
        errno = EBADF;
    }
    return descriptor != 0;
}

}  // namespace

zemPipe::zemPipe() : m_pipe{0, 0} {}

zemPipe::~zemPipe() {
    closeReadingPipe();
    closeWritingPipe();
}

int zemPipe::openPipe() { return ::pipe(m_pipe); }

int zemPipe::closeReadingPipe() { return closeEnd(m_pipe[0]); }

int zemPipe::closeWritingPipe() { return closeEnd(m_pipe[1]); }

int zemPipe::read(void* data, std::size_t size) {
    return isOpen(m_pipe[0]) ? static_cast<int>(::read(m_pipe[0], data, size)) : -1;
}

int zemPipe::write(const void* data, std::size_t size) {
    const zemSigpipeHeld held;
    return isOpen(m_pipe[1]) ? static_cast<int>(::write(m_pipe[1], data, size)) : -1;
}

void zemPipe::attach(const int* fds) {
    if (fds != nullptr) {
        m_pipe[0] = fds[0];
        m_pipe[1] = fds[1];
    }
}

void zemPipe::detach() { m_pipe[0] = m_pipe[1] = 0; }
