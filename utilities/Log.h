/// Lines on standard output, where the CIM server's redirection picks them up.
///
/// A line is written and flushed under the stream's lock, so that lines of concurrent threads come
/// out whole. Control characters inside a text are written as "\n", "\r" or "\x1B", so that a text
/// from outside cannot look like a line of its own; only a line end before a blank, a tab or "}"
/// stays. Writing takes no memory and throws nothing, and a reader that is gone raises no signal.
/// Nothing is held between calls; any thread may call at any time.
#ifndef ZEM_LOG_H
#define ZEM_LOG_H

#include "ZemExport.h"

/// Severities that zemBaseProvider::logMessage passes to the server's log. Include <syslog.h>,
/// whose macros share a name with these, in no source that uses them.
enum { LOG_INFO = 1, LOG_WARN = 2, LOG_SEVERE = 3, LOG_FATAL = 4 };

class ZEM_EXPORT zemLog {
public:
    /// Writes the prefix "<zem350Log-prefix>", @p text (null counts as empty) and a newline.
    static void Log(const char* text);

    /// The same as Log(), under the name used for lines of the system log.
    static void LogSysOut(const char* text);

    /// Writes @p text and a newline without the prefix, for the few lines that tools on the
    /// appliance search for from their first byte.
    static void LogPlain(const char* text);

private:
    zemLog();
    ~zemLog();
};

#endif
