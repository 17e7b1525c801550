// SPDX-License-Identifier: MIT
// The HTTP layer by itself: bytes in, bytes out; what bounds them; what ends a connection.
#include "pegasus/base/PercentCoding.h"
#include "pegasus/server/agent/AgentChannel.h"
#include "pegasus/server/net/Acceptor.h"
#include "pegasus/server/net/AnswerStream.h"
#include "pegasus/server/net/CimAnswer.h"
#include "pegasus/server/net/HttpRequestReader.h"
#include "pegasus/server/net/Listener.h"

#include <gtest/gtest.h>

#include <thread>

#include <netinet/in.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

namespace Pegasus::server {
namespace {

const std::string kRequest =
    "POST /cimom HTTP/1.1\r\nHost: x\r\nTE: chunked, trailers\r\nContent-Length: 11\r\n\r\n<a>hello</a"
    "POST";

// The request's parts, from a parser that got the bytes in two pieces.
HttpRequest parseSplit(const std::string& bytes, std::size_t at, std::size_t& taken)
{
    HttpRequestParser parser(HttpLimits{});
    taken = parser.put(std::string_view(bytes).substr(0, at));
    while (!parser.isDone()) {
        const std::size_t n = parser.put(std::string_view(bytes).substr(taken));
        if (n == 0) {
            throw std::runtime_error("the parser stands still");
        }
        taken += n;
    }
    return parser.take();
}

// A web page's requests carry the name that its browser knows this machine by.
TEST(HostCheckTest, onlyNamesOfTheLoopbackInterface)
{
    char own[256] = "";
    ASSERT_EQ(::gethostname(own, sizeof own - 1), 0);
    struct Row
    {
        const char* host; // null: absent
        const char* origin;
        bool isServed;
    };
    const Row rows[] = {
        {nullptr, nullptr, true},
        {"", nullptr, true},
        {"localhost", nullptr, true},
        {"LOCALHOST:5988", nullptr, true},
        {"localhost.localdomain", nullptr, true},
        {"app.localhost:1", nullptr, true},
        {own, nullptr, std::string(own) == "localhost"},
        {"127.0.0.1:5988", nullptr, true},
        {"127.255.1.2", nullptr, true},
        {"[::1]:5988", nullptr, true},
        {"[::ffff:127.0.0.1]", nullptr, true},
        {"evil.example", nullptr, false},
        {"localhost.evil.example", nullptr, false},
        {"127.0.0.1.evil.example", nullptr, false},
        {"notlocalhost", nullptr, false},
        {".localhost", nullptr, false},
        {"localhost:80@evil.example", nullptr, false},
        {"[::1", nullptr, false},
        {"[::ffff:10.0.0.1]", nullptr, false},
        {"10.0.0.1", nullptr, false},
        {"0.0.0.0", nullptr, false},
        {"localhost", "http://localhost:3000", true},
        {"localhost", "https://[::1]", true},
        {"localhost", "https://evil.example", false},
        {"localhost", "null", false},
        {"localhost", "", false},
        {nullptr, "http://evil.example:5988", false},
    };
    for (const Row& row : rows) {
        HttpRequest http;
        for (const auto& [name, value] : {std::pair("Host", row.host), {"Origin", row.origin}}) {
            if (value != nullptr) {
                http.headers.emplace_back(name, value);
            }
        }
        SCOPED_TRACE(std::string("Host: ") + (row.host ? row.host : "-") +
                     ", Origin: " + (row.origin ? row.origin : "-"));
        unsigned status = 200;
        try {
            requireLocalHost(http);
        } catch (const HttpError& error) {
            status = error.status();
        }
        EXPECT_EQ(status, row.isServed ? 200u : 403u);
    }
}

TEST(HttpRequestParserTest, takesARequestHoweverItArrives)
{
    const std::string chunked =
        "POST / HTTP/1.1\r\nTransfer-Encoding: chunked\r\n\r\n3\r\n<a>\r\n8;x=y\r\nhello</a\r\n0\r\n"
        "T: v\r\n\r\nPOST";
    for (const std::string& bytes : {kRequest, chunked}) {
        for (std::size_t at = 0; at <= bytes.size(); ++at) {
            SCOPED_TRACE("split at " + std::to_string(at) + " of " + bytes.substr(0, 60));
            std::size_t taken = 0;
            const HttpRequest request = parseSplit(bytes, at, taken);
            EXPECT_EQ(request.body, "<a>hello</a");
            EXPECT_EQ(bytes.size() - taken, 4u) << "what follows is the next request's";
            EXPECT_TRUE(request.hasBodyLength);
        }
    }
}

TEST(HttpRequestParserTest, aCutRequestIsNeverDone)
{
    for (std::size_t size = 0; size < kRequest.size() - 4; ++size) {
        HttpRequestParser parser(HttpLimits{});
        parser.put(std::string_view(kRequest).substr(0, size));
        EXPECT_FALSE(parser.isDone()) << size;
    }
}

// What a peer sends after the head, however slowly, is bounded while it is kept.
TEST(HttpRequestParserTest, unparsedBytesAreBounded)
{
    const HttpLimits limits = {200, 10'000};
    const std::string head = "POST / HTTP/1.1\r\nTransfer-Encoding: chunked\r\n\r\n";
    for (const std::string& start : {"5;" + std::string(), "0;" + std::string(), std::string("0\r\nX: ")}) {
        for (const std::size_t piece : {std::size_t(1), std::size_t(150), std::size_t(100'000)}) {
            SCOPED_TRACE(start + " in pieces of " + std::to_string(piece));
            const std::string bytes = head + start + std::string(5000, 'x');
            HttpRequestParser parser(limits);
            std::string pending;
            std::size_t longest = 0;
            const auto feed = [&] {
                for (std::size_t at = 0; at < bytes.size(); at += piece) {
                    pending += bytes.substr(at, piece);
                    pending.erase(0, parser.put(pending));
                    longest = std::max(longest, pending.size());
                }
            };
            EXPECT_THROW(feed(), HttpError);
            EXPECT_LT(longest, limits.maxHeaderBytes);
        }
    }
}

struct WordRow
{
    const char* value;
    bool chunked;
};

TEST(HttpRequestTest, findsWordsInListHeaders)
{
    for (const WordRow& row : {WordRow{"chunked", true},
                               {"trailers, chunked", true},
                               {"CHUNKED;q=0.5 , x", true},
                               {"unchunked", false},
                               {"chunkedx", false},
                               {"", false},
                               {" ,, ", false},
                               {"x;chunked", false}})
    {
        HttpRequest request;
        request.headers.emplace_back("te", row.value);
        EXPECT_EQ(request.headerHas("TE", "chunked"), row.chunked) << row.value;
    }
}

// What an answer looks like on the wire.
template <typename Write> std::string sent(AnswerStream::Options options, const Write& write)
{
    int ends[2];
    EXPECT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends), 0);
    std::string bytes;
    std::thread reader([&, fd = base::Descriptor(ends[0])] {
        char part[65536];
        for (ssize_t n; (n = ::read(fd.get(), part, sizeof part)) > 0;) {
            bytes.append(part, static_cast<std::size_t>(n));
        }
    });
    {
        SocketStream stream((base::Descriptor(ends[1])));
        AnswerStream answer(stream, options);
        write(answer);
    }
    reader.join();
    return bytes.substr(bytes.find("\r\n\r\n") + 4);
}

TEST(AnswerStreamTest, framesChunksAndTrailers)
{
    EXPECT_EQ(sent({}, [](AnswerStream& answer) { answer.finish(); }), "0\r\n\r\n");
    EXPECT_EQ(sent({},
                   [](AnswerStream& answer) {
                       answer.write("<a>");
                       answer.write("b");
                       answer.finish({6, "gone: \xc3\xa9"});
                   }),
              "4\r\n<a>b\r\n0\r\nCIMStatusCode: 6\r\nCIMStatusCodeDescription: gone%3A%20%C3%A9\r\n\r\n");
    const std::string large(AnswerStream::kChunkBytes, 'x');
    EXPECT_EQ(sent({},
                   [&](AnswerStream& answer) {
                       answer.write("<a>");
                       EXPECT_FALSE(answer.hasStarted());
                       answer.write(large);
                       EXPECT_TRUE(answer.hasStarted());
                       answer.finish();
                   }),
              "10003\r\n<a>" + large + "\r\n0\r\n\r\n");
}

TEST(AnswerStreamTest, keepsWhatNeedsALength)
{
    AnswerStream::Options options;
    options.framing = AnswerStream::Framing::kContentLength;
    options.maxBufferedBytes = 10;
    EXPECT_EQ(sent(options,
                   [](AnswerStream& answer) {
                       answer.write("12345");
                       answer.write("67890");
                       EXPECT_THROW(answer.write("x"), AnswerTooLarge);
                       answer.finish();
                   }),
              "1234567890");
}

// A vendor's error text of any length arrives, cut at a character: a longer trailer would lose the whole answer.
TEST(CimAnswerTest, cutsALongErrorText)
{
    CimRequest request;
    for (const std::size_t shift : {std::size_t(0), std::size_t(1)}) {
        std::string text(shift, 'x');
        for (int i = 0; i < 50'000; ++i) {
            text += "\xc3\xa9";
        }
        const std::string bytes = sent({}, [&](AnswerStream& stream) {
            CimAnswer(stream, request, CimAnswer::Envelope::kBare).fail({1, text});
        });
        const std::string field = "CIMStatusCodeDescription: ";
        const std::size_t begin = bytes.find(field) + field.size();
        const std::string arrived = base::percentDecoded(bytes.substr(begin, bytes.find("\r\n", begin) - begin));
        EXPECT_EQ(arrived, text.substr(0, 4096 - shift));
    }
}

// A peer that stops reading may hold the thread for a bounded time only.
TEST(SocketStreamTest, waitsForASlowReaderOnlySoLong)
{
    int ends[2];
    ASSERT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends), 0);
    const base::Descriptor reader(ends[0]);
    SocketStream stream((base::Descriptor(ends[1])));
    std::string data(16u << 20, 'x');
    iovec part = {data.data(), data.size()};
    EXPECT_THROW(stream.writeAll(&part, 1, std::chrono::milliseconds(50)), SocketTimeout);
    char byte;
    EXPECT_THROW(stream.readSome(&byte, 1, base::Deadline::afterOrNever(std::chrono::milliseconds(20))), SocketTimeout);
}

class FaultyHandler : public RequestHandler
{
  public:
    void handle(const HttpRequest&, const CimRequest&, CimAnswer&) override { throw 42; }
    bool knowsMethod(const CimRequest&) const override { return true; }
};

// The other end of a connection that a group serves.
base::Descriptor connectionOf(ConnectionGroup& group)
{
    int ends[2];
    EXPECT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends), 0);
    base::Descriptor served(ends[0]);
    EXPECT_TRUE(group.serve(served, 10));
    return base::Descriptor(ends[1]);
}

