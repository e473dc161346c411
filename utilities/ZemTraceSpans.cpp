#include "ZemTraceSpans.h"

#include <libxml/chvalid.h>
#include <libxml/parserInternals.h>
#include <libxml/xmlstring.h>

#include <algorithm>
#include <charconv>
#include <cstring>
#include <deque>
#include <unordered_map>
#include <utility>

namespace {

constexpr char kLineMark[] = "+++";

/// No line of the trace is as long: the kernel bounds the command that it tells of.
constexpr std::size_t kLongestLine = 1U << 20U;
/// Providers are not nested as deep. What lies further out was not ended, and is forgotten.
constexpr std::size_t kDeepest = 64;
/// Later ticks are no time, and sums of earlier ones lose nothing in JSON.
constexpr std::uint64_t kLatestTick = std::uint64_t{1} << 53U;

struct LoggerKind {
    std::string_view logger;
    zemTraceKind kind;
};
/// Loggers of all other names time operations.
constexpr LoggerKind kKinds[] = {
    {"callGenericCommand", zemTraceKind::Tool},
    {"zemApiCaller", zemTraceKind::Api},
    {"brokerCaller", zemTraceKind::Broker},
};

zemTraceKind kindOf(std::string_view logger) {
    const auto* const row = std::find_if(std::begin(kKinds), std::end(kKinds),
                                         [&](const LoggerKind& k) { return k.logger == logger; });
    return row == std::end(kKinds) ? zemTraceKind::Operation : row->kind;
}

// -- lines --------------------------------------------------------------------------------------

bool take(std::string_view& text, std::string_view front) {
    if (text.substr(0, front.size()) != front) {
        return false;
    }
    text.remove_prefix(front.size());
    return true;
}

bool takeBack(std::string_view& text, std::string_view back) {
    if (text.size() < back.size() || text.substr(text.size() - back.size()) != back) {
        return false;
    }
    text.remove_suffix(back.size());
    return true;
}

template <class Number>
bool takeNumber(std::string_view& text, Number& number) {
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    text.remove_prefix(static_cast<std::size_t>(end - text.data()));
    return error == std::errc();
}

bool takeTick(std::string_view& text, std::uint64_t& tick) {
    return takeNumber(text, tick) && tick <= kLatestTick;
}

/// "<logger>-<text> begin at <tick>."; the text may hold any of these words itself.
bool readMark(std::string_view rest, zemTraceLine& line) {
    constexpr std::string_view kAt = " at ";
    const std::size_t at = rest.rfind(kAt);
    if (at == std::string_view::npos || !take(rest, line.logger) || !take(rest, "-")) {
        return false;
    }
    const std::size_t head = line.logger.size() + 1;
    if (at < head) {
        return false;
    }
    std::string_view tick = rest.substr(at - head + kAt.size());
    line.text = rest.substr(0, at - head);
    line.what = takeBack(line.text, " begin") ? zemTraceLine::What::Begin : zemTraceLine::What::End;
    return (line.what == zemTraceLine::What::Begin || takeBack(line.text, " end")) &&
           takeTick(tick, line.tick) && tick == ".";
}

}  // namespace

std::optional<zemTraceLine> zemReadTraceLine(std::string_view text) {
    zemTraceLine line{};
    if (!take(text, kLineMark)) {
        return std::nullopt;
    }
    line.logger = text.substr(0, text.find(':'));
    if (line.logger.empty() || !take(text, line.logger) || !take(text, ":") ||
        !takeNumber(text, line.thread)) {
        return std::nullopt;
    }
    bool isRead = false;
    if (take(text, " ")) {
        isRead = readMark(text, line);
    } else {
        line.what = zemTraceLine::What::Log;
        isRead = take(text, ",") && takeTick(text, line.tick) && take(text, ", ") &&
                 take(text, line.logger) && take(text, ",");
    }
    return isRead ? std::optional(line) : std::nullopt;
}

// -- texts --------------------------------------------------------------------------------------

namespace {

/// Length of the character of UTF-8 at the beginning of a text, if both a terminal and XML can
/// show it; else 0. The parser takes sequences that nobody may write, hence the way back.
std::size_t shownLength(std::string_view text) {
    int length = static_cast<int>(std::min<std::size_t>(text.size(), 4));
    const int code = xmlGetUTF8Char(reinterpret_cast<const xmlChar*>(text.data()), &length);
    if (code < ' ' || (code >= 0x7F && code < 0xA0) || !xmlIsCharQ(code)) {
        return 0;
    }
    xmlChar written[8] = {};
    const auto size = static_cast<std::size_t>(xmlCopyCharMultiByte(written, code));
    return std::memcmp(written, text.data(), std::min(size, text.size())) == 0 ? size : 0;
}

std::string printable(std::string_view text) {
    std::string out;
    while (!text.empty()) {
        const std::size_t length = shownLength(text);
        out.append(length == 0 ? "?" : text.substr(0, length));
        text.remove_prefix(std::max<std::size_t>(length, 1));
    }
    return out;
}

/// Each different text once.
class Texts {
public:
    std::size_t numberOf(std::string_view text) {
        const auto known = m_numbers.find(text);
        if (known != m_numbers.end()) {
            return known->second;
        }
        m_printable.push_back(printable(text));
        return m_numbers.emplace(m_texts.emplace_back(text), m_numbers.size()).first->second;
    }
    std::vector<std::string> handOver() { return std::move(m_printable); }

private:
    std::deque<std::string> m_texts;
    std::vector<std::string> m_printable;
    std::unordered_map<std::string_view, std::size_t> m_numbers;
};

struct OperationKey {
    std::string_view provider;
    std::string_view subject;
    std::int64_t number = -1;
};

/// "<provider>-<class> <number>", with "-4" behind the provider in the outer layer of getInstance;
/// or the provider alone.
OperationKey splitKey(std::string_view key) {
    const std::size_t blank = key.rfind(' ');
    const std::string_view head = key.substr(0, blank);
    const std::size_t dash = head.rfind('-');
    OperationKey parts{head.substr(0, dash), head.substr(dash + 1)};
    std::string_view number = key.substr(std::min(head.size() + 1, key.size()));
    if (dash == std::string_view::npos || !takeNumber(number, parts.number) || !number.empty()) {
        return {key, key};
    }
    takeBack(parts.provider, "-4");
    if (parts.subject.empty()) {
        parts.subject = parts.provider;
    }
    return parts;
}

// -- spans --------------------------------------------------------------------------------------

class Builder {
public:
    void take(std::string_view text);
    zemTrace finish();

private:
    static constexpr std::uint64_t kUnended = std::numeric_limits<std::uint64_t>::max();

