#include "CimXmlOperations.h"

#include <algorithm>
#include <memory>

#include "CimXmlWriter.h"
#include "Failure.h"

namespace cimom {

namespace {

// -- parameters ---------------------------------------------------------------------------------

/// The parameters of an operation, as read.
struct Arguments : AssociationFilter {
    const CimXmlEnvironment& environment;
    Request request;
    ObjectPath object;  ///< ClassName, InstanceName or ObjectName
    bool objectIsClass = false;
    Instance instance;  ///< NewInstance or ModifiedInstance
    std::optional<bool> localOnly, deepInheritance, includeQualifiers, includeClassOrigin;
    std::string name;  ///< PropertyName or QualifierName
    const XmlElement* newValue = nullptr;
    std::string query, queryLanguage, context;
    std::optional<std::uint32_t> timeout, most;
    bool continueOnError = false, wantsQueryClass = false;

    Arguments(const CimXmlEnvironment& e, const Request& r) : environment(e), request(r) {}
};

using Read = void (*)(CimXmlReader&, const XmlElement&, Arguments&);

Value given(CimXmlReader& reader, const XmlElement& parameter, CMPIType type) {
    Value value = reader.value(parameter, type);
    if (value.isNull()) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, "no value");
    }
    return value;
}
template <auto Place>
void readText(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    arguments.*Place = given(reader, parameter, CMPI_string).text();
}
template <auto Place>
void readFlag(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    arguments.*Place = given(reader, parameter, CMPI_boolean).boolean();
}
template <auto Place>
void readCount(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    arguments.*Place = static_cast<std::uint32_t>(given(reader, parameter, CMPI_uint32).uint());
}
/// The name of a class, as a CLASSNAME.
template <auto Place>
void readClass(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    arguments.*Place = reader.path(parameter.children.front()).className;
}
void readObject(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    const XmlElement& object = parameter.children.front();
    arguments.object = reader.path(object);
    arguments.objectIsClass = object.name == "CLASSNAME";
}
void readInstance(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    arguments.instance = reader.instance(parameter.children.front());
}
void readProperties(CimXmlReader& reader, const XmlElement& parameter, Arguments& arguments) {
    arguments.request.properties.emplace();
    const Value names = given(reader, parameter, CMPI_stringA);
    for (const Value& each : names.elements()) {
        if (!each.isNull()) {
            arguments.request.properties->push_back(each.text());
        }
    }
}
void keepElement(CimXmlReader&, const XmlElement& parameter, Arguments& arguments) {
    arguments.newValue = &parameter;
}

enum ParameterBit : unsigned {
    kClassName = 1U << 0,
    kInstanceName = 1U << 1,
    kObjectName = 1U << 2,
    kNewInstance = 1U << 3,
    kModifiedInstance = 1U << 4,
    kLocalOnly = 1U << 5,
    kDeepInheritance = 1U << 6,
    kIncludeQualifiers = 1U << 7,
    kIncludeClassOrigin = 1U << 8,
    kProperties = 1U << 9,
    kAssocClass = 1U << 10,
    kResultClass = 1U << 11,
    kRole = 1U << 12,
    kResultRole = 1U << 13,
    kPropertyName = 1U << 14,
    kQualifierName = 1U << 15,
    kNewValue = 1U << 16,
    kQueryLanguage = 1U << 17,
    kQuery = 1U << 18,
    kFilterLanguage = 1U << 19,
    kFilterQuery = 1U << 20,
    kTimeout = 1U << 21,
    kContinueOnError = 1U << 22,
    kMost = 1U << 23,
    kContext = 1U << 24,
    kQueryClass = 1U << 25,
};

