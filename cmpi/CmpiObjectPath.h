// The path of a CIM object: host, namespace, class and keys.
#ifndef _CmpiObjectPath_h_
#define _CmpiObjectPath_h_

#include "CmpiObject.h"

class CmpiData;

class CMPI_EXPORT CmpiObjectPath : public CmpiObject {
    friend class CmpiBroker;
    friend class CmpiResult;
    friend class CmpiInstance;
    friend class CmpiInstanceMI;
    friend class CmpiMethodMI;
    friend class CmpiAssociationMI;
    friend class CmpiPropertyMI;
    friend class CmpiIndicationMI;
    friend class CmpiData;

public:
    /// A new path without host and keys.
    CmpiObjectPath(const char* ns, const char* cls);
    CmpiObjectPath(const CmpiString& ns, const char* cls);
    CmpiObjectPath(CMPIObjectPath* c);
    CMPIObjectPath* getEnc() const;

    /// Whether the path's class is @p className or derived from it.
    CmpiBoolean classPathIsA(const char* className) const;

    /// Parts of the path; a part that is not set is the null string or empty, as the broker has it.
    CmpiString getHostname() const;
    /// Null sets a part empty.
    void setHostname(const char* hn);
    void setHostname(CmpiString hn);
    CmpiString getNameSpace() const;
    void setNameSpace(const char* ns);
    void setNameSpace(CmpiString ns);
    CmpiString getClassName() const;
    void setClassName(const char* hn);
    void setClassName(CmpiString hn);

    /// Keys by name or by position, which runs from 0 to getKeyCount() - 1; @p name, unless null,
    /// is given the key's name.
    /// @throws CmpiStatus CMPI_RC_ERR_NOT_FOUND when there is no such key
    unsigned int getKeyCount() const;
    CmpiData getKey(const char* name) const;
    CmpiData getKey(const int index, CmpiString* name = NULL) const;

    /// Sets a key, adding it when it is new.
    /// @throws CmpiStatus CMPI_RC_ERR_INVALID_PARAMETER for a null value: no key is null
    void setKey(const char* name, const CmpiData data);
};

#include "CmpiBroker.h"
#include "CmpiData.h"

#endif
