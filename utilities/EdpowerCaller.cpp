#include "EdpowerCaller.h"

#include <iterator>

#include "Exception.h"

namespace {

enum Resource { PARTITION = 1, HOST = 2, SYSTEM_PROFILE = 3 };

enum PartitionOperation {
    ACTIVATE = 1,
    SHUTDOWN = 2,
    OS_SHUTDOWN = 3,
    DUMP_RESTART = 4,
    KEY_CHANGE = 5
};

enum HostOperation { ON = 1, ON_STANDBY = 6, ON_SYSTEM_PROFILE = 7, REBUILD = 8, OFF = 9 };

enum SystemProfileOperation { VALIDATE = 0, PROFILE_ON = 1 };

/// By boot mode; 0 stands for none.
constexpr const char* kBootModes[] = {nullptr, "norm", "dd", "ds", "of", "sms"};

[[noreturn]] void refuse(const char* method, const std::string& text) {
    throw zemNotSupportedException("EdpowerCaller", method, text.c_str());
}

[[noreturn]] void refuseParms(const std::string& text) { refuse("validateParms", text); }

[[noreturn]] void refuseCombination() {
    refuse("run", "parameter for the invoke method does not match CLI");
}

}  // namespace

EdpowerCaller::EdpowerCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

void EdpowerCaller::validatePartition() const {
    if (m_Operation < ACTIVATE || m_Operation > DUMP_RESTART) {
        refuseParms(std::string("edpower -r lpar operation unsupported: ") +
                    static_cast<char>(m_Operation));
    }
    if (m_LparId == 0) {
        refuseParms("edpower -r lpar requires --id");
    }
    if (m_Operation == ACTIVATE && m_lparProfileName.isEmpty()) {
        refuseParms("edpower -r lpar requires -f <lpar_profile_name>");
    }
}

void EdpowerCaller::validateSystemProfile() const {
    if (m_sysProfName.isEmpty()) {
        refuseParms("edpower -r sysprof requires -n <system_profile_name>");
    }
    if (m_Operation != VALIDATE && m_ValidteSysProfile) {
        refuseParms("edpower -r sysprof cannot have -o and --test");
    }
    if (m_Operation > PROFILE_ON) {
        refuseParms("edpower -r sysprof must have -o on");
    }
}

void EdpowerCaller::validateParms() const {
    switch (m_Resource) {
        case PARTITION:
            validatePartition();
            break;
        case HOST:
            if (m_Restart && !m_Immed) {
                refuseParms("edpower -r lpar -o shutdown --restart must have --immed");
            }
            break;
        case SYSTEM_PROFILE:
            validateSystemProfile();
            break;
        default:
            refuseParms(std::string("edpower resource type unsupported: ") +
                        static_cast<char>(m_Resource));
    }
}

std::string EdpowerCaller::partitionPart() {
    std::string part = "lpar --id " + std::to_string(m_LparId) + " -o ";
    switch (m_Operation) {
        case ACTIVATE:
            part += "on";
            if (m_BootMode < 0 || m_BootMode >= static_cast<int>(std::size(kBootModes))) {
                refuseCombination();
            }
            if (m_BootMode != 0) {
                part += std::string(" -b ") + kBootModes[m_BootMode];
            }
            m_Operation = 0;
            break;
        case SHUTDOWN:
        case OS_SHUTDOWN:
            part += m_Operation == SHUTDOWN ? "shutdown" : "osshutdown";
            part += m_Immed ? " --immed " : "";
            part += m_Restart ? " --restart " : "";
            m_useProfileFlag = false;
            break;
        case DUMP_RESTART:
            part += "dumprestart";
            m_useProfileFlag = false;
            break;
        case KEY_CHANGE:
            part += "chkey";
            break;
        default:
            refuseCombination();
    }
    if (m_useProfileFlag) {
        part += std::string(" -f ") + static_cast<const char*>(m_lparProfileName);
    }
    return part;
}

std::string EdpowerCaller::hostPart() const {
    const std::string part = "sys -o ";
    switch (m_Operation) {
        case ON:
            return part + "on";
        case ON_STANDBY:
            return part + "onstandby";
        case ON_SYSTEM_PROFILE:
            if (m_sysProfName.isEmpty()) {
                refuse("run",
                       "The command entered is either missing a required parameter or a parameter "
                       "value is invalid. The parameters that are missing or have an invalid value "
                       "are -f.");
            }
            return part + "onsysprof -f " + static_cast<const char*>(m_sysProfName);
        case REBUILD:
            return part + "rebuild";
        case OFF:
            return part + "off" + (m_Immed ? " --immed " : "") + (m_Restart ? "--restart" : "");
        default:
            refuseCombination();
    }
}

std::string EdpowerCaller::systemProfilePart() {
    std::string part = std::string("sysprof -n ") + static_cast<const char*>(m_sysProfName);
    if (m_Operation == PROFILE_ON) {
        part += " -o on ";
        m_Operation = 0;
        part += m_StopOnError ? "" : " --continue ";
    } else if (m_ValidteSysProfile) {
        part += " --test ";
        m_ValidteSysProfile = false;
    }
    return part;
}

void EdpowerCaller::run() {
    validateParms();
    std::string line = "edpower -r ";
    switch (m_Resource) {
        case PARTITION:
            line += partitionPart();
            break;
        case HOST:
            line += hostPart();
            break;
        default:
            line += systemProfilePart();
    }
    callStateChange("Change system state:", line + systemOption(m_mtms));
}
