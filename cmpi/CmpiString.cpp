#include "CmpiString.h"

#include <strings.h>

#include <cstring>

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

namespace {

using Compare = int (*)(const char*, const char*);

CmpiBoolean same(const char* left, const char* right, Compare compare) {
    if (!left || !right) {
        return left == right;
    }
    return compare(left, right) == 0;
}

}  // namespace

CmpiString::CmpiString() : enc(nullptr) {}

CmpiString::CmpiString(const char* s)
    : enc(s ? need(ask(CmpiProviderBase::getBroker(), &CMPIBrokerEncFT::newString, s)) : nullptr) {}

CmpiString::CmpiString(const CmpiString& s) : CmpiString(s.charPtr()) {}

CmpiString::CmpiString(CMPIString* c) : enc(c) {}

CMPIString* CmpiString::getEnc() const { return static_cast<CMPIString*>(enc); }

const char* CmpiString::charPtr() const {
    const CMPIString* text = getEnc();
    return text && text->ft && text->ft->getCharPtr ? text->ft->getCharPtr(text, nullptr) : nullptr;
}

CmpiBoolean CmpiString::equals(const char* str) const { return same(charPtr(), str, std::strcmp); }

CmpiBoolean CmpiString::equals(const CmpiString& str) const { return equals(str.charPtr()); }

CmpiBoolean CmpiString::equalsIgnoreCase(const char* str) const {
    return same(charPtr(), str, strcasecmp);
}

CmpiBoolean CmpiString::equalsIgnoreCase(const CmpiString& str) const {
    return equalsIgnoreCase(str.charPtr());
}
