/// A provider on a broker of the object manager, and a place for what it traces.
#ifndef PROVIDER_IN_BENCH_H
#define PROVIDER_IN_BENCH_H

#include <fcntl.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <iterator>
#include <string>

#include "BaseProvider.h"
#include "BaseProviderManager.h"
#include "ClassRepository.h"
#include "Server.h"

/// Sends standard output to a file while it lives, for the benchmark's own report goes there too.
class OutputTo {
public:
    explicit OutputTo(const char* file) {
        std::fflush(stdout);
        m_saved = dup(STDOUT_FILENO);
        const int fd = open(file, O_WRONLY | O_CREAT | O_TRUNC, 0600);
        dup2(fd, STDOUT_FILENO);
        close(fd);
    }
    ~OutputTo() {
        std::fflush(stdout);
        dup2(m_saved, STDOUT_FILENO);
        close(m_saved);
    }
    OutputTo(const OutputTo&) = delete;
    OutputTo& operator=(const OutputTo&) = delete;

private:
    int m_saved;
};

class BenchProvider : public zemBaseProvider {
public:
    BenchProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemBaseProvider(mb, ctx, name) {}
    static CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
        return new BenchProvider(mb, ctx, name);
    }
    CMPIBoolean isValidInstanceClass(const char* name) override {
        return compareClassNames(name, "Bench_Disk");
    }
    void performEnumInstanceNames(const CmpiContext&, CmpiResult& result,
                                  const CmpiObjectPath& path) override {
        result.returnData(path);
    }
    const char* getMessageBundlePath() override { return ""; }
};

/// The provider's instance interface, as a server holds it.
class ProviderInBench {
public:
    explicit ProviderInBench(cimom::Options options = {})
        : m_quiet("/dev/null"), server(std::move(options)), scope(server) {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        mi = zemBaseProviderManager::getInstanceMI(server.broker(), scope.context(), "Bench",
                                                   &status, BenchProvider::create);
    }
    ~ProviderInBench() { mi->ft->cleanup(mi, scope.context(), true); }
    ProviderInBench(const ProviderInBench&) = delete;
    ProviderInBench& operator=(const ProviderInBench&) = delete;

    BenchProvider& provider() const {
        return dynamic_cast<BenchProvider&>(*static_cast<CmpiBaseMI*>(mi->hdl));
    }

private:
    OutputTo m_quiet;

public:
    cimom::Server server;
    cimom::RequestScope scope;
    CMPIInstanceMI* mi = nullptr;
};

#endif
