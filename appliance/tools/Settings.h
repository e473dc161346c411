/// The attribute lists of change tools: "name=value" items with commas between them. An item that
/// holds a comma is quoted as a whole, its own quotes doubled.
#ifndef APPLIANCE_SETTINGS_H
#define APPLIANCE_SETTINGS_H

#include <optional>
#include <string>
#include <vector>

#include "Request.h"

namespace appliance {

struct Setting {
    enum class Operator { Set, Add, Remove };  ///< =, += and -=

    std::string name;
    Operator op = Operator::Set;
    std::string value;
};

using Settings = std::vector<Setting>;

/// The items of the option's value, in their order; none when it is empty or was not given.
/// @param names  those that may be set, with commas between them
/// @throws Failure BadSetting no operator stands behind a name; UnknownAttribute; RepeatedSetting
Settings settingsOf(const Request& request, const char* option, const char* names);

/// The value that @p settings give an attribute, if any.
/// @throws Failure NotAList they add to it or remove from it
std::optional<std::string> given(const Settings& settings, const std::string& name);
/// @throws Failure MissingSetting; NotAList
std::string needed(const Settings& settings, const std::string& name);

}  // namespace appliance

#endif
