// cimom: CIM operations from the command line, with the providers loaded into this process.

#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <iostream>
#include <mutex>
#include <thread>

#include "CommandLine.h"
#include "Failure.h"
#include "InteropMof.h"

namespace {

constexpr int kOutputError = 74;
constexpr int kSetupError = 78;

int reportOutput(int error) {
    std::fprintf(stderr, "cimom: standard output: %s\n", std::strerror(error));
    return kOutputError;
}

int reportFailure(CMPIrc rc, const std::string& message) {
    std::fprintf(stderr, "%s (%d): %s\n", cimom::statusName(rc), static_cast<int>(rc),
                 message.c_str());
    return static_cast<int>(rc);
}

void printLine(const cimom::LogLine& line, int level) {
    const bool trace = line.kind == cimom::LogLine::Kind::Trace;
    if (trace && line.level > level) {
        return;
    }
    std::fprintf(stderr, "%s %d %s: %s\n", trace ? "trace" : "log", line.level,
                 line.component.c_str(), line.text.c_str());
}

/// Tells who watches the terminal, from two seconds on, for how long the request has been working.
class Waiting {
public:
    /// @param what  the request; empty for one that lasts by its nature
    explicit Waiting(const std::string& what) {
        if (what.empty() || isatty(STDERR_FILENO) == 0) {
            return;
        }
        m_thread = std::thread([this, what] {
            std::unique_lock<std::mutex> lock(m_mutex);
            for (int seconds = 1;
                 !m_over.wait_for(lock, std::chrono::seconds(1), [this] { return m_ended; });
                 ++seconds) {
                if (seconds > 1) {
                    std::fprintf(stderr, "\r%s: %d s", what.c_str(), seconds);
                }
                m_shown = seconds > 1;
            }
            if (m_shown) {
                std::fputs("\r\033[K", stderr);
            }
        });
    }
    ~Waiting() { end(); }
    Waiting(const Waiting&) = delete;
    Waiting& operator=(const Waiting&) = delete;

    /// Takes away what it shows.
    void end() {
        if (!m_thread.joinable()) {
            return;
        }
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_ended = true;
        }
        m_over.notify_one();
        m_thread.join();
    }

private:
    std::mutex m_mutex;
    std::condition_variable m_over;
    bool m_ended = false;
    bool m_shown = false;
    std::thread m_thread;
};

int run(cimom::CommandLine& line) {
    const cimom::Verb& verb = *line.verb;
    if (line.registrations.empty() && !(verb.takes & cimom::kNoProvider)) {
        throw std::runtime_error(
            "no providers: name a registration, by --registration or CIMOM_REGISTRATION");
    }
    cimom::ResultStream out(line.providerOutput);
    if (!line.schema.empty()) {
        line.options.classes =
            cimom::ClassRepository::load(line.schema, cimom::readRegularFile,
                                         verb.takes & cimom::kServing ? cimom::interopMof() : "");
    }
    cimom::Server server(line.options);
    for (const std::string& file : line.registrations) {
        server.loadRegistration(file);
    }
    // A provider of indications can say what is wrong in its log alone.
    if (line.traceLevel >= 0 || verb.takes & (cimom::kFilter | cimom::kServing)) {
        server.setLogHook(
            [level = line.traceLevel](const cimom::LogLine& each) { printLine(each, level); });
    }
    const bool lean = line.options.character == cimom::Character::Lean;
    cimom::Session session{server,
                           line.request,
                           line.options.classes.get(),
                           lean ? cimom::Unfit::Kept : cimom::Unfit::Refused,
                           line.format,
                           out};
    const std::string what = line.arguments.name.empty() ? verb.name : line.arguments.name;
    Waiting waiting(verb.takes & (cimom::kFilter | cimom::kServing) ? "" : what);
    out.beforeFirstWrite([&] { waiting.end(); });
    try {
        const cimom::Reply reply = verb.run(session, line.arguments);
        waiting.end();
        if (!reply.ok()) {
            return reportFailure(reply.rc, reply.message);
        }
        return out.failure() == 0 ? 0 : reportOutput(out.failure());
    } catch (const cimom::Failure& failure) {
        waiting.end();
        return reportFailure(failure.rc(), failure.what());
    }
}

int runCommandLine(int argc, char** argv) {
    cimom::CommandLine line;
    if (const std::optional<int> status = cimom::readCommandLine(argc, argv, line)) {
        return *status != 0 || std::cout.flush() ? *status : reportOutput(errno);
    }
    return run(line);
}

}  // namespace

int main(int argc, char** argv) {
    // A reader that goes away ends the output, not the providers; a handler, unlike SIG_IGN, is
    // not passed on to the tools that they start.
    std::signal(SIGPIPE, [](int) {});
    try {
        return runCommandLine(argc, argv);
    } catch (const std::exception& error) {
        std::fprintf(stderr, "cimom: %s\n", error.what());
    }
    return kSetupError;
}
