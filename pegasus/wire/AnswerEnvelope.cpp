// SPDX-License-Identifier: MIT
#include "pegasus/wire/AnswerEnvelope.h"

#include "pegasus/wire/XmlText.h"

namespace Pegasus::wire {

void appendAnswerOpening(std::string& out, std::string_view messageId, std::string_view method, bool isIntrinsic)
{
    constexpr std::size_t kMarkupBytes = 192;
    out.reserve(out.size() + kMarkupBytes + messageId.size() + method.size());
    out += "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n<MESSAGE ID=\"";
    appendEscaped(out, messageId);
    out += "\" PROTOCOLVERSION=\"1.0\">\n<SIMPLERSP>\n<";
    out += responseElement(isIntrinsic);
    out += " NAME=\"";
    appendEscaped(out, method);
    out += "\">\n";
}

} // namespace Pegasus::wire
