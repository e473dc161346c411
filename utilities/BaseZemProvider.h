/// Base of the providers that must stay loaded while the server runs: services and associations
/// that hold subscriptions or caches. See BaseZemValidator.h for its operations.
#ifndef ZEM_BASE_ZEM_PROVIDER_H
#define ZEM_BASE_ZEM_PROVIDER_H

#include "BaseZemValidator.h"

class ZEM_EXPORT zemBaseZemProvider : public zemBaseZemValidator {
public:
    zemBaseZemProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    /// 0: cleanup is refused unless the server is terminating.
    int isUnloadable() const override;
};

#endif
