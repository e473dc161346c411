#include "VirtualSystemInstanceId.h"

#include <string>

namespace {

// By zemSettingSide.
constexpr const char* kPrefixes[] = {"ORX:2*", "ORX:4*"};
constexpr unsigned kPrefixLength = 6;

/// @param what  null: not in the ID
zemString form(const zemInstanceIdOwner& owner, const char* what) {
    constexpr std::size_t kUsual = 80;
    std::string id;
    id.reserve(kUsual);
    id = kPrefixes[owner.side];
    if (owner.side == SIDE_DEFINED) {
        id += owner.profileName;
        id += '-';
    }
    if (what != nullptr) {
        id += what;
        id += '*';
    }
    id += owner.lparID;
    id += '*';
    id += owner.mtms;
    return id.c_str();
}

/// Where the "*" stands before @p mtms at the end of @p id, or -1: @p id has no room for both and a
/// prefix.
int endOf(const zemString& id, const zemString& mtms) {
    const std::size_t around = kPrefixLength + 1 + mtms.length();
    return id.length() < around ? -1 : static_cast<int>(id.length() - mtms.length() - 1);
}

}  // namespace

zemString zemFormInstanceId(const zemInstanceIdOwner& owner) { return form(owner, nullptr); }

zemString zemFormInstanceId(const zemInstanceIdOwner& owner, const zemString& drcIndex) {
    return form(owner, drcIndex);
}

zemString zemFormInstanceId(const zemInstanceIdOwner& owner, int slot) {
    return form(owner, std::to_string(slot).c_str());
}

bool zemIsInstanceIdOf(zemSettingSide side, const zemString& id) {
    return id.startsWith(kPrefixes[side]);
}

bool zemInstanceIdEndsWith(const zemString& id, const zemString& mtms) {
    const zemString end = "*" + mtms;
    const int found = id.find(end);
    return found >= 0 && static_cast<std::size_t>(found) + end.length() == id.length();
}

void zemSplitInstanceId(const zemString& id, const zemString& mtms, zemString& profileName,
                        zemString& lparID) {
    const int end = endOf(id, mtms);
    if (end < 0) {
        return;
    }
    const auto behind = static_cast<unsigned>(end);
    if (zemIsInstanceIdOf(SIDE_STATE, id)) {
        lparID = id.extractSubstring(kPrefixLength, behind);
    } else if (zemIsInstanceIdOf(SIDE_DEFINED, id)) {
        const int dash = id.reverseFind('-', behind);
        if (dash >= 0) {
            lparID = id.extractSubstring(static_cast<unsigned>(dash) + 1, behind);
            profileName = id.extractSubstring(kPrefixLength, static_cast<unsigned>(dash));
        }
    }
}

zemString zemResourceOfInstanceId(const zemString& id, const zemString& mtms) {
    const int end = endOf(id, mtms);
    if (end < 0) {
        return zemString();
    }
    const zemString middle = id.extractSubstring(kPrefixLength, static_cast<unsigned>(end));
    const int dash = zemIsInstanceIdOf(SIDE_DEFINED, id) ? middle.reverseFind('-') : -1;
    return middle.extractSubstring(static_cast<unsigned>(dash + 1));
}

zemString zemSystemInstanceIdOf(const zemString& id, const zemString& mtms, bool namesResource) {
    const std::string text = static_cast<const char*>(id);
    const std::string end = static_cast<const char*>("*" + mtms);
    const std::size_t at = text.rfind(end);
    if (at == text.npos || at + end.size() != text.size()) {
        return zemString();
    }
    if (!namesResource) {
        return id;
    }
    const std::size_t begin = text.find('*') + 1;
    const std::string rest = begin > at ? "" : text.substr(begin, at - begin);
    const std::size_t star = rest.rfind('*');
    const std::string lpar = rest.substr(star + 1) + end;
    if (zemIsInstanceIdOf(SIDE_STATE, id)) {
        return (text.substr(0, begin) + lpar).c_str();
    }
    const std::size_t dash = star == rest.npos ? star : rest.rfind('-', star);
    if (dash == rest.npos) {
        return zemString();
    }
    return (text.substr(0, begin + dash + 1) + lpar).c_str();
}
