// Calls of the management library, and what its answers become.

#include <gtest/gtest.h>

#include <tuple>
#include <vector>

#include "DNXApiCaller.h"
#include "FailureText.h"
#include "LibraryFaults.h"
#include "LibrarySpy.h"
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
    ~DNXApiCallerTest() override { EXPECT_EQ(0, librarySpy.held); }
    testing_support::DemoAppliance m_appliance{ZEM_PROGRAMS};
};

TEST_F(DNXApiCallerTest, WrappersCallTheirOperationTimed) {
    std::vector<std::string> names;
    const auto check = [&names](const std::string& call, auto wrapper) {
        zemApiCaller api;
        apiProp* const result = wrapper(api);
        EXPECT_EQ(call, librarySpy.call);
        EXPECT_EQ(librarySpy.result, result);
        EXPECT_EQ(result->rc, api.getReturnCode());
        EXPECT_EQ(result->rc, zemApiProp(result).getReturnCode());
        api.freeApi();
        EXPECT_EQ(-1, api.getReturnCode());
        names.push_back(call.substr(0, call.find('(')));
    };
#define CHECK_ALL(NAME) check(#NAME "(u,2)", [](auto& api) { return api.NAME("u", 2); });
#define CHECK_KEYED(NAME) check(#NAME "(u,k,1)", [](auto& api) { return api.NAME("u", "k", 1); });
    LIBRARY_OPERATIONS(CHECK_ALL, CHECK_KEYED)
    check("getLparProfile(u,k,p,2)",
          [](auto& api) { return api.getLparProfile("u", "k", "p", 2); });

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
    {
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
        EXPECT_EQ(1, librarySpy.held);
    }
    zemApiProp(zemApiCaller().getAllCecs("", 1)).freeApi();
}

/// All fields of what @p work throws.
std::string failureOf(const std::function<void()>& work) { return failureText(work, "kcmait"); }

TEST_F(DNXApiCallerTest, CodesBecomeFailures) {
    // clang-format off
    const std::tuple<int, const char*, const char*> rows[] = {  // code, its name and text
        {0, "DNX_API_SUCCESS", "The return code 0 always indicates that the required operation has been executed successfully."},
        {-1, "DNX_API_FAILED", "The return code -1 indicates that the required DNX API operation can not be finished correctly."},
        {1, "DNX_API_INVALID_INPUT", "One or more of the input parameter is invalid, e.g. Null MTMS, etc."},
        {2, "DNX_API_INVALID_STATE", "The target is in invalid state for the operation. An example of this is if the VirtualSystem is activated while it is already in \"Active\" state already."},
        {3, "DNX_API_UNKNOWN_SYTEM", "The given CEC, lpar, or frame is not recognized by the DNX. Either the system name is invalid or it is not managed by the DNX."},
        {4, "DNX_API_INVALID_BKN", "Operations that require BKN connection in order to talk with the lpars (e.g. OSShutdown, dlpar operation, etc.) could receive this type of exception if there is no BKN connection to the lpar. A major cause of this type of exception is bad network set up."},
        {5, "DNX_API_NOT_SUPPORTED", "The operation is not supported by the DNX API on the CEC, lpar, or OS."},
        {6, "DNX_API_ACCESS_DENIED", "The user has no permission to execute the required functions."},
        {7, "DNX_API_NOT_FOUND", "There is not any object has been found for the requested query."},
        {8, "DNX_API_UNKNOWN", "Undefined error."},
        {-2, "DNX_API_UNKNOWN", "Undefined error."},
    };
    // clang-format on
    for (const auto& [code, name, text] : rows) {
        EXPECT_STREQ(name, errorCodeToString(code));
        EXPECT_STREQ(text, getErrorString(code));
        planAnswer("getLparObj", code);
        const std::string start = code == 6   ? "1/zemHostSystem/updateData//"
                                  : code == 7 ? "5/zemHostSystem/updateData/getLparObj/"
                                              : "6/zemHostSystem/updateData//";
        EXPECT_EQ(code == 0 ? "" : start + name + '/' + text, failureOf([] {
                      zemApiObjects(kReader, zemApiCaller().getLparObj("", kLpar, 1));
                  }));
        EXPECT_EQ(0, librarySpy.held) << code;
    }
    // To a reader without an id for it, no result is a failure like any other.
    zemApiReader reader = kReader;
    reader.nullId = nullptr;
    planAnswer("getLparObj", {});
    EXPECT_EQ(std::string("6/zemHostSystem/updateData//DNX_API_FAILED/") + getErrorString(-1),
              failureOf([&] { zemApiObjects(reader, zemApiCaller().getLparObj("", kLpar, 1)); }));
}

struct Names {
    void addName(const zemString& name) { text += std::string(name) + ';'; }
    void addBoot(const zemString& mode) { text += std::string(mode) + ' '; }
    std::string text;
};

TEST_F(DNXApiCallerTest, ObjectsAreWalked) {
    using Setter = void (Names::*)(const zemString&);
    static constexpr zemApiField<Setter> kFields[] = {{"UserDefinedName", &Names::addName},
                                                      {"Absent", &Names::addBoot},
                                                      {"BootMode", &Names::addBoot}};
    Names names;
    const zemApiObjects lpars(kReader,
                              zemApiCaller().getAllLparsFromCec("", "1111-AAC*0000003", 1));
    for (apiProp& lpar : lpars) {
        zemReadApiFields(&lpar, names, kFields);
    }
    EXPECT_EQ("xbrg; 1 linux-a; 1 my-test; 1 ", names.text);
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
