#include "CmpiObject.h"

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

CmpiObject::CmpiObject() : enc(nullptr) {}

CmpiObject::CmpiObject(const void* handle) : enc(const_cast<void*>(handle)) {}

CmpiBoolean CmpiObject::isNull() const { return enc == nullptr; }

CmpiString CmpiObject::toString() { return doToString(CmpiProviderBase::getBroker()); }

CmpiBoolean CmpiObject::isA(const char* typeName) const {
    return doIsA(CmpiProviderBase::getBroker(), typeName);
}

CmpiString CmpiObject::doToString(CMPIBroker* mb) {
    return CmpiString(ask(mb, &CMPIBrokerEncFT::toString, given(enc)));
}

CmpiBoolean CmpiObject::doIsA(CMPIBroker* mb, const char* typeName) const {
    return ask(mb, &CMPIBrokerEncFT::isOfType, given(enc), named(typeName));
}
