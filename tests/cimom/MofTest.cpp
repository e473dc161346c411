#include <gtest/gtest.h>

#include <algorithm>
#include <map>

#include "ClassRepository.h"

namespace cimom {
namespace {

using Repository = std::shared_ptr<const ClassRepository>;
using Files = std::map<std::string, std::string>;

const char* const kQualifiers = R"(
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
Qualifier Abstract : boolean = false, Scope(class, association), Flavor(Restricted);
Qualifier Description : string = null, Scope(any), Flavor(Translatable);
Qualifier EmbeddedInstance : string, Scope(property, method, parameter);
Qualifier In : boolean = true, Scope(parameter);
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
Qualifier MaxLen : uint32, Scope(property);
Qualifier Out : boolean = false, Scope(parameter);
Qualifier Override : string, Scope(property, method), Flavor(Restricted);
Qualifier Values : string[], Scope(property);
)";

Repository loadFiles(Files files) {
    files["dir/main.mof"] = "#pragma include(\"../q.mof\")\n#pragma include(\"t.mof\")";
    files["q.mof"] = kQualifiers;
    return ClassRepository::load("dir/main.mof", [&](const std::string& path) {
        auto found = files.find(path);
        if (found == files.end()) {
            throw std::runtime_error("no such file");
        }
        return found->second;
    });
}

Repository load(const std::string& text) { return loadFiles({{"dir/t.mof", text}}); }

std::string faultsOf(const Files& files) {
    try {
        loadFiles(files);
    } catch (const MofError& error) {
        return error.what();
    }
    return "";
}

std::string names(const std::vector<const CimClass*>& classes) {
    std::string all;
    for (const CimClass* cls : classes) {
        all += cls->name + " ";
    }
    return all;
}

TEST(Mof, TellsPlaceAndReasonOfWhatItRejects) {
    // Faults stand behind "dir/t.mof:".
    // clang-format off
    const std::pair<std::string, std::string> rows[] = {
        // form
        {"class", "1:6: expected a name, found the end of the file"},
        {"class A { uint8 }", "1:17: expected a name, found '}'"},
        {"class A { uint8 p q; };", "1:19: expected '[', '(', ';' or '=', found 'q'"},
        {"\n\tint P;", "2:2: expected the end of the file, '#pragma', 'class', 'instance', 'qualifier' or '[', found 'int'"},
        {"class A { string \xC3\xA4; /* \xC3\xA4 */ uint8 p = ; };", "1:39: expected a value or '{', found ';'"},
        {"class A { uint8 p = $x; };", "1:21: expected a value or '{', found '$x'"},
        {"instance of A { P = }", "1:21: expected a value, an alias or '{', found '}'"},
        {"class A { string P[-1]; };", "1:20: expected an array size from 1 to 4294967295"},
        {"class A { string P[4294967296]; };", "1:20: expected an array size from 1 to 4294967295"},
        {"class A { A ref P[]; };", "1:18: a reference property cannot be an array"},
        {"class A { A ref P(); };", "1:17: a method cannot return a reference"},
        {"[Key : Bold] class A {};", "1:8: expected one of DisableOverride, EnableOverride, Restricted, ToSubclass, Translatable, ToInstance; found 'Bold'"},
        {"Qualifier Q : boolean, Scope(house);", "1:30: expected one of Class, Association, Indication, Property, Reference, Method, Parameter, Any; found 'house'"},
        {"#pragma include (5)", "1:9: expected one path in quotes behind 'include'"},
        // tokens
        {"/* open", "1:1: this comment is not closed"},
        {"[Description(\"open\n\")]", "1:14: this string is not closed on its line"},
        {"[Description(\"\\q\")]", "1:14: this string has an unknown escape"},
        {"[Description(\"\\xD800\")]", "1:14: a \\x escape here names no character"},
        {"[Description(\"\\x0\")]", "1:14: a \\x escape here names no character"},
        {"[Description(\"\xC0\xAF\")]", "1:14: this string has a byte that is not UTF-8"},
        {"[Description(\"" + std::string(1, '\0') + "\")]", "1:14: this string has a control character"},
        {"class A " + std::string(1, '\0'), "1:9: byte 0x00 has no meaning here"},
        {"class A ?", "1:9: character '?' has no meaning here"},
        {"class A { uint64 p = 18446744073709551616; };", "1:22: '18446744073709551616' is too large"},
        {"class A { real64 p = 1.0e999; };", "1:22: '1.0e999' is out of range"},
        {"class A { uint8 p = 09; };", "1:21: '09' is not a number"},
        {"class A { char16 p = 'ab'; };", "1:22: this is not one character in quotes"},
        {"class A { char16 p = '\xF0\x9F\x98\x80'; };", "1:22: this character does not fit 16 bits"},
        // values
        {"class A { uint8 p = 256; };", "1:21: 256 is out of the range of uint8"},
        {"class A { uint64 p = -1; };", "1:22: -1 is out of the range of uint64"},
        {"class A { sint8 p = -129; };", "1:21: -129 is out of the range of sint8"},
        {"class A { real32 p = 1.0e39; };", "1:22: the number is out of the range of real32"},
        {"class A { boolean p = 1; };", "1:23: expected a value of type boolean, found an integer"},
        {"class A { uint8 p = \"1\"; };", "1:21: expected a value of type uint8, found a string"},
        {"class A { uint8 p[] = 1; };", "1:23: expected values in braces for an array"},
        {"class A { uint8 p = {1}; };", "1:21: values in braces are for an array only"},
        {"class A { uint8 p[1] = {1, 2}; };", "1:24: more values than the array's 1"},
        {"class A { datetime p = \"2024\"; };", "1:24: '2024' is not a datetime"},
        // meaning
        {"class A {};\nCLASS a {};", "2:7: class 'a' is declared already at dir/t.mof:1:7"},
        {"class A : B {};", "1:11: superclass 'B' of 'A' is not declared"},
        {"class A : C {}; class B : A {}; class C : B {};", "1:27: class 'B' inherits from itself"},
        {"class A : A {};", "1:11: class 'A' inherits from itself"},
        {"class A { string P; uint8 p; };", "1:27: property 'p' is declared twice in this class"},
        {"class A { uint8 M(); uint8 m(); };", "1:28: method 'm' is declared twice in this class"},
        {"class A { uint8 M(uint8 a, uint8 A); };", "1:34: parameter 'A' is declared twice"},
        {"class A { string P; }; class B : A { uint8 p; };", "1:44: 'p' overrides one of another type, string"},
        {"class A { string P[2]; }; class B : A { string P[]; };", "1:48: 'P' overrides one of another type, string[2]"},
        {"class A { uint8 M(); }; class B : A { uint16 M(); };", "1:46: 'M' overrides one of another type, uint8"},
        {"class A {[EmbeddedInstance(\"B\")] string P;}; class B {};class C : A {[EmbeddedInstance(\"C\")] string P;};", "1:101: 'P' overrides one of class 'B', of which its own is no subclass"},
        {"class A { [Override(\"P\")] string P; };", "1:34: 'P' overrides 'P', which is no feature of that name in a superclass"},
        {"class A { [Key] string K; }; class B : A { [Key] string L; };", "1:57: 'L' cannot become a key: 'A' has its keys already"},
        {"class A { [Key] string K; }; class B : A { [Key(false)] string K; };",
         "1:45: qualifier 'Key' has another value in the superclass and cannot be changed\n"
         "dir/t.mof:1:64: 'K' is a key of the superclass and must stay one"},
        // a key again is no fault, the class is
        {"class A { [Key] string K; }; class B : A { [Key(true)] string K; }; class A {};", "1:75: class 'A' is declared already at dir/t.mof:1:7"},
        {"class A { [Key] string K[]; };", "1:24: key 'K' cannot be an array or an instance"},
        {"class A { [EmbeddedInstance(\"X\")] string P; };", "1:42: class 'X' of 'P' is not declared"},
        {"class A { [EmbeddedInstance(\"A\")] uint8 P; };", "1:41: 'P' carries an instance and so must be a string"},
        {"[Association] class A { A ref P; };", "1:21: association 'A' has fewer than two references"},
        {"class A { A ref P; };", "1:7: class 'A' has references and so needs the qualifier 'Association'"},
        {"[Nothing] class A {};", "1:2: qualifier 'Nothing' is not declared"},
        {"[Key] class A {};", "1:2: qualifier 'Key' is not for this element"},
        {"[Abstract, ABSTRACT] class A {};", "1:12: qualifier 'ABSTRACT' is given twice"},
        {"Qualifier key : boolean, Scope(any);", "1:11: qualifier 'key' is declared already"},
    };
    // clang-format on
    for (const auto& [text, fault] : rows) {
        EXPECT_EQ("dir/t.mof:" + fault, faultsOf({{"dir/t.mof", text}})) << text;
    }
}

TEST(Mof, ReportsFaultsOfMeaningTogetherUpToALimit) {
    std::string text = "class A : None {};\nclass B : A {};\nclass C { uint8 p = 300; };\n";
    EXPECT_EQ(
        "dir/t.mof:1:11: superclass 'None' of 'A' is not declared\n"
        "dir/t.mof:3:21: 300 is out of the range of uint8",
        faultsOf({{"dir/t.mof", text}}));
    for (int i = 0; i < 100; ++i) {
        text += "class C {};";
    }
    std::string faults = faultsOf({{"dir/t.mof", text}});
    EXPECT_EQ(49, std::count(faults.begin(), faults.end(), '\n'));
}

TEST(Mof, ReadsLiterals) {
    const std::pair<std::string, std::string> rows[] = {
        // what is declared, and as it is printed
        {"uint8 P = 0xFF;", "uint8 P = 255;"},
        {"SINT64 P = -9223372036854775808;", "sint64 P = -9223372036854775808;"},
        {"uint64 P = +18446744073709551615;", "uint64 P = 18446744073709551615;"},
        {"uint16 P[] = {101b, 017, 0, 0X1f};", "uint16 P[] = {5, 15, 0, 31};"},
        {"sint32 P[3] = {-101B, NULL, -0x80000000};", "sint32 P[3] = {-5, NULL, -2147483648};"},
        {"uint8 P[] = {};", "uint8 P[] = {};"},
        {"real64 P[] = {.5, +1.25E+2, -3, 1.0e22};", "real64 P[] = {0.5, 125.0, -3.0, 1.0e+22};"},
        {"boolean P = TRUE;", "boolean P = true;"},
        {"string P = \"a\" /* and */ \"b\" // then\n \"\\\"\\\\\\'\\t\\x41\\xe4\";",
         "string P = \"ab\\\"\\\\'\\x0009A\xC3\xA4\";"},
        {"char16 P[] = {'a', '\\n', '\\x20AC', '\xE2\x82\xAC', '\"'};",
         "char16 P[] = {'\\x0061', '\\x000A', '\\x20AC', '\\x20AC', '\\x0022'};"},
        {"datetime P = \"20240131235959.000000+060\";",
         "datetime P = \"20240131235959.000000+060\";"},
        {"datetime P = \"00000001******.******:000\";",
         "datetime P = \"00000001******.******:000\";"},
        {"string P = null;", "string P;"},
        {"string Of;", "string Of;"},
        {"uint8 Instance(string Scope, [Out] uint8 Class_[2]);",
         "uint8 Instance(\n        string Scope,\n        [Out]\n        uint8 Class_[2]);"},
        {"[Description(\"d\"), MaxLen(3) : DisableOverride ToSubclass, Values{\"x\", \"y\"}] "
         "string P;",
         "[Description(\"d\"),\n     MaxLen(3) : DisableOverride,\n     Values{\"x\", \"y\"}]\n"
         "    string P;"},
    };
    for (const auto& [declaration, expected] : rows) {
        Repository classes = load("\xEF\xBB\xBF class A { " + declaration + " };");
        std::string printed = classes->toMof(*classes->findClass("A"));
        EXPECT_EQ("class A {\n    " + expected + "\n};\n", printed);
        EXPECT_EQ(printed, load(printed)->toMof(*load(printed)->findClass("A")));
    }
}

const char* const kFamily = R"(
class Leaf : Middle { string L; uint16 State = NULL; [Override("Base.Name")] string NAME; };
[Description("m")] class Middle : base {
    uint16 State = 7;
    [Override("Go")] uint32 Go(uint8 Speed, string Reason[]);
};
[Abstract, Description("b")] class Base {
    [Key, MaxLen(9)] string Name = "none";
    uint16 State = 5;
    uint32 Go(uint8 Speed);
    boolean Stop([In(false), Out] Leaf ref Last[], [EmbeddedInstance("Middle")] string What);
};
[Abstract, Association] class Link { [Key] Base ref From; [Key] Base ref To; };
class LeafLink : Link { [Key, Description("f")] LEAF ref From; };
class Other {};
instance of Leaf as $leaf { [Key] Name = "l"; State = NULL; };
instance of Link { From = $leaf; To = "Leaf.Name=\"x\""; };
)";

