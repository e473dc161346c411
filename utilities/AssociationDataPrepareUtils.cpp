#include "AssociationDataPrepareUtils.h"

#include "BaseZemMultiNtoNAssociationProvider.h"
#include "Exception.h"
#include "LetUnwind.h"
#include "Log.h"

namespace {

/// Runs a hook in a destructor, which must not throw.
template <class Hook>
void runQuietly(Hook hook) noexcept {
    const zemUncancelled uncancelled;
    zemQuietly(hook);
}

}  // namespace

zemAssociationDataPrepareUtility::zemAssociationDataPrepareUtility(
    zemBaseZemMultiNtoNAssociationProvider* provider, const CmpiContext& ctx, const char* className)
    : m_provider(provider), m_ctx(ctx), m_className(className), m_Initialized(false) {
    if (m_provider == nullptr) {
        return;
    }
    try {
        m_Initialized = m_provider->BeforeGenerateAssociation(m_ctx, m_className);
    } catch (zemException& failure) {
        failure.setThrowingClass("zemAssociationDataPrepareUtility");
        failure.setThrowingMethod("zemAssociationDataPrepareUtility");
        failure.setExceptionString("BeforeGenerateAssociation failed");
        throw;
    }
}

zemAssociationDataPrepareUtility::~zemAssociationDataPrepareUtility() {
    if (m_provider == nullptr) {
        return;
    }
    runQuietly([this] { m_provider->AfterGenerateAssociation(m_ctx, m_className); });
}

zemAssociationDataPrepareUtilityPlus::zemAssociationDataPrepareUtilityPlus(
    zemEnhanceBaseZemMultiNtoNAssociationProvider* provider, const CmpiContext& ctx,
    const char* className, const CmpiObjectPath& cop)
    : m_providerPlus(provider),
      m_addInfo(nullptr),
      m_ctx(ctx),
      m_className(className),
      m_cop(cop) {}

void* zemAssociationDataPrepareUtilityPlus::run() {
    if (m_providerPlus == nullptr) {
        return nullptr;
    }
    for (const char* line :
         {"", "+++++++++++++call for BeforeGenerateAssociation+++++++++++++++++++", "", ""}) {
        zemLog::LogPlain(line);
    }
    m_addInfo = m_providerPlus->BeforeGenerateAssociation(m_ctx, m_className, m_cop);
    return m_addInfo;
}

zemAssociationDataPrepareUtilityPlus::~zemAssociationDataPrepareUtilityPlus() {
    if (m_providerPlus == nullptr) {
        return;
    }
    runQuietly([this] {
        zemLog::LogPlain(
            "+++++++++++++++++auto release AfterGenerateAssociation++++++++++++++++++++++++");
        m_providerPlus->AfterGenerateAssociation(m_ctx, m_className, m_addInfo);
    });
}
