// Any text is an object path or is refused whole; what the server refuses comes as its status.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "Exception.h"
#include "ServerInFuzz.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    cimom::RequestScope scope(fuzzServer());
    const std::string input(reinterpret_cast<const char*>(data), size);
    const zemString text(input.c_str());
    try {
        const CmpiObjectPath path = zemBaseProvider::createObjectPath(text);
        const cimom::ObjectPath read = cimom::RequestScope::read(path.getEnc());
        const auto commas = static_cast<std::size_t>(text.count(','));
        if (read.host.find('/') != std::string::npos ||
            read.className.find('.') != std::string::npos || read.keys.size() > commas + 1) {
            std::abort();
        }
        zemBaseProvider::objectPathToString(path);
    } catch (const zemInvalidParameterException& e) {
        if (text != e.getExceptionString()) {
            std::abort();
        }
    } catch (const CmpiStatus&) {
        // A name that the server takes for none.
    }
    return 0;
}
