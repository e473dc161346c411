#include "Request.h"

#include <cstdint>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr unsigned kByHost = kQyplat | kQyalloc | kQymove | kQyusage | kQyfault | kQylink;
constexpr unsigned kByAttribute = kByHost | kQylwh;
constexpr unsigned kChange = kEdalloc | kEdplat | kNwplat | kDlplat | kEdpower | kEdsusp | kDomove;
constexpr unsigned kAll = kByAttribute | kQydyn | kXbrgcli | kChange;

constexpr Option kOptions[] = {
    {"-r", kByHost, "<resource>", "what to list", "was aufgelistet wird"},
    {"--rsubtype", kQyalloc, "<subtype>", "which kind of that resource",
     "welche Art dieser Ressource"},
    {"--level", kQyalloc, "<level>", "whose share of it", "wessen Anteil daran"},
    {"-m", kByHost, "<managed system>",
     "by its name or as <type_model>*<serial_num>; all when absent or empty",
     "mit Namen oder als <type_model>*<serial_num>; alle, wenn es fehlt oder leer ist"},
    {"--filter", kQyplat | kQyalloc | kQymove | kQyusage | kQyfault, "\"<name>=<value>,...,...\"",
     "only records that have one of the values; several filters must all hold",
     "nur Sätze, die einen der Werte haben; mehrere Filter müssen alle zutreffen"},
    {"-F", kByAttribute, "[<attribute>,...]",
     "print these values without names; all of them when the list is empty",
     "diese Werte ohne Namen ausgeben; alle, wenn die Liste leer ist"},
    {"--maxmem", kQyalloc, "<megabytes>",
     "memory that a partition may grow to, for the required_min_mem attributes",
     "Speicher, bis zu dem eine Partition wachsen darf, für die Attribute required_min_mem"},
    {"--procunits", kQyalloc, "<units>", "accepted; no attribute depends on it",
     "wird angenommen; kein Attribut hängt davon ab"},
    {"-n", kQyusage, "<number>", "at most so many samples, the newest",
     "höchstens so viele Messungen, die neuesten"},
    {"--startyear", kQyusage, "<year>",
     "samples from here on, universal time; one hour before the end when absent",
     "Messungen ab hier, Weltzeit; eine Stunde vor dem Ende, wenn es fehlt"},
    {"--startmonth", kQyusage, "<1-12>", "1 when absent", "1, wenn es fehlt"},
    {"--startday", kQyusage, "<1-31>", "1 when absent", "1, wenn es fehlt"},
    {"--starthour", kQyusage, "<0-23>", "0 when absent", "0, wenn es fehlt"},
    {"--endyear", kQyusage, "<year>", "samples up to here; now when absent",
     "Messungen bis hier; bis jetzt, wenn es fehlt"},
    {"--endmonth", kQyusage, "<1-12>", "1 when absent", "1, wenn es fehlt"},
    {"--endday", kQyusage, "<1-31>", "1 when absent", "1, wenn es fehlt"},
    {"--endhour", kQyusage, "<0-23>", "0 when absent", "0, wenn es fehlt"},
    {"-dlpar", kQydyn, nullptr, "what the running partitions can change",
     "was die laufenden Partitionen ändern können"},
    {"-c", kQydyn, "<managed system>",
     "by its name or as <type_model>_<serial_num>; all when absent or empty",
     "mit Namen oder als <type_model>_<serial_num>; alle, wenn es fehlt oder leer ist"},
    {"-m", kXbrgcli, "<managed system>", "by its name or as <type_model>*<serial_num>",
     "mit Namen oder als <type_model>*<serial_num>"},
    {"--id", kXbrgcli, "<lpar_id>", "the I/O server of that managed system",
     "der I/O-Server dieses verwalteten Systems"},
    {"-c", kXbrgcli, "<command>", "what it is to do", "was er tun soll"},
    {"-r", kEdalloc | kEdplat | kNwplat | kDlplat | kEdpower, "<resource>", "what to change",
     "was geändert wird"},
    {"--rsubtype", kEdalloc, "<subtype>", "which kind of that resource",
     "welche Art dieser Ressource"},
    {"-m", kChange, "<managed system>", "by its name or as <type_model>*<serial_num>",
     "mit Namen oder als <type_model>*<serial_num>"},
    {"-o", kEdalloc | kEdpower | kEdsusp, "<operation>", "what to do", "was zu tun ist"},
    {"-o", kDomove, "v|m|s", "tell whether the partition could move, move it, stop its move",
     "sagen, ob die Partition umziehen könnte, sie umziehen, ihren Umzug anhalten"},
    {"--id", kEdalloc | kDlplat | kEdpower | kEdsusp | kDomove, "<lpar_id>", "the partition",
     "die Partition"},
    {"-i", kEdplat | kNwplat, "\"\"<name>=<value>\",...\"",
     "attributes to set; += adds to a list and -= takes from it",
     "zu setzende Attribute; += ergänzt eine Liste, -= nimmt aus ihr heraus"},
    {"-a", kEdalloc, "\"\"<name>=<value>\",...\"", "attributes to set", "zu setzende Attribute"},
    {"--procs", kEdalloc, "<number>", "whole processors", "ganze Prozessoren"},
    {"--procunits", kEdalloc, "<units>", "processing units", "Prozessoreinheiten"},
    {"-q", kEdalloc, "<megabytes>", "memory", "Speicher"},
    {"--entitled", kEdalloc, "<megabytes>", "memory that I/O may use",
     "Speicher, den die Ein-/Ausgabe benutzen darf"},
    {"-s", kEdalloc, "<slot>", "virtual slot; the first free one when absent",
     "virtueller Steckplatz; der erste freie, wenn es fehlt"},
    {"-l", kEdalloc, "<drc_index>", "physical slot", "physischer Steckplatz"},
    {"-f", kEdpower, "<profile>", "the profile to start with: of the partition, or of the system",
     "das Profil, mit dem gestartet wird: der Partition oder des Systems"},
    {"-b", kEdpower, "norm|dd|ds|of|sms", "boot mode; that of the profile when absent",
     "Startmodus; der des Profils, wenn es fehlt"},
    {"-k", kEdpower, "norm|manual", "position of the keylock", "Stellung des Schlüsselschalters"},
    {"-n", kEdpower, "<system profile>", "the system profile", "das Systemprofil"},
    {"--immed", kEdpower, nullptr, "end at once what runs", "sofort beenden, was läuft"},
    {"--restart", kEdpower, nullptr, "start again afterwards", "danach wieder starten"},
    {"--continue", kEdpower, nullptr, "pass over partitions that cannot start",
     "Partitionen übergehen, die nicht starten können"},
    {"--test", kEdpower, nullptr, "only tell whether it could be done",
     "nur sagen, ob es möglich wäre"},
    {"-t", kEdsusp, "suspend", "what the operation is about", "worum es bei der Operation geht"},
    {"-t", kDomove, "<managed system>", "where the partition moves to",
     "wohin die Partition umzieht"},
    {"--ip", kDomove, "<manager>", "who manages that system, when it is another",
     "wer dieses System verwaltet, wenn es ein anderer ist"},
    {"-u", kDomove, "<user>", "the user on that manager", "der Benutzer bei diesem Verwalter"},
    {"--help", kAll, nullptr, "this text", "dieser Text"},
};

