// A CIM value with its type and state, as properties, keys and arguments hold it.
//
// A CmpiData refers to strings, paths, instances and arrays without owning them: the text of a
// const char* value in particular must outlive it. Reading asks for exactly the type at hand and
// throws CMPI_RC_ERR_TYPE_MISMATCH for another, with two exceptions: boolean and uint8, and char16
// and uint16, may stand for each other where a reader says so. Reading a null value gives the zero
// of its type: 0, a null text, a null handle.
#ifndef _CmpiData_h_
#define _CmpiData_h_

#include "CmpiArray.h"
#include "CmpiDateTime.h"
#include "CmpiInstance.h"
#include "CmpiObjectPath.h"
#include "CmpiString.h"

class CmpiBooleanData;
class CmpiCharData;

class CMPI_EXPORT CmpiData {
    friend class CmpiInstance;
    friend class CmpiObjectPath;
    friend class CmpiResult;
    friend class CmpiArgs;
    friend class CmpiArrayIdx;
    friend class CmpiBroker;
    friend class CmpiContext;
    friend class CmpiPropertyMI;
    friend class CmpiDriver;
    friend class CmpiEnumeration;

public:
    /// Nothing: a value of no type, null and not found.
    CmpiData();

    // Booleans and char16 are CmpiBooleanData and CmpiCharData. A null text, string, path,
    // instance, date-time or array makes a null value.
    CmpiData(CMPISint8 d);
    CmpiData(CMPISint16 d);
    CmpiData(CMPISint32 d);
    CmpiData(CMPISint64 d);
    CmpiData(CMPIUint8 d);
    CmpiData(CMPIUint16 d);
    CmpiData(CMPIUint32 d);
    CmpiData(CMPIUint64 d);
    CmpiData(CMPIReal32 d);
    CmpiData(CMPIReal64 d);
    CmpiData(const CmpiString& d);
    CmpiData(const char* d);
    CmpiData(const CmpiObjectPath& d);
    CmpiData(const CmpiInstance& d);
    CmpiData(const CmpiDateTime& d);
    CmpiData(const CmpiArray& d);

    CmpiData(const CmpiData& d);
    ~CmpiData();
    CmpiData& operator=(const CmpiData& d);

    // The conversions are the readers below; those to unsigned char and unsigned short read uint8
    // or boolean, and uint16 or char16.
    operator CmpiString() const;
    operator const char*() const;
    operator CmpiDateTime() const;
    operator CMPISint8() const;
    operator CMPISint16() const;
    operator CMPISint32() const;
    operator CMPISint64() const;
    operator unsigned char() const;
    operator unsigned short() const;
    operator CMPIUint32() const;
    operator CMPIUint64() const;
    operator CMPIReal32() const;
    operator CMPIReal64() const;
    operator CmpiArray() const;
    operator CmpiInstance() const;
    operator CmpiObjectPath() const;

    /// Of a boolean or uint8.
    CMPIBoolean getBoolean() const;
    CMPISint8 getSint8() const;
    CMPIUint8 getUint8() const;
    CMPISint16 getSint16() const;
    CMPIUint16 getUint16() const;
    CMPISint32 getSint32() const;
    CMPIUint32 getUint32() const;
    CMPISint64 getSint64() const;
    CMPIUint64 getUint64() const;
    CMPIReal32 getReal32() const;
    CMPIReal64 getReal64() const;
    /// Of a char16 or uint16.
    CMPIChar16 getChar16() const;
    /// Of type CMPI_string, which is not CMPI_chars.
    CmpiString getString() const;
    /// Of type CMPI_chars, which is not CMPI_string.
    const char* getCString() const;
    CmpiDateTime getDateTime() const;
    /// Of an array of any type.
    CmpiArray getArray() const;
    CmpiInstance getInstance() const;
    CmpiObjectPath getObjectPath() const;

    /// The setters replace type, state and value, as the constructors do.
    void setBoolean(const CmpiBoolean d);
    void setSint8(const CMPISint8 d);
    void setUint8(const CMPIUint8 d);
    void setSint16(const CMPISint16 d);
    void setUint16(const CMPIUint16 d);
    void setSint32(const CMPISint32 d);
    void setUint32(const CMPIUint32 d);
    void setSint64(const CMPISint64 d);
    void setUint64(const CMPIUint64 d);
    void setReal32(const CMPIReal32 d);
    void setReal64(const CMPIReal64 d);
    void setChar16(const CMPIChar16 d);
    void setString(const CmpiString d);
    void setCString(const char* d);
    void setDateTime(const CmpiDateTime d);
    void setArray(const CmpiArray d);
    void setInstance(const CmpiInstance d);
    void setObjectPath(const CmpiObjectPath d);

    /// Non-zero when the state says so.
    int isNullValue() const;
    int isNotFound() const;

    CMPIType getType() const;

protected:
    CMPIData _data;
    CmpiData(const CMPIData& data);
};

#endif
