// Any text is taken apart as an instance ID without harm, and IDs formed of any names give back
// what they were formed of, as far as their form tells it. Lists of slots and adapters of any text
// are walked to their end. Input: lines of host, profile, partition, resource; then a list.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <sstream>
#include <string>

#include "Exception.h"
#include "QyplatCmdCaller.h"
#include "VirtualSystemRep.h"

namespace {

void expect(bool holds) {
    if (!holds) {
        std::abort();
    }
}

bool contains(const std::string& text, const char* part) {
    return text.find(part) != std::string::npos;
}

/// @param whole  the IDs have no other reading
void formAndTakeApart(zemVSSD& vssd, const std::string& resource, bool isState, bool whole) {
    const zemString id = vssd.GenerateInstanceID(isState);
    expect(vssd.isState() == isState);
    if (whole) {
        const zemVSSD read(vssd.getMTMS(), id);
        expect(read.getLparID() == vssd.getLparID());
        expect(isState || read.getProfileName() == vssd.getProfileName());
    }
    for (const int type : {3, 4, 6, 10, 12, 21}) {
        const std::string key = std::to_string(type) + '-' + resource;
        const std::unique_ptr<zemRASD> made(zemVSSD::createRASD(type, key.c_str()));
        const std::unique_ptr<zemRASD> read(zemVSSD::createRASD(type, ""));
        read->setInstanceID(made->getInstanceID(true, &vssd), vssd.getMTMS());
        expect(read->getInstanceID(false, nullptr) == made->getInstanceID(false, nullptr));
        if (type == 12 && !contains(resource + std::string(vssd.getLparID()), "-")) {
            expect(read->getKey() == made->getKey() + "*" + vssd.getLparID());
        } else if (type < 5) {
            expect(read->getKey() == made->getKey());
        }
        const std::unique_ptr<zemRASD> copy(made->clone());
        expect(copy->equals(made.get()));
    }
}

void takeApart(const zemString& mtms, const zemString& text) {
    try {
        const zemVSSD vssd(mtms, text);
        expect(vssd.getLparID().length() + vssd.getProfileName().length() <= text.length());
    } catch (const zemInvalidParameterException&) {
    }
    for (const int type : {3, 4, 6, 10, 12, 21}) {
        const std::unique_ptr<zemRASD> rasd(zemVSSD::createRASD(type, text));
        rasd->setInstanceID(text, mtms);
        expect(rasd->getInstanceID(false, nullptr) == text);
    }
}

void walk(zemVSSD& vssd, const std::string& list) {
    using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;
    zemRecordType record;
    record.insert(Profile::ATTR_IO_SLOTS, list.c_str());
    record.insert(Profile::ATTR_VIRTUAL_ETH_ADAPTERS, list.c_str());
    zemCEC cec(vssd.getMTMS(), "");
    zemLPAR lpar(vssd.getMTMS(), vssd.getLparID());
    for (const char* kind : {"IOSlotAdapter", "EthernetAdapter"}) {
        zemVSSD walked(&lpar, record);
        const std::string className = std::string("ORXC_") + kind + "RASettingData";
        walked.initializeDefined("", vssd.getProfileName(), &cec, &lpar, className.c_str(), 34);
        std::size_t slashes = 0;
        for (const char c : list) {
            slashes += c == '/' ? 1 : 0;
        }
        expect(static_cast<std::size_t>(walked.getRASDSet().size()) <= slashes);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::istringstream input(std::string(data, data + size));
    std::string mtms, profile, lpar, resource, list;
    std::getline(input, mtms);
    std::getline(input, profile);
    std::getline(input, lpar);
    std::getline(input, resource);
    std::getline(input, list, '\0');
    for (std::string* text : {&mtms, &profile, &lpar, &resource}) {
        *text = text->c_str();  // up to a NUL, as these texts end
    }
    zemVSSD vssd(mtms.c_str(), lpar.c_str(), profile.c_str());
    const std::string end = '*' + mtms;
    const bool once = (profile + '-' + lpar + end).find(end) == profile.size() + 1 + lpar.size();
    for (const bool isState : {true, false}) {
        const std::string id = std::string(vssd.GenerateInstanceID(isState));
        const bool whole =
            once && id.find(end) == id.size() - end.size() && (isState || !contains(lpar, "-"));
        formAndTakeApart(vssd, resource, isState, whole);
    }
    for (const std::string* text : {&profile, &resource, &list}) {
        takeApart(mtms.c_str(), text->c_str());
        takeApart(mtms.c_str(), ("ORX:2*" + *text + end).c_str());
    }
    walk(vssd, list);
    return 0;
}
