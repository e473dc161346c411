package com.orx.kel.mvr.event.jni;

/** An event of the console, as the library reads it. */
public final class WRTEvent {
    private final int eventType;
    private final String objectType;
    private final Object oldObject;
    private final Object newObject;

    /** Objects are RClientObjects or Hashtables; null where there was or is none. */
    WRTEvent(int eventType, String objectType, Object oldObject, Object newObject) {
        this.eventType = eventType;
        this.objectType = objectType;
        this.oldObject = oldObject;
        this.newObject = newObject;
    }

    public int getEventType() {
        return eventType;
    }

    /** Null for an event of no object. */
    public String getObjectType() {
        return objectType;
    }

    public Object getOldObject() {
        return oldObject;
    }

    public Object getNewObject() {
        return newObject;
    }
}
