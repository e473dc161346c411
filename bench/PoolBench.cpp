// What do the pools of a host cost through a broker, with all that stands around them, as there are
// more pools and more partitions?
//
// Pools enumerates the pools, capabilities and services of all kinds and, among all setting data,
// those of pools; PoolTies the associations between them. A size is so many shared pools of
// processors and so many partitions of one host; the counter per_item_us is the cost for one of
// these.

#include <benchmark/benchmark.h>

#include <string>

#include "GeneratedAppliance.h"
#include "ProviderInBench.h"

namespace {

const std::vector<std::string> kClasses = [] {
    std::vector<std::string> names = {
        "ORXC_ProcessorRASettingData",     "ORXC_MemoryRASettingData",
        "ORXC_IOSlotAdapterRASettingData", "ORXC_EthernetAdapterRASettingData",
        "ORXC_SCSIAdapterRASettingData",   "ORXC_SerialAdapterRASettingData"};
    for (const char* kind :
         {"Processor", "Memory", "IOSlot", "EthernetAdapter", "SCSIAdapter", "SerialAdapter"}) {
        for (const char* role : {"Pool", "AllocationCapabilities", "PoolConfigurationCapabilities",
                                 "PoolConfigurationService"}) {
            names.push_back(std::string("ORXC_") + kind + role);
        }
    }
    return names;
}();

const std::vector<std::string> kTies = {
    "ORXC_HostedResourcePool",         "ORXC_HostedService",
    "ORXC_ServiceAffectsElement",      "ORXC_ElementCapabilities",
    "ORXC_SettingsDefineCapabilities", "ORXC_ElementAllocatedFromPool",
    "ORXC_ResourceAllocationFromPool"};

void enumerate(benchmark::State& state, const std::vector<std::string>& names) {
    const GeneratedAppliance appliance(state.range(1), state.range(0));
    const OutputTo quiet("/dev/null");
    cimom::Options options;
    options.classes = cimom::ClassRepository::load(ZEM_SCHEMA);
    cimom::Server server(options);
    server.loadRegistration(ZEM_REGISTRATION);
    double whole = 0;
    for (auto _ : state) {
        whole = seconds([&] {
            for (const std::string& name : names) {
                cimom::Request request;
                if (server.enumInstances(request, {"root/cimv2", name, {}}).instances.empty()) {
                    state.SkipWithError("not all are there");
                }
            }
        });
        state.SetIterationTime(whole);
    }
    state.counters["per_item_us"] =
        1e6 * whole / static_cast<double>(state.range(0) + state.range(1));
}

void Pools(benchmark::State& state) { enumerate(state, kClasses); }
void PoolTies(benchmark::State& state) { enumerate(state, kTies); }

void sizes(benchmark::internal::Benchmark* bench) {
    bench->Args({8, 125})
        ->Args({64, 125})
        ->Args({64, 1000})
        ->Iterations(1)
        ->Repetitions(1)
        ->UseManualTime()
        ->Unit(benchmark::kMillisecond);
}
BENCHMARK(Pools)->Apply(sizes);
BENCHMARK(PoolTies)->Apply(sizes);

}  // namespace
