package com.orx.wrt.rep.client;

import java.util.Map;

/** An object of the console as an event tells of it: texts by the names of its properties. */
public final class RClientObject {
    private final Map<String, String> properties;

    public RClientObject(Map<String, String> properties) {
        this.properties = Map.copyOf(properties);
    }

    /** Null for a property that it does not have. */
    public Object getProperty(String name) {
        return properties.get(name);
    }
}
