/// The timing trace, switched on for a test program.
#pragma once

#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <string>
#include <thread>

/// To be made before main: the process reads its environment once, at the first timed operation.
class TimingTrace {
public:
    explicit TimingTrace(const std::string& name)
        : m_file("/tmp/" + name + "." + std::to_string(getpid())) {
        setenv("VM_CIMPROVIDER_TRACE", "1", 1);
        setenv("VM_CIMPROVIDER_TRACE_PATH", m_file.c_str(), 1);
    }
    ~TimingTrace() { std::filesystem::remove(m_file); }

    /// All lines once @p text is among them, or what there is after five seconds. The trace writes
    /// fifty lines at a time, so @p work makes more of them meanwhile.
    std::string waitFor(const std::string& text, const std::function<void()>& work) const {
        std::string lines;
        for (int i = 0; i < 100 && lines.find(text) == std::string::npos; ++i) {
            for (int more = 0; more < 10; ++more) {
                work();
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(50));
            std::ifstream file(m_file);
            lines.assign(std::istreambuf_iterator<char>(file), {});
        }
        return lines;
    }

private:
    const std::string m_file;
};
