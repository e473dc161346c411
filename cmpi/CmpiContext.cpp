#include "CmpiContext.h"

#include "BrokerCall.h"

using namespace brokercall;

const char* CmpiContext::invocationFlags = CMPIInvocationFlags;

CmpiContext::CmpiContext() {}

CmpiContext::CmpiContext(CMPIContext* c) : CmpiObject(c) {}

CMPIContext* CmpiContext::getEnc() const { return static_cast<CMPIContext*>(enc); }

CmpiData CmpiContext::getEntry(const char* name) const {
    return CmpiData(ask(getEnc(), &CMPIContextFT::getEntry, named(name)));
}
