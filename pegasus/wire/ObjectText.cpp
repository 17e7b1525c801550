// SPDX-License-Identifier: MIT
// The one member of the CIM objects that writes XML. It is above them, with the encoder, and part of libpegcommon
// alone.
#include "pegasus/base/Text.h"
#include "pegasus/wire/ElementEncoder.h"

#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/Exception.h>

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
    return base::fromUtf8(text);
}

} // namespace Pegasus
