// Where a provider puts its answer: objects one after the other, and then returnDone.
//
// All operations throw CmpiStatus when the server takes no more.
#ifndef _CmpiResult_h_
#define _CmpiResult_h_

#include "CmpiData.h"
#include "CmpiInstance.h"
#include "CmpiObject.h"
#include "CmpiObjectPath.h"

class CMPI_EXPORT CmpiResult : public CmpiObject {
    friend class CmpiInstanceMI;
    friend class CmpiAssociationMI;
    friend class CmpiMethodMI;
    friend class CmpiPropertyMI;
    friend class CmpiIndicationMI;
    friend class CmpiDriver;

public:
    /// A method's return value or a property's value; a null value is returned as null.
    void returnData(const CmpiData& d);
    void returnData(const CmpiInstance& d);
    void returnData(const CmpiObjectPath& d);
    void returnDone();

protected:
    CmpiResult(CMPIResult* r);
    CMPIResult* getEnc() const;

private:
    CmpiResult();
};

#endif
