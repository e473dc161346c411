// The broker's operations: threads of providers, and upcalls by which one provider reaches
// others as a client would. An upcall runs as a request of its own, with the context given.

#include "Broker.h"

namespace cimom {

namespace {

// As the tables name them.
using Context = const CMPIContext*;
using Path = const CMPIObjectPath*;
using Text = const char*;

// -- threads of providers ---------------------------------------------------------------------

// Requests that attached threads run in, the innermost last.
thread_local std::vector<std::unique_ptr<Activation>> attachments;

CMPIContext* prepareAttachThread(const CMPIBroker* mb, Context context) {
    return brokerEntry(mb, nullptr, [context](Broker& broker) {
        return cloneBody<CMPIContext>(bodyOf(context), broker);
    });
}
void attachThread(Broker& broker, Context context) {
    attachments.push_back(std::make_unique<Activation>(broker, bodyOf(context)));
}
void detachThread(Broker& broker, Context context) {
    if (attachments.empty() || Activation::current(broker) != attachments.back().get()) {
        throw Failure(CMPI_RC_ERR_FAILED, "the thread is not attached");
    }
    nodeOf(context);
    attachments.pop_back();
    releaseObject(const_cast<CMPIContext*>(context));  // made by prepareAttachThread
}

// -- upcalls ----------------------------------------------------------------------------------

Request requestIn(Context context, const char** properties = nullptr) {
    Request request = requestOf(bodyOf(context));
    if (properties) {
        request.properties = namesIn(properties);
    }
    return request;
}

/// What a provider is handed of a reply: nothing but its success, or an enumeration of a part.
/// @throws Failure with what the operation answered
Reply succeeded(Reply reply) {
    if (!reply.ok()) {
        throw Failure(reply.rc, reply.message);
    }
    return reply;
}
template <class List>
CMPIEnumeration* enumerationOf(Broker& broker, const List& items) {
    return make<CMPIEnumeration>(broker, {Value::Array(items.begin(), items.end()), 0});
}

/// An instance as it is to be, under the path given with it.
Instance instanceAt(Path path, const CMPIInstance* instance) {
    Instance placed = bodyOf(instance).value;
    if (path) {
        placed.path = bodyOf(path);
    }
    return placed;
}

void deliverIndication(Broker& broker, Context context, Text ns, const CMPIInstance* indication) {
    Request request = requestIn(context);
    if (ns && *ns) {
        request.nameSpace = ns;
    }
    succeeded(broker.server().deliver(request, bodyOf(indication).value));
}

CMPIEnumeration* enumInstanceNames(Broker& broker, Context context, Path path) {
    Server& server = broker.server();
    return enumerationOf(
        broker, succeeded(server.enumInstanceNames(requestIn(context), bodyOf(path))).paths);
}
CMPIEnumeration* enumInstances(Broker& broker, Context context, Path path,
                               const char** properties) {
    const Request request = requestIn(context, properties);
    return enumerationOf(broker,
                         succeeded(broker.server().enumInstances(request, bodyOf(path))).instances);
}
CMPIInstance* getInstance(Broker& broker, Context context, Path path, const char** properties) {
    const Request request = requestIn(context, properties);
    const Reply reply = succeeded(broker.server().getInstance(request, bodyOf(path)));
    return make<CMPIInstance>(broker, instanceBody(broker, reply.instances.front()));
}
CMPIObjectPath* createInstance(Broker& broker, Context context, Path path,
                               const CMPIInstance* instance) {
    const Request request = requestIn(context);
    const Reply reply =
        succeeded(broker.server().createInstance(request, instanceAt(path, instance)));
    return make<CMPIObjectPath>(broker, reply.paths.front());
}
void modifyInstance(Broker& broker, Context context, Path path, const CMPIInstance* instance,
                    const char** properties) {
    const Request request = requestIn(context, properties);
    succeeded(broker.server().modifyInstance(request, instanceAt(path, instance)));
}
void deleteInstance(Broker& broker, Context context, Path path) {
    succeeded(broker.server().deleteInstance(requestIn(context), bodyOf(path)));
}
CMPIEnumeration* execQuery(Broker& broker, Context context, Path path, Text query, Text language) {
    Request request = requestIn(context);
    if (path) {
        request.nameSpace = bodyOf(path).nameSpace;
    }
    const Reply reply =
        succeeded(broker.server().execQuery(request, textOf(query), textOf(language)));
    return enumerationOf(broker, reply.instances);
}

/// The four operations on associations, by what they answer.
using Navigation = Reply (Server::*)(const Request&, const ObjectPath&, const AssociationFilter&);
template <auto Part>
CMPIEnumeration* navigate(Broker& broker, const Request& request, Path path,
                          const AssociationFilter& filter, Navigation operation) {
    return enumerationOf(
        broker, succeeded((broker.server().*operation)(request, bodyOf(path), filter)).*Part);
}
CMPIEnumeration* associators(Broker& broker, Context context, Path path, Text assocClass,
                             Text resultClass, Text role, Text resultRole,
                             const char** properties) {
    return navigate<&Reply::instances>(
        broker, requestIn(context, properties), path,
        {textOf(assocClass), textOf(resultClass), textOf(role), textOf(resultRole)},
        &Server::associators);
}
CMPIEnumeration* associatorNames(Broker& broker, Context context, Path path, Text assocClass,
                                 Text resultClass, Text role, Text resultRole) {
    return navigate<&Reply::paths>(
        broker, requestIn(context), path,
        {textOf(assocClass), textOf(resultClass), textOf(role), textOf(resultRole)},
        &Server::associatorNames);
}
CMPIEnumeration* references(Broker& broker, Context context, Path path, Text resultClass, Text role,
                            const char** properties) {
    return navigate<&Reply::instances>(broker, requestIn(context, properties), path,
                                       {"", textOf(resultClass), textOf(role), ""},
                                       &Server::references);
}
CMPIEnumeration* referenceNames(Broker& broker, Context context, Path path, Text resultClass,
                                Text role) {
    return navigate<&Reply::paths>(broker, requestIn(context), path,
                                   {"", textOf(resultClass), textOf(role), ""},
                                   &Server::referenceNames);
}

CMPIData invokeMethod(Broker& broker, Context context, Path path, Text method, const CMPIArgs* in,
                      CMPIArgs* out) {
    const Reply reply = succeeded(broker.server().invokeMethod(
        requestIn(context), bodyOf(path), textOf(method), in ? bodyOf(in) : NamedValues()));
    if (out) {
        for (const auto& [name, value] : reply.out) {
            bodyOf(out).set(name, value);
        }
    }
    return makeData(broker, reply.value());
}
void setProperty(Broker& broker, Context context, Path path, Text name, const CMPIValue* value,
                 CMPIType type) {
    succeeded(broker.server().setProperty(requestIn(context), bodyOf(path), textOf(name),
                                          readValue(value, type)));
}
CMPIData getProperty(Broker& broker, Context context, Path path, Text name) {
    const Reply reply =
        succeeded(broker.server().getProperty(requestIn(context), bodyOf(path), textOf(name)));
    return makeData(broker, reply.value());
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
            entryOf<attachThread>,
            entryOf<detachThread>,
            entryOf<deliverIndication>,
            entryOf<enumInstanceNames>,
            entryOf<getInstance>,
            entryOf<createInstance>,
            entryOf<modifyInstance>,
            entryOf<deleteInstance>,
            entryOf<execQuery>,
            entryOf<enumInstances>,
            entryOf<associators>,
            entryOf<associatorNames>,
            entryOf<references>,
            entryOf<referenceNames>,
            entryOf<invokeMethod>,
            entryOf<setProperty>,
            entryOf<getProperty>};
}

}  // namespace cimom
