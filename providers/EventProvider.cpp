#include "EventProvider.h"

#include <algorithm>
#include <condition_variable>
#include <deque>
#include <string>
#include <thread>
#include <vector>

#include "EventValues.h"
#include "Log.h"
#include "ProviderFactories.h"

/// A class of indications, the events that it shows and of those what.
struct EventClass {
    const char* provider;
    const char* name;
    std::vector<const char*> parents;
    int eventType;
    EventAspect aspect;
};

namespace {

/// More events do not wait for those who take them.
constexpr std::size_t kMostWaiting = 20'000;

using Types = zemEventSubscription;

const std::vector<EventClass> kClasses = {
    {"ORXC_PartitionCreationProvider",
     "ORXC_PartitionCreation",
     {"CIM_InstCreation", "CIM_InstIndication", "CIM_Indication"},
     Types::getEVENT_ADD_OBJECT(),
     EventAspect::Existence},
    {"ORXC_PartitionDeletionProvider",
     "ORXC_PartitionDeletion",
     {"CIM_InstDeletion", "CIM_InstIndication", "CIM_Indication"},
     Types::getEVENT_DELETE_OBJECT(),
     EventAspect::Existence},
    {"ORXC_PartitionStateChangeProvider",
     "ORXC_PartitionStateChange",
     {"ORXC_PartitionChange", "CIM_InstModification", "CIM_InstIndication", "CIM_Indication"},
     Types::getEVENT_MODIFY_OBJECT(),
     EventAspect::State},
    {"ORXC_PartitionResourceChangeProvider",
     "ORXC_PartitionResourceChange",
     {"ORXC_PartitionChange", "CIM_InstModification", "CIM_InstIndication", "CIM_Indication"},
     Types::getEVENT_MODIFY_OBJECT(),
     EventAspect::Resources},
    {"ORXC_PartitionMoveProvider",
     "ORXC_PartitionMove",
     {"CIM_ProcessIndication", "CIM_Indication"},
     Types::getEVENT_BKN_MIG_STATUS(),
     EventAspect::Move},
};

/// The class of a provider that is among the rows: the library has no other ones of this kind.
const EventClass& classOf(const std::string& provider) {
    return *std::find_if(kClasses.begin(), kClasses.end(),
                         [&](const EventClass& row) { return provider == row.provider; });
}

/// Events between the threads that Java delivers them on and the one that sends them.
class EventQueue {
public:
    using Event = std::shared_ptr<const PartitionEvent>;

    /// Never waits for room: an event for which there is none is lost.
    void push(Event event) {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_events.size() == kMostWaiting) {
            ++m_lost;
            return;
        }
        m_events.push_back(std::move(event));
        m_changed.notify_one();
    }

    /// The next event, as soon as there is one; null when the queue has been closed.
    /// @param lost  counts up what was lost since the last call
    Event pop(std::size_t& lost) {
        std::unique_lock<std::mutex> lock(m_mutex);
        m_changed.wait(lock, [this] { return m_isClosed || !m_events.empty(); });
        lost += std::exchange(m_lost, 0);
        if (m_isClosed) {
            return nullptr;
        }
        Event event = std::move(m_events.front());
        m_events.pop_front();
        return event;
    }

    void close() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_isClosed = true;
        m_changed.notify_one();
    }

private:
    std::mutex m_mutex;
    std::condition_variable m_changed;
    std::deque<Event> m_events;
    std::size_t m_lost = 0;
    bool m_isClosed = false;
};

/// An event on its way into a queue.
struct QueuedEvent : zemEventData {
    EventQueue* queue = nullptr;
    EventQueue::Event event;

    static void deliver(const zemEventData* data) {
        const auto* const queued = static_cast<const QueuedEvent*>(data);
        queued->queue->push(queued->event);
    }
};

/// What the thread that sends indications needs. It lives as long as the thread, for a client may
/// end its subscription from within the delivery of an indication.
struct EventSender {
    CmpiBroker broker;
    const EventClass& eventClass;
    std::string nameSpace;
    EventQueue queue;

    void log(const std::string& text) {
        zemBaseProvider::logMessage(broker.getEnc(), eventClass.provider, LOG_SEVERE, "",
                                    text.c_str());
    }

    void send(const CmpiContext& context, const PartitionEvent& event) {
        try {
            const CmpiObjectPath nearby(nameSpace.c_str(), eventClass.name);
            broker.deliverIndication(
                context, nameSpace.c_str(),
                makeIndication(nearby, eventClass.name, eventClass.aspect, event));
        } catch (const CmpiStatus& status) {
            tellLost(event, status.msg() == nullptr ? zemBaseProvider::cmpiRcToString(status.rc())
                                                    : status.msg());
        } catch (const zemException& e) {
            tellLost(event, e.getExceptionString());
        }
    }

    void tellLost(const PartitionEvent& event, const char* why) {
        log("an indication of " + event.partition +
            " was not delivered: " + (why == nullptr ? "" : why));
    }

