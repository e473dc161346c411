#include "Output.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <utility>

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

using Json = nlohmann::ordered_json;

Json toJson(const Instance& instance);

Json toJson(const Value& value) {
    if (value.isNull()) {
        return nullptr;
    }
    if (value.isArray()) {
        Json array = Json::array();
        for (const Value& element : value.elements()) {
            array.push_back(toJson(element));
        }
        return array;
    }
    if (value.type() == CMPI_boolean) {
        return value.boolean();
    }
    if (isReal(value.type())) {
        return value.real();
    }
    if (isInteger(value.type())) {
        return value.isSigned() ? Json(value.sint()) : Json(value.uint());
    }
    return value.type() == CMPI_instance ? toJson(value.instance()) : Json(plainText(value));
}

// The names are known to differ, and so are put behind one another, not looked for.
Json toJson(const NamedValues& values) {
    Json::object_t object;
    for (const auto& [name, value] : values) {
        object.Json::object_t::Container::emplace_back(name, toJson(value));
    }
    return object;
}

Json toJson(const Instance& instance) {
    return {{"path", printPath(instance.path)},
            {"class", instance.path.className},
            {"properties", toJson(instance.properties)}};
}

std::string toText(const Instance& instance) { return printInstance(instance); }
std::string toText(const ObjectPath& path) { return printPath(path) + "\n"; }
std::string toText(const std::string& name) { return name + "\n"; }

// Texts of providers need not be UTF-8.
std::string dump(const Json& json, int indent = 2) {
    return json.dump(indent, ' ', false, Json::error_handler_t::replace) + "\n";
}

template <class List>
std::string renderAll(const List& items, Format format) {
    if (format == Format::Json) {
        Json array = Json::array();
        for (const auto& item : items) {
            array.push_back(toJson(item));
        }
        return dump(array);
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
    return format == Format::Json ? dump(toJson(value)) : printValue(value) + "\n";
}

std::string renderMethod(const Reply& reply, Format format) {
    if (format == Format::Json) {
        return dump({{"returnValue", toJson(reply.value())}, {"out", toJson(reply.out)}});
    }
    std::string out = "returnValue = " + printValue(reply.value()) + ";\n";
    for (const auto& [name, value] : reply.out) {
        out += name + " = " + printValue(value) + ";\n";
    }
    return out;
}

std::string renderEvent(const Indication& indication, Format format) {
    return format == Format::Json ? dump(toJson(indication.instance), -1)
                                  : printInstance(indication.instance);
}

}  // namespace cimom
