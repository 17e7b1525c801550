#include <host/ICIMInstance.h>

namespace NKOLVRX20 {

TCIMReference ICIMInstance::BuildPath(TCIMContext context) const
{
    return GetReference(context);
}

} // namespace NKOLVRX20
