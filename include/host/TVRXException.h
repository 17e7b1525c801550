#pragma once

#include <host/TVRXStatusCode.h>

#include <cstdint>
#include <exception>

namespace NKOLVRX20 {

// What every operation of the host's model throws. Its only datum is the status code; what() is the code's text.
class TVRXException : public std::exception
{
  public:
    explicit TVRXException(std::uint32_t statusCode) noexcept : fStatusCode(statusCode) {}
    ~TVRXException() override;

    std::uint32_t GetStatusCode() const noexcept { return fStatusCode; }
    const char* what() const noexcept override;

  private:
    std::uint32_t fStatusCode;
};

} // namespace NKOLVRX20
