#include <sstream>

#include "AssociationHarness.h"
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

}  // namespace
