// What does a query cost beyond the run of its tool?
//
// All attributes of the processors of 1000 partitions: how long until the caller has the records.
// QyallocSpawn starts the same command line, reads its output to the end and waits for it, and no
// more. QyallocSplit takes the two halves of a query one after the other: the child's time is that
// of the runner of tools, ours is the parsing. The stand-in's tool is quick; an appliance that
// takes longer to answer makes our share smaller.

#include <benchmark/benchmark.h>

#include <chrono>
#include <string>
#include <string_view>

#include "GeneratedAppliance.h"
#include "PropertiesHelper.h"
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

/// Times @p call, but not what becomes of its result.
template <typename Call>
auto timed(double& seconds, Call call) {
    using Clock = std::chrono::steady_clock;
    const auto begin = Clock::now();
    auto result = call();
    seconds = std::chrono::duration<double>(Clock::now() - begin).count();
    return result;
}

void Qyalloc(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    double whole = 0;
    for (auto _ : state) {
        const zemRecordSetsType records = timed(whole, [] {
            return zemQyallocCmdCaller("", "").getPartitionProcessorResources(nullptr, nullptr,
                                                                              nullptr);
        });
        state.SetIterationTime(whole);
        if (records.size() != state.range(0)) {
            state.SkipWithError("not the records");
        }
    }
}

void QyallocSpawn(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    double whole = 0;
    for (auto _ : state) {
        benchmark::DoNotOptimize(timed(whole, runQyalloc));
        state.SetIterationTime(whole);
    }
}

void QyallocSplit(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    const std::string command = "qyalloc -r proc --level lpar -F " + attributeNames();
    double child = 0;
    double ours = 0;
    double oursInAll = 0;
    double wholeInAll = 0;
    for (auto _ : state) {
        zemString output;
        zemString error;
        timed(child, [&] {
            return zemPropertiesHelper::executeCommand(command.c_str(), output, error, nullptr, "",
                                                       0, "", true);
        });
        zemRecordSetsType records(0, 25, 1);
        timed(ours, [&] {
            return zemParseRecords(std::string_view(output), nullptr, kAttributes, records);
        });
        if (records.size() != state.range(0)) {
            state.SkipWithError("not the records");
        }
        state.SetIterationTime(child + ours);
        oursInAll += ours;
        wholeInAll += child + ours;
    }
    state.counters["ours_percent"] = 100 * oursInAll / wholeInAll;
}

BENCHMARK(Qyalloc)->Arg(1000)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(QyallocSpawn)->Arg(1000)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(QyallocSplit)->Arg(1000)->UseManualTime()->Unit(benchmark::kMillisecond);

}  // namespace
