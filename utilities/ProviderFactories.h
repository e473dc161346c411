/// The CMPI entry points of a provider library, one line a provider.
///
/// A CIM server finds a provider by the symbols <name>_Create_InstanceMI and its four siblings.
/// ZEM_PROVIDER(name, Class) defines all five; they share one provider object, which
/// zemBaseProviderManager makes with the first record and destroys with the last.
///
///     ZEM_PROVIDER(ORXC_CEC_CSProvider, HostProvider)
///
/// Class needs a constructor (const CmpiBroker&, const CmpiContext&, const char* name).
#ifndef PROVIDER_FACTORIES_H
#define PROVIDER_FACTORIES_H

#include <exception>

#include "BaseProvider.h"
#include "BaseProviderManager.h"
#include "Exception.h"
#include "ZemExport.h"

/// Makes a provider for the manager; null when its constructor fails, as factories are C.
template <class Provider>
CmpiBaseMI* createProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
    try {
        return new Provider(mb, ctx, name);
    } catch (const CmpiStatus&) {
    } catch (const zemException&) {
    } catch (const std::exception&) {
    }
    return nullptr;
}

// The casts drop a const that some servers' headers add to the factories' arguments.
#define ZEM_PROVIDER_FACTORY(name, Class, Kind)                                                \
    extern "C" ZEM_EXPORT CMPI##Kind##MI* name##_Create_##Kind##MI(                            \
        const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status) {            \
        return zemBaseProviderManager::get##Kind##MI(const_cast<CMPIBroker*>(broker),          \
                                                     const_cast<CMPIContext*>(context), #name, \
                                                     status, &createProvider<Class>);          \
    }

#define ZEM_PROVIDER(name, Class)                  \
    ZEM_PROVIDER_FACTORY(name, Class, Instance)    \
    ZEM_PROVIDER_FACTORY(name, Class, Association) \
    ZEM_PROVIDER_FACTORY(name, Class, Method)      \
    ZEM_PROVIDER_FACTORY(name, Class, Indication)  \
    ZEM_PROVIDER_FACTORY(name, Class, Property)

#endif
