// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/HttpExchange.h"

#include "pegasus/base/PercentCoding.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <stdexcept>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

namespace servertest {

namespace {

using Deadline = std::chrono::steady_clock::time_point;

void addHeader(std::map<std::string, std::string>& headers, const std::string& line)
{
    const std::size_t colon = line.find(':');
    if (colon == std::string::npos) {
        return;
    }
    std::string name = line.substr(0, colon);
    std::transform(name.begin(), name.end(), name.begin(), [](unsigned char c) { return std::tolower(c); });
    const std::size_t value = line.find_first_not_of(' ', colon + 1);
    headers[name] = value == std::string::npos ? "" : line.substr(value);
}

bool waitReadable(int fd, Deadline deadline)
{
    const auto left =
        std::chrono::duration_cast<std::chrono::milliseconds>(deadline - std::chrono::steady_clock::now());
    pollfd wait = {fd, POLLIN, 0};
    return ::poll(&wait, 1, static_cast<int>(std::max<long>(left.count(), 0))) > 0;
}

} // namespace

std::string header(const HttpAnswer& answer, const std::string& name)
{
    const auto found = answer.headers.find(name);
    return found == answer.headers.end() ? "" : Pegasus::base::percentDecoded(found->second);
}

RawConnection::RawConnection(std::uint16_t port) : fSocket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0))
{
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (::connect(fSocket, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
        throw std::runtime_error("cannot connect to the server");
    }
}

RawConnection::~RawConnection()
{
    ::close(fSocket);
}

bool RawConnection::send(const std::string& bytes)
{
    for (std::size_t done = 0; done < bytes.size();) {
        const ssize_t n = ::send(fSocket, bytes.data() + done, bytes.size() - done, MSG_NOSIGNAL);
        if (n < 0) {
            return false;
        }
        done += static_cast<std::size_t>(n);
    }
    return true;
}

void RawConnection::endSending()
{
    ::shutdown(fSocket, SHUT_WR);
}

bool RawConnection::fill(Deadline deadline)
{
    char part[65536];
    const ssize_t n = waitReadable(fSocket, deadline) ? ::recv(fSocket, part, sizeof part, 0) : 0;
    if (n > 0) {
        fBuffer.append(part, static_cast<std::size_t>(n));
    }
    return n > 0;
}

bool RawConnection::readLine(std::string& line, Deadline deadline)
{
    std::size_t end;
    while ((end = fBuffer.find("\r\n")) == std::string::npos) {
        if (!fill(deadline)) {
            return false;
        }
    }
    line = fBuffer.substr(0, end);
    fBuffer.erase(0, end + 2);
    return true;
}

bool RawConnection::readChunks(HttpAnswer& answer, Deadline deadline)
{
    for (std::string line; readLine(line, deadline);) {
        const std::size_t size = std::strtoul(line.c_str(), nullptr, 16);
        if (size == 0) {
            while (readLine(line, deadline) && !line.empty()) {
                addHeader(answer.trailers, line);
            }
            return line.empty();
        }
        while (fBuffer.size() < size + 2) {
            if (!fill(deadline)) {
                return false;
            }
        }
        answer.body.append(fBuffer, 0, size);
        fBuffer.erase(0, size + 2);
    }
    return false;
}

bool RawConnection::readBody(HttpAnswer& answer, Deadline deadline)
{
    if (header(answer, "transfer-encoding") == "chunked") {
        return readChunks(answer, deadline);
    }
    const std::size_t size = std::strtoul(header(answer, "content-length").c_str(), nullptr, 10);
    while (fBuffer.size() < size) {
        if (!fill(deadline)) {
            return false;
        }
    }
    answer.body = fBuffer.substr(0, size);
    fBuffer.erase(0, size);
    return true;
}

HttpAnswer RawConnection::receive(std::chrono::milliseconds limit)
{
    const Deadline deadline = std::chrono::steady_clock::now() + limit;
    HttpAnswer answer;
    if (!readLine(answer.statusLine, deadline)) {
        return answer;
    }
    answer.status = std::atoi(answer.statusLine.c_str() + std::min<std::size_t>(9, answer.statusLine.size()));
    for (std::string line; readLine(line, deadline) && !line.empty();) {
        addHeader(answer.headers, line);
    }
    answer.isComplete = readBody(answer, deadline);
    return answer;
}

bool RawConnection::isClosed(std::chrono::milliseconds limit)
{
    const Deadline deadline = std::chrono::steady_clock::now() + limit;
    char scrap[4096];
    while (waitReadable(fSocket, deadline)) {
        if (::recv(fSocket, scrap, sizeof scrap, 0) <= 0) {
            return true;
        }
    }
    return false;
}

HttpAnswer exchange(std::uint16_t port, const std::string& request)
{
    RawConnection connection(port);
    connection.send(request);
    return connection.receive();
}

std::string post(const std::string& headers, const std::string& body)
{
    return "POST /cimom HTTP/1.1\r\nHost: 127.0.0.1\r\nContent-Type: application/xml; charset=utf-8\r\n" + headers +
           "Content-Length: " + std::to_string(body.size()) + "\r\n\r\n" + body;
}

std::string classNameParameter(const std::string& name)
{
    return "<IPARAMVALUE NAME=\"ClassName\">\n<CLASSNAME NAME=\"" + name + "\"/>\n</IPARAMVALUE>\n";
}

std::string intrinsicRequest(const std::string& method, const std::string& nameSpace, const std::string& parameters,
                             const std::string& headers)
{
    std::string path;
    std::istringstream parts(nameSpace);
    for (std::string part; std::getline(parts, part, '/');) {
        path += "<NAMESPACE NAME=\"" + part + "\"/>\n";
    }
    return post(headers + "CIMOperation: MethodCall\r\nCIMMethod: " + method + "\r\nCIMObject: " +
                    Pegasus::base::percentEncoded(nameSpace, Pegasus::base::PercentSet::kUnreserved) + "\r\n",
                "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
                "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\">\n<SIMPLEREQ>\n<IMETHODCALL NAME=\"" +
                    method + "\">\n<LOCALNAMESPACEPATH>\n" + path + "</LOCALNAMESPACEPATH>\n" + parameters +
                    "</IMETHODCALL>\n</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n");
}

} // namespace servertest
