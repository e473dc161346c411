/// ORXC_CEC_CS: the managed hosts of the appliance. Name is <type_model>*<serial_num>.
///
/// The static method FindHost answers the path of the host that users know by a name.
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
    void performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                             const CmpiObjectPath& path, const char* method, const CmpiArgs& in,
                             CmpiArgs& out) override;
    CMPIBoolean isStaticMethod(const char* className, const char* method) override;
    void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                            const char* method) override;
};

#endif
