// SPDX-License-Identifier: MIT
#include <host/TVRXException.h>

namespace NKOLVRX20 {

const char* TVRXStatusCode::TranslateStatusCode() const noexcept
{
    switch (fCode) {
    case kSuccess:
        return "Success";
    case kOperationNotSupported:
        return "The operation is not supported";
    case kBadPath:
        return "The path is not valid";
    case kAllocationFailed:
        return "Memory could not be allocated";
    case kNotFound:
        return "The object was not found";
    case kDirectoryNotOpened:
        return "The directory could not be opened";
    case kProcessFailed:
        return "The program could not be run or did not end in time";
    case kTypeMismatch:
        return "The value has the wrong type";
    case kUnknownProperty:
        return "The property is not known";
    case kAlreadyExists:
        return "The object already exists";
    case kReferenceInNonAssociation:
        return "Only an association can have a reference property";
    case kInvalidName:
        return "The name is not a valid CIM name";
    case kNotSupported:
        return "The operation is not supported by this object";
    case kServerConnectionFailed:
        return "The connection to the CIM server failed";
    default:
        return "Unknown status code";
    }
}

// Out of line, so that host and plug-ins share one type information: what one throws, the other can catch.
TVRXException::~TVRXException() = default;

const char* TVRXException::what() const noexcept
{
    return TVRXStatusCode(fStatusCode).TranslateStatusCode();
}

} // namespace NKOLVRX20
