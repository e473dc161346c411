#include "Subscriptions.h"

#include <algorithm>
#include <optional>
#include <stdexcept>

#include "CimXmlWriter.h"
#include "ClassRepository.h"
#include "Failure.h"
#include "InteropMof.h"
#include "PathText.h"
#include "Query.h"

namespace cimom {

namespace {

constexpr std::size_t kMostInstances = 3000;
constexpr std::size_t kLongestInstance = 65536;
constexpr std::chrono::seconds kReviveAfter{60};
constexpr std::uint64_t kMicroseconds = 1000000;
constexpr const char* kSystemClass = "CIM_ComputerSystem";
constexpr const char* kRoot = "root";

// Values of SubscriptionState and OnFatalErrorPolicy.
constexpr std::uint16_t kEnabled = 2;
constexpr std::uint16_t kDegraded = 3;
constexpr std::uint16_t kDisabled = 4;
constexpr std::uint64_t kDisable = 3;
constexpr std::uint64_t kRemove = 4;

constexpr unsigned bit(unsigned value) { return 1U << value; }

/// Properties with values of which not all can be had.
constexpr struct Choice {
    const char* className;
    const char* property;
    std::uint16_t preset;
    unsigned possible;  ///< bits
} kChoices[] = {
    {kDestinationClass, "PersistenceType", 2, bit(2) | bit(3)},
    {kDestinationClass, "Protocol", 2, bit(2)},
    {kSubscriptionClass, "OnFatalErrorPolicy", 2, bit(2) | bit(kDisable) | bit(kRemove)},
    {kSubscriptionClass, "SubscriptionState", kEnabled,
     bit(kEnabled) | bit(kDegraded) | bit(kDisabled)},
    {kSubscriptionClass, "RepeatNotificationPolicy", 2, bit(0) | bit(2)},
};

/// What is known here alone, whatever clients send.
const std::vector<std::string> kOwnProperties = {"TimeOfLastStateChange", "SubscriptionStartTime",
                                                 "SubscriptionTimeRemaining"};
/// What decides which indications go out.
constexpr const char* kFlow[] = {"Query", "QueryLanguage", "SourceNamespace", "SourceNamespaces",
                                 "SubscriptionState"};

[[noreturn]] void refuse(const std::string& why) {
    throw Failure(CMPI_RC_ERR_INVALID_PARAMETER, why);
}

/// Null for what is not there.
Value valueOf(const Instance& instance, const char* property) {
    const Value* value = instance.properties.find(property);
    return value ? *value : Value();
}
std::string textOf(const Instance& instance, const char* property) {
    const Value value = valueOf(instance, property);
    return value.isNull() ? "" : plainText(value);
}
std::uint64_t numberOf(const Instance& instance, const char* property) {
    const Value value = valueOf(instance, property);
    return value.isNull() ? 0 : value.uint();
}
bool isOf(const Instance& instance, const char* className) {
    return sameName(instance.path.className, className);
}
bool isEnabled(const Instance& subscription) {
    return numberOf(subscription, "SubscriptionState") != kDisabled;
}

std::vector<std::string> sourceNamespaces(const Instance& filter) {
    std::vector<std::string> names;
    const Value several = valueOf(filter, "SourceNamespaces");
    for (const Value& each : several.isNull() ? Value::Array() : several.elements()) {
        if (!each.isNull() && !containsName(names, each.text())) {
            names.push_back(each.text());
        }
    }
    if (names.empty()) {
        const std::string one = textOf(filter, "SourceNamespace");
        names.push_back(one.empty() ? kInteropNamespace : one);
    }
    return names;
}

/// Seconds until the end of a subscription; nothing for one without an end.
std::optional<std::uint64_t> remaining(const Instance& subscription) {
    const Value duration = valueOf(subscription, "SubscriptionDuration");
    const Value begun = valueOf(subscription, "SubscriptionStartTime");
    if (duration.isNull() || begun.isNull()) {
        return std::nullopt;
    }
    const std::uint64_t now = DateTime::now().binary(), start = begun.dateTime().binary();
    const std::uint64_t gone = now > start ? (now - start) / kMicroseconds : 0;
    return duration.uint() > gone ? duration.uint() - gone : 0;
}

}  // namespace

Subscriptions::Subscriptions(Server& server, const ClassRepository* classes, std::string system,
                             const std::string& state, std::shared_ptr<IndicationExport> exports,
                             Log log)
    : m_server(server),
      m_ownClasses(classes ? nullptr
                           : ClassRepository::load(
                                 "interop.mof", [](const std::string&) { return interopMof(); })),
      m_classes(classes ? classes : m_ownClasses.get()),
      m_knowsClasses(classes != nullptr),
      m_system(std::move(system)),
      m_exports(std::move(exports)),
      m_log(std::move(log)),
      m_file(state) {
    load();
}

void Subscriptions::load() {
    for (const SubscriptionFile::Row& row : m_file.rows()) {
        try {
            Record record;
            record.instance = typed(parseValue(row.instance, CMPI_instance, m_classes).instance());
            record.owner = row.owner;
            check(record.instance);
            const std::string id = idOf(record.instance.path);
            if (isOf(record.instance, kDestinationClass)) {
                m_exports->setDestination(id, textOf(record.instance, "Destination"));
            }
            m_records.emplace(id, std::move(record));
        } catch (const Failure& failure) {
            throw std::runtime_error("the state has an instance that cannot be used, " + row.id +
                                     ": " + failure.what());
        }
    }
}

// -- names ----------------------------------------------------------------------------------------

/// A path as it stands in instances, whichever way a client writes it.
ObjectPath Subscriptions::canonical(const ObjectPath& path) const {
    const CimClass* cls = m_classes->findClass(path.className);
    const bool here = path.nameSpace.empty() || sameName(path.nameSpace, kInteropNamespace);
    if (!cls || !here) {
        return path;
    }
    ObjectPath own(kInteropNamespace, cls->name);
    for (const CimProperty* key : cls->keys) {
        const Value* value = path.keys.find(key->name);
        Value typed;
        if (value && !value->isNull() && value->convertTo(typeOf(*key), typed)) {
            own.keys.set(key->name,
                         typed.type() == CMPI_ref ? Value(canonical(typed.reference())) : typed);
        }
    }
    return own;
}

std::string Subscriptions::idOf(const ObjectPath& path) const { return printPath(canonical(path)); }

std::string Subscriptions::referred(const Instance& subscription, const char* role) const {
    const Value value = valueOf(subscription, role);
    return value.isNull() ? "" : idOf(value.reference());
}

std::vector<std::string> Subscriptions::subscriptionsOn(const std::string& id) const {
    std::vector<std::string> found;
    for (const auto& [own, record] : m_records) {
        if (isOf(record.instance, kSubscriptionClass) &&
            (referred(record.instance, "Filter") == id ||
             referred(record.instance, "Handler") == id)) {
            found.push_back(own);
        }
    }
    return found;
}

/// For the log, where paths are too long to be read.
std::string Subscriptions::labelOf(const Instance& subscription) const {
    const auto name = [&](const char* role) {
        return textOf(m_records.at(referred(subscription, role)).instance, "Name");
    };
    return "subscription of filter '" + name("Filter") + "' for '" + name("Handler") + "'";
}

/// @throws Failure CMPI_RC_ERR_NOT_SUPPORTED for other classes than the three
const CimClass& Subscriptions::madeByClients(const ObjectPath& path) const {
    const CimClass* cls = m_classes->findClass(path.className);
    const auto is = [&](const char* name) { return cls && sameName(cls->name, name); };
    if (!is(kFilterClass) && !is(kDestinationClass) && !is(kSubscriptionClass)) {
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED,
                      "instances of " + path.className + " are not made or changed by clients");
    }
    return *cls;
}

