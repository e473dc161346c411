// A provider as the server sees it: factories, the entries of its tables, and cleanup.
#include <gtest/gtest.h>
#include <pthread.h>

#include <new>
#include <stdexcept>
#include <tuple>

#include "CmpiAssociationMI.h"
#include "CmpiIndicationMI.h"
#include "CmpiInstanceMI.h"
#include "CmpiMethodMI.h"
#include "CmpiPropertyMI.h"
#include "Server.h"

namespace {

CmpiStatus succeed() { return CmpiStatus(CMPI_RC_OK); }

/// What the provider does next, and what it saw.
struct Script {
    std::function<CmpiStatus()> operation = succeed;
    std::function<CmpiStatus()> construct = succeed, initialize = succeed, cleanup = succeed;
    int unloadable = 1;
    int alive = 0;
    std::string called;
};
Script* script;

CmpiStatus act(const char* name) {
    script->called = name;
    return script->operation();
}

class Sample : public CmpiInstanceMI,
               public CmpiAssociationMI,
               public CmpiMethodMI,
               public CmpiPropertyMI,
               public CmpiIndicationMI {
    using Status = CmpiStatus;
    using Ctx = const CmpiContext&;
    using Out = CmpiResult&;
    using Filter = const CmpiSelectExp&;
    using Path = const CmpiObjectPath&;
    using Text = const char*;
    using List = const char**;
    using Flag = CMPIBoolean;

public:
    Sample(const CmpiBroker& b, Ctx ctx)
        : CmpiBaseMI(b, ctx),
          CmpiInstanceMI(b, ctx),
          CmpiAssociationMI(b, ctx),
          CmpiMethodMI(b, ctx),
          CmpiPropertyMI(b, ctx),
          CmpiIndicationMI(b, ctx) {
        script->construct();
        ++script->alive;
    }
    ~Sample() override { --script->alive; }

    CmpiStatus initialize(Ctx) override { return script->initialize(); }
    CmpiStatus cleanup(CmpiContext&) override { return script->cleanup(); }
    int isUnloadable() const override { return script->unloadable; }

    Status enumInstanceNames(Ctx, Out, Path) override { return act("enumNames"); }
    Status enumInstances(Ctx, Out, Path, List) override { return act("enum"); }
    Status getInstance(Ctx, Out, Path, List) override { return act("get"); }
    Status createInstance(Ctx, Out, Path, const CmpiInstance&) override { return act("create"); }
    Status setInstance(Ctx, Out, Path, const CmpiInstance&, List) override { return act("set"); }
    Status deleteInstance(Ctx, Out, Path) override { return act("delete"); }
    Status execQuery(Ctx, Out, Path, Text first, Text) override { return act(first); }
    Status associators(Ctx, Out, Path, Text, Text, Text, Text, List) override { return act("all"); }
    Status associatorNames(Ctx, Out, Path, Text, Text, Text, Text r) override { return act(r); }
    Status references(Ctx, Out, Path, Text, Text, List) override { return act("references"); }
    Status referenceNames(Ctx, Out, Path, Text, Text) override { return act("names"); }
    Status invokeMethod(Ctx, Out, Path, Text, const CmpiArgs&, CmpiArgs& out) override {
        out.setArg("Out", CmpiData(CMPIUint32(7)));
        return act("invoke");
    }
    Status setProperty(Ctx, Out r, Path, Text, const CmpiData& d) override {
        r.returnData(d);
        return act("setProperty");
    }
    Status getProperty(Ctx, Out, Path, Text name) override { return act(name); }
    Status authorizeFilter(Ctx, Filter, Text, Path, Text user) override { return act(user); }
    Status mustPoll(Ctx, Filter, Text, Path) override { return act("poll"); }
    Status activateFilter(Ctx, Filter, Text, Path, Flag f) override { return act(f ? "on" : ""); }
    Status deActivateFilter(Ctx, Filter, Text, Path, Flag f) override {
        return act(f ? "off" : "");
    }
    Status enableIndications(Ctx) override { return act("enable"); }
    Status disableIndications(Ctx) override { return act("disable"); }
};

CMProviderBase(SampleProvider);

}  // namespace

CMInstanceMIFactory(Sample, SampleProvider);
CMAssociationMIFactory(Sample, SampleProvider);
CMMethodMIFactory(Sample, SampleProvider);
CMPropertyMIFactory(Sample, SampleProvider);
CMIndicationMIFactory(Sample, SampleProvider);