const Option& find(Tool tool, const std::string& name) {
    for (const Option& option : kOptions) {
        if (name == option.name && (option.tools & tool) != 0) return option;
    }
    throw Failure(name.rfind('-', 0) == 0 ? Fault::UnknownOption : Fault::UnexpectedArgument,
                  {name});
}

}  // namespace

std::vector<Option> optionsOf(Tool tool) {
    std::vector<Option> options;
    for (const Option& option : kOptions) {
        if ((option.tools & tool) != 0) options.push_back(option);
    }
    return options;
}

Request::Request(const ToolName& tool, const char* const* arguments) : m_tool(tool) {
    while (*arguments != nullptr) {
        const Option& option = find(tool.tool, *arguments++);
        std::string value;
        if (option.value != nullptr) {
            // The bare -F at the end of a line asks for all attributes.
            const bool optional = *option.value == '[';
            if (*arguments != nullptr && !(optional && **arguments == '-')) {
                value = *arguments++;
            } else if (!optional) {
                throw Failure(Fault::MissingValue, {option.name});
            }
        }
        refuseIf(!m_values.emplace(option.name, value).second, Fault::RepeatedOption,
                 {option.name});
    }
}

std::string Request::value(const char* option) const {
    const auto found = m_values.find(option);
    return found == m_values.end() ? std::string() : found->second;
}

std::int64_t Request::number(const char* option, std::int64_t least, std::int64_t most,
                             std::int64_t absent) const {
    if (!has(option)) return absent;
    std::int64_t number = 0;
    refuseIf(!wholeNumber(value(option), &number) || number < least || number > most,
             Fault::BadOptionValue, {option, value(option)});
    return number;
}

}  // namespace appliance
