package com.orx.kel.mvr.event.jni;

import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.stream.Stream;

/** The library that called Java, in which the native functions are. */
final class NativeLibrary {
    private static final String NAME = "zemutilities";

    private NativeLibrary() {}

    /**
     * Loads the copy that this process has already: events that went to another one would reach
     * nobody. Paths in the
     * map of the process begin with the first slash of a line.
     */
    static void load() {
        String file = "/" + System.mapLibraryName(NAME);
        try (Stream<String> map = Files.lines(Path.of("/proc/self/maps"))) {
            var loaded = map.filter(line -> line.contains(file))
                    .map(line -> line.substring(line.indexOf('/'))).findFirst();
            if (loaded.isPresent()) {
                System.load(loaded.get());
                return;
            }
        } catch (IOException unreadable) {
            // Then as Java finds it.
        }
        System.loadLibrary(NAME);
    }
}
