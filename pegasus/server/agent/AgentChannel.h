#pragma once

#include "pegasus/server/net/AnswerStream.h"
#include "pegasus/server/net/CimAnswer.h"

#include <vector>

namespace Pegasus::server {

// The agent at the other end ended, or said something that is no answer. what() says which.
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

// The agent sent nothing for the whole patience.
class AgentSilent : public std::runtime_error
{
  public:
    AgentSilent() : std::runtime_error("the agent does not answer") {}
};

// One request for an agent: an operation for one of its module's providers.
struct AgentRequest
{
    std::string method;
    std::string object; // the CIMObject header, not encoded
    std::string body;   // the CIM message
    std::string provider;
    std::string library; // path of the module's library
};

// The server's end of a socket pair to an agent: carries one request at a time.
//
// The protocol is the public one, CIM-XML over HTTP, but for two things: the headers PG-Provider and PG-Library say who
// is meant, and the answer's body is only the elements within IRETURNVALUE or METHODRESPONSE, so that they can be
// passed on unread, whatever their number.
class AgentChannel
{
  public:
    explicit AgentChannel(Descriptor socket) : fStream(std::move(socket)) {}

    // Passes the answer's elements to the sink as they come. Returns: the operation's status.
    // Throws: AgentLost, AgentGone; AgentSilent when nothing comes for `patience` (zero: any time). After an exception,
    // the sink's own included, the channel is out of step and must be dropped.
    CimStatus request(const AgentRequest& request, ElementSink& sink, std::chrono::milliseconds patience);

    // Makes a waiting request() fail. Thread: any.
    void shutDown() noexcept { fStream.shutDown(); }

  private:
    void send(const AgentRequest& request, std::chrono::milliseconds patience);
    std::size_t readMore(std::size_t kept, std::chrono::milliseconds patience);
    CimStatus receive(ElementSink& sink, std::chrono::milliseconds patience);

    SocketStream fStream;
    std::vector<char> fBuffer; // what has been read of the answer and not been parsed
};

} // namespace Pegasus::server