Subscriptions::Records::iterator Subscriptions::changeable(const Request& request,
                                                           const ObjectPath& path) {
    madeByClients(path);
    const auto at = m_records.find(idOf(path));
    if (at == m_records.end()) {
        throw Failure(CMPI_RC_ERR_NOT_FOUND, "no instance " + printPath(path));
    }
    const std::string& owner = at->second.owner;
    const std::string user = request.user.value_or("");
    if (!owner.empty() && !user.empty() && user != owner && user != kRoot) {
        throw Failure(CMPI_RC_ERR_ACCESS_DENIED, "the instance was made by another user");
    }
    return at;
}

// -- what may be ----------------------------------------------------------------------------------

/// An instance of one of the classes, with its properties typed and the references spelt as here.
Instance Subscriptions::typed(const Instance& wanted) const {
    const CimClass& cls = madeByClients(wanted.path);
    Instance made(ObjectPath(kInteropNamespace, cls.name), cls.blank());
    for (const auto& [name, value] : wanted.properties) {
        const CimProperty* declared = cls.properties.find(name);
        if (!declared) {
            throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, "class " + cls.name + " has no " + name);
        }
        Value own;
        if (value.isNull()) {
            continue;
        }
        if (!value.convertTo(typeOf(*declared), own)) {
            throw Failure(CMPI_RC_ERR_TYPE_MISMATCH, name + " is of another type");
        }
        made.properties.set(declared->name,
                            own.type() == CMPI_ref ? Value(canonical(own.reference())) : own);
    }
    const NamedValues ofSystem = {{"SystemCreationClassName", kSystemClass},
                                  {"SystemName", m_system},
                                  {"CreationClassName", cls.name}};
    for (const auto& [name, value] : ofSystem) {
        if (cls.properties.find(name) && valueOf(made, name.c_str()).isNull()) {
            made.properties.set(name, value);
        }
    }
    takeKeys(made, m_classes);
    return made;
}