struct Parameter {
    unsigned bit;
    const char* name;
    Read read;
};
constexpr Parameter kParameters[] = {
    {kClassName, "ClassName", readObject},
    {kInstanceName, "InstanceName", readObject},
    {kObjectName, "ObjectName", readObject},
    {kNewInstance, "NewInstance", readInstance},
    {kModifiedInstance, "ModifiedInstance", readInstance},
    {kLocalOnly, "LocalOnly", readFlag<&Arguments::localOnly>},
    {kDeepInheritance, "DeepInheritance", readFlag<&Arguments::deepInheritance>},
    {kIncludeQualifiers, "IncludeQualifiers", readFlag<&Arguments::includeQualifiers>},
    {kIncludeClassOrigin, "IncludeClassOrigin", readFlag<&Arguments::includeClassOrigin>},
    {kProperties, "PropertyList", readProperties},
    {kAssocClass, "AssocClass", readClass<&Arguments::assocClass>},
    {kResultClass, "ResultClass", readClass<&Arguments::resultClass>},
    {kRole, "Role", readText<&Arguments::role>},
    {kResultRole, "ResultRole", readText<&Arguments::resultRole>},
    {kPropertyName, "PropertyName", readText<&Arguments::name>},
    {kQualifierName, "QualifierName", readText<&Arguments::name>},
    {kNewValue, "NewValue", keepElement},
    {kQueryLanguage, "QueryLanguage", readText<&Arguments::queryLanguage>},
    {kQuery, "Query", readText<&Arguments::query>},
    {kFilterLanguage, "FilterQueryLanguage", readText<&Arguments::queryLanguage>},
    {kFilterQuery, "FilterQuery", readText<&Arguments::query>},
    {kTimeout, "OperationTimeout", readCount<&Arguments::timeout>},
    {kContinueOnError, "ContinueOnError", readFlag<&Arguments::continueOnError>},
    {kMost, "MaxObjectCount", readCount<&Arguments::most>},
    {kContext, "EnumerationContext", readText<&Arguments::context>},
    {kQueryClass, "ReturnQueryResultClass", readFlag<&Arguments::wantsQueryClass>},
};

[[noreturn]] void refuseParameter(const std::string& what) {
    throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, what);
}

void readParameters(const CimXmlCall& call, unsigned needed, unsigned possible,
                    CimXmlReader& reader, Arguments& arguments) {
    unsigned given = 0;
    for (const XmlElement* each : call.parameters) {
        const std::string& name = neededAttribute(*each, "NAME");
        const auto* const row =
            std::find_if(std::begin(kParameters), std::end(kParameters),
                         [&](const Parameter& p) { return sameName(p.name, name); });
        if (row == std::end(kParameters) || !((needed | possible) & row->bit)) {
            refuseParameter(call.name + " has no parameter " + name);
        }
        if (given & row->bit) {
            refuseParameter(name + " stands twice");
        }
        if (each->children.empty()) {
            continue;  // a null, as if it were not there
        }
        if (each->children.size() != 1) {
            refuseElement(each->children[1]);
        }
        given |= row->bit;
        try {
            row->read(reader, *each, arguments);
        } catch (const Failure& failure) {
            // What an instance holds has statuses of its own.
            throw row->bit & (kNewInstance | kModifiedInstance)
                ? failure
                : Failure(CMPI_RC_ERR_INVALID_PARAMETER, name + ": " + failure.what());
        }
    }
    for (const Parameter& row : kParameters) {
        if (needed & ~given & row.bit) {
            refuseParameter(call.name + " needs " + row.name);
        }
    }
}

// -- answers ------------------------------------------------------------------------------------

Reply succeeded(Reply reply) {
    if (!reply.ok()) {
        throw Failure(reply.rc, reply.message);
    }
    return reply;
}

template <class T>
using WriteObject = void (*)(std::string&, const T&, const std::string& host);

void bareInstance(std::string& out, const Instance& instance, const std::string&) {
    writeInstance(out, instance);
}
void namedInstance(std::string& out, const Instance& instance, const std::string&) {
    writeElement(out, "VALUE.NAMEDINSTANCE", {}, [&] {
        writeInstanceName(out, instance.path);
        writeInstance(out, instance);
    });
}
void instanceWithPath(std::string& out, const char* element, const Instance& instance,
                      const std::string& host) {
    writeElement(out, element, {}, [&] {
        writeInstancePath(out, instance.path, host);
        writeInstance(out, instance);
    });
}
void objectWithPath(std::string& out, const Instance& instance, const std::string& host) {
    instanceWithPath(out, "VALUE.OBJECTWITHPATH", instance, host);
}
void pulledInstance(std::string& out, const Instance& instance, const std::string& host) {
    instanceWithPath(out, "VALUE.INSTANCEWITHPATH", instance, host);
}
void instanceName(std::string& out, const ObjectPath& path, const std::string&) {
    writeInstanceName(out, path);
}
void instancePath(std::string& out, const ObjectPath& path, const std::string& host) {
    writeInstancePath(out, path, host);
}
void objectPath(std::string& out, const ObjectPath& path, const std::string& host) {
    writeElement(out, "OBJECTPATH", {}, [&] { writeInstancePath(out, path, host); });
}

