// Whatever a file of the timing trace holds, each line is counted, spans lie behind those around
// them and do not end before they begin, and reports and pictures of them are JSON and XML.

#include <libxml/parser.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>
#include <vector>

#include "ZemTraceReport.h"
#include "ZemTraceTimeline.h"

namespace {

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

bool isXml(const std::string& text) {
    xmlDoc* document = xmlReadMemory(text.data(), static_cast<int>(text.size()), nullptr, nullptr,
                                     XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING);
    xmlFreeDoc(document);
    return document != nullptr;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::istringstream in(std::string(data, data + size));
    const zemTrace trace = zemReadTrace(in);
    require(trace.unreadable + trace.notes + trace.unbegun + trace.unended <= trace.lines);
    for (std::size_t i = 0; i < trace.spans.size(); ++i) {
        const zemTraceSpan& span = trace.spans[i];
        require(span.begin <= span.end && (span.parent == kZemNoSpan || span.parent < i));
    }
    const zemTraceReport report = zemReportOf(trace, true);
    require(!zemReportText(trace, report).empty() && !zemReportJson(trace, report).empty());
    const std::vector<zemTraceRequest> requests = zemRequestsOf(trace);
    require(requests.empty() || isXml(zemTimelineSvg(trace, requests[zemSlowest(requests)])));
    return 0;
}
