// The handle classes against servers that behave and servers that don't.
#include <gtest/gtest.h>

#include <climits>
#include <limits>
#include <tuple>

#include "CmpiArgs.h"
#include "CmpiArray.h"
#include "CmpiBooleanData.h"
#include "CmpiCharData.h"
#include "CmpiDateTime.h"
#include "CmpiInstanceMI.h"
#include "CmpiMethodMI.h"
#include "FakeServer.h"

namespace {

/// A value as a server hands it over.
struct Raw : CmpiData {
    Raw(CMPIType type, CMPIValueState state, CMPIValue value = {})
        : CmpiData(CMPIData{type, state, value}) {}
};

CMPIValue bits(CMPIUint64 value) {
    CMPIValue v = {};
    v.uint64 = value;
    return v;
}

/// The code that @p call throws, or CMPI_RC_OK.
template <class Call>
CMPIrc codeOf(Call call, std::string* text = nullptr) {
    try {
        call();
    } catch (const CmpiStatus& status) {
        if (text) *text = status.msg();
        return status.rc();
    }
    return CMPI_RC_OK;
}

/// Arguments that show their handle.
struct OpenArgs : CmpiArgs {
    using CmpiArgs::getEnc;
};

struct BindingTest : testing::Test {
    FakeServer m_server;
    CmpiBroker m_broker{&m_server.broker};
    CmpiContext m_ctx{m_server.make<CMPIContext>(m_server.contextFt)};
    // Not an operation is called; it makes the broker known.
    CmpiMethodMI m_provider{m_broker, m_ctx};

