// SPDX-License-Identifier: MIT
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/wire/ElementAttributes.h"
#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/XmlText.h"

#include <cmath>

namespace Pegasus::wire {
namespace {

void appendText(std::string& out, Boolean x, Blanks)
{
    out += x ? "TRUE" : "FALSE";
}

void appendReal(std::string& out, Real64 x, int digits)
{
    if (std::isnan(x)) {
        out += "NaN";
    } else if (std::isinf(x)) {
        out += x < 0 ? "-INF" : "INF";
    } else {
        out += base::formatReal(x, digits);
    }
}

void appendText(std::string& out, Real32 x, Blanks)
{
    appendReal(out, Real64(x), 7);
}

void appendText(std::string& out, Real64 x, Blanks)
{
    appendReal(out, x, 16);
}

void appendText(std::string& out, const Char16& x, Blanks)
{
    std::string utf8;
    base::appendUtf8(utf8, &x, 1);
    appendEscaped(out, utf8);
}

void appendText(std::string& out, const String& x, Blanks blanks)
{
    appendEscaped(out, x, blanks);
}

void appendText(std::string& out, const CIMDateTime& x, Blanks)
{
    base::appendUtf8(out, x.toString());
}

void appendText(std::string& out, const CIMInstance& x, Blanks blanks)
{
    std::string xml;
    appendInstance(xml, x);
    appendEscaped(out, xml, blanks);
}

void appendText(std::string& out, const CIMObject& x, Blanks blanks)
{
    appendEscaped(out, x.toString(), blanks);
}

template <typename T> void appendText(std::string& out, const T& x, Blanks)
{
    static_assert(std::is_integral_v<T>, "a number");
    out += std::to_string(x);
}

template <typename T> void appendOne(std::string& out, const T& x, Blanks blanks)
{
    if constexpr (std::is_same_v<T, CIMObjectPath>) {
        appendReference(out, x);
    } else {
        out += "<VALUE>";
        appendText(out, x, blanks);
        out += "</VALUE>\n";
    }
}

template <typename T> void appendAll(std::string& out, const Array<T>& array, Blanks blanks)
{
    const char* const name = std::is_same_v<T, CIMObjectPath> ? "VALUE.REFARRAY" : "VALUE.ARRAY";
    out.append("<").append(name).append(">\n");
    for (Uint32 i = 0; i < array.size(); ++i) {
        appendOne(out, array[i], blanks);
    }
    out.append("</").append(name).append(">\n");
}

} // namespace

void appendValue(std::string& out, const CIMValue& value, Blanks blanks)
{
    if (value.isNull()) {
        return;
    }
    visitType(value.getType(), [&](auto tag) {
        using T = typename decltype(tag)::Type;
        if (value.isArray()) {
            appendAll(out, ValueAccess::held<Array<T>>(value), blanks);
        } else {
            appendOne(out, ValueAccess::held<T>(value), blanks);
        }
    });
}

void appendParamValue(std::string& out, const CIMParamValue& parameter)
{
    const CIMValue value = parameter.getValue();
    out += "<PARAMVALUE";
    appendAttribute(out, "NAME", parameter.getParameterName());
    if (parameter.isTyped()) {
        appendType(out, "PARAMTYPE", value.getType());
    }
    appendEmbeddedMark(out, value.getType());
    out += ">\n";
    appendValue(out, value);
    out += "</PARAMVALUE>\n";
}

void appendReturnValue(std::string& out, const CIMValue& value)
{
    out += "<RETURNVALUE";
    appendType(out, "PARAMTYPE", value.getType());
    appendEmbeddedMark(out, value.getType());
    out += ">\n";
    appendValue(out, value);
    out += "</RETURNVALUE>\n";
}

} // namespace Pegasus::wire
