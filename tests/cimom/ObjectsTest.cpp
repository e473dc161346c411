// The objects that the broker hands to providers, through the C function tables.
#include <cmath>
#include <cstring>
#include <thread>

#include "Fixture.h"

namespace {

using namespace cimom;

std::string textOf(const CMPIString* string) {
    const char* text = string ? string->ft->getCharPtr(string, nullptr) : nullptr;
    return text ? text : "(null)";
}

class Objects : public fixture::BothBrokers {
protected:
    CMPIBroker* mb() { return m_server.broker(); }
    CMPIBrokerEncFT* eft() { return mb()->eft; }
    CMPIString* string(const char* text) { return eft()->newString(mb(), text, nullptr); }

    Server m_server{{GetParam(), "", {}, nullptr}};
    std::optional<RequestScope> m_scope{m_server};
};

Instance part() { return Instance({"test/x", "Part", {{"Id", 7}}}, {{"Id", 7}, {"Note", "n"}}); }

const Value kValues[] = {true,
                         Value::char16(0x20AC),
                         std::uint8_t{255},
                         std::uint16_t{65535},
                         std::uint32_t{4294967295},
                         std::uint64_t{18446744073709551615U},
                         std::int8_t{-128},
                         std::int16_t{-32768},
                         std::int32_t{-2147483647},
                         std::int64_t{INT64_MIN},
                         1.5F,
                         1e300,
                         "",
                         "text \xC3\xA9",
                         DateTime(),
                         DateTime::fromBinary(1600000000123456, false),
                         ObjectPath("test/x", "Other", {{"A", 1}, {"B", "b"}}),
                         part(),
                         Value::array(CMPI_string, {"a", Value(), "c"}),
                         Value::array(CMPI_uint16, {}),
                         Value::array(CMPI_boolean, {true, false}),
                         Value::array(CMPI_real32, {0.25F}),
                         Value::array(CMPI_instance, {part(), part()}),
                         Value::array(CMPI_dateTime, {DateTime()}),
                         Value::array(CMPI_ref, {ObjectPath("n", "C")}),
                         Value::null(CMPI_uint32),
                         Value::null(CMPI_stringA),
                         Value::null(CMPI_instance)};

TEST_P(Objects, ValuesOfAllTypesComeBack) {
    NamedValues all;
    for (const Value& value : kValues) all.set("v" + std::to_string(all.size()), value);
    CMPIArgs* from = m_scope->wrap(all);
    CMPIArgs* to = eft()->newArgs(mb(), nullptr);
    CMPIInstance* inst = m_scope->wrap(Instance({"test/x", "Any"}));
    ASSERT_EQ(from->ft->getArgCount(from, nullptr), all.size());
    for (CMPICount i = 0; i < all.size(); ++i) {
        CMPIString* name = nullptr;
        CMPIStatus rc{CMPI_RC_ERR_FAILED, nullptr};
        CMPIData data = from->ft->getArgAt(from, i, &name, &rc);
        ASSERT_EQ(rc.rc, CMPI_RC_OK);
        EXPECT_EQ((data.state & CMPI_nullValue) != 0, all.at(i).value.isNull());
        const CMPIValue* value = data.state & CMPI_nullValue ? nullptr : &data.value;
        EXPECT_EQ(to->ft->addArg(to, textOf(name).c_str(), value, data.type).rc, CMPI_RC_OK);
        EXPECT_EQ(inst->ft->setProperty(inst, textOf(name).c_str(), value, data.type).rc,
                  CMPI_RC_OK);
    }
    EXPECT_EQ(RequestScope::read(to), all);
    EXPECT_EQ(RequestScope::read(inst).properties, all);
    // Names are found whatever their case; what is not there has the status of its kind.
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    EXPECT_EQ(to->ft->getArg(to, "V0", &rc).value.boolean, 1);
    to->ft->getArg(to, "none", &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NOT_FOUND);
    inst->ft->getProperty(inst, "none", &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    inst->ft->getPropertyAt(inst, 1000, nullptr, &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(to->ft->addArg(to, "q", nullptr, CMPI_filter).rc, CMPI_RC_OK);  // a null is a null
    CMPIValue value{};
    EXPECT_EQ(to->ft->addArg(to, "q", &value, CMPI_filter).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_P(Objects, ArraysCheckWhatTheyAreGiven) {
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    CMPIArray* array = eft()->newArray(mb(), 2, CMPI_chars, &rc);
    EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_string);
    const auto* text = reinterpret_cast<const CMPIValue*>("x");
    CMPIValue number{};
    EXPECT_EQ(array->ft->setElementAt(array, 1, text, CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(array->ft->setElementAt(array, 2, text, CMPI_chars).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(array->ft->setElementAt(array, 0, &number, CMPI_uint8).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(array->ft->getElementAt(array, 0, nullptr).state, CMPI_nullValue);
    EXPECT_EQ(textOf(array->ft->getElementAt(array, 1, nullptr).value.string), "x");
    array->ft->getElementAt(array, 2, &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    for (const CMPIType bad : {CMPIType{CMPI_null}, CMPIType{CMPI_stringA}, CMPIType{CMPI_args}}) {
        EXPECT_EQ(eft()->newArray(mb(), 1, bad, &rc), nullptr);
        EXPECT_EQ(rc.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
}

TEST_P(Objects, DateTimes) {
    const struct {
        const char* text;
        bool valid;
        bool interval;
        std::uint64_t micros;
    } rows[] = {
        {"19700101000001.000002+000", true, false, 1000002},
        {"19700101010000.000000+060", true, false, 0},
        {"20000229120000.500000-300", true, false, 951843600500000},
        {"00000001000000.000000:000", true, true, 86400000000},
        {"00000000000000.00****:000", true, true, 0},
        {"200002**120000.500000-300", false, false, 0},
        {"20001329120000.000000+000", false, false, 0},
        {"20000229120000.000000x000", false, false, 0},
        {"00000001000000.000000:001", false, false, 0},
        {"2000", false, false, 0},
        {"", false, false, 0},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.text);
        CMPIStatus rc{CMPI_RC_OK, nullptr};
        CMPIDateTime* when = eft()->newDateTimeFromChars(mb(), row.text, &rc);
        EXPECT_EQ(rc.rc, row.valid ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_PARAMETER);
        ASSERT_EQ(when != nullptr, row.valid);
        if (!when) continue;
        EXPECT_EQ(textOf(when->ft->getStringFormat(when, nullptr)), row.text);
        EXPECT_EQ(when->ft->isInterval(when, nullptr) != 0, row.interval);
        EXPECT_EQ(when->ft->getBinaryFormat(when, nullptr), row.micros);
        CMPIDateTime* same =
            eft()->newDateTimeFromBinary(mb(), row.micros, row.interval ? 1 : 0, nullptr);
        EXPECT_EQ(same->ft->getBinaryFormat(same, nullptr), row.micros);
    }
    EXPECT_EQ(DateTime::fromBinary(UINT64_MAX, false).text().size(), 25U);
    EXPECT_EQ(DateTime::fromBinary(UINT64_MAX, true).text().substr(0, 8), "99999999");
}

TEST_P(Objects, PathsAndInstances) {
    CMPIObjectPath* path = eft()->newObjectPath(mb(), "test/x", "Thing", nullptr);
    path->ft->setHostname(path, "h");
    path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>("a"), CMPI_chars);
    EXPECT_EQ(path->ft->addKey(path, "", nullptr, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    EXPECT_TRUE(path->ft->getKey(path, "NAME", &rc).state & CMPI_keyValue);
    path->ft->getKey(path, "none", &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NOT_FOUND);
    path->ft->getClassQualifier(path, "Key", &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NOT_SUPPORTED);

    // Key properties and path are one; a filter spares the keys.
    CMPIInstance* inst = eft()->newInstance(mb(), path, nullptr);
    EXPECT_EQ(textOf(inst->ft->getProperty(inst, "Name", nullptr).value.string), "a");
    inst->ft->setProperty(inst, "Name", reinterpret_cast<const CMPIValue*>("b"), CMPI_chars);
    inst->ft->setProperty(inst, "Old", reinterpret_cast<const CMPIValue*>("o"), CMPI_chars);
    const char* wanted[] = {"kept", nullptr};
    inst->ft->setPropertyFilter(inst, wanted, nullptr);
    for (const char* name : {"Kept", "Dropped"})
        EXPECT_EQ(
            inst->ft->setProperty(inst, name, reinterpret_cast<const CMPIValue*>("v"), CMPI_chars)
                .rc,
            CMPI_RC_OK);
    const Instance seen = RequestScope::read(inst);
    EXPECT_EQ(seen.properties, NamedValues({{"Name", "b"}, {"Kept", "v"}}));
    EXPECT_EQ(textOf(eft()->toString(mb(), inst->ft->getObjectPath(inst, nullptr), nullptr)),
              "//h/test/x:Thing.Name=\"b\"");

    CMPIObjectPath* other = eft()->newObjectPath(mb(), "", "Other", nullptr);
    other->ft->setHostAndNameSpaceFromObjectPath(other, path);
    EXPECT_EQ(RequestScope::read(other), [] {
        ObjectPath want("test/x", "Other");
        want.host = "h";
        return want;
    }());
    inst->ft->setObjectPath(inst, other);
    EXPECT_EQ(RequestScope::read(inst).path.className, "Other");
    EXPECT_TRUE(eft()->classPathIsA(mb(), other, "OTHER", &rc));
    EXPECT_FALSE(eft()->classPathIsA(mb(), other, "Thing", &rc));
    EXPECT_TRUE(eft()->isOfType(mb(), other, "CMPIObjectPath", nullptr));
    EXPECT_EQ(textOf(eft()->getType(mb(), inst, nullptr)), "CMPIInstance");
}

TEST_P(Objects, ReleasedObjectsAreCountedAndRefused) {
    const std::size_t live = m_server.liveObjects(), stale = m_server.staleUses();
    CMPIString* own = string("of the request");
    CMPIString* clone = own->ft->clone(own, nullptr);
    EXPECT_EQ(m_server.liveObjects(), live + 2);
    EXPECT_EQ(own->ft->release(own).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.liveObjects(), live + 1);
    EXPECT_EQ(own->ft->release(own).rc, CMPI_RC_ERR_INVALID_HANDLE);
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    EXPECT_EQ(own->ft->getCharPtr(own, &rc), nullptr);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(m_server.staleUses(), stale + 2);

    string("left behind");
    m_scope.reset();  // the request ends
    EXPECT_EQ(m_server.liveObjects(), 1U);
    EXPECT_EQ(textOf(clone), "of the request");
    EXPECT_EQ(clone->ft->release(clone).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.liveObjects(), 0U);
    EXPECT_EQ(own->ft->getCharPtr(nullptr, &rc), nullptr);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_P(Objects, MarksEndWhatCameAfterThem) {
    CMPIString* before = string("before");
    const std::size_t live = m_server.liveObjects();
    CMPIGcStat* outer = mb()->mft->mark(mb(), nullptr);
    CMPIString* inside = string("inside");
    CMPIGcStat* inner = mb()->mft->mark(mb(), nullptr);
    string("deep");
    CMPIString* clone = inside->ft->clone(inside, nullptr);
    EXPECT_EQ(m_server.liveObjects(), live + 3);
    EXPECT_EQ(mb()->mft->release(mb(), outer).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.liveObjects(), live + 1);
    EXPECT_EQ(mb()->mft->release(mb(), inner).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(textOf(before), "before");
    EXPECT_EQ(textOf(clone), "inside");
    EXPECT_EQ(clone->ft->release(clone).rc, CMPI_RC_OK);
    m_scope.reset();
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    EXPECT_EQ(mb()->mft->mark(mb(), &rc), nullptr);  // no request on this thread
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_FAILED);
}

TEST_P(Objects, OtherThreadsAttach) {
    CMPIContext* handed = mb()->bft->prepareAttachThread(mb(), m_scope->context());
    CMPIString* fromThere = nullptr;
    std::thread([&] {
        EXPECT_EQ(mb()->bft->detachThread(mb(), handed).rc, CMPI_RC_ERR_FAILED);
        ASSERT_EQ(mb()->bft->attachThread(mb(), handed).rc, CMPI_RC_OK);
        CMPIString* made = string("there");
        fromThere = made->ft->clone(made, nullptr);
        EXPECT_EQ(mb()->bft->detachThread(mb(), handed).rc, CMPI_RC_OK);
    }).join();
    EXPECT_EQ(textOf(fromThere), "there");
    fromThere->ft->release(fromThere);
    m_scope.reset();
    EXPECT_EQ(m_server.liveObjects(), 0U);
}

TEST_P(Objects, ContextsTellTheRequest) {
    Request request;
    request.language = "de";
    request.flags = CMPI_FLAG_LocalOnly;
    request.context.set("Extra", 5);
    RequestScope scope(m_server, request);
    CMPIContext* ctx = scope.context();
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    CMPIData user = ctx->ft->getEntry(ctx, CMPIPrincipal, &rc);
    ASSERT_EQ(rc.rc, CMPI_RC_OK);
    ASSERT_EQ(user.type, CMPI_string);
    EXPECT_EQ(textOf(user.value.string), lean() ? "(null)" : "");
    EXPECT_EQ(textOf(ctx->ft->getEntry(ctx, CMPIAcceptLanguage, &rc).value.string), "de");
    EXPECT_EQ(textOf(ctx->ft->getEntry(ctx, CMPIInitNameSpace, &rc).value.string), "root/cimv2");
    EXPECT_EQ(ctx->ft->getEntry(ctx, CMPIInvocationFlags, &rc).value.uint32, 1U);
    EXPECT_EQ(ctx->ft->getEntry(ctx, "Extra", &rc).value.sint32, 5);
    ctx->ft->getEntry(ctx, CMPIRole, &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

// Null entries of a table behind its version, "" for a complete one.
template <class T>
std::string nullEntries(const T& table, std::size_t header) {
    std::string nulls;
    for (std::size_t at = header; at < sizeof table; at += sizeof(void*)) {
        void* entry = nullptr;
        std::memcpy(&entry, reinterpret_cast<const char*>(&table) + at, sizeof entry);
        if (!entry) nulls += std::to_string(at / sizeof(void*)) + " ";
    }
    return nulls;
}

TEST_P(Objects, TablesAreCompleteOrEndEarly) {
    CMPIObjectPath* path = eft()->newObjectPath(mb(), "n", "C", nullptr);
    CMPIInstance* inst = eft()->newInstance(mb(), path, nullptr);
    CMPISelectExp* query = eft()->newSelectExp(mb(), "SELECT * FROM C", "WQL", nullptr, nullptr);
    Reply reply;
    CMPIResult* result = m_scope->result(reply);
    EXPECT_EQ(nullEntries(*mb()->bft, 16), "");
    EXPECT_EQ(nullEntries(*mb()->xft, 8), "");
    EXPECT_EQ(nullEntries(*eft(), 8), lean() ? "17 18 19 20 " : "");
    EXPECT_EQ(nullEntries(*inst->ft, 8), lean() ? "10 " : "");
    EXPECT_EQ(nullEntries(*path->ft, 8), lean() ? "19 " : "");
    EXPECT_EQ(nullEntries(*result->ft, 8), lean() ? "7 " : "");
    EXPECT_EQ(nullEntries(*query->ft, 8), lean() ? "5 6 7 " : "");
    EXPECT_EQ(mb()->mft->cmpiMalloc == nullptr, lean());
    EXPECT_EQ(inst->ft->ftVersion, lean() ? 1 : CMPIVersion200);
    EXPECT_EQ(mb()->mft->ftVersion, lean() ? 0 : CMPIVersion200);
    LogCollector log(m_server);
    const CMPIrc want = lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_OK;
    EXPECT_EQ(eft()->logMessage(mb(), CMPI_SEV_ERROR, "Me", "text", nullptr).rc, want);
    EXPECT_EQ(eft()->trace(mb(), static_cast<CMPILevel>(3), "Me", nullptr, string("s")).rc, want);
    EXPECT_EQ(log.lines().size(), lean() ? 0U : 2U);
    EXPECT_EQ(log.contains(LogLine::Kind::Message, 1, "Me", "tex"), !lean());
    EXPECT_EQ(log.contains(LogLine::Kind::Trace, 3, "Me", "s"), !lean());
}

ON_BOTH_BROKERS(Objects);

// -- what only a full broker has ------------------------------------------------------------------

class FullObjects : public testing::Test {
protected:
    Server m_server;
    RequestScope m_scope{m_server};
    CMPIBroker* m_mb = m_server.broker();
};

CMPIData accessSeverity(const char* name, void* parm) {
    CMPIData data{};
    data.type = CMPI_uint16;
    data.state = std::strcmp(name, "Severity") == 0 ? CMPI_goodValue : CMPI_nullValue;
    data.value.uint16 = *static_cast<std::uint16_t*>(parm);
    return data;
}

TEST_F(FullObjects, QueriesHaveNormalForms) {
    CMPIArray* names = nullptr;
    CMPISelectExp* query = m_mb->eft->newSelectExp(
        m_mb,
        "SELECT Severity, Text FROM Fix_Event WHERE (Severity > 3 OR Text LIKE 'a%') AND "
        "NOT Text IS NULL",
        "CIM:CQL", &names, nullptr);
    ASSERT_NE(query, nullptr);
    EXPECT_EQ(names->ft->getSize(names, nullptr), 2U);
    int type = -1;
    CMPISelectCond* doc = query->ft->getDOC(query, nullptr);
    EXPECT_EQ(doc->ft->getCountAndType(doc, &type, nullptr), 2U);
    EXPECT_EQ(type, CMPI_COND_DOC);
    CMPISelectCond* cod = query->ft->getCOD(query, nullptr);
    EXPECT_EQ(cod->ft->getCountAndType(cod, &type, nullptr), 2U);
    EXPECT_EQ(type, CMPI_COND_COD);
    CMPISubCond* sub = doc->ft->getSubCondAt(doc, 0, nullptr);
    ASSERT_EQ(sub->ft->getCount(sub, nullptr), 2U);
    CMPIPredicate* predicate = sub->ft->getPredicate(sub, "severity", nullptr);
    CMPIType literal = 0;
    CMPIPredOp op = CMPI_PredOp_Equals;
    CMPIString *left = nullptr, *right = nullptr;
    EXPECT_EQ(predicate->ft->getData(predicate, &literal, &op, &left, &right).rc, CMPI_RC_OK);
    EXPECT_EQ(literal, CMPI_integerString);
    EXPECT_EQ(op, CMPI_PredOp_GreaterThan);
    EXPECT_EQ(textOf(left) + textOf(right), "Severity3");
    for (const std::uint16_t severity : {std::uint16_t{3}, std::uint16_t{4}}) {
        std::uint16_t value = severity;
        EXPECT_EQ(
            predicate->ft->evaluateUsingAccessor(predicate, accessSeverity, &value, nullptr) != 0,
            severity > 3);
        EXPECT_FALSE(query->ft->evaluateUsingAccessor(query, accessSeverity, &value, nullptr));
    }
}

TEST_F(FullObjects, QueriesSelect) {
    const Instance event({"root/cimv2", "Fix_Event"},
                         {{"Severity", std::uint16_t{5}},
                          {"Text", "abc"},
                          {"When", DateTime::fromBinary(1000000, false)},
                          {"Source", part()},
                          {"Empty", Value::null(CMPI_string)}});
    const struct {
        const char* where;
        int expected;  // 1, 0, or -1 for an invalid query
    } rows[] = {
        {"", 1},
        {"WHERE Severity = 5", 1},
        {"WHERE 4 < Severity AND Severity <= 5", 1},
        {"where severity <> 5 or text = \"ABC\"", 1},
        {"WHERE NOT (Severity = 5 AND Text = 'abc')", 0},
        {"WHERE Text LIKE '%b_'", 1},
        {"WHERE Text LIKE 'b%'", 0},
        {"WHERE NOT Text LIKE 'b%'", 1},
        {"WHERE Empty = 'x' OR NOT Empty = 'x'", 0},  // null compares with nothing
        {"WHERE Empty IS NULL AND Text IS NOT NULL", 1},
        {"WHERE When = '19700101000001.000000+000'", 1},
        {"WHERE Source.Note = 'n' AND Source ISA Part", 1},
        {"WHERE SELF ISA Fix_Event AND NOT SELF ISA Other", 1},
        {"WHERE Severity = -1.5e3", 0},
        {"WHERE Severity", -1},
        {"WHERE Severity = 5 5", -1},
        {"WHERE Text = 'open", -1},
        {"WHERE (Severity = 5", -1},
        {"WHERE Severity = 1x", -1},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.where);
        CMPIStatus rc{CMPI_RC_OK, nullptr};
        CMPISelectExp* query = m_mb->eft->newSelectExp(
            m_mb, (std::string("SELECT * FROM Fix_Event ") + row.where).c_str(), "WQL", nullptr,
            &rc);
        EXPECT_EQ(rc.rc, row.expected < 0 ? CMPI_RC_ERR_INVALID_QUERY : CMPI_RC_OK);
        if (!query) continue;
        EXPECT_EQ(query->ft->evaluate(query, m_scope.wrap(event), nullptr), row.expected);
    }
    CMPIStatus rc{CMPI_RC_OK, nullptr};
    m_mb->eft->newSelectExp(m_mb, "SELECT * FROM X", "SQL", nullptr, &rc);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
    std::string wide = "SELECT * FROM X WHERE a=1";
    for (int i = 0; i < 20; ++i) wide += " AND (b=1 OR c=2)";
    CMPISelectExp* query = m_mb->eft->newSelectExp(m_mb, wide.c_str(), "WQL", nullptr, &rc);
    EXPECT_EQ(query->ft->getDOC(query, &rc), nullptr);
    EXPECT_EQ(rc.rc, CMPI_RC_ERR_FAILED);
}

TEST_F(FullObjects, ErrorsAreReturned) {
    CMPIError* error = m_mb->eft->newCMPIError(m_mb, "me", "E1", "broken", ErrorSevHigh, Timeout,
                                               CMPI_RC_ERR_FAILED, nullptr);
    error->ft->setErrorType(error, SoftwareError);
    error->ft->setErrorSource(error, "here");
    CMPIArray* actions = m_mb->eft->newArray(m_mb, 1, CMPI_chars, nullptr);
    actions->ft->setElementAt(actions, 0, reinterpret_cast<const CMPIValue*>("wait"), CMPI_chars);
    EXPECT_EQ(error->ft->setRecommendedActions(error, actions).rc, CMPI_RC_OK);
    CMPIArray* numbers = m_mb->eft->newArray(m_mb, 1, CMPI_uint8, nullptr);
    EXPECT_EQ(error->ft->setMessageArguments(error, numbers).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(error->ft->getErrorType(error, nullptr), SoftwareError);
    EXPECT_EQ(error->ft->getPerceivedSeverity(error, nullptr), ErrorSevHigh);
    EXPECT_EQ(error->ft->getCIMStatusCode(error, nullptr), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(textOf(error->ft->getMessage(error, nullptr)), "broken");
    EXPECT_EQ(error->ft->getOtherErrorType(error, nullptr), nullptr);
    Reply reply;
    CMPIResult* result = m_scope.result(reply);
    EXPECT_EQ(result->ft->returnError(result, error).rc, CMPI_RC_OK);
    ASSERT_EQ(reply.errors.size(), 1U);
    EXPECT_EQ(*reply.errors[0].find("ErrorSource"), Value("here"));
}

TEST_F(FullObjects, MemoryAndThreadsOfProviders) {
    CMPIBrokerMemFT* mft = m_mb->mft;
    char* text = mft->cmpiStrDup(m_mb, "text");
    text = static_cast<char*>(mft->cmpiRealloc(m_mb, text, 100));
    EXPECT_STREQ(text, "text");
    mft->cmpiFree(m_mb, text);
    EXPECT_EQ(mft->cmpiCalloc(m_mb, SIZE_MAX, 2), nullptr);
    EXPECT_EQ(static_cast<char*>(mft->cmpiCalloc(m_mb, 2, 2))[3], 0);  // freed with the broker
    const std::size_t stale = m_server.staleUses();
    int local = 0;
    mft->cmpiFree(m_mb, &local);
    EXPECT_EQ(m_server.staleUses(), stale + 1);

    CMPIBrokerExtFT* xft = m_mb->xft;
    struct Shared {
        CMPIBrokerExtFT* xft;
        void *mutex, *condition;
        bool ready;
    } shared{xft, xft->newMutex(0), xft->newCondition(0), false};
    void* thread = xft->newThread(
        [](void* parm) -> void* {
            auto* s = static_cast<Shared*>(parm);
            s->xft->lockMutex(s->mutex);
            s->ready = true;
            s->xft->signalCondition(s->condition);
            s->xft->unlockMutex(s->mutex);
            return parm;
        },
        &shared, 0);
    xft->lockMutex(shared.mutex);
    while (!shared.ready) xft->condWait(shared.condition, shared.mutex);
    xft->unlockMutex(shared.mutex);
    void* answer = nullptr;
    EXPECT_EQ(xft->joinThread(thread, &answer), 0);
    EXPECT_EQ(answer, &shared);
    xft->destroyCondition(shared.condition);
    xft->destroyMutex(shared.mutex);
    char* file = xft->resolveFileName("thing");
    EXPECT_STREQ(file, "libthing.so");
    free(file);
}

}  // namespace
