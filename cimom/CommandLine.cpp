#include "CommandLine.h"

#include <CLI/CLI.hpp>
#include <cstdio>
#include <map>

#include "Literal.h"

namespace cimom {

namespace {

constexpr int kUsageError = 64;

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
    "A method that answers 4096 and names a job is followed until the job has ended, as that "
    "lives\n"
    "in this process; its exit code is 0 when the job has done its work. SIGINT asks the job to "
    "end.\n"
    "\n"
    "A failure prints the name, number and message of its CIM status on standard error; the exit\n"
    "code is that number. Exit code 64 is a wrong command line, 74 an output that cannot be\n"
    "written, 78 a registration or schema that cannot be used.";

void addGlobals(CLI::App& app, CommandLine& line) {
    const std::map<std::string, Character> characters = {{"full", Character::Full},
                                                         {"lean", Character::Lean}};
    const std::map<std::string, Format> formats = {{"text", Format::Text}, {"json", Format::Json}};
    app.add_option("--broker", line.options.character,
                   "Character of the broker: full, by the standard and as unkind as OpenPegasus, "
                   "or lean, like sfcb and other small servers")
        ->transform(CLI::CheckedTransformer(characters, CLI::ignore_case))
        ->option_text("full|lean");
    app.add_option("--registration", line.registrations,
                   "File that says which provider serves which class; may be given more than once")
        ->envname("CIMOM_REGISTRATION")
        ->option_text("FILE");
    app.add_option("--schema", line.schema, "MOF file with the classes")
        ->envname("CIMOM_SCHEMA")
        ->option_text("FILE");
    app.add_option("--library-folder", line.options.libraryFolders,
                   "Where to look for provider libraries besides the folder of the registration; "
                   "may be given more than once")
        ->option_text("FOLDER");
    app.add_option("--messages", line.options.messageFolder,
                   "Folder with translated messages of providers")
        ->option_text("FOLDER");
    app.add_option_function<std::string>(
           "--user", [&line](const std::string& user) { line.request.user = user; },
           "User in whose name to ask; nobody when not given")
        ->option_text("NAME");
    app.add_option("--language", line.request.language, "Languages wanted, as in de-DE,en;q=0.5")
        ->option_text("LANGUAGES");
    app.add_option("--namespace", line.request.nameSpace,
                   "Namespace of paths that name none [root/cimv2]")
        ->option_text("NAMESPACE");
    app.add_option("--format", line.format, "How results are printed [text]")
        ->transform(CLI::CheckedTransformer(formats, CLI::ignore_case))
        ->option_text("text|json");
    app.add_option("--provider-output", line.providerOutput,
                   "Where the standard output of providers goes: discard, stderr, or a file to "
                   "append to [discard]")
        ->option_text("discard|stderr|FILE");
    app.add_option("--trace", line.traceLevel,
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
    {kClass, "class", &Arguments::object, "Name of the class", true},
    {kOptionalClass, "class", &Arguments::object, "Name of the class", false},
    {kPath, "path", &Arguments::object, "Object path", true},
    {kMethodName, "method", &Arguments::name, "Name of the method", true},
    {kPropertyName, "property", &Arguments::name, "Name of the property", true},
    {kValue, "value", &Arguments::value, "New value", true},
    {kFilter, "filter", &Arguments::query, "Class of the indications, or a query", true},
    {kFilter, "--query-language", &Arguments::queryLanguage, "Language of the query [WQL]", false},
    {kAssociationEnds, "--assoc-class", &Arguments::assocClass,
     "Only through associations of this class", false},
    {kNavigation, "--result-class", &Arguments::resultClass, "Only results of this class", false},
    {kNavigation, "--role", &Arguments::role, "Only where the given instance stands in this role",
     false},
    {kAssociationEnds, "--result-role", &Arguments::resultRole,
     "Only where the result stands in this role", false},
    {kServing, "--address", &Arguments::address,
     "Address to serve at [127.0.0.1]; others than those of the loopback interface only with the "
     "three options below",
     false},
    {kServing, "--certificate", &Arguments::certificate,
     "File with the certificate, and those above it, in PEM; serves HTTPS", false},
    {kServing, "--key", &Arguments::key, "File with the key of the certificate, in PEM", false},
    {kServing, "--passwords", &Arguments::passwords,
     "File with a line name:hash for each who may sign in, the hash by crypt(3); without it all "
     "users of this machine are served",
     false},
    {kServing, "--state", &Arguments::state,
     "Folder or file in which indication subscriptions are kept; without it they end with the "
     "process",
     false},
    {kServing, "--trusted", &Arguments::trusted,
     "File with the certificates, in PEM, by which listeners of indications are believed, instead "
     "of the system's",
     false},
};

CLI::App* addVerb(CLI::App& app, const Verb& row, CommandLine& line) {
    CLI::App* verb = app.add_subcommand(row.name, row.help);
    verb->fallthrough();
    if (row.takes & kPropertyList) {
        verb->add_option_function<std::string>(
                "--properties",
                [&line](const std::string& names) {
                    line.request.properties = splitAtCommas(names);
                },
                "Names of the properties wanted, separated by commas")
            ->option_text("NAMES");
    }
    for (const TextArgument& argument : kTextArguments) {
        if (row.takes & argument.takenBy) {
            verb->add_option(argument.name, line.arguments.*argument.place, argument.help)
                ->required(argument.required);
        }
    }
    if (row.takes & kFilter) {
        verb->add_option("--count", line.arguments.count, "End after this many indications");
    }
    if (row.takes & kServing) {
        verb->add_option("--port", line.arguments.port,
                         "Port to serve at, 0 for any [5988, with a certificate 5989]");
        verb->add_flag("--log", line.arguments.log, "Print a line for each request");
    }
    if (row.takes & (kPropertyValues | kInputValues)) {
        verb->add_option("values", line.arguments.assignments,
                         row.takes & kPropertyValues ? "Properties, each as name=value"
                                                     : "Input arguments, each as name=value")
            ->option_text("name=value ...");
    }
    return verb;
}

}  // namespace

std::optional<int> readCommandLine(int argc, char** argv, CommandLine& line) {
    CLI::App app("CIM operations on the providers of a registration, without a CIM server.",
                 "cimom");
    app.footer(kFooter);
    app.require_subcommand(1);
    app.set_version_flag("--version", "cimom " CIMOM_VERSION);
    addGlobals(app, line);
    for (const Verb& row : verbs()) {
        addVerb(app, row, line)->callback([&line, verb = &row] { line.verb = verb; });
    }
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        const std::vector<std::string> rest = app.remaining();
        if (app.get_subcommands().empty() && !rest.empty()) {
            std::fprintf(stderr, "cimom: no verb '%s'; cimom --help lists them\n", rest[0].c_str());
            return kUsageError;
        }
        return app.exit(error) == 0 ? 0 : kUsageError;
    }
    return std::nullopt;
}

}  // namespace cimom
