/// What happens to partitions, as indications: they come and go, their state or their resources
/// change, they move to another host.
///
/// The classes differ by one row of a table each. With the first filter of a class the provider
/// subscribes to the console's events of the row's type, and with the last one it ends that. It
/// hands what it hears to a thread of its own, which the CIM server knows, and which delivers: so
/// whoever takes his time with one class holds up neither the console nor another class.
///
/// Indication operations have no messages: why a filter cannot be activated is a line of the
/// server's log.
///
/// Thread-safety: any number of operations at once.
#ifndef EVENT_PROVIDER_H
#define EVENT_PROVIDER_H

#include <memory>
#include <mutex>

#include "BaseZemProvider.h"
#include "JvmHelper.h"

struct EventClass;
class EventSubscription;

class EventProvider : public zemBaseZemProvider {
public:
    EventProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);
    ~EventProvider() override;

protected:
    // the frame's hooks
    void performActivateFilter(const CmpiContext& context, const CMPISelectExp* filter,
                               const char* className, const CmpiObjectPath& path,
                               CMPIBoolean firstActivation) override;
    void performDeActivateFilter(const CmpiContext& context, const CMPISelectExp* filter,
                                 const char* className, const CmpiObjectPath& path,
                                 CMPIBoolean lastActivation) override;
    CMPIBoolean isValidIndicationClass(const char* className) override;

private:
    void subscribe(const CmpiContext& context, const CmpiObjectPath& path);
    bool unsubscribe();

    const EventClass& m_class;
    zemJvmHelperRef m_java;  ///< kept, for no process starts a second VM
    std::mutex m_mutex;      ///< of what follows
    int m_filters = 0;       ///< that are active; servers differ in which ones they call the first
    std::unique_ptr<EventSubscription> m_subscription;
};

#endif