    /// The last value that reached @p handle.
    template <class Handle>
    const CMPIData& arrived(const Handle* handle) {
        return FakeServer::bag(handle).values.back().second;
    }
};

// Which types each reader takes.
const std::tuple<CMPIType, CMPIType, void (*)(const CmpiData&)> kReaders[] = {
    {CMPI_boolean, CMPI_uint8, [](const CmpiData& d) { d.getBoolean(); }},
    {CMPI_sint8, CMPI_sint8, [](const CmpiData& d) { d.getSint8(); }},
    {CMPI_uint8, CMPI_uint8, [](const CmpiData& d) { d.getUint8(); }},
    {CMPI_sint16, CMPI_sint16, [](const CmpiData& d) { d.getSint16(); }},
    {CMPI_uint16, CMPI_uint16, [](const CmpiData& d) { d.getUint16(); }},
    {CMPI_sint32, CMPI_sint32, [](const CmpiData& d) { d.getSint32(); }},
    {CMPI_uint32, CMPI_uint32, [](const CmpiData& d) { d.getUint32(); }},
    {CMPI_sint64, CMPI_sint64, [](const CmpiData& d) { d.getSint64(); }},
    {CMPI_uint64, CMPI_uint64, [](const CmpiData& d) { d.getUint64(); }},
    {CMPI_real32, CMPI_real32, [](const CmpiData& d) { d.getReal32(); }},
    {CMPI_real64, CMPI_real64, [](const CmpiData& d) { d.getReal64(); }},
    {CMPI_char16, CMPI_uint16, [](const CmpiData& d) { d.getChar16(); }},
    {CMPI_string, CMPI_string, [](const CmpiData& d) { d.getString(); }},
    {CMPI_chars, CMPI_chars, [](const CmpiData& d) { d.getCString(); }},
    {CMPI_dateTime, CMPI_dateTime, [](const CmpiData& d) { d.getDateTime(); }},
    {CMPI_instance, CMPI_instance, [](const CmpiData& d) { d.getInstance(); }},
    {CMPI_ref, CMPI_ref, [](const CmpiData& d) { d.getObjectPath(); }},
    {CMPI_stringA, CMPI_uint8A, [](const CmpiData& d) { d.getArray(); }},
    {CMPI_uint8, CMPI_boolean, [](const CmpiData& d) { d.operator unsigned char(); }},
    {CMPI_uint16, CMPI_char16, [](const CmpiData& d) { d.operator unsigned short(); }},
    {CMPI_chars, CMPI_chars, [](const CmpiData& d) { d.operator const char*(); }},
    {CMPI_uint8A, CMPI_stringA, [](const CmpiData& d) { d.operator CmpiArray(); }},
};

TEST_F(BindingTest, ReadersTakeTheirTypesAlone) {
    for (const auto& [takes, also, read] : kReaders) {
        for (const auto& other : kReaders) {
            const CMPIType type = std::get<0>(other);
            const CMPIrc rc =
                type == takes || type == also ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH;
            // Null values too: a server's garbage in them must not be touched.
            const Raw null(type, CMPI_nullValue, bits(0xdeadbeef)), good(type, CMPI_goodValue);
            EXPECT_EQ(codeOf([&, r = read] { r(null); }), rc) << takes << " of null " << type;
            EXPECT_EQ(codeOf([&, r = read] { r(good); }), rc) << takes << " of type " << type;
        }
    }
    EXPECT_EQ(Raw(CMPI_uint32, CMPI_nullValue, bits(5)).getUint32(), 0u);
    EXPECT_TRUE(Raw(CMPI_ref, CMPI_nullValue, bits(5)).getObjectPath().isNull());
    EXPECT_EQ(Raw(CMPI_string, CMPI_nullValue, bits(5)).getString().charPtr(), nullptr);
}

TEST_F(BindingTest, ValuesKeepTheirRange) {
    EXPECT_EQ(CMPISint64(CmpiData(CMPISint64(LLONG_MIN))), LLONG_MIN);
    EXPECT_EQ(CMPIUint64(CmpiData(CMPIUint64(ULLONG_MAX))), ULLONG_MAX);
    EXPECT_EQ(CMPIUint32(CmpiData(CMPIUint32(UINT_MAX))), UINT_MAX);
    EXPECT_EQ(CmpiData(std::numeric_limits<double>::denorm_min()).getReal64(),
              std::numeric_limits<double>::denorm_min());
    EXPECT_TRUE(CmpiTrue.getBoolean() && CmpiFalse.getType() == CMPI_boolean);
    EXPECT_EQ(CmpiCharData(0xFFFF).getChar16(), 0xFFFF);
    const CmpiData nothing;
    EXPECT_TRUE(nothing.isNullValue() && nothing.isNotFound());
}

TEST_F(BindingTest, ValuesArriveAsTheTablesWantThem) {
    OpenArgs args;
    CMPIArgs* const handle = args.getEnc();
    const char* const text = "gr\xc3\xbcn";
    const CmpiString string(text);
    const CmpiArray array(2, CMPI_uint16);
    const std::tuple<CmpiData, CMPIType, bool> kCases[] = {
        // true: a null
        {CmpiData(CMPISint64(-1)), CMPI_sint64, false},
        {CmpiData(string), CMPI_string, false},
        {CmpiData(array), CMPI_uint16A, false},
        {CmpiData(), CMPI_null, true},
        {CmpiData(CmpiString()), CMPI_string, true},
        {CmpiData(static_cast<const char*>(nullptr)), CMPI_chars, true},
        {CmpiData(CmpiArray()), CMPI_null, true},
        {Raw(CMPI_uint32, CMPI_nullValue, bits(5)), CMPI_uint32, true},
        // Good, says the server, but there is no array.
        {Raw(CMPI_stringA, CMPI_goodValue), CMPI_stringA, true},
    };
    for (const auto& [value, type, null] : kCases) {
        args.setArg("Arg", value);
        EXPECT_EQ(arrived(handle).type, type);
        EXPECT_EQ(arrived(handle).state == CMPI_nullValue, null) << "type " << type;
    }
    args.setArg("Arg", CmpiData(text));
    EXPECT_EQ(arrived(handle).value.chars, text);
    EXPECT_STREQ(string.charPtr(), text);

    for (const CMPIType bad : {CMPIType(CMPI_null), CMPIType(77)}) {
        const auto set = [&] { args.setArg("Arg", Raw(bad, CMPI_goodValue)); };
        EXPECT_EQ(codeOf(set), CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    CmpiObjectPath path("root", "C");
    const auto setNull = [&] { path.setKey("Name", CmpiData(CmpiString())); };
    EXPECT_EQ(codeOf(setNull), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(codeOf([&] { path.setKey(nullptr, CmpiData("x")); }), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(BindingTest, ArraysHoldOneType) {
    CmpiArray names(3, CMPI_chars);
    names[0] = CmpiData("first");
    EXPECT_STREQ(names[0], "first");
    EXPECT_EQ(static_cast<const char*>(names[1]), nullptr);
    EXPECT_EQ(codeOf([&] { names[1] = CmpiData(CMPISint32(1)); }), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(codeOf([&] { names[3]; }), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    CmpiArray flags(1, CMPI_boolean);
    flags[0] = CmpiData(CMPIUint8(1));
    EXPECT_EQ(flags[0].getBoolean(), 1);
    EXPECT_EQ(CmpiArray().size(), 0u);
}

TEST_F(BindingTest, MissingValuesAreNullAndNotFound) {
    CmpiObjectPath path("root", "C");
    const CmpiInstance instance(path);
    const CmpiArgs args;
    const std::function<CmpiData()> kLookups[] = {
        [&] { return instance.getProperty("X"); },
        [&] { return instance.getProperty(0); },
        [&] { return instance.getProperty(-1); },
        [&] { return args.getArg("X"); },
        [&] { return args.getArg(0); },
    };
    for (const auto& lookup : kLookups) {
        for (const CMPIrc rc : {CMPI_RC_ERR_NOT_FOUND, CMPI_RC_ERR_NO_SUCH_PROPERTY}) {
            m_server.missing = rc;
            const CmpiData data = lookup();
            EXPECT_TRUE(data.isNullValue() && data.isNotFound());
        }
    }
    m_server.missing = CMPI_RC_ERR_NOT_FOUND;
    EXPECT_EQ(codeOf([&] { path.getKey("X"); }), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(codeOf([&] { path.getKey(-1); }), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(codeOf([&] { m_ctx.getEntry(CMPIPrincipal); }), CMPI_RC_ERR_NOT_FOUND);
    m_server.missing = CMPI_RC_ERR_ACCESS_DENIED;
    std::string name;
    const auto getSecret = [&] { instance.getProperty("Secret"); };
    EXPECT_EQ(codeOf(getSecret, &name), CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(name, "Secret");
}

TEST_F(BindingTest, NamesComeWithPositions) {
    CmpiInstance instance(CmpiObjectPath("root", "C"));
    instance.setProperty("Size", CmpiData(CMPIUint64(ULLONG_MAX)));
    CmpiString name;
    EXPECT_EQ(instance.getProperty(0, &name).getUint64(), ULLONG_MAX);
    EXPECT_TRUE(name.equalsIgnoreCase("SIZE") && !name.equals("SIZE"));
    EXPECT_TRUE(instance.getProperty(1, &name).isNotFound() && !name.charPtr());
}

TEST_F(BindingTest, NullTextsAreSafe) {
    const CmpiString null, word("word");
    for (const char* other : {static_cast<const char*>(nullptr), "word"}) {
        EXPECT_EQ(null.equals(other), other == nullptr);
        EXPECT_EQ(word.equalsIgnoreCase(other), other != nullptr);
    }
    EXPECT_TRUE(null.equals(CmpiString(null)));
    CmpiObjectPath path(null, nullptr);
    path.setHostname(null);
    EXPECT_STREQ(path.getHostname().charPtr(), "");
    // A principal without text, and strings without a table.
    CMPIString textless{nullptr, &m_server.stringFt}, tableless{nullptr, nullptr};
    for (CMPIString* s : {&textless, &tableless}) {
        CMPIValue v = {};
        v.string = s;
        EXPECT_EQ(Raw(CMPI_string, CMPI_goodValue, v).getString().charPtr(), nullptr);
        EXPECT_EQ(CmpiStatus(CMPIStatus{CMPI_RC_ERR_FAILED, s}).msg(), nullptr);
    }
    EXPECT_TRUE(CmpiDateTime(CmpiDateTime(static_cast<const CMPIDateTime*>(nullptr))).isNull());
}

TEST_F(BindingTest, NothingIsClonedOrReleased) {
    CmpiObjectPath path("root", "C");
    CmpiInstance instance(path);
    const CmpiDateTime interval(90000000, 1);
    CmpiString text("text");
    int made = m_server.made();
    {
        EXPECT_FALSE(CmpiObjectPath(path).isNull() || CmpiInstance(instance).isNull());
        CmpiString shared;
        shared = text;
        const CmpiData data(text), copy(data);
        EXPECT_EQ(shared.charPtr(), copy.getString().charPtr());
    }
    EXPECT_EQ(m_server.made(), made);
    const CmpiString own(text);
    const CmpiDateTime ownInterval(interval);
    EXPECT_EQ(m_server.made(), made + 2);
    EXPECT_NE(own.charPtr(), text.charPtr());
    EXPECT_EQ(ownInterval.getDateTime(), 90000000u);
    EXPECT_TRUE(ownInterval.isInterval());
    EXPECT_EQ(FakeServer::cloned, 0);
    EXPECT_EQ(FakeServer::released, 0);
}

TEST_F(BindingTest, WhatTheServerLacksBecomesAStatus) {
    CmpiObjectPath path("root", "C");
    CmpiInstance instance(path);
    OpenArgs args;
    CmpiArray array(1, CMPI_uint8);
    Raw nothing(CMPI_uint8, CMPI_nullValue);
    // true: what creates an object, rather than an answer
    const std::pair<bool, std::function<void()>> kCalls[] = {
        {true, [] { CmpiString("x"); }},
        {true, [] { CmpiObjectPath("root", "C"); }},
        {true, [&] { CmpiInstance{path}; }},
        {true, [] { CmpiArgs(); }},
        {true, [] { CmpiArray(1, CMPI_uint8); }},
        {true, [] { CmpiDateTime(); }},
        {true, [] { CmpiDateTime(1, 0); }},
        {true, [&] { instance.getObjectPath(); }},
        {true, [&] { m_broker.getInstance(m_ctx, path, nullptr); }},
        {false, [&] { path.toString(); }},
        {false, [&] { m_broker.prepareAttachThread(m_ctx); }},
        {false, [&] { m_broker.deliverIndication(m_ctx, "root", instance); }},
        {false, [&] { m_broker.enumInstances(m_ctx, path, nullptr); }},
        {false, [&] { m_broker.setInstance(m_ctx, path, instance, nullptr); }},
        {false, [&] { m_broker.invokeMethod(m_ctx, path, "M", args, args); }},
        {false, [&] { m_broker.getProperty(m_ctx, path, "P"); }},
        {false, [&] { m_ctx.getEntry("X"); }},
        {false, [&] { path.getHostname(); }},
        {false, [&] { path.setKey("K", CmpiData("v")); }},
        {false, [&] { instance.getProperty(0); }},
        {false, [&] { instance.setProperty("P", nothing); }},
        {false, [&] { array.size(); }},
    };
    m_server.withhold = true;
    for (const auto& [creates, call] : kCalls) {
        if (!creates) continue;
        m_server.outcome.rc = CMPI_RC_OK;
        EXPECT_EQ(codeOf(call), CMPI_RC_ERR_FAILED);
        m_server.outcome.rc = CMPI_RC_ERR_ACCESS_DENIED;
        EXPECT_EQ(codeOf(call), CMPI_RC_ERR_ACCESS_DENIED);
    }
    m_server.bft = {};
    m_server.eft = {};
    m_server.contextFt = {};
    m_server.instanceFt = {};
    m_server.pathFt = {};
    m_server.argsFt = {};
    m_server.arrayFt = {};
    for (const auto& c : kCalls)
        EXPECT_EQ(codeOf(c.second), CMPI_RC_ERR_NOT_SUPPORTED) << &c - kCalls;
    m_server.broker.bft = nullptr;
    m_server.broker.eft = nullptr;
    for (const auto& c : kCalls)
        EXPECT_EQ(codeOf(c.second), CMPI_RC_ERR_NOT_SUPPORTED) << &c - kCalls;
}

TEST_F(BindingTest, NullHandlesAreRefused) {
    CmpiObjectPath path(static_cast<CMPIObjectPath*>(nullptr));
    const std::function<void()> kCalls[] = {
        [&] { path.getKeyCount(); },
        [&] { path.toString(); },
        [&] { CmpiInstance{path}; },
        [&] { m_broker.deleteInstance(m_ctx, path); },
        [] { CmpiEnumeration().hasNext(); },
        [] { CmpiContext(nullptr).getEntry("X"); },
        [] { CmpiDateTime(static_cast<const CMPIDateTime*>(nullptr)).isInterval(); },
    };
    for (const auto& call : kCalls) EXPECT_EQ(codeOf(call), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST(WithoutBroker, NothingIsMade) {
    EXPECT_EQ(codeOf([] { CmpiString("x"); }), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(codeOf([] { CmpiObjectPath("root", "C"); }), CMPI_RC_ERR_FAILED);
}

}  // namespace
