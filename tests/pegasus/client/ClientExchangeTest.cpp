// SPDX-License-Identifier: MIT
// A client and a peer that plays good and bad answers: the exceptions, the deadline, and that the next call works.
#include "pegasus/wire/ElementEncoder.h"
#include "tests/support/PeerAnswers.h"

#include <Pegasus/Client/CIMClient.h>

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <csignal>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <thread>
#include <vector>

#include <cxxabi.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

using namespace Pegasus;
using test::PeerAnswer;
using test::PeerRequest;

namespace {

constexpr const char* kNameSpace = "root/cimv2";
// Far more than any of these calls needs, far less than a hang.
constexpr Uint32 kTimeoutMs = 10000;
constexpr Uint32 kShortTimeoutMs = 200;
// Longer than a call lasts even on a busy machine with a sanitizer.
constexpr std::chrono::minutes kHang(2);

CIMClass fanClass()
{
    CIMClass fan("T_Fan", "CIM_Fan");
    CIMProperty id("DeviceID", CIMValue(CIMTYPE_STRING, false));
    id.addQualifier(CIMQualifier("Key", CIMValue(true), CIMFlavor::DEFAULTS));
    fan.addProperty(id);
    fan.addProperty(CIMProperty("Speed", CIMValue(CIMTYPE_UINT64, false)));
    return fan;
}

CIMInstance fan(const char* id, Uint64 speed)
{
    CIMInstance instance("T_Fan");
    instance.addProperty(CIMProperty("DeviceID", String(id)));
    instance.addProperty(CIMProperty("Speed", CIMValue(speed)));
    instance.setPath(instance.buildPath(fanClass()));
    return instance;
}

void connect(CIMClient& client, const test::ScriptedPeer& peer, Uint32 timeoutMs = kTimeoutMs)
{
    client.setTimeout(timeoutMs);
    client.connect("127.0.0.1", peer.port(), String(), String());
}

// "Pegasus::X: message" of what the call throws; "ok" when it returns.
template <typename Call> std::string outcome(Call&& call)
{
    try {
        call();
        return "ok";
    } catch (const Exception& exception) {
        const std::unique_ptr<char, decltype(&std::free)> name(
            abi::__cxa_demangle(typeid(exception).name(), nullptr, nullptr, nullptr), &std::free);
        return std::string(name.get()) + ": " + std::string(exception.getMessage().getCString());
    }
}

// What the call throws, when it takes the time-out's time.
template <typename Call> std::string outcomeInTime(Call&& call)
{
    const auto start = std::chrono::steady_clock::now();
    const std::string result = outcome(call);
    const auto took = std::chrono::steady_clock::now() - start;
    EXPECT_GE(took, std::chrono::milliseconds(kShortTimeoutMs));
    EXPECT_LT(took, kHang);
    return result;
}

PeerAnswer good(const PeerRequest& request)
{
    return test::classAnswer(request, fanClass());
}

std::string getClassOutcome(CIMClient& client)
{
    return outcome([&] { client.getClass(kNameSpace, "T_Fan", false); });
}

struct Fault
{
    const char* name;
    PeerAnswer (*answer)(const PeerRequest&);
    const char* outcome; // how it begins
};

const Fault kFaults[] = {
    {"closes without a byte", [](const PeerRequest&) { return test::closedConnection(); },
     "Pegasus::CIMClientMalformedHTTPException: Connection closed by CIM Server."},
    {"not HTTP", [](const PeerRequest&) { return test::notHttp(); },
     "Pegasus::CIMClientMalformedHTTPException: Malformed HTTP response message."},
    {"closes in the header", [](const PeerRequest& r) { return test::cutAt(good(r), 40); },
     "Pegasus::CIMClientMalformedHTTPException: Missing CIMOperation HTTP header"},
    {"closes in the body", [](const PeerRequest& r) { return test::cutAt(good(r), 400); },
     "Pegasus::CIMClientXmlException: Validation error: on line "},
    {"a length that is too big", [](const PeerRequest& r) { return test::withWrongLength(good(r), 5); },
     "Pegasus::CIMClientXmlException: "},
    {"a length that is too small", [](const PeerRequest& r) { return test::withWrongLength(good(r), -15); },
     "Pegasus::CIMClientXmlException: "},
    {"end tag of another element",
     [](const PeerRequest& r) { return test::withReplaced(good(r), "</CLASS>", "</CLAZZ>"); },
     "Pegasus::CIMClientXmlException: Not well-formed: on line "},
    {"an element that nobody knows",
     [](const PeerRequest& r) { return test::withReplaced(good(r), "PROPERTY", "PROPPETY"); },
     "Pegasus::CIMClientXmlException: Validation error: on line "},
    {"an unknown type", [](const PeerRequest& r) { return test::withReplaced(good(r), "uint64", "uint46"); },
     "Pegasus::CIMClientXmlException: Semantic error: on line "},
    {"a null among embedded objects",
     [](const PeerRequest& r) {
         return test::httpAnswer(test::intrinsicBody(
             r, "<CLASS NAME=\"T_Fan\"><PROPERTY.ARRAY NAME=\"E\" TYPE=\"string\" EmbeddedObject=\"object\">"
                "<VALUE.ARRAY><VALUE.NULL/></VALUE.ARRAY></PROPERTY.ARRAY></CLASS>"));
     },
     "Pegasus::CIMClientXmlException: Validation error: on line "},
    {"another message's id", [](const PeerRequest& r) { return test::withReplaced(good(r), "ID=\"1", "ID=\"9"); },
     "Pegasus::CIMClientResponseException: Mismatched response message ID:  Got \"9"},
    {"another operation's answer",
     [](const PeerRequest& r) { return test::withReplaced(good(r), "NAME=\"GetClass\"", "NAME=\"GetClasz\""); },
     "Pegasus::CIMClientXmlException: Validation error: on line "},
    {"a known operation's answer",
     [](const PeerRequest& r) {
         PeerRequest other = r;
         other.head = "POST /cimom HTTP/1.1\r\nCIMMethod: EnumerateInstances\r\n";
         return good(other);
     },
     "Pegasus::CIMClientResponseException: Mismatched response:  Got an answer to \"EnumerateInstances\""},
    {"a second class",
     [](const PeerRequest& r) {
         std::string xml;
         wire::appendClass(xml, fanClass());
         return test::httpAnswer(test::intrinsicBody(r, xml + xml));
     },
     "Pegasus::CIMClientXmlException: Validation error: on line "},
    {"no result", [](const PeerRequest& r) { return test::httpAnswer(test::intrinsicBody(r, "")); },
     "Pegasus::CIMClientXmlException: Validation error: on line 11: expected ERROR or IRETURNVALUE element with CLASS "
     "(GetClass answer, column "},
    {"another content type",
     [](const PeerRequest& r) { return test::withReplaced(good(r), "application", "applicatiom"); },
     "Pegasus::CIMClientMalformedHTTPException: Bad Content-Type HTTP header; applicatiom/xml; charset=utf-8"},
    {"status 400",
     [](const PeerRequest&) {
         return test::httpErrorAnswer(400, "Bad Request",
                                      "CIMError: request-not-valid\r\nPGErrorDetail: on%20line%201\r\n");
     },
     "Pegasus::CIMClientHTTPErrorException: HTTP Error (400 Bad Request): CIMError = \"request-not-valid\" "
     "Detail = \"on line 1\"."},
    {"status 401",
     [](const PeerRequest&) { return test::httpErrorAnswer(401, "Unauthorized", "WWW-Authenticate: Basic \"x\"\r\n"); },
     "Pegasus::CIMClientHTTPErrorException: HTTP Error (401 Unauthorized)."},
    {"CIM error in the body", [](const PeerRequest& r) { return test::errorAnswer(r, 6, "gone"); },
     "Pegasus::CIMException: gone"},
    {"CIM error in the trailer", [](const PeerRequest& r) { return test::trailerErrorAnswer(r, 6, "gone é"); },
     "Pegasus::CIMException: gone é"},
};

} // namespace

