// Any text is read as an element of each kind, or refused for quotes that are not closed. What is
// written reads and writes as the same again, and a merge fills up what lacks, once. A newline
// parts the text from the one merged with.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <optional>
#include <string>

#include "Exception.h"
#include "VirtualSystemResourceAdapters.h"

namespace {

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

template <class Adapter>
std::optional<Adapter> read(const std::string& element) {
    try {
        return Adapter{zemString(element.c_str())};
    } catch (const zemInvalidParameterException& e) {
        require(element.find('"') != std::string::npos &&
                element.find(e.getExceptionString()) != std::string::npos);
        return {};
    }
}

template <class Adapter>
std::string formOf(Adapter adapter) {
    return std::string(adapter.getValue());
}

template <class Adapter>
Adapter merged(Adapter adapter, const Adapter& source) {
    adapter.mergeWith(source);
    return adapter;
}

template <class Adapter>
void check(const std::string& element, const std::string& other) {
    const std::optional<Adapter> adapter = read<Adapter>(element);
    const std::optional<Adapter> source = read<Adapter>(other);
    if (!adapter) {
        return;
    }
    const std::string form = formOf(*adapter);
    require(formOf(merged(*adapter, *adapter)) == form);
    // A slot without a pool is written without its index.
    if ((element + form).find('"') == std::string::npos && form.rfind("none/", 0) != 0) {
        require(formOf(*read<Adapter>(form)) == form);
    }
    if (source) {
        const Adapter once = merged(*adapter, *source);
        const std::string filled = formOf(once), again = formOf(merged(once, *source));
        require(again == filled || again == filled + filled);  // some append what they have
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string input = std::string(data, data + size).c_str();
    const std::size_t newline = std::min(input.find('\n'), input.size());
    const std::string element = input.substr(0, newline);
    const std::string other = newline < input.size() ? input.substr(newline + 1) : "";
    check<zemIOSlotAdapter>(element, other);
    check<zemVirtualSerialAdapter>(element, other);
    check<zemVirtualSCSIAdapter>(element, other);
    check<zemVirtualEthernetAdapter>(element, other);
    return 0;
}