/// @throws Failure for what cannot be
void Subscriptions::check(Instance& instance) const {
    const CimClass& cls = *m_classes->findClass(instance.path.className);
    for (const CimProperty* key : cls.keys) {
        if (valueOf(instance, key->name.c_str()).isNull() ||
            (key->type == CMPI_string && textOf(instance, key->name.c_str()).empty())) {
            refuse("property " + key->name + " is missing");
        }
    }
    if (cls.properties.find("CreationClassName") &&
        !sameName(textOf(instance, "CreationClassName"), cls.name)) {
        refuse("CreationClassName is not " + cls.name);
    }
    for (const Choice& row : kChoices) {
        if (!isOf(instance, row.className)) {
            continue;
        }
        if (valueOf(instance, row.property).isNull()) {
            instance.properties.set(row.property, Value(row.preset));
        }
        const std::uint64_t value = numberOf(instance, row.property);
        if (value > 31 || (row.possible & bit(static_cast<unsigned>(value))) == 0) {
            refuse(std::string(row.property) + " " + std::to_string(value) + " is not supported");
        }
    }
    if (isOf(instance, kFilterClass)) {
        checkFilter(instance);
    } else if (isOf(instance, kDestinationClass)) {
        IndicationExport::listenerUrl(textOf(instance, "Destination"));
    } else {
        checkSubscription(instance);
    }
    if (printValue(Value(instance)).size() > kLongestInstance) {
        refuse("the instance is too large to be kept");
    }
}

void Subscriptions::checkFilter(const Instance& filter) const {
    for (const char* needed : {"Query", "QueryLanguage"}) {
        if (textOf(filter, needed).empty()) {
            refuse("property " + std::string(needed) + " is missing");
        }
    }
    const auto query = Query::parse(textOf(filter, "Query"), textOf(filter, "QueryLanguage"));
    const CimClass* cls = m_classes->findClass(query->className());
    if (m_knowsClasses && !(cls && cls->isIndication)) {
        throw Failure(CMPI_RC_ERR_INVALID_QUERY,
                      query->className() + " is no class of indications");
    }
}

void Subscriptions::checkSubscription(Instance& subscription) const {
    constexpr std::pair<const char*, const char*> kEnds[] = {{"Filter", kFilterClass},
                                                             {"Handler", kDestinationClass}};
    for (const auto& [role, className] : kEnds) {
        const auto at = m_records.find(referred(subscription, role));
        if (at == m_records.end() || !isOf(at->second.instance, className)) {
            refuse(std::string(role) + " is no instance of " + className + " that there is");
        }
    }
    if (numberOf(subscription, "SubscriptionState") == kDegraded) {
        subscription.properties.set("SubscriptionState", Value(kEnabled));
    }
}

// -- filters at the providers ---------------------------------------------------------------------

Subscriptions::Active Subscriptions::activated(const std::string& id, const Record& subscription,
                                               const Instance& filter) {
    Request request;
    if (!subscription.owner.empty()) {
        request.user = subscription.owner;
    }
    const auto handler = [exports = m_exports, id,
                          to = referred(subscription.instance, "Handler")](const Indication& each) {
        std::string xml;
        writeInstance(xml, each.instance);
        exports->send(to, id, std::move(xml));
    };
    Active active;
    for (const std::string& nameSpace : sourceNamespaces(filter)) {
        request.nameSpace = nameSpace;
        Server::SubscriptionId made = 0;
        const Reply reply = m_server.subscribe(request, textOf(filter, "Query"),
                                               textOf(filter, "QueryLanguage"), handler, made);
        if (!reply.ok()) {
            deactivate(active);
            throw Failure(reply.rc, "the filter cannot be activated in " + nameSpace + ": " +
                                        (reply.message.empty() ? "the provider refuses it; what it "
                                                                 "says is in the log of the server"
                                                               : reply.message));
        }
        active.push_back(made);
    }
    return active;
}

