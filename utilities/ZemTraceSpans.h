/// What a file of the timing trace tells: pieces of work, one within another, thread by thread.
/// Private to the program zemtrace; TraceTool.h is the family that writes such files.
///
/// The file is not trusted: several processes may have written it, it may begin or end in the
/// middle of a line, and hold anything. What is no line of the trace is counted and left out.
///
///     std::ifstream file(path, std::ios::binary);
///     const zemTrace trace = zemReadTrace(file);
///
/// Thread-safety: functions without state, and plain data.
#ifndef ZEM_TRACE_SPANS_H
#define ZEM_TRACE_SPANS_H

#include <cstddef>
#include <cstdint>
#include <istream>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// One line; the texts lie in it.
struct zemTraceLine {
    enum class What { Begin, End, Log };
    What what;
    std::string_view logger;
    int thread;
    std::uint64_t tick;     ///< microseconds since the epoch
    std::string_view text;  ///< of begin and end
};

/// @return nothing for what is no line of the trace
std::optional<zemTraceLine> zemReadTraceLine(std::string_view line);

enum class zemTraceKind {
    Operation,
    Broker,  ///< a provider's call back into the server
    Tool,
    Api,
};

constexpr std::size_t kZemNoSpan = std::numeric_limits<std::size_t>::max();

/// A piece of work that was begun and ended. Texts are numbers in zemTrace::texts.
struct zemTraceSpan {
    zemTraceKind kind;
    int thread;
    std::uint64_t begin;
    std::uint64_t end;
    std::size_t parent;    ///< around it on its thread, an earlier span; or kZemNoSpan
    std::size_t name;      ///< the logger's
    std::size_t subject;   ///< class of an operation, or its provider without one; else the text
    std::size_t provider;  ///< of an operation; else the text
    std::int64_t number;   ///< that its process gave to an operation, or -1

    std::uint64_t time() const { return end - begin; }
};

/// Both layers of getInstance are one span.
struct zemTrace {
    std::vector<zemTraceSpan> spans;  ///< in the order in which they were begun in the file
    std::vector<std::string> texts;   ///< UTF-8 without control characters, whatever the file had
    std::size_t lines = 0;
    std::size_t unreadable = 0;       ///< lines that are none of the trace
    std::size_t firstUnreadable = 0;  ///< its number, from 1
    std::size_t notes = 0;            ///< lines that neither begin nor end anything
    std::size_t unended = 0;          ///< begun, and no end is told
    std::size_t unbegun = 0;          ///< ended, and no begin is told, or only a later one

    const std::string& text(std::size_t number) const { return texts[number]; }
};

/// Reads to the end. Whether @p in failed on the way is the caller's to ask.
zemTrace zemReadTrace(std::istream& in);

#endif
