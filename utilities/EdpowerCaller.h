/// Powers hosts on and off, changes the state of partitions and runs system profiles, through the
/// tool "edpower".
///
///     EdpowerCaller caller(userName, locale);
///     caller.setManagedSystem(mtms);
///     caller.setResource(1);
///     caller.setOperation(1);
///     caller.setLparId(3);
///     caller.setLparProfileName("normal");
///     caller.run();
///
/// An object is good for one run(), which uses some of the settings up. It is not shared between
/// threads.
#ifndef EDPOWER_CALLER_H
#define EDPOWER_CALLER_H

#include <string>

#include "CommandCaller.h"

class ZEM_EXPORT EdpowerCaller : public zemCommandCaller {
public:
    /// @param auth,locale  as for zemCommandCaller
    EdpowerCaller(const char* auth, const char* locale);

    /// What is changed: 1 a partition, 2 the host, 3 a system profile.
    void setResource(int resource) { m_Resource = resource; }

    /// The change. Of a partition: 1 activate, 2 shut down, 3 shut down its system, 4 dump and
    /// restart, 5 turn the key. Of the host: 1 on, 6 on to standby, 7 on with a system profile,
    /// 8 rebuild, 9 off. Of a system profile: 0 validate, 1 on.
    void setOperation(int operation) { m_Operation = operation; }

    /// The host's key or name.
    void setManagedSystem(const zemString& managedSystem) { m_mtms = managedSystem; }

    /// The partition, and the profile and boot mode with which it is activated. Modes are 0 none,
    /// 1 "norm", 2 "dd", 3 "ds", 4 "of", 5 "sms". The profile stands in the line as it is, and so
    /// does a system profile: callers quote what may hold a blank, a quote or a backslash
    /// (zemCommandCaller::quoted()).
    void setLparId(int lparId) { m_LparId = lparId; }
    void setLparProfileName(const zemString& name) { m_lparProfileName = name; }
    void setBootMode(int bootMode) { m_BootMode = bootMode; }

    /// For a shutdown: at once, and with a restart behind it.
    void setImmed(bool immed) { m_Immed = immed; }
    void setRestart(bool restart) { m_Restart = restart; }

    /// The system profile, whether an activation ends at the first failure, and whether it is only
    /// tried.
    void setSysProfName(const zemString& name) { m_sysProfName = name; }
    void setStopOnError(bool stopOnError) { m_StopOnError = stopOnError; }
    void setValidateSysProfile(bool validate) { m_ValidteSysProfile = validate; }

    /// Checks the settings and runs the tool.
    /// @throws zemNotSupportedException settings that are missing or do not go together; no tool
    ///         runs then
    /// @throws what the tool's failures raise (CommandCaller.h)
    void run();

private:
    void validateParms() const;
    void validatePartition() const;
    void validateSystemProfile() const;
    std::string partitionPart();
    std::string hostPart() const;
    std::string systemProfilePart();

    int m_LparId = 0;
    int m_Resource = 0;
    int m_Operation = 0;
    int m_BootMode = 0;
    bool m_Immed = false;
    bool m_Restart = false;
    zemString m_sysProfName;
    bool m_StopOnError = false;
    bool m_ValidteSysProfile = false;
    zemString m_lparProfileName;
    bool m_useProfileFlag = true;  ///< whether the profile ends the line of a partition
    zemString m_mtms;
};

#endif
