#include "CmpiEnumeration.h"

#include "BrokerCall.h"
#include "CmpiArray.h"
#include "CmpiData.h"

using namespace brokercall;

CmpiEnumeration::CmpiEnumeration() {}

CmpiEnumeration::CmpiEnumeration(CMPIEnumeration* handle) : CmpiObject(handle) {}

CMPIEnumeration* CmpiEnumeration::getEnc() const { return static_cast<CMPIEnumeration*>(enc); }

CmpiBoolean CmpiEnumeration::hasNext() { return ask(getEnc(), &CMPIEnumerationFT::hasNext); }

CmpiData CmpiEnumeration::getNext() { return CmpiData(ask(getEnc(), &CMPIEnumerationFT::getNext)); }

CmpiData CmpiEnumeration::toArray() {
    return CmpiData(CmpiArray(need(ask(getEnc(), &CMPIEnumerationFT::toArray))));
}
