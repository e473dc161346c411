// The context of a request: entries with the principal, the languages and the invocation flags,
// each under the name that cmpidt.h gives it.
#ifndef _CmpiContext_h_
#define _CmpiContext_h_

#include "CmpiObject.h"

class CmpiData;

class CMPI_EXPORT CmpiContext : public CmpiObject {
    friend class CmpiBroker;
    friend class CmpiInstanceMI;
    friend class CmpiMethodMI;
    friend class CmpiAssociationMI;
    friend class CmpiPropertyMI;
    friend class CmpiIndicationMI;

public:
    CmpiContext(CMPIContext* c);
    CMPIContext* getEnc() const;

    /// The name of the entry that holds the invocation flags.
    static const char* invocationFlags;

    /// The entry @p name. Its text may be null: some servers know no principal.
    /// @throws CmpiStatus the broker's, as a rule CMPI_RC_ERR_NO_SUCH_PROPERTY or
    ///         CMPI_RC_ERR_NOT_FOUND, when there is no such entry
    CmpiData getEntry(const char* name) const;

protected:
    CmpiContext();
};

#include "CmpiData.h"

#endif
