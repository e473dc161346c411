// What do the settings of all partitions cost through a broker, beyond what the platform takes for
// its answers, and does an instance's cost stay the same as there are more?
//
// All seven classes of settings are enumerated, and the same calls of the management library are
// made plainly in between, so that what else the machine does weighs on both. The counter
// ours_percent is what visitors, model, provider and broker take of the whole, ours_us the same for
// one instance, per_instance_us the whole for one, and resident_KB what the process grew by for one
// while it worked.
//
// SettingsSplit does two parts of it again, alone: model_percent is what visitors and model take,
// reading what the calls gave and building settings of it, and broker_percent what the object
// manager takes to make the same instances. The rest is the provider's and the binding's.

#include <benchmark/benchmark.h>
#include <time.h>

#include <fstream>
#include <memory>
#include <string>

#include "Broker.h"
#include "DNXApiCaller.h"
#include "GeneratedAppliance.h"
#include "ProviderInBench.h"
#include "VirtualSystemVisitor.h"

namespace {

using All = apiProp* (*)(const char* user, int level);
using Hosts = zemCECVisitor;

/// A class, and what its enumeration asks besides hosts, partitions and profiles: of the library,
/// and of the visitor of hosts.
struct Class {
    const char* name;
    All calls[3];
    int type;
    int (Hosts::*ofHosts[2])(const zemString& userName, int level);
    int (Hosts::*ofPartitions)(const zemString& userName, const zemString& lparid, int level);
};

// clang-format off
constexpr Class kClasses[] = {
    {"ORXC_VirtualSystemSettingData", {}, VISITOR_TYPE_VSSD, {}, nullptr},
    {"ORXC_ProcessorRASettingData", {getAllCecProcessorCfg, getAllLparProcessorCfgs, getAllCecProcessorPoolCfg}, VISITOR_TYPE_RASD_PROC,
     {&Hosts::initializeProcessorLevelSys, &Hosts::initializeProcessorPool}, &Hosts::initializeProcessorLevelLpar},
    {"ORXC_MemoryRASettingData", {getAllCecMemoryCfg, getAllLparMemoryCfgs, getAllCecMemoryPoolCfgs}, VISITOR_TYPE_RASD_MEM,
     {&Hosts::initializeMemoryLevelSys, &Hosts::initializeMemoryPool}, &Hosts::initializeMemoryLevelLpar},
    {"ORXC_IOSlotAdapterRASettingData", {getAllIoSlots}, VISITOR_TYPE_RASD_IOSLOT,
     {}, &Hosts::initializeIOSlotLevelLpar},
    {"ORXC_EthernetAdapterRASettingData", {getAllLparVirtualEthernet}, VISITOR_TYPE_RASD_VETH,
     {}, &Hosts::initializeEthernetAdapterLevelLpar},
    {"ORXC_SCSIAdapterRASettingData", {getAllLparVirtualScsi}, VISITOR_TYPE_RASD_VSCSI,
     {}, &Hosts::initializeSCSIAdapterLevelLpar},
    {"ORXC_SerialAdapterRASettingData", {getAllLparVirtualSerial}, VISITOR_TYPE_RASD_VSERIAL,
     {}, &Hosts::initializeSerialAdapterLevelLpar},
};
// clang-format on

/// What the enumeration of a class asks the library, once each.
void askPlainly(const Class& row) {
    constexpr int kEverything = 2;
    for (const All call :
         {getAllCecs, getAllLpars, getAllLparProfiles, row.calls[0], row.calls[1], row.calls[2]}) {
        if (call != nullptr) {
            zemAutoReleaseApiProp(call("", kEverything));
        }
    }
}

/// Reads and builds the settings of a class as its provider does, and drops them.
void buildAlone(const Class& row) {
    constexpr int kLevel = Hosts::Level_All;
    zemVirtualizationManager manager;
    const std::unique_ptr<Hosts> hosts(manager.createCECVisitor());
    hosts->initialize("", false, kLevel);
    hosts->initializeLparResource("", "", kLevel, VISITOR_TYPE_LPAR);
    hosts->initializeLparProfile("", "", kLevel);
    for (const auto ofHosts : row.ofHosts) {
        if (ofHosts != nullptr) {
            (*hosts.*ofHosts)("", kLevel);
        }
    }
    if (row.ofPartitions != nullptr) {
        (*hosts.*row.ofPartitions)("", "", kLevel);
    }
    for (int i = 0; i < hosts->size(); ++i) {
        zemCEC& host = *hosts->getData(i);
        zemVSSDVisitor systems(&host, row.name);
        for (int j = 0; j < host.getLPARs().size(); ++j) {
            zemLPAR& lpar = *host.getLPARs().getElementAt(j);
            for (int k = 0; k < lpar.getLparProfile().size(); ++k) {
                const std::unique_ptr<zemVSSD> stored(
                    systems.getProfileVSSD(&lpar, lpar.getLparProfile().getElementAt(k), row.type));
                if (k == 0) {
                    std::unique_ptr<zemVSSD>(systems.getStateVSSD(&lpar, *stored));
                }
            }
        }
    }
}

/// Has the broker make the instances of an answer, value by value, and return them.
void makeAlone(cimom::Server& server, const cimom::Reply& reply) {
    const cimom::RequestScope scope(server);
    const CMPIBroker* const mb = server.broker();
    cimom::Broker& broker = cimom::Broker::of(mb);
    cimom::Reply again;
    CMPIResult* const result = scope.result(again);
    const auto hand = [&](auto* object, auto entry, const cimom::NamedValues& values) {
        for (const auto& [name, value] : values) {
            const bool isText = value.type() == CMPI_string && !value.isNull();
            const CMPIData data = isText ? CMPIData() : cimom::makeData(broker, value);
            const void* const text = isText ? value.text().c_str() : nullptr;
            (object->ft->*entry)(object, name.c_str(),
                                 isText ? static_cast<const CMPIValue*>(text) : &data.value,
                                 isText ? CMPIType{CMPI_chars} : data.type);
        }
    };
    for (const cimom::Instance& each : reply.instances) {
        CMPIObjectPath* const path = mb->eft->newObjectPath(mb, each.path.nameSpace.c_str(),
                                                            each.path.className.c_str(), nullptr);
        hand(path, &CMPIObjectPathFT::addKey, each.path.keys);
        CMPIInstance* const instance = mb->eft->newInstance(mb, path, nullptr);
        hand(instance, &CMPIInstanceFT::setProperty, each.properties);
        result->ft->returnInstance(result, instance);
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

/// How long the processor works on @p call. All that is measured here happens in this process and
/// waits for nothing, so what else the machine does need not count.
template <typename Call>
double processorSeconds(Call call) {
    const auto now = [] {
        timespec time = {};
        clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
        return static_cast<double>(time.tv_sec) + 1e-9 * static_cast<double>(time.tv_nsec);
    };
    const double begin = now();
    call();
    return now() - begin;
}

/// What the settings of all classes take together, in seconds.
struct Times {
    double whole = 0;
    double platform = 0;  ///< the library's calls
    double model = 0;     ///< visitors and model
    double broker = 0;
};

/// Enumerates all classes once, and does parts of it again for @p isSplit.
/// @return how many instances there are
std::size_t enumerate(cimom::Server& server, bool isSplit, Times& times) {
    std::size_t instances = 0;
    for (const Class& row : kClasses) {
        cimom::Reply reply;
        times.whole += processorSeconds([&] {
            reply = server.enumInstances({}, {"root/cimv2", row.name, {}});
        });
        instances += reply.instances.size();
        const double platform = processorSeconds([&] { askPlainly(row); });
        times.platform += platform;
        if (isSplit) {
            times.model += processorSeconds([&] { buildAlone(row); }) - platform;
            times.broker += processorSeconds([&] { makeAlone(server, reply); });
        }
        times.whole += processorSeconds([&] { reply = {}; });
    }
    return instances;
}

template <bool isSplit>
void settings(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    const OutputTo quiet("/dev/null");
    cimom::Options options;
    options.classes = cimom::ClassRepository::load(ZEM_SCHEMA);
    cimom::Server server(options);
    server.loadRegistration(ZEM_REGISTRATION);
    const double before = mostResident(true);
    Times all;
    std::size_t instances = 0;
    for (auto _ : state) {
        const double earlier = all.whole;
        instances += enumerate(server, isSplit, all);
        state.SetIterationTime(all.whole - earlier);
    }
    if (instances < static_cast<std::size_t>(state.range(0))) {
        state.SkipWithError("not all are there");
        return;
    }
    const auto each = static_cast<double>(instances);
    const auto percent = [&all](double time) { return 100 * time / all.whole; };
    state.counters["ours_percent"] = percent(all.whole - all.platform);
    state.counters["ours_us"] = 1e6 * (all.whole - all.platform) / each;
    if (isSplit) {
        state.counters["model_percent"] = percent(all.model);
        state.counters["broker_percent"] = percent(all.broker);
        return;
    }
    state.counters["per_instance_us"] = 1e6 * all.whole / each;
    state.counters["resident_KB"] =
        (mostResident(false) - before) * static_cast<double>(state.iterations()) / each;
}

void Settings(benchmark::State& state) { settings<false>(state); }
void SettingsSplit(benchmark::State& state) { settings<true>(state); }

BENCHMARK(Settings)
    ->Arg(100)
    ->Arg(1000)
    ->Arg(10000)
    ->Iterations(1)
    ->Repetitions(1)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

BENCHMARK(SettingsSplit)
    ->Arg(1000)
    ->Iterations(1)
    ->Repetitions(1)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

}  // namespace
