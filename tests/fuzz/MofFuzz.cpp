// Any text is either refused with MofError, or makes classes that print as MOF which makes the
// same classes again.

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>

#include "ClassRepository.h"

namespace {

using cimom::ClassRepository;

const char* const kMain = "#pragma include(\"qualifiers\")\n#pragma include(\"input\")\n";
const char* const kQualifiers = R"(
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
Qualifier Description : string = null, Scope(any), Flavor(Translatable);
Qualifier EmbeddedInstance : string, Scope(property, method, parameter);
Qualifier In : boolean = true, Scope(parameter);
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
Qualifier Max : uint32, Scope(any), Flavor(Restricted);
Qualifier Override : string, Scope(property, method), Flavor(Restricted);
Qualifier Values : string[], Scope(any);
)";
constexpr std::size_t kQualifierCount = 8;

std::shared_ptr<const ClassRepository> load(const std::string& input) {
    return ClassRepository::load("main", [&](const std::string& path) -> std::string {
        if (path == "main") {
            return kMain;
        }
        if (path == "qualifiers") {
            return kQualifiers;
        }
        if (path == "input") {
            return input;
        }
        throw std::runtime_error("no such file");
    });
}

std::string print(const ClassRepository& classes) {
    std::string all;
    for (const auto& cls : classes.classes()) {
        all += classes.toMof(*cls);
    }
    return all;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::shared_ptr<const ClassRepository> classes;
    try {
        classes = load(std::string(data, data + size));
    } catch (const cimom::MofError&) {
        return 0;
    }
    const std::string printed = print(*classes);
    // Types of qualifiers are not printed, so classes that need others than ours stop here.
    if (classes->qualifierTypes().size() != kQualifierCount) {
        return 0;
    }
    const std::string again = print(*load(printed));
    if (printed != again) {
        std::fprintf(stderr, "first:\n%s\nagain:\n%s\n", printed.c_str(), again.c_str());
        std::abort();
    }
    return 0;
}
