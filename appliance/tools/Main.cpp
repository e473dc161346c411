// The appliance's command-line tools: one program, called by the name of the tool.
//
// An answer is composed as a whole before any of it is written, so that a failing tool leaves
// standard output empty.

#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>

#include "Faults.h"
#include "Help.h"
#include "Operation.h"
#include "Resource.h"

namespace {

using namespace appliance;

void writeAll(const std::string& text) {
    for (std::size_t done = 0; done < text.size();) {
        const ssize_t written = write(STDOUT_FILENO, text.data() + done, text.size() - done);
        if (written < 0 && errno == EINTR) {
            continue;
        }
        refuseIf(written < 0, Fault::Output, {std::strerror(errno)});
        done += static_cast<std::size_t>(written);
    }
}

const ToolName& toolNamed(const std::string& name) {
    for (const ToolName& tool : kToolNames) {
        if (name == tool.name) {
            return tool;
        }
    }
    throw Failure(Fault::UnknownTool, {name});
}

/// Does what was planned to go wrong with this call.
/// @return whether the tool ends here, with @p status
bool failsAsPlanned(const std::string& name, int* status) {
    const auto fault = takeFault(name);
    if (!fault) {
        return false;
    }
    pause(*fault);
    if (!fault->text.empty()) {
        std::fprintf(stderr, "%s\n", fault->text.c_str());
    }
    if (fault->signal != 0) {
        std::signal(fault->signal, SIG_DFL);
        std::raise(fault->signal);
    }
    *status = fault->code.value_or(kExitRefused);
    return fault->code || !fault->text.empty();
}

int run(const std::string& name, const char* const* arguments) {
    const ToolName& tool = toolNamed(name);
    int status = 0;
    if (failsAsPlanned(name, &status)) {
        return status;
    }
    const Request request(tool, arguments);
    if (request.has("--help")) {
        writeAll(help(tool));
    } else if (request.has("--version")) {
        writeAll(name + " " APPLIANCE_VERSION "\n");
    } else if (operationsOf(tool.tool).empty()) {
        writeAll(answer(request));
    } else {
        carryOut(request);
    }
    return 0;
}

int report(const Failure& failure, Language language) {
    std::fprintf(stderr, "%s\n", failure.text(language).c_str());
    return failure.exitStatus();
}

}  // namespace

int main(int, char** argv) {
    // A reader that went away shows as a failing write instead of ending the tool silently.
    std::signal(SIGPIPE, SIG_IGN);
    const Language language = languageOfEnvironment();
    try {
        const std::string program = argv[0] == nullptr ? "" : argv[0];
        return run(program.substr(program.rfind('/') + 1), argv + 1);
    } catch (const Failure& failure) {
        return report(failure, language);
    } catch (const std::exception& damage) {
        return report(Failure(Fault::StateUnusable, {"appliance.db", damage.what()}), language);
    }
}
