// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlError.h"

#include "pegasus/base/Text.h"

namespace Pegasus::wire {
namespace {

const char* wordFor(XmlError::Kind kind)
{
    switch (kind) {
    case XmlError::Kind::kNotWellFormed:
        return "Not well-formed";
    case XmlError::Kind::kSemantic:
        return "Semantic error";
    case XmlError::Kind::kTooLarge:
        return "Limit exceeded";
    default:
        return "Validation error";
    }
}

// The cause may quote bytes of the message that are invalid UTF-8.
String messageFor(XmlError::Kind kind, XmlPlace place, const std::string& cause)
{
    return base::fromUtf8Repaired(std::string(wordFor(kind)) + ": on line " + std::to_string(place.line) + ": " +
                                  cause);
}

} // namespace

XmlError::XmlError(Kind kind, XmlPlace place, const std::string& cause)
    : Exception(messageFor(kind, place, cause)), fKind(kind), fPlace(place)
{
}

XmlError::~XmlError() = default;

} // namespace Pegasus::wire
