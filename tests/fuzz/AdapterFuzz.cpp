// Any text is read, as an element of each kind, into the fields that a reader on copies finds, or
// refused when that finds quotes not closed. What is written reads and writes as the same again,
// and a merge fills up what lacks and nothing else. A newline parts the text from the one merged
// with.

#include <algorithm>
#include <climits>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <optional>
#include <string>
#include <vector>

#include "Exception.h"
#include "VirtualSystemResourceAdapters.h"

namespace {

using Texts = std::vector<std::string>;

std::string text(const zemString& value) { return std::string(value); }
std::string text(int value) { return std::to_string(value); }
std::string text(const zemArray<int>& values) {
    std::string all;
    for (int i = 0; i < values.size(); ++i) {
        all += std::to_string(values[i]) + ',';
    }
    return all;
}

Texts fieldsOf(const zemIOSlotAdapter& a) {
    return {text(a.getDrcIndex()), text(a.getPoolId()), text(a.getIsRequired())};
}
Texts fieldsOf(const zemVirtualSerialAdapter& a) {
    return {text(a.getSlotId()),       text(a.getIsServer()),       text(a.getSupportsDNX()),
            text(a.getRemoteLparId()), text(a.getRemoteLparName()), text(a.getRemoteSlotNumber()),
            text(a.getIsRequired())};
}
Texts fieldsOf(const zemVirtualSCSIAdapter& a) {
    return {text(a.getSlotId()),         text(a.getIsServer()),         text(a.getRemoteLparId()),
            text(a.getRemoteLparName()), text(a.getRemoteSlotNumber()), text(a.getIsRequired())};
}
Texts fieldsOf(const zemVirtualEthernetAdapter& a) {
    return {text(a.getSlotId()),        text(a.getIsIEEE()),
            text(a.getPortVlanId()),    text(a.getAdditionalVlanIds()),
            text(a.getTrunkPriority()), text(a.getIsRequired()),
            text(a.getVSwitch())};
}

/// At most @p most fields; nothing for quotes that are not closed.
std::optional<Texts> split(const std::string& line, char delimiter, std::size_t most) {
    Texts fields;
    for (std::size_t begin = 0; fields.size() < most && begin <= line.size();) {
        std::size_t from = begin;
        if (line[begin] == '"') {
            from = line.find('"', begin + 1);
            if (from == std::string::npos) {
                return {};
            }
        }
        const std::size_t end = std::min(line.find(delimiter, from), line.size());
        fields.push_back(from == begin ? line.substr(begin, end - begin)
                                       : line.substr(begin + 1, from - begin - 1));
        begin = end + 1;
    }
    return fields;
}

std::string number(const std::string& field) {
    const long value = std::strtol(field.c_str(), nullptr, 10);
    return std::to_string(std::clamp(value, long{INT_MIN}, long{INT_MAX}));
}

bool isText(char kind) { return kind == 't' || kind == 'm' || kind == 'l'; }

/// The fields of an element of a kind with a letter each: number, digits, side, console of a
/// server, name, text, list.
std::optional<Texts> expected(const std::string& element, const std::string& kinds) {
    const std::optional<Texts> given = split(element, '/', kinds.size());
    if (!given) {
        return {};
    }
    Texts fields;
    for (std::size_t i = 0; i < kinds.size(); ++i) {
        const std::string field = i < given->size() ? (*given)[i] : "";
        const bool isDigits = field.find_first_not_of("0123456789") == std::string::npos;
        std::string value = isText(kinds[i]) ? "" : "-1";
        if (kinds[i] == 'l') {
            const std::optional<Texts> values = split(field, ',', field.size() + 1);
            if (!values) {
                return {};
            }
            for (const std::string& one : *values) {
                value += one.empty() ? "" : number(one) + ',';
            }
        } else if (kinds[i] == 's') {
            value = field == "server" ? "1" : field == "client" ? "0" : "-1";
        } else if (kinds[i] == 't') {
            value = field;
        } else if (!field.empty() && (kinds[i] == 'n' || (kinds[i] == 'd' && isDigits) ||
                                      (kinds[i] == 'c' && fields[1] == "1"))) {
            value = number(field);
        }
        fields.push_back(value);
    }
    return fields;
}

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

template <class Adapter>
std::optional<Adapter> read(const std::string& element, const std::string& kinds) {
    const std::optional<Texts> fields = expected(element, kinds);
    try {
        const Adapter adapter{zemString(element.c_str())};
        require(fields == fieldsOf(adapter));
        return adapter;
    } catch (const zemInvalidParameterException& e) {
        require(!fields && element.find(e.getExceptionString()) != std::string::npos);
        return {};
    }
}

template <class Adapter>
std::string formOf(Adapter adapter) {
    return text(adapter.getValue());
}

template <class Adapter>
void check(const std::string& element, const std::string& other, const std::string& kinds) {
    const std::optional<Adapter> adapter = read<Adapter>(element, kinds);
    const std::optional<Adapter> source = read<Adapter>(other, kinds);
    if (!adapter) {
        return;
    }
    const bool isSlot = kinds[0] == 't';
    const std::string form = formOf(*adapter);
    const bool isPlain = (element + form).find('"') == std::string::npos;
    const bool hasPool = !isSlot || fieldsOf(*adapter)[1] != "-1";
    require(hasPool || form.rfind("none/", 0) == 0);
    if (isPlain && hasPool) {
        require(formOf(*read<Adapter>(form, kinds)) == form);
    }
    if (!source) {
        return;
    }
    Adapter merged = *adapter;
    merged.mergeWith(*source);
    Texts fields = fieldsOf(*adapter);
    for (std::size_t i = 0; i < kinds.size(); ++i) {
        if (fields[i] == (isText(kinds[i]) ? "" : "-1")) {
            fields[i] = fieldsOf(*source)[i];
        }
    }
    require(fieldsOf(merged) == fields);
    Adapter kept = *adapter;
    kept.getValue();
    kept.mergeWith(*source);
    const bool isAppended = kinds.back() != 't';
    const bool isReplaced = isSlot && fields[1] == "-1";
    require(formOf(kept) ==
            (isReplaced ? "" : form) + (isAppended ? formOf(merged) : std::string()));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string input = std::string(data, data + size).c_str();
    const std::size_t newline = std::min(input.find('\n'), input.size());
    const std::string element = input.substr(0, newline);
    const std::string other = newline < input.size() ? input.substr(newline + 1) : "";
    check<zemIOSlotAdapter>(element, other, "tdn");
    check<zemVirtualSerialAdapter>(element, other, "nscdmdn");
    check<zemVirtualSCSIAdapter>(element, other, "nsdmdn");
    check<zemVirtualEthernetAdapter>(element, other, "nnnlnnt");
    return 0;
}
