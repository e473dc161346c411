/// What the command line prints, and where to.
#ifndef CIMOM_OUTPUT_H
#define CIMOM_OUTPUT_H

#include <deque>
#include <functional>
#include <string>
#include <vector>

#include "ClassRepository.h"
#include "Server.h"

namespace cimom {

/// Keeps the results of the command line and the output of providers apart.
///
/// Providers write trace lines to standard output. From construction on, descriptor 1 leads
/// where providers may write, and results go to what was standard output before.
class ResultStream {
public:
    /// @param providerOutput  "discard", "stderr", or the name of a file to append to
    /// @throws std::runtime_error when the file cannot be opened
    explicit ResultStream(const std::string& providerOutput);
    ~ResultStream();
    ResultStream(const ResultStream&) = delete;
    ResultStream& operator=(const ResultStream&) = delete;

    /// Has @p hook called once, before anything is written.
    void beforeFirstWrite(std::function<void()> hook) { m_hook = std::move(hook); }

    /// @return false when the reader has gone, or what was written cannot be kept
    bool write(const std::string& text);
    /// Why a write failed, as errno; 0 when none did, or the reader has gone, who knows it.
    int failure() const { return m_failure; }

private:
    int m_descriptor;
    int m_failure = 0;
    std::function<void()> m_hook;
};

enum class Format { Text, Json };

/// The parts of a reply as text that ends with a newline; empty for an empty list of texts.
std::string render(const std::deque<Instance>& instances, Format format);
std::string render(const std::deque<ObjectPath>& paths, Format format);
/// The return value and the output arguments of a method.
std::string renderMethod(const Reply& reply, Format format);
std::string render(const Value& value, Format format);
/// One instance on a line of its own in JSON, so that a stream of them can be read.
std::string renderEvent(const Indication& indication, Format format);
std::string render(const std::vector<std::string>& names, Format format);

}  // namespace cimom

#endif
