#include <future>

#include "AssociationHarness.h"
#include "BaseZemMultiNtoNAssociationProvider.h"
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

/// Joins systems and disks that it gets through a stub.
class Forwarded : public Scripted<zemBaseZemMultiNtoNAssociationProvider> {
public:
    Forwarded(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), Scripted(mb, ctx, name, OP_ALLOps), m_stub(mb, ctx) {
        m_associationDataSet.addNewAssoPair(
            new zemMultiNtoNAssociationPair({&m_stub, "Test_System", "Left", ""},
                                            {&m_stub, "Test_Disk", "Right", ""}, "Test_Link", ""));
    }
    CMPIBoolean isValidInstanceClass(const char* name) override {
        world->hook("asked");
        return Scripted::isValidInstanceClass(name);
    }
    bool BeforeGenerateAssociation(const CmpiContext&, const char*) override {
        return world->hook("before");
    }

private:
    SystemStub m_stub;
};

// One thread pairs, and is about to ask a stub; another is in a stub, which asks the same provider.
TEST(ProviderStubs, OfAProviderThatAsksStubs) {
    World<Forwarded> w;
    std::thread other;
    std::promise<void> asked;
    world->onHook = [&, first = std::this_thread::get_id()](const std::string& hook) {
        const bool here = std::this_thread::get_id() == first;
        if (!here && hook == "asked") {
            asked.set_value();
        }
        if (!here || hook != "before") {
            return true;
        }
        other = std::thread([&] {
            const cimom::RequestScope scope(w.server);
            const CmpiContext ctx(scope.context());
            SystemStub stub(CmpiBroker(w.server.broker()), ctx);
            const CmpiObjectPath links(scope.wrap(pathOf("")));
            zemDynamicArray<CmpiObjectPath> paths(25);
            stub.enumInstanceNames(ctx, links, paths, links);
            EXPECT_EQ(6, paths.size());
        });
        asked.get_future().wait();
        return true;
    };
    EXPECT_EQ(6U, w.run("ein", "").paths.size());
    other.join();
}

}  // namespace
