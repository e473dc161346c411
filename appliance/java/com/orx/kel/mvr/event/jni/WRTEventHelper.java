package com.orx.kel.mvr.event.jni;

import java.io.IOException;

/** The console's events, for the library: it subscribes here, and is called with each event. */
public final class WRTEventHelper {
    private static final WRTEventHelper INSTANCE = new WRTEventHelper();

    static {
        NativeLibrary.load();
    }

    private WRTEventHelper() {}

    public static WRTEventHelper getWRTEventHelper() {
        return INSTANCE;
    }

    /**
     * Subscribes a user to events of a type that tell of objects of a type.
     *
     * @return how often the user has now
     * @throws IOException the appliance's journal cannot be followed
     */
    public int register(String user, int eventType, String objectType) throws IOException {
        return Subscriptions.instance().add(user, new Subscriptions.Kind(eventType, objectType));
    }

    /** Ends one of these subscriptions: how many there are left, -1 if there was none. */
    public int deregister(String user, int eventType, String objectType) {
        return Subscriptions.instance()
                .remove(user, new Subscriptions.Kind(eventType, objectType), false);
    }

    /** Ends all of these subscriptions: 0, or -1 if there was none. */
    public int deregisterALL(String user, int eventType, String objectType) {
        return Subscriptions.instance()
                .remove(user, new Subscriptions.Kind(eventType, objectType), true);
    }

    /** Hands an event to the library, on any thread: 0, or -1 for what it does not take. */
    native int consumeWRTEvent(Object event);
}