void Subscriptions::deactivate(const Active& active) {
    for (const Server::SubscriptionId each : active) {
        m_server.unsubscribe({}, each);
    }
}

/// Puts what is active now in place of what was, which ends.
void Subscriptions::switchOver(std::map<std::string, Active>& fresh) {
    for (auto& [id, active] : fresh) {
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            Record& record = m_records.at(id);
            record.active.swap(active);
            record.failing = false;
        }
        deactivate(active);
    }
}

// -- changes --------------------------------------------------------------------------------------

void Subscriptions::keep(const std::string& id, const Record& record) {
    m_file.put({id, record.owner, printValue(Value(record.instance))});
}

ObjectPath Subscriptions::create(const Request& request, const Instance& wanted) {
    const std::lock_guard<std::mutex> changes(m_changes);
    Record record;
    record.owner = request.user.value_or("");
    record.instance = typed(wanted);
    Instance& instance = record.instance;
    check(instance);
    const std::string id = idOf(instance.path);
    if (m_records.count(id) != 0) {
        throw Failure(CMPI_RC_ERR_ALREADY_EXISTS, "there is " + id);
    }
    if (m_records.size() >= kMostInstances) {
        throw Failure(CMPI_RC_ERR_FAILED, "there are too many instances of this kind");
    }
    if (isOf(instance, kSubscriptionClass)) {
        const DateTime now = DateTime::now();
        instance.properties.set("SubscriptionStartTime", now);
        instance.properties.set("TimeOfLastStateChange", now);
        if (isEnabled(instance)) {
            record.active =
                activated(id, record, m_records.at(referred(instance, "Filter")).instance);
        }
    }
    try {
        keep(id, record);
    } catch (const Failure&) {
        deactivate(record.active);
        throw;
    }
    if (isOf(instance, kDestinationClass)) {
        m_exports->setDestination(id, textOf(instance, "Destination"));
    }
    const std::lock_guard<std::mutex> lock(m_mutex);
    return m_records.emplace(id, std::move(record)).first->second.instance.path;
}

void Subscriptions::modify(const Request& request, const Instance& wanted,
                           const std::vector<std::string>& properties) {
    const std::lock_guard<std::mutex> changes(m_changes);
    const auto at = changeable(request, wanted.path);
    const Instance& before = at->second.instance;
    Instance given(before.path, wanted.properties);
    const Instance now = typed(given);
    Instance changed = before;
    const CimClass& cls = *m_classes->findClass(before.path.className);
    for (const std::string& name : properties) {
        const CimProperty* declared = cls.properties.find(name);
        if (!declared) {
            throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, "class " + cls.name + " has no " + name);
        }
        if (!declared->isKey && !containsName(kOwnProperties, name)) {
            changed.properties.set(declared->name, valueOf(now, name.c_str()));
        }
    }
    change(at, std::move(changed));
}

/// Filters begin anew where that makes a difference, the new ones before the old ones end.
void Subscriptions::change(Records::iterator at, Instance changed) {
    check(changed);
    const std::string& id = at->first;
    const Instance before = at->second.instance;
    const bool flows = std::any_of(std::begin(kFlow), std::end(kFlow), [&](const char* name) {
        return valueOf(before, name) != valueOf(changed, name);
    });
    const bool ofFilter = isOf(before, kFilterClass);
    const bool ofSubscription = isOf(before, kSubscriptionClass);
    if (flows && ofSubscription) {
        changed.properties.set("TimeOfLastStateChange", DateTime::now());
    }
    Record after = at->second;
    after.instance = changed;
    std::map<std::string, Active> fresh;
    try {
        if (flows && ofSubscription) {
            const Instance& filter = m_records.at(referred(changed, "Filter")).instance;
            fresh[id] = isEnabled(changed) ? activated(id, after, filter) : Active();
        }
        for (const std::string& each :
             flows&& ofFilter ? subscriptionsOn(id) : std::vector<std::string>()) {
            const Record& on = m_records.at(each);
            fresh[each] = isEnabled(on.instance) ? activated(each, on, changed) : Active();
        }
        keep(id, after);
    } catch (const Failure&) {
        for (const auto& each : fresh) {
            deactivate(each.second);
        }
        throw;
    }
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        at->second.instance = std::move(changed);
    }
    switchOver(fresh);
    if (isOf(before, kDestinationClass)) {
        m_exports->setDestination(id, textOf(at->second.instance, "Destination"));
    }
    if (ofSubscription && !isEnabled(at->second.instance)) {
        m_exports->forget(referred(before, "Handler"), id);
    }
}

