/// Between the object manager and a provider of a test: factories, and handles of its requests.
#pragma once

#include <typeinfo>

#include "BaseProviderManager.h"
#include "CmpiMethodMI.h"
#include "Server.h"

/// A handle class of the binding over a handle of the server, which else the binding alone makes.
template <class Wrapper>
struct FromServer : Wrapper {
    template <class Handle>
    explicit FromServer(Handle* handle) : Wrapper(handle) {}
};

/// Tells a binding that knows one broker in a process, from the first provider of a library, which
/// one is meant: tests have one server after the other.
inline void makeKnown(CMPIBroker* broker) {
    CmpiMethodMI(CmpiBroker(broker), CmpiContext(static_cast<CMPIContext*>(nullptr)))
        .setProviderBase(nullptr);
}

/// One object for all kinds, made when the first is asked for.
template <class Provider>
class FactoriesOf {
    template <auto get>
    static auto make(const CMPIBroker* mb, const CMPIContext* ctx, CMPIStatus* rc) {
        return get(const_cast<CMPIBroker*>(mb), const_cast<CMPIContext*>(ctx),
                   typeid(Provider).name(), rc, create);
    }

public:
    static CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
        return new Provider(mb, ctx, name);
    }
    static cimom::Factories all() {
        using M = zemBaseProviderManager;
        return {make<M::getInstanceMI>, make<M::getAssociationMI>, make<M::getMethodMI>,
                make<M::getIndicationMI>, make<M::getPropertyMI>};
    }
};
