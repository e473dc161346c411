// What does reading through the management library cost, and does it grow with what is there?
//
// A record reserves 800,016 bytes, and takes but what it is filled with: the counter
// resident_KB_per_object says how much that is. Walking asks for every key of a record, as readers
// do, in each of 100 or 1000 records.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>

#include "DNXApiCaller.h"
#include "Object.h"
#include "Store.h"

namespace {

/// An appliance with one host of @p lpars partitions, for the length of a benchmark.
class Appliance {
public:
    explicit Appliance(std::int64_t lpars) {
        std::string folder = (std::filesystem::temp_directory_path() / "zembench.XXXXXX").string();
        if (mkdtemp(folder.data()) == nullptr) throw std::runtime_error("no temporary folder");
        m_folder = folder;
        setenv("APPLIANCE_HOME", folder.c_str(), 1);
        using namespace appliance;
        Store store = Store::create();
        Transaction change = store.write();
        store.clear(true);
        store.put(host());
        for (std::int64_t id = 1; id <= lpars; ++id) store.put(lpar(id));
        change.commit();
    }
    ~Appliance() { std::filesystem::remove_all(m_folder); }
    Appliance(const Appliance&) = delete;
    Appliance& operator=(const Appliance&) = delete;

private:
    static appliance::Object host() {
        appliance::Object host(appliance::Kind::Host, {1});
        host.set("name", "alpha");
        host.set("type_model", "1111-AAA");
        host.set("serial_num", "0000001");
        host.set("state", "Operating");
        return host;
    }
    static appliance::Object lpar(std::int64_t id) {
        appliance::Object lpar(appliance::Kind::Lpar, {1, id});
        lpar.set("name", "partition-" + std::to_string(id));
        lpar.set("lpar_env", "tmxlinux");
        lpar.set("state", "Running");
        lpar.set("default_profile", "normal");
        return lpar;
    }

    std::filesystem::path m_folder;
};

double residentKilobytes() {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmRSS:", 0) == 0) return std::stod(line.substr(6));
    }
    return 0;
}

void GetAllLpars(benchmark::State& state) {
    const Appliance appliance(state.range(0));
    double grown = 0;
    for (auto _ : state) {
        const double before = residentKilobytes();
        const zemAutoReleaseApiProp result(zemApiCaller().getAllLpars("", 2));
        if (zemApiCaller::getReturnCode(result.get()) != 0) state.SkipWithError("no result");
        grown = residentKilobytes() - before;
    }
    state.counters["resident_KB_per_object"] = grown / static_cast<double>(state.range(0));
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void WalkLpars(benchmark::State& state) {
    const Appliance appliance(state.range(0));
    const zemApiObjects lpars({"bench", "walk", "getAllLpars"}, zemApiCaller().getAllLpars("", 2));
    for (auto _ : state) {
        for (apiProp& lpar : lpars) {
            for (int i = 0; i < lpar.propertyCount; ++i) {
                benchmark::DoNotOptimize(zemApiProp(&lpar).getProperty(lpar.name[i]));
            }
        }
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void GetLparObj(benchmark::State& state) {
    const Appliance appliance(state.range(0));
    for (auto _ : state) {
        const zemAutoReleaseApiProp result(zemApiCaller().getLparObj("", "7*1111-AAA*0000001", 1));
        benchmark::DoNotOptimize(result.get());
    }
}

BENCHMARK(GetAllLpars)->Arg(100)->Arg(1000)->Unit(benchmark::kMillisecond);
BENCHMARK(WalkLpars)->Arg(100)->Arg(1000)->Unit(benchmark::kMillisecond);
BENCHMARK(GetLparObj)->Arg(100)->Arg(1000)->Unit(benchmark::kMillisecond);

}  // namespace
