/// ORXC_CEC_CS: the managed hosts of the appliance. Name is <type_model>*<serial_num>.
///
/// The static method FindHost answers the path of the host that users know by a name.
#include <strings.h>

#include <memory>

#include "ComputerSystemProvider.h"
#include "ProviderFactories.h"

namespace {

using Host = zemQyplatCmdCaller::ManagedSystemAttribute;

const std::vector<PropertyRow> kRows = {
    {"ElementName", ValueKind::Text, Host::ATTR_NAME},
    {"Caption", ValueKind::Text, Host::ATTR_NAME},
    {"EnabledState", ValueKind::EnabledState, Host::ATTR_STATE},
    {"OperationalStatus", ValueKind::Status, Host::ATTR_STATE},
    {"State", ValueKind::Text, Host::ATTR_STATE},
    {"TypeModel", ValueKind::Text, Host::ATTR_TYPE_MODEL},
    {"SerialNumber", ValueKind::Text, Host::ATTR_SERIAL_NUM},
    {"IPAddress", ValueKind::Text, Host::ATTR_IPADDR},
    {"SystemTime", ValueKind::Timestamp, Host::ATTR_SYS_TIME},
    {"PowerOffPolicy", ValueKind::Flag, Host::ATTR_POWER_OFF_POLICY},
    {"ServiceProcessorVersion", ValueKind::Text, Host::ATTR_SP_VERSION},
    {"MaxLpars", ValueKind::Uint32, Host::ATTR_MAX_LPARS},
    {"ServiceLparID", ValueKind::Uint16, Host::ATTR_SERVICE_LPAR_ID},
    {"ActiveLparMobilityCapable", ValueKind::Flag, Host::ATTR_ACTIVE_LPAR_MOBILITY_CAPABLE},
    {"InactiveLparMobilityCapable", ValueKind::Flag, Host::ATTR_INACTIVE_LPAR_MOBILITY_CAPABLE},
    {"VirtualIOServerCapable", ValueKind::Flag, Host::ATTR_VIRTUAL_IO_SERVER_CAPABLE},
    {"VirtualSwitchCapable", ValueKind::Flag, Host::ATTR_VIRTUAL_SWITCH_CAPABLE},
    {"ActiveMemorySharingCapable", ValueKind::Flag, Host::ATTR_ACTIVE_MEMORY_SHARING_CAPABLE},
    {"LparSuspendCapable", ValueKind::Flag, Host::ATTR_LPAR_SUSPEND_CAPABLE},
    {"LparRemoteRestartCapable", ValueKind::Flag, Host::ATTR_CORALHV_LPAR_REMOTE_RESTART_CAPABLE},
    {"LparProcCompatModes", ValueKind::TextList, Host::ATTR_LPAR_PROC_COMPAT_MODES},
};

constexpr const char kFindHost[] = "FindHost";

class HostProvider : public ComputerSystemProvider {
public:
    HostProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          ComputerSystemProvider(mb, ctx, name, "ORXC_CEC_CS", kRows,
                                 {Host::ATTR_TYPE_MODEL, Host::ATTR_SERIAL_NUM}) {}

protected:
    void read(const Client& client, const std::string& name, int* attributes,
              const Sink& sink) override {
        if (isHostName(name)) {
            readHosts(client, name.c_str(), attributes, sink);
        }
    }

    void readAll(const Client& client, int* attributes, const Sink& sink) override {
        readHosts(client, nullptr, attributes, sink);
    }

    void performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                             const CmpiObjectPath& path, const char* method, const CmpiArgs& in,
                             CmpiArgs& out) override {
        if (strcasecmp(method, kFindHost) != 0) {
            ComputerSystemProvider::performInvokeMethod(context, result, path, method, in, out);
            return;
        }
        const CmpiString wanted = getParmVal(in, "ElementName").getString();
        int attributes[] = {Host::ATTR_TYPE_MODEL, Host::ATTR_SERIAL_NUM, Host::ATTR_NAME,
                            Host::ATTR_END};
        std::string found;
        readAll(clientOf(context), attributes,
                [&](const std::string& name, const zemRecordType& host) {
                    if (host[Host::ATTR_NAME] == wanted.charPtr()) {
                        found = name;
                    }
                });
        if (found.empty()) {
            throwObjectNotFoundExc(kFindHost, m_className, wanted.charPtr());
        }
        out.setArg("Host", CmpiData(systemPath(path, m_className, found)));
        result.returnData(methodResult(0));
    }

    CMPIBoolean isStaticMethod(const char*, const char* method) override {
        return strcasecmp(method, kFindHost) == 0;
    }

    void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                            const char* method) override {
        ComputerSystemProvider::populateMethodArgs(className, args, method);
        if (strcasecmp(method, kFindHost) == 0) {
            args.addElement(std::make_unique<zemString>("ElementName"));
        }
    }

private:
    static void readHosts(const Client& client, const char* host, int* attributes,
                          const Sink& sink) {
        const zemRecordSetsType hosts =
            toolFor(client).getManagedSystemInformation(attributes, host);
        for (int i = 0; i < hosts.size(); ++i) {
            sink(hostName(*hosts[i]), *hosts[i]);
        }
    }
};

}  // namespace

ZEM_PROVIDER(ORXC_CEC_CSProvider, HostProvider)
