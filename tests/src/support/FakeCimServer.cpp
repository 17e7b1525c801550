#include "src/support/FakeCimServer.h"

#include <algorithm>
#include <stdexcept>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <poll.h>
#include <strings.h>
#include <sys/socket.h>
#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr char kNotFound[] = "<ERROR CODE=\"6\" DESCRIPTION=\"CIM_ERR_NOT_FOUND: not in the script\"/>";

// Returns: the text between the two marks after the position; empty when there is none.
std::string Between(const std::string& text, const std::string& before, const std::string& after)
{
    const auto start = text.find(before);
    if (start == std::string::npos)
        return "";
    const auto from = start + before.size();
    return text.substr(from, text.find(after, from) - from);
}

std::string RequestName(const std::string& body)
{
    const std::string operation = Between(body, "METHODCALL NAME=\"", "\"");
    std::string object = Between(body, "<CLASSNAME NAME=\"", "\"");
    if (operation == "GetQualifier")
        object = Between(body, "<VALUE>", "</VALUE>");
    return operation + " " + object;
}

std::string Envelope(const std::string& body, const std::string& content)
{
    const std::string tag = body.find("<IMETHODCALL") == std::string::npos ? "METHODRESPONSE" : "IMETHODRESPONSE";
    return "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n<MESSAGE ID=\"" +
           Between(body, "<MESSAGE ID=\"", "\"") + "\" PROTOCOLVERSION=\"1.0\">\n<SIMPLERSP>\n<" + tag + " NAME=\"" +
           Between(body, "METHODCALL NAME=\"", "\"") + "\">\n" + content + "\n</" + tag +
           ">\n</SIMPLERSP>\n</MESSAGE>\n</CIM>\n";
}

std::string HttpMessage(const std::string& body)
{
    return "HTTP/1.1 200 OK\r\nContent-Type: application/xml; charset=utf-8\r\ncontent-length: " +
           std::to_string(body.size()) + "\r\nCIMOperation: MethodResponse\r\n\r\n" + body;
}

void SendAll(int descriptor, const std::string& bytes)
{
    for (std::size_t sent = 0; sent < bytes.size();) {
        const ssize_t count = ::send(descriptor, bytes.data() + sent, bytes.size() - sent, MSG_NOSIGNAL);
        if (count <= 0)
            return;
        sent += static_cast<std::size_t>(count);
    }
}

// Returns: the bytes of the whole message when it has arrived, else 0.
std::size_t MessageBytes(const std::string& received, std::size_t& headBytes)
{
    const auto end = received.find("\r\n\r\n");
    if (end == std::string::npos)
        return 0;
    headBytes = end + 4;
    std::string head = received.substr(0, headBytes);
    std::transform(head.begin(), head.end(), head.begin(), [](unsigned char c) { return std::tolower(c); });
    const std::size_t total = headBytes + std::stoul(Between(head, "content-length:", "\r\n"));
    return received.size() >= total ? total : 0;
}

} // namespace

TFakeCimServer::TFakeCimServer()
{
    BindListener();
    if (::pipe2(fWakeUp, O_CLOEXEC) != 0)
        throw std::runtime_error("no pipe for the server of the tests");
    fThread = std::thread([this] { Serve(); });
}

TFakeCimServer::~TFakeCimServer()
{
    ::close(fWakeUp[1]);
    fThread.join();
    for (const TConnection& connection : fConnections)
        ::close(connection.fDescriptor);
    ::close(fWakeUp[0]);
    ::close(fListener);
}

// Takes a free port, or the old one again, without listening.
void TFakeCimServer::BindListener()
{
    fListener = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const int reuse = 1;
    ::setsockopt(fListener, SOL_SOCKET, SO_REUSEADDR, &reuse, sizeof reuse);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(fPort);
    socklen_t length = sizeof address;
    if (::bind(fListener, reinterpret_cast<sockaddr*>(&address), length) != 0 ||
        ::getsockname(fListener, reinterpret_cast<sockaddr*>(&address), &length) != 0)
        throw std::runtime_error("no port for the server of the tests");
    fPort = ntohs(address.sin_port);
}

void TFakeCimServer::Listen()
{
    Wish('L');
}

void TFakeCimServer::Refuse()
{
    Wish('R');
}

// Has the thread do it, and waits until it is done.
void TFakeCimServer::Wish(char wish)
{
    std::unique_lock<std::mutex> lock(fMutex);
    ++fWishes;
    if (::write(fWakeUp[1], &wish, 1) != 1)
        throw std::runtime_error("the thread of the tests' server is gone");
    fChanged.wait(lock, [this] { return fWishes == 0; });
}

void TFakeCimServer::Grant(char wish)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (wish == 'L') {
        fIsListening = ::listen(fListener, 16) == 0;
    } else if (fIsListening) {
        ::close(fListener); // one that was shut down never listens again
        BindListener();
        fIsListening = false;
    }
    --fWishes;
    fChanged.notify_all();
}

