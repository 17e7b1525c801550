// SPDX-License-Identifier: MIT
#include "pegasus/server/net/RequestLoop.h"

#include "pegasus/base/Text.h"
#include "pegasus/server/admin/Log.h"

#include <system_error>

namespace Pegasus::server {

namespace {

constexpr std::chrono::seconds kLinger{2};

wire::XmlLimits xmlLimits(const ConnectionSettings& settings)
{
    wire::XmlLimits limits;
    limits.maxDepth = settings.maxXmlDepth;
    return limits;
}

bool wantsClose(const HttpRequest& http)
{
    return http.headerHas("Connection", "close");
}

AnswerStream::Options answerOptions(const HttpRequest& http, const ConnectionSettings& settings,
                                    CimAnswer::Envelope envelope)
{
    AnswerStream::Options options;
    const bool takesTrailers = http.headerHas("TE", "chunked") || http.headerHas("TE", "trailers");
    options.framing =
        takesTrailers ? AnswerStream::Framing::kChunkedWithTrailer : AnswerStream::Framing::kContentLength;
    options.maxBufferedBytes = settings.maxBufferedAnswerBytes;
    options.writeTimeout = settings.writeTimeout;
    options.closes = wantsClose(http);
    options.isForServer = envelope == CimAnswer::Envelope::kBare;
    options.extensionPrefix = http.extensionPrefix;
    return options;
}

void checkMethod(const HttpRequest& http)
{
    if (http.method == "POST") {
        return;
    }
    if (http.method == "GET" || http.method == "HEAD") {
        throw HttpError(404, HttpError::After::kClose); // there is nothing here but the CIM operations
    }
    throw HttpError(400, HttpError::After::kClose);
}

// Logs the exception that ended a connection. Requires: called in a handler.
void logEnd() noexcept
try {
    try {
        throw;
    } catch (const std::system_error& error) { // the peer has gone
        Log::write(LogLevel::kDebug, std::string("connection ended: ") + error.what());
    } catch (const SocketTimeout& error) {
        Log::write(LogLevel::kWarning, std::string("connection closed: ") + error.what());
    } catch (const std::exception& error) {
        Log::write(LogLevel::kError, std::string("connection closed: ") + error.what());
    } catch (const Exception& error) {
        Log::write(LogLevel::kError, "connection closed: " + base::utf8(error.getMessage()));
    } catch (...) {
        Log::write(LogLevel::kError, "connection closed: an unknown exception");
    }
} catch (...) { // out of memory: the line is lost
}

class RequestLoop
{
  public:
    RequestLoop(SocketStream& stream, RequestHandler& handler, const std::function<ConnectionSettings()>& settings,
                CimAnswer::Envelope envelope)
        : fStream(stream), fHandler(handler), fMakeSettings(settings), fSettings(settings()), fEnvelope(envelope),
          fReader(stream), fDecoder(xmlLimits(fSettings))
    {
    }

    // Returns: whether the connection can carry another request.
    bool serveNext();

  private:
    void answer(const HttpRequest& http);
    void run(const HttpRequest& http, const CimRequest& request, CimAnswer& answer);

    SocketStream& fStream;
    RequestHandler& fHandler;
    const std::function<ConnectionSettings()>& fMakeSettings;
    ConnectionSettings fSettings;
    CimAnswer::Envelope fEnvelope;
    HttpRequestReader fReader;
    RequestDecoder fDecoder;
};

bool RequestLoop::serveNext()
try {
    fSettings = fMakeSettings();
    HttpRequest http;
    if (!fReader.read(http, fSettings.http, fSettings.times)) {
        return false;
    }
    checkMethod(http);
    if (fSettings.strictHosts) {
        requireLocalHost(http);
    }
    const bool closes = wantsClose(http);
    answer(http);
    return !closes;
} catch (const HttpError& error) {
    Log::write(LogLevel::kInformation, std::string("request refused: ") + error.what());
    sendHttpError(fStream, error, fSettings.writeTimeout);
    if (error.closes()) {
        fStream.lingeringClose(kLinger);
    }
    return !error.closes();
}

void RequestLoop::answer(const HttpRequest& http)
{
    const CimRequest request = fDecoder.decode(http);
    AnswerStream stream(fStream, answerOptions(http, fSettings, fEnvelope));
    CimAnswer answer(stream, request, fEnvelope);
    if (!fHandler.knowsMethod(request)) {
        answer.fail(makeStatus(CIM_ERR_NOT_SUPPORTED, "Unrecognized intrinsic method: " + request.method),
                    CimAnswer::ErrorPlace::kBody);
        return;
    }
    try {
        run(http, request, answer);
    } catch (const wire::XmlError& error) {
        if (stream.hasStarted()) {
            throw std::runtime_error("a parameter was read after the answer had begun");
        }
        failFor(error);
    }
}

void RequestLoop::run(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
try {
    fHandler.handle(http, request, answer);
    answer.finish();
} catch (const CIMException& error) {
    answer.fail(statusOf(error));
} catch (const OperationFailed& error) {
    answer.fail(error.status(), error.place());
} catch (const wire::XmlError&) {
    throw;
} catch (const AnswerTooLarge& error) {
    answer.fail(makeStatus(CIM_ERR_SERVER_LIMITS_EXCEEDED, error.what()));
} catch (const Exception& error) {
    answer.fail(makeStatus(CIM_ERR_FAILED, base::utf8(error.getMessage())));
} catch (const std::bad_alloc&) {
    answer.fail(makeStatus(CIM_ERR_SERVER_LIMITS_EXCEEDED, "The server is out of memory"));
}

} // namespace

void serveConnection(SocketStream& stream, RequestHandler& handler, const std::function<ConnectionSettings()>& settings,
                     CimAnswer::Envelope envelope) noexcept
try {
    RequestLoop loop(stream, handler, settings, envelope);
    while (loop.serveNext()) {
    }
} catch (...) {
    logEnd();
}

} // namespace Pegasus::server
