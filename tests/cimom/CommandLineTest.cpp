// The program cimom as a child process, with the fixture library.
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <sstream>

#include "Fixture.h"

namespace {

class CommandLine : public testing::Test {
protected:
    struct Run {
        int exit;
        std::string out;
        std::string err;
    };

    CommandLine() {
        m_folder.write("fixture.mof", fixture::kMof);
        const std::string row = R"({"provider": "Fixture", "interfaces":
            ["instance", "association", "method", "indication", "property"]})";
        m_folder.write("fixture.json", R"({"namespace": "root/cimv2", "library": ")" FIXTURE_LIBRARY
                                       R"(", "classes": {"Fix_Thing": )" +
                                           row + R"(, "Fix_Link": )" + row + R"(, "Fix_Event": )" +
                                           row + "}}");
    }

    pid_t start(std::vector<std::string> arguments, const char* out = "out") {
        arguments.insert(arguments.begin(), CIMOM_PROGRAM);
        std::vector<char*> argv;
        for (std::string& each : arguments) {
            argv.push_back(each.data());
        }
        argv.push_back(nullptr);
        const pid_t child = fork();
        if (child == 0) {
            if (chdir((m_folder / "").c_str()) != 0 || !freopen(out, "w", stdout) ||
                !freopen("err", "w", stderr)) {
                _exit(99);
            }
            setenv("CIMOM_REGISTRATION", m_registration, 1);
            execv(CIMOM_PROGRAM, argv.data());
            _exit(98);
        }
        return child;
    }
    Run finish(pid_t child) {
        int status = 0;
        waitpid(child, &status, 0);
        return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, read("out"), read("err")};
    }
    Run run(const std::vector<std::string>& arguments) { return finish(start(arguments)); }
    Run runTyped(std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), {"--schema", "fixture.mof"});
        return run(arguments);
    }

    std::string read(const char* name) {
        std::ostringstream text;
        text << std::ifstream(m_folder / name).rdbuf();
        return text.str();
    }

    const fixture::Folder m_folder;
    const char* m_registration = "fixture.json";
};

TEST_F(CommandLine, PathsThatArePrintedCanBeGivenBack) {
    const Run names = run({"ein", "Fix_Thing"});
    ASSERT_EQ(names.exit, 0) << names.err;
    EXPECT_EQ(names.out,
              "root/cimv2:Fix_Thing.Name=\"one\"\n"
              "root/cimv2:Fix_Thing.Name=\"two, \\\"quoted\\\" \\\\\"\n");
    const std::string second = names.out.substr(names.out.find('\n') + 1);
    const std::string path = second.substr(0, second.size() - 1);
    const Run one = run({"gi", path, "--properties", "Size"});
    EXPECT_EQ(one.out, "// " + path + "\ninstance of Fix_Thing {\n    Size = 2;\n};\n");
    const Run json = run({"--format", "json", "gi", path, "--properties", "Tags"});
    EXPECT_EQ(json.out, R"([
  {
    "path": "root/cimv2:Fix_Thing.Name=\"two, \\\"quoted\\\" \\\\\"",
    "class": "Fix_Thing",
    "properties": {
      "Tags": [
        "first",
        null
      ]
    }
  }
]
)");
}

TEST_F(CommandLine, FailuresAreTold) {
    const struct {
        std::vector<std::string> arguments;
        int exit;
        std::string err;
    } rows[] = {
        {{"gi", "Fix_Thing.Name=\"none\""}, 6, "CIM_ERR_NOT_FOUND (6): no such thing\n"},
        {{"ei", "Other"},
         7,
         "CIM_ERR_NOT_SUPPORTED (7): no provider serves class Other in root/cimv2: no registration "
         "lists it, or a class above it, with the interface instance\n"},
        {{"gi", "Fix_Thing.Name"}, 4, "CIM_ERR_INVALID_PARAMETER (4): at character 15 of "},
        {{"gc", "Fix_Thing"}, 7, "CIM_ERR_NOT_SUPPORTED (7): no classes are known without"},
        {{"ei"}, 64, "class is required"},
        {{"dance", "C"}, 64, "cimom: no verb 'dance'; cimom --help lists them\n"},
        {{}, 64, ""},
        {{"--broker", "fat", "ei", "C"}, 64, "--broker"},
        {{"--registration", "none.json", "ei", "C"},
         78,
         "cimom: none.json: cannot be read: No such file or directory\n"},
        {{"--schema", "fixture.json", "ei", "C"}, 78, "cimom: fixture.json:1:1"},
        {{"--provider-output", "no/such", "ei", "C"}, 78, "cimom: no/such: "},
    };
    for (const auto& row : rows) {
        const Run result = run(row.arguments);
        EXPECT_EQ(result.exit, row.exit) << result.err;
        EXPECT_EQ(result.err.substr(0, row.err.size()), row.err);
        EXPECT_EQ(result.out, "");
    }
    const Run unknown = runTyped({"mi", "Fix_Thing.Name=\"one\"", "Colour=red"});
    EXPECT_EQ(unknown.exit, 12) << unknown.err;
    for (const auto& [arguments, words] :
         std::vector<std::pair<std::vector<std::string>, const char*>>{
             {{"gi", "--help"}, "--properties"},
             {{"--help"}, "CIMOM_SCHEMA"},
             {{"--version"}, "cimom 0."}}) {
        const Run told = run(arguments);
        EXPECT_EQ(told.exit, 0);
        EXPECT_NE(told.out.find(words), std::string::npos);
    }
    m_registration = "";
    const Run none = run({"ei", "C"});
    EXPECT_EQ(none.exit, 78);
    EXPECT_EQ(
        none.err,
        "cimom: no providers: name a registration, by --registration or CIMOM_REGISTRATION\n");
    EXPECT_EQ(runTyped({"ec", "Fix_Base"}).exit, 0);
}

