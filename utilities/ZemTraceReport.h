/// How long operations, tools and calls of the management library took, out of a timing trace.
/// Private to the program zemtrace.
///
/// Thread-safety: functions without state.
#ifndef ZEM_TRACE_REPORT_H
#define ZEM_TRACE_REPORT_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "ZemTraceSpans.h"

/// What has one name. Times are in microseconds; median and p95 are times that were taken.
struct zemTraceRow {
    std::string name;
    std::size_t count = 0;
    std::uint64_t median = 0;
    std::uint64_t p95 = 0;
    std::uint64_t most = 0;
    double total = 0;
    double tool = 0;  ///< of an operation: its time in tools, those of operations within it too
    double api = 0;   ///< and in calls of the management library

    double own() const { return total - tool - api; }
};

/// A table a kind; rows by falling total.
struct zemTraceReport {
    std::vector<zemTraceRow> operations;
    zemTraceRow outermost;  ///< operations that are not within others: each moment counts once
    std::vector<zemTraceRow> tools;
    std::vector<zemTraceRow> calls;  ///< of the management library
};

/// @param byClass  a row for each class of an operation, in place of one for all
zemTraceReport zemReportOf(const zemTrace& trace, bool byClass);

/// For people: tables, and what could not be read.
std::string zemReportText(const zemTrace& trace, const zemTraceReport& report);
/// For programs: an object with the same.
std::string zemReportJson(const zemTrace& trace, const zemTraceReport& report);

/// "12.345", in milliseconds.
std::string zemMilliseconds(double microseconds);

/// The text, or as much of it as fits into so many columns with "..." behind it.
std::string zemFitted(const std::string& text, std::size_t columns);
/// How many columns a text takes.
std::size_t zemColumns(const std::string& text);

#endif
