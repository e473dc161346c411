#include "Settings.h"

#include <algorithm>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

Setting settingOf(const std::string& item) {
    const std::size_t equals = item.find('=');
    if (equals == std::string::npos || equals == 0) throw Failure(Fault::BadSetting, {item});
    Setting setting;
    setting.value = item.substr(equals + 1);
    const char before = item[equals - 1];
    if (before == '+') setting.op = Setting::Operator::Add;
    if (before == '-') setting.op = Setting::Operator::Remove;
    setting.name = item.substr(0, setting.op == Setting::Operator::Set ? equals : equals - 1);
    return setting;
}

}  // namespace

std::vector<Setting> settingsOf(const Request& request, const char* option, const char* names) {
    std::vector<Setting> settings;
    const std::string text = request.value(option);
    if (text.empty()) return settings;
    const std::vector<std::string> known = split(names);
    for (const std::string& item : split(text)) {
        Setting setting = settingOf(item);
        if (std::find(known.begin(), known.end(), setting.name) == known.end()) {
            throw Failure(Fault::UnknownAttribute, {setting.name});
        }
        const auto same = [&](const Setting& other) { return other.name == setting.name; };
        if (std::any_of(settings.begin(), settings.end(), same)) {
            throw Failure(Fault::RepeatedSetting, {setting.name});
        }
        settings.push_back(std::move(setting));
    }
    return settings;
}

}  // namespace appliance
