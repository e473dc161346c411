/// What a CIM-XML request says, in the terms of the object manager.
///
///     CimXmlCall call = readCimXmlCall(body);
///     CimXmlReader reader(classes, Unfit::Refused);
///     for (const XmlElement* each : call.parameters) use(reader.path(*each));
///
/// Two kinds of failure: a message that is no request at all is a CimXmlFault and answered by HTTP
/// alone; what a request asks amiss is a Failure and answered as the operation's error.
/// Thread-safety: a reader belongs to one thread.
#ifndef CIMOM_CIM_XML_READER_H
#define CIMOM_CIM_XML_READER_H

#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "CimXmlTree.h"
#include "ClassRepository.h"
#include "PathText.h"

namespace cimom {

// Statuses of HTTP for messages that are no requests, or none that is served.
constexpr unsigned kBadRequest = 400;
constexpr unsigned kNotImplemented = 501;

/// A message that HTTP answers: with its status, and a header that says why.
class CimXmlFault : public std::runtime_error {
public:
    CimXmlFault(unsigned status, const char* cimError, const std::string& why)
        : std::runtime_error(why), m_status(status), m_cimError(cimError) {}
    unsigned status() const { return m_status; }
    /// Value of the CIMError header.
    const char* cimError() const { return m_cimError; }

private:
    unsigned m_status;
    const char* m_cimError;
};

struct CimXmlCall {
    std::string id;  ///< of the message, for its answer
    bool intrinsic = true;
    std::string name;                           ///< of the operation or of the class's method
    std::vector<const XmlElement*> parameters;  ///< in the document
    /// Of a method: what it is invoked on; else null, and where the operation works is here.
    const XmlElement* object = nullptr;
    std::string nameSpace;
    std::unique_ptr<const XmlElement> document;
};

/// @throws CimXmlFault when the text is not XML, or no request of one operation
CimXmlCall readCimXmlCall(std::string_view text);

/// Reads objects and values out of elements, typed as their classes declare them.
class CimXmlReader {
public:
    /// @param classes  null when nothing is known of them; else outlives the reader
    CimXmlReader(const ClassRepository* classes, Unfit unfit)
        : m_classes(classes), m_unfit(unfit) {}

    /// CLASSNAME, INSTANCENAME, and the paths that have one in them.
    /// @throws CimXmlFault, Failure
    ObjectPath path(const XmlElement& element);
    /// INSTANCE, and what has one in it, with a path or without.
    /// @throws CimXmlFault, Failure
    Instance instance(const XmlElement& element);
    /// What a VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY in @p holder says; a null when
    /// there is none.
    /// @throws CimXmlFault, Failure CMPI_RC_ERR_TYPE_MISMATCH
    Value value(const XmlElement& holder, CMPIType type);
    /// The same, typed as declared or, where nothing is known, by the element's own attribute.
    /// @throws CimXmlFault, Failure CMPI_RC_ERR_TYPE_MISMATCH
    Value declaredValue(const XmlElement& element, const char* typeAttribute,
                        const CimElement* declared);
    /// The arguments of a method.
    /// @param declared  null when nothing is known of the method
    /// @throws CimXmlFault, Failure
    NamedValues arguments(const CimXmlCall& call, const CimMethod* declared);

private:
    void addValue(NamedValues& values, const XmlElement& element, const char* typeAttribute,
                  const CimElement* declared);
    Value single(const XmlElement& element, CMPIType type);
    Value embedded(const std::string& text);
    void addKey(ObjectPath& path, const std::string& name, const XmlElement& element);

    const ClassRepository* m_classes;
    const Unfit m_unfit;
    unsigned m_embedding = 0;
};

/// @throws CimXmlFault that the element has no place where it stands
[[noreturn]] void refuseElement(const XmlElement& element);
/// The attribute's value. @throws CimXmlFault when there is none
const std::string& neededAttribute(const XmlElement& element, const char* name);
/// The text, without blanks around it, of an element for a number or a name.
std::string trimmed(const std::string& text);

}  // namespace cimom

#endif
