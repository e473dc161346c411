/// Object paths, values and instances as text.
///
/// A path reads `//host/namespace:Class.key="text",number=5,flag=true,ref="..."`; host,
/// namespace and keys may be missing. Texts stand between double quotes with \" and \\ escaped;
/// integers, reals, booleans and char16 stand bare; a reference is a text with the path in it.
/// What printPath prints, parsePath reads back; a date-time or a reference comes back as a
/// string, which Value::convertTo and typedKeys turn into what the class declares.
#ifndef CIMOM_PATH_TEXT_H
#define CIMOM_PATH_TEXT_H

#include <string>

#include "ClassRepository.h"
#include "Literal.h"

namespace cimom {

/// What becomes of a value that is not of its declared type, of a name that stands twice, and in an
/// instance of a property that its class does not have: refused, or kept as it could be read, for
/// the provider to judge.
enum class Unfit { Refused, Kept };

std::string printPath(const ObjectPath& path);
/// @throws Failure CMPI_RC_ERR_INVALID_PARAMETER with the place of the mistake
ObjectPath parsePath(const std::string& text, Unfit unfit = Unfit::Refused);

/// The value as it stands in MOF and in paths: quoted texts, {a, b} arrays, NULL.
std::string printValue(const Value& value);
/// The bare content: a string without quotes and escapes, anything else as printValue.
std::string plainText(const Value& value);
/// Reads a text as a value of the type: numbers, true and false, date-times, paths for
/// references; a string is taken as it stands; {a, b} or a,b for arrays; for an instance
/// `instance of Class { name = value; ... }`, its values typed by its class where that is known.
/// @throws Failure CMPI_RC_ERR_TYPE_MISMATCH when the text is no such value
Value parseValue(const std::string& text, CMPIType type, const ClassRepository* classes = nullptr,
                 Unfit unfit = Unfit::Refused);
/// Reads a whole text as a number of the type.
/// @return false, leaving @p result, when it is none
bool parseNumber(const std::string& text, CMPIType type, Value& result);
/// Reads a text whose type nobody knows: whatever printValue could have printed, else a string.
Value guessValue(const std::string& text);

/// "instance of Class { ... };" with one property a line, preceded by its path as a comment.
std::string printInstance(const Instance& instance);

/// The path with its keys as its class declares them, and so the paths in its keys; a path of
/// an unknown class stays as it is.
/// @throws Failure CMPI_RC_ERR_INVALID_PARAMETER for a key that is not of its type
ObjectPath typedKeys(const ObjectPath& path, const ClassRepository& classes,
                     Unfit unfit = Unfit::Refused);

/// Puts the key properties of an instance into its path, as its class says which they are.
/// @param classes  null when none are known; then nothing is done
void takeKeys(Instance& instance, const ClassRepository* classes);

}  // namespace cimom

#endif
