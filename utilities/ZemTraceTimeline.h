/// The requests in a timing trace, and a picture of one across threads. Private to the program
/// zemtrace.
///
/// The trace does not say which work belongs to one request of a client. A server asks one provider
/// after another on one thread, so what follows closely there is taken as one request. Work for it
/// on other threads cannot be told from work for others: the picture has all of it.
///
/// Thread-safety: functions without state.
#ifndef ZEM_TRACE_TIMELINE_H
#define ZEM_TRACE_TIMELINE_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "ZemTraceSpans.h"

/// Operations of different providers, one after another.
struct zemTraceRequest {
    std::vector<std::size_t> parts;  ///< spans, one at least
    std::uint64_t begin;
    std::uint64_t end;

    std::uint64_t time() const { return end - begin; }
};

/// In the order of their begin.
std::vector<zemTraceRequest> zemRequestsOf(const zemTrace& trace);

/// Index of the request that took longest, of one at least.
std::size_t zemSlowest(const std::vector<zemTraceRequest>& requests);

/// A line for each, with its number from 1.
std::string zemRequestsText(const zemTrace& trace, const std::vector<zemTraceRequest>& requests);

/// A picture that stands alone, light or dark as its reader likes it: a lane for each thread, bars
/// within bars, the whole text of each where the pointer rests.
std::string zemTimelineSvg(const zemTrace& trace, const zemTraceRequest& request);

#endif
