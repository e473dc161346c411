#include "QymoveCmdCaller.h"

namespace {

constexpr zemQuery kManager = {"qymove -r manager",
                               zemQymoveCmdCaller::ManagerSystemAttribute::m_attributeName};
constexpr zemQuery kSystemMoves = {"qymove -r sys",
                                   zemQymoveCmdCaller::ManagedSystemAttribute::m_attributeName,
                                   zemQuery::WHEN_NOT_NULL};
constexpr zemQuery kPartitionMoves = {"qymove -r lpar",
                                      zemQymoveCmdCaller::PartitionAttribute::m_attributeName,
                                      zemQuery::WHEN_NOT_NULL};

}  // namespace

zemQymoveCmdCaller::zemQymoveCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

zemRecordSetsType zemQymoveCmdCaller::getManagerSystemCapabilities(int* paramAttr) {
    return query(kManager, paramAttr, nullptr);
}

zemRecordSetsType zemQymoveCmdCaller::getManagedSystemCapabilities(int* paramAttr,
                                                                   const char* managedSystem) {
    return query(kSystemMoves, paramAttr, managedSystem);
}

zemRecordSetsType zemQymoveCmdCaller::getPartitionsMigrationState(int* paramAttr,
                                                                  const char* managedSystem,
                                                                  const char* filter) {
    return query(kPartitionMoves, paramAttr, managedSystem, filter);
}
