#include <tuple>

#include "AssociationDataPrepareUtils.h"
#include "AssociationHarness.h"
#include "BaseZemMultiNtoNAssociationProvider.h"

namespace {

/// A side: serves the objects of the world, past the server, with a gap before each.
class Side : public zemBaseZemInstanceProvider {
public:
    Side(const CmpiBroker& mb, const CmpiContext& ctx)
        : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, "Side") {}
    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::getInstance;

    int getInstance(const CmpiContext&, const CmpiObjectPath& cop, const char**,
                    CmpiInstance& out) override {
        const auto& names = world->objects[cop.getClassName().charPtr()];
        if (std::find(names.begin(), names.end(), nameOf(cop)) == names.end()) {
            return -1;
        }
        out.setProperty("Name", CmpiData(nameOf(cop).c_str()));
        return 0;
    }
    void enumInstanceNames(const CmpiContext&, const CmpiObjectPath& cop,
                           zemDynamicArray<CmpiObjectPath>& out, const CmpiObjectPath&) override {
        for (const CmpiObjectPath& object : askWorld("names", cop)) {
            out.addElement(nullptr);
            out.addElement(new CmpiObjectPath(object));
        }
    }
};

/// Adds the rows of the world as pairs; a namespace "none" stands for a missing handle.
void addPairs(zemMultiNtoNAssociationDataSet& set, Side& side) {
    const auto handle = [&](const char* nameSpace) {
        return std::string(nameSpace) == "none" ? nullptr : &side;
    };
    for (const Row& r : world->rows) {
        set.addNewAssoPair(new zemMultiNtoNAssociationPair(
            {handle(r[4]), r[2], r[3], ""}, {handle(r[7]), r[5], r[6], ""}, r[0], r[1]));
    }
}

class Plain : public Scripted<zemBaseZemMultiNtoNAssociationProvider> {
public:
    Plain(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), Scripted(mb, ctx, name, OP_ALLOps), m_side(mb, ctx) {
        addPairs(m_associationDataSet, m_side);
    }
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2,
                               const zemMultiNtoNAssociationPair& pair) override {
        // as providers that look for targets of their own call it
        static_assert(
            std::is_invocable_v<decltype(&Plain::CheckRolesAndResultClass), Plain&, const char*,
                                const char*, const char*, const zemMultiTargetAssociationData&>);
        EXPECT_STREQ("Left", pair.m_leftAssiData.m_assoPropname);
        world->note("pair");
        return world->valid(nameOf(cop1), nameOf(cop2));
    }
    void addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                       const char** properties, const char* className) override {
        world->note("addProperties");
        Scripted::addProperties(inst, cop1, cop2, properties, className);
    }
    bool BeforeGenerateAssociation(const CmpiContext&, const char*) override {
        return world->hook("before");
    }
    void AfterGenerateAssociation(const CmpiContext&, const char*) override {
        world->hook("after");
    }

private:
    Side m_side;
};

/// Objects belong together by the digits of their names.
class Joined : public Scripted<zemEnhanceBaseZemMultiNtoNAssociationProvider> {
public:
    Joined(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), Scripted(mb, ctx, name, OP_ALLOps), m_side(mb, ctx) {
        addPairs(m_associationDataSet, m_side);
    }
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath&, const CmpiObjectPath&,
                               void*) override {
        return world->hook("named pair");
    }
    bool isValidateAssociationPlus(const CmpiContext&, const CmpiObjectPath& cop1,
                                   const CmpiObjectPath& cop2, void* addInfo) override {
        EXPECT_EQ(world.get(), addInfo);
        world->note("pair");
        return world->valid(nameOf(cop1), nameOf(cop2));
    }
    zemString getObjectPathHashKeyString(const CmpiObjectPath& cop, bool) override {
        return byKey ? zemString(nameOf(cop).substr(1).c_str()) : zemString();
    }
    void* BeforeGenerateAssociation(const CmpiContext&, const char*,
                                    const CmpiObjectPath&) override {
        world->hook("before");
        return world.get();
    }
    void AfterGenerateAssociation(const CmpiContext&, const char*, void* addInfo) override {
        world->hook(addInfo == world.get() ? "after" : "after without context");
    }
    static inline bool byKey = false;

private:
    Side m_side;
};

