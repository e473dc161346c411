package com.orx.kel.mvr.event.jni;

/** Stands in front of the real one. */
public final class MigrationEventJniHelper {
    public MigrationEventJniHelper() {
        Fault.at("new");
    }

    public int register(String user) {
        return Fault.at("register");
    }

    public int deregister(String user) {
        return Fault.at("deregister");
    }
}
