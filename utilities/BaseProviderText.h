/// Reading texts from CMPI values and objects; private to the sources of the provider families.
///
/// Servers give texts as strings or as plain characters, some give strings without a text, and some
/// refuse to tell or to print; these helpers take them all.
#ifndef ZEM_BASE_PROVIDER_TEXT_H
#define ZEM_BASE_PROVIDER_TEXT_H

#include "BaseProvider.h"
#include "CmpiArray.h"
#include "CmpiData.h"
#include "CmpiInstance.h"
#include "CmpiObjectPath.h"
#include "CmpiStatus.h"
#include "CmpiString.h"
#include "StringUtils.h"

inline const char* zemOrEmpty(const char* text) { return text != nullptr ? text : ""; }

inline bool zemIsMissing(const CmpiData& data) {
    return data.isNotFound() != 0 || data.isNullValue() != 0;
}

/// Copies the text of a string value. False for a missing value, another type, or no text.
inline bool zemReadText(const CmpiData& data, zemString& text) {
    if (zemIsMissing(data)) return false;
    if (data.getType() == CMPI_chars) {
        const char* chars = data.getCString();
        text = chars;
        return chars != nullptr;
    }
    if (data.getType() != CMPI_string) return false;
    const CmpiString string = data.getString();
    text = string.charPtr();
    return string.charPtr() != nullptr;
}

/// The server's text of an object. False from a server that cannot print it: an operation must not
/// fail over a text that is only traced.
inline bool zemPrint(CmpiObject object, zemString& text) {
    try {
        const CmpiString printed = object.toString();
        text = printed.charPtr();
        return printed.charPtr() != nullptr;
    } catch (const CmpiStatus&) {
        return false;
    }
}

/// The server's text of a path, or the library's own.
inline zemString zemPathText(const CmpiObjectPath& path) {
    zemString text;
    if (!zemPrint(path, text)) text = zemBaseProvider::objectPathToString(path);
    return text;
}

inline zemString zemTextOf(const CmpiString& string) { return zemString(string.charPtr()); }

/// Class of a path; "" when the server cannot tell, so that no provider serves it.
inline zemString zemClassOf(const CmpiObjectPath& path) {
    try {
        return zemTextOf(path.getClassName());
    } catch (const CmpiStatus&) {
        return zemString();
    }
}

inline zemString zemClassOf(const CmpiInstance& instance) {
    try {
        return zemClassOf(instance.getObjectPath());
    } catch (const CmpiStatus&) {
        return zemString();
    }
}

#endif
