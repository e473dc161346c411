// What is each family's own: associations by rows of a table, by a pair of classes, by pairs.
#include <sstream>
#include <tuple>

#include "AssociationHarness.h"
#include "OnThreads.h"
#include "TimingTrace.h"

namespace {

const TimingTrace timing("zemAssociationTest");

const Row kSystemDevice = {"Test_Link", "", "Test_System", "Left", "", "Test_Disk", "Right", ""};
const Row kSystemSystem = {"Test_Link", "", "Test_System", "Left", "", "Test_System", "Right", ""};
const Row kElementSystem = {"Test_Link", "", "Test_Element", "Left", "", "Test_BigSystem",
                            "Right",     ""};

struct SideCase {
    const char* what;
    const Row& row;
    int side;  ///< 0: the class decides
    const char* source;
    const char* resultClass;
    const char* role;
    const char* resultRole;
    bool expected;
    const char* sourceRole;
};

TEST(AssociationData, SideChecks) {
    // clang-format off
    const SideCase cases[] = {
        {"class by name", kSystemDevice, 1, "s1", "", "", "", true, "Left"},
        {"subclass", kSystemDevice, 1, "b1", nullptr, nullptr, nullptr, true, "Left"},
        {"class of the other side", kSystemDevice, 1, "d1", "", "", "", false, ""},
        {"other side", kSystemDevice, 2, "d1", "", "", "", true, "Right"},
        {"role, any case", kSystemDevice, 1, "s1", "", "LEFT", "", true, "Left"},
        {"role of the other side", kSystemDevice, 1, "s1", "", "Right", "", false, "Left"},
        {"role of no side", kSystemDevice, 1, "s1", "", "Middle", "", false, "Left"},
        {"result role", kSystemDevice, 1, "s1", "", "", "right", true, "Left"},
        {"result role of the source", kSystemDevice, 1, "s1", "", "", "Left", false, "Left"},
        {"result class", kSystemDevice, 1, "s1", "Test_Disk", "", "Right", true, "Left"},
        {"base of the result class", kSystemDevice, 1, "s1", "Test_Device", "", "", true, "Left"},
        {"base of both is side 1", kSystemDevice, 1, "s1", "Test_Element", "", "", false, "Left"},
        {"base of both, from side 2", kSystemDevice, 2, "d1", "Test_Element", "", "", true, "Right"},
        {"unrelated result class", kSystemDevice, 1, "s1", "Test_Port", "", "", false, "Left"},
        {"unknown result class", kSystemDevice, 1, "s1", "Test_None", "", "", false, "Left"},
        {"self, result class", kSystemSystem, 1, "s1", "Test_System", "", "", true, "Left"},
        {"self, result role", kSystemSystem, 1, "s1", "", "", "Right", true, "Left"},
        {"self, both", kSystemSystem, 1, "s1", "Test_System", "", "Right", false, "Left"},
        {"either side, first", kSystemDevice, 0, "s1", "", "", "", true, "Left"},
        {"either side, second", kSystemDevice, 0, "d1", "", "", "", true, "Right"},
        {"either side, first only", kSystemSystem, 0, "s1", "", "Right", "", false, "Left"},
        {"either side, none", kSystemDevice, 0, "p1", "", "", "", false, ""},
    };
    // clang-format on
    World<Rows> w;
    w.provider();  // the binding makes paths through the broker of a living provider
    for (const SideCase& c : cases) {
        SCOPED_TRACE(c.what);
        const Row& r = c.row;
        const zemAssociationData row(r[0], r[1], r[2], r[3], r[4], r[5], r[6], r[7]);
        const auto check = c.side == 1   ? &zemAssociationData::getAssoDataFromOperation1
                           : c.side == 2 ? &zemAssociationData::getAssoDataFromOperation2
                                         : &zemAssociationData::getAssoDataFromOperation;
        zemString sourceClass, sourceRole, resultRole = "x";
        EXPECT_EQ(c.expected, (row.*check)(w.path(objectPath(c.source)), sourceClass, sourceRole,
                                           &resultRole, c.resultClass, c.role, c.resultRole));
        EXPECT_STREQ(c.sourceRole, sourceRole);
        EXPECT_STREQ(sourceRole == "Left"    ? "Right"
                     : sourceRole == "Right" ? "Left"
                                             : "",
                     resultRole);
    }
}

TEST(AssociationRows, ClassesOfATable) {
    World<Rows> w;
    world->rows.push_back({"test_link", "", "_Port", "A", "", "Test_Disk", "B", ""});
    Rows& p = w.provider();
    EXPECT_EQ(nullptr, p.getAssoData("_Link")) << "association classes are named in full";
    EXPECT_TRUE(p.isFirstClass(w.path(objectPath("b1")), "TEST_LINK"));
    EXPECT_FALSE(p.isSecondClass(w.path(objectPath("b1")), "Test_Link"));
    zemString class1, class2;
    p.getReferenceClass(w.path(objectPath("p1")), w.path(objectPath("d1")), class1, class2,
                        "Test_Link");
    EXPECT_STREQ("_Port", class1) << "a suffix stands for every class that ends so";
    EXPECT_THROW(p.isValidInstanceClass("Test_None"), zemInvalidParameterException);
    EXPECT_THROW(p.isValidAssociationClass("Test_None"), zemInvalidParameterException);
}

TEST(AssociationRows, AnswersAsTheRowsSay) {
    const std::pair<std::vector<Row>, RequestCase> cases[] = {
        // clang-format off
        {{kSystemSystem}, {"self", "ein", "", kNone, "s1-s1 s1-s2 s1-b1 s2-s1 s2-s2 s2-b1 b1-s1 b1-s2 b1-b1"}},
        {{kSystemSystem}, {"both orders", "rn", "s1", kNone, "s1-s1 s1-s2 s1-b1 s1-s1 s2-s1 b1-s1"}},
        {{kSystemDevice, kSystemSystem}, {"several rows", "an", "s1", {"Test_Link", "", "Left", ""}, "d1 d2 s1 s2 b1"}},
    };
    // clang-format on
    for (const auto& c : cases) {
        expectAnswer<Rows>(c.second, [&] { world->rows = c.first; });
    }
    World<Rows> w(cimom::Character::Lean);  // which hands on that no class was named
    const cimom::Reply reply = w.run("an", "s1", {"", "", "", ""});
    EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER, reply.rc);
    EXPECT_EQ("Invalid association name ", reply.message);
}

