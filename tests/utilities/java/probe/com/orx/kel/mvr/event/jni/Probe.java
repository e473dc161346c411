package com.orx.kel.mvr.event.jni;

import java.lang.management.ManagementFactory;
import java.util.Hashtable;

/** What a test does on Java's side. */
public final class Probe {
    private Probe() {}

    /** What a Java program sees of the options of its VM. */
    public static String options() {
        return String.join(" ", ManagementFactory.getRuntimeMXBean().getInputArguments()) + " "
                + System.getProperty("java.class.path");
    }

    public static int send(int type, String objectType) {
        return sendObject(new WRTEvent(type, objectType, null, null));
    }

    public static int sendObject(Object event) {
        return WRTEventHelper.getWRTEventHelper().consumeWRTEvent(event);
    }

    public static int move(Object table) {
        return new MigrationEventJniHelper().consumeMigrationEvent(table);
    }

    public static Object table() {
        return new Hashtable<>(java.util.Map.of("MIGRATION_SIDE", -1, "DESP_LPAR_NAME", "B\u00fcro",
                "TOTAL_BYTES", 1L << 40, "BYTES_SENT", 7, "CURRENT_MIGRATION_STATE", "on",
                "BYTES_LEFT", "no number"));
    }
}