// What a connection's thread throws must end that connection only.
TEST(ConnectionGroupTest, anExceptionEndsOnlyItsConnection)
{
    FaultyHandler handler;
    const std::string body =
        "<?xml version=\"1.0\"?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" "
        "PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL NAME=\"GetClass\"><LOCALNAMESPACEPATH>"
        "<NAMESPACE NAME=\"root\"/></LOCALNAMESPACEPATH></IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    const std::string request = "POST / HTTP/1.1\r\nHost: x\r\nContent-Type: text/xml; charset=utf-8\r\n"
                                "CIMOperation: MethodCall\r\nCIMMethod: GetClass\r\nCIMObject: root\r\n"
                                "Content-Length: " +
                                std::to_string(body.size()) + "\r\n\r\n" + body;
    const std::pair<const char*, std::function<ConnectionSettings()>> rows[] = {
        {"no memory for a new connection", []() -> ConnectionSettings { throw std::bad_alloc(); }},
        {"an exception of the CIM library", []() -> ConnectionSettings { throw Exception(String("x")); }},
        {"something else, from a request", [] { return ConnectionSettings(); }}};
    for (const auto& [name, settings] : rows) {
        SCOPED_TRACE(name);
        ConnectionGroup group(handler, settings);
        const base::Descriptor client = connectionOf(group);
        ::send(client.get(), request.data(), request.size(), MSG_NOSIGNAL); // fails when it is closed already
        char byte;
        EXPECT_LE(::recv(client.get(), &byte, 1, 0), 0);
        EXPECT_TRUE(group.waitForEnd(base::Deadline::afterOrNever(std::chrono::seconds(10))));
    }
}

