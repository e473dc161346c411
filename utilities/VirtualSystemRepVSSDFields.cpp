// What walks all fields of a VSSD and its RASDs: comparing and printing.

#include <cstdint>
#include <string>
#include <string_view>
#include <tuple>

#include "Log.h"
#include "VirtualSystemRepRASDFields.h"
#include "VirtualSystemRepVSSD.h"

struct zemVSSD::Fields {
    static constexpr auto all() {
        using Data = zemVSSD;
        return std::tuple{ZEM_NAMED_FIELD(m_MTMS),
                          ZEM_NAMED_FIELD(m_virtualSystemType),
                          ZEM_NAMED_FIELD(m_autoActivate),
                          ZEM_NAMED_FIELD(m_virtualSystemIdentifier),
                          ZEM_NAMED_FIELD(m_lparID),
                          ZEM_NAMED_FIELD(m_lparName),
                          ZEM_NAMED_FIELD(m_profileName),
                          ZEM_NAMED_FIELD(m_bootMode),
                          ZEM_NAMED_FIELD(m_enableConnectionMonitoring),
                          ZEM_NAMED_FIELD(m_isDefault),
                          ZEM_NAMED_FIELD(m_maxVirtualSlots),
                          ZEM_NAMED_FIELD(m_enableRedundantErrorPathReporting),
                          ZEM_NAMED_FIELD(m_keylock),
                          ZEM_NAMED_FIELD(m_defaultProfileName),
                          ZEM_NAMED_FIELD(m_IOSlotsInfo),
                          ZEM_NAMED_FIELD(m_virtualSerialAdaptersInfo),
                          ZEM_NAMED_FIELD(m_virtualSCSIAdaptersInfo),
                          ZEM_NAMED_FIELD(m_virtualEthetnetAdaptersInfo),
                          ZEM_NAMED_FIELD(m_memoryPoolNum)};
    }

    /// Whether @p name is of a field that follows from others, or from the RASDs.
    static bool follows(std::string_view name) {
        return name == "m_isDefault" || name.find("Info") != name.npos;
    }
};

namespace {

std::string textOf(const zemString& text) { return static_cast<const char*>(text); }
std::string textOf(std::int64_t number) { return std::to_string(number); }
std::string textOf(const zemArray<int>& numbers) {
    std::string text;
    for (int i = 0; i < numbers.size(); ++i) {
        text += (i == 0 ? "" : ",") + std::to_string(numbers[i]);
    }
    return text;
}

template <class Value>
void print(const std::string& label, const Value& value) {
    zemLog::LogPlain((label + textOf(value)).c_str());
}

/// @param begin,end  what stands around a field's name
template <class Data, class Fields>
void printFields(const char* begin, const Fields& fields, const Data& data) {
    std::apply(
        [&](const auto&... field) {
            (print(std::string(begin) + field.name + ':', data.*field.member), ...);
        },
        fields);
}

/// Prints the fields of one kind.
/// @return false: the RASD is of another one
template <class Rasd>
bool printKind(zemRASD* rasd) {
    const auto* kind = dynamic_cast<const Rasd*>(rasd);
    using Data = decltype(kind->m_Data);
    if (kind == nullptr || kind->m_Data.m_ResourceType != Data().m_ResourceType) {
        return false;
    }
    printFields("\t:", zemFieldsOf(kind->m_Data), kind->m_Data);
    return true;
}

}  // namespace

void zemVSSD::dumpVSSD(zemVSSD* vssd) {
    print("VSSD, id:", vssd->m_InstanceID);
    printFields("\t", Fields::all(), *vssd);
    for (int i = 0; i < vssd->m_RASDs.size(); ++i) {
        dumpRASD(vssd->m_RASDs[i]);
    }
}

void zemVSSD::dumpRASD(zemRASD* rasd) {
    const zemRASDCommData& data = *rasd->getData();
    print("Key:", rasd->getKey());
    print("\tresource type:", data.m_ResourceType);
    printFields("\t:", zemCommonFields(), data);
    if (!printKind<zemProcessorRASD>(rasd) && !printKind<zemMemoryRASD>(rasd) &&
        !printKind<zemIOSlotRASD>(rasd) && !printKind<zemVSCSIRASD>(rasd) &&
        !printKind<zemVSERIALRASD>(rasd) && !printKind<zemVETHRASD>(rasd)) {
        zemLog::LogPlain("=====resource type error.");
    }
}

bool zemVSSD::equalvssd(const zemVSSD* vssd) const {
    return vssd != nullptr && m_InstanceID == vssd->m_InstanceID &&
           std::apply(
               [&](const auto&... field) {
                   return ((this->*field.member == vssd->*field.member) && ...);
               },
               Fields::all());
}

bool zemVSSD::hasSettingsOf(const zemVSSD& vssd) const {
    // A RASD compares only as many elements of its lists as it has: both are asked.
    const auto haveSame = [](zemRASD* mine, zemRASD* other) {
        return mine->equals(other) && other->equals(mine);
    };
    bool same = m_InstanceID == vssd.m_InstanceID && m_RASDs.size() == vssd.m_RASDs.size() &&
                std::apply(
                    [&](const auto&... field) {
                        return ((Fields::follows(field.name) ||
                                 this->*field.member == vssd.*field.member) &&
                                ...);
                    },
                    Fields::all());
    for (int i = 0; same && i < m_RASDs.size(); ++i) {
        same = haveSame(m_RASDs[i], vssd.m_RASDs[i]);
    }
    return same;
}

bool zemVSSD::equals(const zemVSSD* vssd) const {
    if (!equalvssd(vssd) || m_RASDs.size() != vssd->m_RASDs.size()) {
        return false;
    }
    for (int i = 0; i < m_RASDs.size(); ++i) {
        if (!m_RASDs[i]->equals(vssd->m_RASDs[i])) {
            return false;
        }
    }
    return true;
}
