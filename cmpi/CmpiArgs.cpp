#include "CmpiArgs.h"

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

CmpiArgs::CmpiArgs(CMPIArgs* handle) : CmpiObject(handle) {}

CmpiArgs::CmpiArgs() { enc = makeArgs(CmpiProviderBase::getBroker()); }

CMPIArgs* CmpiArgs::getEnc() const { return static_cast<CMPIArgs*>(enc); }

void* CmpiArgs::makeArgs(CMPIBroker* mb) { return need(ask(mb, &CMPIBrokerEncFT::newArgs)); }

unsigned int CmpiArgs::getArgCount() const { return ask(getEnc(), &CMPIArgsFT::getArgCount); }

CmpiData CmpiArgs::getArg(const char* name) const {
    return CmpiData(find(getEnc(), &CMPIArgsFT::getArg, name));
}

CmpiData CmpiArgs::getArg(const int index, CmpiString* name) const {
    CMPIString* argName = nullptr;
    const CMPIData data = findAt(getEnc(), &CMPIArgsFT::getArgAt, index, &argName);
    if (name) {
        *name = CmpiString(argName);
    }
    return CmpiData(data);
}

void CmpiArgs::setArg(const char* name, const CmpiData& data) {
    tell(getEnc(), &CMPIArgsFT::addArg, named(name), valueOf(data._data), data._data.type);
}
