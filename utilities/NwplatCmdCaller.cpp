#include "NwplatCmdCaller.h"

zemNwplatCmdCaller::zemNwplatCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

int zemNwplatCmdCaller::makePartitionsInformation(
    const zemDynamicArray<tagAttributePair>& attrPairs, const char* managedSystem) {
    constexpr zemAttributeNames table(PartitionAttribute::m_attributeName);
    const std::string line = "nwplat -r lpar" + systemOption(managedSystem);
    return callMkCommand(line.c_str(), attrPairs, table.names, table.count);
}
