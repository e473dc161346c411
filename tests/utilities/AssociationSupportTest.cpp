// What the association families have in common: failures of the broker, refusals, hooks, locks.
#include <set>

#include "AssociationHarness.h"
#include "FailingAllocation.h"
#include "OnThreads.h"

namespace {

template <class Provider>
class AssociationFamily : public testing::Test {
public:
    static constexpr bool byRows = std::is_same_v<Provider, Rows>;
    static constexpr bool byPair = std::is_same_v<Provider, Pair>;
    static constexpr bool byPairs = std::is_same_v<Provider, Pairs>;

    /// Calls the worker of an operation, past the frame.
    static cimom::Reply call(World<Provider>& w, const Operation& op) {
        cimom::Reply reply;
        DirectResult result(w.scope.result(reply));
        const CmpiObjectPath path = w.path(pathOf(op.object));
        Provider& p = w.provider();
        const std::function<void()> workers[] = {
            [&] { p.performGetInstance(w.ctx(), path, nullptr); },
            [&] { p.performEnumInstances(w.ctx(), result, path, nullptr); },
            [&] { p.performEnumInstanceNames(w.ctx(), result, path); },
            [&] { p.performAssociators(w.ctx(), result, path, "Test_Link", "", "", "", nullptr); },
            [&] { p.performAssociatorNames(w.ctx(), result, path, "Test_Link", "", "", ""); },
            [&] { p.performReferences(w.ctx(), result, path, "Test_Link", "", nullptr); },
            [&] { p.performReferenceNames(w.ctx(), result, path, "Test_Link", ""); },
        };
        workers[&op - kOperations]();
        return reply;
    }
};

using Families = testing::Types<Rows, Pair, Pairs>;
TYPED_TEST_SUITE(AssociationFamily, Families);

TYPED_TEST(AssociationFamily, AnswersBetweenItsClasses) {
    using Family = AssociationFamily<TypeParam>;
    const RequestCase cases[] = {
        {"names", "ein", "", kNone, "s1-d1 s1-d2 s2-d1 s2-d2 b1-d1 b1-d2"},
        {"instances", "ei", "", kNone, "s1-d1 s1-d2 s2-d1 s2-d2 b1-d1 b1-d2"},
        {"associators", "a", "s1", kNone, "d1 d2"},
        {"from a subclass", "an", "b1", kNone, "d1 d2"},
        {"from side 2", "an", "d2", kNone, "s1 s2 b1"},
        {"references", "r", "b1", kNone, "b1-d1 b1-d2"},
        {"references from side 2", "rn", "d1", kNone, "s1-d1 s2-d1 b1-d1"},
        {"an association", "gi", "s1-d2", kNone, "s1-d2"},
        {"an association of a subclass", "gi", "b1-d2", kNone, "b1-d2"},
    };
    for (const RequestCase& c : cases) {
        const bool isGet = c.operation == std::string("gi");
        const bool hooks = isGet ? Family::byRows && c.object[0] == 's' : !Family::byPairs;
        expectAnswer<TypeParam>(
            c, [] {}, [&] { EXPECT_EQ(hooks ? 1 : 0, world->count("after")); });
    }
}

/// Kind of exception by code; 0 for codes that a navigation lets pass.
int kindOf(int rc) {
    if (std::set<int>{3, 4, 5, 6, 10, 12}.count(rc) != 0) {
        return 3;
    }
    if (std::set<int>{13, 60, 61, 100, 200}.count(rc) != 0) {
        return 6;
    }
    return rc == 7 ? 4 : rc == 2 ? 1 : 0;
}

// Every code through every call to the broker that an operation makes.
TYPED_TEST(AssociationFamily, StatusBecomesException) {
    using Family = AssociationFamily<TypeParam>;
    std::vector<int> codes = {50, 51, 60, 61, 77, 100, 200};
    for (int rc = 1; rc <= 18; ++rc) {
        codes.push_back(rc);
    }
    for (const Operation& op : kOperations) {
        for (const std::string failing : {"get:", op.bit == 8 ? "instances:" : "names:"}) {
            if ((op.bit == 1) != (failing == "get:") && op.bit < 8) {
                continue;
            }
            World<TypeParam> w;
            for (const int rc : codes) {
                SCOPED_TRACE(op.letters + (" " + failing) + std::to_string(rc));
                world->onCall = [&](const std::string& call) {
                    if (call.compare(0, failing.size(), failing) == 0) {
                        throw CmpiStatus(static_cast<CMPIrc>(rc), "boom");
                    }
                };
                const int kind = kindOf(rc) == 0 && op.bit < 8 ? 6 : kindOf(rc);
                try {
                    EXPECT_EQ("", show(Family::call(w, op)));
                    EXPECT_EQ(0, kind);
                } catch (const zemException& e) {
                    const zemString code = zemBaseProvider::cmpiRcToString(static_cast<CMPIrc>(rc));
                    EXPECT_EQ(kind, e.getExceptionType());
                    EXPECT_STREQ(op.bit < 8 ? "Test_Link" : "Test_System", e.getThrowingClass());
                    EXPECT_STREQ(op.word, e.getThrowingMethod());
                    EXPECT_STREQ(failing == "get:" ? "getInstance"
                                 : Family::byPairs ? "enumerateInstanceNames"
                                                   : op.access,
                                 e.getAccessMethod());
                    EXPECT_STREQ(Family::byPairs ? code : "CIM_ERR", e.getExceptionId());
                    EXPECT_STREQ("boom", e.getExceptionString());
                } catch (const CmpiStatus& status) {
                    EXPECT_TRUE(Family::byPairs && op.bit == 1);  // left to the frame
                    EXPECT_EQ(rc, static_cast<int>(status.rc()));
                }
                EXPECT_EQ(0, world->count("after"));
            }
        }
    }
}

// Whichever allocation fails, the operation fails with it, and the next one is sound.
TYPED_TEST(AssociationFamily, MemoryThatRunsOut) {
    for (const Operation& op : kOperations) {
        World<TypeParam> w;
        const std::string whole = show(AssociationFamily<TypeParam>::call(w, op));
        bool failed = true;
        for (long n = 0; failed; ++n) {
            const FailingAllocation failing(n);
            try {
                AssociationFamily<TypeParam>::call(w, op);
            } catch (const std::bad_alloc&) {
            } catch (const CmpiStatus&) {
            } catch (const zemException&) {
            }
            failed = failing.happened();
        }
        EXPECT_EQ(whole, show(AssociationFamily<TypeParam>::call(w, op))) << op.letters;
    }
}

TYPED_TEST(AssociationFamily, RefusesOperationsThatAreNotSupported) {
    for (const Operation& op : kOperations) {
        World<TypeParam> w;
        world->supported = 127 & ~op.bit;
        const cimom::Reply reply = w.run(op.letters, op.object);
        EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED, reply.rc) << op.letters;
        EXPECT_NE(std::string::npos, reply.message.find(std::string("Method ") + op.word + " on"))
            << reply.message;
        EXPECT_EQ(0, world->count("")) << "nothing was asked";
    }
}

