#include "EdallocCmdCaller.h"

#include "CommandLine.h"
#include "Exception.h"
#include "Log.h"
#include "PropertiesHelper.h"
#include "VirtualSystemRepRASD.h"

namespace {

constexpr char kEdallocCaller[] = "zemEdallocCmdCaller";

/// Quantities of processors arrive in hundredths.
constexpr int kHundredths = 100;

/// Fixed words, the placeholder included; nothing is put into them.
constexpr char kNotWhole[] =
    "\"VirtualQuantity/100\" for shared mode or \"Reservation/100\" for dedicated mode should be "
    "an integer for the command \"edalloc -r proc -m %s -o r --id lpar_id --procs\"";

// Unlike in the lines of all other tools, the system stands without quotes.

/// The front of most lines.
std::string front(const char* resource, const char* managedSystem, char operation,
                  const zemString& lparID) {
    return std::string("edalloc -r ") + resource + " -m " + zemTextOf(managedSystem) + " -o " +
           operation + " --id " + zemTextOf(lparID);
}

/// The front of lines that add a slot or an adapter, in which the operation comes first.
std::string additionFront(const char* resource, const char* managedSystem,
                          const zemString& lparID) {
    return std::string("edalloc -r ") + resource + " -o a -m " + zemTextOf(managedSystem) +
           " --id " + zemTextOf(lparID);
}

/// An option with its number, which only positive ones bring into the line.
std::string numberOption(const char* option, std::int64_t number) {
    return number > 0 ? option + std::to_string(number) : std::string();
}

std::string processorLine(const char* managedSystem, char operation, const zemString& lparID,
                          std::int64_t procs, std::int64_t procUnits) {
    std::string line = front("proc", managedSystem, operation, lparID) + ' ';
    if (procs > 0) {
        line += "--procs " + std::to_string(procs / kHundredths) + ' ';
    }
    if (procUnits > 0) {
        // Digit by digit: the decimal point of a printed float is the process locale's.
        const std::string fraction = std::to_string(kHundredths + procUnits % kHundredths);
        line += "--procunits " + std::to_string(procUnits / kHundredths) + '.' + fraction.substr(1);
    }
    return line;
}

std::string processorLog(const char* operation, std::int64_t procs, std::int64_t procUnits) {
    return std::string(operation) + ":procs:" + std::to_string(procs) +
           ";procUnits:" + std::to_string(procUnits) + ';';
}

std::string memoryLine(const char* managedSystem, char operation, const zemString& lparID,
                       std::int64_t size, std::int64_t vsize) {
    return front("mem", managedSystem, operation, lparID) + numberOption(" --entitled ", size) +
           numberOption(" -q ", vsize);
}

std::string adapterLine(const char* adapter, const char* managedSystem, const zemString& lparID,
                        std::int32_t slotID) {
    return additionFront(adapter, managedSystem, lparID) + ' ' + numberOption(" -s ", slotID);
}

std::string adapterRemoval(const char* adapter, const char* managedSystem, const zemString& lparID,
                           std::int32_t slotID) {
    return front(adapter, managedSystem, 'r', lparID) + " -s " + std::to_string(slotID) + ' ';
}

}  // namespace

zemEdallocCmdCaller::zemEdallocCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

int zemEdallocCmdCaller::addProcessing(const char* managedSystem, const zemString& lparID,
                                       std::int64_t procs, std::int64_t procUnits, pid_t* pid,
                                       FILE** fpOutput) {
    return run("addProcessing", processorLog("addProcessing", procs, procUnits),
               processorLine(managedSystem, 'a', lparID, procs, procUnits), pid, fpOutput);
}

int zemEdallocCmdCaller::removeProcessing(const char* managedSystem, const zemString& lparID,
                                          std::int64_t procs, std::int64_t procUnits, pid_t* pid,
                                          FILE** fpOutput) {
    if (procs % kHundredths != 0) {
        throw zemInvalidParameterException(kEdallocCaller, "removeProcessing", kNotWhole);
    }
    return run("removeProcessing", processorLog("removeProcessing", procs, procUnits),
               processorLine(managedSystem, 'r', lparID, procs, procUnits), pid, fpOutput);
}

int zemEdallocCmdCaller::modifyProcessing(const char* managedSystem, const zemString& lparID,
                                          zemRASD* rasd, pid_t* pid, FILE** fpOutput) {
    const zemRASDCommData& data = *rasd->getData();
    std::string settings;
    if (!data.m_SharingMode.isEmpty()) {
        settings = "sharing_mode=" + zemEscaped(data.m_SharingMode);
    }
    if (data.m_Weight != -1) {
        settings += (settings.empty() ? "" : ",");
        settings += "uncap_weight=" + std::to_string(data.m_Weight);
    }
    // Here and in modifyMemory() a failure bears another operation's name, which clients know.
    return run("removeProcessing", "modifyProcessing: ",
               front("proc", managedSystem, 's', lparID) + " -a \"" + settings + '"', pid,
               fpOutput);
}