// What getInstance makes of its references, and whether it asks the server for the objects.
TEST(AssociationRows, GetInstanceReferences) {
    const std::vector<Row> system = {kSystemDevice}, shared = {kElementSystem};
    const std::string port = "\"root/cimv2:Test_Port.Name=\"p1\"\"";
    const std::string tail = " provided to method getInstance on provider Direct";
    struct {
        const char* what;
        std::vector<Row> table;
        const char *left, *right;
        bool asks;
        std::string message;
    } cases[] = {
        {"exact first class", system, "s1", "d1", true, ""},
        {"exact first class, any second", system, "s1", "p1", true, ""},
        {"first is a subclass", system, "b1", "d1", false, ""},
        {"second derives from the first class", shared, "s1", "d1", false, ""},
        {"one wrong", system, "p1", "d1", false,
         "Invalid value " + port + " for the property Left of the class Test_Link was" + tail},
        {"both wrong", system, "p1", "p1", false,
         "Invalid value " + port + " for the property Left and invalid value " + port +
             " for the property Right of the class Test_Link were" + tail},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        World<Rows> w;
        world->rows = c.table;
        Rows& provider = w.provider();
        const auto get = [&] {
            const CmpiInstance found =
                provider.performGetInstance(w.ctx(), w.path(linkPath(c.left, c.right)), nullptr);
            const CmpiObjectPath left = found.getProperty("Left").getObjectPath();
            EXPECT_EQ(objectPath(c.left), cimom::RequestScope::read(left.getEnc()));
        };
        EXPECT_EQ(c.message, failureText(get, "t"));
        EXPECT_EQ(c.asks ? 2 : 0, world->count("get:"));
    }
}