// A hook that fails leaves no lock behind; the After hook is called on normal completion only.
TYPED_TEST(AssociationFamily, HooksThatRefuseOrThrow) {
    using Family = AssociationFamily<TypeParam>;
    for (const Operation& op : kOperations) {
        for (const std::string hook : {"refuse", "before", "valid", "addKeys", "after"}) {
            SCOPED_TRACE(op.letters + (" " + hook));
            World<TypeParam> w;
            failIn(hook);
            const bool paired = Family::byRows || (Family::byPair && op.bit != 1);
            const bool associators = op.bit == 8 || op.bit == 16;
            const bool called = hook == "valid"     ? true
                                : hook == "addKeys" ? !associators
                                                    : paired && hook != "refuse";
            const CMPIrc rc = called                            ? CMPI_RC_ERR_FAILED
                              : hook != "refuse" || op.bit != 1 ? CMPI_RC_OK
                              : Family::byRows                  ? CMPI_RC_ERR_FAILED
                              : Family::byPair                  ? CMPI_RC_ERR_INVALID_PARAMETER
                                                                : CMPI_RC_ERR_NOT_FOUND;
            EXPECT_EQ(rc, w.run(op.letters, op.object).rc);
            EXPECT_EQ(paired && (hook == "after" || (!called && hook == "addKeys")) ? 1 : 0,
                      world->count("after"));
            failIn("none");
            std::thread([&] { EXPECT_EQ("s1-d1 s1-d2", show(w.run("rn", "s1"))); }).join();
        }
    }
}

