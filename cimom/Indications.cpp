// Filters and the way of indications from providers to subscribers.

#include <algorithm>

#include "ServerImpl.h"

namespace cimom {

namespace {

/// What a provider answered to a step, NOT_SUPPORTED counting as consent where it may.
void require(const Reply& reply, bool mayRefuse) {
    if (!reply.ok() && !(mayRefuse && reply.rc == CMPI_RC_ERR_NOT_SUPPORTED)) {
        throw Failure(reply.rc, reply.message);
    }
}

}  // namespace

void Server::Impl::filterStep(const Request& request, const Target& target, FilterStep step,
                              const std::shared_ptr<const Query>& query, bool firstOrLast) {
    const auto body = [&](CMPIIndicationMI* mi, const Call& with) {
        const CMPISelectExp* filter = make<CMPISelectExp>(broker, query);
        const char* className = query->className().c_str();
        const CMPIBoolean edge = firstOrLast ? 1 : 0;
        const std::string owner = request.user.value_or("");
        switch (step) {
            case FilterStep::Authorize:
                return mi->ft->authorizeFilter(mi, with.context, filter, className, with.path,
                                               owner.c_str());
            case FilterStep::MustPoll:
                return mi->ft->mustPoll(mi, with.context, filter, className, with.path);
            case FilterStep::Activate:
                return mi->ft->activateFilter(mi, with.context, filter, className, with.path, edge);
            default:
                return mi->ft->deActivateFilter(mi, with.context, filter, className, with.path,
                                                edge);
        }
    };
    const ObjectPath path(request.nameSpace, query->className());
    require(call<CMPIIndicationMI>(request, target, path, body), false);
}

Reply Server::Impl::switchIndications(const Request& request, const Target& target, bool on) {
    return call<CMPIIndicationMI>(request, target, {},
                                  [on](CMPIIndicationMI* mi, const Call& with) {
                                      return on ? mi->ft->enableIndications(mi, with.context)
                                                : mi->ft->disableIndications(mi, with.context);
                                  });
}

// Whether the filter counted is the first (by 1) or the last (by -1) of its kind.
bool Server::Impl::countFilter(const Target& target, int by, bool ofProvider) {
    std::lock_guard<std::mutex> lock(subscriptionMutex);
    int& count = activeFilters[{target.provider, ofProvider ? "" : target.className}];
    const bool first = count == 0;
    count += by;
    return by > 0 ? first : count == 0;
}

void Server::Impl::activate(const Request& request, Subscription& subscription,
                            const Target& target) {
    if (broker.lean()) {
        try {
            filterStep(request, target, FilterStep::MustPoll, subscription.query, false);
        } catch (const Failure&) {  // nobody polls, whatever it answers
        }
    }
    const bool first = countFilter(target, 1, false);
    const bool enable = countFilter(target, 1, true);
    try {
        filterStep(request, target, FilterStep::Activate, subscription.query, first);
    } catch (const Failure&) {
        countFilter(target, -1, false);
        countFilter(target, -1, true);
        throw;
    }
    subscription.targets.push_back(target);
    if (enable) {
        require(switchIndications(request, target, true), true);
    }
}

void Server::Impl::deactivate(const Request& request, const Subscription& subscription) {
    Request inSpace = request;
    inSpace.nameSpace = subscription.nameSpace;
    for (const Target& target : subscription.targets) {
        const bool last = countFilter(target, -1, false);
        const bool disable = countFilter(target, -1, true);
        try {
            filterStep(inSpace, target, FilterStep::Deactivate, subscription.query, last);
        } catch (const Failure&) {  // the filter is gone whatever the provider thinks of it
        }
        if (disable) {
            switchIndications(inSpace, target, false);
        }
    }
}

Reply Server::subscribe(const Request& request, const std::string& query,
                        const std::string& language, IndicationHandler handler,
                        SubscriptionId& id) {
    return answer([&] {
        auto subscription = std::make_shared<Subscription>();
        subscription->nameSpace = request.nameSpace;
        subscription->query = Query::parse(query, language);
        subscription->handler = std::move(handler);
        const ObjectPath path = m_impl->complete(request, {"", subscription->query->className()});
        const std::vector<Target> targets = m_impl->targetsBelow(path, kIndication);
        for (const Target& target : targets) {
            try {
                m_impl->filterStep(request, target, FilterStep::Authorize, subscription->query,
                                   false);
            } catch (const Failure& failure) {
                if (failure.rc() != CMPI_RC_ERR_NOT_SUPPORTED) {
                    throw;
                }
            }
        }
        // Indications may come as soon as the first provider has the filter.
        {
            std::lock_guard<std::mutex> lock(m_impl->subscriptionMutex);
            id = m_impl->nextSubscription++;
            m_impl->subscriptions[id] = subscription;
        }
        try {
            for (const Target& target : targets) {
                m_impl->activate(request, *subscription, target);
            }
        } catch (const Failure&) {
            unsubscribe(request, id);
            throw;
        }
        return Reply();
    });
}

Reply Server::unsubscribe(const Request& request, SubscriptionId id) {
    return answer([&] {
        std::shared_ptr<Subscription> subscription;
        {
            std::lock_guard<std::mutex> lock(m_impl->subscriptionMutex);
            const auto at = m_impl->subscriptions.find(id);
            if (at == m_impl->subscriptions.end()) {
                throw Failure(CMPI_RC_ERR_NOT_FOUND, "no subscription " + std::to_string(id));
            }
            subscription = at->second;
            m_impl->subscriptions.erase(at);
        }
        m_impl->deactivate(request, *subscription);
        std::lock_guard<std::recursive_mutex> lock(subscription->mutex);
        subscription->ended = true;
        return Reply();
    });
}

namespace {

/// An indication with the properties that a query selects.
Indication selected(const Indication& indication, const Query& query) {
    if (query.projection().empty()) {
        return indication;
    }
    Reply one;
    one.instances.push_back(indication.instance);
    Server::Impl::keepProperties(query.projection(), one);
    return {indication.nameSpace, one.instances.front()};
}

}  // namespace

Reply Server::deliver(const Request& request, const Instance& indication) {
    Indication delivered{request.nameSpace, indication};
    if (delivered.instance.path.nameSpace.empty()) {
        delivered.instance.path.nameSpace = request.nameSpace;
    }
    std::vector<std::shared_ptr<Subscription>> open;
    {
        std::lock_guard<std::mutex> lock(m_impl->subscriptionMutex);
        for (const auto& each : m_impl->subscriptions) {
            open.push_back(each.second);
        }
    }
    for (const auto& subscription : open) {
        if (!sameName(subscription->nameSpace, request.nameSpace) ||
            !instanceMatches(m_impl->broker, *subscription->query, indication)) {
            continue;
        }
        std::lock_guard<std::recursive_mutex> lock(subscription->mutex);
        if (!subscription->ended && subscription->handler) {
            subscription->handler(selected(delivered, *subscription->query));
        }
    }
    return {};
}

}  // namespace cimom
