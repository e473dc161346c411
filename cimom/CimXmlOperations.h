/// The operations of CIM-XML: one row an operation, with its parameters and its body.
///
/// An answer is made as it goes out: the objects found are written one by one when there is room
/// for them, and are gone then.
/// Thread-safety: any number of calls at once; an answer belongs to one thread at a time.
#ifndef CIMOM_CIM_XML_OPERATIONS_H
#define CIMOM_CIM_XML_OPERATIONS_H

#include <functional>
#include <string>

#include "CimXmlPulls.h"
#include "CimXmlReader.h"
#include "Server.h"

namespace cimom {

/// What operations work with. Classes that the object manager itself has to serve to clients, such
/// as those of indication subscriptions, are registered at the server as a provider of this process
/// (Server::registerProvider) and need nothing here.
struct CimXmlEnvironment {
    Server& server;
    const ClassRepository* classes;  ///< null when none are known
    Unfit unfit;
    std::string host;  ///< of paths that name none
    CimXmlPulls& pulls;
};

/// What stands in the element of an operation's answer.
struct CimXmlAnswer {
    /// Appends the next object of the return value; false, and nothing is appended, behind the
    /// last. Null for an operation without a return value.
    std::function<bool(std::string&)> next;
    /// Behind the return value.
    std::string tail;
};

/// Runs an operation, or a method of a class.
/// @param request  who asks; where is said by the call
/// @throws Failure with the status to answer, CimXmlFault
CimXmlAnswer runCimXmlCall(const CimXmlEnvironment& environment, const Request& request,
                           const CimXmlCall& call);

}  // namespace cimom

#endif
