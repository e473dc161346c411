/// The plainest run of a program: started, read to the end of its output, waited for.
#ifndef SPAWN_READ_WAIT_H
#define SPAWN_READ_WAIT_H

#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <string>

/// @param argv  null-terminated; the program is looked up on PATH
/// @return what it wrote to standard output; empty also when it could not be started
inline std::string spawnReadWait(const char* const* argv) {
    int fds[2];
    if (pipe(fds) != 0) {
        return {};
    }
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addclose(&actions, fds[0]);
    posix_spawn_file_actions_adddup2(&actions, fds[1], STDOUT_FILENO);
    pid_t pid = -1;
    const int error =
        posix_spawnp(&pid, argv[0], &actions, nullptr, const_cast<char* const*>(argv), environ);
    posix_spawn_file_actions_destroy(&actions);
    close(fds[1]);
    std::string output;
    char buffer[1 << 16];
    for (ssize_t n = 0; (n = read(fds[0], buffer, sizeof buffer)) > 0;) {
        output.append(buffer, static_cast<std::size_t>(n));
    }
    close(fds[0]);
    if (error == 0) {
        waitpid(pid, nullptr, 0);
    }
    return output;
}

#endif