void Subscriptions::remove(const Request& request, const ObjectPath& path) {
    const std::lock_guard<std::mutex> changes(m_changes);
    const auto at = changeable(request, path);
    const std::vector<std::string> users = subscriptionsOn(at->first);
    if (!users.empty()) {
        throw Failure(CMPI_RC_ERR_FAILED, "it is in use by " + users.front());
    }
    erase(at);
}

void Subscriptions::erase(Records::iterator at) {
    const std::string id = at->first;
    const Instance instance = at->second.instance;
    m_file.erase(id);
    deactivate(at->second.active);
    if (isOf(instance, kSubscriptionClass)) {
        m_exports->forget(referred(instance, "Handler"), id);
    } else if (isOf(instance, kDestinationClass)) {
        m_exports->removeDestination(id);
    }
    const std::lock_guard<std::mutex> lock(m_mutex);
    m_records.erase(at);
}

// -- reading --------------------------------------------------------------------------------------

std::deque<Instance> Subscriptions::instances(const std::string& className) const {
    std::deque<Instance> found;
    const std::lock_guard<std::mutex> lock(m_mutex);
    for (const auto& each : m_records) {
        const Record& record = each.second;
        if (!isOf(record.instance, className.c_str())) {
            continue;
        }
        Instance& shown = found.emplace_back(record.instance);
        if (const auto left = remaining(shown)) {
            shown.properties.set("SubscriptionTimeRemaining", Value(*left));
        }
        if (record.failing) {
            shown.properties.set("SubscriptionState", Value(kDegraded));
        }
    }
    return found;
}

// -- in the course of time ------------------------------------------------------------------------

void Subscriptions::start() {
    const std::lock_guard<std::mutex> changes(m_changes);
    for (auto at = m_records.begin(); at != m_records.end(); ++at) {
        if (isOf(at->second.instance, kSubscriptionClass) && isEnabled(at->second.instance)) {
            revive(at);
        }
    }
}

void Subscriptions::watch() {
    const std::unique_lock<std::mutex> changes(m_changes, std::try_to_lock);
    if (!changes) {
        return;  // the next time will do
    }
    try {
        for (const std::string& id : m_exports->takeFailed()) {
            applyPolicy(id);
        }
        for (auto at = m_records.begin(); at != m_records.end();) {
            tend(at++);
        }
    } catch (const Failure& failure) {
        m_log(failure.what());
    }
}

/// The record may be gone after this.
void Subscriptions::tend(Records::iterator at) {
    const Record& record = at->second;
    if (!isOf(record.instance, kSubscriptionClass)) {
        return;
    }
    if (remaining(record.instance) == 0U) {
        m_log(labelOf(record.instance) + " is removed, its time is over");
        erase(at);
    } else if (record.failing && record.nextAttempt <= std::chrono::steady_clock::now()) {
        revive(at);
    }
}

void Subscriptions::revive(Records::iterator at) {
    Record& record = at->second;
    Active active;
    std::string trouble;
    try {
        const auto& filter = m_records.at(referred(record.instance, "Filter")).instance;
        active = activated(at->first, record, filter);
    } catch (const Failure& failure) {
        trouble = failure.what();
    }
    if (!trouble.empty() && !record.failing) {
        m_log(labelOf(record.instance) + ", tried again: " + trouble);
    }
    const std::lock_guard<std::mutex> lock(m_mutex);
    record.active = std::move(active);
    record.failing = !trouble.empty();
    record.nextAttempt = std::chrono::steady_clock::now() + kReviveAfter;
}

void Subscriptions::applyPolicy(const std::string& id) {
    const auto at = m_records.find(id);
    if (at == m_records.end()) {
        return;
    }
    const std::uint64_t policy = numberOf(at->second.instance, "OnFatalErrorPolicy");
    if (policy == kRemove) {
        m_log(labelOf(at->second.instance) + " is removed, its listener fails");
        erase(at);
    } else if (policy == kDisable && isEnabled(at->second.instance)) {
        m_log(labelOf(at->second.instance) + " is disabled, its listener fails");
        Instance disabled = at->second.instance;
        disabled.properties.set("SubscriptionState", Value(kDisabled));
        change(at, std::move(disabled));
    }
}

void Subscriptions::stop() {
    const std::lock_guard<std::mutex> changes(m_changes);
    for (auto& each : m_records) {
        deactivate(each.second.active);
        each.second.active.clear();
    }
}

}  // namespace cimom
