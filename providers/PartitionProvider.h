/// ORXC_LPAR_CS: the logical partitions of all hosts. Name is <lparId>*<Name of the host>.
///
/// What a partition has when it is activated is read from its default profile.
///
/// Partitions are made by the host's ORXC_VirtualSystemManagementService. A client starts and stops
/// them by RequestStateChange, which has done its work when it answers, so that there is no job:
///
///     2 Enabled    activates with the default profile, or resumes
///     3 Disabled   switches off at once; a suspended partition loses what it kept
///     4 Shut Down  has the system in the partition shut down
///     6 Offline    suspends
///     10 Reboot    as Shut Down, and starts again
///     11 Reset     as Disabled, and starts again
///
/// The answer is 0 when it is done, 1 for another state, 4097 when the partition cannot come to
/// that state from its own. What the appliance refuses fails with the tool's words.
#ifndef PARTITION_PROVIDER_H
#define PARTITION_PROVIDER_H

#include "ComputerSystemProvider.h"

class PartitionProvider : public ComputerSystemProvider {
public:
    PartitionProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

protected:
    void read(const Client& client, const std::string& name, int* attributes,
              const Sink& sink) override;
    void readAll(const Client& client, int* attributes, const Sink& sink) override;
    bool isChangeable(const char* property) const override;
    void change(const Client& client, const std::string& name, const char* property,
                const std::string& value) override;
    StateChangeAnswer requestState(const Client& client, const std::string& name,
                                   RequestedState state) override;

    // the frame's hooks
    void performDeleteInstance(const CmpiContext& context, CmpiResult& result,
                               const CmpiObjectPath& path) override;

private:
    /// The parts of the Name.
    struct Key {
        std::string id;
        std::string host;
    };
    /// @return false when @p name has not the form of one
    static bool split(const std::string& name, Key& key);
};

#endif
