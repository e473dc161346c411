// What zemtrace tells of a trace: rows of the report, requests, and the picture's structure.
#include <gtest/gtest.h>
#include <libxml/parser.h>
#include <libxml/xpath.h>
#include <libxml/xpathInternals.h>

#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "ZemTraceReport.h"
#include "ZemTraceTimeline.h"

namespace {

constexpr unsigned long long kStart = 1795460304822000;

/// Lines of a trace, from lines "<thread> <microseconds> + <logger> <text>" to begin, with "-" to
/// end, and others as they are.
std::string traceOf(const std::string& script) {
    std::istringstream in(script);
    std::string trace;
    for (std::string row; std::getline(in, row);) {
        std::istringstream words(row);
        std::string thread, mark, logger, text;
        unsigned long long time = 0;
        words >> thread >> time >> mark >> logger >> std::ws;
        std::getline(words, text);
        const bool isMark = mark == "+" || mark == "-";
        trace += !isMark ? row
                         : "+++" + logger + ":" + thread + " " + logger + "-" + text +
                               (mark == "+" ? " begin at " : " end at ") +
                               std::to_string(kStart + time) + ".";
        trace += '\n';
    }
    return trace;
}

zemTrace read(const std::string& script) {
    std::istringstream in(traceOf(script));
    return zemReadTrace(in);
}

/// Rows as "<name> <count> <median> <p95> <most> <total> <tool> <api>", by lines.
std::string shown(const std::vector<zemTraceRow>& rows) {
    std::ostringstream text;
    for (const zemTraceRow& row : rows) {
        text << row.name << ' ' << row.count << ' ' << row.median << ' ' << row.p95 << ' '
             << row.most << ' ' << row.total << ' ' << row.tool << ' ' << row.api << '\n';
    }
    return text.str();
}

/// An association that asks the server, and another thread meanwhile.
constexpr const char* kNested =
    "1 0 + associators AProvider-C 1\n"
    "1 10 + brokerCaller niD\n"
    "1 20 + enumInstances D-P-D 2\n"
    "2 25 + getInstance P-4-C 3\n"
    "2 26 + getInstance P-C 4\n"
    "1 30 + callGenericCommand qyplat -r sys -F \"a begin at 1. <b>\"\n"
    "2 40 - getInstance P-C 4\n"
    "1 50 - callGenericCommand qyplat -r sys -F \"a begin at 1. <b>\"\n"
    "2 55 - getInstance P-4-C 3\n"
    "1 60 - enumInstances D-P-D 2\n"
    "1 65 - brokerCaller niD\n"
    "1 70 + zemApiCaller getAllCecs\n"
    "1 75 - zemApiCaller getAllCecs\n"
    "1 100 - associators AProvider-C 1\n"
    "1 400 + associators BProvider-C 5\n"
    "1 500 - associators BProvider-C 5\n";

struct ReportRow {
    const char* what;
    std::string script;
    const char* operations;
    const char* others = "";                         ///< rows of tools and calls
    std::vector<std::size_t> counts = {0, 0, 0, 0};  ///< unreadable, notes, unended, unbegun
};

TEST(ZemTraceTest, Report) {
    std::string many;
    for (int i = 1; i <= 40; ++i) {
        many += "1 0 + op k\n1 " + std::to_string(i) + " - op k\n";
    }
    const ReportRow rows[] = {
        {"nothing", "", "", ""},
        {"nesting: shares go to all that are around; both layers of getInstance are one", kNested,
         "associators C 2 100 100 100 200 20 5\nenumInstances D 1 40 40 40 40 20 0\n"
         "getInstance C 1 30 30 30 30 0 0\n",
         "qyplat -r sys 1 20 20 20 20 20 0\ngetAllCecs 1 5 5 5 5 0 5\n"},
        {"median and p95 are times that were taken", many, "op k 40 20 38 40 820 0 0\n"},
        {"of what does not end, what is within stays",
         "1 0 + enumInstances P-C 1\n1 10 + callGenericCommand dlplat\n1 15 - callGenericCommand "
         "dlplat\n1 20 + enumInstances P-C 2\n1 30 - enumInstances P-C 2\n1 40 - op k\n"
         "1 50 + op k\n1 45 - op k\n",
         "enumInstances C 1 10 10 10 10 0 0\n",
         "dlplat 1 5 5 5 5 5 0\n",
         {0, 0, 2, 2}},
        {"lines of others",
         "+++x:1 x-k begin at 1\n++x: +++x:1 x-k begin at 1.\n+++x:1 y-k begin at 1.\n"
         "+++x:99999999999 x-k begin at 1.\n+++x:1 x-k begin at 99999999999999999999.\n"
         "+++x:1 x-k begun at 1.\n\n+++x:1,17, x,a-b,c\n+++x:1 x-+++x:1 x-k begin at 1.\n"
         "1 5 + x \xC0\x1B[1m\n1 9 - x \xC0\x1B[1m",
         "x ??[1m 1 4 4 4 4 0 0\n",
         "",
         {7, 1, 1, 0}},
    };
    for (const ReportRow& row : rows) {
        SCOPED_TRACE(row.what);
        const zemTrace trace = read(row.script);
        const zemTraceReport report = zemReportOf(trace, true);
        EXPECT_EQ(shown(report.operations), row.operations);
        EXPECT_EQ(shown(report.tools) + shown(report.calls), row.others);
        EXPECT_EQ(
            (std::vector<std::size_t>{trace.unreadable, trace.notes, trace.unended, trace.unbegun}),
            row.counts);
    }
    std::istringstream cut(traceOf(kNested).substr(9) + std::string(3U << 20U, 'x'));
    const zemTrace trace = zemReadTrace(cut);
    EXPECT_EQ(trace.lines, 17U);
    EXPECT_EQ(trace.unreadable, 2U);
    EXPECT_EQ(trace.unbegun, 1U);
}

TEST(ZemTraceTest, ReportText) {
    const zemTrace trace = read(std::string(kNested) + "garbage\n");
    EXPECT_EQ(zemReportText(trace, zemReportOf(trace, false)),
              "operation      count  median    p95    max  total  tool  API   own\n"
              "associators        2   0.100  0.100  0.100  0.200   10%   3%   88%\n"
              "enumInstances      1   0.040  0.040  0.040  0.040   50%   0%   50%\n"
              "getInstance        1   0.030  0.030  0.030  0.030    0%   0%  100%\n"
              "outermost          3   0.100  0.100  0.100  0.230    9%   2%   89%\n"
              "\n"
              "tool           count  median    p95    max  total\n"
              "qyplat -r sys      1   0.020  0.020  0.020  0.020\n"
              "\n"
              "API call    count  median    p95    max  total\n"
              "getAllCecs      1   0.005  0.005  0.005  0.005\n"
              "\n"
              "times are milliseconds; lines in the file: 17, of which could not be read: 1, the "
              "first is line 17\n");
}

TEST(ZemTraceTest, Requests) {
    struct {
        const char* what;
        std::string script;
        std::vector<std::uint64_t> times;
    } const rows[] = {
        {"providers that are asked one after another", kNested, {500, 30}},
        {"the same again is another",
         "1 0 + op P-C 1\n1 9 - op P-C 1\n1 9 + op P-C 2\n1 12 - op P-C 2\n",
         {9, 3}},
        {"so is what comes later, and what another operation does",
         "1 0 + op P-C 1\n1 9 - op P-C 1\n1 1010 + op Q-C 2\n1 1012 - op Q-C 2\n"
         "1 1013 + other R-C 3\n1 1014 - other R-C 3\n",
         {9, 2, 1}},
        {"a tool alone is none", "1 0 + callGenericCommand t\n1 9 - callGenericCommand t\n", {}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.what);
        std::vector<std::uint64_t> times;
        for (const zemTraceRequest& request : zemRequestsOf(read(row.script))) {
            times.push_back(request.time());
        }
        EXPECT_EQ(times, row.times);
    }
}

TEST(ZemTraceTest, Picture) {
    const zemTrace trace = read(kNested);
    const std::vector<zemTraceRequest> requests = zemRequestsOf(trace);
    const std::string svg = zemTimelineSvg(trace, requests[zemSlowest(requests)]);
    const std::unique_ptr<xmlDoc, decltype(&xmlFreeDoc)> document(
        xmlReadMemory(svg.data(), static_cast<int>(svg.size()), nullptr, nullptr, XML_PARSE_NONET),
        xmlFreeDoc);
    ASSERT_NE(document, nullptr);
    const std::unique_ptr<xmlXPathContext, decltype(&xmlXPathFreeContext)> context(
        xmlXPathNewContext(document.get()), xmlXPathFreeContext);
    xmlXPathRegisterNs(context.get(), reinterpret_cast<const xmlChar*>("s"),
                       reinterpret_cast<const xmlChar*>("http://www.w3.org/2000/svg"));
    const char* const kHolds[] = {
        "string(/s:svg/s:title) = 'associators C: 0.500 ms'",
        "count(//s:g[@class='bar']) = 7",
        "count(//s:g/s:rect[@class='operation']) = 4",
        // A row for each level, and the other thread below.
        "//s:g[s:rect/@class='tool']/s:rect/@y > //s:g[s:rect/@class='broker']/s:rect/@y",
        "//s:g[contains(s:title, 'getInstance')]/s:rect/@y > //s:g[s:rect/@class='tool']/s:rect/@y",
        "count(//s:text[starts-with(., 'meanwhile, on thread 2')]) = 1",
        "contains(//s:g[s:rect/@class='tool']/s:title, '1. <b>\"\n0.020 ms, from 0.030')",
        // A fifth of the chart's 1152, from its left.
        "//s:g[contains(s:title, 'BProvider')]/s:rect/@width = '230.4'",
        "//s:g[contains(s:title, 'BProvider')]/s:rect/@x = '945.6'",
        "not(//s:rect[@x < 0 or @x + @width > 1200])",
    };
    for (const char* const holds : kHolds) {
        xmlXPathObject* const result =
            xmlXPathEvalExpression(reinterpret_cast<const xmlChar*>(holds), context.get());
        EXPECT_TRUE(result != nullptr && xmlXPathCastToBoolean(result) != 0) << holds << '\n'
                                                                             << svg;
        xmlXPathFreeObject(result);
    }
}

}  // namespace
