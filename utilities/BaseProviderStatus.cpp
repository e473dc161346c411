// Status, localisation and logging of zemBaseProvider.
#include <locale.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <string>

#include "BaseProvider.h"
#include "BaseProviderText.h"
#include "Exception.h"
#include "LetUnwind.h"
#include "ServerCall.h"

namespace {

using Text = const char*;

struct KindRow {
    int kind;
    CMPIrc rc;
    const char* traceFormat;
};

constexpr KindRow kKinds[] = {
    {zemAccessDeniedException::kind, CMPI_RC_ERR_ACCESS_DENIED, "CMPI_RC_ERR_ACCESS_DENIED: %s"},
    {zemInvalidParameterException::kind, CMPI_RC_ERR_INVALID_PARAMETER,
     "CMPI_RC_ERR_INVALID_PARAMETER: %s"},
    {zemNotSupportedException::kind, CMPI_RC_ERR_NOT_SUPPORTED, "CMPI_RC_ERR_NOT_SUPPORTED: %s"},
    {zemObjectAlreadyExistsException::kind, CMPI_RC_ERR_ALREADY_EXISTS,
     "CMPI_RC_ERR_ALREADY_EXISTS: %s"},
    {zemObjectNotFoundException::kind, CMPI_RC_ERR_NOT_FOUND, "CMPI_RC_ERR_NOT_FOUND: %s"},
    {zemPropertyNotFoundException::kind, CMPI_RC_ERR_NO_SUCH_PROPERTY,
     "CMPI_RC_ERR_NO_SUCH_PROPERTY: %s"},
    {zemMethodNotFoundException::kind, CMPI_RC_ERR_METHOD_NOT_FOUND,
     "CMPI_RC_ERR_METHOD_NOT_FOUND: %s"},
};
constexpr KindRow kOtherKind = {zemOperationFailedException::kind, CMPI_RC_ERR_FAILED,
                                "CMPI_RC_ERR_FAILED: %s"};

const KindRow& rowOf(int kind) {
    for (const KindRow& row : kKinds) {
        if (row.kind == kind) {
            return row;
        }
    }
    return kOtherKind;
}

struct LanguageRow {
    char language[3];
    char locale[6];
};

// Languages in which the appliance is translated.
constexpr LanguageRow kLanguages[] = {
    {"ca", "ca_ES"}, {"cs", "cs_CZ"}, {"de", "de_DE"}, {"hu", "hu_HU"}, {"es", "es_ES"},
    {"pl", "pl_PL"}, {"fr", "fr_FR"}, {"sk", "sk_SK"}, {"it", "it_IT"}, {"ru", "ru_RU"},
    {"pt", "pt_BR"}, {"ja", "ja_JP"}, {"ko", "ko_KR"},
};
constexpr const char* kOtherLocale = "en_US";

zemString contextText(const CmpiContext& ctx, const char* entry) {
    zemString text;
    if (ctx.isNull()) {
        return text;
    }
    zemQuietly([&] { zemReadText(ctx.getEntry(entry), text); });
    return text;
}

// Reads "q=0.7" of a language range. The decimal point is a point whatever locale the server runs
// in. False, and the weight as it was, for another text.
bool readWeight(const char* text, float& weight) {
    static const locale_t pointLocale = newlocale(LC_ALL_MASK, "C", nullptr);
    if (strncmp(text, "q=", 2) != 0) {
        return false;
    }
    char* end = nullptr;
    const float value = strtof_l(text + 2, &end, pointLocale);
    if (end == text + 2) {
        return false;
    }
    weight = value;
    return true;
}

// The language of greatest weight, the first of equals; one without a weight ends the search.
std::string preferredLanguage(const std::string& ranges) {
    std::string best;
    float bestWeight = 0;
    float weight = 0;
    for (size_t start = 0; start <= ranges.size();) {
        const size_t comma = std::min(ranges.find(',', start), ranges.size());
        std::string range = ranges.substr(start, comma - start);
        const size_t semicolon = range.find(';');
        if (semicolon == std::string::npos) {
            return range;
        }
        readWeight(range.c_str() + semicolon + 1, weight);
        if (weight > bestWeight) {
            best = range.substr(0, semicolon);
            bestWeight = weight;
        }
        start = comma + 1;
    }
    return best;
}

constexpr size_t kMaxInserts = 10;

/// One lookup in a message bundle: open, read, close.
class BundleLookup {
public:
    BundleLookup(CMPIBroker* broker, const char* providerName)
        : m_broker(broker), m_component(providerName) {}
    BundleLookup(const BundleLookup&) = delete;
    BundleLookup& operator=(const BundleLookup&) = delete;
    ~BundleLookup() {
        const zemUncancelled uncancelled;
        close();
    }