// The calls of a row are told apart by its first class, whatever they ask for.
TEST(AssociationRows, CallsAreTimed) {
    World<Rows> w;
    world->rows = {{"Test_Link", "", "Test_Port", "Left", "", "Test_Disk", "Right", ""}};
    const std::string text = timing.waitFor("niTest_Port end", [&] { w.run("an", "p1"); });
    EXPECT_NE(text.npos, text.find("brokerCaller-giTest_Port begin at")) << text;
    EXPECT_NE(text.npos, text.find("brokerCaller-niTest_Port end at")) << text;
}

TEST(AssociationRows, ReportsTheEnumerationOfNames) {
    World<Rows> w;
    world->objects = {{"Test_System", {"s1"}}, {"Test_Disk", {"d1", "d2"}}};
    world->valid = [](const std::string&, const std::string& right) { return right == "d2"; };
    testing::internal::CaptureStdout();
    w.run("ein", "");
    const std::string output = testing::internal::GetCapturedStdout();
    std::string progress;
    std::istringstream lines(output);
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind("performEnumInstanceNames", 0) == 0) {
            progress += line.substr(24) + "\n";
        }
    }
    EXPECT_EQ(
        " <-\n before BeforeGenerateAssociation\n after BeforeGenerateAssociation\n"
        ": Test_System;Test_Disk\n: objs size: 1;2\n: obj1: \n: obj2: \n: obj2: \n"
        ": an association found: \n ->\n",
        progress);
}

// -- a pair of classes ----------------------------------------------------------------------------

TEST(NtoNAssociation, WhichSideASourceIsOn) {
    struct {
        const char *what, *class1, *class2, *source, *resultClass, *role, *resultRole;
        bool first;
        // clang-format off
    } cases[] = {
        {"role of side 1", "Test_System", "Test_Disk", "d1", "", "LEFT", "", true},
        {"role of side 2", "Test_System", "Test_Disk", "s1", "", "right", "", false},
        {"class 1", "Test_System", "Test_Disk", "s1", "", "Middle", "Left", true},
        {"class 2", "Test_System", "Test_Disk", "d1", nullptr, nullptr, nullptr, false},
        {"one class for both", "Test_System", "Test_System", "s1", "", "", "Left", true},
        {"derives from class 1", "Test_System", "Test_Device", "b1", "", "", "", true},
        {"derives from class 2", "Test_System", "Test_Device", "d1", "", "", "", false},
        {"both, 1 more derived", "Test_System", "Test_Element", "b1", "Test_System", "", "Left", true},
        {"both, 2 more derived", "Test_Element", "Test_System", "b1", "", "", "Right", false},
        {"neither, result role 1", "Test_System", "Test_Disk", "p1", "", "", "Left", false},
        {"neither, result role 2", "Test_System", "Test_Disk", "p1", "Test_Element", "", "Right", true},
        {"neither, nothing asked", "Test_System", "Test_Disk", "p1", "", "", "", true},
        {"neither, result class of 1", "Test_System", "Test_Disk", "p1", "Test_Element", "", "", false},
        {"neither, result class of 2", "Test_System", "Test_Disk", "p1", "Test_Disk", "", "", true},
    };
    // clang-format on
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        World<Pair> w;
        world->class1 = c.class1;
        world->class2 = c.class2;
        Pair& provider = w.provider();
        EXPECT_EQ(c.first, provider.isFirstClass(w.path(objectPath(c.source)), c.resultClass,
                                                 c.role, c.resultRole));
    }
}

