#include "JobProgress.h"

#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>

#include "EndSignals.h"

namespace cimom {

namespace {

// Numbers of the schema.
constexpr std::uint64_t kJobStarted = 4096;
constexpr std::uint64_t kCompleted = 7;  ///< of CIM_ConcreteJob.JobState
constexpr std::uint64_t kException = 10;
constexpr std::uint16_t kTerminate = 4;  ///< of its RequestStateChange
constexpr std::uint16_t kKill = 5;

constexpr int kFirstPause = 50;  ///< in milliseconds
constexpr int kLongestPause = 1000;

/// A number without a sign; @p otherwise for anything else.
std::uint64_t numberOr(std::uint64_t otherwise, const Value* value) {
    Value number;
    return value && value->convertTo(CMPI_uint64, number) && !number.isNull() ? number.uint()
                                                                              : otherwise;
}

std::string textOf(const Instance& job, const char* property) {
    const Value* value = job.properties.find(property);
    return value && !value->isNull() && value->type() == CMPI_string ? value->text() : "";
}

/// A line that is written over until the end.
class ProgressLine {
public:
    ~ProgressLine() {
        if (m_shown) {
            std::fputs("\r\033[K", stderr);
        }
    }

    void show(const Instance& job) {
        using std::chrono::seconds;
        const auto worked =
            std::chrono::duration_cast<seconds>(std::chrono::steady_clock::now() - m_begin);
        if (!m_terminal || worked < seconds(1)) {
            return;
        }
        std::string line = "\r\033[K" + textOf(job, "Name") + ": ";
        const Value* percent = job.properties.find("PercentComplete");
        if (percent && !percent->isNull()) {
            line += std::to_string(numberOr(0, percent)) + " %, ";
        }
        std::fprintf(stderr, "%s%lld s", line.c_str(), static_cast<long long>(worked.count()));
        m_shown = true;
    }

private:
    const bool m_terminal = isatty(STDERR_FILENO) != 0;
    const std::chrono::steady_clock::time_point m_begin = std::chrono::steady_clock::now();
    bool m_shown = false;
};

/// What is answered does not matter: whether the job ends shows by itself.
void askToEnd(Session& session, const ObjectPath& job, std::uint16_t state) {
    std::fprintf(stderr, "%scimom: asking the job to end%s\n",
                 isatty(STDERR_FILENO) != 0 ? "\n" : "",
                 state == kTerminate ? "; the next signal has it killed" : " at once");
    session.server.invokeMethod(session.request, job, "RequestStateChange",
                                {{"RequestedState", Value(state)}});
}

}  // namespace

bool hasStartedJob(const Reply& method, ObjectPath& job) {
    const Value answer = method.value();
    const Value* named = method.out.find("Job");
    if (numberOr(0, &answer) != kJobStarted || !named || named->isNull() ||
        named->type() != CMPI_ref) {
        return false;
    }
    job = named->reference();
    return true;
}

Reply awaitJob(Session& session, const ObjectPath& job) {
    EndSignals signals;
    Request request = session.request;
    request.properties = {"Name", "JobState", "PercentComplete", "ErrorDescription"};
    ProgressLine progress;
    std::uint16_t ending = kTerminate;
    for (int pause = kFirstPause;; pause = std::min(2 * pause, kLongestPause)) {
        Reply reply = session.server.getInstance(request, job);
        if (!reply.ok()) {
            reply.message = "how the job ended cannot be told: " + reply.message;
            return reply;
        }
        const Instance found = reply.instances.front();
        const std::uint64_t state = numberOr(0, found.properties.find("JobState"));
        if (state == kCompleted) {
            return {};
        }
        if (state > kCompleted && state <= kException) {
            reply.fail(CMPI_RC_ERR_FAILED, textOf(found, "ErrorDescription"));
            return reply;
        }
        progress.show(found);
        if (signals.wait(std::chrono::milliseconds(pause))) {
            askToEnd(session, job, ending);
            ending = kKill;
        }
    }
}

}  // namespace cimom
