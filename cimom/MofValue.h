/// Literals of MOF as values of a CIM type, and back to text; internal to the class repository.
#ifndef CIMOM_MOF_VALUE_H
#define CIMOM_MOF_VALUE_H

#include <string>

#include "ClassRepository.h"

namespace cimom {

/// Turns @p initializer into a value of @p type.
/// @return why it does not fit; empty when it does
std::string convertMofValue(const MofInitializer& initializer, const MofType& type,
                            CimValue& value);

/// MOF text of @p value: a literal, or literals in braces when @p isArray.
std::string printMofValue(const CimValue& value, CimType type, bool isArray);

}  // namespace cimom

#endif
