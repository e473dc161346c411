// Calls of the management library, and what its answers become.

#include <gtest/gtest.h>

#include <algorithm>
#include <tuple>

#include "DNXApiCaller.h"
#include "FailureText.h"
#include "LibraryFaults.h"
#include "TestAppliance.h"
#include "TimingTrace.h"
#include "TraceTool.h"

namespace {

constexpr const char* kHost = "1111-AAA*0000001";
constexpr const char* kLpar = "3*1111-AAA*0000001";
constexpr zemApiReader kReader = {"zemHostSystem", "updateData", "getLparObj"};

const TimingTrace timing("zemapitrace");

class DNXApiCallerTest : public testing::Test {
protected:
    DNXApiCallerTest() { EXPECT_EQ(0, m_appliance.run("appliance init").exit); }
    testing_support::TestAppliance m_appliance{ZEM_PROGRAMS};
};

/// A wrapper by the name of its operation, called for all objects or for those of a key.
using Wrapper = std::pair<const char*, std::function<apiProp*(zemApiCaller&)>>;
#define OF_ALL(NAME) Wrapper(#NAME, [](zemApiCaller& api) { return api.NAME("", 2); })
#define OF(KEY, NAME) Wrapper(#NAME, [](zemApiCaller& api) { return api.NAME("", KEY, 2); })

TEST_F(DNXApiCallerTest, WrappersCallTheirOperationTimed) {
    std::vector<std::string> names;
    const auto expectCall = [&](const Wrapper& wrapper) {
        const auto& [name, call] = wrapper;
        names.push_back(name);
        // Whoever answers a planned code is the operation of this name, and only it.
        planAnswer(name, 40 + static_cast<int>(names.size()));
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
    const auto expectCalls = [&](const auto&... wrappers) { (expectCall(wrappers), ...); };
    expectCalls(OF_ALL(getAllCecs), OF_ALL(getAllLpars), OF_ALL(getAllLparProfiles),
                OF_ALL(getAllLparVirtualSerial), OF_ALL(getAllLparVirtualScsi),
                OF_ALL(getAllLparVirtualEthernet), OF_ALL(getAllIoSlots),
                OF_ALL(getAllCecMemoryCfg), OF_ALL(getAllCecProcessorCfg),
                OF_ALL(getAllCecMemoryPoolCfgs), OF_ALL(getAllCecProcessorPoolCfg),
                OF_ALL(getAllLparMemoryCfgs), OF_ALL(getAllLparProcessorCfgs));
    expectCalls(OF(kHost, getCecObj), OF(kHost, getAllLparsFromCec),
                OF(kHost, getAllLparProfilesFromCec), OF(kHost, getVirtualSerial),
                OF(kHost, getVirtualScsi), OF(kHost, getVirtualEthernet), OF(kHost, getIoSlots),
                OF(kHost, getCecMemoryCfg), OF(kHost, getCecProcessorCfg),
                OF(kHost, getCecMemoryPoolCfg), OF(kHost, getCecProcessorPoolCfg),
                OF(kHost, getAllLparMemoryCfg), OF(kHost, getAllLparProcessorCfg));
    expectCalls(OF(kLpar, getLparObj), OF(kLpar, getAllLparProfilesFromLpar),
                OF(kLpar, getLparVirtualSerial), OF(kLpar, getLparVirtualScsi),
                OF(kLpar, getLparVirtualEthernet), OF(kLpar, getLparIoSlots),
                OF(kLpar, getLparMemoryCfg), OF(kLpar, getLparProcessorCfg));
    expectCall({"getLparProfile",
                [](zemApiCaller& api) { return api.getLparProfile("", kLpar, "normal", 2); }});

    const std::string trace = timing.waitFor(
        "getLparProfile end", [] { CTimeLogerManager::getInstance()->log("padding"); });
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

/// All fields of what @p work throws.
std::string failureOf(const std::function<void()>& work) { return failureText(work, "kcmait"); }

TEST_F(DNXApiCallerTest, CodesBecomeFailures) {
    const std::tuple<int, const char*, std::string> rows[] = {
        // code, its name, end of its text
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
    const auto read = [] { zemApiObjects(kReader, zemApiCaller().getLparObj("", kLpar, 1)); };
    for (const auto& [code, name, end] : rows) {
        EXPECT_STREQ(name, errorCodeToString(code));
        const std::string text = getErrorString(code);
        EXPECT_EQ(end, text.substr(text.size() - std::min(text.size(), end.size())));
        planAnswer("getLparObj", code);
        const char* start = code == 6   ? "1/zemHostSystem/updateData//"
                            : code == 7 ? "5/zemHostSystem/updateData/getLparObj/"
                                        : "6/zemHostSystem/updateData//";
        EXPECT_EQ(std::string(start) + name + '/' + text, failureOf(read));
    }
    EXPECT_STREQ("DNX_API_SUCCESS", errorCodeToString(0));
}

TEST_F(DNXApiCallerTest, NoResultIsTheReadersDecision) {
    const std::pair<const char*, std::string> rows[] = {
        // the reader's id, and what it gives
        {"-1", "//-1/Internal Error:API(\"getLparObj\") calling failed"},
        {"UNKNOWN", "//UNKNOWN/Internal Error:API(\"getLparObj\") calling failed"},
        {nullptr, std::string("//DNX_API_FAILED/") + getErrorString(-1)},
    };
    for (const auto& [id, failure] : rows) {
        zemApiReader reader = kReader;
        reader.nullId = id;
        planAnswer("getLparObj", {});
        const auto read = [&] { zemApiObjects(reader, zemApiCaller().getLparObj("", kLpar, 1)); };
        EXPECT_EQ("6/zemHostSystem/updateData" + failure, failureOf(read));
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
    EXPECT_EQ("5/zemHostSystem/updateData///the key", failureOf([&] { none.only("the key"); }));
    zemApiReader forgiving = kReader;
    forgiving.notFoundIsEmpty = true;
    const char* missing = "99*1111-AAA*0000001";
    EXPECT_EQ(0U, zemApiObjects(forgiving, zemApiCaller().getLparObj("", missing, 1)).size());
}

}  // namespace
