/// What the sources of the configuration objects share: how data of the management library become
/// fields, and failures of tools become failures of these objects.
///
/// Functions without state; any thread may call them.
#ifndef SYSTEM_CONFIG_SUPPORT_H
#define SYSTEM_CONFIG_SUPPORT_H

#include <cstddef>
#include <cstring>
#include <string>

#include "CommandLine.h"
#include "DNXApiCaller.h"
#include "Exception.h"
#include "NumberText.h"
#include "StringUtils.h"

constexpr int zemNumberBase = 10;  ///< of what the tools and the library tell

/// @throws zemInvalidParameterException @p index is the mark that ends a list, and no attribute
inline void zemExpectAttribute(int index, const char* throwClass, const char* throwMethod) {
    if (index == -1) {
        throw zemInvalidParameterException(throwClass, throwMethod, "INVALID_INDEX",
                                           zemString(index));
    }
}

/// The name behind the number in "<number>,<profile name>", as partitions tell their profiles;
/// empty when there is no profile, for which either side of the comma says "null".
inline zemString zemProfileNameOf(const zemString& text) {
    const int comma = text.find(',');
    if (comma <= 0) {
        return zemString();
    }
    const auto end = static_cast<unsigned>(comma);
    const zemString name = text.extractSubstring(end + 1);
    const bool isNone = zemString::equalsIgnoreCase(text.extractSubstring(0, end), "null") ||
                        zemString::equalsIgnoreCase(name, "null");
    return isNone ? zemString() : name;
}

/// One datum of the management library, and what an object makes of it.
template <class Object>
using zemConfigField = zemApiField<void (*)(Object&, const zemString&)>;

/// What most objects make of a datum: a text, a number, or whether it is the number 1.
template <auto field, class Object>
void zemSetText(Object& object, const zemString& value) {
    object.*field = value;
}
template <auto field, class Object>
void zemSetNumber(Object& object, const zemString& value) {
    object.*field = zemNumberOf(value);
}
template <auto field, class Object>
void zemSetFlag(Object& object, const zemString& value) {
    object.*field = zemNumberOf(value) == 1;
}

/// A getter of CLASS that tells VALUE, which takes the level LEVEL.
#define ZEM_CONFIG_GETTER(CLASS, TYPE, NAME, LEVEL, VALUE) \
    TYPE CLASS::NAME() {                                   \
        need(OP_LEVEL_##LEVEL);                            \
        return VALUE;                                      \
    }

/// Lines that several classes run: deleting a partition, and turning its keylock.
inline std::string zemRemovalLine(const char* mtms, const char* lparId) {
    return "dlplat -r lpar -m " + zemQuoted(mtms) + " --id " + zemQuoted(lparId);
}
inline std::string zemKeylockLine(const char* mtms, const char* lparId, const char* position) {
    return "edpower -r lpar -o chkey -k " + zemQuoted(position) + " --id " + zemQuoted(lparId) +
           " -m " + zemQuoted(mtms);
}

/// Ids by which the query tool and the change tools say that there is no such object.
constexpr const char* kUnknownToQueries[] = {"WRTL8018", "WRTL8011"};
constexpr const char* kUnknownToChanges[] = {"WRTL8018", "WRTL8011", "WRTL8010"};

/// Runs @p operation. A failure with one of @p ids becomes a zemObjectNotFoundException of the
/// given class and method; others pass.
template <std::size_t N, class Operation>
auto zemWithNotFound(const char* const (&ids)[N], const char* throwClass, const char* throwMethod,
                     Operation operation) {
    try {
        return operation();
    } catch (const zemOperationFailedException& e) {
        for (const char* id : ids) {
            if (std::strcmp(e.getExceptionId(), id) == 0) {
                throw zemObjectNotFoundException(throwClass, throwMethod, e.getAccessMethod(), id,
                                                 e.getExceptionString());
            }
        }
        throw;
    }
}

#endif
