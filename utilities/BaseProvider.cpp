#include "BaseProvider.h"

#include "AtomicType.h"
#include "BaseProviderText.h"
#include "LetUnwind.h"
#include "ServerCall.h"

namespace {

/// Texts of clients and tools may be of any length, what a client is told is not.
constexpr size_t kMaxMessage = 16384;

}  // namespace

int getID() {
    static zemAtomicType<int> counter(0);
    ++counter;
    return counter;
}

zemBaseProvider::zemBaseProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                 const char* providerName)
    : CmpiBaseMI(mb, ctx),
      CmpiInstanceMI(mb, ctx),
      CmpiAssociationMI(mb, ctx),
      CmpiMethodMI(mb, ctx),
      zemCmpiIndicationMI(mb, ctx),
      CmpiPropertyMI(mb, ctx),
      m_providerName(providerName) {
    PROV_TRACE_LOCALS();
    if (PROV_TRACE_BROKER == nullptr) {
        return;
    }
    PROV_TRACE_STRING(4, "0x%p - BROKER[0x%p: hdl 0x%p,bft 0x%p,eft 0x%p,xft 0x%p]",
                      static_cast<const void*>(broker), static_cast<const void*>(PROV_TRACE_BROKER),
                      static_cast<const void*>(PROV_TRACE_BROKER->hdl),
                      static_cast<const void*>(PROV_TRACE_BROKER->bft),
                      static_cast<const void*>(PROV_TRACE_BROKER->eft),
                      static_cast<const void*>(PROV_TRACE_BROKER->xft));
}

zemBaseProvider::~zemBaseProvider() {
    const zemUncancelled uncancelled;
    traceDefault("~zemBaseProvider");
}

CmpiStatus zemBaseProvider::initialize(const CmpiContext&) {
    traceDefault(__func__);
    return returnOK();
}

CmpiStatus zemBaseProvider::cleanup(CmpiContext&) {
    traceDefault(__func__);
    return returnOK();
}

int zemBaseProvider::isUnloadable() const {
    traceDefault(__func__);
    return 1;
}

CMPIBoolean zemBaseProvider::isValidInstanceClass(const char*) {
    traceDefault(__func__);
    return false;
}

CMPIBoolean zemBaseProvider::isValidAssociationClass(const char*) {
    traceDefault(__func__);
    return false;
}

CMPIBoolean zemBaseProvider::isValidMethodClass(const char*) {
    traceDefault(__func__);
    return false;
}

CMPIBoolean zemBaseProvider::isStaticMethod(const char*, const char*) {
    traceDefault(__func__);
    return false;
}

CMPIBoolean zemBaseProvider::isValidIndicationClass(const char*) {
    traceDefault(__func__);
    return false;
}

void zemBaseProvider::populateEssentialKeys(const char*, CmpiArray&) { traceDefault(__func__); }

void zemBaseProvider::populateMethodArgs(const char*, zemDynamicArray<zemString>&, const char*) {
    traceDefault(__func__);
}

CmpiStatus zemBaseProvider::returnOK() const { return CmpiStatus(CMPI_RC_OK); }

CmpiStatus zemBaseProvider::returnStatus(CMPIrc rc, const char* text) const {
    CMPIBroker* raw = rawBroker();
    if (raw == nullptr) {
        return CmpiStatus(rc);
    }
    const zemString message = zemShortened(text, kMaxMessage);
    CMPIString* const none = nullptr;
    const CMPIStatus status = {rc, zemCallServer(raw->eft, &CMPIBrokerEncFT::newString, none, raw,
                                                 static_cast<const char*>(message), nullptr)};
    return CmpiStatus(status);
}

void zemBaseProvider::trace(const char* text) const {
    CMPIBroker* raw = rawBroker();
    if (raw == nullptr) {
        return;
    }
    zemCallServer(raw->eft, &CMPIBrokerEncFT::trace, kZemNotServed, raw, static_cast<CMPILevel>(0),
                  "ProviderAgent", text, nullptr);
}

CMPIBroker* zemBaseProvider::rawBroker() const {
    return broker != nullptr ? broker->getEnc() : nullptr;
}

void zemBaseProvider::traceDefault(const char* function) const {
    PROV_TRACE_LOCALS();
    zemProviderTracer::_traceEnter(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__,
                                   PROV_TRACE_COMPONENT, function);
    zemProviderTracer::_traceExit(PROV_TRACE_BROKER, PROV_TRACE_FILE, __LINE__,
                                  PROV_TRACE_COMPONENT, function);
}

void zemBaseProvider::refuse(const char* function, const char* operation,
                             const char* className) const {
    traceDefault(function);
    throwMethodNotSupportedExc(operation, className);
}
