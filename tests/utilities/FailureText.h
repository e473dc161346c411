/// What an operation throws, and what it gives, as one text to hold against what is expected.
#pragma once

#include <functional>
#include <sstream>
#include <string>

#include "Exception.h"

/// The fields that @p letters ask for, with "/" between them: kind, class, method, access method,
/// id, text.
inline std::string fieldsOf(const zemException& e, const std::string& letters) {
    std::string all;
    for (const char letter : letters) {
        if (!all.empty()) {
            all += '/';
        }
        all += letter == 'k'   ? std::to_string(e.getExceptionType()).c_str()
               : letter == 'c' ? e.getThrowingClass()
               : letter == 'm' ? e.getThrowingMethod()
               : letter == 'a' ? e.getAccessMethod()
               : letter == 'i' ? e.getExceptionId()
                               : e.getExceptionString();
    }
    return all;
}

/// The fields of what @p operation throws, or "" if it throws nothing.
inline std::string failureText(const std::function<void()>& operation,
                               const std::string& letters = "kcmit") {
    try {
        operation();
    } catch (const zemException& e) {
        return fieldsOf(e, letters);
    }
    return "";
}

/// All @p values, "|" behind each.
template <class... Values>
std::string joined(const Values&... values) {
    std::ostringstream text;
    ((text << values << '|'), ...);
    return text.str();
}

/// "<number> <word>;" of each number around those in use whose word is not @p other.
template <class WordOf>
std::string wordsOf(WordOf wordOf, const std::string& other) {
    std::string words;
    for (int number = -2; number <= 256; ++number) {
        const std::string word(wordOf(number));
        words += word == other ? "" : std::to_string(number) + ' ' + word + ';';
    }
    return words;
}