int zemEdallocCmdCaller::addMemory(const char* managedSystem, const zemString& lparID,
                                   std::int64_t size, std::int64_t vsize, pid_t* pid,
                                   FILE** fpOutput) {
    return run("addMemory", "addMemory:", memoryLine(managedSystem, 'a', lparID, size, vsize), pid,
               fpOutput);
}

int zemEdallocCmdCaller::removeMemory(const char* managedSystem, const zemString& lparID,
                                      std::int64_t size, std::int64_t vsize, pid_t* pid,
                                      FILE** fpOutput) {
    return run("removeMemory", "removeMemory:", memoryLine(managedSystem, 'r', lparID, size, vsize),
               pid, fpOutput);
}

int zemEdallocCmdCaller::modifyMemory(const char* managedSystem, const zemString& lparID,
                                      zemRASD* rasd, pid_t* pid, FILE** fpOutput) {
    const std::string weight = std::to_string(rasd->getData()->m_Weight);
    return run("addMemory", "modifyMemory:",
               front("mem", managedSystem, 's', lparID) + " -a \"mem_weight=" + weight + '"', pid,
               fpOutput);
}

int zemEdallocCmdCaller::addIOSlot(const char* managedSystem, const zemString& lparID,
                                   const zemString& drc_index,
                                   const zemDynamicArray<tagAttributePair>& attrPairs, pid_t* pid,
                                   FILE** fpOutput) {
    const std::string line =
        additionFront("io --rsubtype slot", managedSystem, lparID) + " -l " + zemTextOf(drc_index);
    return run("addIOSlot",
               "addIOSlot:", withPairs(line, AddIOSlotAttribute::m_attributeName, attrPairs), pid,
               fpOutput);
}

int zemEdallocCmdCaller::removeIOSlot(const char* managedSystem, const zemString& lparID,
                                      const zemString& drc_index, pid_t* pid, FILE** fpOutput) {
    return run(
        "removeIOSlot", "removeIOSlot:",
        front("io  --rsubtype slot", managedSystem, 'r', lparID) + " -l " + zemTextOf(drc_index),
        pid, fpOutput);
}

/// The pair of operations of one kind of adapter.
#define ZEM_ADAPTER_OPERATIONS(KIND, RESOURCE)                                                \
    int zemEdallocCmdCaller::add##KIND(                                                       \
        const char* managedSystem, const zemString& lparID, std::int32_t slotID,              \
        const zemDynamicArray<tagAttributePair>& attrPairs, pid_t* pid, FILE** fpOutput) {    \
        return run("add" #KIND, "add" #KIND ":",                                              \
                   withPairs(adapterLine(RESOURCE, managedSystem, lparID, slotID),            \
                             Add##KIND##Attribute::m_attributeName, attrPairs),               \
                   pid, fpOutput);                                                            \
    }                                                                                         \
    int zemEdallocCmdCaller::remove##KIND(const char* managedSystem, const zemString& lparID, \
                                          std::int32_t slotID, pid_t* pid, FILE** fpOutput) { \
        return run("remove" #KIND, "remove" #KIND ":",                                        \
                   adapterRemoval(RESOURCE, managedSystem, lparID, slotID), pid, fpOutput);   \
    }

ZEM_ADAPTER_OPERATIONS(VETH, "virtualio --rsubtype eth")
ZEM_ADAPTER_OPERATIONS(VSCSI, "virtualio --rsubtype scsi")
ZEM_ADAPTER_OPERATIONS(VSERIAL, "virtualio --rsubtype serial")

std::string zemEdallocCmdCaller::withPairs(std::string line, zemAttributeNames table,
                                           const zemDynamicArray<tagAttributePair>& attrPairs) {
    appendAttributes(line, attrPairs, zemDynamicArray<tagAttributePair>(), table, CH_OP_ADD,
                     " -a ");
    return line;
}

int zemEdallocCmdCaller::run(const char* throwMethod, const std::string& logFront,
                             const std::string& line, pid_t* pid, FILE** fpOutput) {
    zemLog::LogSysOut((logFront + line).c_str());
    if (pid == nullptr || fpOutput == nullptr) {
        zemString output;
        return callGenericCommand(line.c_str(), &output, false);
    }
    const int rc =
        zemPropertiesHelper::asynExecuteCommand(line.c_str(), pid, fpOutput, m_auth, m_locale);
    if (rc != 0) {
        const std::string text = "Command:\"" + line + "\" ReturnCode:" + std::to_string(rc);
        throw zemNotSupportedException(kEdallocCaller, throwMethod, text.c_str());
    }
    return 0;
}
