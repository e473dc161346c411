#include "CommandCaller.h"

#include <cstring>
#include <string>
#include <string_view>

#include "CommandLine.h"
#include "Exception.h"
#include "Log.h"
#include "PropertiesHelper.h"
#include "RecordParser.h"
#include "TraceTool.h"

namespace {

constexpr char kClass[] = "zemCommandCaller";
constexpr char kNoResults[] = "No results were found.";
constexpr char kErrorCode[] = "WRTL";

/// Operators of a multi-valued attribute, by zemCommandCaller::CH_OP_TYPE.
constexpr const char* kOperators[] = {"+=", "=", "-="};

constexpr int kListEnd = -1;

constexpr size_t kQueryRoom = 2048;
constexpr size_t kChangeRoom = 512;

/// The fixed front of a line; what does not fit into @p room is cut. Not within quotes, where the
/// next quote of the line would end what it begins.
std::string frontOf(const char* cmd, size_t room, const char* method) {
    std::string front = cmd != nullptr ? std::string(cmd, strnlen(cmd, room)) : std::string();
    if (front.size() == room && !zemSplitCommandLine(front.c_str()).valid()) {
        throw zemInvalidParameterException(kClass, method, front.c_str(), "INVALID_LENGTH",
                                           zemString(static_cast<int>(room)));
    }
    return front;
}

bool saysNoResults(const zemString& text) { return text.startsWith(kNoResults); }

[[noreturn]] void throwNotFound(const std::string& quotedCommand, const zemString& text) {
    throw zemObjectNotFoundException(kClass, "callGenericCommand", quotedCommand.c_str(), nullptr,
                                     text);
}

/// The name at @p index of a table.
const char* nameAt(int index, const zemAttributeNames& table, const std::string& line,
                   const char* method) {
    // As unsigned values, negative positions lie behind every table.
    if (static_cast<unsigned>(index) >= table.count) {
        throw zemInvalidParameterException(kClass, method, line.c_str(), "INVALID_INDEX",
                                           zemString(index));
    }
    return table.names[index];
}

/// Appends one item for each pair: a double-quoted assignment and a comma, with the quotes escaped
/// for the splitter.
void appendItems(std::string& line, const zemDynamicArray<tagAttributePair>& pairs,
                 const char* assignment, const zemAttributeNames& table, const char* method) {
    for (int i = 0; i < pairs.size(); ++i) {
        const tagAttributePair* pair = pairs.getElementAt(i);
        if (pair == nullptr) {
            continue;
        }
        const char* name = nameAt(pair->m_attributeIndex, table, line, method);
        line += "\\\"";
        line += name;
        line += assignment;
        line += pair->m_attributeValue;
        line += "\\\",";
    }
}

void removeTrailingCommas(std::string& line) { line.erase(line.find_last_not_of(',') + 1); }

/// The inside of a quoted field in a tool's lists.
std::string withQuotesDoubled(const char* text) {
    std::string result;
    for (; zemIsGiven(text); ++text) {
        result.append(*text == '"' ? 2 : 1, *text);
    }
    return result;
}

/// Whether a tool's filter cannot see the begin of a quoted value, or of another item, in @p text.
bool isOneValue(std::string_view text) {
    for (size_t begin = 0;; ++begin) {
        const std::string_view field = text.substr(begin);
        const size_t word = field.find_first_not_of("abcdefghijklmnopqrstuvwxyz_");
        const char after = word != field.npos ? field[word] : '\0';
        if ((word == 0 && after == '"') || (begin > 0 && word > 0 && after == '=')) {
            return false;
        }
        begin = text.find(',', begin);
        if (begin == text.npos) {
            return true;
        }
    }
}

}  // namespace

zemCommandCaller::zemCommandCaller(const char* auth, const char* locale)
    : m_auth(auth), m_locale(locale) {}

zemCommandCaller::~zemCommandCaller() = default;

zemString zemCommandCaller::quoted(const char* text) { return zemQuoted(text).c_str(); }

zemString zemCommandCaller::itemValue(const char* text) {
    return zemEscaped(withQuotesDoubled(text).c_str()).c_str();
}

zemString zemCommandCaller::filterItem(const char* name, const char* value) {
    std::string item = name + std::string("=");
    if (zemIsGiven(value)) {
        item += isOneValue(value) ? value : '"' + withQuotesDoubled(value) + '"';
    }
    return item.c_str();
}

int zemCommandCaller::callGenericCommand(const char* command, zemString* pCmdOutput,
                                         bool forceTimeOut) {
    zemString strCmdOutput;
    zemString strError;
    int exitCode = 0;
    CTimeLoger* const logger = CTimeLogerManager::getInstance()->getLogger("callGenericCommand");
    logger->begin(command);
    zemPropertiesHelper::executeCommand(command, strCmdOutput, strError, &exitCode, m_auth, 0,
                                        m_locale, forceTimeOut);
    logger->end(command);

    const std::string quotedCommand = '"' + zemTextOf(command) + '"';
    if (exitCode == 0) {
        if (saysNoResults(strCmdOutput)) {
            throwNotFound(quotedCommand, strCmdOutput.stripTrailing('\n'));
        }
        if (pCmdOutput != nullptr) {
            *pCmdOutput = std::move(strCmdOutput);
        }
        return 0;
    }
    if (strError.isEmpty()) {
        strError = strCmdOutput;
    }
    if (saysNoResults(strError)) {
        throwNotFound(quotedCommand, strError);
    }
    std::string code = "UNKNOWN";
    const char* const found = std::strstr(strError, kErrorCode);
    if (found != nullptr) {
        code.assign(found, std::strcspn(found, " \t\r\n\v\f"));
    }
    throw zemOperationFailedException(kClass, "callGenericCommand", quotedCommand.c_str(),
                                      code.c_str(), strError.stripTrailing('\n'));
}

