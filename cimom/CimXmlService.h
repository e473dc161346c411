/// CIM-XML over HTTP: checks a message, runs what it asks for, and writes the answer as it goes.
///
/// Thread-safety: any number of requests at once.
#ifndef CIMOM_CIM_XML_SERVICE_H
#define CIMOM_CIM_XML_SERVICE_H

#include <optional>
#include <string>

#include "CimXmlOperations.h"
#include "HttpServer.h"

namespace cimom {

/// Name of this machine, for paths that name none.
std::string hostName();

class CimXmlService {
public:
    /// @param server   outlives the service, as do @p classes
    /// @param classes  null when none are known
    /// @param nobody   user of requests that come without one
    CimXmlService(Server& server, const ClassRepository* classes, Unfit unfit,
                  std::optional<std::string> nobody = {});

    HttpAnswer answer(const HttpRequest& request);
    /// Frees what clients began and do not come back for; to be called now and then.
    void expire() { m_pulls.expire(); }

private:
    CimXmlPulls m_pulls;
    const CimXmlEnvironment m_environment;
    const std::optional<std::string> m_nobody;
};

}  // namespace cimom

#endif
