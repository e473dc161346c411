// What all handles of the binding share.
//
// A CmpiObject is a handle on an object of the broker's. Copies share the object; nothing is cloned
// and nothing released, for objects that the server passes in or that a broker creates are freed
// by the server when the operation ends. So no handle may be kept beyond the operation in which it
// came. An operation on the null handle throws CMPI_RC_ERR_INVALID_HANDLE; one that the broker
// leaves out of its tables throws CMPI_RC_ERR_NOT_SUPPORTED. Not safe for use by several threads at
// once.
#ifndef _CmpiObject_h_
#define _CmpiObject_h_

#include "CmpiStatus.h"
#include "CmpiString.h"

class CmpiBroker;

class CMPI_EXPORT CmpiObject {
    friend class CmpiBroker;
    friend class CmpiObjectPath;
    friend class CmpiInstance;

public:
    CmpiBoolean isNull() const;

    /// The broker's text form of the object, for traces.
    CmpiString toString();

    /// Whether the object is of the CMPI type @p typeName, such as "CMPIInstance".
    CmpiBoolean isA(const char* typeName) const;

protected:
    void* enc;
    CmpiObject();
    CmpiObject(const void* enc);
    CmpiString doToString(CMPIBroker* mb);
    CmpiBoolean doIsA(CMPIBroker* mb, const char* typeName) const;
};

#endif
