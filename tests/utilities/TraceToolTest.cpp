#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <regex>

#include "OnThreads.h"
#include "ToolFolder.h"
#include "TraceTool.h"

namespace {

using namespace std::chrono_literals;
namespace fs = std::filesystem;
using testing_support::contents;
using testing_support::lines;

// The manager reads the environment once in the life of a process, so each case is a process:
// a fork of this one, which itself never touches the manager.
class TraceToolTest : public testing::Test {
protected:
    ~TraceToolTest() override {
        fs::remove(m_trace);
        fs::remove(m_output);
    }

    // Runs the work with tracing switched by the variables, null meaning unset, and returns what
    // it wrote to standard output. Its failed expectations make the process, and this test, fail.
    std::string run(const char* trace, const char* path, const std::function<void()>& work) const {
        std::fflush(stdout);
        const pid_t child = fork();
        if (child == 0) {
            std::freopen(m_output.c_str(), "w", stdout);
            const auto set = [](const char* name, const char* value) {
                value == nullptr ? unsetenv(name) : setenv(name, value, 1);
            };
            set("VM_CIMPROVIDER_TRACE", trace);
            set("VM_CIMPROVIDER_TRACE_PATH", path);
            work();
            std::exit(HasFailure() ? 1 : 0);
        }
        int status = -1;
        EXPECT_EQ(waitpid(child, &status, 0), child);
        EXPECT_EQ(status, 0) << contents(m_output);
        return contents(m_output);
    }

    bool waitForLines(std::size_t count) const {
        return within(50s, [&] { return lines(contents(m_trace)).size() >= count; }) &&
               lines(contents(m_trace)).size() == count;
    }

    const std::string m_trace = testing::TempDir() + "timing" + std::to_string(getpid());
    const std::string m_output = m_trace + ".stdout";
};

TEST_F(TraceToolTest, OffUnlessAskedFor) {
    const std::string output = run(nullptr, m_trace.c_str(), [] {
        CTimeLogerManager* const manager = CTimeLogerManager::getInstance();
        CTimeLoger* const logger = manager->getLogger("x");
        EXPECT_EQ(logger, manager->getLogger("y"));
        EXPECT_STREQ(logger->getId(), "dummy");
        EXPECT_FALSE(manager->isEnabled());
        logger->begin("k");
        logger->end("k");
        manager->log("line");
        EXPECT_EQ(manager->getLogQueue(), nullptr);
    });
    EXPECT_EQ(output, "env not set for VM_CIMPROVIDER_TRACE\n");
    EXPECT_FALSE(fs::exists(m_trace));
}

TEST_F(TraceToolTest, SaysWhereTheDefaultFileIsAndEndsWithoutWaitingForThePoll) {
    const bool wasThere = fs::exists("/tmp/CIMTestPerfData.txt");
    const auto start = std::chrono::steady_clock::now();
    for (int i = 0; i < 5; ++i) {
        EXPECT_EQ(run("", nullptr, CTimeLogerManager::getInstance),
                  "env not set for VM_CIMPROVIDER_TRACE_PATH\npath:/tmp/CIMTestPerfData.txt\n");
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, 2400ms);
    if (!wasThere) {
        fs::remove("/tmp/CIMTestPerfData.txt");
    }
}

TEST_F(TraceToolTest, FiftyLinesAreWrittenFewerWait) {
    const std::string output = run("", m_trace.c_str(), [this] {
        CTimeLogerManager* const manager = CTimeLogerManager::getInstance();
        CTimeLoger* const logger = manager->getLogger("op");
        EXPECT_EQ(logger, manager->getLogger("op"));
        EXPECT_NE(logger, manager->getLogger("other"));
        logger->begin(std::string(10000, 'k').c_str());
        logger->end("short");
        logger->log("a", "b", "c");
        for (int i = 3; i < 49; ++i) {
            manager->log("fill");
        }
        usleep(1200000);  // two polls of the drain
        EXPECT_TRUE(lines(contents(m_trace)).empty());
        manager->log("fill");
        EXPECT_TRUE(waitForLines(50));
    });
    EXPECT_EQ(output, "path:" + m_trace + "\n");
    std::vector<std::string> written = lines(contents(m_trace));
    ASSERT_EQ(written.size(), 50U);
    const std::size_t key = written[0].find("kkk");
    EXPECT_EQ(written[0].substr(key, 10000), std::string(10000, 'k'));
    written[0].erase(key, 9999);
    const char* const forms[] = {R"(\+\+\+op:-?\d+ op-k begin at \d{16}\.)",
                                 R"(\+\+\+op:-?\d+ op-short end at \d{16}\.)",
                                 R"(\+\+\+op:-?\d+,\d{16}, op,a-b,c)"};
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_TRUE(std::regex_match(written[i], std::regex(forms[i]))) << written[i];
    }
}

