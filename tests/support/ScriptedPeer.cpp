// SPDX-License-Identifier: MIT
#include "tests/support/ScriptedPeer.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <system_error>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <strings.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

namespace test {
namespace {

[[noreturn]] void fail(const char* operation)
{
    throw std::system_error(errno, std::generic_category(), std::string("scripted peer: ") + operation);
}

int hexValue(char c)
{
    return c >= '0' && c <= '9' ? c - '0' : (c | 0x20) - 'a' + 10;
}

std::string percentDecoded(const std::string& text)
{
    std::string out;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '%' && i + 2 < text.size()) {
            out += static_cast<char>(hexValue(text[i + 1]) * 16 + hexValue(text[i + 2]));
            i += 2;
        } else {
            out += text[i];
        }
    }
    return out;
}

} // namespace

std::string PeerRequest::header(std::string_view name) const
{
    std::size_t start = head.find("\r\n");
    while (start != std::string::npos && start + 2 < head.size()) {
        start += 2;
        const std::size_t end = std::min(head.find("\r\n", start), head.size());
        const std::string_view line = std::string_view(head).substr(start, end - start);
        if (line.size() > name.size() && line[name.size()] == ':' &&
            ::strncasecmp(line.data(), name.data(), name.size()) == 0)
        {
            const std::size_t value = line.find_first_not_of(' ', name.size() + 1);
            return value == std::string_view::npos ? std::string() : std::string(line.substr(value));
        }
        start = head.find("\r\n", start);
    }
    return std::string();
}

std::string PeerRequest::method() const
{
    return percentDecoded(header("CIMMethod"));
}

std::string PeerRequest::object() const
{
    return percentDecoded(header("CIMObject"));
}

std::string PeerRequest::messageId() const
{
    constexpr std::string_view kBefore = "<MESSAGE ID=\"";
    const std::size_t start = body.find(kBefore);
    return start == std::string::npos
               ? std::string()
               : body.substr(start + kBefore.size(), body.find('"', start + kBefore.size()) - start - kBefore.size());
}

std::string PeerRequest::nameIn(std::string_view element) const
{
    const std::size_t tag = body.find("<" + std::string(element) + " ");
    const std::size_t name = tag == std::string::npos ? tag : body.find("NAME=\"", tag);
    if (name == std::string::npos) {
        return std::string();
    }
    return body.substr(name + 6, body.find('"', name + 6) - name - 6);
}

ScriptedPeer::ScriptedPeer(PeerHandler handler, Start start) : fHandler(std::move(handler))
{
    fStopEvent = ::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK);
    if (fStopEvent < 0) {
        fail("eventfd");
    }
    bindPort();
    if (start == Start::kListening) {
        listen();
    }
}

ScriptedPeer::~ScriptedPeer()
{
    stopThreads();
    ::close(fListener);
    ::close(fStopEvent);
}

// A socket that is bound but yet to listen refuses connections and keeps its port reserved.
void ScriptedPeer::bindPort()
{
    fListener = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const int on = 1;
    ::setsockopt(fListener, SOL_SOCKET, SO_REUSEADDR, &on, sizeof(on));
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(fPort);
    socklen_t size = sizeof(address);
    auto* generic = reinterpret_cast<sockaddr*>(&address);
    if (fListener < 0 || ::bind(fListener, generic, size) < 0 || ::getsockname(fListener, generic, &size) < 0) {
        fail("bind");
    }
    fPort = ntohs(address.sin_port);
}

void ScriptedPeer::listen()
{
    if (fAcceptThread.joinable()) {
        return;
    }
    if (::listen(fListener, 64) < 0) {
        fail("listen");
    }
    fAcceptThread = std::thread([this, listener = fListener] { acceptLoop(listener); });
}

void ScriptedPeer::refuse()
{
    stopThreads();
    ::close(fListener);
    bindPort();
}

void ScriptedPeer::stopThreads()
{
    std::uint64_t count = 1;
    if (::write(fStopEvent, &count, sizeof(count)) < 0) {
        std::abort();
    }
    if (fAcceptThread.joinable()) {
        fAcceptThread.join();
    }
    for (std::thread& thread : fThreads) {
        thread.join();
    }
    fThreads.clear();
    if (::read(fStopEvent, &count, sizeof(count)) < 0) {
        std::abort();
    }
}

