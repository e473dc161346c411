// The appliance's command-line tools: one program, called by the name of the tool.
//
// An answer is composed as a whole before any of it is written, so that a failing tool leaves
// standard output empty.

#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>

#include "Query.h"

namespace {

using namespace appliance;

void writeAll(const std::string& text) {
    for (std::size_t done = 0; done < text.size();) {
        const ssize_t written = write(STDOUT_FILENO, text.data() + done, text.size() - done);
        if (written < 0 && errno == EINTR) continue;
        if (written < 0) throw Failure(Fault::Output, {std::strerror(errno)});
        done += static_cast<std::size_t>(written);
    }
}

}  // namespace

int main(int, char** argv) {
    // A reader that went away shows as a failing write instead of ending the tool silently.
    std::signal(SIGPIPE, SIG_IGN);
    const Language language = languageOfEnvironment();
    try {
        const std::string program = argv[0] == nullptr ? "" : argv[0];
        const Tool tool = toolNamed(program.substr(program.rfind('/') + 1));
        writeAll(answer(tool, argv + 1, language));
        return 0;
    } catch (const Failure& failure) {
        std::fprintf(stderr, "%s\n", failure.text(language).c_str());
        return failure.exitStatus();
    } catch (const std::exception& damage) {
        const Failure failure(Fault::StateUnusable, {"appliance.db", damage.what()});
        std::fprintf(stderr, "%s\n", failure.text(language).c_str());
        return failure.exitStatus();
    }
}
