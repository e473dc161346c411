#include "CimXmlService.h"

#include <strings.h>
#include <unistd.h>

#include <climits>
#include <cstdlib>
#include <memory>

#include "CimXmlWriter.h"
#include "Failure.h"

namespace cimom {

namespace {

constexpr unsigned kMethodNotAllowed = 405;
constexpr unsigned kUnsupportedMediaType = 415;
constexpr const char* kDeclaration = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n";

// -- the head of a message ------------------------------------------------------------------------

std::string headerText(const HttpRequest& request, const char* name) {
    const char* value = request.header(name);
    return value ? value : "";
}

/// Text in which bytes stand as %41.
std::string decoded(const std::string& text) {
    std::string out;
    for (std::size_t at = 0; at < text.size(); ++at) {
        char* end = nullptr;
        const std::string digits = text[at] == '%' ? text.substr(at + 1, 2) : "";
        const auto byte = static_cast<char>(std::strtoul(digits.c_str(), &end, 16));
        if (digits.size() == 2 && end == digits.c_str() + 2) {
            out += byte;
            at += 2;
        } else {
            out += text[at];
        }
    }
    return out;
}

void checkHead(const HttpRequest& request) {
    if (request.method != "POST") {
        // M-POST, which older clients try first, is answered so that they go on with POST.
        const bool known = request.method == "M-POST";
        throw CimXmlFault(known ? kNotImplemented : kMethodNotAllowed, "", request.method);
    }
    const std::string type = headerText(request, "Content-Type");
    if (!type.empty() && strncasecmp(type.c_str(), "application/xml", 15) != 0 &&
        strncasecmp(type.c_str(), "text/xml", 8) != 0) {
        throw CimXmlFault(kUnsupportedMediaType, "", type);
    }
    if (request.header("CIMBatch")) {
        throw CimXmlFault(kNotImplemented, "multiple-requests-unsupported", "a batch");
    }
    if (strcasecmp(headerText(request, "CIMOperation").c_str(), "MethodCall") != 0) {
        throw CimXmlFault(kNotImplemented, "unsupported-operation", "no CIMOperation: MethodCall");
    }
    const std::string version = headerText(request, "CIMProtocolVersion");
    if (!version.empty() && version.rfind("1.", 0) != 0) {
        throw CimXmlFault(kNotImplemented, "unsupported-protocol-version", version);
    }
}

/// What stands in the head has to be what stands in the message, for it may have been judged by
/// somebody on the way.
void compareHead(const HttpRequest& request, const CimXmlCall& call) {
    const std::string method = decoded(headerText(request, "CIMMethod"));
    std::string object = decoded(headerText(request, "CIMObject"));
    // Of a method's object, whose keys can be written in more ways than one, only the namespace.
    if (!call.intrinsic) {
        object.erase(std::min(object.find(':'), object.size()));
    }
    const bool named = sameName(method, call.name) && method.size() == call.name.size();
    const bool placed = object.size() == call.nameSpace.size() && sameName(object, call.nameSpace);
    if (!named || !placed) {
        throw CimXmlFault(kBadRequest, "header-mismatch", method + " " + object);
    }
}

// -- answers --------------------------------------------------------------------------------------

HttpAnswer refused(const CimXmlFault& fault) {
    HttpAnswer answer;
    answer.status = fault.status();
    if (*fault.cimError() != '\0') {
        answer.headers.emplace_back("CIMError", fault.cimError());
    }
    if (fault.status() == kMethodNotAllowed) {
        answer.headers.emplace_back("Allow", "POST");
    }
    answer.note = std::string(fault.cimError()) + " " + fault.what();
    return answer;
}

/// The document around the answer of an operation.
struct Envelope {
    std::string begin = kDeclaration;
    std::string end;

    explicit Envelope(const CimXmlCall& call) {
        const char* const response = call.intrinsic ? "IMETHODRESPONSE" : "METHODRESPONSE";
        openElement(begin, "CIM", {{"CIMVERSION", "2.0"}, {"DTDVERSION", "2.0"}});
        openElement(begin, "MESSAGE", {{"ID", call.id}, {"PROTOCOLVERSION", "1.0"}});
        openElement(begin, "SIMPLERSP");
        openElement(begin, response, {{"NAME", call.name}});
        for (const char* name : {response, "SIMPLERSP", "MESSAGE", "CIM"}) {
            closeElement(end, name);
        }
        end += '\n';
    }
};

/// Statuses of CMPI alone are failures like others to a client.
unsigned statusOnWire(CMPIrc rc) {
    const auto code = static_cast<unsigned>(rc);
    const bool known = (code >= 1 && code <= 17) || (code >= 20 && code <= 28);
    return known ? code : static_cast<unsigned>(CMPI_RC_ERR_FAILED);
}

std::string errorText(CMPIrc rc, const std::string& message) {
    std::string text;
    openElement(text, "ERROR",
                {{"CODE", std::to_string(statusOnWire(rc))}, {"DESCRIPTION", message}});
    closeElement(text, "ERROR");
    return text;
}

/// Begin, objects, tail and end, each when there is room for it.
class Writing {
public:
    Writing(Envelope envelope, CimXmlAnswer answer)
        : m_envelope(std::move(envelope)), m_answer(std::move(answer)) {}

    bool next(std::string& out) {
        if (!m_begun) {
            m_begun = true;
            out += m_envelope.begin;
            if (m_answer.next) {
                openElement(out, "IRETURNVALUE");
            }
            return true;
        }
        if (m_answer.next) {
            if (!m_answer.next(out)) {
                closeElement(out, "IRETURNVALUE");
                m_answer.next = nullptr;
            }
            return true;
        }
        if (m_ended) {
            return false;
        }
        m_ended = true;
        out += m_answer.tail + m_envelope.end;
        return true;
    }

private:
    const Envelope m_envelope;
    CimXmlAnswer m_answer;
    bool m_begun = false;
    bool m_ended = false;
};

}  // namespace

std::string hostName() {
    char name[HOST_NAME_MAX + 1] = "localhost";
    gethostname(name, sizeof name - 1);
    return name;
}

CimXmlService::CimXmlService(Server& server, const ClassRepository* classes, Unfit unfit,
                             std::optional<std::string> nobody)
    : m_environment{server, classes, unfit, hostName(), m_pulls}, m_nobody(std::move(nobody)) {}

HttpAnswer CimXmlService::answer(const HttpRequest& http) {
    try {
        checkHead(http);
        const CimXmlCall call = readCimXmlCall(http.body);
        compareHead(http, call);
        Request request;
        request.user = http.user ? http.user : m_nobody;
        request.language = headerText(http, "Accept-Language");
        HttpAnswer answer;
        answer.note = call.nameSpace + " " + call.name;
        CimXmlAnswer body;
        try {
            body = runCimXmlCall(m_environment, request, call);
        } catch (const Failure& failure) {
            body.tail = errorText(failure.rc(), failure.what());
            answer.note += std::string(" ") + statusName(failure.rc()) + " " + failure.what();
        }
        answer.headers = {{"Content-Type", "application/xml; charset=\"utf-8\""},
                          {"CIMOperation", "MethodResponse"},
                          {"Cache-Control", "no-cache"}};
        const auto writing = std::make_shared<Writing>(Envelope(call), std::move(body));
        answer.next = [writing](std::string& out) { return writing->next(out); };
        return answer;
    } catch (const CimXmlFault& fault) {
        return refused(fault);
    }
}

}  // namespace cimom
