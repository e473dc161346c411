#include "Request.h"

#include <cstdint>

#include "Failure.h"
#include "Text.h"

namespace appliance {

namespace {

constexpr unsigned kHostTools = kQyplat | kQyalloc | kQymove | kQyusage | kQyfault | kQylink;
constexpr unsigned kAttributeTools = kHostTools | kQylwh;
constexpr unsigned kChange = kEdalloc | kEdplat | kNwplat | kDlplat | kEdpower | kEdsusp | kDomove;
constexpr unsigned kAll = kAttributeTools | kQydyn | kXbrgcli | kChange;

constexpr Option kOptions[] = {
    {"-r", kHostTools, "<resource>", "what to list"},
    {"--rsubtype", kQyalloc, "<subtype>", "which kind of that resource"},
    {"--level", kQyalloc, "<level>", "whose share of it"},
    {"-m", kHostTools, "<managed system>",
     "by its name or as <type_model>*<serial_num>; all when absent or empty"},
    {"--filter", kQyplat | kQyalloc | kQymove | kQyusage | kQyfault, "\"<name>=<value>,...,...\"",
     "only records that have one of the values; several filters must all hold"},
    {"-F", kAttributeTools, "[<attribute>,...]",
     "print these values without names; all of them when the list is empty"},
    {"--maxmem", kQyalloc, "<megabytes>",
     "memory that a partition may grow to, for the required_min_mem attributes"},
    {"--procunits", kQyalloc, "<units>", "accepted; no attribute depends on it"},
    {"-n", kQyusage, "<number>", "at most so many samples, the newest"},
    {"--startyear", kQyusage, "<year>",
     "samples from here on, universal time; one hour before the end when absent"},
    {"--startmonth", kQyusage, "<1-12>", "1 when absent"},
    {"--startday", kQyusage, "<1-31>", "1 when absent"},
    {"--starthour", kQyusage, "<0-23>", "0 when absent"},
    {"--endyear", kQyusage, "<year>", "samples up to here; now when absent"},
    {"--endmonth", kQyusage, "<1-12>", "1 when absent"},
    {"--endday", kQyusage, "<1-31>", "1 when absent"},
    {"--endhour", kQyusage, "<0-23>", "0 when absent"},
    {"-dlpar", kQydyn, nullptr, "what the running partitions can change"},
    {"-c", kQydyn, "<managed system>",
     "by its name or as <type_model>_<serial_num>; all when absent or empty"},
    {"-m", kXbrgcli, "<managed system>", "by its name or as <type_model>*<serial_num>"},
    {"--id", kXbrgcli, "<lpar_id>", "the I/O server of that managed system"},
    {"-c", kXbrgcli, "<command>", "what it is to do"},
    {"-r", kEdalloc | kEdplat | kNwplat | kDlplat | kEdpower, "<resource>", "what to change"},
    {"--rsubtype", kEdalloc, "<subtype>", "which kind of that resource"},
    {"-m", kChange, "<managed system>", "by its name or as <type_model>*<serial_num>"},
    {"-o", kEdalloc | kEdpower | kEdsusp, "<operation>", "what to do"},
    {"-o", kDomove, "v|m|s", "tell whether the partition could move, move it, stop its move"},
    {"--id", kEdalloc | kDlplat | kEdpower | kEdsusp | kDomove, "<lpar_id>", "the partition"},
    {"-i", kEdplat | kNwplat, "\"\"<name>=<value>\",...\"",
     "attributes to set; += adds to a list and -= takes from it"},
    {"-a", kEdalloc, "\"\"<name>=<value>\",...\"", "attributes to set"},
    {"--procs", kEdalloc, "<number>", "whole processors"},
    {"--procunits", kEdalloc, "<units>", "processing units"},
    {"-q", kEdalloc, "<megabytes>", "memory"},
    {"--entitled", kEdalloc, "<megabytes>", "memory that I/O may use"},
    {"-s", kEdalloc, "<slot>", "virtual slot; the first free one when absent"},
    {"-l", kEdalloc, "<drc_index>", "physical slot"},
    {"-f", kEdpower, "<profile>", "the profile to start with: of the partition, or of the system"},
    {"-b", kEdpower, "norm|dd|ds|of|sms", "boot mode; that of the profile when absent"},
    {"-k", kEdpower, "norm|manual", "position of the keylock"},
    {"-n", kEdpower, "<system profile>", "the system profile"},
    {"-n", kDlplat, "<profile>", "the profile"},
    {"--immed", kEdpower, nullptr, "end at once what runs"},
    {"--restart", kEdpower, nullptr, "start again afterwards"},
    {"--continue", kEdpower, nullptr, "pass over partitions that cannot start"},
    {"--test", kEdpower, nullptr, "only tell whether it could be done"},
    {"-t", kEdsusp, "suspend", "what the operation is about"},
    {"-t", kDomove, "<managed system>", "where the partition moves to"},
    {"--ip", kDomove, "<manager>", "who manages that system, when it is another"},
    {"-u", kDomove, "<user>", "the user on that manager"},
    {"--help", kAll, nullptr, "this text"},
    {"--version", kAll, nullptr, "name and version"},
};

const Option& find(Tool tool, const std::string& name) {
    for (const Option& option : kOptions) {
        if (name == option.name && (option.tools & tool) != 0) {
            return option;
        }
    }
    throw Failure(name.rfind('-', 0) == 0 ? Fault::UnknownOption : Fault::UnexpectedArgument,
                  {name});
}

}  // namespace

std::vector<Option> optionsOf(Tool tool) {
    std::vector<Option> options;
    for (const Option& option : kOptions) {
        if ((option.tools & tool) != 0) {
            options.push_back(option);
        }
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
    if (!has(option)) {
        return absent;
    }
    std::int64_t number = 0;
    refuseIf(!wholeNumber(value(option), &number) || number < least || number > most,
             Fault::BadOptionValue, {option, value(option)});
    return number;
}

}  // namespace appliance
