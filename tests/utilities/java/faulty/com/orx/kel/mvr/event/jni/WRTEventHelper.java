package com.orx.kel.mvr.event.jni;

/** Stands in front of the real one. */
public final class WRTEventHelper {
    static {
        Fault.at("class");
    }

    public static WRTEventHelper getWRTEventHelper() {
        Fault.at("get");
        return Fault.STEP.equals("null") ? null : new WRTEventHelper();
    }

    public int register(String user, int eventType, String objectType) {
        return Fault.at("register");
    }

    public int deregister(String user, int eventType, String objectType) {
        return Fault.at("deregister");
    }

    public int deregisterALL(String user, int eventType, String objectType) {
        return Fault.at("deregisterALL");
    }
}
