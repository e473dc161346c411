// The program "zemtrace": shows what the timing trace of providers tells.

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstring>
#include <exception>
#include <fstream>
#include <iostream>
#include <optional>
#include <stdexcept>
#include <string>

#include "ZemTraceReport.h"
#include "ZemTraceSpans.h"
#include "ZemTraceTimeline.h"

namespace {

constexpr int kExitNothing = 1;
constexpr int kExitUsage = 2;
constexpr int kExitFile = 3;
constexpr int kExitOutput = 4;

constexpr const char* kFooter =
    "Environment:\n"
    "  VM_CIMPROVIDER_TRACE        lets a process with providers write the trace, when it is set\n"
    "  VM_CIMPROVIDER_TRACE_PATH   the file that it writes, and that is read here when none is\n"
    "                              named; else /tmp/CIMTestPerfData.txt\n"
    "\n"
    "Examples:\n"
    "  VM_CIMPROVIDER_TRACE=1 VM_CIMPROVIDER_TRACE_PATH=/tmp/trace cimom serve &\n"
    "  zemtrace report /tmp/trace\n"
    "  zemtrace timeline /tmp/trace -o slowest.svg\n"
    "\n"
    "Exit status: 0 done, 1 the trace has nothing of what was asked for, 2 wrong command line,\n"
    "3 file not read, 4 output not written.";

struct Failure : std::runtime_error {
    Failure(int exitStatus, const std::string& text) : runtime_error(text), status(exitStatus) {}
    int status;
};

struct Options {
    std::string file = "/tmp/CIMTestPerfData.txt";
    bool byClass = false;
    bool asJson = false;
    bool slowest = false;
    std::optional<std::size_t> request;
    std::string output;
};

zemTrace readFile(const std::string& path) {
    std::ifstream file;
    errno = 0;
    if (path != "-") {
        file.open(path, std::ios::binary);
    }
    std::istream& in = path == "-" ? std::cin : file;
    zemTrace trace;
    if (in) {
        trace = zemReadTrace(in);
    }
    if (path != "-" && (!file.is_open() || file.bad())) {
        throw Failure(kExitFile, path + ": " + std::strerror(errno) +
                                     "; name the file that VM_CIMPROVIDER_TRACE_PATH named for the "
                                     "process with the providers");
    }
    return trace;
}

/// The trace, which must have work in it.
zemTrace readWork(const std::string& path) {
    zemTrace trace = readFile(path);
    if (trace.spans.empty()) {
        throw Failure(kExitNothing,
                      path + ": no work that was begun and ended in " +
                          std::to_string(trace.lines) +
                          " lines; is it a trace? One of a process that runs is written fifty "
                          "lines at a time, and what is left when it ends is lost");
    }
    return trace;
}

void printReport(const Options& options) {
    const zemTrace trace = readWork(options.file);
    const zemTraceReport report = zemReportOf(trace, options.byClass);
    std::cout << (options.asJson ? zemReportJson(trace, report) : zemReportText(trace, report));
}

std::vector<zemTraceRequest> requestsOf(const zemTrace& trace, const Options& options) {
    std::vector<zemTraceRequest> requests = zemRequestsOf(trace);
    if (requests.empty()) {
        throw Failure(kExitNothing, options.file + ": no operation of a provider in it");
    }
    return requests;
}

void listRequests(const Options& options) {
    const zemTrace trace = readWork(options.file);
    std::cout << zemRequestsText(trace, requestsOf(trace, options));
}

void drawTimeline(const Options& options) {
    const zemTrace trace = readWork(options.file);
    const std::vector<zemTraceRequest> requests = requestsOf(trace, options);
    const std::size_t number = options.request ? *options.request : zemSlowest(requests) + 1;
    if (number == 0 || number > requests.size()) {
        throw Failure(kExitNothing, "no request " + std::to_string(number) + ": there are 1 to " +
                                        std::to_string(requests.size()) +
                                        ", see zemtrace requests " + options.file);
    }
    const std::string svg = zemTimelineSvg(trace, requests[number - 1]);
    if (options.output.empty()) {
        std::cout << svg;
        return;
    }
    std::ofstream out(options.output, std::ios::binary);
    out << svg;
    out.close();
    if (!out) {
        throw Failure(kExitOutput, options.output + ": " + std::strerror(errno));
    }
}

void addVerbs(CLI::App& app, Options& options) {
    CLI::App* report = app.add_subcommand(
        "report",
        "Show how long operations, tools and calls of the management library took,\n"
        "and the share of tools, of calls and of the rest in each operation.");
    report->callback([&options] { printReport(options); });
    report->add_flag("--by-class", options.byClass, "A row for each class of an operation");
    report->add_flag("--json", options.asJson, "An object of JSON, times in microseconds");
    CLI::App* requests = app.add_subcommand(
        "requests", "List the requests with their numbers, in the order of their begin.");
    requests->callback([&options] { listRequests(options); });
    CLI::App* timeline = app.add_subcommand(
        "timeline",
        "Draw one request, and what other threads did meanwhile, as a picture (SVG).\n"
        "Without an option: the request that took longest.");
    timeline->callback([&options] { drawTimeline(options); });
    CLI::Option* slowest =
        timeline->add_flag("--slowest", options.slowest, "The request that took longest");
    timeline->add_option("--request", options.request, "The request of this number in the list")
        ->excludes(slowest);
    timeline->add_option("-o,--output", options.output, "File to write; else standard output");
    for (CLI::App* verb : {report, requests, timeline}) {
        verb->add_option("file", options.file, "File of the trace; - for standard input")
            ->envname("VM_CIMPROVIDER_TRACE_PATH")
            ->capture_default_str();
        verb->footer(kFooter);
    }
}

int run(int argc, char** argv) {
    CLI::App app{
        "Shows where the time of CIM operations went, out of the timing trace that providers "
        "write."};
    app.name("zemtrace");
    app.footer(kFooter);
    app.require_subcommand(0, 1);  // with one at least, a mistyped one would not be named
    app.set_version_flag("--version", "zemtrace " ZEM_VERSION);
    Options options;
    addVerbs(app, options);
    try {
        app.parse(argc, argv);
        if (app.get_subcommands().empty()) {
            throw CLI::RequiredError::Subcommand(1);
        }
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? 0 : kExitUsage;
    }
    std::cout.flush();
    if (!std::cout) {
        throw Failure(kExitOutput, "standard output: it cannot be written");
    }
    return 0;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        return run(argc, argv);
    } catch (const Failure& failure) {
        std::cerr << "zemtrace: " << failure.what() << '\n';
        return failure.status;
    } catch (const std::exception& error) {
        std::cerr << "zemtrace: " << error.what() << '\n';
        return kExitFile;
    }
}
