// A sequence of instances or paths that the broker answered with, read once from front to end.
//
//     for (CmpiEnumeration e = broker.enumInstances(ctx, path, NULL); e.hasNext();)
//         use(e.getNext().getInstance());
#ifndef _CmpiEnumeration_h_
#define _CmpiEnumeration_h_

#include "CmpiObject.h"

class CmpiData;
class CmpiObjectPath;

class CMPI_EXPORT CmpiEnumeration : public CmpiObject {
    friend class CmpiBroker;

public:
    /// The null enumeration, of which every operation throws CMPI_RC_ERR_INVALID_HANDLE.
    CmpiEnumeration();

    /// The next element. @throws CmpiStatus the broker's, when there is none
    CmpiData getNext();
    CmpiBoolean hasNext();

    /// What has not been read yet, as an array.
    CmpiData toArray();

protected:
    CmpiEnumeration(CMPIEnumeration* enc);
    CMPIEnumeration* getEnc() const;
};

#include "CmpiBroker.h"
#include "CmpiObjectPath.h"

#endif
