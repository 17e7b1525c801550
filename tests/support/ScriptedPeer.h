// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace test {

// A CIM request as the peer got it.
struct PeerRequest
{
    std::string head; // request line and header fields
    std::string body;
    std::size_t connection = 0; // which connection, counted from 0

    // A header field's value, case of its name ignored; empty when absent.
    std::string header(std::string_view name) const;
    // CIMMethod and CIMObject, percent-decoded.
    std::string method() const;
    std::string object() const;
    std::string messageId() const;
    // The name in the first element `<element ...NAME="x"`; empty when absent.
    std::string nameIn(std::string_view element) const;
};

// What the peer does with a request.
struct PeerAnswer
{
    std::string bytes;                     // sent as they are, header and all
    const std::string* prepared = nullptr; // sent instead, without a copy; must outlive the peer
    std::size_t pieceBytes = 0;            // at most so many bytes in one send; 0: all at once
    std::chrono::milliseconds pauseBetweenPieces{0};
    bool closesAfterwards = false;
    bool neverAnswers = false; // keeps the connection open and silent
};

using PeerHandler = std::function<PeerAnswer(const PeerRequest&)>;

// An HTTP server on the loopback interface, in this process, that plays what the test says.
// Thread: the handler runs on the peer's threads, one connection each; the members may be called from any thread.
class ScriptedPeer
{
  public:
    enum class Start
    {
        kListening,
        kRefusing // the port is taken, but connections are refused until listen() is called
    };

    explicit ScriptedPeer(PeerHandler handler, Start start = Start::kListening);
    // Closes everything and waits for the threads.
    ~ScriptedPeer();
    ScriptedPeer(const ScriptedPeer&) = delete;
    ScriptedPeer& operator=(const ScriptedPeer&) = delete;

    std::uint16_t port() const { return fPort; }
    // From now on connections are accepted.
    void listen();
    // From now on connections are refused again; those that are open are closed. The port stays the peer's.
    void refuse();

    // All requests so far, in the order of their arrival.
    std::vector<PeerRequest> requests() const;
    std::size_t connectionCount() const;
    // Returns: whether so many requests had come before the time was over.
    bool waitForRequests(std::size_t count, std::chrono::milliseconds limit = std::chrono::seconds(60)) const;

  private:
    void bindPort();
    void acceptLoop(int listener);
    void serve(int socket, std::size_t connection);
    bool readRequest(int socket, std::string& buffer, PeerRequest& request);
    bool play(int socket, const PeerAnswer& answer);
    bool waitFor(int socket, short events, int timeoutMs = -1) const;
    void stopThreads();

    PeerHandler fHandler;
    std::uint16_t fPort = 0;
    int fListener = -1;
    int fStopEvent = -1; // readable when the threads have to end
    std::thread fAcceptThread;

    mutable std::mutex fMutex;
    mutable std::condition_variable fChanged;
    std::vector<std::thread> fThreads;
    std::vector<PeerRequest> fRequests;
    std::size_t fConnectionCount = 0;
};

} // namespace test
