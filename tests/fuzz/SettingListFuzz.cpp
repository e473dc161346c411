// Any text is read as the lists and numbers of a profile. Slots come out as many as the list has
// elements that are not empty, each under its first field, as long as no quotes stand in it; quotes
// that are not closed are refused; no number turns negative by being large.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>

#include "Exception.h"
#include "VirtualSystemVisitor.h"

namespace {

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

void checkSlots(const std::string& list, zemVSSD& vssd) {
    int at = 0;
    std::istringstream all(list);
    for (std::string one; std::getline(all, one, ',');) {
        if (!one.empty()) {
            auto* slot = dynamic_cast<zemIOSlotRASD*>(vssd.getRASDs().getElementAt(at++));
            require(slot != nullptr &&
                    slot->m_Data.m_DRCIndex == one.substr(0, one.find('/')).c_str());
        }
    }
    require(at == vssd.getRASDs().size());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text = std::string(reinterpret_cast<const char*>(data), size).c_str();
    const zemString list(text.c_str());
    for (const int type : {6, 10, 12, 21}) {
        zemVSSD vssd;
        bool isRefused = false;
        try {
            zemVSSDVisitor::createIORASDs(list, type, &vssd);
        } catch (const zemOperationFailedException&) {
            isRefused = true;
        } catch (const zemInvalidParameterException&) {
            continue;  // quotes within an element
        }
        require(isRefused == (std::count(text.begin(), text.end(), '"') % 2 != 0));
        const bool isNone =
            zemString::equalsIgnoreCase(list, "none") || zemString::equalsIgnoreCase(list, "null");
        if (type == 12 && !isNone && text.find('"') == std::string::npos) {
            checkSlots(text, vssd);
        }
    }
    zemPartitionProcessorResource source;
    source.setCurrProcMode("0");
    source.setRunProcs(list);
    source.setRunProcUnits(list);
    zemCEC host;
    zemProcessorRASD rasd;
    zemVSSDVisitor(&host, "").getProcessorRASDData(&source, &rasd.m_Data);
    require((rasd.m_Data.m_VirtualQuantity < 0) <= (text.find('-') != std::string::npos));
    require((rasd.m_Data.m_Reservation < 0) <= (text.find('-') != std::string::npos));
    return 0;
}