namespace {
CmpiStatus throwCode() { throw CmpiStatus(CMPI_RC_ERR_ACCESS_DENIED); }
CmpiStatus throwText() { throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND, "no such host"); }
CmpiStatus throwError() { throw std::runtime_error("disk on fire"); }
CmpiStatus throwMemory() { throw std::bad_alloc(); }
CmpiStatus throwNumber() { throw 42; }
CmpiStatus answerText() { return CmpiStatus(CMPI_RC_ERR_FAILED, "answered"); }

using I = CMPIInstanceMIFT;
using A = CMPIAssociationMIFT;
using M = CMPIMethodMIFT;
using P = CMPIPropertyMIFT;

struct ProviderTest : testing::Test {
    ProviderTest() { script = &m_script; }
    ~ProviderTest() override {
        m_script.cleanup = succeed;
        for (int i = 0; i < 5 && m_script.alive; ++i) {
            cleanup(true);
        }
        EXPECT_EQ(m_script.alive, 0);
    }

    CMPIInstanceMI* load() {
        m_instance = SampleProvider_Create_InstanceMI(m_mb, m_ctx, &m_rc);
        return m_instance;
    }
    CMPIStatus cleanup(bool terminating) {
        return m_instance->ft->cleanup(m_instance, m_ctx, terminating);
    }
    /// Calls an entry of a record's table.
    template <class MI, class Entry, class... Args>
    CMPIStatus call(MI* mi, Entry entry, Args... args) {
        return (mi->ft->*entry)(mi, m_ctx, m_result, m_path, args...);
    }
    CMPIStatus enumerate() { return call(m_instance, &I::enumerateInstances, nullptr); }
    static std::string text(const CMPIStatus& status) {
        return status.msg ? status.msg->ft->getCharPtr(status.msg, nullptr) : "(none)";
    }

    Script m_script;
    cimom::Server m_server;
    cimom::Reply m_reply;
    cimom::RequestScope m_scope{m_server};
    CMPIBroker* m_mb = m_server.broker();
    CMPIStatus m_rc{CMPI_RC_OK, nullptr};
    CMPIContext* m_ctx = m_scope.context();
    CMPIResult* m_result = m_scope.result(m_reply);
    CMPIObjectPath* m_path = m_scope.wrap(cimom::ObjectPath("root", "C"));
    CMPIInstanceMI* m_instance = nullptr;
};

TEST_F(ProviderTest, EveryEntryReachesItsOperation) {
    CMPIInstanceMI* i = load();
    CMPIAssociationMI* a = SampleProvider_Create_AssociationMI(m_mb, m_ctx, &m_rc);
    CMPIMethodMI* m = SampleProvider_Create_MethodMI(m_mb, m_ctx, &m_rc);
    CMPIPropertyMI* p = SampleProvider_Create_PropertyMI(m_mb, m_ctx, &m_rc);
    CMPIIndicationMI* n = SampleProvider_Create_IndicationMI(m_mb, m_ctx, &m_rc);
    EXPECT_EQ(m_script.alive, 1);
    EXPECT_STREQ(n->ft->miName, "indicationSampleProvider");

    CMPIInstance* inst = m_scope.wrap(cimom::Instance());
    CMPIArgs* args = m_scope.wrap(cimom::NamedValues());
    CMPIData value{CMPI_sint64, CMPI_goodValue, {}};
    value.value.sint64 = INT64_MIN;
    const auto ctx = m_ctx;
    const auto op = m_path;
    const std::pair<const char*, std::function<CMPIStatus()>> kEntries[] = {
        {"enumNames", [=] { return call(i, &I::enumerateInstanceNames); }},
        {"enum", [=] { return call(i, &I::enumerateInstances, nullptr); }},
        {"get", [=] { return call(i, &I::getInstance, nullptr); }},
        {"create", [=] { return call(i, &I::createInstance, inst); }},
        {"set", [=] { return call(i, &I::modifyInstance, inst, nullptr); }},
        {"delete", [=] { return call(i, &I::deleteInstance); }},
        {"query", [=] { return call(i, &I::execQuery, "query", "lang"); }},
        {"all", [=] { return call(a, &A::associators, "A", "R", "r", "rr", nullptr); }},
        {"rr", [=] { return call(a, &A::associatorNames, "A", "R", "r", "rr"); }},
        {"references", [=] { return call(a, &A::references, "R", "r", nullptr); }},
        {"names", [=] { return call(a, &A::referenceNames, "R", "r"); }},
        {"invoke", [=] { return call(m, &M::invokeMethod, "Start", args, args); }},
        {"setProperty", [=] { return call(p, &P::setProperty, "Name", value); }},
        {"Name", [=] { return call(p, &P::getProperty, "Name"); }},
        {"user", [=] { return n->ft->authorizeFilter(n, ctx, nullptr, "C", op, "user"); }},
        {"poll", [=] { return n->ft->mustPoll(n, ctx, nullptr, "C", op); }},
        {"on", [=] { return n->ft->activateFilter(n, ctx, nullptr, "C", op, 1); }},
        {"off", [=] { return n->ft->deActivateFilter(n, ctx, nullptr, "C", op, 1); }},
        {"enable", [=] { return n->ft->enableIndications(n, ctx); }},
        {"disable", [=] { return n->ft->disableIndications(n, ctx); }},
    };
    for (const auto& [called, entry] : kEntries) {
        m_script.operation = succeed;
        EXPECT_EQ(entry().rc, CMPI_RC_OK) << called;
        EXPECT_EQ(m_script.called, called);
        m_script.operation = throwError;
        EXPECT_EQ(text(entry()), "disk on fire") << called;
    }
    EXPECT_EQ(*cimom::RequestScope::read(args).find("Out"), cimom::Value(CMPIUint32(7)));
    EXPECT_EQ(m_reply.value(), cimom::Value(CMPISint64(INT64_MIN)));
}

