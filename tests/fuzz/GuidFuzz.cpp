// Any text is either zero or an identifier whose own text reads back as the same identifier.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>

#include "Guid.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string input(data, data + size);
    const zemGuid guid(input.c_str());
    const zemString text = guid.toString();
    const bool formed = text.length() == 36 && text.count('-') == 4;
    if (!formed || !(zemGuid(text) == guid) ||
        (std::strlen(input.c_str()) != 36 && !(guid == zemGuid()))) {
        std::abort();
    }
    return 0;
}
