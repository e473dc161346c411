/// The plainest run of a program: started, read to the end of its output, waited for.
#ifndef SPAWN_READ_WAIT_H
#define SPAWN_READ_WAIT_H

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <string>

struct Spawned {
    pid_t pid = -1;   ///< -1 when it could not be started
    int output = -1;  ///< its standard output; the caller's to close
};

/// @param argv  null-terminated; the program is looked up on PATH
inline Spawned spawn(const char* const* argv) {
    int fds[2];
    if (pipe2(fds, O_CLOEXEC) != 0) {
        return {};
    }
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, fds[1], STDOUT_FILENO);
    Spawned child;
    posix_spawnp(&child.pid, argv[0], &actions, nullptr, const_cast<char* const*>(argv), environ);
    posix_spawn_file_actions_destroy(&actions);
    close(fds[1]);
    child.output = fds[0];
    return child;
}

/// @return what it wrote to standard output; empty also when it could not be started
inline std::string spawnReadWait(const char* const* argv) {
    const Spawned child = spawn(argv);
    std::string output;
    char buffer[1 << 16];
    for (ssize_t n = 0; (n = read(child.output, buffer, sizeof buffer)) > 0;) {
        output.append(buffer, static_cast<std::size_t>(n));
    }
    close(child.output);
    if (child.pid > 0) {
        waitpid(child.pid, nullptr, 0);
    }
    return output;
}

#endif
