/// Events of the console: who wants to hear of them registers a callback for a type of event and a
/// type of object, and Java calls that on threads of its own.
///
///     struct Renamed : zemEventData { zemString name; };
///
///     class OnRename : public zemWrtEventCallBack {
///         zemEventData* eventOccured(const zemWRTEvent& event) override {
///             auto* data = new Renamed;
///             data->name = event.getRClientObjectProperty(event.getNewRClientObject(),
///                                                         zemWrtConstants::getUSER_DEFINED_NAME());
///             return data;
///         }
///     };
///
///     zemJvmHelperRef java;       // held for as long as events are wanted
///     OnRename callBack;          // outlives its registration
///     callBack.setDeliverFunction(&sendIndication);
///     zemWrtEventManager::getWrtEventManager().registerSubscription(
///         java.getJvmHelper(), user, zemEventSubscription::getEVENT_MODIFY_OBJECT(),
///         zemWrtConstants::getLPAR_CIM_CLASS(), &callBack);
///
/// Thread-safety: of the manager, any thread may call anything, out of a callback too.
/// Subscriptions take turns. Callbacks are called on Java's threads, several at a time, with no
/// lock held.
#ifndef WRT_EVENT_HELPER_H
#define WRT_EVENT_HELPER_H

#include <condition_variable>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <thread>

#include "StringUtils.h"
#include "Synchronizer.h"
#include "WrtEventHelperConstants.h"
#include "WrtEventHelperCounters.h"
#include "WrtEventHelperEvent.h"
#include "ZemExport.h"

/// What a callback makes of an event for its deliver function.
class ZEM_EXPORT zemEventData {
public:
    virtual ~zemEventData();
};

/// Takes the data of one event, which go when it returns. Must not block: it holds up the thread
/// that Java delivers on, and the events behind it there.
using DELIVEREVENT = void (*)(const zemEventData*);

class ZEM_EXPORT zemWrtEventCallBack {
public:
    virtual ~zemWrtEventCallBack();

    /// Translates an event into data, which the caller deletes; null for one that is of no
    /// interest.
    virtual zemEventData* eventOccured(const zemWRTEvent& event) = 0;

    /// Where data go; set before registering.
    void setDeliverFunction(DELIVEREVENT deliver) { m_deliverFunc = deliver; }

    /// Translates and delivers. Returns 0, or -1 when there were no data.
    int operator()(const zemWRTEvent& event);

private:
    DELIVEREVENT m_deliverFunc = nullptr;
};

/// The callbacks of one registration key, each with the number of its registrations. The manager
/// owns and locks it.
class ZEM_EXPORT zemWrtEventHandler {
public:
    zemWrtEventHandler(int eventType, const zemString& objectType);

    /// Writes "<eventType>-<objectType>" into @p dst, cut to @p size - 2 characters: object types
    /// that differ only behind that have one key.
    static void createKey(char* dst, std::size_t size, int eventType, const zemString& objectType);
    static zemString getzemStringKey(int eventType, const zemString& objectType);

    /// Counts @p callBack once more, from 1; returns its count.
    int registerCallBack(zemWrtEventCallBack* callBack);
    /// Counts it once less; it goes at 0. Returns its count, or -1 for an unknown one.
    int unregisterCallBack(zemWrtEventCallBack* callBack);

    const std::map<zemWrtEventCallBack*, int>& getCallBacks() const { return m_WrtEventCallBack; }
    int getEventType() const { return m_eventType; }
    const zemString& getObjectType() const { return m_objectType; }
    const char* getKey() const { return m_key; }

private:
    static constexpr std::size_t kKeySize = 20;

    std::map<zemWrtEventCallBack*, int> m_WrtEventCallBack;
    int m_eventType;
    zemString m_objectType;
    char m_key[kKeySize];
};

class ZEM_EXPORT zemWrtEventManager {
public:
    /// The only manager, which lives to the end of the process.
    static zemWrtEventManager& getWrtEventManager();

    /// Subscribes @p user to the events of a type on Java's side, and then registers @p callBack
    /// for them here. One callback may be registered any number of times; it is called once for an
    /// event.
    /// @param helper    of a zemJvmHelperRef, which is held until the subscription has ended
    /// @param objType   a class of zemWrtConstants; "null" for events of no object
    /// @return how often @p callBack is registered for this now
    /// @throws zemOperationFailedException there is no Java VM, or Java refused; nothing is
    ///         registered then
    int registerSubscription(zemJvmHelper* helper, const zemString& user, int eventType,
                             const zemString& objType, zemWrtEventCallBack* callBack);

    /// The reverse. When the last registration of @p callBack has gone, it is not called any more
    /// once this returns: a call that is under way on another thread is waited for, except by a
    /// thread that is in a callback itself.
    /// @param all  ends all subscriptions of @p user to these events on Java's side
    /// @return how often @p callBack is still registered; -1 when it was not
    /// @throws zemOperationFailedException as registerSubscription(); all stays as it was
    int unregisterSubscription(zemJvmHelper* helper, const zemString& user, int eventType,
                               const zemString& objType, zemWrtEventCallBack* callBack, bool all);

    /// Calls the callbacks that are registered for @p event; each is called, whatever another one
    /// throws.
    /// @return 0; also when nobody is registered
    /// @throws what the first failing callback threw, or what reading the event raised
    int eventOccured(const zemWRTEvent& event);

private:
    class CallUnderWay;
    using Calls = std::multimap<std::thread::id, const zemWrtEventCallBack*>;

    zemWrtEventManager() = default;
    ~zemWrtEventManager() = delete;

    void callJava(zemJvmHelper* helper, const char* method, const zemString& user, int eventType,
                  const zemString& objType);
    int registerEvent(int eventType, const zemString& objType, zemWrtEventCallBack* callBack);
    int unregisterEvent(int eventType, const zemString& objType, zemWrtEventCallBack* callBack);
    static zemString getKey(int eventType, const zemString& objType);
    static void noteSubscription(const char* method, const zemString& user, int eventType,
                                 const zemString& objType, const zemWrtEventCallBack* callBack);
    void awaitCalls(const zemWrtEventCallBack* callBack);

    zemSynchronizerContext m_regMutex;  ///< held across the calls into Java
    std::mutex m_tableMutex;            ///< of what follows; never held while others are called
    std::condition_variable m_callEnded;
    std::map<std::string, std::unique_ptr<zemWrtEventHandler>> m_WrtEventContainer;
    Calls m_calls;  ///< that are under way
};

#endif
