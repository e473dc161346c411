// The one way from the server's C calls to a provider's virtual operations, and back.
//
// Nothing but a status may cross into the server. Every exception becomes one here, save the
// unwinding of a cancelled thread, which must reach the end of the thread's stack.
#ifndef _CmpiDriver_h_
#define _CmpiDriver_h_

#include <exception>

#include "CmpiArgs.h"
#include "CmpiBaseMI.h"
#include "CmpiContext.h"
#include "CmpiData.h"
#include "CmpiInstance.h"
#include "CmpiObjectPath.h"
#include "CmpiResult.h"
#include "CmpiSelectExp.h"
#include "CmpiStatus.h"

class CmpiDriver {
public:
    /// The status that @p body returns or throws.
    template <class Body>
    static CMPIStatus guarded(Body body) {
        try {
            return body();
        } catch (const CmpiStatus& status) {
            return status.status();
        } catch (const std::exception& failure) {
            return CmpiStatus(CMPI_RC_ERR_FAILED, failure.what()).status();
        } catch (...) {
            // The unwinding of a cancelled thread, which alone has no exception.
            if (!std::current_exception()) {
                throw;
            }
            return CmpiStatus(CMPI_RC_ERR_FAILED, "The provider failed.").status();
        }
    }

    /// Calls @p operation of the provider object behind @p record, with the C arguments wrapped in
    /// the binding's classes.
    template <class Record, class MI, class... Params, class... Args>
    static CMPIStatus drive(Record* record, CmpiStatus (MI::*operation)(Params...), Args... args) {
        return guarded([&] {
            auto* const base = record ? static_cast<CmpiBaseMI*>(record->hdl) : nullptr;
            if (!base) {
                throw CmpiStatus(CMPI_RC_ERR_INVALID_HANDLE, "The provider is gone.");
            }
            auto* const provider = dynamic_cast<MI*>(base);
            if (!provider) {
                throw CmpiStatus(CMPI_RC_ERR_NOT_SUPPORTED);
            }
            return call(*provider, operation, wrap(args)...);
        });
    }

private:
    template <class MI, class Operation, class... Wrapped>
    static CMPIStatus call(MI& provider, Operation operation, Wrapped&&... wrapped) {
        return (provider.*operation)(wrapped...).status();
    }

    // Handles come const from the server; the binding's classes have always taken them otherwise.
    static CmpiContext wrap(const CMPIContext* c) {
        return CmpiContext(const_cast<CMPIContext*>(c));
    }
    static CmpiResult wrap(const CMPIResult* r) { return CmpiResult(const_cast<CMPIResult*>(r)); }
    static CmpiObjectPath wrap(const CMPIObjectPath* p) {
        return CmpiObjectPath(const_cast<CMPIObjectPath*>(p));
    }
    static CmpiInstance wrap(const CMPIInstance* i) { return CmpiInstance(i); }
    static CmpiArgs wrap(const CMPIArgs* a) { return CmpiArgs(const_cast<CMPIArgs*>(a)); }
    static CmpiSelectExp wrap(const CMPISelectExp* s) { return CmpiSelectExp(s); }
    static CmpiData wrap(const CMPIData& d) { return CmpiData(d); }
    static const char* wrap(const char* text) { return text; }
    static const char** wrap(const char** list) { return list; }
    static CMPIBoolean wrap(CMPIBoolean flag) { return flag; }
};

#endif
