/// Answers of the tools, taken apart by a reader of the tests' own.
#ifndef TOOL_RECORDS_H
#define TOOL_RECORDS_H

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "TestAppliance.h"

using Record = std::vector<std::string>;

/// The fields of one line: commas between them, quoted ones with doubled quotes inside.
inline Record fieldsOf(const std::string& line) {
    Record fields(1);
    bool inside = false;
    for (std::size_t i = 0; i < line.size(); ++i) {
        if (line[i] == '"' && inside && i + 1 < line.size() && line[i + 1] == '"') {
            fields.back() += line[++i];
        } else if (line[i] == '"') {
            inside = !inside;
        } else if (line[i] == ',' && !inside) {
            fields.emplace_back();
        } else {
            fields.back() += line[i];
        }
    }
    return fields;
}

inline std::vector<Record> recordsOf(const std::string& output) {
    std::vector<Record> records;
    for (const std::string& line : testing_support::lines(output)) {
        records.push_back(fieldsOf(line));
    }
    return records;
}

/// A command line and all that comes of it.
struct ToolRow {
    const char* command;
    int exit;
    const char* out;
    const char* err;
};

template <std::size_t N>
void expectRows(testing_support::TestAppliance& appliance, const ToolRow (&rows)[N]) {
    for (const ToolRow& row : rows) {
        const auto outcome = appliance.run(row.command);
        EXPECT_EQ(row.exit, outcome.exit) << row.command;
        EXPECT_EQ(row.out, outcome.out) << row.command;
        EXPECT_EQ(row.err, outcome.err) << row.command;
    }
}

/// Whether the values of an attribute change from one call to the next.
inline bool moves(const std::string& attribute) {
    return attribute.find("time") != std::string::npos ||
           attribute.find("cycles") != std::string::npos;
}

/// Asks for every attribute of @p names (with commas between them) alone, and for all at once.
/// @return what is wrong, empty when each has a value in some record and the answers agree
inline std::string faultsOfTable(testing_support::TestAppliance& appliance,
                                 const std::string& command, const std::string& names) {
    const auto whole = recordsOf(appliance.run(command + " -F " + names).out);
    const auto bare = recordsOf(appliance.run(command + " -F").out);
    const Record attributes = fieldsOf(names);
    const auto agree = [&](const std::vector<Record>& records, std::size_t width, std::size_t from,
                           std::size_t at) {
        if (records.size() != whole.size()) return false;
        for (std::size_t i = 0; i < records.size(); ++i) {
            if (records[i].size() != width || whole[i].size() != attributes.size()) return false;
            if (!moves(attributes[at]) && records[i][from] != whole[i][at]) return false;
        }
        return true;
    };
    std::string faults;
    for (std::size_t i = 0; i < attributes.size(); ++i) {
        const auto one = appliance.run(command + " -F " + attributes[i]);
        const auto records = recordsOf(one.out);
        const bool hasValue = std::any_of(records.begin(), records.end(),
                                          [](const Record& record) { return record[0] != ""; });
        if (one.exit != 0 || !hasValue || !agree(records, 1, 0, i) ||
            !agree(bare, attributes.size(), i, i)) {
            faults += command + ' ' + attributes[i] + ": " + one.err + '\n';
        }
    }
    return faults;
}

#endif
