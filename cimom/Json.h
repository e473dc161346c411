/// The documents in JSON that the object manager reads and prints: the one place that knows a
/// library for them.
///
/// A registration file is JSON and says which class is served by which provider:
///
///     {
///       "namespace": "root/cimv2",
///       "library": "zemproviders",
///       "classes": {
///         "ORXC_Host": {"provider": "ORXC_HostProvider", "interfaces": ["instance", "method"]},
///         "ORXC_HostedPartition": [{"provider": "A", "interfaces": ["association"]},
///                                  {"provider": "B", "interfaces": ["instance"]}]
///       }
///     }
///
/// "namespace" may be a list, and both it and "library" may stand again in a row of "classes".
/// Interfaces are instance, association, method, indication and property. A library is a file
/// name, or a bare name that stands for lib<name>.so; it is looked for in the folder of the
/// registration file, then in the server's library folders, then by the system's loader.
///
/// What is printed ends with a newline; bytes that are no UTF-8, which texts of providers may hold,
/// are replaced.
#ifndef CIMOM_JSON_H
#define CIMOM_JSON_H

#include <deque>
#include <optional>
#include <string>
#include <vector>

#include "Messages.h"
#include "Server.h"

namespace cimom {

/// One row of a registration.
struct Registration {
    std::string className;
    std::string provider;
    std::string library;
    std::vector<std::string> nameSpaces;
    unsigned interfaces = 0;  ///< bits of Interface
};

/// @throws std::runtime_error with the file and the reason
std::vector<Registration> readRegistration(const std::string& file);

/// The texts of a message file; none when it cannot be read or holds no JSON object.
std::optional<MessageTexts> readTexts(const std::string& file);

/// Instances are {path, class, properties}, and paths are their texts.
std::string jsonOf(const std::deque<Instance>& instances);
std::string jsonOf(const std::deque<ObjectPath>& paths);
std::string jsonOf(const std::vector<std::string>& names);
std::string jsonOf(const Value& value);
/// {returnValue, out} of a method.
std::string jsonOfMethod(const Reply& reply);
/// One instance on a line of its own.
std::string jsonLineOf(const Instance& instance);

}  // namespace cimom

#endif
