// Any output of a tool parses to a record a line up to the first whose quotes are not closed, and
// records written with every field quoted read as they were. The first byte of the input says how
// many fields are wanted.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "RecordParser.h"

namespace {

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

std::string written(const zemRecordSetsType& records, unsigned count) {
    std::string lines;
    for (int i = 0; i < records.size(); ++i) {
        for (unsigned field = 0; field < count; ++field) {
            lines += field == 0 ? "\"" : ",\"";
            for (const char c : std::string((*records.getElementAt(i))[static_cast<int>(field)])) {
                lines.append(c == '"' ? 2 : 1, c);
            }
            lines += '"';
        }
        lines += '\n';
    }
    return lines;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const unsigned count = size > 0 ? data[0] % 12U : 0;
    const std::string output(data + (size > 0 ? 1 : 0), data + size);
    zemRecordSetsType records(0, 25, 1), again(0, 25, 1);
    const bool isWhole = zemParseRecords(output, nullptr, count, records);
    const auto lines = std::count(output.begin(), output.end(), '\n') +
                       (output.empty() || output.back() == '\n' ? 0 : 1);
    require(isWhole ? records.size() == lines : records.size() < lines);
    const std::string all = written(records, count);
    require(zemParseRecords(all, nullptr, count, again) && written(again, count) == all);
    return 0;
}
