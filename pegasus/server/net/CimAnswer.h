// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/net/AnswerStream.h"
#include "pegasus/server/net/CimRequest.h"

#include <Pegasus/Common/Exception.h>

#include <stdexcept>
#include <string>
#include <string_view>

namespace Pegasus::server {

// What operations write to.
class ElementSink
{
  public:
    virtual ~ElementSink() = default;
    // Whole elements, children of IRETURNVALUE or of METHODRESPONSE.
    // Throws: whatever ends the request, such as SocketTimeout.
    virtual void write(std::string_view elements) = 0;
};

// The response message (DSP0201, SIMPLERSP) to one request, streamed: the envelope is written around what operations
// write, and an error is put where the client looks for it.
//
// Throws: what AnswerStream throws.
// Thread: one at a time.
class CimAnswer : public ElementSink
{
  public:
    static constexpr std::size_t kMaxStatusTextBytes = 4096;

    enum class Envelope
    {
        kMessage, // a whole CIM message
        kBare     // the elements alone: an agent's answer, which the server wraps
    };

    // Requires: stream and request outlive this.
    CimAnswer(AnswerStream& stream, const CimRequest& request, Envelope envelope);

    void write(std::string_view elements) override;

    // Ends the answer of an operation that succeeded.
    void finish();
    enum class ErrorPlace
    {
        kTrailer,       // in the trailer; what was written is taken back if none of it has been sent yet
        kAfterElements, // in the trailer; what was written stays
        kBody           // an ERROR element in the message, also when the client reads trailers
    };
    // Ends the answer with an error, whose text is cut at kMaxStatusTextBytes. For a client that lacks trailers it is
    // an ERROR element, in place of what was written.
    void fail(CimStatus status, ErrorPlace place = ErrorPlace::kTrailer);

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

// An operation failed with a status whose text is complete: an agent's. `place` says whether what other agents gave
// stays.
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

// The status that clients see: the symbolic name before the text. Success, as the code of an error, becomes
// CIM_ERR_FAILED.
CimStatus statusOf(const CIMException& error);
CimStatus makeStatus(CIMStatusCode code, const std::string& text);

} // namespace Pegasus::server
