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
    DiskProvider(const CmpiBroker& mb, const CmpiContext& ctx)
        : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, "Disks") {}
    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;
    using zemBaseZemInstanceProvider::getLparID;
    using zemBaseZemInstanceProvider::getMtms;

    CMPIBoolean isValidInstanceClass(const char*) override { return true; }
    int getInstance(const CmpiContext&, const CmpiObjectPath& cop, const char**,
                    CmpiInstance& out) override {
        zemString name;
        if (!zemReadText(getKeyBinding(cop, "Name"), name) || !name.startsWith("d")) return -1;
        out.setProperty("Name", CmpiData(static_cast<const char*>(name)));
        return 0;
    }
    void enumInstanceNames(const CmpiContext&, const CmpiObjectPath& cop,
                           zemDynamicArray<CmpiObjectPath>& out, const CmpiObjectPath&) override {
        for (const char* name : {"d1", "d2"}) {
            auto path = std::make_unique<CmpiObjectPath>(createObjectPath(cop));
            path->setKey("Name", CmpiData(name));
            out.addElement(path.release());
        }
    }
    void enumInstances(const CmpiContext& ctx, const CmpiObjectPath& cop, const char** properties,
                       zemDynamicArray<CmpiInstance>& out, const CmpiObjectPath& origCop) override {
        zemDynamicArray<CmpiObjectPath> paths;
        enumInstanceNames(ctx, cop, paths, origCop);
        for (int i = 0; i < paths.size(); ++i) {
            auto instance = std::make_unique<CmpiInstance>(*paths[i]);
            getInstance(ctx, *paths[i], properties, *instance);
            out.addElement(instance.release());
        }
    }
};

template <class Provider>
CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char*) {
    return new Provider(mb, ctx);
}

class BaseZemProvider : public BothBrokers {
protected:
    BaseZemProvider()
        : h(GetParam()),
          service(CmpiBroker(h.server.broker()), CmpiContext(h.ctx())),
          instance(h.scope.wrap(cimom::Instance(Harness::diskPath(),
                                                {{"Name", "d1"},
                                                 {"Size", std::uint32_t{7}},
                                                 {"Caption", cimom::Value::null(CMPI_string)}}))) {}

    struct Instance : CmpiInstance {
        explicit Instance(CMPIInstance* raw) : CmpiInstance(raw) {}
    };

    // The text of what a call throws, after its kind.
    static std::string thrown(const std::function<void()>& call) {
        testing::internal::CaptureStdout();
        std::string text;
        try {
            call();
        } catch (const zemException& e) {
            text = std::to_string(e.getExceptionType()) + " " + e.getExceptionString();
        }
        testing::internal::GetCapturedStdout();
        return text;
    }

    Harness h;
    ServiceProvider service;
    Instance instance;
};

TEST_P(BaseZemProvider, ReadsPropertiesByType) {
    EXPECT_STREQ("7", zemBaseProvider::cmpidata2String(
                          service.getInstanceProperty(instance, "Size", CMPI_uint32)));
    EXPECT_EQ(CMPI_string, service.getInstanceProperty(instance, "Name", CMPI_chars).getType());
    EXPECT_TRUE(zemIsMissing(service.getInstanceProperty(instance, "None", CMPI_uint32)));
    EXPECT_TRUE(zemIsMissing(service.getInstanceProperty(instance, "Caption", CMPI_uint32)));
    const std::string type =
        "3 The data type(\"uint32\") of property \"Size\" is invalid in "
        "instance root/cimv2:Test_Disk.Name=\"d1\", the expected data type is ";
    EXPECT_EQ(type + "\"uint16\"",
              thrown([&] { service.getInstanceProperty(instance, "Size", CMPI_uint16); }));
    EXPECT_EQ(type + "\"uint32[]\"",
              thrown([&] { service.getInstanceProperty(instance, "Size", CMPI_uint32A); }));
}

