/// Objects, classes and values as CIM-XML, appended to a text.
///
/// Whatever a provider put into a string, the document stays well-formed: what XML cannot hold, or
/// is no UTF-8, becomes the replacement character.
/// Thread-safety: functions without state.
#ifndef CIMOM_CIM_XML_WRITER_H
#define CIMOM_CIM_XML_WRITER_H

#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>

#include "ClassRepository.h"

namespace cimom {

/// Appends characters, escaped for both content and attributes.
void writeXmlText(std::string& out, std::string_view text);

using XmlAttributes = std::initializer_list<std::pair<const char*, std::string_view>>;
/// Appends the beginning of an element; attributes without a name are left out.
void openElement(std::string& out, const char* name, XmlAttributes attributes = {});
void closeElement(std::string& out, const char* name);
/// Appends an element and, between its tags, what @p content appends.
template <class F>
void writeElement(std::string& out, const char* name, XmlAttributes attributes, F content) {
    openElement(out, name, attributes);
    content();
    closeElement(out, name);
}
void writeTextElement(std::string& out, const char* name, std::string_view text);

/// Name of a type in XML, where instances are strings and arrays are said elsewhere.
const char* xmlTypeName(CMPIType type);

/// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY; nothing for a null.
void writeValue(std::string& out, const Value& value);
/// PARAMVALUE with a name, or RETURNVALUE without one.
void writeParameter(std::string& out, const char* element, std::string_view name,
                    const Value& value);

void writeClassName(std::string& out, std::string_view name);
void writeInstanceName(std::string& out, const ObjectPath& path);
/// @param host  of paths that name none
void writeInstancePath(std::string& out, const ObjectPath& path, std::string_view host);
void writeInstance(std::string& out, const Instance& instance);

/// What is wanted of a class.
struct ClassForm {
    bool localOnly = false;
    bool qualifiers = true;
    bool classOrigin = false;
    const std::vector<std::string>* properties = nullptr;  ///< null for all
};
void writeClass(std::string& out, const CimClass& cls, const ClassForm& form);
void writeQualifierType(std::string& out, const CimQualifierType& type);

}  // namespace cimom

#endif
