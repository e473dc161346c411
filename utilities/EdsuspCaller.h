/// Suspends and resumes partitions through the tool "edsusp".
///
///     EdsuspCaller caller(userName, locale);
///     caller.setManagedSystem(mtms);
///     caller.setLparId(3);
///     caller.setOperation(1);
///     caller.run();
///
/// An object is made for one operation and is not shared between threads.
#ifndef EDSUSP_CALLER_H
#define EDSUSP_CALLER_H

#include "CommandCaller.h"

class ZEM_EXPORT EdsuspCaller : public zemCommandCaller {
public:
    /// @param auth,locale  as for zemCommandCaller
    EdsuspCaller(const char* auth, const char* locale);

    /// The host's key or name, and the partition.
    void setManagedSystem(const zemString& managedSystem) { m_mtms = managedSystem; }
    void setLparId(int lparId) { m_Lparid = lparId; }

    /// 1 suspend, 2 resume; and of a suspension 3 validate, 4 cancel, 5 recover, 6 shut down.
    void setOperation(int operation) { m_Operation = operation; }

    /// Held for callers that set them; the tool has no options for these.
    void setLparName(const zemString& name) { m_lparName = name; }
    void setImmed(bool immed) { m_Immed = immed; }
    void setRestart(bool restart) { m_Restart = restart; }
    void setWaitTime(long waitTime) { m_WaitTime = waitTime; }
    void setDetailLevel(int detailLevel) { m_DetailLevel = detailLevel; }

    /// Runs the tool.
    /// @throws zemNotSupportedException an operation that there is not; no tool runs then
    /// @throws what the tool's failures raise (CommandCaller.h)
    void run();

private:
    void validateParms() const;

    zemString m_mtms;
    zemString m_lparName;
    int m_Lparid = 0;
    bool m_Immed = false;
    bool m_Restart = false;
    long m_WaitTime = 0;
    int m_DetailLevel = 0;
    int m_Operation = 0;
};

#endif