TEST_P(BaseZemProvider, TestsPropertiesOfInstances) {
    const Instance other(
        h.scope.wrap(cimom::Instance(Harness::diskPath(), {{"Size", std::uint32_t{8}}})));
    const std::string given = "of class Test_Disk";
    const std::pair<std::function<void()>, std::string> rows[] = {
        {[&] { service.validateRequestedProperty(instance, "Size"); }, ""},
        {[&] { service.validateRequestedProperty(instance, "Caption"); },
         "3 The requested property  \"Caption\" for class Test_Disk was not provided."},
        {[&] { service.validateUnsupportedProperty(instance, "Caption"); }, ""},
        {[&] { service.validateUnsupportedProperty(instance, "Size"); },
         "3 Attempt to create or modify unsupported property \"Size\" of class Test_Disk."},
        {[&] { service.validateUnimplementedProperty(instance, "Name"); },
         "3 Attempt to create or modify unimplemented property \"Name\" of class Test_Disk to "
         "\"d1\"."},
        {[&] { service.validateCannotSpecifiedProperty(instance, "Size"); },
         "3 Attempt to set property \"Size\" of class Test_Disk to 7. Can not specify this "
         "property "
         "\"Size\", when execute this operation."},
        {[&] { service.validateUnmodifiableProperty(other, instance, "Caption"); }, ""},
        {[&] { service.validateUnmodifiableProperty(instance, instance, "Size"); }, ""},
        {[&] { service.validateUnmodifiableProperty(other, instance, "Size"); },
         "3 Attempt to change unmodifiable property \"Size\" of class Test_Disk from 8 to 7."},
        {[&] { service.validateFixedValueProperty(instance, "Name", "d1", false); }, ""},
        {[&] { service.validateFixedValueProperty(instance, "Size", "7", false); }, ""},
        {[&] { service.validateFixedValueProperty(instance, "Caption", "x", true); }, ""},
        {[&] { service.validateFixedValueProperty(instance, "Caption", "x", false); },
         "3 A property provided for class Test_Disk had an unexpected value. An invalid value of  "
         "was specifieded for property \"Caption\" instead of the expected value of x"},
        {[&] { service.validateFixedValueProperty(instance, "Name", "D1", true); },
         "3 A property provided for class Test_Disk had an unexpected value. An invalid value of "
         "d1 "
         "was specifieded for property \"Name\" instead of the expected value of D1"},
        {[&] { service.validateEmbededInstanceProerties(instance, "M"); }, ""},
    };
    for (const auto& [call, text] : rows) EXPECT_EQ(text, thrown(call));
}

TEST_P(BaseZemProvider, FetchesEmbeddedObjects) {
    const auto check = [&](CMPIObjectPath* path) {
        return thrown([&] {
            service.validateEmbeddedObject(CmpiContext(h.ctx()), CmpiObjectPath(path), "Target",
                                           "Force");
        });
    };
    const std::string refused = "3 Invalid value of root/cimv2:Test_Disk";
    EXPECT_EQ(refused + " is provided for parameter Target to method Force on provider Service.",
              check(h.classPath()));
    EXPECT_TRUE(script.calls.empty());

    static Harness* current;
    current = &h;
    cimom::Factories factories;
    factories.instance = [](const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
        return zemBaseProviderManager::getInstanceMI(current->server.broker(), current->ctx(),
                                                     "Disks", nullptr, create<DiskProvider>);
    };
    h.server.registerProvider("Disks", {"Test_Disk"}, factories);
    EXPECT_EQ("", check(h.path()));
    EXPECT_EQ(refused +
                  ".Name=\"x9\" is provided for parameter Target to method Force on provider "
                  "Service.",
              check(h.scope.wrap(cimom::ObjectPath("root/cimv2", "Test_Disk", {{"Name", "x9"}}))));
    const std::string failed =
        check(h.scope.wrap(cimom::ObjectPath("root/cimv2", "Test_Unserved", {{"Name", "x9"}})));
    EXPECT_EQ(0U, failed.find("6 An error ocurred, when validate value "
                              "root/cimv2:Test_Unserved.Name=\"x9\" of parameter \"Target\". And "
                              "the error string was \""));
}

