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
    {Fault::BadSetting, kExitUsage, "WRTL1012", "The item \"%1\" is not of the form name=value.",
     "Die Angabe \"%1\" hat nicht die Form name=wert."},
    {Fault::RepeatedSetting, kExitUsage, "WRTL1013", "The attribute %1 is given more than once.",
     "Das Attribut %1 ist mehrfach angegeben."},
    {Fault::MissingSetting, kExitUsage, "WRTL1014", "The attribute %1 is missing.",
     "Das Attribut %1 fehlt."},
    {Fault::NotAList, kExitUsage, "WRTL1015", "The attribute %1 is no list: it can only be set.",
     "Das Attribut %1 ist keine Liste: es kann nur gesetzt werden."},
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
    {Fault::Unsound, kExitRefused, "WRTL8030", "The managed system refuses the change: %1.",
     "Das verwaltete System lehnt die Änderung ab: %1."},
    {Fault::ProfileNotFound, kExitRefused, "WRTL8031",
     "The partition has no profile with the name \"%1\".",
     "Die Partition hat kein Profil mit dem Namen \"%1\"."},
    {Fault::NameTaken, kExitRefused, "WRTL8032", "The name \"%1\" is taken.",
     "Der Name \"%1\" ist vergeben."},
    {Fault::IdTaken, kExitRefused, "WRTL8033", "The partition ID %1 is taken.",
     "Die Partitions-ID %1 ist vergeben."},
    {Fault::TooManyLpars, kExitRefused, "WRTL8034",
     "The managed system can have no more than %1 partitions.",
     "Das verwaltete System kann höchstens %1 Partitionen haben."},
    {Fault::NotCapable, kExitRefused, "WRTL8035",
     "The managed system cannot do what the attribute %1 asks for.",
     "Das verwaltete System kann nicht, was das Attribut %1 verlangt."},
    {Fault::OutsideLimits, kExitRefused, "WRTL8036",
     "The attribute %1 would be outside its limits.",
     "Das Attribut %1 läge außerhalb seiner Grenzen."},
    {Fault::Disagree, kExitRefused, "WRTL8037", "The attributes %1 and %2 do not go together.",
     "Die Attribute %1 und %2 passen nicht zusammen."},
    {Fault::NotEnough, kExitRefused, "WRTL8038",
     "The managed system has not enough left: %1 is %2.",
     "Das verwaltete System hat nicht genug übrig: %1 ist %2."},
    {Fault::ElementThere, kExitRefused, "WRTL8039", "The list %1 has \"%2\" already.",
     "Die Liste %1 hat \"%2\" schon."},
    {Fault::ElementMissing, kExitRefused, "WRTL8040", "The list %1 does not have \"%2\".",
     "Die Liste %1 hat \"%2\" nicht."},
    {Fault::SlotNotFound, kExitRefused, "WRTL8041", "The managed system has no physical slot %1.",
     "Das verwaltete System hat keinen physischen Steckplatz %1."},
    {Fault::SlotNotFree, kExitRefused, "WRTL8042",
     "The physical slot %1 belongs to the partition with the ID %2.",
     "Der physische Steckplatz %1 gehört der Partition mit der ID %2."},
    {Fault::SlotNotHeld, kExitRefused, "WRTL8043",
     "The partition does not have the physical slot %1.",
     "Die Partition hat den physischen Steckplatz %1 nicht."},
    {Fault::VirtualSlotNotFree, kExitRefused, "WRTL8044",
     "The virtual slot %1 is taken, or not one that the partition can use.",
     "Der virtuelle Steckplatz %1 ist belegt oder für die Partition nicht benutzbar."},
    {Fault::AdapterNotFound, kExitRefused, "WRTL8045",
     "The partition has no such adapter in its virtual slot %1.",
     "Die Partition hat keinen solchen Adapter in ihrem virtuellen Steckplatz %1."},
    {Fault::Required, kExitRefused, "WRTL8046",
     "What is in slot %1 is required and cannot be removed.",
     "Was in Steckplatz %1 ist, wird gebraucht und kann nicht entfernt werden."},
    {Fault::InUse, kExitRefused, "WRTL8047", "This is in use by the partition with the ID %1.",
     "Dies wird von der Partition mit der ID %1 benutzt."},
    {Fault::HostState, kExitRefused, "WRTL8048",
     "The managed system \"%1\" cannot do this in the state \"%2\".",
     "Das verwaltete System \"%1\" kann dies im Zustand \"%2\" nicht."},
    {Fault::LparState, kExitRefused, "WRTL8049",
     "The partition with the ID %1 cannot do this in the state \"%2\".",
     "Die Partition mit der ID %1 kann dies im Zustand \"%2\" nicht."},
    {Fault::LparMoving, kExitRefused, "WRTL8050",
     "The partition with the ID %1 is moving to another managed system.",
     "Die Partition mit der ID %1 zieht auf ein anderes verwaltetes System um."},
    {Fault::NoResources, kExitRefused, "WRTL8051",
     "The partition with the ID %1 has no resources before it is activated.",
     "Die Partition mit der ID %1 hat keine Ressourcen, bevor sie aktiviert wird."},
    {Fault::NoSuchSystemProfile, kExitRefused, "WRTL8060",
     "The managed system has no system profile with the name \"%1\".",
     "Das verwaltete System hat kein Systemprofil mit dem Namen \"%1\"."},
    {Fault::NoPool, kExitRefused, "WRTL8061",
     "The managed system does not have the pool that the attribute %1 asks for.",
     "Das verwaltete System hat den Pool nicht, den das Attribut %1 verlangt."},
    {Fault::NoServerAdapter, kExitRefused, "WRTL8062",
     "No server adapter is free for the client adapter in the virtual slot %1.",
     "Für den Client-Adapter im virtuellen Steckplatz %1 ist kein Server-Adapter frei."},
    {Fault::LparsActive, kExitRefused, "WRTL8063",
     "Partitions are active on the managed system; --immed ends them.",
     "Auf dem verwalteten System sind Partitionen aktiv; --immed beendet sie."},
    {Fault::NotSuspendable, kExitRefused, "WRTL8064",
     "The partition with the ID %1, or its managed system, cannot suspend.",
     "Die Partition mit der ID %1 oder ihr verwaltetes System kann nicht anhalten."},
    {Fault::NoSuspension, kExitRefused, "WRTL8065",
     "No suspension of the partition with the ID %1 is under way or has failed.",
     "Ein Anhalten der Partition mit der ID %1 ist weder im Gang noch misslungen."},
    {Fault::LparStays, kExitRefused, "WRTL8066",
     "The partition with the ID %1 is an I/O server or the service partition.",
     "Die Partition mit der ID %1 ist ein I/O-Server oder die Service-Partition."},
    {Fault::PhysicalAdapters, kExitRefused, "WRTL8067",
     "The partition with the ID %1 has physical adapters.",
     "Die Partition mit der ID %1 hat physische Adapter."},
    {Fault::JoinedAdapters, kExitRefused, "WRTL8068",
     "The adapter in the virtual slot %1 joins the partition to one that stays.",
     "Der Adapter im virtuellen Steckplatz %1 verbindet die Partition mit einer, die bleibt."},
    {Fault::NotMovable, kExitRefused, "WRTL8069",
     "The managed system \"%1\" takes no part in such a move.",
     "Das verwaltete System \"%1\" nimmt an einem solchen Umzug nicht teil."},
    {Fault::TooManyMoves, kExitRefused, "WRTL8070",
     "The managed system \"%1\" has as many moves under way as it supports.",
     "Auf dem verwalteten System \"%1\" sind so viele Umzüge im Gang, wie es unterstützt."},
    {Fault::NoMover, kExitRefused, "WRTL8071", "No I/O server runs on the managed system \"%1\".",
     "Auf dem verwalteten System \"%1\" läuft kein I/O-Server."},
    {Fault::NoServerSlot, kExitRefused, "WRTL8072",
     "No I/O server of the managed system \"%1\" has a virtual slot left.",
     "Kein I/O-Server des verwalteten Systems \"%1\" hat noch einen virtuellen Steckplatz."},
    {Fault::NotMoving, kExitRefused, "WRTL8073",
     "The partition with the ID %1 is not moving away from this managed system.",
     "Die Partition mit der ID %1 zieht nicht von diesem verwalteten System weg."},
    {Fault::MoveStopped, kExitRefused, "WRTL8074",
     "The move of the partition with the ID %1 was stopped.",
     "Der Umzug der Partition mit der ID %1 wurde angehalten."},
    {Fault::OtherManager, kExitRefused, "WRTL8075",
     "The manager \"%1\" cannot be reached: moves stay within this appliance.",
     "Der Verwalter \"%1\" ist nicht erreichbar: Umzüge bleiben innerhalb dieser Appliance."},
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
