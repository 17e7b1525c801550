// SPDX-License-Identifier: MIT
#include "display/PlainText.h"

namespace NKOLVRX20 {

bool IsNumber(const TCIMValue& value)
{
    using TType = TCIMValue::TCIMType;
    return !value.IsNull() && value.GetType() >= TType::kUint8 && value.GetType() <= TType::kReal64;
}

std::string PlainText(const TCIMValue& value)
{
    if (value.IsNull()) {
        return "";
    }
    switch (value.GetType()) {
    case TCIMValue::TCIMType::kDatetime:
        return static_cast<TCIMDateTime>(value).ToUIString();
    case TCIMValue::TCIMType::kChar16:
        return CharacterText(static_cast<TCIMChar16>(value));
    default:
        return value.ToString(10);
    }
}

std::string CharacterText(TCIMChar16 character)
{
    const auto byte = [](unsigned int value) { return static_cast<char>(value); };
    unsigned int code = character.GetCode();
    if (code >= 0xd800 && code < 0xe000) {
        code = 0xfffd;
    }
    if (code < 0x80) {
        return {byte(code)};
    }
    if (code < 0x800) {
        return {byte(0xc0u | code >> 6), byte(0x80u | (code & 0x3fu))};
    }
    return {byte(0xe0u | code >> 12), byte(0x80u | (code >> 6 & 0x3fu)), byte(0x80u | (code & 0x3fu))};
}

std::string JoinTexts(const std::vector<std::string>& texts, const char* separator)
{
    std::string joined;
    for (std::size_t i = 0; i < texts.size(); ++i) {
        joined += (i == 0 ? "" : separator) + texts[i];
    }
    return joined;
}

} // namespace NKOLVRX20
