package com.orx.kel.mvr.event.jni;

import java.io.IOException;

/** How moves of partitions go on, for the library. */
public final class MigrationEventJniHelper {
    static {
        NativeLibrary.load();
    }

    /**
     * Subscribes a user to the steps of all moves.
     *
     * @return 0
     * @throws IOException the appliance's journal cannot be followed
     */
    public int register(String user) throws IOException {
        Subscriptions.instance().add(user, Subscriptions.MOVES);
        return 0;
    }

    /** Ends a subscription: 0, or -1 if there was none. */
    public int deregister(String user) {
        return Math.min(Subscriptions.instance().remove(user, Subscriptions.MOVES, false), 0);
    }

    /** Hands a step to the library, a Hashtable, on any thread: 0, or -1 for what it does not take. */
    native int consumeMigrationEvent(Object table);
}
