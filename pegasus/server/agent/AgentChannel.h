// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/AnswerStream.h"
#include "pegasus/server/net/CimAnswer.h"

#include <cstdint>
#include <vector>

namespace Pegasus::server {

// The agent at the other end has ended, or its answer is malformed. what() says which.
class AgentLost : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

// The same, before the agent could take the request: another agent may be asked.
class AgentGone : public AgentLost
{
  public:
    using AgentLost::AgentLost;
};

// The agent was silent for the whole timeout.
class AgentSilent : public std::runtime_error
{
  public:
    AgentSilent() : std::runtime_error("the agent does not answer") {}
};

// One request for an agent: an operation for one of its module's providers.
struct AgentRequest
{
    std::string method;
    std::string object; // the CIMObject header, before encoding
    std::string body;   // the CIM message
    std::string provider;
    std::string library; // path of the module's library
};

// The server's end of a socket pair to an agent: carries one request at a time.
//
// The protocol is the public one, CIM-XML over HTTP, with two differences: the headers PG-Provider and PG-Library name
// the provider and its library, and the answer's body is only the elements within IRETURNVALUE or METHODRESPONSE, so
// that they can be passed on unread, whatever their number; its head lacks the fields that say what the body is.
//
// Thread: one at a time; shutDown(): any.
class AgentChannel
{
  public:
    // Of the head of an answer, of a chunk's extensions, and of the trailer, which carries the provider's error text.
    static constexpr std::uint32_t kMaxAnswerHeadBytes = 1u << 20;

    // `maxHeadBytes`: for tests that have little input.
    explicit AgentChannel(base::Descriptor socket, std::uint32_t maxHeadBytes = kMaxAnswerHeadBytes)
        : fStream(std::move(socket)), fMaxHeadBytes(maxHeadBytes)
    {
    }

    // Passes the answer's elements to the sink as they come. Returns: the operation's status.
    // Throws: AgentLost, AgentGone; AgentSilent after silence for `timeout` (0: any time); what the sink throws.
    // After an exception the rest of the answer is still under way, and the channel must be dropped.
    // Blocks: as long as the agent keeps sending.
    CimStatus request(const AgentRequest& request, ElementSink& sink, std::chrono::milliseconds timeout);

    // Makes a waiting request() fail. Thread: any.
    void shutDown() noexcept { fStream.shutDown(); }

  private:
    void send(const AgentRequest& request, std::chrono::milliseconds timeout);
    std::string_view readMore(std::chrono::milliseconds timeout);
    CimStatus receive(ElementSink& sink, std::chrono::milliseconds timeout);

    SocketStream fStream;
    const std::uint32_t fMaxHeadBytes;
    std::vector<char> fBuffer; // for what is read of the answer
};

} // namespace Pegasus::server
