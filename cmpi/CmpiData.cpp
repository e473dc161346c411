#include "CmpiData.h"

#include "BrokerCall.h"
#include "CmpiBooleanData.h"
#include "CmpiCharData.h"

using namespace brokercall;

namespace {

template <class T>
CMPIData scalar(CMPIType type, T CMPIValue::*member, T value) {
    CMPIData data = {};
    data.type = type;
    data.value.*member = value;
    return data;
}

/// A value that is a pointer: null when the pointer is.
template <class T>
CMPIData handle(CMPIType type, T* CMPIValue::*member, T* value) {
    CMPIData data = scalar(type, member, value);
    if (!value) {
        data.state = CMPI_nullValue;
    }
    return data;
}

CMPIData arrayOf(CMPIArray* array) {
    if (!array) {
        CMPIData data = {};
        data.state = CMPI_nullValue;
        return data;
    }
    const CMPIType type = ask(array, &CMPIArrayFT::getSimpleType);
    return handle(static_cast<CMPIType>(type | CMPI_ARRAY), &CMPIValue::array, array);
}

/// The value, which must be of type @p wanted, or @p also. What a null value holds is not read:
/// servers don't always clear it.
template <class T>
T read(const CMPIData& data, T CMPIValue::*member, CMPIType wanted, CMPIType also) {
    if (data.type != wanted && data.type != also) {
        throw CmpiStatus(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    return data.state & CMPI_nullValue ? T() : data.value.*member;
}

template <class T>
T read(const CMPIData& data, T CMPIValue::*member, CMPIType wanted) {
    return read(data, member, wanted, wanted);
}

}  // namespace

CmpiData::CmpiData() : _data(missing()) {}
CmpiData::CmpiData(const CMPIData& data) : _data(data) {}
CmpiData::CmpiData(CMPISint8 d) { setSint8(d); }
CmpiData::CmpiData(CMPISint16 d) { setSint16(d); }
CmpiData::CmpiData(CMPISint32 d) { setSint32(d); }
CmpiData::CmpiData(CMPISint64 d) { setSint64(d); }
CmpiData::CmpiData(CMPIUint8 d) { setUint8(d); }
CmpiData::CmpiData(CMPIUint16 d) { setUint16(d); }
CmpiData::CmpiData(CMPIUint32 d) { setUint32(d); }
CmpiData::CmpiData(CMPIUint64 d) { setUint64(d); }
CmpiData::CmpiData(CMPIReal32 d) { setReal32(d); }
CmpiData::CmpiData(CMPIReal64 d) { setReal64(d); }
// These four refer to the caller's object; the setters would copy it first.
CmpiData::CmpiData(const CmpiString& d)
    : _data(handle(CMPI_string, &CMPIValue::string, d.getEnc())) {}
CmpiData::CmpiData(const CmpiDateTime& d)
    : _data(handle(CMPI_dateTime, &CMPIValue::dateTime, d.getEnc())) {}
CmpiData::CmpiData(const char* d) { setCString(d); }
CmpiData::CmpiData(const CmpiObjectPath& d) { setObjectPath(d); }
CmpiData::CmpiData(const CmpiInstance& d) { setInstance(d); }
CmpiData::CmpiData(const CmpiArray& d) { setArray(d); }
CmpiData::CmpiData(const CmpiData& d) = default;
CmpiData::~CmpiData() = default;
CmpiData& CmpiData::operator=(const CmpiData& d) = default;

CmpiBooleanData::CmpiBooleanData(CMPIBoolean d) { setBoolean(d); }
CmpiCharData::CmpiCharData(CMPIChar16 d) { setChar16(d); }

CmpiBooleanData CmpiTrue(1);
CmpiBooleanData CmpiFalse(0);

void CmpiData::setBoolean(const CmpiBoolean d) {
    _data = scalar(CMPI_boolean, &CMPIValue::boolean, d);
}
void CmpiData::setSint8(const CMPISint8 d) { _data = scalar(CMPI_sint8, &CMPIValue::sint8, d); }
void CmpiData::setUint8(const CMPIUint8 d) { _data = scalar(CMPI_uint8, &CMPIValue::uint8, d); }
void CmpiData::setSint16(const CMPISint16 d) { _data = scalar(CMPI_sint16, &CMPIValue::sint16, d); }
void CmpiData::setUint16(const CMPIUint16 d) { _data = scalar(CMPI_uint16, &CMPIValue::uint16, d); }
void CmpiData::setSint32(const CMPISint32 d) { _data = scalar(CMPI_sint32, &CMPIValue::sint32, d); }
void CmpiData::setUint32(const CMPIUint32 d) { _data = scalar(CMPI_uint32, &CMPIValue::uint32, d); }
void CmpiData::setSint64(const CMPISint64 d) { _data = scalar(CMPI_sint64, &CMPIValue::sint64, d); }
void CmpiData::setUint64(const CMPIUint64 d) { _data = scalar(CMPI_uint64, &CMPIValue::uint64, d); }
void CmpiData::setReal32(const CMPIReal32 d) { _data = scalar(CMPI_real32, &CMPIValue::real32, d); }
void CmpiData::setReal64(const CMPIReal64 d) { _data = scalar(CMPI_real64, &CMPIValue::real64, d); }
void CmpiData::setChar16(const CMPIChar16 d) { _data = scalar(CMPI_char16, &CMPIValue::char16, d); }
void CmpiData::setString(const CmpiString d) {
    _data = handle(CMPI_string, &CMPIValue::string, d.getEnc());
}
void CmpiData::setCString(const char* d) {
    _data = handle(CMPI_chars, &CMPIValue::chars, const_cast<char*>(d));
}
void CmpiData::setDateTime(const CmpiDateTime d) {
    _data = handle(CMPI_dateTime, &CMPIValue::dateTime, d.getEnc());
}
void CmpiData::setArray(const CmpiArray d) { _data = arrayOf(d.getEnc()); }
void CmpiData::setInstance(const CmpiInstance d) {
    _data = handle(CMPI_instance, &CMPIValue::inst, d.getEnc());
}
void CmpiData::setObjectPath(const CmpiObjectPath d) {
    _data = handle(CMPI_ref, &CMPIValue::ref, d.getEnc());
}

CMPIBoolean CmpiData::getBoolean() const {
    return read(_data, &CMPIValue::boolean, CMPI_boolean, CMPI_uint8);
}
CMPISint8 CmpiData::getSint8() const { return read(_data, &CMPIValue::sint8, CMPI_sint8); }
CMPIUint8 CmpiData::getUint8() const { return read(_data, &CMPIValue::uint8, CMPI_uint8); }
CMPISint16 CmpiData::getSint16() const { return read(_data, &CMPIValue::sint16, CMPI_sint16); }
CMPIUint16 CmpiData::getUint16() const { return read(_data, &CMPIValue::uint16, CMPI_uint16); }
CMPISint32 CmpiData::getSint32() const { return read(_data, &CMPIValue::sint32, CMPI_sint32); }
CMPIUint32 CmpiData::getUint32() const { return read(_data, &CMPIValue::uint32, CMPI_uint32); }
CMPISint64 CmpiData::getSint64() const { return read(_data, &CMPIValue::sint64, CMPI_sint64); }
CMPIUint64 CmpiData::getUint64() const { return read(_data, &CMPIValue::uint64, CMPI_uint64); }
CMPIReal32 CmpiData::getReal32() const { return read(_data, &CMPIValue::real32, CMPI_real32); }
CMPIReal64 CmpiData::getReal64() const { return read(_data, &CMPIValue::real64, CMPI_real64); }
CMPIChar16 CmpiData::getChar16() const {
    return read(_data, &CMPIValue::char16, CMPI_char16, CMPI_uint16);
}
CmpiString CmpiData::getString() const {
    return CmpiString(read(_data, &CMPIValue::string, CMPI_string));
}
const char* CmpiData::getCString() const { return read(_data, &CMPIValue::chars, CMPI_chars); }
CmpiDateTime CmpiData::getDateTime() const {
    return CmpiDateTime(read(_data, &CMPIValue::dateTime, CMPI_dateTime));
}
CmpiArray CmpiData::getArray() const {
    return CmpiArray(
        read(_data, &CMPIValue::array, static_cast<CMPIType>(_data.type | CMPI_ARRAY)));
}
CmpiInstance CmpiData::getInstance() const {
    return CmpiInstance(read(_data, &CMPIValue::inst, CMPI_instance));
}
CmpiObjectPath CmpiData::getObjectPath() const {
    return CmpiObjectPath(read(_data, &CMPIValue::ref, CMPI_ref));
}

CmpiData::operator CmpiString() const { return getString(); }
CmpiData::operator const char*() const { return getCString(); }
CmpiData::operator CmpiDateTime() const { return getDateTime(); }
CmpiData::operator CMPISint8() const { return getSint8(); }
CmpiData::operator CMPISint16() const { return getSint16(); }
CmpiData::operator CMPISint32() const { return getSint32(); }
CmpiData::operator CMPISint64() const { return getSint64(); }
CmpiData::operator unsigned char() const { return getBoolean(); }
CmpiData::operator unsigned short() const { return getChar16(); }
CmpiData::operator CMPIUint32() const { return getUint32(); }
CmpiData::operator CMPIUint64() const { return getUint64(); }
CmpiData::operator CMPIReal32() const { return getReal32(); }
CmpiData::operator CMPIReal64() const { return getReal64(); }
CmpiData::operator CmpiArray() const { return getArray(); }
CmpiData::operator CmpiInstance() const { return getInstance(); }
CmpiData::operator CmpiObjectPath() const { return getObjectPath(); }

int CmpiData::isNullValue() const { return _data.state & CMPI_nullValue; }
int CmpiData::isNotFound() const { return _data.state & CMPI_notFound; }
CMPIType CmpiData::getType() const { return _data.type; }
