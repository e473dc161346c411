// CIM-XML in this process: messages as clients send them, against the fixture provider.
#include <gtest/gtest.h>

#include <map>
#include <thread>

#include "CimXmlService.h"
#include "CimXmlWriter.h"
#include "Failure.h"
#include "Fixture.h"

namespace {

using Headers = std::map<std::string, std::string>;

std::string element(const std::string& name, const std::string& attributes,
                    const std::string& content = "") {
    return "<" + name + (attributes.empty() ? "" : " ") + attributes + ">" + content + "</" + name +
           ">";
}
std::string parameter(const std::string& name, const std::string& content) {
    return element("IPARAMVALUE", "NAME='" + name + "'", content);
}
std::string text(const std::string& name, const std::string& value) {
    return parameter(name, element("VALUE", "", value));
}
const std::string kPlace =
    "<LOCALNAMESPACEPATH><NAMESPACE NAME='root'/><NAMESPACE "
    "NAME='cimv2'/></LOCALNAMESPACEPATH>";
const std::string kThingClass = parameter("ClassName", "<CLASSNAME NAME='Fix_Thing'/>");
std::string thing(const std::string& name) {
    return element("INSTANCENAME", "CLASSNAME='Fix_Thing'",
                   element("KEYBINDING", "NAME='Name'", element("KEYVALUE", "", name)));
}
std::string property(const std::string& name, const std::string& value) {
    return element("PROPERTY", "TYPE='string' NAME='" + name + "'", element("VALUE", "", value));
}
std::string thingWith(const std::string& properties) {
    return element("INSTANCE", "CLASSNAME='Fix_Thing'", properties);
}
std::string message(const std::string& call) {
    return element(
        "CIM", "CIMVERSION='2.0' DTDVERSION='2.0'",
        element("MESSAGE", "ID='7' PROTOCOLVERSION='1.0'", element("SIMPLEREQ", "", call)));
}

class CimXml : public testing::Test {
protected:
    CimXml() {
        m_server.registerProvider("Fixture", {"Fix_Thing", "Fix_Link"}, fixture::factories(),
                                  {"root/cimv2"});
    }

    cimom::HttpAnswer post(const std::string& body, Headers headers) {
        headers.emplace("CIMOperation", "MethodCall");
        cimom::HttpRequest request;
        request.method = headers.count("Method") ? headers["Method"] : "POST";
        request.body = body;
        request.user = m_user;
        request.header = [&](const char* name) {
            const auto found = headers.find(name);
            return found == headers.end() ? nullptr : found->second.c_str();
        };
        return m_service.answer(request);
    }
    std::string answered(const cimom::HttpAnswer& answer) {
        EXPECT_EQ(answer.status, 200U) << answer.note;
        std::string body;
        while (answer.next && answer.next(body)) {
        }
        EXPECT_NO_THROW(cimom::parseXml(body)) << body;
        return body;
    }
    std::string ask(const std::string& operation, const std::string& parameters) {
        return answered(
            post(message(element("IMETHODCALL", "NAME='" + operation + "'", kPlace + parameters)),
                 {{"CIMMethod", operation}, {"CIMObject", "root%2Fcimv2"}}));
    }
    std::string invoke(const std::string& method, const std::string& parameters) {
        return answered(post(
            message(element("METHODCALL", "NAME='" + method + "'",
                            element("LOCALINSTANCEPATH", "", kPlace + thing("one")) + parameters)),
            {{"CIMMethod", method}, {"CIMObject", "root/cimv2:Fix_Thing.Name='one'"}}));
    }

