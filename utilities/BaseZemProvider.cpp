#include "BaseZemProvider.h"

zemBaseZemProvider::zemBaseZemProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                       const char* name)
    : CmpiBaseMI(mb, ctx), zemBaseZemValidator(mb, ctx, name) {}

int zemBaseZemProvider::isUnloadable() const {
    PROV_TRACE_LOCALS();
    PROV_TRACE_ENTER();
    PROV_TRACE_EXIT();
    return 0;
}
