// The one member of the CIM objects that writes XML: it stands above them, with the codec.
#include "pegasus/common/StringRep.h"
#include "pegasus/wire/ElementEncoder.h"

#include <Pegasus/Common/CIMObject.h>

namespace Pegasus {

String CIMConstObject::toString() const
{
    if (isUninitialized()) {
        throw UninitializedObjectException();
    }
    std::string text;
    if (isClass()) {
        wire::appendClass(text, fClass);
    } else {
        wire::appendInstance(text, fInstance);
    }
    return StringAccess::fromUtf8(text);
}

} // namespace Pegasus
