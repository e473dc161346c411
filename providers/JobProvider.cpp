#include "JobProvider.h"

#include <strings.h>

#include <cctype>
#include <memory>

#include "PropertyRows.h"
#include "ProviderFactories.h"

namespace {

using Status = JobTable::Status;

constexpr char kError[] = "CIM_Error";
constexpr char kDelete[] = "DeleteOnCompletion";
constexpr char kStateChange[] = "RequestStateChange";
constexpr char kGetError[] = "GetError";

// Values of the schema.
enum Operational : CMPIUint16 {
    Ok = 2,
    Error = 6,
    Stopping = 9,
    Stopped = 10,
    Aborted = 14,
    Done = 17
};
enum RequestedState : CMPIUint16 { Start = 2, Suspend, Terminate, Kill, Service };
constexpr CMPIUint32 kSuccess = 0;
constexpr CMPIUint32 kTimeoutNotSupported = 4098;
constexpr CMPIUint16 kSoftwareError = 4;
constexpr CMPIUint32 kFailed = 1;

/// What clients are told of the states of jobs.
struct StateRow {
    JobTable::State state;
    const char* word;
    CMPIUint16 status;
    bool done;  ///< whether Completed stands behind the status
};
constexpr StateRow kStates[] = {
    {JobTable::Running, "Running", Ok, false},
    {JobTable::ShuttingDown, "Shutting Down", Stopping, false},
    {JobTable::Completed, "Completed", Ok, true},
    {JobTable::Terminated, "Terminated", Stopped, true},
    {JobTable::Killed, "Killed", Aborted, true},
    {JobTable::Exception, "Exception", Error, true},
};

const StateRow& stateOf(const Status& job) {
    const StateRow* row = kStates;
    while (row->state != job.state) {
        ++row;
    }
    return *row;
}

CmpiData text(const std::string& value) {
    return value.empty() ? CmpiData() : CmpiData(CmpiString(value.c_str()));
}

CmpiData interval(std::chrono::microseconds length) {
    return CmpiData(CmpiDateTime(static_cast<CMPIUint64>(length.count()), 1));
}

CmpiData statusList(const Status& job) {
    const StateRow& row = stateOf(job);
    CmpiArray list(row.done ? 2 : 1, CMPI_uint16);
    list[0] = CmpiData(row.status);
    if (row.done) {
        list[1] = CmpiData(static_cast<CMPIUint16>(Done));
    }
    return CmpiData(list);
}

CmpiData flag(bool value) {
    CmpiData data;
    data.setBoolean(value);
    return data;
}

/// The properties besides the key; a value that is null leaves its property null.
constexpr struct {
    const char* property;
    CmpiData (*of)(const Status& job);
} kRows[] = {
    {"Name", [](const Status& job) { return text(job.name); }},
    {"ElementName", [](const Status& job) { return text(job.name); }},
    {"Owner", [](const Status& job) { return text(job.owner); }},
    {"AffectedSystem", [](const Status& job) { return text(job.partition); }},
    {"JobState", [](const Status& job) { return CmpiData(static_cast<CMPIUint16>(job.state)); }},
    {"JobStatus", [](const Status& job) { return text(stateOf(job).word); }},
    {"OperationalStatus", statusList},
    {"TimeSubmitted",
     [](const Status& job) { return CmpiData(zemBaseProvider::convertDateTime(job.submitted)); }},
    {"StartTime",
     [](const Status& job) { return CmpiData(zemBaseProvider::convertDateTime(job.submitted)); }},
    {"ElapsedTime", [](const Status& job) { return interval(job.elapsed); }},
    {"TimeOfLastStateChange",
     [](const Status& job) {
         return job.changed.tv_sec == 0 ? interval(std::chrono::microseconds(0))
                                        : CmpiData(zemBaseProvider::convertDateTime(job.changed));
     }},
    {"TimeBeforeRemoval",
     [](const Status&) { return interval(std::chrono::seconds(JobTable::kSecondsBeforeRemoval)); }},
    {"PercentComplete",
     [](const Status& job) {
         return job.percent ? CmpiData(CMPIUint16(*job.percent)) : CmpiData();
     }},
    {kDelete, [](const Status& job) { return flag(job.deleteOnCompletion); }},
    {"ErrorCode",
     [](const Status& job) {
         return job.ended() ? CmpiData(static_cast<CMPIUint16>(job.exitCode)) : CmpiData();
     }},
    {"ErrorDescription", [](const Status& job) { return text(job.error); }},
};

CmpiInstance instanceOf(const CmpiObjectPath& near, const char** properties, const Status& job) {
    CmpiInstance instance = newInstance(jobPath(near, job.id), properties);
    for (const auto& row : kRows) {
        if (zemBaseProvider::containsProperty(properties, row.property)) {
            const CmpiData value = row.of(job);
            if (!value.isNullValue()) {
                instance.setProperty(row.property, value);
            }
        }
    }
    return instance;
}

/// The code with which a tool's message begins, "WRTL8038"; empty for one without.
std::string messageId(const std::string& message) {
    std::size_t end = 0;
    bool digit = false;
    for (; end < message.size() && std::isalnum(static_cast<unsigned char>(message[end])); ++end) {
        digit = digit || std::isdigit(static_cast<unsigned char>(message[end]));
    }
    return digit ? message.substr(0, end) : "";
}

CmpiInstance errorOf(const CmpiObjectPath& near, const Status& job) {
    CmpiInstance error(zemBaseProvider::createObjectPath(near, kError));
    error.setProperty("ErrorType", CmpiData(kSoftwareError));
    error.setProperty("OwningEntity", CmpiData("ORX"));
    error.setProperty("MessageID", CmpiData(messageId(job.error).c_str()));
    error.setProperty("Message", CmpiData(job.error.c_str()));
    error.setProperty("CIMStatusCode", CmpiData(kFailed));
    return error;
}

std::string idAt(const CmpiObjectPath& path) {
    return zemBaseProvider::getKeyBinding(path, "InstanceID").getString().charPtr();
}

}  // namespace

