/// ORXC_CEC_CS: the managed hosts of the appliance. Name is <type_model>*<serial_num>.
#ifndef HOST_PROVIDER_H
#define HOST_PROVIDER_H

#include "ComputerSystemProvider.h"

class HostProvider : public ComputerSystemProvider {
public:
    HostProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

protected:
    void find(zemQyplatCmdCaller& tool, const std::string& name, int* attributes,
              const Sink& sink) override;
    void walk(zemQyplatCmdCaller& tool, int* attributes, const Sink& sink) override;
};

#endif
