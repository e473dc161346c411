#include "AssociationSupport.h"

#include <algorithm>
#include <iterator>
#include <string>

#include "BaseProviderText.h"
#include "Exception.h"
#include "LetUnwind.h"
#include "ProviderTracer.h"
#include "TraceTool.h"

/// The names of one operation.
struct zemAssociationRow {
    int bit;
    const char* function;  ///< in the trace
    const char* word;      ///< in messages
    const char* access;    ///< call to the broker on whose behalf it fails
};

namespace {

constexpr zemAssociationRow kRows[] = {
    {1, "performGetInstance", "getInstance", "getInstance"},
    {2, "performEnumInstances", "enumerateInstances", "enumerateInstanceNames"},
    {4, "performEnumInstanceNames", "enumerateInstanceNames", "enumerateInstanceNames"},
    {8, "performAssociators", "associators", "enumerateInstances"},
    {16, "performAssociatorNames", "associatorNames", "enumerateInstanceNames"},
    {32, "performReferences", "references", "enumerateInstanceNames"},
    {64, "performReferenceNames", "referenceNames", "enumerateInstanceNames"},
    {zemAssociationCall::kValidateSource, "validateSourceObject", "getInstance", "getInstance"},
};

const zemAssociationRow& rowOf(int bit) {
    std::size_t i = 0;
    while (i + 1 < std::size(kRows) && kRows[i].bit != bit) {
        ++i;
    }
    return kRows[i];
}

using Text = const char*;

template <class Exception>
void raise(Text cls, Text method, Text access, Text id, Text text) {
    throw Exception(cls, method, access, id, text);
}

constexpr auto kInvalid = raise<zemInvalidParameterException>;
constexpr auto kFailed = raise<zemOperationFailedException>;

/// What a status of the broker becomes. A navigation lets other codes pass, see translate().
struct StatusRow {
    int code;
    void (*raise)(Text cls, Text method, Text access, Text id, Text text);
};

constexpr StatusRow kStatusRows[] = {
    {CMPI_RC_ERR_ACCESS_DENIED, raise<zemAccessDeniedException>},
    {CMPI_RC_ERR_INVALID_NAMESPACE, kInvalid},
    {CMPI_RC_ERR_INVALID_PARAMETER, kInvalid},
    {CMPI_RC_ERR_INVALID_CLASS, kInvalid},
    {CMPI_RC_ERR_NOT_FOUND, kInvalid},
    {CMPI_RC_ERR_NOT_SUPPORTED, raise<zemNotSupportedException>},
    {CMPI_RC_ERR_INVALID_SUPERCLASS, kInvalid},
    {CMPI_RC_ERR_NO_SUCH_PROPERTY, kInvalid},
    {CMPI_RC_ERR_TYPE_MISMATCH, kFailed},
    {CMPI_RC_ERR_INVALID_HANDLE, kFailed},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, kFailed},
    {CMPI_RC_ERROR_SYSTEM, kFailed},
    {CMPI_RC_ERROR, kFailed},
};

}  // namespace

zemBrokerTiming::zemBrokerTiming(const char* mark, const char* className) {
    CTimeLogerManager* const manager = CTimeLogerManager::getInstance();
    if (!manager->isEnabled()) {
        return;
    }
    m_id = std::string(mark) + className;
    CTimeLoger* const loger = manager->getLogger("brokerCaller");
    loger->begin(m_id.c_str());
    m_loger = loger;
}

zemBrokerTiming::~zemBrokerTiming() {
    if (m_loger == nullptr) {
        return;
    }
    const zemUncancelled uncancelled;
    zemQuietly([this] { m_loger->end(m_id.c_str()); });
}

