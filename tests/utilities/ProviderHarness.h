/// A provider that does what a test tells it, called through the function tables that
/// zemBaseProviderManager hands out, on a broker of the object manager.
#ifndef PROVIDER_HARNESS_H
#define PROVIDER_HARNESS_H

#include <map>
#include <regex>
#include <string>
#include <vector>

#include "../cimom/BothBrokers.h"
#include "BaseProvider.h"
#include "ClassRepository.h"
#include "FailureText.h"
#include "InProcessFactories.h"

/// What the provider answers, and what it was asked.
struct Script {
    bool instanceClass = true, associationClass = false, methodClass = true;
    bool indicationClass = true, staticMethod = false;
    std::vector<std::string> keys = {"Name"};
    std::string argsOf;  ///< class and method whose arguments were asked for
    std::string bundle;
    std::map<std::string, std::function<void()>> actions;  ///< by worker, run when it is called
    std::vector<std::string> calls;                        ///< workers called, with a detail each
};
inline Script script;

/// All predicates as the script says, all workers those of the base.
class PlainProvider : public zemBaseProvider {
public:
    PlainProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemBaseProvider(mb, ctx, name) {}

    CMPIBoolean isValidInstanceClass(const char*) override { return script.instanceClass; }
    CMPIBoolean isValidAssociationClass(const char*) override { return script.associationClass; }
    CMPIBoolean isValidMethodClass(const char*) override { return script.methodClass; }
    CMPIBoolean isStaticMethod(const char*, const char*) override { return script.staticMethod; }
    CMPIBoolean isValidIndicationClass(const char*) override { return script.indicationClass; }
    void populateEssentialKeys(const char*, CmpiArray& keys) override {
        CMPICount i = 0;
        for (const std::string& key : script.keys) {
            setText(keys, i++, key.c_str());
        }
    }
    void populateMethodArgs(const char*, zemDynamicArray<zemString>& args, const char*) override {
        args.addElement(std::make_unique<zemString>("Reason"));
    }
    const char* getMessageBundlePath() override { return script.bundle.c_str(); }
};

class ScriptedProvider : public PlainProvider {
public:
    ScriptedProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), PlainProvider(mb, ctx, name) {}
    void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                            const char* method) override {
        script.argsOf = std::string(className) + "." + method;
        PlainProvider::populateMethodArgs(className, args, method);
    }
    using Ctx = const CmpiContext&;
    using Path = const CmpiObjectPath&;
    using Instance = const CmpiInstance&;
    using Filter = const CMPISelectExp*;
    using Text = const char*;

    CmpiInstance performGetInstance(Ctx, Path path, Text*) override {
        note("performGetInstance");
        CmpiInstance instance(path);
        instance.setProperty("Name", getKeyBinding(path, "Name"));
        return instance;
    }
    void performSetInstance(Ctx, CmpiResult&, Path, Instance instance, Text*) override {
        CmpiInstance copy(instance);
        note("performSetInstance", instanceToString(copy));
    }
    CmpiStatus performMustPoll(Ctx, Filter, Text className, Path) override {
        note("performMustPoll", className);
        return CmpiStatus(CMPI_RC_ERR_FAILED, "dropped by the frame");
    }
    void performInvokeMethod(Ctx, CmpiResult&, Path, Text name, const CmpiArgs&,
                             CmpiArgs&) override {
        note("performInvokeMethod", name);
    }