    cimom::Server m_server{{cimom::Character::Full, "", {}, fixture::classes()}};
    cimom::CimXmlService m_service{m_server, fixture::classes().get(), cimom::Unfit::Refused};
    std::optional<std::string> m_user = "ann";
};

/// The first of the parts that does not stand in the text, in their order; nothing when all do.
/// Quotes are written here as XML lets them be in requests.
std::string missing(std::string text, const std::vector<std::string>& parts) {
    std::replace(text.begin(), text.end(), '"', '\'');
    std::size_t at = 0;
    for (const std::string& part : parts) {
        at = text.find(part, at);
        if (at == std::string::npos) {
            return part;
        }
    }
    return "";
}

std::string error(int code) { return "<ERROR CODE='" + std::to_string(code) + "'"; }

TEST_F(CimXml, OperationsAnswerOrTellWhyNot) {
    const std::string one = parameter("InstanceName", thing("one"));
    const std::string made = parameter("InstanceName", thing("new"));
    const std::string object = parameter("ObjectName", thing("one"));
    const std::string nix = parameter("ClassName", "<CLASSNAME NAME='Nix'/>");
    const std::string base = parameter("ClassName", "<CLASSNAME NAME='Fix_Base'/>");
    const std::string link = parameter("AssocClass", "<CLASSNAME NAME='Fix_Link'/>");
    const std::string deep = text("DeepInheritance", "true");
    const std::string size = text("PropertyName", "Size");
    const std::string sizes =
        parameter("PropertyList", "<VALUE.ARRAY><VALUE>size</VALUE></VALUE.ARRAY>");
    const std::string ofClass = parameter("ObjectName", "<CLASSNAME NAME='Fix_Thing'/>");
    const std::string modified = parameter(
        "ModifiedInstance",
        element("VALUE.NAMEDINSTANCE", "", thing("new") + thingWith(property("Size", "0x10"))));
    const std::string query =
        text("QueryLanguage", "WQL") + text("Query", "SELECT * FROM Fix_Thing WHERE Size = 1");
    const auto creating = [](const std::string& name, const std::string& value) {
        return parameter("NewInstance", thingWith(property("Name", "new") + property(name, value)));
    };
    const struct {
        const char* operation;
        std::string parameters;
        std::vector<std::string> parts;
    } rows[] = {
        {"GetInstance", one, {"ID='7'", "<IRETURNVALUE><INSTANCE CLASSNAME=", "<VALUE.NULL/>"}},
        {"getinstance", one + sizes, {"Thing'><PROPERTY NAME='Size' TYPE='uint32'><VALUE>1</V"}},
        {"GetInstance", made, {error(6), "no such thing"}},
        {"GetInstance", "", {error(4), "GetInstance needs InstanceName"}},
        {"GetInstance", one + one, {error(4), "stands twice"}},
        {"GetInstance", one + deep, {error(4), "GetInstance has no parameter DeepInheritance"}},
        {"GetInstance", one + text("LocalOnly", "perhaps"), {error(4), "LocalOnly"}},
        {"EnumerateInstances", base, {"<VALUE.NAMEDINSTANCE><INSTANCENAME", "two, &"}},
        {"EnumerateInstances", nix, {error(5)}},
        {"ExecQuery", query, {"<VALUE.OBJECTWITHPATH><INSTANCEPATH><NAMESPACEPATH><HOST>"}},
        {"CreateInstance", creating("Size", "3"), {"<INSTANCENAME CLASSNAME='Fix_Thing'", ">new<"}},
        {"CreateInstance", creating("Size", "3"), {error(11)}},
        {"CreateInstance", creating("Size", "-1"), {error(13)}},
        {"CreateInstance", creating("Colour", "red"), {error(12)}},
        {"ModifyInstance", modified, {"<IMETHODRESPONSE NAME='ModifyInstance'></IMETHODRESPONSE>"}},
        {"GetProperty", made + size, {"<IRETURNVALUE><VALUE>16</VALUE></IRETURNVALUE>"}},
        {"SetProperty", made + size + text("NewValue", "17"), {"NAME='SetProperty'></IMETH"}},
        {"SetProperty", one + text("PropertyName", "Hue"), {error(12)}},
        {"DeleteInstance", made, {"></IMETHODRESPONSE>"}},
        {"DeleteInstance", made, {error(6)}},
        {"Associators", object + link, {"<VALUE.OBJECTWITHPATH><INSTANCEPATH>", "<INSTANCE CLASS"}},
        {"AssociatorNames", object + text("Role", "Dependent"), {"<IRETURNVALUE></IRETURNVALUE>"}},
        {"AssociatorNames", ofClass, {error(7)}},
        {"References", object, {"<PROPERTY.REFERENCE NAME='Antecedent'><VALUE.REFERENCE>"}},
        {"ReferenceNames", object, {"<KEYBINDING NAME='Antecedent'><VALUE.REFERENCE><LOCALINST"}},
        {"GetClass",
         kThingClass,
         {"<CLASS NAME='Fix_Thing' SUPERCLASS='Fix_Base'><PROPERTY NAME='Size'",
          "NAME='State' TYPE='uint16' PROPAGATED='false'><VALUE>5<", "EmbeddedObject='inst",
          "<METHOD NAME='Echo'", "<PARAMETER.REFERENCE NAME='Thing' REFERENCECLASS="}},
        {"GetClass",
         kThingClass + text("LocalOnly", "FALSE") + text("IncludeClassOrigin", "TRUE"),
         {"<PROPERTY NAME='Name' TYPE='string' CLASSORIGIN='Fix_Base' PROPAGATED='true'>"}},
        {"EnumerateClasses", "", {"<CLASS NAME='Fix_Base'>", "<CLASS NAME='Fix_Link'>"}},
        {"EnumerateClassNames", deep, {"NAME='Fix_Base'", "NAME='Fix_Thing'"}},
        {"GetQualifier", text("QualifierName", "key"), {"SCOPE CLASS='false'", "PERTY='true'"}},
        {"DeleteClass", kThingClass, {error(7)}},
    };
    for (const auto& row : rows) {
        const std::string answer = ask(row.operation, row.parameters);
        EXPECT_EQ(missing(answer, row.parts), "") << row.operation << ": " << answer;
    }
    EXPECT_EQ(ask("EnumerateClassNames", "").find("Fix_Thing"), std::string::npos);
    EXPECT_EQ(m_server.liveObjects(), 0U);
}

TEST_F(CimXml, MethodsTakeAndGiveWhatValuesThereAre) {
    const auto argument = [](const std::string& attributes, const std::string& content) {
        return element("PARAMVALUE", attributes, content);
    };
    const std::string part =
        "<VALUE>&lt;INSTANCE CLASSNAME='Fix_Thing'>&lt;PROPERTY NAME='Name' "
        "TYPE='string'>&lt;VALUE>a&amp;lt;\xC3\xBC&amp;#10;&lt;/VALUE>"
        "&lt;/PROPERTY>&lt;/INSTANCE></VALUE>";
    const struct {
        std::string method, parameters;
        std::vector<std::string> parts;
    } rows[] = {
        {"Echo",
         argument("NAME='Number' PARAMTYPE='uint16'", "<VALUE> 5 </VALUE>") +
             argument("NAME='names'", "<VALUE.ARRAY><VALUE> a</VALUE><VALUE.NULL/></VALUE.ARRAY>") +
             argument("NAME='Thing'", element("VALUE.REFERENCE", "", thing("q"))) +
             argument("NAME='Parts'", element("VALUE.ARRAY", "", part)),
         {"<METHODRESPONSE NAME='Echo'><RETURNVALUE PARAMTYPE='uint32'><VALUE>4</VALUE></RETURN",
          "<PARAMVALUE NAME='Number' PARAMTYPE='uint16'><VALUE>5<",
          "NAME='Names' PARAMTYPE='string'><VALUE.ARRAY><VALUE> a</VALUE><VALUE.NULL/><",
          "PARAMTYPE='reference'><VALUE.REFERENCE><INSTANCENAME",
          "EmbeddedObject='instance'><VALUE.ARRAY><VALUE>&lt;", "a&amp;lt;\xC3\xBC&amp;#10;"}},
        {"Echo", argument("NAME='Names'", "<VALUE>a</VALUE>"), {error(13)}},
        {"Echo", argument("NAME='Number'", "<VALUE>70000</VALUE>"), {error(13)}},
        {"Echo", argument("NAME='Other'", "<VALUE>7</VALUE>"), {error(4)}},
        {"Echo",
         argument("NAME='Parts'", "<VALUE.ARRAY><VALUE>x</VALUE></VALUE.ARRAY>"),
         {error(4)}},
        {"Context", "", {"<PARAMVALUE NAME='CMPIPrincipal' PARAMTYPE='string'><VALUE>ann<"}},
        {"Dance", "", {error(17)}},
    };
    for (const auto& row : rows) {
        const std::string answer = invoke(row.method, row.parameters);
        EXPECT_EQ(missing(answer, row.parts), "") << row.method << ": " << answer;
    }
}

TEST_F(CimXml, WhatIsNoRequestIsRefusedByHttp) {
    const std::string fine = message(element("IMETHODCALL", "NAME='EnumerateClassNames'", kPlace));
    const Headers head = {{"CIMMethod", "EnumerateClassNames"}, {"CIMObject", "root/cimv2"}};
    const auto with = [&](const std::string& name, const std::string& value) {
        Headers headers = head;
        headers[name] = value;
        return headers;
    };
    const auto replaced = [&](const std::string& what, const std::string& by) {
        std::string body = fine;
        return body.replace(body.find(what), what.size(), by);
    };
    std::string deep, many = "<CIM>";
    for (int i = 0; i < 70000; ++i) {
        deep += "<A>";
        many += "<A/><A/><A/>";
    }
    const std::string form = "400 request-not-well-formed", valid = "400 request-not-valid";
    const std::string batches = "501 multiple-requests-unsupported";
    const auto declaring = [&](const std::string& what) {
        return "<!DOCTYPE CIM [" + what + "]>" + replaced("root", "&b;");
    };
    const std::string placed = "</LOCALNAMESPACEPATH>";
    const std::string odd = "<IPARAMVALUE NAME='ClassName'><VALUE/></IPARAMVALUE>";
    const struct {
        std::string body, answer;
    } bodies[] = {
        {fine, "200 "},
        {"<?xml version='1.0'?><!DOCTYPE CIM SYSTEM 'http://host.invalid/cim.dtd'>" + fine, "200 "},
        {"", form},
        {fine.substr(0, fine.size() - 9), form},
        {replaced("root", "\xFF"), form},
        {"<?xml version='1.0' encoding='utf-7'?>" + replaced("root", "\xE2\x82\xAC"), form},
        {deep, form},
        {many, form},
        {replaced("<CIM ", "<CIM " + std::string(30000, ' ')), form},
        {declaring("<!ENTITY a 'aaaa'><!ENTITY b '&a;&a;'>"), form},
        {declaring("<!ENTITY b SYSTEM 'file:///etc/passwd'>"), form},
        {declaring("<!ENTITY b 'root'>"), form},
        {declaring("<!ATTLIST NAMESPACE X CDATA 'xxxxxxxxxxxx'>"), form},
        {"<HTML/>", valid},
        {replaced("<NAMESPACE NAME='root'/>", "<ROOT/>"), valid},
        {replaced(placed, placed + odd), valid},
        {replaced("'root'", "'/root'"), valid},
        {replaced("CIMVERSION='2.0", "CIMVERSION='3.0"), "501 unsupported-cim-version"},
        {replaced("SIMPLEREQ", "MULTIREQ").replace(fine.rfind("SIMPLEREQ") - 1, 9, "MULTIREQ"),
         batches},
    };
    const struct {
        const char *name, *value;
        std::string answer;
    } heads[] = {
        {"CIMBatch", "", batches},
        {"CIMOperation", "Dance", "501 unsupported-operation"},
        {"CIMMethod", "EnumerateClasses", "400 header-mismatch"},
        {"CIMObject", "root/other", "400 header-mismatch"},
        {"Content-Type", "text/plain", "415 "},
        {"Method", "GET", "405 "},
        {"Method", "M-POST", "501 "},
    };
    const auto said = [&](const std::string& body, const Headers& headers) {
        const cimom::HttpAnswer answer = post(body, headers);
        std::string all = std::to_string(answer.status) + " ";
        for (const auto& [name, value] : answer.headers) {
            all += name == "CIMError" ? value : "";
        }
        return all;
    };
    testing::internal::CaptureStderr();
    for (const auto& row : bodies) {
        EXPECT_EQ(said(row.body, head), row.answer) << row.body.substr(0, 300);
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
    for (const auto& row : heads) {
        EXPECT_EQ(said(fine, with(row.name, row.value)), row.answer) << row.name;
    }
    const std::string elsewhere = replaced("cimv2", "nix");
    EXPECT_EQ(missing(answered(post(elsewhere, with("CIMObject", "root/nix"))), {error(3)}), "");
}

std::string contextIn(const std::string& answer) {
    const std::size_t at = answer.find("<VALUE>", answer.find("\"EnumerationContext\"")) + 7;
    return text("EnumerationContext", answer.substr(at, answer.find('<', at) - at));
}

TEST_F(CimXml, EnumerationsArePulledByTheirOwnerUntilTheirEnd) {
    const auto pull = [&](const char* operation, const std::string& context, const char* most) {
        return ask(operation, context + text("MaxObjectCount", most));
    };
    const std::string end = "'EndOfSequence' PARAMTYPE='boolean'><VALUE>TRUE";
    const std::string more = "'EndOfSequence' PARAMTYPE='boolean'><VALUE>FALSE";
    const std::string opened =
        ask("OpenEnumerateInstances", kThingClass + text("MaxObjectCount", "1"));
    EXPECT_EQ(missing(opened, {"<VALUE.INSTANCEWITHPATH><INSTANCEPATH>", "one", more}), "");
    const std::string context = contextIn(opened);
    m_user = "eve";
    EXPECT_EQ(missing(pull("PullInstancesWithPath", context, "1"), {error(21)}), "");
    m_user = "ann";
    EXPECT_EQ(missing(pull("PullInstancePaths", context, "1"), {error(21)}), "");
    EXPECT_EQ(missing(pull("PullInstancesWithPath", context, "0"), {"<IRETURNVALUE></IR", more}),
              "");
    EXPECT_EQ(missing(pull("PullInstancesWithPath", context, "9"), {"two", "<VALUE></V", end}), "");
    EXPECT_EQ(missing(pull("PullInstancesWithPath", context, "9"), {error(21)}), "");

    const std::string object = parameter("InstanceName", thing("one"));
    const struct {
        const char* open;
        std::string parameters;
        const char* pull;
        const char* part;
    } rows[] = {
        {"OpenEnumerateInstancePaths", kThingClass, "PullInstancePaths",
         "<IRETURNVALUE><INSTANCEP"},
        {"OpenAssociatorInstances", object, "PullInstancesWithPath", "<VALUE.INSTANCEWITHPATH>"},
        {"OpenAssociatorInstancePaths", object, "PullInstancePaths", "'Fix_Thing'"},
        {"OpenReferenceInstances", object, "PullInstancesWithPath", "<INSTANCE CLASSNAME='Fix_L"},
        {"OpenReferenceInstancePaths", object, "PullInstancePaths", "'Fix_Link'"},
        {"OpenQueryInstances",
         text("FilterQueryLanguage", "WQL") + text("FilterQuery", "SELECT * FROM Fix_Thing"),
         "PullInstances", "<IRETURNVALUE><INSTANCE CLASSNAME"},
    };
    for (const auto& row : rows) {
        const std::string kept = ask(row.open, row.parameters);
        EXPECT_EQ(missing(kept, {"<IRETURNVALUE></IRETURNVALUE>", more}), "") << kept;
        EXPECT_EQ(missing(pull(row.pull, contextIn(kept), "9"), {row.part, end}), "") << row.open;
    }
    const struct {
        std::string parameter;
        int error;
    } refused[] = {{text("OperationTimeout", "0"), 22},
                   {text("OperationTimeout", "601"), 22},
                   {text("ContinueOnError", "true"), 26},
                   {text("FilterQuery", "x"), 25}};
    for (const auto& row : refused) {
        EXPECT_EQ(
            missing(ask("OpenEnumerateInstances", kThingClass + row.parameter), {error(row.error)}),
            "");
    }
}

TEST_F(CimXml, OpenEnumerationsAreBoundedInNumberAndTime) {
    const std::string brief = kThingClass + text("OperationTimeout", "1");
    for (std::size_t i = 1; i < cimom::CimXmlPulls::kMostOpen; ++i) {
        ASSERT_EQ(missing(ask("OpenEnumerateInstances", kThingClass), {"FALSE"}), "");
    }
    ASSERT_EQ(missing(ask("OpenEnumerateInstances", brief), {"FALSE"}), "");
    EXPECT_EQ(missing(ask("OpenEnumerateInstances", brief), {error(27)}), "");
    std::this_thread::sleep_for(std::chrono::milliseconds(1100));
    const std::string context = contextIn(ask("OpenEnumerateInstances", brief));
    EXPECT_EQ(missing(ask("CloseEnumeration", context), {"></IMETHODRESPONSE>"}), "");
    EXPECT_EQ(missing(ask("CloseEnumeration", context), {error(21)}), "");
}

// Whatever providers return, the document can be read.
TEST_F(CimXml, TextThatXmlCannotHoldIsReplaced) {
    const std::string bad = "\xEF\xBF\xBD";
    const struct {
        std::string text, written;
    } rows[] = {
        {"a\tb\n\r<>&\"", "a&#9;b&#10;&#13;&lt;&gt;&amp;&quot;"},
        {std::string("\0\x01\x1F", 3), bad + bad + bad},
        {"\xC3\xBC\xE2\x82\xAC\xF0\x9F\x98\x80", "\xC3\xBC\xE2\x82\xAC\xF0\x9F\x98\x80"},
        {"\xFF\xC3", bad + bad},
        {"\xC0\xAF", bad + bad},
        {"\xED\xA0\x80", bad + bad + bad},
        {"\xEF\xBF\xBF", bad + bad + bad},
        {"\xF4\x90\x80\x80", bad + bad + bad + bad},
    };
    for (const auto& row : rows) {
        std::string out;
        cimom::writeXmlText(out, row.text);
        EXPECT_EQ(out, row.written);
    }
}

}  // namespace
