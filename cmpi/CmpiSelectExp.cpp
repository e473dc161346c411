#include "CmpiSelectExp.h"

CmpiSelectExp::CmpiSelectExp() {}

CmpiSelectExp::CmpiSelectExp(const CMPISelectExp* handle) : CmpiObject(handle) {}

CMPISelectExp* CmpiSelectExp::getEnc() const { return static_cast<CMPISelectExp*>(enc); }
