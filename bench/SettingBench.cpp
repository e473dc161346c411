// What do the settings of all partitions cost through a broker, beyond what the platform takes for
// its answers, and does an instance's cost stay the same as there are more?
//
// All seven classes of settings are enumerated, and the same calls of the management library are
// made plainly in between, so that what else the machine does weighs on both. The counter
// ours_percent is what visitors, model, provider and broker take of the whole, per_instance_us
// the whole for one instance, and resident_KB what the process grew by for one while it worked.

#include <benchmark/benchmark.h>

#include <fstream>
#include <string>

#include "DNXApiCaller.h"
#include "GeneratedAppliance.h"
#include "ProviderInBench.h"

namespace {

using All = apiProp* (*)(const char* user, int level);

/// The classes, and what their enumeration asks besides hosts, partitions and profiles.
constexpr struct {
    const char* name;
    All calls[2];
} kClasses[] = {
    {"ORXC_VirtualSystemSettingData", {nullptr, nullptr}},
    {"ORXC_ProcessorRASettingData", {getAllCecProcessorCfg, getAllLparProcessorCfgs}},
    {"ORXC_MemoryRASettingData", {getAllCecMemoryCfg, getAllLparMemoryCfgs}},
    {"ORXC_IOSlotAdapterRASettingData", {getAllIoSlots, nullptr}},
    {"ORXC_EthernetAdapterRASettingData", {getAllLparVirtualEthernet, nullptr}},
    {"ORXC_SCSIAdapterRASettingData", {getAllLparVirtualScsi, nullptr}},
    {"ORXC_SerialAdapterRASettingData", {getAllLparVirtualSerial, nullptr}},
};

void askPlainly(const All (&calls)[2]) {
    constexpr int kEverything = 2;
    for (const All call : {&getAllCecs, &getAllLpars, &getAllLparProfiles, calls[0], calls[1]}) {
        if (call != nullptr) {
            zemAutoReleaseApiProp(call("", kEverything));
        }
    }
}

/// The most that was resident since the last call with true, in KB.
double mostResident(bool forget) {
    if (forget) {
        std::ofstream("/proc/self/clear_refs") << 5;
    }
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmHWM:", 0) == 0) {
            return std::stod(line.substr(sizeof "VmHWM:"));
        }
    }
    return 0;
}

void Settings(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    const OutputTo quiet("/dev/null");
    cimom::Options options;
    options.classes = cimom::ClassRepository::load(ZEM_SCHEMA);
    cimom::Server server(options);
    server.loadRegistration(ZEM_REGISTRATION);
    const double before = mostResident(true);
    double wholeInAll = 0;
    double platformInAll = 0;
    std::size_t instances = 0;
    for (auto _ : state) {
        double whole = 0;
        for (const auto& row : kClasses) {
            whole += seconds([&] {
                cimom::Request request;
                const cimom::Reply reply =
                    server.enumInstances(request, {"root/cimv2", row.name, {}});
                instances += reply.instances.size();
            });
            platformInAll += seconds([&] { askPlainly(row.calls); });
        }
        state.SetIterationTime(whole);
        wholeInAll += whole;
    }
    if (instances < static_cast<std::size_t>(state.range(0))) {
        state.SkipWithError("not all are there");
        return;
    }
    const auto each = static_cast<double>(instances);
    state.counters["ours_percent"] = 100 * (wholeInAll - platformInAll) / wholeInAll;
    state.counters["per_instance_us"] = 1e6 * wholeInAll / each;
    state.counters["resident_KB"] =
        (mostResident(false) - before) * static_cast<double>(state.iterations()) / each;
}

BENCHMARK(Settings)
    ->Arg(100)
    ->Arg(1000)
    ->Arg(10000)
    ->Iterations(1)
    ->Repetitions(1)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

}  // namespace
