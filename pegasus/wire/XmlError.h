// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Exception.h>

#include <string>

namespace Pegasus::wire {

// A line and a column (in bytes), counted from 1; 0 means unknown.
struct XmlPlace
{
    std::size_t line = 0;
    std::size_t column = 0;
};

// What was wrong with a piece of XML, and where.
// getMessage(): "Validation error: on line 11: expected CLASSNAME element", the form that OpenPegasus answers with.
class XmlError : public Exception
{
  public:
    enum class Kind
    {
        kNotWellFormed, // not XML: "Not well-formed"
        kInvalid,       // XML, but not CIM-XML: "Validation error"
        kSemantic,      // CIM-XML whose values do not fit: "Semantic error"
        kTooLarge       // over one of the limits: "Limit exceeded"
    };

    XmlError(Kind kind, XmlPlace place, const std::string& cause);
    ~XmlError() override;

    Kind kind() const { return fKind; }
    XmlPlace place() const { return fPlace; }

  private:
    Kind fKind;
    XmlPlace fPlace;
};

} // namespace Pegasus::wire
