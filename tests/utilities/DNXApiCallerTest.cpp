// Calls of the management library, and what its answers become.

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <functional>
#include <thread>

#include "DNXApiCaller.h"
#include "Exception.h"
#include "Faults.h"
#include "TestAppliance.h"
#include "TraceTool.h"

namespace {

constexpr const char* kHost = "1111-AAA*0000001";
constexpr const char* kLpar = "3*1111-AAA*0000001";
constexpr zemApiReader kReader = {"zemHostSystem", "updateData", "getLparObj"};

// The trace reads its environment once, when the first wrapper is called.
const std::string kTraceFile = "/tmp/zemapitrace." + std::to_string(getpid());
const bool kTraced = setenv("VM_CIMPROVIDER_TRACE", "1", 1) == 0 &&
                     setenv("VM_CIMPROVIDER_TRACE_PATH", kTraceFile.c_str(), 1) == 0;

class DNXApiCallerTest : public testing::Test {
protected:
    DNXApiCallerTest() { EXPECT_EQ(0, m_appliance.run("appliance init").exit); }
    static void TearDownTestSuite() { std::remove(kTraceFile.c_str()); }

    /// Lets the next call of @p operation answer with @p code; without one it answers null.
    static void plan(const char* operation, std::optional<int> code) {
        appliance::PlannedFault fault;
        fault.name = operation;
        fault.code = code;
        fault.isNull = !code;
        appliance::planFault(fault);
    }

