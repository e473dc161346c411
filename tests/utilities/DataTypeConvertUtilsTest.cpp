#include "AssociationHarness.h"
#include "DataTypeConvertUtils.h"

namespace {

constexpr const char* kHost = "1111-AAA*0000001";

TEST(DataTypeConvert, HostAndPartitionOfAClass) {
    const struct {
        const char* className;
        cimom::NamedValues keys;
        std::string byHost, mtms, lparid;
        // clang-format off
    } cases[] = {
        {"ORXC_CEC_CS", {{"Name", kHost}}, kHost, kHost, ""},
        {"orxc_lpar_cs", {{"Name", "12*1111-AAA*0000001"}}, kHost, kHost, "12"},
        {"ORXC_LPAR_CS", {{"Name", "12"}}, "", "", ""},
        {"ORXC_Memory", {{"SystemCreationClassName", "ORXC_CEC_CS"}, {"SystemName", kHost}}, kHost, kHost, ""},
        {"ORXC_Memory", {{"SystemCreationClassName", "ORXC_LPAR_CS"}, {"SystemName", "3*1111-AAA*0000001"}}, kHost, kHost, "3"},
        {"ORXC_Memory", {{"SystemCreationClassName", "Other"}, {"SystemName", "3*1111-AAA*0000001"}}, kHost, "", ""},
        {"ORXC_AlarmDevice", {{"SystemCreationClassName", "ORXC_LPAR_CS"}, {"SystemName", "3*1111-AAA*0000001"}}, "", kHost, "3"},
        {"ORXC_ProcessorRASettingData", {{"InstanceID", "x/9*1111-AAA*0000001"}}, kHost, kHost, ""},
        {"ORXC_ProcessorRASettingData", {{"InstanceID", "1111-AAA*0000001"}}, "", "", ""},
        {"ORXC_ProcessorRASettingData", {{"InstanceID", "*1111-AAA*0000001"}}, "", "", ""},
        {"ORXC_PoolConfigurationService", {{"SystemName", kHost}}, kHost, "", ""},
        {"x_poolconfigurationcapabilities", {{"InstanceID", "a-1111-AAA*0000001"}}, kHost, kHost, ""},
        {"ORXC_MemoryPool", {{"InstanceID", "x*1111-AAA*0000001"}}, kHost, kHost, ""},
        {"ORXC_OtherPool", {{"InstanceID", "x*1111-AAA*0000001"}}, kHost, "", ""},
        {"ORXC_PoolAllocationCapabilities", {{"InstanceID", "x:1111-AAA*0000001"}}, "", kHost, ""},
        {"ORXC_MemoryAllocationCapabilities", {{"InstanceID", "x*1111-AAA*0000001"}}, kHost, kHost, ""},
        {"ORXC_SlotAllocationCapabilities", {{"InstanceID", "x:y:1111-AAA*0000001"}}, kHost, kHost, ""},
        {"ORXC_MemoryCapacity", {{"Name", kHost}}, kHost, kHost, ""},
        {"ORXC_PhysicalPackage", {{"Tag", kHost}}, kHost, kHost, ""},
        {"ORXC_VLANEndpoint", {{"SystemName", "3*1111-AAA*0000001"}}, kHost, kHost, "3"},
        {"ORXC_VLANEndpoint", {{"SystemName", "3"}}, "3", "", ""},
        {"ORXC_LANEndPoint", {{"SystemName", "3*1111-AAA*0000001"}}, "", kHost, "3"},
        {"ORXC_NetworkVLAN", {{"InstanceID", "7*1111-AAA*0000001"}}, "7*1111-AAA*0000001", kHost, ""},
        {"ORXC_VirtualSystemManagementCapabilities", {{"InstanceID", "ORXCORAL:ZEMCap:1111-AAA*0000001"}}, "", kHost, ""},
        {"ORXC_VirtualSystemMigrationCapabilities", {{"InstanceID", "short"}}, "", "", ""},
        {"ORXC_EnabledVirtualSystemCapabilities", {{"InstanceID", "ORXCORAL:ZEMCap:3*1111-AAA*0000001"}}, "", kHost, ":3"},
        {"ORXC_VirtualSystemManagementService", {{"Name", "SystemVirtualization:1111-AAA*0000001"}}, "", kHost, ""},
        {"ORXC_ZEMMetricValue", {{"InstanceID", "ORX:ZEM:MDHS0016+1111-AAA*0000001"}}, "", "+1111-AAA*0000001", ""},
        {"ORXC_ZEMMetricValue", {{"InstanceID", "ORX:ZEM:MDLP0016:3*1111-AAA*0000001"}}, "", kHost, ":3"},
        {"ORXC_Unknown", {}, "", "", ""},
    };
    // clang-format on
    World<Rows> w;
    w.provider();
    for (const auto& c : cases) {
        SCOPED_TRACE(c.className);
        const CmpiObjectPath path = w.path({kNameSpace, c.className, c.keys});
        EXPECT_STREQ(c.byHost.c_str(), zemDataTypeConvertManager::getMTMSByOP(path));
        zemString mtms = "old", lparid = "old";
        zemDataTypeConvertManager::getMTMSAndLparIDByOp(path, mtms, lparid);
        EXPECT_STREQ(c.mtms.c_str(), mtms);
        EXPECT_STREQ(c.lparid.c_str(), lparid);
    }
    EXPECT_THROW(zemDataTypeConvertManager::getMTMSByOP(w.path({kNameSpace, "ORXC_LPAR_CS"})),
                 CmpiStatus);
}

}  // namespace
