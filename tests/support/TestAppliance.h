/// An appliance of its own for one test: a temporary folder, the built programs first on PATH,
/// and any program run with its streams caught. For tests alone; not thread-safe, as it changes
/// the environment.
#pragma once

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "../cimom/Folder.h"

namespace testing_support {

namespace fs = std::filesystem;

inline std::string contents(const fs::path& file) {
    std::ifstream in(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), {}};
}

inline std::vector<std::string> lines(const std::string& text) {
    std::vector<std::string> result;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);) {
        result.push_back(line);
    }
    return result;
}

/// Sets an environment variable until the end of the scope.
class ScopedEnvironment {
public:
    ScopedEnvironment(const char* name, const std::string& value) : m_name(name) {
        const char* before = std::getenv(name);
        m_had = before != nullptr;
        if (m_had) {
            m_before = before;
        }
        setenv(name, value.c_str(), 1);
    }
    ~ScopedEnvironment() {
        if (m_had) {
            setenv(m_name.c_str(), m_before.c_str(), 1);
        } else {
            unsetenv(m_name.c_str());
        }
    }
    ScopedEnvironment(const ScopedEnvironment&) = delete;
    ScopedEnvironment& operator=(const ScopedEnvironment&) = delete;

private:
    std::string m_name;
    std::string m_before;
    bool m_had = false;
};

struct Outcome {
    int exit = -1;  ///< exit status, or 256 + the signal's number
    std::string out;
    std::string err;
};

class TestAppliance {
public:
    /// @param programs  folder with the built programs
    explicit TestAppliance(const std::string& programs)
        : m_home("APPLIANCE_HOME", (m_folder / "appliance").string()),
          m_path("PATH", (m_folder / "bin").string() + ":" + programs + ":" + std::getenv("PATH")) {
        fs::create_directory(m_folder / "bin");
        fs::permissions(m_folder, fs::perms(0755));  // tools run as other users too
    }

    const fs::path& folder() const { return m_folder; }

    /// Puts a shell script ahead of the built program of that name.
    void replaceTool(const std::string& name, const std::string& script) {
        const fs::path file = m_folder / "bin" / name;
        std::ofstream(file) << "#!/bin/sh\n" << script << '\n';
        fs::permissions(file, fs::perms(0755));
    }
    void restoreTool(const std::string& name) { fs::remove(m_folder / "bin" / name); }

    /// Runs a shell command line.
    Outcome run(const std::string& command) {
        const fs::path out = m_folder / "out", err = m_folder / "err";
        const std::string line =
            "(" + command + ") >'" + out.string() + "' 2>'" + err.string() + "' </dev/null";
        const int status = std::system(line.c_str());
        Outcome outcome;
        outcome.exit = WIFEXITED(status) ? WEXITSTATUS(status) : 256 + WTERMSIG(status);
        outcome.out = contents(out);
        outcome.err = contents(err);
        return outcome;
    }

private:
    const fixture::Folder m_temporary;
    const fs::path m_folder = m_temporary.path();
    ScopedEnvironment m_home;
    ScopedEnvironment m_path;
};

/// The demo's appliance.
class DemoAppliance : public TestAppliance {
public:
    explicit DemoAppliance(const std::string& programs) : TestAppliance(programs) {
        EXPECT_EQ(run("appliance init").exit, 0);
    }
};

}  // namespace testing_support