TEST(ClassRepository, AnswersForInheritance) {
    Repository classes = load(kFamily);
    ASSERT_EQ(6u, classes->classes().size());
    EXPECT_EQ("Base", classes->classes()[0].name);  // before those that inherit from it
    const CimClass* leaf = classes->findClass("lEaF");
    ASSERT_TRUE(leaf);
    EXPECT_EQ("Base Middle Leaf ", names(leaf->lineage));
    EXPECT_EQ("Middle ", names(leaf->superclass->superclass->subclasses));
    EXPECT_EQ("Middle Leaf ", names(classes->findClass("Base")->allSubclasses()));
    EXPECT_TRUE(classes->isA("leaf", "BASE") && classes->isA("Leaf", "Leaf"));
    EXPECT_FALSE(classes->isA("Base", "Leaf") || classes->isA("Other", "Base") ||
                 classes->isA("Nothing", "Nothing"));
    EXPECT_TRUE(classes->findClass("Base")->flag("Abstract"));
    EXPECT_FALSE(leaf->isAssociation || leaf->qualifiers.find("Abstract"));
    EXPECT_EQ("m", leaf->qualifiers.find("description")->value.text());

    ASSERT_EQ(3u, leaf->properties.size());
    const CimProperty& name = leaf->properties[0];  // overridden in its old place
    EXPECT_EQ("NAME", name.name);
    EXPECT_TRUE(name.isKey);
    EXPECT_EQ("none", name.defaultValue.text());
    EXPECT_EQ(Value(std::uint32_t{9}), name.qualifiers.find("MaxLen")->value);
    EXPECT_EQ(std::vector<const CimProperty*>{&name}, leaf->keys);
    EXPECT_EQ(Value::null(CMPI_uint16), leaf->properties.find("STATE")->defaultValue);
    EXPECT_FALSE(leaf->properties.find("Go"));
    EXPECT_EQ(Value(std::uint16_t{7}), leaf->superclass->properties.find("State")->defaultValue);

    const CimClass* link = classes->findClass("LeafLink");
    EXPECT_TRUE(link->isAssociation);
    EXPECT_EQ("Leaf", link->properties.find("From")->referenceClass);
    EXPECT_EQ("Base", link->properties.find("To")->referenceClass);
    EXPECT_EQ(2u, link->keys.size());
}