int zemCommandCaller::callXBRGCommand(const char* command, zemString* pCmdOutput) {
    return callGenericCommand("xbrgcli " + zemString(command), pCmdOutput, true);
}

void zemCommandCaller::callLsCommand(const char* cmd, int* paramAttr, int paramAttrEndFlag,
                                     const char* const* allAttrNames, unsigned int allAttrNumber,
                                     zemRecordSetsType& results) {
    const zemAttributeNames table(allAttrNames, allAttrNumber);
    std::string line = frontOf(cmd, kQueryRoom, "callLsCommand") + " -F ";
    unsigned attrNumber = 0;
    while (paramAttr != nullptr ? paramAttr[attrNumber] != paramAttrEndFlag
                                : attrNumber < allAttrNumber) {
        const int index =
            paramAttr != nullptr ? paramAttr[attrNumber] : static_cast<int>(attrNumber);
        line += nameAt(index, table, line, "callLsCommand");
        line += ',';
        ++attrNumber;
    }
    removeTrailingCommas(line);
    zemLog::LogSysOut(line.c_str());
    zemString output;
    callGenericCommand(line.c_str(), &output, true);
    const std::string_view text(output);
    if (!zemParseRecords(text, paramAttr, attrNumber, results)) {
        throw zemOperationFailedException(kClass, "callLsCommand", line.c_str(), "INVALID_RECORD",
                                          output);
    }
}

void zemCommandCaller::appendAttributes(std::string& line,
                                        const zemDynamicArray<tagAttributePair>& singleValAttrPairs,
                                        const zemDynamicArray<tagAttributePair>& multiValAttrPairs,
                                        zemAttributeNames table, CH_OP_TYPE op,
                                        const char* attrOpt) {
    const char* const method = "BuildChCmdString";
    if (singleValAttrPairs.size() == 0 && multiValAttrPairs.size() == 0) {
        return;
    }
    line += ' ' + zemTextOf(attrOpt) + " \"";
    appendItems(line, singleValAttrPairs, "=", table, method);
    appendItems(line, multiValAttrPairs, nameAt(op, kOperators, line, method), table, method);
    removeTrailingCommas(line);
    line += '"';
}

void zemCommandCaller::BuildChCmdString(zemString& strCmd,
                                        const zemDynamicArray<tagAttributePair>& singleValAttrPairs,
                                        const zemDynamicArray<tagAttributePair>& multiValAttrPairs,
                                        const char* const* allAttrNames, unsigned int allAttrNumber,
                                        CH_OP_TYPE op, const char* attrOpt) {
    std::string line(strCmd);
    appendAttributes(line, singleValAttrPairs, multiValAttrPairs, {allAttrNames, allAttrNumber}, op,
                     attrOpt);
    strCmd = line.c_str();
}

int zemCommandCaller::callChCommand(const char* cmd,
                                    const zemDynamicArray<tagAttributePair>& singleValAttrPairs,
                                    const zemDynamicArray<tagAttributePair>& multiValAttrPairs,
                                    const char* const* allAttrNames, unsigned int allAttrNumber,
                                    CH_OP_TYPE op, const char* attrOpt) {
    std::string line = frontOf(cmd, kChangeRoom, "callChCommand");
    appendAttributes(line, singleValAttrPairs, multiValAttrPairs, {allAttrNames, allAttrNumber}, op,
                     attrOpt);
    zemLog::LogSysOut(line.c_str());
    return callGenericCommand(line.c_str(), nullptr, false);
}

int zemCommandCaller::callMkCommand(const char* cmd,
                                    const zemDynamicArray<tagAttributePair>& attrPairs,
                                    const char* const* allAttrNames, unsigned int allAttrNumber) {
    const zemAttributeNames table(allAttrNames, allAttrNumber);
    std::string line = frontOf(cmd, kChangeRoom, "callMkCommand") + " -i \"";
    appendItems(line, attrPairs, "=", table, "callMkCommand");
    removeTrailingCommas(line);
    line += '"';
    zemLog::LogSysOut(line.c_str());
    return callGenericCommand(line.c_str(), nullptr, false);
}

zemRecordSetsType zemCommandCaller::query(const zemQuery& query, int* paramAttr,
                                          const char* managedSystem, const char* filter,
                                          const char* firstOptions, const char* lastOptions) {
    std::string line = std::string(query.command) + firstOptions;
    if (query.systemTest == zemQuery::WHEN_NOT_NULL || zemIsGiven(managedSystem)) {
        line += systemOption(managedSystem);
    }
    if (zemIsGiven(filter)) {
        line += std::string(" --filter ") + filter;
    }
    line += lastOptions;
    zemRecordSetsType results(0, 25, 1);
    // Where there are no fields to ask for, none are: the records are then only counted.
    callLsCommand(line.c_str(), query.attributes.count > 0 ? paramAttr : nullptr, kListEnd,
                  query.attributes.names, query.attributes.count, results);
    return results;
}

std::string zemCommandCaller::systemOption(const char* managedSystem) {
    return managedSystem != nullptr ? " -m " + zemQuoted(managedSystem) : std::string();
}

void zemCommandCaller::callStateChange(const char* what, const std::string& line) {
    const std::string rule(28, '+');
    zemLog::LogSysOut(rule.c_str());
    zemLog::LogSysOut((what + line).c_str());
    zemLog::LogSysOut(rule.c_str());
    callGenericCommand(line.c_str(), nullptr, false);
}
