#include "CimXmlTree.h"

#include <libxml/parser.h>

#include <algorithm>
#include <memory>
#include <new>

namespace cimom {

const std::string* XmlElement::attribute(std::string_view wanted) const {
    const auto found = std::find_if(attributes.begin(), attributes.end(),
                                    [&](const auto& each) { return each.first == wanted; });
    return found == attributes.end() ? nullptr : &found->second;
}

const XmlElement* XmlElement::child(std::string_view wanted) const {
    const auto found = std::find_if(children.begin(), children.end(),
                                    [&](const auto& each) { return each.name == wanted; });
    return found == children.end() ? nullptr : &*found;
}

namespace {

/// Takes what the parser finds, until something is wrong.
class Builder {
public:
    explicit Builder(XmlElement& root) : m_root(root) {}

    void start(const xmlChar* name, int attributeCount, const xmlChar** attributes) {
        if (m_open.size() == kDeepestXml) {
            return stop("elements lie more than " + std::to_string(kDeepestXml) + " deep");
        }
        if (++m_elements > kMostXmlElements) {
            return stop("more than " + std::to_string(kMostXmlElements) + " elements");
        }
        XmlElement& element =
            m_open.empty() ? m_root : m_open.back()->children.emplace_back(XmlElement());
        element.name = reinterpret_cast<const char*>(name);
        for (int i = 0; i < attributeCount; ++i) {
            // local name, prefix, namespace, begin and end of the value
            const xmlChar** const each = attributes + std::ptrdiff_t{5} * i;
            element.attributes.emplace_back(reinterpret_cast<const char*>(each[0]),
                                            std::string(each[3], each[4]));
        }
        m_open.push_back(&element);
    }
    void end() { m_open.pop_back(); }
    void text(const xmlChar* text, int length) {
        if (!m_open.empty()) {
            m_open.back()->text.append(reinterpret_cast<const char*>(text),
                                       static_cast<std::size_t>(length));
        }
    }
    void stop(const std::string& why) {
        if (m_why.empty()) {
            m_why = why;
        }
        xmlStopParser(m_parser);
    }
    void setParser(xmlParserCtxtPtr parser) { m_parser = parser; }
    const std::string& why() const { return m_why; }

private:
    XmlElement& m_root;
    std::vector<XmlElement*> m_open;  // a parent gets no child while one of its children is open
    std::size_t m_elements = 0;
    std::string m_why;
    xmlParserCtxtPtr m_parser = nullptr;
};

/// Runs a handler; nothing is thrown through the parser, which is C.
template <class F>
void handle(void* context, F body) {
    Builder& builder = *static_cast<Builder*>(context);
    try {
        body(builder);
    } catch (const std::bad_alloc&) {
        builder.stop("");  // and the document ends too early
    }
}

void startElement(void* context, const xmlChar* name, const xmlChar*, const xmlChar*, int,
                  const xmlChar**, int attributeCount, int, const xmlChar** attributes) {
    handle(context, [=](Builder& builder) { builder.start(name, attributeCount, attributes); });
}
void endElement(void* context, const xmlChar*, const xmlChar*, const xmlChar*) {
    handle(context, [](Builder& builder) { builder.end(); });
}
void characters(void* context, const xmlChar* text, int length) {
    handle(context, [=](Builder& builder) { builder.text(text, length); });
}
template <class... A>
void declaration(void* context, A...) {
    handle(context, [](Builder& builder) { builder.stop("a declaration within the document"); });
}
void keepQuiet(void*, xmlErrorPtr) {}

xmlSAXHandler handlers() {
    xmlSAXHandler sax = {};
    sax.initialized = XML_SAX2_MAGIC;
    sax.startElementNs = startElement;
    sax.endElementNs = endElement;
    sax.characters = characters;
    sax.ignorableWhitespace = characters;
    sax.cdataBlock = characters;
    sax.entityDecl = declaration;
    sax.attributeDecl = declaration;
    sax.elementDecl = declaration;
    sax.notationDecl = declaration;
    sax.unparsedEntityDecl = declaration;
    sax.serror = keepQuiet;
    return sax;
}

struct FreeParser {
    void operator()(xmlParserCtxtPtr parser) const {
        xmlFreeDoc(parser->myDoc);  // begun for the declarations of entities, refused or not
        xmlFreeParserCtxt(parser);
    }
};

std::string failureOf(const xmlParserCtxt& parser) {
    const xmlError& error = parser.lastError;
    std::string text = error.message ? error.message : "no document";
    while (!text.empty() && (text.back() == '\n' || text.back() == '.')) {
        text.pop_back();
    }
    return "line " + std::to_string(error.line) + ": " + text;
}

/// Some failures of a text's encoding do not go to the parser's own handlers: clients would write
/// to our standard error. They end the parse as others do.
void keepQuiet(void*, const char*, ...) {}

constexpr std::size_t kPiece = 4096;
constexpr std::ptrdiff_t kLongestTag = 16384;

}  // namespace

XmlElement parseXml(std::string_view text) {
    static const bool ready = (xmlInitParser(), true);  // once, before there are many threads
    static_cast<void>(ready);
    xmlSetGenericErrorFunc(nullptr, keepQuiet);  // of this thread
    XmlElement root;
    Builder builder(root);
    xmlSAXHandler sax = handlers();
    const std::unique_ptr<xmlParserCtxt, FreeParser> parser(
        xmlCreatePushParserCtxt(&sax, &builder, nullptr, 0, nullptr));
    if (!parser) {
        throw std::bad_alloc();
    }
    builder.setParser(parser.get());
    xmlCtxtUseOptions(parser.get(), XML_PARSE_NONET);
    // In pieces, so that a tag is seen to be too long while it is unread: the parser compares each
    // attribute of it with each.
    int wrong = XML_ERR_OK;
    for (std::size_t at = 0; at < text.size() && wrong == XML_ERR_OK; at += kPiece) {
        const std::string_view piece = text.substr(at, kPiece);
        wrong = xmlParseChunk(parser.get(), piece.data(), static_cast<int>(piece.size()), 0);
        const bool data = parser->instate == XML_PARSER_CDATA_SECTION;
        if (!data && parser->input && parser->input->end - parser->input->cur > kLongestTag) {
            throw XmlError("a tag of more than " + std::to_string(kLongestTag) + " bytes");
        }
    }
    if (wrong == XML_ERR_OK) {
        wrong = xmlParseChunk(parser.get(), nullptr, 0, 1);
    }
    if (!builder.why().empty()) {
        throw XmlError(builder.why());
    }
    if (wrong != XML_ERR_OK || parser->wellFormed == 0 || root.name.empty()) {
        throw XmlError(failureOf(*parser));
    }
    return root;
}

}  // namespace cimom
