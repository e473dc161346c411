#include "Log.h"

#include <stdio_ext.h>

#include <cstdio>
#include <cstring>

#include "LogLines.h"
#include "LogText.h"
#include "SigpipeHeld.h"

namespace {

constexpr const char* kPrefix = "<zem350Log-prefix>";

/// Holds the stream from the first byte of a line until it is out, so that no other thread's line
/// gets between, and no other thread is left to write this one to a reader that is gone.
class OutputHold {
public:
    OutputHold() { flockfile(stdout); }
    ~OutputHold() { funlockfile(stdout); }
    OutputHold(const OutputHold&) = delete;
    OutputHold& operator=(const OutputHold&) = delete;
};

void put(const char* piece, size_t size) { fwrite_unlocked(piece, 1, size, stdout); }

/// Runs @p body, which puts whole lines.
template <class Body>
void writeLines(Body body) {
    const OutputHold hold;
    const zemSigpipeHeld held;
    body();
    fflush_unlocked(stdout);
}

// Takes no memory: lines are written in destructors, and when there is none.
void writeLine(const char* prefix, const char* text) {
    writeLines([=] {
        put(prefix, strlen(prefix));
        zemPutLogText(text != nullptr ? text : "", put);
        put("\n", 1);
    });
}

}  // namespace

void zemLog::Log(const char* text) { writeLine(kPrefix, text); }

void zemLog::LogSysOut(const char* text) { writeLine(kPrefix, text); }

void zemLog::LogPlain(const char* text) { writeLine("", text); }

void zemLogLines::add(std::initializer_list<const char*> words, const char* text) {
    for (const char* const word : words) {
        m_lines += word;
    }
    zemPutLogText(text, [this](const char* piece, size_t size) { m_lines.append(piece, size); });
    m_lines += '\n';
}

zemLogLines::~zemLogLines() {
    const OutputHold hold;
    const bool isRoom = __fbufsize(stdout) > __fpending(stdout) + m_lines.size();
    if (isRoom && __flbf(stdout) == 0) {
        put(m_lines.data(), m_lines.size());
    } else {
        writeLines([this] { put(m_lines.data(), m_lines.size()); });
    }
}
