/// What scanner and grammar of MOF share; internal to the parser.
///
/// A MofSession is one parse with all its files, a MofInput one of these files on its way through
/// the scanner. The grammar's actions put what they have read into the session's declarations.
#ifndef CIMOM_MOF_INPUT_H
#define CIMOM_MOF_INPUT_H

#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

#include "MofParser.h"

namespace cimom {

class MofSession {
public:
    explicit MofSession(const MofReader& reader) : m_reader(reader) {}

    /// Parses a file into declarations(); @p includedAt is null for the first one.
    void parseFile(const std::string& path, const MofPlace* includedAt);
    MofDeclarations& declarations() { return m_declarations; }

private:
    const MofReader& m_reader;
    MofDeclarations m_declarations;
    std::vector<std::string> m_open;  // files being read, outermost first
    std::unordered_set<std::string> m_read;
};

class MofInput {
public:
    MofInput(MofSession& session, const std::string* file);

    // -- for the scanner

    /// Takes the text of the next token, which begins at place().
    void advance(const char* text, std::size_t length);
    const MofPlace& place() const { return m_start; }
    const std::string& lexeme() const { return m_lexeme; }
    /// The token for a message: no more than its first characters.
    std::string shownLexeme() const;

    MofInteger integer(std::string_view digits, int base) const;
    double real() const;
    /// Text of the token, a quoted string, without its quotes and with its escapes resolved.
    std::string unquoted() const;
    std::uint16_t character() const;

    // -- for the grammar

    MofDeclarations& declarations() { return m_session.declarations(); }
    void pragma(const MofPlace& place, const std::string& name,
                const std::vector<MofLiteral>& arguments);
    std::uint32_t arraySize(const MofPlace& place, const MofInteger& size) const;
    /// Adds a flavor by its MOF name to @p qualifier.
    void addFlavor(const MofPlace& place, const std::string& name, MofQualifier& qualifier) const;
    /// Bit of an element by its MOF name.
    unsigned scope(const MofPlace& place, const std::string& name) const;

    /// @throws MofError
    [[noreturn]] static void fail(const MofPlace& place, const std::string& text);

private:
    MofSession& m_session;
    MofPlace m_start;
    MofPlace m_end;
    std::string m_lexeme;
};

}  // namespace cimom

#endif
