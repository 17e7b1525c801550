// SPDX-License-Identifier: MIT
// The server as any HTTP client sees it: rows of request bytes, and what comes back.
#include "tests/pegasus/server/HttpExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>

#include <memory>

#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

namespace servertest {
namespace {

std::string getClassBody(const std::string& cim = "CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"",
                         const std::string& version = "1.0", const std::string& parameters = classNameParameter("C"))
{
    return "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM " + cim + ">\n<MESSAGE ID=\"7\" PROTOCOLVERSION=\"" +
           version +
           "\">\n<SIMPLEREQ>\n<IMETHODCALL NAME=\"GetClass\">\n<LOCALNAMESPACEPATH>\n<NAMESPACE NAME=\"root\"/>\n"
           "</LOCALNAMESPACEPATH>\n" +
           parameters + "</IMETHODCALL>\n</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n";
}

const std::string kOperation = "CIMOperation: MethodCall\r\n";
const std::string kMethod = "CIMMethod: GetClass\r\n";
const std::string kObject = "CIMObject: root\r\n";
const std::string kCim = kOperation + kMethod + kObject;

class ProtocolTest : public testing::Test
{
  protected:
    static void SetUpTestSuite()
    {
        fgTree = std::make_unique<ServerTree>();
        fgTree->start();
    }
    static void TearDownTestSuite() { fgTree.reset(); }

