/// Reading texts from CMPI values and objects; private to the sources of the provider families.
///
/// Servers give texts as strings or as plain characters, some give strings without a text, and some
/// refuse to tell or to print; these helpers take them all.
#ifndef ZEM_BASE_PROVIDER_TEXT_H
#define ZEM_BASE_PROVIDER_TEXT_H

#include <cstring>
#include <vector>

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
    if (zemIsMissing(data)) {
        return false;
    }
    if (data.getType() == CMPI_chars) {
        const char* chars = data.getCString();
        text = chars;
        return chars != nullptr;
    }
    if (data.getType() != CMPI_string) {
        return false;
    }
    const CmpiString string = data.getString();
    text = string.charPtr();
    return string.charPtr() != nullptr;
}

/// The server's text of an object. False, and @p text as it was, from a server that cannot print
/// it: an operation must not fail over a text that is only traced.
inline bool zemPrint(CmpiObject object, zemString& text) {
    try {
        const CmpiString printed = object.toString();
        if (printed.charPtr() == nullptr) {
            return false;
        }
        text = printed.charPtr();
        return true;
    } catch (const CmpiStatus&) {
        return false;
    }
}

/// What a server can be asked to print: some do it in 4096 bytes on the stack, whatever comes.
constexpr size_t kZemPrintable = 4095;

/// The server's text of a path, or the library's own.
inline zemString zemPathText(const CmpiObjectPath& path) {
    zemString text = zemBaseProvider::objectPathToString(path);
    if (text.length() <= kZemPrintable) {
        zemPrint(path, text);
    }
    return text;
}

/// A text from outside for a message: what goes beyond @p limit becomes "...", between characters
/// of UTF-8.
inline zemString zemShortened(const char* text, size_t limit) {
    if (strnlen(zemOrEmpty(text), limit + 1) <= limit) {
        return zemString(text);
    }
    size_t length = limit;
    while (length > 0 && (text[length] & 0xC0) == 0x80) {
        --length;
    }
    return zemString(text, static_cast<unsigned>(length)) + "...";
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

/// The names of all properties of an instance, as a list that a null ends.
class zemPropertyNames {
public:
    explicit zemPropertyNames(const CmpiInstance& instance) {
        const unsigned count = instance.getPropertyCount();
        for (unsigned i = 0; i < count; ++i) {
            CmpiString name;
            instance.getProperty(static_cast<int>(i), &name);
            m_names.push_back(zemTextOf(name));
        }
        m_list.assign(m_names.begin(), m_names.end());
        m_list.push_back(nullptr);
    }
    operator const char**() { return m_list.data(); }

private:
    std::vector<zemString> m_names;
    std::vector<const char*> m_list;
};

#endif
