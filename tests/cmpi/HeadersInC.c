/* The headers and macros as a C provider uses them. */
#include "cmpift.h"

static const CMPIBroker* broker;

static CMPIStatus SampleMethodCleanup(CMPIMethodMI* mi, const CMPIContext* ctx,
                                      CMPIBoolean terminating) {
    if (terminating || mi->hdl || ctx) {
        CMReturn(CMPI_RC_OK);
    }
    CMReturnWithChars(broker, CMPI_RC_DO_NOT_UNLOAD, "busy");
}

static CMPIStatus SampleInvokeMethod(CMPIMethodMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* rslt, const CMPIObjectPath* op,
                                     const char* method, const CMPIArgs* in, CMPIArgs* out) {
    CMPIStatus rc = {CMPI_RC_OK, NULL};
    CMPIData data = CMGetArg(in, "Force", &rc);
    CMSetStatusWithChars(broker, &rc, CMPI_RC_ERR_METHOD_NOT_FOUND, method);
    if (mi->hdl || ctx || CMIsNullObject(op) || CMIsNullValue(data)) {
        return rc;
    }
    CMAddArg(out, "Text", "a text", CMPI_chars);
    return CMReturnData(rslt, &data.value, CMPI_uint32);
}

CMMethodMIStub(Sample, SampleInC, broker, CMNoHook)
