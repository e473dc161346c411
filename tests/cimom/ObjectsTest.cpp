// The objects that the broker hands to providers, through the C function tables.
#include <cstring>
#include <thread>
#include <tuple>

#include "Fixture.h"
#include "cmpimacs.h"

namespace {

using namespace cimom;

using fixture::textOf;

class Objects : public BothBrokers {
protected:
    CMPIString* string(const char* text) { return CMNewString(m_mb, text, nullptr); }

    Server m_server{{GetParam(), "", {}, nullptr}};
    std::optional<RequestScope> m_scope{m_server};
    CMPIBroker* const m_mb = m_server.broker();
    CMPIStatus m_rc{CMPI_RC_OK, nullptr};
};

Instance part() { return Instance({"test/x", "Part", {{"Id", 7}}}, {{"Id", 7}, {"Note", "n"}}); }

template <class... Each>
std::vector<Value> valuesOf(const Each&... each) {
    return {Value(each)...};
}

TEST_P(Objects, ValuesOfAllTypesComeBack) {
    NamedValues all;
    for (const Value& value : valuesOf(
             true, Value::char16(0x20AC), std::uint8_t{255}, std::uint16_t{65535}, UINT32_MAX,
             UINT64_MAX, std::int8_t{-128}, std::int16_t{-32768}, INT32_MIN, INT64_MIN, 1.5F, 1e300,
             "", "text \xC3\xA9", DateTime(), DateTime::fromBinary(1600000000123456, false),
             ObjectPath("test/x", "Other", {{"A", 1}, {"B", "b"}}), part(),
             Value::array(CMPI_string, {"a", Value(), "c"}), Value::array(CMPI_uint16, {}),
             Value::array(CMPI_boolean, {true, false}), Value::array(CMPI_real32, {0.25F}),
             Value::array(CMPI_instance, {part(), part()}),
             Value::array(CMPI_dateTime, {DateTime()}),
             Value::array(CMPI_ref, {ObjectPath("n", "C")}), Value::null(CMPI_uint32),
             Value::null(CMPI_stringA), Value::null(CMPI_instance))) {
        all.set("v" + std::to_string(all.size()), value);
    }
    CMPIArgs* from = m_scope->wrap(all);
    CMPIArgs* to = CMNewArgs(m_mb, nullptr);
    CMPIInstance* inst = m_scope->wrap(Instance({"test/x", "Any"}));
    ASSERT_EQ(CMGetArgCount(from, nullptr), all.size());
    for (CMPICount i = 0; i < all.size(); ++i) {
        CMPIString* name = nullptr;
        m_rc.rc = CMPI_RC_ERR_FAILED;
        const CMPIData data = CMGetArgAt(from, i, &name, &m_rc);
        ASSERT_EQ(m_rc.rc, CMPI_RC_OK);
        const CMPIValue* value = CMIsNullValue(data) ? nullptr : &data.value;
        EXPECT_EQ(CMAddArg(to, CMGetCharPtr(name), value, data.type).rc, CMPI_RC_OK);
        EXPECT_EQ(CMSetProperty(inst, CMGetCharPtr(name), value, data.type).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(RequestScope::read(to), all);
    EXPECT_EQ(RequestScope::read(inst).properties, all);
    // Names are found whatever their case; what is not there has the status of its kind.
    EXPECT_EQ(CMGetArg(to, "V0", &m_rc).value.boolean, 1);
    const CMPIrc missing = lean() ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_ERR_NO_SUCH_PROPERTY;
    CMGetArg(to, "none", &m_rc);
    EXPECT_EQ(m_rc.rc, missing);
    EXPECT_EQ(CMIsNullValue(CMGetProperty(inst, "none", &m_rc)) != 0, !lean());
    EXPECT_EQ(m_rc.rc, missing);
    CMGetPropertyAt(inst, 1000, nullptr, &m_rc);
    EXPECT_EQ(m_rc.rc, missing);
    EXPECT_EQ(CMAddArg(to, "q", nullptr, CMPI_filter).rc, CMPI_RC_OK);  // a null is a null
    const CMPIValue value{};
    EXPECT_EQ(CMAddArg(to, "q", &value, CMPI_filter).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_P(Objects, ArraysCheckWhatTheyAreGiven) {
    const CMPIrc outside = lean() ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_NO_SUCH_PROPERTY;
    const CMPIrc mismatch = lean() ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_TYPE_MISMATCH;
    CMPIValue number{}, text{};
    text.string = string("s");
    CMPIArray* array = CMNewArray(m_mb, 2, CMPI_chars, &m_rc);
    EXPECT_EQ(CMGetArrayType(array, nullptr), lean() ? CMPI_string : CMPI_chars);
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &text, CMPI_string).rc, lean() ? CMPI_RC_OK : mismatch);
    EXPECT_EQ(CMSetArrayElementAt(array, 1, "x", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetArrayElementAt(array, 2, "x", CMPI_chars).rc, outside);
    EXPECT_EQ(CMSetArrayElementAt(array, 0, &number, CMPI_uint8).rc, mismatch);
    EXPECT_EQ(CMGetArrayElementAt(array, 0, nullptr).state, CMPI_nullValue);
    const CMPIData x = CMGetArrayElementAt(array, 1, nullptr);
    EXPECT_EQ(lean() ? textOf(x.value.string) : x.value.chars, "x");
    EXPECT_EQ(CMGetArrayElementAt(array, 2, &m_rc).state == CMPI_badValue, lean());
    EXPECT_EQ(m_rc.rc, lean() ? CMPI_RC_OK : outside);
    CMPIArgs* args = CMNewArgs(m_mb, nullptr);
    CMAddArg(args, "a", &array, CMPI_charsA);  // wherever it goes, it is one of strings
    EXPECT_EQ(*RequestScope::read(args).find("a"), Value::array(CMPI_string, {Value(), "x"}));
    array = CMNewArray(m_mb, 1, CMPI_string, &m_rc);
    EXPECT_EQ(CMSetArrayElementAt(array, 0, "x", CMPI_chars).rc, lean() ? CMPI_RC_OK : mismatch);
    for (const CMPIType bad : {CMPIType{CMPI_null}, CMPIType{CMPI_stringA}, CMPIType{CMPI_args}}) {
        EXPECT_EQ(CMNewArray(m_mb, 1, bad, &m_rc), nullptr);
        EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
}

TEST_P(Objects, DateTimes) {
    const std::tuple<const char*, bool, std::uint64_t> rows[] = {
        {"19700101000001.000002+000", false, 1000002},
        {"19700101010000.000000+060", false, 0},
        {"20000229120000.500000-300", false, 951843600500000},
        {"00000001000000.000000:000", true, 86400000000},
        {"00000000000000.00****:000", true, 0},
    };
    for (const auto& [text, interval, micros] : rows) {
        SCOPED_TRACE(text);
        CMPIDateTime* when = CMNewDateTimeFromChars(m_mb, text, &m_rc);
        ASSERT_EQ(m_rc.rc, CMPI_RC_OK);
        EXPECT_EQ(textOf(CMGetStringFormat(when, nullptr)), text);
        EXPECT_EQ(CMIsInterval(when, nullptr) != 0, interval);
        EXPECT_EQ(CMGetBinaryFormat(when, nullptr), micros);
        when = CMNewDateTimeFromBinary(m_mb, micros, interval, nullptr);
        EXPECT_EQ(CMGetBinaryFormat(when, nullptr), micros);
    }
    for (const char* bad : {"200002**120000.500000-300", "20001329120000.000000+000",
                            "20000229120000.000000x000", "00000001000000.000000:001", "2000", ""}) {
        EXPECT_EQ(CMNewDateTimeFromChars(m_mb, bad, &m_rc), nullptr) << bad;
        EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    }
    EXPECT_EQ(DateTime::fromBinary(UINT64_MAX, false).text().size(), 25U);
    EXPECT_EQ(DateTime::fromBinary(UINT64_MAX, true).text().substr(0, 8), "99999999");
}

TEST_P(Objects, PathsAndInstances) {
    CMPIObjectPath* path = CMNewObjectPath(m_mb, "test/x", "Thing", nullptr);
    CMSetHostname(path, "h");
    CMAddKey(path, "Name", "a", CMPI_chars);
    EXPECT_EQ(CMAddKey(path, "", nullptr, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_TRUE(CMIsKeyValue(CMGetKey(path, "NAME", &m_rc)));
    CMGetKey(path, "none", &m_rc);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_NOT_FOUND);
    CMGetClassQualifier(path, "Key", &m_rc);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_NOT_SUPPORTED);

    // Key properties and path are one; a filter spares the keys.
    CMPIInstance* inst = CMNewInstance(m_mb, path, nullptr);
    EXPECT_EQ(textOf(CMGetProperty(inst, "Name", nullptr).value.string), "a");
    CMSetProperty(inst, "Name", "b", CMPI_chars);
    CMSetProperty(inst, "Old", "o", CMPI_chars);
    const char *wanted[] = {"kept", nullptr}, *keys[] = {"name", nullptr};
    CMPIInstance* keyless = CMClone(inst, nullptr);
    CMSetPropertyFilter(keyless, wanted, nullptr);  // small brokers go by the list of keys
    EXPECT_EQ(RequestScope::read(keyless).properties.empty(), lean());
    EXPECT_EQ(CMGetKeyCount(CMGetObjectPath(keyless, nullptr), nullptr), lean() ? 0U : 1U);
    CMRelease(keyless);
    CMSetPropertyFilter(inst, wanted, keys);
    for (const char* name : {"Kept", "Dropped"}) {
        EXPECT_EQ(CMSetProperty(inst, name, "v", CMPI_chars).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(RequestScope::read(inst).properties, NamedValues({{"Name", "b"}, {"Kept", "v"}}));
    EXPECT_EQ(textOf(CDToString(m_mb, CMGetObjectPath(inst, nullptr), nullptr)),
              "//h/test/x:Thing.Name=\"b\"");
    EXPECT_EQ(CDToString(m_mb, string("s"), nullptr) == nullptr, lean());

    CMPIObjectPath* other = CMNewObjectPath(m_mb, "", "Other", nullptr);
    CMSetHostAndNameSpaceFromObjectPath(other, path);
    CMSetObjectPath(inst, other);
    EXPECT_EQ(textOf(CDToString(m_mb, CMGetObjectPath(inst, nullptr), nullptr)),
              "//h/test/x:Other");
    EXPECT_TRUE(CMClassPathIsA(m_mb, other, "OTHER", &m_rc));
    EXPECT_FALSE(CMClassPathIsA(m_mb, other, "Thing", &m_rc));
    EXPECT_TRUE(CDIsOfType(m_mb, other, "CMPIObjectPath", nullptr));
    EXPECT_EQ(textOf(CDGetType(m_mb, inst, nullptr)), "CMPIInstance");
}

TEST_P(Objects, ReleasedObjectsAreCountedAndRefused) {
    const std::size_t live = m_server.liveObjects(), stale = m_server.staleUses();
    CMPIString* own = string("of the request");
    CMPIString* clone = CMClone(own, nullptr);
    EXPECT_EQ(m_server.liveObjects(), live + 2);
    EXPECT_EQ(CMRelease(own).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.liveObjects(), live + 1);
    EXPECT_EQ(CMRelease(own).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMGetCharsPtr(own, &m_rc), nullptr);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_FALSE(CDIsOfType(m_mb, own, "CMPIString", &m_rc));
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(m_server.staleUses(), stale + 3);
    EXPECT_EQ(own->hdl, nullptr);  // there are those who read a text there
    EXPECT_STREQ(static_cast<char*>(clone->hdl), "of the request");

    string("left behind");
    m_scope.reset();  // the request ends
    EXPECT_EQ(m_server.liveObjects(), 1U);
    EXPECT_EQ(textOf(clone), "of the request");
    EXPECT_EQ(CMRelease(clone).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.liveObjects(), 0U);
    EXPECT_EQ(own->ft->getCharPtr(nullptr, &m_rc), nullptr);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_P(Objects, ManyObjectsEndInAnyOrder) {
    const std::size_t live = m_server.liveObjects(), stale = m_server.staleUses();
    std::vector<CMPIString*> clones;
    for (int i = 0; i < 300; ++i) {
        CMPIString* own = string(std::to_string(i).c_str());
        clones.push_back(CMClone(own, nullptr));
        EXPECT_EQ(CMRelease(own).rc, CMPI_RC_OK);
    }
    for (int step = 0; step < 300; ++step) {
        CMPIString* clone = clones[static_cast<unsigned>(step) * 7U % 300];
        EXPECT_EQ(textOf(clone), std::to_string(step * 7 % 300));
        EXPECT_EQ(CMRelease(clone).rc, CMPI_RC_OK);
        EXPECT_EQ(CMRelease(clone).rc, CMPI_RC_ERR_INVALID_HANDLE);
    }
    EXPECT_EQ(m_server.liveObjects(), live);
    EXPECT_EQ(m_server.staleUses(), stale + 300);
}

TEST_P(Objects, ChangesStayInTheObjectThatIsChanged) {
    Reply reply;
    const CMPIResult* result = m_scope->result(reply);
    CMPIInstance* inst = m_scope->wrap(part());
    CMPIInstance* clone = CMClone(inst, nullptr);
    EXPECT_EQ(CMReturnInstance(result, inst).rc, CMPI_RC_OK);
    CMPIValue value{};
    value.uint16 = 8;
    EXPECT_EQ(CMSetProperty(inst, "Id", &value, CMPI_uint16).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(inst, "More", &value, CMPI_uint16).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(result, inst).rc, CMPI_RC_OK);
    const Value eight(std::uint16_t{8});
    EXPECT_EQ(reply.instances[0], part());
    EXPECT_EQ(reply.instances[1], Instance({"test/x", "Part", {{"Id", eight}}},
                                           {{"Id", eight}, {"Note", "n"}, {"More", eight}}));
    EXPECT_EQ(RequestScope::read(clone), part());
    CMRelease(clone);
}

// Neither takes more than its share of time or stack.
TEST_P(Objects, ManyPropertiesAndDeepOnes) {
    CMPIInstance* wide = m_scope->wrap(Instance({"n", "C"}));
    CMPIValue value{};
    for (std::uint32_t i = 0; i < 100000; ++i) {
        value.uint32 = i;
        CMSetProperty(wide, ("p" + std::to_string(i)).c_str(), &value, CMPI_uint32);
    }
    EXPECT_EQ(CMGetProperty(wide, "P99999", nullptr).value.uint32, 99999U);
    EXPECT_EQ(RequestScope::read(wide), RequestScope::read(CMClone(wide, nullptr)));

    CMPIArray* array = CMNewArray(m_mb, 1, CMPI_instance, nullptr);
    unsigned depth = 0;
    for (m_rc.rc = CMPI_RC_OK; m_rc.rc == CMPI_RC_OK && depth < 100000; ++depth) {
        CMPIInstance* outer = m_scope->wrap(Instance({"n", "C"}));
        value.array = array;
        if (depth > 0) {
            CMSetProperty(outer, "Parts", &value, CMPI_instanceA);
        }
        value.inst = outer;
        array = CMNewArray(m_mb, 1, CMPI_instance, nullptr);
        m_rc = CMSetArrayElementAt(array, 0, &value, CMPI_instance);
    }
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(depth, Value::kMostNested + 1);
    EXPECT_EQ(textOf(m_rc.msg), "paths and instances lie in one another more than 50 deep");
}

TEST_P(Objects, MarksEndWhatCameAfterThem) {
    CMPIString* before = string("before");
    const std::size_t live = m_server.liveObjects();
    CMPIGcStat* outer = m_mb->mft->mark(m_mb, nullptr);
    CMPIString* inside = string("inside");
    CMPIGcStat* inner = m_mb->mft->mark(m_mb, nullptr);
    string("deep");
    CMPIString* clone = CMClone(inside, nullptr);
    EXPECT_EQ(m_server.liveObjects(), live + 3);
    EXPECT_EQ(m_mb->mft->release(m_mb, outer).rc, CMPI_RC_OK);
    EXPECT_EQ(m_server.liveObjects(), live + 1);
    EXPECT_EQ(m_mb->mft->release(m_mb, inner).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(textOf(before), "before");
    EXPECT_EQ(textOf(clone), "inside");
    EXPECT_EQ(CMRelease(clone).rc, CMPI_RC_OK);
    m_scope.reset();
    EXPECT_EQ(m_mb->mft->mark(m_mb, &m_rc), nullptr);  // no request on this thread
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_FAILED);
}

TEST_P(Objects, OtherThreadsAttach) {
    CMPIContext* handed = m_mb->bft->prepareAttachThread(m_mb, m_scope->context());
    CMPIString* fromThere = nullptr;
    std::thread([&] {
        EXPECT_EQ(m_mb->bft->detachThread(m_mb, handed).rc, CMPI_RC_ERR_FAILED);
        ASSERT_EQ(m_mb->bft->attachThread(m_mb, handed).rc, CMPI_RC_OK);
        CMPIString* made = string("there");
        fromThere = CMClone(made, nullptr);
        EXPECT_EQ(m_mb->bft->detachThread(m_mb, handed).rc, CMPI_RC_OK);
    }).join();
    EXPECT_EQ(textOf(fromThere), "there");
    CMRelease(fromThere);
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
    const CMPIData user = CMGetContextEntry(ctx, CMPIPrincipal, &m_rc);
    ASSERT_EQ(m_rc.rc, CMPI_RC_OK);
    ASSERT_EQ(user.type, CMPI_string);
    EXPECT_EQ(textOf(user.value.string), lean() ? "(null)" : "");
    EXPECT_EQ(textOf(CMGetContextEntry(ctx, CMPIAcceptLanguage, &m_rc).value.string), "de");
    EXPECT_EQ(textOf(CMGetContextEntry(ctx, CMPIInitNameSpace, &m_rc).value.string), "root/cimv2");
    EXPECT_EQ(CMGetContextEntry(ctx, CMPIInvocationFlags, &m_rc).value.uint32, 1U);
    EXPECT_EQ(CMGetContextEntry(ctx, "Extra", &m_rc).value.sint32, 5);
    CMGetContextEntry(ctx, CMPIRole, &m_rc);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    CMPIContext* clone = ctx->ft->clone(ctx, &m_rc);
    EXPECT_EQ(m_rc.rc, lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_OK);
    if (clone) {
        CMRelease(clone);
    }
}

// Null entries of a table behind its version, "" for a complete one.
template <class T>
std::string nullEntries(const T& table, std::size_t header) {
    std::string nulls;
    for (std::size_t at = header; at < sizeof table; at += sizeof(void*)) {
        void* entry = nullptr;
        std::memcpy(&entry, reinterpret_cast<const char*>(&table) + at, sizeof entry);
        if (!entry) {
            nulls += std::to_string(at / sizeof(void*)) + " ";
        }
    }
    return nulls;
}

TEST_P(Objects, TablesAreCompleteOrEndEarly) {
    CMPIObjectPath* path = CMNewObjectPath(m_mb, "n", "C", nullptr);
    CMPIInstance* inst = CMNewInstance(m_mb, path, nullptr);
    CMPISelectExp* query = CMNewSelectExp(m_mb, "SELECT * FROM C", "WQL", nullptr, nullptr);
    Reply reply;
    CMPIResult* result = m_scope->result(reply);
    EXPECT_EQ(nullEntries(*m_mb->bft, 16), "");
    EXPECT_EQ(nullEntries(*m_mb->xft, 8), "");
    EXPECT_EQ(nullEntries(*m_mb->eft, 8), lean() ? "17 18 19 20 " : "");
    EXPECT_EQ(nullEntries(*m_scope->context()->ft, 8), lean() ? "6 " : "");
    EXPECT_EQ(nullEntries(*inst->ft, 8), lean() ? "10 " : "");
    EXPECT_EQ(nullEntries(*path->ft, 8), lean() ? "19 " : "");
    EXPECT_EQ(nullEntries(*result->ft, 8), lean() ? "7 " : "");
    EXPECT_EQ(nullEntries(*query->ft, 8), lean() ? "5 6 7 " : "");
    EXPECT_EQ(m_mb->mft->cmpiMalloc == nullptr, lean());
    EXPECT_EQ(inst->ft->ftVersion, lean() ? 1 : CMPIVersion200);
    EXPECT_EQ(m_mb->mft->ftVersion, lean() ? 0 : CMPIVersion200);
    LogCollector log(m_server);
    const CMPIrc want = lean() ? CMPI_RC_ERR_NOT_SUPPORTED : CMPI_RC_OK;
    EXPECT_EQ(CMLogMessage(m_mb, CMPI_SEV_ERROR, "Me", "text", nullptr).rc, want);
    EXPECT_EQ(CMTraceMessage(m_mb, static_cast<CMPILevel>(3), "Me", nullptr, string("s")).rc, want);
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
    CMPIStatus m_rc{CMPI_RC_OK, nullptr};
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
    CMPISelectExp* query = CMNewSelectExp(
        m_mb,
        "SELECT Severity, Text FROM Fix_Event WHERE (Severity > 3 OR Text LIKE 'a%') AND "
        "NOT Text IS NULL",
        "CIM:CQL", &names, nullptr);
    ASSERT_NE(query, nullptr);
    EXPECT_EQ(CMGetArrayCount(names, nullptr), 2U);
    int type = -1;
    CMPISelectCond* doc = CMGetDoc(query, nullptr);
    EXPECT_EQ(CMGetSubCondCountAndType(doc, &type, nullptr), 2U);
    EXPECT_EQ(type, CMPI_COND_DOC);
    CMPISelectCond* cod = CMGetCod(query, nullptr);
    EXPECT_EQ(CMGetSubCondCountAndType(cod, &type, nullptr), 2U);
    EXPECT_EQ(type, CMPI_COND_COD);
    CMPISubCond* sub = CMGetSubCondAt(doc, 0, nullptr);
    ASSERT_EQ(CMGetPredicateCount(sub, nullptr), 2U);
    CMPIPredicate* predicate = CMGetPredicate(sub, "severity", nullptr);
    CMPIType literal = 0;
    CMPIPredOp op = CMPI_PredOp_Equals;
    CMPIString *left = nullptr, *right = nullptr;
    EXPECT_EQ(CMGetPredicateData(predicate, &literal, &op, &left, &right).rc, CMPI_RC_OK);
    EXPECT_EQ(literal, CMPI_integerString);
    EXPECT_EQ(op, CMPI_PredOp_GreaterThan);
    EXPECT_EQ(textOf(left) + textOf(right), "Severity3");
    for (std::uint16_t value : {std::uint16_t{3}, std::uint16_t{4}}) {
        EXPECT_EQ(CMEvaluatePredicateUsingAccessor(predicate, accessSeverity, &value, nullptr) != 0,
                  value > 3);
        EXPECT_FALSE(CMEvaluateSelExpUsingAccessor(query, accessSeverity, &value, nullptr));
    }
}

TEST_F(FullObjects, QueriesSelect) {
    const Instance event({"root/cimv2", "Fix_Event"},
                         {{"Severity", std::uint16_t{5}},
                          {"Text", "abc"},
                          {"When", DateTime::fromBinary(1000000, false)},
                          {"Source", part()},
                          {"Empty", Value::null(CMPI_string)}});
    // What is expected: 1, 0, or -1 for an invalid query.
    const std::pair<const char*, int> rows[] = {
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
        {"WHERE Text = 'a\\bc'", 1},
        {"WHERE Text = 'abc\\'", -1},
        {"WHERE (Severity = 5", -1},
        {"WHERE Severity = 1x", -1},
    };
    for (const auto& [where, expected] : rows) {
        const std::string text = std::string("SELECT * FROM Fix_Event ") + where;
        CMPISelectExp* query = CMNewSelectExp(m_mb, text.c_str(), "WQL", nullptr, &m_rc);
        EXPECT_EQ(m_rc.rc, expected < 0 ? CMPI_RC_ERR_INVALID_QUERY : CMPI_RC_OK) << text;
        if (!query) {
            continue;
        }
        EXPECT_EQ(CMEvaluateSelExp(query, m_scope.wrap(event), nullptr), expected) << text;
    }
    CMNewSelectExp(m_mb, "SELECT * FROM X", "SQL", nullptr, &m_rc);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
    std::string wide = "SELECT * FROM X WHERE a=1";
    for (int i = 0; i < 20; ++i) {
        wide += " AND (b=1 OR c=2)";
    }
    CMPISelectExp* query = CMNewSelectExp(m_mb, wide.c_str(), "WQL", nullptr, &m_rc);
    EXPECT_EQ(CMGetDoc(query, &m_rc), nullptr);
    EXPECT_EQ(m_rc.rc, CMPI_RC_ERR_FAILED);
}

TEST_F(FullObjects, ErrorsAreReturned) {
    CMPIError* error = CMNewCMPIError(m_mb, "me", "E1", "broken", ErrorSevHigh, Timeout,
                                      CMPI_RC_ERR_FAILED, nullptr);
    CMSetErrorType(error, SoftwareError);
    CMSetErrorSource(error, "here");
    CMPIArray* actions = CMNewArray(m_mb, 1, CMPI_chars, nullptr);
    CMSetArrayElementAt(actions, 0, "wait", CMPI_chars);
    EXPECT_EQ(CMSetRecommendedActions(error, actions).rc, CMPI_RC_OK);
    CMPIArray* numbers = CMNewArray(m_mb, 1, CMPI_uint8, nullptr);
    EXPECT_EQ(CMSetMessageArguments(error, numbers).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMGetErrorType(error, nullptr), SoftwareError);
    EXPECT_EQ(CMGetPerceivedSeverity(error, nullptr), ErrorSevHigh);
    EXPECT_EQ(CMGetCIMStatusCode(error, nullptr), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(textOf(CMGetErrorMessage(error, nullptr)), "broken");
    EXPECT_EQ(CMGetOtherErrorType(error, nullptr), nullptr);
    Reply reply;
    CMPIResult* result = m_scope.result(reply);
    EXPECT_EQ(CMReturnError(result, error).rc, CMPI_RC_OK);
    EXPECT_EQ(*reply.errors.at(0).find("ErrorSource"), Value("here"));
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
    xft->lockMutex(shared.mutex);  // so that it is waited for
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
    while (!shared.ready) {
        xft->condWait(shared.condition, shared.mutex);
    }
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
