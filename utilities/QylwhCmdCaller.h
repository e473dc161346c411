/// Asks the tool "qylwh" whether the appliance is a manager of a single host, and of which.
///
/// An object is made for one operation and is not shared between threads. Failures of running the
/// tool (PropertiesHelper.h), a missing one among them, come out of both operations.
#ifndef QYLWH_CMD_CALLER_H
#define QYLWH_CMD_CALLER_H

#include "StringUtils.h"
#include "ZemExport.h"

class ZEM_EXPORT zemQylwhCmdCaller {
public:
    /// @param userName  user to run the tool as; null or empty: the process's own
    explicit zemQylwhCmdCaller(const char* userName);
    virtual ~zemQylwhCmdCaller();

    /// Key of the managed partition: its number and the host's key, as "1*1111-AAB*0000002".
    /// @throws what the tool's own failures raise (CommandCaller.h)
    zemString getLWHName();

    /// Whether there is such a host, that is, whether the tool ends with 0.
    bool isLWH();

private:
    zemString parseQylwhToName(const zemString& qylwh);

    zemString m_userName;
};

#endif
