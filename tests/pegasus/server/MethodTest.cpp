// SPDX-License-Identifier: MIT
// What becomes of a method's parameters between a client and the provider.
#include "tests/pegasus/server/HttpExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>

namespace servertest {
namespace {

std::string value(const std::string& text)
{
    return "<VALUE>" + text + "</VALUE>";
}

std::string array(const std::vector<std::string>& texts)
{
    std::string element = "<VALUE.ARRAY>";
    for (const std::string& text : texts) {
        element += value(text);
    }
    return element + "</VALUE.ARRAY>";
}

// `type`: further attributes.
std::string parameter(const std::string& name, const std::string& content, const std::string& type = "")
{
    return "<PARAMVALUE NAME=\"" + name + "\"" + type + ">" + content + "</PARAMVALUE>";
}

const std::string kPath = "<VALUE.REFERENCE><INSTANCENAME CLASSNAME=\"Probe_Base\"><KEYBINDING NAME=\"Id\">"
                          "<KEYVALUE>a</KEYVALUE></KEYBINDING></INSTANCENAME></VALUE.REFERENCE>";
const std::string kObject = "&lt;INSTANCE CLASSNAME=\"Probe_Base\"&gt;&lt;PROPERTY NAME=\"Id\" TYPE=\"string\"&gt;"
                            "&lt;VALUE&gt;x&lt;/VALUE&gt;&lt;/PROPERTY&gt;&lt;/INSTANCE&gt;";

// Calls a method of Probe_Bulk. Returns: the whole answer.
std::string invoke(const ServerTree& tree, const std::string& method, const std::string& parameters)
{
    const std::string body =
        "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"7\" "
        "PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><METHODCALL NAME=\"" +
        method +
        "\"><LOCALCLASSPATH><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"probe\"/>"
        "</LOCALNAMESPACEPATH><CLASSNAME NAME=\"Probe_Bulk\"/></LOCALCLASSPATH>" +
        parameters + "</METHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    const HttpAnswer answer = exchange(tree.port(), post("CIMOperation: MethodCall\r\nCIMMethod: " + method +
                                                             "\r\nCIMObject: root%2Fprobe%3AProbe_Bulk\r\n",
                                                         body));
    return answer.statusLine + header(answer, "pgerrordetail") + answer.body;
}

struct ParameterRow
{
    const char* name;
    std::string parameters;
    std::string expected; // in the answer: "name:CMPI type=value;" as the provider got it, or the error
    const char* method = "Describe";
};

const std::string kMismatch = "<ERROR CODE=\"13\" DESCRIPTION=\"CIM_ERR_TYPE_MISMATCH: Probe_Bulk.Describe: ";
const std::string kInvalid = "<ERROR CODE=\"4\" DESCRIPTION=\"CIM_ERR_INVALID_PARAMETER: Probe_Bulk.Describe: ";

