#include "CmpiArray.h"

#include "BrokerCall.h"
#include "CmpiProviderBase.h"

using namespace brokercall;

CmpiArray::CmpiArray() {}

CmpiArray::CmpiArray(CMPIArray* arr) : CmpiObject(arr) {}

CmpiArray::CmpiArray(CMPICount max, CMPIType type)
    : CmpiObject(need(ask(CmpiProviderBase::getBroker(), &CMPIBrokerEncFT::newArray, max, type))) {}

CMPIArray* CmpiArray::getEnc() const { return static_cast<CMPIArray*>(enc); }

CMPICount CmpiArray::size() const { return isNull() ? 0 : ask(getEnc(), &CMPIArrayFT::getSize); }

CmpiArrayIdx CmpiArray::operator[](CMPICount idx) const {
    if (idx >= size()) {
        throw CmpiStatus(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }
    return CmpiArrayIdx(*this, idx);
}

CmpiArrayIdx::CmpiArrayIdx(const CmpiArray& a, CMPICount i) : ar(a), idx(i) {}

CmpiData CmpiArrayIdx::getData() const {
    return CmpiData(ask(ar.getEnc(), &CMPIArrayFT::getElementAt, idx));
}

CmpiArrayIdx& CmpiArrayIdx::operator=(const CmpiData& v) {
    const CMPIType wanted = ask(ar.getEnc(), &CMPIArrayFT::getSimpleType);
    const CMPIType type = v._data.type;
    const bool sameCType = (wanted == CMPI_boolean && type == CMPI_uint8) ||
                           (wanted == CMPI_char16 && type == CMPI_uint16);
    // Some servers make arrays of strings where arrays of characters were asked for, and some take
    // a text only in the form that the array has.
    if (wanted == CMPI_string && type == CMPI_chars) {
        return *this = CmpiData(CmpiString(v.getCString()));
    }
    if (wanted == CMPI_chars && type == CMPI_string) {
        return *this = CmpiData(v.getString().charPtr());
    }
    if (type != wanted && !sameCType) {
        throw CmpiStatus(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    tell(ar.getEnc(), &CMPIArrayFT::setElementAt, idx, valueOf(v._data), wanted);
    return *this;
}

CmpiArrayIdx::operator CmpiString() const { return getString(); }
CmpiArrayIdx::operator const char*() const { return getCString(); }
CmpiArrayIdx::operator CmpiDateTime() const { return getDateTime(); }
CmpiArrayIdx::operator CmpiInstance() const { return getInstance(); }
CmpiArrayIdx::operator CmpiObjectPath() const { return getObjectPath(); }
CmpiArrayIdx::operator CMPISint8() const { return getSint8(); }
CmpiArrayIdx::operator CMPISint16() const { return getSint16(); }
CmpiArrayIdx::operator CMPISint32() const { return getSint32(); }
CmpiArrayIdx::operator CMPISint64() const { return getSint64(); }
CmpiArrayIdx::operator unsigned char() const { return getUint8(); }
CmpiArrayIdx::operator unsigned short() const { return getUint16(); }
CmpiArrayIdx::operator CMPIUint32() const { return getUint32(); }
CmpiArrayIdx::operator CMPIUint64() const { return getUint64(); }
CmpiArrayIdx::operator CMPIReal32() const { return getReal32(); }
CmpiArrayIdx::operator CMPIReal64() const { return getReal64(); }

CMPIBoolean CmpiArrayIdx::getBoolean() const { return getData().getBoolean(); }
CMPISint8 CmpiArrayIdx::getSint8() const { return getData().getSint8(); }
CMPIUint8 CmpiArrayIdx::getUint8() const { return getData().getUint8(); }
CMPISint16 CmpiArrayIdx::getSint16() const { return getData().getSint16(); }
CMPIUint16 CmpiArrayIdx::getUint16() const { return getData().getUint16(); }
CMPISint32 CmpiArrayIdx::getSint32() const { return getData().getSint32(); }
CMPIUint32 CmpiArrayIdx::getUint32() const { return getData().getUint32(); }
CMPISint64 CmpiArrayIdx::getSint64() const { return getData().getSint64(); }
CMPIUint64 CmpiArrayIdx::getUint64() const { return getData().getUint64(); }
CMPIReal32 CmpiArrayIdx::getReal32() const { return getData().getReal32(); }
CMPIReal64 CmpiArrayIdx::getReal64() const { return getData().getReal64(); }
CMPIChar16 CmpiArrayIdx::getChar16() const { return getData().getChar16(); }
CmpiString CmpiArrayIdx::getString() const { return getData().getString(); }
const char* CmpiArrayIdx::getCString() const { return getData().getCString(); }
CmpiDateTime CmpiArrayIdx::getDateTime() const { return getData().getDateTime(); }
CmpiInstance CmpiArrayIdx::getInstance() const { return getData().getInstance(); }
CmpiObjectPath CmpiArrayIdx::getObjectPath() const { return getData().getObjectPath(); }
