// An instance of a CIM class: a path and properties.
#ifndef _CmpiInstance_h_
#define _CmpiInstance_h_

#include "CmpiObject.h"

class CmpiData;
class CmpiObjectPath;

class CMPI_EXPORT CmpiInstance : public CmpiObject {
    friend class CmpiBroker;
    friend class CmpiResult;
    friend class CmpiInstanceMI;
    friend class CmpiMethodMI;
    friend class CmpiDriver;
    friend class CmpiData;

public:
    /// A new instance of the path's class. Whether properties get their defaults and the path's
    /// keys is up to the broker.
    CmpiInstance(const CmpiObjectPath& op);

    /// Whether the instance's class is @p className or derived from it.
    CmpiBoolean instanceIsA(const char* className) const;

    unsigned int getPropertyCount() const;

    /// Properties by name or by position, which runs from 0 to getPropertyCount() - 1; @p name,
    /// unless null, is given the property's name. A property that is not there gives a value that
    /// is both null and not found, without exception.
    CmpiData getProperty(const char* name) const;
    CmpiData getProperty(const int index, CmpiString* name = NULL) const;

    /// Sets a property. A null value sets it to null.
    /// @throws CmpiStatus CMPI_RC_ERR_INVALID_DATA_TYPE for a value whose type is none of CMPI's;
    ///         the broker's status when it knows the property under another type
    void setProperty(const char* name, const CmpiData data);

    /// Lets the instance take only @p properties, and @p keys in any case. Both lists end with a
    /// null; null for @p properties lets all pass.
    void setPropertyFilter(const char** properties, const char** keys);

    CmpiObjectPath getObjectPath() const;

protected:
    CmpiInstance(const CMPIInstance* enc);
    CMPIInstance* getEnc() const;

private:
    CmpiInstance();
};

#include "CmpiBroker.h"
#include "CmpiData.h"
#include "CmpiObjectPath.h"

#endif
