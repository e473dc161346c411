#include "BaseProviderFrame.h"

#include "BaseProviderText.h"
#include "Exception.h"
#include "LetUnwind.h"
#include "Log.h"
#include "TraceTool.h"

namespace {

/// What a disabled provider answers.
enum Disabled { kNotAsked, kNothing, kNotFound };

/// Which class must be served for the operation to go on.
enum ClassTest { kAny, kInstance, kNoAssociation, kFilterClass, kMethod, kIndication };

/// Where an essential key must be present.
enum KeyTest { kNoKeys, kOnPath, kOnPathOrInstance, kOnInstance };

enum ResultEnd { kNotDone, kDone };

/// How a success is told of: the exit line and the end of the timing, or the other way round.
enum Leaving { kTimedThenTraced, kTracedThenTimed };

/// What becomes of a failure. A switch is ordinary, but traces no exit, whatever its outcome.
enum Rule { kOrdinary, kEnumeration, kWrapped, kSwitch };

constexpr const char* kUntimed = nullptr;
constexpr const char* kBareName = "";

}  // namespace

/// One operation. Its logger in the timing trace has the operation's name; the key is made of
/// provider name, keyMark, class and a number, or of the provider name alone.
struct zemOperationRow {
    const char* method;
    const char* keyMark;
    Disabled disabled;
    const char* banner;
    ClassTest classTest;
    const char* errName;
    KeyTest keys;
    ResultEnd resultEnd;
    Rule rule;
    Leaving leaving = kTimedThenTraced;
};

namespace {

// The outer getInstance has a key mark of its own, which tells the two layers apart in the log.
// clang-format off
constexpr zemOperationRow kRows[] = {
    // method              key mark   disabled   banner                          class test      error name            essential keys     result end  failures      success
    {"getInstance",        "-4-",     kNotFound, nullptr,                        kAny,           "getInstance",        kNoKeys,           kDone,      kOrdinary},
    {"getInstance",        "-",       kNotFound, "GET INSTANCE: %s",             kInstance,      "getInstance",        kOnPath,           kNotDone,   kOrdinary,    kTracedThenTimed},
    {"enumInstances",      "-",       kNothing,  "ENUMERATE INSTANCES: %s",      kInstance,      "enumerateInstances", kNoKeys,           kDone,      kEnumeration},
    {"enumInstanceNames",  "-",       kNothing,  "ENUMERATE INSTANCE NAMES: %s", kInstance,      "enumInstanceNames",  kNoKeys,           kDone,      kEnumeration},
    {"setInstance",        kUntimed,  kNotAsked, "SET INSTANCE: %s",             kNoAssociation, "modifyInstance",     kOnPathOrInstance, kNotDone,   kOrdinary},
    {"createInstance",     kUntimed,  kNotAsked, "CREATE INSTANCE: %s",          kNoAssociation, "createInstance",     kOnInstance,       kDone,      kOrdinary},
    {"deleteInstance",     kUntimed,  kNotAsked, "DELETE INSTANCE: %s",          kNoAssociation, "deleteInstance",     kOnPath,           kDone,      kOrdinary},
    {"associators",        "-",       kNothing,  "ASSOCIATORS: %s",              kFilterClass,   "associators",        kNoKeys,           kDone,      kOrdinary},
    {"associatorNames",    "-",       kNothing,  "ASSOCIATOR NAMES: %s",         kFilterClass,   "associatorNames",    kNoKeys,           kDone,      kOrdinary},
    {"references",         "-",       kNothing,  "REFERENCES: %s",               kFilterClass,   "references",         kNoKeys,           kDone,      kOrdinary},
    {"referenceNames",     "-",       kNothing,  "REFERENCE NAMES: %s",          kFilterClass,   "referenceNames",     kNoKeys,           kDone,      kOrdinary},
    {"invokeMethod",       kBareName, kNotAsked, "INVOKE METHOD %s: %s",         kMethod,        "invokeMethod",       kNoKeys,           kDone,      kWrapped,     kTracedThenTimed},
    {"getProperty",        kUntimed,  kNotAsked, nullptr,                        kInstance,      "getProperty",        kOnPath,           kDone,      kOrdinary},
    {"setProperty",        kUntimed,  kNotAsked, nullptr,                        kNoAssociation, "setProperty",        kOnPath,           kDone,      kOrdinary},
    {"mustPoll",           kUntimed,  kNotAsked, nullptr,                        kIndication,    "mustPoll",           kNoKeys,           kNotDone,   kOrdinary},
    {"activateFilter",     kUntimed,  kNotAsked, nullptr,                        kIndication,    "activateFilter",     kNoKeys,           kNotDone,   kOrdinary},
    {"authorizeFilter",    kUntimed,  kNotAsked, nullptr,                        kIndication,    "authorizeFilter",    kNoKeys,           kNotDone,   kOrdinary},
    {"deActivateFilter",   kUntimed,  kNotAsked, nullptr,                        kIndication,    "deActivateFilter",   kNoKeys,           kNotDone,   kOrdinary},
    {"enableIndications",  kUntimed,  kNotAsked, nullptr,                        kAny,           "enableIndications",  kNoKeys,           kNotDone,   kSwitch},
    {"disableIndications", kUntimed,  kNotAsked, nullptr,                        kAny,           "disableIndications", kNoKeys,           kNotDone,   kSwitch},
};
// clang-format on

/// How much of a key that is too long a client is shown.
constexpr size_t kShownKey = 64;

constexpr const char* kDisabledText =
    "The XBRG is managed by DNX, this provider on the XGRB in dissabled.";

}  // namespace

