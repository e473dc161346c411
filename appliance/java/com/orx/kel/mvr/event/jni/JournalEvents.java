package com.orx.kel.mvr.event.jni;

import com.orx.wrt.rep.client.RClientObject;
import java.util.HashMap;
import java.util.Hashtable;
import java.util.List;
import java.util.Map;

/** The events that one line of the journal stands for. */
final class JournalEvents {
    private static final int LOST_CONNECTION = -1;
    private static final int RECONNECT = -2;
    private static final Map<String, Integer> EVENTS = Map.of("add", 1, "delete", 2, "modify", 4);
    private static final int MIGRATION_STATUS = 610;

    private static final String PARTITION = "ORXWRT_Partition";
    private static final String NO_CONNECTION = "No Connection";
    /** Under which events of no object are subscribed to. */
    private static final String NO_OBJECT = "null";

    /** The management library's numbers for words; what is not listed is the number of "*". */
    private static final Map<String, String> HOST_STATES = codes("Standby=0,Operating=1,"
            + "Power Off=3,Initializing=6,Error=12,Error - Dump in progress=13,"
            + "Error - Terminated=14,QCAP Click to Accept=15,Power Off In Progress=32,"
            + "Service Processor Failover In Progress=33,Failed Authentication=241,"
            + "Pending Authentication - Password Updates Required=242,Version Mismatch=250,"
            + "Recovery=251,Incomplete=253,No Connection=254,*=255");
    private static final Map<String, String> LPAR_STATES = codes("Not Activated=0,Starting=1,"
            + "Running=2,Shutting Down=3,Error=4,Open Firmware=8,Suspended=9,Not Available=252,"
            + "*=255");
    private static final Map<String, String> MIGRATION_STATES = codes("Not Migrating=9,"
            + "Migration Starting=10,Migration Stopped=12,Migration In Progress=13,"
            + "Migration Complete=16,Lost Connection=255,*=0");

    /** A property of an event's object, the attribute that it shows, and its numbers for words. */
    private record Property(String name, String attribute, Map<String, String> codes) {
        Property(String name, String attribute) {
            this(name, attribute, null);
        }

        String of(String value) {
            return codes == null ? value : codes.getOrDefault(value, codes.get("*"));
        }
    }

    /** What the journal calls a kind, the class of its objects, their properties. */
    private record Kind(String name, String objectType, List<Property> properties) {}

    private static final List<Kind> KINDS = List.of(
            new Kind("host", "ORXWRT_ComputerSystem", List.of(
                    new Property("UserDefinedName", "name"),
                    new Property("State", "state", HOST_STATES),
                    new Property("OpPanelValue", "refcode"),
                    new Property("IPAddress", "ipaddr"))),
            new Kind("lpar", PARTITION, List.of(
                    new Property("UserDefinedName", "name"),
                    new Property("PartitionState", "state", LPAR_STATES),
                    new Property("OpPanelValue", "refcode"),
                    new Property("OsType", "lpar_env"),
                    new Property("RemoteRestartState", "remote_restart_status"),
                    new Property("MigrationState", "migration_state", MIGRATION_STATES),
                    new Property("PendAllocMem", "pend_mem"),
                    new Property("CurAllocMem", "curr_mem"),
                    new Property("RuntimeMem", "run_mem"),
                    new Property("PendAllocProcs", "pend_procs"),
                    new Property("CurAllocProcs", "curr_procs"),
                    new Property("PendAllocProcUnits", "pend_proc_units"),
                    new Property("CurAllocProcUnits", "curr_proc_units"),
                    new Property("PendUncappedWeight", "pend_uncap_weight"),
                    new Property("CurUncappedWeight", "curr_uncap_weight"),
                    new Property("PendSharingMode", "pend_sharing_mode"),
                    new Property("CurSharingMode", "curr_sharing_mode"),
                    new Property("PendVRMWeight", "pend_mem_weight"),
                    new Property("CurrVRMWeight", "curr_mem_weight"),
                    new Property("RuntimeVRMWeight", "run_mem_weight"),
                    new Property("EntUsage", "auto_io_entitled_mem"),
                    new Property("PendEntMem", "pend_io_entitled_mem"),
                    new Property("CurrEntMem", "curr_io_entitled_mem"),
                    new Property("RuntimeEntMem", "run_io_entitled_mem"))),
            new Kind("profile", "ORXWRT_LparProfile", List.of(
                    new Property("UserDefinedName", "name"))));