// The thread that accepts connections is the server's own.
TEST(AcceptorTest, outlivesAConnectionThatCannotBeServed)
{
    FaultyHandler handler;
    ConnectionGroup group(handler, [] { return ConnectionSettings(); });
    base::Descriptor listener = listenOnLoopback(0);
    sockaddr_in address = {};
    socklen_t size = sizeof address;
    ASSERT_EQ(::getsockname(listener.get(), reinterpret_cast<sockaddr*>(&address), &size), 0);
    std::vector<Acceptor::Source> sources;
    sources.push_back({std::move(listener), [](int) { return ::geteuid(); }, &group});
    const base::Descriptor stop(::eventfd(0, EFD_CLOEXEC));
    bool first = true;
    Acceptor acceptor(std::move(sources), stop.get(), [&]() -> std::size_t {
        if (std::exchange(first, false)) {
            throw std::bad_alloc();
        }
        return 10;
    });
    std::thread thread([&] { acceptor.run(); });
    for (const char* expected : {"", "HTTP/1.1 404 Not Found"}) {
        const base::Descriptor client(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
        EXPECT_EQ(::connect(client.get(), reinterpret_cast<const sockaddr*>(&address), size), 0);
        ::send(client.get(), "GET / HTTP/1.0\r\n\r\n", 18, MSG_NOSIGNAL);
        char answer[22];
        const ssize_t n = ::recv(client.get(), answer, sizeof answer, MSG_WAITALL);
        EXPECT_EQ(std::string(answer, static_cast<std::size_t>(std::max<ssize_t>(n, 0))), expected);
    }
    ::eventfd_write(stop.get(), 1);
    thread.join();
    group.breakAll();
    EXPECT_TRUE(group.waitForEnd(base::Deadline::afterOrNever(std::chrono::seconds(10))));
}

// An agent runs a vendor's code: its answers are bounded as a client's requests are.
TEST(AgentChannelTest, unparsedBytesAreBounded)
{
    const std::string head = "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n";
    for (const std::string& start : {std::string("HTTP/1.1 200 OK\r\nX: "), head + "5;", head + "0\r\nX: "}) {
        SCOPED_TRACE(start);
        int ends[2];
        ASSERT_EQ(::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends), 0);
        std::size_t sent = 0;
        std::thread agent([&, fd = base::Descriptor(ends[0])] {
            std::string bytes = start;
            for (bytes.resize(64u << 10, 'x'); sent < (16u << 20); bytes.assign(64u << 10, 'x')) {
                const ssize_t n = ::send(fd.get(), bytes.data(), bytes.size(), MSG_NOSIGNAL);
                if (n < 0) {
                    return;
                }
                sent += static_cast<std::size_t>(n);
            }
        });
        class : public ElementSink
        {
            void write(std::string_view) override {}
        } nothing;
        {
            AgentChannel channel((base::Descriptor(ends[1])));
            try {
                channel.request(AgentRequest(), nothing, std::chrono::seconds(10));
                ADD_FAILURE() << "accepted";
            } catch (const AgentLost& error) {
                EXPECT_NE(std::string(error.what()).find(" of more than 1048576 bytes"), std::string::npos)
                    << error.what();
            }
        }
        agent.join();
        EXPECT_LT(sent, 4u << 20);
    }
}

struct StatusRow
{
    unsigned code;
    const char* text;
    const char* expected;
};

TEST(CimStatusTest, putsTheSymbolicNameInFront)
{
    for (const StatusRow& row : {StatusRow{1, "x", "CIM_ERR_FAILED: x"},
                                 {7, "", "CIM_ERR_NOT_SUPPORTED"},
                                 {28, "x", "CIM_ERR_SERVER_IS_SHUTTING_DOWN: x"},
                                 {99, "x", "Unrecognized CIM status code \"99\": x"},
                                 {19, "x", "Unrecognized CIM status code \"19\": x"}})
    {
        EXPECT_EQ(makeStatus(static_cast<CIMStatusCode>(row.code), row.text).text, row.expected);
    }
}

} // namespace
} // namespace Pegasus::server
