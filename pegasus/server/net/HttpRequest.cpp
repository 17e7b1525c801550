// SPDX-License-Identifier: MIT
#include "pegasus/server/net/HttpRequest.h"

#include "pegasus/base/AsciiCase.h"

namespace Pegasus::server {

const std::string* HttpRequest::header(std::string_view name) const
{
    for (const auto& [key, value] : headers) {
        if (base::equalNoCase(key, name)) {
            return &value;
        }
    }
    return nullptr;
}

bool HttpRequest::headerHas(std::string_view name, std::string_view word) const
{
    const std::string* value = header(name);
    if (value == nullptr) {
        return false;
    }
    for (std::size_t begin = 0; begin < value->size();) {
        begin = std::min(value->find_first_not_of(" \t,", begin), value->size());
        const std::size_t end = std::min(value->find_first_of(" \t,;", begin), value->size());
        if (base::equalNoCase(std::string_view(*value).substr(begin, end - begin), word)) {
            return true;
        }
        begin = std::min(value->find(',', end), value->size());
    }
    return false;
}

HttpError::HttpError(unsigned status, After after, const std::string& cimError, const std::string& detail)
    : std::runtime_error("HTTP " + std::to_string(status) + " " + httpReason(status) + " " + cimError + " " + detail),
      fStatus(status), fAfter(after), fCimError(cimError), fDetail(detail)
{
}

const char* httpReason(unsigned status)
{
    switch (status) {
    case 200:
        return "OK";
    case 400:
        return "Bad Request";
    case 403:
        return "Forbidden";
    case 404:
        return "Not Found";
    case 408:
        return "Request Timeout";
    case 411:
        return "Length Required";
    case 413:
        return "Payload Too Large";
    case 431:
        return "Request Header Fields Too Large";
    case 501:
        return "Not Implemented";
    case 503:
        return "Service Unavailable";
    default:
        return "Internal Server Error";
    }
}

} // namespace Pegasus::server
