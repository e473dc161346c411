#include "QylwhCmdCaller.h"

#include <string>

#include "CommandCaller.h"
#include "PropertiesHelper.h"

namespace {

constexpr char kTool[] = "qylwh";

/// Takes the text before the first comma off @p rest.
std::string takeField(std::string& rest) {
    const size_t comma = rest.find(',');
    std::string field = rest.substr(0, comma);
    rest.erase(0, comma == std::string::npos ? comma : comma + 1);
    return field;
}

}  // namespace

zemQylwhCmdCaller::zemQylwhCmdCaller(const char* userName) : m_userName(userName) {}

zemQylwhCmdCaller::~zemQylwhCmdCaller() = default;

zemString zemQylwhCmdCaller::getLWHName() {
    zemString output;
    zemCommandCaller caller(m_userName, nullptr);
    caller.callGenericCommand(kTool, &output, true);
    return parseQylwhToName(output);
}

bool zemQylwhCmdCaller::isLWH() {
    zemString output;
    zemString error;
    int exitCode = -1;
    zemPropertiesHelper::executeCommand(kTool, output, error, &exitCode, m_userName, 0, nullptr,
                                        true);
    return exitCode == 0;
}

zemString zemQylwhCmdCaller::parseQylwhToName(const zemString& qylwh) {
    std::string rest(zemString::stripTrailing(qylwh, '\n'));
    const std::string typeModel = takeField(rest);
    const std::string serialNum = takeField(rest);
    return zemString((rest + '*' + typeModel + '*' + serialNum).c_str());
}
