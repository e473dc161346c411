#include "CmpiDateTime.h"

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

CmpiDateTime::CmpiDateTime(const CMPIDateTime* handle) : CmpiObject(handle) {}

CmpiDateTime::CmpiDateTime() { enc = makeDateTime(CmpiProviderBase::getBroker()); }

CmpiDateTime::CmpiDateTime(const CmpiDateTime& original) : CmpiObject() {
    if (!original.isNull()) {
        enc = makeDateTime(CmpiProviderBase::getBroker(), original.getDateTime(),
                           original.isInterval());
    }
}

CmpiDateTime::CmpiDateTime(const char* utcTime) {
    enc = makeDateTime(CmpiProviderBase::getBroker(), utcTime);
}

CmpiDateTime::CmpiDateTime(const CMPIUint64 binTime, const CmpiBoolean interval) {
    enc = makeDateTime(CmpiProviderBase::getBroker(), binTime, interval);
}

CMPIDateTime* CmpiDateTime::getEnc() const { return static_cast<CMPIDateTime*>(enc); }

CmpiBoolean CmpiDateTime::isInterval() const { return ask(getEnc(), &CMPIDateTimeFT::isInterval); }

CMPIUint64 CmpiDateTime::getDateTime() const {
    return ask(getEnc(), &CMPIDateTimeFT::getBinaryFormat);
}

void* CmpiDateTime::makeDateTime(CMPIBroker* mb) {
    return need(ask(mb, &CMPIBrokerEncFT::newDateTime));
}

void* CmpiDateTime::makeDateTime(CMPIBroker* mb, const char* utcTime) {
    return need(ask(mb, &CMPIBrokerEncFT::newDateTimeFromChars, given(utcTime)));
}

void* CmpiDateTime::makeDateTime(CMPIBroker* mb, const CMPIUint64 binTime,
                                 const CmpiBoolean interval) {
    return need(ask(mb, &CMPIBrokerEncFT::newDateTimeFromBinary, binTime, interval));
}
