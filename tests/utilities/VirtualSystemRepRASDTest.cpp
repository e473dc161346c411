#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "FailureText.h"
#include "VirtualSystemRepVSSD.h"

namespace {

constexpr char kHost[] = "1111-AAA*0000001";

std::unique_ptr<zemRASD> rasd(int type, const char* key) {
    return std::unique_ptr<zemRASD>(zemVSSD::createRASD(type, key));
}

/// Type, units and both automatic flags, as "3 Percent 11".
std::string constantsOf(zemRASD& rasd) {
    const zemRASDCommData& data = *rasd.getData();
    return std::to_string(data.m_ResourceType) + ' ' + std::string(data.m_AllocationUnits) + ' ' +
           std::to_string(data.m_AutomaticAllocation) +
           std::to_string(data.m_AutomaticDeallocation);
}

TEST(VirtualSystemRepRASDTest, EachKindHasItsKeyItsConstantsAndItsIds) {
    const struct {
        const char *key, *made, *constants, *state, *defined;
        const char* keyOfState;    ///< behind setInstanceID() with the ID of the state side
        const char* keyOfDefined;  ///< and of the defined side
    } rows[] = {
        {"x-9", "3-Processor", "3 Percent 11", "ORX:4*7*", "ORX:2*a-b-7*", "3-Processor",
         "3-Processor"},
        {"x-9", "4-Memory", "4 byte*2^10 11", "ORX:4*7*", "ORX:2*a-b-7*", "4-Memory", "4-Memory"},
        {"6-13-4", "6-13", "6 Adapter 10", "ORX:4*13*7*", "ORX:2*a-b-13*7*", "6-13", "6-13"},
        {"13", "10--1", "10 Adapter 11", "ORX:4*-1*7*", "ORX:2*a-b--1*7*", "10--1", "10-1"},
        {"12-2101A003", "12-2101A003", "12 Slot 10", "ORX:4*2101A003*7*", "ORX:2*a-b-2101A003*7*",
         "12-2101A003*7", "12-2101A003*7"},
        {"21-99999999999", "21-2147483647", "21 Adapter 10", "ORX:4*2147483647*7*",
         "ORX:2*a-b-2147483647*7*", "21-2147483647", "21-2147483647"},
    };
    for (const auto& row : rows) {
        const int type = std::atoi(row.constants);
        std::unique_ptr<zemRASD> made = rasd(type, row.key);
        EXPECT_STREQ(row.made, made->getKey());
        EXPECT_EQ(row.constants, constantsOf(*made));
        EXPECT_STREQ("", made->getInstanceID(false, nullptr));
        EXPECT_EQ(
            "3/zemRASD/getInstanceID//When re-generating InstanceID, the parameter vssd is "
            "required.",
            failureText([&] { made->getInstanceID(true, nullptr); }));
        zemVSSD vssd(kHost, "7", "a-b");
        for (const bool isState : {true, false}) {
            vssd.GenerateInstanceID(isState);
            const std::string id = std::string(isState ? row.state : row.defined) + kHost;
            EXPECT_EQ(id, std::string(made->getInstanceID(true, &vssd)));
            EXPECT_EQ(id, std::string(made->getInstanceID(false, nullptr)));
            std::unique_ptr<zemRASD> read = rasd(type, "");
            read->setInstanceID(id.c_str(), kHost);
            EXPECT_STREQ(isState ? row.keyOfState : row.keyOfDefined, read->getKey());
            EXPECT_EQ(id, std::string(read->getInstanceID(false, nullptr)));
        }
        // Too short for the host: stored, and nothing read from it.
        std::unique_ptr<zemRASD> read = rasd(type, row.key);
        read->setInstanceID("ORX:4*5*", kHost);
        EXPECT_STREQ(row.made, read->getKey());
    }
}

TEST(VirtualSystemRepRASDTest, CopiesHaveNoAddress) {
    zemVETHRASD adapter("10-4");
    adapter.m_Data.m_Address = "A2";
    adapter.m_Data.m_vswitch = "net";
    adapter.m_Data.m_AddVLANIDs.append(20);
    adapter.m_Data.m_ResourceType = 5;
    const std::unique_ptr<zemRASD> clone(adapter.clone());
    const auto& copy = static_cast<zemVETHRASD&>(*clone).m_Data;
    EXPECT_TRUE(copy.m_Address.isEmpty());
    EXPECT_EQ(10, copy.m_ResourceType);
    EXPECT_STREQ("net", copy.m_vswitch);
    EXPECT_EQ(20, copy.m_AddVLANIDs[0]);
    EXPECT_FALSE(adapter.equals(clone.get()));
    const zemRASDCommData common(&adapter.m_Data);
    EXPECT_TRUE(common.m_Address.isEmpty() && common.getKey().isEmpty());
    EXPECT_EQ(5, common.m_ResourceType);

    zemProcessorRASD processor("");
    processor.setMTMS(kHost);
    const std::unique_ptr<zemRASD> other(processor.clone());
    EXPECT_TRUE(processor.equals(other.get()));
    EXPECT_STREQ("", static_cast<zemProcessorRASD&>(*other).getMTMS());
}

/// One with a changed field is another.
template <class Rasd, class Data, class Value, class... Field>
void expectChangesSeen(const Value& value, Field Data::*... fields) {
    Rasd mine("0-1");
    EXPECT_FALSE(mine.equals(nullptr));
    const auto check = [&](auto field) {
        Rasd other("0-1");
        EXPECT_TRUE(mine.equals(&other));
        other.m_Data.*field = value;
        EXPECT_FALSE(mine.equals(&other)) << mine.getKey();
        EXPECT_TRUE(other.equals(&other));
    };
    (check(fields), ...);
}

TEST(VirtualSystemRepRASDTest, EqualsComparesAllFields) {
    using Common = zemRASDCommData;
    expectChangesSeen<zemMemoryRASD>("x", &Common::m_InstanceID, &Common::m_PoolID,
                                     &Common::m_SharingMode, &Common::m_AllocationUnits,
                                     &Common::m_Address);
    expectChangesSeen<zemMemoryRASD>(
        0, &Common::m_Weight, &Common::m_ConsumerVisibility, &Common::m_MappingBehavior,
        &Common::m_ResourceType, &Common::m_VirtualMinimum, &Common::m_VirtualQuantity,
        &Common::m_VirtualMaximum, &Common::m_Minimum, &Common::m_Reservation,
        &Common::m_AutomaticAllocation, &Common::m_AutomaticDeallocation, &Common::m_IsRequired);
    expectChangesSeen<zemMemoryRASD>(std::int64_t{1} << 32, &Common::m_Limit);
    expectChangesSeen<zemProcessorRASD>("x",
                                        &zemProcessorRASD::zemProcessorRASDData::m_ProcCompatMode);
    expectChangesSeen<zemIOSlotRASD>("x", &zemIOSlotRASD::zemIOSlotRASDData::m_DRCIndex);
    using Remote = zemRemoteAdapterRASDData;
    expectChangesSeen<zemVSCSIRASD>(0, &Remote::m_VirtualAdapterType, &Remote::m_SlotID,
                                    &Remote::m_RemoteClientFlag, &Remote::m_RemoteClientSlotFlag,
                                    &Remote::m_RemoteSlotID);
    expectChangesSeen<zemVSCSIRASD>("x", &Remote::m_RemoteVirtualSystemID);
    using Ethernet = zemVETHRASD::zemVETHRASDData;
    expectChangesSeen<zemVETHRASD>(0, &Ethernet::m_SlotID, &Ethernet::m_IEEECompatible,
                                   &Ethernet::m_PortVLANID, &Ethernet::m_TrunkPriority);
    expectChangesSeen<zemVETHRASD>("x", &Ethernet::m_vswitch);
    zemVSCSIRASD scsi;
    zemVSERIALRASD serial;
    serial.m_Data.m_ResourceType = scsi.m_Data.m_ResourceType;
    EXPECT_FALSE(scsi.equals(&serial));
}

TEST(VirtualSystemRepRASDTest, ListsAreComparedAsFarAsThisOneGoes) {
    zemVETHRASD fewer("10-4"), more("10-4");
    fewer.m_Data.m_AddVLANIDs.append(5);
    more.m_Data.m_AddVLANIDs.append(5);
    more.m_Data.m_AddVLANIDs.append(0);
    EXPECT_TRUE(fewer.equals(&more));
    EXPECT_FALSE(more.equals(&fewer));
    zemIOSlotRASD untagged, tagged;
    tagged.m_Data.m_TaggedIOType.append(1);
    EXPECT_TRUE(untagged.equals(&tagged));
    EXPECT_FALSE(tagged.equals(&untagged));
}

}  // namespace