    static std::unique_ptr<ServerTree> fgTree;
};
std::unique_ptr<ServerTree> ProtocolTest::fgTree;

struct ErrorRow
{
    const char* name;
    std::string request;
    int status;
    const char* cimError;
    const char* detail; // the text's beginning
    bool closes;
};

const ErrorRow kErrorRows[] = {
    {"no request line", "hello there\r\n\r\n", 501, "", "", true},
    {"page request", "GET / HTTP/1.1\r\nHost: x\r\n\r\n", 404, "", "", true},
    {"another method", "PUT /cimom HTTP/1.1\r\nHost: x\r\nContent-Length: 0\r\n\r\n", 400, "", "", true},
    {"header without colon", "POST / HTTP/1.1\r\nHost x\r\n\r\n", 400, "", "The HTTP request is malformed", true},
    {"no length", "POST / HTTP/1.1\r\nHost: localhost\r\n" + kCim + "\r\n", 411, "", "", true},
    {"two lengths", "POST / HTTP/1.1\r\nContent-Length: 1\r\nContent-Length: 2\r\n\r\nab", 400, "", "The HTTP", true},
    {"negative length", "POST / HTTP/1.1\r\nContent-Length: -1\r\n\r\n", 400, "", "The HTTP", true},
    {"length and chunks", "POST / HTTP/1.1\r\nContent-Length: 5\r\nTransfer-Encoding: chunked\r\n\r\n0\r\n\r\n", 400,
     "", "The HTTP", true},
    {"bad chunk size", "POST / HTTP/1.1\r\nTransfer-Encoding: chunked\r\n\r\nzz\r\n\r\n", 400, "", "The HTTP", true},
    {"announced too large", "POST / HTTP/1.1\r\nContent-Length: 99999999999\r\n\r\n", 413, "", "The request body",
     true},
    {"chunk too large", "POST / HTTP/1.1\r\nTransfer-Encoding: chunked\r\n\r\n7fffffff\r\n", 413, "", "", true},
    {"no host", "POST / HTTP/1.1\r\nContent-Length: 0\r\n\r\n", 400, "", "HTTP request message lacks a Host", false},
    {"another host", "POST / HTTP/1.1\r\nHost: evil.example\r\nContent-Length: 0\r\n\r\n", 403, "",
     "The Host header must be localhost or a loopback address: evil.example", true},
    {"a web page's origin", post(kCim + "Origin: http://evil.example\r\n", getClassBody()), 403, "",
     "The Origin header must be localhost or a loopback address: http://evil.example", true},
    {"no operation", post(kMethod + kObject, getClassBody()), 400, "", "", false},
    {"other operation", post("CIMOperation: Bad\r\n" + kMethod + kObject, getClassBody()), 400, "unsupported-operation",
     "CIMOperation value \"Bad\"", false},
    {"no method header", post(kOperation + kObject, getClassBody()), 400, "header-mismatch", "Missing CIMMethod",
     false},
    {"empty method header", post(kOperation + "CIMMethod:\r\n" + kObject, getClassBody()), 400, "header-mismatch",
     "Empty CIMMethod value.", false},
    {"no object header", post(kOperation + kMethod, getClassBody()), 400, "header-mismatch", "Missing CIMObject",
     false},
    {"other method", post(kOperation + "CIMMethod: X\r\n" + kObject, getClassBody()), 400, "header-mismatch",
     "CIMMethod value \"X\" does not match CIM request method \"GetClass\".", false},
    {"other object", post(kOperation + kMethod + "CIMObject: root%2Fx\r\n", getClassBody()), 400, "header-mismatch",
     "CIMObject value \"root/x\" does not match CIM request object \"root\".", false},
    {"batch", post(kCim + "CIMBatch: x\r\n", getClassBody()), 501, "multiple-requests-unsupported", "", false},
    {"protocol header", post(kCim + "CIMProtocolVersion: 2.0\r\n", getClassBody()), 501, "unsupported-protocol-version",
     "", false},
    {"CIM version", post(kCim, getClassBody("CIMVERSION=\"9.9\" DTDVERSION=\"2.0\"")), 501, "unsupported-cim-version",
     "CIM version \"9.9\" is not supported.", false},
    {"DTD version", post(kCim, getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"3.1\"")), 501, "unsupported-dtd-version",
     "", false},
    {"no CIM version", post(kCim, getClassBody("DTDVERSION=\"2.0\"")), 400, "request-not-valid",
     "Validation error: on line 2: missing CIM.CIMVERSION attribute", false},
    {"message version", post(kCim, getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "2.0")), 400,
     "header-mismatch", "CIMProtocolVersion value \"1.0\" does not match CIM request protocol version \"2.0\".", false},
    {"empty body", post(kCim, ""), 400, "request-not-", "", false},
    {"text", post(kCim, "hello"), 400, "request-not-valid", "Validation error: on line 1", false},
    {"cut XML", post(kCim, getClassBody().substr(0, 200)), 400, "request-not-well-formed", "", false},
    {"not UTF-8", post(kCim, getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "1.0", "<!-- \xff -->")), 400,
     "request-not-valid", "Invalid UTF-8 character detected.", false},
    {"overlong UTF-8", post(kCim, "\xc0\xaf"), 400, "request-not-valid", "Invalid UTF-8 character detected.", false},
    {"another element for a class name",
     post(kCim, getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "1.0",
                             "<IPARAMVALUE NAME=\"ClassName\"><VALUE>C</VALUE></IPARAMVALUE>")),
     400, "request-not-valid", "Validation error: on line 9: expected CLASSNAME element", false},
    {"illegal class name",
     post(kCim, getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "1.0", classNameParameter("1bad"))), 400,
     "request-not-valid", "Semantic error: on line 10: Illegal value for CLASSNAME.NAME attribute", false},
    {"entity declaration",
     post(kCim, "<?xml version=\"1.0\"?>\n<!DOCTYPE CIM [<!ENTITY a \"b\">]>\n<CIM CIMVERSION=\"2.0\"></CIM>"), 400,
     "request-not-", "", false},
    {"unknown entity",
     post(kCim,
          getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "1.0",
                       classNameParameter("C") + "<IPARAMVALUE NAME=\"LocalOnly\"><VALUE>&x;</VALUE></IPARAMVALUE>")),
     400, "request-not-", "", false},
};

