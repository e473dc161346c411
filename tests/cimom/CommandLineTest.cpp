// The program cimom as a child process, with the fixture library.
#include "Fixture.h"
#include "TestAppliance.h"

namespace {

using testing_support::contents;
using testing_support::Outcome;

class CommandLine : public testing::Test {
protected:
    CommandLine() {
        const std::string row = R"({"provider": "Fixture", "interfaces":
            ["instance", "association", "method", "indication", "property"]})";
        std::ofstream(m_folder / "fixture.mof") << fixture::kMof;
        std::ofstream(m_folder / "fixture.json")
            << R"({"namespace": "root/cimv2", "library": ")" FIXTURE_LIBRARY
               R"(", "classes": {"Fix_Thing": )"
            << row << R"(, "Fix_Link": )" << row << R"(, "Fix_Event": )" << row << "}}";
    }

    /// Runs cimom with arguments as a shell takes them, and what else stands behind them.
    Outcome run(const std::string& arguments) {
        return m_programs.run("cd '" + m_folder.string() + "'; cimom " + arguments);
    }
    Outcome runTyped(const std::string& arguments) {
        return run("--schema fixture.mof " + arguments);
    }

    testing_support::TestAppliance m_programs{ZEM_PROGRAMS};
    const std::filesystem::path m_folder = m_programs.folder();
    testing_support::ScopedEnvironment m_registration{"CIMOM_REGISTRATION", "fixture.json"};
};

TEST_F(CommandLine, PathsThatArePrintedCanBeGivenBack) {
    const Outcome names = run("ein Fix_Thing");
    ASSERT_EQ(names.exit, 0) << names.err;
    EXPECT_EQ(names.out,
              "root/cimv2:Fix_Thing.Name=\"one\"\n"
              "root/cimv2:Fix_Thing.Name=\"two, \\\"quoted\\\" \\\\\"\n");
    const std::string path = testing_support::lines(names.out).at(1);
    const Outcome one = run("gi '" + path + "' --properties Size");
    EXPECT_EQ(one.out, "// " + path + "\ninstance of Fix_Thing {\n    Size = 2;\n};\n");
    const Outcome json = run("--format json gi '" + path + "' --properties Tags");
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
        const char* arguments;
        int exit;
        std::string err;  ///< its beginning
    } rows[] = {
        {"gi 'Fix_Thing.Name=\"none\"'", 6, "CIM_ERR_NOT_FOUND (6): no such thing\n"},
        {"ei Other", 7,
         "CIM_ERR_NOT_SUPPORTED (7): no provider serves class Other in root/cimv2: no registration "
         "lists it, or a class above it, with the interface instance\n"},
        {"gi Fix_Thing.Name", 4, "CIM_ERR_INVALID_PARAMETER (4): at character 15 of "},
        {"gc Fix_Thing", 7, "CIM_ERR_NOT_SUPPORTED (7): no classes are known without"},
        {"ei", 64, "class is required"},
        {"dance C", 64, "cimom: no verb 'dance'; cimom --help lists them\n"},
        {"", 64, ""},
        {"--broker fat ei C", 64, "--broker"},
        {"--registration none.json ei C", 78,
         "cimom: none.json: cannot be read: No such file or directory\n"},
        {"--schema fixture.json ei C", 78, "cimom: fixture.json:1:1"},
        {"--provider-output no/such ei C", 78, "cimom: no/such: "},
        {"--schema fixture.mof mi 'Fix_Thing.Name=\"one\"' Colour=red", 12, ""},
        {"ein Fix_Thing >/dev/full", 74, "cimom: standard output: No space left on device\n"},
        {"--format json gp 'Fix_Thing.Name=\"one\"' Size >/dev/full", 74,
         "cimom: standard output: No space left on device\n"},
        {"--help >/dev/full", 74, "cimom: standard output: No space left on device\n"},
    };
    for (const auto& row : rows) {
        const Outcome result = run(row.arguments);
        EXPECT_EQ(result.exit, row.exit) << row.arguments << result.err;
        EXPECT_EQ(result.err.substr(0, row.err.size()), row.err);
        EXPECT_EQ(result.out, "");
    }
    const std::pair<const char*, const char*> told[] = {
        {"gi --help", "--properties"}, {"--help", "CIMOM_SCHEMA"}, {"--version", "cimom 0."}};
    for (const auto& [arguments, words] : told) {
        const Outcome result = run(arguments);
        EXPECT_EQ(result.exit, 0);
        EXPECT_NE(result.out.find(words), std::string::npos);
    }
    const testing_support::ScopedEnvironment without("CIMOM_REGISTRATION", "");
    const Outcome none = run("ei C");
    EXPECT_EQ(none.exit, 78);
    EXPECT_EQ(
        none.err,
        "cimom: no providers: name a registration, by --registration or CIMOM_REGISTRATION\n");
    EXPECT_EQ(runTyped("ec Fix_Base").exit, 0);
}

