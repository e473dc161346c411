// A char16 value. CmpiData has no constructor for char16, which is the same C type as uint16.
#ifndef _CmpiCharData_h_
#define _CmpiCharData_h_

#include "CmpiData.h"

class CMPI_EXPORT CmpiCharData : public CmpiData {
public:
    CmpiCharData(CMPIChar16 d);
};

#endif
