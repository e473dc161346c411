// cimom: CIM operations from the command line, with the providers loaded into this process.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <cstdio>
#include <map>
#include <mutex>
#include <thread>

#include "Commands.h"
#include "Failure.h"

namespace {

using cimom::Arguments;
using cimom::Takes;

constexpr int kUsageError = 64;
constexpr int kSetupError = 78;

struct Settings {
    cimom::Options options;
    cimom::Request request;
    std::vector<std::string> registrations;
    std::string schema;
    std::string user;
    std::string properties;
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
    "What providers write to their standard output goes where --provider-output says, and never\n"
    "among the results.\n"
    "\n"
    "A failure prints the name, number and message of its CIM status on standard error; the exit\n"
    "code is that number. Exit code 64 is a wrong command line, 78 a registration or schema that\n"
    "cannot be used.";

void addGlobals(CLI::App& app, Settings& settings) {
    const std::map<std::string, cimom::Character> characters = {{"full", cimom::Character::Full},
                                                                {"lean", cimom::Character::Lean}};
    const std::map<std::string, cimom::Format> formats = {{"text", cimom::Format::Text},
                                                          {"json", cimom::Format::Json}};
    app.add_option("--broker", settings.options.character,
                   "Character of the broker: full, as the standard has it, or lean, like small "
                   "servers in the field")
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
    app.add_option("--user", settings.user, "User in whose name to ask; nobody when not given")
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

void addPositionals(CLI::App& verb, Takes takes, Arguments& arguments) {
    const bool ofClass =
        takes == Takes::Class || takes == Takes::ClassAndValues || takes == Takes::OptionalClass;
    const bool values = takes == Takes::ClassAndValues || takes == Takes::PathAndValues;
    if (takes == Takes::Filter) {
        verb.add_option("filter", arguments.query, "Class of the indications, or a query")
            ->required();
        verb.add_option("--query-language", arguments.queryLanguage, "Language of the query [WQL]");
        verb.add_option("--count", arguments.count, "End after this many indications");
        return;
    }
    auto* object = verb.add_option(ofClass ? "class" : "path", arguments.object,
                                   ofClass ? "Name of the class" : "Object path");
    object->required(takes != Takes::OptionalClass);
    if (takes == Takes::Method || takes == Takes::Property || takes == Takes::PropertyAndValue) {
        const bool method = takes == Takes::Method;
        verb.add_option(method ? "method" : "property", arguments.name,
                        method ? "Name of the method" : "Name of the property")
            ->required();
    }
    if (takes == Takes::PropertyAndValue)
        verb.add_option("value", arguments.value, "New value")->required();
    if (values || takes == Takes::Method)
        verb.add_option(
                "values", arguments.assignments,
                values ? "Properties, each as name=value" : "Input arguments, each as name=value")
            ->option_text("name=value ...");
}

void addVerb(CLI::App& app, const cimom::Verb& row, Settings& settings, Arguments& arguments) {
    CLI::App* verb = app.add_subcommand(row.name, row.help);
    verb->fallthrough();
    addPositionals(*verb, row.takes, arguments);
    if (row.propertyList)
        verb->add_option("--properties", settings.properties,
                         "Names of the properties wanted, separated by commas")
            ->option_text("NAMES");
    if (row.takes != Takes::Navigation) return;
    const std::string name = row.name;
    const bool associators = name[0] == 'a';
    if (associators)
        verb->add_option("--assoc-class", arguments.filter.assocClass,
                         "Only through associations of this class");
    verb->add_option("--result-class", arguments.filter.resultClass, "Only results of this class");
    verb->add_option("--role", arguments.filter.role,
                     "Only where the given instance stands in this role");
    if (associators)
        verb->add_option("--result-role", arguments.filter.resultRole,
                         "Only where the result stands in this role");
}

std::vector<std::string> splitNames(const std::string& text) {
    std::vector<std::string> names;
    for (std::size_t at = 0; at < text.size();) {
        const std::size_t comma = std::min(text.find(',', at), text.size());
        if (comma > at) names.push_back(text.substr(at, comma - at));
        at = comma + 1;
    }
    return names;
}

int reportFailure(CMPIrc rc, const std::string& message) {
    std::fprintf(stderr, "%s (%d): %s\n", cimom::statusName(rc), static_cast<int>(rc),
                 message.c_str());
    return static_cast<int>(rc);
}

void printLine(const cimom::LogLine& line, int level) {
    const bool trace = line.kind == cimom::LogLine::Kind::Trace;
    if (trace && line.level > level) return;
    std::fprintf(stderr, "%s %d %s: %s\n", trace ? "trace" : "log", line.level,
                 line.component.c_str(), line.text.c_str());
}

/// Tells who watches the terminal, from two seconds on, for how long the request has been working.
class Waiting {
public:
    /// @param what  the request; empty for one that lasts by its nature
    explicit Waiting(const std::string& what) {
        if (what.empty() || isatty(STDERR_FILENO) == 0) return;
        m_thread = std::thread([this, what] {
            std::unique_lock<std::mutex> lock(m_mutex);
            for (int seconds = 1;
                 !m_over.wait_for(lock, std::chrono::seconds(1), [this] { return m_ended; });
                 ++seconds) {
                if (seconds > 1) std::fprintf(stderr, "\r%s: %d s", what.c_str(), seconds);
                m_shown = seconds > 1;
            }
            if (m_shown) std::fputs("\r\033[K", stderr);
        });
    }
    ~Waiting() { end(); }
    Waiting(const Waiting&) = delete;
    Waiting& operator=(const Waiting&) = delete;

    /// Takes away what it shows.
    void end() {
        if (!m_thread.joinable()) return;
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
    cimom::ResultStream out(settings.providerOutput);
    if (!settings.schema.empty())
        settings.options.classes = cimom::ClassRepository::load(settings.schema);
    cimom::Server server(settings.options);
    for (const std::string& file : settings.registrations) server.loadRegistration(file);
    if (settings.traceLevel >= 0)
        server.setLogHook(
            [level = settings.traceLevel](const cimom::LogLine& line) { printLine(line, level); });
    const bool lean = settings.options.character == cimom::Character::Lean;
    cimom::Session session{server,
                           settings.request,
                           settings.options.classes.get(),
                           lean ? cimom::Unfit::Kept : cimom::Unfit::Refused,
                           settings.format,
                           out};
    const std::string what = arguments.name.empty() ? verb.name : arguments.name;
    Waiting waiting(verb.takes == Takes::Filter ? "" : what);
    out.beforeFirstWrite([&] { waiting.end(); });
    try {
        const cimom::Reply reply = verb.run(session, arguments);
        waiting.end();
        return reply.ok() ? 0 : reportFailure(reply.rc, reply.message);
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
    Settings settings;
    Arguments arguments;
    addGlobals(app, settings);
    for (const cimom::Verb& row : cimom::verbs()) addVerb(app, row, settings, arguments);
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        return app.exit(error) == 0 ? 0 : kUsageError;
    }
    if (app.count("--user")) settings.request.user = settings.user;
    const CLI::App& chosen = *app.get_subcommands().front();
    const auto* option = chosen.get_option_no_throw("--properties");
    if (option && option->count()) settings.request.properties = splitNames(settings.properties);
    const auto& rows = cimom::verbs();
    const auto verb = std::find_if(rows.begin(), rows.end(), [&](const cimom::Verb& row) {
        return chosen.get_name() == row.name;
    });
    return run(*verb, settings, arguments);
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
