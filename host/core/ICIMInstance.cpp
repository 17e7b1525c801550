#include <host/ICIMInstance.h>

namespace NKOLVRX20 {

// The interface's only body. It also anchors the type information of ICIMInstance in this library.
TCIMReference ICIMInstance::BuildPath(TCIMContext context) const
{
    return GetReference(context);
}

} // namespace NKOLVRX20
