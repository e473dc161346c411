/// Tools for a test: scripts of its own ahead of the real ones, and what they left behind.
#pragma once

#include <gtest/gtest.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <iterator>
#include <string>
#include <vector>

#include "../support/TestAppliance.h"
#include "CommandCaller.h"
#include "FailureText.h"

class ToolFolder : public testing_support::TestAppliance {
public:
    /// PATH is the scripts and the system's programs alone: a folder on it that may not be searched
    /// would make a missing tool one that is refused.
    ToolFolder() : TestAppliance("/usr/bin") {
        setenv("PATH", (file("bin") + ":/usr/bin:/bin").c_str(), 1);
    }

    /// Makes the demo's appliance, or another, whose tools come behind the scripts.
    void makeAppliance(const std::string& programs, const std::string& how = "init") {
        EXPECT_EQ(0, run(programs + "/appliance " + how).exit);
        setenv("PATH", (file("bin") + ':' + programs + ":/usr/bin:/bin").c_str(), 1);
    }

    /// Makes a shell script, to which $here is the folder of file().
    void script(const std::string& name, const std::string& body) {
        replaceTool(name, "here=" + folder().string() + '\n' + body);
    }

    /// Makes a script that keeps its arguments for arguments() and then prints @p output.
    void recorder(const std::string& name, const std::string& output = "") {
        std::ofstream(file("output")) << output;
        script(name, "for a; do printf '%s\\0' \"$a\"; done >$here/argv; cat $here/output");
    }

    /// The arguments of the last recorder that ran, with "|" between them.
    std::string arguments() const {
        std::string all = read("argv");
        std::replace(all.begin(), all.end(), '\0', '|');
        return all.substr(0, all.empty() ? 0 : all.size() - 1);
    }

    std::string file(const std::string& name) const { return (folder() / name).string(); }
    std::string read(const std::string& name) const {
        return testing_support::contents(file(name));
    }
};

/// What an operation prints, and the line of its tool in that.
struct LoggedCall {
    std::string log;
    std::string line;
};

/// Runs @p operation, whose tool prints @p output, and holds what the tool receives against what
/// the shell makes of the line that is logged: to it, these lines mean the same.
inline LoggedCall logged(const std::string& tool, const std::string& output,
                         const std::function<void()>& operation) {
    ToolFolder tools;
    tools.recorder(tool, output);
    testing::internal::CaptureStdout();
    EXPECT_NO_THROW(operation());
    const std::string log = testing::internal::GetCapturedStdout();
    const size_t begin = log.find(tool + ' ');
    const std::string line = log.substr(begin, log.find('\n', begin) - begin);
    const std::string received = tools.read("argv");
    tools.run(line);
    EXPECT_EQ(tools.read("argv"), received) << line;
    return {log, line};
}

/// Reads a stream, blocking or not, to its end and closes it.
inline std::string readAll(FILE* stream) {
    std::string text;
    for (char buffer[4096];;) {
        pollfd ready = {fileno(stream), POLLIN, 0};
        poll(&ready, 1, -1);
        const ssize_t n = read(fileno(stream), buffer, sizeof buffer);
        if (n <= 0) {
            break;
        }
        text.append(buffer, static_cast<size_t>(n));
    }
    fclose(stream);
    return text;
}

/// Attributes for a change tool.
inline zemDynamicArray<tagAttributePair> pairs(const std::vector<tagAttributePair>& list) {
    zemDynamicArray<tagAttributePair> all;
    for (const tagAttributePair& pair : list) {
        all.addElement(new tagAttributePair(pair));
    }
    return all;
}

/// Descriptors that this process holds open, and whether it has a child, ended or not.
inline long openDescriptors() {
    return std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {});
}
inline bool hasChildren() { return waitpid(-1, nullptr, WNOHANG) != -1 || errno != ECHILD; }
