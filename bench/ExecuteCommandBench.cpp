// What does a run of a tool cost beyond starting the program?
//
// The other side is posix_spawn, one read to the end and waitpid. The runner polls, so it may take
// one polling step (2 ms) longer, plus a quarter.

#include <benchmark/benchmark.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "PropertiesHelper.h"

namespace {

void ExecuteCommand(benchmark::State& state) {
    zemString out;
    zemString err;
    int exitCode = -1;
    for (auto _ : state) {
        zemPropertiesHelper::executeCommand("/bin/true", out, err, &exitCode, nullptr, 0, nullptr,
                                            true);
    }
}

void SpawnReadWait(benchmark::State& state) {
    char program[] = "/bin/true";
    char* argv[] = {program, nullptr};
    for (auto _ : state) {
        int fds[2];
        if (pipe(fds) != 0) {
            state.SkipWithError("no pipe");
            break;
        }
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_addclose(&actions, fds[0]);
        posix_spawn_file_actions_adddup2(&actions, fds[1], STDOUT_FILENO);
        pid_t pid = 0;
        posix_spawn(&pid, program, &actions, nullptr, argv, environ);
        posix_spawn_file_actions_destroy(&actions);
        close(fds[1]);
        char buffer[1024];
        while (read(fds[0], buffer, sizeof buffer) > 0) {
        }
        close(fds[0]);
        int status = 0;
        waitpid(pid, &status, 0);
    }
}

BENCHMARK(ExecuteCommand)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(SpawnReadWait)->UseRealTime()->Unit(benchmark::kMillisecond);

}  // namespace
