#include <gtest/gtest.h>

#include <string>

#include "Log.h"
#include "ProviderTracer.h"
#include "cmpift.h"

namespace {

int levelTraced;
std::string textTraced;

CMPIStatus takeTrace(const CMPIBroker*, CMPILevel level, const char* component, const char* text,
                     const CMPIString* string) {
    EXPECT_STREQ("P", component);
    EXPECT_EQ(nullptr, string);
    levelTraced = static_cast<int>(level);
    textTraced = text;
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
    static std::string output() { return testing::internal::GetCapturedStdout(); }

    CMPIBrokerEncFT table = {};
    CMPIBroker broker = {};
};

TEST_F(ProviderTracer, WritesEntryAndExitToBothPlaces) {
    zemProviderTracer::_traceEnter(&broker, "f.cpp", 7, "P", "void C::run(int)");
    EXPECT_EQ(1, levelTraced);
    EXPECT_EQ("<f.cpp:7> Entering method void C::run", textTraced);
    zemProviderTracer::_traceExit(&broker, "f.cpp", 8, "P", std::string(300, 'x').c_str());
    EXPECT_EQ("<f.cpp:8> Exiting method " + std::string(255, 'x'), textTraced);
    zemProviderTracer::_traceString(&broker, "f.cpp", 9, 3, "P", "%s of %d%%", "90%s", 5);
    EXPECT_EQ(3, levelTraced);
    EXPECT_EQ(line("<f.cpp:7> Entering method void C::run") +
                  line("<f.cpp:8> Exiting method " + std::string(255, 'x')) +
                  line("<f.cpp:9> 90%s of 5%"),
              output());
}

TEST_F(ProviderTracer, ReadsThePercentOfAFileNameAsAConversion) {
    zemProviderTracer::_traceString(&broker, "a%%b.cpp", 1, 4, "P", "x");
    EXPECT_EQ(line("<a%b.cpp:1> x"), output());
}

TEST_F(ProviderTracer, CutsLongLines) {
    zemProviderTracer::_traceString(&broker, "f", 1, 4, "P", "%s", std::string(5000, 'x').c_str());
    EXPECT_EQ(1023U, textTraced.size());
    // Formats too long for the buffer, of which the last conversion or percent sign is cut in two.
    for (const char* tail : {"%-9ld", "%%", "%%%%d"}) {
        for (size_t length = 1010; length < 1024; ++length) {
            const std::string format = std::string(length, 'x') + tail;
            zemProviderTracer::_traceString(&broker, "f", 1, 4, "P", format.c_str(), 1L);
            EXPECT_EQ(0U, textTraced.find("<f:1> xxx"));
        }
    }
    output();
}

TEST_F(ProviderTracer, SurvivesEveryBroker) {
    zemProviderTracer::_traceEnter(nullptr, "f", 1, "P", "m");
    zemProviderTracer::_traceExit(nullptr, "f", 1, "P", "m");
    zemProviderTracer::_traceString(nullptr, "f", 1, 4, "P", "text");
    table.trace = throwTrace;
    zemProviderTracer::_traceEnter(&broker, "f", 1, "P", "thrown");
    table.trace = nullptr;
    zemProviderTracer::_traceEnter(&broker, "f", 1, "P", "no entry");
    broker.eft = nullptr;
    zemProviderTracer::_traceEnter(&broker, nullptr, 1, "P", nullptr);
    EXPECT_EQ(line("<f:1> Entering method thrown") + line("<f:1> Entering method no entry") +
                  line("<:1> Entering method "),
              output());
}

TEST_F(ProviderTracer, LogsWithAndWithoutThePrefix) {
    zemLog::Log("a");
    zemLog::LogSysOut("b");
    zemLog::LogPlain("c");
    zemLog::Log(nullptr);
    EXPECT_EQ("<zem350Log-prefix>a\n<zem350Log-prefix>b\nc\n<zem350Log-prefix>\n", output());
}

}  // namespace
