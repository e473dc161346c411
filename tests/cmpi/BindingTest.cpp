// The handle classes against servers that behave and servers that don't.
#include <gtest/gtest.h>

#include <climits>
#include <cstring>
#include <functional>
#include <limits>
#include <memory>
#include <string>

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
CMPIrc codeOf(Call call) {
    try {
        call();
    } catch (const CmpiStatus& status) {
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
#define READER(type, also, call)                             \
    {                                                        \
#call, type, also, [](const CmpiData& d) { d.call; } \
    }
const struct {
    const char* name;
    CMPIType type, also;
    void (*read)(const CmpiData&);
} kReaders[] = {
    READER(CMPI_boolean, CMPI_uint8, getBoolean()),
    READER(CMPI_sint8, CMPI_sint8, getSint8()),
    READER(CMPI_uint8, CMPI_uint8, getUint8()),
    READER(CMPI_sint16, CMPI_sint16, getSint16()),
    READER(CMPI_uint16, CMPI_uint16, getUint16()),
    READER(CMPI_sint32, CMPI_sint32, getSint32()),
    READER(CMPI_uint32, CMPI_uint32, getUint32()),
    READER(CMPI_sint64, CMPI_sint64, getSint64()),
    READER(CMPI_uint64, CMPI_uint64, getUint64()),
    READER(CMPI_real32, CMPI_real32, getReal32()),
    READER(CMPI_real64, CMPI_real64, getReal64()),
    READER(CMPI_char16, CMPI_uint16, getChar16()),
    READER(CMPI_string, CMPI_string, getString()),
    READER(CMPI_chars, CMPI_chars, getCString()),
    READER(CMPI_dateTime, CMPI_dateTime, getDateTime()),
    READER(CMPI_instance, CMPI_instance, getInstance()),
    READER(CMPI_ref, CMPI_ref, getObjectPath()),
    READER(CMPI_stringA, CMPI_uint8A, getArray()),
    READER(CMPI_uint8, CMPI_boolean, operator unsigned char()),
    READER(CMPI_uint16, CMPI_char16, operator unsigned short()),
    READER(CMPI_chars, CMPI_chars, operator const char*()),
    READER(CMPI_uint8A, CMPI_stringA, operator CmpiArray()),
};

TEST_F(BindingTest, ReadersTakeTheirTypesAlone) {
    for (const auto& r : kReaders) {
        for (const auto& other : kReaders) {
            const CMPIType type = other.type;
            const bool fits = type == r.type || type == r.also;
            // Null values too: a server's garbage in them must not be touched.
            for (const bool null : {false, true}) {
                const Raw value(type, null ? CMPI_nullValue : CMPI_goodValue,
                                bits(null ? 0xdeadbeef : 0));
                EXPECT_EQ(codeOf([&] { r.read(value); }),
                          fits ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH)
                    << r.name << " of type " << type;
            }
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
    const struct {
        CmpiData value;
        CMPIType type;
        bool null;
    } kCases[] = {
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
    for (const auto& c : kCases) {
        args.setArg("Arg", c.value);
        EXPECT_EQ(arrived(handle).type, c.type);
        EXPECT_EQ(arrived(handle).state == CMPI_nullValue, c.null) << "type " << c.type;
    }
    args.setArg("Arg", CmpiData(text));
    EXPECT_EQ(arrived(handle).value.chars, text);
    EXPECT_STREQ(string.charPtr(), text);

    EXPECT_EQ(codeOf([&] { args.setArg("Arg", Raw(CMPI_null, CMPI_goodValue)); }),
              CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(codeOf([&] { args.setArg("Arg", Raw(77, CMPI_goodValue)); }),
              CMPI_RC_ERR_INVALID_DATA_TYPE);
    CmpiObjectPath path("root", "C");
    EXPECT_EQ(codeOf([&] { path.setKey("Name", CmpiData(CmpiString())); }),
              CMPI_RC_ERR_INVALID_PARAMETER);
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
    try {
        instance.getProperty("Secret");
        ADD_FAILURE();
    } catch (const CmpiStatus& status) {
        EXPECT_EQ(status.rc(), CMPI_RC_ERR_ACCESS_DENIED);
        EXPECT_STREQ(status.msg(), "Secret");
    }
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
    const struct {
        bool creates;  // an object, rather than an answer
        std::function<void()> call;
    } kCalls[] = {
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
    for (const auto& c : kCalls) {
        if (!c.creates) continue;
        m_server.outcome.rc = CMPI_RC_OK;
        EXPECT_EQ(codeOf(c.call), CMPI_RC_ERR_FAILED) << &c - kCalls;
        m_server.outcome.rc = CMPI_RC_ERR_ACCESS_DENIED;
        EXPECT_EQ(codeOf(c.call), CMPI_RC_ERR_ACCESS_DENIED) << &c - kCalls;
    }
    m_server.bft = {};
    m_server.eft = {};
    m_server.contextFt = {};
    m_server.instanceFt = {};
    m_server.pathFt = {};
    m_server.argsFt = {};
    m_server.arrayFt = {};
    for (const auto& c : kCalls) {
        EXPECT_EQ(codeOf(c.call), CMPI_RC_ERR_NOT_SUPPORTED) << &c - kCalls;
    }
    m_server.broker.bft = nullptr;
    m_server.broker.eft = nullptr;
    for (const auto& c : kCalls) {
        EXPECT_EQ(codeOf(c.call), CMPI_RC_ERR_NOT_SUPPORTED) << &c - kCalls;
    }
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
