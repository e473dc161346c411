// Changes by several processes at once, changes that are killed, and changes for which the disk has
// no space. ZEM_CHANGES is the number of rounds, for a long run.

#include <gtest/gtest.h>

#include <chrono>
#include <map>
#include <random>

#include "ToolRecords.h"

namespace {

using testing_support::lines;
using testing_support::Outcome;

int rounds(int usual) {
    const char* wanted = std::getenv("ZEM_CHANGES");
    return wanted == nullptr ? usual : std::atoi(wanted);
}

class ChangesTogetherTest : public DemoTest {
protected:
    std::int64_t lineCount(const std::string& command) {
        return static_cast<std::int64_t>(lines(out(command)).size());
    }
    std::int64_t journalLines() { return lineCount("appliance journal --json"); }
};

TEST_F(ChangesTogetherTest, WhatSucceedsAddsUp) {
    // Each process gives and takes the same memory, and makes and deletes partitions of its own;
    // what succeeds it writes down.
    m_appliance.replaceTool("changes", R"(
        for i in $(seq $2); do
            edalloc -r mem -m alpha -o a --id 4 -q 256 && echo a
            nwplat -r lpar -m alpha -i "\"name=p$1\",\"lpar_env=tmxlinux\",\"all_resources=1\"" && echo n
            [ $((($1 + i) % 3)) = 0 ] || { edalloc -r mem -m alpha -o r --id 4 -q 256 && echo r; }
            id=$(qyplat -r lpar -m alpha --filter lpar_names=p$1 -F lpar_id)
            [ $((($1 + i) % 5)) = 0 ] || { dlplat -r lpar -m alpha --id $id && echo d; }
        done)");
    const std::string count = std::to_string(rounds(10));
    const Outcome outcome = m_appliance.run("for p in 1 2 3 4 5 6 7 8; do changes $p " + count +
                                            " 2>$APPLIANCE_HOME/err.$p & done; wait");
    std::map<char, std::int64_t> done;
    for (char c : outcome.out) {
        ++done[c];
    }
    EXPECT_LT(0, done['a']);
    EXPECT_LT(0, done['d']);
    EXPECT_EQ(std::to_string(16384 + 256 * (done['a'] - done['r'])) + '\n',
              out("qyalloc -r mem --level lpar -m alpha --filter lpar_ids=4 -F curr_mem"));
    EXPECT_EQ(7 + done['n'] - done['d'], lineCount("qyplat -r lpar -m alpha"));
    EXPECT_EQ(done['\n'], journalLines());
    EXPECT_EQ(std::to_string(done['\n']) + '\n',
              out("appliance journal --json | tail -1 | tr , : | cut -d: -f2"));
    EXPECT_EQ("", out("appliance check"));
    // Nothing was refused but for want of memory, of a free name, or of the partition to delete.
    EXPECT_EQ("", m_appliance.run("cat $APPLIANCE_HOME/err.* | grep -v 'WRTL8036\\|WRTL8032'").out);
}

const std::string kMake = "nwplat -r lpar -m gamma -i name=k,lpar_env=tmxlinux,all_resources=1";

TEST_F(ChangesTogetherTest, AKilledToolChangesAllOrNothing) {
    const std::string without = shown();
    const auto start = std::chrono::steady_clock::now();
    out(kMake);
    const std::chrono::duration<double> usual = std::chrono::steady_clock::now() - start;
    const std::string with = shown();
    ASSERT_NE(without, with);

    std::mt19937 engine(1);  // NOLINT(cert-msc51-cpp): the same moments in every run
    std::string before = with;
    std::int64_t changes = 1;
    for (int i = rounds(40); i > 0; --i) {
        const double moment = usual.count() * 1.5 * std::generate_canonical<double, 32>(engine);
        run("timeout --foreground -s KILL " + std::to_string(moment) + ' ' +
            (before == with ? "dlplat -r lpar -m gamma --id 3" : kMake));
        ASSERT_EQ("", out("appliance check"));
        const std::string after = shown();
        ASSERT_TRUE(after == with || after == without) << after;
        changes += after == before ? 0 : 1;
        before = after;
    }
    EXPECT_EQ(changes, journalLines());
    RecordProperty("changes", std::to_string(changes));
    EXPECT_EQ("", out("edplat -r sys -m gamma -i power_off_policy=1"));
}

TEST_F(ChangesTogetherTest, AFullDiskIsAFailureAndNoChange) {
    const std::string before = shown();
    // The limits, in half kilobytes, are met at the first, second and third page of a change.
    for (const char* limit : {"1", "9", "17"}) {
        const Outcome outcome =
            m_appliance.run(std::string("trap '' XFSZ; ulimit -f ") + limit + "; " + kMake);
        EXPECT_EQ(3, outcome.exit) << limit << outcome.out;
        EXPECT_EQ(0U, outcome.err.find("WRTL2005 ")) << outcome.err;
        EXPECT_EQ(before, shown());
    }
    EXPECT_NE(0, m_appliance.run("ulimit -f 9; " + kMake).exit);
    EXPECT_EQ(before, shown());
    EXPECT_EQ(0, journalLines());
    EXPECT_EQ("", out(kMake));
    EXPECT_EQ(1, journalLines());
    EXPECT_EQ("", out("appliance check"));
}

}  // namespace
