// What does a run of a tool cost beyond starting the program?
//
// The other side is posix_spawn, one read to the end and waitpid. The runner has three pipes to
// make and to watch, and resets the signals of the child; it may take half as long again.

#include <benchmark/benchmark.h>

#include "PropertiesHelper.h"
#include "SpawnReadWait.h"

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
    const char* const argv[] = {"/bin/true", nullptr};
    for (auto _ : state) benchmark::DoNotOptimize(spawnReadWait(argv));
}

BENCHMARK(ExecuteCommand)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(SpawnReadWait)->UseRealTime()->Unit(benchmark::kMillisecond);

}  // namespace
