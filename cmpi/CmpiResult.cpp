#include "CmpiResult.h"

#include "BrokerCall.h"

using namespace brokercall;

CmpiResult::CmpiResult() {}

CmpiResult::CmpiResult(CMPIResult* r) : CmpiObject(r) {}

CMPIResult* CmpiResult::getEnc() const { return static_cast<CMPIResult*>(enc); }

void CmpiResult::returnData(const CmpiData& d) {
    tell(getEnc(), &CMPIResultFT::returnData, valueOf(d._data), d._data.type);
}

void CmpiResult::returnData(const CmpiInstance& d) {
    tell(getEnc(), &CMPIResultFT::returnInstance, given(d.getEnc()));
}

void CmpiResult::returnData(const CmpiObjectPath& d) {
    tell(getEnc(), &CMPIResultFT::returnObjectPath, given(d.getEnc()));
}

void CmpiResult::returnDone() { tell(getEnc(), &CMPIResultFT::returnDone); }
