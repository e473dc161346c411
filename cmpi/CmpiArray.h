// Arrays of CIM values of one type and a fixed length, and the elements of such an array.
//
//     CmpiArray names(2, CMPI_chars);
//     names[0] = CmpiData("first");
//     names[1] = CmpiData("second");
#ifndef _CmpiArray_h_
#define _CmpiArray_h_

#include "CmpiObject.h"

class CmpiArray;
class CmpiData;
class CmpiDateTime;
class CmpiInstance;
class CmpiObjectPath;

/// One element. Reads and writes go through to the array, which must outlive it.
/// The readers and conversions ask for exactly the type they name, as those of CmpiData do.
class CMPI_EXPORT CmpiArrayIdx {
    friend class CmpiArray;
    const CmpiArray& ar;
    CMPICount idx;
    CmpiArrayIdx(const CmpiArray& a, CMPICount i);

public:
    CmpiData getData() const;

    /// Sets the element.
    /// @throws CmpiStatus CMPI_RC_ERR_TYPE_MISMATCH unless the value is of the array's type; an
    ///         uint8 may go where booleans are, an uint16 where char16 are
    CmpiArrayIdx& operator=(const CmpiData& v);

    operator CmpiString() const;
    operator const char*() const;
    operator CmpiDateTime() const;
    operator CmpiInstance() const;
    operator CmpiObjectPath() const;
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
    CMPIChar16 getChar16() const;
    CmpiString getString() const;
    const char* getCString() const;
    CmpiDateTime getDateTime() const;
    CmpiInstance getInstance() const;
    CmpiObjectPath getObjectPath() const;
};

class CMPI_EXPORT CmpiArray : public CmpiObject {
    friend class CmpiArrayIdx;
    friend class CmpiData;
    friend class CmpiEnumeration;

public:
    /// A new array of @p max null elements of @p type, given without the array bit.
    CmpiArray(CMPICount max, CMPIType type);

    /// The null array, of size 0.
    CmpiArray();

    CMPICount size() const;

    /// @throws CmpiStatus CMPI_RC_ERR_NO_SUCH_PROPERTY for an index beyond the end
    CmpiArrayIdx operator[](CMPICount idx) const;

private:
    CmpiArray(CMPIArray* arr);
    CMPIArray* getEnc() const;
};

#include "CmpiData.h"

#endif
