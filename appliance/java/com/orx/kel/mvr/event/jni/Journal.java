package com.orx.kel.mvr.event.jni;

import java.io.BufferedReader;
import java.io.File;
import java.io.IOException;
import java.nio.charset.StandardCharsets;
import java.util.ArrayList;
import java.util.List;
import java.util.Map;
import java.util.concurrent.TimeUnit;

/**
 * Follows the appliance's journal while somebody has subscribed, and has its events delivered. It is
 * read through the appliance's own program, which ends when nobody reads what it prints.
 */
final class Journal {
    private static final long RETRY_MILLISECONDS = 1000;

    /** One run of that program. */
    private static final class Follower {
        private final Process program;
        private final BufferedReader output;
        private volatile long last;
        private volatile boolean isStopped;

        /**
         * Returns when it follows: what is changed from then on will be read.
         *
         * @param after the change behind which to begin; null for now
         */
        Follower(Long after) throws IOException {
            List<String> line =
                    new ArrayList<>(List.of("appliance", "journal", "--json", "--follow"));
            if (after != null) {
                line.addAll(List.of("--after", after.toString()));
            }
            program = new ProcessBuilder(line).redirectErrorStream(true)
                    .redirectInput(new File("/dev/null")).start();
            output = program.inputReader(StandardCharsets.UTF_8);
            String first = output.readLine();
            if (first == null || !first.startsWith("{")) {
                program.destroy();
                throw new IOException(first == null ? "appliance journal ended" : first);
            }
            last = numberOf(Json.object(first));
        }

        void stop() {
            isStopped = true;
            program.destroy();
        }
    }

    private final Deliveries deliveries = new Deliveries();
    private Follower follower;

    private Journal() {
        Runtime.getRuntime().addShutdownHook(new Thread(this::end, "appliance-end"));
    }

    private static long numberOf(Map<String, Object> line) {
        return Long.parseLong((String) line.get("number"));
    }

    /** @throws IOException what the program said instead of following */
    synchronized void require() throws IOException {
        if (follower == null) {
            Follower first = new Follower(null);
            follower = first;
            Thread reader = new Thread(() -> follow(first), "appliance-journal");
            reader.setDaemon(true);
            reader.start();
        }
    }

    synchronized void stop() {
        if (follower != null) {
            follower.stop();
            follower = null;
        }
    }

    /** No program and no zombie stays in the process when the VM ends. */
    private void end() {
        Follower ended;
        synchronized (this) {
            ended = follower;
            stop();
        }
        try {
            if (ended != null) {
                ended.program.waitFor(1, TimeUnit.SECONDS);
            }
        } catch (InterruptedException interrupted) {
            Thread.currentThread().interrupt();
        }
    }

    private void follow(Follower first) {
        Follower now = first;
        while (now != null && !now.isStopped) {
            try {
                for (String line = now.output.readLine(); line != null;
                        line = now.output.readLine()) {
                    deliver(now, line);
                }
            } catch (IOException ended) {
                // As its end.
            }
            now = next(now);
        }
    }

    private void deliver(Follower from, String text) {
        if (from.isStopped) {
            return;
        }
        try {
            var line = Json.object(text);
            from.last = numberOf(line);
            new JournalEvents(line).deliver(deliveries);
        } catch (IllegalArgumentException | NullPointerException | ClassCastException unreadable) {
            System.err.println("appliance journal: " + unreadable.getMessage());
        }
    }

    /** What goes on where @p ended was, whose program has gone; null when nobody wants it. */
    private Follower next(Follower ended) {
        while (!ended.isStopped) {
            try {
                Thread.sleep(RETRY_MILLISECONDS);
                synchronized (this) {
                    if (!ended.isStopped) {
                        follower = new Follower(ended.last);
                    }
                    return follower;
                }
            } catch (IOException unusable) {
                // Until it can be read again.
            } catch (InterruptedException interrupted) {
                return null;
            }
        }
        return null;
    }

    private static final Journal INSTANCE = new Journal();

    static Journal instance() {
        return INSTANCE;
    }
}
