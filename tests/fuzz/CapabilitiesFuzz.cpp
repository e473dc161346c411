// Any list of capability words, and any runtime word behind the first newline of the input, is read
// without harm, and the same again by a host that has been told other words before.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "VirtualSystemRep.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string input(data, data + size);
    const std::size_t end = std::min(input.find('\n'), input.size());
    const std::string list = input.substr(0, end), runtime = input.substr(end);
    zemCEC first, second;
    first.setCapability(list.c_str(), runtime.c_str());
    second.setCapability("[255,255,255,255,255,255]", "4294967295");
    second.setCapability(list.c_str(), runtime.c_str());
    const zemCECCapability &a = first.getCapability(), &b = second.getCapability();
    if (a.m_osq00Capable != b.m_osq00Capable || a.m_lparSuspendCapable != b.m_lparSuspendCapable ||
        a.m_lparProcCompatModes != b.m_lparProcCompatModes) {
        std::abort();
    }
    return 0;
}