zemOperationFrame::zemOperationFrame(zemBaseProvider& provider, zemOperation operation,
                                     const CmpiContext& ctx, const CmpiObjectPath* path,
                                     CmpiResult* result)
    : m_provider(provider),
      m_row(kRows[static_cast<size_t>(operation)]),
      m_ctx(ctx),
      m_path(path),
      m_result(result) {
    if (path != nullptr) {
        m_className = zemClassOf(*path);
    }
    m_testedClass = m_className;
    m_namedClass = m_className;
}

void zemOperationFrame::setFilterClass(const char* className) {
    m_testedClass = className;
    m_namedClass = className;
}

void zemOperationFrame::setEventType(const char* eventType) { m_namedClass = eventType; }

CmpiStatus zemOperationFrame::run(const std::function<void()>& work) {
    enter();
    try {
        if (admit()) {
            work();
        }
        if (m_answer) {
            return *m_answer;
        }
        if (m_row.resultEnd == kDone) {
            m_result->returnDone();
        }
        leave();
        return m_provider.returnOK();
    } catch (const CmpiStatus& status) {
        return answerFailure(status);
    } catch (const zemException& failure) {
        return answerFailure(failure);
    }
}

void zemOperationFrame::enter() {
    zemProviderTracer::_traceEnter(m_provider.rawBroker(), PROV_TRACE_FILE, __LINE__,
                                   m_provider.m_providerName, m_row.method);
    if (m_row.keyMark == kUntimed) {
        return;
    }
    CTimeLogerManager* manager = CTimeLogerManager::getInstance();
    if (!manager->isEnabled()) {
        return;
    }
    m_timing = manager->getLogger(m_row.method);
    m_timingKey = timingKey();
    m_timing->begin(m_timingKey.c_str());
}

bool zemOperationFrame::admit() {
    if (m_row.disabled != kNotAsked && !m_provider.isProviderEnabled(m_ctx)) {
        if (m_row.disabled == kNothing) {
            return false;
        }
        endTiming(m_timingKey);
        m_provider.throwObjectNotFoundExc("getInstance", "zemBaseProvider", kDisabledText);
    }
    const zemString path =
        m_path != nullptr ? zemBaseProvider::objectPathToString(*m_path) : zemString();
    if (path.length() > kZemPrintable) {
        refuseKeys();
    }
    if (m_row.banner != nullptr) {
        traceBanner(path);
    }
    if (m_filterLabel != nullptr) {
        logFilter();
    }
    testClass();
    if (m_row.keys != kNoKeys) {
        testKeys();
    }
    return true;
}

void zemOperationFrame::leave() {
    if (m_row.leaving == kTracedThenTimed) {
        traceExit();
    }
    endTiming(m_timingKey);
    if (m_row.leaving == kTimedThenTraced) {
        traceExit();
    }
}

std::string zemOperationFrame::timingKey() const {
    std::string key(m_provider.m_providerName);
    if (m_row.keyMark != kBareName) {
        key.append(m_row.keyMark).append(m_className).append(" ").append(std::to_string(getID()));
    }
    return key;
}

void zemOperationFrame::endTiming(const std::string& key) const {
    if (m_timing != nullptr) {
        m_timing->end(key.c_str());
    }
}

void zemOperationFrame::traceExit() const {
    if (m_row.rule == kSwitch) {
        return;
    }
    zemProviderTracer::_traceExit(m_provider.rawBroker(), PROV_TRACE_FILE, __LINE__,
                                  m_provider.m_providerName, m_row.method);
}

void zemOperationFrame::traceDetail(const char* text) const {
    PROV_TRACE_LOCALS_OF(m_provider);
    PROV_TRACE_STRING(4, "%s", text);
}

void zemOperationFrame::traceStatus(const CmpiStatus& status) const {
    PROV_TRACE_LOCALS_OF(m_provider);
    PROV_TRACE_STRING(4, "CMPI STATUS:%s  %s", zemBaseProvider::cmpiRcToString(status.rc()),
                      zemOrEmpty(status.msg()));
}

// The status itself is thrown: a method must not wrap it.
void zemOperationFrame::refuseKeys() const {
    zemString key, value;
    const unsigned count = m_path->getKeyCount();
    for (unsigned i = 0; i < count; ++i) {
        CmpiString name;
        const CmpiData data = m_path->getKey(static_cast<int>(i), &name);
        zemString text;
        if (!zemReadText(data, text)) {
            text = zemBaseProvider::cmpidata2String(data);
        }
        if (text.length() < value.length()) {
            continue;
        }
        key = zemTextOf(name);
        value = text;
    }
    try {
        m_provider.throwInvalidMethodArgValueExc(zemShortened(key, kShownKey),
                                                 zemShortened(value, kShownKey), m_row.errName);
    } catch (const zemInvalidParameterException& failure) {
        throw m_provider.handleException(m_row.errName, failure);
    }
}

