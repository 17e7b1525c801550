// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Pegasus::server {

// Bounds on one request (named alike in the configuration).
struct HttpLimits
{
    std::size_t maxHeaderBytes = 65536; // of the head, and again of a chunk's framing and of the trailer
    std::size_t maxBodyBytes = 16u << 20;
};

// One request as it came. Header names match in any case.
struct HttpRequest
{
    std::string method; // "POST"; "M-POST" has been resolved (its numbered headers bear their plain names)
    std::string body;
    std::vector<std::pair<std::string, std::string>> headers;
    bool isVersion10 = false;    // of HTTP/1.0, which may leave the Host header out
    bool hasBodyLength = false;  // by Content-Length or chunks
    std::string extensionPrefix; // "NN-" of an M-POST, for the answer's headers

    // Returns: null if absent.
    const std::string* header(std::string_view name) const;
    // Returns: whether a comma-separated header holds a word, whatever its parameters.
    bool headerHas(std::string_view name, std::string_view word) const;
};

// A request that is answered with an HTTP error.
class HttpError : public std::runtime_error
{
  public:
    // Whether the next request can be found on the connection.
    enum class After
    {
        kKeepOpen,
        kClose
    };

    // `cimError` and `detail` may be empty; they become the CIMError and PGErrorDetail headers.
    HttpError(unsigned status, After after, const std::string& cimError = "", const std::string& detail = "");

    unsigned status() const { return fStatus; }
    const std::string& cimError() const { return fCimError; }
    const std::string& detail() const { return fDetail; }
    bool closes() const { return fAfter == After::kClose; }

  private:
    unsigned fStatus;
    After fAfter;
    std::string fCimError;
    std::string fDetail;
};

// Refuses requests that a web page has a browser send: a page can have its own host name resolve to 127.0.0.1, and the
// browser's connections pass the check of the peer when root or the server's user sits before it.
//
// A Host header must name the loopback interface: localhost, localhost.localdomain, a name below .localhost, or an
// address (127.0.0.0/8, [::1], [::ffff:127.0.0.0]/104); a port may follow, and an empty one counts as absent. The
// machine's own name is refused like any other: name servers answer for it. An Origin header, which browsers add, must
// name such a host too.
// Throws: HttpError 403. Thread: any.
void requireLocalHost(const HttpRequest& http);

// Returns: "Not Found" for 404.
const char* httpReason(unsigned status);

} // namespace Pegasus::server
