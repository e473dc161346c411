#include "VirtualSystemResourceAdapters.h"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <string>
#include <string_view>

#include "Exception.h"
#include "NumberText.h"

namespace {

constexpr char kDelimiter = '/';
constexpr int kUnset = -1;

/// A remote partition or slot that is known to be any.
constexpr int kAny = -2;

/// What a field of an element holds, and so how it is read, written and merged.
enum class Kind {
    text,          ///< any text
    optional,      ///< any text; without one the field is left away, with its delimiter
    passed,        ///< a text that is written, and read past
    number,        ///< -1 is written as nothing
    flag,          ///< a number that is written as "1" or "0"
    side,          ///< 1 "server", 0 "client"
    ofServer,      ///< a flag that clients do not have
    remote,        ///< a number or, on a server, "any"
    pool,          ///< a number; without one, "none" takes the place of all that stands before
    listOfNumbers  ///< numbers, run together when written
};

/// A field of an element of adapters of the class Adapter: its kind, and the member.
template <class Adapter>
struct Field {
    Kind kind;
    int Adapter::*number = nullptr;
    zemString Adapter::*text = nullptr;
    zemArray<int> Adapter::*list = nullptr;

    constexpr Field(Kind what, int Adapter::*member) : kind(what), number(member) {}
    constexpr Field(Kind what, zemString Adapter::*member) : kind(what), text(member) {}
    constexpr Field(Kind what, zemArray<int> Adapter::*member) : kind(what), list(member) {}
};

int position(std::size_t found) {
    return found == std::string_view::npos ? kUnset : static_cast<int>(found);
}

/// zemVirtualSystemIOResource::getNextResourceProperty() without a copy.
std::string_view nextProperty(std::string_view text, int& index, char delimiter) {
    if (index < 0) {
        return {};
    }
    const std::size_t begin = std::min(static_cast<std::size_t>(index), text.size());
    if (begin < text.size() && text[begin] == '"') {
        const std::size_t end = text.find('"', begin + 1);
        if (end == std::string_view::npos) {
            throw zemInvalidParameterException(
                "zemVirtualSystemIOResource", "getNextResourceProperty", std::string(text).c_str());
        }
        index = position(text.find(delimiter, end + 1));
        return text.substr(begin + 1, end - begin - 1);
    }
    index = position(text.find(delimiter, begin));
    return index < 0 ? text.substr(begin)
                     : text.substr(begin, static_cast<std::size_t>(index) - begin);
}

/// Reads a field and steps behind it.
std::string_view takeProperty(std::string_view text, int& index, char delimiter) {
    const std::string_view property = nextProperty(text, index, delimiter);
    index += index < 0 ? 0 : 1;
    return property;
}

bool isDigits(std::string_view text) {
    return !text.empty() &&
           std::all_of(text.begin(), text.end(), [](char c) { return c >= '0' && c <= '9'; });
}

zemString stringOf(std::string_view text) {
    return zemString(text.data(), static_cast<unsigned>(text.size()));
}

void appendNumber(std::string& text, int number) {
    char digits[16];
    text.append(digits, std::to_chars(digits, digits + sizeof digits, number).ptr);
}

void appendFlag(std::string& text, int flag) {
    if (flag != kUnset) {
        text += flag != 0 ? '1' : '0';
    }
}

template <class Adapter>
void readField(Adapter& adapter, const Field<Adapter>& field, std::string_view text,
               bool& isServer) {
    switch (field.kind) {
        case Kind::text:
        case Kind::optional:
            adapter.*field.text = stringOf(text);
            break;
        case Kind::passed:
            break;
        case Kind::number:
        case Kind::flag:
            adapter.*field.number = zemNumberOf(text);
            break;
        case Kind::side:
            isServer = text == "server";
            if (isServer || text == "client") {
                adapter.*field.number = isServer ? 1 : 0;
            }
            break;
        case Kind::ofServer:
            if (isServer) {
                adapter.*field.number = zemNumberOf(text);
            }
            break;
        case Kind::remote:
        case Kind::pool:
            if (isDigits(text)) {
                adapter.*field.number = zemNumberOf(text);
            }
            break;
        case Kind::listOfNumbers:
            for (int index = 0; index >= 0;) {
                const std::string_view number = takeProperty(text, index, ',');
                if (!number.empty()) {
                    (adapter.*field.list).append(zemNumberOf(number));
                }
            }
            break;
    }
}

/// Reads an element into a fresh adapter. Fields behind those of the kind are not looked at.
template <class Adapter, std::size_t N>
void readElement(Adapter& adapter, const Field<Adapter> (&fields)[N], const char* element) {
    const std::string_view text(element);
    bool isServer = false;
    int index = 0;
    for (const Field<Adapter>& field : fields) {
        const std::string_view property = takeProperty(text, index, kDelimiter);
        if (!property.empty()) {
            readField(adapter, field, property, isServer);
        }
    }
}

template <class Adapter>
void writeField(const Adapter& adapter, const Field<Adapter>& field, std::string& text,
                bool& isServer) {
    const int number = field.number == nullptr ? kUnset : adapter.*field.number;
    switch (field.kind) {
        case Kind::text:
        case Kind::optional:
        case Kind::passed:
            text += adapter.*field.text;
            break;
        case Kind::number:
            if (number != kUnset) {
                appendNumber(text, number);
            }
            break;
        case Kind::flag:
            appendFlag(text, number);
            break;
        case Kind::side:
            isServer = number == 1;
            if (number != kUnset) {
                text += isServer ? "server" : "client";
            }
            break;
        case Kind::ofServer:
            appendFlag(text, isServer ? number : kUnset);
            break;
        case Kind::remote:
            if (number != kUnset && number != kAny) {
                appendNumber(text, number);
            } else if (isServer) {
                text += "any";
            }
            break;
        case Kind::pool:
            if (number != kUnset) {
                appendNumber(text, number);
            } else {
                text = "none";
            }
            break;
        case Kind::listOfNumbers: {
            const zemArray<int>& list = adapter.*field.list;
            const char* const quote = list.size() > 1 ? "\"" : "";
            text += quote;
            for (int i = 0; i < list.size(); ++i) {
                appendNumber(text, list[i]);
            }
            text += quote;
            break;
        }
    }
}

/// What stands in @p text already, and the element behind it.
template <class Adapter, std::size_t N>
std::string withElement(const char* before, const Adapter& adapter,
                        const Field<Adapter> (&fields)[N]) {
    std::string text(before);
    bool isServer = false;
    for (const Field<Adapter>& field : fields) {
        if (field.kind == Kind::optional && (adapter.*field.text).isEmpty()) {
            continue;
        }
        if (&field != fields) {
            text += kDelimiter;
        }
        writeField(adapter, field, text, isServer);
    }
    return text;
}

/// Gives @p adapter what it lacks and @p other has.
template <class Adapter, std::size_t N>
void mergeFields(Adapter& adapter, const Adapter& other, const Field<Adapter> (&fields)[N]) {
    for (const Field<Adapter>& field : fields) {
        if (field.number != nullptr) {
            if (adapter.*field.number == kUnset) {
                adapter.*field.number = other.*field.number;
            }
        } else if (field.text != nullptr) {
            if ((adapter.*field.text).isEmpty()) {
                adapter.*field.text = other.*field.text;
            }
        } else if ((adapter.*field.list).size() == 0) {
            adapter.*field.list = other.*field.list;
        }
    }
}

}  // namespace

