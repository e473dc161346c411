#include "ZemTraceTimeline.h"

#include <libxml/xmlwriter.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <ctime>
#include <initializer_list>
#include <map>
#include <memory>
#include <new>
#include <numeric>
#include <set>
#include <unordered_map>
#include <utility>

#include "ZemTraceReport.h"

namespace {

/// A server needs less between two providers that it asks for one request, a client more between
/// two requests.
constexpr std::uint64_t kPause = 1000;

using Provided = std::pair<std::size_t, std::size_t>;  ///< provider and class

bool isWithin(const zemTrace& trace, const zemTraceSpan& span, zemTraceKind kind) {
    for (std::size_t i = span.parent; i != kZemNoSpan; i = trace.spans[i].parent) {
        if (trace.spans[i].kind == kind) {
            return true;
        }
    }
    return false;
}

std::string dayAndTime(std::uint64_t tick) {
    const auto seconds = static_cast<std::time_t>(tick / 1000000);
    std::tm parts{};
    gmtime_r(&seconds, &parts);
    char day[64], text[96];
    std::strftime(day, sizeof day, "%Y-%m-%d %H:%M:%S", &parts);
    std::snprintf(text, sizeof text, "%s.%06u", day, static_cast<unsigned>(tick % 1000000));
    return text;
}

/// What a request is called: its operation, and the class, or the first of them.
std::string nameOf(const zemTrace& trace, const zemTraceRequest& request) {
    const zemTraceSpan& first = trace.spans[request.parts.front()];
    std::string name = trace.text(first.name) + ' ' + trace.text(first.subject);
    const bool isOneClass =
        std::all_of(request.parts.begin(), request.parts.end(),
                    [&](std::size_t i) { return trace.spans[i].subject == first.subject; });
    if (!isOneClass) {
        name += " ...";
    }
    return name;
}

/// How often and how long the parts of a request were in tools, or in calls.
struct Share {
    std::size_t count = 0;
    double time = 0;
};

}  // namespace

// -- requests -----------------------------------------------------------------------------------

std::vector<zemTraceRequest> zemRequestsOf(const zemTrace& trace) {
    struct Last {
        std::size_t request;
        std::set<Provided> asked;
    };
    std::vector<zemTraceRequest> requests;
    std::unordered_map<int, Last> lastOfThread;
    for (std::size_t i = 0; i < trace.spans.size(); ++i) {
        const zemTraceSpan& span = trace.spans[i];
        if (span.parent != kZemNoSpan || span.kind != zemTraceKind::Operation) {
            continue;
        }
        const Provided asked{span.provider, span.subject};
        const auto found = lastOfThread.find(span.thread);
        if (found != lastOfThread.end()) {
            zemTraceRequest& last = requests[found->second.request];
            if (trace.spans[last.parts.front()].name == span.name && span.begin >= last.end &&
                span.begin - last.end <= kPause && found->second.asked.insert(asked).second) {
                last.parts.push_back(i);
                last.end = span.end;
                continue;
            }
        }
        lastOfThread[span.thread] = {requests.size(), {asked}};
        requests.push_back({{i}, span.begin, span.end});
    }
    std::stable_sort(requests.begin(), requests.end(),
                     [](const zemTraceRequest& one, const zemTraceRequest& other) {
                         return one.begin < other.begin;
                     });
    return requests;
}

std::size_t zemSlowest(const std::vector<zemTraceRequest>& requests) {
    const auto slowest =
        std::max_element(requests.begin(), requests.end(),
                         [](const zemTraceRequest& one, const zemTraceRequest& other) {
                             return one.time() < other.time();
                         });
    return static_cast<std::size_t>(slowest - requests.begin());
}

std::string zemRequestsText(const zemTrace& trace, const std::vector<zemTraceRequest>& requests) {
    std::string text;
    for (std::size_t i = 0; i < requests.size(); ++i) {
        const zemTraceRequest& request = requests[i];
        char line[128];
        std::snprintf(line, sizeof line, "%6zu  %s  %11s ms  %3zu  ", i + 1,
                      dayAndTime(request.begin).c_str(),
                      zemMilliseconds(static_cast<double>(request.time())).c_str(),
                      request.parts.size());
        text += line + nameOf(trace, request) + '\n';
    }
    return "number  begin (UTC)                        time  parts  name\n" + text;
}