TEST_F(CommandLine, OutputThatIsLostIsAFailure) {
    const std::vector<std::string> rows[] = {
        {"ein", "Fix_Thing"},
        {"--format", "json", "gp", "Fix_Thing.Name=\"one\"", "Size"},
        {"--help"}};
    for (const auto& row : rows) {
        const Run result = finish(start(row, "/dev/full"));
        EXPECT_EQ(result.exit, 74);
        EXPECT_EQ(result.err, "cimom: standard output: No space left on device\n");
    }
}

TEST_F(CommandLine, ProvidersDoNotPrintAmongResults) {
    const char* line = "fixture: a line for standard output\n";
    EXPECT_EQ(run({"ein", "Fix_Thing"}).err, "");
    EXPECT_EQ(run({"--provider-output", "stderr", "ein", "Fix_Thing"}).err, line);
    run({"ein", "Fix_Thing", "--provider-output", "provider.log"});
    EXPECT_EQ(read("provider.log"), line);
    EXPECT_EQ(run({"--trace", "1", "watch", "Nothing"}).exit, 7);
}

TEST_F(CommandLine, VerbsThatChange) {
    const struct {
        std::vector<std::string> arguments;
        std::string out;
    } rows[] = {
        {{"ci", "Fix_Thing", "Name=new", "Size=7"}, "root/cimv2:Fix_Thing.Name=\"new\"\n"},
        {{"mi", "Fix_Thing.Name=\"one\"", "Size=7"}, ""},
        {{"di", "Fix_Thing.Name=\"one\""}, ""},
        {{"sp", "Fix_Thing.Name=\"one\"", "Size", "8"}, ""},
        {{"gp", "Fix_Thing.Name=\"one\"", "Size"}, "1\n"},
        {{"ain", "Fix_Thing.Name=\"two, \\\"quoted\\\" \\\\\"", "--assoc-class", "Fix_Link"},
         "root/cimv2:Fix_Thing.Name=\"one\"\n"},
        {{"rin", "Fix_Thing.Name=\"one\"", "--role", "Dependent"}, ""},
        {{"ec", "Fix_Base"}, "Fix_Thing\n"},
        {{"im", "Fix_Thing.Name=\"one\"", "Echo", "Number=5", "Names={a,\"b,c\"}",
          "Thing=Fix_Base.Name=\"x\"", "Parts={instance of Fix_Thing { Size = 3; }}"},
         "returnValue = 4;\nNumber = 5;\nNames = {\"a\", \"b,c\"};\n"
         "Thing = \"Fix_Base.Name=\\\"x\\\"\";\n"
         "Parts = {instance of Fix_Thing {\n    Size = 3;\n}};\n"},
        {{"--format", "json", "im", "Fix_Thing.Name=\"one\"", "Echo", "Number=5"},
         "{\n  \"returnValue\": 1,\n  \"out\": {\n    \"Number\": 5\n  }\n}\n"},
    };
    for (const auto& row : rows) {
        const Run result = runTyped(row.arguments);
        EXPECT_EQ(result.exit, 0) << result.err;
        EXPECT_EQ(result.out, row.out);
    }
    EXPECT_NE(runTyped({"gc", "Fix_Thing"}).out.find("class Fix_Thing : Fix_Base {"),
              std::string::npos);
}

// Nothing fires in that process, and so it watches until it is told to end.
TEST_F(CommandLine, WatchingEndsWithASignal) {
    const pid_t child = start({"--trace", "1", "watch", "Fix_Event"});
    for (int i = 0; i < 500 && read("err").find("\nwatching\n") == std::string::npos; ++i) {
        usleep(20000);
    }
    kill(child, SIGTERM);
    const Run result = finish(child);
    EXPECT_EQ(result.exit, 0);
    EXPECT_NE(result.err.find("trace 1 Fixture: deactivate Fix_Event edge"), std::string::npos)
        << result.err;
}

}  // namespace