    // A server without message functions is like one without the bundle.
    bool open(Text bundle, Text key, Text dfltString) {
        CMPIStatus status = kZemNotServed;
        const bool answered = zemQuietly([&] {
            status = zemCallServer(m_broker->eft, &CMPIBrokerEncFT::openMessageFile, kZemNotServed,
                                   m_broker, bundle, &m_handle);
        });
        if (answered && status.rc == CMPI_RC_OK) {
            return true;
        }
        m_handle = nullptr;
        if (!answered) {
            return false;
        }
        PROV_TRACE_OF(m_broker, m_component);
        PROV_TRACE_STRING(2, "OPEN MESSAGE BUNDLE FILE(%s) FAILED,RETURN DEFAULT STRING %s:%s",
                          zemOrEmpty(bundle), zemOrEmpty(key), zemOrEmpty(dfltString));
        return false;
    }

    bool read(const char* bundle, const char* key, const char* dfltString,
              const char* const (&a)[kMaxInserts], zemString& text) {
        if (m_handle == nullptr) {
            return false;
        }
        PROV_TRACE_OF(m_broker, m_component);
        PROV_TRACE_STRING(4, "READ ICU MESSAGE %s FROM %s", zemOrEmpty(key), zemOrEmpty(bundle));
        CMPICount count = 0;
        while (count < kMaxInserts && a[count] != nullptr) {
            ++count;
        }
        bool found = false;
        zemQuietly([&] {
            CMPIStatus status = kZemServed;
            CMPIString* const none = nullptr;
            CMPIString* const message = zemCallServer(
                m_broker->eft, &CMPIBrokerEncFT::getMessage2, none, m_broker, key, m_handle,
                dfltString, &status, count, CMPI_chars, a[0], CMPI_chars, a[1], CMPI_chars, a[2],
                CMPI_chars, a[3], CMPI_chars, a[4], CMPI_chars, a[5], CMPI_chars, a[6], CMPI_chars,
                a[7], CMPI_chars, a[8], CMPI_chars, a[9]);
            if (status.rc != CMPI_RC_OK || message == nullptr) {
                return;
            }
            Text const unread = nullptr;
            Text const chars =
                zemCallServer(message->ft, &CMPIStringFT::getCharPtr, unread, message, &status);
            if (chars != nullptr) {
                text = chars;
            }
            found = chars != nullptr;
            zemCallServer(message->ft, &CMPIStringFT::release, kZemNotServed, message);
        });
        return found;
    }

    void close() {
        if (m_handle == nullptr) {
            return;
        }
        zemQuietly([&] {
            zemCallServer(m_broker->eft, &CMPIBrokerEncFT::closeMessageFile, kZemNotServed,
                          m_broker, m_handle);
        });
        m_handle = nullptr;
    }

private:
    CMPIBroker* m_broker;
    const char* m_component;
    CMPIMsgFileHandle m_handle = nullptr;
};

}  // namespace

