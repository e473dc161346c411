// The program "appliance": makes an appliance's state, shows it and checks it, and lets tools fail.

#include <poll.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <iostream>
#include <limits>
#include <optional>

#include "Appliances.h"
#include "Check.h"
#include "Failure.h"
#include "FaultCommand.h"
#include "Json.h"
#include "Show.h"

namespace {

using namespace appliance;

constexpr const char* kFooter =
    "The state is the file appliance.db in the folder that the environment variable\n"
    "APPLIANCE_HOME names.\n"
    "\n"
    "Exit status: 0 done, 1 refused or rules broken, 2 wrong command line,\n"
    "3 state unusable, 4 output not written.";

constexpr std::int64_t kMostHosts = 65535;  ///< MAC addresses number hosts and partitions
constexpr std::int64_t kMostLpars = 65000;
constexpr std::int64_t kMostPools = 64;  ///< of which a host can have no more

/// Tells a watching person how far a long work is; says nothing before two seconds are over.
class Progress {
public:
    explicit Progress(std::int64_t total) : m_total(total) {}
    ~Progress() {
        if (m_shown) {
            std::fputc('\n', stderr);
        }
    }
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;

    void operator()(std::int64_t done) {
        const auto now = std::chrono::steady_clock::now();
        if (!m_watched || now - m_last < (m_shown ? std::chrono::milliseconds(200)
                                                  : std::chrono::milliseconds(2000))) {
            return;
        }
        m_last = now;
        m_shown = true;
        std::fprintf(stderr, "\r%lld of %lld hosts", static_cast<long long>(done),
                     static_cast<long long>(m_total));
    }

private:
    const bool m_watched = isatty(STDERR_FILENO) != 0;
    const std::int64_t m_total;
    bool m_shown = false;
    std::chrono::steady_clock::time_point m_last = std::chrono::steady_clock::now();
};

/// Fills the state anew, in one transaction: whoever reads meanwhile sees what was there before.
template <typename Fill>
void fill(bool force, Fill fillStore) {
    Store store = Store::create();
    Transaction change = store.write();
    store.clear(force);
    fillStore(store);
    change.commit();
}

void showState(const std::string& format) {
    Store store = Store::open(Database::Access::Read);
    const Transaction picture = store.read();
    std::cout << (format == "json" ? showJson(store) : showText(store));
}

/// Prints the lines behind the one with the number @p after; gives the number of the last one.
std::int64_t printJournal(Store& store, std::int64_t after, bool asJson) {
    constexpr std::int64_t kAtOnce = 1000;
    const Transaction picture = store.read();
    for (auto lines = store.journal(after, kAtOnce); !lines.empty();
         lines = store.journal(after, kAtOnce)) {
        for (const auto& [number, line] : lines) {
            std::cout << (asJson ? journalJson(number, line) : journalText(number, line));
        }
        after = lines.back().first;
    }
    return after;
}

/// Whether whoever read standard output has gone; takes @p milliseconds to find that it has not.
bool isReaderGone(int milliseconds) {
    pollfd out = {STDOUT_FILENO, 0, 0};
    return poll(&out, 1, milliseconds) > 0 && (out.revents & (POLLERR | POLLHUP)) != 0;
}

/// Prints where the journal ends, which tells the reader that nothing is missed from here on, and
/// then each line that comes, until nobody reads it.
void followJournal(std::optional<std::int64_t> after, bool asJson) {
    constexpr int kPause = 10;
    Store store = Store::open(Database::Access::Read);
    std::int64_t last = after ? *after : store.journalEnd();
    std::cout << (asJson ? "{\"number\":" + std::to_string(last) + "}\n"
                         : std::to_string(last) + '\n');
    do {
        last = printJournal(store, last, asJson);
        std::cout.flush();
    } while (std::cout && !isReaderGone(kPause));
}

void showJournal(std::optional<std::int64_t> after, bool asJson, bool follow) {
    if (follow) {
        followJournal(after, asJson);
        return;
    }
    Store store = Store::open(Database::Access::Read);
    printJournal(store, after.value_or(0), asJson);
}

int checkState() {
    Store store = Store::open(Database::Access::Read);
    const Transaction picture = store.read();
    const std::vector<std::string> findings = check(store);
    for (const std::string& finding : findings) {
        std::cout << finding << '\n';
    }
    return findings.empty() ? 0 : kExitRefused;
}

struct Options {
    bool force = false, asJson = false, follow = false;
    Size size{3, 10, 1};
    std::string format = "text";
    std::optional<std::int64_t> after;
    FaultOptions fault;
    int status = 0;  ///< what a verb that did its work ends with
};

void addMakers(CLI::App& app, Options& options) {
    CLI::App* init = app.add_subcommand(
        "init", "Make the demo appliance: four hosts in four states, fourteen partitions.");
    init->callback([&options] { fill(options.force, fillDemo); });
    CLI::App* generate = app.add_subcommand(
        "generate", "Make an appliance of any size; the same options always make the same one.");
    Size& size = options.size;
    generate->callback([&options, &size] {
        Progress progress(size.hosts);
        fill(options.force, [&](Store& store) { fillGenerated(store, size, std::ref(progress)); });
    });
    for (CLI::App* maker : {init, generate}) {
        maker->add_flag("--force", options.force, "Replace an appliance that is there already");
    }
    generate->add_option("--hosts", size.hosts, "How many hosts")
        ->check(CLI::Range(std::int64_t{0}, kMostHosts))
        ->capture_default_str();
    generate->add_option("--lpars", size.lpars, "How many partitions each host has")
        ->check(CLI::Range(std::int64_t{0}, kMostLpars))
        ->capture_default_str();
    generate->add_option("--pools", size.pools, "How many shared processor pools each host has")
        ->check(CLI::Range(std::int64_t{1}, kMostPools))
        ->capture_default_str();
    generate->add_option("--seed", size.seed, "Start of the random choices")->capture_default_str();
}

void addReaders(CLI::App& app, Options& options) {
    CLI::App* show = app.add_subcommand("show", "Show hosts and partitions.");
    show->callback([&options] { showState(options.format); });
    show->add_option("--format", options.format, "text, or json with every attribute that was set")
        ->check(CLI::IsMember({"text", "json"}))
        ->capture_default_str();
    CLI::App* journal = app.add_subcommand(
        "journal", "Show the journal of changes, each with its number: oldest first.");
    journal->callback([&options] { showJournal(options.after, options.asJson, options.follow); });
    journal->add_option("--after", options.after, "Only changes behind the one with this number")
        ->check(CLI::NonNegativeNumber);
    journal->add_flag("--json", options.asJson, "A JSON object in a line for each change");
    journal->add_flag(
        "--follow", options.follow,
        "Wait for further changes until nobody reads them; without --after, only those "
        "from now on. The first line is the number behind which they begin");
    app.add_subcommand("check",
                       "Check that the state obeys the rules of hosts, and print those that it "
                       "breaks.")
        ->callback([&options] { options.status = checkState(); });
}

void addFault(CLI::App& app, FaultOptions& options) {
    constexpr std::int64_t kMost = std::numeric_limits<std::int32_t>::max();
    CLI::App* fault = app.add_subcommand(
        "fault",
        "Let the next calls of a tool (qyplat ...) or of an operation of the management library\n"
        "(getCecObj ...) go wrong. Without a name: show what is planned.");
    fault->callback([&options] { carryOut(options); });
    fault->add_option("name", options.plan.name, "Tool or operation")
        ->check(CLI::Validator(judgeFaultName, ""));
    fault->add_option("--calls", options.plan.calls, "How many calls")
        ->check(CLI::Range(std::int64_t{1}, kMost))
        ->capture_default_str();
    fault->add_option("--code", options.code,
                      "Exit status of a tool, or return code of an operation; null lets an "
                      "operation return no result at all");
    fault->add_option("--text", options.plan.text, "What a tool writes to standard error");
    fault->add_option("--delay", options.plan.delay, "Milliseconds before anything else")
        ->check(CLI::Range(std::int64_t{0}, kMost));
    fault->add_option("--signal", options.plan.signal, "Number of the signal that ends a tool")
        ->check(CLI::Range(1, SIGRTMAX));
    fault->add_flag("--clear", options.clear, "Forget what is planned");
}

int run(int argc, char** argv) {
    CLI::App app{"Makes and shows the state of an appliance that manages partitioned hosts."};
    app.footer(kFooter);
    app.require_subcommand(0, 1);  // with one at least, a mistyped one would not be named
    app.set_version_flag("--version", "appliance " APPLIANCE_VERSION);
    Options options;
    addMakers(app, options);
    addReaders(app, options);
    addFault(app, options.fault);
    for (CLI::App* verb : app.get_subcommands({})) {
        verb->footer(kFooter);
    }

    try {
        app.parse(argc, argv);
        if (app.get_subcommands().empty()) {
            throw CLI::RequiredError::Subcommand(1);
        }
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? 0 : kExitUsage;
    }
    return options.status;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        const int status = run(argc, argv);
        std::cout.flush();
        if (!std::cout) {
            throw Failure(Fault::Output, {"standard output"});
        }
        return status;
    } catch (const Failure& failure) {
        std::cerr << failure.text(languageOfEnvironment()) << '\n';
        return failure.exitStatus();
    } catch (const std::exception& error) {
        std::cerr << error.what() << '\n';
        return kExitState;
    }
}