TEST_F(ProtocolTest, refusesWithStatusAndCause)
{
    for (const ErrorRow& row : kErrorRows) {
        SCOPED_TRACE(row.name);
        RawConnection connection(fgTree->port());
        connection.send(row.request);
        const HttpAnswer answer = connection.receive();
        EXPECT_EQ(answer.status, row.status) << answer.statusLine << header(answer, "pgerrordetail");
        EXPECT_EQ(header(answer, "cimerror").rfind(row.cimError, 0), 0u) << header(answer, "cimerror");
        EXPECT_EQ(header(answer, "pgerrordetail").rfind(row.detail, 0), 0u) << header(answer, "pgerrordetail");
        EXPECT_EQ(answer.headers.count("content-length"), 1u) << "a client would wait for more";
        if (row.closes) {
            EXPECT_TRUE(connection.isClosed());
        } else { // the stream is in step: the next request is served
            connection.send(post(kCim, getClassBody()));
            EXPECT_EQ(connection.receive().status, 200);
        }
    }
}

TEST_F(ProtocolTest, theServerOutlivesDeepAndWideInput)
{
    std::string deep;
    for (int i = 0; i < 100'000; ++i) {
        deep += "<A>";
    }
    const std::string wide = "<IPARAMVALUE NAME=\"" + std::string(1'000'000, 'x') + "\"></IPARAMVALUE>\n";
    std::string many = "<IPARAMVALUE";
    for (int i = 0; i < 10'000; ++i) {
        many += " A" + std::to_string(i) + "=\"\"";
    }
    const std::pair<const char*, std::string> rows[] = {
        {"100000 nested elements", deep}, {"a megabyte in an attribute", wide}, {"10000 attributes", many + "/>"}};
    for (const auto& [name, parameters] : rows) {
        SCOPED_TRACE(name);
        const HttpAnswer answer = exchange(
            fgTree->port(), post(kCim, getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "1.0", parameters)));
        EXPECT_EQ(answer.status, 413) << answer.statusLine;
        EXPECT_EQ(header(answer, "pgerrordetail").rfind("Limit exceeded", 0), 0u) << header(answer, "pgerrordetail");
    }
    EXPECT_EQ(exchange(fgTree->port(), post(kCim, getClassBody())).status, 200);
}

TEST_F(ProtocolTest, errorsGoIntoTheTrailerOrIntoTheBody)
{
    const HttpAnswer chunked = exchange(fgTree->port(), post(kCim + "TE: chunked, trailers\r\n", getClassBody()));
    EXPECT_EQ(chunked.trailers.at("cimstatuscode"), "6");
    EXPECT_EQ(chunked.trailers.at("cimstatuscodedescription"), "CIM_ERR_NOT_FOUND%3A%20C");
    EXPECT_EQ(chunked.body.find("<ERROR"), std::string::npos);
    EXPECT_NE(chunked.body.find("<MESSAGE ID=\"7\""), std::string::npos);

    const HttpAnswer plain = exchange(fgTree->port(), post(kCim, getClassBody()));
    EXPECT_EQ(plain.headers.count("transfer-encoding"), 0u);
    EXPECT_TRUE(plain.isComplete);
    EXPECT_NE(plain.body.find("<ERROR CODE=\"6\" DESCRIPTION=\"CIM_ERR_NOT_FOUND: C\"/>"), std::string::npos);
}

// What the parameters of an operation are is known by their names: a fault in them is the operation's error.
TEST_F(ProtocolTest, parametersAreCheckedByName)
{
    const std::string flag = "<IPARAMVALUE NAME=\"LocalOnly\"><VALUE>TRUE</VALUE></IPARAMVALUE>";
    const std::string name = classNameParameter("C");
    const std::tuple<const char*, const char*, std::string, const char*> rows[] = {
        {"required one missing", "GetClass", flag, "4"},
        {"required one without a value", "GetClass", "<IPARAMVALUE NAME=\"ClassName\"/>", "4"},
        {"optional one without a value", "GetClass", name + "<IPARAMVALUE NAME=\"LocalOnly\"/>", "6"},
        {"required one twice", "GetClass", name + name, "4"},
        {"optional one twice, in another case", "GetClass",
         name + flag + "<IPARAMVALUE NAME=\"localonly\"><VALUE>TRUE</VALUE></IPARAMVALUE>", "4"},
        {"unknown one", "GetClass", name + "<IPARAMVALUE NAME=\"Local\"><VALUE>TRUE</VALUE></IPARAMVALUE>", "7"},
        {"one of another operation", "EnumerateInstanceNames", name + flag, "7"},
        {"any of an operation without parameters", "EnumerateQualifiers", flag, "7"},
        {"one of two required", "GetProperty", "<IPARAMVALUE NAME=\"PropertyName\"><VALUE>P</VALUE></IPARAMVALUE>",
         "4"},
    };
    for (const auto& [what, method, parameters, status] : rows) {
        SCOPED_TRACE(what);
        const HttpAnswer answer = exchange(fgTree->port(), intrinsicRequest(method, "root", parameters));
        EXPECT_EQ(answer.status, 200);
        EXPECT_EQ(answer.trailers.at("cimstatuscode"), status) << header(answer, "cimstatuscodedescription");
    }
    EXPECT_NE(fgTree->log().find("request refused: parameter LocalOnly is unknown"), std::string::npos);
}

