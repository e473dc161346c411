/// Text from outside in the lines of a log; private to the library.
#ifndef ZEM_LOG_TEXT_H
#define ZEM_LOG_TEXT_H

#include <cstddef>
#include <cstdio>
#include <cstring>

/// Hands @p text piece by piece to @p put(piece, size), its control characters as "\n", "\r" or
/// "\x1B": a name or a value of a client must not look like a line of its own. Tabs stay, and so
/// does a line end before a blank, a tab, "}" or the end, for no line of the log begins so: of such
/// lines are the texts of instances and exceptions. What has gone through once stays as it is.
template <class Put>
void zemPutLogText(const char* text, Put put) {
    const char* next = text;
    for (; *next != '\0'; ++next) {
        const auto byte = static_cast<unsigned char>(*next);
        if ((byte >= ' ' && byte != 0x7F) || byte == '\t') {
            continue;
        }
        if (byte == '\n' && strchr(" \t}", next[1]) != nullptr) {
            continue;  // the end, too
        }
        char escape[8];
        const int size = snprintf(escape, sizeof escape,
                                  byte == '\n'   ? "\\n"
                                  : byte == '\r' ? "\\r"
                                                 : "\\x%02X",
                                  static_cast<unsigned>(byte));
        put(text, static_cast<size_t>(next - text));
        put(escape, static_cast<size_t>(size));
        text = next + 1;
    }
    put(text, static_cast<size_t>(next - text));
}

#endif