std::vector<PeerRequest> ScriptedPeer::requests() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fRequests;
}

std::size_t ScriptedPeer::connectionCount() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fConnectionCount;
}

bool ScriptedPeer::waitForRequests(std::size_t count, std::chrono::milliseconds limit) const
{
    std::unique_lock<std::mutex> lock(fMutex);
    return fChanged.wait_for(lock, limit, [&] { return fRequests.size() >= count; });
}

// Returns: false when the peer must stop, or the time is over.
bool ScriptedPeer::waitFor(int socket, short events, int timeoutMs) const
{
    pollfd entries[] = {{fStopEvent, POLLIN, 0}, {socket, events, 0}};
    for (;;) {
        const int ready = ::poll(entries, socket < 0 ? 1 : 2, timeoutMs);
        if (ready < 0 && errno == EINTR) {
            continue;
        }
        return ready > 0 && entries[0].revents == 0;
    }
}

void ScriptedPeer::acceptLoop(int listener)
{
    while (waitFor(listener, POLLIN)) {
        const int socket = ::accept4(listener, nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK);
        if (socket < 0) {
            continue;
        }
        const int on = 1;
        ::setsockopt(socket, IPPROTO_TCP, TCP_NODELAY, &on, sizeof(on));
        const std::lock_guard<std::mutex> lock(fMutex);
        const std::size_t connection = fConnectionCount++;
        fThreads.emplace_back([this, socket, connection] { serve(socket, connection); });
    }
}

void ScriptedPeer::serve(int socket, std::size_t connection)
{
    std::string buffer;
    PeerRequest request;
    request.connection = connection;
    while (readRequest(socket, buffer, request)) {
        {
            const std::lock_guard<std::mutex> lock(fMutex);
            fRequests.push_back(request);
        }
        fChanged.notify_all();
        if (!play(socket, fHandler(request))) {
            break;
        }
    }
    ::close(socket);
}

// Returns: false at the end of the connection.
bool ScriptedPeer::readRequest(int socket, std::string& buffer, PeerRequest& request)
{
    for (;;) {
        const std::size_t headEnd = buffer.find("\r\n\r\n");
        if (headEnd != std::string::npos) {
            request.head = buffer.substr(0, headEnd + 2);
            const std::size_t length = std::strtoul(request.header("content-length").c_str(), nullptr, 10);
            if (buffer.size() >= headEnd + 4 + length) {
                request.body = buffer.substr(headEnd + 4, length);
                buffer.erase(0, headEnd + 4 + length);
                return true;
            }
        }
        char bytes[16 * 1024];
        const ssize_t count = waitFor(socket, POLLIN) ? ::recv(socket, bytes, sizeof(bytes), 0) : 0;
        if (count == 0 || (count < 0 && errno != EAGAIN && errno != EINTR)) {
            return false;
        }
        if (count > 0) {
            buffer.append(bytes, static_cast<std::size_t>(count));
        }
    }
}

// Returns: whether the connection goes on.
bool ScriptedPeer::play(int socket, const PeerAnswer& answer)
{
    if (answer.neverAnswers) {
        // Readable: the client has given up (or sent something else).
        waitFor(socket, POLLIN);
        return false;
    }
    std::string_view rest = answer.prepared ? *answer.prepared : answer.bytes;
    while (!rest.empty()) {
        const std::size_t piece = answer.pieceBytes ? std::min(answer.pieceBytes, rest.size()) : rest.size();
        const ssize_t count = ::send(socket, rest.data(), piece, MSG_NOSIGNAL);
        if (count < 0 && (errno != EAGAIN || !waitFor(socket, POLLOUT))) {
            return false;
        }
        if (count > 0) {
            rest.remove_prefix(static_cast<std::size_t>(count));
        }
        const auto pause = static_cast<int>(answer.pauseBetweenPieces.count());
        // The pause is a wait for the order to stop.
        if (pause > 0 && !rest.empty() && waitFor(-1, 0, pause)) {
            return false;
        }
    }
    return !answer.closesAfterwards;
}

} // namespace test
