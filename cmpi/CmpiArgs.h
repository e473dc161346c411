// The arguments of a method call, by name.
#ifndef _CmpiArgs_h_
#define _CmpiArgs_h_

#include "CmpiBaseMI.h"
#include "CmpiBroker.h"
#include "CmpiData.h"
#include "CmpiObject.h"
#include "CmpiObjectPath.h"

class CMPI_EXPORT CmpiArgs : public CmpiObject {
    friend class CmpiBroker;
    friend class CmpiMethodMI;
    friend class CmpiDriver;

public:
    /// No arguments yet.
    CmpiArgs();

    unsigned int getArgCount() const;

    /// Arguments by name or by position, which runs from 0 to getArgCount() - 1; @p name, unless
    /// null, is given the argument's name. An argument that is not there gives a value that is both
    /// null and not found, without exception.
    CmpiData getArg(const char* name) const;
    CmpiData getArg(const int index, CmpiString* name = NULL) const;

    /// Sets an argument, adding it when it is new. A null value sets it to null.
    void setArg(const char* name, const CmpiData& data);

protected:
    CmpiArgs(CMPIArgs* enc);
    CMPIArgs* getEnc() const;
    void* makeArgs(CMPIBroker* mb);
};

#endif