CmpiStatus zemBaseProvider::handleException(const char* accessMethod, const zemException& e) const {
    PROV_TRACE_LOCALS();
    PROV_TRACE_ENTER();
    const char* id = e.getExceptionId()[0] != '\0' ? e.getExceptionId() : "CIM_ERROR";
    zemString text(e.getExceptionString());
    if (e.getThrowingClass()[0] != '\0') {
        const char* behalf = e.getAccessMethod();
        std::string sentence = "An exception occurred during executing method ";
        sentence.append(zemOrEmpty(accessMethod))
            .append(" on provider ")
            .append(static_cast<const char*>(m_providerName))
            .append(". The exception was thrown from method ")
            .append(e.getThrowingMethod())
            .append(" on class ")
            .append(e.getThrowingClass())
            .append(" with an exception id of ")
            .append(id)
            .append(" and an exception string of \"")
            .append(e.getExceptionString())
            .append("\".");
        const char* key = "Error.PropertiesAccessException1";
        const char* lastInsert = nullptr;
        if (behalf[0] != '\0') {
            sentence.append(" The exception was thrown on behalf of access method ")
                .append(behalf)
                .append(".");
            key = "Error.PropertiesAccessException2";
            lastInsert = behalf;
        }
        text = retrieveLocalizedString(
            rawBroker(), m_providerName, "", key, sentence.c_str(), 0, accessMethod, m_providerName,
            e.getThrowingMethod(), e.getThrowingClass(), id, e.getExceptionString(), lastInsert);
    }
    const KindRow& row = rowOf(e.getExceptionType());
    PROV_TRACE_STRING(3, row.traceFormat, static_cast<const char*>(text));
    PROV_TRACE_EXIT();
    return returnStatus(row.rc, text);
}

zemString zemBaseProvider::retrieveLocalizedString(const char* msgKey, const char* dfltString,
                                                   const char* arg0, const char* arg1,
                                                   const char* arg2, const char* arg3,
                                                   const char* arg4, const char* arg5,
                                                   const char* arg6, const char* arg7,
                                                   const char* arg8, const char* arg9) {
    return retrieveLocalizedString(rawBroker(), m_providerName, getMessageBundlePath(), msgKey,
                                   dfltString, 0, arg0, arg1, arg2, arg3, arg4, arg5, arg6, arg7,
                                   arg8, arg9);
}

zemString zemBaseProvider::retrieveLocalizedString(
    const char* msgBundle, const char* msgKey, const char* dfltString, int ignore, const char* arg0,
    const char* arg1, const char* arg2, const char* arg3, const char* arg4, const char* arg5,
    const char* arg6, const char* arg7, const char* arg8, const char* arg9) {
    return retrieveLocalizedString(rawBroker(), m_providerName, msgBundle, msgKey, dfltString,
                                   ignore, arg0, arg1, arg2, arg3, arg4, arg5, arg6, arg7, arg8,
                                   arg9);
}

zemString zemBaseProvider::retrieveLocalizedString(
    CMPIBroker* brkr, const char* providerName, const char* msgBundle, const char* msgKey,
    const char* dfltString, int, const char* arg0, const char* arg1, const char* arg2,
    const char* arg3, const char* arg4, const char* arg5, const char* arg6, const char* arg7,
    const char* arg8, const char* arg9) {
    zemString text(dfltString);
    if (brkr == nullptr) {
        return text;
    }
    PROV_TRACE_OF(brkr, providerName);
    PROV_TRACE_ENTER();
    if (brkr->eft == nullptr) {
        PROV_TRACE_STRING(2, "ERROR brkr->eft is NULL");
        PROV_TRACE_EXIT();
        return text;
    }
    const char* const inserts[kMaxInserts] = {arg0, arg1, arg2, arg3, arg4,
                                              arg5, arg6, arg7, arg8, arg9};
    BundleLookup lookup(brkr, providerName);
    if (lookup.open(msgBundle, msgKey, dfltString)) {
        const bool found = lookup.read(msgBundle, msgKey, dfltString, inserts, text);
        lookup.close();
        if (found) {
            PROV_TRACE_STRING(4, "ICU MESSAGE %s: %s", zemOrEmpty(msgKey),
                              static_cast<const char*>(text));
        } else {
            PROV_TRACE_STRING(2, "RETURN DEFAULT STRING %s:%s", zemOrEmpty(msgKey),
                              zemOrEmpty(dfltString));
        }
    }
    PROV_TRACE_EXIT();
    return text;
}

void zemBaseProvider::logMessage(int severity, const char* id, const char* text) const {
    if (broker == nullptr) {
        return;
    }
    logMessage(rawBroker(), m_providerName, severity, id, text);
}

