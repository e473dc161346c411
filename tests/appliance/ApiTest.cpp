// The management library: its levels, how it refuses and fails, threads and size. That it and the
// tools tell one story is in AgreementTest.cpp.

#include <atomic>
#include <chrono>
#include <functional>
#include <thread>

#include "ApiAnswer.h"
#include "Store.h"

namespace {

constexpr const char* kHost = "1111-AAA*0000001";
constexpr const char* kLpar = "3*1111-AAA*0000001";

TEST_F(ApiTest, ShortReadsLeaveTheRestAway) {
    make("init");
    const Answer host(getCecObj("", kHost, 1)), lpar(getLparObj("", kLpar, 1)),
        profile(getLparProfile("", kLpar, "normal", 1));
    // By these readers tell a short read from a full one.
    EXPECT_EQ(nullptr, getProperty(host.record(0), "ProcCompatModesSupported"));
    EXPECT_EQ(nullptr, getProperty(lpar.record(0), "Default_prof"));
    EXPECT_EQ(nullptr, getProperty(profile.record(0), "BootMode"));
    EXPECT_EQ("tmxlinux", lpar.value(0, "Lpar_env"));
    EXPECT_EQ("[104,97,16,0,0,16,0,0]", Answer(getCecObj("", kHost, 2)).value(0, "GlvExCaps"));
    // Never activated: neither resources nor a current profile.
    const Answer idle(getLparObj("", "2*1111-AAC*0000003", 2));
    EXPECT_EQ("2", idle.value(0, "DefinitionState"));
    EXPECT_EQ("null,", idle.value(0, "Curr_prof"));
}

// Refusals.

TEST_F(ApiTest, ReturnCodes) {
    make("init");
    const std::function<apiProp*()> ok[] = {
        [] { return getCecObj("", kHost, 1); },
        [] { return getLparVirtualScsi("anyone", kLpar, 2); },
        [] { return getAllLparsFromCec("", "1111-AAD*0000004", 1); },  // no partitions
    };
    for (const auto& call : ok) EXPECT_EQ(API_SUCCESS, Answer(call()).code());
    EXPECT_EQ(0, Answer(ok[2]()).size());

    const struct {
        int code;
        std::function<apiProp*()> call;
    } rows[] = {
        {API_INVALID_INPUT, [] { return getCecObj(nullptr, kHost, 1); }},
        {API_INVALID_INPUT, [] { return getCecObj("", nullptr, 1); }},
        {API_INVALID_INPUT, [] { return getCecObj("", "", 1); }},
        {API_INVALID_INPUT, [] { return getAllCecs("", 0); }},
        {API_INVALID_INPUT, [] { return getAllCecs("", 3); }},
        {API_INVALID_INPUT, [] { return getLparObj("", "3", 1); }},
        {API_INVALID_INPUT, [] { return getLparObj("", "3*", 1); }},
        {API_INVALID_INPUT, [] { return getLparObj("", "x*1111-AAA*0000001", 1); }},
        {API_INVALID_INPUT, [] { return getLparProfile("", kLpar, "", 1); }},
        {API_UNKNOWN_SYSTEM, [] { return getCecObj("", "alpha", 1); }},
        {API_UNKNOWN_SYSTEM, [] { return getLparObj("", "3*1111-AAA*9999999", 1); }},
        {API_NOT_FOUND, [] { return getLparObj("", "99*1111-AAA*0000001", 1); }},
        {API_NOT_FOUND, [] { return getLparIoSlots("", "0*1111-AAA*0000001", 1); }},
        {API_NOT_FOUND, [] { return getLparProfile("", kLpar, "absent", 1); }},
    };
    for (const auto& row : rows) {
        const Answer answer(row.call());
        EXPECT_EQ(row.code, answer.code()) << &row - rows;
        EXPECT_EQ(0, answer.size());
    }
    EXPECT_EQ(API_FAILED, getReturnCode(nullptr));
    EXPECT_EQ(nullptr, getProperty(nullptr, "Name"));
    EXPECT_EQ(nullptr, getProperty(Answer(getCecObj("", kHost, 1)).record(0), "name"));
}

TEST_F(ApiTest, AnObjectTooLargeForARecordFails) {
    make("init");
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    appliance::Transaction change = store.write();
    appliance::Object lpar = store.all(appliance::Kind::Lpar).front();
    lpar.set("name", std::string(500'000, 'x'));
    store.put(lpar);
    change.commit();
    EXPECT_EQ(API_FAILED, Answer(getAllLpars("", 1)).code());
}

TEST_F(ApiTest, PlannedFaults) {
    EXPECT_TRUE(Answer(getAllCecs("", 1)).isNull());  // there is no state yet
    make("init");
    const struct {
        const char* plan;
        int code;
        bool isNull;
    } rows[] = {
        {"--code 2", API_INVALID_STATE, false},
        {"--code 4", API_INVALID_BKN, false},
        {"--code 5", API_NOT_SUPPORTED, false},
        {"--code 6", API_ACCESS_DENIED, false},
        {"--code 8", 8, false},
        {"--code -2", -2, false},
        {"--code null --calls 1", API_FAILED, true},
    };
    for (const auto& row : rows) {
        make(std::string("fault getAllCecs ") + row.plan);
        const Answer faulty(getAllCecs("", 1));
        EXPECT_EQ(row.code, faulty.code());
        EXPECT_EQ(row.isNull, faulty.isNull());
        EXPECT_EQ(4, Answer(getAllCecs("", 1)).size()) << row.plan;
    }

    make("fault getCecObj --delay 50 --calls 2");
    make("fault qyplat --code 7 --text \"WRTL9999 No.\" --calls 2");
    EXPECT_EQ(
        "getCecObj: 2 calls, delay 50 ms\n"
        "qyplat: 2 calls, code 7, text \"WRTL9999 No.\"\n",
        m_appliance.run("appliance fault").out);
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(API_SUCCESS, Answer(getCecObj("", kHost, 1)).code());
    EXPECT_LE(std::chrono::milliseconds(50), std::chrono::steady_clock::now() - start);
    for (int i = 0; i < 2; ++i) {
        const auto outcome = m_appliance.run("qyplat -r sys -F name");
        EXPECT_EQ(7, outcome.exit);
        EXPECT_EQ("WRTL9999 No.\n", outcome.err);
    }
    make("fault qyplat --signal 9");
    EXPECT_EQ(128 + 9, m_appliance.run("qyplat -r sys; exit $?").exit);
    EXPECT_EQ(0, m_appliance.run("qyplat -r sys").exit);
    make("fault --clear");
    const auto refused = m_appliance.run("appliance fault getAllCec --code 1");
    EXPECT_EQ(2, refused.exit);
    for (const char* name : {"{", ",getAllCecs,", ",getLparProfile,", ",edalloc,", ",xbrgcli}"}) {
        EXPECT_NE(std::string::npos, refused.err.find(name)) << name;
    }
    EXPECT_EQ("", m_appliance.run("appliance fault").out);
}

// Size and threads.

long residentKilobytes() {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmRSS:", 0) == 0) return std::stol(line.substr(6));
    }
    return 0;
}

TEST_F(ApiTest, AThousandPartitionsStaySmall) {
    make("generate --hosts 1 --lpars 1000");
    const long before = residentKilobytes();
    const Answer lpars(getAllLpars("", 2));
    ASSERT_EQ(1000, lpars.size());
    EXPECT_GT(100 * 1024, residentKilobytes() - before);
}

TEST_F(ApiTest, EveryCallIsOnePicture) {
    make("generate --hosts 2 --lpars 20");
    std::atomic<bool> done{false};
    std::atomic<int> mixed{0}, failed{0};
    std::vector<std::thread> readers;
    for (int i = 0; i < 4; ++i) {
        readers.emplace_back([&] {
            while (!done) {
                const Answer lpars(getAllLparMemoryCfgs("", 2));
                if (lpars.size() != 40) ++failed;
                for (int j = 1; j < lpars.size(); ++j) {
                    mixed +=
                        lpars.value(j, "RuntimeVRMWeight") != lpars.value(0, "RuntimeVRMWeight");
                }
            }
        });
    }
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    for (int value = 1; value <= 30; ++value) {
        appliance::Transaction change = store.write();
        for (appliance::Object& lpar : store.all(appliance::Kind::Lpar)) {
            lpar.set("run_mem_weight", std::to_string(value));
            store.put(lpar);
        }
        change.commit();
    }
    done = true;
    for (std::thread& reader : readers) reader.join();
    EXPECT_EQ(0, mixed);
    EXPECT_EQ(0, failed);
}

}  // namespace
