#include "ComputerSystemProvider.h"

#include <strings.h>

#include <algorithm>
#include <memory>

namespace {

constexpr const char kStateChange[] = "RequestStateChange";

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
        find(clientOf(context), name.charPtr(),
             attributesFor(m_rows, m_identity, properties).data(),
             [&](const std::string& foundName, const zemRecordType& record) {
                 found = std::make_unique<CmpiInstance>(
                     makeInstance(path, properties, foundName, record));
             });
    }
    if (!found) {
        throwObjectNotFoundExc("getInstance", m_className, objectPathToString(path));
    }
    return *found;
}

void ComputerSystemProvider::performEnumInstances(const CmpiContext& context, CmpiResult& result,
                                                  const CmpiObjectPath& path,
                                                  const char** properties) {
    readAll(clientOf(context), attributesFor(m_rows, m_identity, properties).data(),
            [&](const std::string& name, const zemRecordType& record) {
                result.returnData(makeInstance(path, properties, name, record));
            });
}

void ComputerSystemProvider::performEnumInstanceNames(const CmpiContext& context,
                                                      CmpiResult& result,
                                                      const CmpiObjectPath& path) {
    readAll(clientOf(context), attributesFor({}, m_identity, nullptr).data(),
            [&](const std::string& name, const zemRecordType&) {
                result.returnData(systemPath(path, m_className, name));
            });
}

void ComputerSystemProvider::performSetInstance(const CmpiContext& context, CmpiResult&,
                                                const CmpiObjectPath& path,
                                                const CmpiInstance& instance,
                                                const char** properties) {
    const auto asked = askedFor(instance, path, m_className, properties);
    std::vector<const char*> toCompare = {"Name"};
    for (const auto& [property, value] : asked) {
        toCompare.push_back(property.c_str());
    }
    toCompare.push_back(nullptr);
    const CmpiInstance present = performGetInstance(context, path, toCompare.data());
    std::vector<std::pair<const char*, std::string>> changes;
    for (const auto& [property, value] : asked) {
        const char* const name = property.c_str();
        if (!isChangeable(name)) {
            validateUnmodifiableProperty(present, instance, name);
        } else if (!(cmpidata2String(value) == cmpidata2String(present.getProperty(name)))) {
            changes.emplace_back(name, value.getString().charPtr());
        }
    }
    const CmpiString name = getKeyBinding(path, "Name").getString();
    for (const auto& [property, value] : changes) {
        change(clientOf(context), name.charPtr(), property, value);
    }
}

void ComputerSystemProvider::performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                                                 const CmpiObjectPath& path, const char* method,
                                                 const CmpiArgs& in, CmpiArgs&) {
    if (strcasecmp(method, kStateChange) != 0) {
        throwMethodNotFoundExc(method, m_className);
    }
    const CmpiData asked = getParmVal(in, "RequestedState");
    const CMPIUint16 state = asked.getUint16();
    constexpr RequestedState kStates[] = {Enabled, Disabled, ShutDown, Offline, Test,
                                          Defer,   Quiesce,  Reboot,   Reset};
    const auto* const found = std::find(std::begin(kStates), std::end(kStates), state);
    if (found == std::end(kStates)) {
        throwInvalidMethodArgValueExc("RequestedState", cmpidata2String(asked), method);
    }
    if (hasTimeout(in)) {
        result.returnData(methodResult(TimeoutNotSupported));
        return;
    }
    const CmpiString name = getKeyBinding(path, "Name").getString();
    result.returnData(methodResult(requestState(clientOf(context), name.charPtr(), *found)));
}

CMPIBoolean ComputerSystemProvider::isValidInstanceClass(const char* className) {
    return compareClassNames(className, m_className);
}

CMPIBoolean ComputerSystemProvider::isValidMethodClass(const char* className) {
    return isValidInstanceClass(className);
}

void ComputerSystemProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    listSystemKeys(keys);
}

void ComputerSystemProvider::populateMethodArgs(const char*, zemDynamicArray<zemString>& args,
                                                const char* method) {
    if (strcasecmp(method, kStateChange) != 0) {
        return;
    }
    args.addElement(std::make_unique<zemString>("RequestedState"));
    args.addElement(std::make_unique<zemString>("TimeoutPeriod"));
}

bool ComputerSystemProvider::isChangeable(const char*) const { return false; }

void ComputerSystemProvider::change(const Client&, const std::string&, const char*,
                                    const std::string&) {}

ComputerSystemProvider::StateChangeAnswer ComputerSystemProvider::requestState(const Client&,
                                                                               const std::string&,
                                                                               RequestedState) {
    return NotSupported;
}

void ComputerSystemProvider::find(const Client& client, const std::string& name, int* attributes,
                                  const Sink& sink) {
    try {
        read(client, name, attributes, sink);
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) {
            throw;
        }
    }
}

ComputerSystemProvider::Client ComputerSystemProvider::clientOf(const CmpiContext& context) {
    return {getUserContext(context), getExternalLanguageName(context)};
}

zemQyplatCmdCaller ComputerSystemProvider::toolFor(const Client& client) {
    return zemQyplatCmdCaller(client.user, client.locale);
}

CmpiData ComputerSystemProvider::methodResult(CMPIUint32 value) {
    CmpiData data;
    data.setUint32(value);
    return data;
}

CmpiInstance ComputerSystemProvider::makeInstance(const CmpiObjectPath& near,
                                                  const char** properties, const std::string& name,
                                                  const zemRecordType& record) {
    CmpiInstance instance = newInstance(systemPath(near, m_className, name), properties);
    setProperties(instance, m_rows, properties, record);
    return instance;
}
