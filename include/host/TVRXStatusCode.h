#pragma once

#include <cstdint>

namespace NKOLVRX20 {

// A host status code and its text.
class TVRXStatusCode
{
  public:
    // The codes that namespace providers and the reference host throw; the host knows more.
    enum ECode : std::uint32_t
    {
        kSuccess = 0,
        kOperationNotSupported = 1,
        kBadPath = 3,
        kAllocationFailed = 4,
        kNotFound = 6,
        kDirectoryNotOpened = 11,
        kProcessFailed = 12, // a program could not be run, or ran out of time
        kTypeMismatch = 14,
        kUnknownProperty = 15,
        kAlreadyExists = 16,
        kReferenceInNonAssociation = 22,
        kInvalidName = 25,
        kNotSupported = 31,
        kServerConnectionFailed = 42
    };

    explicit TVRXStatusCode(std::uint32_t code) noexcept : fCode(code) {}

    std::uint32_t GetStatusCode() const noexcept { return fCode; }

    // Returns: the code's sentence, zero-terminated, of static lifetime; "Unknown status code" for a code
    // that has none.
    const char* TranslateStatusCode() const noexcept;

  private:
    std::uint32_t fCode;
};

} // namespace NKOLVRX20
