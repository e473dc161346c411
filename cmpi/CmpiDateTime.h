// A CIM date-time: a point in time or an interval, to the microsecond.
//
// Copy construction makes a date-time of its own, assignment shares the handle.
#ifndef _CmpiDateTime_h_
#define _CmpiDateTime_h_

#include "CmpiObject.h"

class CMPI_EXPORT CmpiDateTime : public CmpiObject {
public:
    CmpiDateTime(const CMPIDateTime* enc);

    /// Now.
    CmpiDateTime();
    CmpiDateTime(const CmpiDateTime& original);
    CmpiDateTime& operator=(const CmpiDateTime& original) = default;

    /// From the CIM form, "yyyymmddhhmmss.mmmmmmsutc" or "ddddddddhhmmss.mmmmmm:000".
    CmpiDateTime(const char* utcTime);

    /// From microseconds: of the interval, or since 1970 UTC.
    CmpiDateTime(const CMPIUint64 binTime, const CmpiBoolean interval);

    CmpiBoolean isInterval() const;

    /// Microseconds, as the constructor takes them.
    CMPIUint64 getDateTime() const;
    CMPIDateTime* getEnc() const;

protected:
    void* makeDateTime(CMPIBroker* mb);
    void* makeDateTime(CMPIBroker* mb, const char* utcTime);
    void* makeDateTime(CMPIBroker* mb, const CMPIUint64 binTime, const CmpiBoolean interval);
};

#endif
