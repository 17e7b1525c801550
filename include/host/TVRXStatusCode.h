// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

namespace NKOLVRX20 {

// A host status code and its text.
//
// The codes are the host's; plug-ins and the reference host throw those below. "In" names where a host meets them; each
// operation's comment has the details. Here: a line in the core log precedes every one that the plug-in throws, and
// says which operation failed on what.
class TVRXStatusCode
{
  public:
    enum ECode : std::uint32_t
    {
        kSuccess = 0, // reserved: success throws nothing
        // In ICIMNamespace::Subscribe, and in GetQualifier with a found flag on a class.
        kOperationNotSupported = 1,
        // An unusable path. In AllocateNamespace (working directory or consumer), TConfig::Load.
        kBadPath = 3,
        // Memory for a file is short, or the file exceeds its limit. Here: costs one vendor, inside AllocateNamespace.
        kAllocationFailed = 4,
        // In ICIMInstance::InvokeMethod: an undeclared method or parameter. In the reference host's own namespace:
        // an unknown instance.
        kNotFound = 6,
        // In AllocateNamespace: the providers' folder or a vendor's folder is unreadable.
        kDirectoryNotOpened = 11,
        // A program failed to run, or ran out of time. In TOSSpecific::SpawnProcess, and so in AllocateNamespace.
        kProcessFailed = 12,
        // A value, context entry or declaration of the wrong type, or a value that fails to convert.
        kTypeMismatch = 14,
        // In GetProperty and GetPropertyDecl.
        kUnknownProperty = 15,
        // In the operations that enter a class, a qualifier declaration or a property declaration.
        kAlreadyExists = 16,
        // In ICIMClass::AddPropertyDecl.
        kReferenceInNonAssociation = 22,
        // In every look-up by name: an invalid CIM name.
        kInvalidName = 25,
        // In the operations whose comment says "unsupported", and in the delegated ones while the repository is absent.
        kNotSupported = 31,
        // The private server failed to start, is out of reach, or left a question about a class unanswered.
        kServerConnectionFailed = 42
    };

    explicit TVRXStatusCode(std::uint32_t code) noexcept : fCode(code) {}

    std::uint32_t GetStatusCode() const noexcept { return fCode; }

    // Returns: the code's sentence in English, zero-terminated, of static lifetime; "Unknown status code" for an
    // unlisted code. Sentences are for people: a host that decides by the failure compares codes.
    const char* TranslateStatusCode() const noexcept;

  private:
    std::uint32_t fCode;
};

} // namespace NKOLVRX20
