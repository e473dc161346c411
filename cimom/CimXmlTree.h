/// XML text of strangers as a tree of elements.
///
/// The text is read by libxml2 with nothing on by which a document could reach out or swell: one
/// that declares anything of its own (entities, attributes with defaults) is refused, nothing is
/// loaded, and size, depth and number of elements have limits.
/// Thread-safety: that of standard containers; any number of texts may be read at once.
#ifndef CIMOM_CIM_XML_TREE_H
#define CIMOM_CIM_XML_TREE_H

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimom {

/// An element, its attributes and what it holds; text and elements apart, for no element of
/// CIM-XML mixes them.
struct XmlElement {
    std::string name;
    std::vector<std::pair<std::string, std::string>> attributes;
    std::vector<XmlElement> children;
    std::string text;

    /// The attribute's value, or null.
    const std::string* attribute(std::string_view wanted) const;
    /// The first child of that name, or null.
    const XmlElement* child(std::string_view wanted) const;
};

/// Text that is not well-formed XML, or not within the limits; what() tells why.
class XmlError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

constexpr std::size_t kDeepestXml = 200;
constexpr std::size_t kMostXmlElements = 200000;

/// @return the document's root
/// @throws XmlError
XmlElement parseXml(std::string_view text);

}  // namespace cimom

#endif