    testing_support::TestAppliance m_appliance{ZEM_PROGRAMS};
};

using OfAll = apiProp* (zemApiCaller::*)(const char*, int);
using OfKey = apiProp* (zemApiCaller::*)(const char*, const char*, int);

template <class Call>
struct Operation {
    const char* name;
    Call call;
};

#define OP(NAME) \
    { #NAME, &zemApiCaller::NAME }
constexpr Operation<OfAll> kOfAll[] = {OP(getAllCecs),
                                       OP(getAllLpars),
                                       OP(getAllLparProfiles),
                                       OP(getAllLparVirtualSerial),
                                       OP(getAllLparVirtualScsi),
                                       OP(getAllLparVirtualEthernet),
                                       OP(getAllIoSlots),
                                       OP(getAllCecMemoryCfg),
                                       OP(getAllCecProcessorCfg),
                                       OP(getAllCecMemoryPoolCfgs),
                                       OP(getAllCecProcessorPoolCfg),
                                       OP(getAllLparMemoryCfgs),
                                       OP(getAllLparProcessorCfgs)};
constexpr Operation<OfKey> kOfHost[] = {OP(getCecObj),
                                        OP(getAllLparsFromCec),
                                        OP(getAllLparProfilesFromCec),
                                        OP(getVirtualSerial),
                                        OP(getVirtualScsi),
                                        OP(getVirtualEthernet),
                                        OP(getIoSlots),
                                        OP(getCecMemoryCfg),
                                        OP(getCecProcessorCfg),
                                        OP(getCecMemoryPoolCfg),
                                        OP(getCecProcessorPoolCfg),
                                        OP(getAllLparMemoryCfg),
                                        OP(getAllLparProcessorCfg)};
constexpr Operation<OfKey> kOfLpar[] = {
    OP(getLparObj),         OP(getAllLparProfilesFromLpar), OP(getLparVirtualSerial),
    OP(getLparVirtualScsi), OP(getLparVirtualEthernet),     OP(getLparIoSlots),
    OP(getLparMemoryCfg),   OP(getLparProcessorCfg)};
#undef OP

TEST_F(DNXApiCallerTest, WrappersCallTheirOperationTimed) {
    std::vector<std::string> names;
    const auto expectCall = [&](const char* name,
                                const std::function<apiProp*(zemApiCaller&)>& call) {
        names.push_back(name);
        // Whoever answers a planned code is the operation of this name, and only it.
        plan(name, 40 + static_cast<int>(names.size()));
        zemApiCaller api;
        apiProp* const faulty = call(api);
        EXPECT_EQ(40 + static_cast<int>(names.size()), api.getReturnCode()) << name;
        zemApiCaller::freeApi(faulty);
        apiProp* const result = call(api);
        EXPECT_EQ(0, api.getReturnCode()) << name;
        EXPECT_EQ(result->rc, zemApiCaller(result).getReturnCode());
        api.freeApi();
        EXPECT_EQ(-1, api.getReturnCode());
    };
    for (const auto& row : kOfAll) {
        expectCall(row.name, [&](zemApiCaller& api) { return (api.*row.call)("", 2); });
    }
    for (const auto& row : kOfHost) {
        expectCall(row.name, [&](zemApiCaller& api) { return (api.*row.call)("", kHost, 2); });
    }
    for (const auto& row : kOfLpar) {
        expectCall(row.name, [&](zemApiCaller& api) { return (api.*row.call)("", kLpar, 2); });
    }
    expectCall("getLparProfile",
               [&](zemApiCaller& api) { return api.getLparProfile("", kLpar, "normal", 2); });

    // The background thread writes when 50 lines have come together.
    for (int i = 0; i < 50; ++i) CTimeLogerManager::getInstance()->log("padding");
    std::string trace;
    for (int i = 0; i < 100 && trace.find("getLparProfile end") == std::string::npos; ++i) {
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        trace = testing_support::contents(kTraceFile);
    }
    for (const std::string& name : names) {
        const std::size_t begin = trace.find(" zemApiCaller-" + name + " begin at ");
        const std::size_t end = trace.find(" zemApiCaller-" + name + " end at ");
        EXPECT_TRUE(begin < end && end != std::string::npos) << name;
    }
}

TEST_F(DNXApiCallerTest, ViewsReadAndForgive) {
    EXPECT_TRUE(zemApiProp(nullptr).getProperty("Name").isEmpty());
    EXPECT_EQ(-1, zemApiProp(nullptr).getReturnCode());
    zemAutoReleaseApiProp owner(zemApiCaller().getLparObj("", kLpar, 2));
    const zemApiProp lpar(owner.get() + 1);
    EXPECT_STREQ("web server", lpar.getProperty("UserDefinedName"));
    EXPECT_STREQ("", lpar.getProperty("userdefinedname"));
    EXPECT_STREQ("2", zemApiProp::getProperty(owner.get() + 1, "PartitionState"));
    EXPECT_EQ(nullptr, zemApiProp::getProperty(owner.get() + 1, "Absent"));
    owner.reset(owner.get());  // the same result stays
    EXPECT_STREQ(kLpar, lpar.getProperty("Name"));
    owner.reset(zemApiCaller().getCecObj("", kHost, 1));
    EXPECT_STREQ("alpha", zemApiProp(owner.get() + 1).getProperty("UserDefinedName"));
}

/// What a failure says: kind, class-method, access method, id, text.
std::string failureOf(const std::function<void()>& work) {
    try {
        work();
        return "none";
    } catch (const zemException& e) {
        return std::to_string(e.getExceptionType()) + '|' + e.getThrowingClass() + '-' +
               e.getThrowingMethod() + '|' + e.getAccessMethod() + '|' + e.getExceptionId() + '|' +
               e.getExceptionString();
    }
}

TEST_F(DNXApiCallerTest, CodesBecomeFailures) {
    const struct {
        int code;
        const char* name;
        const char* end;  ///< of the text
    } rows[] = {
        {-1, "DNX_API_FAILED", "API operation can not be finished correctly."},
        {1, "DNX_API_INVALID_INPUT", "parameter is invalid, e.g. Null MTMS, etc."},
        {2, "DNX_API_INVALID_STATE", "while it is already in \"Active\" state already."},
        {3, "DNX_API_UNKNOWN_SYTEM", "is invalid or it is not managed by the DNX."},
        {4, "DNX_API_INVALID_BKN", "cause of this type of exception is bad network set up."},
        {5, "DNX_API_NOT_SUPPORTED", "by the DNX API on the CEC, lpar, or OS."},
        {6, "DNX_API_ACCESS_DENIED", "permission to execute the required functions."},
        {7, "DNX_API_NOT_FOUND", "has been found for the requested query."},
        {8, "DNX_API_UNKNOWN", "Undefined error."},
        {-2, "DNX_API_UNKNOWN", "Undefined error."},
    };
    for (const auto& row : rows) {
        EXPECT_STREQ(row.name, errorCodeToString(row.code));
        const std::string text = getErrorString(row.code), end = row.end;
        EXPECT_EQ(end, text.substr(text.size() - std::min(text.size(), end.size())));
        plan("getLparObj", row.code);
        const char* start = row.code == 6   ? "1|zemHostSystem-updateData||"
                            : row.code == 7 ? "5|zemHostSystem-updateData|getLparObj|"
                                            : "6|zemHostSystem-updateData||";
        EXPECT_EQ(std::string(start) + row.name + '|' + text, failureOf([] {
                      zemApiObjects(kReader, zemApiCaller().getLparObj("", kLpar, 1));
                  }));
    }
    EXPECT_STREQ("DNX_API_SUCCESS", errorCodeToString(0));
}

TEST_F(DNXApiCallerTest, NoResultIsTheReadersDecision) {
    const struct {
        const char* id;
        std::string failure;
    } rows[] = {
        {"-1", "||-1|Internal Error:API(\"getLparObj\") calling failed"},
        {"UNKNOWN", "||UNKNOWN|Internal Error:API(\"getLparObj\") calling failed"},
        {nullptr, std::string("||DNX_API_FAILED|") + getErrorString(-1)},
    };
    for (const auto& row : rows) {
        zemApiReader reader = kReader;
        reader.nullId = row.id;
        plan("getLparObj", {});
        EXPECT_EQ("6|zemHostSystem-updateData" + row.failure, failureOf([&] {
                      zemApiObjects(reader, zemApiCaller().getLparObj("", kLpar, 1));
                  }));
    }
}

struct Names {
    void addName(const zemString& name) { text += std::string(name) + ';'; }
    void addBoot(const zemString& mode) { text += std::string(mode) + ' '; }
    std::string text;
};

TEST_F(DNXApiCallerTest, ObjectsAreWalked) {
    using Setter = void (Names::*)(const zemString&);
    static constexpr zemApiField<Setter> kFields[] = {{"UserDefinedName", &Names::addName},
                                                      {"BootMode", &Names::addBoot}};
    Names names;
    const zemApiObjects lpars(kReader,
                              zemApiCaller().getAllLparsFromCec("", "1111-AAC*0000003", 1));
    for (apiProp& lpar : lpars) zemReadApiFields(&lpar, names, kFields);
    EXPECT_EQ("xbrg;1 linux-a;1 my-test;1 ", names.text);
    EXPECT_EQ(lpars.begin(), &lpars.only("any"));

    // Code 0 without objects, and the two ways of code 7.
    const zemApiObjects none(kReader, zemApiCaller().getAllLparsFromCec("", "1111-AAD*0000004", 1));
    EXPECT_EQ(0U, none.size());
    EXPECT_EQ(none.begin(), none.end());
    EXPECT_EQ("5|zemHostSystem-updateData|||the key", failureOf([&] { none.only("the key"); }));
    zemApiReader forgiving = kReader;
    forgiving.notFoundIsEmpty = true;
    const char* missing = "99*1111-AAA*0000001";
    EXPECT_EQ(0U, zemApiObjects(forgiving, zemApiCaller().getLparObj("", missing, 1)).size());
}

}  // namespace
