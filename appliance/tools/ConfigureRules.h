/// The attributes that edplat and nwplat set: one row for each, with the attribute of the object
/// that holds it and the values that it can have.
///
/// A tool takes a copy of an object, applies what the command line says, lets a profile settle,
/// and puts the copy back: nothing changes when something on the way is refused.
#ifndef APPLIANCE_CONFIGURERULES_H
#define APPLIANCE_CONFIGURERULES_H

#include <optional>
#include <string>
#include <vector>

#include "Settings.h"
#include "View.h"

namespace appliance {

/// How @p value is stored; nothing when the attribute cannot have it.
using Rule = std::optional<std::string> (*)(const HostView& host, const std::string& value,
                                            const char* argument);

struct AttributeRule {
    const char* names;  ///< as they are set, with commas between them
    Rule rule;
    const char* argument = "";     ///< what the rule makes of it is its own
    const char* stored = nullptr;  ///< the name under which it is stored; null: its own
    bool isList = false;           ///< elements can be added and removed
};

using AttributeRules = std::vector<AttributeRule>;

const AttributeRules& hostRules();
const AttributeRules& lparRules();
/// Also those of a new partition.
const AttributeRules& profileRules();

/// The names of @p rules, with commas between them, behind @p others.
std::string namesOf(const AttributeRules& rules, std::string others);

/// How the value of @p setting, which one of @p rules is about, is stored.
/// @throws Failure BadValue, NotCapable, NotAList
std::string checkedValue(const HostView& host, const AttributeRules& rules, const Setting& setting);

/// Makes @p object as @p setting, which one of @p rules is about, says.
/// @throws Failure those of checkedValue(); ElementThere, ElementMissing; Required for a console,
///         which every partition has
void apply(const HostView& host, const AttributeRules& rules, const Setting& setting,
           Object& object);

/// Sets what follows from the settings that were applied to a profile (units of dedicated
/// processors, the usual weight of an uncapped partition, consoles ...), and judges whether its
/// values go together.
/// @throws Failure OutsideLimits, Disagree, BadValue, SlotNotFound
void settle(const HostView& host, const Settings& settings, Object& profile);

/// Whether this way of sharing is one of shared processors; all others are of dedicated ones.
bool sharesPool(const std::string& sharingMode);

/// Whether people can read @p name on one line of the usual length.
bool isPrintable(const std::string& name);

}  // namespace appliance

#endif
