#pragma once

#include "pegasus/server/AnswerStream.h"
#include "pegasus/server/CimRequest.h"

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
    // Ends the answer with an error. What was written is taken back if none of it has left yet.
    // `inBody` puts the ERROR element into the message although the client could read a trailer.
    void fail(const CimStatus& status, bool inBody = false);

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

// An operation failed with a status whose text is complete already: an agent's.
class OperationFailed : public std::runtime_error
{
  public:
    explicit OperationFailed(const CimStatus& status) : std::runtime_error(status.text), fStatus(status) {}
    const CimStatus& status() const { return fStatus; }

  private:
    CimStatus fStatus;
};

// The status that clients see: the symbolic name before the text.
CimStatus statusOf(const CIMException& error);
CimStatus makeStatus(CIMStatusCode code, const std::string& text);

} // namespace Pegasus::server
