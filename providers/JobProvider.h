/// ORXC_ConcreteJob: the changes that go on in this process, from its table of jobs (Jobs.h).
///
/// A client polls the job that a method named until JobState is 7 (Completed) or above. It can ask
/// the job to end by RequestStateChange (4 Terminate, 5 Kill; no other state is supported), keep it
/// in the table by DeleteOnCompletion, delete it once it has ended, and ask GetError why it failed.
/// Who may do so is the job's owner, and root. What was changed before a job ended stays changed.
///
/// PercentComplete is the part of the job's tools that have done their work: tools do not tell how
/// far they are. It is null while the only tool of a job runs.
///
/// Thread-safety: no state; any number of operations at once.
#ifndef JOB_PROVIDER_H
#define JOB_PROVIDER_H

#include "BaseZemProvider.h"
#include "Jobs.h"

class JobProvider : public zemBaseZemProvider {
public:
    JobProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

protected:
    CmpiInstance performGetInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties) override;
    void performEnumInstances(const CmpiContext& context, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override;
    void performEnumInstanceNames(const CmpiContext& context, CmpiResult& result,
                                  const CmpiObjectPath& path) override;
    void performSetInstance(const CmpiContext& context, CmpiResult& result,
                            const CmpiObjectPath& path, const CmpiInstance& instance,
                            const char** properties) override;
    void performDeleteInstance(const CmpiContext& context, CmpiResult& result,
                               const CmpiObjectPath& path) override;
    void performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                             const CmpiObjectPath& path, const char* method, const CmpiArgs& in,
                             CmpiArgs& out) override;
    CMPIBoolean isValidInstanceClass(const char* className) override;
    CMPIBoolean isValidMethodClass(const char* className) override;
    void populateEssentialKeys(const char* className, CmpiArray& keys) override;
    void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                            const char* method) override;

private:
    /// The job of a path. @throws zemObjectNotFoundException
    JobTable::Status jobAt(const CmpiObjectPath& path, const char* operation) const;
    /// As jobAt(), for its owner. @throws zemAccessDeniedException for others
    JobTable::Status ownJobAt(const CmpiContext& context, const CmpiObjectPath& path,
                              const char* operation) const;

    JobTable::Use m_jobs;
};

#endif
