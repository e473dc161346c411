// What all C++ provider classes share. A provider derives from one class per kind of interface it
// serves (CmpiInstanceMI and so on); these have CmpiBaseMI as their one virtual base.
//
// The library's factory (CMInstanceMIFactory and so on) makes the object, and the last cleanup
// destroys it. The operations are called by the server, from many threads at once.
#ifndef _CmpiBaseMI_h_
#define _CmpiBaseMI_h_

#include "CmpiBroker.h"
#include "CmpiContext.h"
#include "CmpiProviderBase.h"
#include "CmpiStatus.h"

class CMPI_EXPORT CmpiBaseMI {
public:
    virtual ~CmpiBaseMI();
    CmpiBaseMI(const CmpiBroker& mbp, const CmpiContext& ctx);
    CmpiBaseMI(const CmpiBaseMI&) = delete;
    CmpiBaseMI& operator=(const CmpiBaseMI&) = delete;

    /// The anchor of this object; null until a factory sets it.
    void setProviderBase(CmpiProviderBase* base);
    CmpiProviderBase* getProviderBase();

    /// The cleanup entry of every kind of interface record. The last one calls cleanup and destroys
    /// the object. A provider that is not unloadable answers CMPI_RC_ERR_NOT_SUPPORTED, and one
    /// whose cleanup fails stays, unless the server is terminating and the code is another than
    /// CMPI_RC_ERR_FAILED.
    static CMPIStatus driveBaseCleanup(void* mi, const CMPIContext* eCtx, CMPIBoolean terminating);

    /// What the factory macros call: the object of @p base, made and initialized when there is none
    /// yet, with one use more. Null when that fails, with the reason in @p rc.
    static CmpiBaseMI* acquire(CmpiProviderBase& base, const CMPIBroker* mb,
                               const CMPIContext* eCtx, CMPIStatus* rc,
                               CmpiBaseMI* (*create)(const CmpiBroker&, CmpiContext&));

    /// Called once after construction; any code but CMPI_RC_OK undoes the load.
    virtual CmpiStatus initialize(const CmpiContext& ctx);
    /// Called once before destruction.
    virtual CmpiStatus cleanup(CmpiContext& ctx);
    /// Whether the server may unload the provider while it runs.
    virtual int isUnloadable() const;

protected:
    CmpiBroker* broker;

private:
    CmpiProviderBase* providerBase;
};

#endif