struct AcceptedRow
{
    const char* name;
    std::string request;
};

TEST_F(ProtocolTest, servesEveryFormThatClientsUse)
{
    const std::string body = getClassBody();
    const std::string length = "Content-Length: " + std::to_string(body.size()) + "\r\n";
    const std::string type = "Content-Type: application/xml; charset=utf-8\r\n";
    const AcceptedRow rows[] = {
        {"any path", "POST /other HTTP/1.1\r\nHost: localhost\r\n" + type + kCim + length + "\r\n" + body},
        {"padded length", "POST / HTTP/1.1\r\nHOST: \r\n" + type + kCim + "content-length: 0000000" +
                              std::to_string(body.size()) + "\r\n\r\n" + body},
        {"HTTP/1.0", "POST / HTTP/1.0\r\nHost: localhost\r\n" + type + kCim + length + "\r\n" + body},
        {"no charset",
         "POST / HTTP/1.1\r\nHost: localhost\r\nContent-Type: text/xml\r\n" + kCim + length + "\r\n" + body},
        {"unknown attributes", post(kCim, getClassBody("xmlns=\"urn:x\" CIMVERSION=\"2.0\" DTDVERSION=\"2.0\""))},
        {"HTTP/1.0 without Host", "POST / HTTP/1.0\r\n" + type + kCim + length + "\r\n" + body},
        {"quoted charset", "POST / HTTP/1.1\r\nHost: localhost\r\nContent-Type: text/xml; charset=\"UTF-8\"\r\n" +
                               kCim + length + "\r\n" + body},
        {"40 KB header", "POST / HTTP/1.1\r\nHost: localhost\r\nX-Big: " + std::string(40'000, 'a') + "\r\n" + type +
                             kCim + length + "\r\n" + body},
        {"chunks", "POST / HTTP/1.1\r\nHost: localhost\r\nTransfer-Encoding: chunked\r\n" + type + kCim + "\r\n5\r\n" +
                       body.substr(0, 5) + "\r\n" +
                       [](std::size_t n) {
                           char text[16];
                           std::snprintf(text, sizeof text, "%zx", n);
                           return std::string(text);
                       }(body.size() - 5) +
                       "\r\n" + body.substr(5) + "\r\n0\r\n\r\n"},
        {"M-POST", "M-POST / HTTP/1.1\r\nHost: localhost\r\nMan: http://www.dmtf.org/cim/mapping/http/v1.0; ns=40\r\n" +
                       type + length +
                       "40-CIMOperation: MethodCall\r\n40-CIMMethod: GetClass\r\n40-CIMObject: root\r\n\r\n" + body},
    };
    for (const AcceptedRow& row : rows) {
        SCOPED_TRACE(row.name);
        const HttpAnswer answer = exchange(fgTree->port(), row.request);
        EXPECT_EQ(answer.status, 200) << header(answer, "pgerrordetail");
        EXPECT_NE(answer.body.find("CIM_ERR_NOT_FOUND: C"), std::string::npos);
    }
}

TEST_F(ProtocolTest, keepsALineEndAndATabInAnAttribute)
{
    std::string body = getClassBody();
    body.replace(body.find("ID=\"7\""), 6, "ID=\"a\n\tb\"");
    const HttpAnswer answer = exchange(fgTree->port(), post(kCim, body));
    EXPECT_NE(answer.body.find("<MESSAGE ID=\"a&#10;&#9;b\""), std::string::npos) << answer.body;
}

// As paths relative to the namespace asked, and as the instances that the DMTF's clients look for.
TEST_F(ProtocolTest, namespacesAreListedBothWays)
{
    fgTree->compileBase();
    const std::tuple<const char*, const char*, std::vector<std::string>> rows[] = {
        {"__Namespace", "root", {"PG_InterOp", "PG_Internal"}},
        {"__Namespace", "root/PG_InterOp", {}},
        {"CIM_Namespace", "root/PG_InterOp", {"root", "root/PG_InterOp", "root/PG_Internal"}},
    };
    for (const auto& [className, nameSpace, names] : rows) {
        for (const std::string method : {"EnumerateInstances", "EnumerateInstanceNames"}) {
            SCOPED_TRACE(className + (" in " + std::string(nameSpace) + " by " + method));
            const HttpAnswer answer =
                exchange(fgTree->port(), intrinsicRequest(method, nameSpace, classNameParameter(className)));
            EXPECT_EQ(answer.status, 200);
            EXPECT_EQ(answer.trailers.count("cimstatuscode"), 0u);
            std::size_t found = 0;
            for (std::size_t at = 0; (at = answer.body.find("<INSTANCENAME ", at)) != std::string::npos; ++at) {
                ++found;
            }
            EXPECT_GE(found, names.size());
            EXPECT_EQ(found == 0, names.empty()) << answer.body;
            for (const std::string& name : names) {
                const std::string key = "<KEYBINDING NAME=\"Name\">\n<KEYVALUE VALUETYPE=\"string\">" + name + "<";
                EXPECT_NE(answer.body.find(key), std::string::npos) << name << "\n" << answer.body;
            }
        }
    }
}

TEST_F(ProtocolTest, keepsAliveAndServesPipelinedRequestsInOrder)
{
    RawConnection connection(fgTree->port());
    const std::string second = intrinsicRequest("EnumerateClassNames", "root", "");
    connection.send(post(kCim, getClassBody()) + second);
    EXPECT_NE(connection.receive().body.find("GetClass"), std::string::npos);
    EXPECT_NE(connection.receive().body.find("EnumerateClassNames"), std::string::npos);

    connection.send(post(kCim + "Connection: close\r\n", getClassBody()));
    EXPECT_EQ(connection.receive().status, 200);
    EXPECT_TRUE(connection.isClosed());
}

TEST_F(ProtocolTest, asksForTheBodyOfAClientThatWaits)
{
    RawConnection connection(fgTree->port());
    const std::string request = post(kCim + "Expect: 100-continue\r\n", getClassBody());
    const std::size_t body = request.find("\r\n\r\n") + 4;
    connection.send(request.substr(0, body));
    EXPECT_EQ(connection.receive().status, 100);
    connection.send(request.substr(body));
    EXPECT_EQ(connection.receive().status, 200);
}

TEST_F(ProtocolTest, aRequestThatEndsEarlyIsRefused)
{
    RawConnection connection(fgTree->port());
    const std::string request = post(kCim, getClassBody());
    connection.send(request); // once it is served, the server has looked who its peer is
    ASSERT_EQ(connection.receive().status, 200);
    connection.send(request.substr(0, request.size() - 10));
    connection.endSending();
    const HttpAnswer answer = connection.receive();
    EXPECT_EQ(answer.status, 400);
    EXPECT_EQ(header(answer, "cimerror"), "request-not-well-formed");
}

TEST_F(ProtocolTest, unknownAndUnsupportedOperations)
{
    const HttpAnswer unknown = exchange(fgTree->port(), intrinsicRequest("FooBar", "root", ""));
    EXPECT_NE(unknown.body.find("<ERROR CODE=\"7\" DESCRIPTION=\"CIM_ERR_NOT_SUPPORTED: "
                                "Unrecognized intrinsic method: FooBar\"/>"),
              std::string::npos);
    for (const char* method : {"DeleteClass", "ExecQuery", "Associators", "OpenEnumerateInstances", "ModifyClass"}) {
        SCOPED_TRACE(method);
        const HttpAnswer answer = exchange(fgTree->port(), intrinsicRequest(method, "root", ""));
        EXPECT_EQ(answer.trailers.at("cimstatuscode"), "7");
    }
}

// An unknown configuration property is refused, whatever the call asks to do with it.
TEST_F(ProtocolTest, anUnknownConfigurationPropertyIsNotFound)
{
    fgTree->compileBase();
    for (const std::string flags : {"", "<PARAMVALUE NAME=\"SetCurrentValue\"><VALUE>TRUE</VALUE></PARAMVALUE>",
                                    "<PARAMVALUE NAME=\"SetPlannedValue\"><VALUE>TRUE</VALUE></PARAMVALUE>",
                                    "<PARAMVALUE NAME=\"ResetValue\"><VALUE>TRUE</VALUE></PARAMVALUE>"})
    {
        SCOPED_TRACE(flags);
        const std::string body =
            "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"7\" "
            "PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><METHODCALL NAME=\"UpdatePropertyValue\"><LOCALINSTANCEPATH>"
            "<LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"PG_Internal\"/></LOCALNAMESPACEPATH>"
            "<INSTANCENAME CLASSNAME=\"PG_ConfigSetting\"><KEYBINDING NAME=\"PropertyName\"><KEYVALUE "
            "VALUETYPE=\"string\">nosuch</KEYVALUE></KEYBINDING></INSTANCENAME></LOCALINSTANCEPATH>" +
            flags + "</METHODCALL></SIMPLEREQ></MESSAGE></CIM>";
        const HttpAnswer answer = exchange(
            fgTree->port(), post(kOperation + "CIMMethod: UpdatePropertyValue\r\nCIMObject: "
                                              "root%2FPG_Internal%3APG_ConfigSetting.PropertyName%3D%22nosuch%22\r\n",
                                 body));
        EXPECT_NE(answer.body.find("<ERROR CODE=\"6\" DESCRIPTION=\"CIM_ERR_NOT_FOUND: Configuration property "
                                   "&quot;nosuch&quot;\"/>"),
                  std::string::npos)
            << answer.statusLine << header(answer, "pgerrordetail") << answer.body;
    }
}

// Runs `action` as another user. Returns: its exit status.
template <typename Action> int asNobody(const Action& action)
{
    const pid_t pid = ::fork();
    if (pid == 0) {
        ::_exit(::setgid(65534) == 0 && ::setuid(65534) == 0 ? action() : 99);
    }
    int status = 0;
    ::waitpid(pid, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

TEST_F(ProtocolTest, anotherUserIsNotServed)
{
    if (::geteuid() != 0) {
        GTEST_SKIP() << "needs root, to become somebody else";
    }
    const std::string create = intrinsicRequest(
        "CreateInstance", "root",
        "<IPARAMVALUE NAME=\"NewInstance\">\n<INSTANCE CLASSNAME=\"__Namespace\">\n<PROPERTY NAME=\"Name\" "
        "TYPE=\"string\">\n<VALUE>intruder</VALUE>\n</PROPERTY>\n</INSTANCE>\n</IPARAMVALUE>\n");
    EXPECT_EQ(asNobody([&] { return exchange(fgTree->port(), create).status; }), 0);
    // One that closes at once leaves a socket of which the kernel reports no owner, which must not pass for root.
    for (int i = 0; i < 50; ++i) {
        EXPECT_EQ(asNobody([&] {
                      RawConnection connection(fgTree->port());
                      return connection.send(create) ? 0 : 0;
                  }),
                  0);
    }
    EXPECT_TRUE(
        eventually([] { return fgTree->log().find("Refused a connection of user 65534.") != std::string::npos; }));
    const HttpAnswer names =
        exchange(fgTree->port(), intrinsicRequest("EnumerateInstanceNames", "root", classNameParameter("__Namespace")));
    EXPECT_EQ(names.status, 200);
    EXPECT_EQ(names.body.find("intruder"), std::string::npos);
}

// Tiny limits, so that each can be met.
class LimitsTest : public testing::Test
{
  protected:
    static void SetUpTestSuite()
    {
        fgTree = std::make_unique<ServerTree>();
        // More than one test's requests: a busy server notices late that a client has closed.
        fgTree->start({"maxConnections=20", "maxHeaderBytes=2000", "maxBodyBytes=3000", "maxXmlDepth=8",
                       "requestReadTimeout=1", "idleConnectionTimeout=2", "socketWriteTimeout=1"});
    }
    static void TearDownTestSuite() { fgTree.reset(); }

    static std::unique_ptr<ServerTree> fgTree;
};
std::unique_ptr<ServerTree> LimitsTest::fgTree;

TEST_F(LimitsTest, eachLimitHasItsStatus)
{
    const std::string spaces(2000, ' ');
    const std::string kChunked = "POST / HTTP/1.1\r\nHost: x\r\nTransfer-Encoding: chunked\r\n\r\n";
    const char* const kFraming = "A chunk extension or the trailer is larger than maxHeaderBytes.";
    const ErrorRow rows[] = {
        {"head", "POST / HTTP/1.1\r\nX: " + spaces + "\r\n\r\n", 431, "",
         "The request head is larger than maxHeaderBytes.", true},
        {"head without end", "POST / HTTP/1.1\r\nX: " + spaces + spaces, 431, "", "", true},
        {"trailer", kChunked + "0\r\nX: " + spaces + "\r\n\r\n", 431, "", kFraming, true},
        {"trailer without end", kChunked + "0\r\nX: " + spaces + spaces, 431, "", kFraming, true},
        {"chunk extension", kChunked + "1;" + spaces + "\r\nx\r\n", 431, "", kFraming, true},
        {"chunk extension without end", kChunked + "1;" + spaces + spaces, 431, "", kFraming, true},
        {"body", post(kCim, getClassBody() + spaces + spaces), 413, "", "The request body is larger than maxBodyBytes.",
         true},
        {"depth",
         post(kCim,
              getClassBody("CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"", "1.0", "<A><A><A><A><A></A></A></A></A></A>")),
         413, "request-not-valid", "Limit exceeded", false},
    };
    for (const ErrorRow& row : rows) {
        SCOPED_TRACE(row.name);
        const HttpAnswer answer = exchange(fgTree->port(), row.request);
        EXPECT_EQ(answer.status, row.status) << answer.statusLine;
        EXPECT_EQ(header(answer, "pgerrordetail").rfind(row.detail, 0), 0u) << header(answer, "pgerrordetail");
    }
}

TEST_F(LimitsTest, aSlowSenderIsToldAndEnded)
{
    RawConnection connection(fgTree->port());
    const std::string request = post(kCim, getClassBody());
    const auto begin = std::chrono::steady_clock::now();
    HttpAnswer answer;
    for (std::size_t i = 0; i < request.size() && answer.status == 0; ++i) {
        connection.send(request.substr(i, 1));
        answer = connection.receive(std::chrono::milliseconds(20));
    }
    EXPECT_EQ(answer.status, 408) << answer.statusLine;
    EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(20)) << "of the default's 30";
    EXPECT_TRUE(connection.isClosed());
}

TEST_F(LimitsTest, aSilentConnectionIsClosed)
{
    RawConnection connection(fgTree->port());
    connection.send(post(kCim, getClassBody()));
    EXPECT_EQ(connection.receive().status, 200);
    EXPECT_TRUE(connection.isClosed());
}

TEST_F(LimitsTest, oneConnectionMoreThanTheLimitIsRefused)
{
    std::vector<std::unique_ptr<RawConnection>> served;
    for (int i = 0; i < 20; ++i) {
        served.push_back(std::make_unique<RawConnection>(fgTree->port()));
        served.back()->send(post(kCim, getClassBody()));
        ASSERT_EQ(served.back()->receive().status, 200);
    }
    EXPECT_EQ(exchange(fgTree->port(), post(kCim, getClassBody())).status, 503);
    served.pop_back();
    EXPECT_TRUE(eventually([] { return exchange(fgTree->port(), post(kCim, getClassBody())).status == 200; }));
}

} // namespace
} // namespace servertest
