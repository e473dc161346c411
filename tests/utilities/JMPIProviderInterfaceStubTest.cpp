#include "AssociationHarness.h"
#include "JMPIProviderInterfaceStub.h"

namespace {

class SystemStub : public zemJMPIInstanceProviderBrokerInterface {
public:
    SystemStub(const CmpiBroker& mb, const CmpiContext& ctx)
        : CmpiBaseMI(mb, ctx), zemJMPIInstanceProviderBrokerInterface(mb, ctx, "SystemStub") {}
};

TEST(ProviderStubs, ForwardToTheServer) {
    World<Rows> w;
    const CmpiBroker mb(w.server.broker());
    SystemStub stub(mb, w.ctx());
    EXPECT_FALSE(stub.isValidInstanceClass("Test_System"));
    EXPECT_TRUE(zemLANEndPointProviderStub(mb, w.ctx()).isValidInstanceClass("orxc_lanendpoint"));
    EXPECT_EQ(&stub.getSynchronizerContext(),
              &zemDNXProviderStub(mb, w.ctx()).getSynchronizerContext());

    cimom::ObjectPath where(kNameSpace, "Test_System");
    where.host = "somewhere";
    const CmpiObjectPath path = w.path(where);
    zemDynamicArray<CmpiObjectPath> paths(25);
    stub.enumInstanceNames(w.ctx(), path, paths, path);
    ASSERT_EQ(3, paths.size());
    EXPECT_EQ("b1", nameOf(*paths[2]));
    EXPECT_STREQ("somewhere", paths[2]->getHostname().charPtr());
    zemDynamicArray<CmpiInstance> instances(25);
    stub.enumInstances(w.ctx(), path, nullptr, instances, path);
    EXPECT_EQ(3, instances.size());
    const CmpiObjectPath s2 = w.path(objectPath("s2"));
    CmpiInstance found(path);
    EXPECT_EQ(0, stub.getInstance(w.ctx(), s2, nullptr, found));
    EXPECT_STREQ("s2", found.getProperty("Name").getString().charPtr());
    EXPECT_THROW(stub.getInstance(w.ctx(), w.path(objectPath("s9")), nullptr, found), CmpiStatus);
}

}  // namespace