    void begin(const zemTraceLine& line);
    void end(const zemTraceLine& line);
    bool isInnerLayer(const zemTraceSpan& span) const;

    struct Open {
        std::size_t span;
        std::string text;
    };

    zemTrace m_trace;
    Texts m_texts;
    std::unordered_map<int, std::vector<Open>> m_open;  ///< by thread, innermost last
};

void Builder::take(std::string_view text) {
    ++m_trace.lines;
    const std::optional<zemTraceLine> line = zemReadTraceLine(text);
    if (!line) {
        ++m_trace.unreadable;
        if (m_trace.firstUnreadable == 0) {
            m_trace.firstUnreadable = m_trace.lines;
        }
    } else if (line->what == zemTraceLine::What::Begin) {
        begin(*line);
    } else if (line->what == zemTraceLine::What::End) {
        end(*line);
    } else {
        ++m_trace.notes;
    }
}

void Builder::begin(const zemTraceLine& line) {
    std::vector<Open>& open = m_open[line.thread];
    if (open.size() == kDeepest) {
        open.erase(open.begin());
    }
    zemTraceSpan span{};
    span.kind = kindOf(line.logger);
    span.thread = line.thread;
    span.begin = line.tick;
    span.end = kUnended;
    span.parent = open.empty() ? kZemNoSpan : open.back().span;
    span.name = m_texts.numberOf(line.logger);
    const OperationKey key = span.kind == zemTraceKind::Operation
                                 ? splitKey(line.text)
                                 : OperationKey{line.text, line.text};
    span.subject = m_texts.numberOf(key.subject);
    span.provider = m_texts.numberOf(key.provider);
    span.number = key.number;
    open.push_back({m_trace.spans.size(), std::string(line.text)});
    m_trace.spans.push_back(span);
}

// What is still open within it has lost its end: enumerations that fail tell none.
void Builder::end(const zemTraceLine& line) {
    std::vector<Open>& open = m_open[line.thread];
    const std::size_t name = m_texts.numberOf(line.logger);
    const auto found = std::find_if(open.rbegin(), open.rend(), [&](const Open& one) {
        return m_trace.spans[one.span].name == name && one.text == line.text;
    });
    if (found == open.rend()) {
        ++m_trace.unbegun;
        return;
    }
    zemTraceSpan& span = m_trace.spans[found->span];
    if (line.tick < span.begin) {
        ++m_trace.unbegun;  // the clock was set back
    } else {
        span.end = line.tick;
    }
    open.erase(found.base() - 1, open.end());
}

// getInstance calls its inner layer through the provider's slot, and each writes its lines.
bool Builder::isInnerLayer(const zemTraceSpan& span) const {
    if (span.kind != zemTraceKind::Operation || span.parent == kZemNoSpan) {
        return false;
    }
    const zemTraceSpan& outer = m_trace.spans[span.parent];
    return outer.name == span.name && outer.provider == span.provider &&
           outer.subject == span.subject;
}

// What was not ended goes, and what lies within it belongs to what is around it. Parents stand
// before their children, so one pass does, over spans that move to the front as it goes.
zemTrace Builder::finish() {
    std::vector<std::size_t> now(m_trace.spans.size());  // where each span, or what replaced it, is
    std::size_t kept = 0;
    for (std::size_t i = 0; i < m_trace.spans.size(); ++i) {
        zemTraceSpan span = m_trace.spans[i];
        span.parent = span.parent == kZemNoSpan ? kZemNoSpan : now[span.parent];
        const bool isUnended = span.end == kUnended;
        m_trace.unended += isUnended ? 1 : 0;
        if (isUnended || isInnerLayer(span)) {
            now[i] = span.parent;
        } else {
            now[i] = kept;
            m_trace.spans[kept++] = span;
        }
    }
    m_trace.spans.resize(kept);
    m_trace.texts = m_texts.handOver();
    return std::move(m_trace);
}

}  // namespace

zemTrace zemReadTrace(std::istream& in) {
    Builder builder;
    std::string buffer(kLongestLine, '\0');
    while (in.getline(buffer.data(), static_cast<std::streamsize>(buffer.size())) ||
           in.gcount() > 0) {
        auto length = static_cast<std::size_t>(in.gcount());
        if (in.fail() && !in.eof() && !in.bad()) {  // too long
            in.clear();
            in.ignore(std::numeric_limits<std::streamsize>::max(), '\n');
            length = 0;
        } else if (!in.eof()) {
            --length;  // the newline
        }
        builder.take(std::string_view(buffer).substr(0, length));
    }
    return builder.finish();
}