// -- picture ------------------------------------------------------------------------------------

namespace {

constexpr double kWidth = 1200;
constexpr double kLeft = 24;
constexpr double kRight = 24;
constexpr double kChart = kWidth - kLeft - kRight;
constexpr double kRow = 22;       ///< of bars
constexpr double kBar = 19;       ///< a row without the gap to the next
constexpr double kLine = 18;      ///< of text
constexpr double kColumn = 6.75;  ///< of a character in the bars' font, at most
constexpr double kLeastBar = 1;   ///< what is shorter is drawn as wide, or hidden by its neighbour

constexpr std::size_t kMostThreads = 12;
constexpr std::size_t kMostRows = 16;  ///< of a thread
constexpr std::size_t kMostListed = 8;

constexpr const char* kStyle =
    "\n.page{fill:#ffffff}.grid{stroke:#d9dde2}.rule{stroke:#8a929b}"
    "\ntext{fill:#1f2429;font:12px 'DejaVu Sans Mono','Liberation Mono',Menlo,Consolas,monospace}"
    "\n.title{font-size:17px;font-weight:bold}.dim{fill:#5d666f}.bar text{fill:#15191d;"
    "font-size:11px}"
    "\n.bar rect{stroke:#15191d;stroke-opacity:.3;stroke-width:.6}"
    "\n.operation{fill:#a9bfd6}.broker{fill:#c9b5e6}.tool{fill:#f2b75c}.api{fill:#82cba5}"
    "\n@media (prefers-color-scheme:dark){.page{fill:#15191d}.grid{stroke:#323a42}"
    "\n.rule{stroke:#77808a}text{fill:#e4e8ec}.dim{fill:#a3adb7}}\n";

struct KindWords {
    const char* style;
    const char* legend;
};
/// In the order of zemTraceKind.
constexpr KindWords kKindWords[] = {
    {"operation", "operation of a provider"},
    {"broker", "call of the server"},
    {"tool", "tool"},
    {"api", "API call"},
};

const KindWords& wordsOf(zemTraceKind kind) { return kKindWords[static_cast<std::size_t>(kind)]; }

/// What a piece of work is called in its bar. Associations are told apart by their providers; the
/// others' are called like their class.
std::string nameOf(const zemTrace& trace, const zemTraceSpan& span) {
    const std::string& subject = trace.text(span.subject);
    const std::string& provider = trace.text(span.provider);
    const bool isOfClass = provider.compare(0, subject.size(), subject) == 0;
    return span.kind == zemTraceKind::Operation
               ? trace.text(span.name) + ' ' + (isOfClass ? subject : provider)
               : subject;
}

using Attributes = std::initializer_list<std::pair<const char*, std::string>>;

std::string number(double value) {
    char text[64];
    std::snprintf(text, sizeof text, "%.1f", value);
    return text;
}

/// Elements of a document, in memory. The library escapes; texts are UTF-8 without characters that
/// XML cannot hold.
class Document {
public:
    Document()
        : m_buffer(xmlBufferCreate(), xmlBufferFree),
          m_writer(xmlNewTextWriterMemory(m_buffer.get(), 0), xmlFreeTextWriter) {
        need(m_writer != nullptr);
        need(xmlTextWriterStartDocument(m_writer.get(), nullptr, "UTF-8", nullptr) >= 0);
    }

    void open(const char* name, Attributes attributes) {
        need(xmlTextWriterStartElement(m_writer.get(), chars(name)) >= 0);
        for (const auto& [attribute, value] : attributes) {
            need(xmlTextWriterWriteAttribute(m_writer.get(), chars(attribute),
                                             chars(value.c_str())) >= 0);
        }
    }
    void close() { need(xmlTextWriterEndElement(m_writer.get()) >= 0); }

    void element(const char* name, Attributes attributes, const std::string& text = "") {
        open(name, attributes);
        if (!text.empty()) {
            need(xmlTextWriterWriteString(m_writer.get(), chars(text.c_str())) >= 0);
        }
        close();
        need(xmlTextWriterWriteString(m_writer.get(), chars("\n")) >= 0);
    }

