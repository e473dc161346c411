// Any list of capability words, and any runtime word, sets what a reader finds that takes the steps
// one by one: the brackets off, cut at commas, 32 words. The runtime word stands behind the first
// newline of the input.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>

#include "VirtualSystemRep.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string input(data, data + size);
    const std::size_t end = input.find('\n');
    const std::string list = input.substr(0, end).c_str();  // up to a NUL, as texts end
    const std::string runtime = end == std::string::npos ? "" : input.substr(end + 1).c_str();

    std::string words[32];
    std::istringstream elements(list.size() < 2 ? "" : list.substr(1, list.size() - 2));
    for (std::string& word : words) {
        std::getline(elements, word, ',');
    }
    const auto isSet = [](const std::string& word, unsigned long long bit) {
        return (std::strtoull(word.c_str(), nullptr, 10) & bit) != 0;
    };

    zemCEC host;
    host.setCapability(list.c_str(), runtime.c_str());
    const zemCECCapability& found = host.getCapability();
    if (found.m_virtualIoServerCapable != isSet(words[0], 8) ||
        found.m_redundantErrPathReportingCapable != isSet(words[0], 32) ||
        found.m_osq00Capable != (isSet(words[0], 64) && isSet(runtime, 1U << 30)) ||
        found.m_virtualSwitchCapable != isSet(words[1], 1) ||
        found.m_activeLparMobilityCapable != isSet(words[1], 32) ||
        found.m_inactiveLparMobilityCapable != isSet(words[1], 64) ||
        found.m_lparProcCompatModes != (isSet(words[2], 16) ? "1" : "0") ||
        found.m_lparSuspendCapable != isSet(words[5], 16)) {
        std::abort();
    }
    return 0;
}
