#include <fcntl.h>
#include <gtest/gtest.h>
#include <linux/capability.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sys/prctl.h>
#include <sys/ptrace.h>
#include <sys/syscall.h>

#include <chrono>
#include <csignal>
#include <cstring>
#include <ctime>
#include <tuple>

#include "CommandLine.h"
#include "FailingAllocation.h"
#include "OnThreads.h"
#include "PollPlan.h"
#include "PropertiesHelper.h"
#include "ToolFolder.h"

using namespace std::chrono_literals;
using Helper = zemPropertiesHelper;

namespace {

const std::string kThrower = "zemPropertiesHelper/executeCommand/";

/// A run of a tool, and "kind/id/access method/text" of its failure.
struct ToolRun {
    zemString out;
    zemString err;
    int exitCode = 99;
    std::string failure;

    explicit ToolRun(const std::string& command, const char* user = nullptr, int waitTime = 0,
                     const char* locale = nullptr) {
        failure = failureText(
            [&] {
                Helper::executeCommand(command.c_str(), out, err, &exitCode, user, waitTime, locale,
                                       true);
            },
            "cmkiat");
        if (failure.empty()) {
            return;
        }
        EXPECT_EQ(0U, failure.find(kThrower));
        failure.erase(0, kThrower.size());
    }
};

/// A tool that goes on running; its stream, which does not block, and its process.
struct Running {
    FILE* stream = nullptr;
    pid_t pid = 0;

