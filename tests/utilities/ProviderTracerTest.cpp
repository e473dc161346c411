#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include <vector>

#include "Log.h"
#include "ProviderTracer.h"
#include "cmpift.h"

namespace {

std::string traced;

CMPIStatus takeTrace(const CMPIBroker*, CMPILevel level, const char* component, const char* text,
                     const CMPIString* string) {
    EXPECT_EQ(nullptr, string);
    traced = std::to_string(static_cast<int>(level)) + component + text;
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIStatus throwTrace(const CMPIBroker*, CMPILevel, const char*, const char*, const CMPIString*) {
    throw 1;
}

class ProviderTracer : public testing::Test {
protected:
    ProviderTracer() {
        broker.eft = &table;
        table.trace = takeTrace;
        testing::internal::CaptureStdout();
    }
    static std::string line(const std::string& message) {
        return "<zem350Log-prefix>Component:P, Log message: " + message + "\n";
    }

    CMPIBrokerEncFT table = {};
    CMPIBroker broker = {};
};

TEST_F(ProviderTracer, WritesToBothPlaces) {
    const std::string longName(300, 'x');
    zemProviderTracer::_traceEnter(&broker, "f.cpp", 7, "P", "void C::run(int)");
    EXPECT_EQ("1P<f.cpp:7> Entering method void C::run", traced);
    zemProviderTracer::_traceExit(&broker, "f.cpp", 8, "P", longName.c_str());
    EXPECT_EQ("1P<f.cpp:8> Exiting method " + longName.substr(45), traced);
    zemProviderTracer::_traceString(&broker, "f%%.cpp", 9, 3, "P", "%s of %d%%", "90%s", 5);
    EXPECT_EQ("3P<f%.cpp:9> 90%s of 5%", traced);
    zemLog::LogPlain(nullptr);
    EXPECT_EQ(line("<f.cpp:7> Entering method void C::run") +
                  line("<f.cpp:8> Exiting method " + longName.substr(45)) +
                  line("<f%.cpp:9> 90%s of 5%") + "\n",
              testing::internal::GetCapturedStdout());
}

// Too long a text, and formats of which the last conversion or percent sign is cut in two.
TEST_F(ProviderTracer, CutsLongLines) {
    zemProviderTracer::_traceString(&broker, "f", 1, 4, "P", "%s", std::string(5000, 'x').c_str());
    EXPECT_EQ(2U + 1023U, traced.size());
    for (const char* tail : {"%-9ld", "%%", "%%%%d"}) {
        for (size_t length = 1010; length < 1024; ++length) {
            const std::string format = std::string(length, 'x') + tail;
            zemProviderTracer::_traceString(&broker, "f", 1, 4, "P", format.c_str(), 1L);
            EXPECT_EQ(0U, traced.find("4P<f:1> xxx"));
        }
    }
    testing::internal::GetCapturedStdout();
}

TEST_F(ProviderTracer, SurvivesEveryBroker) {
    zemProviderTracer::_traceEnter(nullptr, "f", 1, "P", "m");
    zemProviderTracer::_traceString(nullptr, "f", 1, 4, "P", "text");
    table.trace = throwTrace;
    zemProviderTracer::_traceEnter(&broker, "f", 1, "P", "thrown");
    table.trace = nullptr;
    zemProviderTracer::_traceEnter(&broker, nullptr, 1, "P", nullptr);
    EXPECT_EQ(line("<f:1> Entering method thrown") + line("<:1> Entering method "),
              testing::internal::GetCapturedStdout());
}

// A client's text cannot begin a line of its own, and what comes of it fits the buffer; the
// library's own texts of several lines are indented, and stay.
TEST_F(ProviderTracer, EscapesControlCharacters) {
    const std::pair<std::string, std::string> rows[] = {
        {"k\n<zem350Log-prefix>forged", "k\\n<zem350Log-prefix>forged"},
        {"\r\x1b[2J\x7f\tk\\n\xc3\xa4", "\\r\\x1B[2J\\x7F\tk\\n\xc3\xa4"},
        {"{\n    a = 1}\n\tid\n", "{\n    a = 1}\n\tid\n"},
    };
    std::string lines;
    for (const auto& [text, escaped] : rows) {
        zemProviderTracer::_traceString(&broker, "f", 1, 4, "P", "%s", text.c_str());
        EXPECT_EQ("4P<f:1> " + escaped, traced);
        lines += line("<f:1> " + escaped);
    }
    zemLog::LogPlain("a\nb");
    EXPECT_EQ(lines + "a\\nb\n", testing::internal::GetCapturedStdout());
    zemProviderTracer::_traceString(&broker, "f", 1, 4, "P", "%s",
                                    std::string(999, '\x01').c_str());
    EXPECT_EQ(2U + 1023U, traced.size());
    EXPECT_EQ(0U, traced.find("4P<f:1> \\x01\\x01"));
}

// Standard output without a reader, and closed: nobody gets a signal, now or later, and one that
// waits for this thread stays.
TEST(Log, AReaderThatIsGoneHarmsNobody) {
    std::fflush(stdout);
    const int saved = dup(STDOUT_FILENO);
    int ends[2];
    ASSERT_EQ(0, pipe(ends));
    dup2(ends[1], STDOUT_FILENO);
    for (const int end : ends) {
        close(end);
    }
    sigset_t none, pipeSignal, seen, waiting;
    sigemptyset(&none);
    sigemptyset(&pipeSignal);
    sigaddset(&pipeSignal, SIGPIPE);
    const auto waits = [&](const sigset_t& mask) {
        pthread_sigmask(SIG_SETMASK, &mask, nullptr);
        zemLog::Log("nobody reads this");
        pthread_sigmask(SIG_SETMASK, nullptr, &seen);
        sigpending(&waiting);
        return sigismember(&waiting, SIGPIPE) + 10 * sigismember(&seen, SIGPIPE);
    };
    const int open = waits(none), held = waits(pipeSignal);
    raise(SIGPIPE);
    const int raised = waits(pipeSignal);
    const timespec now = {};
    sigtimedwait(&pipeSignal, nullptr, &now);
    close(STDOUT_FILENO);
    const int closed = waits(none);
    dup2(saved, STDOUT_FILENO);
    close(saved);
    EXPECT_EQ((std::vector<int>{0, 10, 11, 0}), (std::vector<int>{open, held, raised, closed}));
}

}  // namespace
