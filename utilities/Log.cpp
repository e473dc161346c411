#include "Log.h"

#include <cstdio>
#include <string>

namespace {

// One fwrite takes the stream's lock once, so a line is never torn by another thread's line.
void writeLine(const char* prefix, const char* text) {
    std::string line(prefix);
    if (text != nullptr) line += text;
    line += '\n';
    std::fwrite(line.data(), 1, line.size(), stdout);
    std::fflush(stdout);
}

constexpr const char* kPrefix = "<zem350Log-prefix>";

}  // namespace

void zemLog::Log(const char* text) { writeLine(kPrefix, text); }

void zemLog::LogSysOut(const char* text) { writeLine(kPrefix, text); }

void zemLog::LogPlain(const char* text) { writeLine("", text); }
