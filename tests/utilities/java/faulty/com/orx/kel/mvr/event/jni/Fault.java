package com.orx.kel.mvr.event.jni;

/** Lets go wrong what the environment variable FAULT names. */
final class Fault {
    static final String STEP = String.valueOf(System.getenv("FAULT"));

    private Fault() {}

    static int at(String step) {
        if (step.equals(STEP)) {
            throw new IllegalStateException("at " + step);
        }
        return 0;
    }
}
