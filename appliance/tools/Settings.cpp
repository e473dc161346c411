#include "Settings.h"

#include <algorithm>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

Setting settingOf(const std::string& item) {
    const std::size_t equals = item.find('=');
    refuseIf(equals == std::string::npos || equals == 0, Fault::BadSetting, {item});
    Setting setting;
    setting.value = item.substr(equals + 1);
    const char before = item[equals - 1];
    if (before == '+') {
        setting.op = Setting::Operator::Add;
    }
    if (before == '-') {
        setting.op = Setting::Operator::Remove;
    }
    setting.name = item.substr(0, setting.op == Setting::Operator::Set ? equals : equals - 1);
    return setting;
}

}  // namespace

Settings settingsOf(const Request& request, const char* option, const char* names) {
    Settings settings;
    const std::string text = request.value(option);
    if (text.empty()) {
        return settings;
    }
    for (const std::string& item : split(text)) {
        Setting setting = settingOf(item);
        refuseIf(!isListed(names, setting.name), Fault::UnknownAttribute, {setting.name});
        const auto same = [&](const Setting& other) { return other.name == setting.name; };
        refuseIf(std::any_of(settings.begin(), settings.end(), same), Fault::RepeatedSetting,
                 {setting.name});
        settings.push_back(std::move(setting));
    }
    return settings;
}

std::optional<std::string> given(const Settings& settings, const std::string& name) {
    for (const Setting& setting : settings) {
        if (setting.name != name) {
            continue;
        }
        refuseIf(setting.op != Setting::Operator::Set, Fault::NotAList, {name});
        return setting.value;
    }
    return std::nullopt;
}

std::string needed(const Settings& settings, const std::string& name) {
    std::optional<std::string> value = given(settings, name);
    refuseIf(!value, Fault::MissingSetting, {name});
    return std::move(*value);
}

}  // namespace appliance
