// Is reading the tools' records as fast as a plain CSV reader, and linear in their number?
//
// Records have ten fields, a third of them quoted. The other side is libcsv on the same bytes: once
// into the same record sets, and, as a measure of what these cost, with each field in a std::string
// in rows of a map keyed by field and of a flat vector.

#include <benchmark/benchmark.h>
#include <csv.h>

#include <memory>
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

/// Where libcsv's fields go: rows of one standard container each.
template <typename Row>
struct Rows {
    std::vector<Row> rows;
    Row row;

    void addField(const char* text, size_t size) { add(row, std::string(text, size)); }
    void endRow() {
        rows.push_back(std::move(row));
        row = Row();
    }
    size_t size() const { return rows.size(); }

private:
    static void add(std::vector<std::string>& target, std::string value) {
        target.push_back(std::move(value));
    }
    static void add(std::unordered_map<int, std::string>& target, std::string value) {
        target.emplace(static_cast<int>(target.size()), std::move(value));
    }
};

/// The same into what our own parser fills.
struct RecordSets {
    zemRecordSetsType records{0, 25, 1};
    std::unique_ptr<zemRecordType> record = std::make_unique<zemRecordType>(kFields);
    int field = 0;

    void addField(const char* text, size_t size) {
        record->insert(field++, zemString(text, static_cast<unsigned>(size)));
    }
    void endRow() {
        records.addElement(record.release());
        record = std::make_unique<zemRecordType>(kFields);
        field = 0;
    }
    int size() const { return records.size(); }
};

template <typename Target>
auto parseWithLibcsv(const std::string& bytes) {
    Target target;
    csv_parser parser;
    csv_init(&parser, 0);
    const auto onField = [](void* text, size_t size, void* self) {
        static_cast<Target*>(self)->addField(static_cast<const char*>(text), size);
    };
    const auto onRow = [](int, void* self) { static_cast<Target*>(self)->endRow(); };
    csv_parse(&parser, bytes.data(), bytes.size(), onField, onRow, &target);
    csv_fini(&parser, onField, onRow, &target);
    csv_free(&parser);
    return target.size();
}

int parseRecords(const std::string& bytes) {
    zemRecordSetsType results(0, 25, 1);
    zemParseRecords(bytes, nullptr, kFields, results);
    return results.size();
}

void ParseRecords(benchmark::State& state) { run(state, parseRecords); }
void LibcsvRecords(benchmark::State& state) { run(state, parseWithLibcsv<RecordSets>); }
void LibcsvKeyed(benchmark::State& state) {
    run(state, parseWithLibcsv<Rows<std::unordered_map<int, std::string>>>);
}
void LibcsvRows(benchmark::State& state) {
    run(state, parseWithLibcsv<Rows<std::vector<std::string>>>);
}

BENCHMARK(ParseRecords)
    ->Arg(1000)
    ->Arg(10000)
    ->Arg(100000)
    ->Arg(1000000)
    ->Complexity(benchmark::oN)
    ->Unit(benchmark::kMillisecond);
BENCHMARK(LibcsvRecords)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(LibcsvKeyed)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(LibcsvRows)->Arg(100000)->Unit(benchmark::kMillisecond);

}  // namespace
