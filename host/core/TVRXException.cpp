#include <host/TVRXException.h>

namespace NKOLVRX20 {

TVRXException::~TVRXException() = default;

const char* TVRXException::what() const noexcept
{
    return TVRXStatusCode(fStatusCode).TranslateStatusCode();
}

} // namespace NKOLVRX20
