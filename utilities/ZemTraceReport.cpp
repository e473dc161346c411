#include "ZemTraceReport.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <map>
#include <nlohmann/json.hpp>
#include <utility>

namespace {

constexpr std::size_t kWidestName = 60;

// -- rows ---------------------------------------------------------------------------------------

struct Collected {
    std::vector<std::uint64_t> times;
    double tool = 0;
    double api = 0;
};
using CollectedByName = std::map<std::string, Collected>;

/// The time of spans that tools and calls within them took.
struct Within {
    double tool = 0;
    double api = 0;
};

// Children stand behind their parents.
std::vector<Within> timesWithin(const zemTrace& trace) {
    std::vector<Within> within(trace.spans.size());
    for (std::size_t i = trace.spans.size(); i-- > 0;) {
        const zemTraceSpan& span = trace.spans[i];
        const auto time = static_cast<double>(span.time());
        Within& mine = within[i];
        if (span.kind == zemTraceKind::Tool) {
            mine = {time, 0};
        } else if (span.kind == zemTraceKind::Api) {
            mine = {0, time};
        } else {  // the clock may have been set while they ran
            mine.tool = std::min(mine.tool, time);
            mine.api = std::min(mine.api, time - mine.tool);
        }
        if (span.parent != kZemNoSpan) {
            within[span.parent].tool += mine.tool;
            within[span.parent].api += mine.api;
        }
    }
    return within;
}

/// For each span whether an operation is around it.
std::vector<bool> areWithinOperations(const zemTrace& trace) {
    std::vector<bool> inner(trace.spans.size());
    for (std::size_t i = 0; i < trace.spans.size(); ++i) {
        const std::size_t parent = trace.spans[i].parent;
        inner[i] = parent != kZemNoSpan &&
                   (inner[parent] || trace.spans[parent].kind == zemTraceKind::Operation);
    }
    return inner;
}

void collect(Collected& into, const zemTraceSpan& span, const Within& within) {
    into.times.push_back(span.time());
    into.tool += within.tool;
    into.api += within.api;
}

/// The tool and what it is asked about: "qyplat -r lpar".
std::string toolName(const std::string& command) {
    const std::size_t tool = std::min(command.find(' '), command.size());
    constexpr const char* kResource = " -r ";
    if (command.compare(tool, 4, kResource) != 0) {
        return command.substr(0, tool);
    }
    return command.substr(0, command.find(' ', tool + 4));
}

zemTraceRow rowOf(const std::string& name, Collected& of) {
    std::sort(of.times.begin(), of.times.end());
    zemTraceRow row;
    row.name = name;
    row.count = of.times.size();
    row.tool = of.tool;
    row.api = of.api;
    for (const std::uint64_t time : of.times) {
        row.total += static_cast<double>(time);
    }
    if (row.count > 0) {
        row.median = of.times[(row.count - 1) / 2];
        row.p95 = of.times[(row.count * 95 + 99) / 100 - 1];
        row.most = of.times.back();
    }
    return row;
}

std::vector<zemTraceRow> rowsOf(CollectedByName& all) {
    std::vector<zemTraceRow> rows;
    for (auto& [name, collected] : all) {
        rows.push_back(rowOf(name, collected));
    }
    std::stable_sort(
        rows.begin(), rows.end(),
        [](const zemTraceRow& one, const zemTraceRow& other) { return one.total > other.total; });
    return rows;
}

std::string nameOfRow(const zemTrace& trace, const zemTraceSpan& span, bool byClass) {
    const std::string& subject = trace.text(span.subject);
    if (span.kind != zemTraceKind::Operation) {
        return span.kind == zemTraceKind::Tool ? toolName(subject) : subject;
    }
    std::string name = trace.text(span.name);
    return byClass ? name.append(" ").append(subject) : name;
}

}  // namespace

zemTraceReport zemReportOf(const zemTrace& trace, bool byClass) {
    const std::vector<Within> within = timesWithin(trace);
    const std::vector<bool> isInner = areWithinOperations(trace);
    std::map<zemTraceKind, CollectedByName> tables;
    Collected outermost;
    // Names are put together once for each pair of texts, not for each span.
    std::map<std::pair<std::size_t, std::size_t>, Collected*> known;
    for (std::size_t i = 0; i < trace.spans.size(); ++i) {
        const zemTraceSpan& span = trace.spans[i];
        const bool isOperation = span.kind == zemTraceKind::Operation;
        const bool isSplit = byClass || !isOperation;
        Collected*& collected = known[{span.name, isSplit ? span.subject : kZemNoSpan}];
        if (collected == nullptr) {
            collected = &tables[span.kind][nameOfRow(trace, span, byClass)];
        }
        collect(*collected, span, within[i]);
        if (isOperation && !isInner[i]) {
            collect(outermost, span, within[i]);
        }
    }
    return {rowsOf(tables[zemTraceKind::Operation]), rowOf("outermost", outermost),
            rowsOf(tables[zemTraceKind::Tool]), rowsOf(tables[zemTraceKind::Api])};
}

// -- text ---------------------------------------------------------------------------------------

