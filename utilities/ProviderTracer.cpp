#include "ProviderTracer.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

#include "LetUnwind.h"
#include "Log.h"
#include "LogText.h"
#include "cmpift.h"

namespace {

constexpr size_t kMessageSize = 1024;
constexpr size_t kLineSize = 2048;
constexpr int kMaxFunctionName = 255;

const char* orEmpty(const char* text) { return text != nullptr ? text : ""; }

// Builds the text of an entry or exit line; the function's name ends at its parameter list.
void methodLine(char (&text)[kMessageSize], const char* what, const char* file, unsigned line,
                const char* function) {
    const char* name = orEmpty(function);
    const size_t bare = strcspn(name, "(");
    const int length = bare < kMaxFunctionName ? static_cast<int>(bare) : kMaxFunctionName;
    snprintf(text, sizeof text, "<%s:%u> %s method %.*s", orEmpty(file), line, what, length, name);
}

// A format cut at the buffer's end may stop inside a conversion, which must not be expanded.
void dropCutConversion(char* format) {
    char* next = format;
    while ((next = strchr(next, '%')) != nullptr) {
        char* conversion = next++;
        next += strcspn(next, "%diouxXeEfFgGaAcspn");
        if (*next == '\0') {
            *conversion = '\0';
            return;
        }
        ++next;
    }
}

}  // namespace

void zemProviderTracer::_traceEnter(CMPIBroker* broker, const char* file, unsigned line,
                                    const char* component, const char* function, ...) {
    if (broker == nullptr) {
        return;
    }
    char text[kMessageSize];
    methodLine(text, "Entering", file, line, function);
    va_list args;
    va_start(args, function);
    _trace(broker, 1, component, text, args);
    va_end(args);
}

void zemProviderTracer::_traceExit(CMPIBroker* broker, const char* file, unsigned line,
                                   const char* component, const char* function, ...) {
    if (broker == nullptr) {
        return;
    }
    char text[kMessageSize];
    methodLine(text, "Exiting", file, line, function);
    va_list args;
    va_start(args, function);
    _trace(broker, 1, component, text, args);
    va_end(args);
}

void zemProviderTracer::_traceString(CMPIBroker* broker, const char* file, unsigned line, int level,
                                     const char* component, const char* fmt, ...) {
    if (broker == nullptr) {
        return;
    }
    char format[kMessageSize];
    const int wanted =
        snprintf(format, sizeof format, "<%s:%u> %s", orEmpty(file), line, orEmpty(fmt));
    if (wanted >= static_cast<int>(sizeof format)) {
        dropCutConversion(format);
    }
    va_list args;
    va_start(args, fmt);
    _trace(broker, level, component, format, args);
    va_end(args);
}

void zemProviderTracer::_trace(CMPIBroker* broker, int level, const char* component,
                               const char* fmt, va_list args) {
    char text[kMessageSize] = {};
    vsnprintf(text, sizeof text, fmt, args);
    char message[kMessageSize] = {};
    size_t length = 0;
    zemPutLogText(text, [&](const char* piece, size_t size) {
        size = std::min(size, sizeof message - 1 - length);
        memcpy(message + length, piece, size);
        length += size;
    });

    char line[kLineSize] = {};
    snprintf(line, sizeof line, "Component:%s, Log message: %s", orEmpty(component), message);
    zemLog::Log(line);

    if (broker == nullptr) {
        return;
    }
    // Level 4 is one that servers know and CMPILevel does not name: it is handed on as it is made,
    // and never read as one of that type.
    const auto* const services = broker->eft;
    if (services != nullptr && services->trace != nullptr) {
        zemQuietly([&] {
            services->trace(broker, static_cast<CMPILevel>(level), component, message, nullptr);
        });
    }
}