TEST_F(ProviderTest, NothingButAStatusCrosses) {
    static const std::tuple<CmpiStatus (*)(), CMPIrc, const char*> kCases[] = {
        {throwCode, CMPI_RC_ERR_ACCESS_DENIED, "(none)"},
        {throwText, CMPI_RC_ERR_NOT_FOUND, "no such host"},
        {throwError, CMPI_RC_ERR_FAILED, "disk on fire"},
        {throwMemory, CMPI_RC_ERR_FAILED, "std::bad_alloc"},
        {throwNumber, CMPI_RC_ERR_FAILED, "The provider failed."},
        {answerText, CMPI_RC_ERR_FAILED, "answered"},
    };
    ASSERT_TRUE(load());
    for (const auto& [operation, rc, words] : kCases) {
        m_script.operation = operation;
        const CMPIStatus status = enumerate();
        EXPECT_EQ(status.rc, rc);
        EXPECT_EQ(text(status), words);
    }
    // Without a way to make the text, the code still arrives.
    const auto out = [](const CMPIBroker*, const char*, CMPIStatus*) -> CMPIString* {
        throw std::bad_alloc();
    };
    for (const auto newString : {decltype(+out){nullptr}, +out}) {
        m_mb->eft->newString = newString;
        EXPECT_EQ(text(enumerate()), "(none)");
    }
}

TEST_F(ProviderTest, CancellationUnwindsTheWholeThread) {
    ASSERT_TRUE(load());
    m_script.operation = [this]() -> CmpiStatus {
        const auto unwind = [](ProviderTest* test) { test->m_script.called = "unwound"; };
        const std::unique_ptr<ProviderTest, decltype(unwind)> mark(this, unwind);
        pthread_cancel(pthread_self());
        pthread_testcancel();
        return CmpiStatus(CMPI_RC_OK);
    };
    const auto thread = [](void* self) -> void* {
        static_cast<ProviderTest*>(self)->enumerate();
        return nullptr;
    };
    pthread_t id;
    ASSERT_EQ(pthread_create(&id, nullptr, thread, this), 0);
    void* result = nullptr;
    EXPECT_EQ(pthread_join(id, &result), 0);
    EXPECT_EQ(result, PTHREAD_CANCELED);
    EXPECT_EQ(m_script.called, "unwound");
}