TEST(ClassRepository, AnswersForMethods) {
    Repository classes = load(kFamily);
    const CimClass* leaf = classes->findClass("Leaf");
    const CimMethod* go = leaf->methods.find("go");
    ASSERT_TRUE(go);
    EXPECT_EQ(CMPI_uint32, go->type);
    ASSERT_EQ(2u, go->parameters.size());
    const CimParameter& reason = go->parameters[1];
    EXPECT_TRUE(reason.isArray && reason.flag("In", true) && !reason.flag("Out"));
    const CimMethod& stop = leaf->methods[1];
    const CimParameter* last = stop.parameters.find("last");
    EXPECT_EQ(CMPI_refA, typeOf(*last));
    EXPECT_TRUE(last->flag("Out") && !last->flag("In", true));
    EXPECT_EQ("Leaf", last->referenceClass);
    EXPECT_TRUE(stop.parameters[1].isEmbeddedObject);
    EXPECT_EQ("Middle", stop.parameters[1].embeddedClass);
}

TEST(ClassRepository, PrintsWhatItReadsAgain) {
    const auto printAll = [](const Repository& classes) {
        std::string all;
        for (const auto& cls : classes->classes()) {
            all += classes->toMof(*cls);
        }
        return all;
    };
    const Repository classes = load(kFamily);
    const std::string printed = printAll(classes);
    EXPECT_EQ(printed, printAll(load(printed)));
    EXPECT_EQ(
        "[Association]\nclass LeafLink : Link {\n    [Key,\n     Description(\"f\")]\n"
        "    Leaf ref From;\n    [Key]\n    Base ref To;\n};\n",
        classes->toMof(*classes->findClass("LeafLink")));
}

