/// Trace lines of the providers: each goes to standard output (Log.h) and to the CIM server's own
/// trace. There is no switch here; what the server keeps depends on its trace level.
///
/// Levels: 1 entry and exit, 2 problems in localisation, 3 failures, 4 detail. A line is cut at
/// 1023 bytes, and control characters in it are escaped as Log.h says, in both places. All state is
/// on the stack; tracing takes no memory, throws nothing, and may be done on any thread. A thread
/// can be cancelled in it, so a destructor that traces disables that meanwhile.
///
/// Code writes its lines through the macros below, which use two locals that name the broker and
/// the provider:
///
///     PROV_TRACE_OF(broker->getEnc(), m_providerName);
///     PROV_TRACE_ENTER();
///     PROV_TRACE_STRING(4, "ENUMERATE INSTANCES: %s", pathText);
///     PROV_TRACE_EXIT();
///
/// Texts that come from outside (object paths, messages) are arguments, never formats.
#ifndef ZEM_PROVIDER_TRACER_H
#define ZEM_PROVIDER_TRACER_H

#include <cstdarg>

#include "ZemExport.h"
#include "cmpidt.h"

class ZEM_EXPORT zemProviderTracer {
public:
    /// Traces "<file:line> Entering method function" at level 1. @p function is cut before its
    /// first "(" and at 255 bytes. With a null @p broker nothing happens.
    static void _traceEnter(CMPIBroker* broker, const char* file, unsigned line,
                            const char* component, const char* function, ...);

    /// Traces "<file:line> Exiting method function", otherwise as _traceEnter().
    static void _traceExit(CMPIBroker* broker, const char* file, unsigned line,
                           const char* component, const char* function, ...);

    /// Traces "<file:line> " and the expansion of @p fmt at @p level. File and format make up one
    /// format together: a percent sign in @p file is read as a conversion. With a null @p broker
    /// nothing happens.
    static void _traceString(CMPIBroker* broker, const char* file, unsigned line, int level,
                             const char* component, const char* fmt, ...)
        __attribute__((format(printf, 6, 7)));

    /// Writes one line to both places. A null @p broker, or one without a trace function, still
    /// gets the line on standard output; what the server's function throws is dropped.
    static void _trace(CMPIBroker* broker, int level, const char* component, const char* fmt,
                       va_list args) __attribute__((format(printf, 4, 0)));
};

/// The source's base name where the compiler offers it: build folders say nothing to the reader.
#ifdef __FILE_NAME__
#define PROV_TRACE_FILE __FILE_NAME__
#else
#define PROV_TRACE_FILE __FILE__
#endif

/// Declares the two locals.
#define PROV_TRACE_OF(broker, component)            \
    CMPIBroker* const PROV_TRACE_BROKER = (broker); \
    const char* const PROV_TRACE_COMPONENT = (component)

#define PROV_TRACE_ENTER()                                                       \
    zemProviderTracer::_traceEnter(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__, \
                                   PROV_TRACE_COMPONENT, __func__)
#define PROV_TRACE_EXIT()                                                       \
    zemProviderTracer::_traceExit(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__, \
                                  PROV_TRACE_COMPONENT, __func__)
#define PROV_TRACE_STRING(level, ...)                                                    \
    zemProviderTracer::_traceString(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__, level, \
                                    PROV_TRACE_COMPONENT, __VA_ARGS__)

#endif