const ParameterRow kParameterRows[] = {
    {"boolean, and another case", parameter("flag", value("TRUE")), "flag:0002=1;"},
    {"uint8, its maximum", parameter("Small", value("255")), "Small:0080=255;"},
    {"sint64, its minimum", parameter("Large", value("-9223372036854775808")), "Large:00f0=-9223372036854775808;"},
    {"real32", parameter("Part", value("0.5")), "Part:0008=0.5;"},
    {"char16", parameter("Unit", value("V")), "Unit:0003=V;"},
    {"string of digits", parameter("Text", value("1200")), "Text:1600=1200;"},
    {"datetime", parameter("When", value("20260102030405.000000+000")), "When:1800=20260102030405.000000+000;"},
    {"array", parameter("List", array({"1", "65535"})), "List:2090=2 elements;"},
    {"empty array", parameter("List", array({})), "List:2090=0 elements;"},
    {"reference", parameter("Other", kPath), "Other:1100=to Probe_Base;"},
    {"path as a text", parameter("Other", value("Probe_Base.Id=\"a\"")), "Other:1100=to Probe_Base;"},
    {"array of paths as texts", parameter("Others", array({"Probe_Base.Id=\"a\""})), "Others:3100=1 elements;"},
    {"embedded instance as a text", parameter("Inner", value(kObject)), "Inner:1000=of x;"},
    {"embedded instance with its mark", parameter("Inner", value(kObject), " EmbeddedObject=\"instance\""),
     "Inner:1000=of x;"},
    {"embedded object", parameter("Any", value(kObject)), "Any:1000=of x;"},
    {"null", parameter("Large", ""), "Large:00f0=null;"},
    {"null for an array", parameter("List", ""), "List:0090=null;"},
    {"not declared", parameter("Nosuch", value("5")), "Nosuch:1600=5;"},
    {"one with a type, one without",
     parameter("Text", value("t"), " PARAMTYPE=\"string\"") + parameter("Small", value("7")),
     "Text:1600=t;Small:0080=7;"},
    {"typed otherwise than declared", parameter("Small", value("1200"), " PARAMTYPE=\"uint32\""), "Small:00a0="},

    {"uint8, beyond its maximum", parameter("Small", value("256")),
     kInvalid + "parameter &quot;Small&quot;: the value does not convert to uint8"},
    {"text for a number", parameter("Small", value("hello")), kInvalid},
    {"empty text for a number", parameter("Small", value("")), kInvalid},
    {"text for a boolean", parameter("Flag", value("1")), kInvalid},
    {"text for a datetime", parameter("When", value("now")), kInvalid},
    {"one element of an array", parameter("List", array({"1", "65536"})), kInvalid},
    {"text that is not a path", parameter("Other", value("a.b.c=")), kInvalid},
    {"text that is not an object", parameter("Inner", value("x")), kInvalid},
    {"array for a scalar", parameter("Small", array({"1"})),
     kMismatch + "parameter &quot;Small&quot; is declared uint8, but was sent as string[]"},
    {"scalar for an array", parameter("List", value("1")), kMismatch},
    {"reference for a number", parameter("Small", kPath), kMismatch},
    {"reference for a text", parameter("Text", kPath), kMismatch},
    {"embedded instance for a text", parameter("Text", value(kObject), " EmbeddedObject=\"instance\""), kMismatch},

    {"method that is not declared", parameter("Small", value("1")),
     "<ERROR CODE=\"17\" DESCRIPTION=\"CIM_ERR_METHOD_NOT_FOUND: Undeclared\"/>", "Undeclared"},
    {"method that is not declared, typed", parameter("Small", value("1"), " PARAMTYPE=\"uint8\""), "Small:0080=1;",
     "Undeclared"},
};

TEST(MethodTest, parametersWithoutATypeGetTheDeclaredOne)
{
    ServerTree tree;
    tree.start();
    tree.installProbe();
    for (const ParameterRow& row : kParameterRows) {
        SCOPED_TRACE(row.name);
        const std::string answer = invoke(tree, row.method, row.parameters);
        EXPECT_NE(answer.find(row.expected), std::string::npos) << row.expected << "\nin: " << answer;
    }
}

std::size_t countOf(const std::string& piece, const std::string& text)
{
    std::size_t count = 0;
    for (std::size_t at = text.find(piece); at != std::string::npos; at = text.find(piece, at + 1)) {
        ++count;
    }
    return count;
}

TEST(MethodTest, differencesFromTheDeclarationAreLoggedOnceAndBounded)
{
    ServerTree tree;
    tree.start();
    tree.installProbe();
    const std::string agreeing = parameter("Small", value("7"), " PARAMTYPE=\"uint8\"") +
                                 parameter("List", "", " PARAMTYPE=\"uint16\"") + parameter("Large", value("7")) +
                                 parameter("Any", value(kObject), " PARAMTYPE=\"string\" EmbeddedObject=\"instance\"");
    invoke(tree, "Describe", agreeing);
    EXPECT_EQ(countOf("Probe_Bulk.", tree.log()), 0u) << tree.log();

    for (const char* spelling : {"Small", "SMALL"}) {
        for (const char* type : {" PARAMTYPE=\"uint32\"", " PARAMTYPE=\"string\""}) {
            invoke(tree, "Describe", parameter(spelling, value("7"), type));
        }
    }
    EXPECT_EQ(countOf("Probe_Bulk.Describe: parameter \"Small\" is declared uint8, but was sent as uint32; the "
                      "provider gets it as sent",
                      tree.log()),
              1u)
        << tree.log();
    EXPECT_EQ(countOf("Probe_Bulk.", tree.log()), 1u) << tree.log();

    std::string many;
    for (int i = 0; i < 300; ++i) {
        many += parameter("N" + std::to_string(i), "");
    }
    invoke(tree, "SetCount", many);
    EXPECT_EQ(countOf("Probe_Bulk.SetCount: parameter \"N0\" is not declared", tree.log()), 1u);
    EXPECT_EQ(countOf("Probe_Bulk.", tree.log()), 256u);
}

} // namespace
} // namespace servertest
