#include "pegasus/server/net/HttpRequest.h"

#include <cctype>
#include <cstring>

#include <strings.h>

namespace Pegasus::server {

const std::string* HttpRequest::header(const char* name) const
{
    for (const auto& [key, value] : headers) {
        if (::strcasecmp(key.c_str(), name) == 0) {
            return &value;
        }
    }
    return nullptr;
}

bool HttpRequest::headerHas(const char* name, const char* word) const
{
    const std::string* value = header(name);
    if (value == nullptr) {
        return false;
    }
    const std::size_t size = std::strlen(word);
    for (std::size_t begin = 0; begin < value->size();) {
        begin = std::min(value->find_first_not_of(" \t,", begin), value->size());
        const std::size_t end = std::min(value->find_first_of(" \t,;", begin), value->size());
        if (end - begin == size && ::strncasecmp(value->data() + begin, word, size) == 0) {
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

std::string percentEncode(const std::string& text)
{
    static const char kDigits[] = "0123456789ABCDEF";
    std::string encoded;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte < 0x80 && (std::isalnum(byte) != 0 || std::strchr("-_.!~*'()", c) != nullptr)) {
            encoded += c;
        } else {
            encoded += '%';
            encoded += kDigits[byte >> 4];
            encoded += kDigits[byte & 15];
        }
    }
    return encoded;
}

namespace {

int hexDigit(char c)
{
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    const int lower = std::tolower(static_cast<unsigned char>(c));
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

} // namespace

std::string percentDecode(const std::string& text)
{
    std::string decoded;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const int high = text[i] == '%' && i + 2 < text.size() ? hexDigit(text[i + 1]) : -1;
        const int low = high >= 0 ? hexDigit(text[i + 2]) : -1;
        if (low < 0) {
            decoded += text[i];
        } else {
            decoded += static_cast<char>(high * 16 + low);
            i += 2;
        }
    }
    return decoded;
}

} // namespace Pegasus::server