    /// The server frees what was made on a thread when that is detached, so each indication has an
    /// attachment of its own; the context of the next one must be made while the thread has one.
    void run(CmpiContext context) {
        try {
            broker.attachThread(context);
            std::size_t lost = 0;
            while (const EventQueue::Event event = queue.pop(lost)) {
                if (lost != 0) {
                    log(std::to_string(std::exchange(lost, 0)) +
                        " events were lost: those before "
                        "them are delivered too slowly");
                }
                send(context, *event);
                const CmpiContext next = broker.prepareAttachThread(context);
                broker.detachThread(context);
                broker.attachThread(next);
                context = next;
            }
            broker.detachThread(context);
        } catch (const CmpiStatus& status) {
            log("no indications any more: the server has no threads, " +
                std::to_string(status.rc()));
        }
    }
};

}  // namespace

/// From the first filter of a class to the last: what hears of events, and the thread that sends
/// them.
class EventSubscription : public zemWrtEventCallBack {
public:
    /// @param context  of the operation that activates the filter
    EventSubscription(const CmpiBroker& broker, const EventClass& eventClass,
                      const CmpiContext& context, const char* nameSpace)
        : user(zemBaseProvider::getUserContext(context)),
          m_sender(new EventSender{broker, eventClass, nameSpace, {}}),
          m_thread([sender = m_sender, own = m_sender->broker.prepareAttachThread(context)] {
              sender->run(own);
          }) {
        setDeliverFunction(&QueuedEvent::deliver);
    }

    /// Waits for the delivery that is under way, unless it is the one that ends this.
    ~EventSubscription() override {
        m_sender->queue.close();
        if (m_thread.get_id() == std::this_thread::get_id()) {
            m_thread.detach();
        } else {
            m_thread.join();
        }
    }

    zemEventData* eventOccured(const zemWRTEvent& event) override {
        EventQueue::Event read = readEvent(event, m_sender->eventClass.aspect);
        if (!read) {
            return nullptr;
        }
        auto data = std::make_unique<QueuedEvent>();
        data->queue = &m_sender->queue;
        data->event = std::move(read);
        return data.release();
    }

    const zemString user;

private:
    const std::shared_ptr<EventSender> m_sender;
    std::thread m_thread;
};

EventProvider::EventProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
    : CmpiBaseMI(mb, ctx), zemBaseZemProvider(mb, ctx, name), m_class(classOf(name)) {}

EventProvider::~EventProvider() {
    if (m_subscription && !unsubscribe()) {
        m_subscription.release();  // NOLINT: Java goes on calling it
    }
}

void EventProvider::performActivateFilter(const CmpiContext& context, const CMPISelectExp*,
                                          const char*, const CmpiObjectPath& path, CMPIBoolean) {
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (!m_subscription) {
        subscribe(context, path);
    }
    ++m_filters;
}

void EventProvider::performDeActivateFilter(const CmpiContext&, const CMPISelectExp*, const char*,
                                            const CmpiObjectPath&, CMPIBoolean) {
    std::unique_ptr<EventSubscription> ended;  // its thread may wait for the lock: it goes after it
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (m_filters != 0 && --m_filters == 0 && unsubscribe()) {
        ended = std::move(m_subscription);
    }
}

CMPIBoolean EventProvider::isValidIndicationClass(const char* className) {
    return compareClassNames(className, m_class.name) ||
           std::any_of(m_class.parents.begin(), m_class.parents.end(), [&](const char* parent) {
               return compareClassNames(className, parent) != 0;
           });
}

void EventProvider::subscribe(const CmpiContext& context, const CmpiObjectPath& path) {
    const CmpiString nameSpace = path.getNameSpace();
    auto subscription = std::make_unique<EventSubscription>(CmpiBroker(rawBroker()), m_class,
                                                            context, nameSpace.charPtr());
    try {
        zemWrtEventManager::getWrtEventManager().registerSubscription(
            m_java.getJvmHelper(), subscription->user, m_class.eventType,
            zemWrtConstants::getLPAR_CIM_CLASS(), subscription.get());
    } catch (const zemException& e) {
        logMessage(LOG_SEVERE, m_class.name, e.getExceptionString());
        throw;
    }
    m_subscription = std::move(subscription);
}

/// Where Java refuses, the subscription stays, and serves the next filter.
bool EventProvider::unsubscribe() {
    try {
        zemWrtEventManager::getWrtEventManager().unregisterSubscription(
            m_java.getJvmHelper(), m_subscription->user, m_class.eventType,
            zemWrtConstants::getLPAR_CIM_CLASS(), m_subscription.get(), false);
        return true;
    } catch (const zemException& e) {
        logMessage(LOG_SEVERE, m_class.name, e.getExceptionString());
        return false;
    }
}

ZEM_PROVIDER(ORXC_PartitionCreationProvider, EventProvider)
ZEM_PROVIDER(ORXC_PartitionDeletionProvider, EventProvider)
ZEM_PROVIDER(ORXC_PartitionStateChangeProvider, EventProvider)
ZEM_PROVIDER(ORXC_PartitionResourceChangeProvider, EventProvider)
ZEM_PROVIDER(ORXC_PartitionMoveProvider, EventProvider)
