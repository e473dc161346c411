// A CIM string as the broker keeps it: text in UTF-8, never changed by this binding.
//
// A CmpiString is a handle on a string that the broker owns and frees when the operation ends. Copy
// construction makes a string of its own, assignment shares the handle. Needs a living provider
// object (CmpiBaseMI), through whose broker strings are made. Not safe for use by several threads
// at once.
#ifndef _CmpiString_h_
#define _CmpiString_h_

#include "cmpift.h"

#ifndef CmpiBoolean
#define CmpiBoolean CMPIBoolean
#define CmpiRc CMPIrc
#endif

class CMPI_EXPORT CmpiString {
    friend class CmpiBroker;
    friend class CmpiData;
    friend class CmpiObjectPath;
    friend class CmpiInstance;
    friend class CmpiObject;
    friend class CmpiArgs;
    friend class CmpiArrayIdx;

public:
    /// The null string.
    CmpiString();

    /// A new string with a copy of @p s; null gives the null string.
    /// @throws CmpiStatus CMPI_RC_ERR_FAILED without a broker, or the broker's own status
    CmpiString(const char* s);
    CmpiString(const CmpiString& s);
    CmpiString& operator=(const CmpiString& s) = default;

    /// The text, valid as long as the broker keeps the string; null for the null string and when
    /// the broker gives no text.
    const char* charPtr() const;

    /// Comparison of bytes, or without regard to ASCII case. Null equals null alone.
    CmpiBoolean equals(const char* str) const;
    CmpiBoolean equals(const CmpiString& str) const;
    CmpiBoolean equalsIgnoreCase(const char* str) const;
    CmpiBoolean equalsIgnoreCase(const CmpiString& str) const;

private:
    void* enc;
    CmpiString(CMPIString* c);
    CMPIString* getEnc() const;
};

#endif
