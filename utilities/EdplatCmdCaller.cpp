#include "EdplatCmdCaller.h"

#include <memory>
#include <string>

namespace {

using Pairs = zemDynamicArray<tagAttributePair>;

}  // namespace

zemEdplatCmdCaller::zemEdplatCmdCaller(const char* auth, const char* locale)
    : zemCommandCaller(auth, locale) {}

int zemEdplatCmdCaller::change(const char* resource, const Pairs& identity, const Pairs& attrPairs,
                               const char* managedSystem, zemAttributeNames table, CH_OP_TYPE op) {
    const std::string line = std::string("edplat -r ") + resource + systemOption(managedSystem);
    return callChCommand(line.c_str(), identity, attrPairs, table.names, table.count, op, " -i ");
}

int zemEdplatCmdCaller::changeManagedSystemInformation(const Pairs& attrPairs,
                                                       const char* managedSystem, CH_OP_TYPE op) {
    return change("sys", Pairs(), attrPairs, managedSystem, ManagedSystemAttribute::m_attributeName,
                  op);
}

int zemEdplatCmdCaller::changePartitionsInformation(const zemString& lparId, const Pairs& attrPairs,
                                                    const char* managedSystem, CH_OP_TYPE op) {
    Pairs identity;
    identity.addElement(
        std::make_unique<tagAttributePair>(PartitionAttribute::ATTR_LPAR_ID, itemValue(lparId)));
    return change("lpar", identity, attrPairs, managedSystem, PartitionAttribute::m_attributeName,
                  op);
}

int zemEdplatCmdCaller::changePartitionsProfileInformation(const zemString& profName,
                                                           const Pairs& attrPairs,
                                                           const char* lparId,
                                                           const char* managedSystem,
                                                           CH_OP_TYPE op) {
    using Profile = PartitionProfileAttribute;
    Pairs identity;
    identity.addElement(
        std::make_unique<tagAttributePair>(Profile::ATTR_NAME, itemValue(profName)));
    identity.addElement(
        std::make_unique<tagAttributePair>(Profile::ATTR_LPAR_ID, itemValue(lparId)));
    return change("prof", identity, attrPairs, managedSystem, Profile::m_attributeName, op);
}

int zemEdplatCmdCaller::modifyManagedSystemInformation(const Pairs& attrPairs,
                                                       const char* managedSystem) {
    return changeManagedSystemInformation(attrPairs, managedSystem, CH_OP_MODIFY);
}

/// The operations on partitions and profiles that make one kind of change.
#define ZEM_EDPLAT_OPERATIONS(NAME, OP)                                                            \
    int zemEdplatCmdCaller::NAME##PartitionsInformation(                                           \
        const zemString& lparId, const Pairs& attrPairs, const char* managedSystem) {              \
        return changePartitionsInformation(lparId, attrPairs, managedSystem, OP);                  \
    }                                                                                              \
    int zemEdplatCmdCaller::NAME##PartitionsProfileInformation(                                    \
        const zemString& profName, const Pairs& attrPairs, const char* lparId,                     \
        const char* managedSystem) {                                                               \
        return changePartitionsProfileInformation(profName, attrPairs, lparId, managedSystem, OP); \
    }

ZEM_EDPLAT_OPERATIONS(add, CH_OP_ADD)
ZEM_EDPLAT_OPERATIONS(modify, CH_OP_MODIFY)
ZEM_EDPLAT_OPERATIONS(remove, CH_OP_REMOVE)
