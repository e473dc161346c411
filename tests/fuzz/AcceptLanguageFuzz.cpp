// Whatever a client accepts, it becomes a locale name or nothing.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "ServerInFuzz.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    cimom::Request request;
    request.language = std::string(reinterpret_cast<const char*>(data), size).c_str();
    cimom::RequestScope scope(fuzzServer(), request);
    const std::string locale(static_cast<const char*>(
        zemBaseProvider::getExternalLanguageName(CmpiContext(scope.context()))));
    if (locale.empty()) {
        return 0;
    }
    const std::string encoding = ".UTF-8";
    const std::size_t end = locale.size() - encoding.size();
    if (locale.size() < 3 + encoding.size() || locale.substr(end) != encoding ||
        locale.find_first_of("-,;") < end) {
        std::abort();
    }
    return 0;
}