TEST_P(BaseZemProvider, NamesTheFailuresOfResources) {
    const std::pair<std::function<void()>, std::string> rows[] = {
        {[&] { service.throwMultiResourceExc("memory", "p", "s"); },
         "3 Multiple memory instances were specified for partition p on managed system s. Only one "
         "instance should be specified for such resource."},
        {[&] { service.throwDuplicateResourceExc("slot", "7", "p", "s"); },
         "3 Duplicate slot resources \"7\" were specified for partition p on managed system s"},
        {[&] { service.throwResourceHasExistedExc("slot", "7", "p", "s"); },
         "3 The specified slot \"7\" has been existing on partition p current profile on managed "
         "system s. "},
        {[&] { service.throwResourceNotExistingExc("slot", "7", "p", "s", "8,9"); },
         "3 The specified slot \"7\" was not existing on partition p current profile on managed "
         "system s. It maybe have never been added or have already been removed.Current existing "
         "such type resource are \"8,9\"."},
        {[&] { service.throwMinGtDesiredValueExc(~0ULL, 2, "K", "p", "s", "memory"); },
         "3 Conflicted property value 18446744073709551615 of \"Reservation\" and property value 2 "
         "of \"VirtualQuantity\" were specified for class K for partition p on managed system s. "
         "Desired memory should be greater than or equal to min memory."},
        {[&] { service.throwMinGtMaxValueExc(3, 2, "K", "p", "s", "memory"); },
         "3 Conflicted property value 3 of \"VirtualQuantity\" and property value 2 of \"Limit\" "
         "were specified for class K for partition p on managed system s. Min memory should be "
         "less than or equal to max memory."},
        {[&] { service.throwDesiredGtMaxValueExc(3, 2, "K", "p", "s", "memory"); },
         "3 Conflicted property value 3 of \"Reservation\" and property value 2 of \"Limit\" were "
         "specified for class K for partition p on managed system s. Desired memory should be less "
         "than or equal to max memory."},
    };
    for (const auto& [call, text] : rows) EXPECT_EQ(text, thrown(call));
}

TEST_P(BaseZemProvider, ServesArraysThroughTheFrame) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIInstanceMI* disks = zemBaseProviderManager::getInstanceMI(
        h.server.broker(), h.ctx(), "Disks", &status, create<DiskProvider>);
    Answer answer = h.answer([&](CMPIResult* r) {
        return disks->ft->enumerateInstanceNames(disks, h.ctx(), r, h.classPath());
    });
    ASSERT_EQ(2U, answer.reply.paths.size());
    EXPECT_EQ(cimom::Value("d2"), *answer.reply.paths[1].keys.find("Name"));
    answer = h.answer([&](CMPIResult* r) {
        return disks->ft->enumerateInstances(disks, h.ctx(), r, h.classPath(), nullptr);
    });
    ASSERT_EQ(2U, answer.reply.instances.size());
    EXPECT_EQ(cimom::Value("d1"), *answer.reply.instances[0].properties.find("Name"));
    answer = h.answer([&](CMPIResult* r) {
        return disks->ft->getInstance(
            disks, h.ctx(), r,
            h.scope.wrap(cimom::ObjectPath("root/cimv2", "Test_Disk", {{"Name", "x9"}})), nullptr);
    });
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, answer.rc);
    EXPECT_EQ(
        "The requested object root/cimv2:Test_Disk.Name=\"x9\" of class Test_Disk can not be "
        "found. "
        "The exception was thrown from method getInstance on provider Disks.",
        answer.text);

    auto& provider = dynamic_cast<DiskProvider&>(*static_cast<CmpiBaseMI*>(disks->hdl));
    EXPECT_STREQ("3", provider.getLparID("3*1111-AAA*0000001"));
    EXPECT_STREQ("1111-AAA*0000001", provider.getMtms("3*1111-AAA*0000001"));
    EXPECT_STREQ("", provider.getLparID("1111-AAA*0000001"));
    EXPECT_STREQ("1111-AAA*0000001", provider.getMtms("1111-AAA*0000001"));
    EXPECT_EQ(1, provider.isUnloadable());
    EXPECT_EQ(0, service.isUnloadable());
    EXPECT_EQ(CMPI_RC_OK, disks->ft->cleanup(disks, h.ctx(), false).rc);
}

ON_BOTH_BROKERS(BaseZemProvider);

}  // namespace
