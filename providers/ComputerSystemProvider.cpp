#include "ComputerSystemProvider.h"

#include <strings.h>

#include <algorithm>
#include <memory>

namespace {

constexpr const char kStateChange[] = "RequestStateChange";

/// States that a client may ask for, and the answer to each of them.
constexpr CMPIUint16 kRequestableStates[] = {2, 3, 4, 6, 7, 8, 9, 10, 11};
constexpr CMPIUint32 kNotSupported = 1;

CmpiData uint32(CMPIUint32 value) {
    CmpiData data;
    data.setUint32(value);
    return data;
}

}  // namespace

ComputerSystemProvider::ComputerSystemProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                               const char* name, const char* className,
                                               std::vector<PropertyRow> rows, Attributes identity)
    : CmpiBaseMI(mb, ctx),
      zemBaseZemProvider(mb, ctx, name),
      m_className(className),
      m_rows(std::move(rows)),
      m_identity(std::move(identity)) {}

CmpiInstance ComputerSystemProvider::performGetInstance(const CmpiContext& context,
                                                        const CmpiObjectPath& path,
                                                        const char** properties) {
    const CmpiString creationClass = getKeyBinding(path, "CreationClassName").getString();
    const CmpiString name = getKeyBinding(path, "Name").getString();
    std::unique_ptr<CmpiInstance> found;
    if (strcasecmp(creationClass.charPtr(), m_className) == 0) {
        zemQyplatCmdCaller tool = toolFor(context);
        find(tool, name.charPtr(), attributesFor(m_rows, m_identity, properties).data(),
             [&](const std::string& foundName, const zemRecordType& record) {
                 found = std::make_unique<CmpiInstance>(
                     systemInstance(path, properties, foundName, record));
             });
    }
    if (!found) throwObjectNotFoundExc("getInstance", m_className, objectPathToString(path));
    return *found;
}

void ComputerSystemProvider::performEnumInstances(const CmpiContext& context, CmpiResult& result,
                                                  const CmpiObjectPath& path,
                                                  const char** properties) {
    zemQyplatCmdCaller tool = toolFor(context);
    walk(tool, attributesFor(m_rows, m_identity, properties).data(),
         [&](const std::string& name, const zemRecordType& record) {
             result.returnData(systemInstance(path, properties, name, record));
         });
}

void ComputerSystemProvider::performEnumInstanceNames(const CmpiContext& context,
                                                      CmpiResult& result,
                                                      const CmpiObjectPath& path) {
    zemQyplatCmdCaller tool = toolFor(context);
    walk(tool, attributesFor({}, m_identity, nullptr).data(),
         [&](const std::string& name, const zemRecordType&) {
             result.returnData(systemPath(path, name));
         });
}

void ComputerSystemProvider::performSetInstance(const CmpiContext& context, CmpiResult&,
                                                const CmpiObjectPath& path,
                                                const CmpiInstance& instance,
                                                const char** properties) {
    const CmpiInstance present = performGetInstance(context, path, nullptr);
    for (unsigned i = 0; i < instance.getPropertyCount(); ++i) {
        CmpiString name;
        instance.getProperty(static_cast<int>(i), &name);
        if (containsProperty(properties, name.charPtr()))
            validateUnmodifiableProperty(present, instance, name.charPtr());
    }
}

void ComputerSystemProvider::performInvokeMethod(const CmpiContext&, CmpiResult& result,
                                                 const CmpiObjectPath&, const char* method,
                                                 const CmpiArgs& in, CmpiArgs&) {
    if (strcasecmp(method, kStateChange) != 0) throwMethodNotFoundExc(method, m_className);
    const CmpiData asked = getParmVal(in, "RequestedState");
    const auto* end = std::end(kRequestableStates);
    if (std::find(std::begin(kRequestableStates), end, asked.getUint16()) == end)
        throwInvalidMethodArgValueExc("RequestedState", cmpidata2String(asked), method);
    result.returnData(uint32(kNotSupported));
}

CMPIBoolean ComputerSystemProvider::isValidInstanceClass(const char* className) {
    return strcasecmp(className, m_className) == 0;
}

CMPIBoolean ComputerSystemProvider::isValidMethodClass(const char* className) {
    return isValidInstanceClass(className);
}

void ComputerSystemProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    keys[0] = CmpiData("CreationClassName");
    keys[1] = CmpiData("Name");
}

void ComputerSystemProvider::populateMethodArgs(const char*, zemDynamicArray<zemString>& args,
                                                const char* method) {
    if (strcasecmp(method, kStateChange) != 0) return;
    args.addElement(new zemString("RequestedState"));
    args.addElement(new zemString("TimeoutPeriod"));
}

const char* ComputerSystemProvider::getMessageBundlePath() { return ""; }

void ComputerSystemProvider::complete(CmpiInstance&, const std::string&, const char**) {}

zemQyplatCmdCaller ComputerSystemProvider::toolFor(const CmpiContext& context) {
    return zemQyplatCmdCaller(getUserContext(context), getExternalLanguageName(context));
}

CmpiObjectPath ComputerSystemProvider::systemPath(const CmpiObjectPath& near,
                                                  const std::string& name) {
    CmpiObjectPath path = createObjectPath(near, m_className);
    path.setKey("CreationClassName", CmpiData(m_className));
    path.setKey("Name", CmpiData(name.c_str()));
    return path;
}

CmpiInstance ComputerSystemProvider::systemInstance(const CmpiObjectPath& near,
                                                    const char** properties,
                                                    const std::string& name,
                                                    const zemRecordType& record) {
    CmpiInstance instance(systemPath(near, name));
    instance.setProperty("CreationClassName", CmpiData(m_className));
    instance.setProperty("Name", CmpiData(name.c_str()));
    setProperties(instance, m_rows, properties, record);
    complete(instance, name, properties);
    return instance;
}
