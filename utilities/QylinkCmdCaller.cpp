#include "QylinkCmdCaller.h"

namespace {

constexpr zemQuery kConnections = {"qylink -r all", zemQylinkCmdCaller::ALL::m_attributeName};

}  // namespace

zemQylinkCmdCaller::zemQylinkCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

zemRecordSetsType zemQylinkCmdCaller::getQylinkInformation(int* paramAttr,
                                                           const char* managedSystem) {
    return query(kConnections, paramAttr, managedSystem);
}
