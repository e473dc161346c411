/// Answers of the tools, taken apart by a reader of the tests' own.
#ifndef TOOL_RECORDS_H
#define TOOL_RECORDS_H

#include <gtest/gtest.h>

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

/// A command line, and what it answers: on standard error if that begins with a message's code.
struct ToolRow {
    std::string command;
    std::string answer = "";

    /// 1 is a refusal, 2 a wrong command line, 3 a state and 4 an output that cannot be used.
    int exit() const {
        if (answer.rfind("WRTL", 0) != 0) {
            return 0;
        }
        const std::string code = answer.substr(4, 4);
        if (code == "1011") {
            return 1;  // a value that the host refuses
        }
        if (code == "2007") {
            return 4;
        }
        return code[0] == '1' ? 2 : code[0] == '2' ? 3 : 1;
    }
};

/// A test that runs the built programs.
class ToolTest : public testing::Test {
protected:
    testing_support::Outcome run(const std::string& command) { return m_appliance.run(command); }

    /// What a command that succeeds prints.
    std::string out(const std::string& command) {
        const auto outcome = run(command);
        EXPECT_EQ("", outcome.err) << command;
        return outcome.out;
    }
    void make(const std::string& command) { ASSERT_EQ(0, run("appliance " + command).exit); }
    std::string shown() { return out("appliance show --format json"); }

    void expectRows(const std::vector<ToolRow>& rows) {
        for (const ToolRow& row : rows) {
            const auto outcome = run(row.command);
            EXPECT_EQ(row.exit(), outcome.exit) << row.command;
            EXPECT_EQ(row.exit() == 0 ? row.answer : "", outcome.out) << row.command;
            EXPECT_EQ(row.exit() == 0 ? "" : row.answer, outcome.err) << row.command;
        }
    }

    /// Of answers these rows give the beginning.
    void expectRefused(const std::vector<ToolRow>& rows) {
        const std::string before = shown() + out("appliance journal --json");
        for (const ToolRow& row : rows) {
            const auto outcome = run(row.command);
            EXPECT_EQ(row.exit(), outcome.exit) << row.command;
            EXPECT_EQ("", outcome.out) << row.command;
            EXPECT_EQ(0U, outcome.err.find(row.answer)) << row.command << '\n' << outcome.err;
        }
        EXPECT_EQ(before, shown() + out("appliance journal --json"));
    }

    testing_support::TestAppliance m_appliance{ZEM_PROGRAMS};
};

/// The same, on the appliance of the demo.
class DemoTest : public ToolTest {
protected:
    DemoTest() { make("init"); }
};

#endif