TEST(Mof, IncludesFiles) {
    const std::string again = "#PRAGMA INCLUDE (\"b.mof\")\n#pragma include (\"../sub/b.mof\")";
    Repository classes =
        loadFiles({{"dir/t.mof",
                    "#pragma locale (\"en_US\")\n#pragma include (\"sub/a.mof\") class T : A {};"},
                   {"dir/sub/a.mof", again + "class A : B {};"},
                   {"dir/sub/b.mof", "class B {};"}});
    EXPECT_EQ("B A T ", names(classes->findClass("T")->lineage));

    EXPECT_EQ("dir/t.mof:1:18: cannot read 'dir/no.mof': no such file",
              faultsOf({{"dir/t.mof", "#pragma include (\"no.mof\")"}}));
    EXPECT_EQ("dir/b.mof:2:18: cannot read 'dir/t.mof': it includes itself",
              faultsOf({{"dir/t.mof", "#pragma include (\"b.mof\")"},
                        {"dir/b.mof", "\n#pragma include (\"t.mof\")"}}));
    Files deep = {{"dir/t.mof", "#pragma include (\"0\")"}};
    for (int i = 0; i < 20; ++i) {
        deep["dir/" + std::to_string(i)] = "#pragma include (\"" + std::to_string(i + 1) + "\")";
    }
    EXPECT_EQ("dir/13:1:18: cannot read 'dir/14': files are included too deep", faultsOf(deep));

    for (const char* path : {"/nowhere.mof", "/dev/zero", "/"}) {
        EXPECT_THROW(ClassRepository::load(path), MofError) << path;
    }
}