const Row kSystemDisk = {"Test_Link", "", "Test_System", "Left", "", "Test_Disk", "Right", ""};
const Row kSystemPort = {"Test_Link", "", "Test_System", "Left", "", "Test_Port", "Right", ""};
const Row kPortDisk = {"Test_Link", "", "Test_Port", "Left", "", "Test_Disk", "Right", ""};
const Row kSystems = {"", "", "Test_System", "Left", "", "Test_System", "Right", ""};
const Row kNoHandle = {"Test_Link", "", "Test_System", "Left", "", "Test_Port", "Right", "none"};

template <class Provider>
class ProviderPairs : public testing::Test {
protected:
    void SetUp() override { Joined::byKey = false; }
};
using Bases = testing::Types<Plain, Joined>;
TYPED_TEST_SUITE(ProviderPairs, Bases);

TYPED_TEST(ProviderPairs, AnswerFromTheirHandles) {
    const CMPIrc failed = CMPI_RC_ERR_FAILED;
    const std::pair<std::vector<Row>, RequestCase> cases[] = {
        // clang-format off
        {{kSystemDisk}, {"names", "ein", "", kNone, "s1-d1 s1-d2 s2-d1 s2-d2"}},
        {{kSystemDisk, kSystemPort}, {"instances", "ei", "", kNone, "s1-d1 s1-d2 s2-d1 s2-d2 s1-p1 s2-p1"}},
        {{kSystemDisk}, {"associators", "a", "s1", kNone, "d1 d2"}},
        {{kSystemDisk}, {"from the right", "an", "d1", kNone, "s1 s2"}},
        {{kSystemDisk}, {"references", "r", "d2", kNone, "s1-d2 s2-d2"}},
        {{kSystemDisk, kSystemPort}, {"reference names", "rn", "s2", kNone, "s2-d1 s2-d2 s2-p1"}},
        {{kSystems}, {"right of a self association", "rn", "s1", kNone, "s1-s1 s2-s1"}},
        {{kSystemDisk}, {"role of the target", "an", "s1", {"Test_Link", "", "right", ""}, "d1 d2"}},
        {{kSystemDisk}, {"role of the source", "an", "s1", {"Test_Link", "", "Left", ""}, ""}},
        {{kSystemDisk}, {"result role", "an", "s1", {"Test_Link", "", "", "Left"}, "d1 d2"}},
        {{kSystemDisk, kSystemPort}, {"result class", "an", "s1", {"Test_Link", "Test_Port", "", ""}, "p1"}},
        {{kSystemDisk}, {"base", "an", "s1", {"Test_Link", "Test_Device", "", ""}, "d1 d2"}},
        {{kSystemDisk}, {"class on no side", "an", "p1", kNone, ""}},
        {{kSystemDisk}, {"no such source", "an", "s9", kNone, ""}},
        {{kSystemDisk}, {"an association", "gi", "s1-d2", kNone, "s1-d2"}},
        {{kSystemDisk}, {"no such object", "gi", "s1-d9", kNone, "", CMPI_RC_ERR_NOT_FOUND}},
        {{kSystemDisk}, {"wrong side", "gi", "d1-s1", kNone, "", CMPI_RC_ERR_INVALID_PARAMETER}},
        {{kNoHandle}, {"target without handle", "an", "s1", kNone, "", failed}},
        {{kNoHandle}, {"side without handle", "ein", "", kNone, "", failed}},
        {{kNoHandle, kSystemDisk}, {"a handle that is not needed", "an", "d1", kNone, "s1 s2"}},
    };
    // clang-format on
    for (const auto& c : cases) {
        const auto configure = [&] {
            world->rows = c.first;
            // a pair of no class serves whatever class its provider answers for
            if (c.first[0][0][0] == '\0') {
                world->rows.push_back(kPortDisk);
            }
        };
        expectAnswer<TypeParam>(c.second, configure, [] {
            for (const char* cls : {"Test_System", "Test_Disk", "Test_Port"}) {
                EXPECT_LE(world->count(std::string("names:") + cls), 1) << "asked once";
            }
        });
    }
}

TYPED_TEST(ProviderPairs, NameTheMissingHandle) {
    World<TypeParam> w;
    world->rows = {kNoHandle};
    const char* const text = "rror occured while retrive the handle of the associated class.";
    EXPECT_NE(std::string::npos, w.run("an", "s1").message.find(std::string("\"E") + text));
    EXPECT_NE(std::string::npos, w.run("ein", "").message.find(std::string("\"e") + text));
}