#define WORKER(name, ...) \
    void name(__VA_ARGS__) override { note(#name); }
#define FILTER_WORKER(name, last) \
    void name(Ctx, Filter, Text className, Path, last) override { note(#name, className); }
    WORKER(performEnumInstances, Ctx, CmpiResult&, Path, Text*)
    WORKER(performEnumInstanceNames, Ctx, CmpiResult&, Path)
    WORKER(performCreateInstance, Ctx, CmpiResult&, Path, Instance)
    WORKER(performDeleteInstance, Ctx, CmpiResult&, Path)
    WORKER(performAssociators, Ctx, CmpiResult&, Path, Text, Text, Text, Text, Text*)
    WORKER(performAssociatorNames, Ctx, CmpiResult&, Path, Text, Text, Text, Text)
    WORKER(performReferences, Ctx, CmpiResult&, Path, Text, Text, Text*)
    WORKER(performReferenceNames, Ctx, CmpiResult&, Path, Text, Text)
    WORKER(performEnableIndications, void)
    WORKER(performDisableIndications, void)
    FILTER_WORKER(performActivateFilter, CMPIBoolean)
    FILTER_WORKER(performAuthorizeFilter, Text)
    FILTER_WORKER(performDeActivateFilter, CMPIBoolean)
#undef WORKER
#undef FILTER_WORKER

private:
    static void note(const std::string& worker, const char* detail = "") {
        script.calls.push_back(*detail == '\0' ? worker : worker + " " + detail);
        const auto action = script.actions.find(worker);
        if (action != script.actions.end()) {
            action->second();
        }
    }
};

/// Does something of its own in each operation, fails where its object has the name "missing", and
/// refuses associations and deletion.
class WorkingProvider : public PlainProvider {
public:
    WorkingProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), PlainProvider(mb, ctx, name) {}
    CmpiInstance performGetInstance(const CmpiContext&, const CmpiObjectPath& path,
                                    const char**) override {
        const CmpiData name = getKeyBinding(path, "Name");
        if (std::string(name.getString().charPtr()) == "missing") {
            throwObjectNotFoundExc("getInstance", "Test_Disk", "missing");
        }
        CmpiInstance found(path);
        found.setProperty("Name", name);
        return found;
    }
    void performEnumInstances(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override {
        for (const char* name : {"a", "b", "missing"}) {
            CmpiObjectPath one = createObjectPath(path);
            one.setKey("Name", CmpiData(name));
            result.returnData(performGetInstance(ctx, one, properties));
        }
    }
    void performEnumInstanceNames(const CmpiContext&, CmpiResult& result,
                                  const CmpiObjectPath& path) override {
        result.returnData(path);
    }
    void performCreateInstance(const CmpiContext&, CmpiResult& result, const CmpiObjectPath& path,
                               const CmpiInstance&) override {
        result.returnData(path);
    }
    void performSetInstance(const CmpiContext& ctx, CmpiResult&, const CmpiObjectPath&,
                            const CmpiInstance&, const char**) override {
        logICUMessage(ctx, 1, "Id", "bundle", "Key", "text");
    }
    void performInvokeMethod(const CmpiContext&, CmpiResult& result, const CmpiObjectPath&,
                             const char*, const CmpiArgs& in, CmpiArgs& out) override {
        out.setArg("Reason", getParmVal(in, "Reason"));
        result.returnData(CmpiData(CMPIUint32{0}));
    }
};

/// What came back from one call through a function table.
struct Answer {
    CMPIrc rc = CMPI_RC_OK;
    std::string text;
    cimom::Reply reply;
    std::string output;  ///< lines on standard output

    /// How often a line of the trace is on standard output, up to its end.
    long traced(const std::string& message) const {
        const std::regex line("[>] " + message + "\n");
        return std::distance(std::sregex_iterator(output.begin(), output.end(), line),
                             std::sregex_iterator());
    }
};

class Harness {
public:
    using M = zemBaseProviderManager;

    explicit Harness(cimom::Character character,
                     createMI create = FactoriesOf<ScriptedProvider>::create,
                     const cimom::Request& request = {}, const std::string& messageFolder = "")
        : server({character, messageFolder, {}, classes()}), scope(server, request) {
        script = Script();
        CMPIBroker* mb = server.broker();
        makeKnown(mb);
        instance = M::getInstanceMI(mb, ctx(), "TestProvider", nullptr, create);
        association = M::getAssociationMI(mb, ctx(), "TestProvider", nullptr, create);
        method = M::getMethodMI(mb, ctx(), "TestProvider", nullptr, create);
        indication = M::getIndicationMI(mb, ctx(), "TestProvider", nullptr, create);
        property = M::getPropertyMI(mb, ctx(), "TestProvider", nullptr, create);
    }
    ~Harness() {
        const auto cleanup = [this](auto*... mi) { (mi->ft->cleanup(mi, ctx(), true), ...); };
        cleanup(instance, association, method, indication, property);
        EXPECT_EQ(0U, server.staleUses());
    }
    Harness(const Harness&) = delete;
    Harness& operator=(const Harness&) = delete;

    static std::shared_ptr<const cimom::ClassRepository> classes() {
        static const auto repository =
            cimom::ClassRepository::load("t.mof", [](const std::string&) {
                return "Qualifier Key : boolean = false, Scope(property), Flavor(DisableOverride);"
                       "class Test_Disk { [Key] string Name; string Caption; uint32 Size;"
                       "    uint32 Force(string Mode, string Reason); };";
            });
        return repository;
    }

    CMPIContext* ctx() const { return scope.context(); }
    zemBaseProvider& provider() const {
        return dynamic_cast<zemBaseProvider&>(*static_cast<CmpiBaseMI*>(instance->hdl));
    }
    CMPIObjectPath* path(const char* name = "d1") const {
        return scope.wrap(cimom::ObjectPath("root/cimv2", className, {{"Name", name}}));
    }
    CMPIObjectPath* classPath() const {
        return scope.wrap(cimom::ObjectPath("root/cimv2", className));
    }
    CMPIInstance* disk(const cimom::NamedValues& properties = {{"Name", "d1"}}) const {
        cimom::ObjectPath path("root/cimv2", className);
        if (!properties.empty()) {
            path.keys.set("Name", "d1");
        }
        return scope.wrap(cimom::Instance(path, properties));
    }
    CMPIArgs* args(const cimom::NamedValues& values = {}) const { return scope.wrap(values); }

    /// Runs something that gives a status, with standard output captured.
    template <class Run>
    Answer answer(Run run) {
        Answer answer;
        testing::internal::CaptureStdout();
        const CMPIStatus status = run(scope.result(answer.reply));
        answer.output = testing::internal::GetCapturedStdout();
        answer.rc = status.rc;
        if (status.msg != nullptr) {
            answer.text = status.msg->ft->getCharPtr(status.msg, nullptr);
        }
        return answer;
    }
    /// Calls an entry of a function table with context, result and the arguments given.
    template <class MI, class Entry, class... Args>
    Answer call(MI* mi, Entry entry, Args... rest) {
        return answer(
            [&](CMPIResult* result) { return (mi->ft->*entry)(mi, ctx(), result, rest...); });
    }
    template <class Entry, class... Args>
    Answer call(CMPIIndicationMI* mi, Entry entry, Args... rest) {
        return answer([&](CMPIResult*) { return (mi->ft->*entry)(mi, ctx(), rest...); });
    }

    cimom::Server server;
    cimom::RequestScope scope;
    std::string className = "Test_Disk";
    CMPIInstanceMI* instance;
    CMPIAssociationMI* association;
    CMPIMethodMI* method;
    CMPIIndicationMI* indication;
    CMPIPropertyMI* property;
};

#endif