TEST_F(ProviderTest, RecordsWithoutAProviderAreRefused) {
    CMPIInstanceMI gone{nullptr, load()->ft};
    const auto enumNames = [this](CMPIInstanceMI* mi) {
        return m_instance->ft->enumerateInstanceNames(mi, m_ctx, m_result, m_path).rc;
    };
    EXPECT_EQ(enumNames(&gone), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(enumNames(nullptr), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(gone.ft->cleanup(&gone, m_ctx, 0).rc, CMPI_RC_ERR_INVALID_HANDLE);

    CmpiMethodMI methodsOnly{CmpiBroker(m_mb), CmpiContext(m_ctx)};
    CMPIInstanceMI wrongKind{static_cast<CmpiBaseMI*>(&methodsOnly), gone.ft};
    EXPECT_EQ(enumNames(&wrongKind), CMPI_RC_ERR_NOT_SUPPORTED);
    M table = {200, 200, "", nullptr, CmpiMethodMI::driveInvokeMethod};
    CMPIMethodMI bare{wrongKind.hdl, &table};  // its class overrides nothing
    EXPECT_EQ(call(&bare, &M::invokeMethod, "M", nullptr, nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(ProviderTest, AFailingLoadLeavesNothing) {
    using Step = std::function<CmpiStatus()> Script::*;
    static const std::tuple<Step, CmpiStatus (*)(), CMPIrc, const char*> kCases[] = {
        {&Script::initialize, answerText, CMPI_RC_ERR_FAILED, "answered"},
        {&Script::initialize, throwText, CMPI_RC_ERR_NOT_FOUND, "no such host"},
        {&Script::initialize, throwNumber, CMPI_RC_ERR_FAILED, "The provider failed."},
        {&Script::construct, throwError, CMPI_RC_ERR_FAILED, "disk on fire"},
    };
    for (const auto& [step, does, rc, words] : kCases) {
        m_script.*step = does;
        EXPECT_EQ(load(), nullptr);
        EXPECT_EQ(m_rc.rc, rc);
        EXPECT_EQ(text(m_rc), words);
        EXPECT_EQ(m_script.alive, 0);
        m_script.*step = succeed;
    }
    EXPECT_TRUE(load());
    EXPECT_EQ(m_rc.rc, CMPI_RC_OK);
}

TEST_F(ProviderTest, TheLastCleanupDestroys) {
    load();
    CMPIMethodMI* method = SampleProvider_Create_MethodMI(m_mb, m_ctx, &m_rc);
    EXPECT_EQ(cleanup(false).rc, CMPI_RC_OK);
    EXPECT_EQ(m_script.alive, 1);
    EXPECT_EQ(method->ft->cleanup(method, m_ctx, 0).rc, CMPI_RC_OK);
    EXPECT_EQ(m_script.alive, 0);
    EXPECT_EQ(call(method, &M::invokeMethod, "M", nullptr, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    load();
    EXPECT_EQ(m_script.alive, 1);
    EXPECT_EQ(enumerate().rc, CMPI_RC_OK);
}

TEST_F(ProviderTest, WhenAProviderMayStay) {
    static const struct {
        int unloadable;
        CmpiStatus (*cleanup)();
        bool terminating;
        CMPIrc rc;
        int alive;
    } kCases[] = {
        {0, succeed, false, CMPI_RC_ERR_NOT_SUPPORTED, 1},
        {0, succeed, true, CMPI_RC_OK, 0},
        {1, answerText, false, CMPI_RC_ERR_FAILED, 1},
        {1, answerText, true, CMPI_RC_ERR_FAILED, 1},
        {1, throwText, false, CMPI_RC_ERR_NOT_FOUND, 1},
        {1, throwText, true, CMPI_RC_OK, 0},
        {1, throwError, false, CMPI_RC_ERR_FAILED, 1},
    };
    for (const auto& c : kCases) {
        load();
        m_script.unloadable = c.unloadable;
        m_script.cleanup = c.cleanup;
        EXPECT_EQ(cleanup(c.terminating).rc, c.rc);
        EXPECT_EQ(m_script.alive, c.alive);
        m_script.cleanup = succeed;
        m_script.unloadable = 1;
        // What stayed still has its one use: one more cleanup ends it.
        if (c.alive) {
            cleanup(false);
        }
        EXPECT_EQ(m_script.alive, 0);
    }
}

TEST_F(ProviderTest, TextsAreMadeByALivingProvidersBroker) {
    EXPECT_EQ(CmpiStatus(CMPI_RC_ERR_FAILED, "nobody to make it").msg(), nullptr);
    const CmpiContext ctx(m_ctx);
    auto other = std::make_unique<cimom::Server>();
    const CmpiMethodMI first(CmpiBroker(m_mb), ctx);
    auto second = std::make_unique<CmpiMethodMI>(CmpiBroker(other->broker()), ctx);
    EXPECT_STREQ(CmpiStatus(CMPI_RC_ERR_FAILED, "of the second").msg(), "of the second");
    EXPECT_EQ(other->liveObjects(), 1U);
    second.reset();
    other.reset();
    EXPECT_STREQ(CmpiStatus(CMPI_RC_ERR_FAILED, "of the first").msg(), "of the first");
}

}  // namespace