void zemOperationFrame::traceBanner(zemString path) const {
    PROV_TRACE_LOCALS_OF(m_provider);
    zemPrint(*m_path, path);
    if (m_method != nullptr) {
        PROV_TRACE_STRING(4, m_row.banner, m_method, static_cast<const char*>(path));
    } else {
        PROV_TRACE_STRING(4, m_row.banner, static_cast<const char*>(path));
    }
}

void zemOperationFrame::logFilter() const {
    const auto line = [this](const char* what, const char* value) {
        const std::string text = std::string(m_filterLabel) + " -> " + what + ":[" + value + "]";
        zemLog::LogSysOut(text.c_str());
    };
    line("className", m_className);
    line("eventType", m_namedClass);
}

void zemOperationFrame::testClass() {
    bool served = true;
    switch (m_row.classTest) {
        case kAny:
            break;
        case kInstance:
            served = m_provider.isValidInstanceClass(m_testedClass);
            break;
        case kNoAssociation:
            served = m_provider.isValidInstanceClass(m_testedClass) &&
                     !m_provider.isValidAssociationClass(m_testedClass);
            break;
        case kFilterClass:
            served = m_testedClass.isEmpty() || m_provider.isValidAssociationClass(m_testedClass);
            break;
        case kMethod:
            served = m_provider.isValidMethodClass(m_testedClass);
            break;
        case kIndication:
            served = m_provider.isValidIndicationClass(m_testedClass);
            break;
    }
    if (served) {
        return;
    }
    if (m_row.rule != kEnumeration) {
        traceExit();
    }
    m_provider.throwMethodNotSupportedExc(m_row.errName, m_namedClass);
}

void zemOperationFrame::testKeys() {
    CmpiArray keys(10, CMPI_chars);
    m_provider.populateEssentialKeys(m_className, keys);
    zemString key;
    for (CMPICount i = 0; i < keys.size() && zemReadText(keys[i].getData(), key); ++i) {
        if (hasKey(key)) {
            continue;
        }
        traceExit();
        m_provider.throwKeyNotFoundExc(m_row.errName, m_className, key);
    }
}

bool zemOperationFrame::hasKey(const char* key) const {
    if (m_row.keys == kOnInstance) {
        bool has = false;  // whatever the server throws over a property it does not know
        zemQuietly([&] { has = !zemIsMissing(m_instance->getProperty(key)); });
        return has;
    }
    if (!zemIsMissing(zemBaseProvider::getKeyBinding(*m_path, key))) {
        return true;
    }
    if (m_row.keys == kOnPath) {
        return false;
    }
    try {
        return !zemIsMissing(m_provider.getPropVal(*m_instance, key));
    } catch (const zemException&) {
        return false;  // getPropVal's way to say that the property is missing
    }
}

CmpiStatus zemOperationFrame::answerFailure(const CmpiStatus& status) const {
    traceStatus(status);
    if (m_row.rule == kEnumeration && status.rc() != CMPI_RC_ERR_NOT_SUPPORTED &&
        status.rc() != CMPI_RC_ERR_INVALID_PARAMETER) {
        return logAndAnswerOK(status);
    }
    traceExit();
    endTiming(m_timingKey);
    return status;
}

CmpiStatus zemOperationFrame::answerFailure(const zemException& failure) const {
    if (m_row.rule == kEnumeration) {
        const CmpiStatus status = m_provider.handleException(m_row.errName, failure);
        // Unlike the status of the same name, a failed-exception is an answer of the provider's
        // own and goes to the client.
        if (status.rc() != CMPI_RC_ERR_NOT_SUPPORTED &&
            status.rc() != CMPI_RC_ERR_INVALID_PARAMETER && status.rc() != CMPI_RC_ERR_FAILED) {
            return logAndAnswerOK(status);
        }
        if (m_timing != nullptr) {
            endTiming(timingKey());
        }
        traceExit();
        return status;
    }
    endTiming(m_timingKey);
    traceExit();
    if (m_row.rule != kWrapped) {
        return m_provider.handleException(m_row.errName, failure);
    }

    // Clients of methods rely on one code and on this sentence, whatever went wrong.
    const std::string text =
        std::string(
            "A general error occurred that is not covered by a more specific error code: "
            "\"") +
        failure.getExceptionString() + "\"";
    return m_provider.handleException(m_row.errName, zemOperationFailedException(text.c_str()));
}

// An enumeration spans many providers: one that fails must not spoil the client's whole request.
// Timing is left open, which marks the failure in the timing log.
CmpiStatus zemOperationFrame::logAndAnswerOK(const CmpiStatus& status) const {
    m_provider.logMessage(LOG_SEVERE, zemBaseProvider::cmpiRcToString(status.rc()), status.msg());
    traceExit();
    return m_provider.returnOK();
}
