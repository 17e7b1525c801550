#include "pegasus/common/FlagWords.h"

#include <Pegasus/Common/CIMScope.h>

namespace Pegasus {

const CIMScope CIMScope::NONE(0);
const CIMScope CIMScope::CLASS(1);
const CIMScope CIMScope::ASSOCIATION(2);
const CIMScope CIMScope::INDICATION(4);
const CIMScope CIMScope::PROPERTY(8);
const CIMScope CIMScope::REFERENCE(16);
const CIMScope CIMScope::METHOD(32);
const CIMScope CIMScope::PARAMETER(64);
const CIMScope CIMScope::ANY(127);

Boolean CIMScope::hasScope(const CIMScope& scope) const
{
    return (fBits & scope.fBits) == scope.fBits;
}

void CIMScope::addScope(const CIMScope& scope)
{
    fBits |= scope.fBits;
}

Boolean CIMScope::equal(const CIMScope& scope) const
{
    return fBits == scope.fBits;
}

String CIMScope::toString() const
{
    return joinFlagWords(fBits, {"CLASS", "ASSOCIATION", "INDICATION", "PROPERTY", "REFERENCE", "METHOD", "PARAMETER"});
}

CIMScope CIMScope::operator+(const CIMScope& scope) const
{
    return CIMScope(fBits | scope.fBits);
}

} // namespace Pegasus
