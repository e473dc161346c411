#include <algorithm>
#include <cstring>
#include <tuple>

#include "ProviderHarness.h"
#include "TimingTrace.h"
#include "TraceTool.h"

namespace {

using cimom::Character;

const TimingTrace timing("zemBaseProviderTest");

enum Rule { kOrdinary, kEnumeration, kMethod, kIndication };

// One operation as the server calls it, and what the frame says of it.
struct Operation {
    const char* name;
    const char* worker;
    Rule rule;
    const char* refusal;      ///< operation named when the class is not served; null: no class test
    const char* unsupported;  ///< operation named by the worker of the base class, or null
    const char* banner;       ///< what is told of the operation, as a regular expression, or ""
    bool done;
    int exits;  ///< exit lines of the operation when it succeeds
    Answer (*call)(Harness& h);
};

using I = CMPIInstanceMIFT;
using A = CMPIAssociationMIFT;
using M = CMPIMethodMIFT;
using N = CMPIIndicationMIFT;
using P = CMPIPropertyMIFT;
constexpr auto no = nullptr;

Answer setCaption(Harness& h) {
    CMPIData data = {CMPI_chars, CMPI_goodValue, {}};
    data.value.chars = const_cast<char*>("new caption");
    return h.call(h.property, &P::setProperty, h.path(), "Caption", data);
}

#define DISK ".*Test_Disk.*"
#define FILTER(name, label)                              \
    "Entering method " name "\n<zem350Log-prefix>" label \
    " -> className:\\[Test_Disk\\]\n<zem350Log-prefix>" label " -> eventType:\\[Test_Event\\]"

#define CALL(mi, ...) [](Harness& h) { return h.call(h.mi, __VA_ARGS__); }

// getInstance and setInstance have exit lines of the inner getInstance and of the existence test.
// clang-format off
const Operation kOperations[] = {
    {"enumInstanceNames", "performEnumInstanceNames", kEnumeration, "enumInstanceNames", "enumerateInstanceNames", "ENUMERATE INSTANCE NAMES: " DISK, true, 1,
     CALL(instance, &I::enumerateInstanceNames, h.classPath())},
    {"enumInstances", "performEnumInstances", kEnumeration, "enumerateInstances", "enumerateInstances", "ENUMERATE INSTANCES: " DISK, true, 1, CALL(instance, &I::enumerateInstances, h.classPath(), no)},
    {"getInstance", "performGetInstance", kOrdinary, "getInstance", "getInstance", "GET INSTANCE: " DISK, true, 2, CALL(instance, &I::getInstance, h.path(), no)},
    {"createInstance", "performCreateInstance", kOrdinary, "createInstance", "createInstance", "CREATE INSTANCE: " DISK, true, 1, CALL(instance, &I::createInstance, h.classPath(), h.disk())},
    {"setInstance", "performSetInstance", kOrdinary, "modifyInstance", "getInstance", "SET INSTANCE: " DISK, false, 2, CALL(instance, &I::modifyInstance, h.path(), h.disk(), no)},
    {"deleteInstance", "performDeleteInstance", kOrdinary, "deleteInstance", "deleteInstance", "DELETE INSTANCE: " DISK, true, 1, CALL(instance, &I::deleteInstance, h.path())},
    {"associators", "performAssociators", kOrdinary, nullptr, "associators", "ASSOCIATORS: " DISK, true, 1, CALL(association, &A::associators, h.path(), no, "X", no, no, no)},
    {"associatorNames", "performAssociatorNames", kOrdinary, nullptr, "associatorNames", "ASSOCIATOR NAMES: " DISK, true, 1, CALL(association, &A::associatorNames, h.path(), "", no, no, no)},
    {"references", "performReferences", kOrdinary, nullptr, "references", "REFERENCES: " DISK, true, 1, CALL(association, &A::references, h.path(), no, no, no)},
    {"referenceNames", "performReferenceNames", kOrdinary, nullptr, "referenceNames", "REFERENCE NAMES: " DISK, true, 1, CALL(association, &A::referenceNames, h.path(), no, no)},
    {"invokeMethod", "performInvokeMethod", kMethod, "invokeMethod", nullptr, "INVOKE METHOD Force: " DISK, true, 1, CALL(method, &M::invokeMethod, h.path(), "Force", h.args(), h.args())},
    {"getProperty", "performGetInstance", kOrdinary, "getProperty", "getInstance", "", true, 1, CALL(property, &P::getProperty, h.path(), "Name")},
    {"setProperty", "performSetInstance", kOrdinary, "setProperty", "modifyInstance", "", true, 1, setCaption},
    {"mustPoll", "performMustPoll Test_Disk", kIndication, "mustPoll", "activateFilter", "", false, 1, CALL(indication, &N::mustPoll, no, "Test_Event", h.classPath())},
    {"activateFilter", "performActivateFilter Test_Disk", kIndication, "activateFilter", "activateFilter", FILTER("activateFilter", "Filter___activate"), false, 1,
     CALL(indication, &N::activateFilter, no, "Test_Event", h.classPath(), true)},
    {"authorizeFilter", "performAuthorizeFilter Test_Disk", kIndication, "authorizeFilter", nullptr, "", false, 1, CALL(indication, &N::authorizeFilter, no, "Test_Event", h.classPath(), "root")},
    {"deActivateFilter", "performDeActivateFilter Test_Disk", kIndication, "deActivateFilter", "deActivateFilter", FILTER("deActivateFilter", "deActivateFilter"), false, 1,
     CALL(indication, &N::deActivateFilter, no, "Test_Event", h.classPath(), true)},
    {"enableIndications", "performEnableIndications", kIndication, nullptr, nullptr, "", false, 0, CALL(indication, &N::enableIndications)},
    {"disableIndications", "performDisableIndications", kIndication, nullptr, nullptr, "", false, 0, CALL(indication, &N::disableIndications)},
};
// clang-format on

Answer call(Harness& h, const std::string& name) {
    for (const Operation& op : kOperations) {
        if (name == op.name) {
            return op.call(h);
        }
    }
    throw std::out_of_range(name);
}

Answer invokeOnClass(Harness& h) {
    return h.call(h.method, &M::invokeMethod, h.classPath(), "Force", h.args(), h.args());
}

std::string notSupported(const std::string& name, const std::string& className = "Test_Disk") {
    return "Method " + name + " on provider TestProvider is not supported for class " + className +
           ".";
}

std::string general(const std::string& text) {
    return "A general error occurred that is not covered by a more specific error code: \"" + text +
           "\"";
}

class BaseProvider : public BothBrokers {
protected:
    BaseProvider() : h(GetParam()) {}
    Harness h;
};

TEST_P(BaseProvider, SucceedsInItsSteps) {
    for (const Operation& op : kOperations) {
        SCOPED_TRACE(op.name);
        script.calls.clear();
        const Answer answer = op.call(h);
        EXPECT_EQ(CMPI_RC_OK, answer.rc) << answer.text;
        EXPECT_EQ(op.done, answer.reply.done);
        ASSERT_FALSE(script.calls.empty());
        // Filters go by the class, not the event.
        EXPECT_EQ(0U, script.calls.back().find(op.worker));
        EXPECT_EQ(op.exits, answer.traced(std::string("Exiting method ") + op.name));
        EXPECT_EQ(op.banner[0] != '\0', answer.traced(op.banner)) << answer.output;
    }
}

TEST_P(BaseProvider, RefusesClassesItDoesNotServe) {
    script.instanceClass = script.methodClass = script.indicationClass = false;
    for (const Operation& op : kOperations) {
        if (op.refusal == nullptr) {
            continue;
        }
        SCOPED_TRACE(op.name);
        const Answer answer = op.call(h);
        // A filter's refusal names the event; its message does not reach the server.
        const std::string text =
            notSupported(op.refusal, op.rule == kIndication ? "Test_Event" : "Test_Disk");
        EXPECT_EQ(op.rule == kMethod ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_NOT_SUPPORTED, answer.rc);
        EXPECT_EQ(op.rule == kMethod       ? general(text)
                  : op.rule == kIndication ? ""
                                           : text,
                  answer.text);
        EXPECT_EQ(1, answer.traced("Exception: " + text));
        EXPECT_EQ(op.rule == kEnumeration ? 1 : 2,
                  answer.traced(std::string("Exiting method ") + op.name));
        EXPECT_FALSE(answer.reply.done);
    }
    script.instanceClass = script.associationClass = true;
    for (const char* name : {"setInstance", "createInstance", "deleteInstance", "setProperty"}) {
        EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, call(h, name).rc);
    }
    script.associationClass = false;  // that of the filter counts, where it is given
    EXPECT_EQ(notSupported("references", "Test_Link"),
              h.call(h.association, &A::references, h.path(), "Test_Link", no, no).text);
    EXPECT_TRUE(script.calls.empty());
}

