// The broker's operations: threads of providers, and upcalls by which one provider reaches
// others as a client would. An upcall runs as a request of its own, with the context given.

#include "Broker.h"

namespace cimom {

namespace {

// -- threads of providers ---------------------------------------------------------------------

// Requests that attached threads run in, the innermost last.
thread_local std::vector<std::unique_ptr<Activation>> attachments;

CMPIContext* prepareAttachThread(const CMPIBroker* mb, const CMPIContext* context) {
    return brokerEntry(mb, nullptr, [context](Broker&) { return cloneObject(context, nullptr); });
}
CMPIStatus attachThread(const CMPIBroker* mb, const CMPIContext* context) {
    return brokerStatus(mb, [context](Broker& broker) {
        attachments.push_back(std::make_unique<Activation>(broker, bodyOf(context)));
    });
}
CMPIStatus detachThread(const CMPIBroker* mb, const CMPIContext* context) {
    return brokerStatus(mb, [context](Broker& broker) {
        if (attachments.empty() || Activation::current(broker) != attachments.back().get())
            throw Failure(CMPI_RC_ERR_FAILED, "the thread is not attached");
        nodeOf(context);
        attachments.pop_back();
        releaseObject(const_cast<CMPIContext*>(context));  // made by prepareAttachThread
    });
}

// -- upcalls ----------------------------------------------------------------------------------

/// Runs an operation as the request that @p context stands for, and hands its reply on.
/// @throws Failure with what the operation answered
template <class F>
Reply upcall(Broker& broker, const CMPIContext* context, const char** properties, F operation) {
    Request request = requestOf(bodyOf(context));
    if (properties) {
        request.properties.emplace();
        for (const char** name = properties; *name; ++name) request.properties->push_back(*name);
    }
    Reply reply = operation(broker.server(), request);
    if (!reply.ok()) throw Failure(reply.rc, reply.message);
    return reply;
}

/// Upcalls by what they answer: a status, or an enumeration of one part of the reply.
template <class F>
CMPIStatus statusOf(const CMPIBroker* mb, const CMPIContext* context, const char** properties,
                    F operation) {
    return brokerStatus(mb,
                        [&](Broker& broker) { upcall(broker, context, properties, operation); });
}
template <auto Part, class F>
CMPIEnumeration* enumerationOf(const CMPIBroker* mb, const CMPIContext* context,
                               const char** properties, CMPIStatus* rc, F operation) {
    return brokerEntry(mb, rc, [&](Broker& broker) {
        const auto items = upcall(broker, context, properties, operation).*Part;
        return make<CMPIEnumeration>(broker, {Value::Array(items.begin(), items.end()), 0});
    });
}

/// An instance as it is to be, under the path given with it.
Instance instanceAt(const CMPIObjectPath* path, const CMPIInstance* instance) {
    Instance placed = bodyOf(instance).value;
    if (path) placed.path = bodyOf(path);
    return placed;
}

CMPIStatus deliverIndication(const CMPIBroker* mb, const CMPIContext* context, const char* ns,
                             const CMPIInstance* indication) {
    return statusOf(mb, context, nullptr, [=](Server& server, Request& request) {
        if (ns && *ns) request.nameSpace = ns;
        return server.deliver(request, bodyOf(indication).value);
    });
}

CMPIEnumeration* enumInstanceNames(const CMPIBroker* mb, const CMPIContext* context,
                                   const CMPIObjectPath* path, CMPIStatus* rc) {
    return enumerationOf<&Reply::paths>(mb, context, nullptr, rc,
                                        [=](Server& server, auto& request) {
                                            return server.enumInstanceNames(request, bodyOf(path));
                                        });
}
CMPIEnumeration* enumInstances(const CMPIBroker* mb, const CMPIContext* context,
                               const CMPIObjectPath* path, const char** properties,
                               CMPIStatus* rc) {
    return enumerationOf<&Reply::instances>(
        mb, context, properties, rc,
        [=](Server& server, auto& request) { return server.enumInstances(request, bodyOf(path)); });
}
CMPIInstance* getInstance(const CMPIBroker* mb, const CMPIContext* context,
                          const CMPIObjectPath* path, const char** properties, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        Reply reply = upcall(broker, context, properties, [=](Server& server, auto& request) {
            return server.getInstance(request, bodyOf(path));
        });
        return make<CMPIInstance>(broker, instanceBody(broker, reply.instances.front()));
    });
}
CMPIObjectPath* createInstance(const CMPIBroker* mb, const CMPIContext* context,
                               const CMPIObjectPath* path, const CMPIInstance* instance,
                               CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        Reply reply = upcall(broker, context, nullptr, [=](Server& server, auto& request) {
            return server.createInstance(request, instanceAt(path, instance));
        });
        return make<CMPIObjectPath>(broker, reply.paths.front());
    });
}
CMPIStatus modifyInstance(const CMPIBroker* mb, const CMPIContext* context,
                          const CMPIObjectPath* path, const CMPIInstance* instance,
                          const char** properties) {
    return statusOf(mb, context, properties, [=](Server& server, auto& request) {
        return server.modifyInstance(request, instanceAt(path, instance));
    });
}
CMPIStatus deleteInstance(const CMPIBroker* mb, const CMPIContext* context,
                          const CMPIObjectPath* path) {
    return statusOf(mb, context, nullptr, [=](Server& server, auto& request) {
        return server.deleteInstance(request, bodyOf(path));
    });
}
CMPIEnumeration* execQuery(const CMPIBroker* mb, const CMPIContext* context,
                           const CMPIObjectPath* path, const char* query, const char* language,
                           CMPIStatus* rc) {
    return enumerationOf<&Reply::instances>(
        mb, context, nullptr, rc, [=](Server& server, Request& request) {
            if (path) request.nameSpace = bodyOf(path).nameSpace;
            return server.execQuery(request, textOf(query), textOf(language));
        });
}

