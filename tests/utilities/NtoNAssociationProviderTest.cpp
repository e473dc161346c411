#include <tuple>

#include "AssociationHarness.h"

namespace {

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

}  // namespace
