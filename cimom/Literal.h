/// Pieces of text that MOF, object paths and printed values have in common.
#ifndef CIMOM_LITERAL_H
#define CIMOM_LITERAL_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "cmpidt.h"

namespace cimom {

/// CIM name of a type, "uint32[]" for arrays.
std::string typeName(CMPIType type);
bool isValueType(CMPIType type);
/// The word by which a declaration of MOF names a type that is no array; null when it has none.
const char* declaredTypeName(CMPIType type);
/// The type that a declaration of MOF names by a word, if it is one.
std::optional<CMPIType> declaredTypeNamed(std::string_view word);

/// Control characters within quotes: those that have a letter by it, as in \n, or all by number.
enum class Controls { ByLetter, ByNumber };
std::string quoted(const std::string& text, char quote, Controls controls);
/// A UTF-16 unit in single quotes; by number unless it is a letter of ASCII.
std::string quotedUnit(std::uint64_t unit, Controls controls);

/// What a letter behind a backslash stands for; 0 for one that stands for nothing.
char meaningOfEscape(char letter);
std::string utf8(unsigned unit);

/// What stands between commas, without what is empty.
std::vector<std::string> splitAtCommas(const std::string& text);

}  // namespace cimom

#endif