zemString zemVirtualSystemIOResource::getValue() {
    if (m_strResource.isEmpty()) {
        m_strResource = refreshResourceString();
    }
    return m_strResource;
}

zemString zemVirtualSystemIOResource::getNextResourceProperty(const zemString& text, int& index,
                                                              char delimiter) {
    return stringOf(nextProperty(static_cast<const char*>(text), index, delimiter));
}

struct zemIOSlotAdapter::Form {
    using Self = zemIOSlotAdapter;
    static constexpr Field<Self> kFields[] = {
        {Kind::text, &Self::m_stringDrcIndex},
        {Kind::pool, &Self::m_iPoolId},
        {Kind::flag, &Self::m_iIsRequired},
    };
};

struct zemVirtualSerialAdapter::Form {
    using Self = zemVirtualSerialAdapter;
    static constexpr Field<Self> kFields[] = {
        {Kind::number, &Self::m_iSlotId},           {Kind::side, &Self::m_iIsServer},
        {Kind::ofServer, &Self::m_iSupportsDNX},    {Kind::remote, &Self::m_iRemoteLparId},
        {Kind::passed, &Self::m_strRemoteLparName}, {Kind::remote, &Self::m_iRemoteSlotNumber},
        {Kind::flag, &Self::m_iIsRequired},
    };
};

