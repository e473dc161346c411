// The anchor of one C++ provider in its library: which provider object is alive and how many
// interfaces of it the server holds. CMProviderBase defines one per provider.
//
// It also knows the broker of the living provider objects, for strings and paths that are made
// without naming a broker. The server calls the factories and cleanups of one provider one at a
// time; everything else may be called from any thread.
#ifndef _CmpiProviderBase_h_
#define _CmpiProviderBase_h_

#include <atomic>

#include "cmpift.h"

class CmpiBaseMI;

class CMPI_EXPORT CmpiProviderBase {
public:
    CmpiProviderBase();
    ~CmpiProviderBase();

    CmpiBaseMI* getBaseMI();
    void setBaseMI(CmpiBaseMI* aBaseMI);
    void incUseCount();
    /// The count that is left.
    int decUseCount();

private:
    friend class CmpiArgs;
    friend class CmpiArray;
    friend class CmpiDateTime;
    friend class CmpiInstance;
    friend class CmpiObject;
    friend class CmpiObjectPath;
    friend class CmpiStatus;
    friend class CmpiString;
    friend class CmpiBaseMI;

    CmpiBaseMI* baseMI;
    std::atomic<int> useCount;

    // The broker of the youngest living provider object, or null.
    static CMPIBroker* getBroker();
    static void setBroker(const CMPIBroker* mb);
    static void dropBroker(const CMPIBroker* mb);
};

#endif