std::string zemMilliseconds(double microseconds) {
    char text[64];
    std::snprintf(text, sizeof text, "%.3f", microseconds / 1000);
    return text;
}

// Characters beyond ASCII may be wide ones: two columns hold any.
std::size_t zemColumns(const std::string& text) {
    std::size_t columns = 0;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        columns += byte < 0x80 ? 1 : byte < 0xC0 ? 0 : 2;
    }
    return columns;
}

std::string zemFitted(const std::string& text, std::size_t columns) {
    if (zemColumns(text) <= columns) {
        return text;
    }
    constexpr std::size_t kDots = 3;
    std::size_t end = 0;
    for (std::size_t used = 0; end < text.size(); ++end) {
        used += zemColumns(text.substr(end, 1));
        if (used + kDots > columns) {
            break;
        }
    }
    return columns <= kDots ? std::string() : text.substr(0, end) + "...";
}

namespace {

using Line = std::vector<std::string>;

std::string percent(double part, double whole) {
    return whole > 0 ? std::to_string(std::lround(100 * part / whole)) + '%' : "-";
}

Line lineOf(const zemTraceRow& row, bool hasShares) {
    Line line = {zemFitted(row.name, kWidestName),
                 std::to_string(row.count),
                 zemMilliseconds(static_cast<double>(row.median)),
                 zemMilliseconds(static_cast<double>(row.p95)),
                 zemMilliseconds(static_cast<double>(row.most)),
                 zemMilliseconds(row.total)};
    if (hasShares) {
        line.insert(line.end(), {percent(row.tool, row.total), percent(row.api, row.total),
                                 percent(row.own(), row.total)});
    }
    return line;
}

/// Columns as wide as they must be: the first flush left, the others flush right.
std::string aligned(const std::vector<Line>& lines) {
    std::vector<std::size_t> widths(lines.front().size());
    for (const Line& line : lines) {
        for (std::size_t i = 0; i < line.size(); ++i) {
            widths[i] = std::max(widths[i], zemColumns(line[i]));
        }
    }
    std::string text;
    for (const Line& line : lines) {
        for (std::size_t i = 0; i < line.size(); ++i) {
            const std::string blanks(widths[i] - zemColumns(line[i]), ' ');
            text += i == 0 ? line[i] + blanks : "  " + blanks + line[i];
        }
        text += '\n';
    }
    return text;
}

std::string table(const char* name, const std::vector<zemTraceRow>& rows,
                  const zemTraceRow* outermost) {
    if (rows.empty()) {
        return "";
    }
    std::vector<Line> lines = {{name, "count", "median", "p95", "max", "total"}};
    if (outermost != nullptr) {
        lines.front().insert(lines.front().end(), {"tool", "API", "own"});
    }
    for (const zemTraceRow& row : rows) {
        lines.push_back(lineOf(row, outermost != nullptr));
    }
    if (outermost != nullptr) {
        lines.push_back(lineOf(*outermost, true));
    }
    return aligned(lines) + '\n';
}

/// What the tables were made from, and what they lack.
std::string sourceText(const zemTrace& trace) {
    std::string text = "times are milliseconds; lines in the file: " + std::to_string(trace.lines) +
                       ", of which could not be read: " + std::to_string(trace.unreadable);
    if (trace.unreadable > 0) {
        text += ", the first is line " + std::to_string(trace.firstUnreadable);
    }
    text += '\n';
    if (trace.unended > 0 || trace.unbegun > 0) {
        text += "left out: begun and not ended " + std::to_string(trace.unended) +
                ", ended and not begun " + std::to_string(trace.unbegun) + '\n';
    }
    return text;
}

using Json = nlohmann::ordered_json;

Json jsonOf(const zemTraceRow& row, bool hasShares) {
    Json json = {{"name", row.name},  {"count", row.count}, {"median_us", row.median},
                 {"p95_us", row.p95}, {"max_us", row.most}, {"total_us", row.total}};
    if (hasShares) {
        json.update({{"tool_us", row.tool}, {"api_us", row.api}, {"own_us", row.own()}});
    }
    return json;
}

Json jsonOf(const std::vector<zemTraceRow>& rows, bool hasShares) {
    Json json = Json::array();
    for (const zemTraceRow& row : rows) {
        json.push_back(jsonOf(row, hasShares));
    }
    return json;
}

}  // namespace

std::string zemReportText(const zemTrace& trace, const zemTraceReport& report) {
    return table("operation", report.operations, &report.outermost) +
           table("tool", report.tools, nullptr) + table("API call", report.calls, nullptr) +
           sourceText(trace);
}

std::string zemReportJson(const zemTrace& trace, const zemTraceReport& report) {
    const Json json = {{"operations", jsonOf(report.operations, true)},
                       {"outermost", jsonOf(report.outermost, true)},
                       {"tools", jsonOf(report.tools, false)},
                       {"api_calls", jsonOf(report.calls, false)},
                       {"lines", trace.lines},
                       {"unreadable", trace.unreadable},
                       {"first_unreadable", trace.firstUnreadable},
                       {"unended", trace.unended},
                       {"unbegun", trace.unbegun}};
    return json.dump(2) + '\n';
}