    private final Map<String, Object> line;

    JournalEvents(Map<String, Object> line) {
        this.line = line;
    }

    private static Map<String, String> codes(String rows) {
        Map<String, String> codes = new HashMap<>();
        for (String row : rows.split(",")) {
            int equals = row.lastIndexOf('=');
            codes.put(row.substring(0, equals), row.substring(equals + 1));
        }
        return codes;
    }

    @SuppressWarnings("unchecked")
    private static Map<String, Object> map(Object value) {
        return (Map<String, Object>) value;
    }

    void deliver(Deliveries to) {
        for (Object object : (List<?>) line.getOrDefault("objects", List.of())) {
            Map<String, Object> change = map(object);
            for (Kind kind : KINDS) {
                if (kind.name().equals(change.get("kind"))) {
                    deliver(kind, change, to);
                }
            }
        }
        if (line.containsKey("move")) {
            deliverMove(map(line.get("move")), to);
        }
    }

    private static void deliver(Kind kind, Map<String, Object> change, Deliveries to) {
        String host = (String) change.get("host");
        String lpar = change.get("lpar") + "*" + host;
        String thread = kind.name().equals("host") ? host : lpar;
        String name = kind.name().equals("profile") ? change.get("number") + "*" + lpar : thread;
        RClientObject before = object(kind, name, lpar, map(change.get("old")));
        RClientObject after = object(kind, name, lpar, map(change.get("new")));
        submit(EVENTS.get((String) change.get("event")), kind.objectType(), before, after, thread,
                to);
        if (kind.name().equals("host") && before != null && after != null) {
            String was = (String) map(change.get("old")).get("state");
            String is = (String) map(change.get("new")).get("state");
            if (NO_CONNECTION.equals(was) || NO_CONNECTION.equals(is)) {
                submit(NO_CONNECTION.equals(is) ? LOST_CONNECTION : RECONNECT, null, before, after,
                        thread, to);
            }
        }
    }

    /** Null when there is none. */
    private static RClientObject object(Kind kind, String name, String lpar,
            Map<String, Object> attributes) {
        if (attributes == null) {
            return null;
        }
        Map<String, String> properties = new HashMap<>();
        properties.put("Name", name);
        if (kind.name().equals("profile")) {
            properties.put("PartitionName", lpar);
        }
        for (Property property : kind.properties()) {
            Object value = attributes.get(property.attribute());
            if (value != null) {
                properties.put(property.name(), property.of((String) value));
            }
        }
        return new RClientObject(properties);
    }

    private static void deliverMove(Map<String, Object> move, Deliveries to) {
        String lpar = move.get("source_lpar_id") + "*" + move.get("source");
        Hashtable<String, Object> table = new Hashtable<>();
        table.put("Name", lpar);
        table.put("UserDefinedName", move.get("lpar_name"));
        table.put("ComputerSystemName", move.get("dest"));
        table.put("MIGRATION_SIDE", 0);
        table.put("DESP_LPAR_NAME", move.get("lpar_name"));
        table.put("TOTAL_BYTES", bytes(move, "total"));
        table.put("BYTES_LEFT", bytes(move, "remaining"));
        table.put("BYTES_SENT", bytes(move, "transmitted"));
        table.put("BYTES_RECEIVED", bytes(move, "transmitted"));
        table.put("CURRENT_MIGRATION_STATE", move.get("state"));
        if (Subscriptions.instance().isWanted(Subscriptions.MOVES)) {
            to.submitMove(() -> new MigrationEventJniHelper().consumeMigrationEvent(table));
        }
        submit(MIGRATION_STATUS, PARTITION, null, table, lpar, to);
    }

    private static Long bytes(Map<String, Object> move, String which) {
        return Long.valueOf((String) move.get("bytes_" + which));
    }

    private static void submit(int type, String objectType, Object before, Object after,
            String thread, Deliveries to) {
        String subscribed = objectType == null ? NO_OBJECT : objectType;
        if (Subscriptions.instance().isWanted(new Subscriptions.Kind(type, subscribed))) {
            to.submit(thread, () -> WRTEventHelper.getWRTEventHelper()
                    .consumeWRTEvent(new WRTEvent(type, objectType, before, after)));
        }
    }
}
