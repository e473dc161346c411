#include <gtest/gtest.h>

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

}  // namespace
