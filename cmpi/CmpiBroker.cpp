#include "CmpiBroker.h"

#include "BrokerCall.h"

using namespace brokercall;

CmpiBroker::CmpiBroker(CMPIBroker* b) : CmpiObject(b) {}

CMPIBroker* CmpiBroker::getEnc() const { return static_cast<CMPIBroker*>(enc); }

CmpiContext CmpiBroker::prepareAttachThread(const CmpiContext& ctx) {
    const auto prepare = entryOf(getEnc(), &CMPIBrokerFT::prepareAttachThread);
    return CmpiContext(need(prepare(getEnc(), given(ctx.getEnc()))));
}

void CmpiBroker::attachThread(const CmpiContext& ctx) {
    tell(getEnc(), &CMPIBrokerFT::attachThread, given(ctx.getEnc()));
}

void CmpiBroker::detachThread(const CmpiContext& ctx) {
    tell(getEnc(), &CMPIBrokerFT::detachThread, given(ctx.getEnc()));
}

void CmpiBroker::deliverIndication(const CmpiContext& ctx, const char* ns,
                                   const CmpiInstance& ind) {
    tell(getEnc(), &CMPIBrokerFT::deliverIndication, given(ctx.getEnc()), ns, given(ind.getEnc()));
}

CmpiEnumeration CmpiBroker::enumInstanceNames(const CmpiContext& ctx, const CmpiObjectPath& op) {
    return CmpiEnumeration(need(ask(getEnc(), &CMPIBrokerFT::enumerateInstanceNames,
                                    given(ctx.getEnc()), given(op.getEnc()))));
}

CmpiInstance CmpiBroker::getInstance(const CmpiContext& ctx, const CmpiObjectPath& op,
                                     const char** properties) {
    return CmpiInstance(need(ask(getEnc(), &CMPIBrokerFT::getInstance, given(ctx.getEnc()),
                                 given(op.getEnc()), properties)));
}

CmpiObjectPath CmpiBroker::createInstance(const CmpiContext& ctx, const CmpiObjectPath& op,
                                          const CmpiInstance& inst) {
    return CmpiObjectPath(need(ask(getEnc(), &CMPIBrokerFT::createInstance, given(ctx.getEnc()),
                                   given(op.getEnc()), given(inst.getEnc()))));
}

void CmpiBroker::setInstance(const CmpiContext& ctx, const CmpiObjectPath& op,
                             const CmpiInstance& inst, const char** properties) {
    tell(getEnc(), &CMPIBrokerFT::modifyInstance, given(ctx.getEnc()), given(op.getEnc()),
         given(inst.getEnc()), properties);
}

void CmpiBroker::deleteInstance(const CmpiContext& ctx, const CmpiObjectPath& op) {
    tell(getEnc(), &CMPIBrokerFT::deleteInstance, given(ctx.getEnc()), given(op.getEnc()));
}

CmpiEnumeration CmpiBroker::execQuery(const CmpiContext& ctx, const CmpiObjectPath& op,
                                      const char* query, const char* lang) {
    return CmpiEnumeration(need(ask(getEnc(), &CMPIBrokerFT::execQuery, given(ctx.getEnc()),
                                    given(op.getEnc()), query, lang)));
}

CmpiEnumeration CmpiBroker::enumInstances(const CmpiContext& ctx, const CmpiObjectPath& op,
                                          const char** properties) {
    return CmpiEnumeration(need(ask(getEnc(), &CMPIBrokerFT::enumerateInstances,
                                    given(ctx.getEnc()), given(op.getEnc()), properties)));
}

CmpiEnumeration CmpiBroker::associators(const CmpiContext& ctx, const CmpiObjectPath& op,
                                        const char* assocClass, const char* resultClass,
                                        const char* role, const char* resultRole,
                                        const char** properties) {
    return CmpiEnumeration(
        need(ask(getEnc(), &CMPIBrokerFT::associators, given(ctx.getEnc()), given(op.getEnc()),
                 assocClass, resultClass, role, resultRole, properties)));
}

CmpiEnumeration CmpiBroker::associatorNames(const CmpiContext& ctx, const CmpiObjectPath& op,
                                            const char* assocClass, const char* resultClass,
                                            const char* role, const char* resultRole) {
    return CmpiEnumeration(
        need(ask(getEnc(), &CMPIBrokerFT::associatorNames, given(ctx.getEnc()), given(op.getEnc()),
                 assocClass, resultClass, role, resultRole)));
}

CmpiEnumeration CmpiBroker::references(const CmpiContext& ctx, const CmpiObjectPath& op,
                                       const char* resultClass, const char* role,
                                       const char** properties) {
    return CmpiEnumeration(need(ask(getEnc(), &CMPIBrokerFT::references, given(ctx.getEnc()),
                                    given(op.getEnc()), resultClass, role, properties)));
}

CmpiEnumeration CmpiBroker::referenceNames(const CmpiContext& ctx, const CmpiObjectPath& op,
                                           const char* resultClass, const char* role) {
    return CmpiEnumeration(need(ask(getEnc(), &CMPIBrokerFT::referenceNames, given(ctx.getEnc()),
                                    given(op.getEnc()), resultClass, role)));
}

CmpiData CmpiBroker::invokeMethod(const CmpiContext& ctx, const CmpiObjectPath& op,
                                  const char* method, const CmpiArgs& in, CmpiArgs& out) {
    return CmpiData(ask(getEnc(), &CMPIBrokerFT::invokeMethod, given(ctx.getEnc()),
                        given(op.getEnc()), named(method), given(in.getEnc()),
                        given(out.getEnc())));
}

void CmpiBroker::setProperty(const CmpiContext& ctx, const CmpiObjectPath& op, const char* name,
                             const CmpiData& data) {
    tell(getEnc(), &CMPIBrokerFT::setProperty, given(ctx.getEnc()), given(op.getEnc()), named(name),
         valueOf(data._data), data._data.type);
}

CmpiData CmpiBroker::getProperty(const CmpiContext& ctx, const CmpiObjectPath& op,
                                 const char* name) {
    return CmpiData(ask(getEnc(), &CMPIBrokerFT::getProperty, given(ctx.getEnc()),
                        given(op.getEnc()), named(name)));
}
