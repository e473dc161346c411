// cimom: CIM operations from the command line, with the providers loaded into this process.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <iostream>
#include <map>
#include <mutex>
#include <thread>

#include "Commands.h"
#include "Failure.h"

namespace {

using cimom::Arguments;

constexpr int kUsageError = 64;
constexpr int kOutputError = 74;
constexpr int kSetupError = 78;

struct Settings {
    cimom::Options options;
    cimom::Request request;
    std::vector<std::string> registrations;
    std::string schema;
    std::string providerOutput = "discard";
    int traceLevel = -1;
    cimom::Format format = cimom::Format::Text;
};

const char* const kFooter =
    "The options of cimom itself may stand before or behind the verb; cimom --help lists them.\n"
    "\n"
    "Object paths read [//host/][namespace:]Class.key=\"text\",other=5,flag=true; quotes and\n"
    "backslashes within a text are written \\\" and \\\\. Paths that are printed can be given "
    "back.\n"
    "Values of properties and arguments are read as the class declares them, with --schema:\n"
    "arrays as {a, b}, references as paths, embedded instances as\n"
    "'instance of Class { name = value; }'. Without it they are guessed. What the class does not\n"
    "have, or not so, is refused here, and left to the provider with --broker lean.\n"
    "\n"
    "Environment: CIMOM_REGISTRATION and CIMOM_SCHEMA stand for --registration and --schema where\n"
    "these are not given. Texts of messages follow LC_ALL, LC_MESSAGES or LANG where a provider\n"
    "asks for the language of its process.\n"
    "\n"
    "What providers write to their standard output goes where --provider-output says, and never\n"
    "among the results.\n"
    "\n"
    "A failure prints the name, number and message of its CIM status on standard error; the exit\n"
    "code is that number. Exit code 64 is a wrong command line, 74 an output that cannot be\n"
    "written, 78 a registration or schema that cannot be used.";

void addGlobals(CLI::App& app, Settings& settings) {
    const std::map<std::string, cimom::Character> characters = {{"full", cimom::Character::Full},
                                                                {"lean", cimom::Character::Lean}};
    const std::map<std::string, cimom::Format> formats = {{"text", cimom::Format::Text},
                                                          {"json", cimom::Format::Json}};
    app.add_option("--broker", settings.options.character,
                   "Character of the broker: full, by the standard and as unkind as OpenPegasus, "
                   "or lean, like sfcb and other small servers")
        ->transform(CLI::CheckedTransformer(characters, CLI::ignore_case))
        ->option_text("full|lean");
    app.add_option("--registration", settings.registrations,
                   "File that says which provider serves which class; may be given more than once")
        ->envname("CIMOM_REGISTRATION")
        ->option_text("FILE");
    app.add_option("--schema", settings.schema, "MOF file with the classes")
        ->envname("CIMOM_SCHEMA")
        ->option_text("FILE");
    app.add_option("--library-folder", settings.options.libraryFolders,
                   "Where to look for provider libraries besides the folder of the registration; "
                   "may be given more than once")
        ->option_text("FOLDER");
    app.add_option("--messages", settings.options.messageFolder,
                   "Folder with translated messages of providers")
        ->option_text("FOLDER");
    app.add_option_function<std::string>(
           "--user", [&settings](const std::string& user) { settings.request.user = user; },
           "User in whose name to ask; nobody when not given")
        ->option_text("NAME");
    app.add_option("--language", settings.request.language,
                   "Languages wanted, as in de-DE,en;q=0.5")
        ->option_text("LANGUAGES");
    app.add_option("--namespace", settings.request.nameSpace,
                   "Namespace of paths that name none [root/cimv2]")
        ->option_text("NAMESPACE");
    app.add_option("--format", settings.format, "How results are printed [text]")
        ->transform(CLI::CheckedTransformer(formats, CLI::ignore_case))
        ->option_text("text|json");
    app.add_option("--provider-output", settings.providerOutput,
                   "Where the standard output of providers goes: discard, stderr, or a file to "
                   "append to [discard]")
        ->option_text("discard|stderr|FILE");
    app.add_option("--trace", settings.traceLevel,
                   "Print log messages and trace lines of providers up to this level on standard "
                   "error")
        ->option_text("LEVEL");
}

struct TextArgument {
    unsigned takenBy;  ///< bits of Takes
    const char* name;
    std::string Arguments::*place;
    const char* help;
    bool required;
};
constexpr TextArgument kTextArguments[] = {
    {cimom::kClass, "class", &Arguments::object, "Name of the class", true},
    {cimom::kOptionalClass, "class", &Arguments::object, "Name of the class", false},
    {cimom::kPath, "path", &Arguments::object, "Object path", true},
    {cimom::kMethodName, "method", &Arguments::name, "Name of the method", true},
    {cimom::kPropertyName, "property", &Arguments::name, "Name of the property", true},
    {cimom::kValue, "value", &Arguments::value, "New value", true},
    {cimom::kFilter, "filter", &Arguments::query, "Class of the indications, or a query", true},
    {cimom::kFilter, "--query-language", &Arguments::queryLanguage, "Language of the query [WQL]",
     false},
    {cimom::kAssociationEnds, "--assoc-class", &Arguments::assocClass,
     "Only through associations of this class", false},
    {cimom::kNavigation, "--result-class", &Arguments::resultClass, "Only results of this class",
     false},
    {cimom::kNavigation, "--role", &Arguments::role,
     "Only where the given instance stands in this role", false},
    {cimom::kAssociationEnds, "--result-role", &Arguments::resultRole,
     "Only where the result stands in this role", false},
};

CLI::App* addVerb(CLI::App& app, const cimom::Verb& row, Settings& settings, Arguments& arguments) {
    CLI::App* verb = app.add_subcommand(row.name, row.help);
    verb->fallthrough();
    if (row.takes & cimom::kPropertyList) {
        verb->add_option_function<std::string>(
                "--properties",
                [&settings](const std::string& names) {
                    settings.request.properties = cimom::splitAtCommas(names);
                },
                "Names of the properties wanted, separated by commas")
            ->option_text("NAMES");
    }
    for (const TextArgument& argument : kTextArguments) {
        if (row.takes & argument.takenBy) {
            verb->add_option(argument.name, arguments.*argument.place, argument.help)
                ->required(argument.required);
        }
    }
    if (row.takes & cimom::kFilter) {
        verb->add_option("--count", arguments.count, "End after this many indications");
    }
    if (row.takes & (cimom::kPropertyValues | cimom::kInputValues)) {
        verb->add_option("values", arguments.assignments,
                         row.takes & cimom::kPropertyValues ? "Properties, each as name=value"
                                                            : "Input arguments, each as name=value")
            ->option_text("name=value ...");
    }
    return verb;
}

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

int run(const cimom::Verb& verb, Settings& settings, const Arguments& arguments) {
    if (settings.registrations.empty() && !(verb.takes & cimom::kNoProvider)) {
        throw std::runtime_error(
            "no providers: name a registration, by --registration or CIMOM_REGISTRATION");
    }
    cimom::ResultStream out(settings.providerOutput);
    if (!settings.schema.empty()) {
        settings.options.classes = cimom::ClassRepository::load(settings.schema);
    }
    cimom::Server server(settings.options);
    for (const std::string& file : settings.registrations) {
        server.loadRegistration(file);
    }
    if (settings.traceLevel >= 0) {
        server.setLogHook(
            [level = settings.traceLevel](const cimom::LogLine& line) { printLine(line, level); });
    }
    const bool lean = settings.options.character == cimom::Character::Lean;
    cimom::Session session{server,
                           settings.request,
                           settings.options.classes.get(),
                           lean ? cimom::Unfit::Kept : cimom::Unfit::Refused,
                           settings.format,
                           out};
    const std::string what = arguments.name.empty() ? verb.name : arguments.name;
    Waiting waiting(verb.takes == cimom::kFilter ? "" : what);
    out.beforeFirstWrite([&] { waiting.end(); });
    try {
        const cimom::Reply reply = verb.run(session, arguments);
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
    CLI::App app("CIM operations on the providers of a registration, without a CIM server.",
                 "cimom");
    app.footer(kFooter);
    app.require_subcommand(1);
    app.set_version_flag("--version", "cimom " CIMOM_VERSION);
    Settings settings;
    Arguments arguments;
    addGlobals(app, settings);
    const cimom::Verb* chosen = nullptr;
    for (const cimom::Verb& row : cimom::verbs()) {
        addVerb(app, row, settings, arguments)->callback([&chosen, verb = &row] { chosen = verb; });
    }
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        const std::vector<std::string> rest = app.remaining();
        if (app.get_subcommands().empty() && !rest.empty()) {
            std::fprintf(stderr, "cimom: no verb '%s'; cimom --help lists them\n", rest[0].c_str());
            return kUsageError;
        }
        if (app.exit(error) != 0) {
            return kUsageError;
        }
        return std::cout.flush() ? 0 : reportOutput(errno);
    }
    return run(*chosen, settings, arguments);
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
