#include "Failure.h"

#include <cstdlib>

namespace appliance {

namespace {

struct FaultText {
    Fault fault;
    ExitStatus exitStatus;
    const char* code;
    const char* english;
    const char* german;
};

constexpr FaultText kFaults[] = {
    {Fault::UnknownOption, kExitUsage, "WRTL1001", "The option %1 is not known.",
     "Die Option %1 ist nicht bekannt."},
    {Fault::MissingValue, kExitUsage, "WRTL1002", "The option %1 needs a value.",
     "Die Option %1 braucht einen Wert."},
    {Fault::MissingOption, kExitUsage, "WRTL1003", "The option %1 is missing.",
     "Die Option %1 fehlt."},
    {Fault::BadOptionValue, kExitUsage, "WRTL1004", "The option %1 cannot have the value \"%2\".",
     "Die Option %1 kann den Wert \"%2\" nicht haben."},
    {Fault::RepeatedOption, kExitUsage, "WRTL1005", "The option %1 is given more than once.",
     "Die Option %1 ist mehrfach angegeben."},
    {Fault::UnexpectedArgument, kExitUsage, "WRTL1006", "The argument \"%1\" belongs to no option.",
     "Das Argument \"%1\" gehört zu keiner Option."},
    {Fault::UnknownAttribute, kExitUsage, "WRTL1007", "The attribute \"%1\" is not known.",
     "Das Attribut \"%1\" ist nicht bekannt."},
    {Fault::UnknownFilter, kExitUsage, "WRTL1008", "The filter \"%1\" is not known.",
     "Der Filter \"%1\" ist nicht bekannt."},
    {Fault::BadFilter, kExitUsage, "WRTL1009", "The filter \"%1\" is not of the form name=value.",
     "Der Filter \"%1\" hat nicht die Form name=wert."},
    {Fault::UnknownTool, kExitUsage, "WRTL1010", "There is no tool with the name \"%1\".",
     "Es gibt kein Werkzeug mit dem Namen \"%1\"."},
    {Fault::BadValue, kExitRefused, "WRTL1011", "The attribute %1 cannot have the value \"%2\".",
     "Das Attribut %1 kann den Wert \"%2\" nicht haben."},
    {Fault::NoHome, kExitState, "WRTL2001",
     "The environment variable APPLIANCE_HOME does not name the appliance's folder.",
     "Die Umgebungsvariable APPLIANCE_HOME nennt den Ordner der Appliance nicht."},
    {Fault::NoState, kExitState, "WRTL2002",
     "There is no appliance in %1: make one with \"appliance init\" or \"appliance generate\".",
     "In %1 ist keine Appliance: \"appliance init\" oder \"appliance generate\" legt eine an."},
    {Fault::StateVersion, kExitState, "WRTL2003",
     "The appliance's state has version %1; this program reads version %2.",
     "Der Zustand der Appliance hat Version %1; dieses Programm liest Version %2."},
    {Fault::StateExists, kExitRefused, "WRTL2004",
     "There is an appliance in %1 already; --force replaces it.",
     "In %1 ist schon eine Appliance; --force ersetzt sie."},
    {Fault::StateUnusable, kExitState, "WRTL2005", "The appliance's state %1 cannot be used: %2.",
     "Der Zustand %1 der Appliance ist nicht zu benutzen: %2."},
    {Fault::StateBusy, kExitState, "WRTL2006",
     "Other changes kept the appliance's state %1 busy for too long.",
     "Andere Änderungen haben den Zustand %1 der Appliance zu lange belegt."},
    {Fault::Output, kExitOutput, "WRTL2007", "The output cannot be written: %1.",
     "Die Ausgabe ist nicht zu schreiben: %1."},
    {Fault::NoSingleHostManager, kExitRefused, "WRTL3001",
     "This appliance is not the manager of a single host.",
     "Diese Appliance ist nicht der Verwalter eines einzelnen Hosts."},
    {Fault::LparNameNotFound, kExitRefused, "WRTL8010",
     "The partition with the name \"%1\" was not found.",
     "Die Partition mit dem Namen \"%1\" wurde nicht gefunden."},
    {Fault::LparIdNotFound, kExitRefused, "WRTL8011", "The partition with the ID %1 was not found.",
     "Die Partition mit der ID %1 wurde nicht gefunden."},
    {Fault::HostNotFound, kExitRefused, "WRTL8018", "The managed system \"%1\" was not found.",
     "Das verwaltete System \"%1\" wurde nicht gefunden."},
    {Fault::NotIoServer, kExitRefused, "WRTL8019", "The partition with the ID %1 is no I/O server.",
     "Die Partition mit der ID %1 ist kein I/O-Server."},
    {Fault::LparNotRunning, kExitRefused, "WRTL8020",
     "The partition with the ID %1 is not running.", "Die Partition mit der ID %1 läuft nicht."},
};

constexpr bool inOrder() {
    for (std::size_t i = 0; i < sizeof kFaults / sizeof *kFaults; ++i) {
        if (static_cast<std::size_t>(kFaults[i].fault) != i) return false;
    }
    return true;
}
static_assert(inOrder(), "textOf() takes the rows by the number of their fault");

const FaultText& textOf(Fault fault) { return kFaults[static_cast<std::size_t>(fault)]; }

std::string filled(const char* sentence, const std::vector<std::string>& words) {
    std::string text;
    for (const char* c = sentence; *c != '\0'; ++c) {
        const auto index = static_cast<std::size_t>(c[1] - '1');
        if (*c == '%' && index < words.size()) {
            text += words[index];
            ++c;
        } else {
            text += *c;
        }
    }
    return text;
}

}  // namespace

Language languageOfEnvironment() {
    for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
        const char* value = std::getenv(variable);
        if (value == nullptr || *value == '\0') continue;
        const std::string locale = value;
        const std::string language = locale.substr(0, locale.find_first_of("_.@"));
        return language == "de" ? Language::German : Language::English;
    }
    return Language::English;
}

Failure::Failure(Fault fault, std::vector<std::string> words)
    : m_fault(fault), m_words(std::move(words)), m_english(text(Language::English)) {}

std::string Failure::text(Language language) const {
    const FaultText& row = textOf(m_fault);
    const char* sentence = language == Language::German ? row.german : row.english;
    return std::string(row.code) + ' ' + filled(sentence, m_words);
}

ExitStatus Failure::exitStatus() const noexcept { return textOf(m_fault).exitStatus; }

}  // namespace appliance