    explicit Running(const char* command, const char* user = nullptr,
                     const char* locale = nullptr) {
        EXPECT_EQ(0, Helper::asynExecuteCommand(command, &pid, &stream, user, locale));
    }
    /// Its exit code, once it has ended.
    int end() const {
        int status = 0;
        EXPECT_EQ(pid, waitpid(pid, &status, 0));
        return WEXITSTATUS(status);
    }
};

/// The process that a tool wrote to the file "pid"; throws if none does within ten seconds.
pid_t waitForPid(const ToolFolder& tools) {
    within(10s, [&] { return tools.read("pid").find('\n') != std::string::npos; });
    return std::stoi(tools.read("pid"));
}

TEST(CommandLineTest, SplitsLikeAShell) {
    const std::tuple<const char*, std::string, char> rows[] = {
        {"tool", "tool", ' '},
        {"", "", ' '},
        {" tool a", "|tool|a", ' '},
        {"tool   a    b  ", "tool|a|b", ' '},
        {"tool a \"\" b ''", "tool|a||b|", ' '},
        {R"(tool "a b"c 'd "e'f)", R"(tool|a bc|d "ef)", ' '},
        {R"(tool -i  "\"name=a b\",\"x+=1\"")", R"(tool|-i|"name=a b","x+=1")", ' '},
        {R"(tool a\ b \" \\ "\x\\\"" '\x')", R"(tool|a b|"|\|\x\"|\x)", ' '},
        {"tool a\tb\nc", "tool|a\tb\nc", ' '},
        {R"(tool a \)", "tool|a|", 'd'},
        {R"(tool "a\)", "tool", 'u'},
        {"tool a 'b c", "tool|a", 'u'},
        {"tool \"it's\" 'say \"'", "tool|it's|say \"", ' '},
    };
    for (const auto& [command, arguments, fault] : rows) {
        const zemCommandLine line = zemSplitCommandLine(command);
        std::string joined;
        for (const std::string& argument : line.arguments) {
            joined += argument + '|';
        }
        EXPECT_EQ(arguments + '|', joined) << command;
        EXPECT_EQ(line.danglingBackslash, fault == 'd') << command;
        EXPECT_EQ(line.unbalancedQuote, fault == 'u') << command;
    }
}

TEST(PollPlanTest, LimitsCountInTenthsOfASecond) {
    using Length = std::chrono::microseconds;
    // waitTime, passes (1000: no limit), their length. Longer limits wrap in the product: to a unit
    // that is negative and larger than the limit, then smaller, then to none.
    // clang-format off
    const std::tuple<int, int, Length> rows[] = {
        {50, 0, 0us}, {99999, 0, 0us}, {100000, 1, 2ms}, {250000, 2, 102ms}, {2147483, 21, 2002ms}, {5000000, 50, 4902ms},
        {0, 1000, 2s}, {-5, 1000, 2s}, {3000000, 0, 0us}, {4294967, 1000, 2s}, {536870912, 1000, 2s},
    };
    // clang-format on
    for (const auto& [waitTime, passes, total] : rows) {
        zemPollPlan plan(waitTime);
        std::chrono::microseconds slept(0);
        int count = 0;
        for (; count < 1000 && !plan.expired(); ++count) {
            slept += plan.pause();
        }
        EXPECT_EQ(passes, count) << waitTime;
        EXPECT_EQ(total, slept) << waitTime;
    }
}

TEST(PollPlanTest, BacksOffAfterTwentyMinutes) {
    zemPollPlan plan(0);
    for (int pass = 0; pass < 600001; ++pass) {
        ASSERT_FALSE(plan.expired());
        ASSERT_EQ(2ms, plan.pause());
    }
    EXPECT_EQ(0ms, plan.pause());
    for (int wait = 1; wait <= 32768; wait *= 2) {
        EXPECT_EQ(std::chrono::milliseconds(wait), plan.pause());
    }
    EXPECT_EQ(1min, plan.pause());
    EXPECT_EQ(1min, plan.pause());
}

TEST(ExecuteCommandTest, PassesArgumentsByteForByteAndCollectsOutput) {
    ToolFolder tools;
    tools.recorder("record", "out");
    const ToolRun run("record  \"a  b\" '' \\\"x \xff\x01*$HOME\t;");
    EXPECT_EQ("a  b||\"x|\xff\x01*$HOME\t;", tools.arguments());
    EXPECT_STREQ("out", run.out);
    EXPECT_EQ(0, run.exitCode);

    // The program's name is argument 0; a zero byte hides the rest of its piece.
    EXPECT_STREQ("cat", ToolRun("cat /proc/self/cmdline").out);

    tools.script("both", "printf 'o\\377\\n\\n'; printf e >&2; exit 255");
    const ToolRun both("both");
    EXPECT_STREQ("o\xff\n\n", both.out);
    EXPECT_STREQ("e", both.err);
    EXPECT_EQ(255, both.exitCode);
    EXPECT_EQ("", both.failure);
}

TEST(ExecuteCommandTest, LocaleIsTheOnlyChangeToTheEnvironment) {
    ToolFolder tools;
    setenv("ZEM_TEST", "kept", 1);
    setenv("LC_ALL", "C", 1);
    tools.script("show", "echo $LC_ALL $ZEM_TEST; env | grep -c LC_ALL=");
    EXPECT_STREQ("de_DE kept\n1\n", ToolRun("show", nullptr, 0, "de_DE").out);
    EXPECT_STREQ("C kept\n1\n", ToolRun("show", nullptr, 0, "").out);
    unsetenv("LC_ALL");
    EXPECT_STREQ("fr_FR kept\n1\n", ToolRun("show", nullptr, 0, "fr_FR").out);
}

TEST(ExecuteCommandTest, FailuresNameTheirCause) {
    ToolFolder tools;
    tools.script("locked", "");
    std::filesystem::permissions(tools.file("bin/locked"), std::filesystem::perms(0644));
    tools.script("killed", "kill -9 $$");
    tools.script("marker", "touch $here/started");
    const std::string open = "marker " + std::string(200000, 'x') + " \"";
    const std::string endless(10000000, 'u');
    const std::tuple<std::string, const char*, std::string, int> rows[] = {
        {"nosuchtool -x", "", "6/2/nosuchtool/No such file or directory", 255},
        {"", "", "6/2//No such file or directory", 255},
        {"locked", "", "1/13/locked/Permission denied", 255},
        {"killed", "", "6///Receive Signal:9", -1},
        {"marker \"a", "", "6/-1/marker/Invalid command parameter:\"a", 255},
        {open, "", "6/-1/marker/Invalid command parameter:" + open.substr(7), 255},
        {"cat " + std::string(300000, 'x'), "", "6/7/cat/Argument list too long", 255},
        {"marker", "no such user", "6/0/marker/The given user name \"no such user\" was not found.",
         255},
        {"marker \"a", "nobodyelse", "6/0/marker/The given user name \"nobodyelse\" was not found.",
         255},
        {"marker", endless.c_str(),
         "6/0/marker/The given user name \"" + endless + "\" was not found.", 255},
        {"nosuchtool \\", "", "6/-1/nosuchtool/Invalid command parameter:\\", 255},
    };
    for (const auto& [command, user, failure, exitCode] : rows) {
        const ToolRun run(command, user);
        EXPECT_EQ(failure, run.failure);
        EXPECT_EQ(exitCode, run.exitCode) << failure;
    }
    EXPECT_FALSE(std::filesystem::exists(tools.file("started")));
    // After a backslash at the end the tool runs all the same.
    const ToolRun run("marker \\");
    EXPECT_EQ("6/-1/marker/Invalid command parameter:\\", run.failure);
    EXPECT_EQ(0, run.exitCode);
    EXPECT_TRUE(std::filesystem::exists(tools.file("started")));
    EXPECT_FALSE(hasChildren());
}

TEST(ExecuteCommandTest, ReportsAStoppedTool) {
    const std::string self = std::filesystem::read_symlink("/proc/self/exe");
    EXPECT_EQ("6///Receive Stop Signal:" + std::to_string(SIGSTOP),
              ToolRun(self + " stop").failure);
    // The stopped child is no one's but the caller's.
    pid_t child = 0;
    ASSERT_TRUE(std::ifstream("/proc/thread-self/children") >> child);
    kill(child, SIGKILL);
    EXPECT_EQ(child, waitpid(child, nullptr, 0));
}

TEST(ExecuteCommandTest, LimitLeavesTheToolRunning) {
    ToolFolder tools;
    tools.script("hang", "echo $$ >$here/pid; exec sleep 60");
    // At once, the child finds no one to complain to about the backslash, and starts all the same.
    const std::pair<const char*, int> rows[] = {{"hang \\", 50}, {"hang", 200000}};
    for (const auto& [command, limit] : rows) {
        std::filesystem::remove(tools.file("pid"));
        const auto begin = std::chrono::steady_clock::now();
        EXPECT_EQ("6/CLI_TIME_OUT//CLI do not return in 10 miniutes.",
                  ToolRun(command, nullptr, limit).failure);
        EXPECT_LT(std::chrono::steady_clock::now() - begin, 10s);
        const pid_t pid = waitForPid(tools);
        EXPECT_EQ(0, waitpid(pid, nullptr, WNOHANG));
        kill(pid, SIGKILL);
        EXPECT_EQ(pid, waitpid(pid, nullptr, 0));
    }
    EXPECT_EQ("", ToolRun("true", nullptr, 5000000).failure);
}

TEST(ExecuteCommandTest, TakesMuchOutputOnBothStreams) {
    ToolFolder tools;
    tools.script("some", "head -c 2000000 /dev/zero | tr '\\0' $1");
    tools.script("flood", "for i in 1 2 3 4 5; do some o; some e >&2; done");
    const ToolRun run("flood");
    EXPECT_EQ(std::string(10000000, 'o'), std::string(run.out));
    EXPECT_EQ(std::string(10000000, 'e'), std::string(run.err));
}

/// Makes the kernel, for this thread and its children, one that lacks a call.
void removeCall(unsigned int number) {
    sock_filter rules[] = {BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
                           BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, number, 0, 1),
                           BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | ENOSYS),
                           BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW)};
    const sock_fprog filter = {std::size(rules), rules};
    prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
    EXPECT_EQ(0, prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter));
}

