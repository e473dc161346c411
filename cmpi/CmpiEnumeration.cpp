#include "CmpiEnumeration.h"

#include "BrokerCall.h"
#include "CmpiArray.h"
#include "CmpiData.h"

using namespace brokercall;

CmpiEnumeration::CmpiEnumeration() {}

CmpiEnumeration::CmpiEnumeration(CMPIEnumeration* handle) : CmpiObject(handle) {}

CMPIEnumeration* CmpiEnumeration::getEnc() const { return static_cast<CMPIEnumeration*>(enc); }

CmpiBoolean CmpiEnumeration::hasNext() { return ask(getEnc(), &CMPIEnumerationFT::hasNext); }

CmpiData CmpiEnumeration::getNext() {
    CMPIData element = ask(getEnc(), &CMPIEnumerationFT::getNext);
    // An element is an object, never null. Servers leave the mark of an empty value on it.
    if (element.value.inst) {
        element.state = CMPI_goodValue;
    }
    return CmpiData(element);
}

CmpiData CmpiEnumeration::toArray() {
    return CmpiData(CmpiArray(need(ask(getEnc(), &CMPIEnumerationFT::toArray))));
}
