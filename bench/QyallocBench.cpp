// What does a query cost beyond the run of its tool?
//
// All attributes of the processors of 1000 partitions. QyallocSpawn starts the same command line,
// reads its output to the end and waits for it: the child's time. What the query takes longer is
// ours: fork() where the other has posix_spawn(), waits of 2 ms between two looks at the child (one
// when its output has filled the pipe, one when it has ended), and the parsing, which stands alone
// as QyallocParse. The stand-in's tool is quick; an appliance that takes longer to answer makes our
// share smaller.

#include <benchmark/benchmark.h>

#include <string>

#include "GeneratedAppliance.h"
#include "QyallocCmdCaller.h"
#include "RecordParser.h"
#include "SpawnReadWait.h"

namespace {

constexpr unsigned kAttributes = 25;

/// All attributes, in the order in which the query asks for them.
std::string attributeNames() {
    std::string names;
    for (const char* name :
         zemQyallocCmdCaller::ProcessorResourceAttribute::LparLevelAttribute::m_attributeName) {
        names += (names.empty() ? "" : ",") + std::string(name);
    }
    return names;
}

std::string runQyalloc() {
    static const std::string names = attributeNames();
    const char* const argv[] = {"qyalloc", "-r", "proc",        "--level",
                                "lpar",    "-F", names.c_str(), nullptr};
    return spawnReadWait(argv);
}

void Qyalloc(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    for (auto _ : state) {
        const zemRecordSetsType records =
            zemQyallocCmdCaller("", "").getPartitionProcessorResources(nullptr, nullptr, nullptr);
        if (records.size() != state.range(0)) state.SkipWithError("not the records");
    }
}

void QyallocSpawn(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    for (auto _ : state) benchmark::DoNotOptimize(runQyalloc());
}

void QyallocParse(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    const std::string output = runQyalloc();
    for (auto _ : state) {
        zemRecordSetsType records(0, 25, 1);
        zemParseRecords(output, nullptr, kAttributes, records);
        if (records.size() != state.range(0)) state.SkipWithError("not the records");
    }
}

BENCHMARK(Qyalloc)->Arg(1000)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(QyallocSpawn)->Arg(1000)->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(QyallocParse)->Arg(1000)->UseRealTime()->Unit(benchmark::kMillisecond);

}  // namespace
