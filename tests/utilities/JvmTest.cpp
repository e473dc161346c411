// The VM: one a process, its options, what stands between C++ and Java's values.

#include <unistd.h>

#include <csignal>
#include <fstream>

#include "JavaProcess.h"

namespace {

/// How many VMs the process has, once there are no more than expected or two seconds are over.
int vms(int expected) {
    JavaVM* first = nullptr;
    jsize count = 0;
    within(std::chrono::seconds(2),
           [&] { return JNI_GetCreatedJavaVMs(&first, 1, &count) != 0 || count <= expected; });
    return count;
}

/// Starts a VM as a server may do itself.
void startServersOwn() {
    JavaVMInitArgs arguments = {JNI_VERSION_1_2, 0, nullptr, JNI_FALSE};
    JavaVM* vm = nullptr;
    void* env = nullptr;
    ASSERT_EQ(JNI_CreateJavaVM(&vm, &env, &arguments), JNI_OK);
    vm->DetachCurrentThread();
}

void reference() { zemJavaVM::getJavaVM().refJavaVM(); }
void process() {
    zemJvm::getJvm().initJVM();
    zemJvm::getJvm().detachThread();
}

TEST(JvmTest, ThereIsOneWhoeverAsksAndItEndsWithTheLastOfItsUsers) {
    const struct {
        std::vector<void (*)()> asking;
        bool isServers;
        int left;  ///< VMs when the references are released, and when the process's is as well
        int leftBehind;
    } cases[] = {
        {{reference}, false, 0, 0},
        {{reference, process}, false, 1, 0},
        {{process, reference}, false, 1, 0},
        {{startServersOwn, reference, process}, true, 1, 1},
    };
    for (const auto& row : cases) {
        inProcess([&] {
            constexpr int kThreads = 8;
            zemJavaVM& vm = zemJavaVM::getJavaVM();
            vm.releaseJavaVM();  // of none: changes nothing
            for (void (*ask)() : row.asking) {
                onThreads(ask == startServersOwn ? 1 : kThreads, [&](int) { ask(); });
            }
            EXPECT_EQ(vms(1), 1);
            EXPECT_EQ(vm.refJavaVM(), kThreads + 1);
            for (int i = 0; i <= kThreads; ++i) {
                vm.releaseJavaVM();
            }
            EXPECT_EQ(vms(row.left), row.left);
            zemJvm::getJvm().destroyJVM();
            EXPECT_EQ(vms(row.leftBehind), row.leftBehind);
            // OpenJDK starts no second one, which is no more than that.
            EXPECT_EQ(vm.refJavaVM(), 1);
            EXPECT_EQ(vm.attachThread() != nullptr, row.isServers);
        });
    }
}

TEST(JvmTest, OptionsComeFromTheEnvironment) {
    const std::string classes = usual()["CLASSPATH"];
    const struct {
        Environment environment;
        std::string expected;
        std::string printed;
    } cases[] = {
        {{}, "-Xmx128m -Xms8m -Xss4096k", "options[0].optionString =-Xmx128m\n"},
        {{{"PEGASUS_JMPI_MAX_HEAP", "1g"},
          {"PEGASUS_JMPI_INITIAL_HEAP", "16m"},
          {"PEGASUS_JMPI_JAVA_THREAD_STACK_SIZE", "2m"}},
         "-Xmx1g -Xms16m -Xss2m",
         "\noptions[3].optionString =-Djava.class.path=" + classes + "\n"},
        {{{"CLASSPATH", ""}}, "", "\noptions[3].optionString =-Djava.class.path=\n"},
    };
    for (const auto& row : cases) {
        inProcess(
            [&] {
                reference();
                if (!row.expected.empty()) {
                    InJava java;
                    EXPECT_EQ(std::string(java.helper().getStringObjValue(
                                  java.env(), java.probe("options", "()Ljava/lang/String;"))),
                              "-Xcheck:jni " + row.expected + " " + classes);
                }
            },
            row.environment, row.printed);
    }
}

TEST(JvmTest, TheServerKeepsItsSignals) {
    inProcess([] {
        constexpr int kept[] = {SIGHUP, SIGINT, SIGTERM, SIGQUIT, SIGUSR2};
        static volatile sig_atomic_t caught = 0;
        for (const int number : kept) {
            signal(number, [](int) { ++caught; });
        }
        reference();
        for (const int number : kept) {
            raise(number);
        }
        EXPECT_EQ(caught, 5);
        int ends[2];
        ASSERT_EQ(pipe(ends), 0);
        close(ends[0]);
        EXPECT_EQ(write(ends[1], "", 1), -1);  // and the process lives
    });
}

TEST(JvmTest, TheProcessEndsWithItsVm) {
    const std::string said = testing::TempDir() + "/zemend" + std::to_string(getpid());
    const auto end = [&](void (*start)()) {
        ASSERT_NE(freopen(said.c_str(), "w", stdout), nullptr);
        start();
        std::exit(0);
    };
    for (void (*start)() : {reference, process}) {
        EXPECT_EXIT(end(start), testing::ExitedWithCode(0), "");
        std::ifstream in(said);
        const std::string text(std::istreambuf_iterator<char>(in), {});
        EXPECT_EQ(text.find("Warning"), std::string::npos) << text;
    }
    remove(said.c_str());
}

TEST(JvmTest, ValuesPassAsTheyAreOrReadAsNothing) {
    const std::pair<const char*, const char*> texts[] = {
        {"web \xC3\xBC \xE6\x9D\xB1 \xF0\x9F\x98", "web \xC3\xBC \xE6\x9D\xB1 \xEF\xBF\xBD"},
        {"\xF0\x9F\x98\x80", "\xF0\x9F\x98\x80"},
        {"\xFFz\x80", "\xEF\xBF\xBDz\xEF\xBF\xBD"},  // no UTF-8 at all
        {"\xC0\xAF", "\xEF\xBF\xBD"},                // longer than need be
        {"\xED\xA0\x80", "\xEF\xBF\xBD"},            // half a pair
    };
    const struct {
        const char* key;
        int number;
        const char *text, *anyText;
    } values[] = {{"MIGRATION_SIDE", -1, "", "-1"},
                  {"CURRENT_MIGRATION_STATE", 0, "on", "on"},
                  {"nothing", 0, "", ""}};
    inProcess([&] {
        reference();
        InJava java;
        const zemJvmHelper& helper = java.helper();
        JNIEnv* const env = java.env();
        const jobject table = java.probe("table", "()Ljava/lang/Object;");
        for (int i = 0; i < 20; ++i) {  // leaves nothing behind, or there would be too much
            for (const auto& [text, expected] : texts) {
                const jstring object = java.text(text);
                EXPECT_EQ(helper.getStringObjValue(env, object), expected);
                env->DeleteLocalRef(object);
            }
            for (const auto& row : values) {
                const jobject value = helper.getValueOfHashtable(env, table, row.key);
                EXPECT_EQ(helper.getIntObjValue(env, value), row.number);
                EXPECT_EQ(helper.getStringObjValue(env, value), row.text);
                EXPECT_EQ(helper.getStringObjValue(env, value, true), row.anyText);
                EXPECT_FALSE(helper.getBooleanObjValue(env, value));
                env->DeleteLocalRef(value);
            }
        }
        const char* two[] = {"a", nullptr};
        EXPECT_EQ(env->GetArrayLength(helper.NewJStringArray(env, two, 2)), 2);
    });
}

}  // namespace