TEST_F(CommandLine, ProvidersDoNotPrintAmongResults) {
    const char* line = "fixture: a line for standard output\n";
    EXPECT_EQ(run("ein Fix_Thing").err, "");
    EXPECT_EQ(run("--provider-output stderr ein Fix_Thing").err, line);
    run("ein Fix_Thing --provider-output provider.log");
    EXPECT_EQ(contents(m_folder / "provider.log"), line);
    EXPECT_EQ(run("--trace 1 watch Nothing").exit, 7);
}

TEST_F(CommandLine, VerbsThatChange) {
    const std::string one = " 'Fix_Thing.Name=\"one\"' ";
    const std::pair<std::string, const char*> rows[] = {
        {"ci Fix_Thing Name=new Size=7", "root/cimv2:Fix_Thing.Name=\"new\"\n"},
        {"mi" + one + "Size=7", ""},
        {"di" + one, ""},
        {"sp" + one + "Size 8", ""},
        {"gp" + one + "Size", "1\n"},
        {R"(ain 'Fix_Thing.Name="two, \"quoted\" \\"' --assoc-class Fix_Link)",
         "root/cimv2:Fix_Thing.Name=\"one\"\n"},
        {"rin" + one + "--role Dependent", ""},
        {"ai" + one + "--result-role Dependent --properties Size",
         "// root/cimv2:Fix_Thing.Name=\"two, \\\"quoted\\\" \\\\\"\n"
         "instance of Fix_Thing {\n    Size = 2;\n};\n"},
        {"ri" + one + "--role Dependent", ""},
        {"ec Fix_Base", "Fix_Thing\n"},
        {"im" + one + R"(Echo Number=5 'Names={a,"b,c"}' 'Thing=Fix_Base.Name="x"' )" +
             "'Parts={instance of Fix_Thing { Size = 3; }}'",
         "returnValue = 4;\nNumber = 5;\nNames = {\"a\", \"b,c\"};\n"
         "Thing = \"Fix_Base.Name=\\\"x\\\"\";\n"
         "Parts = {instance of Fix_Thing {\n    Size = 3;\n}};\n"},
        {"--format json im" + one + "Echo Number=5",
         "{\n  \"returnValue\": 1,\n  \"out\": {\n    \"Number\": 5\n  }\n}\n"},
    };
    for (const auto& [arguments, out] : rows) {
        const Outcome result = runTyped(arguments);
        EXPECT_EQ(result.exit, 0) << result.err;
        EXPECT_EQ(result.out, out);
    }
    EXPECT_NE(runTyped("ri" + one).out.find("instance of Fix_Link {"), std::string::npos);
    EXPECT_NE(runTyped("gc Fix_Thing").out.find("class Fix_Thing : Fix_Base {"), std::string::npos);
}

// Nothing fires in that process, and so it watches until it is told to end.
TEST_F(CommandLine, WatchingEndsWithASignal) {
    const Outcome result =
        run("--trace 1 watch Fix_Event & for i in $(seq 500); do grep -q ^watching err && break; "
            "sleep .02; done; kill $!; wait $!");
    EXPECT_EQ(result.exit, 0);
    EXPECT_NE(result.err.find("trace 1 Fixture: deactivate Fix_Event edge"), std::string::npos)
        << result.err;
}

}  // namespace
