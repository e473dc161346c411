#include "BrokerCall.h"

namespace brokercall {

void check(const CMPIStatus& rc) {
    if (rc.rc != CMPI_RC_OK) {
        throw CmpiStatus(rc);
    }
}

void refuse(CMPIrc rc, const char* text) { throw CmpiStatus(rc, text); }

CMPIData missing() {
    CMPIData data = {};
    data.state = CMPI_nullValue | CMPI_notFound;
    return data;
}

CMPIData found(const CMPIData& data, const CMPIStatus& rc, const char* name) {
    switch (rc.rc) {
        case CMPI_RC_OK:
            return data;
        case CMPI_RC_ERR_NO_SUCH_PROPERTY:
        case CMPI_RC_ERR_NOT_FOUND:
            return missing();
        default:
            if (rc.msg) {
                throw CmpiStatus(rc);
            }
            throw CmpiStatus(rc.rc, name);
    }
}

namespace {

bool isKnown(CMPIType type) {
    if (type & CMPI_ENC) {
        return true;
    }
    switch (type & ~CMPI_ARRAY) {
        case CMPI_boolean:
        case CMPI_char16:
        case CMPI_real32:
        case CMPI_real64:
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_uint64:
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
        case CMPI_sint64:
            return true;
        default:
            return false;
    }
}

}  // namespace

const CMPIValue* valueOf(const CMPIData& data) {
    if (data.state & CMPI_nullValue) {
        return nullptr;
    }
    if (!isKnown(data.type)) {
        refuse(CMPI_RC_ERR_INVALID_DATA_TYPE, "The value is of no CMPI type.");
    }
    if (data.type & (CMPI_ARRAY | CMPI_ENC)) {
        if (!data.value.dataPtr.ptr) {
            return nullptr;
        }
        if (data.type == CMPI_chars) {
            return reinterpret_cast<const CMPIValue*>(data.value.chars);
        }
    }
    return &data.value;
}

}  // namespace brokercall