zemAssociationCall::zemAssociationCall(const zemBaseProvider& provider, const char* providerName,
                                       CmpiBroker& broker, int operation, const CmpiContext& ctx,
                                       const CmpiObjectPath& cop, Wording wording,
                                       const char* function)
    : m_provider(provider),
      m_providerName(providerName),
      m_broker(broker),
      m_row(rowOf(operation)),
      m_ctx(ctx),
      m_cop(cop),
      m_wording(wording),
      m_function(function != nullptr ? function : m_row.function),
      m_access(wording == kCodeAsId && operation != kValidateSource ? "enumerateInstanceNames"
                                                                    : m_row.access),
      m_word(m_row.word),
      m_className(zemClassOf(cop)),
      m_host(zemTextOf(cop.getHostname())) {
    zemProviderTracer::_traceEnter(m_broker.getEnc(), PROV_TRACE_FILE, __LINE__, m_providerName,
                                   m_function);
}

zemAssociationCall::~zemAssociationCall() {
    const zemUncancelled uncancelled;
    zemQuietly([this] { traceExit(); });
}

void zemAssociationCall::traceExit() {
    if (m_exited) {
        return;
    }
    m_exited = true;
    zemProviderTracer::_traceExit(m_broker.getEnc(), PROV_TRACE_FILE, __LINE__, m_providerName,
                                  m_function);
}

void zemAssociationCall::require(int supported) {
    if ((supported & m_row.bit) != 0) {
        return;
    }
    traceExit();
    m_provider.throwMethodNotSupportedExc(m_word, m_className);
}

int zemAssociationCall::validateSource(zemSynchronizerContext& lock) {
    const zemSynchronizer hold(lock);
    return guard([&] { getInstance(m_cop); }) ? 0 : 1;
}

CmpiInstance zemAssociationCall::getInstance(const CmpiObjectPath& path, const char* timedClass) {
    const zemString own = zemClassOf(path);
    const zemBrokerTiming timing(timedClass != nullptr ? "ni" : "gi",
                                 timedClass != nullptr ? timedClass : Text(own));
    return m_broker.getInstance(m_ctx, path, nullptr);
}

CmpiEnumeration zemAssociationCall::enumInstanceNames(const CmpiObjectPath& path,
                                                      const char* timedClass) {
    const zemBrokerTiming timing("ni", timedClass);
    return m_broker.enumInstanceNames(m_ctx, path);
}

CmpiEnumeration zemAssociationCall::enumInstances(const CmpiObjectPath& path,
                                                  const char** properties, const char* timedClass) {
    const zemBrokerTiming timing("ni", timedClass);
    return m_broker.enumInstances(m_ctx, path, properties);
}

std::vector<CmpiObjectPath> zemAssociationCall::paths(const char* nameSpace,
                                                      const char* className) {
    std::vector<CmpiObjectPath> result;
    CmpiEnumeration names = enumInstanceNames(classPath(nameSpace, className), className);
    while (names.hasNext()) {
        result.push_back(zemNextPath(names));
        place(result.back(), nameSpace);
    }
    return result;
}

CmpiEnumeration zemAssociationCall::targets(const zemAssociationRequest& request,
                                            const CmpiObjectPath& target, const char* timedClass) {
    return request.is(zemAssociationBits::OP_AssocsOp)
               ? enumInstances(target, request.properties, timedClass)
               : enumInstanceNames(target, timedClass);
}

CmpiObjectPath zemAssociationCall::reference(const char* property) const {
    const CmpiData key = zemBaseProvider::getKeyBinding(m_cop, property);
    if (zemIsMissing(key) || key.getType() != CMPI_ref) {
        zemString text;
        if (!zemReadText(key, text)) {
            text = zemBaseProvider::cmpidata2String(key);
        }
        zemRefuseReferences(text, property, nullptr, nullptr, m_className, m_providerName);
    }
    return key.getObjectPath();
}

CmpiObjectPath zemAssociationCall::classPath(const char* nameSpace, const char* className) const {
    return zemBaseProvider::createObjectPath(m_cop, nameSpace, className);
}

void zemAssociationCall::place(CmpiObjectPath& path, const char* nameSpace) const {
    path.setNameSpace(nameSpace);
    path.setHostname(static_cast<const char*>(m_host));
}

