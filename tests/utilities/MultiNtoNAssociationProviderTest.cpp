#include "AssociationHarness.h"
#include "OnThreads.h"

namespace {

/// "A B C" as a block of names.
std::string block(const std::string& names) {
    std::string text = names + ' ';
    std::replace(text.begin(), text.end(), ' ', '\0');
    return text;
}

std::string joined(const zemArray<zemString>& names) {
    std::string text;
    for (int i = 0; i < names.size(); ++i) {
        text += (i == 0 ? "" : " ") + std::string(names[i]);
    }
    return text;
}

TEST(MultiNtoNAssociation, ClassesThatNeedEnumerating) {
    const struct {
        const char *what, *pairs, *firsts, *seconds;
        // clang-format off
    } cases[] = {
        {"no relation", "Test_System Test_Disk", "Test_System", "Test_Disk"},
        {"duplicates", "Test_System Test_Disk test_system Test_Port", "test_system", "Test_Disk Test_Port"},
        {"a base later", "Test_BigSystem Test_Disk Test_System Test_Device", "Test_System", "Test_Device"},
        {"a base earlier", "Test_System Test_Device Test_BigSystem Test_Disk", "Test_System Test_BigSystem", "Test_Device Test_Disk"},
        {"unknown classes stay", "Test_A Test_B Test_C Test_D", "Test_A Test_C", "Test_B Test_D"},
    };
    // clang-format on
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        World<Pairs> w;
        world->pairs = block(c.pairs);
        Pairs& provider = w.provider();
        onThreads(4, [&](int) {
            const cimom::RequestScope scope(w.server);
            provider.aggregateReferenceClasses();
        });
        EXPECT_EQ(c.firsts, joined(provider.m_aFirstClassName));
        EXPECT_EQ(c.seconds, joined(provider.m_aSecondClassName));
    }
}

TEST(MultiNtoNAssociation, BlocksThatAreNoPairs) {
    World<Pairs> w;
    for (const std::string& pairs : {std::string("\0", 1), block("A"), block("A B C")}) {
        world->pairs = pairs;
        EXPECT_THROW(w.provider(), zemInvalidParameterException);
    }
    EXPECT_THROW(zemMultiNtoNAssociationProvider(CmpiBroker(w.server.broker()), w.ctx(), "A",
                                                 nullptr, "L", "R", Pairs::OP_ALLOps, "", "", ""),
                 zemInvalidParameterException);
}

TEST(MultiNtoNAssociation, AnswersAmongItsClasses) {
    const char* const fork = "Test_System Test_Disk Test_System Test_Port";
    const char* const chain = "Test_System Test_Disk Test_Disk Test_Port";
    const char* const nested = "Test_Disk Test_Port Test_System Test_Disk Test_BigSystem Test_Port";
    const std::pair<const char*, RequestCase> cases[] = {
        // clang-format off
        {fork, {"names", "ein", "", kNone, "s1-d1 s1-d2 s2-d1 s2-d2 b1-d1 b1-d2 s1-p1 s2-p1 b1-p1"}},
        {chain, {"instances", "ei", "", kNone, "s1-d1 s1-d2 s2-d1 s2-d2 b1-d1 b1-d2 d1-p1 d2-p1"}},
        {nested, {"a class and its base", "ein", "", kNone, "d1-p1 d2-p1 s1-d1 s1-d2 s2-d1 s2-d2 b1-d1 b1-d2 b1-d1 b1-d2 b1-p1"}},
        {fork, {"associators", "a", "s1", kNone, "d1 d2 p1"}},
        {chain, {"from both sides", "rn", "d1", kNone, "d1-p1 s1-d1 s2-d1 b1-d1"}},
        {chain, {"from the first side", "rn", "d1", {"Test_Link", "", "Left", ""}, "d1-p1"}},
        {chain, {"to the second side", "an", "d1", {"Test_Link", "", "", "left"}, "s1 s2 b1"}},
        {fork, {"result class", "an", "s1", {"Test_Link", "Test_Port", "", ""}, "p1"}},
        {fork, {"base of result classes", "an", "s1", {"Test_Link", "Test_Device", "", ""}, "d1 d2 p1"}},
        {fork, {"no result class", "an", "s1", {"Test_Link", "Test_System", "", ""}, ""}},
        {fork, {"an association", "gi", "b1-p1", kNone, "b1-p1"}},
        {chain, {"classes that are in no pair", "gi", "s1-p1", kNone, "", CMPI_RC_ERR_NOT_FOUND}},
    };
    // clang-format on
    for (const auto& c : cases) {
        expectAnswer<Pairs>(c.second, [&] { world->pairs = block(c.first); });
    }
}

TEST(MultiNtoNAssociation, AsksForAClassOnceAnEnumeration) {
    World<Pairs> w;
    world->pairs = block("Test_System Test_Disk Test_System Test_Port Test_Disk Test_Disk");
    for (int round = 1; round <= 2; ++round) {
        w.run("ein", "");
        for (const char* call : {"names:Test_System", "names:Test_Disk", "names:Test_Port"}) {
            EXPECT_EQ(round, world->count(call)) << call;
        }
        world->objects["Test_Port"].push_back("p2");
    }
    EXPECT_EQ("s1-p2 s2-p2 b1-p2", show(w.run("rn", "p2"))) << "nothing is kept";
}

TEST(MultiNtoNAssociation, RefusesBeforeTheObjectsAreLookedFor) {
    World<Pairs> w;
    EXPECT_NE(std::string::npos, w.run("gi", "d1-s1").message.find("\" for the property Right of"));
    world->valid = [](const std::string&, const std::string&) { return false; };
    const cimom::Reply reply = w.run("gi", "s1-d1");
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, reply.rc);
    EXPECT_EQ(0U, reply.message.find(
                      "The requested object root/cimv2:Test_Link.Left=" + w.textOf("s1") +
                      ",Right=" + w.textOf("d1") + " of class Test_Link can not be found."));
    EXPECT_EQ(0, world->count("get:"));
}

// The lock covers a call to the server, not the pairing of what it answered.
TEST(MultiNtoNAssociation, OperationsInterleave) {
    World<Pairs> w;
    whilePairing([&] { EXPECT_EQ(6U, w.run("ei", "").instances.size()); });
    EXPECT_EQ(6U, w.run("ein", "").paths.size());
}

}  // namespace