// All hooks for a pair of objects come before those for the next.
TEST(ProviderPairsOneByOne, OrderOfCalls) {
    const std::tuple<const char*, const char*, std::string> cases[] = {
        {"ein", "", "before names:Test_Disk names:Test_Port pair addKeys pair addKeys after "},
        {"ei", "",
         "before names:Test_Disk names:Test_Port pair addKeys addProperties pair addKeys "
         "addProperties after "},
        {"r", "p1",
         "before names:Test_Disk pair addKeys addProperties pair addKeys addProperties after "},
        {"an", "p1", "before names:Test_Disk pair pair after "},
    };
    for (const auto& [operation, object, calls] : cases) {
        World<Plain> w;
        world->rows = {{"Test_Link", "", "Test_Disk", "Left", "", "Test_Port", "Right", ""}};
        w.run(operation, object);
        EXPECT_EQ(calls, noted()) << operation;
    }
}

// The hooks come in pairs, and what the After hook throws does not matter.
TYPED_TEST(ProviderPairs, HooksThatThrow) {
    constexpr bool plain = std::is_same_v<TypeParam, Plain>;
    for (const Operation& op : kOperations) {
        for (const std::string hook : {"before", "valid", "after"}) {
            SCOPED_TRACE(op.letters + (" " + hook));
            World<TypeParam> w;
            failIn(hook);
            const cimom::Reply reply = w.run(op.letters, op.object);
            EXPECT_EQ(hook == "after" ? CMPI_RC_OK : CMPI_RC_ERR_FAILED, reply.rc);
            EXPECT_EQ(plain && hook == "before" ? 0 : 1, world->count("after"));
            if (!plain || hook != "before") {
                continue;
            }
            EXPECT_NE(std::string::npos,
                      reply.message.find("thrown from method zemAssociationDataPrepareUtility "
                                         "on class zemAssociationDataPrepareUtility"))
                << reply.message;
        }
    }
}

TEST(ProviderPairsByKey, OnlyObjectsWithOneKeyAreCompared) {
    Joined::byKey = true;
    World<Joined> w;
    EXPECT_EQ("s1-d1 s2-d2", show(w.run("ein", "")));
    EXPECT_EQ(2, world->count("pair"));
    EXPECT_EQ("s2-d2", show(w.run("rn", "d2")));
    EXPECT_EQ(3, world->count("pair"));
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, w.run("gi", "s1-d2").rc);
    EXPECT_EQ("s1-d1", show(w.run("gi", "s1-d1")));
    world->onHook = [](const std::string& hook) { return hook != "named pair"; };
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, w.run("gi", "s1-d1").rc);
}

// Many of the keys have the same sum of bytes, and each stands twice on the right.
TEST(ProviderPairsByKey, ManyKeysStayApartAndInOrder) {
    Joined::byKey = true;
    World<Joined> w;
    std::vector<std::string> systems, disks, others;
    std::string expected;
    for (int i = 0; i < 200; ++i) {
        const std::string key = std::to_string(1000 + i);
        systems.push_back("s" + key);
        disks.push_back("d" + key);
        others.push_back("e" + key);
        expected += (i > 0 ? " s" : "s") + key + "-d" + key + " s" + key + "-e" + key;
    }
    disks.insert(disks.end(), others.begin(), others.end());
    world->objects = {{"Test_System", systems}, {"Test_Disk", disks}};
    EXPECT_EQ(expected, show(w.run("ein", "")));
    EXPECT_EQ(400, world->count("pair"));
}

TEST(PreparationScopes, WithoutProviderOrRun) {
    World<Joined> w;
    const CmpiObjectPath path = (w.provider(), w.path(pathOf("s1")));
    EXPECT_FALSE(zemAssociationDataPrepareUtility(nullptr, w.ctx(), "A").isInitialized());
    EXPECT_EQ(nullptr, zemAssociationDataPrepareUtilityPlus(nullptr, w.ctx(), "A", path).run());
    { const zemAssociationDataPrepareUtilityPlus never(&w.provider(), w.ctx(), "A", path); }
    EXPECT_EQ(1, world->count("after without context"));
}

}  // namespace