/// Writes objects one by one, and frees each.
template <class T>
CimXmlAnswer listOf(std::deque<T> objects, WriteObject<T> write, const std::string& host) {
    auto left = std::make_shared<std::deque<T>>(std::move(objects));
    return {[left, write, host](std::string& out) {
                if (left->empty()) {
                    return false;
                }
                write(out, left->front(), host);
                left->pop_front();
                return true;
            },
            ""};
}

CimXmlAnswer single(std::string text) {
    auto left = std::make_shared<std::string>(std::move(text));
    return {[left](std::string& out) {
                out += *left;
                return !std::exchange(*left, {}).empty();
            },
            ""};
}

// -- what is asked of the server ----------------------------------------------------------------

/// Without what subclasses add, where a client asks for that.
Reply enumerateInstances(Arguments& arguments) {
    Request request = arguments.request;
    const ClassRepository* classes = arguments.environment.classes;
    const CimClass* cls = classes ? classes->findClass(arguments.object.className) : nullptr;
    if (cls && !arguments.deepInheritance.value_or(true)) {
        std::vector<std::string> names;
        for (const auto& property : cls->properties) {
            if (!request.properties || containsName(*request.properties, property->name)) {
                names.push_back(property->name);
            }
        }
        request.properties = std::move(names);
    }
    return arguments.environment.server.enumInstances(request, arguments.object);
}
Reply enumerateNames(Arguments& arguments) {
    return arguments.environment.server.enumInstanceNames(arguments.request, arguments.object);
}
Reply get(Arguments& arguments) {
    return arguments.environment.server.getInstance(arguments.request, arguments.object);
}

using Navigation = Reply (Server::*)(const Request&, const ObjectPath&, const AssociationFilter&);
template <Navigation Operation>
Reply navigate(Arguments& arguments) {
    if (arguments.objectIsClass) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "associations of classes are not told");
    }
    return (arguments.environment.server.*Operation)(arguments.request, arguments.object,
                                                     arguments);
}
Reply query(Arguments& arguments) {
    if (arguments.wantsQueryClass) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "no class of what a query finds is made");
    }
    return arguments.environment.server.execQuery(arguments.request, arguments.query,
                                                  arguments.queryLanguage);
}

using Ask = Reply (*)(Arguments&);

template <Ask Operation, WriteObject<Instance> Write>
CimXmlAnswer instances(Arguments& arguments) {
    return listOf(succeeded(Operation(arguments)).instances, Write, arguments.environment.host);
}
template <Ask Operation, WriteObject<ObjectPath> Write>
CimXmlAnswer paths(Arguments& arguments) {
    return listOf(succeeded(Operation(arguments)).paths, Write, arguments.environment.host);
}

// -- pulled enumerations ------------------------------------------------------------------------

CimXmlAnswer pieceAnswer(const Arguments& arguments, PullKind kind, PulledPiece piece) {
    const std::string& host = arguments.environment.host;
    CimXmlAnswer answer = kind == PullKind::InstancePaths
                              ? listOf<ObjectPath>(std::move(piece.paths), instancePath, host)
                          : kind == PullKind::Instances
                              ? listOf<Instance>(std::move(piece.instances), bareInstance, host)
                              : listOf<Instance>(std::move(piece.instances), pulledInstance, host);
    writeParameter(answer.tail, "PARAMVALUE", "EnumerationContext", Value(piece.context));
    writeParameter(answer.tail, "PARAMVALUE", "EndOfSequence", Value(piece.context.empty()));
    return answer;
}

