// What does filling a partition cost beyond what the platform takes for its answers?
//
// Each of 1000 partitions is filled with the VSSDs of its profiles, and the same calls of the
// management library and the same query of the tool are made plainly, one partition after the
// other, so that what else the machine does weighs on both. The counter ours_percent is the rest:
// what the model takes of the whole.

#include <benchmark/benchmark.h>

#include <string>

#include "DNXApiCaller.h"
#include "GeneratedAppliance.h"
#include "PropertiesHelper.h"
#include "VirtualSystemRep.h"

namespace {

/// What filling a partition asks of the platform.
void askPlainly(const std::string& mtms, const std::string& id) {
    const std::string key = id + '*' + mtms;
    const auto ask = [](apiProp* result) { return zemAutoReleaseApiProp(result); };
    ask(getCecObj("", mtms.c_str(), 1));
    ask(getLparObj("", key.c_str(), 1));
    ask(getLparObj("", key.c_str(), 2));
    const std::string line =
        "qyplat -r prof -m \"" + mtms + "\" --filter \"lpar_ids=" + id +
        "\" -F name,lpar_name,lpar_id,lpar_env,all_resources,min_mem,desired_mem,max_mem,"
        "proc_mode,min_proc_units,desired_proc_units,max_proc_units,min_procs,desired_procs,"
        "max_procs,sharing_mode,uncap_weight,io_slots,lpar_io_pool_ids,max_virtual_slots,"
        "virtual_serial_adapters,virtual_scsi_adapters,virtual_eth_adapters,boot_mode,"
        "conn_monitoring,auto_start,redundant_err_path_reporting";
    zemString output;
    zemString errors;
    zemPropertiesHelper::executeCommand(line.c_str(), output, errors, nullptr, "", 0, "", true);
    const zemAutoReleaseApiProp profiles = ask(getAllLparProfilesFromLpar("", key.c_str(), 1));
    for (int i = 1; i < profiles.get()->objCount; ++i) {
        const char* name = zemApiProp::getProperty(profiles.get() + i, "UserDefinedName");
        ask(getLparProfile("", key.c_str(), name, 2));
    }
}

void Initialize(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    const std::string mtms =
        zemApiProp::getProperty(zemAutoReleaseApiProp(getAllCecs("", 1)).get() + 1, "Name");
    zemCEC host(mtms.c_str(), "");
    double wholeInAll = 0;
    double platformInAll = 0;
    for (auto _ : state) {
        double whole = 0;
        for (std::int64_t i = 1; i <= state.range(0); ++i) {
            const std::string id = std::to_string(i);
            zemLPAR lpar(mtms.c_str(), id.c_str());
            whole += seconds([&] { lpar.initialize(&host, "", "", VISITOR_TYPE_VSSD_INIT); });
            platformInAll += seconds([&] { askPlainly(mtms, id); });
            if (lpar.getDefinedVSSDs().size() == 0 ||
                lpar.getStateVSSD().getInstanceID().isEmpty()) {
                state.SkipWithError("not filled");
                return;
            }
        }
        state.SetIterationTime(whole);
        wholeInAll += whole;
    }
    state.counters["ours_percent"] = 100 * (wholeInAll - platformInAll) / wholeInAll;
}

BENCHMARK(Initialize)
    ->Arg(1000)
    ->Iterations(1)
    ->Repetitions(1)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

}  // namespace
