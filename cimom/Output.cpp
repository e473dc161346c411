#include "Output.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <stdexcept>
#include <utility>

#include "Json.h"
#include "PathText.h"

namespace cimom {

// -- where to -----------------------------------------------------------------------------------

ResultStream::ResultStream(const std::string& providerOutput)
    : m_descriptor(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1)) {
    const std::string file = providerOutput == "discard" ? "/dev/null" : providerOutput;
    const int target = file == "stderr"
                           ? STDERR_FILENO
                           : open(file.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC,
                                  S_IRUSR | S_IWUSR | S_IRGRP | S_IROTH);
    if (target < 0 || m_descriptor < 0) {
        const std::string why = std::strerror(errno);
        if (m_descriptor >= 0) {
            close(m_descriptor);
        }
        throw std::runtime_error(file + ": " + why);
    }
    dup2(target, STDOUT_FILENO);
    if (target != STDERR_FILENO) {
        close(target);
    }
}

// Descriptor 1 stays as it is: what providers have in their buffers comes out at exit.
ResultStream::~ResultStream() { close(m_descriptor); }

bool ResultStream::write(const std::string& text) {
    if (m_hook) {
        std::exchange(m_hook, nullptr)();
    }
    for (std::size_t done = 0; done < text.size();) {
        const ssize_t count = ::write(m_descriptor, text.data() + done, text.size() - done);
        if (count < 0 && errno != EINTR) {
            if (errno != EPIPE) {
                m_failure = errno;
            }
            return false;
        }
        if (count > 0) {
            done += static_cast<std::size_t>(count);
        }
    }
    return true;
}

// -- what ---------------------------------------------------------------------------------------

namespace {

std::string toText(const Instance& instance) { return printInstance(instance); }
std::string toText(const ObjectPath& path) { return printPath(path) + "\n"; }
std::string toText(const std::string& name) { return name + "\n"; }

template <class List>
std::string renderAll(const List& items, Format format) {
    if (format == Format::Json) {
        return jsonOf(items);
    }
    std::string out;
    for (const auto& item : items) {
        out += toText(item);
    }
    return out;
}

}  // namespace

std::string render(const std::deque<Instance>& instances, Format format) {
    return renderAll(instances, format);
}
std::string render(const std::deque<ObjectPath>& paths, Format format) {
    return renderAll(paths, format);
}
std::string render(const std::vector<std::string>& names, Format format) {
    return renderAll(names, format);
}

std::string render(const Value& value, Format format) {
    return format == Format::Json ? jsonOf(value) : printValue(value) + "\n";
}

std::string renderMethod(const Reply& reply, Format format) {
    if (format == Format::Json) {
        return jsonOfMethod(reply);
    }
    std::string out = "returnValue = " + printValue(reply.value()) + ";\n";
    for (const auto& [name, value] : reply.out) {
        out += name + " = " + printValue(value) + ";\n";
    }
    return out;
}

std::string renderEvent(const Indication& indication, Format format) {
    return format == Format::Json ? jsonLineOf(indication.instance)
                                  : printInstance(indication.instance);
}

}  // namespace cimom
