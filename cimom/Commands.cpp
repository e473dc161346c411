#include "Commands.h"

#include <cstdio>

#include "EndSignals.h"
#include "Failure.h"
#include "JobProgress.h"
#include "PathText.h"
#include "Serve.h"

namespace cimom {

namespace {

ObjectPath readPath(const Session& session, const std::string& text) {
    ObjectPath path = parsePath(text, session.unfit);
    if (path.nameSpace.empty()) {
        path.nameSpace = session.request.nameSpace;
    }
    return session.classes ? typedKeys(path, *session.classes, session.unfit) : path;
}

const CimClass* classOf(const Session& session, const ObjectPath& path) {
    return session.classes ? session.classes->findClass(path.className) : nullptr;
}

/// The value of an element, typed as declared; guessed when its class is not known.
Value readValue(const Session& session, const CimElement* declared, const std::string& text) {
    return declared ? parseValue(text, typeOf(*declared), session.classes, session.unfit)
                    : guessValue(text);
}

/// What to say of a name that is not declared or stands twice; nothing where the provider is to
/// judge.
void refuseName(const Session& session, CMPIrc rc, const std::string& message) {
    if (session.unfit == Unfit::Refused) {
        throw Failure(rc, message);
    }
}

/// The method or property that is named; null where it is not known and left to the provider.
template <class T>
const T* named(const Session& session, const std::string& name, const CimClass* cls,
               NamedList<T> CimClass::*members, CMPIrc unknown, const char* what) {
    const T* found = cls ? (cls->*members).find(name) : nullptr;
    if (cls && !found) {
        refuseName(session, unknown, "class " + cls->name + " has no " + what + " " + name);
    }
    return found;
}

/// Values given as name=value.
/// @param declared  elements that there are; null when nothing is known of them
/// @throws Failure with @p unknown for a name that is not among them, and for one given twice
template <class T>
NamedValues readAssignments(const Session& session, const NamedList<T>* declared,
                            const std::vector<std::string>& assignments, CMPIrc unknown) {
    NamedValues values;
    for (const std::string& text : assignments) {
        const std::size_t equals = text.find('=');
        if (equals == 0 || equals == std::string::npos) {
            throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "'" + text + "' is not name=value");
        }
        const std::string name = text.substr(0, equals);
        const T* element = declared ? declared->find(name) : nullptr;
        if (declared && !element) {
            refuseName(session, unknown, "there is no '" + name + "' to set");
        }
        if (values.find(name)) {
            refuseName(session, CMPI_RC_ERR_INVALID_PARAMETER, "'" + name + "' is given twice");
        }
        values.add(element ? element->name : name,
                   readValue(session, element, text.substr(equals + 1)));
    }
    return values;
}

/// Prints what a reply holds, failure or not: of several providers some may have answered.
Reply printed(Session& session, Reply reply, bool instances) {
    const std::string text =
        instances ? render(reply.instances, session.format) : render(reply.paths, session.format);
    const bool nothing = reply.instances.empty() && reply.paths.empty();
    if (reply.ok() || !nothing) {
        session.out.write(text);
    }
    return reply;
}

// -- instances --------------------------------------------------------------------------------

using Operation = Reply (Server::*)(const Request&, const ObjectPath&);

template <Operation Get, bool Instances>
Reply fetch(Session& session, const Arguments& arguments) {
    const ObjectPath path = readPath(session, arguments.object);
    return printed(session, (session.server.*Get)(session.request, path), Instances);
}

Instance readInstance(const Session& session, const Arguments& arguments) {
    Instance instance(readPath(session, arguments.object));
    const CimClass* cls = classOf(session, instance.path);
    instance.properties = readAssignments(session, cls ? &cls->properties : nullptr,
                                          arguments.assignments, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return instance;
}
Reply createInstance(Session& session, const Arguments& arguments) {
    Instance instance = readInstance(session, arguments);
    takeKeys(instance, session.classes);
    return printed(session, session.server.createInstance(session.request, instance), false);
}
Reply modifyInstance(Session& session, const Arguments& arguments) {
    const Instance instance = readInstance(session, arguments);
    Request request = session.request;
    request.properties.emplace();
    for (const auto& each : instance.properties) {
        request.properties->push_back(each.name);
    }
    return session.server.modifyInstance(request, instance);
}
Reply deleteInstance(Session& session, const Arguments& arguments) {
    return session.server.deleteInstance(session.request, readPath(session, arguments.object));
}

// -- associations -----------------------------------------------------------------------------

using AssociationOperation = Reply (Server::*)(const Request&, const ObjectPath&,
                                               const AssociationFilter&);

template <AssociationOperation Operation, bool Instances>
Reply navigate(Session& session, const Arguments& arguments) {
    const ObjectPath path = readPath(session, arguments.object);
    return printed(session, (session.server.*Operation)(session.request, path, arguments),
                   Instances);
}

// -- methods and properties -------------------------------------------------------------------

Reply invokeMethod(Session& session, const Arguments& arguments) {
    const ObjectPath path = readPath(session, arguments.object);
    const CimMethod* method = named(session, arguments.name, classOf(session, path),
                                    &CimClass::methods, CMPI_RC_ERR_METHOD_NOT_FOUND, "method");
    const NamedValues in = readAssignments(session, method ? &method->parameters : nullptr,
                                           arguments.assignments, CMPI_RC_ERR_INVALID_PARAMETER);
    Reply reply = session.server.invokeMethod(session.request, path, arguments.name, in);
    if (reply.ok()) {
        session.out.write(renderMethod(reply, session.format));
    }
    ObjectPath job;
    return reply.ok() && hasStartedJob(reply, job) ? awaitJob(session, job) : reply;
}
Reply getProperty(Session& session, const Arguments& arguments) {
    Reply reply = session.server.getProperty(session.request, readPath(session, arguments.object),
                                             arguments.name);
    if (reply.ok()) {
        session.out.write(render(reply.value(), session.format));
    }
    return reply;
}
Reply setProperty(Session& session, const Arguments& arguments) {
    const ObjectPath path = readPath(session, arguments.object);
    const CimProperty* property =
        named(session, arguments.name, classOf(session, path), &CimClass::properties,
              CMPI_RC_ERR_NO_SUCH_PROPERTY, "property");
    return session.server.setProperty(session.request, path, arguments.name,
                                      readValue(session, property, arguments.value));
}

// -- classes ----------------------------------------------------------------------------------

const ClassRepository& repository(const Session& session) {
    if (!session.classes) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "no classes are known without --schema");
    }
    return *session.classes;
}
const CimClass& knownClass(const Session& session, const std::string& name) {
    const CimClass* cls = repository(session).findClass(name);
    if (!cls) {
        throw Failure(CMPI_RC_ERR_INVALID_CLASS, "no class " + name);
    }
    return *cls;
}
Reply getClass(Session& session, const Arguments& arguments) {
    const CimClass& cls = knownClass(session, arguments.object);
    const std::string mof = repository(session).toMof(cls);
    session.out.write(session.format == Format::Json ? render(Value(mof), session.format) : mof);
    return {};
}
Reply enumClasses(Session& session, const Arguments& arguments) {
    std::vector<std::string> names;
    if (arguments.object.empty()) {
        for (const auto& cls : repository(session).classes()) {
            names.push_back(cls->name);
        }
    } else {
        for (const CimClass* cls : knownClass(session, arguments.object).allSubclasses()) {
            names.push_back(cls->name);
        }
    }
    session.out.write(render(names, session.format));
    return {};
}

