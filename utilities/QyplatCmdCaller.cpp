#include "QyplatCmdCaller.h"

namespace {

constexpr zemQuery kSystems = {"qyplat -r sys",
                               zemQyplatCmdCaller::ManagedSystemAttribute::m_attributeName};
constexpr zemQuery kPartitions = {"qyplat -r lpar",
                                  zemQyplatCmdCaller::PartitionAttribute::m_attributeName};
constexpr zemQuery kProfiles = {"qyplat -r prof",
                                zemQyplatCmdCaller::PartitionProfileAttribute::m_attributeName};

}  // namespace

zemQyplatCmdCaller::zemQyplatCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

zemRecordSetsType zemQyplatCmdCaller::getManagedSystemInformation(int* paramAttr,
                                                                  const char* managedSystem) {
    return query(kSystems, paramAttr, managedSystem);
}

zemRecordSetsType zemQyplatCmdCaller::getPartitionsInformation(int* paramAttr,
                                                               const char* managedSystem,
                                                               const char* filter) {
    return query(kPartitions, paramAttr, managedSystem, filter);
}

zemRecordSetsType zemQyplatCmdCaller::getPartitionsProfileInformation(int* paramAttr,
                                                                      const char* managedSystem,
                                                                      const char* filter) {
    return query(kProfiles, paramAttr, managedSystem, filter);
}