template <Ask Operation, PullKind Kind>
CimXmlAnswer open(Arguments& arguments) {
    if (arguments.continueOnError) {
        throw Failure(kContinuationOnErrorNotSupported, "a failure ends the enumeration");
    }
    const bool filtered = !arguments.query.empty() || !arguments.queryLanguage.empty();
    if (filtered && Kind != PullKind::Instances) {
        throw Failure(kFilteredEnumerationNotSupported, "enumerations are not filtered");
    }
    return pieceAnswer(arguments, Kind,
                       arguments.environment.pulls.open(succeeded(Operation(arguments)), Kind,
                                                        arguments.request.user, arguments.timeout,
                                                        arguments.most.value_or(0)));
}
template <PullKind Kind>
CimXmlAnswer pull(Arguments& arguments) {
    return pieceAnswer(arguments, Kind,
                       arguments.environment.pulls.pull(arguments.context, Kind,
                                                        arguments.request.user, *arguments.most));
}
CimXmlAnswer close(Arguments& arguments) {
    arguments.environment.pulls.close(arguments.context, arguments.request.user);
    return {};
}

// -- changes ------------------------------------------------------------------------------------

CimXmlAnswer create(Arguments& arguments) {
    takeKeys(arguments.instance, arguments.environment.classes);
    return listOf<ObjectPath>(succeeded(arguments.environment.server.createInstance(
                                            arguments.request, arguments.instance))
                                  .paths,
                              instanceName, "");
}
CimXmlAnswer modify(Arguments& arguments) {
    succeeded(arguments.environment.server.modifyInstance(arguments.request, arguments.instance));
    return {};
}
CimXmlAnswer deleteObject(Arguments& arguments) {
    succeeded(arguments.environment.server.deleteInstance(arguments.request, arguments.object));
    return {};
}
CimXmlAnswer getProperty(Arguments& arguments) {
    std::string text;
    writeValue(text, succeeded(arguments.environment.server.getProperty(
                                   arguments.request, arguments.object, arguments.name))
                         .value());
    return single(std::move(text));
}
CimXmlAnswer setProperty(Arguments& arguments) {
    const CimXmlEnvironment& environment = arguments.environment;
    const CimClass* cls =
        environment.classes ? environment.classes->findClass(arguments.object.className) : nullptr;
    const CimProperty* property = cls ? cls->properties.find(arguments.name) : nullptr;
    if (cls && !property && environment.unfit == Unfit::Refused) {
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY,
                      "class " + cls->name + " has no property " + arguments.name);
    }
    CimXmlReader reader(environment.classes, environment.unfit);
    const Value value = arguments.newValue
                            ? reader.declaredValue(*arguments.newValue, "TYPE", property)
                            : Value::null(property ? typeOf(*property) : CMPI_string);
    succeeded(
        environment.server.setProperty(arguments.request, arguments.object, arguments.name, value));
    return {};
}

// -- classes ------------------------------------------------------------------------------------

const ClassRepository& repository(const Arguments& arguments) {
    if (!arguments.environment.classes) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "no classes are known");
    }
    return *arguments.environment.classes;
}

ClassForm formOf(const Arguments& arguments) {
    ClassForm form;
    form.localOnly = arguments.localOnly.value_or(true);
    form.qualifiers = arguments.includeQualifiers.value_or(true);
    form.classOrigin = arguments.includeClassOrigin.value_or(false);
    return form;
}

CimXmlAnswer getClass(Arguments& arguments) {
    const CimClass* cls = repository(arguments).findClass(arguments.object.className);
    if (!cls) {
        throw Failure(CMPI_RC_ERR_NOT_FOUND, "no class " + arguments.object.className);
    }
    ClassForm form = formOf(arguments);
    form.properties = arguments.request.properties ? &*arguments.request.properties : nullptr;
    std::string text;
    writeClass(text, *cls, form);
    return single(std::move(text));
}

/// The classes below one, or all; those directly below alone unless the client wants them deep.
std::vector<const CimClass*> classesBelow(const Arguments& arguments) {
    const bool deep = arguments.deepInheritance.value_or(false);
    const ClassRepository& classes = repository(arguments);
    const std::string& name = arguments.object.className;
    if (!name.empty()) {
        const CimClass* cls = classes.findClass(name);
        if (!cls) {
            throw Failure(CMPI_RC_ERR_INVALID_CLASS, "no class " + name);
        }
        return deep ? cls->allSubclasses() : cls->subclasses;
    }
    std::vector<const CimClass*> all;
    for (const auto& cls : classes.classes()) {
        if (deep || !cls->superclass) {
            all.push_back(cls.get());
        }
    }
    return all;
}