TEST(Mof, BoundsWhatSmallTextsCanStandFor) {
    std::string chain = "class C0 {};";
    for (int i = 1; i < 100; ++i) {
        chain += "class C" + std::to_string(i) + " : C" + std::to_string(i - 1) + " {};";
    }
    EXPECT_NE(std::string::npos,
              faultsOf({{"dir/t.mof", chain}}).find("'C64' has more than 63 classes above it"));

    std::string wide = "class C {";
    for (int i = 0; i < 3000; ++i) {
        wide += "uint8 p" + std::to_string(i) + ";";
    }
    wide += "};";
    for (int i = 0; i < 1000; ++i) {
        wide += "class C" + std::to_string(i) + " : C {};";
    }
    EXPECT_NE(std::string::npos,
              faultsOf({{"dir/t.mof", wide}}).find("the classes have too many features"));
}

TEST(Schema, DescribesWhatItHolds) {
    Repository classes = ClassRepository::load(ZEM_MOF_DIR "/zem.mof");
    for (const auto& cls : classes->classes()) {
        for (const auto& property : cls->properties) {
            const CimQualifier* map = property->qualifiers.find("ValueMap");
            const CimQualifier* values = property->qualifiers.find("Values");
            EXPECT_TRUE(property->qualifiers.find("Description")) << property->name;
            EXPECT_TRUE(!map || !values ||
                        map->value.elements().size() == values->value.elements().size())
                << property->name;
        }
    }
}

}  // namespace
}  // namespace cimom
