#include <host/TCIMChar16.h>
#include <host/TVRXException.h>

#include <charconv>

namespace NKOLVRX20 {

TCIMChar16::TCIMChar16(const std::string& decimalText) : fCode(0)
{
    const char* end = decimalText.data() + decimalText.size();
    const auto result = std::from_chars(decimalText.data(), end, fCode);
    if (result.ec != std::errc() || result.ptr != end) {
        throw TVRXException(TVRXStatusCode::kTypeMismatch);
    }
}

} // namespace NKOLVRX20
