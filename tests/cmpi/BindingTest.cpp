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
#include "Server.h"

namespace {

/// What a value is that reaches arguments.
CMPIData arrived;
CMPIStatus take(const CMPIArgs*, const char*, const CMPIValue* value, CMPIType type) {
    arrived = {type, CMPIValueState(value ? CMPI_goodValue : CMPI_nullValue), {}};
    if (value && type == CMPI_chars) {
        arrived.value.chars = const_cast<char*>(reinterpret_cast<const char*>(value));
    }
    return {CMPI_RC_OK, nullptr};
}

/// What entries report that lose() and withhold() have replaced.
CMPIrc outcome;
template <class... Args>
void report(Args&... args) {
    CMPIStatus* const rc = std::get<sizeof...(Args) - 1>(std::tie(args...));
    if (rc) {
        rc->rc = outcome;
    }
}
/// Has a search find nothing, and leave garbage as careless servers do.
template <class... Args>
void lose(CMPIData (*&search)(Args...)) {
    search = [](Args... args) {
        report(args...);
        return CMPIData{CMPI_string, CMPI_goodValue, {0xdeadbeef}};
    };
}
/// Has an entry return no object.
template <class Object, class... Args>
void withhold(Object* (*&entry)(Args...)) {
    entry = [](Args... args) -> Object* {
        report(args...);
        return nullptr;
    };
}

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
        if (text) {
            *text = status.msg();
        }
        return status.rc();
    }
    return CMPI_RC_OK;
}

/// Arguments that show their handle.
struct OpenArgs : CmpiArgs {
    using CmpiArgs::getEnc;
};

struct OpenEnumeration : CmpiEnumeration {
    explicit OpenEnumeration(CMPIEnumeration* handle) : CmpiEnumeration(handle) {}
};

/// The tables belong to the server of the test alone, and may be thinned out.
struct BindingTest : testing::Test {
    cimom::Server m_server;
    cimom::RequestScope m_scope{m_server};
    CMPIBroker& m_mb = *m_server.broker();
    CmpiBroker m_broker{&m_mb};
    CmpiContext m_ctx{m_scope.context()};
    // Not an operation is called; it makes the broker known.
    CmpiMethodMI m_provider{m_broker, m_ctx};
};

// Which types each reader takes.
// clang-format off
#define READER(takes, also, read) {CMPI_##takes, CMPI_##also, [](const CmpiData& d) { d.read(); }},
const std::tuple<CMPIType, CMPIType, void (*)(const CmpiData&)> kReaders[] = {
    READER(boolean, uint8, getBoolean)   READER(sint8, sint8, getSint8)
    READER(uint8, uint8, getUint8)       READER(sint16, sint16, getSint16)
    READER(uint16, uint16, getUint16)    READER(sint32, sint32, getSint32)
    READER(uint32, uint32, getUint32)    READER(sint64, sint64, getSint64)
    READER(uint64, uint64, getUint64)    READER(real32, real32, getReal32)
    READER(real64, real64, getReal64)    READER(char16, uint16, getChar16)
    READER(string, string, getString)    READER(chars, chars, getCString)
    READER(dateTime, dateTime, getDateTime) READER(instance, instance, getInstance)
    READER(ref, ref, getObjectPath)      READER(stringA, uint8A, getArray)
    READER(uint8, boolean, operator unsigned char) READER(chars, chars, operator const char*)
    READER(uint16, char16, operator unsigned short) READER(uint8A, stringA, operator CmpiArray)
};
// clang-format on

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

