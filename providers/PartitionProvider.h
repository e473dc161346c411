/// ORXC_LPAR_CS: the logical partitions of all hosts. Name is <lparId>*<Name of the host>.
#ifndef PARTITION_PROVIDER_H
#define PARTITION_PROVIDER_H

#include "ComputerSystemProvider.h"

class PartitionProvider : public ComputerSystemProvider {
public:
    PartitionProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

protected:
    void find(zemQyplatCmdCaller& tool, const std::string& name, int* attributes,
              const Sink& sink) override;
    void walk(zemQyplatCmdCaller& tool, int* attributes, const Sink& sink) override;
    void complete(CmpiInstance& instance, const std::string& name,
                  const char** properties) override;
};

#endif
