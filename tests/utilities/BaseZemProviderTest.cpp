#include "BaseProviderText.h"
#include "BaseZemInstanceProvider.h"
#include "BaseZemProvider.h"
#include "ProviderHarness.h"

namespace {

class ServiceProvider : public zemBaseZemProvider {
public:
    ServiceProvider(const CmpiBroker& mb, const CmpiContext& ctx)
        : CmpiBaseMI(mb, ctx), zemBaseZemProvider(mb, ctx, "Service") {}
};

// Knows the disks "d1" and "d2".
class DiskProvider : public zemBaseZemInstanceProvider {
public:
    DiskProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, name) {}
    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::getInstance;
    using zemBaseZemInstanceProvider::getLparID;
    using zemBaseZemInstanceProvider::getMtms;

    CMPIBoolean isValidInstanceClass(const char*) override { return true; }
    int getInstance(const CmpiContext&, const CmpiObjectPath& cop, const char**,
                    CmpiInstance& out) override {
        zemString name;
        if (!zemReadText(getKeyBinding(cop, "Name"), name) || !name.startsWith("d")) {
            return -1;
        }
        out.setProperty("Name", CmpiData(static_cast<const char*>(name)));
        return 0;
    }
    void enumInstanceNames(const CmpiContext&, const CmpiObjectPath& cop,
                           zemDynamicArray<CmpiObjectPath>& out, const CmpiObjectPath&) override {
        for (const char* name : {"d1", "d2"}) {
            out.addElement(new CmpiObjectPath(createObjectPath(cop)));
            out[out.size() - 1]->setKey("Name", CmpiData(name));
        }
    }
};

class BaseZemProvider : public BothBrokers {
protected:
    BaseZemProvider()
        : h(GetParam(), FactoriesOf<DiskProvider>::create),
          service(CmpiBroker(h.server.broker()), CmpiContext(h.ctx())),
          disk(h.disk({{"Name", "d1"},
                       {"Size", std::uint32_t{7}},
                       {"Caption", cimom::Value::null(CMPI_string)}})) {}

    using Instance = FromServer<CmpiInstance>;

    Harness h;
    ServiceProvider service;
    Instance disk;
};

TEST_P(BaseZemProvider, ReadsPropertiesByType) {
    EXPECT_EQ(CMPI_string, service.getInstanceProperty(disk, "Name", CMPI_chars).getType());
    EXPECT_TRUE(zemIsMissing(service.getInstanceProperty(disk, "None", CMPI_uint32)));
    EXPECT_TRUE(zemIsMissing(service.getInstanceProperty(disk, "Caption", CMPI_uint32)));
    EXPECT_EQ(
        "3/The data type(\"uint32\") of property \"Size\" is invalid in instance "
        "root/cimv2:Test_Disk.Name=\"d1\", the expected data type is \"uint32[]\"",
        failureText([&] { service.getInstanceProperty(disk, "Size", CMPI_uint32A); }, "kt"));
    CMPIInstance* const locked = h.disk();
    static CMPIInstanceFT table = *locked->ft;
    table.getProperty = [](const CMPIInstance*, const char*, CMPIStatus* rc) {
        rc->rc = CMPI_RC_ERR_ACCESS_DENIED;
        return CMPIData{};
    };
    table.getObjectPath = [](const CMPIInstance*, CMPIStatus* rc) -> CMPIObjectPath* {
        rc->rc = CMPI_RC_ERR_NOT_SUPPORTED;
        return nullptr;
    };
    locked->ft = &table;
    EXPECT_EQ(
        "6/Get Property:\"Name\" of  failed. Name",
        failureText([&] { service.validateRequestedProperty(Instance(locked), "Name"); }, "kt"));
}

TEST_P(BaseZemProvider, TestsPropertiesOfInstances) {
    const Instance other(h.disk({{"Name", "d1"}, {"Size", std::uint32_t{8}}}));
    const std::string unexpected =
        "3/A property provided for class Test_Disk had an unexpected value. An invalid value of ";
    const std::pair<std::function<void()>, std::string> rows[] = {
        {[&] { service.validateUnsupportedProperty(disk, "Caption"); }, ""},
        {[&] { service.validateUnmodifiableProperty(other, disk, "Caption"); }, ""},
        {[&] { service.validateUnmodifiableProperty(other, disk, "Size"); },
         "3/Attempt to change unmodifiable property \"Size\" of class Test_Disk from 8 to 7."},
        {[&] { service.validateFixedValueProperty(disk, "Size", "7", false); }, ""},
        {[&] { service.validateFixedValueProperty(disk, "Caption", "x", true); }, ""},
        {[&] { service.validateFixedValueProperty(disk, "Name", "D1", true); },
         unexpected +
             "d1 was specifieded for property \"Name\" instead of the expected value of D1"},
        {[&] { service.validateEmbededInstanceProerties(disk, "M"); }, ""},
        {[&] { service.throwMinGtDesiredValueExc(~0ULL, 2, "K", "p", "s", "memory"); },
         "3/Conflicted property value 18446744073709551615 of \"Reservation\" and property value 2 "
         "of \"VirtualQuantity\" were specified for class K for partition p on managed system s. "
         "Desired memory should be greater than or equal to min memory."},
    };
    for (const auto& [call, text] : rows) {
        EXPECT_EQ(text, failureText(call, "kt"));
    }
}

TEST_P(BaseZemProvider, ServesArraysThroughTheFrame) {
    Answer answer = h.call(h.instance, &CMPIInstanceMIFT::enumerateInstanceNames, h.classPath());
    ASSERT_EQ(2U, answer.reply.paths.size());
    EXPECT_EQ(cimom::Value("d2"), *answer.reply.paths[1].keys.find("Name"));
    answer = h.call(h.instance, &CMPIInstanceMIFT::getInstance, h.path("x9"), nullptr);
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, answer.rc);
    EXPECT_EQ(
        "The requested object root/cimv2:Test_Disk.Name=\"x9\" of class Test_Disk can not be "
        "found. "
        "The exception was thrown from method getInstance on provider TestProvider.",
        answer.text);

    auto& provider = dynamic_cast<DiskProvider&>(h.provider());
    EXPECT_STREQ("3", provider.getLparID("3*1111-AAA*0000001"));
    EXPECT_STREQ("1111-AAA*0000001", provider.getMtms("3*1111-AAA*0000001"));
    EXPECT_STREQ("1111-AAA*0000001", provider.getMtms("1111-AAA*0000001"));
    EXPECT_EQ(1, provider.isUnloadable());
    EXPECT_EQ(0, service.isUnloadable());
}

ON_BOTH_BROKERS(BaseZemProvider);

}  // namespace
