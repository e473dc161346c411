#include "CmpiInstance.h"

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

CmpiInstance::CmpiInstance() {}

CmpiInstance::CmpiInstance(const CMPIInstance* handle) : CmpiObject(handle) {}

CmpiInstance::CmpiInstance(const CmpiObjectPath& op)
    : CmpiObject(need(
          ask(CmpiProviderBase::getBroker(), &CMPIBrokerEncFT::newInstance, given(op.getEnc())))) {}

CMPIInstance* CmpiInstance::getEnc() const { return static_cast<CMPIInstance*>(enc); }

CmpiBoolean CmpiInstance::instanceIsA(const char* className) const {
    return getObjectPath().classPathIsA(className);
}

unsigned int CmpiInstance::getPropertyCount() const {
    return ask(getEnc(), &CMPIInstanceFT::getPropertyCount);
}

CmpiData CmpiInstance::getProperty(const char* name) const {
    return CmpiData(find(getEnc(), &CMPIInstanceFT::getProperty, name));
}

CmpiData CmpiInstance::getProperty(const int index, CmpiString* name) const {
    CMPIString* propertyName = nullptr;
    const CMPIData data = findAt(getEnc(), &CMPIInstanceFT::getPropertyAt, index, &propertyName);
    if (name) {
        *name = CmpiString(propertyName);
    }
    return CmpiData(data);
}

void CmpiInstance::setProperty(const char* name, const CmpiData data) {
    tell(getEnc(), &CMPIInstanceFT::setProperty, named(name), valueOf(data._data), data._data.type);
}

void CmpiInstance::setPropertyFilter(const char** properties, const char** keys) {
    // Servers walk the list of keys without a test for null.
    const char* noKeys[] = {nullptr};
    tell(getEnc(), &CMPIInstanceFT::setPropertyFilter, properties, keys ? keys : noKeys);
}

CmpiObjectPath CmpiInstance::getObjectPath() const {
    return CmpiObjectPath(need(ask(getEnc(), &CMPIInstanceFT::getObjectPath)));
}