using WriteClass = void (*)(std::string&, const CimClass&, const ClassForm&);
void className(std::string& out, const CimClass& cls, const ClassForm&) {
    writeClassName(out, cls.name);
}
template <WriteClass Write>
CimXmlAnswer classes(Arguments& arguments) {
    return {[all = classesBelow(arguments), form = formOf(arguments),
             at = std::size_t{0}](std::string& out) mutable {
                if (at == all.size()) {
                    return false;
                }
                Write(out, *all[at++], form);
                return true;
            },
            ""};
}

CimXmlAnswer getQualifier(Arguments& arguments) {
    const CimQualifierType* type = repository(arguments).qualifierTypes().find(arguments.name);
    if (!type) {
        throw Failure(CMPI_RC_ERR_NOT_FOUND, "no qualifier " + arguments.name);
    }
    std::string text;
    writeQualifierType(text, *type);
    return single(std::move(text));
}
CimXmlAnswer enumerateQualifiers(Arguments& arguments) {
    std::string text;
    for (const auto& type : repository(arguments).qualifierTypes()) {
        writeQualifierType(text, *type);
    }
    return single(std::move(text));
}

// -- the operations -----------------------------------------------------------------------------

struct Operation {
    const char* name;
    unsigned needed;
    unsigned possible;
    CimXmlAnswer (*run)(Arguments&);
};

constexpr unsigned kShape = kIncludeQualifiers | kIncludeClassOrigin | kProperties;
constexpr unsigned kEnds = kAssocClass | kResultClass | kRole | kResultRole;
constexpr unsigned kEnd = kResultClass | kRole;
constexpr unsigned kOpening = kFilterLanguage | kFilterQuery | kTimeout | kContinueOnError | kMost;

constexpr auto kAssociators = navigate<&Server::associators>;
constexpr auto kAssociatorNames = navigate<&Server::associatorNames>;
constexpr auto kReferences = navigate<&Server::references>;
constexpr auto kReferenceNames = navigate<&Server::referenceNames>;
constexpr auto kWithPath = PullKind::InstancesWithPath;
constexpr auto kPaths = PullKind::InstancePaths;
constexpr auto kBare = PullKind::Instances;

/// Sorted by what they do. Those that would change classes are not here, and so not supported.
constexpr Operation kOperations[] = {
    {"GetInstance", kInstanceName, kLocalOnly | kShape, instances<get, bareInstance>},
    {"EnumerateInstances", kClassName, kLocalOnly | kDeepInheritance | kShape,
     instances<enumerateInstances, namedInstance>},
    {"EnumerateInstanceNames", kClassName, 0, paths<enumerateNames, instanceName>},
    {"ExecQuery", kQueryLanguage | kQuery, 0, instances<query, objectWithPath>},
    {"CreateInstance", kNewInstance, 0, create},
    {"ModifyInstance", kModifiedInstance, kIncludeQualifiers | kProperties, modify},
    {"DeleteInstance", kInstanceName, 0, deleteObject},
    {"GetProperty", kInstanceName | kPropertyName, 0, getProperty},
    {"SetProperty", kInstanceName | kPropertyName, kNewValue, setProperty},

    {"Associators", kObjectName, kEnds | kShape, instances<kAssociators, objectWithPath>},
    {"AssociatorNames", kObjectName, kEnds, paths<kAssociatorNames, objectPath>},
    {"References", kObjectName, kEnd | kShape, instances<kReferences, objectWithPath>},
    {"ReferenceNames", kObjectName, kEnd, paths<kReferenceNames, objectPath>},

    {"OpenEnumerateInstances", kClassName, kDeepInheritance | kShape | kOpening,
     open<enumerateInstances, kWithPath>},
    {"OpenEnumerateInstancePaths", kClassName, kOpening, open<enumerateNames, kPaths>},
    {"OpenAssociatorInstances", kInstanceName, kEnds | kShape | kOpening,
     open<kAssociators, kWithPath>},
    {"OpenAssociatorInstancePaths", kInstanceName, kEnds | kOpening,
     open<kAssociatorNames, kPaths>},
    {"OpenReferenceInstances", kInstanceName, kEnd | kShape | kOpening,
     open<kReferences, kWithPath>},
    {"OpenReferenceInstancePaths", kInstanceName, kEnd | kOpening, open<kReferenceNames, kPaths>},
    {"OpenQueryInstances", kFilterLanguage | kFilterQuery,
     kQueryClass | kTimeout | kContinueOnError | kMost, open<query, kBare>},
    {"PullInstancesWithPath", kContext | kMost, 0, pull<kWithPath>},
    {"PullInstancePaths", kContext | kMost, 0, pull<kPaths>},
    {"PullInstances", kContext | kMost, 0, pull<kBare>},
    {"CloseEnumeration", kContext, 0, close},

    {"GetClass", kClassName, kLocalOnly | kShape, getClass},
    {"EnumerateClasses", 0,
     kClassName | kDeepInheritance | kLocalOnly | kIncludeQualifiers | kIncludeClassOrigin,
     classes<writeClass>},
    {"EnumerateClassNames", 0, kClassName | kDeepInheritance, classes<className>},
    {"GetQualifier", kQualifierName, 0, getQualifier},
    {"EnumerateQualifiers", 0, 0, enumerateQualifiers},
};