TYPED_TEST(AssociationFamily, BadInput) {
    const CMPIrc invalid = CMPI_RC_ERR_INVALID_PARAMETER;
    // clang-format off
    const RequestCase cases[] = {
        {"no such source", "an", "s9", kNone, "", invalid},
        {"no such source, references", "r", "s9", kNone, "", invalid},
        {"wrong class", "an", "p1", kNone, ""},
        {"role on no side", "an", "s1", {"Test_Link", "", "Middle", ""}, ""},
        {"role of the other side", "rn", "s1", {"Test_Link", "", "Right", ""}, ""},
        {"result role on no side", "a", "s1", {"Test_Link", "", "", "Middle"}, ""},
        {"result class on no side", "an", "s1", {"Test_Link", "Test_Port", "", ""}, ""},
        {"no such target", "gi", "s1-d9", kNone, "", std::is_same_v<TypeParam, Pairs> ? CMPI_RC_ERR_NOT_FOUND : invalid},
    };
    // clang-format on
    for (const RequestCase& c : cases) {
        expectAnswer<TypeParam>(c);
    }
    World<TypeParam> w;
    for (const cimom::Value& bad : {cimom::Value("Test_System.Name=\"s1\""), cimom::Value()}) {
        cimom::ObjectPath path(kNameSpace, "Test_Link", {{"Right", objectPath("d1")}});
        if (!bad.isNull()) {
            path.keys.set("Left", bad);
        }
        const auto get = [&] { w.provider().performGetInstance(w.ctx(), w.path(path), nullptr); };
        EXPECT_EQ("3/Invalid value \"" + (bad.isNull() ? "" : bad.text()) +
                      "\" for the property Left of the class Test_Link was provided to method "
                      "getInstance on provider Direct",
                  failureText(get, "kt"));
    }
    cimom::Reply reply;
    DirectResult result(w.scope.result(reply));
    EXPECT_THROW(w.provider().performAssociatorNames(
                     w.ctx(), result, w.path({kNameSpace, "Test_System"}), "Test_Link", "", "", ""),
                 zemInvalidParameterException)
        << "a source without keys";
}

// Locks admit their holder again: a provider that the server asks may come back.
TYPED_TEST(AssociationFamily, UpcallsComeBack) {
    for (const Operation& op : kOperations) {
        World<TypeParam> w;
        bool inside = false;
        world->onCall = [&](const std::string&) {
            if (inside) {
                return;
            }
            inside = true;
            EXPECT_EQ("s1 s2 b1", show(w.run("an", "d1")));
            inside = false;
        };
        EXPECT_EQ(CMPI_RC_OK, w.run(op.letters, op.object).rc) << op.letters;
    }
}

// Operations on one provider and on another of its family, from several threads.
TYPED_TEST(AssociationFamily, ManyThreads) {
    World<TypeParam> w;
    std::atomic<int> pairing{0};
    world->valid = [&](const std::string&, const std::string&) {
        const bool alone = ++pairing == 1;
        EXPECT_TRUE(alone || !(AssociationFamily<TypeParam>::byRows)) << "one lock for all";
        std::this_thread::yield();
        --pairing;
        return true;
    };
    onThreads(4, [&](int number) {
        const cimom::RequestScope scope(w.server);
        const CmpiContext ctx(scope.context());
        TypeParam other(CmpiBroker(w.server.broker()), ctx, "Other");
        for (int n = 0; n < 5; ++n) {
            if (number % 2 == 0) {
                EXPECT_EQ(6U, w.run("ei", "").instances.size());
            } else {
                EXPECT_EQ("s1-d1 s2-d1 b1-d1", show(w.run("rn", "d1")));
            }
            cimom::Reply reply;
            DirectResult result(scope.result(reply));
            other.performEnumInstanceNames(ctx, result, CmpiObjectPath(scope.wrap(pathOf(""))));
            EXPECT_EQ(6U, reply.paths.size());
        }
    });
}

}  // namespace