TEST(ClientExchange, ReadsClassesAndInstancesOverOneConnection)
{
    test::ServedModel model;
    model.addClass(kNameSpace, fanClass()).addInstance(kNameSpace, fan("a", 1)).addInstance(kNameSpace, fan("b", 2));
    test::ScriptedPeer peer(model.handler());
    CIMClient client;
    connect(client, peer);

    for (int i = 0; i < 3; ++i) {
        CIMClass read = client.getClass(kNameSpace, "t_fan", false);
        EXPECT_TRUE(read.identical(fanClass())) << i;
        read.removeProperty(0);
    }
    const Array<CIMInstance> fans = client.enumerateInstances(kNameSpace, "T_Fan", false);
    ASSERT_EQ(fans.size(), 2u);
    EXPECT_TRUE(fans[1].identical(fan("b", 2)));
    EXPECT_EQ(peer.connectionCount(), 1u);
}

TEST(ClientExchange, EachFaultHasItsExceptionAndTheNextCallWorks)
{
    for (const Fault& fault : kFaults) {
        for (const char* classIs : {"new", "known"}) {
            SCOPED_TRACE(std::string(fault.name) + ", the class is " + classIs);
            test::ServedModel model;
            model.addClass(kNameSpace, fanClass());
            test::ScriptedPeer peer(model.handler());
            CIMClient client;
            connect(client, peer);
            if (std::string(classIs) == "known") {
                EXPECT_EQ(getClassOutcome(client), "ok");
            }
            model.addFault("GetClass", fault.answer);
            const std::string result = getClassOutcome(client);
            EXPECT_EQ(result.rfind(fault.outcome, 0), 0u) << result;
            EXPECT_EQ(getClassOutcome(client), "ok");
        }
    }
}