const Operation* operationNamed(const std::string& name) {
    const auto* const row =
        std::find_if(std::begin(kOperations), std::end(kOperations),
                     [&](const Operation& each) { return sameName(each.name, name); });
    return row == std::end(kOperations) ? nullptr : row;
}

CimXmlAnswer runOperation(const CimXmlEnvironment& environment, const Request& request,
                          const CimXmlCall& call) {
    const Operation* operation = operationNamed(call.name);
    if (!operation) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "operation " + call.name);
    }
    Arguments arguments(environment, request);
    CimXmlReader reader(environment.classes, environment.unfit);
    readParameters(call, operation->needed, operation->possible, reader, arguments);
    const struct {
        std::optional<bool> Arguments::*given;
        unsigned flag;
    } flags[] = {{&Arguments::localOnly, CMPI_FLAG_LocalOnly},
                 {&Arguments::deepInheritance, CMPI_FLAG_DeepInheritance},
                 {&Arguments::includeQualifiers, CMPI_FLAG_IncludeQualifiers},
                 {&Arguments::includeClassOrigin, CMPI_FLAG_IncludeClassOrigin}};
    for (const auto& each : flags) {
        arguments.request.flags |= (arguments.*each.given).value_or(false) ? each.flag : 0;
    }
    return operation->run(arguments);
}

CimXmlAnswer runMethod(const CimXmlEnvironment& environment, const Request& request,
                       const CimXmlCall& call) {
    CimXmlReader reader(environment.classes, environment.unfit);
    const ObjectPath path = reader.path(*call.object);
    const CimClass* cls =
        environment.classes ? environment.classes->findClass(path.className) : nullptr;
    const CimMethod* method = cls ? cls->methods.find(call.name) : nullptr;
    if (cls && !method && environment.unfit == Unfit::Refused) {
        throw Failure(CMPI_RC_ERR_METHOD_NOT_FOUND,
                      "class " + cls->name + " has no method " + call.name);
    }
    const Reply reply = succeeded(environment.server.invokeMethod(
        request, path, method ? method->name : call.name, reader.arguments(call, method)));
    CimXmlAnswer answer;
    if (!reply.value().isNull()) {
        writeParameter(answer.tail, "RETURNVALUE", "", reply.value());
    }
    for (const auto& [name, value] : reply.out) {
        writeParameter(answer.tail, "PARAMVALUE", name, value);
    }
    return answer;
}

}  // namespace

CimXmlAnswer runCimXmlCall(const CimXmlEnvironment& environment, const Request& request,
                           const CimXmlCall& call) {
    Request placed = request;
    placed.nameSpace = call.nameSpace;
    if (!environment.server.hasNamespace(call.nameSpace)) {
        throw Failure(CMPI_RC_ERR_INVALID_NAMESPACE, "no namespace " + call.nameSpace);
    }
    return call.intrinsic ? runOperation(environment, placed, call)
                          : runMethod(environment, placed, call);
}

}  // namespace cimom
