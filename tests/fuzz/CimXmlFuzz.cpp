// Any text is refused as no request, or answered by a document; an instance in it that can be read
// is written so that it reads as the same again.

#include <cstdint>
#include <cstdlib>
#include <string>

#include "CimXmlService.h"
#include "CimXmlWriter.h"
#include "Failure.h"

namespace {

constexpr const char* kMof = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
Qualifier EmbeddedInstance : string = null, Scope(property, parameter, method);
[Association] class A { [Key] string Name; uint8 Size; datetime Since; real32 Share; char16 Letter; A REF Other; A REF Another;
          string Tags[]; [EmbeddedInstance("A")] string Part;
          uint32 Do([EmbeddedInstance("A")] string Parts[], A REF Thing, boolean Flag); };
)";

struct Served {
    std::shared_ptr<const cimom::ClassRepository> classes =
        cimom::ClassRepository::load("a.mof", [](const std::string&) { return kMof; });
    cimom::Server server{{cimom::Character::Full, "", {}, classes}};
    cimom::CimXmlService service{server, classes.get(), cimom::Unfit::Refused};
};

std::string written(const cimom::Instance& instance) {
    std::string out;
    cimom::writeInstance(out, instance);
    return out;
}

void checkInstances(const cimom::XmlElement& element) {
    for (const cimom::XmlElement& each : element.children) {
        checkInstances(each);
    }
    if (element.name != "INSTANCE") {
        return;
    }
    cimom::CimXmlReader reader(nullptr, cimom::Unfit::Kept);
    std::string first;
    try {
        first = written(reader.instance(element));
    } catch (const std::exception&) {  // a Failure, or no request
        return;
    }
    if (written(reader.instance(cimom::parseXml(first))) != first) {
        std::abort();
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static Served served;
    cimom::HttpRequest request;
    request.method = "POST";
    request.body.assign(reinterpret_cast<const char*>(data), size);
    try {
        const cimom::CimXmlCall call = cimom::readCimXmlCall(request.body);
        checkInstances(*call.document);
        request.header = [&](const char* name) -> const char* {
            const std::string_view wanted(name);
            return wanted == "CIMOperation" ? "MethodCall"
                   : wanted == "CIMMethod"  ? call.name.c_str()
                   : wanted == "CIMObject"  ? call.nameSpace.c_str()
                                            : nullptr;
        };
        const cimom::HttpAnswer answer = served.service.answer(request);
        std::string body;
        while (answer.next && answer.next(body)) {
        }
        if (answer.status == 200) {
            cimom::parseXml(body);
        }
    } catch (const cimom::CimXmlFault&) {
        // No request.
    }
    return 0;
}
