// Method operation of zemBaseProvider.
#include "BaseProvider.h"
#include "BaseProviderFrame.h"
#include "BaseProviderText.h"
#include "Exception.h"

namespace {

// Some servers count the keys of the class on a path that has none of them.
bool hasKeys(const CmpiObjectPath& path) {
    try {
        return path.getKeyCount() != 0 && !zemIsMissing(path.getKey(0));
    } catch (const CmpiStatus&) {
        return false;
    }
}

// The object that @p find looks for must exist.
template <class Find>
void requireTarget(const zemOperationFrame& frame, const CmpiObjectPath& path, const char* method,
                   Find find) {
    const char* className = frame.className();
    try {
        find();
    } catch (const zemException& failure) {
        frame.traceDetail(failure.toString());
        frame.traceExit();
        const zemString text =
            "refers to an invalid object:" + zemBaseProvider::objectPathToString(path) +
            " to inovke method " + method;
        throw zemInvalidParameterException(className, "invokeMethod", method,
                                           failure.getExceptionId(), text);
    } catch (const CmpiStatus& status) {
        frame.traceStatus(status);
        const char* code = zemBaseProvider::cmpiRcToString(status.rc());
        if (status.rc() != CMPI_RC_ERR_NOT_FOUND && status.rc() != CMPI_RC_ERR_INVALID_PARAMETER) {
            throw zemOperationFailedException(className, "invokeMethod", code, status.msg());
        }
        frame.traceExit();
        const zemString text =
            "reference an invalid object:" + zemBaseProvider::objectPathToString(path) +
            " to invoke method " + method;
        throw zemInvalidParameterException(className, "invokeMethod", method, code, text);
    }
}

}  // namespace

CmpiStatus zemBaseProvider::invokeMethod(const CmpiContext& ctx, CmpiResult& result,
                                         const CmpiObjectPath& path, const char* method,
                                         const CmpiArgs& in, CmpiArgs& out) {
    zemOperationFrame frame(*this, zemOperation::InvokeMethod, ctx, &path, &result);
    frame.setMethod(method);
    return frame.run([&] {
        const bool onClass = isStaticMethod(frame.className(), method) && !hasKeys(path);
        if (!onClass) {
            requireTarget(frame, path, method, [&] {
                // The provider of the method alone asks the server, which asks that of the
                // instances.
                if (isValidInstanceClass(frame.className())) {
                    getInstance(ctx, path, nullptr);
                } else {
                    broker->getInstance(ctx, path, nullptr);
                }
            });
        }
        validateMethodArgs(method, in, frame.className());
        performInvokeMethod(ctx, result, path, method, in, out);
    });
}

void zemBaseProvider::performInvokeMethod(const CmpiContext&, CmpiResult&,
                                          const CmpiObjectPath& path, const char*, const CmpiArgs&,
                                          CmpiArgs&) {
    refuse(__func__, "invokeMethod", zemClassOf(path));
}
