// Is reading the tools' records as fast as a plain CSV reader, and linear in their number?
//
// Records have ten fields, a third of them quoted. The other side is libcsv on the same bytes, with
// each field in a std::string: once in rows of a vector, once keyed by field as our records are.

#include <benchmark/benchmark.h>
#include <csv.h>

#include <string>
#include <unordered_map>
#include <vector>

#include "RecordParser.h"

namespace {

constexpr int kFields = 10;

std::string records(int64_t count) {
    std::string bytes;
    for (int64_t record = 0; record < count; ++record) {
        for (int field = 0; field < kFields; ++field) {
            const std::string value = std::to_string(record * 7 + field);
            bytes += field == 0 ? "" : ",";
            switch (field % 6) {
                case 0:
                    bytes += "\"lpar " + value + ",\"\"active\"\"\"";
                    break;
                case 3:
                    bytes += "\"" + value + "/1/2,3\"";
                    break;
                default:
                    bytes += value;
            }
        }
        bytes += '\n';
    }
    return bytes;
}

template <typename Parse>
void run(benchmark::State& state, Parse parse) {
    const std::string bytes = records(state.range(0));
    for (auto _ : state) {
        benchmark::DoNotOptimize(parse(bytes));
    }
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(bytes.size()));
    state.SetComplexityN(state.range(0));
}

/// libcsv with its fields in rows of type Row.
template <typename Row>
struct CsvRows {
    std::vector<Row> rows;
    Row row = {};
    int field = 0;

    void add(std::vector<std::string>& target, std::string value) {
        target.push_back(std::move(value));
    }
    void add(std::unordered_map<int, std::string>& target, std::string value) {
        target.emplace(field++, std::move(value));
    }

    static size_t parse(const std::string& bytes) {
        CsvRows result;
        csv_parser parser;
        csv_init(&parser, 0);
        const auto onField = [](void* text, size_t size, void* self) {
            auto* const rows = static_cast<CsvRows*>(self);
            rows->add(rows->row, std::string(static_cast<const char*>(text), size));
        };
        const auto onRow = [](int, void* self) {
            auto* const rows = static_cast<CsvRows*>(self);
            rows->rows.push_back(std::move(rows->row));
            rows->row = Row();
            rows->field = 0;
        };
        csv_parse(&parser, bytes.data(), bytes.size(), onField, onRow, &result);
        csv_fini(&parser, onField, onRow, &result);
        csv_free(&parser);
        return result.rows.size();
    }
};

int parseRecords(const std::string& bytes) {
    zemRecordSetsType results(0, 25, 1);
    zemParseRecords(bytes, nullptr, kFields, results);
    return results.size();
}

void ParseRecords(benchmark::State& state) { run(state, parseRecords); }
void LibcsvKeyed(benchmark::State& state) {
    run(state, CsvRows<std::unordered_map<int, std::string>>::parse);
}
void LibcsvRows(benchmark::State& state) { run(state, CsvRows<std::vector<std::string>>::parse); }

BENCHMARK(ParseRecords)
    ->Arg(1000)
    ->Arg(10000)
    ->Arg(100000)
    ->Arg(1000000)
    ->Complexity(benchmark::oN)
    ->Unit(benchmark::kMillisecond);
BENCHMARK(LibcsvKeyed)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(LibcsvRows)->Arg(100000)->Unit(benchmark::kMillisecond);

}  // namespace
