#include "QyfaultCmdCaller.h"

namespace {

constexpr zemQuery kSystemFaults = {"qyfault -r sys",
                                    zemQyfaultCmdCaller::ManagedSystemAttribute::m_attributeName};
constexpr zemQuery kPartitionFaults = {"qyfault -r lpar",
                                       zemQyfaultCmdCaller::PartitionAttribute::m_attributeName};

}  // namespace

zemQyfaultCmdCaller::zemQyfaultCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

zemRecordSetsType zemQyfaultCmdCaller::getManagedSystemInformation(int* paramAttr,
                                                                   const char* managedSystem) {
    return query(kSystemFaults, paramAttr, managedSystem);
}

zemRecordSetsType zemQyfaultCmdCaller::getPartitionsInformation(int* paramAttr,
                                                                const char* managedSystem,
                                                                const char* filter) {
    return query(kPartitionFaults, paramAttr, managedSystem, filter);
}
