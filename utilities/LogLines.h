/// Lines of standard output that belong together; private to the library.
///
///     zemLogLines lines;
///     lines.add({"name:"}, name);
///     lines.add({"state:"}, state);  // both are written when the object ends
///
/// To be used where there are many: each line alone costs four calls of the system. No line of
/// another thread gets between.
#ifndef ZEM_LOG_LINES_H
#define ZEM_LOG_LINES_H

#include <initializer_list>
#include <string>

class zemLogLines {
public:
    zemLogLines() = default;
    ~zemLogLines();
    zemLogLines(const zemLogLines&) = delete;
    zemLogLines& operator=(const zemLogLines&) = delete;

    /// A line as zemLog::LogPlain() writes it: words of the program's own, and a text.
    void add(std::initializer_list<const char*> words, const char* text);

private:
    std::string m_lines;
};

#endif
