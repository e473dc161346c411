#include "CmpiStatus.h"

#include <exception>

#include "CmpiProviderBase.h"

namespace {

CMPIString* messageOf(const CMPIBroker* broker, const char* text) {
    if (!text || !broker || !broker->eft || !broker->eft->newString) {
        return nullptr;
    }
    try {
        return broker->eft->newString(broker, text, nullptr);
    } catch (const std::exception&) {
        // A broker written in C++ may run out of memory; a status without its text is still true.
        return nullptr;
    }
}

}  // namespace

CmpiStatus::CmpiStatus() : st{CMPI_RC_OK, nullptr} {}

CmpiStatus::CmpiStatus(const CMPIStatus stat) : st(stat) {}

CmpiStatus::CmpiStatus(const CMPIrc rc) : st{rc, nullptr} {}

CmpiStatus::CmpiStatus(const CMPIrc rcp, const char* msg)
    : st{rcp, messageOf(CmpiProviderBase::getBroker(), msg)} {}

CMPIStatus CmpiStatus::status() const { return st; }

CMPIrc CmpiStatus::rc() const { return st.rc; }

const char* CmpiStatus::msg() const {
    const CMPIString* text = st.msg;
    return text && text->ft && text->ft->getCharPtr ? text->ft->getCharPtr(text, nullptr) : nullptr;
}
