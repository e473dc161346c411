/// Lines of standard output that belong together; private to the library.
///
///     zemLogLines lines;
///     lines.add({"name:"}, name);
///     lines.add({"state:"}, state);  // both go to the stream when the object ends
///
/// To be used where there are many, in an operation: each line alone costs four calls of the
/// system. These wait in the stream's buffer while there is room, and go out with the next line of
/// zemLog, at the latest with the one in which the operation's trace ends. No line of another
/// thread gets between.
#ifndef ZEM_LOG_LINES_H
#define ZEM_LOG_LINES_H

#include <cstddef>
#include <initializer_list>
#include <string>

class zemLogLines {
public:
    zemLogLines() { m_lines.reserve(kUsual); }
    ~zemLogLines();
    zemLogLines(const zemLogLines&) = delete;
    zemLogLines& operator=(const zemLogLines&) = delete;

    /// A line as zemLog::LogPlain() writes it: words of the program's own, and a text.
    void add(std::initializer_list<const char*> words, const char* text);

private:
    static constexpr std::size_t kUsual = 1000;

    std::string m_lines;
};

#endif
