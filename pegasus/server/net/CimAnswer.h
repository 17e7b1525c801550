#pragma once

#include "pegasus/server/net/AnswerStream.h"
#include "pegasus/server/net/CimRequest.h"

#include <Pegasus/Common/Exception.h>

#include <stdexcept>
#include <string>
#include <string_view>

namespace Pegasus::server {

// What operations write to: whole elements, children of IRETURNVALUE or of METHODRESPONSE.
class ElementSink
{
  public:
    virtual ~ElementSink() = default;
    // Throws: whatever ends the request, such as a client that has gone.
    virtual void write(std::string_view elements) = 0;
};

// The response message (DSP0201, SIMPLERSP) to one request, streamed: the envelope is written around what operations
// write, and an error goes where the client looks for it.
class CimAnswer : public ElementSink
{
  public:
    enum class Envelope
    {
        kMessage, // a whole CIM message
        kBare     // the elements alone: an agent's answer, which the server wraps
    };

    CimAnswer(AnswerStream& stream, const CimRequest& request, Envelope envelope);

    void write(std::string_view elements) override;

    // Ends a good answer.
    void finish();
    enum class ErrorPlace
    {
        kTrailer,        // behind nothing: what was written is taken back if none of it has left yet
        kBehindElements, // in the trailer, behind what was written
        kBody            // an ERROR element in the message, although the client could read a trailer
    };
    // Ends the answer with an error. A client that reads no trailer finds it in the body, and nothing else.
    void fail(const CimStatus& status, ErrorPlace place = ErrorPlace::kTrailer);

  private:
    void open();
    void openReturnValue();
    void close();

    AnswerStream& fStream;
    const CimRequest& fRequest;
    Envelope fEnvelope;
    bool fOpen = false;
    bool fReturnValueOpen = false;
};

// An operation failed with a status whose text is complete already: an agent's. What other agents gave may stay.
class OperationFailed : public std::runtime_error
{
  public:
    explicit OperationFailed(const CimStatus& status, CimAnswer::ErrorPlace place = CimAnswer::ErrorPlace::kTrailer)
        : std::runtime_error(status.text), fStatus(status), fPlace(place)
    {
    }
    const CimStatus& status() const { return fStatus; }
    CimAnswer::ErrorPlace place() const { return fPlace; }

  private:
    CimStatus fStatus;
    CimAnswer::ErrorPlace fPlace;
};

// The status that clients see: the symbolic name before the text.
CimStatus statusOf(const CIMException& error);
CimStatus makeStatus(CIMStatusCode code, const std::string& text);

} // namespace Pegasus::server
