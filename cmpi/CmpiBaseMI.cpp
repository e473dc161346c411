#include "CmpiBaseMI.h"

#include <memory>

#include "CmpiDriver.h"

namespace {

constexpr CMPIStatus kOk = {CMPI_RC_OK, nullptr};

}  // namespace

CmpiBaseMI::CmpiBaseMI(const CmpiBroker& mbp, const CmpiContext&)
    : broker(new CmpiBroker(mbp)), providerBase(nullptr) {
    CmpiProviderBase::setBroker(broker->getEnc());
}

CmpiBaseMI::~CmpiBaseMI() {
    CmpiProviderBase::dropBroker(broker->getEnc());
    delete broker;
}

void CmpiBaseMI::setProviderBase(CmpiProviderBase* base) { providerBase = base; }

CmpiProviderBase* CmpiBaseMI::getProviderBase() { return providerBase; }

CmpiStatus CmpiBaseMI::initialize(const CmpiContext&) { return CmpiStatus(CMPI_RC_OK); }

CmpiStatus CmpiBaseMI::cleanup(CmpiContext&) { return CmpiStatus(CMPI_RC_OK); }

int CmpiBaseMI::isUnloadable() const { return 1; }

CMPIStatus CmpiBaseMI::driveBaseCleanup(void* mi, const CMPIContext* eCtx,
                                        CMPIBoolean terminating) {
    return CmpiDriver::guarded([&]() -> CMPIStatus {
        // Whatever its kind, a record begins with the handle.
        void** const hdl = static_cast<void**>(mi);
        auto* const provider = hdl ? static_cast<CmpiBaseMI*>(*hdl) : nullptr;
        if (!provider) {
            throw CmpiStatus(CMPI_RC_ERR_INVALID_HANDLE, "The provider is gone.");
        }
        if (!terminating && !provider->isUnloadable()) {
            throw CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
        }

        CmpiProviderBase* const base = provider->getProviderBase();
        if (!base || base->decUseCount() != 0) {
            return kOk;
        }
        CmpiContext ctx(const_cast<CMPIContext*>(eCtx));
        const CMPIStatus outcome =
            CmpiDriver::guarded([&] { return provider->cleanup(ctx).status(); });
        const bool stays =
            terminating ? outcome.rc == CMPI_RC_ERR_FAILED : outcome.rc != CMPI_RC_OK;
        if (stays) {
            base->incUseCount();
            return outcome;
        }
        base->setBaseMI(nullptr);
        delete provider;
        *hdl = nullptr;
        return kOk;
    });
}

CmpiBaseMI* CmpiBaseMI::acquire(CmpiProviderBase& base, const CMPIBroker* mb,
                                const CMPIContext* eCtx, CMPIStatus* rc,
                                CmpiBaseMI* (*create)(const CmpiBroker&, CmpiContext&)) {
    // Known until the end, so that a failing constructor still gets its text across.
    struct Known {
        explicit Known(const CMPIBroker* b) : broker(b) { CmpiProviderBase::setBroker(broker); }
        ~Known() { CmpiProviderBase::dropBroker(broker); }
        const CMPIBroker* broker;
    };
    const Known known(mb);
    const CMPIStatus outcome = CmpiDriver::guarded([&]() -> CMPIStatus {
        if (base.getBaseMI()) {
            return kOk;
        }
        CmpiContext ctx(const_cast<CMPIContext*>(eCtx));
        std::unique_ptr<CmpiBaseMI> made(create(CmpiBroker(const_cast<CMPIBroker*>(mb)), ctx));
        made->setProviderBase(&base);
        const CmpiStatus initialized = made->initialize(ctx);
        if (initialized.rc() == CMPI_RC_OK) {
            base.setBaseMI(made.release());
        }
        return initialized.status();
    });
    if (rc) {
        *rc = outcome;
    }
    if (outcome.rc != CMPI_RC_OK) {
        return nullptr;
    }
    base.incUseCount();
    return base.getBaseMI();
}
