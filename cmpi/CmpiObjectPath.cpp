#include "CmpiObjectPath.h"

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

CmpiObjectPath::CmpiObjectPath(const char* ns, const char* cls)
    : CmpiObject(need(ask(CmpiProviderBase::getBroker(), &CMPIBrokerEncFT::newObjectPath,
                          orEmpty(ns), orEmpty(cls)))) {}

CmpiObjectPath::CmpiObjectPath(const CmpiString& ns, const char* cls)
    : CmpiObjectPath(ns.charPtr(), cls) {}

CmpiObjectPath::CmpiObjectPath(CMPIObjectPath* c) : CmpiObject(c) {}

CMPIObjectPath* CmpiObjectPath::getEnc() const { return static_cast<CMPIObjectPath*>(enc); }

CmpiBoolean CmpiObjectPath::classPathIsA(const char* className) const {
    return ask(CmpiProviderBase::getBroker(), &CMPIBrokerEncFT::classPathIsA, given(getEnc()),
               named(className));
}

CmpiString CmpiObjectPath::getHostname() const {
    return CmpiString(ask(getEnc(), &CMPIObjectPathFT::getHostname));
}

void CmpiObjectPath::setHostname(const char* hn) {
    tell(getEnc(), &CMPIObjectPathFT::setHostname, orEmpty(hn));
}

void CmpiObjectPath::setHostname(CmpiString hn) { setHostname(hn.charPtr()); }

CmpiString CmpiObjectPath::getNameSpace() const {
    return CmpiString(ask(getEnc(), &CMPIObjectPathFT::getNameSpace));
}

void CmpiObjectPath::setNameSpace(const char* ns) {
    tell(getEnc(), &CMPIObjectPathFT::setNameSpace, orEmpty(ns));
}

void CmpiObjectPath::setNameSpace(CmpiString ns) { setNameSpace(ns.charPtr()); }

CmpiString CmpiObjectPath::getClassName() const {
    return CmpiString(ask(getEnc(), &CMPIObjectPathFT::getClassName));
}

void CmpiObjectPath::setClassName(const char* cn) {
    tell(getEnc(), &CMPIObjectPathFT::setClassName, orEmpty(cn));
}

void CmpiObjectPath::setClassName(CmpiString cn) { setClassName(cn.charPtr()); }

unsigned int CmpiObjectPath::getKeyCount() const {
    return ask(getEnc(), &CMPIObjectPathFT::getKeyCount);
}

CmpiData CmpiObjectPath::getKey(const char* name) const {
    return CmpiData(ask(getEnc(), &CMPIObjectPathFT::getKey, named(name)));
}

CmpiData CmpiObjectPath::getKey(const int index, CmpiString* name) const {
    if (index < 0) {
        throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND);
    }
    CMPIString* keyName = nullptr;
    const CMPIData data =
        ask(getEnc(), &CMPIObjectPathFT::getKeyAt, static_cast<CMPICount>(index), &keyName);
    if (name) {
        *name = CmpiString(keyName);
    }
    return CmpiData(data);
}

void CmpiObjectPath::setKey(const char* name, const CmpiData data) {
    const CMPIValue* value = valueOf(data._data);
    if (!value) {
        throw CmpiStatus(CMPI_RC_ERR_INVALID_PARAMETER, name);
    }
    tell(getEnc(), &CMPIObjectPathFT::addKey, named(name), value, data._data.type);
}
