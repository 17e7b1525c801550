// SPDX-License-Identifier: MIT
// Flavors and scopes: two sets of flags that are written as words.
#include <Pegasus/Common/CIMFlavor.h>
#include <Pegasus/Common/CIMScope.h>

#include <initializer_list>
#include <string>

namespace Pegasus {
namespace {

// The words of the bits that are set, lowest bit first, with a blank between.
String joinFlagWords(Uint32 bits, std::initializer_list<const char*> words)
{
    std::string text;
    Uint32 bit = 1;
    for (const char* word : words) {
        if (bits & bit) {
            text.append(text.empty() ? "" : " ").append(word);
        }
        bit <<= 1;
    }
    return String(text.c_str());
}

} // namespace

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
