// What does the frame cost around a worker that does next to nothing?
//
// One enumeration of names through the function table, with all its trace lines, beside the bare
// call of the same worker. Lines are those on standard output, which goes to a file here; to a
// server's log they are what the operation costs.

#include <benchmark/benchmark.h>

#include <algorithm>

#include "ProviderInBench.h"
#include "TraceTool.h"

namespace {

const cimom::ObjectPath kDisks("root/cimv2", "Bench_Disk");

struct Result : CmpiResult {
    explicit Result(CMPIResult* result) : CmpiResult(result) {}
};

void Frame_EnumInstanceNames(benchmark::State& state) {
    ProviderInBench bench;
    const auto enumerate = [&](const cimom::RequestScope& scope) {
        cimom::Reply reply;
        bench.mi->ft->enumerateInstanceNames(bench.mi, scope.context(), scope.result(reply),
                                             scope.wrap(kDisks));
    };
    for (auto _ : state) {
        cimom::RequestScope scope(bench.server);
        enumerate(scope);
    }
    const char* file = "/tmp/zemFrameBench.lines";
    {
        OutputTo count(file);
        enumerate(bench.scope);
    }
    std::ifstream in(file);
    state.counters["lines"] = static_cast<double>(
        std::count(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>(), '\n'));
    std::remove(file);
}
BENCHMARK(Frame_EnumInstanceNames)->Unit(benchmark::kMicrosecond);

void Worker_EnumInstanceNames(benchmark::State& state) {
    ProviderInBench bench;
    BenchProvider& provider = bench.provider();
    for (auto _ : state) {
        cimom::RequestScope scope(bench.server);
        cimom::Reply reply;
        Result result(scope.result(reply));
        provider.performEnumInstanceNames(CmpiContext(scope.context()), result,
                                          CmpiObjectPath(scope.wrap(kDisks)));
    }
}
BENCHMARK(Worker_EnumInstanceNames)->Unit(benchmark::kMicrosecond);

// What the timing trace costs a tool's run or an operation while nobody has switched it on.
void TimingOff_OneOperation(benchmark::State& state) {
    if (CTimeLogerManager::getInstance()->isEnabled()) {
        state.SkipWithError("the trace is on");
    }
    for (auto _ : state) {
        CTimeLoger* timing = CTimeLogerManager::getInstance()->getLogger("enumInstanceNames");
        timing->begin("Bench_Disk");
        timing->end("Bench_Disk");
    }
}
BENCHMARK(TimingOff_OneOperation)->Unit(benchmark::kMicrosecond);

}  // namespace
