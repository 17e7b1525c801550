// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

// The CIM-XML response message (DSP0200, DSP0201).
namespace Pegasus::wire {

// The element around a result, by the kind of the method.
constexpr std::string_view responseElement(bool isIntrinsic)
{
    return isIntrinsic ? "IMETHODRESPONSE" : "METHODRESPONSE";
}

// Everything before the result of a method, up to the response element's start tag and the line feed after it. Servers
// write it in this form, byte by byte; a reader takes others too.
void appendAnswerOpening(std::string& out, std::string_view messageId, std::string_view method, bool isIntrinsic);

} // namespace Pegasus::wire
