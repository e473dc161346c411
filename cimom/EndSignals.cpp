#include "EndSignals.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>

#include "Failure.h"

namespace cimom {

namespace {

int wakePipe[2] = {-1, -1};

void onSignal(int) {
    const int before = errno;
    EndSignals::wake();
    errno = before;
}

void takeSignals() {
    struct sigaction action = {};
    action.sa_handler = onSignal;
    for (int signal : {SIGINT, SIGTERM}) {
        sigaction(signal, &action, nullptr);
    }
}

}  // namespace

void EndSignals::wake() {
    const char byte = 0;
    if (::write(wakePipe[1], &byte, 1) < 0) {
        return;  // a full pipe wakes as well
    }
}

EndSignals::EndSignals() {
    if (pipe2(wakePipe, O_CLOEXEC | O_NONBLOCK) != 0) {
        throw Failure(CMPI_RC_ERROR_SYSTEM, "no pipe");
    }
    takeSignals();
}

bool EndSignals::wait(std::chrono::milliseconds time) {
    takeSignals();
    pollfd waited = {wakePipe[0], POLLIN, 0};
    char bytes[64];
    return poll(&waited, 1, static_cast<int>(time.count())) > 0 &&
           ::read(wakePipe[0], bytes, sizeof bytes) > 0;
}

}  // namespace cimom