JobProvider::JobProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx), zemBaseZemProvider(mb, ctx, name) {}

Status JobProvider::jobAt(const CmpiObjectPath& path, const char* operation) const {
    const std::string id = idAt(path);
    const std::optional<Status> job = JobTable::instance().find(id);
    if (!job) {
        throwObjectNotFoundExc(operation, kJobClass, id.c_str());
    }
    return *job;
}

Status JobProvider::ownJobAt(const CmpiContext& context, const CmpiObjectPath& path,
                             const char* operation) const {
    Status job = jobAt(path, operation);
    const zemString user = getUserContext(context);
    if (job.owner != static_cast<const char*>(user) && !(user == "root")) {
        throwUserAccessDeniedExc(operation, kJobClass, user);
    }
    return job;
}

CmpiInstance JobProvider::performGetInstance(const CmpiContext&, const CmpiObjectPath& path,
                                             const char** properties) {
    return instanceOf(path, properties, jobAt(path, "getInstance"));
}

void JobProvider::performEnumInstances(const CmpiContext&, CmpiResult& result,
                                       const CmpiObjectPath& path, const char** properties) {
    for (const Status& job : JobTable::instance().all()) {
        result.returnData(instanceOf(path, properties, job));
    }
}

void JobProvider::performEnumInstanceNames(const CmpiContext&, CmpiResult& result,
                                           const CmpiObjectPath& path) {
    for (const Status& job : JobTable::instance().all()) {
        result.returnData(jobPath(path, job.id));
    }
}

void JobProvider::performSetInstance(const CmpiContext& context, CmpiResult&,
                                     const CmpiObjectPath& path, const CmpiInstance& instance,
                                     const char** properties) {
    const Status job = ownJobAt(context, path, "setInstance");
    const CmpiInstance present = instanceOf(path, nullptr, job);
    std::optional<bool> wanted;
    for (const auto& [property, value] : askedFor(instance, path, kJobClass, properties)) {
        if (strcasecmp(property.c_str(), kDelete) == 0) {
            wanted = value.getBoolean() != 0;
        } else {
            validateUnmodifiableProperty(present, instance, property.c_str());
        }
    }
    if (wanted) {
        JobTable::instance().setDeleteOnCompletion(job.id, *wanted);
    }
}

void JobProvider::performDeleteInstance(const CmpiContext& context, CmpiResult&,
                                        const CmpiObjectPath& path) {
    const Status job = ownJobAt(context, path, "deleteInstance");
    if (!JobTable::instance().remove(job.id)) {
        throw zemOperationFailedException("JobProvider", "performDeleteInstance",
                                          "A job that runs cannot be deleted.");
    }
}

void JobProvider::performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                                      const CmpiObjectPath& path, const char* method,
                                      const CmpiArgs& in, CmpiArgs& out) {
    if (strcasecmp(method, kGetError) == 0) {
        const Status job = jobAt(path, method);
        if (!job.error.empty()) {
            out.setArg("Error", CmpiData(errorOf(path, job)));
        }
        result.returnData(CmpiData(kSuccess));
        return;
    }
    if (strcasecmp(method, kStateChange) != 0) {
        throwMethodNotFoundExc(method, kJobClass);
    }
    const Status job = ownJobAt(context, path, method);
    const CmpiData asked = getParmVal(in, "RequestedState");
    const CMPIUint16 state = asked.getUint16();
    if (state < Start || state > Service) {
        throwInvalidMethodArgValueExc("RequestedState", cmpidata2String(asked), method);
    }
    if (hasTimeout(in)) {
        result.returnData(CmpiData(kTimeoutNotSupported));
        return;
    }
    const JobTable::State wanted = state == Terminate ? JobTable::Terminated
                                   : state == Kill    ? JobTable::Killed
                                                      : JobTable::Running;
    result.returnData(
        CmpiData(static_cast<CMPIUint32>(JobTable::instance().requestState(job.id, wanted))));
}

CMPIBoolean JobProvider::isValidInstanceClass(const char* className) {
    return compareClassNames(className, kJobClass);
}

CMPIBoolean JobProvider::isValidMethodClass(const char* className) {
    return isValidInstanceClass(className);
}

void JobProvider::populateEssentialKeys(const char*, CmpiArray& keys) {
    setText(keys, 0, "InstanceID");
}

void JobProvider::populateMethodArgs(const char*, zemDynamicArray<zemString>& args,
                                     const char* method) {
    if (strcasecmp(method, kStateChange) == 0) {
        args.addElement(std::make_unique<zemString>("RequestedState"));
        args.addElement(std::make_unique<zemString>("TimeoutPeriod"));
    }
}

ZEM_PROVIDER(ORXC_ConcreteJobProvider, JobProvider)
