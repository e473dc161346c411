// A boolean value. CmpiData has no constructor for booleans, which are the same C type as uint8.
#ifndef _CmpiBooleanData_h_
#define _CmpiBooleanData_h_

#include "CmpiData.h"

class CMPI_EXPORT CmpiBooleanData : public CmpiData {
public:
    CmpiBooleanData(CMPIBoolean d);
};

extern CMPI_EXPORT CmpiBooleanData CmpiTrue;
extern CMPI_EXPORT CmpiBooleanData CmpiFalse;

#endif
