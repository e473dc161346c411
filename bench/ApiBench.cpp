// What does reading through the management library cost, and does it grow with what is there?
//
// GetAllLpars reads all partitions in full. The other side walks the same rows of the same database
// file with SQLite alone, finds the same attributes in each and copies them. A record reserves
// 800,016 bytes, and takes but what it is filled with: the counter resident_MB says how much the
// whole result is.
//
// WalkLpars asks for every key of each record, as readers do. What it takes for ten times the
// records is ten times as much and what the smaller caches no longer hold.
//
// LookUp asks once for each property of a record with so many of them, and copies the value. The
// other sides do the same on pairs in a vector, searched from its front, and on a map.

#include <benchmark/benchmark.h>
#include <sqlite3.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "DNXApiCaller.h"
#include "GeneratedAppliance.h"

namespace {

double residentMegabytes() {
    std::ifstream status("/proc/self/statm");
    double total = 0, resident = 0;
    status >> total >> resident;
    return resident * static_cast<double>(sysconf(_SC_PAGESIZE)) / (1 << 20);
}

void GetAllLpars(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    double grown = 0;
    for (auto _ : state) {
        const double before = residentMegabytes();
        const zemAutoReleaseApiProp result(zemApiCaller().getAllLpars("", 2));
        if (zemApiCaller::getReturnCode(result.get()) != 0 ||
            result.get()->objCount != state.range(0) + 1) {
            state.SkipWithError("not the result");
            break;
        }
        grown = residentMegabytes() - before;
    }
    state.counters["resident_MB"] = grown;
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

/// Hands each row's attributes to @p take.
template <typename Take>
int walkRows(sqlite3* database, const char* kind, Take take) {
    sqlite3_stmt* query = nullptr;
    sqlite3_prepare_v2(database,
                       "SELECT attributes FROM object WHERE kind = ? ORDER BY host, lpar, number",
                       -1, &query, nullptr);
    sqlite3_bind_text(query, 1, kind, -1, SQLITE_STATIC);
    int rows = 0;
    for (; sqlite3_step(query) == SQLITE_ROW; ++rows) {
        const void* text = sqlite3_column_blob(query, 0);
        take(std::string_view(static_cast<const char*>(text),
                              static_cast<std::size_t>(sqlite3_column_bytes(query, 0))));
    }
    sqlite3_finalize(query);
    return rows;
}

void copyValue(std::string_view attributes, std::string_view line,
               std::vector<std::string>& values) {
    const std::size_t at = attributes.find(line);
    if (at == std::string_view::npos) {
        return;
    }
    const std::size_t begin = at + line.size();
    values.emplace_back(attributes.substr(begin, attributes.find('\n', begin) - begin));
}

void SqliteWalkLpars(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
    const std::string file = appliance.folder() / "appliance" / "appliance.db";
    for (auto _ : state) {
        sqlite3* database = nullptr;
        sqlite3_open_v2(file.c_str(), &database, SQLITE_OPEN_READONLY, nullptr);
        std::vector<std::string> values;
        const int rows = walkRows(database, "lpar", [&](std::string_view attributes) {
            for (const char* line :
                 {"\nname=", "\nlpar_env=", "\nresource_config=", "\nstate=", "\nboot_mode=",
                  "\nmigration_state=", "\ndefault_profile=", "\ncurr_profile=", "\nlpar_keylock=",
                  "\nredundant_err_path_reporting=", "\ndesired_lpar_proc_compat_mode=",
                  "\ncurr_lpar_proc_compat_mode=", "\nauto_start="}) {
                copyValue(attributes, line, values);
            }
        });
        // A partition's profiles stand in its record with their numbers.
        walkRows(database, "profile",
                 [&](std::string_view attributes) { copyValue(attributes, "\nname=", values); });
        sqlite3_close(database);
        if (rows != state.range(0)) {
            state.SkipWithError("not the rows");
        }
        benchmark::DoNotOptimize(values);
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void WalkLpars(benchmark::State& state) {
    const GeneratedAppliance appliance(state.range(0));
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
    const GeneratedAppliance appliance(state.range(0));
    const std::string key =
        "7*" + std::string(zemApiProp::getProperty(
                   zemAutoReleaseApiProp(zemApiCaller().getAllCecs("", 1)).get() + 1, "Name"));
    for (auto _ : state) {
        const zemAutoReleaseApiProp result(zemApiCaller().getLparObj("", key.c_str(), 1));
        if (zemApiCaller::getReturnCode(result.get()) != 0) {
            state.SkipWithError("no result");
        }
    }
}

// Looking up.

using Properties = std::vector<std::pair<std::string, std::string>>;

Properties properties(std::int64_t count) {
    Properties all;
    for (std::int64_t i = 0; i < count; ++i) {
        all.emplace_back("Key" + std::to_string(i) + "OfRecord", "value " + std::to_string(i));
    }
    return all;
}

template <typename Find>
void lookUp(benchmark::State& state, const Properties& all, Find find) {
    for (auto _ : state) {
        for (const auto& property : all) {
            benchmark::DoNotOptimize(find(property.first));
        }
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

void LookUp(benchmark::State& state) {
    const Properties all = properties(state.range(0));
    const auto record = std::make_unique<apiProp>();
    for (const auto& [key, value] : all) {
        const auto index = static_cast<std::size_t>(record->propertyCount++);
        std::snprintf(record->name[index], sizeof record->name[index], "%s", key.c_str());
        std::snprintf(record->value[index], sizeof record->value[index], "%s", value.c_str());
    }
    lookUp(state, all, [&](const std::string& key) {
        return zemApiProp(record.get()).getProperty(key.c_str());
    });
}

void LookUpInVector(benchmark::State& state) {
    const Properties all = properties(state.range(0));
    lookUp(state, all, [&](const std::string& key) {
        for (const auto& property : all) {
            if (property.first == key) {
                return property.second;
            }
        }
        return std::string();
    });
}

void LookUpInMap(benchmark::State& state) {
    const Properties all = properties(state.range(0));
    const std::map<std::string, std::string> map(all.begin(), all.end());
    lookUp(state, all, [&](const std::string& key) { return map.at(key); });
}

BENCHMARK(GetAllLpars)->Arg(100)->Arg(1000)->Arg(10000)->Unit(benchmark::kMillisecond);
BENCHMARK(SqliteWalkLpars)->Arg(1000)->Arg(10000)->Unit(benchmark::kMillisecond);
BENCHMARK(WalkLpars)->Arg(100)->Arg(1000)->Unit(benchmark::kMillisecond);
BENCHMARK(GetLparObj)->Arg(100)->Arg(1000)->Unit(benchmark::kMillisecond);
BENCHMARK(LookUp)->Arg(1)->Arg(10)->Arg(100)->Arg(1000);
BENCHMARK(LookUpInVector)->Arg(1)->Arg(10)->Arg(100)->Arg(1000);
BENCHMARK(LookUpInMap)->Arg(1)->Arg(10)->Arg(100)->Arg(1000);

}  // namespace
