#include "Pipe.h"

#include <unistd.h>

namespace {

int closeEnd(int& descriptor) {
    if (descriptor != 0) {
        ::close(descriptor);
        descriptor = 0;
    }
    return 0;
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
    return static_cast<int>(::read(m_pipe[0], data, size));
}

int zemPipe::write(const void* data, std::size_t size) {
    return static_cast<int>(::write(m_pipe[1], data, size));
}

void zemPipe::attach(const int* fds) {
    if (fds != nullptr) {
        m_pipe[0] = fds[0];
        m_pipe[1] = fds[1];
    }
}

void zemPipe::detach() { m_pipe[0] = m_pipe[1] = 0; }
