// Any output of a tool parses to the same records as a parser that counts quotes byte by byte. The
// first byte of the input says how many fields are wanted.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include "RecordParser.h"

namespace {

using Record = std::vector<std::string>;

bool parseByCounting(const std::string& output, unsigned count, std::vector<Record>& records) {
    for (std::size_t begin = 0; begin < output.size();) {
        const std::size_t end = std::min(output.find('\n', begin), output.size());
        std::size_t at = begin;
        Record record(count);
        for (std::string& value : record) {
            int opened = 0;
            int closed = 0;
            for (; at < end && output[at] != '\0'; ++at) {
                if (output[at] == '"' && opened > closed && at + 1 < end && output[at + 1] == '"') {
                    value += output[at++];
                } else if (output[at] == '"') {
                    ++(opened > closed ? closed : opened);
                } else if (output[at] == ',' && opened == closed) {
                    break;
                } else {
                    value += output[at];
                }
            }
            if (opened != closed) {
                return false;
            }
            at += at < end ? 1 : 0;
        }
        records.push_back(record);
        begin = end + 1;
    }
    return true;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const unsigned count = size > 0 ? data[0] % 12U : 0;
    const std::string output(data + (size > 0 ? 1 : 0), data + size);
    std::vector<Record> expected;
    const bool valid = parseByCounting(output, count, expected);
    zemRecordSetsType records(0, 25, 1);
    if (zemParseRecords(output, nullptr, count, records) != valid ||
        records.size() != static_cast<int>(expected.size())) {
        std::abort();
    }
    for (int i = 0; i < records.size(); ++i) {
        const Record& record = expected[static_cast<std::size_t>(i)];
        for (unsigned field = 0; field < count; ++field) {
            if (record[field] != std::string((*records.getElementAt(i))[static_cast<int>(field)])) {
                std::abort();
            }
        }
    }
    return 0;
}