CMPIEnumeration* associators(const CMPIBroker* mb, const CMPIContext* context,
                             const CMPIObjectPath* path, const char* assocClass,
                             const char* resultClass, const char* role, const char* resultRole,
                             const char** properties, CMPIStatus* rc) {
    return enumerationOf<&Reply::instances>(
        mb, context, properties, rc, [=](Server& server, auto& request) {
            return server.associators(
                request, bodyOf(path),
                {textOf(assocClass), textOf(resultClass), textOf(role), textOf(resultRole)});
        });
}
CMPIEnumeration* associatorNames(const CMPIBroker* mb, const CMPIContext* context,
                                 const CMPIObjectPath* path, const char* assocClass,
                                 const char* resultClass, const char* role, const char* resultRole,
                                 CMPIStatus* rc) {
    return enumerationOf<&Reply::paths>(
        mb, context, nullptr, rc, [=](Server& server, auto& request) {
            return server.associatorNames(
                request, bodyOf(path),
                {textOf(assocClass), textOf(resultClass), textOf(role), textOf(resultRole)});
        });
}
CMPIEnumeration* references(const CMPIBroker* mb, const CMPIContext* context,
                            const CMPIObjectPath* path, const char* resultClass, const char* role,
                            const char** properties, CMPIStatus* rc) {
    return enumerationOf<&Reply::instances>(
        mb, context, properties, rc, [=](Server& server, auto& request) {
            return server.references(request, bodyOf(path),
                                     {"", textOf(resultClass), textOf(role), ""});
        });
}
CMPIEnumeration* referenceNames(const CMPIBroker* mb, const CMPIContext* context,
                                const CMPIObjectPath* path, const char* resultClass,
                                const char* role, CMPIStatus* rc) {
    return enumerationOf<&Reply::paths>(
        mb, context, nullptr, rc, [=](Server& server, auto& request) {
            return server.referenceNames(request, bodyOf(path),
                                         {"", textOf(resultClass), textOf(role), ""});
        });
}

CMPIData invokeMethod(const CMPIBroker* mb, const CMPIContext* context, const CMPIObjectPath* path,
                      const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        Reply reply = upcall(broker, context, nullptr, [=](Server& server, auto& request) {
            return server.invokeMethod(request, bodyOf(path), textOf(method),
                                       in ? bodyOf(in) : NamedValues());
        });
        if (out)
            for (const auto& [name, value] : reply.out) bodyOf(out).set(name, value);
        return makeData(broker, reply.value());
    });
}
CMPIStatus setProperty(const CMPIBroker* mb, const CMPIContext* context, const CMPIObjectPath* path,
                       const char* name, const CMPIValue* value, CMPIType type) {
    return statusOf(mb, context, nullptr, [=](Server& server, auto& request) {
        return server.setProperty(request, bodyOf(path), textOf(name), readValue(value, type));
    });
}
CMPIData getProperty(const CMPIBroker* mb, const CMPIContext* context, const CMPIObjectPath* path,
                     const char* name, CMPIStatus* rc) {
    return brokerEntry(mb, rc, [=](Broker& broker) {
        Reply reply = upcall(broker, context, nullptr, [=](Server& server, auto& request) {
            return server.getProperty(request, bodyOf(path), textOf(name));
        });
        return makeData(broker, reply.value());
    });
}

constexpr unsigned kFullCapabilities =
    CMPI_MB_Class_2 | CMPI_MB_Supports_PropertyMI | CMPI_MB_Supports_IndicationMI |
    CMPI_MB_Supports_QueryNormalization | CMPI_MB_Supports_Qualifier |
    CMPI_MB_Supports_MemEnhancements | CMPI_MB_Supports_Extended_Error;
constexpr unsigned kLeanCapabilities =
    CMPI_MB_Class_1 | CMPI_MB_Supports_PropertyMI | CMPI_MB_Supports_IndicationMI;

}  // namespace

CMPIBrokerFT operationTable(bool lean) {
    return {lean ? kLeanCapabilities : kFullCapabilities,
            lean ? 1U : static_cast<unsigned>(CMPIVersion200),
            lean ? "cimom, lean" : "cimom",
            prepareAttachThread,
            attachThread,
            detachThread,
            deliverIndication,
            enumInstanceNames,
            getInstance,
            createInstance,
            modifyInstance,
            deleteInstance,
            execQuery,
            enumInstances,
            associators,
            associatorNames,
            references,
            referenceNames,
            invokeMethod,
            setProperty,
            getProperty};
}

}  // namespace cimom
