// The outcome of a CMPI operation: a return code and perhaps a message. What a provider's
// operations return, and what every operation of the binding throws when the broker refuses it.
//
// The message is a string of the broker's, valid until the server's operation ends. Copies share
// it.
#ifndef _CmpiStatus_h_
#define _CmpiStatus_h_

#include "cmpift.h"

class CMPI_EXPORT CmpiStatus {
    friend class CmpiInstanceMI;
    friend class CmpiMethodMI;
    friend class CmpiBaseMI;
    friend class CmpiAssociationMI;
    friend class CmpiPropertyMI;
    friend class CmpiIndicationMI;
    friend class CmpiDriver;

public:
    CmpiStatus(const CMPIStatus stat);
    CmpiStatus(const CMPIrc rc);

    /// Never throws: the message is dropped when it is null, or when there is no broker to make a
    /// string of it.
    CmpiStatus(const CMPIrc rcp, const char* msg);

    CMPIrc rc() const;

    /// The message, or null when there is none.
    const char* msg() const;

protected:
    CMPIStatus st;
    CMPIStatus status() const;

private:
    CmpiStatus();
};

#endif