// ZEM_TRACE_LINES is the number of lines of each thread, for a long run.
TEST_F(TraceToolTest, ThreadsLinesArriveWholeAndInOrder) {
    constexpr int threadCount = 8;
    const char* const wanted = std::getenv("ZEM_TRACE_LINES");
    const int lineCount = wanted == nullptr ? 4000 : std::atoi(wanted);
    run("", m_trace.c_str(), [&] {
        onThreads(threadCount, [&](int number) {
            for (int i = 0; i < lineCount; ++i) {
                zemString key;
                key.format("<%d/%d>", number, i);
                // Half of the loggers are shared.
                CTimeLogerManager::getInstance()->getLogger(zemString(number / 2))->begin(key);
            }
        });
        for (int i = 0; i < 50; ++i) {
            CTimeLogerManager::getInstance()->log("fill");
        }
        EXPECT_TRUE(waitForLines(static_cast<std::size_t>(threadCount * lineCount) + 50));
    });
    int next[threadCount] = {};
    const std::regex form(R"(\+\+\+\d:-?\d+ (\d)-<(\d)/(\d+)> begin at \d{16}\.)");
    for (const std::string& line : lines(contents(m_trace))) {
        std::smatch match;
        if (line != "fill") {
            ASSERT_TRUE(std::regex_match(line, match, form)) << line;
            ASSERT_EQ(std::stoi(match[3]), next[std::stoi(match[2])]++);
        }
    }
    EXPECT_EQ(std::count(next, next + threadCount, lineCount), threadCount);
}

// What lies at the file's name cannot keep an operation waiting or lead it elsewhere.
TEST_F(TraceToolTest, OpensNothingButAFileOfItsOwn) {
    const auto fill = [this] {
        alarm(20);
        for (int i = 0; i < 50; ++i) {
            CTimeLogerManager::getInstance()->log("fill");
        }
        usleep(700000);  // more than a poll of the drain
        for (const auto& entry : fs::directory_iterator("/proc/self/fd")) {
            std::error_code gone;
            if (fs::read_symlink(entry, gone) != m_trace) {
                continue;
            }
            const int fd = std::stoi(entry.path().filename());
            EXPECT_EQ(FD_CLOEXEC, fcntl(fd, F_GETFD));
        }
        const long before = openDescriptors();
        { const CFileLoger given("/dev/null"); }
        EXPECT_EQ(before, openDescriptors());
    };
    ASSERT_EQ(0, mkfifo(m_trace.c_str(), 0600));
    run("", m_trace.c_str(), fill);
    fs::remove(m_trace);
    fs::create_symlink(m_output + ".linked", m_trace);
    run("", m_trace.c_str(), fill);
    EXPECT_FALSE(fs::exists(m_output + ".linked"));
    fs::remove(m_trace);
    run("", m_trace.c_str(), fill);
    EXPECT_EQ(fs::perms::owner_read | fs::perms::owner_write, fs::status(m_trace).permissions());
    EXPECT_EQ(50U, lines(contents(m_trace)).size());
}

// Threads may still be timing when the process has begun to end; a child of a fork has no thread
// that it could wait for.
TEST_F(TraceToolTest, LateLinesAreDropped) {
    run("", m_trace.c_str(), [] {
        static CTimeLoger* logger = nullptr;
        static const pid_t process = getpid();
        const auto late = [] {
            if (getpid() != process) {
                return;  // a lock of the drain's may be held there for good
            }
            for (int i = 0; i < 100; ++i) {
                logger->end("late");
            }
            CTimeLogerManager::getInstance()->getLogger("later")->begin("late");
        };
        std::atexit(late);  // runs behind the end of all that is made from here on
        logger = CTimeLogerManager::getInstance()->getLogger("op");
        const pid_t child = fork();
        if (child == 0) {
            std::exit(0);
        }
        int status = -1;
        EXPECT_EQ(child, waitpid(child, &status, 0));
        EXPECT_EQ(0, status);
    });
    EXPECT_TRUE(lines(contents(m_trace)).empty());
}

TEST_F(TraceToolTest, FileLoggerWritesAtOnce) {
    const std::string path = "/tmp/CIMTest-" + std::to_string(zemThread::getCurrentThreadId());
    fs::remove(path);
    CTimeFileLoger logger("id");
    logger.end("k");
    const std::string line = lines(contents(path)).at(0);
    fs::remove(path);
    const std::regex form(R"(\+\+id: \+\+\+id:-?\d+ id-k end at \d{16}\.)");
    EXPECT_TRUE(std::regex_match(line, form)) << line;
}

TEST(TimerTest, ElapsedTimes) {
    CTimer timer;
    usleep(20000);
    const std::uint64_t second = timer.timer(0);
    usleep(10000);
    const int step = static_cast<int>(timer.timer(0) - second);
    EXPECT_EQ(timer.getElapsedTime(CTimer::fromprevious, CTimer::micro), step);
    EXPECT_EQ(timer.getElapsedTime(CTimer::fromprevious, CTimer::milli), step / 1000);
    EXPECT_GE(timer.getElapsedTime(CTimer::frombegin, CTimer::milli), 30);
}

}  // namespace