    void text(double x, double y, const char* style, const std::string& text,
              const char* anchor = "start") {
        element("text",
                {{"x", number(x)}, {"y", number(y)}, {"class", style}, {"text-anchor", anchor}},
                text);
    }
    void line(double x1, double y1, double x2, double y2, const char* style) {
        element("line", {{"x1", number(x1)},
                         {"y1", number(y1)},
                         {"x2", number(x2)},
                         {"y2", number(y2)},
                         {"class", style}});
    }
    void box(double x, double y, double width, double height, const char* style) {
        element("rect", {{"x", number(x)},
                         {"y", number(y)},
                         {"width", number(width)},
                         {"height", number(height)},
                         {"class", style}});
    }

    std::string end() {
        need(xmlTextWriterEndDocument(m_writer.get()) >= 0);
        return reinterpret_cast<const char*>(xmlBufferContent(m_buffer.get()));
    }

private:
    static const xmlChar* chars(const char* text) { return reinterpret_cast<const xmlChar*>(text); }
    static void need(bool done) {
        if (!done) {
            throw std::bad_alloc();
        }
    }

    std::unique_ptr<xmlBuffer, decltype(&xmlBufferFree)> m_buffer;
    std::unique_ptr<xmlTextWriter, decltype(&xmlFreeTextWriter)> m_writer;
};

/// The work of one thread while the request ran.
struct Lane {
    int thread = 0;
    std::vector<std::pair<std::size_t, std::size_t>> bars;  ///< span, and its row
    std::size_t rows = 0;
};

class Picture {
public:
    Picture(const zemTrace& trace, const zemTraceRequest& request)
        : m_trace(trace), m_request(request), m_time(std::max<std::uint64_t>(request.time(), 1)) {}

    std::string draw();

private:
    void gatherLanes();
    void gatherLongest();
    double height() const;
    double lanesHeight() const;

    void drawHead();
    void drawAxis();
    void drawLanes();
    void drawLane(const Lane& lane, double top);
    void drawBar(const zemTraceSpan& span, double top, double& drawnTo);
    void drawLongest();

    std::string whole(const zemTraceSpan& span) const;
    double xOf(std::uint64_t tick) const;