void TFakeCimServer::Answer(const std::string& request, const std::string& returnValue)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fReplies[request] = {TReply::kReturnValue, returnValue};
}

void TFakeCimServer::AnswerClass(const std::string& name, const std::string& superClass, const std::string& elements)
{
    const std::string super = superClass.empty() ? "" : " SUPERCLASS=\"" + superClass + "\"";
    Answer("GetClass " + name, "<CLASS NAME=\"" + name + "\"" + super + ">" + elements + "</CLASS>");
}

void TFakeCimServer::AnswerRaw(const std::string& request, const std::string& bytes)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fReplies[request] = {TReply::kRaw, bytes};
}

void TFakeCimServer::KeepSilentOn(const std::string& request)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fReplies[request] = {TReply::kSilence, ""};
}

void TFakeCimServer::WaitUntilIdle() const
{
    std::unique_lock<std::mutex> lock(fMutex);
    fChanged.wait_for(lock, std::chrono::seconds(5), [this] { return fConnectionCount == 0; });
}

void TFakeCimServer::CountConnections()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fConnectionCount = static_cast<int>(fConnections.size());
    fChanged.notify_all();
}

void TFakeCimServer::ForgetRequests()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fRequests.clear();
}

std::vector<std::string> TFakeCimServer::Requests() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<std::string> names;
    for (const auto& request : fRequests)
        names.push_back(request.first);
    return names;
}

long TFakeCimServer::Count(const std::string& request) const
{
    const std::vector<std::string> names = Requests();
    return std::count(names.begin(), names.end(), request);
}

std::string TFakeCimServer::LastBody(const std::string& request) const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    const auto last = std::find_if(fRequests.rbegin(), fRequests.rend(),
                                   [&request](const auto& candidate) { return candidate.first == request; });
    return last == fRequests.rend() ? "" : last->second;
}

void TFakeCimServer::Serve()
{
    for (;;) {
        // A socket that does not listen reports a hang-up for ever; a negative descriptor is not looked at.
        std::vector<pollfd> watched = {{fWakeUp[0], POLLIN, 0}, {fIsListening ? fListener : -1, POLLIN, 0}};
        for (const TConnection& connection : fConnections)
            watched.push_back({connection.fDescriptor, POLLIN, 0});
        if (::poll(watched.data(), watched.size(), -1) < 0)
            continue;
        if (watched[0].revents != 0) {
            char wish = 0;
            if (::read(fWakeUp[0], &wish, 1) != 1)
                return; // the other end is closed
            Grant(wish);
            continue; // the listener may be another now
        }
        for (std::size_t i = watched.size(); i-- > 2;) {
            if (watched[i].revents == 0 || Receive(fConnections[i - 2]))
                continue;
            ::close(fConnections[i - 2].fDescriptor);
            fConnections.erase(fConnections.begin() + static_cast<std::ptrdiff_t>(i - 2));
        }
        if (watched[1].revents & POLLIN)
            Accept();
        CountConnections();
    }
}

void TFakeCimServer::Accept()
{
    const int descriptor = ::accept4(fListener, nullptr, nullptr, SOCK_CLOEXEC);
    if (descriptor != -1)
        fConnections.push_back({descriptor, ""});
}

// Returns: false when the connection has ended.
bool TFakeCimServer::Receive(TConnection& connection)
{
    char buffer[4096];
    const ssize_t count = ::recv(connection.fDescriptor, buffer, sizeof buffer, 0);
    if (count <= 0)
        return false;
    connection.fReceived.append(buffer, static_cast<std::size_t>(count));
    std::size_t headBytes = 0;
    while (const std::size_t bytes = MessageBytes(connection.fReceived, headBytes)) {
        const std::string body = connection.fReceived.substr(headBytes, bytes - headBytes);
        connection.fReceived.erase(0, bytes);
        if (!Respond(connection.fDescriptor, body))
            return false;
    }
    return true;
}

// Returns: false when the script wants the connection closed.
bool TFakeCimServer::Respond(int descriptor, const std::string& body)
{
    const std::string name = RequestName(body);
    TReply reply = {TReply::kReturnValue, ""};
    bool known = false;
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fRequests.emplace_back(name, body);
        const auto scripted = fReplies.find(name);
        known = scripted != fReplies.end();
        if (known)
            reply = scripted->second;
    }
    if (reply.fKind == TReply::kSilence)
        return true;
    if (reply.fKind == TReply::kRaw) {
        SendAll(descriptor, reply.fText);
        return false;
    }
    const std::string content = known ? "<IRETURNVALUE>" + reply.fText + "</IRETURNVALUE>" : std::string(kNotFound);
    SendAll(descriptor, HttpMessage(Envelope(body, content)));
    return true;
}

} // namespace NKOLVRX20