TEST(BaseProviderDefaults, RefuseWhatIsNotOverridden) {
    Harness plain(Character::Full, FactoriesOf<PlainProvider>::create);
    for (const Operation& op : kOperations) {
        if (op.unsupported == nullptr) {
            continue;
        }
        EXPECT_EQ(1, op.call(plain).traced("Exception: " + notSupported(op.unsupported)))
            << op.name;
    }
    script.staticMethod = true;
    EXPECT_EQ(general(notSupported("invokeMethod")), invokeOnClass(plain).text);
    EXPECT_EQ(CMPI_RC_OK, call(plain, "authorizeFilter").rc);
}

TEST_P(BaseProvider, AnswersFailuresByTheRuleOfTheOperation) {
    // kind of exception, 0 for a status; its code; that of an enumeration
    const std::tuple<int, CMPIrc, CMPIrc> failures[] = {
        {1, CMPI_RC_ERR_ACCESS_DENIED, CMPI_RC_OK},
        {3, CMPI_RC_ERR_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_PARAMETER},
        {4, CMPI_RC_ERR_NOT_SUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
        {5, CMPI_RC_ERR_NOT_FOUND, CMPI_RC_OK},
        {6, CMPI_RC_ERR_FAILED, CMPI_RC_ERR_FAILED},
        {0, CMPI_RC_ERR_FAILED, CMPI_RC_OK},
        {0, CMPI_RC_ERR_NOT_FOUND, CMPI_RC_OK},
        {0, CMPI_RC_ERR_NOT_SUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
        {0, CMPI_RC_ERR_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_PARAMETER},
    };
    for (const Operation& op : kOperations) {
        for (const auto& [kind, failure, enumeration] : failures) {
            const std::string worker(op.worker), code = zemBaseProvider::cmpiRcToString(failure);
            SCOPED_TRACE(worker + " kind " + std::to_string(kind) + " " + code);
            script.actions[worker.substr(0, worker.find(' '))] = [kind = kind, rc = failure] {
                if (kind == 0) {
                    throw CmpiStatus(rc, "it is so");
                }
                throw zemException(kind, "it is so");
            };
            const Answer answer = op.call(h);
            const bool wrapped = op.rule == kMethod && kind != 0;
            const CMPIrc rc = op.rule == kEnumeration ? enumeration
                              : wrapped               ? CMPI_RC_ERR_FAILED
                                                      : failure;
            EXPECT_EQ(rc, answer.rc);
            EXPECT_EQ(rc == CMPI_RC_OK || op.rule == kIndication ? ""
                      : wrapped                                  ? general("it is so")
                                                                 : "it is so",
                      answer.text);
            EXPECT_FALSE(answer.reply.done);
            EXPECT_EQ(kind == 0, answer.traced("CMPI STATUS:" + code + "  it is so"));
            EXPECT_EQ(rc == CMPI_RC_OK, answer.traced("LOG MESSAGE: " + code + ": it is so"));
        }
        script.actions.clear();
    }
    script.actions = {{"performEnableIndications", [] { throw 3; }}};
    EXPECT_THROW(h.provider().enableIndications(CmpiContext(h.ctx())), int);
}

TEST_P(BaseProvider, FindsEssentialKeysOnTheInstanceToo) {
    // Without any on the path, nothing is looked up.
    const Answer set = h.call(h.instance, &I::modifyInstance, h.classPath(), h.disk(), no);
    EXPECT_EQ(CMPI_RC_OK, set.rc);
    EXPECT_EQ(1U, script.calls.size());
    EXPECT_EQ(1, set.traced("Exiting method setInstance"));
    script.keys.clear();  // an instance without properties is not looked at
    EXPECT_EQ(CMPI_RC_OK, h.call(h.instance, &I::createInstance, h.classPath(), h.disk({})).rc);
}

TEST_P(BaseProvider, AnswersAndSetsOneProperty) {
    EXPECT_EQ(cimom::Value("d1"), call(h, "getProperty").reply.value());
    const Answer missing = h.call(h.property, &P::getProperty, h.path(), "Caption");
    EXPECT_EQ(CMPI_RC_ERR_NO_SUCH_PROPERTY, missing.rc);
    EXPECT_EQ("Caption", missing.text);
    EXPECT_TRUE(missing.reply.done);
    EXPECT_EQ(0, missing.traced("Exiting method getProperty"));
    call(h, "setProperty");
    EXPECT_NE(std::string::npos, script.calls.back().find("Caption = \"new caption\""));
}

TEST_P(BaseProvider, VerifiesTheTargetOfAMethod) {
    const std::string object = "an invalid object:root/cimv2:Test_Disk.Name=\"d1\" to ";
    const std::pair<std::function<void()>, std::string> rows[] = {
        {[] { throw zemNotSupportedException("x"); },
         "refers to " + object + "inovke method Force"},
        {[] { throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND); },
         "reference " + object + "invoke method Force"},
        {[] { throw CmpiStatus(CMPI_RC_ERR_INVALID_PARAMETER); },
         "reference " + object + "invoke method Force"},
        {[] { throw CmpiStatus(CMPI_RC_ERR_FAILED, "no"); }, "no"}};
    for (const auto& [failure, text] : rows) {
        script.actions["performGetInstance"] = failure;
        EXPECT_EQ(general(text), call(h, "invokeMethod").text);
    }

    // A provider of the method alone asks the server, which knows no provider of the instances. A
    // static method needs no object, but one given is looked up.
    script = Script();
    script.instanceClass = false;
    script.staticMethod = true;
    EXPECT_EQ(CMPI_RC_ERR_FAILED, call(h, "invokeMethod").rc);
    EXPECT_TRUE(script.calls.empty());
    EXPECT_EQ(CMPI_RC_OK, invokeOnClass(h).rc);
    EXPECT_EQ(std::vector<std::string>{"performInvokeMethod Force"}, script.calls);

    const Answer extra = h.call(h.method, &M::invokeMethod, h.classPath(), "Force",
                                h.args({{"reason", "x"}, {"Mode", "x"}}), h.args());
    EXPECT_EQ(general("Wrong method argument Mode when invoking method Force on provider "
                      "TestProvider."),
              extra.text);
    EXPECT_EQ("Test_Disk.Force", script.argsOf);
}

// Some servers print a path in 4096 bytes on the stack: one that takes more is never handed back.
TEST_P(BaseProvider, RefusesKeysThatNoServerPrints) {
    static std::size_t longest;
    longest = 0;
    static decltype(CMPIBrokerEncFT::toString) real;
    CMPIBrokerEncFT& table = *h.server.broker()->eft;  // a table of this server alone
    real = table.toString;
    table.toString = [](const CMPIBroker* mb, const void* object, CMPIStatus* rc) {
        CMPIString* const text = real(mb, object, rc);
        longest = std::max(longest, strlen(text->ft->getCharPtr(text, nullptr)));
        return text;
    };
    const std::string front = "root/cimv2:Test_Disk.Name=\"\"";
    for (const std::size_t size : {4095U, 4096U, 1000000U}) {
        const std::string name(size - front.size(), 'x');
        const bool fits = size < 4096;
        const Answer answers[] = {
            h.call(h.instance, &I::getInstance, h.path(name.c_str()), no),
            h.call(h.method, &M::invokeMethod, h.path(name.c_str()), "Force", h.args(), h.args()),
            h.call(h.association, &A::associatorNames, h.path(name.c_str()), no, no, no, no)};
        const char* const methods[] = {"getInstance", "invokeMethod", "associatorNames"};
        for (int i = 0; i < 3; ++i) {
            EXPECT_EQ(fits ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_PARAMETER, answers[i].rc);
            EXPECT_EQ(fits ? ""
                           : "Invalid value of " + name.substr(0, 64) +
                                 "... is provided for parameter Name to method " + methods[i] +
                                 " on provider TestProvider.",
                      answers[i].text);
        }
    }
    EXPECT_EQ(4095U, longest);
}

// begin and end have one key; the outer getInstance has a mark of its own; an enumeration that
// failed ends under another number, one that was only logged does not end. What ends well is timed
// before its exit line, but for the inner getInstance and invokeMethod.
TEST_P(BaseProvider, TimesItsOperations) {
    static std::vector<std::uint64_t> exits;  // two of getInstance, one of invokeMethod
    exits.clear();
    static CMPIBrokerEncFT table;
    table = *h.server.broker()->eft;
    table.trace = [](auto, auto, auto, const char* text, auto) {
        if (exits.size() < 3 && std::strstr(text, "Frame.cpp") && std::strstr(text, "Exiting")) {
            usleep(1000);
            exits.push_back(CTimer().timer(0));
            usleep(1000);
        }
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    h.server.broker()->eft = &table;
    call(h, "getInstance");
    script.staticMethod = true;
    invokeOnClass(h);
    h.className = GetParam() == Character::Full ? "TimedFull" : "TimedLean";
    call(h, "getInstance");
    script.actions["performEnumInstances"] = [] { throw zemOperationFailedException("x"); };
    call(h, "enumInstances");
    script.actions["performEnumInstanceNames"] = [] { throw zemObjectNotFoundException("x"); };
    call(h, "enumInstanceNames");

    const std::string key = "-TestProvider-" + h.className + " ";
    const std::string lines =
        timing.waitFor("enumInstanceNames" + key, [&] { call(h, "associators"); });
    const auto has = [&](const std::string& text) { return lines.find(text) != std::string::npos; };
    // The number under which an operation begins or ends.
    const auto number = [&](const std::string& start, const std::string& word) {
        std::smatch match;
        std::regex_search(lines, match, std::regex(start + "([0-9]+) " + word + " at"));
        return match.empty() ? "none" : match.str(1);
    };
    const std::string outer = "getInstance-TestProvider-4-" + h.className + " ";
    EXPECT_EQ(number(outer, "begin"), number(outer, "end"));
    EXPECT_NE("none", number("getInstance" + key, "begin"));
    EXPECT_TRUE(has("invokeMethod-TestProvider begin at") && has("invokeMethod-TestProvider end"));
    EXPECT_NE("none", number("enumInstances" + key, "end"));
    EXPECT_NE(number("enumInstances" + key, "begin"), number("enumInstances" + key, "end"));
    EXPECT_EQ("none", number("enumInstanceNames" + key, "end"));
    const auto end = [&](const std::string& start) {
        return std::stoull(lines.substr(lines.find(" end at ", lines.rfind(start)) + 8));
    };
    EXPECT_LT(exits.at(0), end("getInstance-TestProvider-Test_Disk "));
    EXPECT_GT(exits.at(1), end("getInstance-TestProvider-4-Test_Disk "));
    EXPECT_LT(exits.at(2), end("invokeMethod-TestProvider "));
}

// A thread is cancelled inside the worker and inside each function of the server that is called
// around it, once while a failure is being handled. It ends as cancelled, and the process lives.
TEST_P(BaseProvider, LetsACancelledThreadEnd) {
    static const char* where = nullptr;
    static const auto cancelAt = [](const char* place) {
        if (std::strstr(place, where) == nullptr) {
            return CMPIStatus{CMPI_RC_OK, nullptr};
        }
        pthread_cancel(pthread_self());
        pthread_testcancel();
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    static CMPIBrokerEncFT table;  // outlives the test, whose end traces
    table = *h.server.broker()->eft;
    table.trace = [](auto, auto, auto, const char* text, auto) { return cancelAt(text); };
    table.logMessage = [](auto, auto, auto, auto, auto) { return cancelAt("logMessage"); };
    table.openMessageFile = [](auto, auto, CMPIMsgFileHandle*) { return cancelAt("openMessage"); };
    h.server.broker()->eft = &table;
    script.actions["performEnumInstanceNames"] = [] {
        cancelAt("worker");
        throw zemObjectNotFoundException("x");
    };
    for (const char* place : {"worker", "ENUMERATE INSTANCE NAMES", "CMPI_RC_ERR_NOT_FOUND",
                              "logMessage", "openMessage"}) {
        SCOPED_TRACE(where = place);
        script.instanceClass = std::strcmp(place, "openMessage") != 0;
        pthread_t thread = {};
        const auto run = [](void* harness) -> void* {
            auto& on = *static_cast<Harness*>(harness);
            on.instance->ft->enumerateInstanceNames(on.instance, on.ctx(), nullptr, on.classPath());
            pthread_testcancel();
            return nullptr;
        };
        ASSERT_EQ(0, pthread_create(&thread, nullptr, run, &h));
        void* end = nullptr;
        pthread_join(thread, &end);
        EXPECT_EQ(PTHREAD_CANCELED, end);
    }
}

ON_BOTH_BROKERS(BaseProvider);

}  // namespace