// -- indications ------------------------------------------------------------------------------

// Until a signal asks to end, or enough indications have come, or nobody reads them.
Reply watch(Session& session, const Arguments& arguments) {
    const std::string query = arguments.query.find(' ') == std::string::npos
                                  ? "SELECT * FROM " + arguments.query
                                  : arguments.query;
    EndSignals signals;
    std::size_t seen = 0;  // the handler runs one indication at a time
    Server::SubscriptionId id = 0;
    Reply reply = session.server.subscribe(
        session.request, query, arguments.queryLanguage,
        [&](const Indication& indication) {
            if (arguments.count != 0 && seen == arguments.count) {
                return;
            }
            ++seen;
            const bool read = session.out.write(renderEvent(indication, session.format));
            if (!read || seen == arguments.count) {
                EndSignals::wake();
            }
        },
        id);
    if (!reply.ok()) {
        return reply;
    }
    std::fputs("watching\n", stderr);  // what changes from now on will be told
    while (!signals.wait(std::chrono::seconds(1))) {
        continue;
    }
    return session.server.unsubscribe(session.request, id);
}

}  // namespace

const std::vector<Verb>& verbs() {
    static const std::vector<Verb> rows = {
        {"ei", "Enumerate the instances of a class", kClass | kPropertyList,
         fetch<&Server::enumInstances, true>},
        {"ein", "Enumerate the paths of the instances of a class", kClass,
         fetch<&Server::enumInstanceNames, false>},
        {"gi", "Get an instance", kPath | kPropertyList, fetch<&Server::getInstance, true>},
        {"ci", "Create an instance and print its path", kClass | kPropertyValues, createInstance},
        {"mi", "Modify properties of an instance", kPath | kPropertyValues, modifyInstance},
        {"di", "Delete an instance", kPath, deleteInstance},
        {"ai", "Get the instances associated with an instance",
         kPath | kPropertyList | kAssociationEnds | kNavigation,
         navigate<&Server::associators, true>},
        {"ain", "Get the paths of the instances associated with an instance",
         kPath | kAssociationEnds | kNavigation, navigate<&Server::associatorNames, false>},
        {"ri", "Get the associations that refer to an instance",
         kPath | kPropertyList | kNavigation, navigate<&Server::references, true>},
        {"rin", "Get the paths of the associations that refer to an instance", kPath | kNavigation,
         navigate<&Server::referenceNames, false>},
        {"im", "Invoke a method", kPath | kMethodName | kInputValues, invokeMethod},
        {"gp", "Get a property of an instance", kPath | kPropertyName, getProperty},
        {"sp", "Set a property of an instance", kPath | kPropertyName | kValue, setProperty},
        {"gc", "Print the declaration of a class", kClass | kNoProvider, getClass},
        {"ec", "List all classes, or those below one", kOptionalClass | kNoProvider, enumClasses},
        {"watch", "Print indications until interrupted", kFilter, watch},
        {"serve", "Serve clients of CIM-XML over HTTP until interrupted", kServing, serve},
    };
    return rows;
}

}  // namespace cimom
