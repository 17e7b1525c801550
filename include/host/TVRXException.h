// SPDX-License-Identifier: MIT
#pragma once

#include <host/TVRXStatusCode.h>

#include <cstdint>
#include <exception>

namespace NKOLVRX20 {

// What every operation of the host's model throws. Its only datum is the status code. An implementer keeps the virtual
// table, the one datum and std::exception as base: hosts and plug-ins catch it as both.
class TVRXException : public std::exception
{
  public:
    explicit TVRXException(std::uint32_t statusCode) noexcept : fStatusCode(statusCode) {}
    ~TVRXException() override;

    // Returns: the code; TVRXStatusCode::ECode names those in use.
    std::uint32_t GetStatusCode() const noexcept { return fStatusCode; }
    // Returns: the code's sentence (TVRXStatusCode::TranslateStatusCode); of static lifetime.
    const char* what() const noexcept override;

  private:
    std::uint32_t fStatusCode;
};

} // namespace NKOLVRX20
