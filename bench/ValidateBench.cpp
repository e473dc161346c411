// Are the tests of keys and property lists cheap beside plain comparisons of as many names?
//
// The baseline compares two vectors of strings by strcasecmp: every key with every key, every name
// with those behind it. The validators read their names from the server's objects besides.

#include <benchmark/benchmark.h>
#include <strings.h>

#include <vector>

#include "ProviderInBench.h"

namespace {

std::vector<std::string> names(int64_t count) {
    std::vector<std::string> list;
    for (int64_t i = 0; i < count; ++i) {
        list.push_back("Property" + std::to_string(i));
    }
    return list;
}

cimom::Options withClassOf(const std::vector<std::string>& properties) {
    std::string mof = "class Bench_Disk {\n";
    for (const std::string& name : properties) {
        mof += "    string " + name + ";\n";
    }
    mof += "};\n";
    cimom::Options options;
    options.classes =
        cimom::ClassRepository::load("bench.mof", [mof](const std::string&) { return mof; });
    return options;
}

void ValidateKeys(benchmark::State& state) {
    const auto keys = names(state.range(0));
    ProviderInBench bench(withClassOf(keys));
    cimom::ObjectPath path("root/cimv2", "Bench_Disk");
    for (const std::string& key : keys) {
        path.keys.set(key, cimom::Value("value of " + key));
    }
    for (auto _ : state) {
        cimom::RequestScope scope(bench.server);
        bench.provider().validateKeys(CmpiObjectPath(scope.wrap(path)),
                                      CmpiObjectPath(scope.wrap(path)), "bench", false);
    }
}
BENCHMARK(ValidateKeys)->Arg(10)->Arg(100)->Unit(benchmark::kMicrosecond);

void ValidateProperties(benchmark::State& state) {
    const auto properties = names(state.range(0));
    ProviderInBench bench(withClassOf(properties));
    std::vector<const char*> list;
    for (const std::string& name : properties) {
        list.push_back(name.c_str());
    }
    list.push_back(nullptr);
    for (auto _ : state) {
        cimom::RequestScope scope(bench.server);
        const CmpiObjectPath path(scope.wrap(cimom::ObjectPath("root/cimv2", "Bench_Disk")));
        bench.provider().validateProerties(path, list.data(), "bench");
    }
}
BENCHMARK(ValidateProperties)->Arg(10)->Arg(100)->Unit(benchmark::kMicrosecond);

void PlainKeys(benchmark::State& state) {
    const auto a = names(state.range(0));
    const auto b = a;
    for (auto _ : state) {
        int equal = 0;
        for (const std::string& x : a) {
            for (const std::string& y : b) {
                equal += strcasecmp(x.c_str(), y.c_str()) == 0;
            }
        }
        benchmark::DoNotOptimize(equal);
    }
}
BENCHMARK(PlainKeys)->Arg(10)->Arg(100)->Unit(benchmark::kMicrosecond);

void PlainProperties(benchmark::State& state) {
    const auto list = names(state.range(0));
    for (auto _ : state) {
        int equal = 0;
        for (size_t i = 0; i < list.size(); ++i) {
            for (size_t j = i + 1; j < list.size(); ++j) {
                equal += strcasecmp(list[i].c_str(), list[j].c_str()) == 0;
            }
        }
        benchmark::DoNotOptimize(equal);
    }
}
BENCHMARK(PlainProperties)->Arg(10)->Arg(100)->Unit(benchmark::kMicrosecond);

}  // namespace
