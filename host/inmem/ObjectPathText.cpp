#include "host/inmem/ObjectPathText.h"

namespace NKOLVRX20 {
namespace {

std::string Quoted(const std::string& text)
{
    std::string quoted = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\') {
            quoted += '\\';
        }
        quoted += c;
    }
    return quoted + '"';
}

std::string KeyText(const TCIMValue& value)
{
    const auto type = value.GetType();
    if (type == TCIMValue::TCIMType::kBoolean) {
        return static_cast<bool>(value) ? "TRUE" : "FALSE";
    }
    const bool isNumber = type > TCIMValue::TCIMType::kBoolean && type < TCIMValue::TCIMType::kChar16;
    return isNumber ? value.ToString(10) : Quoted(value.ToString(10));
}

} // namespace

std::string ObjectPathText(const std::string& className, const TCIMContext& keys)
{
    std::string path = className;
    char separator = '.';
    for (const auto& key : keys) {
        path += separator + key.first + '=' + KeyText(key.second);
        separator = ',';
    }
    return path;
}

} // namespace NKOLVRX20