void zemBaseProvider::logMessage(CMPIBroker* brkr, const char* providerName, int severity,
                                 const char* id, const char* text) {
    if (brkr == nullptr || (id == nullptr && text == nullptr)) {
        return;
    }
    std::string message = zemOrEmpty(text);
    if (zemOrEmpty(id)[0] != '\0') {
        message = std::string(id) + ": " + message;
    }

    PROV_TRACE_OF(brkr, providerName);
    PROV_TRACE_STRING(4, "LOG MESSAGE: %s", message.c_str());
    zemQuietly([&] {
        zemCallServer(brkr->eft, &CMPIBrokerEncFT::logMessage, kZemNotServed, brkr,
                      static_cast<CMPISeverity>(severity), providerName, message.c_str(), nullptr);
    });
}

void zemBaseProvider::logICUMessage(const CmpiContext& ctx, int severity, const char* msgId,
                                    const char* msgBundle, const char* msgKey,
                                    const char* dfltString, const char* arg0, const char* arg1,
                                    const char* arg2, const char* arg3, const char* arg4,
                                    const char* arg5, const char* arg6, const char* arg7,
                                    const char* arg8, const char* arg9) const {
    logICUMessage(rawBroker(), ctx.getEnc(), m_providerName, severity, msgId, msgBundle, msgKey,
                  dfltString, arg0, arg1, arg2, arg3, arg4, arg5, arg6, arg7, arg8, arg9);
}

void zemBaseProvider::logICUMessage(CMPIBroker* brkr, CMPIContext* ctx, const char* providerName,
                                    int severity, const char* msgId, const char* msgBundle,
                                    const char* msgKey, const char* dfltString, const char* arg0,
                                    const char* arg1, const char* arg2, const char* arg3,
                                    const char* arg4, const char* arg5, const char* arg6,
                                    const char* arg7, const char* arg8, const char* arg9) {
    if (brkr == nullptr) {
        return;
    }
    zemString text(dfltString);
    if (ctx != nullptr) {
        const bool answered = zemQuietly([&] {
            CMPIValue yes = {};
            yes.boolean = 1;
            zemCallServer(ctx->ft, &CMPIContextFT::addEntry, kZemNotServed, ctx, "UseProcessLocale",
                          &yes, CMPIType{CMPI_boolean});
            text =
                retrieveLocalizedString(brkr, providerName, msgBundle, msgKey, dfltString, 0, arg0,
                                        arg1, arg2, arg3, arg4, arg5, arg6, arg7, arg8, arg9);
        });
        if (!answered) {
            text = dfltString;
        }
    }
    PROV_TRACE_OF(brkr, providerName);
    PROV_TRACE_STRING(4, "LOG ICU MESSAGE %s: %s", zemOrEmpty(msgKey),
                      static_cast<const char*>(text));
    logMessage(brkr, providerName, severity, msgId, text);
}

zemString zemBaseProvider::getUserContext(const CmpiContext& ctx) {
    return contextText(ctx, "CMPIPrincipal");
}

zemString zemBaseProvider::getExternalLanguageName(const CmpiContext& ctx) {
    const zemString accepted = contextText(ctx, "CMPIAcceptLanguage");
    if (accepted.length() < 2 || zemString::equalsIgnoreCase(accepted, "root")) {
        return zemString();
    }
    std::string language = preferredLanguage(static_cast<const char*>(accepted));
    if (language.size() < 2) {
        return zemString();
    }

    if (language.size() == 2) {
        const char* locale = kOtherLocale;
        for (const LanguageRow& row : kLanguages) {
            if (language == row.language) {
                locale = row.locale;
            }
        }
        language = locale;
    } else {
        bool behindUnderscore = false;
        for (char& c : language) {
            if (c == '-') {
                c = '_';
            }
            if (behindUnderscore && c >= 'a' && c <= 'z') {
                c = static_cast<char>(c - 'a' + 'A');
            }
            behindUnderscore = behindUnderscore || c == '_';
        }
    }
    return zemString((language + ".UTF-8").c_str());
}