TEST(ExecuteCommandTest, KeepsTheServersDescriptorsAndSignalsFromTools) {
    const int inherited = fcntl(STDERR_FILENO, F_DUPFD, 100);
    sigset_t blocked;
    sigset_t before;
    sigemptyset(&blocked);
    sigaddset(&blocked, SIGUSR1);
    pthread_sigmask(SIG_BLOCK, &blocked, &before);
    const auto handler = std::signal(SIGTERM, SIG_IGN);
    // The last descriptor is that of the folder.
    EXPECT_STREQ("0\n1\n2\n3\n", ToolRun("ls /proc/self/fd").out);
    onThreads(1, [](int) {
        removeCall(SYS_close_range);
        removeCall(SYS_pidfd_open);
        EXPECT_STREQ("0\n1\n2\n3\n", ToolRun("ls /proc/self/fd").out) << "by other ways";
    });
    EXPECT_STREQ("SigBlk:\t0000000000000000\nSigIgn:\t0000000000000000\n",
                 ToolRun("grep -E SigBlk|SigIgn /proc/self/status").out);
    pthread_sigmask(SIG_SETMASK, &before, &blocked);
    EXPECT_EQ(1, sigismember(&blocked, SIGUSR1));
    EXPECT_EQ(SIG_IGN, std::signal(SIGTERM, handler));
    close(inherited);
}

