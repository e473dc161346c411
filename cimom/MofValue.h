/// Literals of MOF as values of a CIM type, and back to text; internal to the class repository.
#ifndef CIMOM_MOF_VALUE_H
#define CIMOM_MOF_VALUE_H

#include <string>

#include "MofParser.h"

namespace cimom {

/// Turns @p initializer into a value of @p type.
/// @return why it does not fit; empty when it does
std::string convertMofValue(const MofInitializer& initializer, const CimType& type, Value& value);

/// MOF text of @p value: a literal, or literals in braces.
std::string printMofValue(const Value& value);

/// How MOF declares a type: the word before a name, and the brackets behind it.
std::string mofTypeWord(const CimType& type);
std::string mofBrackets(const CimType& type);

}  // namespace cimom

#endif