// A limit holds from the next call on, for one answer at a time.
TEST(ClientExchange, MemoryOfAnAnswerHasALimitThatCanBeSet)
{
    test::ServedModel model;
    model.addClass(kNameSpace, fanClass()).addInstance(kNameSpace, fan("a", 1)).addInstance(kNameSpace, fan("b", 2));
    test::ScriptedPeer peer(model.handler());
    CIMClient client;
    connect(client, peer);
    const auto enumerate = [&] { return outcome([&] { client.enumerateInstances(kNameSpace, "T_Fan", false); }); };
    EXPECT_EQ(client.getMaxDecodedBytes(), 256u << 20);
    EXPECT_EQ(enumerate(), "ok");
    client.setMaxDecodedBytes(300);
    const std::string refused = enumerate();
    EXPECT_EQ(refused.rfind("Pegasus::CIMClientXmlException: ", 0), 0u) << refused;
    EXPECT_NE(refused.find("objects of more than 300 bytes in one answer (maxDecodedBytes)"), std::string::npos)
        << refused;
    client.setMaxDecodedBytes(6000);
    for (int i = 0; i < 20; ++i) {
        ASSERT_EQ(enumerate(), "ok") << i;
    }
}

TEST(ClientExchange, ComplaintsAboutXmlNameOperationPlaceAndCause)
{
    test::ScriptedPeer peer([](const PeerRequest& r) { return test::withReplaced(good(r), "uint64", "uint46"); });
    CIMClient client;
    connect(client, peer);
    EXPECT_EQ(getClassOutcome(client),
              "Pegasus::CIMClientXmlException: Semantic error: on line 13: Illegal value for PROPERTY.TYPE attribute "
              "(GetClass answer, column 1)");
}

TEST(ClientExchange, PiecesOfOneByteMakeTheSameAnswer)
{
    test::ScriptedPeer peer([](const PeerRequest& r) {
        return test::inPieces(test::chunkedAnswer(test::intrinsicBody(r, "<CLASS NAME=\"T_Fan\"/>"), 5), 1);
    });
    CIMClient client;
    connect(client, peer);
    EXPECT_EQ(client.getClass(kNameSpace, "T_Fan").getClassName(), CIMName("T_Fan"));
}

TEST(ClientDeadline, BoundsEveryWaitAndTheNextCallWorks)
{
    const Fault waits[] = {
        {"no answer", [](const PeerRequest&) { return test::noAnswer(); }, ""},
        {"an answer that drips",
         [](const PeerRequest& r) { return test::inPieces(good(r), 1, std::chrono::milliseconds(20)); }, ""},
        {"an answer that never ends",
         [](const PeerRequest& r) {
             PeerAnswer endless = test::withWrongLength(good(r), 1000);
             endless.closesAfterwards = false;
             return endless;
         },
         ""},
    };
    for (const Fault& wait : waits) {
        SCOPED_TRACE(wait.name);
        test::ServedModel model;
        model.addClass(kNameSpace, fanClass()).addFault("GetClass", wait.answer);
        test::ScriptedPeer peer(model.handler());
        CIMClient client;
        connect(client, peer, kShortTimeoutMs);
        EXPECT_EQ(outcomeInTime([&] { client.getClass(kNameSpace, "T_Fan"); }),
                  "Pegasus::ConnectionTimeoutException: connection timed out");
        client.setTimeout(kTimeoutMs);
        EXPECT_EQ(getClassOutcome(client), "ok");
        EXPECT_EQ(peer.connectionCount(), 2u);
    }
}