struct zemVirtualSCSIAdapter::Form {
    using Self = zemVirtualSCSIAdapter;
    static constexpr Field<Self> kFields[] = {
        {Kind::number, &Self::m_iSlotId},           {Kind::side, &Self::m_iIsServer},
        {Kind::remote, &Self::m_iRemoteLparId},     {Kind::passed, &Self::m_strRemoteLparName},
        {Kind::remote, &Self::m_iRemoteSlotNumber}, {Kind::flag, &Self::m_iIsRequired},
    };
};

struct zemVirtualEthernetAdapter::Form {
    using Self = zemVirtualEthernetAdapter;
    static constexpr Field<Self> kFields[] = {
        {Kind::number, &Self::m_iSlotId},        {Kind::flag, &Self::m_iIsIEEE},
        {Kind::number, &Self::m_iPortVlanId},    {Kind::listOfNumbers, &Self::m_aAdditionalVlanIds},
        {Kind::number, &Self::m_iTrunkPriority}, {Kind::flag, &Self::m_iIsRequired},
        {Kind::optional, &Self::m_vswitch},
    };
};

// What the classes do alike, each with its own fields.
#define ZEM_ADAPTER(CLASS)                                                                 \
    CLASS::CLASS(const zemString& element) { readElement(*this, Form::kFields, element); } \
    zemString CLASS::refreshResourceString() {                                             \
        m_strResource = withElement(m_strResource, *this, Form::kFields).c_str();          \
        return m_strResource;                                                              \
    }                                                                                      \
    zemSystemSetting* CLASS::clone() const { return new CLASS(*this); }
ZEM_ADAPTER(zemIOSlotAdapter)
ZEM_ADAPTER(zemVirtualSerialAdapter)
ZEM_ADAPTER(zemVirtualSCSIAdapter)
ZEM_ADAPTER(zemVirtualEthernetAdapter)
#undef ZEM_ADAPTER

void zemIOSlotAdapter::mergeWith(const zemIOSlotAdapter& other) {
    mergeFields(*this, other, Form::kFields);
    refreshResourceString();
}

void zemVirtualSerialAdapter::mergeWith(const zemVirtualSerialAdapter& other) {
    mergeFields(*this, other, Form::kFields);
    refreshResourceString();
}

void zemVirtualSCSIAdapter::mergeWith(const zemVirtualSCSIAdapter& other) {
    mergeFields(*this, other, Form::kFields);
    refreshResourceString();
}

void zemVirtualEthernetAdapter::mergeWith(const zemVirtualEthernetAdapter& other) {
    mergeFields(*this, other, Form::kFields);
}

zemIOSlotAdapter::zemIOSlotAdapter(const zemString& drcIndex, int poolId, int isRequired)
    : m_stringDrcIndex(drcIndex), m_iPoolId(poolId), m_iIsRequired(isRequired) {}

zemVirtualSerialAdapter::zemVirtualSerialAdapter(int slotId, int isServer, int supportsDNX,
                                                 int remoteLparId, const zemString& remoteLparName,
                                                 int remoteSlotNumber, int isRequired)
    : m_iSlotId(slotId),
      m_iIsServer(isServer),
      m_iSupportsDNX(supportsDNX),
      m_iRemoteLparId(remoteLparId),
      m_strRemoteLparName(remoteLparName),
      m_iRemoteSlotNumber(remoteSlotNumber),
      m_iIsRequired(isRequired) {}

zemVirtualSCSIAdapter::zemVirtualSCSIAdapter(int slotId, int isServer, int remoteLparId,
                                             const zemString& remoteLparName, int remoteSlotNumber,
                                             int isRequired)
    : m_iSlotId(slotId),
      m_iIsServer(isServer),
      m_iRemoteLparId(remoteLparId),
      m_strRemoteLparName(remoteLparName),
      m_iRemoteSlotNumber(remoteSlotNumber),
      m_iIsRequired(isRequired) {}

zemVirtualEthernetAdapter::zemVirtualEthernetAdapter(int slotId, int isIEEE, int portVlanId,
                                                     const zemArray<int>& additionalVlanIds,
                                                     int trunkPriority, int isRequired,
                                                     const zemString& vswitch)
    : m_iSlotId(slotId),
      m_iIsIEEE(isIEEE),
      m_iPortVlanId(portVlanId),
      m_aAdditionalVlanIds(additionalVlanIds),
      m_iTrunkPriority(trunkPriority),
      m_iIsRequired(isRequired),
      m_vswitch(vswitch) {}