    const zemTrace& m_trace;
    const zemTraceRequest& m_request;
    const std::uint64_t m_time;
    std::vector<Lane> m_lanes;  ///< the request's own first
    std::size_t m_otherThreads = 0;
    std::vector<std::size_t> m_longest;
    Share m_tool, m_api;
    Document m_svg;
    double m_y = 0;
};

std::string Picture::draw() {
    gatherLanes();
    gatherLongest();
    m_svg.open("svg", {{"xmlns", "http://www.w3.org/2000/svg"},
                       {"width", number(kWidth)},
                       {"height", number(height())},
                       {"viewBox", "0 0 " + number(kWidth) + ' ' + number(height())}});
    m_svg.element("style", {}, kStyle);
    m_svg.box(0, 0, kWidth, height(), "page");
    drawHead();
    drawAxis();
    drawLanes();
    drawLongest();
    m_svg.close();
    return m_svg.end();
}

void Picture::gatherLanes() {
    std::vector<std::size_t> rows(m_trace.spans.size());
    std::map<int, std::size_t> laneOf;
    m_lanes.push_back({m_trace.spans[m_request.parts.front()].thread, {}, 0});
    laneOf[m_lanes.front().thread] = 0;
    for (std::size_t i = 0; i < m_trace.spans.size(); ++i) {
        const zemTraceSpan& span = m_trace.spans[i];
        rows[i] = span.parent == kZemNoSpan ? 0 : rows[span.parent] + 1;
        if (span.begin >= m_request.end || span.end <= m_request.begin) {
            continue;
        }
        const auto [lane, isNew] = laneOf.try_emplace(span.thread, m_lanes.size());
        if (isNew) {
            m_lanes.push_back({span.thread, {}, 0});
        }
        Lane& of = m_lanes[lane->second];
        if (rows[i] < kMostRows) {
            of.bars.emplace_back(i, rows[i]);
            of.rows = std::max(of.rows, rows[i] + 1);
        }
    }
    m_otherThreads = m_lanes.size() - 1;
    m_lanes.resize(std::min(m_lanes.size(), kMostThreads));
}

void Picture::gatherLongest() {
    for (const auto& [i, row] : m_lanes.front().bars) {
        const zemTraceSpan& span = m_trace.spans[i];
        const bool isTool = span.kind == zemTraceKind::Tool;
        if ((!isTool && span.kind != zemTraceKind::Api) ||
            isWithin(m_trace, span, zemTraceKind::Tool) ||
            isWithin(m_trace, span, zemTraceKind::Api)) {
            continue;
        }
        Share& share = isTool ? m_tool : m_api;
        ++share.count;
        share.time += static_cast<double>(span.time());
        m_longest.push_back(i);
    }
    std::stable_sort(m_longest.begin(), m_longest.end(), [this](std::size_t one, std::size_t two) {
        return m_trace.spans[one].time() > m_trace.spans[two].time();
    });
    m_longest.resize(std::min(m_longest.size(), kMostListed));
}

// -- parts of the picture -----------------------------------------------------------------------

constexpr double kHead = 118;   ///< title, what it is made of, legend, axis
constexpr double kLabel = 22;   ///< of a lane
constexpr double kAfter = 10;   ///< a lane
constexpr double kMargin = 16;  ///< below all

double Picture::lanesHeight() const {
    return std::accumulate(m_lanes.begin(), m_lanes.end(), 0.0, [](double sum, const Lane& lane) {
        return sum + kLabel + kRow * static_cast<double>(lane.rows) + kAfter;
    });
}

double Picture::height() const {
    const auto listed = static_cast<double>(m_longest.empty() ? 0 : m_longest.size() + 2);
    const double more = m_otherThreads >= kMostThreads ? kLine : 0;
    return kHead + lanesHeight() + more + listed * kLine + kMargin;
}

double Picture::xOf(std::uint64_t tick) const {
    const std::uint64_t shown = std::clamp(tick, m_request.begin, m_request.begin + m_time);
    return kLeft +
           kChart * static_cast<double>(shown - m_request.begin) / static_cast<double>(m_time);
}

void Picture::drawHead() {
    const auto time = static_cast<double>(m_request.time());
    const std::string took = ": " + zemMilliseconds(time) + " ms";
    m_svg.element("title", {}, nameOf(m_trace, m_request) + took);
    constexpr std::size_t kTitleColumns = 90;
    m_svg.text(kLeft, 32, "title", zemFitted(nameOf(m_trace, m_request), kTitleColumns) + took);
    const double own = std::max(0.0, time - m_tool.time - m_api.time);
    char made[512];
    std::snprintf(made, sizeof made,
                  "%s UTC; providers: %zu; tools: %zu, %s ms; API calls: %zu, %s ms; own: %s ms",
                  dayAndTime(m_request.begin).c_str(), m_request.parts.size(), m_tool.count,
                  zemMilliseconds(m_tool.time).c_str(), m_api.count,
                  zemMilliseconds(m_api.time).c_str(), zemMilliseconds(own).c_str());
    m_svg.text(kLeft, 54, "dim", made);
    double x = kLeft;
    for (const KindWords& kind : kKindWords) {
        m_svg.box(x, 66, 14, 12, kind.style);
        m_svg.text(x + 20, 76, "", kind.legend);
        x += 20 + 7.4 * static_cast<double>(std::char_traits<char>::length(kind.legend)) + 28;
    }
}

/// A round step of the axis, so that there are about ten.
double stepOf(double milliseconds) {
    const double least = milliseconds / 12;
    const double power = std::pow(10, std::floor(std::log10(least)));
    for (const double factor : {1.0, 2.0, 5.0}) {
        if (factor * power >= least) {
            return factor * power;
        }
    }
    return 10 * power;
}

void Picture::drawAxis() {
    const double all = static_cast<double>(m_time) / 1000;
    const double step = stepOf(all);
    const double bottom = kHead + lanesHeight();
    for (int i = 0; i * step <= all * (1 + 1e-9); ++i) {
        const double x = kLeft + kChart * i * step / all;
        m_svg.line(x, kHead - 8, x, bottom, "grid");
        char text[64];
        std::snprintf(text, sizeof text, "%.10g%s", i * step, i == 0 ? " ms" : "");
        m_svg.text(x, kHead - 13, "dim", text,
                   i == 0                     ? "start"
                   : x > kWidth - kRight - 20 ? "end"
                                              : "middle");
    }
    m_svg.line(kLeft, kHead - 8, kWidth - kRight, kHead - 8, "rule");
}

void Picture::drawLanes() {
    m_y = kHead;
    for (const Lane& lane : m_lanes) {
        const std::string what =
            &lane == &m_lanes.front() ? "this request, on thread " : "meanwhile, on thread ";
        m_svg.text(kLeft, m_y + 14, "dim", what + std::to_string(lane.thread));
        drawLane(lane, m_y + kLabel);
        m_y += kLabel + kRow * static_cast<double>(lane.rows) + kAfter;
    }
    if (m_otherThreads >= kMostThreads) {
        m_y += kLine;
        m_svg.text(kLeft, m_y - 4, "dim",
                   "and on " + std::to_string(m_otherThreads - kMostThreads + 1) + " more threads");
    }
}

void Picture::drawLane(const Lane& lane, double top) {
    std::vector<double> drawnTo(lane.rows, 0);
    for (const auto& [i, row] : lane.bars) {
        drawBar(m_trace.spans[i], top + kRow * static_cast<double>(row), drawnTo[row]);
    }
}

void Picture::drawBar(const zemTraceSpan& span, double top, double& drawnTo) {
    const double x = xOf(span.begin);
    const double end = std::max(xOf(span.end), x + kLeastBar);
    if (end <= drawnTo + kLeastBar / 2) {
        return;
    }
    drawnTo = end;
    m_svg.open("g", {{"class", "bar"}});
    m_svg.element("title", {}, whole(span));
    m_svg.box(x, top, end - x, kBar, wordsOf(span.kind).style);
    constexpr double kInset = 4;
    const double room = (end - x - 2 * kInset) / kColumn;
    constexpr double kLeastName = 6;
    const std::string name =
        room < kLeastName ? "" : zemFitted(nameOf(m_trace, span), static_cast<std::size_t>(room));
    if (!name.empty()) {
        m_svg.text(x + kInset, top + 13.5, "", name);
    }
    m_svg.close();
}

std::string Picture::whole(const zemTraceSpan& span) const {
    const bool isEarlier = span.begin < m_request.begin;
    const std::uint64_t from =
        isEarlier ? m_request.begin - span.begin : span.begin - m_request.begin;
    std::string text = m_trace.text(span.name) + ' ' + m_trace.text(span.subject);
    if (span.provider != span.subject) {
        text += ", " + m_trace.text(span.provider);
    }
    if (span.number >= 0) {
        text += ", number " + std::to_string(span.number);
    }
    return text + '\n' + zemMilliseconds(static_cast<double>(span.time())) + " ms, from " +
           (isEarlier ? "-" : "") + zemMilliseconds(static_cast<double>(from)) + " ms";
}

void Picture::drawLongest() {
    if (m_longest.empty()) {
        return;
    }
    m_y += 1.5 * kLine;
    m_svg.text(kLeft, m_y, "dim", "longest tools and calls: ms taken, ms from the beginning, what");
    for (const std::size_t i : m_longest) {
        const zemTraceSpan& span = m_trace.spans[i];
        m_y += kLine;
        const auto from = static_cast<double>(span.begin) - static_cast<double>(m_request.begin);
        m_svg.text(kLeft + 76, m_y, "", zemMilliseconds(static_cast<double>(span.time())), "end");
        m_svg.text(kLeft + 160, m_y, "", zemMilliseconds(from), "end");
        m_svg.box(kLeft + 176, m_y - 10, 12, 12, wordsOf(span.kind).style);
        constexpr std::size_t kListedColumns = 128;
        m_svg.text(kLeft + 196, m_y, "", zemFitted(nameOf(m_trace, span), kListedColumns));
    }
}

}  // namespace

std::string zemTimelineSvg(const zemTrace& trace, const zemTraceRequest& request) {
    return Picture(trace, request).draw();
}
