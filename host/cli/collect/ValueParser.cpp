// SPDX-License-Identifier: MIT
#include "host/cli/collect/ClassReader.h"
#include "host/cli/model/ErrorReport.h"

#include <host/TCIMChar16.h>
#include <host/TCIMDateTime.h>
#include <host/TCIMReference.h>

#include <charconv>
#include <sstream>

namespace vrxhost {
namespace {

using namespace NKOLVRX20;
using TType = TCIMValue::TCIMType;

[[noreturn]] void Refuse(const std::string& text, TType type)
{
    throw TRequestError("\"" + text + "\" is not a " + type.GetName());
}

template <typename Number> TCIMValue ParseNumber(const std::string& text, TType type)
{
    Number number{};
    const char* const end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, number);
    if (result.ec != std::errc() || result.ptr != end) {
        Refuse(text, type);
    }
    return TCIMValue(number);
}

TCIMValue ParseBoolean(const std::string& text, TType type)
{
    if (text != "true" && text != "false") {
        Refuse(text, type);
    }
    return TCIMValue(text == "true");
}

TCIMValue ParseReference(const std::string& text, const boost::shared_ptr<ICIMNamespace>& ns)
{
    TCIMReference reference(ns, TCIMContext());
    reference.SetPath(text);
    return TCIMValue(reference);
}

TCIMValue ParseScalar(const std::string& text, TType type, const boost::shared_ptr<ICIMNamespace>& ns)
{
    switch (type) {
    case TType::kBoolean:
        return ParseBoolean(text, type);
    case TType::kUint8:
        return ParseNumber<unsigned char>(text, type);
    case TType::kSint8:
        return ParseNumber<signed char>(text, type);
    case TType::kUint16:
        return ParseNumber<unsigned short>(text, type);
    case TType::kSint16:
        return ParseNumber<short>(text, type);
    case TType::kUint32:
        return ParseNumber<unsigned int>(text, type);
    case TType::kSint32:
        return ParseNumber<int>(text, type);
    case TType::kUint64:
        return ParseNumber<unsigned long>(text, type);
    case TType::kSint64:
        return ParseNumber<long>(text, type);
    case TType::kReal32:
        return ParseNumber<float>(text, type);
    case TType::kReal64:
        return ParseNumber<double>(text, type);
    case TType::kReference:
        return ParseReference(text, ns);
    case TType::kDatetime:
    case TType::kChar16: {
        TCIMValue value;
        const std::string error = ErrorOf(
            [&] { value = type == TType::kDatetime ? TCIMValue(TCIMDateTime(text)) : TCIMValue(TCIMChar16(text)); });
        return error.empty() ? value : (Refuse(text, type), value);
    }
    default:
        return TCIMValue(text);
    }
}

} // namespace

TCIMValue ParseValue(const std::string& text, TType type, const boost::shared_ptr<ICIMNamespace>& ns)
{
    if (!type.IsArray()) {
        return ParseScalar(text, type, ns);
    }
    std::vector<TCIMValue> elements;
    std::istringstream parts(text);
    for (std::string part; std::getline(parts, part, ',');) {
        elements.push_back(ParseScalar(part, type.GetElementType(), ns));
    }
    return TCIMValue(type.GetElementType(), 0, elements);
}

} // namespace vrxhost
