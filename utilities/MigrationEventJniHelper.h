/// How a partition's move to another host goes on: plain functions hear of each step.
///
///     zemMigrationEventJniHelper moves;
///     moves.registerSubscription(user, &showProgress);
///
/// Thread-safety: any thread may call. Listeners are called on Java's threads, one event at a time;
/// they may register and unregister, and must not block.
#ifndef MIGRATION_EVENT_JNI_HELPER_H
#define MIGRATION_EVENT_JNI_HELPER_H

#include <cstdint>

#include "EventJniHelper.h"
#include "StringUtils.h"
#include "ZemExport.h"

/// One step of a move. What the console does not tell is 0 or empty.
struct ZEM_EXPORT zemMigrationEvent {
    int migrationSide = 0;
    zemString destLparName;
    std::uint64_t totalBytes = 0;
    std::uint64_t leftBytes = 0;
    std::uint64_t sentBytes = 0;
    std::uint64_t recvBytes = 0;
    zemString state;  ///< as "Migration In Progress"
    int portNum = 0;
};

using pfnMigrationEventOcurrCallBack = void (*)(const zemMigrationEvent&);

class ZEM_EXPORT zemMigrationEventJniHelper : public zemEventJniHelper {
public:
    zemMigrationEventJniHelper() = default;
    ~zemMigrationEventJniHelper() override;

    /// Subscribes @p user on Java's side and puts @p callback behind the other listeners of the
    /// process; one that is registered twice is called twice.
    /// @return what Java's "register" returns: 0
    /// @throws zemOperationFailedException there is no Java VM, or Java refused; nothing is
    ///         registered then
    int registerSubscription(const zemString& user, pfnMigrationEventOcurrCallBack callback);

    /// Takes one registration of @p callback out and ends the subscription on Java's side. Once it
    /// returns, no call of the listener is under way on another thread.
    /// @return what Java's "deregister" returns: 0; -1 when @p callback was not registered
    /// @throws zemOperationFailedException as registerSubscription(); the listener is out all the
    ///         same
    int unregisterSubscription(const zemString& user, pfnMigrationEventOcurrCallBack callback);

private:
    int callJava(const char* method, const zemString& user);

    jobject m_migrationJniHelper = nullptr;  ///< a global reference, made by the first subscription
};

#endif