TEST(ExecuteCommandTest, CancelledThreadLeavesOnlyTheTool) {
    ToolFolder tools;
    tools.script("hang", "echo $$ >$here/pid; exec sleep 60");
    const long before = openDescriptors();
    // Cancelled while it waits, and before it starts a child that has something to write.
    void* (*const works[])(void*) = {[](void*) -> void* { return ToolRun("hang"), nullptr; },
                                     [](void*) -> void* {
                                         pthread_cancel(pthread_self());
                                         return ToolRun("nosuchtool"), nullptr;
                                     }};
    for (const auto work : works) {
        pthread_t thread;
        ASSERT_EQ(0, pthread_create(&thread, nullptr, work, nullptr));
        const pid_t pid = work == works[0] ? waitForPid(tools) : 0;
        if (pid != 0) {
            pthread_cancel(thread);
        }
        void* result = nullptr;
        pthread_join(thread, &result);
        EXPECT_EQ(PTHREAD_CANCELED, result);
        EXPECT_EQ(before, openDescriptors());
        EXPECT_TRUE(pid == 0 || kill(pid, SIGKILL) == 0) << "it goes on";
        siginfo_t ended;
        EXPECT_EQ(0, waitid(P_ALL, 0, &ended, WEXITED | WNOWAIT));
        EXPECT_EQ("", ToolRun("true").failure);
        EXPECT_FALSE(hasChildren()) << "reaped by the next run";
    }
}

TEST(ExecuteCommandTest, EachAllocationMayFail) {
    ToolFolder tools;
    tools.script("talk", "head -c 200000 /dev/zero | tr '\\0' o; echo e >&2");
    const long before = openDescriptors();
    const auto run = [](const char* user) {
        zemString out;
        zemString err;
        Helper::executeCommand("talk a 'b c'", out, err, nullptr, user, 0, "C", true);
        EXPECT_EQ(200000U, out.length());
    };
    const std::function<void()> operations[] = {
        [&] { run(nullptr); },
        [&] { EXPECT_NE("", failureText([&] { run("nosuchuser"); })); },
        [] {
            const Running running("talk \\");
            fclose(running.stream);
            running.end();
        },
    };
    for (const auto& operation : operations) {
        bool happened = true;
        long n = 0;
        for (; happened; ++n) {
            bool failed = false;
            {
                const FailingAllocation nth(n);
                try {
                    operation();
                } catch (const std::bad_alloc&) {
                    failed = true;
                }
                happened = nth.happened();
            }
            ASSERT_EQ(happened, failed) << n;
            ASSERT_EQ(before, openDescriptors()) << n;
            ASSERT_FALSE(hasChildren()) << n;
        }
        if (&operation != operations) {
            continue;
        }
        tools.script("talk", "exec yes");  // output without end
        FailingAllocation::s_most = 1 << 20;
        EXPECT_THROW(operation(), std::bad_alloc) << "a tool that no one reads any more ends";
        FailingAllocation::s_most = SIZE_MAX;
        tools.script("talk", "echo");
    }
}