void zemAssociationCall::translate(const CmpiStatus& status) const {
    const char* const code = zemBaseProvider::cmpiRcToString(status.rc());
    const zemString text = status.msg();
    const bool codeAsId = m_wording == kCodeAsId;
    zemProviderTracer::_traceString(m_broker.getEnc(), PROV_TRACE_FILE, __LINE__, 4, m_providerName,
                                    "%s%s%s", codeAsId ? code : "", codeAsId ? ":" : "",
                                    static_cast<const char*>(text));
    const auto* const row =
        std::find_if(std::begin(kStatusRows), std::end(kStatusRows),
                     [&](const StatusRow& r) { return r.code == static_cast<int>(status.rc()); });
    const bool known = row != std::end(kStatusRows);
    if (!known && m_row.bit >= zemAssociationBits::OP_AssocsOp) {
        return;
    }
    (known ? row->raise : kFailed)(m_className, m_word, m_access, codeAsId ? code : "CIM_ERR",
                                   text);
}

bool zemPathIsA(const CmpiObjectPath& path, const char* ancestor) {
    if (!zemIsGiven(ancestor)) {
        return false;
    }
    if (zemString::equalsIgnoreCase(zemClassOf(path), ancestor)) {
        return true;
    }
    try {
        return path.classPathIsA(ancestor) != 0;
    } catch (const CmpiStatus& status) {
        if (status.rc() == CMPI_RC_ERR_INVALID_CLASS || status.rc() == CMPI_RC_ERR_NOT_FOUND) {
            return false;
        }
        throw;
    }
}

bool zemClassIsA(const char* nameSpace, const char* className, const char* ancestor) {
    return zemPathIsA(CmpiObjectPath(nameSpace, className), ancestor);
}

bool zemIsOfClass(const CmpiObjectPath& path, const char* className) {
    return zemBaseProvider::compareClassNames(zemClassOf(path), className) != 0 ||
           zemPathIsA(path, className);
}

CmpiObjectPath zemNextPath(CmpiEnumeration& paths) { return paths.getNext().getObjectPath(); }

CmpiInstance zemNextInstance(CmpiEnumeration& instances) {
    return instances.getNext().getInstance();
}

zemAssociationCandidate zemNextCandidate(CmpiEnumeration& enumeration, bool instances) {
    if (!instances) {
        return {zemNextPath(enumeration), std::nullopt};
    }
    const CmpiInstance instance = zemNextInstance(enumeration);
    return {instance.getObjectPath(), instance};
}

void zemSetReferences(CmpiObjectPath& path, const char* property1, const CmpiObjectPath& cop1,
                      const char* property2, const CmpiObjectPath& cop2) {
    path.setKey(property1, CmpiData(cop1));
    path.setKey(property2, CmpiData(cop2));
}

void zemSetReferences(CmpiInstance& instance, const char* property1, const CmpiObjectPath& cop1,
                      const char* property2, const CmpiObjectPath& cop2) {
    instance.setProperty(property1, CmpiData(cop1));
    instance.setProperty(property2, CmpiData(cop2));
}

void zemListReferences(CmpiArray& keys, const char* property1, const char* property2) {
    zemBaseProvider::setText(keys, 0, property1);
    zemBaseProvider::setText(keys, 1, property2);
}

bool zemServesClass(const char* name, const char* assocClass, int supported, int mask) {
    return zemBaseProvider::compareClassNames(name, assocClass) != 0 && (supported & mask) != 0;
}

void zemRefuseReferences(const char* text1, const char* property1, const char* text2,
                         const char* property2, const char* className, const char* providerName) {
    if (text1 == nullptr && text2 == nullptr) {
        return;
    }
    std::string message;
    const auto complain = [&message](const char* text, const char* property) {
        if (text == nullptr) {
            return;
        }
        message += message.empty() ? "Invalid value \"" : " and invalid value \"";
        message.append(text).append("\" for the property ").append(property);
    };
    complain(text1, property1);
    complain(text2, property2);
    message.append(" of the class ").append(className);
    message += text1 != nullptr && text2 != nullptr ? " were" : " was";
    message.append(" provided to method getInstance on provider ").append(providerName);
    throw zemInvalidParameterException(message.c_str());
}
