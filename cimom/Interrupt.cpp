#include "Interrupt.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>

#include "Failure.h"

namespace cimom {

namespace {

int wakePipe[2] = {-1, -1};

}  // namespace

// Handlers and no blocked signals: the tools that providers start must be free of both.
void wakeAtSignals() {
    if (wakePipe[0] < 0 && pipe2(wakePipe, O_CLOEXEC | O_NONBLOCK) != 0) {
        throw Failure(CMPI_RC_ERROR_SYSTEM, "no pipe");
    }
    struct sigaction action = {};
    action.sa_handler = [](int) { wake(); };
    for (int signal : {SIGINT, SIGTERM}) {
        sigaction(signal, &action, nullptr);
    }
}

void wake() {
    const int error = errno;
    const char byte = 0;
    if (::write(wakePipe[1], &byte, 1) < 0) {
        errno = error;  // a full pipe wakes as well
    }
}

bool waitForWake(int milliseconds) {
    pollfd woken = {wakePipe[0], POLLIN, 0};
    while (poll(&woken, 1, milliseconds) < 0 && errno == EINTR) {
        continue;
    }
    char bytes[64];
    return ::read(wakePipe[0], bytes, sizeof bytes) > 0;
}

}  // namespace cimom
