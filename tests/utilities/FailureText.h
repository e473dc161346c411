/// What an operation throws, as one text to hold against what is expected.
#pragma once

#include <functional>
#include <string>

#include "Exception.h"

/// "kind/class/method/id/text", or "" if @p operation throws nothing.
inline std::string failureText(const std::function<void()>& operation) {
    try {
        operation();
    } catch (const zemException& e) {
        return std::to_string(e.getExceptionType()) + '/' + e.getThrowingClass() + '/' +
               e.getThrowingMethod() + '/' + e.getExceptionId() + '/' + e.getExceptionString();
    }
    return "";
}
