/// ORXC_VirtualSystemManagementService: makes, changes and removes partitions and their settings.
/// Each host has one, with the host's Name in SystemName; its methods serve that host alone.
///
/// A method takes settings as embedded instances, turns them into RASDs by the table of
/// SettingRows.h, and ends in one line of a tool; what the tool refuses fails with its words. What
/// a partition has now ("ORX:4*...") is changed by jobs (Jobs.h), a tool for each resource, which a
/// client follows; everything else is done when the method answers.
///
///     DefineSystem            a partition with its first profile; the appliance chooses its number
///     DestroySystem           a partition with its profiles
///     ModifySystemSettings    of a profile; of a partition: names and the key lock
///     AddResourceSettings     slots and adapters, to a profile or to what a partition has now
///     ModifyResourceSettings  any of a profile; processors or memory that a partition has now
///     RemoveResourceSettings  slots and adapters
///
/// All resources of one call are of one system. Settings that are changed keep what a client does
/// not send, and what it sends as it reads it. Whoever changes the mode of processors or memory
/// starts anew: of what is not sent the appliance decides.
///
/// Thread-safety: constant tables and no state; any number of operations at once.
#ifndef MANAGEMENT_SERVICE_H
#define MANAGEMENT_SERVICE_H

#include <string>
#include <vector>

#include "BaseZemProvider.h"
#include "Jobs.h"
#include "SentSettings.h"

class ManagementService : public zemBaseZemProvider {
public:
    ManagementService(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    CMPIBoolean isValidInstanceClass(const char* className) override;
    CMPIBoolean isValidMethodClass(const char* className) override;

protected:
    // the frame's hooks
    CmpiInstance performGetInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties) override;
    void performEnumInstances(const CmpiContext& context, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override;
    void performEnumInstanceNames(const CmpiContext& context, CmpiResult& result,
                                  const CmpiObjectPath& path) override;
    void performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                             const CmpiObjectPath& path, const char* method, const CmpiArgs& in,
                             CmpiArgs& out) override;
    void populateEssentialKeys(const char* className, CmpiArray& keys) override;
    void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                            const char* method) override;

private:
    /// What methods answer: the schema's numbers.
    enum Answer : CMPIUint32 {
        Done = 0,
        NotSupported = 1,
        InvalidParameter = 4,
        InvalidState = 5,
        JobStarted = 4096
    };

    struct Call {
        const CmpiContext& context;
        const CmpiObjectPath& path;
        const CmpiArgs& in;
        CmpiArgs& out;
        std::string host;  ///< whose service it is
        zemOperEnv client;
    };
    struct Method;
    static const Method kMethods[];
    static const Method* methodNamed(const char* name);

    Answer defineSystem(const Call& call) const;
    Answer destroySystem(const Call& call) const;
    Answer modifySystem(const Call& call) const;
    Answer addResources(const Call& call) const;
    Answer modifyResources(const Call& call) const;
    Answer removeResources(const Call& call) const;

    Answer modifyProfile(const Call& call, const MeantResources& meant) const;
    Answer modifyState(const Call& call, const MeantResources& meant) const;
    static Answer startJob(const Call& call, const SettingOwner& owner, const char* name,
                           std::vector<JobTable::Step> steps);

    JobTable::Use m_jobs;
};

#endif
