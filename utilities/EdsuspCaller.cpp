#include "EdsuspCaller.h"

#include <iterator>

#include "Exception.h"

namespace {

/// By operation, of which 0 is none.
constexpr const char* kOperations[] = {nullptr,
                                       "suspend",
                                       "resume",
                                       "validate -t suspend ",
                                       "cancel -t suspend ",
                                       "recover -t suspend ",
                                       "shutdown -t suspend "};

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
    callStateChange("Change lpar state:", std::string("edsusp  -o ") + kOperations[m_Operation] +
                                              systemOption(m_mtms) + " --id " +
                                              std::to_string(m_Lparid));
}
