package com.orx.kel.mvr.event.jni;

import java.util.concurrent.ArrayBlockingQueue;
import java.util.concurrent.ExecutorService;
import java.util.concurrent.RejectedExecutionException;
import java.util.concurrent.ThreadPoolExecutor;
import java.util.concurrent.TimeUnit;

/**
 * The threads that call the library. Events of one object are delivered on one thread, in their
 * order; a receiver that takes its time holds up that thread alone, until its queue is full: then
 * the journal, where all the rest is kept, is read no further.
 */
final class Deliveries {
    private static final int THREADS = 4;
    private static final int QUEUED = 10_000;

    private final ExecutorService[] threads = new ExecutorService[THREADS];
    private final ExecutorService moves = thread("appliance-moves");

    Deliveries() {
        for (int i = 0; i < THREADS; ++i) {
            threads[i] = thread("appliance-events-" + i);
        }
    }

    /** @param object what the event tells of, as a key */
    void submit(String object, Runnable delivery) {
        threads[Math.floorMod(object.hashCode(), THREADS)].execute(delivery);
    }

    void submitMove(Runnable delivery) {
        moves.execute(delivery);
    }

    /** Daemons: what waits for delivery does not keep the VM from ending. */
    private static ExecutorService thread(String name) {
        return new ThreadPoolExecutor(1, 1, 0, TimeUnit.SECONDS, new ArrayBlockingQueue<>(QUEUED),
                work -> {
                    Thread thread = new Thread(work, name);
                    thread.setDaemon(true);
                    return thread;
                },
                (work, full) -> {
                    try {
                        full.getQueue().put(work);
                    } catch (InterruptedException interrupted) {
                        throw new RejectedExecutionException(interrupted);
                    }
                });
    }
}
