#include <gtest/gtest.h>

#include "QyplatCmdCaller.h"
#include "ToolFolder.h"

namespace {

using System = zemQyplatCmdCaller::ManagedSystemAttribute;
using Partition = zemQyplatCmdCaller::PartitionAttribute;

TEST(QyplatCmdCallerTest, EnumeratorsArePositions) {
    const struct {
        int position;
        System::Attribute attribute;
        const char* name;
    } rows[] = {
        {0, System::ATTR_NAME, "name"},
        {28, System::ATTR_7460_APPLICATION_CAPABLE, "7460_application_capable"},
        {34, System::ATTR_ASSIGN_7460_WKL_PERCENT, "assign_7460_wkl_percent"},
        {50, System::ATTR_SP_BOTT_MINOR_TYPE, "sp_boot_minor_type"},
        {52, System::ATTR_CURR_MFG_DEFAULT_IPL_SOURCW, "curr_mfg_default_ipl_source"},
        {58, System::ATTR_CORALHV_LPAR_REMOTE_RESTART_CAPABLE,
         "coralhv_lpar_remote_restart_capable"},
        {61, System::ATTR_ACTIVE_MEMORY_SHARING_CAPABLE, "active_mem_sharing_capable"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.position, row.attribute);
        EXPECT_STREQ(row.name, System::m_attributeName[row.attribute]);
    }
    EXPECT_EQ(-1, System::ATTR_END);
    EXPECT_EQ(18, Partition::ATTR_MIGRATION_STATE);
    EXPECT_EQ(43, zemQyplatCmdCaller::PartitionProfileAttribute::ATTR_REDUNDANT_ERR_PATH_REPORTING);
}

TEST(QyplatCmdCallerTest, KeysRecordsByTheListOfAttributes) {
    ToolFolder tools;
    tools.recorder("qyplat", "one,\"two,2\"\n");
    zemQyplatCmdCaller caller(nullptr, nullptr);
    int wanted[] = {System::ATTR_SERIAL_NUM, System::ATTR_NAME, System::ATTR_END};
    const zemRecordSetsType hosts = caller.getManagedSystemInformation(wanted, "m x");
    EXPECT_EQ("-r|sys|-m|m x|-F|serial_num,name", tools.arguments());
    ASSERT_EQ(1, hosts.size());
    EXPECT_STREQ("one", (*hosts.getElementAt(0))[System::ATTR_SERIAL_NUM]);
    EXPECT_STREQ("two,2", (*hosts.getElementAt(0))[System::ATTR_NAME]);

    tools.script("qyplat", "echo 'No results were found.'; exit 1");
    EXPECT_THROW(caller.getPartitionsInformation(nullptr, "m", nullptr),
                 zemObjectNotFoundException);
}

}  // namespace
