/// zemPipe: a POSIX pipe whose open ends are closed with the object.
///
/// The value 0 marks an end as closed or none, so descriptor 0 is never taken for a pipe's end.
///
/// Thread-safety: none; after a fork each process has its own object.
#ifndef PIPE_H
#define PIPE_H

#include <cstddef>

#include "ZemExport.h"

class ZEM_EXPORT zemPipe {
public:
    zemPipe();
    ~zemPipe();
    zemPipe(const zemPipe&) = delete;
    zemPipe& operator=(const zemPipe&) = delete;

    /// Opens both ends. Returns 0, or -1 with errno set. Ends held before are not closed.
    int openPipe();

    /// Close the end if it is open. Return 0.
    int closeReadingPipe();
    int closeWritingPipe();

    /// One read(2) or write(2): the number of bytes, 0 at the end of file, -1 with errno set: EBADF
    /// for an end that is none, EPIPE, without a signal, when there is nobody left to read.
    int read(void* data, std::size_t size);
    int write(const void* data, std::size_t size);

    /// The descriptors, 0 for an end that is closed; they stay the object's.
    int getReadingPipe() const { return m_pipe[0]; }
    int getWritingPipe() const { return m_pipe[1]; }

    /// Holds the two descriptors (reading, writing) from here on; null is ignored.
    void attach(const int* fds);

    /// Gives both descriptors up, open.
    void detach();

private:
    int m_pipe[2];
};

#endif
