/// Reading texts from CMPI values. Servers give texts as strings or as plain characters, and some
/// give strings without a text; these helpers take them all.
#ifndef ZEM_BASE_PROVIDER_TEXT_H
#define ZEM_BASE_PROVIDER_TEXT_H

#include "CmpiArray.h"
#include "CmpiData.h"
#include "CmpiObjectPath.h"
#include "CmpiStatus.h"
#include "CmpiString.h"
#include "StringUtils.h"

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

inline zemString zemTextOf(const CmpiString& string) { return zemString(string.charPtr()); }

/// Class of a path; "" when the server cannot tell, so that no provider serves it.
inline zemString zemClassOf(const CmpiObjectPath& path) {
    try {
        return zemTextOf(path.getClassName());
    } catch (const CmpiStatus&) {
        return zemString();
    }
}

#endif
