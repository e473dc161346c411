// The broker: through it a provider reaches the CIM server and, by way of it, other providers.
//
// A CmpiBroker is a handle on the server's broker, which lives as long as the provider. Operations
// may be called from any of the server's threads; a thread of the provider's own attaches itself
// first. All throw CmpiStatus with what the server answers; what they return belongs to the broker.
#ifndef _CmpiBroker_h_
#define _CmpiBroker_h_

#include "CmpiContext.h"
#include "CmpiEnumeration.h"
#include "CmpiInstance.h"
#include "CmpiObject.h"
#include "CmpiObjectPath.h"
#include "CmpiString.h"

class CmpiArgs;
class CmpiData;

class CMPI_EXPORT CmpiBroker : public CmpiObject {
public:
    CmpiBroker(CMPIBroker* b);
    CMPIBroker* getEnc() const;

    /// A context for one new thread, made by the thread that starts it. The new thread brackets its
    /// work with attachThread and detachThread; the latter frees what the broker made for it.
    CmpiContext prepareAttachThread(const CmpiContext& ctx);
    void attachThread(const CmpiContext& ctx);
    void detachThread(const CmpiContext& ctx);

    void deliverIndication(const CmpiContext& ctx, const char* ns, const CmpiInstance& ind);

    /// Instances of the path's class. A null list of properties asks for all of them.
    CmpiEnumeration enumInstanceNames(const CmpiContext& ctx, const CmpiObjectPath& op);
    CmpiInstance getInstance(const CmpiContext& ctx, const CmpiObjectPath& op,
                             const char** properties);
    CmpiObjectPath createInstance(const CmpiContext& ctx, const CmpiObjectPath& op,
                                  const CmpiInstance& inst);
    void setInstance(const CmpiContext& ctx, const CmpiObjectPath& op, const CmpiInstance& inst,
                     const char** properties);
    void deleteInstance(const CmpiContext& ctx, const CmpiObjectPath& op);
    CmpiEnumeration execQuery(const CmpiContext& ctx, const CmpiObjectPath& op, const char* query,
                              const char* lang);
    CmpiEnumeration enumInstances(const CmpiContext& ctx, const CmpiObjectPath& op,
                                  const char** properties);

    /// Neighbours of the object at the path. A null class or role does not restrict.
    CmpiEnumeration associators(const CmpiContext& ctx, const CmpiObjectPath& op,
                                const char* assocClass, const char* resultClass, const char* role,
                                const char* resultRole, const char** properties);
    CmpiEnumeration associatorNames(const CmpiContext& ctx, const CmpiObjectPath& op,
                                    const char* assocClass, const char* resultClass,
                                    const char* role, const char* resultRole);
    CmpiEnumeration references(const CmpiContext& ctx, const CmpiObjectPath& op,
                               const char* resultClass, const char* role, const char** properties);
    CmpiEnumeration referenceNames(const CmpiContext& ctx, const CmpiObjectPath& op,
                                   const char* resultClass, const char* role);

    /// The method's return value; output arguments are added to @p out.
    CmpiData invokeMethod(const CmpiContext& ctx, const CmpiObjectPath& op, const char* method,
                          const CmpiArgs& in, CmpiArgs& out);
    void setProperty(const CmpiContext& ctx, const CmpiObjectPath& op, const char* name,
                     const CmpiData& data);
    CmpiData getProperty(const CmpiContext& ctx, const CmpiObjectPath& op, const char* name);
};

#include "CmpiArgs.h"
#include "CmpiData.h"

#endif
