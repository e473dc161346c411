package com.orx.kel.mvr.event.jni;

import java.io.IOException;
import java.util.HashMap;
import java.util.Map;

/**
 * Who has subscribed to what, each as often as it did. While anybody has, the journal is followed.
 *
 * <p>An event of one kind is delivered once, however many users want it: the library calls all who
 * have registered.
 */
final class Subscriptions {
    record Kind(int eventType, String objectType) {}

    private record Subscription(String user, Kind kind) {}

    /** What moves are told under, which have listeners of their own. */
    static final Kind MOVES = new Kind(0, "moves");

    private final Map<Subscription, Integer> counts = new HashMap<>();

    /** How many there are now. What happens once this returns is delivered. */
    synchronized int add(String user, Kind kind) throws IOException {
        Journal.instance().require();
        return counts.merge(new Subscription(user, kind), 1, Integer::sum);
    }

    /** How many there are left; -1 if there was none. */
    synchronized int remove(String user, Kind kind, boolean all) {
        Subscription subscription = new Subscription(user, kind);
        Integer count = counts.get(subscription);
        if (count == null) {
            return -1;
        }
        if (all || count == 1) {
            counts.remove(subscription);
        } else {
            counts.put(subscription, count - 1);
        }
        if (counts.isEmpty()) {
            Journal.instance().stop();
        }
        return all ? 0 : count - 1;
    }

    synchronized boolean isWanted(Kind kind) {
        return counts.keySet().stream().anyMatch(one -> one.kind().equals(kind));
    }

    private static final Subscriptions INSTANCE = new Subscriptions();

    static Subscriptions instance() {
        return INSTANCE;
    }
}