TEST(ExecuteCommandTest, ManyRunsLeaveNothingBehind) {
    ToolFolder tools;
    const long before = openDescriptors();
    onThreads(8, [](int) {
        for (int i = 0; i < 60; ++i) {
            const ToolRun run(i % 4 == 0 ? "nosuchtool" : i % 4 == 1 ? "echo 'x" : "echo x");
            EXPECT_EQ(i % 4 > 1, run.failure.empty());
        }
        const Running running("echo x");
        EXPECT_EQ("x\n", readAll(running.stream));
        running.end();
    });
    EXPECT_EQ(before, openDescriptors());
    EXPECT_FALSE(hasChildren());
}

TEST(ExecuteCommandTest, WorksWithoutStandardDescriptors) {
    EXPECT_EXIT(
        {
            close(STDIN_FILENO);
            close(STDOUT_FILENO);
            close(STDERR_FILENO);
            const char* const both = "sh -c 'echo o; echo e >&2'";
            zemString out;
            zemString err;
            Helper::executeCommand(both, out, err, nullptr, nullptr, 0, nullptr, false);
            const bool good = out == "o\n" && err == "e\n";
            _exit(good && readAll(Running(both).stream) == "o\ne\n" ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST(ExecuteCommandTest, FullDescriptorTableIsAFailureOfThePipe) {
    EXPECT_EXIT(
        {
            while (dup(STDERR_FILENO) >= 0) {
            }
            const std::string failure = ToolRun("true").failure;
            _exit(failure == "6/24/pipe/Too many open files" ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST(UserContextTest, SwitchesGroupAndUser) {
    if (geteuid() != 0) {
        GTEST_SKIP() << "needs root";
    }
    // First, as its process starts the test anew and leaves by the shortest way.
    EXPECT_EXIT(
        {
            const int there = Helper::changeProcessUserContext("nobody");
            const int back = Helper::changeProcessUserContext("root");
            _exit(there == 0 && geteuid() == 65534 && back == EPERM ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
    ToolFolder tools;
    tools.script("who", "id -u; id -g; grep CapInh /proc/self/status");
    onThreads(4, [](int) {
        __user_cap_header_struct self = {_LINUX_CAPABILITY_VERSION_3, 0};
        __user_cap_data_struct kept[_LINUX_CAPABILITY_U32S_3] = {};
        syscall(SYS_capget, &self, kept);
        kept[0].inheritable |= 1U << CAP_KILL;
        EXPECT_EQ(0, syscall(SYS_capset, &self, kept));
        const std::string none = "CapInh:\t0000000000000000\n";
        EXPECT_EQ("65534\n65534\n" + none, std::string(ToolRun("who", "nobody").out));
        EXPECT_NE("0\n0\n" + none, std::string(ToolRun("who", "root").out));
        EXPECT_EQ(0U, geteuid());
    });
    EXPECT_EQ(1, prctl(PR_GET_DUMPABLE)) << "of this process, whose memory the children had";
    EXPECT_EQ(0, Helper::changeProcessUserContext("root"));
    EXPECT_EQ(-1, Helper::changeProcessUserContext("no such user"));
    EXPECT_EQ(-1, Helper::changeProcessUserContext(std::string(10000000, 'x').c_str()));
}

TEST(AsynExecuteCommandTest, HandsOverStreamAndChild) {
    ToolFolder tools;
    tools.script("both", "echo $LC_ALL; echo e >&2; exit 7");
    tools.script("marker", "echo ran");
    const std::string longName(200000, 'n');  // more than a pipe holds
    const std::tuple<const char*, const char*, std::string, int> rows[] = {
        {"both", "", "xx\ne\n", 7},
        {"nosuchtool a", "", std::string("No such file or directory : nosuchtool") + '\0', 2},
        {"marker", "no such user",
         std::string("The given user name \"no such user\" was not found.") + '\0', 255},
        {"marker 'a", "", std::string("-1:Invalid command parameter:'a") + '\0', 255},
        {"marker \\", "", std::string("-1:Invalid command parameter:\\") + '\0' + "ran\n", 0},
        {longName.c_str(), "", "File name too long : " + longName + '\0', 36},
    };
    for (const auto& [command, user, output, exitCode] : rows) {
        const Running running(command, user, "xx");
        EXPECT_NE(0, fcntl(fileno(running.stream), F_GETFL) & O_NONBLOCK);
        EXPECT_EQ(output, readAll(running.stream));
        EXPECT_EQ(exitCode, running.end()) << command;
    }
    const Running unread(longName.c_str());
    fclose(unread.stream);
    EXPECT_EQ(36, unread.end()) << "neither waits for a reader nor is killed for want of one";
}

TEST(HostTest, NamesAndAddresses) {
    char name[257] = {};
    gethostname(name, sizeof name - 1);
    onThreads(4, [&name](int) {
        EXPECT_STREQ(name, Helper::getHostName());
        Helper::getFullHostName();
    });
    EXPECT_EQ(&Helper::getHostName(), &Helper::getHostName());

    EXPECT_EQ(0x0A010203U, Helper::getHostIPAddress("10.1.2.3"));
    EXPECT_EQ(0xFFFFFFFFU, Helper::getHostIPAddress(nullptr));
    EXPECT_EQ(0xFFFFFFFFU, Helper::getHostIPAddress("no such host"));
    EXPECT_STREQ("10.1.2.3", Helper::getHostIP("10.1.2.3"));
    EXPECT_STREQ("", Helper::getHostIP("no such host"));
    EXPECT_TRUE(Helper::isSameHost("127.0.0.1"));
    EXPECT_FALSE(Helper::isSameHost("no such host"));
    EXPECT_FALSE(Helper::isSameHost("192.0.2.1"));
}

TEST(ValidatorTest, AddressesAndNames) {
    for (const char* good : {"1.2.3.4", "1..2.3.4", "-1.2.3.4", "255.255.255.255", "1.2.3.4x"}) {
        EXPECT_EQ(1, Helper::isValidIPAddress(good)) << good;
    }
    for (const char* bad : {"", "1.2.3", "1.2.3.256", "a.b.c.d"}) {
        EXPECT_EQ(0, Helper::isValidIPAddress(bad)) << bad;
    }
    const std::tuple<const char*, const char*, int> rows[] = {
        {"$ab", "", 1},  {"a9$#@", "", 1}, {"9a", "", 0},   {"a_b", "", 0},
        {"$ab", "_", 0}, {"a_b", "_", 1},  {"a$b", "_", 0}, {"", "", 0},
        {"", "_", 0},    {"_a", "_", 0},   {"Zz", "", 1},   {"\xe4", "", 0}};
    for (const auto& [name, extra, valid] : rows) {
        EXPECT_EQ(valid, Helper::isValidName(name, extra)) << name;
    }
}

TEST(TimeStampTest, AreLocalTime) {
    const testing_support::ScopedEnvironment zone("TZ", "CET-1CEST,M3.5.0,M10.5.0/3");
    tzset();
    char winter[] = "1130102030405";
    char summer[] = "0990731235959";
    char blank[] = "             ";
    char date[] = "20130102";
    char time[] = "030405";
    EXPECT_EQ(1357092245, Helper::getTimeFromTimeStamp13(winter));
    EXPECT_EQ(933458399, Helper::getTimeFromTimeStamp13(summer));
    EXPECT_EQ(0, Helper::getTimeFromTimeStamp13(blank));
    EXPECT_EQ(1357092245, Helper::getTimeFromDateTimeStamps(date, time));
    EXPECT_EQ(0, Helper::getTimeFromDateTimeStamps(blank, time));
    EXPECT_EQ(0, Helper::getTimeFromDateTimeStamps(date, blank));
    EXPECT_LE(std::labs(Helper::getLocalDateTime() - Helper::getCurrentTimeBaseSec()), 1);
}

}  // namespace

int main(int argc, char** argv) {
    // As a tool of its own: a wait reports a stop only of a child that is traced.
    if (argc == 2 && std::strcmp(argv[1], "stop") == 0) {
        ptrace(PTRACE_TRACEME, 0, nullptr, nullptr);
        raise(SIGSTOP);
        return 0;
    }
    testing::InitGoogleTest(&argc, argv);
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    return RUN_ALL_TESTS();
}
