/// A server and a living provider for fuzz targets that make CIM objects.
#ifndef SERVER_IN_FUZZ_H
#define SERVER_IN_FUZZ_H

#include "BaseProvider.h"
#include "Server.h"

class FuzzProvider : public zemBaseProvider {
public:
    FuzzProvider(CMPIBroker* mb, CMPIContext* ctx)
        : CmpiBaseMI(CmpiBroker(mb), CmpiContext(ctx)),
          zemBaseProvider(CmpiBroker(mb), CmpiContext(ctx), "Fuzz") {
        setProviderBase(nullptr);  // some bindings know no broker before
    }
    const char* getMessageBundlePath() override { return ""; }
};

inline cimom::Server& fuzzServer() {
    static cimom::Server server;
    static cimom::RequestScope scope(server);
    static FuzzProvider provider(server.broker(), scope.context());
    return server;
}

#endif
