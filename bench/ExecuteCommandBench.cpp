// What does a run of a tool cost beyond starting the program?
//
// The other side is posix_spawn, one read to the end and waitpid. The runner has three pipes to
// make and to watch, and resets the signals of the child; it may take half as long again.
//
// And in a server of a gigabyte, for a client who is another user? There the look-up of the user
// and the switch come on top, but nothing that grows with the server: to copy it would take
// hundreds of times as long.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <vector>

#include "PropertiesHelper.h"
#include "SpawnReadWait.h"

namespace {

void run(benchmark::State& state, const char* user) {
    zemString out;
    zemString err;
    int exitCode = -1;
    for (auto _ : state) {
        zemPropertiesHelper::executeCommand("/bin/true", out, err, &exitCode, user, 0, nullptr,
                                            true);
    }
    if (exitCode != 0) {
        state.SkipWithError("did not run");
    }
}

/// Makes this process as large as a server, each page its own.
void growToServer() {
    static const std::vector<char> memory(1U << 30, 'x');
    benchmark::DoNotOptimize(memory.data());
}

void ExecuteCommand(benchmark::State& state) { run(state, nullptr); }

void ExecuteCommandInServer(benchmark::State& state) {
    growToServer();
    run(state, nullptr);
}

void ExecuteCommandInServerAsUser(benchmark::State& state) {
    growToServer();
    run(state, "nobody");
}

void SpawnReadWait(benchmark::State& state) {
    const char* const argv[] = {"/bin/true", nullptr};
    for (auto _ : state) {
        benchmark::DoNotOptimize(spawnReadWait(argv));
    }
}

BENCHMARK(ExecuteCommand)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(ExecuteCommandInServer)->UseRealTime()->Unit(benchmark::kMillisecond);
// Only root may become another user.
[[maybe_unused]] const auto* const asUser =
    geteuid() != 0
        ? nullptr
        : benchmark::RegisterBenchmark("ExecuteCommandInServerAsUser", ExecuteCommandInServerAsUser)
              -> UseRealTime() -> Unit(benchmark::kMillisecond);
BENCHMARK(SpawnReadWait)->UseRealTime()->Unit(benchmark::kMillisecond);

}  // namespace