namespace {

// A server that is there but never accepts: the kernel takes as many connections and bytes as it keeps room for.
class DeafServer
{
  public:
    DeafServer()
    {
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof(address);
        auto* generic = reinterpret_cast<sockaddr*>(&address);
        if (::bind(fListener, generic, size) < 0 || ::getsockname(fListener, generic, &size) < 0 ||
            ::listen(fListener, 0) < 0)
        {
            throw std::runtime_error("cannot listen");
        }
        fAddress = address;
    }
    ~DeafServer()
    {
        for (const int fd : fWaiting) {
            ::close(fd);
        }
        ::close(fListener);
    }
    DeafServer(const DeafServer&) = delete;
    DeafServer& operator=(const DeafServer&) = delete;

    Uint32 port() const { return ntohs(fAddress.sin_port); }
    // Connects until a connection stays pending. Returns: whether it came to that.
    bool fill()
    {
        for (int tries = 0; tries < 16; ++tries) {
            const int fd = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
            fWaiting.push_back(fd);
            (void)::connect(fd, reinterpret_cast<const sockaddr*>(&fAddress), sizeof(fAddress));
            pollfd entry{fd, POLLOUT, 0};
            if (::poll(&entry, 1, 100) == 0) {
                return true;
            }
        }
        return false;
    }

  private:
    int fListener = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_in fAddress{};
    std::vector<int> fWaiting;
};

} // namespace

TEST(ClientDeadline, BoundsConnectingAndSendingToo)
{
    DeafServer server;
    CIMClient client;
    client.setTimeout(kShortTimeoutMs);
    client.connect("127.0.0.1", server.port(), String(), String());
    CIMClass big("T_Big");
    big.addQualifier(CIMQualifier("Description", String(std::string(8 << 20, 'x').c_str())));
    EXPECT_EQ(outcomeInTime([&] { client.createClass(kNameSpace, big); }),
              "Pegasus::ConnectionTimeoutException: connection timed out");

    ASSERT_TRUE(server.fill());
    const std::string refused =
        "Pegasus::CannotConnectException: Cannot connect to 127.0.0.1:" + std::to_string(server.port()) +
        ". Connection failed.";
    EXPECT_EQ(outcomeInTime([&] { client.getClass(kNameSpace, "T_Fan"); }), refused) << "reconnecting";
    CIMClient other;
    other.setTimeout(kShortTimeoutMs);
    EXPECT_EQ(outcomeInTime([&] { other.connect("127.0.0.1", server.port(), String(), String()); }), refused);
}

TEST(ClientDeadline, OfZeroEndsAtOnce)
{
    test::ScriptedPeer peer(good);
    CIMClient client;
    connect(client, peer);
    client.setTimeout(0);
    EXPECT_EQ(getClassOutcome(client), "Pegasus::ConnectionTimeoutException: connection timed out");
    EXPECT_TRUE(peer.requests().empty());
    client.setTimeout(kTimeoutMs);
    EXPECT_EQ(getClassOutcome(client), "ok");
}

TEST(ClientConnection, LifeCycle)
{
    test::ScriptedPeer peer(good, test::ScriptedPeer::Start::kRefusing);
    CIMClient client;
    EXPECT_EQ(getClassOutcome(client), "Pegasus::NotConnectedException: not connected");
    const std::string refused =
        "Pegasus::CannotConnectException: Cannot connect to 127.0.0.1:" + std::to_string(peer.port()) +
        ". Connection failed.";
    EXPECT_EQ(outcome([&] { connect(client, peer); }), refused);
    peer.listen();
    const Uint32 noPort = 65536u + peer.port();
    EXPECT_EQ(outcome([&] { client.connect("127.0.0.1", noPort, String(), String()); }),
              "Pegasus::InvalidLocatorException: Invalid locator: 127.0.0.1:" + std::to_string(noPort));
    connect(client, peer);
    EXPECT_EQ(outcome([&] { connect(client, peer); }), "Pegasus::AlreadyConnectedException: already connected");
    EXPECT_EQ(getClassOutcome(client), "ok");

    peer.refuse(); // the server has gone
    EXPECT_EQ(getClassOutcome(client), refused);
    EXPECT_EQ(getClassOutcome(client), refused);
    peer.listen(); // and come back
    EXPECT_EQ(getClassOutcome(client), "ok");

    client.disconnect();
    EXPECT_EQ(getClassOutcome(client), "Pegasus::NotConnectedException: not connected");
}