TEST(NtoNAssociation, AnswersBetweenItsClasses) {
    const std::tuple<const char*, const char*, RequestCase> cases[] = {
        // clang-format off
        {"Test_System", "Test_Disk", {"base of both classes", "an", "s1", {"Test_Link", "Test_Element", "", ""}, "d1 d2"}},
        {"Test_System", "Test_Device", {"class below the target", "an", "s1", {"Test_Link", "Test_Disk", "", ""}, ""}},
        {"Test_System", "Test_System", {"one side of a self association", "rn", "s1", kNone, "s1-s1 s1-s2 s1-b1"}},
        {"Test_System", "Test_System", {"the other by role", "rn", "s1", {"Test_Link", "", "Right", ""}, "s1-s1 s2-s1 b1-s1"}},
    };
    // clang-format on
    for (const auto& c : cases) {
        expectAnswer<Pair>(std::get<RequestCase>(c), [&] {
            world->class1 = std::get<0>(c);
            world->class2 = std::get<1>(c);
        });
    }
}

TEST(NtoNAssociation, RefusedReferences) {
    World<Pair> texts;
    const std::string at = "Invalid value " + texts.textOf("p1") + " for the property ";
    const std::string tail =
        " of the class Test_Link is provided to method getInstance on provider ";
    const std::pair<const char*, std::string> cases[] = {
        {"p1-p1", at + "Left" + tail},
        {"s1-p1", at + "Right" + tail},
        {"s1-d1",
         "There doesn't exist an association Test_Link between the property Left with value " +
             texts.textOf("s1") + " and the property Right with value " + texts.textOf("d1")},
    };
    for (const auto& [object, message] : cases) {
        World<Pair> w;
        world->valid = [](const std::string&, const std::string&) { return false; };
        const cimom::Reply reply = w.run("gi", object);
        EXPECT_EQ(CMPI_RC_ERR_INVALID_PARAMETER, reply.rc);
        EXPECT_EQ(message, reply.message.substr(0, message.size()));
        EXPECT_EQ(2, world->count("get:")) << "the objects are looked for first";
    }
}

TEST(NtoNAssociation, OrderOfCalls) {
    const std::tuple<std::string, const char*, const char*> cases[] = {
        {"an", "d1",
         "get:Test_Disk names:Test_System names:Test_BigSystem before pair pair pair after "},
        {"a", "s1", "get:Test_System instances:Test_Disk before pair pair after "},
        {"ein", "",
         "names:Test_Disk names:Test_Disk before pair addKeys pair addKeys pair addKeys "
         "pair addKeys after "},
    };
    for (const auto& [operation, object, calls] : cases) {
        World<Pair> w;
        if (operation == "ein") {
            world->class1 = "Test_Disk";
        }
        world->valid = [](const std::string&, const std::string&) {
            world->note("pair");
            return true;
        };
        w.run(operation, object);
        EXPECT_EQ(calls, noted()) << operation;
    }
}

// The lock is the provider's: while one pairs, another does.
TEST(NtoNAssociation, ProvidersRunSideBySide) {
    World<Pair> w;
    w.provider();
    whilePairing([&] {
        const cimom::RequestScope scope(w.server);
        const CmpiContext ctx(scope.context());
        cimom::Reply reply;
        DirectResult result(scope.result(reply));
        w.provider().performEnumInstances(ctx, result, CmpiObjectPath(scope.wrap(pathOf(""))),
                                          nullptr);
        EXPECT_EQ(6U, reply.instances.size());
    });
    EXPECT_EQ("d1 d2", show(w.run("an", "s1")));
}

// -- pairs of classes -----------------------------------------------------------------------------

/// "A B C" as a block of names.
std::string block(const std::string& names) {
    std::string text = names + ' ';
    std::replace(text.begin(), text.end(), ' ', '\0');
    return text;
}

std::string listed(const zemArray<zemString>& names) {
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
        EXPECT_EQ(c.firsts, listed(provider.m_aFirstClassName));
        EXPECT_EQ(c.seconds, listed(provider.m_aSecondClassName));
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
