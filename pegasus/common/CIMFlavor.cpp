#include "pegasus/common/FlagWords.h"

#include <Pegasus/Common/CIMFlavor.h>

namespace Pegasus {

const CIMFlavor CIMFlavor::NONE(0);
const CIMFlavor CIMFlavor::OVERRIDABLE(1);
const CIMFlavor CIMFlavor::ENABLEOVERRIDE(1);
const CIMFlavor CIMFlavor::TOSUBCLASS(2);
const CIMFlavor CIMFlavor::TOSUBELEMENTS(2);
const CIMFlavor CIMFlavor::TOINSTANCE(4);
const CIMFlavor CIMFlavor::TRANSLATABLE(8);
const CIMFlavor CIMFlavor::DISABLEOVERRIDE(16);
const CIMFlavor CIMFlavor::RESTRICTED(32);
const CIMFlavor CIMFlavor::DEFAULTS(3);

void CIMFlavor::addFlavor(const CIMFlavor& flavor)
{
    fBits |= flavor.fBits;
}

void CIMFlavor::removeFlavor(const CIMFlavor& flavor)
{
    fBits &= ~flavor.fBits;
}

Boolean CIMFlavor::hasFlavor(const CIMFlavor& flavor) const
{
    return (fBits & flavor.fBits) == flavor.fBits;
}

Boolean CIMFlavor::equal(const CIMFlavor& flavor) const
{
    return fBits == flavor.fBits;
}

String CIMFlavor::toString() const
{
    return joinFlagWords(fBits,
                         {"OVERRIDABLE", "TOSUBCLASS", "TOINSTANCE", "TRANSLATABLE", "DISABLEOVERRIDE", "RESTRICTED"});
}

CIMFlavor CIMFlavor::operator+(const CIMFlavor& flavor) const
{
    return CIMFlavor(fBits | flavor.fBits);
}

} // namespace Pegasus