TEST(ClientConnection, NullNamespaceIsRefusedAndTheClientLives)
{
    test::ScriptedPeer peer(good);
    CIMClient client;
    connect(client, peer);
    EXPECT_EQ(outcome([&] { client.getClass(CIMNamespaceName(), "T_Fan"); }),
              "Pegasus::InvalidNamespaceNameException: invalid CIM namespace name: ");
    EXPECT_EQ(getClassOutcome(client), "ok");
}

TEST(ClientConnection, RequestIsSentOnceWhateverItAsks)
{
    // The second request of each connection finds it closed, as when a server gives up an idle one.
    test::ScriptedPeer peer([](const PeerRequest& request) -> PeerAnswer {
        static thread_local std::size_t served = 0;
        return ++served % 2 == 0 ? test::closedConnection() : good(request);
    });
    CIMClient client;
    connect(client, peer);
    for (std::size_t count = 1; count <= 4; ++count) {
        EXPECT_EQ(getClassOutcome(client),
                  count % 2 == 1 ? "ok" : "Pegasus::CIMClientMalformedHTTPException: Connection closed by CIM Server.");
        EXPECT_EQ(peer.requests().size(), count);
    }
}

TEST(ClientConnection, SocketsAreCloseOnExecAndBrokenOnesRaiseNoSignal)
{
    std::signal(SIGPIPE, SIG_DFL); // a raised one would end this process
    test::ScriptedPeer peer([](const PeerRequest&) { return test::closedConnection(); });
    CIMClient client;
    connect(client, peer);
    std::size_t sockets = 0;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
        const int fd = std::stoi(entry.path().filename());
        std::error_code gone;
        const std::string target = std::filesystem::read_symlink(entry.path(), gone);
        if (target.rfind("socket:", 0) == 0) {
            ++sockets;
            EXPECT_NE(::fcntl(fd, F_GETFD) & FD_CLOEXEC, 0) << target;
        }
    }
    EXPECT_GE(sockets, 1u);
    CIMClass big("T_Big");
    big.addQualifier(CIMQualifier("Description", String(std::string(8 << 20, 'x').c_str())));
    for (int call = 0; call < 3; ++call) {
        EXPECT_NE(outcome([&] { client.createClass(kNameSpace, big); }), "ok");
    }
}

TEST(ClientThreads, ClientsOfTheirOwnAndObjectsInCommon)
{
    test::ServedModel model;
    model.addClass(kNameSpace, fanClass());
    test::ScriptedPeer peer(model.handler());
    const CIMClass common = fanClass();
    const CIMValue null(CIMTYPE_STRING, false);
    std::atomic<unsigned> equal{0};
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread) {
        threads.emplace_back([&, copy = common] {
            CIMClient client;
            connect(client, peer);
            for (int call = 0; call < 50; ++call) {
                const CIMClass read = client.getClass(kNameSpace, "T_Fan", false);
                equal += read.identical(copy) && read.getProperty(0).getValue() == null ? 1 : 0;
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(equal, 200u);
    EXPECT_EQ(peer.connectionCount(), 4u);
}

TEST(ClientMethods, OutputsReplaceWhatWasThereAndNullsHaveNoType)
{
    test::ServedModel model;
    model.addMethod("Spin", [](const PeerRequest& request) {
        return test::httpAnswer(test::extrinsicBody( // OpenPegasus takes the return value at any place
            request, "<PARAMVALUE NAME=\"a\" PARAMTYPE=\"string\"><VALUE>x</VALUE></PARAMVALUE>"
                     "<RETURNVALUE PARAMTYPE=\"uint32\"><VALUE>7</VALUE></RETURNVALUE>"
                     "<PARAMVALUE NAME=\"b\" PARAMTYPE=\"uint16\"/>"));
    });
    test::ScriptedPeer peer(model.handler());
    CIMClient client;
    connect(client, peer);
    Array<CIMParamValue> outputs(1, CIMParamValue("old", CIMValue(true)));
    Array<CIMParamValue> inputs(1, CIMParamValue("speed", CIMValue(Real32(1.5f))));
    const CIMValue result =
        client.invokeMethod(kNameSpace, CIMObjectPath("T_Fan.DeviceID=\"a\""), "Spin", inputs, outputs);
    EXPECT_EQ(result, CIMValue(Uint32(7)));
    ASSERT_EQ(outputs.size(), 2u);
    EXPECT_EQ(outputs[0].getValue(), CIMValue(String("x")));
    EXPECT_EQ(outputs[1].getValue(), CIMValue());
    EXPECT_FALSE(outputs[1].isTyped());
    EXPECT_EQ(peer.requests().front().object(), "root/cimv2:T_Fan.DeviceID=\"a\"");
}
