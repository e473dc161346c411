package com.orx.wrt.api;

import java.io.IOException;
import java.nio.charset.StandardCharsets;

/** What the library asks the console for besides events. */
public final class DnxPegasusApi {
    private DnxPegasusApi() {}

    /**
     * The last reference code of a partition.
     *
     * @param mtms the key of its host
     * @param lparId its number
     * @throws IOException what the tool says that was asked
     */
    public static String getLparRefCode(String mtms, String lparId) throws IOException {
        Process tool = new ProcessBuilder("qyfault", "-r", "lpar", "-m", mtms,
                "--filter", "lpar_ids=" + lparId, "-F", "refcode")
                .redirectErrorStream(true).start();
        tool.getOutputStream().close();
        String answer = new String(tool.getInputStream().readAllBytes(), StandardCharsets.UTF_8);
        try {
            if (tool.waitFor() != 0) {
                throw new IOException(answer.strip());
            }
        } catch (InterruptedException interrupted) {
            throw new IOException(interrupted);
        }
        return answer.strip();
    }
}
