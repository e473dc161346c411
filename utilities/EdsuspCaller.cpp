#include "EdsuspCaller.h"

#include <iterator>
#include <string>

#include "Exception.h"
#include "Log.h"

namespace {

/// By operation, of which 0 is none.
constexpr const char* kOperations[] = {nullptr,
                                       "suspend",
                                       "resume",
                                       "validate -t suspend ",
                                       "cancel -t suspend ",
                                       "recover -t suspend ",
                                       "shutdown -t suspend "};

constexpr char kRule[] = "++++++++++++++++++++++++++++";

}  // namespace

EdsuspCaller::EdsuspCaller(const char* auth, const char* locale) : zemCommandCaller(auth, locale) {}

void EdsuspCaller::validateParms() const {
    if (m_Operation < 1 || m_Operation >= static_cast<int>(std::size(kOperations))) {
        const std::string text =
            std::string("edsusp resource type unsupported: ") + static_cast<char>(m_Operation);
        throw zemNotSupportedException("EdsuspCaller", "validateParms", text.c_str());
    }
}

void EdsuspCaller::run() {
    validateParms();
    const std::string line = std::string("edsusp  -o ") + kOperations[m_Operation] + " -m \"" +
                             static_cast<const char*>(m_mtms) + "\" --id " +
                             std::to_string(m_Lparid);
    zemLog::LogSysOut(kRule);
    zemLog::LogSysOut(("Change lpar state:" + line).c_str());
    zemLog::LogSysOut(kRule);
    zemString output;
    callGenericCommand(line.c_str(), &output, false);
}
