// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <cstdint>
#include <map>
#include <string>

namespace servertest {

// An HTTP answer taken apart. Header and trailer names are in lower case.
struct HttpAnswer
{
    std::string statusLine;
    int status = 0; // 0: no answer
    std::map<std::string, std::string> headers;
    std::string body; // without chunk framing
    std::map<std::string, std::string> trailers;
    bool isComplete = false;
};

// Percent-decoded; empty if absent.
std::string header(const HttpAnswer& answer, const std::string& name);

// A raw connection to a server on this machine.
class RawConnection
{
  public:
    explicit RawConnection(std::uint16_t port);
    ~RawConnection();
    RawConnection(const RawConnection&) = delete;
    RawConnection& operator=(const RawConnection&) = delete;

    // Returns: false when the connection is broken.
    bool send(const std::string& bytes);
    void endSending();
    // Reads one answer; bytes after it are kept for the next. Ends at the time limit with what there is.
    HttpAnswer receive(std::chrono::milliseconds limit = std::chrono::seconds(60));
    // Whether the server has closed, seen within the limit.
    bool isClosed(std::chrono::milliseconds limit = std::chrono::seconds(60));
    int fd() const { return fSocket; }

  private:
    bool fill(std::chrono::steady_clock::time_point deadline);
    bool readBody(HttpAnswer& answer, std::chrono::steady_clock::time_point deadline);
    bool readChunks(HttpAnswer& answer, std::chrono::steady_clock::time_point deadline);
    bool readLine(std::string& line, std::chrono::steady_clock::time_point deadline);

    int fSocket;
    std::string fBuffer;
};

// One request on a connection of its own.
HttpAnswer exchange(std::uint16_t port, const std::string& request);

// A complete intrinsic request; `parameters` are IPARAMVALUE elements, `headers` further header lines with their ends.
std::string intrinsicRequest(const std::string& method, const std::string& nameSpace, const std::string& parameters,
                             const std::string& headers = "TE: chunked, trailers\r\n");
// A POST with these CIM headers and this body.
std::string post(const std::string& headers, const std::string& body);
// IPARAMVALUE ClassName
std::string classNameParameter(const std::string& name);

} // namespace servertest