TEST_F(BindingTest, ValuesArriveAsTheTablesWantThem) {
    OpenArgs args;
    args.getEnc()->ft->addArg = take;
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
        EXPECT_EQ(arrived.type, type);
        EXPECT_EQ(arrived.state == CMPI_nullValue, null) << "type " << type;
    }
    args.setArg("Arg", CmpiData(text));
    EXPECT_EQ(arrived.value.chars, text);
    EXPECT_STREQ(string.charPtr(), text);

    for (const CMPIType bad : {CMPIType(CMPI_null), CMPIType(77)}) {
        EXPECT_EQ(codeOf([&] { args.setArg("Arg", Raw(bad, CMPI_goodValue)); }),
                  CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    CmpiObjectPath path("root", "C");
    EXPECT_EQ(codeOf([&] { path.setKey("K", CmpiString()); }), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(codeOf([&] { path.setKey(nullptr, "x"); }), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(BindingTest, ArraysHoldOneType) {
    CmpiArray names(3, CMPI_chars);
    names[0] = CmpiData("first");
    EXPECT_STREQ(names[0].getCString(), "first");
    EXPECT_TRUE(CmpiData(names[1].getData()).isNullValue());
    EXPECT_EQ(codeOf([&] { names[1] = CmpiData(CMPISint32(1)); }), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(codeOf([&] { names[3]; }), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    CmpiArray flags(1, CMPI_boolean);
    flags[0] = CmpiData(CMPIUint8(1));
    EXPECT_EQ(flags[0].getBoolean(), 1);
    EXPECT_EQ(CmpiArray().size(), 0u);
}

// Strict servers take a text only in the form that the array has.
TEST_F(BindingTest, TextsGoIntoArraysInTheArraysOwnForm) {
    for (const CMPIType form : {CMPIType(CMPI_chars), CMPIType(CMPI_string)}) {
        CmpiArray array(2, form);
        array[0] = CmpiData("text");
        array[1] = CmpiData(CmpiString("string"));
        const auto text = [&](CMPICount i) {
            return form == CMPI_chars ? array[i].getCString() : array[i].getString().charPtr();
        };
        EXPECT_STREQ(text(0), "text");
        EXPECT_STREQ(text(1), "string");
    }
}

TEST_F(BindingTest, ElementsOfEnumerationsAreNeverNull) {
    const CmpiObjectPath path("root", "C");
    CMPIEnumerationFT table = {};
    table.getNext = [](const CMPIEnumeration* self, CMPIStatus*) {
        CMPIData marked = {CMPI_ref, CMPI_nullValue, {}};
        marked.value.ref = static_cast<CMPIObjectPath*>(self->hdl);
        return marked;
    };
    CMPIEnumeration handle = {path.getEnc(), &table};
    const CmpiData element = OpenEnumeration(&handle).getNext();
    EXPECT_EQ(element.getObjectPath().getEnc(), path.getEnc());
    EXPECT_FALSE(element.isNullValue());
}

TEST_F(BindingTest, MissingValuesAreNullAndNotFound) {
    CmpiObjectPath path("root", "C");
    const CmpiInstance instance(path);
    const OpenArgs args;
    CMPIInstanceFT& ofInstances = *m_scope.wrap(cimom::Instance())->ft;
    lose(ofInstances.getProperty);
    lose(ofInstances.getPropertyAt);
    lose(args.getEnc()->ft->getArg);
    lose(args.getEnc()->ft->getArgAt);
    const std::function<CmpiData()> kLookups[] = {
        [&] { return instance.getProperty("X"); },
        [&] { return instance.getProperty(0); },
        [&] { return instance.getProperty(-1); },
        [&] { return args.getArg("X"); },
        [&] { return args.getArg(0); },
    };
    for (const CMPIrc rc : {CMPI_RC_ERR_NO_SUCH_PROPERTY, CMPI_RC_ERR_NOT_FOUND}) {
        outcome = rc;
        for (const auto& lookup : kLookups) {
            EXPECT_TRUE(lookup().isNullValue() && lookup().isNotFound());
        }
    }
    EXPECT_EQ(codeOf([&] { path.getKey("X"); }), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(codeOf([&] { path.getKey(-1); }), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(codeOf([&] { m_ctx.getEntry("X"); }), CMPI_RC_ERR_NO_SUCH_PROPERTY);
    outcome = CMPI_RC_ERR_ACCESS_DENIED;
    std::string name;
    EXPECT_EQ(codeOf([&] { instance.getProperty("Secret"); }, &name), CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(name, "Secret");
}

TEST_F(BindingTest, ValuesKeepTheirRangeAndNamesComeWithPositions) {
    const double least = std::numeric_limits<double>::denorm_min();
    EXPECT_EQ(CMPISint64(CmpiData(CMPISint64(LLONG_MIN))), LLONG_MIN);
    EXPECT_EQ(CMPIUint32(CmpiData(CMPIUint32(UINT_MAX))), UINT_MAX);
    EXPECT_EQ(CmpiData(least).getReal64(), least);
    EXPECT_TRUE(CmpiTrue.getBoolean() && CmpiFalse.getType() == CMPI_boolean);
    EXPECT_EQ(CmpiCharData(0xFFFF).getChar16(), 0xFFFF);
    CmpiInstance instance(CmpiObjectPath("root", "C"));
    instance.setProperty("Size", CmpiData(CMPIUint64(ULLONG_MAX)));
    CmpiString name;
    EXPECT_EQ(CMPIUint64(instance.getProperty(0, &name)), ULLONG_MAX);
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
    CMPIStringFT table{};
    table.getCharPtr = [](const CMPIString*, CMPIStatus*) -> const char* { return nullptr; };
    CMPIString textless{nullptr, &table}, tableless{nullptr, nullptr};
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
    const std::size_t made = m_server.liveObjects();
    {
        EXPECT_FALSE(CmpiObjectPath(path).isNull() || CmpiInstance(instance).isNull());
        CmpiString shared;
        shared = text;
        const CmpiData data(text), copy(data);
        EXPECT_EQ(shared.charPtr(), copy.getString().charPtr());
        EXPECT_EQ(m_server.liveObjects(), made);
    }
    const CmpiString own(text);
    const CmpiDateTime ownInterval(interval);
    EXPECT_EQ(m_server.liveObjects(), made + 2);
    EXPECT_NE(own.charPtr(), text.charPtr());
    EXPECT_EQ(ownInterval.getDateTime(), 90000000u);
    EXPECT_TRUE(ownInterval.isInterval());
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
    CMPIInstanceFT& ofInstances = *m_scope.wrap(cimom::Instance())->ft;
    CMPIObjectPathFT& ofPaths = *m_scope.wrap(cimom::ObjectPath())->ft;
    CMPIBrokerEncFT& eft = *m_mb.eft;
    CMPIArrayFT& ofArrays = *eft.newArray(&m_mb, 1, CMPI_uint8, nullptr)->ft;
    const auto withholdAll = [](auto&... entries) { (withhold(entries), ...); };
    withholdAll(eft.newString, eft.newObjectPath, eft.newInstance, eft.newArgs, eft.newArray,
                eft.newDateTime, eft.newDateTimeFromBinary, m_mb.bft->getInstance,
                ofInstances.getObjectPath);
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_ACCESS_DENIED}) {
        outcome = rc;
        for (const auto& [creates, call] : kCalls) {
            EXPECT_TRUE(!creates || codeOf(call) == (rc == CMPI_RC_OK ? CMPI_RC_ERR_FAILED : rc));
        }
    }
    const auto emptied = [](auto&... tables) { ((tables = {}), ...); };
    emptied(*m_mb.bft, eft, *m_scope.context()->ft, ofInstances, ofPaths, *args.getEnc()->ft,
            ofArrays);
    for (const bool tables : {true, false}) {
        if (!tables) {
            emptied(m_mb.bft, m_mb.eft);
        }
        for (const auto& c : kCalls) {
            EXPECT_EQ(codeOf(c.second), CMPI_RC_ERR_NOT_SUPPORTED) << &c - kCalls;
        }
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
    for (const auto& call : kCalls) {
        EXPECT_EQ(codeOf(call), CMPI_RC_ERR_INVALID_HANDLE);
    }
}

TEST(WithoutBroker, NothingIsMade) {
    EXPECT_EQ(codeOf([] { CmpiString("x"); }), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(codeOf([] { CmpiObjectPath("root", "C"); }), CMPI_RC_ERR_FAILED);
}

}  // namespace
