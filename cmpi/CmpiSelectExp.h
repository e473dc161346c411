// The filter of an indication subscription, passed through to the provider.
#ifndef _CmpiSelectExp_h_
#define _CmpiSelectExp_h_

#include "CmpiBroker.h"
#include "CmpiData.h"
#include "CmpiObject.h"
#include "CmpiObjectPath.h"

class CMPI_EXPORT CmpiSelectExp : public CmpiObject {
    friend class CmpiBroker;
    friend class CmpiResult;
    friend class CmpiIndicationMI;
    friend class CmpiDriver;

protected:
    CmpiSelectExp(const CMPISelectExp* enc);
    CMPISelectExp* getEnc() const;

private:
    CmpiSelectExp();
};

#endif
